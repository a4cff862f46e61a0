// Packing of variable key values: digit strings, octet strings and
// transaction ids into the key buffer's data area.

#include "keyfields/key_pack.h"

#include "key_test_field.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <vector>

namespace {

using camel::PackKeyValue;
using keytest::digits;
using keytest::Field;
using keytest::runs;
using Bytes = std::vector<uint8_t>;
using Spans = std::vector<ValueSpan>;

constexpr uint8_t kUntouched = 0xEE;

// A transaction id as its unit reports it: per octet, bits 8-5 then bits 4-1.
Field transactionId(std::initializer_list<uint8_t> octets) {
    Spans spans;
    uint32_t bit = 17;
    for (uint8_t o : octets) {
        spans.push_back(ValueSpan{uint32_t(o >> 4), bit + 4, bit + 7, 0, {0, 0}});
        spans.push_back(ValueSpan{uint32_t(o & 0x0F), bit, bit + 3, 0, {0, 0}});
        bit += 8;
    }
    return Field(std::move(spans));
}

TEST(PackKeyValue, PackedFormsAndCapacity) {
    struct Case {
        const char *name;
        Field field;
        uint32_t capacity;
        int32_t bits;
        bool fits;
        Bytes packed; // the buffer's first bytes; all others stay untouched
    };
    const Case cases[] = {
        {"odd digit count", digits(5), 8, 20, true, {0x01, 0x23, 0x45}},
        {"even digit count", digits(4), 8, 16, true, {0x12, 0x34}},
        {"one digit", runs({7}, 4), 8, 4, true, {0x07}},
        {"octets", runs({0x61, 0x62}, 8), 8, 16, true, {0x61, 0x62}},
        {"all-ones octet", runs({0xFF}, 8), 8, 8, true, {0xFF}},
        {"nibbles give the octets as received", transactionId({0x0A, 0xBC, 0x12, 0xF0}), 8, 32, true,
         {0x0A, 0xBC, 0x12, 0xF0}},
        // Only a span's own bits count, whatever its value holds above them.
        {"value wider than its span", runs({0x1F, 0x2E}, 4), 8, 8, true, {0xFE}},
        // Packing runs from the last span: the upper value byte of 0x123 must
        // not carry over into the 12 bits of 0x005.
        {"12-bit spans", runs({0x005, 0x123}, 12), 8, 24, true, {0x00, 0x51, 0x23}},
        // A span wider than 32 bits reads zeros above its value.
        {"40-bit span", Field(Spans{{0x7FFFFFFF, 1, 40, 0, {0, 0}}}), 8, 40, true,
         {0x00, 0x7F, 0xFF, 0xFF, 0xFF}},
        {"span ending before its start", Field(Spans{{5, 20, 10, 0, {0, 0}}, {6, 21, 24, 0, {0, 0}}}),
         8, 4, true, {0x06}},
        {"only the reported spans", Field(digits(6).spans, 2), 8, 8, true, {0x12}},
        {"exact fit", digits(8), 4, 32, true, {0x12, 0x34, 0x56, 0x78}},
        {"one byte over", digits(9), 4, 36, false, {}},
        {"no spans", runs({}, 4), 1, 0, true, {}},
        // No room at all is an overflow, even for a value of no bytes.
        {"capacity 0", digits(8), 0, 32, false, {}},
        {"no spans, capacity 0", runs({}, 4), 0, 0, false, {}},
    };
    for (const Case &c : cases) {
        SCOPED_TRACE(c.name);
        EXPECT_EQ(camel::ValueBitLength(c.field.record), c.bits);
        Bytes buf(16, kUntouched);
        const int32_t r = PackKeyValue(c.field.record, buf.data(), c.capacity);
        EXPECT_TRUE(c.fits ? r == -1 : r >= 0) << r;
        Bytes want = c.packed;
        want.resize(buf.size(), kUntouched);
        EXPECT_EQ(buf, want);
    }
}

TEST(PackKeyValue, NegativeSpanValueOverflowsInsideTheValue) {
    const Field f = runs({0x80000000u, 0x1}, 4);
    Bytes buf(16, kUntouched);
    EXPECT_GE(PackKeyValue(f.record, buf.data(), 8), 0);
    EXPECT_EQ(Bytes(buf.begin() + 1, buf.end()), Bytes(15, kUntouched));
}

TEST(WriteBitRange, WritesOnlyTheRangeFromTheSourcesLowBits) {
    uint8_t ones[3] = {0xFF, 0xFF, 0xFF};
    const uint8_t zeros[camel::kSpanValueBytes] = {};
    camel::WriteBitRange(ones, 11, 4, zeros);
    EXPECT_EQ(Bytes(ones, ones + 3), (Bytes{0x0F, 0xF0, 0xFF}));

    uint8_t dst[3] = {0, 0, 0};
    const uint8_t src[camel::kSpanValueBytes] = {0xA5, 0x3C, 0, 0};
    camel::WriteBitRange(dst, 17, 6, src); // 12 bits of 0x3CA5 from bit 6 on
    EXPECT_EQ(Bytes(dst, dst + 3), (Bytes{0x40, 0x29, 0x03}));
}

// Every start and width, octet-aligned or not, against a bit-by-bit model:
// the bits of the range come from the source's low bits (zeros past its
// bytes), every other bit of the destination is left as it was.
TEST(WriteBitRange, MatchesABitByBitModelAtEveryOffsetAndWidth) {
    const uint8_t src[camel::kSpanValueBytes] = {0xA5, 0x3C, 0x81, 0x7E};
    for (uint32_t first = 0; first < 24; ++first)
        for (uint32_t count = 1; count <= 48; ++count) {
            uint8_t dst[10];
            for (size_t k = 0; k < sizeof dst; ++k)
                dst[k] = uint8_t(0x96 ^ (k * 0x1D));
            uint8_t want[10];
            std::copy(dst, dst + sizeof dst, want);
            for (uint32_t i = 0; i < count; ++i) {
                const uint32_t bit = i < 32 ? (src[i / 8] >> (i % 8)) & 1u : 0u;
                const uint32_t d = first + i;
                want[d / 8] = uint8_t((want[d / 8] & ~(1u << (d % 8))) | bit << (d % 8));
            }
            camel::WriteBitRange(dst, first + count - 1, first, src);
            ASSERT_EQ(Bytes(dst, dst + sizeof dst), Bytes(want, want + sizeof want))
                << "from bit " << first << ", " << count << " bits";
        }
}

} // namespace
