// Key value conversion: measure a field's spans and pack their bits into
// the key buffer's data area.

#include "keyfields/key_pack.h"

#include <algorithm>
#include <cstring>

namespace camel {
namespace {

uint32_t spanBits(const ValueSpan &span) {
    return span.lastBit >= span.firstBit ? span.lastBit - span.firstBit + 1 : 0;
}

// Spans that take part in the value: the reported ones, and never more
// than were filled, so the packing loop cannot write more bits than the
// measured length reserved.
uint32_t packedSpanCount(const FieldRecord &field) {
    if (field.spans == nullptr)
        return 0;
    return field.spansReported < field.spansFilled ? field.spansReported : field.spansFilled;
}

} // namespace

int32_t ValueBitLength(const FieldRecord &field) {
    if (field.spans == nullptr)
        return 0;
    uint64_t bits = 0;
    for (uint32_t i = 0; i < field.spansReported; ++i) {
        bits += spanBits(field.spans[i]);
        if (bits >= static_cast<uint64_t>(INT32_MAX))
            return INT32_MAX;
    }
    return static_cast<int32_t>(bits);
}

uint32_t ValueByteLength(const FieldRecord &field) {
    const auto bits = static_cast<uint32_t>(ValueBitLength(field));
    return bits / 8 + (bits % 8 != 0 ? 1 : 0);
}

void ReverseBytes(uint8_t *buffer, uint32_t n) {
    for (uint32_t i = 0; i < n / 2; ++i) {
        const uint8_t t = buffer[i];
        buffer[i] = buffer[n - 1 - i];
        buffer[n - 1 - i] = t;
    }
}

int SplitValueBytes(int32_t value, uint8_t (&out)[kSpanValueBytes]) {
    if (value < 0)
        return 0;
    auto v = static_cast<uint32_t>(value);
    out[0] = static_cast<uint8_t>(v);
    for (uint32_t i = 1; i < kSpanValueBytes && (v >>= 8) != 0; ++i)
        out[i] = static_cast<uint8_t>(v);
    return 1;
}

void WriteBitRange(uint8_t *dst, uint32_t lastBit, uint32_t firstBit,
                   const uint8_t (&src)[kSpanValueBytes]) {
    if (lastBit < firstBit)
        return;
    const uint32_t count = lastBit - firstBit + 1;
    static_assert(kSpanValueBytes <= 4, "a span value fits 32 bits");
    uint32_t value = 0; // the source's bits; zeros above its 32
    for (uint32_t k = kSpanValueBytes; k-- > 0;)
        value = value << 8 | src[k];
    // One destination octet at a time: the bits of the range that fall in
    // it, the others kept.
    for (uint32_t i = 0; i < count;) {
        const uint32_t d = firstBit + i;
        const uint32_t at = d % 8;
        const uint32_t n = std::min(8 - at, count - i);
        const uint32_t bits = (i < 32 ? value >> i : 0u) & ((1u << n) - 1);
        const auto mask = static_cast<uint8_t>(((1u << n) - 1) << at);
        dst[d / 8] = static_cast<uint8_t>((dst[d / 8] & ~mask) | bits << at);
        i += n;
    }
}

int32_t PackKeyValue(const FieldRecord &field, uint8_t *dst, uint32_t capacity) {
    if (capacity == 0)
        return static_cast<int32_t>(field.spansFilled & 0x7FFFFFFFu);
    // A saturated length is not the true length: never pack such a value.
    if (ValueBitLength(field) == INT32_MAX)
        return 0;
    const uint32_t n = ValueByteLength(field);
    if (n > capacity)
        return 0;
    if (n != 0)
        std::memset(dst, 0, n);

    // The last span goes to the low bits of byte 0, each earlier span above
    // it; reversing the bytes afterwards puts the first span in front.
    uint32_t b = 0;
    for (uint32_t i = packedSpanCount(field); i-- > 0;) {
        const ValueSpan &span = field.spans[i];
        const uint32_t len = spanBits(span);
        // Cleared per span: SplitValueBytes writes only the bytes a value
        // needs, and a span wider than its value must read zeros above it.
        uint8_t scratch[kSpanValueBytes] = {};
        if (!SplitValueBytes(static_cast<int32_t>(span.value), scratch))
            return static_cast<int32_t>(i);
        if (len != 0)
            WriteBitRange(dst, b + len - 1, b, scratch);
        b += len;
    }
    ReverseBytes(dst, n);
    return -1;
}

} // namespace camel
