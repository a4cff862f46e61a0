// Runtime routines shared by every unit: bit extraction and reversal, growth
// of the host's arrays, layer frames, the position and end stacks and the
// BER length peek.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <memory>
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

// Bit-by-bit references: bit p (1-based) is bit (p-1) mod 8 of octet
// (p-1) div 8; the lower position lands in the lower bit, and a reversed
// read (from > to) puts `from` in the lowest bit.
uint32_t naiveExtract(const uint8_t *b, uint32_t from, uint32_t to) {
    uint32_t v = 0;
    const uint32_t lo = std::min(from, to), hi = std::max(from, to);
    for (uint32_t p = lo; p <= hi; ++p)
        v |= ((b[(p - 1) / 8] >> ((p - 1) % 8)) & 1u) << (from <= to ? p - from : from - p);
    return v;
}

uint32_t naiveReverse(uint32_t value, uint32_t n) {
    uint32_t r = 0;
    for (uint32_t i = 0; i < n; ++i)
        r |= ((value >> i) & 1u) << (n - 1 - i);
    return r;
}

// A host-prepared state over a message, freed at the end of the test.
using State = std::unique_ptr<DecodeState, void (*)(DecodeState *)>;
State stateOver(const Bytes &m) {
    return State(host_NewState(m.data(), static_cast<uint32_t>(m.size())), host_FreeState);
}

struct ReallocGuard {
    ~ReallocGuard() { host_SetReallocFailAt(0); }
};

// ---- ExtractBits / ReverseBits -------------------------------------------------

TEST(EngineExtractBits, EveryRangeMatchesTheReferenceAndStaysInTheBuffer) {
    // Asymmetric octets, so that a swapped, shifted or mis-masked octet
    // shows; an exact-size block, so that the address sanitizer sees a read
    // of one octet too many at the end.
    std::mt19937 rng(20040909);
    constexpr uint32_t kOctets = 11;
    auto *b = static_cast<uint8_t *>(std::malloc(kOctets));
    for (int round = 0; round < 8; ++round) {
        for (uint32_t i = 0; i < kOctets; ++i)
            b[i] = round == 0 ? hexBytes("01 80 7E C3 5A 0F F0 96 3C A5 E1")[i] : static_cast<uint8_t>(rng());
        for (uint32_t lo = 1; lo <= 8 * kOctets; ++lo) {
            for (uint32_t hi = lo; hi < lo + 32 && hi <= 8 * kOctets; ++hi) {
                ASSERT_EQ(ExtractBits(b, lo, hi), naiveExtract(b, lo, hi)) << lo << ".." << hi;
                ASSERT_EQ(ExtractBits(b, hi, lo), naiveExtract(b, hi, lo)) << hi << ".." << lo;
            }
        }
    }
    std::free(b);
}

TEST(EngineReverseBits, MatchesTheReferenceForEveryWidth) {
    std::mt19937 rng(29078);
    std::vector<uint32_t> values = {0, 1, 0x80, 0x1F4, 0x8001, 0xFFFF, 0x80000000u, 0xFFFFFFFFu};
    for (int i = 0; i < 300; ++i)
        values.push_back(static_cast<uint32_t>(rng()));
    for (uint32_t n = 1; n <= 32; ++n)
        for (uint32_t v : values)
            ASSERT_EQ(ReverseBits(v, n), naiveReverse(v, n)) << std::hex << v << " n=" << std::dec << n;
}

// ---- Growth of the host's arrays --------------------------------------------------

