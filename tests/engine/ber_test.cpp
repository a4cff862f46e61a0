// The BER pieces run through small grammars built from them, in the
// decoded-field, display and message-view passes, with the stand-in host
// recording the reports.
#include <gtest/gtest.h>

#include <cstring>
#include <string>
#include <vector>

#include "engine/ber.h"
#include "engine/members.h"
#include "support/harness.h"

namespace camel::test {
namespace {

using Texts = std::vector<std::string>;
using Spans = std::vector<Span>;

// ---- Test grammar ------------------------------------------------------------
// Units take (state, context, request) and leave the present / EOC guards to
// the piece under test.  Field ids are real catalogue entries: 3629
// "Component Portion Tag", 3630 / 3661 block-form "LENGTH", 3606 header-form
// "LENGTH", 3660 "Invoke", 3703 "Invoke Id Tag", 3704 "  Length",
// 3705 "  Invoke Id".

// A pre-bounded primitive: tag octet, length, a value of up to four octets.
template <uint32_t Tag, bool Mandatory = false>
struct Primitive {
    template <Pass P>
    static int body(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
        return preBoundedElement<P>(st, ctx, rq, "Primitive", 8, [&](ElementContext *own) {
            return octetField<P, 3703>(st, own, rq) && lengthField<P, 3704>(st, own, rq) &&
                   octetsField<P, 3705>(st, own, rq, 4);
        });
    }
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
        if (tagTest(st, Tag))
            return body<P>(st, ctx, rq);
        if constexpr (Mandatory) {
            mandatoryMissing(st);
            noteStatus<P>(st, rq);
        }
        return 1;
    }
    template <Pass P> // as an element-loop member
    static int tryMember(DecodeState *st, ElementContext *ctx, bool &matched, Request<P> *rq) {
        matched = tagTest(st, Tag);
        return matched ? body<P>(st, ctx, rq) : 1;
    }
};

// A delimited construct (definite or indefinite) with its members in order.
template <uint32_t Tag, uint32_t TagId, uint32_t LengthId, class... Members>
struct Construct {
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
        if (!tagTest(st, Tag))
            return 1;
        return delimitedConstruct<P, TagId, LengthId>(
            st, ctx, rq, "Construct", "INLINE BLOCK",
            [st, rq](ElementContext *c, uint32_t) { return Members::template run<P>(st, c, rq); }...);
    }
};
template <class... Members>
using Portion = Construct<0x6C, 3629, 3630, Members...>;
template <class... Members>
using Invoke = Construct<0xA1, 3660, 3661, Members...>;

// Member-table rows of primitives like Primitive's: tag, length, a value of
// up to four octets.
consteval Member primitiveRow(uint32_t tag) { return el(tag, "Primitive", 3703, 3704, integer(3705, 4)); }

// An argument SEQUENCE (tag 30) whose members, primitives with these tags,
// form an element loop of the member-table walker.
template <uint32_t... Tags>
struct Sequence {
    static constexpr Member rows[] = {primitiveRow(Tags)...};
    static constexpr MemberTable loop = members(Walk::Loop, rows);
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
        if (!tagTest(st, 0x30))
            return 1;
        return preBoundedElement<P>(st, ctx, rq, "Sequence", 8, [&](ElementContext *own) {
            return octetField<P, 3629>(st, own, rq) && lengthField<P, 3606>(st, own, rq) &&
                   walkTable<P>(st, own, rq, loop);
        });
    }
};
// SEQUENCE OF primitives 02, walked as a repetition.
constexpr Member kItemRow[] = {primitiveRow(0x02)};
constexpr MemberTable kItems = members(Walk::Repeat, kItemRow);

