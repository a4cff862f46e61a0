// User information of the dialogue PDUs: the EXTERNAL list, its encodings
// and the opaque walker over single-ASN.1-type contents.
#include <gtest/gtest.h>

#include "tcap/dialogue_support.h"

using namespace camel::test;
using namespace camel::test::dlg;
using Texts = std::vector<std::string>;

namespace {

const Bytes kUserInfoOid = hexBytes("06 07 04 00 00 01 01 05 02");

// A Begin whose dialogue request carries `userInfo` as its last member.
Decoded decodeRequestWith(const Bytes &userInfo) {
    return decode(begin(structured(tlv(0x60, cat({kProtocolVersion, cap2(), userInfo})))));
}

TEST(DialogueUserInfo, SingleAsn1TypeThroughTheOpaqueWalker) {
    const auto d = decodeRequestWith(tlv(0xBE, tlv(0x28, cat({kUserInfoOid,
                                                              hexBytes("a0 05 30 03 02 01 05")}))));
    EXPECT_EQ(textsFrom(d, 3801),
              (Texts{"User Information Tag=be", "LENGTH=18 Octet(s)", "External Tag=28",
                     "LENGTH=16 Octet(s)", "Object Identifier Tag=6", "  Length=7 octet(s)",
                     "CCITT Identified Organisation=4", "ETSI=0", "Mobile Domain=0",
                     "GSM/UMTS_Network=1", "As_id=1", "Cap-datatypes=CAP-GPRS-Reference Number",
                     "Version3(2)=2", "Single ASN.1 Type Tag=40", "LENGTH=5 octet(s)", "=1",
                     "  ASN.1 Tag CLASS=Universal", "  ASN.1 Tag FORM=Constructed",
                     "  ASN.1 Tag Number=Sequence(OF)", "  Single-ASN.1 Length=3 octet(s)", "=0",
                     "  ASN.1 Tag CLASS=Universal", "  ASN.1 Tag FORM=Primitive",
                     "  ASN.1 Tag Number=Integer", "  Single-ASN.1 Length=1 octet(s)",
                     "  ASN Type VALUE=5"}));
    EXPECT_EQ(d.md.errorFlags, 0u);
    std::vector<uint32_t> ids;
    for (const Field &f : d.fields)
        if (f.id >= 3835 && f.id <= 3850)
            ids.push_back(f.id);
    EXPECT_EQ(ids, (std::vector<uint32_t>{3835, 3848, 3849, 3850, 3841, 3835, 3848, 3849, 3850, 3842,
                                          3844}));
    // The form bit alone: one span over bit 6 of the identifier, nothing consumed.
    const Field *form = d.find(3835);
    const Field *tagClass = d.find(3848);
    ASSERT_EQ(form->spans.size(), 1u);
    EXPECT_EQ(form->spans[0].first, form->spans[0].last);
    EXPECT_EQ(form->spans[0].first, tagClass->spans[0].first - 1);
    EXPECT_EQ(d.shown[d.shown.size() - 11].text, "1");
    EXPECT_EQ(d.shown[d.shown.size() - 11].displayId, 3835u);
}

TEST(DialogueUserInfo, OpaqueWalkerEdges) {
    struct Case {
        const char *what;
        const char *single; // the [0] element
        Texts values;       // "ASN Type VALUE" texts in order
        uint32_t flags;
    } cases[] = {
        {"two primitives", "a0 07 02 01 05 04 02 aa bb", {"  ASN Type VALUE=5", "  ASN Type VALUE=aa", "  ASN Type VALUE=bb"}, 0},
        {"primitive longer than its wrapper", "a0 04 04 05 01 02", {"  ASN Type VALUE=1", "  ASN Type VALUE=2"}, DPX_ERR_LENGTH_BEYOND},
        {"nested constructed, walked flat", "a0 08 30 06 31 04 30 02 05 00", {}, 0},
        {"last length octet missing: flagged, the walk ends", "a0 03 05 00 04", {}, DPX_ERR_LENGTH_BEYOND},
        {"empty", "a0 00", {}, 0},
    };
    for (const Case &c : cases) {
        SCOPED_TRACE(c.what);
        const auto d = decodeRequestWith(tlv(0xBE, tlv(0x28, hexBytes(c.single))));
        Texts values;
        for (const Field &f : d.fields)
            if (f.id == 3844)
                values.push_back(f.text);
        EXPECT_EQ(values, c.values) << textDump(d);
        EXPECT_EQ(d.md.errorFlags, c.flags) << textDump(d);
    }
    const auto nested = decodeRequestWith(tlv(0xBE, tlv(0x28, hexBytes("a0 08 30 06 31 04 30 02 05 00"))));
    EXPECT_EQ(countId(nested, 3841), 3u);
    EXPECT_EQ(nested.fields.back().text, "  Single-ASN.1 Length=0 octet(s)");
}

TEST(DialogueUserInfo, IndirectReferenceOctetAlignedAndArbitrary) {
    const auto d = decodeRequestWith(tlv(0xBE, tlv(0x28, hexBytes(
        "02 01 07  81 06 01 23 45 67 89 ab  a2 02 0f f0"))));
    EXPECT_EQ(textsFrom(d, 3828),
              (Texts{"Integer Tag=2", "  Length=1 octet(s)", "    Indirect Reference=07",
                     "Octet Aligned Tag=41", "LENGTH=6 octet(s)", "  Octet-Aligned Value=01234567",
                     "Arbitrary Tag=42", "LENGTH=2 octet(s)", "    Arbitrary Value=0ff0"}));
    EXPECT_EQ(d.find(3853)->spans.size(), 8u); // four octets, two half-octets each
    EXPECT_EQ(d.md.errorFlags, DPX_ERR_LEFTOVER); // octets 5 and 6 of the octet-aligned value
}

// A list of up to 100 EXTERNALs; the rest is left to the enclosing window.
TEST(DialogueUserInfo, ListStopsAfterOneHundredExternals) {
    for (size_t items : {1u, 100u, 101u}) {
        SCOPED_TRACE(items);
        Bytes list;
        for (size_t i = 0; i < items; ++i)
            list = cat({list, tlv(0x28, Bytes{2, 1, static_cast<uint8_t>(i)})});
        const auto d = decodeRequestWith(tlv(0xBE, list));
        EXPECT_EQ(countId(d, 3808), items > 100 ? 100u : items);
        EXPECT_EQ(d.md.errorFlags, items > 100 ? DPX_ERR_LEFTOVER : 0u);
        EXPECT_EQ(d.md.remainingBits, 0u);
    }
    EXPECT_EQ(decodeRequestWith(hexBytes("be 00")).md.errorFlags, 0u); // empty list
}

TEST(DialogueUserInfo, EndOfContentsForms) {
    // Items and the list in EOC form: each item's EOC closes it before its
    // next member; the list's own EOC follows the last member of the user
    // information, so it is left to the PDU's window, which skips it.
    const Bytes item1 = indef(0x28, cat({kUserInfoOid, hexBytes("a0 03 02 01 05")}));
    const Bytes item2 = indef(0x28, hexBytes("02 01 09"));
    const auto d = decodeRequestWith(indef(0xBE, cat({item1, item2})));
    EXPECT_EQ(countId(d, 3808), 2u);
    EXPECT_EQ(countId(d, 1065), 2u);
    EXPECT_EQ(d.find(3830)->text, "    Indirect Reference=09");
    EXPECT_EQ(d.md.errorFlags, DPX_ERR_LEFTOVER) << textDump(d);
    EXPECT_EQ(d.md.remainingBits, 0u);
    EXPECT_GT(checkReallocFailures(begin(structured(tlv(0x60, indef(0xBE, cat({item1, item2})))))), 20u);
}

} // namespace
