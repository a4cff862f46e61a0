// The Gprsms Class element: the MS network capability bits and the MS radio
// access capability records, walked through the element's row in all four
// passes.  The record values below were checked against tshark's reading
// of the same bodies (as the radio access capability of a GPRS attach).
#include <gtest/gtest.h>

#include <map>
#include <set>
#include <string>
#include <vector>

#include "cap/ms_capability.h"
#include "support/harness.h"

namespace camel::test {
namespace {

using Texts = std::vector<std::string>;

constexpr Member kRow[] = {gprsmsClass(0xA5)};
constexpr MemberTable kElement = members(Walk::InOrder, kRow);

std::string octet(size_t n) {
    static const char kDigits[] = "0123456789abcdef";
    return std::string{kDigits[n >> 4 & 15], kDigits[n & 15]};
}
// The element with network capability `net` and, when not empty, the radio
// access capability body `body` (hex).
Bytes element(const std::string &net, const std::string &body = "") {
    std::string inner = "80" + octet(hexBytes(net).size()) + net;
    if (!body.empty())
        inner += "81" + octet(hexBytes(body).size()) + body;
    return hexBytes("a5" + octet(hexBytes(inner).size()) + inner);
}

Texts operator+(Texts a, const Texts &b) {
    a.insert(a.end(), b.begin(), b.end());
    return a;
}
// The texts of the seven A5 bits, given as "1100000" for A5/1 to A5/7.
Texts a5(const std::string &bits) {
    Texts out;
    for (size_t n = 0; n < bits.size(); ++n) {
        const std::string name = "A5/" + std::to_string(n + 1);
        out.push_back(name + "=Encryption Algorithm " + name + (bits[n] == '1' ? " Available" : " Not Available"));
    }
    return out;
}
const std::string kEs = "ES IND=Controlled Early Classmark Sending Option Is ";

TEST(MsNetworkCapability, BitsFromTheLeastSignificantBitUpEachConsumed) {
    // E5 = 1110 0101, 60 = 0110 0000.
    const Decoded d = walk(element("e5 60"), kElement);
    EXPECT_EQ(textsFrom(d, 2533),
              (Texts{"  MS Network Capability=80", "  LENGTH=2 octet(s)",
                     "  GPRS Encryption Algorithm(gea/1)=Available", "  Sm Capa Via Dedicated Chann=Not Supported",
                     "  Sm Capa Via GPRS Channels=Supported", "  Ucs2 Support=Prefer Defau Alphabet Over Ucs2",
                     "  Ss Screening Indicator=Cap Han Elli Nota&phas 2 Err(2)", "  Solsa Capability=Support",
                     "  Revision LEVEL Indicator=Used By MS Sup This Verpro", "  Pfc Ffeature Mode=Not Supported",
                     "  GEA/2=Not Available", "  GEA/3=Not Available", "  GEA/4=Not Available", "  GEA/5=Not Available",
                     "  GEA/6=Available", "  GEA/7=Available", "  Spare Bits=0"}));
    EXPECT_EQ(d.md.errorFlags, 0u);
    EXPECT_EQ(d.md.cursor, 1 + 6 * 8u);
    // The screening indicator is bits 6-5 of the first value octet (octet 5
    // of the element); the revision level is shown under its display name.
    EXPECT_EQ(d.find(2539)->spans, (std::vector<Span>{{37, 38, 2}}));
    EXPECT_EQ(d.find(2549)->spans, (std::vector<Span>{{48, 48, 0}}));
    EXPECT_EQ(shownOf(d, 2541), "Used By MS Sup Thisver Pro");
    // One octet: the second octet's fields are absent; three: the third is
    // left over.
    EXPECT_EQ(textsFrom(walk(element("e5"), kElement), 2542), Texts{});
    const Decoded longer = walk(element("e5 60 01"), kElement);
    EXPECT_EQ(longer.md.errorFlags, uint32_t{DPX_ERR_LEFTOVER});
    EXPECT_EQ(longer.md.cursor, 1 + 7 * 8u);
}

// The bodies: GSM E with the A5 bits, GPRS and switch-measure classes,
// followed by GSM 1800 with neither; GSM P with the HSCSD class only and
// three later-release bits; GSM 1800 followed by a list of additional
// access technologies.
struct BodyCase {
    const char *body;
    Texts texts; // from the first body field on
};

const BodyCase kBodies[] = {
    {"14 33 82 2a 97 19 89 28 00",
     Texts{"Access Capabilities=1", "Access Technology Type=GSM E", "Length=33", "RF Power Capability=4",
      "Selector=1"} + a5("1100000") + Texts{kEs + "Implemented",
      "PS=PS Capability Not Present", "VGCS=No VGCS Capability Or No Notifications Wanted",
      "VBS=No VBS Capability Or No Notifications Wanted", "Selector=1", "Selector=0", "Selector=1",
      "GPRS Multi Slot Class=10", "GPRS Extended Dynamic Allocation Capability=Not Implemented",
      "Selector=1", "SMS_VALUE=8/4 Timeslot(~1154 Microseconds)", "SM_VALUE=2/4 Timeslot(~288 Microseconds)",
      "Selector=1",
      "Access Technology Type=GSM 1800", "Length=9", "RF Power Capability=1", "Selector=0",
      kEs + "Implemented", "PS=PS Capability Not Present", "VGCS=No VGCS Capability Or No Notifications Wanted",
      "VBS=No VBS Capability Or No Notifications Wanted", "Selector=0", "Selector=0", "Spare=0"}},
    {"02 88 db 0a",
     {"Access Capabilities=0", "Access Technology Type=GSM P", "Length=20", "RF Power Capability=2",
      "Selector=0", kEs + "Not Implemented", "PS=PS Capability Present",
      "VGCS=VGCS Capability And Notifications Wanted", "VBS=No VBS Capability Or No Notifications Wanted",
      "Selector=1", "Selector=1", "HSCSD Multi Slot Class=12", "Selector=0", "Selector=0", "Spare=5",
      "Selector=0"}},
    {"33 27 46 6f 6f 8b a5 80",
     Texts{"Access Capabilities=3", "Access Technology Type=GSM 1800", "Length=25", "RF Power Capability=1",
      "Selector=1"} + a5("1010001") + Texts{kEs + "Implemented",
      "PS=PS Capability Not Present", "VGCS=No VGCS Capability Or No Notifications Wanted",
      "VBS=VBS Capability And Notifications Wanted", "Selector=1", "Selector=0", "Selector=1",
      "GPRS Multi Slot Class=29", "GPRS Extended Dynamic Allocation Capability=Implemented", "Selector=0",
      "Selector=1",
      // 1 0100 101 10 0: one additional technology, shown as the record's spare bits
      "Access Technology Type=Reserved", "Length=11", "Spare=1324", "Selector=0", "Spare=0"}},
};

TEST(MsRadioAccessCapability, RecordsOfSeveralTechnologies) {
    for (const BodyCase &c : kBodies) {
        SCOPED_TRACE(c.body);
        const Decoded d = walk(element("e5 60", c.body), kElement);
        EXPECT_EQ(textsFrom(d, 3920), c.texts);
        EXPECT_EQ(d.md.errorFlags, 0u);
        EXPECT_EQ(d.md.cursor, 1 + 8 * (8 + hexBytes(c.body).size()));
        // Every record field is shown under its family's display id.
        const std::map<std::string, uint32_t> familyIds = {
            {"Access Technology Type", 3919}, {"Selector", 3927}, {"Length", 3718}, {"Spare", 1821},
            {"SMS_VALUE", 3944}, {"A5/7", 3978}, {"ES IND", 3929}};
        for (size_t i = 0; i < d.fields.size() && i < d.shown.size(); ++i) {
            const auto family = familyIds.find(d.fields[i].label);
            if (family != familyIds.end()) {
                EXPECT_EQ(d.shown[i].displayId, family->second) << d.fields[i].text;
            }
        }
    }
}

TEST(MsRadioAccessCapability, EveryGrowthFailureEndsThePassWithZero) {
    // Fields of several spans grow the span array past its first slot.
    EXPECT_GT(checkReallocFailures(element("e5 60", kBodies[0].body), kElement), 8u);
}

TEST(MsRadioAccessCapability, FieldsThatStraddleOctetsAreOneFieldOfTwoSpans) {
    // Body octets from position 65 on (the element's tag and length, the
    // network capability and the radio access tag and length take 8 octets).
    const Decoded d = walk(element("e5 60", kBodies[0].body), kElement);
    const Field *length = d.find(3921);                       // octet 1 bits 4-1, octet 2 bits 8-6
    ASSERT_NE(length, nullptr);
    EXPECT_EQ(length->spans, (std::vector<Span>{{65, 68, 4}, {78, 80, 1}}));
    EXPECT_EQ(length->selector, 1u);
    const Field *header = d.find(3920);                       // shows the technology, consumes nothing
    EXPECT_EQ(header->spans, (std::vector<Span>{{69, 72, 1}}));
    EXPECT_EQ(d.find(3919)->spans, header->spans);
    const Field *gprs = d.find(3947);                         // octet 4 bits 3-1, octet 5 bits 8-7
    EXPECT_EQ(gprs->spans, (std::vector<Span>{{89, 91, 2}, {103, 104, 2}}));
}

// The field ids of the first record's content and spare bits.
const std::set<uint32_t> kFirstContent = {3926, 3927, 3972, 3973, 3974, 3975, 3976, 3977, 3978, 3929, 3930,
                                          3931, 3932, 3922, 3923, 3955, 3924, 3947, 3948, 3925, 3944, 3945,
                                          3928};

TEST(MsRadioAccessCapability, BodyCutShortAtEveryBitEndsInsideItsWindow) {
    // The element cut by the enclosing window at every bit, and the first
    // record's length cut at every bit of its content (33 bits).
    const Bytes full = element("e5 60", kBodies[0].body);
    const uint32_t bits = static_cast<uint32_t>(8 * full.size());
    for (uint32_t window = 1; window <= bits; ++window) {
        SCOPED_TRACE(window);
        const Decoded d = walk(full, kElement, window);
        for (const Field &f : d.fields)
            for (const Span &s : f.spans)
                EXPECT_LE(s.last, window) << f.text;
        // Below 8 bits the element's identifier is not there: it is absent.
        EXPECT_EQ(d.md.errorFlags != 0, window >= 8 && window < bits);
        EXPECT_LE(d.md.cursor, window + 1);
    }
    for (uint32_t length = 0; length <= 33; ++length) {
        SCOPED_TRACE(length);
        Bytes cut = full;
        // The length: bits 4-1 of body octet 1, bits 8-6 of body octet 2.
        cut[8] = static_cast<uint8_t>((cut[8] & 0xF0) | length >> 3);
        cut[9] = static_cast<uint8_t>((cut[9] & 0x1F) | (length & 7) << 5);
        const Decoded d = walk(cut, kElement);
        // No field of the first record's content reads past its length: a
        // span's last stream bit, counted from the body's first bit (65).
        for (const Field &f : d.fields) {
            if (kFirstContent.count(f.id) == 0)
                continue;
            for (const Span &s : f.spans)
                EXPECT_LT((s.first - 65) / 8 * 8 + 7 - (s.first - 65) % 8, 11 + length) << f.text;
        }
        EXPECT_EQ(d.md.errorFlags != 0, length < 33) << textDump(d);
    }
}

} // namespace
} // namespace camel::test
