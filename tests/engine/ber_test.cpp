// The BER pieces (tag tests, tag and length fields, content blocks, the
// end-of-contents check, element loops, choices, repetitions, field fit)
// run through small grammars built from them, in the decoded-field, display
// and message-view passes, with the stand-in host recording the reports.
#include <gtest/gtest.h>

#include <cstring>
#include <string>
#include <vector>

#include "engine/ber.h"
#include "support/harness.h"

namespace camel::test {
namespace {

using Texts = std::vector<std::string>;
using Spans = std::vector<Span>;

// ---- Test grammar ------------------------------------------------------------
// Every unit takes (state, context, in-EOC-block flag, request) so that the
// driver and the blocks can call any of them.  Field ids are real catalogue
// entries: 3629 "Component Portion Tag", 3630 / 3661 block-form "LENGTH",
// 3606 header-form "LENGTH", 3660 "Invoke", 3703 "Invoke Id Tag",
// 3704 "  Length", 3705 "  Invoke Id".

// A pre-bounded primitive element: tag octet, general length, a value of
// up to four octets, all inside the element's window.
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
    static int run(DecodeState *st, ElementContext *ctx, uint32_t inEoc, Request<P> *rq) {
        if (ctx->present == 0 || (inEoc != 0 && ctx->eocSeen != 0))
            return 1;
        if (!tagTest(st, Tag)) {
            if constexpr (Mandatory) {
                mandatoryMissing(st);
                noteStatus<P>(st, rq);
            }
            return 1;
        }
        return body<P>(st, ctx, rq);
    }
    // As a member of an element loop.
    template <Pass P>
    static int tryMember(DecodeState *st, ElementContext *ctx, bool &matched, Request<P> *rq) {
        matched = tagTest(st, Tag);
        return matched ? body<P>(st, ctx, rq) : 1;
    }
};

// A loop member that matches its tag but decodes nothing: the loop must
// still end.
int g_peekOnlyCalls = 0;
template <uint32_t Tag>
struct PeekOnly {
    template <Pass P>
    static int tryMember(DecodeState *st, ElementContext *, bool &matched, Request<P> *) {
        ++g_peekOnlyCalls;
        matched = tagTest(st, Tag);
        return 1;
    }
};

// An invoke-id-like element: three fixed one-octet fields, no window.
struct IdElement {
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, uint32_t, Request<P> *rq) {
        if (ctx->present == 0 || !tagTest(st, 0x02))
            return 1;
        return octetFieldsElement<P, 3703, 3704, 3705>(st, ctx, rq, "Invoke Id");
    }
};

// An explicit [0] wrapper (mandatory) around one mandatory primitive; the
// tag and length fields reuse 3629 and 3606.
struct Wrapper {
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, uint32_t, Request<P> *rq) {
        return wrapperElement<P, 3629, 3606>(st, ctx, rq, "Wrapper", 0, true,
                                             [&](ElementContext *own) {
                                                 return Primitive<2, true>::run<P>(st, own, 0, rq);
                                             });
    }
};

template <Pass P, class M>
auto blockMember(DecodeState *st, Request<P> *rq) {
    return [st, rq](ElementContext *c, uint32_t inEoc) { return M::template run<P>(st, c, inEoc, rq); };
}

template <Pass P, class M>
auto loopMember(DecodeState *st, Request<P> *rq) {
    return [st, rq](ElementContext *c, bool &matched) {
        return M::template tryMember<P>(st, c, matched, rq);
    };
}

// A delimited construct (definite or indefinite) with its members in order.
template <uint32_t Tag, uint32_t TagId, uint32_t LengthId, class... Members>
struct Construct {
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, uint32_t inEoc, Request<P> *rq) {
        if (ctx->present == 0 || (inEoc != 0 && ctx->eocSeen != 0) || !tagTest(st, Tag))
            return 1;
        return delimitedConstruct<P, TagId, LengthId>(st, ctx, rq, "Construct", "INLINE BLOCK",
                                                      blockMember<P, Members>(st, rq)...);
    }
};
template <class... Members>
using Portion = Construct<0x6C, 3629, 3630, Members...>;
template <class... Members>
using Invoke = Construct<0xA1, 3660, 3661, Members...>;

// An argument SEQUENCE (tag 30) whose members form an element loop.
template <class... Members>
struct Sequence {
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, uint32_t, Request<P> *rq) {
        if (ctx->present == 0 || !tagTest(st, 0x30))
            return 1;
        if (!elementStart(st, "Sequence"))
            return 0;
        bool overflow = false;
        if (!openElementWindow(st, 8, &overflow))
            return 0;
        if (overflow)
            ctx->present = 0;
        ElementContext own{0, 1, 0, 0};
        if (!octetField<P, 3629>(st, &own, rq) || !lengthField<P, 3606>(st, &own, rq))
            return 0;
        if (!elementLoop<P>(st, &own, rq, loopMember<P, Members>(st, rq)...))
            return 0;
        closeElementWindow<P>(st, rq);
        return 1;
    }
};

// A problem: "Choice"-style identifier octet, then the alternative it names.
struct Problem {
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, uint32_t, Request<P> *rq) {
        if (!choiceField<P, 3701>(st, ctx, rq))
            return 0;
        if (ctx->present == 0)
            return 1;
        switch (g_scratch<P>.choiceTag) {
        case 0x80:
            return octetField<P, 3709>(st, ctx, rq) && octetField<P, 3710>(st, ctx, rq);
        case 0x81:
            return octetField<P, 3711>(st, ctx, rq) && octetField<P, 3712>(st, ctx, rq);
        default:
            return 1;
        }
    }
};

