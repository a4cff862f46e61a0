// BER element conventions shared by every grammar unit: tag tests, element
// windows, content blocks in their windowed and end-of-contents-delimited
// forms, the end-of-contents unit and choices.  Element loops and
// repetitions are walks of member tables (engine/members.h).
#pragma once

#include <cstdint>

#include "engine/emit.h"

namespace camel {

// ---- Tag tests: peek only, nothing consumed, nothing emitted ---------------

namespace detail {
// The test leaves what it read in span 0 and the field value, as the host
// may inspect the field record after a pass.
inline void noteTestedIdentifier(DecodeState *st, uint32_t bits, uint32_t value) {
    st->field.value = value;
    if (st->field.spans != nullptr && st->field.spanCapacity > 0) {
        st->field.spans[0].value = value;
        st->field.spans[0].firstBit = st->bitCursor;
        st->field.spans[0].lastBit = st->bitCursor + bits - 1;
    }
}
} // namespace detail

// Whole-octet test: the identifier octet equals `expected`.
inline bool tagTest(DecodeState *st, uint32_t expected) {
    if (!room(st, 8))
        return false;
    const uint32_t octet = peekOctet(st);
    detail::noteTestedIdentifier(st, 8, octet);
    return octet == expected;
}

// Class-and-number test: class * 32 + number equals `expected`; the form
// bit is ignored, so [0] matches both 0x80 and 0xA0 as 64.  The class and
// the number are left in spans 0 and 1, as the tag field shows them.
inline bool tagTestClassNumber(DecodeState *st, uint32_t expected) {
    if (!room(st, 8))
        return false;
    const uint32_t octet = peekOctet(st);
    const uint32_t cls = octet >> 6;
    const uint32_t number = octet & 0x1Fu;
    const uint32_t value = cls * 32 + number;
    st->field.value = value;
    if (st->field.spans != nullptr && st->field.spanCapacity > 1) {
        ValueSpan *spans = st->field.spans;
        spans[0].value = cls;
        spans[0].firstBit = st->bitCursor + 6;
        spans[0].lastBit = st->bitCursor + 7;
        spans[1].value = number;
        spans[1].firstBit = st->bitCursor;
        spans[1].lastBit = st->bitCursor + 4;
    }
    return value == expected;
}

// Two-octet test (tag numbers above 30): the first octet is the low byte,
// so BF 32 compares as 0x32BF.
inline bool tagTest16(DecodeState *st, uint32_t expected) {
    if (!room(st, 16))
        return false;
    const uint32_t value = peekOctet(st) | (octetAt(st, 8) << 8);
    detail::noteTestedIdentifier(st, 16, value);
    return value == expected;
}

// A mandatory element whose tag is missing.
inline void mandatoryMissing(DecodeState *st) { st->errorFlags |= DPX_ERR_MANDATORY_MISSING; }

// Whole-octet tag test of an element that must be there: a missing tag
// sets the mandatory-missing flag.  Returns whether the tag is next.
template <Pass P>
inline bool mandatoryTag(DecodeState *st, Request<P> *rq, uint32_t tag) {
    if (tagTest(st, tag))
        return true;
    mandatoryMissing(st);
    noteStatus<P>(st, rq);
    return false;
}

// Element end: pops the element's start position; in the message-view pass
// the status then reflects every flag raised inside the element.
template <Pass P>
inline int elementEnd(DecodeState *st, Request<P> *rq) {
    popPos(st);
    noteStatus<P>(st, rq);
    return 1;
}

// ---- Element windows ---------------------------------------------------------

// Narrows the window to the element at the cursor, whose identifier takes
// `idBits` and whose BER length follows it, and pushes the window's end.
// An element longer than the window sets the length-beyond flag, keeps the
// enclosing window and reports `overflow`; the caller then clears the
// present flag of its context so that the construct's later members are
// skipped.  A header whose length octets run past the window counts as such
// an element too (its length field will then not fit).  0 when a stack
// cannot grow.
inline int openElementWindow(DecodeState *st, uint32_t idBits, bool *overflow) {
    const LengthPeek len = peekLength(st, idBits);
    *overflow = !narrowWindow(st, len.fits ? idBits + len.bits + len.value * 8 : ~0ull);
    return pushEnd(st);
}

// Closes a window opened by openElementWindow or a content block, together
// with the element start pushed before it: leftovers are flagged and
// skipped, then the position and the window are popped.
template <Pass P>
inline void closeElementWindow(DecodeState *st, Request<P> *rq) {
    skipLeftover(st);
    popPos(st);
    popEnd(st);
    noteStatus<P>(st, rq);
}

// ---- Element shapes ------------------------------------------------------------------

// A run of fixed one-octet fields (tags, one-octet lengths, OBJECT
// IDENTIFIER arcs, one-octet values): each taken while the element is
// present and its octet is in the window, whatever the length octets say.
template <Pass P, uint32_t... Ids>
inline int octetFields(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return ((octetField<P, Ids>(st, ctx, rq) != 0) && ...) ? 1 : 0;
}

// An element made of fixed one-octet fields, whose tag test has succeeded.
template <Pass P, uint32_t... Ids>
inline int octetFieldsElement(DecodeState *st, ElementContext *ctx, Request<P> *rq,
                              const char *name) {
    if (!elementStart(st, name) || !octetFields<P, Ids...>(st, ctx, rq))
        return 0;
    return elementEnd<P>(st, rq);
}

// A pre-bounded element whose tag test has succeeded: its window is set
// from its length before anything is shown.  An element longer than the
// enclosing window is flagged, clears `ctx` (the construct's later members
// are skipped) and is shown against what is there.  `contents` is called
// with the element's own context, whose present flag is 1, at the
// identifier octet.
template <Pass P, class Contents>
int preBoundedElement(DecodeState *st, ElementContext *ctx, Request<P> *rq, const char *name,
                      uint32_t idBits, Contents &&contents) {
    if (!elementStart(st, name))
        return 0;
    bool overflow = false;
    if (!openElementWindow(st, idBits, &overflow))
        return 0;
    if (overflow)
        ctx->present = 0;
    ElementContext own{0, 1, 0, 0};
    if (!contents(&own))
        return 0;
    closeElementWindow<P>(st, rq);
    return 1;
}

// The explicit [n] wrappers (class-and-number tag test, [n] in either form):
// tag field of two spans, length field, then `contents` with the wrapper's
// own context.  Definite lengths only: with 80 as its length the window
// holds the header alone.
template <Pass P, uint32_t TagId, uint32_t LengthId, class Contents>
int wrapperElement(DecodeState *st, ElementContext *ctx, Request<P> *rq, const char *name,
                   uint32_t number, bool mandatory, Contents &&contents) {
    if (ctx->present == 0)
        return 1;
    if (!tagTestClassNumber(st, 2 * 32 + number)) {
        if (mandatory)
            mandatoryMissing(st);
        noteStatus<P>(st, rq);
        return 1;
    }
    return preBoundedElement<P>(st, ctx, rq, name, 8, [&](ElementContext *own) {
        return classNumberTagField<P, TagId>(st, own, rq) && lengthField<P, LengthId>(st, own, rq) &&
               contents(own);
    });
}

// ---- End of contents -----------------------------------------------------------

// The end-of-contents check of an EOC-delimited block: two zero octets close
// the block (eocSeen) and are reported as "End of contents".
template <Pass P>
inline int eocCheck(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (ctx->present == 0 || ctx->eocSeen != 0)
        return 1;
    if (!room(st, 16) || peekOctet(st) != 0 || octetAt(st, 8) != 0)
        return 1;
    ctx->eocSeen = 1;
    if (!elementStart(st, "End Of Contents"))
        return 0;
    if (ctx->present != 0 && room(st, 16)) {
        if (!bitsField<P, fid::kEndOfContents>(st, rq, 0, 16, 16))
            return 0;
    }
    return elementEnd<P>(st, rq);
}

// ---- Content blocks ------------------------------------------------------------

// A member of a block: called with the block's context and the in-EOC-block
// flag, returns 1 or 0 like any unit.
//   [&](ElementContext *c, uint32_t inEoc) { return decodeX<P>(st, c, inEoc, rq); }

// The content block of a delimited construct, entered right after its
// length field (it reads `lengthValue`).  A definite length opens a window
// of that many octets and runs the members in order inside it; the
// indefinite form (and a length of zero) runs them with an end-of-contents
// check before each, and the first EOC met closes the block.  The EOC that
// follows the last member is left to the enclosing block.
template <Pass P, class... Members>
inline int contentBlock(DecodeState *st, ElementContext *ctx, Request<P> *rq,
                        const char *blockName, Members &&...members) {
    if (ctx->present == 0)
        return 1;
    const uint32_t length = g_scratch<P>.lengthValue;
    if (blockName != nullptr)
        setElementName(st, blockName);
    if (!pushPos(st))
        return 0;
    if (length != 0) {
        if (!narrowWindow(st, static_cast<uint64_t>(length) * 8))
            ctx->present = 0;
        if (!pushEnd(st))
            return 0;
        ElementContext block{0, 1, 0, 0};
        bool ok = true;
        ((ok = ok && (block.present == 0 || members(&block, 0u) != 0)), ...);
        if (!ok)
            return 0;
        closeElementWindow<P>(st, rq);
        return 1;
    }
    ElementContext block{0, ctx->present, 0, 0};
    bool ok = true;
    ((ok = ok && eocCheck<P>(st, &block, rq) != 0 &&
           (block.present == 0 || block.eocSeen != 0 || members(&block, 1u) != 0)),
     ...);
    if (!ok)
        return 0;
    ctx->present = block.present;
    return elementEnd<P>(st, rq);
}

// A delimited construct whose tag test has succeeded: element start, tag
// field, length field, content block, element end.
template <Pass P, uint32_t TagId, uint32_t LengthId, class... Members>
inline int delimitedConstruct(DecodeState *st, ElementContext *ctx, Request<P> *rq,
                              const char *name, const char *blockName, Members &&...members) {
    if (!elementStart(st, name))
        return 0;
    if (!octetField<P, TagId>(st, ctx, rq) || !lengthField<P, LengthId>(st, ctx, rq))
        return 0;
    if (!contentBlock<P>(st, ctx, rq, blockName, members...))
        return 0;
    return elementEnd<P>(st, rq);
}

// ---- Choice -----------------------------------------------------------------------

// A "Choice" field: the alternative's identifier, reported by name and kept
// in `choiceTag` for the selection that follows.  A field of two octets
// reads them first octet low, as tag tests do, and keeps them in
// `choiceTag` as written (9F 32 as 0x9F32), as alternatives are declared.
template <Pass P>
int choiceField(DecodeState *st, ElementContext *ctx, Request<P> *rq, FieldIndex f) {
    const uint32_t width = kFields[f].width == 16 ? 16 : 8;
    if (ctx->present == 0 || !room(st, width)) {
        ctx->present = 0;
        return 1;
    }
    if (!bitsField<P>(st, rq, f, 0, width, width))
        return 0;
    const uint32_t v = st->field.value;
    g_scratch<P>.choiceTag = width == 16 ? ((v & 0xFFu) << 8) | (v >> 8) : v;
    return 1;
}
template <Pass P, uint32_t Id>
inline int choiceField(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return choiceField<P>(st, ctx, rq, Field<Id>::index);
}

} // namespace camel
