// Mobile identities, location and time: IMSI digit counts and key, the
// MCC-MNC forms, time and time zone, the order and digit limit of location
// information.  (The values of the mobile elements are compared with tshark
// by the reference comparison.)
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

// Location information members come in their order only: an age after the
// VLR number is left over, as are octets of an ISDN address beyond its 16
// digits.  (The member values are compared with tshark.)
TEST(MobileLocationInformation, MembersInOrderAndDigitLimit) {
    const Decoded late = decode(initialDp(tlv("BF 34", "81 02 91 21 02 01 05")));
    EXPECT_EQ(textsFrom(late, 2059).back(), "  ISDN Address Digits=12");
    EXPECT_EQ(late.find(2046), nullptr);
    EXPECT_EQ(late.md.errorFlags, DPX_ERR_LEFTOVER);
    const Decoded longVlr = decode(initialDp(tlv("BF 34", "81 0B 91 21 43 65 87 A9 21 43 65 87 A9")));
    EXPECT_EQ(textsFrom(longVlr, 2058), (Texts{"  ISDN Address Digits=123456789a123456"}));
    EXPECT_EQ(longVlr.md.errorFlags, DPX_ERR_LEFTOVER);
}

} // namespace
} // namespace camel::test
