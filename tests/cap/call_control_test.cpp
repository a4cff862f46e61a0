// Call-control types through the real entry points: each case is one
// operation argument in an Invoke, checked from the operation's name on.
// Units of other areas (cause, party numbers) are not looked into here.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "support/harness.h"

using namespace camel::test;
using Texts = std::vector<std::string>;

namespace {


struct Case {
    const char *name;
    uint8_t op;
    std::string arg;
    Texts texts; // from the argument's outer tag on
    uint32_t flags = 0;
};

void check(const Case &c) {
    SCOPED_TRACE(c.name);
    const auto d = decode(invoke(c.op, c.arg));
    EXPECT_EQ(argumentTexts(d), c.texts);
    EXPECT_EQ(d.md.errorFlags, c.flags);
}

} // namespace

// Well-formed types whose values the reference comparison does not check
// one by one (it covers the rest over thousands of generated arguments).
TEST(CallControl, ArgumentLayouts) {
    const Case cases[] = {
        {"erb_answer", 24, "30 28 80 01 07 A2 19 A5 17 9F 33 00 9F 34 00 9F 35 01 06 BF 36 03 82 01 11 BF 37 04 83 02 61 0B A3 03 81 01 02 A4 03 80 01 01",
         {"Sequence Tag=30", "  LENGTH=40 octet(s)", "Event Type BCSM Tag=80", "  LENGTH=1 octet(s)", "  Event Type BCSM Value=O. Answer", "Event Specific Info BCSM Tag=a2", "  LENGTH=25 octet(s)", "Choice=O. Answer Specific Info Tag", "  LENGTH=23 octet(s)", "Or Call Tag=339f", "  LENGTH(null)=0 octet(s)", "Forwarded call=349f", "  LENGTH(null)=0 octet(s)", "ChargeIndicator Tag=359f", "  LENGTH=1 octet(s)", "  Charge Indicator=charge", "  Spare=1", "Ext Basic Service Code Tag=36bf", "  LENGTH=3 octet(s)", "Choice=Bs Code Tag", "  LENGTH=1 octet(s)", "  Bs Code=Data Cda - 300b/s", "Ext Basic Service Code Tag=37bf", "  LENGTH=4 octet(s)", "Choice=Tele Service Code Tag", "  LENGTH=2 octet(s)", "  Ts Code=Facsimile Group 3 And Alternate Speech", "  Reserved Ts Code=0b", "Receiving Side ID Tag=a3", "  LENGTH=3 octet(s)", "Choice=Receiving Side ID", "  LENGTH=1 octet(s)", "  Side Id Value=Leg 2 Legtype", "Misc Call Info Tag=a4", "  LENGTH=3 octet(s)", "Message Type Tag=80", "  LENGTH=1 octet(s)", "  Message Type=Notification"}},
        {"cwa", 56, "30 0E BF 3B 0B 80 00 82 00 A3 05 A1 03 81 01 02",
         {"Sequence Tag=30", "  LENGTH=14 octet(s)", "ContinueWithArgumentArgExtension Tag=3bbf", "  LENGTH=11 octet(s)", "suppress_D_CSI Tag=80", "  LENGTH=0 octet(s)", "suppressOutgoingCallBarring Tag=82", "  LENGTH=0 octet(s)", "LegOrCallSegment Tag=a3", "  LENGTH=5 octet(s)", "LegOrCallSegment Type=legID", "  LENGTH=3 octet(s)", "  Choice=Receiving Side IdTAG", "  LENGTH=1 octet(s)", "  Side Id Value=Leg 2 Legtype"}},
        {"etc", 17, "30 06 83 04 01 A2 B3 C4",
         {"Sequence Tag=30", "  LENGTH=6 octet(s)", "SCF ID Tag=83", "  LENGTH=4 octet(s)", "SCF ID Value=01a2b3c4"}},
        {"ari", 16, "30 03 82 01 6A",
         {"Sequence Tag=30", "  LENGTH=3 octet(s)", "IP Ssp Capabilities Tag=82", "  LENGTH=1 octet(s)", "  IP Routing Address Support=Not Supported", "  Voiceback=Supported", "  Voiceinformation Via Speech=Not Supported,via Speech Recog.", "  Voiceinformation Via Voice=Supported,via Voice Recognition", "  Generation Of Voice Announ=Not Supported", "  End Of Standard Part=End Of Standard Part"}},
    };
    for (const Case &c : cases)
        check(c);
}

