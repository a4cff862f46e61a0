// The stand-in host prepares states and requests as a host does before it
// calls a pass; every end-to-end test starts from what is checked here.

#include "dpx_standin_host.h"

#include <gtest/gtest.h>

#include <cstring>
#include <memory>
#include <vector>

namespace {

using StatePtr = std::unique_ptr<DecodeState, decltype(&host_FreeState)>;

StatePtr newState(const std::vector<uint8_t> &m) {
    return {host_NewState(m.data(), static_cast<uint32_t>(m.size())), &host_FreeState};
}

// The starting point of a pass over a message of `bits` bits, with the
// arrays at their initial sizes unless the end stack grew.
void expectFresh(const DecodeState &s, uint32_t bits, uint32_t endCapacity = 16) {
    ASSERT_TRUE(s.buffer && s.posStack && s.endStack && s.elementName && s.field.label &&
                s.field.valueText && s.field.spans && s.layerFrames);
    const std::vector<uint64_t> got{
        s.totalBits, s.bitCursor, s.remainingBits, s.errorFlags, s.posIndex, s.posStack[0],
        s.endIndex, s.endStack[0], s.testFlag, s.fieldWidth, s.occurrenceCounter,
        s.field.fieldId, s.field.value, s.field.spansFilled, s.field.spansReported,
        s.field.valueKind, s.firstFrameFlag, s.frameIndex, s.posCapacity, s.endCapacity,
        s.field.spanCapacity, s.frameCapacity};
    EXPECT_EQ(got, (std::vector<uint64_t>{bits, 1, bits, 0, 0, 1, 0, bits, 0, 0, 0, 0, 0, 0, 0, 0, 1, 0, 16,
                                          endCapacity, DPX_INITIAL_SPANS, 4}));
    EXPECT_EQ(s.posTop, s.posStack);
    EXPECT_EQ(s.endTop, s.endStack);
    EXPECT_STREQ(s.elementName, "");
    EXPECT_STREQ(s.field.label, "");
    EXPECT_STREQ(s.field.valueText, "");
    const std::vector<uint8_t> zeros(sizeof s.reservedArea, 0);
    EXPECT_EQ(std::memcmp(s.reservedArea, zeros.data(), zeros.size()), 0);
}

TEST(HostState, NewStateHoldsACopyOfTheMessage) {
    const std::vector<uint8_t> msg{0x62, 0x03, 0x48, 0x01, 0x7F};
    StatePtr s = newState(msg);
    ASSERT_NE(s, nullptr);
    expectFresh(*s, 40);
    EXPECT_NE(s->buffer, msg.data());
    EXPECT_EQ(std::memcmp(s->buffer, msg.data(), msg.size()), 0);
    StatePtr empty = newState({});
    ASSERT_NE(empty, nullptr);
    expectFresh(*empty, 0);
}

TEST(HostState, ResetKeepsGrownArraysAndReplacesThoseAFailedGrowthLeftNull) {
    StatePtr s = newState({0x30, 0x00});
    ASSERT_NE(s, nullptr);
    auto *grown = static_cast<uint32_t *>(pu_Realloc(s->endStack, 32 * sizeof(uint32_t)));
    ASSERT_NE(grown, nullptr);
    s->endStack = grown;
    s->endCapacity = 32;
    // Growths the host refused: the module stores null, capacities stale.
    host_SetReallocFailAt(1);
    EXPECT_EQ(pu_Realloc(s->posStack, 4096), nullptr);
    host_SetReallocFailAt(1);
    EXPECT_EQ(pu_Realloc(s->field.spans, 4096), nullptr);
    host_SetReallocFailAt(1);
    EXPECT_EQ(pu_Realloc(s->layerFrames, 4096), nullptr);
    host_SetReallocFailAt(0);
    s->posStack = s->posTop = nullptr;
    s->field.spans = nullptr;
    s->layerFrames = nullptr;
    s->posCapacity = s->field.spanCapacity = s->frameCapacity = 999;
    // What a pass leaves behind.
    s->bitCursor = 17;
    s->remainingBits = 0;
    s->errorFlags = DPX_ERR_LEFTOVER;
    s->endIndex = 2;
    s->endTop = s->endStack + 2;
    s->testFlag = 1;
    s->fieldWidth = 8;
    s->occurrenceCounter = 4;
    std::strcpy(s->elementName, "Invoke");
    std::strcpy(s->field.label, "  Length=");
    s->reservedArea[5] = 0xAA;
    s->firstFrameFlag = 0;
    s->frameIndex = 2;

    host_ResetState(s.get());
    expectFresh(*s, 16, 32);
    EXPECT_EQ(s->endStack, grown);
}

TEST(HostRequest, InitFillsTheDocumentedMembersAndLayerEntriesGrow) {
    StatePtr s = newState({0x00});
    PreDecodeRequest r;
    std::memset(&r, 0xCD, sizeof r);
    host_InitRequest(&r, s.get(), 3, 1);
    EXPECT_EQ(r.state, s.get());
    ASSERT_NE(r.outputLines, nullptr);
    EXPECT_EQ(r.outputLines[3 * DPX_OUTPUT_LINE_SIZE - 1], 0);
    EXPECT_EQ(r.currentLineIndex + r.layerIndex + r.remainingBits + r.layerCode + r.layerTag, 0u);
    EXPECT_EQ(r.status, 0);
    EXPECT_EQ(r.layerLimit, 1u);
    ASSERT_NE(r.layerEntries, nullptr);
    r.layerEntries[1] = LayerInfoEntry{8, 15, 3, 4}; // layerLimit + 1 entries

    host_ClearRecords();
    r.layerIndex = 1; // within the limit: nothing to do
    pu_CreateNewLayerInfo(&r);
    EXPECT_EQ(r.layerLimit, 1u);
    r.layerIndex = 32; // far past the end, and a doubling of the 2 entries
    pu_CreateNewLayerInfo(&r);
    ASSERT_GE(r.layerLimit, 32u);
    EXPECT_EQ(r.layerEntries[1].lastBit, 15u) << "entries survive the move";
    EXPECT_EQ(r.layerEntries[32].firstBit, 0u);
    r.layerEntries[r.layerLimit].firstBit = 1;
    EXPECT_EQ(host_CreateLayerCalls(), 2u);
    host_ClearRecords();
    EXPECT_EQ(host_CreateLayerCalls(), 0u);
    host_FreeRequest(&r);
    EXPECT_EQ(r.outputLines, nullptr);
    EXPECT_EQ(r.layerEntries, nullptr);
}

} // namespace
