// Component portion through the real entry points: the component list in
// its definite and indefinite forms, invoke and linked ids, the operation
// code, Reject problems, key entries, and long lists that must not grow the
// stack.  Every sample also goes through all passes with realloc failures
// (samples_test), so growth points are not repeated here.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "engine/scratch.h"
#include "support/harness.h"

using namespace camel::test;
using Texts = std::vector<std::string>;

namespace {


// A Begin with originating transaction id 01 and the given portion octets.
Bytes begin(const Bytes &portion) {
    Bytes content = hexBytes("48 01 01");
    content.insert(content.end(), portion.begin(), portion.end());
    return tlv(0x62, content);
}
Bytes beginPortion(const std::string &components) { return begin(tlv(0x6C, hexBytes(components))); }

// The texts from the portion's tag on.
Texts portionTexts(const camel::test::Decoded &d) {
    const Texts all = d.texts();
    for (size_t i = 0; i < d.fields.size(); ++i)
        if (d.fields[i].id == 3629)
            return Texts(all.begin() + long(i), all.end());
    return {};
}

int32_t componentBudget() { return camel::g_scratch<camel::Pass::Decoded>.componentBudget; }

// Invoke 1 of Activity Test (no linked id, no argument); Invoke 2 of
// Continue linked to 1; Return Result (Last) for invoke 3, id only.
const std::string kInvoke1 = "A1 06 02 01 01 02 01 37 ";
const std::string kInvoke2 = "A1 09 02 01 02 80 01 01 02 01 1F ";
const std::string kResult3 = "A2 03 02 01 03 ";

TEST(Components, DefiniteListDecodesEveryComponentInOrder) {
    const auto d = decode(beginPortion(kInvoke1 + kInvoke2 + kResult3));
    // A missing linked id or result is no error.
    EXPECT_EQ(d.md.errorFlags, 0u);
    EXPECT_EQ(d.md.remainingBits, 0u);
    EXPECT_EQ(componentBudget(), 0); // 24 octets less 8 + 11 + 5

    std::vector<uint32_t> ids;
    for (const auto &f : d.fields)
        ids.push_back(f.id);
    EXPECT_EQ(ids, (std::vector<uint32_t>{3604, 3608, 3651, 3652, 3653, 3629, 3630, 3660, 3661, 3703, 3704,
                                          3705, 3876, 3668, 1066, 3660, 3661, 3703, 3704, 3705, 3706, 3707,
                                          3708, 3876, 3668, 1066, 3669, 3670, 3703, 3704, 3705}));
    EXPECT_EQ(d.find(3629)->spans, (std::vector<Span>{{41, 48, 0x6C}})); // octet 6
    EXPECT_EQ(d.find(3630)->spans, (std::vector<Span>{{49, 56, 24}}));

    // Display: the values alone.
    const auto shownOf = [&](uint32_t id) {
        for (size_t i = 0; i < d.fields.size() && i < d.shown.size(); ++i)
            if (d.fields[i].id == id)
                return d.shown[i];
        return camel::test::Shown{0, "?"};
    };
    EXPECT_EQ(shownOf(1066).displayId, 1066u);
    EXPECT_EQ(shownOf(1066).text, "Activity Test");
    EXPECT_EQ(shownOf(3876).text, "Local Operation Code");
    EXPECT_EQ(shownOf(3705).displayId, 3705u);
    EXPECT_EQ(shownOf(3661).text, "6 Octet(s)");
}

TEST(Components, KeyEntriesOfInvokeResultAndError) {
    using Keys = std::vector<std::pair<uint32_t, Bytes>>;
    const auto keysOf = [](const std::string &portion) {
        Keys keys;
        for (const auto &k : decode(beginPortion(portion)).keyEntries)
            keys.push_back({k.index, k.value});
        return keys;
    };
    // Invoke Id (4) holds the last invoke id met.
    EXPECT_EQ(keysOf("A1 06 02 01 09 02 01 37  A2 03 02 01 0A  A3 03 02 01 0B"),
              (Keys{{0, {0x62}}, {4, {0x0B}}, {5, {0x37}}, {26, {0x01}}, {27, {0xA2}}, {28, {0xA3}}}));
    EXPECT_EQ(keysOf(kInvoke1), (Keys{{0, {0x62}}, {4, {0x01}}, {5, {0x37}}, {26, {0x01}}}));
}

// How a portion's components are found: which are decoded, what ends the
// portion, what is left over.
TEST(Components, PortionShapes) {
    const struct {
        const char *name;
        std::string portion; // after the transaction id
        Texts components;    // the component tag fields
        size_t count;        // fields from the portion's tag on
        std::string last;
        uint32_t flags;
        int budget = -1; // left of a definite portion's length; -1: not checked
    } cases[] = {
        // The indefinite form holds at most one component of each kind, in
        // order; a component out of place is left over with the portion's
        // end-of-contents.
        {"two Invokes", "6C 80" + kInvoke1 + "A1 06 02 01 02 02 01 37 00 00", {"Invoke=a1"}, 10,
         "Operation ID(Invoke)=Activity Test", DPX_ERR_LEFTOVER},
        {"Invoke after Return Result", "6C 80" + kResult3 + kInvoke1 + "00 00", {"Return Result (Last)=a2"},
         7, "  Invoke Id=3", DPX_ERR_LEFTOVER},
        {"three kinds", "6C 80" + kInvoke1 + kResult3 + "A3 03 02 01 04 00 00",
         {"Invoke=a1", "Return Result (Last)=a2", "Return Error=a3"}, 21, "End of contents=0", 0},
        // No check follows the Reject: the portion's end-of-contents is
        // left to the message.
        {"all four kinds", "6C 80" + kInvoke1 + kResult3 + "A3 03 02 01 04 A4 06 02 01 05 80 01 00 00 00",
         {"Invoke=a1", "Return Result (Last)=a2", "Return Error=a3", "Reject=a4"}, 28,
         "  Problem Code=UnrecognizedComponent", DPX_ERR_LEFTOVER},
        {"empty", "6C 80 00 00", {}, 3, "End of contents=0", 0},
        // An indefinite Invoke's end-of-contents closes the portion too.
        {"indefinite Invoke", "6C 80 A1 80 02 01 01 02 01 37 00 00 00 00", {"Invoke=a1"}, 11,
         "End of contents=0", DPX_ERR_LEFTOVER},
        // In a definite portion: an indefinite Reject closed early has no
        // problem; a full one costs the budget one octet, and its
        // end-of-contents is then read as no component and left over.
        {"indefinite Reject, no problem", "6C 07 A4 80 02 01 05 00 00", {"Reject=a4"}, 8,
         "End of contents=0", 0},
        {"indefinite Reject", "6C 0A A4 80 02 01 05 81 01 03 00 00", {"Reject=a4"}, 10,
         "  Problem Code=Resource Limitation", DPX_ERR_LEFTOVER, 9},
        // The list ends at the first component it does not know.
        {"A7 ends the list", "6C 12" + kInvoke1 + "A7 03 02 01 02" + kResult3, {"Invoke=a1"}, 10,
         "Operation ID(Invoke)=Activity Test", DPX_ERR_LEFTOVER},
        {"nothing known", "6C 05 30 03 02 01 02", {}, 2, "LENGTH=5 Octet(s)", DPX_ERR_LEFTOVER},
        // Lengths beyond their window are flagged and cut to it.
        {"component beyond the portion", "6C 05 A1 09 02 01 01 02 01 37", {"Invoke=a1"}, 7, "  Invoke Id=1",
         DPX_ERR_LENGTH_BEYOND | DPX_ERR_LEFTOVER},
        {"portion beyond the message", "6C 20" + kInvoke1, {"Invoke=a1"}, 10,
         "Operation ID(Invoke)=Activity Test", DPX_ERR_LENGTH_BEYOND},
    };
    for (const auto &c : cases) {
        SCOPED_TRACE(c.name);
        const auto d = decode(begin(hexBytes(c.portion)));
        Texts components;
        for (const auto &f : d.fields)
            if (f.id == 3660 || f.id == 3669 || f.id == 3685 || f.id == 3694)
                components.push_back(f.text);
        EXPECT_EQ(components, c.components);
        EXPECT_EQ(portionTexts(d).size(), c.count);
        ASSERT_FALSE(d.fields.empty());
        EXPECT_EQ(d.fields.back().text, c.last);
        EXPECT_EQ(d.md.errorFlags, c.flags);
        EXPECT_EQ(d.md.remainingBits, 0u);
        if (c.budget >= 0) {
            EXPECT_EQ(componentBudget(), c.budget);
        }
    }
}

// The elements of a component after its invoke id, or after its length
// when it has none; the Operation ID key (5) and the Invoke Id key (4).
TEST(Components, ComponentElements) {
    const struct {
        const char *component;
        Texts texts;
        int key5; // -1: not set
        uint32_t flags;
    } cases[] = {
        // Only the first octet of a longer id is the id; the next is read as
        // the operation code's tag.
        {"A1 07 02 02 01 00 02 01 37", {"Operation Code Tag=", "  Length=2 octet(s)", "Operation ID(Invoke)="},
         0x01, DPX_ERR_LEFTOVER},
        {"A1 03 80 01 01", {"Linked Id Tag=80", "  Length=1 octet(s)", "  Linked Id=1"}, -1,
         DPX_ERR_MANDATORY_MISSING},
        {"A1 02 02 01", {"Invoke Id Tag=2", "  Length=1 octet(s)"}, -1, 0},
        {"A1 06 02 01 01 06 01 37",
         {"Operation Code Tag=Global Operation Code", "  Length=1 octet(s)", "Operation ID(Invoke)=Activity Test"},
         0x37, 0},
        {"A1 06 02 01 01 02 01 63",
         {"Operation Code Tag=Local Operation Code", "  Length=1 octet(s)", "Operation ID(Invoke)="}, 0x63, 0},
        // A length octet bounds neither an operation code nor a problem code.
        {"A1 07 02 01 01 02 02 37 00",
         {"Operation Code Tag=Local Operation Code", "  Length=2 octet(s)", "Operation ID(Invoke)=Activity Test"},
         0x37, DPX_ERR_LEFTOVER},
        {"A1 05 02 01 01 02 01", {"Operation Code Tag=Local Operation Code", "  Length=1 octet(s)"}, -1, 0},
        {"A1 04 02 01 01 02", {"Operation Code Tag=Local Operation Code"}, -1, 0},
        {"A4 06 02 01 05 80 01 02",
         {"  Problem Code=General Problem", "  Length=1 octet(s)", "  Problem Code=Badly StructuredComponent"},
         -1, 0},
        {"A4 06 02 01 05 81 01 03",
         {"  Problem Code=Invoke", "  Length=1 octet(s)", "  Problem Code=Resource Limitation"}, -1, 0},
        {"A4 06 02 01 05 81 01 09", {"  Problem Code=Invoke", "  Length=1 octet(s)", "  Problem Code="}, -1, 0},
        {"A4 07 02 01 05 80 02 00 00",
         {"  Problem Code=General Problem", "  Length=2 octet(s)", "  Problem Code=UnrecognizedComponent"}, -1,
         DPX_ERR_LEFTOVER},
        {"A4 06 02 01 05 84 01 00", {"  Problem Code="}, -1, DPX_ERR_LEFTOVER},
        {"A4 05 02 01 05 81 01", {"  Problem Code=Invoke", "  Length=1 octet(s)"}, -1, 0},
        // A NULL invoke id fails the id's test; 05 is then the identifier.
        {"A4 07 05 00 80 01 00 00 00", {"  Problem Code="}, -1, DPX_ERR_MANDATORY_MISSING | DPX_ERR_LEFTOVER},
    };
    for (const auto &c : cases) {
        SCOPED_TRACE(c.component);
        const auto d = decode(beginPortion(c.component));
        size_t from = 0;
        for (size_t i = 0; i < d.fields.size(); ++i)
            if (d.fields[i].id == 3705 || d.fields[i].id == 3661 || d.fields[i].id == 3695)
                from = i + 1;
        Texts texts;
        for (size_t i = from; i < d.fields.size(); ++i) {
            texts.push_back(d.fields[i].text);
            if (i < d.shown.size() && d.fields[i].label == "  Problem Code") {
                EXPECT_EQ(d.shown[i].displayId, 3701u);
            }
        }
        EXPECT_EQ(texts, c.texts);
        EXPECT_EQ(d.md.errorFlags, c.flags);
        EXPECT_EQ(d.key(5) ? d.key(5)->value : Bytes{}, c.key5 < 0 ? Bytes{} : Bytes{uint8_t(c.key5)});
        EXPECT_EQ(d.key(4) != nullptr, d.find(3705) != nullptr);
    }
}

// One round per component, so the host's stack stays flat (the tests run
// under ASan with the default stack).
TEST(Components, LongListsDecodeWithoutGrowingTheStack) {
    Bytes list;
    for (int i = 0; i < 5000; ++i)
        list.insert(list.end(), {0xA1, 0x06, 0x02, 0x01, uint8_t(i), 0x02, 0x01, 0x37});
    const Bytes message = begin(tlv(0x6C, list));
    const auto d = decode(message);
    EXPECT_EQ(d.md.errorFlags, 0u);
    EXPECT_EQ(d.md.cursor, 8 * message.size() + 1);
    EXPECT_EQ(d.fields.size(), 7 + 8 * 5000u); // 8 fields for every Invoke
    EXPECT_EQ(d.fields.back().text, "Operation ID(Invoke)=Activity Test");
    EXPECT_EQ(d.find(3630)->text, "LENGTH=40000 Octet(s)");
    EXPECT_EQ(d.key(4)->value, Bytes{uint8_t(4999)});

    // 200000 Return Results in the passes that keep no per-field records.
    list.clear();
    for (uint32_t i = 0; i < 200000; ++i)
        list.insert(list.end(), {0xA2, 0x03, 0x02, 0x01, uint8_t(i)});
    const Bytes huge = begin(tlv(0x6C, list));
    const auto end = uint32_t(8 * huge.size() + 1);
    DecodeState *st = host_NewState(huge.data(), uint32_t(huge.size()));
    PreDecodeRequest rq{};
    host_InitRequest(&rq, st, 1, 1);
    EXPECT_EQ(dpx_PreDecodeMV(&rq), 1);
    EXPECT_EQ(st->errorFlags, 0u);
    EXPECT_EQ(st->bitCursor, end);
    host_FreeRequest(&rq);
    host_FreeState(st);
    const auto keys = camel::test::runKeys(huge, 64);
    EXPECT_EQ(keys.result, 1);
    EXPECT_EQ(keys.end.cursor, end);
    ASSERT_EQ(keys.entries.size(), 4u); // 0, 4, 26, 27
    EXPECT_EQ(keys.entries[1].value, Bytes{uint8_t(199999)});
}

} // namespace
