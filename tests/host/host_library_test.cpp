// The stand-in host libraries: what they record, how failures are injected,
// access point name rendering and the key table layout they hand out.

#include "dpx_standin_host.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

namespace {

// ---- recorder ------------------------------------------------------------------

class HostRecorder : public ::testing::Test {
protected:
    void SetUp() override { host_ClearRecords(); }
    void TearDown() override { host_ClearRecords(); }
};

TEST_F(HostRecorder, DecodedFieldIsCopiedBeforeTheCallReturns) {
    PreDecodeRequest r;
    host_InitRequest(&r, nullptr, 2, 0);
    r.currentLineIndex = 1;
    r.outputLines[DPX_OUTPUT_LINE_SIZE] = 0x2A;

    char text[256] = "Invoke ID=1";
    char label[256] = "  Invoke ID";
    ValueSpan spans[2] = {{0x01, 9, 16, 0, {0, 0}}, {0x02, 17, 24, 0, {0, 0}}};
    pu_AddDecodedFieldsData(&r, 2, spans, text, 1, label, 1066, 0, 0);
    // The module reuses its buffers for the next field at once.
    std::strcpy(text, "changed");
    std::strcpy(label, "changed");
    spans[0].value = 0xFF;
    pu_AddDecodedFieldsData(&r, 0, spans, text, 0, label, 7, 0, 5);

    ASSERT_EQ(host_DecodedCount(), 2u);
    const HostDecodedField *f = host_Decoded(0);
    ASSERT_NE(f, nullptr);
    EXPECT_STREQ(f->text, "Invoke ID=1");
    EXPECT_STREQ(f->label, "  Invoke ID");
    EXPECT_EQ(f->fieldId, 1066u);
    EXPECT_EQ(f->selector, 1u);
    EXPECT_EQ(f->lineLayerCode, 0x2A);
    ASSERT_EQ(f->spanCount, 2u);
    EXPECT_EQ(f->spans[0].value, 0x01u);
    EXPECT_EQ(f->spans[0].firstBit, 9u);
    EXPECT_EQ(f->spans[1].lastBit, 24u);

    const HostDecodedField *g = host_Decoded(1);
    ASSERT_NE(g, nullptr);
    EXPECT_EQ(g->spanCount, 0u);
    EXPECT_EQ(g->arg8, 0u);
    EXPECT_EQ(g->arg9, 5u) << "trailing arguments are recorded as received";
    EXPECT_EQ(host_Decoded(2), nullptr);
    host_FreeRequest(&r);
}

TEST_F(HostRecorder, SpansStayReachableAfterManyFields) {
    ValueSpan span{0, 1, 8, 0, {0, 0}};
    char text[] = "x";
    char label[] = "x";
    for (uint32_t i = 0; i < 20000; ++i) {
        span.value = i;
        pu_AddDecodedFieldsData(nullptr, 1, &span, text, 0, label, i, 0, 0);
    }
    ASSERT_EQ(host_DecodedCount(), 20000u);
    EXPECT_EQ(host_Decoded(0)->spans[0].value, 0u);
    EXPECT_EQ(host_Decoded(19999)->spans[0].value, 19999u);
    EXPECT_EQ(host_Decoded(19999)->lineLayerCode, 0u) << "no output lines";
}

TEST_F(HostRecorder, TextsAreCutAt255Characters) {
    std::string longText(300, 'a');
    std::string longLabel(300, 'b');
    pu_AddDecodedFieldsData(nullptr, 0, nullptr, longText.data(), 0, longLabel.data(), 1, 0, 0);
    pu_AddFieldsToDisplayData(nullptr, longText.data(), 9);
    EXPECT_EQ(std::strlen(host_Decoded(0)->text), 255u);
    EXPECT_EQ(std::strlen(host_Decoded(0)->label), 255u);
    EXPECT_EQ(std::strlen(host_Display(0)->text), 255u);
}

TEST_F(HostRecorder, DisplayFieldsAndClear) {
    char a[] = "Begin";
    char b[] = "";
    pu_AddFieldsToDisplayData(nullptr, a, 12);
    pu_AddFieldsToDisplayData(nullptr, b, 13);
    ASSERT_EQ(host_DisplayCount(), 2u);
    EXPECT_STREQ(host_Display(0)->text, "Begin");
    EXPECT_EQ(host_Display(0)->displayId, 12u);
    EXPECT_STREQ(host_Display(1)->text, "");
    EXPECT_EQ(host_Display(2), nullptr);
    EXPECT_EQ(host_DecodedCount(), 0u);
    host_ClearRecords();
    EXPECT_EQ(host_DisplayCount(), 0u);
}

// ---- pu_Realloc failure injection ------------------------------------------------

TEST(HostRealloc, FailsExactlyTheNthCallCountedFromTheSetting) {
    host_SetReallocFailAt(3);
    void *block = pu_Realloc(nullptr, 8);
    ASSERT_NE(block, nullptr);
    block = pu_Realloc(block, 16);
    ASSERT_NE(block, nullptr);
    EXPECT_EQ(pu_Realloc(block, 32), nullptr); // the block is released with the failure
    void *after = pu_Realloc(nullptr, 8);
    EXPECT_NE(after, nullptr) << "only the n-th call fails";
    EXPECT_EQ(host_ReallocCalls(), 4u);

    host_SetReallocFailAt(0);
    EXPECT_EQ(host_ReallocCalls(), 0u);
    for (int i = 0; i < 5; ++i) {
        after = pu_Realloc(after, 64);
        ASSERT_NE(after, nullptr);
    }
    EXPECT_EQ(host_ReallocCalls(), 5u);
    std::free(after);
}

// ---- pu_access_point_name ------------------------------------------------------------

class AccessPointName : public ::testing::Test {
protected:
    void SetUp() override {
        state = host_NewState(nullptr, 0);
        ASSERT_NE(state, nullptr);
    }
    void TearDown() override {
        host_SetAccessPointNameResult(1);
        host_FreeState(state);
    }
    // Puts the octets into the state's spans the way the module reports them.
    void report(const std::vector<uint8_t> &octets) {
        ASSERT_LE(octets.size(), state->field.spanCapacity);
        for (size_t i = 0; i < octets.size(); ++i) {
            state->field.spans[i] = ValueSpan{octets[i], 0, 0, 0, {0, 0}};
        }
        state->field.spansReported = static_cast<uint32_t>(octets.size());
    }
    std::string render(const std::string &prefix, const std::vector<uint8_t> &octets) {
        report(octets);
        std::memset(text, 0x55, sizeof text);
        std::strcpy(text, prefix.c_str());
        EXPECT_EQ(pu_access_point_name(text, 0, state), 1);
        return text;
    }

