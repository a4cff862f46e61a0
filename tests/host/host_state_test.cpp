// The stand-in host prepares decoding states and requests exactly as a host
// does before it calls a pass; end-to-end tests rely on that starting point.

#include "dpx_standin_host.h"

#include <gtest/gtest.h>

#include <cstring>
#include <memory>
#include <vector>

namespace {

struct StateDeleter {
    void operator()(DecodeState *s) const { host_FreeState(s); }
};
using StatePtr = std::unique_ptr<DecodeState, StateDeleter>;

StatePtr newState(const std::vector<uint8_t> &bytes) {
    return StatePtr(host_NewState(bytes.data(), static_cast<uint32_t>(bytes.size())));
}

bool allZero(const uint8_t *bytes, size_t n) {
    for (size_t i = 0; i < n; ++i) {
        if (bytes[i] != 0) {
            return false;
        }
    }
    return true;
}

// A growth the host refuses, as the module handles it: the pointer becomes null.
template <typename T>
void failGrowth(T *&array) {
    host_SetReallocFailAt(1);
    EXPECT_EQ(pu_Realloc(array, 4096), nullptr);
    array = nullptr;
}

void expectFreshState(const DecodeState &s, uint32_t bits) {
    EXPECT_EQ(s.totalBits, bits);
    EXPECT_EQ(s.bitCursor, 1u);
    EXPECT_EQ(s.remainingBits, bits);
    EXPECT_EQ(s.errorFlags, 0u);
    ASSERT_NE(s.posStack, nullptr);
    EXPECT_EQ(s.posTop, s.posStack);
    EXPECT_EQ(s.posIndex, 0u);
    EXPECT_EQ(s.posStack[0], 1u);
    ASSERT_NE(s.endStack, nullptr);
    EXPECT_EQ(s.endTop, s.endStack);
    EXPECT_EQ(s.endIndex, 0u);
    EXPECT_EQ(s.endStack[0], bits);
    EXPECT_EQ(s.testFlag, 0u);
    EXPECT_EQ(s.fieldWidth, 0u);
    EXPECT_EQ(s.occurrenceCounter, 0u);
    ASSERT_NE(s.elementName, nullptr);
    EXPECT_STREQ(s.elementName, "");
    EXPECT_TRUE(allZero(s.reservedArea, sizeof s.reservedArea));
    ASSERT_NE(s.field.label, nullptr);
    ASSERT_NE(s.field.valueText, nullptr);
    EXPECT_STREQ(s.field.label, "");
    EXPECT_STREQ(s.field.valueText, "");
    EXPECT_EQ(s.field.fieldId, 0u);
    EXPECT_EQ(s.field.value, 0u);
    EXPECT_EQ(s.field.spansFilled, 0u);
    EXPECT_EQ(s.field.spansReported, 0u);
    EXPECT_EQ(s.field.valueKind, 0u);
    ASSERT_NE(s.field.spans, nullptr);
    ASSERT_NE(s.layerFrames, nullptr);
    EXPECT_EQ(s.firstFrameFlag, 1u);
    EXPECT_EQ(s.frameIndex, 0u);
}

TEST(HostState, NewStateMatchesWhatAHostPrepares) {
    const std::vector<uint8_t> msg{0x62, 0x03, 0x48, 0x01, 0x7F};
    StatePtr s = newState(msg);
    ASSERT_NE(s, nullptr);
    expectFreshState(*s, 40);
    EXPECT_NE(s->buffer, msg.data()) << "the host owns a copy of the message";
    EXPECT_EQ(std::memcmp(s->buffer, msg.data(), msg.size()), 0);
    EXPECT_EQ(s->posCapacity, 16u);
    EXPECT_EQ(s->endCapacity, 16u);
    EXPECT_EQ(s->field.spanCapacity, DPX_INITIAL_SPANS);
    EXPECT_EQ(s->frameCapacity, 4u);
}

TEST(HostState, EmptyMessageHasNoBits) {
    StatePtr s(host_NewState(nullptr, 0));
    ASSERT_NE(s, nullptr);
    ASSERT_NE(s->buffer, nullptr);
    expectFreshState(*s, 0);
}

TEST(HostState, ResetRestoresTheStartAndKeepsGrownArrays) {
    StatePtr s = newState({0x30, 0x00});
    ASSERT_NE(s, nullptr);
    // A pass leaves a used state behind: moved cursor, flags, pushed stacks,
    // field contents, a later frame and a grown end stack.
    auto *grown = static_cast<uint32_t *>(pu_Realloc(s->endStack, 32 * sizeof(uint32_t)));
    ASSERT_NE(grown, nullptr);
    s->endStack = grown;
    s->endCapacity = 32;
    s->bitCursor = 17;
    s->remainingBits = 0;
    s->errorFlags = DPX_ERR_LEFTOVER | DPX_ERR_MANDATORY_MISSING;
    s->posIndex = 3;
    s->posTop = s->posStack + 3;
    s->endIndex = 2;
    s->endTop = s->endStack + 2;
    s->testFlag = 1;
    s->fieldWidth = 8;
    s->occurrenceCounter = 4;
    std::strcpy(s->elementName, "Invoke");
    std::strcpy(s->field.label, "  Length=");
    s->field.spansFilled = 2;
    s->field.spansReported = 2;
    s->reservedArea[5] = 0xAA;
    s->firstFrameFlag = 0;
    s->frameIndex = 2;

    host_ResetState(s.get());
    expectFreshState(*s, 16);
    EXPECT_EQ(s->endStack, grown);
    EXPECT_EQ(s->endCapacity, 32u);
}

TEST(HostState, ResetReallocatesArraysAFailedGrowthLeftNull) {
    StatePtr s = newState({0x30, 0x00});
    ASSERT_NE(s, nullptr);
    // Every growable array fails once; the module stores null each time.
    failGrowth(s->posStack);
    failGrowth(s->endStack);
    failGrowth(s->field.spans);
    failGrowth(s->layerFrames);
    s->posTop = nullptr;
    s->endTop = nullptr;
    host_SetReallocFailAt(0);

    host_ResetState(s.get());
    expectFreshState(*s, 16);
    EXPECT_EQ(s->posCapacity, 16u);
    EXPECT_EQ(s->endCapacity, 16u);
    EXPECT_EQ(s->field.spanCapacity, DPX_INITIAL_SPANS);
    EXPECT_EQ(s->frameCapacity, 4u);
}

TEST(HostRequest, InitFillsTheDocumentedMembersOnly) {
    StatePtr s = newState({0x00});
    PreDecodeRequest r;
    std::memset(&r, 0xCD, sizeof r);
    host_InitRequest(&r, s.get(), 3, 2);
    EXPECT_EQ(r.state, s.get());
    ASSERT_NE(r.outputLines, nullptr);
    EXPECT_EQ(r.outputLines[3 * DPX_OUTPUT_LINE_SIZE - 1], 0);
    EXPECT_EQ(r.currentLineIndex, 0u);
    ASSERT_NE(r.layerEntries, nullptr);
    EXPECT_EQ(r.layerIndex, 0u);
    EXPECT_EQ(r.layerLimit, 2u);
    EXPECT_EQ(r.status, 0);
    EXPECT_EQ(r.remainingBits, 0u);
    EXPECT_EQ(r.layerCode, 0u);
    EXPECT_EQ(r.layerTag, 0u);
    EXPECT_TRUE(allZero(r.reserved0, sizeof r.reserved0));
    EXPECT_TRUE(allZero(r.reserved6, sizeof r.reserved6));
    r.layerEntries[2].layerCode = 1; // layerLimit + 1 entries exist
    host_FreeRequest(&r);
    EXPECT_EQ(r.outputLines, nullptr);
    EXPECT_EQ(r.layerEntries, nullptr);
}

TEST(HostRequest, CreateNewLayerInfoMakesTheCurrentEntryWritable) {
    PreDecodeRequest r;
    host_InitRequest(&r, nullptr, 0, 1);
    host_ClearRecords();
    r.layerEntries[1] = LayerInfoEntry{8, 15, 3, 4};

    r.layerIndex = 1; // within the limit: nothing to do
    pu_CreateNewLayerInfo(&r);
    EXPECT_EQ(r.layerLimit, 1u);

    r.layerIndex = 2;
    pu_CreateNewLayerInfo(&r);
    EXPECT_GE(r.layerLimit, 2u);
    EXPECT_EQ(r.layerEntries[1].lastBit, 15u) << "entries survive the move";
    r.layerEntries[2] = LayerInfoEntry{16, 23, 3, 4};

    r.layerIndex = 40; // far past the end: doubles until it fits
    pu_CreateNewLayerInfo(&r);
    EXPECT_GE(r.layerLimit, 40u);
    EXPECT_EQ(r.layerEntries[40].firstBit, 0u);
    r.layerEntries[40].firstBit = 1;
    EXPECT_EQ(r.layerEntries[2].firstBit, 16u);

    EXPECT_EQ(host_CreateLayerCalls(), 3u);
    host_ClearRecords();
    EXPECT_EQ(host_CreateLayerCalls(), 0u);
    host_FreeRequest(&r);
}

} // namespace
