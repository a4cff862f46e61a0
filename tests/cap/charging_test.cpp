// Charging, call gap and announcement arguments through the real entry
// points: the time duration charging and its audible indicator, the
// charging report, Furnish and Send Charging Information, gap indicators
// and treatment, Information To Send with its message ids and variable
// parts, bursts and the Specialized Resource Report; then the bit layouts
// (charging address, append indicator, generic digits), the display names
// of the choices, and what a cap or an unknown alternative leaves over.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "support/harness.h"

using namespace camel::test;
using Texts = std::vector<std::string>;

namespace {

// An End (destination id 0A 0B 0C 0D) carrying Invoke 1 of `opcode` with
// the argument octets; every length here is below 128.
Bytes endWithInvoke(uint8_t opcode, const std::string &argument) {
    const Bytes arg = hexBytes(argument);
    Bytes invoke = hexBytes("02 01 01 02 01");
    invoke.push_back(opcode);
    invoke.insert(invoke.end(), arg.begin(), arg.end());
    Bytes out = hexBytes("64 00 49 04 0A 0B 0C 0D 6C 00 A1");
    out.push_back(static_cast<uint8_t>(invoke.size()));
    out.insert(out.end(), invoke.begin(), invoke.end());
    out[9] = static_cast<uint8_t>(invoke.size() + 2);
    out[1] = static_cast<uint8_t>(out.size() - 2);
    return out;
}

// What caps and unknown alternatives leave over; the values of well-formed
// elements (the variable parts' time, date and price too) are compared with
// tshark by the reference comparison.
TEST(Charging, ArgumentsFieldByField) {
    const struct {
        const char *name;
        uint8_t opcode;
        std::string argument;
        Texts texts;
        uint32_t flags;
    } cases[] = {
        // Faults: a value longer than its cap keeps its first octets and
        // leaves the rest over; an alternative no choice names is shown
        // with no name and its octets are left over.
        {"Gap interval beyond its two octets", 41, "30 07 A1 05 81 03 00 88 E0",
         {"Sequence Tag=30", "  LENGTH=7 octet(s)", "Gap Indicator Tag=a1", "  LENGTH=5 octet(s)",
          "Gap Interval Tag=81", "  LENGTH=3 octet(s)", "  Gap Interval Data=88"},
         DPX_ERR_LEFTOVER},
        {"Information To Send, unknown alternative", 47, "30 06 A0 04 A2 02 80 00",
         {"Sequence Tag=30", "  LENGTH=6 octet(s)", "Information To Send Tag=a0", "  LENGTH=4 octet(s)", "Choice="},
         DPX_ERR_LEFTOVER},
        // A basic gap criterion names only the four basic alternatives.
        {"Compound criteria nested in a basic criterion", 41, "30 08 A0 06 30 04 A0 02 30 00",
         {"Sequence Tag=30", "  LENGTH=8 octet(s)", "Gap Criteria Tag=a0", "  LENGTH=6 octet(s)",
          "Choice=Compound Gap Criteria Tag", "  LENGTH=4 octet(s)", "Basic Gap Criteria Tag=a0",
          "  LENGTH=2 octet(s)", "Choice="},
         DPX_ERR_LEFTOVER},
        // The choice field takes two octets: the plain NULL of the earlier
        // phases is shown whole with no name.
        {"Specialized Resource Report, phase 2 and 3 NULL", 49, "05 00", {"SpecializedResourceReportArg Choice="}, 0},
        {"Specialized Resource Report, unknown identifier", 49, "9F 34 00", {"SpecializedResourceReportArg Choice="},
         DPX_ERR_LEFTOVER},
        {"Apply Charging Report without its wrapper", 36, "30 02 A0 00", {}, DPX_ERR_MANDATORY_MISSING | DPX_ERR_LEFTOVER},
    };
    for (const auto &c : cases) {
        SCOPED_TRACE(c.name);
        const auto r = decode(endWithInvoke(c.opcode, c.argument));
        EXPECT_EQ(argumentTexts(r), c.texts);
        EXPECT_EQ(r.md.errorFlags, c.flags);
        EXPECT_EQ(r.md.remainingBits, 0u);
    }
}

// The charging report's own fields around the party to charge (decoded by
// the side-id unit); the charging address's alternative chosen by the tag
// number of its identifier, which is shown without being consumed.
TEST(Charging, ReportAndChargingAddress) {
    const auto r = decode(endWithInvoke(
        36, "04 1D A0 1B A0 00 A1 0A A1 08 80 02 01 2C 81 02 0E 10 82 01 FF 83 00 84 00 A5 04 9F 32 01 05"));
    const struct {
        uint32_t id;
        const char *text;
    } shown[] = {
        {1412, "Choice=Time If Tariff Switch"},
        {1420, "  Time Since Tariff Switch Value(100 millisecond)=300"},
        {1396, "  Tariff Switch Interval(second)=3600"},
        {1423, "  Call Active=True"},
        {1426, "  LENGTH(null)=0 octet(s)"},
        {1481, "Extensions Tag=84"},
        {4196, "AChChargingAddress Tag=a5"},
        {4200, "AChChargingAddress Type=1f"},
        {4205, "AChChargingAddress Tag (srfConnection)=329f"},
    };
    for (const auto &s : shown) {
        const auto *f = r.find(s.id);
        ASSERT_NE(f, nullptr) << s.id;
        EXPECT_EQ(f->text, s.text);
    }
    // Type: bits 1-5 of the identifier octet, nothing consumed; the tag
    // that follows starts on the same octet.
    const auto *type = r.find(4200);
    const auto *tag = r.find(4205);
    ASSERT_EQ(type->spans.size(), 1u);
    EXPECT_EQ(type->spans[0].last - type->spans[0].first, 4u);
    EXPECT_EQ(type->spans[0].first, tag->spans[0].first);
    EXPECT_EQ(tag->spans[0].last - tag->spans[0].first, 15u);

    // Tag number 2 selects the leg alternative, whatever the class bits.
    for (const char *leg : {"A2", "82"}) {
        SCOPED_TRACE(leg);
        const auto a = decode(endWithInvoke(35, std::string("30 04 BF 32 01 ") + leg));
        ASSERT_NE(a.find(4203), nullptr);
        EXPECT_EQ(a.find(4200)->text, "AChChargingAddress Type=2");
        EXPECT_EQ(a.find(4205), nullptr);
    }
}

// Fields narrower than an octet and digits: their spans, and the display
// pass's names and ids.
TEST(Charging, BitLayoutsAndDisplay) {
    // Append Free Format Data: bits 1-2 of an octet whose other bits are set.
    const auto fci = decode(endWithInvoke(34, "04 05 A0 03 82 01 FD"));
    const auto *append = fci.find(2191);
    ASSERT_NE(append, nullptr);
    EXPECT_EQ(append->text, "  Append Free Format Data=Append");
    ASSERT_EQ(append->spans.size(), 1u);
    EXPECT_EQ(append->spans[0].last - append->spans[0].first, 1u);
    EXPECT_EQ(fci.md.errorFlags, 0u);

    // Generic digits outside the generic-number context: the second id set.
    // Type of digits (bits 1-5) and scheme (bits 6-8) share the first octet;
    // BCD digits come low half first, one span each.
    const auto pa = decode(endWithInvoke(47, "30 0F A0 0D A0 0B A0 09 BE 07 A1 05 81 03 03 21 F3"));
    const auto *type = pa.find(1649);
    const auto *scheme = pa.find(3533);
    const auto *digits = pa.find(3539);
    ASSERT_TRUE(type && scheme && digits);
    EXPECT_EQ(pa.find(3530), nullptr);
    EXPECT_EQ(type->text, "  Type Of Digits=Res Business ");
    EXPECT_EQ(scheme->text, "  Encoding Scheme=Bcd Even");
    EXPECT_EQ(scheme->spans[0].first, type->spans[0].first + 5);
    EXPECT_EQ(scheme->spans[0].last, type->spans[0].first + 7);
    EXPECT_EQ(digits->text, "  Bcd Digits=123f");
    ASSERT_EQ(digits->spans.size(), 4u);
    EXPECT_EQ(digits->spans[0], (Span{scheme->spans[0].last + 1, scheme->spans[0].last + 4, 1}));
    EXPECT_EQ(digits->selector, 1u);
    // Binary-coded digits: every octet high half first.
    const auto bin = decode(endWithInvoke(47, "30 0E A0 0C A0 0A A0 08 BE 06 A1 04 81 02 7F A5"));
    ASSERT_NE(bin.find(3551), nullptr);
    EXPECT_EQ(bin.find(3551)->text, "  Binary Digits=a5");
    EXPECT_EQ(bin.find(1649)->text, "  Type Of Digits=Res For Extension");

    // Choice names differ in the display pass; every "Choice" shares one
    // display id.
    const auto cg = decode(endWithInvoke(41, "30 10 A0 02 A2 00 A3 0A A0 08 A0 06 A0 04 80 02 00 07"));
    const struct {
        uint32_t id;
        const char *md;
        const char *shown;
    } names[] = {
        {1442, "Choice=Gap On Service Tag", "Gap Onservice"},
        {1472, "Choice=Information To Send Tag", "InformationTO Send"},
        {1304, "Choice=Inband Info Tag", "Inband Info"},
        {1331, "Choice=Elementary Message Id Tag", "Elementary Message Id"},
    };
    uint32_t choiceDisplayId = 0;
    for (const auto &n : names) {
        SCOPED_TRACE(n.id);
        size_t i = 0;
        while (i < cg.fields.size() && cg.fields[i].id != n.id)
            ++i;
        ASSERT_LT(i, cg.fields.size());
        EXPECT_EQ(cg.fields[i].text, n.md);
        EXPECT_EQ(cg.shown[i].text, n.shown);
        if (choiceDisplayId == 0)
            choiceDisplayId = cg.shown[i].displayId;
        EXPECT_EQ(cg.shown[i].displayId, choiceDisplayId);
    }
    EXPECT_EQ(cg.md.errorFlags, 0u);
}

} // namespace
