// The exported entry points: table access, the time-stamp formatter, and
// the frame every pass runs in (layer entries, layer frames, the remaining
// bits handed back, growth failure of the layer frames).
#include <gtest/gtest.h>

#include <climits>
#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

#include "support/harness.h"

using camel::test::Bytes;
using camel::test::hexBytes;

namespace {

const Bytes kBegin = hexBytes("62 06 48 04 01 02 03 04");
constexpr uint32_t kBeginBits = 64;

// ---- Table access and date_conv -------------------------------------------------

TEST(PluginTables, InterfaceVersionAtIndexOneOtherIndexesRefused) {
    const struct {
        uint32_t (*get)(int32_t, const void **);
        int32_t last;
    } entries[] = {{dp_DLLGetTable, 9}, {dp_DLLGetPtr, 5}};
    for (const auto &e : entries) {
        const void *out = nullptr;
        EXPECT_EQ(e.get(1, &out), 0u);
        ASSERT_NE(out, nullptr);
        EXPECT_STREQ(static_cast<const char *>(out), "QZ1.02.01");
        for (int32_t index = 2; index <= e.last; ++index) {
            out = nullptr;
            if (index != 3) {
                EXPECT_EQ(e.get(index, &out), 0u) << index;
                EXPECT_NE(out, nullptr) << index;
            }
        }
        for (int32_t index : {0, -1, 3, e.last + 1, INT32_MIN, INT32_MAX}) {
            out = &kBeginBits;
            EXPECT_EQ(e.get(index, &out), DPX_TABLE_BAD_INDEX) << index;
            EXPECT_EQ(out, nullptr) << index;
        }
    }
}

TEST(PluginDateConv, AppendsUtcCalendarTime) {
    struct Case {
        uint32_t seconds;
        const char *text;
    } cases[] = {
        {0, "1970-01-01 00:00:00"},
        {951827696, "2000-02-29 12:34:56"},   // leap day of a century divisible by 400
        {2147483648u, "2038-01-19 03:14:08"}, // past a signed 32-bit time
        {4107542400u, "2100-03-01 00:00:00"}, // 2100 has no 29 February
        {0xFFFFFFFFu, "2106-02-07 06:28:15"},
    };
    // The record is the host's: offset 212 need not be aligned in memory.
    std::vector<unsigned char> block(217, 0);
    unsigned char *record = block.data() + 1;
    for (const Case &c : cases) {
        std::memcpy(record + 212, &c.seconds, sizeof c.seconds);
        char dst[64] = "Time: ";
        EXPECT_EQ(date_conv(dst, 0xA5A5A5A5u, record), dst);
        EXPECT_EQ(std::string(dst), std::string("Time: ") + c.text) << c.seconds;
    }
}

// ---- Pass frame --------------------------------------------------------------------------

enum Which { MD, TO, MV, KF };
constexpr const char *kNames[] = {"MD", "TO", "MV", "KFE"};

// One pass over a state it owns, with a request whose layer entries hold
// entries 0..layerLimit; `remaining` is what the pass handed back (the
// key-field request has its own member for it).
struct PassRun {
    DecodeState *st;
    PreDecodeRequest rq{};
    uint32_t remaining = 0;
    PassRun(DecodeState *state, uint32_t layerLimit) : st(state) {
        host_InitRequest(&rq, st, 4, layerLimit);
        rq.layerCode = 0xFE;
        rq.layerTag = 0x87654321;
        rq.remainingBits = 0xDEAD;
        host_ClearRecords();
    }
    PassRun(const Bytes &m, uint32_t layerLimit)
        : PassRun(host_NewState(m.data(), static_cast<uint32_t>(m.size())), layerLimit) {}
    ~PassRun() {
        host_ClearRecords();
        host_FreeRequest(&rq);
        host_FreeState(st);
    }
    PassRun(const PassRun &) = delete;
    PassRun &operator=(const PassRun &) = delete;
    int pass(Which which) {
        if (which != KF) {
            const int r = which == MD ? dpx_PreDecodeMD(&rq) : which == TO ? dpx_PreDecodeTO(&rq) : dpx_PreDecodeMV(&rq);
            remaining = rq.remainingBits;
            return r;
        }
        std::vector<uint8_t> keys(4096, 0);
        KeyFieldRequest kr{};
        kr.keyBuffer = keys.data();
        kr.dataOffset = HOST_KEY_DATA_START;
        kr.valueRoom = static_cast<uint16_t>(keys.size() - HOST_KEY_DATA_START);
        kr.state = st;
        kr.remainingBits = 0xDEAD;
        const int r = KFE_3gpp_camel_400(&kr);
        remaining = kr.remainingBits;
        return r;
    }
};

TEST(PluginLayerEntries, FilledAtTheIndexTheHostCreatingOneBeyondTheLimit) {
    struct Case {
        Which pass;
        uint32_t index, creates, indexAfter;
    } cases[] = {
        {MD, 2, 1, 3}, {TO, 2, 1, 3}, // beyond the limit: the host is asked first
        {MD, 1, 0, 2}, {TO, 1, 0, 2}, // equal to the limit: the entry exists
        {MV, 3, 0, 3}, {KF, 3, 0, 3}, // the other passes fill none
    };
    for (const Case &c : cases) {
        // Two octets follow the message window: the outermost window still
        // holds them at the end, and every pass hands them back.
        PassRun r(hexBytes("62 06 48 04 01 02 03 04 FF FF"), 1);
        r.rq.layerIndex = c.index;
        ASSERT_EQ(r.pass(c.pass), 1) << kNames[c.pass];
        EXPECT_EQ(host_CreateLayerCalls(), c.creates) << kNames[c.pass] << " " << c.index;
        EXPECT_EQ(r.rq.layerIndex, c.indexAfter) << kNames[c.pass] << " " << c.index;
        EXPECT_EQ(r.remaining, 16u) << kNames[c.pass];
        EXPECT_EQ(r.st->bitCursor, kBeginBits + 1) << kNames[c.pass];
        if (c.pass == MV || c.pass == KF) {
            EXPECT_EQ(r.rq.layerEntries[1].lastBit, 0u) << kNames[c.pass];
            continue;
        }
        const LayerInfoEntry &e = r.rq.layerEntries[c.index];
        EXPECT_EQ(e.firstBit, 1u);
        EXPECT_EQ(e.lastBit, kBeginBits);
        EXPECT_EQ(e.layerTag, 0x87654321u);
        EXPECT_EQ(e.layerCode, 0xFEu) << "zero-extended";
    }
}

// ---- A message after a lower layer: cursor not at 1 ----------------------------------------

// Two octets of a lower layer the host decoded first, then the message; the
// layer-frame array holds exactly `capacity` frames (so a write past it is
// caught) and the lower layer's frame is the current one.
DecodeState *offsetState(uint32_t frameIndex, uint32_t capacity) {
    Bytes m = hexBytes("AA BB");
    m.insert(m.end(), kBegin.begin(), kBegin.end());
    DecodeState *st = host_NewState(m.data(), static_cast<uint32_t>(m.size()));
    st->bitCursor = 17;
    st->remainingBits = st->totalBits - 16;
    st->firstFrameFlag = 0;
    st->frameIndex = frameIndex;
    st->layerFrames = static_cast<LayerFrame *>(std::realloc(st->layerFrames, capacity * sizeof(LayerFrame)));
    std::memset(st->layerFrames, 0x77, capacity * sizeof(LayerFrame));
    st->layerFrames[frameIndex].startBit = 1;
    st->frameCapacity = capacity;
    return st;
}

// The decoded fields as "id text first-last ..." lines, positions shifted.
std::vector<std::string> reported(uint32_t shift) {
    std::vector<std::string> out;
    for (uint32_t i = 0; i < host_DecodedCount(); ++i) {
        const HostDecodedField *f = host_Decoded(i);
        std::string line = std::to_string(f->fieldId) + " " + f->text;
        for (uint32_t k = 0; k < f->spanCount; ++k)
            line += " " + std::to_string(f->spans[k].firstBit - shift) + "-" +
                    std::to_string(f->spans[k].lastBit - shift);
        out.push_back(line);
    }
    return out;
}

TEST(PluginOffsetMessage, DecodedInTheNextLayerFrame) {
    std::vector<std::string> plain; // the same message at the start of a buffer
    {
        PassRun r(kBegin, 4);
        ASSERT_EQ(r.pass(MD), 1);
        plain = reported(0);
    }
    ASSERT_EQ(plain.size(), 5u);
    struct Case {
        uint32_t frameIndex, capacity;
    } cases[] = {{0, 1}, {3, 4}, {0, 4}};
    for (const Case &c : cases) {
        for (Which w : {MD, TO, MV, KF}) {
            PassRun r(offsetState(c.frameIndex, c.capacity), 4);
            ASSERT_EQ(r.pass(w), 1) << kNames[w];
            const std::string where = std::string(kNames[w]) + " frame " + std::to_string(c.frameIndex) +
                                      "/" + std::to_string(c.capacity);
            const LayerFrame *frames = r.st->layerFrames;
            EXPECT_EQ(r.st->frameIndex, c.frameIndex + 1) << where;
            EXPECT_EQ(frames[c.frameIndex + 1].startBit, 17u) << where;
            EXPECT_EQ(frames[c.frameIndex + 1].cleared[12], 0u) << where;
            EXPECT_EQ(frames[c.frameIndex].startBit, 1u) << where << ": lower layer kept";
            EXPECT_EQ(frames[c.frameIndex].cleared[0], 0x77777777u) << where;
            EXPECT_EQ(r.st->bitCursor, 17 + kBeginBits) << where;
            EXPECT_EQ(r.st->errorFlags, 0u) << where;
            EXPECT_EQ(r.remaining, 0u) << where;
            if (w == MD || w == TO) {
                EXPECT_EQ(r.rq.layerEntries[0].firstBit, 17u) << where;
                EXPECT_EQ(r.rq.layerEntries[0].lastBit, 16 + kBeginBits) << where;
            }
            if (w == MD) {
                EXPECT_EQ(reported(16), plain) << where;
            }
        }
    }
}

TEST(PluginOffsetMessage, LayerFrameGrowthFailureEndsThePass) {
    for (Which w : {MD, TO, MV, KF}) {
        PassRun r(offsetState(0, 1), 4);
        host_SetReallocFailAt(1);
        const int result = r.pass(w);
        host_SetReallocFailAt(0);
        EXPECT_EQ(result, 0) << kNames[w];
        EXPECT_EQ(r.st->errorFlags, DPX_ERR_FRAME_GROWTH) << kNames[w];
        EXPECT_EQ(r.st->layerFrames, nullptr) << kNames[w];
        EXPECT_EQ(r.remaining, 0xDEADu) << kNames[w] << ": remaining bits not stored";
        EXPECT_EQ(r.rq.layerIndex, 0u) << kNames[w];
        EXPECT_EQ(r.rq.layerEntries[0].lastBit, 0u) << kNames[w];
    }
}

} // namespace
