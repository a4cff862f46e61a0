// Packing of variable key values: digit strings, octet strings and
// transaction ids into the key buffer's data area.

#include "keyfields/key_pack.h"

#include "key_test_field.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <vector>

namespace {

using camel::PackKeyValue;
using camel::ValueBitLength;
using camel::ValueByteLength;
using keytest::Field;

constexpr uint8_t kUntouched = 0xEE;

// Packs into a buffer of sentinels and returns the result and the buffer.
struct Packed {
    int32_t result;
    std::vector<uint8_t> bytes;
};
Packed pack(const Field &f, uint32_t capacity) {
    std::vector<uint8_t> buf(16, kUntouched);
    const int32_t r = PackKeyValue(f.record, buf.data(), capacity);
    return {r, buf};
}

// Digit splits of a transaction id octet string, in the unit's reading
// order: bits 8-5 then bits 4-1 of each octet.
Field transactionId(std::initializer_list<uint8_t> octets) {
    std::vector<ValueSpan> spans;
    uint32_t bit = 17;
    for (uint8_t o : octets) {
        spans.push_back(ValueSpan{static_cast<uint32_t>(o >> 4), bit + 4, bit + 7, 0, {0, 0}});
        spans.push_back(ValueSpan{static_cast<uint32_t>(o & 0x0F), bit, bit + 3, 0, {0, 0}});
        bit += 8;
    }
    return Field(std::move(spans));
}

struct PackCase {
    const char *name;
    Field field;
    std::vector<uint8_t> expected;
    int32_t bits;
};

TEST(PackKeyValue, PackedForms) {
    const PackCase cases[] = {
        {"odd digit count", Field({1, 2, 3, 4, 5}, 4), {0x01, 0x23, 0x45}, 20},
        {"even digit count", Field({1, 2, 3, 4}, 4), {0x12, 0x34}, 16},
        {"one digit", Field({7}, 4), {0x07}, 4},
        {"octets", Field({0x61, 0x62}, 8), {0x61, 0x62}, 16},
        {"all-ones octet", Field({0xFF}, 8), {0xFF}, 8},
        {"transaction id", transactionId({0x0A, 0xBC, 0x12, 0xF0}), {0x0A, 0xBC, 0x12, 0xF0}, 32},
        // Only the span's own bits count, whatever the value holds above them.
        {"value wider than its span", Field({0x1F, 0x2E}, 4), {0xFE}, 8},
        // Packing runs from the last span: the upper value byte of 0x123
        // must not carry over into the 12 bits of 0x005.
        {"wide spans", Field({0x005, 0x123}, 12), {0x00, 0x51, 0x23}, 24},
    };
    for (const PackCase &c : cases) {
        SCOPED_TRACE(c.name);
        EXPECT_EQ(ValueBitLength(c.field.record), c.bits);
        EXPECT_EQ(ValueByteLength(c.field.record), c.expected.size());
        const Packed p = pack(c.field, 8);
        EXPECT_EQ(p.result, -1);
        std::vector<uint8_t> want = c.expected;
        want.resize(p.bytes.size(), kUntouched);
        EXPECT_EQ(p.bytes, want);
    }
}

TEST(PackKeyValue, CapacityLimits) {
    const Field eight({1, 2, 3, 4, 5, 6, 7, 8}, 4);
    const Field nine({1, 2, 3, 4, 5, 6, 7, 8, 9}, 4);
    const Field none({}, 4);
    const std::vector<uint8_t> untouched(16, kUntouched);

    const Packed fit = pack(eight, 4);
    EXPECT_EQ(fit.result, -1);
    EXPECT_EQ(fit.bytes[0], 0x12);
    EXPECT_EQ(fit.bytes[3], 0x78);
    EXPECT_EQ(fit.bytes[4], kUntouched);

    const Packed over = pack(nine, 4);
    EXPECT_GE(over.result, 0);
    EXPECT_EQ(over.bytes, untouched);

    const Packed empty = pack(none, 1);
    EXPECT_EQ(empty.result, -1);
    EXPECT_EQ(empty.bytes, untouched);

    // No room at all is an overflow, even for a value of no bytes.
    EXPECT_GE(pack(none, 0).result, 0);
    const Packed zero = pack(eight, 0);
    EXPECT_GE(zero.result, 0);
    EXPECT_EQ(zero.bytes, untouched);
}

TEST(PackKeyValue, NegativeSpanValueOverflowsInsideTheValue) {
    const Field f({0x80000000u, 0x1}, 4);
    const Packed p = pack(f, 8);
    EXPECT_GE(p.result, 0);
    EXPECT_EQ(p.bytes[1], kUntouched);
}

TEST(PackKeyValue, PacksOnlyTheMeasuredSpans) {
    // More spans filled than reported: the bytes beyond the measured
    // length must stay untouched.
    Field f({1, 2, 3, 4, 5, 6}, 4);
    f.record.spansReported = 2;
    const Packed p = pack(f, 8);
    EXPECT_EQ(p.result, -1);
    EXPECT_EQ(p.bytes[0], 0x12);
    EXPECT_EQ(p.bytes[1], kUntouched);
}

TEST(PackKeyValue, MalformedSpansAreHarmless) {
    // A span ending before it starts counts no bits.
    Field f(std::vector<ValueSpan>{{0x5, 20, 10, 0, {0, 0}}, {0x6, 21, 24, 0, {0, 0}}});
    EXPECT_EQ(ValueBitLength(f.record), 4);
    const Packed p = pack(f, 8);
    EXPECT_EQ(p.result, -1);
    EXPECT_EQ(p.bytes[0], 0x06);
    EXPECT_EQ(p.bytes[1], kUntouched);

    // A span wider than 32 bits: its upper bits are zero, the value stays
    // inside its measured 5 bytes.
    Field wide(std::vector<ValueSpan>{{0xFFFFFFFFu >> 1, 1, 40, 0, {0, 0}}});
    const Packed w = pack(wide, 8);
    EXPECT_EQ(w.result, -1);
    EXPECT_EQ(w.bytes[0], 0x00);
    EXPECT_EQ(w.bytes[1], 0x7F);
    EXPECT_EQ(w.bytes[4], 0xFF);
    EXPECT_EQ(w.bytes[5], kUntouched);
}

TEST(WriteBitRange, LeavesBitsOutsideTheRangeAlone) {
    uint8_t dst[3] = {0xFF, 0xFF, 0xFF};
    const uint8_t zeros[camel::kSpanValueBytes] = {};
    camel::WriteBitRange(dst, 11, 4, zeros);
    EXPECT_EQ(dst[0], 0x0F);
    EXPECT_EQ(dst[1], 0xF0);
    EXPECT_EQ(dst[2], 0xFF);

    // Only as many source bits as the range holds: 12 bits of 0x3CA5.
    uint8_t zeros3[3] = {0, 0, 0};
    const uint8_t src[camel::kSpanValueBytes] = {0xA5, 0x3C, 0, 0};
    camel::WriteBitRange(zeros3, 17, 6, src);
    EXPECT_EQ(zeros3[0], 0x40);
    EXPECT_EQ(zeros3[1], 0x29);
    EXPECT_EQ(zeros3[2], 0x03);
}

} // namespace