// Single fields and small shapes as units.
enum class Leaf { Octet, ClassNumber, TwoOctet, Length, HeaderLength, Digits, Items, Id, Wrapper };
template <Leaf L>
struct Unit {
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
        if constexpr (L == Leaf::Octet)
            return octetField<P, 3629>(st, ctx, rq);
        else if constexpr (L == Leaf::ClassNumber)
            return classNumberTagField<P, 3629>(st, ctx, rq);
        else if constexpr (L == Leaf::TwoOctet)
            return fittedBitsField<P>(st, ctx, rq, camel::Field<3629>::index, 0, 16, 16);
        else if constexpr (L == Leaf::Length)
            return lengthField<P, 3630>(st, ctx, rq);
        else if constexpr (L == Leaf::HeaderLength)
            return lengthField<P, 3606>(st, ctx, rq);
        else if constexpr (L == Leaf::Digits) // far more than a text line holds
            return halfOctetField<P, 3653>(st, ctx, rq, 300);
        else if constexpr (L == Leaf::Items) // SEQUENCE OF primitives 02
            return walkTable<P>(st, ctx, rq, kItems);
        else if constexpr (L == Leaf::Id) // three fixed one-octet fields, no window
            return !tagTest(st, 0x02) || octetFieldsElement<P, 3703, 3704, 3705>(st, ctx, rq, "Id");
        else // a mandatory explicit [0] around a mandatory primitive
            return wrapperElement<P, 3629, 3606>(st, ctx, rq, "Wrapper", 0, true, [&](ElementContext *own) {
                return Primitive<2, true>::run<P>(st, own, rq);
            });
    }
};

// ---- Driver ------------------------------------------------------------------

struct RunSetup {
    uint32_t enclosingBits = 0; // run inside a window of this many bits
    int32_t status = 0;         // the request's status before the pass
    bool shrink = false;        // arrays at capacity 1, so that they grow
    uint32_t failAt = 0;        // pu_Realloc call that fails
};

struct Outcome {
    int result = -1;
    uint32_t flags = 0, cursor = 0, remaining = 0, loopCounter = 0;
    uint32_t nulled = 0; // growth flags of the arrays left null
    bool failureReached = false;
    int32_t status = 0;
    ElementContext ctx{0, 1, 0, 0};
    Scratch scratch{};
};

struct UnitRun {
    Outcome md, display, view;
    std::vector<Field> fields;
    std::vector<Shown> shown;
    Texts texts() const {
        Texts out;
        for (const Field &f : fields)
            out.push_back(f.text);
        return out;
    }
    // The invoke-id values and the end-of-contents fields, in order.
    std::string values() const {
        std::string out;
        for (const Field &f : fields)
            if (f.id == 3705 || f.id == 1065)
                out += (out.empty() ? "" : " ") + (f.id == 1065 ? "EOC" : f.text.substr(12));
        return out;
    }
};

template <Pass P, class U>
Outcome runPass(const Bytes &m, const RunSetup &setup, UnitRun *run) {
    DecodeState *st = host_NewState(m.data(), static_cast<uint32_t>(m.size()));
    PreDecodeRequest rq;
    host_InitRequest(&rq, st, 4, 4);
    rq.status = setup.status;
    g_scratch<P> = Scratch{};
    host_ClearRecords();
    if (setup.enclosingBits != 0) {
        st->remainingBits = setup.enclosingBits;
        EXPECT_EQ(pushEnd(st), 1);
    }
    if (setup.shrink)
        st->posCapacity = st->endCapacity = st->field.spanCapacity = 1;
    const auto posDepth = st->posTop - st->posStack, endDepth = st->endTop - st->endStack;
    Outcome o;
    host_SetReallocFailAt(setup.failAt);
    o.result = U::template run<P>(st, &o.ctx, &rq);
    o.failureReached = setup.failAt != 0 && host_ReallocCalls() >= setup.failAt;
    host_SetReallocFailAt(0);
    if (o.result == 1) {
        EXPECT_EQ(st->posTop - st->posStack, posDepth) << "position stack unbalanced";
        EXPECT_EQ(st->endTop - st->endStack, endDepth) << "end stack unbalanced";
    }
    o.flags = st->errorFlags;
    o.cursor = st->bitCursor;
    o.remaining = st->remainingBits;
    o.loopCounter = st->occurrenceCounter;
    o.scratch = g_scratch<P>;
    o.status = rq.status;
    o.nulled = (st->posStack == nullptr || st->endStack == nullptr ? DPX_ERR_STACK_GROWTH : 0) |
               (st->field.spans == nullptr ? DPX_ERR_SPAN_GROWTH : 0);
    for (uint32_t i = 0; run != nullptr && P == Pass::Decoded && i < host_DecodedCount(); ++i) {
        const HostDecodedField *f = host_Decoded(i);
        Field field{f->fieldId, f->label, f->text, f->selector, {}};
        for (uint32_t k = 0; k < f->spanCount; ++k)
            field.spans.push_back({f->spans[k].firstBit, f->spans[k].lastBit, f->spans[k].value});
        run->fields.push_back(std::move(field));
    }
    for (uint32_t i = 0; run != nullptr && P == Pass::Display && i < host_DisplayCount(); ++i)
        run->shown.push_back({host_Display(i)->displayId, host_Display(i)->text});
    host_ClearRecords();
    host_FreeRequest(&rq);
    host_FreeState(st);
    return o;
}