// SEQUENCE OF primitives with tag 02.
struct Items {
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, uint32_t, Request<P> *rq) {
        return repeatItems<P>(st, ctx, rq, 0x02,
                              [&](ElementContext *c) { return Primitive<0x02>::body<P>(st, c, rq); });
    }
};

struct OctetTag {
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, uint32_t, Request<P> *rq) {
        return octetField<P, 3629>(st, ctx, rq);
    }
};
struct ClassNumberTag {
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, uint32_t, Request<P> *rq) {
        return classNumberTagField<P, 3629>(st, ctx, rq);
    }
};
struct TwoOctetTag {
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, uint32_t, Request<P> *rq) {
        return twoOctetTagField<P, 3629>(st, ctx, rq);
    }
};
template <uint32_t Id>
struct Length {
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, uint32_t, Request<P> *rq) {
        return lengthField<P, Id>(st, ctx, rq);
    }
};
// Up to 300 octets as hexadecimal digits: far more than a text line holds.
struct LongDigits {
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, uint32_t, Request<P> *rq) {
        return halfOctetField<P, 3653>(st, ctx, rq, 300);
    }
};

// ---- Driver ------------------------------------------------------------------

struct RunSetup {
    uint32_t enclosingBits = 0;    // run inside a window of this many bits
    ElementContext ctx{0, 1, 0, 0}; // the caller's context
    int32_t status = 0;            // the request's status before the pass
    bool shrink = false;           // arrays at capacity 1, so that they grow
    uint32_t failAt = 0;           // pu_Realloc call that fails
};

struct Outcome {
    int result = -1;
    uint32_t flags = 0, cursor = 0, remaining = 0, occurrenceCounter = 0;
    ElementContext ctx{};
    Scratch scratch{};
    int32_t status = 0;
    bool failureReached = false;
    uint32_t nulled = 0; // growth flags of the arrays left null
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
};

template <Pass P, class U>
Outcome runPass(const Bytes &m, const RunSetup &setup, UnitRun *run) {
    DecodeState *st = host_NewState(m.data(), static_cast<uint32_t>(m.size()));
    PreDecodeRequest rq;
    host_InitRequest(&rq, st, 4, 4);
    rq.layerCode = 0x5A;
    rq.status = setup.status;
    g_scratch<P> = Scratch{};
    host_ClearRecords();
    if (setup.enclosingBits != 0) {
        st->remainingBits = setup.enclosingBits;
        EXPECT_EQ(pushEnd(st), 1);
    }
    if (setup.shrink) {
        st->posCapacity = 1;
        st->endCapacity = 1;
        st->field.spanCapacity = 1;
    }
    const auto posDepth = st->posTop - st->posStack;
    const auto endDepth = st->endTop - st->endStack;

    Outcome o;
    o.ctx = setup.ctx;
    host_SetReallocFailAt(setup.failAt);
    o.result = U::template run<P>(st, &o.ctx, 0u, &rq);
    o.failureReached = setup.failAt != 0 && host_ReallocCalls() >= setup.failAt;
    host_SetReallocFailAt(0);
    if (o.result == 1) {
        EXPECT_EQ(st->posTop - st->posStack, posDepth) << "position stack unbalanced";
        EXPECT_EQ(st->endTop - st->endStack, endDepth) << "end stack unbalanced";
        if (setup.enclosingBits != 0)
            popEnd(st);
    }
    o.flags = st->errorFlags;
    o.cursor = st->bitCursor;
    o.remaining = st->remainingBits;
    o.occurrenceCounter = st->occurrenceCounter;
    o.scratch = g_scratch<P>;
    o.status = rq.status;
    if (st->posStack == nullptr || st->endStack == nullptr)
        o.nulled |= DPX_ERR_STACK_GROWTH;
    if (st->field.spans == nullptr)
        o.nulled |= DPX_ERR_SPAN_GROWTH;

    if (run != nullptr) {
        if constexpr (P == Pass::Decoded) {
            for (uint32_t i = 0; i < host_DecodedCount(); ++i) {
                const HostDecodedField *f = host_Decoded(i);
                Field field{f->fieldId, f->label, f->text, f->selector, {}};
                for (uint32_t k = 0; k < f->spanCount; ++k)
                    field.spans.push_back({f->spans[k].firstBit, f->spans[k].lastBit, f->spans[k].value});
                run->fields.push_back(std::move(field));
            }
        } else if constexpr (P == Pass::Display) {
            for (uint32_t i = 0; i < host_DisplayCount(); ++i)
                run->shown.push_back({host_Display(i)->displayId, host_Display(i)->text});
        }
    }
    host_ClearRecords();
    host_FreeRequest(&rq);
    host_FreeState(st);
    return o;
}

// Runs a unit in the decoded-field, display and message-view passes, each on
// a fresh state, and checks that they agree.
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
        EXPECT_EQ(o->ctx.eocSeen, run.md.ctx.eocSeen);
        EXPECT_EQ(o->ctx.occurrenceCount, run.md.ctx.occurrenceCount);
    }
    EXPECT_EQ(run.md.status, setup.status) << "only the message-view pass sets the status";
    EXPECT_EQ(run.view.status, run.md.flags != 0 ? DPX_STATUS_INVALID : setup.status);
    EXPECT_EQ(run.shown.size(), run.fields.size());
    for (size_t i = 0; i < run.fields.size() && i < run.shown.size(); ++i) {
        const std::string &text = run.fields[i].text;
        const std::string &value = run.shown[i].text;
        if (text.size() >= 255)
            continue; // both cut at the buffer's end
        EXPECT_TRUE(text.size() >= value.size() &&
                    text.compare(text.size() - value.size(), value.size(), value) == 0)
            << "display text '" << value << "' does not end '" << text << "'";
    }
    return run;
}