TEST(EngineGrowth, EnsureSlotToIndexPlusOneAndDoublingUntilTheIndexFits) {
    ReallocGuard guard;
    struct Case {
        bool doubling;
        uint32_t index, count, countAfter, reallocs;
    } cases[] = {
        {false, 0, 0, 1, 1}, {false, 2, 5, 5, 0}, {false, 7, 3, 8, 1}, // one slot at a time
        {true, 1, 2, 2, 0},  {true, 2, 2, 4, 1},                        // index equal to the capacity grows
        {true, 9, 0, 16, 5},                                             // a zero capacity too: 1, 2, 4, 8, 16
    };
    for (const Case &c : cases) {
        void *array = std::malloc(c.count == 0 ? 1 : c.count * 24u);
        uint32_t count = c.count;
        host_SetReallocFailAt(0);
        ASSERT_EQ(c.doubling ? camel::EnsureCapacityDoubling(&array, c.index, &count, 24)
                             : camel::EnsureSlot(&array, c.index, &count, 24), 1);
        EXPECT_EQ(count, c.countAfter) << c.doubling << " " << c.index << "/" << c.count;
        EXPECT_EQ(host_ReallocCalls(), c.reallocs) << c.doubling << " " << c.index << "/" << c.count;
        std::memset(array, 0x5A, count * 24u); // the whole array is writable
        std::free(array);
    }
    // A failed growth, the first or a later doubling, leaves a null array.
    for (uint32_t failAt : {0u, 1u, 2u}) { // 0: EnsureSlot's only call
        void *array = std::malloc(8);
        uint32_t count = 2;
        host_SetReallocFailAt(failAt == 0 ? 1 : failAt);
        EXPECT_EQ(failAt == 0 ? camel::EnsureSlot(&array, 5, &count, 4)
                              : camel::EnsureCapacityDoubling(&array, 5, &count, 4), 0) << failAt;
        EXPECT_EQ(array, nullptr) << failAt;
    }
}

// ---- Layer frames -------------------------------------------------------------------

TEST(EnginePushLayerFrame, CursorOneReusesFrameZeroElsewhereMovesOn) {
    State s = stateOver(Bytes(8, 0));
    std::memset(s->layerFrames, 0xEE, 2 * sizeof(LayerFrame));
    camel::PushLayerFrame(s.get());
    EXPECT_EQ(s->frameIndex, 0u);
    EXPECT_EQ(s->layerFrames[0].startBit, 1u);
    s->bitCursor = 17;
    camel::PushLayerFrame(s.get());
    EXPECT_EQ(s->frameIndex, 1u);
    EXPECT_EQ(s->layerFrames[1].startBit, 17u);
    EXPECT_EQ(s->layerFrames[0].startBit, 1u);
    for (uint32_t f = 0; f < 2; ++f)
        for (uint32_t v : s->layerFrames[f].cleared)
            EXPECT_EQ(v, 0u);
}

// ---- Position and end stacks -----------------------------------------------------------

TEST(EngineStacks, WindowsNarrowPushAndPopFromTheCursorWithoutWrapping) {
    State s = stateOver(Bytes(4, 0)); // 32 message bits
    s->bitCursor = 5;
    s->remainingBits = 20; // an enclosing window over bits 5..24
    ASSERT_EQ(camel::pushEnd(s.get()), 1);
    EXPECT_EQ(*s->endTop, 24u);
    EXPECT_FALSE(camel::narrowWindow(s.get(), 21));
    EXPECT_FALSE(camel::narrowWindow(s.get(), 0x100000010ull)); // wider than 32 bits: no wrap
    EXPECT_EQ(s->remainingBits, 20u) << "a failed narrowing keeps the window";
    EXPECT_EQ(s->errorFlags, DPX_ERR_LENGTH_BEYOND);
    ASSERT_TRUE(camel::narrowWindow(s.get(), 12));
    ASSERT_EQ(camel::pushEnd(s.get()), 1);
    EXPECT_EQ(*s->endTop, 16u);
    camel::consume(s.get(), 12);
    camel::popEnd(s.get());
    EXPECT_EQ(s->remainingBits, 8u); // 24 - 17 + 1
    ASSERT_EQ(camel::pushEnd(s.get()), 1);
    s->bitCursor = 26; // past the end of the enclosing window
    camel::popEnd(s.get());
    EXPECT_EQ(s->remainingBits, 0u);
    camel::popEnd(s.get());
    EXPECT_EQ(s->remainingBits, 7u);
    EXPECT_EQ(s->endTop, s->endStack);
}