// Runs a unit in the decoded-field, display and message-view passes, each on
// a fresh state, and checks that they agree and that only the message-view
// pass sets the status, from the flags, never clearing it.
template <class U>
UnitRun runUnit(const Bytes &m, const RunSetup &setup = {}) {
    UnitRun run;
    run.md = runPass<Pass::Decoded, U>(m, setup, &run);
    run.display = runPass<Pass::Display, U>(m, setup, &run);
    run.view = runPass<Pass::MessageView, U>(m, setup, &run);
    for (const Outcome *o : {&run.display, &run.view}) {
        EXPECT_EQ(o->result, run.md.result);
        EXPECT_EQ(o->flags, run.md.flags);
        EXPECT_EQ(o->cursor, run.md.cursor);
        EXPECT_EQ(o->remaining, run.md.remaining);
        EXPECT_EQ(o->ctx.present, run.md.ctx.present);
        EXPECT_EQ(o->ctx.occurrenceCount, run.md.ctx.occurrenceCount);
    }
    EXPECT_EQ(run.md.status, setup.status);
    EXPECT_EQ(run.view.status, run.md.flags != 0 ? DPX_STATUS_INVALID : setup.status);
    EXPECT_EQ(run.shown.size(), run.fields.size());
    for (size_t i = 0; i < run.fields.size() && i < run.shown.size(); ++i) {
        const std::string &text = run.fields[i].text, &value = run.shown[i].text;
        const bool cut = text.size() >= 255; // both cut at the buffer's end
        EXPECT_TRUE(cut || (text.size() >= value.size() &&
                            text.compare(text.size() - value.size(), value.size(), value) == 0))
            << "display text '" << value << "' does not end '" << text << "'";
    }
    return run;
}

template <class U>
UnitRun run(std::string_view hex, const RunSetup &setup = {}) {
    return runUnit<U>(hexBytes(hex), setup);
}

using R = UnitRun (*)(std::string_view, const RunSetup &);

DecodeState *stateOver(const Bytes &m) { return host_NewState(m.data(), static_cast<uint32_t>(m.size())); }

// ---- Tag tests -----------------------------------------------------------------

TEST(BerTagTest, ThreeFormsPeekAndLeaveTheIdentifierInTheFieldRecord) {
    enum Form { Octet, ClassNumber, TwoOctets };
    struct Case {
        const char *bytes;
        uint32_t window; // 0: the whole message
        Form form;
        uint32_t expected;
        bool matches;
    } cases[] = {
        {"6C", 0, Octet, 0x6C, true}, {"6D", 0, Octet, 0x6C, false}, {"6C", 7, Octet, 0x6C, false},
        // [0] in either form; private class; [1]; [31]
        {"80", 0, ClassNumber, 64, true}, {"A0", 0, ClassNumber, 64, true}, {"C0", 0, ClassNumber, 64, false},
        {"81", 0, ClassNumber, 64, false}, {"BF", 0, ClassNumber, 95, true},
        // first octet low; second octet outside the window
        {"BF 32", 0, TwoOctets, 0x32BF, true}, {"BF 32", 8, TwoOctets, 0x32BF, false},
        {"32 BF", 0, TwoOctets, 0x32BF, false},
    };
    for (const Case &c : cases) {
        DecodeState *st = stateOver(hexBytes(c.bytes));
        if (c.window != 0)
            st->remainingBits = c.window;
        const uint32_t remaining = st->remainingBits;
        const bool result = c.form == Octet         ? tagTest(st, c.expected)
                            : c.form == ClassNumber ? tagTestClassNumber(st, c.expected)
                                                    : tagTest16(st, c.expected);
        EXPECT_EQ(result, c.matches) << c.bytes << " form " << c.form;
        EXPECT_EQ(st->bitCursor, 1u);
        EXPECT_EQ(st->remainingBits, remaining);
        EXPECT_EQ(st->errorFlags, 0u);
        host_FreeState(st);
    }
    // What a test read stays in the field record: the octet in span 0, or the
    // class and the number in spans 0 and 1, as the tag field shows them.
    DecodeState *st = stateOver(hexBytes("00 A1"));
    st->bitCursor = 9;
    st->remainingBits = 8;
    EXPECT_FALSE(tagTestClassNumber(st, 64));
    EXPECT_EQ(st->field.value, 65u);
    const ValueSpan *s = st->field.spans;
    EXPECT_EQ((Spans{{s[0].firstBit, s[0].lastBit, s[0].value}, {s[1].firstBit, s[1].lastBit, s[1].value}}),
              (Spans{{15, 16, 2}, {9, 13, 1}}));
    EXPECT_TRUE(tagTest(st, 0xA1));
    EXPECT_EQ((Span{s[0].firstBit, s[0].lastBit, s[0].value}), (Span{9, 16, 0xA1}));
    host_FreeState(st);
}

