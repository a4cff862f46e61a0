// Dialogue portion through the real entry points: the structured dialogue
// PDUs, the application context name, the unidirectional dialogue, the
// indefinite forms and the failure rules.
#include <gtest/gtest.h>

#include "tcap/dialogue_support.h"

using namespace camel::test;
using namespace camel::test::dlg;
using Texts = std::vector<std::string>;

namespace {

TEST(DialoguePdu, ApplicationContextNames) {
    struct Case {
        const char *arcs;
        Texts tail; // texts from the cap arc on
        uint32_t flags;
    } cases[] = {
        {"04 00 00 01 15 03 04", {"  cap=cap3OE", "  ac=3", "Context=CAP gsmSSF scfGenericAC"}, 0},
        {"04 00 00 01 15 03 3d", {"  cap=cap3OE", "  ac=3", "Context=Cap3 SMS AC"}, 0},
        {"04 00 00 01 14 03 0e", {"  cap=cap3", "  ac=3", "Context=gsmSRF gsmSCF"}, 0},
        {"04 00 00 01 00 34 00", {"  cap=ac_id", "  dialoguePDU=cap gsmSRF to gsmscf", "  version=1"}, 0},
        {"04 00 00 01 00 40 07", {"  cap=ac_id", "  dialoguePDU=", "  version="}, 0},
        // Not 03 after cap3OE: flagged, nothing more read; the two arcs
        // left over are skipped at the end of the PDU.
        {"04 00 00 01 15 04 04", {"  cap=cap3OE"}, DPX_ERR_MANDATORY_MISSING | DPX_ERR_LEFTOVER},
        // The CAP v4 classes (no name of their own) read as cap3's and
        // cap3OE's; a context value without a name shows empty.
        {"04 00 00 01 16 03 0e", {"  cap=", "  ac=3", "Context=gsmSRF gsmSCF"}, 0},
        {"04 00 00 01 17 03 04", {"  cap=", "  ac=3", "Context=CAP gsmSSF scfGenericAC"}, 0},
        {"04 00 00 01 17 03 08", {"  cap=", "  ac=3", "Context="}, 0},
        {"04 00 00 01 17 04 04", {"  cap="}, DPX_ERR_MANDATORY_MISSING | DPX_ERR_LEFTOVER},
        // An unknown class ends the identifier after the cap arc.
        {"04 00 00 01 18 03 04", {"  cap="}, DPX_ERR_LEFTOVER},
    };
    for (const Case &c : cases) {
        SCOPED_TRACE(c.arcs);
        const auto d = decode(begin(structured(tlv(0x60, acn(c.arcs)))));
        EXPECT_EQ(textsFrom(d, 3797), c.tail) << textDump(d);
        EXPECT_EQ(d.md.errorFlags, c.flags);
    }
    const auto oe = decode(begin(structured(tlv(0x60, acn("04 00 00 01 15 03 04")))));
    ASSERT_NE(oe.find(3880), nullptr);
    EXPECT_EQ(oe.find(3879)->text, "  ac=3");
    EXPECT_EQ(oe.find(3877), nullptr);
    const auto srf4 = decode(begin(structured(tlv(0x60, acn("04 00 00 01 16 03 0e")))));
    EXPECT_NE(srf4.find(3878), nullptr);
    EXPECT_EQ(srf4.find(3879), nullptr);
}

TEST(DialoguePdu, ResponseResultAndDiagnostic) {
    struct Case {
        uint8_t result, alternative, value;
        const char *resultText, *tag, *valueText;
        uint32_t valueId;
    } cases[] = {
        {1, 0xA1, 2, "  Result=Reject-permanent", "Service User Tag=a1",
         "  Service User Value=Applic Cont Name Not Supp", 3866},
        {0, 0xA2, 2, "  Result=Accepted", "Service Provider Tag=a2",
         "  Service Provider Value=No Common Dialogue Portion", 3875},
        {7, 0xA1, 9, "  Result=", "Service User Tag=a1", "  Service User Value=", 3866},
    };
    for (const Case &c : cases) {
        const Bytes pdu = tlv(0x61, cat({kProtocolVersion, cap2(), tlv(0xA2, Bytes{2, 1, c.result}),
                                         tlv(0xA3, tlv(c.alternative, Bytes{2, 1, c.value}))}));
        const auto d = decode(tlv(0x64, cat({hexBytes("49 01 07"), structured(pdu)})));
        SCOPED_TRACE(textDump(d));
        EXPECT_EQ(textsFrom(d, 3766),
                  (Texts{"Result Tag=a2", "LENGTH=3 Octet(s)", "Integer Tag=2", "  Length=1 octet(s)",
                         c.resultText, "Result Source Diagnostic Tag=a3", "LENGTH=5 Octet(s)", c.tag,
                         "LENGTH=3 Octet(s)", "Integer Tag=2", "  Length=1 octet(s)", c.valueText}));
        EXPECT_EQ(d.fields.back().id, c.valueId);
        EXPECT_EQ(d.find(3763)->text, "LENGTH=27 octet(s)");
        EXPECT_EQ(d.md.errorFlags, 0u);
    }
}

// Indefinite lengths: the delimited constructs read their members through
// end-of-contents checks; the [0] wrapper and the PDUs are pre-bounded and
// need definite lengths.
TEST(DialoguePdu, IndefiniteForms) {
    const Bytes request = tlv(0x60, cat({kProtocolVersion, cap2()}));
    {
        SCOPED_TRACE("6B 80 28 80 with a definite [0]");
        const auto d = decode(begin(indef(0x6B, indef(0x28, cat({kDialogueAs, tlv(0xA0, request)})))));
        EXPECT_EQ(d.find(3738)->text, "LENGTH=Indefinite Length");
        EXPECT_EQ(d.find(3744)->text, "LENGTH=Indefinite Length");
        EXPECT_EQ(d.find(3800)->text, "  version=2");
        // The closing EOCs follow last members, so the portions leave them
        // to the message window.
        EXPECT_EQ(d.md.errorFlags, DPX_ERR_LEFTOVER);
    }
    {
        SCOPED_TRACE("indefinite [0]: only its header is in its window");
        const auto d = decode(begin(indef(0x6B, indef(0x28, cat({kDialogueAs, indef(0xA0, request)})))));
        EXPECT_EQ(d.fields.back().text, "LENGTH=0 octet(s)");
        EXPECT_EQ(d.fields.back().id, 3759u);
        EXPECT_EQ(d.find(3760), nullptr);
    }
    {
        SCOPED_TRACE("indefinite PDU inside a definite [0]");
        const auto d = decode(begin(structured(indef(0x60, cat({kProtocolVersion, cap2()})))));
        EXPECT_EQ(textsFrom(d, 3760), (Texts{"  Dialogue PDU=DialogueRequest", "LENGTH=0 octet(s)"}));
        EXPECT_EQ(d.md.errorFlags, DPX_ERR_LEFTOVER);
    }
    {
        SCOPED_TRACE("EOC before the first member: the block is empty, no flag");
        const auto d = decode(begin(cat({hexBytes("6b 80 00 00"), hexBytes("6c 00")})));
        EXPECT_EQ(textsFrom(d, 3737), (Texts{"Dialogue Portion Tag=6b", "LENGTH=Indefinite Length",
                                             "End of contents=0", "Component Portion Tag=6c",
                                             "LENGTH=Indefinite Length"}));
        EXPECT_EQ(d.md.errorFlags, 0u);
    }
    {
        SCOPED_TRACE("service user in EOC form: a check before each INTEGER field");
        const Bytes pdu = tlv(0x61, tlv(0xA3, hexBytes("a1 80 02 01 00 00")));
        const auto d = decode(begin(structured(pdu)));
        EXPECT_EQ(textsFrom(d, 3858), (Texts{"Service User Tag=a1", "LENGTH=Indefinite Length",
                                             "Integer Tag=2", "  Length=1 octet(s)",
                                             "End of contents=0"}));
        EXPECT_EQ(d.find(3866), nullptr);
        EXPECT_EQ(d.md.errorFlags, 0u);
    }
    {
        SCOPED_TRACE("unidirectional dialogue in EOC form");
        const Bytes uni = tlv(0x6B, tlv(0x28, cat({kUniDialogueAs, tlv(0xA0, indef(0x60, kProtocolVersion))})));
        const auto d = decode(tlv(0x61, cat({uni, hexBytes("6c 00")})));
        EXPECT_EQ(d.find(3729)->text, "LENGTH=Indefinite Length");
        EXPECT_EQ(d.find(3788)->text, "    Protocol Version=780");
        EXPECT_EQ(d.find(1065)->text, "End of contents=0");
        EXPECT_NE(d.find(3629), nullptr);
        EXPECT_EQ(d.md.errorFlags, 0u);
    }
}

TEST(DialoguePdu, FailureRules) {
    struct Case {
        const char *what;
        Bytes message;
        uint32_t flags;
    } cases[] = {
        {"External missing", begin(hexBytes("6b 02 05 00")),
         DPX_ERR_MANDATORY_MISSING | DPX_ERR_LEFTOVER},
        {"dialogue-as missing", begin(tlv(0x6B, tlv(0x28, tlv(0xA0, tlv(0x60, {}))))),
         DPX_ERR_MANDATORY_MISSING},
        {"[0] missing", begin(tlv(0x6B, tlv(0x28, kDialogueAs))), DPX_ERR_MANDATORY_MISSING},
        {"result INTEGER missing", begin(structured(tlv(0x61, hexBytes("a2 03 0a 01 01")))),
         DPX_ERR_MANDATORY_MISSING | DPX_ERR_LEFTOVER},
        {"ACN identifier missing", begin(structured(tlv(0x60, hexBytes("a1 00")))),
         DPX_ERR_MANDATORY_MISSING},
        {"PDU longer than [0]", begin(structured(hexBytes("60 05 80 02 07 80"))),
         DPX_ERR_LENGTH_BEYOND},
        {"unidirectional dialogue missing",
         tlv(0x61, cat({tlv(0x6B, tlv(0x28, cat({kUniDialogueAs, tlv(0xA0, hexBytes("61 00"))}))),
                        hexBytes("6c 00")})),
         DPX_ERR_MANDATORY_MISSING | DPX_ERR_LEFTOVER},
    };
    for (const Case &c : cases) {
        SCOPED_TRACE(c.what);
        const auto d = decode(c.message);
        EXPECT_EQ(d.md.errorFlags, c.flags) << textDump(d);
        EXPECT_EQ(d.status, DPX_STATUS_INVALID);
        EXPECT_EQ(d.md.remainingBits, 0u);
    }
}

// A short OBJECT IDENTIFIER: the fixed arcs take the following octets.
TEST(DialoguePdu, FixedArcsIgnoreTheLengthOctet) {
    const auto d = decode(begin(tlv(0x6B, tlv(0x28, cat({hexBytes("06 05 00 11 86 05 01"),
                                                          tlv(0xA0, tlv(0x60, {}))})))));
    EXPECT_EQ(d.find(3756)->text, "  DialoguePDU=a0");
    EXPECT_EQ(d.find(3757)->text, "  version1(1)=2");
    EXPECT_EQ(d.md.errorFlags, DPX_ERR_MANDATORY_MISSING | DPX_ERR_LEFTOVER);
}

TEST(DialoguePdu, TruncatedPortionsReadNothingPastTheMessage) {
    const Bytes full = begin(structured(tlv(0x61, cat({kProtocolVersion, cap2(),
                                                        hexBytes("a2 03 02 01 00 a3 05 a1 03 02 01 01")}))));
    for (size_t n = 8; n < full.size(); ++n) {
        SCOPED_TRACE(n);
        const auto d = decode(Bytes(full.begin(), full.begin() + n));
        EXPECT_NE(d.md.errorFlags & DPX_ERR_LENGTH_BEYOND, 0u);
        EXPECT_EQ(d.md.remainingBits, 0u);
    }
}

} // namespace