template <class U>
UnitRun runUnit(std::string_view hex, const RunSetup &setup = {}) {
    return runUnit<U>(hexBytes(hex), setup);
}

// ---- Tag tests -----------------------------------------------------------------

TEST(BerTagTest, ThreeForms) {
    enum Form { Octet, ClassNumber, TwoOctets };
    struct Case {
        const char *bytes;
        uint32_t window; // 0: the whole message
        Form form;
        uint32_t expected;
        bool matches;
    } cases[] = {
        {"6C", 0, Octet, 0x6C, true},
        {"6D", 0, Octet, 0x6C, false},
        {"6C", 7, Octet, 0x6C, false},          // not 8 bits left
        {"80", 0, ClassNumber, 64, true},        // [0] primitive
        {"A0", 0, ClassNumber, 64, true},        // [0] constructed
        {"C0", 0, ClassNumber, 64, false},       // private class
        {"81", 0, ClassNumber, 64, false},
        {"40", 0, ClassNumber, 64, false},       // application class
        {"BF", 0, ClassNumber, 95, true},        // [31]: class 2, number 31
        {"BF 32", 0, TwoOctets, 0x32BF, true},
        {"BF 32", 8, TwoOctets, 0x32BF, false},  // only the BF octet in the window
        {"BF", 0, TwoOctets, 0x32BF, false},     // only the BF octet in the message
        {"32 BF", 0, TwoOctets, 0x32BF, false},
    };
    for (const Case &c : cases) {
        const Bytes m = hexBytes(c.bytes);
        DecodeState *st = host_NewState(m.data(), static_cast<uint32_t>(m.size()));
        if (c.window != 0)
            st->remainingBits = c.window;
        const uint32_t remaining = st->remainingBits;
        bool result = false;
        switch (c.form) {
        case Octet: result = tagTest(st, c.expected); break;
        case ClassNumber: result = tagTestClassNumber(st, c.expected); break;
        case TwoOctets: result = tagTest16(st, c.expected); break;
        }
        EXPECT_EQ(result, c.matches) << c.bytes << " form " << c.form;
        EXPECT_EQ(st->bitCursor, 1u) << "a tag test consumes nothing";
        EXPECT_EQ(st->remainingBits, remaining);
        EXPECT_EQ(st->errorFlags, 0u);
        host_FreeState(st);
    }
}

// A test leaves what it read in the field record: the octet in span 0, or
// the class and the number in spans 0 and 1, as the tag field shows them.
TEST(BerTagTest, LeavesTheIdentifierInTheFieldRecord) {
    const Bytes m = hexBytes("00 A1");
    DecodeState *st = host_NewState(m.data(), static_cast<uint32_t>(m.size()));
    st->bitCursor = 9;
    st->remainingBits = 8;
    EXPECT_FALSE(tagTestClassNumber(st, 64));
    EXPECT_EQ(st->field.value, 65u);
    EXPECT_EQ(st->field.spans[0].value, 2u);
    EXPECT_EQ(st->field.spans[0].firstBit, 15u);
    EXPECT_EQ(st->field.spans[0].lastBit, 16u);
    EXPECT_EQ(st->field.spans[1].value, 1u);
    EXPECT_EQ(st->field.spans[1].firstBit, 9u);
    EXPECT_EQ(st->field.spans[1].lastBit, 13u);
    EXPECT_TRUE(tagTest(st, 0xA1));
    EXPECT_EQ(st->field.spans[0].value, 0xA1u);
    EXPECT_EQ(st->field.spans[0].firstBit, 9u);
    EXPECT_EQ(st->field.spans[0].lastBit, 16u);
    host_FreeState(st);
}

// ---- Tag fields ------------------------------------------------------------------

TEST(BerTagField, Renderings) {
    {
        const auto r = runUnit<OctetTag>("6C");
        ASSERT_EQ(r.fields.size(), 1u);
        EXPECT_EQ(r.fields[0].text, "Component Portion Tag=6c");
        EXPECT_EQ(r.fields[0].label, "Component Portion Tag");
        EXPECT_EQ(r.fields[0].id, 3629u);
        EXPECT_EQ(r.fields[0].selector, 0u);
        EXPECT_EQ(r.fields[0].spans, (Spans{{1, 8, 0x6C}}));
        EXPECT_EQ(r.shown[0].text, "6c");
        EXPECT_EQ(r.md.cursor, 9u);
    }
    EXPECT_EQ(runUnit<OctetTag>("0A").fields.at(0).text, "Component Portion Tag=a");
    struct Case {
        const char *bytes;
        const char *text;
        Spans spans;
    } classNumber[] = {
        {"A0", "Component Portion Tag=40", {{7, 8, 2}, {1, 5, 0}}},
        {"80", "Component Portion Tag=40", {{7, 8, 2}, {1, 5, 0}}},
        {"BF", "Component Portion Tag=5f", {{7, 8, 2}, {1, 5, 31}}},
        {"04", "Component Portion Tag=4", {{7, 8, 0}, {1, 5, 4}}},
    };
    for (const Case &c : classNumber) {
        const auto r = runUnit<ClassNumberTag>(c.bytes);
        ASSERT_EQ(r.fields.size(), 1u) << c.bytes;
        EXPECT_EQ(r.fields[0].text, c.text);
        EXPECT_EQ(r.fields[0].spans, c.spans) << c.bytes;
        EXPECT_EQ(r.fields[0].selector, 1u);
        EXPECT_EQ(r.md.cursor, 9u);
    }
    {
        const auto r = runUnit<TwoOctetTag>("BF 32");
        ASSERT_EQ(r.fields.size(), 1u);
        EXPECT_EQ(r.fields[0].text, "Component Portion Tag=32bf");
        EXPECT_EQ(r.fields[0].spans, (Spans{{1, 16, 0x32BF}}));
        EXPECT_EQ(r.fields[0].selector, 0u);
        EXPECT_EQ(r.md.cursor, 17u);
    }
}

