// SMS arguments through the real entry points: the TP octets of SMS Initial
// DP in every layout (asymmetric bit patterns), both validity period forms
// and a length that has none, the event-specific information of Event
// Report SMS with its causes and key entry, the RP cause of SMS Release
// with its key entry, and values without a name.  The values of the other
// elements are compared with tshark by the reference comparison.
#include <gtest/gtest.h>

#include <cstdio>
#include <string>
#include <vector>

#include "support/harness.h"

namespace camel::test {
namespace {

using Texts = std::vector<std::string>;

// SMS Initial DP (60) with service key 1 and `element` (hex, short lengths).
Decoded initialDpSms(const std::string &element) {
    char head[16];
    std::snprintf(head, sizeof head, "30 %02X 80 01 01 ",
                  static_cast<unsigned>(hexBytes(element).size() + 3));
    return decode(invoke(60, head + element));
}

// Each TP octet is read by the layout its own bits choose; every case
// decodes clean unless a flag is given.
TEST(SmsInitialDp, TpOctetsByLayout) {
    const struct {
        std::string element;
        uint32_t fromId;
        Texts texts;
        uint32_t flags;
    } cases[] = {
        {"89 01 39", 2243,
         {"  TP Reply Path=TP Reply Path Not In SMS-submit",
          "  TP User Data Header Indicator=TP-ud Contains Only Short Mess",
          "  TP Status Report Request=A Status Report Is Requested",
          "  TP Validity Period FORMAT=TP-vp present(absolute FORMAT)",
          "  TP Reject Duplicates=Accept An SMS-submit",
          "  TP Message Type Indicator=SMS-submit/SMS-submit-report"},
         0},
        {"89 01 C6", 2243,
         {"  TP Reply Path=TP Reply Path Set In SMS-submit",
          "  TP User Data Header Indicator=TP-ud Contains A Header",
          "  TP Status Report Request=A Status Report Is Not Requested",
          "  TP Validity Period FORMAT=TP-vp Notpresent", "  TP Reject Duplicates=Reject An SMS-submit",
          "  TP Message Type Indicator=SMS-status-report/SMS-command"},
         0},
        {"8A 01 21", 2249,
         {"  TP Protocol Identifier=8a", "  LENGTH=1 octet(s)", "  Bit 7,8=Bit 7=0,bit 8=0",
          "  Types Of Telematic Devices=Telex", "  Indicate Telematic Interworking=Telematic Interworking"},
         0},
        {"8A 01 0E", 2251,
         {"  Bit 7,8=Bit 7=0,bit 8=0", "  Types Of Telematic Devices=",
          "  Indicate Telematic Interworking=No Interwork, Smetosmeprotcol"},
         0},
        {"8A 01 41", 2251,
         {"  Bit 7,8=Bit 7=1,bit 8=0", "  Types Of Telematic Devices=Replace Short Message Type 1"}, 0},
        {"8A 01 BE", 2251, {"  Bit 7,8=Reserved", "  Bits 0-5 Value=3e"}, 0},
        {"8B 01 19", 2272,
         {"  TP Data Coding Scheme=8b", "  LENGTH=1 octet(s)",
          "  Coding Group=General Data Coding Indication(1)", "  Compress Indicator=The Ttext Is Uncompressed",
          "  Bit 1,2 Indicator=Bits 2,1 Have Msg Class Mean", "  Alphabet=Ucs2(16bit)",
          "  Message Class=Class 1 Default = Me-specific."},
         0},
        {"8B 01 6A", 2274,
         {"  Coding Group=", "  Compress Indicator=Text Is Compressed",
          "  Bit 1,2 Indicator=Bits 2,1 No Msg Class Mean", "  Alphabet=Ucs2(16bit)",
          "  Message Class=Class 2 (u)sim Specificmessage"},
         0},
        {"8B 01 85", 2274, {"  Coding Group="}, 0},
        // Sense bit 4 clear beside the group's set bit 5.
        {"8B 01 D1", 2274,
         {"  Coding Group=Store Message(13)", "  Indication Sense=Voicemail Messagewaiting",
          "  Indication Type=Fax Messagewaiting"},
         0},
        {"8B 01 F6", 2274,
         {"  Coding Group=Data Coding/message Class", "  Message Coding=8-bit Data",
          "  Message Class=Class 2 (u)sim-specific Message."},
         0},
        {"8C 01 A7", 2256,
         {"  TP validity period=8c", "TP Validity Period=1", "  LENGTH=1 octet(s)",
          "  Validity Period Value=1440minutes"},
         0},
        // Swapped BCD digits; the time zone's sign in bit 4, its tens in
        // bits 3-1 and its units in bits 8-5 (0x2B: minus 32 quarters).
        {"8C 07 42 50 81 01 03 00 2B", 2258,
         {"  LENGTH=7 octet(s)", "  Year=24", "  Month=5", "  Day=18", "  Hour=10", "  Minute=30",
          "  Second=0", "  Time Zone Algebraic Sign= - ", "  Time Zone =32"},
         0},
        // A length that is neither form: its octets are left over.
        {"8C 03 01 02 03", 2256, {"  TP validity period=8c", "TP Validity Period=3", "  LENGTH=3 octet(s)"},
         DPX_ERR_LEFTOVER},
        // An empty TP octet shows nothing and is no error.
        {"89 00", 2241, {"  TP Short Messagesubscriber Info=89", "  LENGTH=0 octet(s)"}, 0},
    };
    for (const auto &c : cases) {
        SCOPED_TRACE(c.element);
        const Decoded d = initialDpSms(c.element);
        EXPECT_EQ(textsFrom(d, c.fromId), c.texts);
        EXPECT_EQ(d.md.errorFlags, c.flags);
    }
}

TEST(SmsInitialDp, RelativeValidityPeriodAtEveryStepBoundary) {
    const struct {
        uint32_t value;
        const char *text;
    } cases[] = {{0, "5minutes"},     {143, "720minutes"}, {144, "750minutes"}, {167, "1440minutes"},
                 {168, "2 Days"},     {196, "30 Days"},    {197, "5 Weeks"},    {255, "63 Weeks"}};
    for (const auto &c : cases) {
        char element[16];
        std::snprintf(element, sizeof element, "8C 01 %02X", c.value);
        SCOPED_TRACE(element);
        EXPECT_EQ(shownOf(initialDpSms(element), 2271), c.text);
    }
}

// Event Report SMS and SMS Release: the causes, their key entries, the
// choice's display names and values without a name.
TEST(SmsArguments, CausesAndEventSpecificInformation) {
    const struct {
        uint8_t op;
        std::string argument;
        Texts texts;
        std::string shownChoice;
        int keyEntry;
        uint8_t keyValue;
        uint32_t flags;
    } cases[] = {
        {64, "30 0A 80 01 02 A1 05 A0 03 80 01 03",
         {"Sequence Tag=30", "  LENGTH=10 octet(s)", "  Event Type Tag=80", "  LENGTH=1 octet(s)",
          "  Event Type Value=O. SMS Failure", "Event Specific Info SMS Tag=a1", "  LENGTH=5 octet(s)",
          "Choice=O. SMS Failure Specific Info Tag", "  LENGTH=3 octet(s)", "  Failure Cause Tag=80",
          "  LENGTH=1 octet(s)", "  Failure Cause Value=sM-Deliveryfailure"},
         "O. SMS Failure Specific Info.", 6, 0x03, 0},
        {64, "30 0A 80 01 0C A1 05 A2 03 80 01 16",
         {"Sequence Tag=30", "  LENGTH=10 octet(s)", "  Event Type Tag=80", "  LENGTH=1 octet(s)",
          "  Event Type Value=T. SMS Failure", "Event Specific Info SMS Tag=a1", "  LENGTH=5 octet(s)",
          "Choice=T. SMS Failure Specific Info Tag", "  LENGTH=3 octet(s)", "  MT SMS Cause Tag=80",
          "  LENGTH=1 octet(s)", "  MT SMS Cause Value=Memory Capacity Exceeded"},
         "T. SMS Failure Specific Info.", -1, 0, 0},
        // An event type and an alternative without a name.
        {64, "30 07 80 01 04 A1 02 A5 00",
         {"Sequence Tag=30", "  LENGTH=7 octet(s)", "  Event Type Tag=80", "  LENGTH=1 octet(s)",
          "  Event Type Value=", "Event Specific Info SMS Tag=a1", "  LENGTH=2 octet(s)", "Choice="},
         "", -1, 0, DPX_ERR_LEFTOVER},
        {66, "04 01 15",
         {"RP Cause Tag=4", "  LENGTH=1 octet(s)", "  RP Cause Value=Short Message Transfer Rejected"}, "?", 7,
         0x15, 0},
        // The cause value is bits 7-1 whatever the extension bit says.
        {66, "04 01 95",
         {"RP Cause Tag=4", "  LENGTH=1 octet(s)", "  RP Cause Value=Short Message Transfer Rejected"}, "?", 7,
         0x15, 0},
        {66, "04 01 48", {"RP Cause Tag=4", "  LENGTH=1 octet(s)", "  RP Cause Value="}, "?", 7, 0x48, 0},
    };
    for (const auto &c : cases) {
        SCOPED_TRACE(c.argument);
        const Decoded d = decode(invoke(c.op, c.argument));
        EXPECT_EQ(argumentTexts(d), c.texts);
        EXPECT_EQ(shownOf(d, 2172), c.shownChoice);
        EXPECT_EQ(d.md.errorFlags, c.flags);
        for (int entry : {6, 7}) {
            const Key *k = d.key(static_cast<uint32_t>(entry));
            if (entry != c.keyEntry) {
                EXPECT_EQ(k, nullptr) << entry;
                continue;
            }
            ASSERT_NE(k, nullptr) << entry;
            EXPECT_EQ(k->value, Bytes{c.keyValue});
        }
    }
}

} // namespace
} // namespace camel::test