// ---- Tag and length fields -----------------------------------------------------

TEST(BerTagField, Renderings) {
    struct Case {
        R run;
        const char *bytes, *value;
        Spans spans;
        uint32_t selector;
    } cases[] = {
        {run<Unit<Leaf::Octet>>, "6C", "6c", {{1, 8, 0x6C}}, 0},
        {run<Unit<Leaf::ClassNumber>>, "A0", "40", {{7, 8, 2}, {1, 5, 0}}, 1},
        {run<Unit<Leaf::ClassNumber>>, "BF", "5f", {{7, 8, 2}, {1, 5, 31}}, 1},
        {run<Unit<Leaf::ClassNumber>>, "04", "4", {{7, 8, 0}, {1, 5, 4}}, 1},
        {run<Unit<Leaf::TwoOctet>>, "BF 32", "32bf", {{1, 16, 0x32BF}}, 0},
    };
    for (const Case &c : cases) {
        const auto r = c.run(c.bytes, {});
        ASSERT_EQ(r.fields.size(), 1u) << c.bytes;
        EXPECT_EQ(r.fields[0].text, std::string("Component Portion Tag=") + c.value);
        EXPECT_EQ(r.shown[0].text, c.value);
        EXPECT_EQ(r.fields[0].spans, c.spans) << c.bytes;
        EXPECT_EQ(r.fields[0].selector, c.selector) << c.bytes;
        EXPECT_EQ(r.md.cursor, 1 + 8 * hexBytes(c.bytes).size()) << c.bytes;
    }
}

TEST(BerTagField, WrapperAcceptsBothFormsOfItsNumber) {
    struct Case {
        const char *bytes, *values;
        uint32_t flags, cursor;
    } cases[] = {
        {"A0 03 02 01 05", "5", 0, 41},
        {"80 03 02 01 05", "5", 0, 41},
        {"A1 03 02 01 05", "", DPX_ERR_MANDATORY_MISSING, 1},
        // Definite lengths only: with 80 the window holds the header alone.
        {"A0 80 02 01 05", "", DPX_ERR_MANDATORY_MISSING, 17},
    };
    for (const Case &c : cases) {
        const auto r = run<Unit<Leaf::Wrapper>>(c.bytes);
        EXPECT_EQ(r.values(), c.values) << c.bytes;
        EXPECT_EQ(r.md.flags, c.flags) << c.bytes;
        EXPECT_EQ(r.md.cursor, c.cursor) << c.bytes;
    }
}