TEST(BerTagField, WrapperAcceptsBothFormsOfItsNumber) {
    struct Case {
        const char *bytes;
        Texts texts;
        uint32_t flags, cursor;
    } cases[] = {
        {"A0 03 02 01 05",
         {"Component Portion Tag=40", "LENGTH=3 octet(s)", "Invoke Id Tag=2", "  Length=1 octet(s)",
          "  Invoke Id=5"},
         0, 41},
        {"80 03 02 01 05",
         {"Component Portion Tag=40", "LENGTH=3 octet(s)", "Invoke Id Tag=2", "  Length=1 octet(s)",
          "  Invoke Id=5"},
         0, 41},
        {"A1 03 02 01 05", {}, DPX_ERR_MANDATORY_MISSING, 1},
        // Definite lengths only: with 80 the window holds the header alone,
        // so the mandatory content is missing and 02 01 05 is left outside.
        {"A0 80 02 01 05", {"Component Portion Tag=40", "LENGTH=0 octet(s)"},
         DPX_ERR_MANDATORY_MISSING, 17},
    };
    for (const Case &c : cases) {
        const auto r = runUnit<Wrapper>(c.bytes);
        EXPECT_EQ(r.texts(), c.texts) << c.bytes;
        EXPECT_EQ(r.md.flags, c.flags) << c.bytes;
        EXPECT_EQ(r.md.cursor, c.cursor) << c.bytes;
        if (!r.fields.empty()) {
            EXPECT_EQ(r.fields[0].spans.size(), 2u);
            EXPECT_EQ(r.fields[0].selector, 1u);
        }
    }
}

// ---- General length field ----------------------------------------------------------

TEST(BerLengthField, FormsAndRenderings) {
    struct Case {
        const char *bytes;
        bool block; // 3630 block form, else 3606 header form
        const char *shown;
        uint32_t lastBit, value, octetCount;
    } cases[] = {
        {"05", true, "5 Octet(s)", 8, 5, 1},
        {"81 05", true, "5 Octet(s)", 16, 5, 2},
        {"82 01 00", true, "256 Octet(s)", 24, 256, 3},
        {"81 85", false, "133 octet(s)", 16, 133, 2},
        {"80", true, "Indefinite Length", 8, 0, 0},
        {"00", true, "Indefinite Length", 8, 0, 1}, // a definite zero shows the same
        {"80", false, "0 octet(s)", 8, 0, 0},
        {"85 00 00 00 01 00", true, "256 Octet(s)", 48, 256, 6},
        {"85 01 00 00 00 00", true, "4294967295 Octet(s)", 48, 0xFFFFFFFF, 6},
    };
    for (const Case &c : cases) {
        const auto r = c.block ? runUnit<Length<3630>>(c.bytes) : runUnit<Length<3606>>(c.bytes);
        ASSERT_EQ(r.fields.size(), 1u) << c.bytes;
        const Field &f = r.fields[0];
        EXPECT_EQ(f.text, std::string("LENGTH=") + c.shown) << c.bytes;
        EXPECT_EQ(r.shown[0].text, c.shown);
        EXPECT_EQ(r.shown[0].displayId, 3606u) << "every LENGTH shares one display id";
        EXPECT_EQ(f.id, c.block ? 3630u : 3606u);
        ASSERT_EQ(f.spans.size(), 1u) << "one span over all the length octets";
        EXPECT_EQ(f.spans[0].first, 1u);
        EXPECT_EQ(f.spans[0].last, c.lastBit) << c.bytes;
        EXPECT_EQ(f.selector, 0u);
        EXPECT_EQ(r.md.cursor, c.lastBit + 1) << c.bytes;
        EXPECT_EQ(r.md.scratch.lengthValue, c.value) << c.bytes;
        EXPECT_EQ(r.md.scratch.lengthOctetCount, c.octetCount) << c.bytes;
        EXPECT_EQ(r.md.flags, 0u);
    }
    EXPECT_EQ(runUnit<Length<3630>>("05").fields.at(0).spans, (Spans{{1, 8, 5}}));
}

TEST(BerLengthField, OctetsOutsideTheWindowAreNeverRead) {
    // The message ends (or the window ends) inside the long form: the field
    // does not fit, is not reported, and the element is marked absent.
    struct Case {
        const char *bytes;
        uint32_t window;
    } cases[] = {{"82 01", 0}, {"81", 0}, {"81 05", 8}, {"FF", 0}, {"", 0}};
    for (const Case &c : cases) {
        RunSetup setup;
        setup.enclosingBits = c.window;
        const auto r = runUnit<Length<3630>>(c.bytes, setup);
        EXPECT_TRUE(r.fields.empty()) << c.bytes;
        EXPECT_EQ(r.md.ctx.present, 0u) << c.bytes;
        EXPECT_EQ(r.md.cursor, 1u) << c.bytes;
        EXPECT_EQ(r.md.result, 1);
    }
}

// ---- Content blocks ------------------------------------------------------------------

