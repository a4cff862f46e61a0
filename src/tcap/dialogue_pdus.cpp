// Members shared by the dialogue PDUs: the protocol version and the
// application context name with its CAMEL application context.
#include "tcap/dialogue_units.h"

namespace camel {

namespace {

enum : uint32_t {
    kAcIdClass = 0x00, // cap arc of the CAP phase 1/2 contexts
    kCap3Class = 0x14,
    kCap3OeClass = 0x15,
    kCap4Class = 0x16,   // the CAP v4 gsmSRF context, read as cap3's
    kCap4OeClass = 0x17, // the other CAP v4 contexts, read as cap3OE's
};

// The ac and Context arcs after a cap3 / cap3OE / CAP v4 class: an ac arc
// of 03 must follow, else the identifier is flagged and ends.
template <Pass P, uint32_t AcId, uint32_t ContextId>
int decodeContextArcs(DecodeState *st, ElementContext *ctx, const char *name, Request<P> *rq) {
    if (!mandatoryTag<P>(st, rq, 0x03))
        return 1;
    return octetFieldsElement<P, AcId, ContextId>(st, ctx, rq, name);
}

// The application context's OBJECT IDENTIFIER (tag 06, mandatory): the
// fixed arcs up to the cap arc, whose value selects how the rest is read.
template <Pass P>
int decodeAcObjectIdentifier(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (ctx->present == 0)
        return 1;
    if (!mandatoryTag<P>(st, rq, 0x06))
        return 1;
    if (!elementStart(st, "Object Identifier"))
        return 0;
    if (!octetFields<P, 3791, 3792, 3793, 3794, 3795, 3796>(st, ctx, rq) ||
        !choiceField<P, 3797>(st, ctx, rq))
        return 0;
    if (ctx->present != 0) {
        int ok = 1;
        switch (g_scratch<P>.choiceTag) {
        case kAcIdClass:
            ok = octetFields<P, 3799, 3800>(st, ctx, rq);
            break;
        case kCap3Class:
        case kCap4Class:
            ok = decodeContextArcs<P, 3877, 3878>(st, ctx, "CAP3", rq);
            break;
        case kCap3OeClass:
        case kCap4OeClass:
            ok = decodeContextArcs<P, 3879, 3880>(st, ctx, "CAP3OE", rq);
            break;
        default: // any other class ends the identifier after the cap arc
            break;
        }
        if (!ok)
            return 0;
    }
    return elementEnd<P>(st, rq);
}

} // namespace

template <Pass P>
int decodeProtocolVersion(DecodeState *st, ElementContext *ctx, uint32_t, Request<P> *rq) {
    if (ctx->present == 0 || !tagTest(st, 0x80))
        return 1;
    return preBoundedElement<P>(st, ctx, rq, "Protocol Version", 8, [&](ElementContext *own) {
        return octetFields<P, 3786, 3787>(st, own, rq) && octetsField<P, 3788>(st, own, rq, 2);
    });
}

template <Pass P>
int decodeApplicationContextName(DecodeState *st, ElementContext *ctx, uint32_t,
                                 Request<P> *rq) {
    if (ctx->present == 0 || !tagTest(st, 0xA1))
        return 1;
    if (!elementStart(st, "Application Context Name") ||
        !octetFields<P, 3789, 3790>(st, ctx, rq) || !decodeAcObjectIdentifier<P>(st, ctx, rq))
        return 0;
    return elementEnd<P>(st, rq);
}

CAMEL_INSTANTIATE_UNIT(decodeProtocolVersion, DecodeState *, ElementContext *, uint32_t);
CAMEL_INSTANTIATE_UNIT(decodeApplicationContextName, DecodeState *, ElementContext *, uint32_t);

} // namespace camel
