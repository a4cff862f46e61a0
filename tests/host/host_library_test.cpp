// The stand-in host libraries: how failures are injected, access point name
// rendering and the key table layout they hand out.  (What they record and the
// states they prepare are what every end-to-end test starts from.)

#include "dpx_standin_host.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <string>
#include <tuple>
#include <vector>

namespace {

TEST(HostRealloc, FailsExactlyTheNthCallCountedFromTheSetting) {
    host_SetReallocFailAt(3);
    void *block = pu_Realloc(nullptr, 8);
    block = pu_Realloc(block, 16);
    ASSERT_NE(block, nullptr);
    EXPECT_EQ(pu_Realloc(block, 32), nullptr); // the host releases the block
    void *after = pu_Realloc(nullptr, 8);
    EXPECT_NE(after, nullptr) << "only the n-th call fails";
    EXPECT_EQ(host_ReallocCalls(), 4u);
    host_SetReallocFailAt(0);
    for (int i = 0; i < 5; ++i)
        ASSERT_NE(after = pu_Realloc(after, 64), nullptr);
    EXPECT_EQ(host_ReallocCalls(), 5u);
    std::free(after);
}

// Appends the name held in `octets` (one a span, as the module reports
// them) to `prefix` in a 256-byte host text buffer.
std::string accessPointName(const std::string &prefix, const std::vector<uint8_t> &octets,
                            uint8_t result = 1) {
    DecodeState *s = host_NewState(nullptr, 0);
    for (size_t i = 0; i < octets.size(); ++i)
        s->field.spans[i] = ValueSpan{octets[i], 0, 0, 0, {0, 0}};
    s->field.spansReported = static_cast<uint32_t>(octets.size());
    char text[256];
    std::memset(text, 0x55, sizeof text);
    std::strcpy(text, prefix.c_str());
    host_SetAccessPointNameResult(result);
    EXPECT_EQ(pu_access_point_name(text, 0, s), result);
    host_SetAccessPointNameResult(1);
    host_FreeState(s);
    return text;
}

TEST(HostAccessPointName, LabelsJoinedWithDotsWithinTheTextBuffer) {
    EXPECT_EQ(accessPointName("APN=", {3, 'a', 'b', 'c', 2, 'd', 'e'}), "APN=abc.de");
    EXPECT_EQ(accessPointName("x", {}), "x");
    EXPECT_EQ(accessPointName("", {5, 'a', 'b'}), "ab") << "a label past the end takes what is there";
    EXPECT_EQ(accessPointName("", {2, 0x01, 'z', 1, 0xC8}), "?z.?");
    EXPECT_EQ(accessPointName("", {1, 'a', 0, 1, 'b'}), "a..b");
    EXPECT_EQ(accessPointName("APN=", {1, 'a'}, 0), "APN=") << "injected failure";

    std::vector<uint8_t> labels;
    for (int i = 0; i < 3; ++i) {
        labels.push_back(60);
        labels.insert(labels.end(), 60, 'q');
    }
    EXPECT_EQ(accessPointName(std::string(200, 'p'), labels), std::string(200, 'p') + std::string(55, 'q'));
    EXPECT_EQ(accessPointName(std::string(255, 'f'), {1, 'a'}), std::string(255, 'f'));
}

TEST(HostKeyTable, LayoutAndNegativeOverride) {
    KeyTableEntry table[DPX_KEY_ENTRY_COUNT] = {};
    uint16_t selected = 0xBEEF;
    host_ClearKfInitOverride();
    const uint32_t before = host_KfInitCalls();
    EXPECT_EQ(kf_InitialiseOptKFE(table, DPX_KEY_ENTRY_COUNT, &selected), 1);
    EXPECT_EQ(host_KfInitCalls(), before + 1);
    EXPECT_EQ(selected, 0xBEEF) << "no entry selected by default";
    for (uint32_t i = 0; i < DPX_KEY_ENTRY_COUNT; ++i) {
        EXPECT_EQ(table[i].presenceOffset, i / 8) << i;
        EXPECT_EQ(table[i].presenceMask, 1u << (i % 8)) << i;
        EXPECT_EQ(table[i].valueOffset, HOST_KEY_SLOT_BASE + 4 * i) << i;
    }
    EXPECT_LE(table[DPX_KEY_ENTRY_COUNT - 1].valueOffset + HOST_KEY_SLOT_SIZE, HOST_KEY_DATA_START);

    // A negative override fills nothing and selects nothing (key_marks_test
    // uses the others).
    std::memset(table, 0, sizeof table);
    host_SetKfInitResult(-3, 5);
    EXPECT_EQ(kf_InitialiseOptKFE(table, DPX_KEY_ENTRY_COUNT, &selected), -3);
    EXPECT_EQ(selected, 0xBEEF);
    EXPECT_EQ(table[1].presenceMask, 0u);
    host_ClearKfInitOverride();
}

} // namespace