TEST(BerContentBlock, WindowedMembersInOrder) {
    const auto r = runUnit<Portion<Primitive<2>, Primitive<2>>>("6C 06 02 01 05 02 01 07");
    EXPECT_EQ(r.texts(), (Texts{"Component Portion Tag=6c", "LENGTH=6 Octet(s)", "Invoke Id Tag=2",
                                "  Length=1 octet(s)", "  Invoke Id=5", "Invoke Id Tag=2",
                                "  Length=1 octet(s)", "  Invoke Id=7"}));
    EXPECT_EQ(r.md.flags, 0u);
    EXPECT_EQ(r.md.cursor, 65u);
    EXPECT_EQ(r.md.remaining, 0u);
    EXPECT_EQ(r.view.status, 0);
}

TEST(BerContentBlock, WindowedLeftoverIsSkippedAndFlagged) {
    const auto r = runUnit<Portion<Primitive<2>>>("6C 05 02 01 05 AA BB 99");
    EXPECT_EQ(r.fields.size(), 5u);
    EXPECT_EQ(r.md.flags, DPX_ERR_LEFTOVER);
    EXPECT_EQ(r.md.cursor, 57u);
    EXPECT_EQ(r.md.remaining, 8u) << "the enclosing window, seen from the cursor";
    EXPECT_EQ(r.view.status, DPX_STATUS_INVALID);
}

TEST(BerContentBlock, IndefiniteChecksForEndOfContentsBeforeEachMember) {
    // Both members present: no EOC check after the last one, so the closing
    // 00 00 stays for whatever encloses the construct.
    const auto r = runUnit<Portion<Primitive<2>, Primitive<2>>>("6C 80 02 01 05 02 01 07 00 00");
    EXPECT_EQ(r.texts(), (Texts{"Component Portion Tag=6c", "LENGTH=Indefinite Length",
                                "Invoke Id Tag=2", "  Length=1 octet(s)", "  Invoke Id=5",
                                "Invoke Id Tag=2", "  Length=1 octet(s)", "  Invoke Id=7"}));
    EXPECT_EQ(r.md.flags, 0u);
    EXPECT_EQ(r.md.cursor, 65u);
    EXPECT_EQ(r.md.remaining, 16u);
    EXPECT_EQ(r.md.ctx.eocSeen, 0u);
}

TEST(BerContentBlock, EndOfContentsBeforeTheFirstMemberClosesTheBlock) {
    // Mandatory members count as absent after the EOC: no error bit.
    const auto r = runUnit<Portion<Primitive<2, true>, Primitive<2, true>>>("6C 80 00 00 02 01 05");
    EXPECT_EQ(r.texts(), (Texts{"Component Portion Tag=6c", "LENGTH=Indefinite Length",
                                "End of contents=0"}));
    const Field &eoc = r.fields.at(2);
    EXPECT_EQ(eoc.id, 1065u);
    EXPECT_EQ(eoc.label, "End of contents");
    EXPECT_EQ(eoc.spans, (Spans{{17, 32, 0}}));
    EXPECT_EQ(eoc.selector, 0u);
    EXPECT_EQ(r.shown.at(2).text, "0");
    EXPECT_EQ(r.shown.at(2).displayId, 1065u);
    EXPECT_EQ(r.md.flags, 0u);
    EXPECT_EQ(r.md.cursor, 33u);
    EXPECT_EQ(r.view.status, 0);

    // The same members without the EOC do raise the mandatory flag.
    const auto missing = runUnit<Portion<Primitive<2, true>>>("6C 80 04 01 05");
    EXPECT_EQ(missing.md.flags, DPX_ERR_MANDATORY_MISSING);
    EXPECT_EQ(missing.view.status, DPX_STATUS_INVALID);
}

TEST(BerContentBlock, DefiniteZeroLengthIsReadLikeTheIndefiniteForm) {
    const auto r = runUnit<Portion<Primitive<2>>>("6C 00 02 01 05");
    EXPECT_EQ(r.texts(), (Texts{"Component Portion Tag=6c", "LENGTH=Indefinite Length",
                                "Invoke Id Tag=2", "  Length=1 octet(s)", "  Invoke Id=5"}));
    EXPECT_EQ(r.md.flags, 0u);
    EXPECT_EQ(r.md.cursor, 41u);

    const auto eoc = runUnit<Portion<Primitive<2>>>("6C 00 00 00");
    EXPECT_EQ(eoc.texts().back(), "End of contents=0");
    EXPECT_EQ(eoc.md.flags, 0u);
}

TEST(BerContentBlock, EndOfContentsAfterAPresentLastMemberClosesTheEnclosingBlock) {
    // The inner block's last member is present, so the inner block leaves
    // its 00 00; the outer block's check before its next member consumes it
    // and thereby closes the outer block too: 02 01 07 is not decoded.
    using Outer = Portion<Invoke<Primitive<2>>, Primitive<2>>;
    const auto r = runUnit<Outer>("6C 80 A1 80 02 01 05 00 00 02 01 07 00 00");
    EXPECT_EQ(r.texts(), (Texts{"Component Portion Tag=6c", "LENGTH=Indefinite Length", "Invoke=a1",
                                "LENGTH=Indefinite Length", "Invoke Id Tag=2",
                                "  Length=1 octet(s)", "  Invoke Id=5", "End of contents=0"}));
    EXPECT_EQ(r.md.flags, 0u);
    EXPECT_EQ(r.md.cursor, 73u);
    EXPECT_EQ(r.md.remaining, 40u);
    EXPECT_EQ(r.fields.at(3).id, 3661u);
    EXPECT_EQ(r.shown.at(3).displayId, 3606u);
}

