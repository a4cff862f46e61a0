// Runtime routines shared by every unit: bit extraction and reversal, growth
// of the host's arrays, field reset, layer frames, the position and end
// stacks and the BER length peek.
#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <random>
#include <vector>

#include "engine/cursor.h"
#include "engine/runtime.h"
#include "support/harness.h"

using camel::ExtractBits;
using camel::ReverseBits;
using camel::test::Bytes;
using camel::test::hexBytes;

namespace {

// Bit p (1-based) of the message: bit (p-1) mod 8 of octet (p-1) div 8.
uint32_t bitAt(const Bytes &b, uint32_t p) { return (b[(p - 1) / 8] >> ((p - 1) % 8)) & 1u; }

// Bit-by-bit reference: the lowest position lands in the lowest bit, and a
// reversed read puts `from` (the higher position) in the lowest bit.
uint32_t naiveExtract(const Bytes &b, uint32_t from, uint32_t to) {
    uint32_t v = 0;
    if (from <= to) {
        for (uint32_t p = from; p <= to; ++p)
            v |= bitAt(b, p) << (p - from);
    } else {
        for (uint32_t p = to; p <= from; ++p)
            v |= bitAt(b, p) << (from - p);
    }
    return v;
}

uint32_t naiveReverse(uint32_t value, uint32_t n) {
    uint32_t r = 0;
    for (uint32_t i = 0; i < n; ++i)
        if ((value >> i) & 1u)
            r |= 1u << (n - 1 - i);
    return r;
}

// A host-prepared state over a message, freed at the end of the test.
struct State {
    DecodeState *st;
    explicit State(const Bytes &m) : st(host_NewState(m.data(), static_cast<uint32_t>(m.size()))) {}
    ~State() { host_FreeState(st); }
    State(const State &) = delete;
    State &operator=(const State &) = delete;
    DecodeState *operator->() const { return st; }
};

// Turns realloc failure injection off whatever the test does.
struct ReallocGuard {
    ~ReallocGuard() { host_SetReallocFailAt(0); }
};

// ---- ExtractBits -------------------------------------------------------------

TEST(EngineExtractBits, DocumentedCases) {
    struct Case {
        const char *bytes;
        uint32_t from, to, expected;
    } cases[] = {
        {"A5", 1, 8, 0xA5},        // a whole octet
        {"A5", 8, 8, 1},           // its most significant bit
        {"A5", 1, 1, 1},           // its least significant bit
        {"A5", 2, 2, 0},
        {"12 34", 1, 16, 0x3412},  // octets assembled least significant first
        {"01", 8, 1, 0x80},        // reversed read
        {"80", 8, 1, 0x01},
        {"A5", 7, 8, 2},           // BER class bits of A5
        {"A5", 1, 5, 5},           // BER number bits of A5
        {"A5", 6, 6, 1},           // BER form bit of A5
        {"00 FF", 5, 12, 0xF0},    // unaligned: high half of 00, low half of FF
        {"12 34 56 78", 1, 32, 0x78563412},
        {"12 34 56 78", 32, 1, 0x482C6A1E},
    };
    for (const Case &c : cases) {
        const Bytes b = hexBytes(c.bytes);
        EXPECT_EQ(ExtractBits(b.data(), c.from, c.to), c.expected)
            << c.bytes << " " << c.from << ".." << c.to;
    }
}

TEST(EngineExtractBits, UnalignedReadsAcrossOctetsMatchBitByBitReference) {
    // Asymmetric octets, so that a swapped, shifted or mis-masked octet shows.
    const Bytes b = hexBytes("01 80 7E C3 5A 0F F0 96 3C");
    const uint32_t bits = static_cast<uint32_t>(b.size() * 8);
    for (uint32_t from = 1; from <= bits; ++from) {
        for (uint32_t width = 1; width <= 32 && from + width - 1 <= bits; ++width) {
            const uint32_t to = from + width - 1;
            ASSERT_EQ(ExtractBits(b.data(), from, to), naiveExtract(b, from, to))
                << from << ".." << to;
        }
    }
}

TEST(EngineExtractBits, ReversedReadsMatchBitByBitReference) {
    std::mt19937 rng(20040909);
    Bytes b(16);
    for (int round = 0; round < 50; ++round) {
        for (auto &octet : b)
            octet = static_cast<uint8_t>(rng());
        // 16- and 32-bit reversed reads go through the swap paths, the
        // others through the bit loop; aligned and unaligned starts alike.
        for (uint32_t width : {2u, 7u, 8u, 9u, 16u, 17u, 31u, 32u}) {
            for (uint32_t lo = 1; lo + width - 1 <= 128; lo += 3) {
                const uint32_t hi = lo + width - 1;
                ASSERT_EQ(ExtractBits(b.data(), hi, lo), naiveExtract(b, hi, lo))
                    << hi << ".." << lo << " round " << round;
            }
        }
    }
}

TEST(EngineExtractBits, ReadsOnlyTheOctetsOfTheRange) {
    // The message ends exactly at the last bit read: a read of one octet
    // too many is caught by the address sanitizer on this exact-size block.
    for (uint32_t n = 1; n <= 5; ++n) {
        auto *bytes = static_cast<uint8_t *>(std::malloc(n));
        for (uint32_t i = 0; i < n; ++i)
            bytes[i] = static_cast<uint8_t>(0x11 * (i + 1));
        const uint32_t last = 8 * n;
        const uint32_t first = last > 32 ? last - 31 : 1;
        EXPECT_EQ(ExtractBits(bytes, first, last), naiveExtract(Bytes(bytes, bytes + n), first, last));
        EXPECT_EQ(ExtractBits(bytes, last, last), static_cast<uint32_t>(bytes[n - 1] >> 7));
        std::free(bytes);
    }
}

// ---- ReverseBits -------------------------------------------------------------

TEST(EngineReverseBits, MatchesReferenceForEveryWidth) {
    std::mt19937 rng(29078);
    std::vector<uint32_t> values = {0, 1, 2, 0x80, 0xFF, 0x100, 0x8001, 0xFFFF, 0x12345678,
                                    0x80000000u, 0xFFFFFFFFu, 0xA5A5A5A5u};
    for (int i = 0; i < 2000; ++i)
        values.push_back(static_cast<uint32_t>(rng()));
    for (uint32_t n = 1; n <= 32; ++n) {
        for (uint32_t v : values) {
            ASSERT_EQ(ReverseBits(v, n), naiveReverse(v, n)) << std::hex << v << " n=" << std::dec << n;
        }
    }
}

TEST(EngineReverseBits, KnownValues) {
    EXPECT_EQ(ReverseBits(0x01, 8), 0x80u);
    EXPECT_EQ(ReverseBits(0x1F4, 8), 0x2Fu);      // only the low 8 bits count
    EXPECT_EQ(ReverseBits(0x0001, 16), 0x8000u);
    EXPECT_EQ(ReverseBits(0x3412, 16), 0x482Cu);
    EXPECT_EQ(ReverseBits(0x12345678, 32), 0x1E6A2C48u);
    EXPECT_EQ(ReverseBits(0x1, 32), 0x80000000u);
    EXPECT_EQ(ReverseBits(0x6, 3), 0x3u);
    EXPECT_EQ(ReverseBits(0, 17), 0u);
}

// ---- EnsureSlot / EnsureCapacityDoubling ---------------------------------------

TEST(EngineEnsureSlot, GrowsToIndexPlusOne) {
    struct Case {
        uint32_t index, count;
        uint32_t reallocs, countAfter;
    } cases[] = {
        {0, 0, 1, 1}, // empty array: one element
        {4, 5, 1, 5}, // the last slot: reallocated to the same size
        {2, 5, 0, 5}, // inside: untouched
        {7, 3, 1, 8}, // one slot at a time: exactly index + 1
    };
    for (const Case &c : cases) {
        void *array = std::malloc(c.count == 0 ? 1 : c.count * 24u);
        uint32_t count = c.count;
        host_SetReallocFailAt(0);
        ASSERT_EQ(camel::EnsureSlot(&array, c.index, &count, 24), 1);
        EXPECT_EQ(host_ReallocCalls(), c.reallocs) << c.index << "/" << c.count;
        EXPECT_EQ(count, c.countAfter);
        ASSERT_NE(array, nullptr);
        std::memset(array, 0x5A, count * 24u); // the whole array is writable
        std::free(array);
    }
}

TEST(EngineEnsureSlot, FailureStoresNullAndReturnsZero) {
    ReallocGuard guard;
    void *array = std::malloc(24);
    uint32_t count = 1;
    host_SetReallocFailAt(1);
    EXPECT_EQ(camel::EnsureSlot(&array, 3, &count, 24), 0);
    EXPECT_EQ(array, nullptr);
    EXPECT_EQ(count, 1u);
}

TEST(EngineEnsureCapacityDoubling, DoublesUntilTheIndexFits) {
    struct Case {
        uint32_t index, capacity;
        uint32_t capacityAfter, reallocs;
    } cases[] = {
        {5, 2, 8, 2},  // 2 -> 4 -> 8
        {1, 2, 2, 0},  // fits already
        {2, 2, 4, 1},  // index equal to the capacity grows
        {0, 0, 1, 1},  // a zero capacity still grows
        {9, 0, 16, 5}, // 0 -> 1 -> 2 -> 4 -> 8 -> 16
    };
    for (const Case &c : cases) {
        void *array = std::malloc(c.capacity == 0 ? 1 : c.capacity * 56u);
        uint32_t capacity = c.capacity;
        host_SetReallocFailAt(0);
        ASSERT_EQ(camel::EnsureCapacityDoubling(&array, c.index, &capacity, 56), 1);
        EXPECT_EQ(capacity, c.capacityAfter) << c.index << "/" << c.capacity;
        EXPECT_EQ(host_ReallocCalls(), c.reallocs) << c.index << "/" << c.capacity;
        std::memset(array, 0x5A, capacity * 56u);
        std::free(array);
    }
}

TEST(EngineEnsureCapacityDoubling, KeepsTheContents) {
    auto *array = static_cast<uint32_t *>(std::malloc(2 * sizeof(uint32_t)));
    array[0] = 11;
    array[1] = 22;
    void *p = array;
    uint32_t capacity = 2;
    ASSERT_EQ(camel::EnsureCapacityDoubling(&p, 6, &capacity, 4), 1);
    array = static_cast<uint32_t *>(p);
    EXPECT_EQ(array[0], 11u);
    EXPECT_EQ(array[1], 22u);
    array[7] = 77;
    std::free(array);
}

TEST(EngineEnsureCapacityDoubling, FailureStoresNullAndReturnsZero) {
    ReallocGuard guard;
    for (uint32_t failAt : {1u, 2u}) {
        void *array = std::malloc(2 * 4);
        uint32_t capacity = 2;
        host_SetReallocFailAt(failAt);
        EXPECT_EQ(camel::EnsureCapacityDoubling(&array, 5, &capacity, 4), 0) << failAt;
        EXPECT_EQ(array, nullptr) << failAt;
    }
}

// ---- ResetFieldRecord ------------------------------------------------------------

TEST(EngineResetFieldRecord, ClearsWhatEveryFieldSetsAnew) {
    char label[255], valueText[255];
    std::memset(label, 'L', sizeof label);
    std::memset(valueText, 'V', sizeof valueText);
    ValueSpan spans[2]{};
    FieldRecord f{};
    f.fieldId = 3705;
    f.label = label;
    f.value = 0xDEADBEEF;
    f.valueText = valueText;
    f.spansFilled = 2;
    f.spansReported = 2;
    f.spans = spans;
    f.spanCapacity = 2;
    f.lengthFieldBits = 16;
    f.valueKind = 7;
    camel::ResetFieldRecord(&f);
    EXPECT_EQ(f.value, 0u);
    EXPECT_EQ(label[0], '\0');
    EXPECT_EQ(valueText[0], '\0');
    EXPECT_EQ(f.spansFilled, 0u);
    EXPECT_EQ(f.valueKind, 0u);
    // Left for the unit to set before it reports.
    EXPECT_EQ(f.fieldId, 3705u);
    EXPECT_EQ(f.spansReported, 2u);
    EXPECT_EQ(f.spans, spans);
    EXPECT_EQ(f.spanCapacity, 2u);
    EXPECT_EQ(label[1], 'L');
}

// ---- PushLayerFrame -------------------------------------------------------------

TEST(EnginePushLayerFrame, CursorOneReusesFrameZeroElsewhereMovesOn) {
    State s(hexBytes("62 06 48 04 01 02 03 04"));
    std::memset(s->layerFrames, 0xEE, 2 * sizeof(LayerFrame));

    camel::PushLayerFrame(s.st);
    EXPECT_EQ(s->frameIndex, 0u);
    EXPECT_EQ(s->firstFrameFlag, 0u);
    EXPECT_EQ(s->layerFrames[0].startBit, 1u);
    for (uint32_t v : s->layerFrames[0].cleared)
        EXPECT_EQ(v, 0u);

    s->bitCursor = 17;
    camel::PushLayerFrame(s.st);
    EXPECT_EQ(s->frameIndex, 1u);
    EXPECT_EQ(s->layerFrames[1].startBit, 17u);
    for (uint32_t v : s->layerFrames[1].cleared)
        EXPECT_EQ(v, 0u);
    EXPECT_EQ(s->layerFrames[0].startBit, 1u); // the earlier frame is kept
}

// ---- Position and end stacks ------------------------------------------------------

TEST(EngineStacks, PoppingAnEndRestoresTheEnclosingWindowFromTheCursor) {
    State s(Bytes(4, 0)); // 32 message bits
    // An enclosing window of 24 bits, then an element window of 16 in it.
    s->remainingBits = 24;
    ASSERT_EQ(camel::pushEnd(s.st), 1);
    EXPECT_EQ(*s->endTop, 24u);
    ASSERT_TRUE(camel::narrowWindow(s.st, 16));
    ASSERT_EQ(camel::pushEnd(s.st), 1);
    EXPECT_EQ(*s->endTop, 16u);
    camel::consume(s.st, 16);
    EXPECT_EQ(s->remainingBits, 0u);
    camel::popEnd(s.st);
    EXPECT_EQ(s->remainingBits, 8u); // 24 - 17 + 1, not the message's 16
    camel::popEnd(s.st);
    EXPECT_EQ(s->remainingBits, 16u);
    EXPECT_EQ(s->endTop, s->endStack);
}

TEST(EngineStacks, WindowEndIsCursorPlusRemainingMinusOne) {
    State s(Bytes(8, 0));
    s->bitCursor = 13;
    s->remainingBits = 20;
    ASSERT_EQ(camel::pushEnd(s.st), 1);
    EXPECT_EQ(*s->endTop, 32u);
    EXPECT_EQ(s->endIndex, 1u);
    camel::consume(s.st, 4);
    camel::popEnd(s.st);
    EXPECT_EQ(s->remainingBits, 64u - 17 + 1);
}

TEST(EngineStacks, NarrowingBeyondTheWindowFlagsAndKeepsIt) {
    State s(Bytes(2, 0));
    EXPECT_FALSE(camel::narrowWindow(s.st, 17));
    EXPECT_EQ(s->remainingBits, 16u);
    EXPECT_EQ(s->errorFlags, DPX_ERR_LENGTH_BEYOND);
    EXPECT_TRUE(camel::narrowWindow(s.st, 16));
    EXPECT_FALSE(camel::narrowWindow(s.st, 0xFFFFFFFFFull)); // wider than 32 bits: no wrap
    EXPECT_EQ(s->remainingBits, 16u);
}

TEST(EngineStacks, PopEndNeverWrapsTheRemainingBits) {
    State s(Bytes(4, 0));
    s->remainingBits = 8;
    ASSERT_EQ(camel::pushEnd(s.st), 1); // inner window ends at bit 8
    ASSERT_EQ(camel::pushEnd(s.st), 1);
    s->bitCursor = 17; // past the end of the enclosing window
    camel::popEnd(s.st);
    EXPECT_EQ(s->remainingBits, 0u);
}

TEST(EngineStacks, StacksGrowFromCapacityOneAndKeepTheirEntries) {
    State s(Bytes(16, 0));
    s->posStack = static_cast<uint32_t *>(std::realloc(s->posStack, sizeof(uint32_t)));
    s->posTop = s->posStack;
    s->posCapacity = 1;
    s->endStack = static_cast<uint32_t *>(std::realloc(s->endStack, sizeof(uint32_t)));
    s->endTop = s->endStack;
    s->endCapacity = 1;

    for (uint32_t i = 1; i <= 5; ++i) {
        s->bitCursor = 8 * i + 1;
        s->remainingBits = 128 - 8 * i - i; // each window one bit shorter
        ASSERT_EQ(camel::pushPos(s.st), 1);
        ASSERT_EQ(camel::pushEnd(s.st), 1);
        EXPECT_EQ(s->posIndex, i);
        EXPECT_EQ(s->endIndex, i);
    }
    EXPECT_EQ(s->posCapacity, 8u);
    EXPECT_EQ(s->endCapacity, 8u);
    EXPECT_EQ(s->posStack[0], 1u);   // the host's bottom entries survive the moves
    EXPECT_EQ(s->endStack[0], 128u);
    for (uint32_t i = 1; i <= 5; ++i) {
        EXPECT_EQ(s->posStack[i], 8 * i + 1);
        EXPECT_EQ(s->endStack[i], 128u - i);
    }
    for (uint32_t i = 5; i >= 1; --i) {
        EXPECT_EQ(*s->posTop, 8 * i + 1);
        camel::popPos(s.st);
        camel::popEnd(s.st);
        EXPECT_EQ(s->remainingBits, 128u - (i - 1) - 41 + 1) << i;
    }
    EXPECT_EQ(s->posTop, s->posStack);
    EXPECT_EQ(s->endTop, s->endStack);
}

TEST(EngineStacks, GrowthFailureFlagsAndNullsTheStack) {
    ReallocGuard guard;
    {
        State s(Bytes(2, 0));
        s->posCapacity = 1;
        host_SetReallocFailAt(1);
        EXPECT_EQ(camel::pushPos(s.st), 0);
        EXPECT_EQ(s->posStack, nullptr);
        EXPECT_EQ(s->errorFlags, DPX_ERR_STACK_GROWTH);
    }
    {
        State s(Bytes(2, 0));
        s->endCapacity = 1;
        host_SetReallocFailAt(1);
        EXPECT_EQ(camel::pushEnd(s.st), 0);
        EXPECT_EQ(s->endStack, nullptr);
        EXPECT_EQ(s->errorFlags, DPX_ERR_STACK_GROWTH);
    }
}

// ---- BER length peek -----------------------------------------------------------------

TEST(EnginePeekLength, FormsAndLimits) {
    struct Case {
        const char *bytes;
        uint32_t window;  // remaining bits; 0: the whole message
        uint32_t offset;  // bits after the cursor
        bool fits;
        uint64_t value;
        uint32_t bits, octets;
    } cases[] = {
        {"05", 0, 0, true, 5, 8, 1},
        {"7F", 0, 0, true, 127, 8, 1},
        {"00", 0, 0, true, 0, 8, 1},
        {"80", 0, 0, true, 0, 8, 0},                       // indefinite
        {"81 05", 0, 0, true, 5, 16, 2},
        {"81 85", 0, 0, true, 133, 16, 2},
        {"82 01 00", 0, 0, true, 256, 24, 3},
        {"84 FF FF FF FF", 0, 0, true, 0xFFFFFFFF, 40, 5},
        {"85 00 00 00 01 00", 0, 0, true, 256, 48, 6},     // non-minimal, five octets
        {"85 01 00 00 00 00", 0, 0, true, 0xFFFFFFFF, 48, 6}, // 2^32 saturates
        {"89 01 00 00 00 00 00 00 00 00", 0, 0, true, 0xFFFFFFFF, 80, 10}, // 2^64: no wrap to 0
        {"8A FF FF FF FF FF FF FF FF FF FF", 0, 0, true, 0xFFFFFFFF, 88, 11},
        {"30 81 05", 0, 8, true, 5, 16, 2},                // after an identifier octet
        {"30 82 01 00", 24, 8, false, 0, 0, 0},            // after it, cut by the window
        {"82 01 00", 16, 0, false, 0, 0, 0},               // long form cut by the window
        {"82 01", 0, 0, false, 0, 0, 0},                   // cut by the message
        {"FF", 0, 0, false, 0, 0, 0},                      // 127 octets announced
        {"30", 0, 8, false, 0, 0, 0},                      // no length octet at all
        {"05", 7, 0, false, 0, 0, 0},                      // first octet not in the window
    };
    for (const Case &c : cases) {
        State s(hexBytes(c.bytes));
        if (c.window != 0)
            s->remainingBits = c.window;
        const camel::LengthPeek len = camel::peekLength(s.st, c.offset);
        EXPECT_EQ(len.fits, c.fits) << c.bytes;
        if (!c.fits)
            continue;
        EXPECT_EQ(len.value, c.value) << c.bytes;
        EXPECT_EQ(len.bits, c.bits) << c.bytes;
        EXPECT_EQ(len.octetCount, c.octets) << c.bytes;
        EXPECT_EQ(s->bitCursor, 1u) << "a peek consumes nothing";
    }
}

TEST(EnginePeekLength, UnalignedCursor) {
    // The length octets start at bit 5: 0x81 over bits 5..12, then 0x05.
    State s(hexBytes("10 58 00 00"));
    s->bitCursor = 5;
    s->remainingBits = 28;
    const camel::LengthPeek len = camel::peekLength(s.st, 0);
    ASSERT_TRUE(len.fits);
    EXPECT_EQ(len.octetCount, 2u);
    EXPECT_EQ(len.value, 5u);
}

} // namespace
