// The generic member-table walker, one instance per pass.
#include "engine/members.h"

namespace camel {

bool memberTagNext(DecodeState *st, const Member &m) {
    switch (m.tagBits) {
    case 0:
        return room(st, 8);
    case 1:
        return tagTestClassNumber(st, m.tag);
    case 16:
        return tagTest16(st, m.tag);
    default:
        return tagTest(st, m.tag);
    }
}

namespace {

template <Pass P>
int decodeValue(DecodeState *st, ElementContext *ctx, Request<P> *rq, const Value &v) {
    switch (v.kind) {
    case ValueKind::None:
        return 1;
    case ValueKind::Octet:
        return octetField<P>(st, ctx, rq, v.field);
    case ValueKind::Integer:
        return octetsField<P>(st, ctx, rq, v.field, v.limit);
    case ValueKind::HalfOctets:
        return halfOctetField<P>(st, ctx, rq, v.field, v.limit);
    case ValueKind::Bcd:
        return bcdDigitsField<P>(st, ctx, rq, v.field, v.limit);
    case ValueKind::Table:
        return walkTable<P>(st, ctx, rq, *v.table);
    case ValueKind::Unit:
        return v.unit.call<P>(st, ctx, rq);
    }
    return 1;
}

// An element that no row names, at the cursor: when it is whole and inside
// the window it is stepped over by its own length and flagged as bits not
// decoded, so that the members after it are still found.  False when it is
// malformed or runs past the window.
bool stepOverUnknown(DecodeState *st) {
    const uint64_t bits = wholeElementBits(st);
    if (bits == 0)
        return false;
    st->errorFlags |= DPX_ERR_LEFTOVER;
    st->bitCursor += static_cast<uint32_t>(bits);
    st->remainingBits -= static_cast<uint32_t>(bits);
    return true;
}

// The element loop: sweeps over the rows; after N consecutive misses the
// element at the cursor is stepped over when it is whole.  Ends when the
// window is used up, at a malformed or overrunning element no row names,
// or after a sweep without progress.
template <Pass P>
int loop(DecodeState *st, ElementContext *ctx, Request<P> *rq, const MemberTable &t) {
    const uint32_t n = t.count;
    st->occurrenceCounter = 0;
    bool firstSweep = true;
    uint32_t sweepStart = 0;
    while (st->remainingBits != 0 && ctx->present != 0 && st->occurrenceCounter < n &&
           (firstSweep || st->bitCursor != sweepStart)) {
        firstSweep = false;
        sweepStart = st->bitCursor;
        for (uint32_t i = 0; i < n && ctx->present != 0 && st->occurrenceCounter < n; ++i) {
            const Member &m = t.rows[i];
            if (!memberTagNext(st, m)) {
                ++st->occurrenceCounter;
                continue;
            }
            st->occurrenceCounter = 0;
            if (!decodeMember<P>(st, ctx, rq, m, m.tagBits == 16 ? 16 : 8))
                return 0;
            st->occurrenceCounter = 0;
        }
        if (st->occurrenceCounter >= n && ctx->present != 0) {
            if (!stepOverUnknown(st))
                break;
            st->occurrenceCounter = 0;
        }
    }
    st->occurrenceCounter = 0;
    noteStatus<P>(st, rq);
    return 1;
}

} // namespace

template <Pass P>
int decodeMember(DecodeState *st, ElementContext *ctx, Request<P> *rq, const Member &m,
                 uint32_t idBits) {
    return preBoundedElement<P>(st, ctx, rq, m.name, idBits, [&](ElementContext *own) {
        if (idBits != 0 && m.tagField != kNoField &&
            !fittedBitsField<P>(st, own, rq, m.tagField, 0, idBits, idBits))
            return 0;
        if (m.lengthField != kNoField && !lengthField<P>(st, own, rq, m.lengthField))
            return 0;
        if (own->present == 0)
            return 1;
        return decodeValue<P>(st, own, rq, m.value);
    });
}

template <Pass P>
int decodeRow(DecodeState *st, ElementContext *ctx, Request<P> *rq, const Member &m,
              bool mandatory) {
    if (ctx->present == 0)
        return 1;
    if (!memberTagNext(st, m)) {
        if (mandatory)
            mandatoryMissing(st);
        noteStatus<P>(st, rq);
        return 1;
    }
    return decodeMember<P>(st, ctx, rq, m, m.tagBits == 16 ? 16 : 8);
}

template <Pass P>
int walkTable(DecodeState *st, ElementContext *ctx, Request<P> *rq, const MemberTable &t) {
    if (ctx->present == 0)
        return 1;
    switch (t.walk) {
    case Walk::Loop:
        return loop<P>(st, ctx, rq, t);
    case Walk::InOrder:
    case Walk::Mandatory:
        for (uint32_t i = 0; i < t.count && ctx->present != 0; ++i)
            if (!decodeRow<P>(st, ctx, rq, t.rows[i], t.walk == Walk::Mandatory))
                return 0;
        return 1;
    case Walk::Repeat: {
        uint32_t count = 0;
        while (ctx->present != 0 && count < 255 && memberTagNext(st, t.rows[0])) {
            ++count;
            ++ctx->occurrenceCount;
            if (!decodeMember<P>(st, ctx, rq, t.rows[0], t.rows[0].tagBits == 16 ? 16 : 8))
                return 0;
        }
        noteStatus<P>(st, rq);
        return 1;
    }
    case Walk::FirstMatch:
        for (uint32_t i = 0; i < t.count; ++i)
            if (memberTagNext(st, t.rows[i]))
                return decodeMember<P>(st, ctx, rq, t.rows[i], t.rows[i].tagBits == 16 ? 16 : 8);
        return 1;
    case Walk::Choice: {
        if (!choiceField<P>(st, ctx, rq, t.choiceField))
            return 0;
        if (ctx->present == 0)
            return 1;
        const uint32_t chosen = g_scratch<P>.choiceTag;
        for (uint32_t i = 0; i < t.count; ++i)
            if (t.rows[i].tag == chosen)
                return decodeMember<P>(st, ctx, rq, t.rows[i], 0);
        return 1;
    }
    }
    return 1;
}

#define CAMEL_INSTANTIATE_WALKER(P)                                                          \
    template int walkTable<P>(DecodeState *, ElementContext *, Request<P> *,                  \
                              const MemberTable &);                                           \
    template int decodeMember<P>(DecodeState *, ElementContext *, Request<P> *, const Member &, \
                                 uint32_t);                                                   \
    template int decodeRow<P>(DecodeState *, ElementContext *, Request<P> *, const Member &,    \
                              bool)
CAMEL_INSTANTIATE_WALKER(Pass::Decoded);
CAMEL_INSTANTIATE_WALKER(Pass::Display);
CAMEL_INSTANTIATE_WALKER(Pass::MessageView);
CAMEL_INSTANTIATE_WALKER(Pass::KeyField);

} // namespace camel