TEST(BerContentBlock, EndOfContentsMetByTheInnerBlockClosesOnlyIt) {
    // The inner block has a second member, so its own check consumes the
    // 00 00; the outer block goes on with 02 01 07.
    using Outer = Portion<Invoke<Primitive<2>, Primitive<2>>, Primitive<2>>;
    const auto r = runUnit<Outer>("6C 80 A1 80 02 01 05 00 00 02 01 07 00 00");
    EXPECT_EQ(r.texts(), (Texts{"Component Portion Tag=6c", "LENGTH=Indefinite Length", "Invoke=a1",
                                "LENGTH=Indefinite Length", "Invoke Id Tag=2",
                                "  Length=1 octet(s)", "  Invoke Id=5", "End of contents=0",
                                "Invoke Id Tag=2", "  Length=1 octet(s)", "  Invoke Id=7"}));
    EXPECT_EQ(r.md.flags, 0u);
    EXPECT_EQ(r.md.cursor, 97u);
    EXPECT_EQ(r.md.remaining, 16u);
}

TEST(BerContentBlock, EndOfContentsLeftToAWindowedBlockIsLeftover) {
    using Outer = Portion<Invoke<Primitive<2>>>;
    const auto r = runUnit<Outer>("6C 07 A1 80 02 01 05 00 00");
    EXPECT_EQ(r.texts(), (Texts{"Component Portion Tag=6c", "LENGTH=7 Octet(s)", "Invoke=a1",
                                "LENGTH=Indefinite Length", "Invoke Id Tag=2",
                                "  Length=1 octet(s)", "  Invoke Id=5"}));
    EXPECT_EQ(r.md.flags, DPX_ERR_LEFTOVER);
    EXPECT_EQ(r.md.cursor, 73u);
    EXPECT_EQ(r.md.remaining, 0u);
}

TEST(BerContentBlock, WindowBeyondTheEnclosingOneClearsPresentAndDecodesWhatIsThere) {
    // The enclosing window holds 6 octets; the construct claims 5 content
    // octets where only 4 remain in it.  The members are decoded against the
    // enclosing window, whose rest (FF) is then skipped; 99 99 beyond the
    // enclosing window is never touched.
    RunSetup setup;
    setup.enclosingBits = 48;
    const auto r = runUnit<Portion<Primitive<2>>>("6C 05 02 01 05 FF 99 99", setup);
    EXPECT_EQ(r.texts(), (Texts{"Component Portion Tag=6c", "LENGTH=5 Octet(s)", "Invoke Id Tag=2",
                                "  Length=1 octet(s)", "  Invoke Id=5"}));
    EXPECT_EQ(r.md.flags, DPX_ERR_LENGTH_BEYOND | DPX_ERR_LEFTOVER);
    EXPECT_EQ(r.md.ctx.present, 0u);
    EXPECT_EQ(r.md.cursor, 49u);
    EXPECT_EQ(r.md.remaining, 16u);
    EXPECT_EQ(r.view.status, DPX_STATUS_INVALID);
}

TEST(BerContentBlock, MemberClearingPresentInAnIndefiniteBlockReachesTheCaller) {
    // The primitive claims 9 octets where 6 remain: it clears the present
    // flag of the inner block, which the inner and then the outer block
    // copy back, so the caller sees the construct cut short.
    using Outer = Portion<Invoke<Primitive<2>>, Primitive<2>>;
    const auto r = runUnit<Outer>("6C 80 A1 80 02 09 05 02 01 07");
    EXPECT_EQ(r.md.flags, DPX_ERR_LENGTH_BEYOND);
    EXPECT_EQ(r.md.ctx.present, 0u);
    EXPECT_EQ(r.texts().back(), "  Invoke Id=84017415");
    EXPECT_EQ(r.md.cursor, 81u);
}

TEST(BerContentBlock, AbsentConstructIsNotEntered) {
    RunSetup setup;
    setup.ctx.present = 0;
    const auto r = runUnit<Portion<Primitive<2>>>("6C 03 02 01 05", setup);
    EXPECT_TRUE(r.fields.empty());
    EXPECT_EQ(r.md.cursor, 1u);
    EXPECT_EQ(r.md.flags, 0u);
}

// ---- Element loop ---------------------------------------------------------------------

using Loop3 = Sequence<Primitive<0x80>, Primitive<0x81>, Primitive<0x82>>;

// The invoke-id values decoded by a run, in message order.
std::vector<std::string> values(const UnitRun &r) {
    std::vector<std::string> out;
    for (const Field &f : r.fields)
        if (f.id == 3705)
            out.push_back(f.text.substr(std::strlen("  Invoke Id=")));
    return out;
}

TEST(BerElementLoop, Sweeps) {
    struct Case {
        const char *name;
        const char *bytes;
        Texts values;
        uint32_t flags;
        uint32_t cursor;
    } cases[] = {
        {"any order", "30 09 82 01 03 80 01 01 81 01 02", {"3", "1", "2"}, 0, 89},
        {"repeated member", "30 06 80 01 01 80 01 02", {"1", "2"}, 0, 65},
        {"a match restarts the miss count", "30 09 81 01 01 81 01 02 80 01 03", {"1", "2", "3"}, 0, 89},
        {"no member matches", "30 03 85 01 07", {}, DPX_ERR_LEFTOVER, 41},
        {"N misses after a match", "30 06 80 01 01 85 01 02", {"1"}, DPX_ERR_LEFTOVER, 65},
        {"empty sequence", "30 00", {}, 0, 17},
    };
    for (const Case &c : cases) {
        const auto r = runUnit<Loop3>(c.bytes);
        EXPECT_EQ(values(r), c.values) << c.name;
        EXPECT_EQ(r.md.flags, c.flags) << c.name;
        EXPECT_EQ(r.md.cursor, c.cursor) << c.name;
        EXPECT_EQ(r.md.remaining, 0u) << c.name;
        EXPECT_EQ(r.md.occurrenceCounter, 0u) << c.name << ": the miss counter is cleared";
        EXPECT_EQ(r.fields.at(1).text, "LENGTH=" + std::to_string(hexBytes(c.bytes)[1]) + " octet(s)");
    }
}

