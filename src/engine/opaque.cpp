// The opaque walker (see opaque.h).
#include "engine/opaque.h"

#include "engine/ber.h"

namespace camel {

namespace {

enum : uint32_t {
    kFormBit = 3835,        // the identifier's form bit, unlabelled
    kTagClass = 3848,
    kTagForm = 3849,
    kTagNumber = 3850,
    kConstructedLength = 3841,
    kPrimitiveLength = 3842,
    kValueOctet = 3844,
};

// A primitive element: its length octet bounds a window of its own.  A
// length past the enclosing window is flagged and the element is shown
// against what is there; the walk then ends.
template <Pass P>
int opaquePrimitive(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    Scratch &s = g_scratch<P>;
    if (!room(st, 8)) { // even the length octet runs past the window
        st->errorFlags |= DPX_ERR_LENGTH_BEYOND;
        ctx->present = 0;
        return 1;
    }
    const bool overflow = !narrowWindow(st, 8 + 8ull * peekOctet(st));
    if (!pushPos(st) || !pushEnd(st))
        return 0;
    ElementContext element{0, 1, 0, 0};
    if (!octetField<P, kPrimitiveLength>(st, &element, rq))
        return 0;
    if (element.present != 0) {
        s.opaqueLength = st->field.value;
        s.opaqueBudget -= static_cast<int32_t>(s.opaqueLength);
        if (!opaqueValue<P>(st, &element, rq))
            return 0;
    }
    closeElementWindow<P>(st, rq);
    if (overflow)
        ctx->present = 0;
    return 1;
}

} // namespace

template <Pass P>
int opaqueValue(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    Scratch &s = g_scratch<P>;
    while (ctx->present != 0 && s.opaqueLength >= 1 && room(st, 8)) {
        if (!bitsField<P, kValueOctet>(st, rq, 0, 8, 8))
            return 0;
        --s.opaqueLength;
    }
    return 1;
}

template <Pass P>
int opaqueHead(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    Scratch &s = g_scratch<P>;
    // Every round consumes at least the identifier octet or ends the walk.
    while (s.opaqueBudget >= 1 && ctx->present != 0) {
        if (!room(st, 8)) {
            ctx->present = 0;
            break;
        }
        if (!bitsField<P, kFormBit>(st, rq, 5, 1, 0))
            return 0;
        s.opaqueForm = st->field.value;
        if (!elementStart(st, "ASN.1 Tag"))
            return 0;
        if (!bitsField<P, kTagClass>(st, rq, 6, 2, 0) || !bitsField<P, kTagForm>(st, rq, 5, 1, 0))
            return 0;
        s.opaqueForm = st->field.value;
        if (!bitsField<P, kTagNumber>(st, rq, 0, 5, 8))
            return 0;
        popPos(st);
        s.opaqueBudget -= 2;
        if (s.opaqueForm == 0) {
            if (!opaquePrimitive<P>(st, ctx, rq))
                return 0;
        } else if (!octetField<P, kConstructedLength>(st, ctx, rq)) {
            return 0;
        }
        noteStatus<P>(st, rq);
    }
    return 1;
}

CAMEL_INSTANTIATE_UNIT(opaqueHead, DecodeState *, ElementContext *);
CAMEL_INSTANTIATE_UNIT(opaqueValue, DecodeState *, ElementContext *);

} // namespace camel
