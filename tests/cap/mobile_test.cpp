// Mobile identities, location and time: IMSI digit counts and key, the
// MCC-MNC forms, time and time zone, location information with every
// member, and the subscriber state alternatives.  (The values of the other
// mobile elements are compared with tshark by the reference comparison.)
#include <gtest/gtest.h>

#include <cstdio>
#include <string>
#include <vector>

#include "support/harness.h"

namespace camel::test {
namespace {

using Texts = std::vector<std::string>;

// An element with a short definite length, as hex text.
std::string tlv(const std::string &tag, const std::string &content) {
    char len[4];
    std::snprintf(len, sizeof len, "%02X", static_cast<unsigned>(hexBytes(content).size()));
    return tag + " " + len + " " + content + " ";
}

// A Begin holding one Invoke of operation `op` with argument `arg`.
std::string invoke(unsigned op, const std::string &arg) {
    char code[4];
    std::snprintf(code, sizeof code, "%02X", op);
    return tlv("62", "48 01 01 " + tlv("6C", tlv("A1", "02 01 01 02 01 " + std::string(code) + " " + arg)));
}
std::string initialDp(const std::string &members) { return invoke(0, tlv("30", members)); }


// Decodes an Initial DP holding `element`; checks the texts from field `id`
// on and the error flags.
Decoded expectTexts(const std::string &element, uint32_t id, const Texts &texts, uint32_t flags) {
    SCOPED_TRACE(element);
    const Decoded d = decode(initialDp(element));
    EXPECT_EQ(textsFrom(d, id), texts);
    EXPECT_EQ(d.md.errorFlags, flags);
    return d;
}

// An element's contents, the texts expected from one field on, the flags.
struct TextCase {
    std::string content;
    Texts texts;
    uint32_t flags;
};

// The display id each field with `id` was shown under.
std::vector<uint32_t> displayIds(const Decoded &d, uint32_t id) {
    std::vector<uint32_t> out;
    for (size_t i = 0; i < d.fields.size() && i < d.shown.size(); ++i)
        if (d.fields[i].id == id)
            out.push_back(d.shown[i].displayId);
    return out;
}

TEST(MobileImsi, DigitCountFollowsTheLengthAndFillsKeyEntry17) {
    const struct {
        std::string content;
        Texts texts;
        uint32_t keyBits;
        Bytes keyValue;
    } cases[] = {
        {"32 54 76 98 10 32 54 F6",
         {"IMSI Tag=329f", "  LENGTH=8 octet(s)", "  IMSI Digits=234567890123456", "filler=f"},
         60,
         hexBytes("02 34 56 78 90 12 34 56")},
        {"21 43 65 87 A9",
         {"IMSI Tag=329f", "  LENGTH=5 octet(s)", "  IMSI Digits=123456789a"},
         40,
         hexBytes("12 34 56 78 9A")},
        {"21 43 65 87 A9 CB ED",
         {"IMSI Tag=329f", "  LENGTH=7 octet(s)", "  IMSI Digits=123456789abcde"},
         56,
         hexBytes("12 34 56 78 9A BC DE")},
    };
    for (const auto &c : cases) {
        SCOPED_TRACE(c.content);
        const Decoded d = decode(initialDp(tlv("9F 32", c.content)));
        EXPECT_EQ(textsFrom(d, 2018), c.texts);
        EXPECT_EQ(d.md.errorFlags, 0u);
        const Key *k = d.key(17);
        ASSERT_NE(k, nullptr);
        EXPECT_EQ(k->bits, c.keyBits);
        EXPECT_EQ(k->value, c.keyValue);
    }
    // Digits low half first; the filler is the high half of octet 8.
    const Decoded d = decode(initialDp(tlv("9F 32", "32 54 76 98 10 32 54 F6")));
    const auto &digits = d.find(2025)->spans;
    ASSERT_EQ(digits.size(), 15u);
    const uint32_t p = digits[0].first;
    EXPECT_EQ(digits[0], (Span{p, p + 3, 2}));
    EXPECT_EQ(digits[1], (Span{p + 4, p + 7, 3}));
    EXPECT_EQ(digits[14], (Span{p + 56, p + 59, 6}));
    EXPECT_EQ(d.find(2026)->spans, (std::vector<Span>{{p + 60, p + 63, 0xF}}));
    EXPECT_EQ(d.find(2025)->selector, 1u);
}

// The location area identity of a cell or location area: MCC, filler test,
// then the two-digit MNC (after a filler) or the three-digit MNC.
TEST(MobileLocationArea, MncFormsAndShortWindows) {
    const TextCase cases[] = { // texts from the MCC on
        {"81 05 32 F4 51 12 34",
         {"  MCC=234", "NAS Filler Don't Show=f", "  Filler=f", "  MNC=51", "  Location Area Code=4660"},
         0},
        {"81 05 32 14 51 12 34",
         {"  MCC=234", "NAS Filler Don't Show=1", "  MNC=511", "  Location Area Code=4660"},
         0},
        {"80 07 32 F4 51 12 34 BE EF",
         {"  MCC=234", "NAS Filler Don't Show=f", "  Filler=f", "  MNC=51", "  Location Area Code=4660",
          "  Cell Identity=beef"},
         0},
        // A window that ends inside the identity: what does not fit is absent.
        {"81 02 32 F4", {"  MCC=234", "NAS Filler Don't Show=f", "  Filler=f"}, 0},
        {"81 03 32 14 51", {"  MCC=234", "NAS Filler Don't Show=1", "  MNC=511"}, 0},
        {"81 01 32", {}, DPX_ERR_LEFTOVER},
        // An alternative that is neither a cell nor a location area.
        {"82 01 32", {}, DPX_ERR_LEFTOVER},
    };
    for (const auto &c : cases)
        EXPECT_EQ(expectTexts(tlv("BF 34", tlv("A3", c.content)), 2079, c.texts, c.flags).md.remainingBits, 0u);
    // Three-digit MNC: bits 8-5 and 4-1 of octet 3, then bits 8-5 of octet 2.
    const Decoded d = decode(initialDp(tlv("BF 34", tlv("A3", "81 05 32 14 51 12 34"))));
    const uint32_t p = d.find(2079)->spans[0].first;
    EXPECT_EQ(d.find(2079)->spans, (std::vector<Span>{{p, p + 3, 2}, {p + 4, p + 7, 3}, {p + 8, p + 11, 4}}));
    EXPECT_EQ(d.find(2080)->spans, (std::vector<Span>{{p + 12, p + 15, 1}}));
    EXPECT_EQ(d.find(2083)->spans,
              (std::vector<Span>{{p + 20, p + 23, 5}, {p + 16, p + 19, 1}, {p + 12, p + 15, 1}}));
    EXPECT_EQ(d.find(2083)->selector, 2u);
    EXPECT_EQ(d.find(2087)->spans, (std::vector<Span>{{p + 24, p + 31, 0x12}, {p + 32, p + 39, 0x34}}));
    // Both MNC forms share one display id, the three-digit form's (first in
    // the catalogue), as every MNC does.
    const Decoded two = decode(initialDp(tlv("BF 34", tlv("A3", "81 05 32 F4 51 12 34"))));
    EXPECT_EQ(displayIds(two, 2086), (std::vector<uint32_t>{2083}));
    EXPECT_EQ(displayIds(d, 2083), (std::vector<uint32_t>{2083}));
    EXPECT_EQ(d.find(2079)->label, "  MCC");
}

TEST(MobileTime, SwappedHalfOctetsAndTimeZone) {
    const TextCase cases[] = { // texts from the year on
        {"02 50 30 21 90 45 00 88",
         {"  Year=2005", "  Month=3", "  Day=12", "  Hour=9", "  Minute=54", "  Second=0",
          "  Time Zone Algebraic Sign= - ", "  Time Zone =8"},
         0},
        {"02 71 21 13 32 95 71 61",
         {"  Year=2017", "  Month=12", "  Day=31", "  Hour=23", "  Minute=59", "  Second=17",
          "  Time Zone Algebraic Sign= + ", "  Time Zone =97"},
         0},
        // One octet cannot hold the year: nothing is shown and the octet is skipped.
        {"02", {}, DPX_ERR_LEFTOVER},
        {"02 50 30", {"  Year=2005", "  Month=3"}, 0},
    };
    for (const auto &c : cases)
        expectTexts(tlv("9F 39", c.content), 2233, c.texts, c.flags);
    const Decoded d = decode(initialDp(tlv("9F 39", "02 50 30 21 90 45 00 88")));
    EXPECT_EQ(d.find(2240)->label, "Time Zone ");
    const uint32_t p = d.find(2233)->spans[0].first;
    EXPECT_EQ(d.find(2239)->spans, (std::vector<Span>{{p + 63, p + 63, 1}}));
    EXPECT_EQ(d.find(2240)->spans, (std::vector<Span>{{p + 56, p + 62, 8}}));
}

TEST(MobileLocationInformation, EveryMemberInItsOrder) {
    const std::string members = "02 02 01 2C "                                   // age 300
                                "80 08 10 12 34 56 89 AB CD 85 "                 // geographical
                                "81 04 91 21 43 F5 "                             // VLR number
                                "82 04 83 14 21 43 "                             // location number
                                "A3 07 81 05 32 F4 51 12 34 "                    // location area
                                "A4 0E A0 0A 30 08 06 02 2A 03 A1 02 04 05 A1 00 " // extensions
                                "85 03 12 34 56 "                                // selected LSA id
                                "86 03 91 21 F3 "                                // MSC number
                                "87 02 AB CD "                                   // geodetic
                                "88 00 ";                                        // current location
    const Decoded d = decode(initialDp(tlv("BF 34", members)));
    EXPECT_EQ(textsFrom(d, 2031),
              (Texts{"Location Information Tag=34bf", "  LENGTH=67 octet(s)",
                     "  Age Of Location Information=2", "  LENGTH=2 octet(s)",
                     "  Age Of Location Information=300",
                     "Geographical Information Tag=80", "  LENGTH=8 octet(s)",
                     "  Type Of Shape=Ellipsoid Point With Uncertainty Circle", "  Latitude=123456",
                     "Degrees Of Longitude=89abcd", "Uncertainty Code=5",
                     "VLR Number=81", "  LENGTH=4 octet(s)",
                     "  Numbering Plan Ind=ISDN/telephony Number Plan",
                     "  Nature Of Address=International Number", "  Extension Indicator=No Extension",
                     "  ISDN Address Digits=12345f",
                     "  Location Number=82", "  LENGTH=4 octet(s)", "  Odd/even Indicator=Odd",
                     "  Nature Of Address Indicator=National (significant) Number",
                     "  Internal Network Number Ind=Routing to Internal Numberallowed",
                     "  Numbering Plan Indicator=ISDN/telephony (rec. E.164)",
                     "  Presentation Indicator=Presentation Restricted", "  Screening Indicator=Reserved",
                     "  Address Signals=1234",
                     "Cell Id Or Sai Or LAI Tag=a3", "  LENGTH=7 octet(s)", "laiFixedLength Tag=81",
                     "  LENGTH=5 octet(s)", "  MCC=234", "NAS Filler Don't Show=f", "  Filler=f", "  MNC=51",
                     "  Location Area Code=4660",
                     "Extension Container Tag=a4", "  LENGTH=14 octet(s)", "  Private Extension List=a0",
                     "  LENGTH=10 octet(s)", "  Private Extension=30", "  LENGTH=8 octet(s)", "Ext Id Tag=6",
                     "  LENGTH=2 octet(s)", "  Extension Id=2a03", "  Ext Type=a1020405",
                     "  PCS-Extensions=a1", "  LENGTH=0 octet(s)",
                     "  Selected LSA-id=85", "  LENGTH=3 octet(s)", "  Selected LSA-Id Value=123456",
                     "SMS MSC Number Tag=86", "  LENGTH=3 octet(s)",
                     "  Numbering Plan Ind=ISDN/telephony Number Plan",
                     "  Nature Of Address=International Number", "  Extension Indicator=No Extension",
                     "  ISDN Address Digits=123f",
                     "  Geodetic Information=87", "  LENGTH=2 octet(s)", "  Geodetic Information=abcd",
                     "  Current Location Retrieved=88", "  LENGTH(null)=0 octet(s)"}));
    EXPECT_EQ(d.md.errorFlags, 0u);
    // Display names that differ from the decoded-field names.
    const auto shown = [&](uint32_t id) {
        for (size_t i = 0; i < d.fields.size(); ++i)
            if (d.fields[i].id == id)
                return d.shown[i].text;
        return std::string("?");
    };
    EXPECT_EQ(shown(2049), "Ellips Pt With Uncertain Circle");
    EXPECT_EQ(shown(2063), "Odd Number Of Addresssignals");
    EXPECT_EQ(shown(2065), "Routing to Internal Numallowed");
    EXPECT_EQ(displayIds(d, 2046), (std::vector<uint32_t>{2044}));
    EXPECT_EQ(displayIds(d, 2109), (std::vector<uint32_t>{2107}));

    // Members come in their order only: an age after the VLR number is left
    // over, as are ten octets of an ISDN address beyond its 16 digits.
    const Decoded late = decode(initialDp(tlv("BF 34", "81 02 91 21 02 01 05")));
    EXPECT_EQ(textsFrom(late, 2059).back(), "  ISDN Address Digits=12");
    EXPECT_EQ(late.find(2046), nullptr);
    EXPECT_EQ(late.md.errorFlags, DPX_ERR_LEFTOVER);
    const Decoded longVlr = decode(initialDp(tlv("BF 34", "81 0B 91 21 43 65 87 A9 21 43 65 87 A9")));
    EXPECT_EQ(textsFrom(longVlr, 2058), (Texts{"  ISDN Address Digits=123456789a123456"}));
    EXPECT_EQ(longVlr.md.errorFlags, DPX_ERR_LEFTOVER);
}

TEST(MobileSubscriberState, AlternativeChosenByItsIdentifier) {
    const TextCase cases[] = { // texts after the subscriber state's length
        {"80 00", {"  Assumed Idle=80", "  LENGTH=0 octet(s)"}, 0},
        {"81 00", {"  Camel Busy=81", "  LENGTH=0 octet(s)"}, 0},
        {"0A 01 01", {"  Net Det Not Reachable=a", "  LENGTH=1 octet(s)", "  Not Reachable Reason=IMSI Detached"}, 0},
        {"0A 01 04", {"  Net Det Not Reachable=a", "  LENGTH=1 octet(s)", "  Not Reachable Reason="}, 0},
        {"82 00", {"  Not Provided From VLR=82", "  LENGTH=0 octet(s)"}, 0},
        {"83 00", {}, DPX_ERR_LEFTOVER},
    };
    for (const auto &c : cases) {
        Texts texts{"Subscriber State Tag=33bf",
                    "  LENGTH=" + std::to_string(hexBytes(c.content).size()) + " octet(s)"};
        texts.insert(texts.end(), c.texts.begin(), c.texts.end());
        expectTexts(tlv("BF 33", c.content), 2110, texts, c.flags);
    }
}

} // namespace
} // namespace camel::test