TEST(BerLengthField, FormsRenderingsAndCuts) {
    struct Case {
        const char *bytes;
        bool block;        // 3630 block form, else 3606 header form
        uint32_t window;   // 0: the whole message
        const char *shown; // nullptr: does not fit, not reported
        uint32_t lastBit, value, octetCount;
    } cases[] = {
        {"05", true, 0, "5 Octet(s)", 8, 5, 1},
        {"82 01 00", true, 0, "256 Octet(s)", 24, 256, 3},
        {"81 85", false, 0, "133 octet(s)", 16, 133, 2},
        {"80", true, 0, "Indefinite Length", 8, 0, 0},
        {"00", true, 0, "Indefinite Length", 8, 0, 1}, // a definite zero shows the same
        {"80", false, 0, "0 octet(s)", 8, 0, 0},
        {"85 00 00 00 01 00", true, 0, "256 Octet(s)", 48, 256, 6}, // span wider than 32 bits
        {"85 01 00 00 00 00", true, 0, "4294967295 Octet(s)", 48, 0xFFFFFFFF, 6},
        // Octets outside the message or the window are never read.
        {"82 01", true, 0, nullptr, 0, 0, 0},
        {"81 05", true, 8, nullptr, 0, 0, 0},
    };
    for (const Case &c : cases) {
        RunSetup setup;
        setup.enclosingBits = c.window;
        const auto r = c.block ? run<Unit<Leaf::Length>>(c.bytes, setup)
                               : run<Unit<Leaf::HeaderLength>>(c.bytes, setup);
        const bool fits = c.shown != nullptr;
        ASSERT_EQ(r.fields.size(), fits ? 1u : 0u) << c.bytes;
        EXPECT_EQ(r.md.ctx.present, fits ? 1u : 0u) << c.bytes;
        EXPECT_EQ(r.md.flags, fits ? 0u : DPX_ERR_LENGTH_BEYOND) << c.bytes;
        EXPECT_EQ(r.md.cursor, c.lastBit + 1) << c.bytes;
        EXPECT_EQ(r.md.scratch.lengthValue, c.value) << c.bytes;
        EXPECT_EQ(r.md.scratch.lengthOctetCount, c.octetCount) << c.bytes;
        if (fits) {
            EXPECT_EQ(r.fields[0].text, std::string("LENGTH=") + c.shown) << c.bytes;
            EXPECT_EQ(r.shown[0].text, c.shown);
            EXPECT_EQ(r.fields[0].spans.size(), 1u) << "one span over all the length octets";
            EXPECT_EQ(r.fields[0].spans[0].last, c.lastBit) << c.bytes;
        }
    }
}

// ---- Content blocks ------------------------------------------------------------

using One = Portion<Primitive<2>>;
using Two = Portion<Primitive<2>, Primitive<2>>;
using Nested = Portion<Invoke<Primitive<2>>, Primitive<2>>;
using NestedTwo = Portion<Invoke<Primitive<2>, Primitive<2>>, Primitive<2>>;

TEST(BerContentBlock, WindowedAndEndOfContentsForms) {
    struct Case {
        const char *name;
        R run;
        const char *bytes;
        uint32_t enclosing; // 0: the whole message
        const char *values; // invoke ids and EOCs decoded
        uint32_t flags, cursor, remaining, present;
    } cases[] = {
        {"windowed", run<Two>, "6C 06 02 01 05 02 01 07", 0, "5 7", 0, 65, 0, 1},
        {"windowed leftover skipped and flagged", run<One>, "6C 05 02 01 05 AA BB 99", 0, "5",
         DPX_ERR_LEFTOVER, 57, 8, 1},
        // An EOC check before each member only: the one after the last is
        // left for whatever encloses the construct.
        {"indefinite", run<Two>, "6C 80 02 01 05 02 01 07 00 00", 0, "5 7", 0, 65, 16, 1},
        // Mandatory members count as absent after the EOC: no flag.
        {"EOC before the first member", run<Portion<Primitive<2, true>, Primitive<2, true>>>,
         "6C 80 00 00 02 01 05", 0, "EOC", 0, 33, 24, 1},
        {"no EOC, mandatory member missing", run<Portion<Primitive<2, true>>>, "6C 80 04 01 05", 0, "",
         DPX_ERR_MANDATORY_MISSING, 17, 24, 1},
        {"one zero octet is no EOC", run<One>, "6C 80 00 01", 0, "", 0, 17, 16, 1},
        {"definite zero read as indefinite", run<One>, "6C 00 00 00 02 01 05", 0, "EOC", 0, 33, 24, 1},
        // The inner block's last member is present, so it leaves its 00 00;
        // the outer block's check consumes it and closes the outer block too.
        {"EOC closes the enclosing block", run<Nested>, "6C 80 A1 80 02 01 05 00 00 02 01 07 00 00", 0,
         "5 EOC", 0, 73, 40, 1},
        // A second inner member: the inner check consumes the 00 00.
        {"EOC met by the inner block", run<NestedTwo>, "6C 80 A1 80 02 01 05 00 00 02 01 07 00 00", 0,
         "5 EOC 7", 0, 97, 16, 1},
        {"EOC left to a windowed block is leftover", run<Portion<Invoke<Primitive<2>>>>,
         "6C 07 A1 80 02 01 05 00 00", 0, "5", DPX_ERR_LEFTOVER, 73, 0, 1},
        // 5 content octets claimed where the enclosing window holds 4: the
        // members run against the enclosing window, whose rest (FF) is
        // skipped; 99 99 beyond it is never touched.
        {"window beyond the enclosing one", run<One>, "6C 05 02 01 05 FF 99 99", 48, "5",
         DPX_ERR_LENGTH_BEYOND | DPX_ERR_LEFTOVER, 49, 0, 0},
        // A member cut short clears the inner block's present flag, which
        // both indefinite blocks hand back to the caller.
        {"member clearing present", run<Nested>, "6C 80 A1 80 02 09 05 02 01 07", 0, "84017415",
         DPX_ERR_LENGTH_BEYOND, 81, 0, 0},
    };
    for (const Case &c : cases) {
        RunSetup setup;
        setup.enclosingBits = c.enclosing;
        const auto r = c.run(c.bytes, setup);
        EXPECT_EQ(r.values(), c.values) << c.name;
        EXPECT_EQ(r.md.flags, c.flags) << c.name;
        EXPECT_EQ(r.md.cursor, c.cursor) << c.name;
        EXPECT_EQ(r.md.remaining, c.remaining) << c.name;
        EXPECT_EQ(r.md.ctx.present, c.present) << c.name;
    }
    const auto r = run<One>("6C 80 00 00");
    EXPECT_EQ(r.texts().back(), "End of contents=0");
    EXPECT_EQ(r.fields.back().spans, (Spans{{17, 32, 0}}));
    EXPECT_EQ(r.shown.back().displayId, 1065u);
}

