// Party numbers and ISUP / Q.931 parameters through the real entry points:
// each case puts one element into an operation argument and checks the
// texts from the element's tag on, the key entries the numbers mark and the
// names the display pass shows.  The bytes are asymmetric so that a swapped
// half-octet or bit field shows.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "engine/scratch.h"
#include "support/harness.h"

using namespace camel::test;
using Texts = std::vector<std::string>;

namespace {

// A Begin holding one Invoke of operation `op` whose argument is a SEQUENCE
// of the given elements (or the given argument itself when `sequence` is
// false).
Bytes invoke(uint8_t op, const std::string &elements, bool sequence = true) {
    Bytes component = hexBytes("02 01 01 02 01");
    component.push_back(op);
    const Bytes arg = sequence ? tlv(0x30, hexBytes(elements)) : hexBytes(elements);
    component.insert(component.end(), arg.begin(), arg.end());
    Bytes content = hexBytes("48 01 01");
    const Bytes portion = tlv(0x6C, tlv(0xA1, component));
    content.insert(content.end(), portion.begin(), portion.end());
    return tlv(0x62, content);
}

constexpr uint8_t kInitialDp = 0x00, kConnect = 0x14, kConnectToResource = 0x13,
                  kEstablishTemporaryConnection = 0x11;



struct Case {
    const char *name;
    uint8_t op;
    std::string elements;
    uint32_t tagId; // the element's tag field: texts are compared from it on
    Texts texts;
};

void check(const Case &c, bool sequence = true) {
    SCOPED_TRACE(c.name);
    const auto d = decode(invoke(c.op, c.elements, sequence));
    EXPECT_EQ(textsFrom(d, c.tagId), c.texts);
    EXPECT_EQ(d.md.errorFlags, 0u);
}

// Address digits: low half-octet first, count from the length and the
// odd/even indicator, filler after an odd count.
TEST(PartyNumbers, CalledCallingAndChargeNumbers) {
    const Case cases[] = {
        {"called, odd, no digit octets", kInitialDp, "82 02 83 10", 1614,
         {"Called Party Number Tag=82", "  LENGTH=2 octet(s)",
          "  Nature Of Address Ind=National (significant) Num", "  Odd/even Indicator=Odd", "Spare=0",
          "  Numbering Plan Indicator=ISDN/telephony", "Internal Network Num Ind=Routing to Innallowed"}},
        {"called, one octet", kInitialDp, "82 01 83", 1614,
         {"Called Party Number Tag=82", "  LENGTH=1 octet(s)",
          "  Nature Of Address Ind=National (significant) Num", "  Odd/even Indicator=Odd"}},
        {"IP routing address of Connect to Resource", kConnectToResource, "80 05 84 10 21 43 F5", 1532,
         {"Resource Address(choice)=IP Routing Address Tag", "  LENGTH=5 octet(s)",
          "  Nature Of Address Ind=International Number", "  Odd/even Indicator=Odd", "Spare=0",
          "  Numbering Plan Indicator=ISDN/telephony", "Internal Network Num Ind=Routing to Innallowed",
          "  Called Party Num=12345", "Filler=f"}},
    };
    for (const auto &c : cases)
        check(c);
}

TEST(PartyNumbers, DigitSpansKeysAndDisplay) {
    // Called party number 1bc + filler, then a charge number 1234.
    const auto called = decode(invoke(kInitialDp, "82 04 83 10 B1 5C"));
    const auto *digits = called.find(3589);
    ASSERT_NE(digits, nullptr);
    const uint32_t p = digits->spans[0].first;
    EXPECT_EQ(digits->spans, (std::vector<Span>{{p, p + 3, 1}, {p + 4, p + 7, 0xB}, {p + 8, p + 11, 0xC}}));
    EXPECT_EQ(digits->selector, 1u);
    EXPECT_EQ(called.find(3590)->spans, (std::vector<Span>{{p + 12, p + 15, 5}}));
    ASSERT_NE(called.key(10), nullptr);
    EXPECT_EQ(called.key(10)->value, (Bytes{0x01, 0xBC}));
    EXPECT_EQ(called.key(10)->bits, 12u);
    EXPECT_EQ(called.key(12), nullptr);
    EXPECT_EQ(shownOf(called, 1820), "Odd Number Of Address signals");
    EXPECT_EQ(shownOf(called, 3589), "1bc");

    const auto charge = decode(invoke(kConnect, "93 04 01 D0 21 43"));
    ASSERT_NE(charge.key(12), nullptr);
    EXPECT_EQ(charge.key(12)->value, (Bytes{0x12, 0x34}));
    EXPECT_EQ(charge.key(10), nullptr);
    EXPECT_EQ(shownOf(charge, 1943), "Even Num Of Addresssignals");
    // The number layouts are restored after each number.
    EXPECT_EQ(camel::g_scratch<camel::Pass::Decoded>.tagContext, 0u);
    EXPECT_EQ(camel::g_scratch<camel::Pass::KeyField>.tagContext, 0u);

    const auto calling = decode(invoke(kInitialDp, "83 05 84 2B 21 43 F5"));
    ASSERT_NE(calling.key(15), nullptr);
    EXPECT_EQ(calling.key(15)->value, (Bytes{0x01, 0x23, 0x45}));

    // Shared display ids: every odd/even indicator under the first one (the
    // generic number of Assist Request Instructions comes first),
    // every filler under the called party's.
    for (const auto &f : calling.fields)
        if (f.label == "Odd/even Indicator" || f.label == "Filler") {
            const size_t i = size_t(&f - calling.fields.data());
            EXPECT_EQ(calling.shown[i].displayId, f.label == "Filler" ? 3590u : 1661u);
        }
    EXPECT_EQ(shownOf(decode(invoke(kInitialDp, "82 04 7F F5 B1 5C")), 1822), "Spare (7)");
}

// The location number's own name for nature of address 127; the redirection
// numbers show every half-octet, 16 at most.
TEST(PartyNumbers, GenericLocationAndRedirectionNumbers) {
    // Generic Address nature of address 127 is shown "Spare (127)".
    const auto location = decode(invoke(kInitialDp, "8A 03 7F 7C 21"));
    EXPECT_EQ(location.find(3557)->text, "  Nature Of Address Ind=Spare(127)");
    EXPECT_EQ(shownOf(location, 3557), "Spare (127)");

    // 16 digits at most: the rest of the element is left over.
    const auto redirecting = decode(invoke(kInitialDp, "9D 0C 83 13 21 43 65 87 09 21 43 65 87 09"));
    EXPECT_EQ(redirecting.find(1818)->text, "  Address Signal In Redir=1234567890123456");
    EXPECT_EQ(redirecting.md.errorFlags, uint32_t(DPX_ERR_LEFTOVER));
}

TEST(PartyNumbers, IsupParameters) {
    const Case cases[] = {
        // NA carrier id digits: low half of each octet first, one number.
        {"carrier", kConnect, "8B 03 01 12 34", 1952,
         {"Carrier Tag=8b", "  LENGTH=3 octet(s)",
          "  Carrier Selection=Pre Subscribed And Not Input By Calling Party", "  NA Carrier Id=2143"}},
        {"carrier, leading zero", kConnect, "8B 03 00 10 00", 1952,
         {"Carrier Tag=8b", "  LENGTH=3 octet(s)", "  Carrier Selection=No Indication", "  NA Carrier Id=100"}},
        {"release call cause", 0x16, "84 02 80 81", 1474,
         {"Cause Tag=84", "  LENGTH=2 octet(s)", "  Location=User", "  Coding Standard=ITU-T standardized coding",
          "  Cause Value=Unallocated (unassigned) Number (1)", "  Extension Indicator=No Extension"}},
    };
    for (const auto &c : cases)
        check(c, c.op != 0x16);

    const auto carrier = decode(invoke(kConnect, "8B 03 01 12 34"));
    EXPECT_EQ(shownOf(carrier, 1955), "Pre Subs And Not Input");
    const auto cause = decode(invoke(0x16, "84 02 85 81", false));
    EXPECT_EQ(shownOf(cause, 1476), "Private Ntwk / Remote User");
    EXPECT_EQ(shownOf(cause, 1480), "Unallocated Number (1)");
    ASSERT_NE(cause.key(8), nullptr);
    EXPECT_EQ(cause.key(8)->value, Bytes{0x01});
}

TEST(PartyNumbers, BearerCapability) {
    // An invalid layer id: the rest of the octets shown raw.
    check({"invalid layer, raw data", kInitialDp, "BB 07 80 05 90 90 01 77 08", 1698,
           {"Bearer Capability Tag=bb", "  LENGTH=7 octet(s)", "Choice=Bearer Cap TAG", "  LENGTH=5 octet(s)",
            "  Information Transfer Capability=3.1 Khz Audio", "  Coding Standard=CCITT Standardised Coding",
            "  Extension Bit=No extension", "  Information Transfer Rate=64 Kbit/s",
            "  Transfer Mode=Circuit Mode", "  Extension Bit=No extension", "  Extension Bit=Extension",
            "  Layer Id=Invalid", "  Invalid Data=1", " Raw Data=7708"}});

    // Layer 1 with V.110 octets 5a to 5d, layer 2, layer 3 with 7a and 7b.
    const auto d = decode(invoke(kInitialDp, "BB 0D 80 0B 88 90 21 4F 3B 55 91 C2 6B 0C 8C"));
    EXPECT_EQ(d.md.errorFlags, 0u);
    const Texts texts = textsFrom(d, 1725);
    EXPECT_EQ(texts.size(), 30u);
    EXPECT_EQ(Texts(texts.begin() + 1, texts.begin() + 5),
              (Texts{"  Extension Bit=Extension", "  Synchronous/Asynchronous=Asynchronous data",
                     "  In-band negotiation=Not possible", "  User rate=56 kbit/s"}));
    EXPECT_EQ(d.find(1734)->text, "  Intermediate rate=8 kbit/s");
    EXPECT_EQ(d.find(1739)->text, "  Spare=1");
    EXPECT_EQ(d.find(1750)->text, "  Parity information=Forced to 1");
    EXPECT_EQ(d.find(1751)->text, "  Number of data bits excluding parity Bit=7 bits");
    EXPECT_EQ(d.find(1752)->text, "  Number of stop bits=1.5 bits");
    EXPECT_EQ(d.find(1755)->text, "  Modem type=Recommendation V.21");
    EXPECT_EQ(d.find(1758)->text, "  User information layer 2 protocol=Recommendation Q.921/I.441");
    EXPECT_EQ(d.find(1760)->text,
              " User information layer 3 protocol=ISO/IEC TR 9577 (Protocol identification in the network layer)");
    const auto *info = d.find(1763);
    ASSERT_NE(info, nullptr);
    EXPECT_EQ(info->text, "  Additional layer 3 protocol info.=Internet Protocol (RFC 791) (ISO/IEC TR 9577)");
    const uint32_t p = info->spans[0].first;
    EXPECT_EQ(info->spans, (std::vector<Span>{{p, p + 3, 0xC}, {p + 8, p + 11, 0xC}}));
    EXPECT_EQ(texts.back(), "  Extension Bit=No extension");

    EXPECT_EQ(shownOf(d, 1700), "Bearer Cap");
    EXPECT_EQ(shownOf(d, 1705), "ITU-T standardized coding");
    // A modem type in a code-point range.
    const auto modem = decode(invoke(kInitialDp, "BB 09 80 07 88 90 21 4F 55 31 B3"));
    EXPECT_EQ(modem.find(1755)->text, "  Modem type=User specified");
    EXPECT_EQ(modem.find(1751)->text, "  Number of data bits excluding parity Bit=7 bits");
}

} // namespace