TEST(BerElementLoop, ASweepWithoutProgressEndsTheLoop) {
    g_peekOnlyCalls = 0;
    const auto r = runUnit<Sequence<PeekOnly<0x80>, Primitive<0x81>>>("30 02 80 00");
    EXPECT_EQ(g_peekOnlyCalls, 3) << "one sweep per pass";
    EXPECT_EQ(r.md.flags, DPX_ERR_LEFTOVER);
    EXPECT_EQ(r.md.cursor, 33u);
}

TEST(BerElementLoop, MemberBeyondTheSequenceIsDecodedAgainstIt) {
    // [0] claims 9 octets in a 7-octet sequence: flagged, its value read as
    // far as the sequence goes (four octets at most), the rest skipped.
    const auto r = runUnit<Loop3>("30 07 80 09 01 81 01 02 03");
    EXPECT_EQ(r.texts(), (Texts{"Component Portion Tag=30", "LENGTH=7 octet(s)", "Invoke Id Tag=80",
                                "  Length=9 octet(s)", "  Invoke Id=25231618"}));
    // One span per value octet: the integer's span selector is spans - 1.
    EXPECT_EQ(r.fields.back().spans, (Spans{{33, 40, 1}, {41, 48, 0x81}, {49, 56, 1}, {57, 64, 2}}));
    EXPECT_EQ(r.fields.back().selector, 3u);
    EXPECT_EQ(r.md.flags, DPX_ERR_LENGTH_BEYOND | DPX_ERR_LEFTOVER);
    EXPECT_EQ(r.md.cursor, 73u);
    EXPECT_EQ(r.md.remaining, 0u);
}

// ---- Choice, repetition, field fit ---------------------------------------------------------

TEST(BerChoice, IdentifierOctetSelectsTheAlternative) {
    {
        const auto r = runUnit<Problem>("81 01 02");
        EXPECT_EQ(r.texts(), (Texts{"  Problem Code=Invoke", "  Length=1 octet(s)",
                                    "  Problem Code=MistypedParameter"}));
        EXPECT_EQ(r.md.scratch.choiceTag, 0x81u);
        EXPECT_EQ(r.fields[0].spans, (Spans{{1, 8, 0x81}}));
        EXPECT_EQ(r.shown[0].displayId, 3701u);
        EXPECT_EQ(r.shown[1].displayId, 3718u);
        EXPECT_EQ(r.shown[2].displayId, 3701u);
        EXPECT_EQ(r.md.cursor, 25u);
    }
    {
        const auto r = runUnit<Problem>("80 01 01");
        EXPECT_EQ(r.texts().back(), "  Problem Code=MistypedComponent");
    }
    {
        // An octet without a name renders as an empty text; no alternative.
        const auto r = runUnit<Problem>("85 01 02");
        EXPECT_EQ(r.texts(), (Texts{"  Problem Code="}));
        EXPECT_EQ(r.shown.at(0).text, "");
        EXPECT_EQ(r.md.scratch.choiceTag, 0x85u);
        EXPECT_EQ(r.md.cursor, 9u);
    }
    {
        const auto r = runUnit<Problem>("");
        EXPECT_TRUE(r.fields.empty());
        EXPECT_EQ(r.md.ctx.present, 0u);
    }
}

TEST(BerRepeat, StopsAtAnotherTag) {
    const auto r = runUnit<Items>("02 01 05 02 01 06 04 01 07");
    EXPECT_EQ(values(r), (Texts{"5", "6"}));
    EXPECT_EQ(r.md.ctx.occurrenceCount, 2u);
    EXPECT_EQ(r.md.cursor, 49u);
    EXPECT_EQ(r.md.remaining, 24u);
    EXPECT_EQ(r.md.flags, 0u);
}

TEST(BerRepeat, StopsAt255Items) {
    Bytes m;
    for (int i = 0; i < 300; ++i) {
        m.push_back(0x02);
        m.push_back(0x01);
        m.push_back(static_cast<uint8_t>(i));
    }
    const auto r = runUnit<Items>(m);
    EXPECT_EQ(values(r).size(), 255u);
    EXPECT_EQ(r.md.ctx.occurrenceCount, 255u);
    EXPECT_EQ(r.md.cursor, 255u * 24 + 1);
    EXPECT_EQ(r.md.flags, 0u);
}

TEST(BerFieldFit, FieldWithoutItsBitsIsNotReportedAndClearsPresent) {
    {
        // The value octet is missing: tag and length are reported, then the
        // element is marked absent; no flag.
        const auto r = runUnit<IdElement>("02 01");
        EXPECT_EQ(r.texts(), (Texts{"Invoke Id Tag=2", "  Length=1 octet(s)"}));
        EXPECT_EQ(r.md.ctx.present, 0u);
        EXPECT_EQ(r.md.flags, 0u);
        EXPECT_EQ(r.md.cursor, 17u);
    }
    {
        const auto r = runUnit<TwoOctetTag>("BF");
        EXPECT_TRUE(r.fields.empty());
        EXPECT_EQ(r.md.ctx.present, 0u);
        EXPECT_EQ(r.md.cursor, 1u);
    }
    {
        RunSetup setup;
        setup.enclosingBits = 7;
        const auto r = runUnit<OctetTag>("6C", setup);
        EXPECT_TRUE(r.fields.empty());
        EXPECT_EQ(r.md.ctx.present, 0u);
    }
}

