// The stand-in host libraries: what they record, how failures are injected,
// access point name rendering and the key table layout they hand out.

#include "dpx_standin_host.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <string>
#include <tuple>
#include <vector>

namespace {

TEST(HostRecorder, CopiesFieldsBeforeTheCallReturnsAndCutsTextsAt255) {
    host_ClearRecords();
    char text[] = "Invoke ID=1";
    std::string label(300, 'b');
    ValueSpan span{0x01, 9, 16, 0, {0, 0}};
    pu_AddDecodedFieldsData(nullptr, 1, &span, text, 1, label.data(), 1066, 0, 5);
    pu_AddFieldsToDisplayData(nullptr, label.data(), 12);
    // The module reuses its buffers for the next field at once.
    std::strcpy(text, "changed");
    span.value = 0xFF;

    ASSERT_EQ(host_DecodedCount(), 1u);
    const HostDecodedField *f = host_Decoded(0);
    EXPECT_STREQ(f->text, "Invoke ID=1");
    EXPECT_EQ(f->label, std::string(255, 'b'));
    EXPECT_EQ(std::tuple(f->fieldId, f->selector, f->arg9), std::tuple(1066u, 1u, 5u));
    ASSERT_EQ(f->spanCount, 1u);
    EXPECT_EQ(f->spans[0].value, 0x01u);
    EXPECT_EQ(host_Decoded(1), nullptr);
    ASSERT_EQ(host_DisplayCount(), 1u);
    EXPECT_EQ(host_Display(0)->text, std::string(255, 'b'));
    EXPECT_EQ(host_Display(0)->displayId, 12u);
    host_ClearRecords();
    EXPECT_EQ(host_DecodedCount() + host_DisplayCount(), 0u);
}

// The recorder appends into pools that grow while a message is recorded:
// every field must read back as recorded however far the pools moved, and
// each kind of record is cleared on its own.
TEST(HostRecorder, ViewsAndCopiesReadBackEveryFieldWhileThePoolsGrow) {
    host_ClearRecords();
    constexpr uint32_t kFields = 700; // 700 texts of up to 255 characters: past the pools' first size
    const auto textOf = [](uint32_t i) { return std::string(i % 256, char('a' + i % 26)) + std::to_string(i); };
    for (uint32_t i = 0; i < kFields; ++i) {
        std::string text = textOf(i);
        std::string label = "L" + std::to_string(i);
        std::vector<ValueSpan> spans(i % 7);
        for (uint32_t k = 0; k < spans.size(); ++k)
            spans[k] = ValueSpan{i * 10 + k, i + k, i + k + 3, 0, {0, 0}};
        pu_AddDecodedFieldsData(nullptr, uint32_t(spans.size()), spans.empty() ? nullptr : spans.data(),
                                text.data(), i, label.data(), 1000 + i, 0, 0);
        pu_AddFieldsToDisplayData(nullptr, text.data(), i);
    }
    ASSERT_EQ(host_DecodedCount(), kFields);
    const HostDecodedField *first = host_Decoded(0);
    for (uint32_t i = 0; i < kFields; ++i) {
        SCOPED_TRACE(i);
        const std::string want = textOf(i).substr(0, 255);
        HostFieldView v{};
        ASSERT_EQ(host_DecodedView(i, &v), 1);
        EXPECT_EQ(std::string(v.text, v.textLength), want);
        EXPECT_EQ(v.text[v.textLength], '\0');
        EXPECT_EQ(std::string(v.label, v.labelLength), "L" + std::to_string(i));
        EXPECT_EQ(std::tuple(v.fieldId, v.selector, v.spanCount), std::tuple(1000 + i, i, i % 7));
        for (uint32_t k = 0; k < v.spanCount; ++k)
            EXPECT_EQ(std::tuple(v.spans[k].value, v.spans[k].firstBit, v.spans[k].lastBit),
                      std::tuple(i * 10 + k, i + k, i + k + 3));
        const HostDecodedField *copy = host_Decoded(i);
        EXPECT_EQ(copy->text, want);
        EXPECT_EQ(copy->spanCount, v.spanCount);
        HostDisplayView d{};
        ASSERT_EQ(host_DisplayView(i, &d), 1);
        EXPECT_EQ(std::string(d.text, d.textLength), want);
        EXPECT_EQ(host_Display(i)->displayId, i);
    }
    EXPECT_EQ(host_Decoded(0), first) << "a copy handed out stays where it is";
    HostFieldView none{};
    EXPECT_EQ(host_DecodedView(kFields, &none), 0);

    host_ClearDecodedRecords();
    EXPECT_EQ(host_DecodedCount(), 0u);
    ASSERT_EQ(host_DisplayCount(), kFields) << "the display records are kept";
    EXPECT_EQ(host_Display(kFields - 1)->text, textOf(kFields - 1).substr(0, 255));
    char again[] = "again";
    pu_AddDecodedFieldsData(nullptr, 0, nullptr, again, 0, nullptr, 7, 0, 0);
    EXPECT_STREQ(host_Decoded(0)->text, "again");
    EXPECT_STREQ(host_Decoded(0)->label, "");
    host_ClearRecords();
}

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
