// User information of the dialogue PDUs: a list of EXTERNALs, each with an
// optional direct reference, indirect reference and any of the three
// encodings (single ASN.1 type, octet-aligned, arbitrary).
#include "engine/opaque.h"
#include "tcap/dialogue_units.h"

namespace camel {

namespace {

// The list stops after this many EXTERNALs; the rest is left to the
// enclosing window.
constexpr uint32_t kMaxUserInfoItems = 100;

// Indirect reference: an INTEGER (tag 02) with a one-octet length field,
// shown as the digits of up to four octets.
template <Pass P>
int decodeIndirectReference(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (ctx->present == 0 || !tagTest(st, 0x02))
        return 1;
    return preBoundedElement<P>(st, ctx, rq, "Integer", 8, [&](ElementContext *own) {
        return octetFields<P, 3828, 3829>(st, own, rq) && halfOctetField<P, 3830>(st, own, rq, 4);
    });
}

// Single-ASN.1-type encoding ([0]): its contents are walked by the opaque
// walker with the length as budget.
template <Pass P>
int decodeUserSingleAsn1Type(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return wrapperElement<P, 3831, 3832>(
        st, ctx, rq, "Single ASN.1 Type", 0, false, [&](ElementContext *own) {
            const uint32_t length = g_scratch<P>.lengthValue;
            g_scratch<P>.opaqueBudget =
                length > 0x7FFFFFFFu ? 0x7FFFFFFF : static_cast<int32_t>(length);
            return opaqueHead<P>(st, own, rq);
        });
}

// Octet-aligned ([1]) and arbitrary ([2]) encodings: digits of up to four
// octets, the rest of the element skipped.
template <Pass P>
int decodeOctetAligned(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return wrapperElement<P, 3851, 3852>(st, ctx, rq, "Octet-Aligned", 1, false,
                                         [&](ElementContext *own) {
                                             return halfOctetField<P, 3853>(st, own, rq, 4);
                                         });
}

template <Pass P>
int decodeArbitrary(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return wrapperElement<P, 3854, 3855>(st, ctx, rq, "Arbitrary", 2, false,
                                         [&](ElementContext *own) {
                                             return halfOctetField<P, 3856>(st, own, rq, 4);
                                         });
}

// One EXTERNAL of the list (tag 28, tested by the caller).  Every member is
// optional, so more than one encoding may be shown.
template <Pass P>
int decodeUserInfoItem(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return delimitedConstruct<P, 3808, 3809>(
        st, ctx, rq, "External", "INLINE BLOCK",
        [&](ElementContext *c, uint32_t) {
            return fixedObjectIdentifier<P, false, 3819, 3820, 3821, 3822, 3823, 3824, 3825, 3826,
                                         3827>(st, c, rq);
        },
        [&](ElementContext *c, uint32_t) { return decodeIndirectReference<P>(st, c, rq); },
        [&](ElementContext *c, uint32_t) { return decodeUserSingleAsn1Type<P>(st, c, rq); },
        [&](ElementContext *c, uint32_t) { return decodeOctetAligned<P>(st, c, rq); },
        [&](ElementContext *c, uint32_t) { return decodeArbitrary<P>(st, c, rq); });
}

// The EXTERNALs of the user information, one after another while the next
// identifier is 28, at most kMaxUserInfoItems; an empty list is no error.
// Items are counted in the block's occurrence count.  Like every last
// member of an end-of-contents block, the list leaves the octets 00 00 that
// follow it to the enclosing block.
template <Pass P>
int decodeUserInfoElements(DecodeState *st, ElementContext *ctx, uint32_t inEoc,
                           Request<P> *rq) {
    if (!elementStart(st, "User Info Elements"))
        return 0;
    while (ctx->present != 0 && ctx->occurrenceCount < kMaxUserInfoItems &&
           (inEoc == 0 || ctx->eocSeen == 0)) {
        if (!tagTest(st, 0x28))
            break;
        ++ctx->occurrenceCount;
        if (!decodeUserInfoItem<P>(st, ctx, rq))
            return 0;
    }
    return elementEnd<P>(st, rq);
}

} // namespace

template <Pass P>
int decodeUserInformation(DecodeState *st, ElementContext *ctx, uint32_t, Request<P> *rq) {
    if (ctx->present == 0 || !tagTest(st, 0xBE))
        return 1;
    return delimitedConstruct<P, 3801, 3802>(
        st, ctx, rq, "User Information", "INLINE BLOCK",
        [&](ElementContext *c, uint32_t inEoc) { return decodeUserInfoElements<P>(st, c, inEoc, rq); });
}

CAMEL_INSTANTIATE_UNIT(decodeUserInformation, DecodeState *, ElementContext *, uint32_t);

} // namespace camel