// ---- Text limits -------------------------------------------------------------------------

TEST(BerText, LongTextIsCutAt255Characters) {
    Bytes m;
    for (int i = 0; i < 300; ++i)
        m.push_back(static_cast<uint8_t>(0x10 + i % 0xE0));
    std::string digits;
    static constexpr char kHex[] = "0123456789abcdef";
    for (uint8_t b : m) {
        digits += kHex[b >> 4];
        digits += kHex[b & 15];
    }
    const auto r = runUnit<LongDigits>(m);
    ASSERT_EQ(r.fields.size(), 1u);
    const std::string full = "  Originating Transaction Id=" + digits;
    EXPECT_EQ(r.fields[0].text, full.substr(0, 255));
    EXPECT_EQ(r.fields[0].spans.size(), 600u) << "two spans per octet, grown past 200";
    EXPECT_EQ(r.fields[0].selector, 1u);
    EXPECT_EQ(r.shown.at(0).text, digits.substr(0, 255));
    // The module's own buffers hold at most 255 characters and a terminator.
    EXPECT_EQ(std::strlen(g_text<Pass::Decoded>.text), 255u);
    EXPECT_EQ(std::strlen(g_text<Pass::Display>.text), 255u);
    EXPECT_EQ(r.md.cursor, 300u * 8 + 1);
}

// ---- Display ids ----------------------------------------------------------------------------

TEST(BerDisplayId, SharedByLabelText) {
    struct Case {
        const char *label; // without leading blanks
        uint32_t displayId;
    } cases[] = {
        {"LENGTH", 3606},         {"Length", 3718},          {"Problem Code", 3701},
        {"Invoke Id", 3705},      {"End of contents", 1065}, {"External Tag", 3622},
        {"Object Identifier Tag", 3717},
    };
    for (const Case &c : cases) {
        uint32_t seen = 0;
        for (const FieldDef &f : kFields) {
            const char *label = f.label;
            while (*label == ' ')
                ++label;
            if (std::strcmp(label, c.label) != 0)
                continue;
            ++seen;
            EXPECT_EQ(displayIdOf(f.id), c.displayId) << f.id << " '" << f.label << "'";
        }
        EXPECT_GT(seen, 0u) << c.label;
    }
    static_assert(camel::Field<3630>::displayId == 3606);
    static_assert(camel::Field<3704>::displayId == 3718);
    static_assert(camel::Field<3716>::displayId == 3701);
    static_assert(camel::Field<3604>::displayId == 3604);
    static_assert(camel::Field<3651>::displayId == 3651);
}

TEST(BerDisplayId, UniqueLabelsKeepTheirOwnId) {
    for (const FieldDef &f : kFields) {
        const char *label = f.label;
        while (*label == ' ')
            ++label;
        uint32_t sharing = 0;
        for (const FieldDef &g : kFields) {
            const char *other = g.label;
            while (*other == ' ')
                ++other;
            sharing += std::strcmp(label, other) == 0 ? 1 : 0;
        }
        if (sharing == 1)
            EXPECT_EQ(displayIdOf(f.id), f.id) << f.label;
        else
            EXPECT_LE(fieldIndex(displayIdOf(f.id)), fieldIndex(f.id)) << f.label;
    }
}

// ---- Message-view status ------------------------------------------------------------------

TEST(BerMessageView, StatusFollowsAnyFlagAndIsNeverCleared) {
    struct Case {
        const char *name;
        const char *bytes;
        int32_t before, after;
    } cases[] = {
        {"clean", "6C 03 02 01 05", 0, 0},
        {"leftover", "6C 04 02 01 05 00", 0, DPX_STATUS_INVALID},
        {"length beyond", "6C 09 02 01 05", 0, DPX_STATUS_INVALID},
        {"clean, status already set by the host", "6C 03 02 01 05", DPX_STATUS_INVALID,
         DPX_STATUS_INVALID},
    };
    for (const Case &c : cases) {
        RunSetup setup;
        setup.status = c.before;
        const auto r = runUnit<Portion<Primitive<2>>>(c.bytes, setup);
        EXPECT_EQ(r.view.status, c.after) << c.name;
    }
    // A missing mandatory element.
    const auto r = runUnit<Portion<Primitive<2, true>>>("6C 03 04 01 05");
    EXPECT_EQ(r.md.flags, DPX_ERR_MANDATORY_MISSING | DPX_ERR_LEFTOVER);
    EXPECT_EQ(r.view.status, DPX_STATUS_INVALID);
}

// ---- Growth failures ------------------------------------------------------------------------

TEST(BerGrowth, EveryPieceHandsAFailedGrowthStraightUp) {
    // Arrays at capacity 1, so that the nested constructs grow the stacks
    // and the spans; every pu_Realloc call in turn fails.
    using Outer = Portion<Invoke<Primitive<2>, Sequence<Primitive<0x80>>>, Primitive<2>>;
    const Bytes m = hexBytes("6C 80 A1 80 02 01 05 30 03 80 01 09 00 00 02 01 07");
    uint32_t points = 0;
    for (uint32_t n = 1; n < 100; ++n) {
        RunSetup setup;
        setup.shrink = true;
        setup.failAt = n;
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