// ---- Element loop, repetition, field fit -------------------------------------------

TEST(BerElementLoop, Sweeps) {
    struct Case {
        const char *name, *bytes, *values;
        uint32_t flags, cursor;
    } cases[] = {
        {"any order", "30 09 82 01 03 80 01 01 81 01 02", "3 1 2", 0, 89},
        {"repeated member", "30 06 80 01 01 80 01 02", "1 2", 0, 65},
        {"a match restarts the miss count", "30 09 81 01 01 81 01 02 80 01 03", "1 2 3", 0, 89},
        {"no member matches", "30 03 85 01 07", "", DPX_ERR_LEFTOVER, 41},
        {"N misses after a match", "30 06 80 01 01 85 01 02", "1", DPX_ERR_LEFTOVER, 65},
        {"empty", "30 00", "", 0, 17},
        // [0] claims 9 octets in a 7-octet sequence: its value is read as far
        // as the sequence goes (four octets at most), the rest skipped.
        {"member beyond the sequence", "30 07 80 09 01 81 01 02 03", "25231618",
         DPX_ERR_LENGTH_BEYOND | DPX_ERR_LEFTOVER, 73},
    };
    for (const Case &c : cases) {
        const auto r = run<Sequence<0x80, 0x81, 0x82>>(c.bytes);
        EXPECT_EQ(r.values(), c.values) << c.name;
        EXPECT_EQ(r.md.flags, c.flags) << c.name;
        EXPECT_EQ(r.md.cursor, c.cursor) << c.name;
        EXPECT_EQ(r.md.remaining, 0u) << c.name;
        EXPECT_EQ(r.md.loopCounter, 0u) << c.name << ": the miss counter is cleared";
        if (c.flags & DPX_ERR_LENGTH_BEYOND) { // one span per value octet, selector spans - 1
            EXPECT_EQ(r.fields.back().spans, (Spans{{33, 40, 1}, {41, 48, 0x81}, {49, 56, 1}, {57, 64, 2}}));
            EXPECT_EQ(r.fields.back().selector, 3u);
        }
    }
}

TEST(BerRepeat, StopsAtAnotherTagOrAt255Items) {
    const auto r = run<Unit<Leaf::Items>>("02 01 05 02 01 06 04 01 07");
    EXPECT_EQ(r.values(), "5 6");
    EXPECT_EQ(r.md.ctx.occurrenceCount, 2u);
    EXPECT_EQ(r.md.cursor, 49u);
    Bytes m;
    for (int i = 0; i < 300; ++i)
        m.insert(m.end(), {0x02, 0x01, static_cast<uint8_t>(i)});
    const auto many = runUnit<Unit<Leaf::Items>>(m);
    EXPECT_EQ(many.md.ctx.occurrenceCount, 255u);
    EXPECT_EQ(many.md.cursor, 255u * 24 + 1);
}