TEST(EngineStacks, GrowFromCapacityOneKeepingTheirEntriesOrFlagTheFailure) {
    ReallocGuard guard;
    State s = stateOver(Bytes(16, 0));
    // Exactly one entry each, so that a write past the capacity is caught.
    s->posTop = s->posStack = static_cast<uint32_t *>(std::realloc(s->posStack, sizeof(uint32_t)));
    s->endTop = s->endStack = static_cast<uint32_t *>(std::realloc(s->endStack, sizeof(uint32_t)));
    s->posCapacity = s->endCapacity = 1;
    for (uint32_t i = 1; i <= 5; ++i) {
        s->bitCursor = 8 * i + 1;
        s->remainingBits = 128 - 8 * i - i; // each window one bit shorter
        ASSERT_EQ(camel::pushPos(s.get()), 1);
        ASSERT_EQ(camel::pushEnd(s.get()), 1);
    }
    for (uint32_t i = 0; i <= 5; ++i) { // entries 0 are the host's
        EXPECT_EQ(s->posStack[i], 8 * i + 1) << i;
        EXPECT_EQ(s->endStack[i], 128 - i) << i;
    }
    for (int i = 0; i < 5; ++i) {
        camel::popPos(s.get());
        camel::popEnd(s.get());
    }
    EXPECT_EQ(s->posTop, s->posStack);
    EXPECT_EQ(s->endTop, s->endStack);
    for (bool pos : {true, false}) {
        State f = stateOver(Bytes(2, 0));
        f->posCapacity = f->endCapacity = 1;
        host_SetReallocFailAt(1);
        EXPECT_EQ(pos ? camel::pushPos(f.get()) : camel::pushEnd(f.get()), 0);
        EXPECT_EQ(pos ? f->posStack : f->endStack, nullptr) << pos;
        EXPECT_EQ(f->errorFlags, DPX_ERR_STACK_GROWTH);
    }
}

// ---- BER length peek -----------------------------------------------------------------

TEST(EnginePeekLength, FormsSaturationAndWindowCuts) {
    struct Case {
        const char *bytes;
        uint32_t cursor, window, offset; // window 0: to the end of the message
        uint64_t value;
        uint32_t bits, octets; // bits 0: the length does not fit
    } cases[] = {
        {"7F", 1, 0, 0, 127, 8, 1},
        {"80", 1, 0, 0, 0, 8, 0}, // indefinite
        {"82 01 00", 1, 0, 0, 256, 24, 3},
        {"85 00 00 00 01 00", 1, 0, 0, 256, 48, 6},                    // non-minimal
        {"85 01 00 00 00 00", 1, 0, 0, 0xFFFFFFFF, 48, 6},             // 2^32 saturates
        {"89 01 00 00 00 00 00 00 00 00", 1, 0, 0, 0xFFFFFFFF, 80, 10}, // 2^64: no wrap
        {"30 81 05", 1, 0, 8, 5, 16, 2},   // after an identifier octet
        {"10 58 00 00", 5, 0, 0, 5, 16, 2}, // unaligned: 81 over bits 5..12, then 05
        {"30 82 01 00", 1, 24, 8, 0, 0, 0}, // cut by the window
        {"82 01", 1, 0, 0, 0, 0, 0},        // cut by the message
        {"30", 1, 0, 8, 0, 0, 0},           // no length octet at all
    };
    for (const Case &c : cases) {
        State s = stateOver(hexBytes(c.bytes));
        s->bitCursor = c.cursor;
        s->remainingBits = c.window != 0 ? c.window : s->totalBits - c.cursor + 1;
        const camel::LengthPeek len = camel::peekLength(s.get(), c.offset);
        EXPECT_EQ(len.fits, c.bits != 0) << c.bytes;
        EXPECT_EQ(s->bitCursor, c.cursor) << "a peek consumes nothing";
        if (len.fits) {
            EXPECT_EQ((std::vector<uint64_t>{len.value, len.bits, len.octetCount}),
                      (std::vector<uint64_t>{c.value, c.bits, c.octets})) << c.bytes;
        }
    }
}

} // namespace