// Values a table does not know, cut elements and lengths that overrun:
// what is there is shown, the rest is flagged.
TEST(CallControl, MalformedElements) {
    const Case cases[] = {
        // An alternative the choice does not list: empty name, nothing
        // decoded, its octets left over; the next element still decoded.
        {"erb_unknown", 24, "30 09 A2 02 A6 00 A4 03 80 01 00",
         {"Sequence Tag=30", "  LENGTH=9 octet(s)", "Event Specific Info BCSM Tag=a2", "  LENGTH=2 octet(s)", "Choice=", "Misc Call Info Tag=a4", "  LENGTH=3 octet(s)", "Message Type Tag=80", "  LENGTH=1 octet(s)", "  Message Type=Request"}, DPX_ERR_LEFTOVER},
        // A two-octet identifier cut after its first octet: no choice field.
        {"erb_bf_cut", 24, "30 03 A2 01 BF",
         {"Sequence Tag=30", "  LENGTH=3 octet(s)", "Event Specific Info BCSM Tag=a2", "  LENGTH=1 octet(s)"}, DPX_ERR_LEFTOVER},
        // A leg id whose choice names neither side.
        {"leg_bad_choice", 93, "30 05 A0 03 82 01 01",
         {"Move Leg Arg Tag=30", "  LENGTH=5 octet(s)", "Leg ID Tag=a0", "  LENGTH=3 octet(s)", "  Choice="}, DPX_ERR_LEFTOVER},
        // A service key of five octets: the first four make the value.
        {"sk_long", 0, "30 07 80 05 01 02 03 04 05",
         {"Sequence Tag=30", "  LENGTH=7 octet(s)", "Service Key Tag=80", "  LENGTH=5 octet(s)", "  Service Key=16909060"}, DPX_ERR_LEFTOVER},
        // A side id longer than its window: flagged, the leg type still shown.
        {"side_beyond", 45, "30 05 A3 03 80 05 01",
         {"Sequence Tag=30", "  LENGTH=5 octet(s)", "Party to Charge Tag=a3", "  LENGTH=3 octet(s)", "Choice=Sending Side Id", "  LENGTH=5 octet(s)", "  Side Id Value=Leg 1 Legtype"}, DPX_ERR_LENGTH_BEYOND},
    };
    for (const Case &c : cases)
        check(c);
}

// The display pass shows names of its own where they differ (one per
// names table kind: a treatment, an event, a side), and every "Choice"
// under one display id.
TEST(CallControl, DisplayNames) {
    const auto connect = decode(invoke(20, "30 13 AF 11 A0 06 81 01 02 82 01 02 A1 03 82 01 02 9F 32 01 02"));
    EXPECT_EQ(shownOf(connect, 1980), "Call Diversion Notallowed");

    const auto report = decode(invoke(24, "30 1A 80 01 07 A2 0E A5 0C BF 36 03 82 01 11 BF 37 03 83 01 61"
                                          " A3 03 81 01 02 A4 00"));
    EXPECT_EQ(shownOf(report, 1563), "O. Answer Specific");
    EXPECT_EQ(shownOf(report, 2057), "Fax G3 And Alternate Speech");
    for (size_t i = 0; i < report.fields.size(); ++i) {
        if (report.fields[i].label == "Choice") {
            EXPECT_EQ(report.shown[i].displayId, 1551u) << report.fields[i].id;
        }
    }
    EXPECT_EQ(shownOf(decode(invoke(93, "30 05 A0 03 80 01 02")), 1543), "Sendingside ID");
}

// Spans: multi-octet values octet by octet, bit fields over their bits,
// the two-octet choice and the year read first octet low; the event type
// is key entry 13.
TEST(CallControl, SpansAndKeys) {
    const auto idp = decode(invoke(0, "30 10 80 04 81 02 03 04 9C 01 33 BF 35 04 83 02 11 05"));
    const auto *key = idp.find(1611);
    ASSERT_NE(key, nullptr);
    EXPECT_EQ(key->text, "  Service Key=2164392708");
    ASSERT_EQ(key->spans.size(), 4u);
    EXPECT_EQ(key->spans[0].value, 0x81u);
    EXPECT_EQ(key->spans[3].last - key->spans[0].first, 31u);
    EXPECT_EQ(key->selector, 3u);
    ASSERT_NE(idp.key(13), nullptr);
    EXPECT_EQ(idp.key(13)->value, Bytes{0x33});
    ASSERT_NE(idp.find(2131), nullptr);
    EXPECT_EQ(idp.find(2131)->selector, 1u);

    const auto sii = decode(invoke(20, "30 05 AF 03 84 01 FE"));
    ASSERT_NE(sii.find(1996), nullptr);
    const auto &bits = sii.find(1996)->spans;
    ASSERT_EQ(bits.size(), 1u);
    EXPECT_EQ(bits[0].last - bits[0].first, 1u);
    EXPECT_EQ(bits[0].value, 2u);

    const auto position = decode(invoke(24, "30 04 A2 02 BF 33 00"));
    ASSERT_NE(position.find(1565), nullptr);
    EXPECT_EQ(position.find(1565)->spans[0].value, 0x33BFu);
    EXPECT_EQ(position.find(1565)->text, "Choice=T. Change Of Position Specific Info Tag");

    const auto stop = decode(invoke(44, "30 10 A0 0E 30 0C A1 0A 81 08 02 42 50 71 01 03 59 00"));
    ASSERT_NE(stop.find(1512), nullptr);
    EXPECT_EQ(stop.find(1512)->spans, (std::vector<camel::test::Span>{
                                          {stop.find(1512)->spans[0].first,
                                           stop.find(1512)->spans[0].first + 15, 0x4202}}));
    EXPECT_EQ(stop.md.errorFlags, DPX_ERR_LEFTOVER); // the eighth octet
}