TEST(BerFieldFit, FieldWithoutItsBitsIsNotReportedAndClearsPresent) {
    RunSetup window7;
    window7.enclosingBits = 7;
    const UnitRun runs[] = {run<Unit<Leaf::Id>>("02 01"), run<Unit<Leaf::TwoOctet>>("BF"),
                            run<Unit<Leaf::Octet>>("6C", window7)};
    // Without its value octet the element keeps its tag and length fields.
    EXPECT_EQ(runs[0].texts(), (Texts{"Invoke Id Tag=2", "  Length=1 octet(s)"}));
    for (const UnitRun &r : runs) {
        const bool idElement = &r == &runs[0];
        EXPECT_EQ(r.fields.size(), idElement ? 2u : 0u);
        EXPECT_EQ(r.md.cursor, idElement ? 17u : 1u);
        EXPECT_EQ(r.md.ctx.present, 0u);
        EXPECT_EQ(r.md.flags, 0u);
    }
}

// ---- Text, display ids, status ------------------------------------------------------

TEST(BerText, LongTextIsCutAt255Characters) {
    Bytes m(300);
    for (size_t i = 0; i < m.size(); ++i)
        m[i] = static_cast<uint8_t>(0x10 + i % 0xE0);
    const auto r = runUnit<Unit<Leaf::Digits>>(m);
    ASSERT_EQ(r.fields.size(), 1u);
    EXPECT_EQ(r.fields[0].text.size(), 255u);
    EXPECT_EQ(r.fields[0].text.substr(0, 39), "  Originating Transaction Id=1011121314");
    EXPECT_EQ(r.fields[0].text.substr(250), "e7f80");
    EXPECT_EQ(r.fields[0].spans.size(), 600u) << "two spans per octet, high half first";
    EXPECT_EQ(r.fields[0].spans[0], (Span{5, 8, 1}));
    EXPECT_EQ(r.shown.at(0).text.substr(250), "8d8e8");
    // The module's own buffers hold at most 255 characters and a terminator.
    EXPECT_EQ(std::strlen(g_text<Pass::Decoded>.text), 255u);
    EXPECT_EQ(std::strlen(g_text<Pass::Display>.text), 255u);
}

// Display ids are shared by fields whose labels read alike without leading
// blanks, under the first such field.
static_assert(camel::Field<3630>::displayId == 3606 && camel::Field<3661>::displayId == 3606);
static_assert(camel::Field<3704>::displayId == 3718 && camel::Field<3716>::displayId == 3701);
static_assert(camel::Field<3604>::displayId == 3604 && camel::Field<3651>::displayId == 3651);

TEST(BerMessageView, StatusSetByTheHostIsNeverCleared) {
    // runUnit checks the status of every run against the flags.
    RunSetup setup;
    setup.status = DPX_STATUS_INVALID;
    EXPECT_EQ(run<One>("6C 03 02 01 05", setup).view.status, DPX_STATUS_INVALID);
}

// ---- Growth failures ------------------------------------------------------------------

TEST(BerGrowth, EveryPieceHandsAFailedGrowthStraightUp) {
    // Arrays at capacity 1, so that the nested constructs grow the stacks and
    // the spans; every pu_Realloc call in turn fails.
    using Outer = Portion<Invoke<Primitive<2>, Sequence<0x80>>, Primitive<2>>;
    const Bytes m = hexBytes("6C 80 A1 80 02 01 05 30 03 80 01 09 00 00 02 01 07");
    uint32_t points = 0;
    for (uint32_t n = 1; n < 100; ++n) {
        const RunSetup setup{0, 0, true, n};
        const Outcome md = runPass<Pass::Decoded, Outer>(m, setup, nullptr);
        const Outcome view = runPass<Pass::MessageView, Outer>(m, setup, nullptr);
        EXPECT_EQ(md.failureReached, view.failureReached) << n;
        if (!md.failureReached) {
            EXPECT_EQ(md.result, 1);
            EXPECT_EQ(md.flags, 0u);
            break;
        }
        ++points;
        for (const Outcome *o : {&md, &view}) {
            EXPECT_EQ(o->result, 0) << "failing at realloc " << n;
            EXPECT_NE(o->nulled, 0u) << n;
            EXPECT_EQ(o->flags & 0x70000000u, o->nulled) << n;
        }
    }
    EXPECT_GE(points, 3u) << "the stacks and the spans all had to grow";
}

} // namespace
} // namespace camel::test
