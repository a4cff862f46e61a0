// Component portion through the real entry points: the component list in
// its definite and indefinite forms, the four components, invoke and
// linked ids, the operation code, Reject problems, key entries, and a long
// list that must not grow the stack.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "engine/scratch.h"
#include "support/harness.h"

using camel::test::Bytes;
using camel::test::decode;
using camel::test::hexBytes;
using camel::test::Span;
using Texts = std::vector<std::string>;

namespace {

// BER element with a definite length (short or long form).
Bytes tlv(uint8_t tag, const Bytes &content) {
    Bytes out{tag};
    const size_t n = content.size();
    if (n < 0x80) {
        out.push_back(static_cast<uint8_t>(n));
    } else if (n < 0x100) {
        out.insert(out.end(), {0x81, static_cast<uint8_t>(n)});
    } else if (n < 0x10000) {
        out.insert(out.end(), {0x82, static_cast<uint8_t>(n >> 8), static_cast<uint8_t>(n)});
    } else {
        out.insert(out.end(), {0x83, static_cast<uint8_t>(n >> 16), static_cast<uint8_t>(n >> 8),
                               static_cast<uint8_t>(n)});
    }
    out.insert(out.end(), content.begin(), content.end());
    return out;
}

Bytes cat(std::initializer_list<Bytes> parts) {
    Bytes out;
    for (const Bytes &p : parts)
        out.insert(out.end(), p.begin(), p.end());
    return out;
}

// A Begin with originating transaction id 01 and the given portion octets.
Bytes begin(const Bytes &portion) { return tlv(0x62, cat({hexBytes("48 01 01"), portion})); }
Bytes beginPortion(const std::string &components) {
    return begin(tlv(0x6C, hexBytes(components)));
}

// The texts from the first component portion field on.
Texts portionTexts(const camel::test::Decoded &d) {
    Texts all = d.texts();
    for (size_t i = 0; i < d.fields.size(); ++i)
        if (d.fields[i].id == 3629)
            return Texts(all.begin() + static_cast<long>(i), all.end());
    return {};
}

size_t countOf(const camel::test::Decoded &d, uint32_t id) {
    size_t n = 0;
    for (const auto &f : d.fields)
        n += f.id == id ? 1 : 0;
    return n;
}

// Invoke 1 of Activity Test (no linked id, no argument); Invoke 2 of
// Continue linked to 1; Return Result (Last) for invoke 3, id only.
constexpr const char *kInvoke1 = "A1 06 02 01 01 02 01 37";
constexpr const char *kInvoke2 = "A1 09 02 01 02 80 01 01 02 01 1F";
constexpr const char *kResult3 = "A2 03 02 01 03";

TEST(Components, DefiniteListDecodesEveryComponentInOrder) {
    const auto d = decode(beginPortion(std::string(kInvoke1) + kInvoke2 + kResult3));
    EXPECT_EQ(portionTexts(d),
              (Texts{"Component Portion Tag=6c", "LENGTH=24 Octet(s)",
                     "Invoke=a1", "LENGTH=6 Octet(s)",
                     "Invoke Id Tag=2", "  Length=1 octet(s)", "  Invoke Id=1",
                     "Operation Code Tag=Local Operation Code", "  Length=1 octet(s)",
                     "Operation ID(Invoke)=Activity Test",
                     "Invoke=a1", "LENGTH=9 Octet(s)",
                     "Invoke Id Tag=2", "  Length=1 octet(s)", "  Invoke Id=2",
                     "Linked Id Tag=80", "  Length=1 octet(s)", "  Linked Id=1",
                     "Operation Code Tag=Local Operation Code", "  Length=1 octet(s)",
                     "Operation ID(Invoke)=Continue",
                     "Return Result (Last)=a2", "LENGTH=3 Octet(s)",
                     "Invoke Id Tag=2", "  Length=1 octet(s)", "  Invoke Id=3"}));
    // No linked id on the first Invoke and no result on the Return Result:
    // neither is an error.
    EXPECT_EQ(d.md.errorFlags, 0u);
    EXPECT_EQ(d.md.remainingBits, 0u);
    // 24 octets less 8 + 11 + 5.
    EXPECT_EQ(camel::g_scratch<camel::Pass::Decoded>.componentBudget, 0);

    std::vector<uint32_t> ids;
    for (const auto &f : d.fields)
        ids.push_back(f.id);
    EXPECT_EQ(ids, (std::vector<uint32_t>{3604, 3608, 3651, 3652, 3653, 3629, 3630,
                                          3660, 3661, 3703, 3704, 3705, 3876, 3668, 1066,
                                          3660, 3661, 3703, 3704, 3705, 3706, 3707, 3708,
                                          3876, 3668, 1066, 3669, 3670, 3703, 3704, 3705}));
    // Portion tag at octet 6, its length at octet 7.
    const auto *tag = d.find(3629);
    ASSERT_NE(tag, nullptr);
    EXPECT_EQ(tag->spans, (std::vector<Span>{{41, 48, 0x6C}}));
    EXPECT_EQ(d.find(3630)->spans, (std::vector<Span>{{49, 56, 24}}));

    // Display: names alone, under the shared display ids.
    ASSERT_EQ(d.shown.size(), d.fields.size());
    const auto shownOf = [&](uint32_t id) {
        for (size_t i = 0; i < d.fields.size(); ++i)
            if (d.fields[i].id == id)
                return d.shown[i];
        return camel::test::Shown{0, "?"};
    };
    EXPECT_EQ(shownOf(1066).displayId, 1066u);
    EXPECT_EQ(shownOf(1066).text, "Activity Test");
    EXPECT_EQ(shownOf(3876).text, "Local Operation Code");
    EXPECT_EQ(shownOf(3705).displayId, 3705u);
    EXPECT_EQ(shownOf(3704).displayId, 3718u); // every "  Length"
    EXPECT_EQ(shownOf(3668).displayId, 3718u);
    EXPECT_EQ(shownOf(3661).displayId, 3606u); // every "LENGTH"
    EXPECT_EQ(shownOf(3661).text, "6 Octet(s)");
}

TEST(Components, KeyEntriesOfInvokeResultAndError) {
    // Invoke 9 (Activity Test), Return Result (Last) 10, Return Error 11.
    const auto d = decode(beginPortion("A1 06 02 01 09 02 01 37  A2 03 02 01 0A  A3 03 02 01 0B"));
    EXPECT_EQ(d.md.errorFlags, 0u);
    ASSERT_NE(d.key(5), nullptr);
    EXPECT_EQ(d.key(5)->value, Bytes{55});
    ASSERT_NE(d.key(27), nullptr);
    EXPECT_EQ(d.key(27)->value, Bytes{0xA2});
    ASSERT_NE(d.key(28), nullptr);
    EXPECT_EQ(d.key(28)->value, Bytes{0xA3});
    ASSERT_NE(d.key(4), nullptr);
    EXPECT_EQ(d.key(4)->value, Bytes{11}); // the last invoke id met

    const auto invokeOnly = decode(beginPortion(kInvoke1));
    EXPECT_EQ(invokeOnly.key(4)->value, Bytes{1});
    EXPECT_EQ(invokeOnly.key(27), nullptr);
    EXPECT_EQ(invokeOnly.key(28), nullptr);
}

TEST(Components, IndefinitePortionHoldsAtMostOneComponentOfEachKind) {
    // Two Invokes: the second is not tried, so the message skips it (and the
    // portion's end-of-contents) as left-over bits.
    const auto d = decode(begin(cat({hexBytes("6C 80"), hexBytes(kInvoke1),
                                     hexBytes("A1 06 02 01 02 02 01 37 00 00")})));
    EXPECT_EQ(countOf(d, 3705), 1u);
    EXPECT_EQ(d.find(3705)->text, "  Invoke Id=1");
    EXPECT_EQ(d.find(3630)->text, "LENGTH=Indefinite Length");
    EXPECT_EQ(d.md.errorFlags, DPX_ERR_LEFTOVER);
    EXPECT_EQ(d.status, DPX_STATUS_INVALID);
    EXPECT_EQ(d.md.remainingBits, 0u);

    // One of each kind, in order.  No check follows the last member, so
    // after a Reject the portion's end-of-contents is left to the message.
    const auto all = decode(begin(cat({hexBytes("6C 80"), hexBytes(kInvoke1),
                                       hexBytes(kResult3), hexBytes("A3 03 02 01 04"),
                                       hexBytes("A4 06 02 01 05 80 01 00 00 00")})));
    EXPECT_EQ(all.md.errorFlags, DPX_ERR_LEFTOVER);
    EXPECT_EQ(countOf(all, 3705), 4u);
    EXPECT_EQ(all.fields.back().text, "  Problem Code=UnrecognizedComponent");
    // Without the Reject, the check before it closes the portion.
    const auto three = decode(begin(cat({hexBytes("6C 80"), hexBytes(kInvoke1),
                                         hexBytes(kResult3), hexBytes("A3 03 02 01 04 00 00")})));
    EXPECT_EQ(three.md.errorFlags, 0u);
    EXPECT_EQ(three.fields.back().text, "End of contents=0");
    EXPECT_EQ(three.fields.back().id, 1065u);
    EXPECT_EQ(three.fields.back().spans, (std::vector<Span>{{8 * 25 + 1, 8 * 27, 0}}));

    // Out of order: the Invoke after the Return Result is no longer tried.
    const auto late = decode(begin(cat({hexBytes("6C 80"), hexBytes(kResult3),
                                        hexBytes(kInvoke1), hexBytes("00 00")})));
    EXPECT_EQ(countOf(late, 3660), 0u);
    EXPECT_EQ(countOf(late, 3669), 1u);
    EXPECT_EQ(late.md.errorFlags, DPX_ERR_LEFTOVER);

    // An end-of-contents right away closes the portion with nothing in it.
    const auto empty = decode(begin(hexBytes("6C 80 00 00")));
    EXPECT_EQ(portionTexts(empty), (Texts{"Component Portion Tag=6c",
                                          "LENGTH=Indefinite Length", "End of contents=0"}));
    EXPECT_EQ(empty.md.errorFlags, 0u);
}

TEST(Components, IndefiniteComponents) {
    // An indefinite Invoke in an indefinite portion: its end-of-contents is
    // consumed by the portion's next check and closes the portion too; the
    // portion's own end-of-contents is left over in the message window.
    const auto d = decode(begin(hexBytes("6C 80 A1 80 02 01 01 02 01 37 00 00 00 00")));
    EXPECT_EQ(portionTexts(d),
              (Texts{"Component Portion Tag=6c", "LENGTH=Indefinite Length", "Invoke=a1",
                     "LENGTH=Indefinite Length", "Invoke Id Tag=2", "  Length=1 octet(s)",
                     "  Invoke Id=1", "Operation Code Tag=Local Operation Code",
                     "  Length=1 octet(s)", "Operation ID(Invoke)=Activity Test",
                     "End of contents=0"}));
    EXPECT_EQ(d.md.errorFlags, DPX_ERR_LEFTOVER);

    // An indefinite Reject closed early: the problem is absent, no flag, and
    // the definite portion's list ends with its window used up.
    const auto r = decode(beginPortion("A4 80 02 01 05 00 00"));
    EXPECT_EQ(portionTexts(r),
              (Texts{"Component Portion Tag=6c", "LENGTH=7 Octet(s)", "Reject=a4",
                     "LENGTH=Indefinite Length", "Invoke Id Tag=2", "  Length=1 octet(s)",
                     "  Invoke Id=5", "End of contents=0"}));
    EXPECT_EQ(r.md.errorFlags, 0u);

    // A full indefinite Reject in a definite portion: the budget only loses
    // one octet for it, the next round finds the end-of-contents octets,
    // recognises nothing and ends the list; they are skipped as left-over.
    const auto full = decode(beginPortion("A4 80 02 01 05 81 01 03 00 00"));
    EXPECT_EQ(full.fields.back().text, "  Problem Code=Resource Limitation");
    EXPECT_EQ(full.md.errorFlags, DPX_ERR_LEFTOVER);
    EXPECT_EQ(camel::g_scratch<camel::Pass::Decoded>.componentBudget, 9);
}

TEST(Components, InvokeIdElements) {
    // A two-octet invoke id: only the first value octet is the id; the
    // second is read as the operation code's tag octet (no name), then the
    // code's "length" and "code" follow, and the last octet is left over.
    const auto d = decode(beginPortion("A1 07 02 02 01 00 02 01 37"));
    EXPECT_EQ(portionTexts(d),
              (Texts{"Component Portion Tag=6c", "LENGTH=9 Octet(s)", "Invoke=a1",
                     "LENGTH=7 Octet(s)", "Invoke Id Tag=2", "  Length=2 octet(s)",
                     "  Invoke Id=1", "Operation Code Tag=", "  Length=2 octet(s)",
                     "Operation ID(Invoke)="}));
    EXPECT_EQ(d.md.errorFlags, DPX_ERR_LEFTOVER);

    // A missing invoke id is flagged; the component goes on.
    const auto noId = decode(beginPortion("A1 03 80 01 01"));
    EXPECT_EQ(noId.md.errorFlags, DPX_ERR_MANDATORY_MISSING);
    EXPECT_EQ(noId.find(3708)->text, "  Linked Id=1");

    // Truncated id: the fields that do not fit are not reported, the rest of
    // the component is absent, and nothing is read past the window.
    const auto cut = decode(beginPortion("A1 02 02 01"));
    EXPECT_EQ(portionTexts(cut).back(), "  Length=1 octet(s)");
    EXPECT_EQ(countOf(cut, 3705), 0u);
    EXPECT_EQ(countOf(cut, 3876), 0u);
    EXPECT_EQ(cut.md.errorFlags, 0u);
}

TEST(Components, OperationCodeElement) {
    // A global operation code's tag is shown and consumed like any other.
    const auto global = decode(beginPortion("A1 06 02 01 01 06 01 37"));
    EXPECT_EQ(global.find(3876)->text, "Operation Code Tag=Global Operation Code");
    EXPECT_EQ(global.find(1066)->text, "Operation ID(Invoke)=Activity Test");

    // Codes outside the table render an empty name; the key is still set.
    const auto unknown = decode(beginPortion("A1 06 02 01 01 02 01 63"));
    EXPECT_EQ(unknown.find(1066)->text, "Operation ID(Invoke)=");
    EXPECT_EQ(unknown.key(5)->value, Bytes{0x63});

    // The length octet does not bound the code: the code is one octet and
    // the rest of the Invoke is left over.
    const auto longer = decode(beginPortion("A1 07 02 01 01 02 02 37 00"));
    EXPECT_EQ(longer.find(1066)->text, "Operation ID(Invoke)=Activity Test");
    EXPECT_EQ(longer.md.errorFlags, DPX_ERR_LEFTOVER);

    // The operation element is absent when its octets are not there.
    const auto noCode = decode(beginPortion("A1 05 02 01 01 02 01"));
    EXPECT_EQ(countOf(noCode, 3668), 1u);
    EXPECT_EQ(countOf(noCode, 1066), 0u);
    EXPECT_EQ(noCode.key(5), nullptr);
    EXPECT_EQ(noCode.md.errorFlags, 0u);
    const auto noLength = decode(beginPortion("A1 04 02 01 01 02"));
    EXPECT_EQ(countOf(noLength, 3876), 1u);
    EXPECT_EQ(countOf(noLength, 3668), 0u);
}

struct RejectCase {
    const char *problem;       // identifier, length and code octets
    Texts expected;            // texts after "  Invoke Id=5"
    std::vector<uint32_t> ids; // their field ids
    uint32_t flags;
};

TEST(Components, RejectProblems) {
    const RejectCase cases[] = {
        {"80 01 02",
         {"  Problem Code=General Problem", "  Length=1 octet(s)",
          "  Problem Code=Badly StructuredComponent"},
         {3701, 3709, 3710},
         0},
        {"81 01 03",
         {"  Problem Code=Invoke", "  Length=1 octet(s)", "  Problem Code=Resource Limitation"},
         {3701, 3711, 3712},
         0},
        {"82 01 01",
         {"  Problem Code=Return Result", "  Length=1 octet(s)",
          "  Problem Code=Return Result Unexpected"},
         {3701, 3713, 3714},
         0},
        {"83 01 04",
         {"  Problem Code=Return Error", "  Length=1 octet(s)",
          "  Problem Code=MistypedParameter"},
         {3701, 3715, 3716},
         0},
        // A code without a name renders empty.
        {"81 01 09", {"  Problem Code=Invoke", "  Length=1 octet(s)", "  Problem Code="},
         {3701, 3711, 3712},
         0},
        // The length octet does not bound the code.
        {"80 02 00 00",
         {"  Problem Code=General Problem", "  Length=2 octet(s)",
          "  Problem Code=UnrecognizedComponent"},
         {3701, 3709, 3710},
         DPX_ERR_LEFTOVER},
        // An unknown identifier selects no problem.
        {"84 01 00", {"  Problem Code="}, {3701}, DPX_ERR_LEFTOVER},
        // A problem cut short by the component's window.
        {"81 01", {"  Problem Code=Invoke", "  Length=1 octet(s)"}, {3701, 3711}, 0},
    };
    for (const RejectCase &c : cases) {
        SCOPED_TRACE(c.problem);
        const Bytes problem = hexBytes(c.problem);
        const Bytes reject = tlv(0xA4, cat({hexBytes("02 01 05"), problem}));
        const auto d = decode(begin(tlv(0x6C, reject)));
        Texts tail;
        std::vector<uint32_t> ids;
        for (size_t i = 0; i < d.fields.size(); ++i) {
            if (d.fields[i].id == 3705) {
                for (size_t j = i + 1; j < d.fields.size(); ++j) {
                    tail.push_back(d.fields[j].text);
                    ids.push_back(d.fields[j].id);
                }
            }
        }
        EXPECT_EQ(tail, c.expected);
        EXPECT_EQ(ids, c.ids);
        EXPECT_EQ(d.md.errorFlags, c.flags);
        // Every "  Problem Code" is displayed under one id.
        for (size_t i = 0; i < d.fields.size(); ++i) {
            if (d.fields[i].label == "  Problem Code") {
                EXPECT_EQ(d.shown[i].displayId, 3701u);
            }
        }
    }
}

TEST(Components, RejectWithNullInvokeId) {
    // 05 00 fails the invoke id's test; 05 is then the problem identifier,
    // which selects nothing, and the rest of the window is left over.
    const auto d = decode(beginPortion("A4 07 05 00 80 01 00 00 00"));
    EXPECT_EQ(portionTexts(d), (Texts{"Component Portion Tag=6c", "LENGTH=9 Octet(s)",
                                      "Reject=a4", "LENGTH=7 Octet(s)", "  Problem Code="}));
    EXPECT_EQ(d.md.errorFlags, DPX_ERR_MANDATORY_MISSING | DPX_ERR_LEFTOVER);
    EXPECT_EQ(d.key(4), nullptr);
}

TEST(Components, ListEndsAtFirstUnrecognisedComponent) {
    // A Return Result Not Last (A7) ends the list; the Invoke after it is
    // not decoded and the rest of the portion is skipped as left-over.
    const auto d = decode(beginPortion(std::string(kInvoke1) + "A7 03 02 01 02" + kResult3));
    EXPECT_EQ(countOf(d, 3660), 1u);
    EXPECT_EQ(countOf(d, 3669), 0u);
    EXPECT_EQ(countOf(d, 3705), 1u);
    EXPECT_EQ(d.md.errorFlags, DPX_ERR_LEFTOVER);
    EXPECT_EQ(d.md.remainingBits, 0u);

    // The same with nothing recognisable first: nothing but the portion's
    // tag and length.
    const auto junk = decode(beginPortion("30 03 02 01 02"));
    EXPECT_EQ(portionTexts(junk), (Texts{"Component Portion Tag=6c", "LENGTH=5 Octet(s)"}));
    EXPECT_EQ(junk.md.errorFlags, DPX_ERR_LEFTOVER);
}

TEST(Components, LengthsBeyondTheirWindow) {
    // A component longer than the portion: flagged, decoded against the
    // portion's window, and the list ends.
    const auto d = decode(begin(hexBytes("6C 05 A1 09 02 01 01  02 01 37")));
    EXPECT_EQ(d.md.errorFlags, DPX_ERR_LENGTH_BEYOND | DPX_ERR_LEFTOVER);
    EXPECT_EQ(countOf(d, 3705), 1u);
    EXPECT_EQ(countOf(d, 3876), 0u);
    EXPECT_EQ(d.md.remainingBits, 0u);

    // A portion longer than the message.
    const auto p = decode(begin(hexBytes("6C 20 A1 06 02 01 01 02 01 37")));
    EXPECT_TRUE(p.md.errorFlags & DPX_ERR_LENGTH_BEYOND);
    EXPECT_EQ(countOf(p, 1066), 1u);

}

TEST(Components, LongListDecodesWithoutGrowingTheStack) {
    // 5000 Invokes in one definite portion with long-form lengths: one round
    // per component, so the stack stays flat (run under ASan with the
    // default stack) and every invoke id is reported.
    constexpr int kCount = 5000;
    Bytes list;
    for (int i = 0; i < kCount; ++i) {
        const Bytes invoke{0xA1, 0x06, 0x02, 0x01, static_cast<uint8_t>(i), 0x02, 0x01, 0x37};
        list.insert(list.end(), invoke.begin(), invoke.end());
    }
    const Bytes message = begin(tlv(0x6C, list));
    ASSERT_EQ(message[1], 0x82);
    const auto d = decode(message);
    EXPECT_EQ(d.md.result, 1);
    EXPECT_EQ(d.md.errorFlags, 0u);
    EXPECT_EQ(d.md.remainingBits, 0u);
    EXPECT_EQ(d.md.cursor, 8 * message.size() + 1);
    EXPECT_EQ(countOf(d, 3705), static_cast<size_t>(kCount));
    EXPECT_EQ(countOf(d, 1066), static_cast<size_t>(kCount));
    EXPECT_EQ(d.find(3630)->text, "LENGTH=40000 Octet(s)");
    EXPECT_EQ(d.key(4)->value, Bytes{static_cast<uint8_t>(kCount - 1)});
}

TEST(Components, VeryLongListInTheSilentPasses) {
    // 200000 Return Results: far more rounds than a call per component
    // could survive on a default stack.  The message-view and key-field
    // passes keep no per-field records, so the list can be this long.
    constexpr uint32_t kCount = 200000;
    Bytes list;
    list.reserve(5 * kCount);
    for (uint32_t i = 0; i < kCount; ++i)
        list.insert(list.end(), {0xA2, 0x03, 0x02, 0x01, static_cast<uint8_t>(i)});
    const Bytes message = begin(tlv(0x6C, list));
    ASSERT_EQ(message[1], 0x83);
    const uint32_t bits = static_cast<uint32_t>(8 * message.size());

    DecodeState *st = host_NewState(message.data(), static_cast<uint32_t>(message.size()));
    ASSERT_NE(st, nullptr);
    PreDecodeRequest rq{};
    host_InitRequest(&rq, st, 4, 4);
    EXPECT_EQ(dpx_PreDecodeMV(&rq), 1);
    EXPECT_EQ(st->errorFlags, 0u);
    EXPECT_EQ(st->bitCursor, bits + 1);
    EXPECT_EQ(rq.status, 0);
    host_FreeRequest(&rq);
    host_FreeState(st);

    const auto keys = camel::test::runKeys(message, 64);
    EXPECT_EQ(keys.result, 1);
    EXPECT_EQ(keys.end.cursor, bits + 1);
    ASSERT_EQ(keys.entries.size(), 4u); // 0, 4, 26, 27
    EXPECT_EQ(keys.entries[1].index, 4u);
    EXPECT_EQ(keys.entries[1].value, Bytes{static_cast<uint8_t>(kCount - 1)});
    EXPECT_EQ(keys.entries[3].index, 27u);
}

TEST(Components, ReallocFailuresInsideComponents) {
    // Every growth point the component units reach ends the pass with 0.
    const Bytes message = begin(tlv(
        0x6C, cat({hexBytes(kInvoke1), hexBytes(kInvoke2), hexBytes(kResult3),
                   hexBytes("A3 03 02 01 04 A4 80 02 01 05 81 01 03 00 00")})));
    EXPECT_GT(camel::test::checkReallocFailures(message), 8u);
}

} // namespace