    DecodeState *state = nullptr;
    char text[256];
};

TEST_F(AccessPointName, LabelsAreJoinedWithDots) {
    EXPECT_EQ(render("APN=", {3, 'a', 'b', 'c', 2, 'd', 'e'}), "APN=abc.de");
    EXPECT_EQ(render("", {3, 'm', 'm', 's', 7, 'e', 'x', 'a', 'm', 'p', 'l', 'e', 3, 'n', 'e', 't'}),
              "mms.example.net");
    EXPECT_EQ(render("x", {}), "x");
}

TEST_F(AccessPointName, ShortAndOddOctets) {
    EXPECT_EQ(render("", {5, 'a', 'b'}), "ab") << "a length past the end takes what is there";
    EXPECT_EQ(render("", {2, 0x01, 'z', 1, 0xC8}), "?z.?");
    EXPECT_EQ(render("", {1, 'a', 0, 1, 'b'}), "a..b");
}

TEST_F(AccessPointName, NeverWritesPastTheTextBuffer) {
    std::vector<uint8_t> octets;
    for (int label = 0; label < 3; ++label) {
        octets.push_back(60);
        octets.insert(octets.end(), 60, 'q');
    }
    const std::string prefix(200, 'p');
    const std::string out = render(prefix, octets);
    EXPECT_EQ(out.size(), 255u);
    EXPECT_EQ(out.substr(0, 200), prefix);
    EXPECT_EQ(out.substr(200), std::string(55, 'q'));

    // A prefix that already fills the buffer is left as it is.
    const std::string full(255, 'f');
    EXPECT_EQ(render(full, {1, 'a'}), full);
}

TEST_F(AccessPointName, InjectedFailureLeavesTheTextAlone) {
    report({1, 'a'});
    std::strcpy(text, "APN=");
    host_SetAccessPointNameResult(0);
    EXPECT_EQ(pu_access_point_name(text, 0, state), 0);
    EXPECT_STREQ(text, "APN=");
    host_SetAccessPointNameResult(1);
    EXPECT_EQ(pu_access_point_name(text, 0, state), 1);
    EXPECT_STREQ(text, "APN=a");
}

// ---- kf_InitialiseOptKFE ----------------------------------------------------------------

class KeyTableInit : public ::testing::Test {
protected:
    void SetUp() override {
        host_ClearKfInitOverride();
        std::memset(table, 0, sizeof table);
    }
    void TearDown() override { host_ClearKfInitOverride(); }
    KeyTableEntry table[DPX_KEY_ENTRY_COUNT];
    uint16_t selected = 0xBEEF;
};

TEST_F(KeyTableInit, FillsTheDocumentedKeyBufferLayout) {
    const uint32_t before = host_KfInitCalls();
    EXPECT_EQ(kf_InitialiseOptKFE(table, DPX_KEY_ENTRY_COUNT, &selected), 1);
    EXPECT_EQ(host_KfInitCalls(), before + 1);
    EXPECT_EQ(selected, 0xBEEF) << "no entry selected by default";
    for (uint32_t i = 0; i < DPX_KEY_ENTRY_COUNT; ++i) {
        SCOPED_TRACE(i);
        EXPECT_EQ(table[i].presenceOffset, i / 8);
        EXPECT_EQ(table[i].presenceMask, 1u << (i % 8));
        EXPECT_EQ(table[i].valueOffset, HOST_KEY_SLOT_BASE + 4 * i);
    }
    // Every slot fits between the presence bytes and the data area.
    EXPECT_LT(table[DPX_KEY_ENTRY_COUNT - 1].presenceOffset, HOST_KEY_PRESENCE_BYTES);
    EXPECT_LE(table[DPX_KEY_ENTRY_COUNT - 1].valueOffset + HOST_KEY_SLOT_SIZE, HOST_KEY_DATA_START);
}

TEST_F(KeyTableInit, OverrideSelectsAnEntryAndStillFills) {
    host_SetKfInitResult(2, 17);
    EXPECT_EQ(kf_InitialiseOptKFE(table, DPX_KEY_ENTRY_COUNT, &selected), 2);
    EXPECT_EQ(selected, 17u);
    EXPECT_EQ(table[30].valueOffset, HOST_KEY_SLOT_BASE + 4 * 30);

    host_SetKfInitResult(0, 0);
    EXPECT_EQ(kf_InitialiseOptKFE(table, DPX_KEY_ENTRY_COUNT, &selected), 0);
}

TEST_F(KeyTableInit, NegativeOverrideFillsNothing) {
    host_SetKfInitResult(-3, 5);
    EXPECT_EQ(kf_InitialiseOptKFE(table, DPX_KEY_ENTRY_COUNT, &selected), -3);
    EXPECT_EQ(selected, 0xBEEF);
    EXPECT_EQ(table[1].presenceMask, 0u);
    host_ClearKfInitOverride();
    EXPECT_EQ(kf_InitialiseOptKFE(table, DPX_KEY_ENTRY_COUNT, &selected), 1);
    EXPECT_EQ(table[1].presenceMask, 2u);
}

} // namespace
