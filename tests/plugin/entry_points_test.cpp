// The exported entry points: table access, the time-stamp formatter, and
// the frame every pass runs in (layer entries, layer frames, the remaining
// bits handed back, growth failure of the layer frames).
#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <memory>
#include <string>
#include <vector>

#include "support/harness.h"

using camel::test::Bytes;
using camel::test::hexBytes;

namespace {

const Bytes kBegin = hexBytes("62 06 48 04 01 02 03 04");
constexpr uint32_t kBeginBits = 64;

// ---- Table access ----------------------------------------------------------------

TEST(PluginTables, InterfaceVersionAtIndexOne) {
    const void *out = nullptr;
    EXPECT_EQ(dp_DLLGetTable(1, &out), 0u);
    ASSERT_NE(out, nullptr);
    EXPECT_STREQ(static_cast<const char *>(out), "QZ1.02.01");
    out = nullptr;
    EXPECT_EQ(dp_DLLGetPtr(1, &out), 0u);
    ASSERT_NE(out, nullptr);
    EXPECT_STREQ(static_cast<const char *>(out), "QZ1.02.01");
}

TEST(PluginTables, BadIndexesStoreNullAndFail) {
    static const int dummy = 0;
    for (int32_t index : {0, -1, 3, 10, INT32_MIN, INT32_MAX}) {
        const void *out = &dummy;
        EXPECT_EQ(dp_DLLGetTable(index, &out), DPX_TABLE_BAD_INDEX) << index;
        EXPECT_EQ(out, nullptr) << index;
    }
    for (int32_t index : {0, -1, 3, 6, 9, INT32_MIN}) {
        const void *out = &dummy;
        EXPECT_EQ(dp_DLLGetPtr(index, &out), DPX_TABLE_BAD_INDEX) << index;
        EXPECT_EQ(out, nullptr) << index;
    }
}

// ---- date_conv -------------------------------------------------------------------------

std::string dateOf(const char *before, uint32_t seconds) {
    unsigned char record[216] = {};
    std::memcpy(record + 212, &seconds, sizeof seconds);
    char dst[64];
    std::strcpy(dst, before);
    EXPECT_EQ(date_conv(dst, 0xA5A5A5A5u, record), dst);
    return dst;
}

TEST(PluginDateConv, UtcCalendarTime) {
    struct Case {
        uint32_t seconds;
        const char *text;
    } cases[] = {
        {0, "1970-01-01 00:00:00"},
        {59, "1970-01-01 00:00:59"},
        {86399, "1970-01-01 23:59:59"},
        {68255999, "1972-02-29 23:59:59"},   // first leap day
        {951827696, "2000-02-29 12:34:56"},  // leap day of a century divisible by 400
        {1104537599, "2004-12-31 23:59:59"},
        {1709164800, "2024-02-29 00:00:00"},
        {2147483648u, "2038-01-19 03:14:08"}, // past a signed 32-bit time
        {4107542400u, "2100-03-01 00:00:00"}, // 2100 has no 29 February
        {0xFFFFFFFFu, "2106-02-07 06:28:15"},
    };
    for (const Case &c : cases)
        EXPECT_EQ(dateOf("", c.seconds), c.text) << c.seconds;
}

TEST(PluginDateConv, AppendsToExistingText) {
    EXPECT_EQ(dateOf("Time: ", 0), "Time: 1970-01-01 00:00:00");
}

TEST(PluginDateConv, ReadsTheTimeFromAnUnalignedRecord) {
    // The record is the host's; offset 212 need not be aligned in memory.
    std::vector<unsigned char> block(217, 0);
    const uint32_t seconds = 951827696;
    std::memcpy(block.data() + 1 + 212, &seconds, sizeof seconds);
    char dst[32] = "";
    date_conv(dst, 0, block.data() + 1);
    EXPECT_STREQ(dst, "2000-02-29 12:34:56");
}

// ---- Pass frame --------------------------------------------------------------------------

struct State {
    DecodeState *st;
    explicit State(const Bytes &m) : st(host_NewState(m.data(), static_cast<uint32_t>(m.size()))) {}
    ~State() { host_FreeState(st); }
    State(const State &) = delete;
    State &operator=(const State &) = delete;
    DecodeState *operator->() const { return st; }
};

struct Request {
    PreDecodeRequest rq{};
    Request(DecodeState *st, uint32_t layerLimit) {
        host_InitRequest(&rq, st, 4, layerLimit);
        rq.layerCode = 0xFE;
        rq.layerTag = 0x87654321;
        rq.remainingBits = 0xDEAD;
    }
    ~Request() { host_FreeRequest(&rq); }
    Request(const Request &) = delete;
    Request &operator=(const Request &) = delete;
};

enum class Which { MD, TO, MV, KF };
const char *nameOf(Which w) {
    switch (w) {
    case Which::MD: return "MD";
    case Which::TO: return "TO";
    case Which::MV: return "MV";
    case Which::KF: return "KFE";
    }
    return "";
}

// Runs one pass; the remaining bits the request received come back in
// *remaining (the key-field request has its own member for it).
int runPass(Which which, DecodeState *st, PreDecodeRequest *rq, uint32_t *remaining) {
    switch (which) {
    case Which::MD: {
        const int r = dpx_PreDecodeMD(rq);
        *remaining = rq->remainingBits;
        return r;
    }
    case Which::TO: {
        const int r = dpx_PreDecodeTO(rq);
        *remaining = rq->remainingBits;
        return r;
    }
    case Which::MV: {
        const int r = dpx_PreDecodeMV(rq);
        *remaining = rq->remainingBits;
        return r;
    }
    case Which::KF: {
        static std::vector<uint8_t> keys;
        keys.assign(4096, 0);
        KeyFieldRequest kr{};
        kr.keyBuffer = keys.data();
        kr.dataOffset = HOST_KEY_DATA_START;
        kr.valueRoom = static_cast<uint16_t>(keys.size() - HOST_KEY_DATA_START);
        kr.state = st;
        kr.remainingBits = 0xDEAD;
        const int r = KFE_3gpp_camel_400(&kr);
        *remaining = kr.remainingBits;
        return r;
    }
    }
    return -1;
}

TEST(PluginLayerEntries, IndexBeyondTheLimitAsksTheHostFirst) {
    for (Which w : {Which::MD, Which::TO}) {
        State s(kBegin);
        Request r(s.st, 1); // room for entries 0 and 1
        r.rq.layerIndex = 2;
        host_ClearRecords();
        uint32_t remaining = 0;
        ASSERT_EQ(runPass(w, s.st, &r.rq, &remaining), 1) << nameOf(w);
        EXPECT_EQ(host_CreateLayerCalls(), 1u) << nameOf(w);
        ASSERT_GE(r.rq.layerLimit, 2u);
        const LayerInfoEntry &e = r.rq.layerEntries[2];
        EXPECT_EQ(e.firstBit, 1u);
        EXPECT_EQ(e.lastBit, kBeginBits);
        EXPECT_EQ(e.layerTag, 0x87654321u);
        EXPECT_EQ(e.layerCode, 0xFEu) << "zero-extended";
        EXPECT_EQ(r.rq.layerIndex, 3u);
        host_ClearRecords();
    }
}

TEST(PluginLayerEntries, IndexEqualToTheLimitNeedsNoNewEntry) {
    for (Which w : {Which::MD, Which::TO}) {
        State s(kBegin);
        Request r(s.st, 1);
        r.rq.layerIndex = 1;
        host_ClearRecords();
        uint32_t remaining = 0;
        ASSERT_EQ(runPass(w, s.st, &r.rq, &remaining), 1) << nameOf(w);
        EXPECT_EQ(host_CreateLayerCalls(), 0u) << nameOf(w);
        EXPECT_EQ(r.rq.layerEntries[1].firstBit, 1u);
        EXPECT_EQ(r.rq.layerEntries[1].lastBit, kBeginBits);
        EXPECT_EQ(r.rq.layerIndex, 2u);
        host_ClearRecords();
    }
}

TEST(PluginLayerEntries, ConsecutiveCallsFillConsecutiveEntries) {
    State s(kBegin);
    Request r(s.st, 4);
    uint32_t remaining = 0;
    ASSERT_EQ(runPass(Which::MD, s.st, &r.rq, &remaining), 1);
    host_ResetState(s.st);
    ASSERT_EQ(runPass(Which::TO, s.st, &r.rq, &remaining), 1);
    host_ResetState(s.st);
    ASSERT_EQ(runPass(Which::MD, s.st, &r.rq, &remaining), 1);
    host_ClearRecords();
    EXPECT_EQ(r.rq.layerIndex, 3u);
    for (uint32_t i = 0; i < 3; ++i) {
        EXPECT_EQ(r.rq.layerEntries[i].firstBit, 1u) << i;
        EXPECT_EQ(r.rq.layerEntries[i].lastBit, kBeginBits) << i;
        EXPECT_EQ(r.rq.layerEntries[i].layerTag, 0x87654321u) << i;
    }
    EXPECT_EQ(r.rq.layerEntries[3].lastBit, 0u);
}

TEST(PluginLayerEntries, MessageViewFillsNone) {
    State s(kBegin);
    Request r(s.st, 1);
    r.rq.layerIndex = 3; // beyond the limit and beyond the array
    host_ClearRecords();
    uint32_t remaining = 0;
    ASSERT_EQ(runPass(Which::MV, s.st, &r.rq, &remaining), 1);
    EXPECT_EQ(host_CreateLayerCalls(), 0u);
    EXPECT_EQ(r.rq.layerIndex, 3u);
    for (uint32_t i = 0; i <= 1; ++i) {
        EXPECT_EQ(r.rq.layerEntries[i].firstBit, 0u);
        EXPECT_EQ(r.rq.layerEntries[i].lastBit, 0u);
    }
}

TEST(PluginRemainingBits, StoredInTheRequestByEveryPass) {
    // Two octets follow the message window: the outermost window still
    // holds them when the pass ends.
    const Bytes m = hexBytes("62 06 48 04 01 02 03 04 FF FF");
    for (Which w : {Which::MD, Which::TO, Which::MV, Which::KF}) {
        State s(m);
        Request r(s.st, 4);
        uint32_t remaining = 0;
        ASSERT_EQ(runPass(w, s.st, &r.rq, &remaining), 1) << nameOf(w);
        host_ClearRecords();
        EXPECT_EQ(remaining, 16u) << nameOf(w);
        EXPECT_EQ(s->remainingBits, 16u) << nameOf(w);
        EXPECT_EQ(s->bitCursor, kBeginBits + 1) << nameOf(w);
        EXPECT_EQ(s->errorFlags, 0u) << nameOf(w);
    }
}

// ---- A message after a lower layer: cursor not at 1 ----------------------------------------

// A state whose buffer holds two octets of a lower layer the host decoded
// first, then the TCAP message; the layer-frame array holds exactly
// `capacity` frames (allocated to that size, so a write past it is caught)
// and the lower layer's frame is the current one.
State *offsetState(uint32_t frameIndex, uint32_t capacity) {
    Bytes m = hexBytes("AA BB");
    m.insert(m.end(), kBegin.begin(), kBegin.end());
    auto *s = new State(m);
    DecodeState *st = s->st;
    st->bitCursor = 17;
    st->remainingBits = st->totalBits - 16;
    st->firstFrameFlag = 0;
    st->frameIndex = frameIndex;
    st->layerFrames = static_cast<LayerFrame *>(
        std::realloc(st->layerFrames, capacity * sizeof(LayerFrame)));
    std::memset(st->layerFrames, 0x77, capacity * sizeof(LayerFrame));
    st->layerFrames[frameIndex].startBit = 1;
    st->frameCapacity = capacity;
    return s;
}

struct Reported {
    uint32_t id;
    std::string text;
    std::vector<camel::test::Span> spans;
};

std::vector<Reported> reported(uint32_t shift) {
    std::vector<Reported> out;
    for (uint32_t i = 0; i < host_DecodedCount(); ++i) {
        const HostDecodedField *f = host_Decoded(i);
        Reported r{f->fieldId, f->text, {}};
        for (uint32_t k = 0; k < f->spanCount; ++k)
            r.spans.push_back({f->spans[k].firstBit - shift, f->spans[k].lastBit - shift, f->spans[k].value});
        out.push_back(std::move(r));
    }
    return out;
}

TEST(PluginOffsetMessage, DecodedInTheNextLayerFrame) {
    // The same message at the start of a buffer, for comparison.
    std::vector<Reported> plain;
    {
        State s(kBegin);
        Request r(s.st, 4);
        host_ClearRecords();
        ASSERT_EQ(dpx_PreDecodeMD(&r.rq), 1);
        plain = reported(0);
        host_ClearRecords();
    }
    ASSERT_EQ(plain.size(), 5u);

    struct Case {
        uint32_t frameIndex, capacity;
    } cases[] = {{0, 1}, {1, 2}, {3, 4}, {0, 4}};
    for (const Case &c : cases) {
        for (Which w : {Which::MD, Which::TO, Which::MV, Which::KF}) {
            std::unique_ptr<State> s(offsetState(c.frameIndex, c.capacity));
            Request r(s->st, 4);
            host_ClearRecords();
            uint32_t remaining = 0;
            ASSERT_EQ(runPass(w, s->st, &r.rq, &remaining), 1) << nameOf(w);
            DecodeState *st = s->st;
            const std::string where = std::string(nameOf(w)) + " frame " +
                                      std::to_string(c.frameIndex) + "/" + std::to_string(c.capacity);
            EXPECT_EQ(st->frameIndex, c.frameIndex + 1) << where;
            EXPECT_GT(st->frameCapacity, c.frameIndex + 1) << where;
            EXPECT_EQ(st->layerFrames[c.frameIndex + 1].startBit, 17u) << where;
            EXPECT_EQ(st->layerFrames[c.frameIndex + 1].cleared[12], 0u) << where;
            EXPECT_EQ(st->layerFrames[c.frameIndex].startBit, 1u) << where << ": lower layer kept";
            EXPECT_EQ(st->layerFrames[c.frameIndex].cleared[0], 0x77777777u) << where;
            EXPECT_EQ(st->bitCursor, 17 + kBeginBits) << where;
            EXPECT_EQ(st->errorFlags, 0u) << where;
            EXPECT_EQ(remaining, 0u) << where;
            if (w == Which::MD || w == Which::TO) {
                EXPECT_EQ(r.rq.layerEntries[0].firstBit, 17u) << where;
                EXPECT_EQ(r.rq.layerEntries[0].lastBit, 16 + kBeginBits) << where;
            }
            if (w == Which::MD) {
                const std::vector<Reported> shifted = reported(16);
                ASSERT_EQ(shifted.size(), plain.size()) << where;
                for (size_t i = 0; i < plain.size(); ++i) {
                    EXPECT_EQ(shifted[i].id, plain[i].id) << where;
                    EXPECT_EQ(shifted[i].text, plain[i].text) << where;
                    EXPECT_EQ(shifted[i].spans, plain[i].spans) << where << " field " << i;
                }
            }
            host_ClearRecords();
        }
    }
}

TEST(PluginOffsetMessage, LayerFrameGrowthFailureEndsThePass) {
    for (Which w : {Which::MD, Which::TO, Which::MV, Which::KF}) {
        std::unique_ptr<State> s(offsetState(0, 1));
        Request r(s->st, 4);
        host_ClearRecords();
        host_SetReallocFailAt(1);
        uint32_t remaining = 0;
        const int result = runPass(w, s->st, &r.rq, &remaining);
        host_SetReallocFailAt(0);
        host_ClearRecords();
        DecodeState *st = s->st;
        EXPECT_EQ(result, 0) << nameOf(w);
        EXPECT_EQ(st->errorFlags, DPX_ERR_FRAME_GROWTH) << nameOf(w);
        EXPECT_EQ(st->layerFrames, nullptr) << nameOf(w);
        EXPECT_EQ(remaining, 0xDEADu) << nameOf(w) << ": remaining bits not stored";
        EXPECT_EQ(r.rq.layerIndex, 0u) << nameOf(w);
        EXPECT_EQ(r.rq.layerEntries[0].lastBit, 0u) << nameOf(w);
    }
}

} // namespace
