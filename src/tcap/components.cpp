// The component portion: the list of components (Invoke, Return Result
// (Last), Return Error, Reject), their invoke and linked ids, the operation
// code's identifier octet and the Reject's problems.
#include <cstdint>

#include "cap/units.h"
#include "engine/ber.h"
#include "tcap/units.h"

namespace camel {

namespace {

// A component's encoded size (identifier, length octets, contents) as the
// budget of the component list counts it; 1 for the indefinite form.
// Saturates rather than wrapping for a length far beyond any window.
inline uint32_t componentSizeOf(const Scratch &s) {
    const uint64_t size = uint64_t{s.lengthValue} + s.lengthOctetCount + 1;
    return size > UINT32_MAX ? UINT32_MAX : static_cast<uint32_t>(size);
}

inline int32_t budgetAfter(int32_t budget, uint32_t size) {
    const int64_t left = int64_t{budget} - int64_t{size};
    return left < INT32_MIN ? INT32_MIN : static_cast<int32_t>(left);
}

// Invoke Id (tag 02, mandatory) and Linked Id (tag 80, optional): tag,
// length octet and value octet, each a fixed one-octet field.  The length
// octet opens no window; an id of more octets leaves the rest for the next
// element.
template <Pass P, uint32_t Tag, bool Mandatory, uint32_t TagId, uint32_t LengthId,
          uint32_t ValueId>
int decodeIdElement(DecodeState *st, ElementContext *ctx, uint32_t inEoc, const char *name,
                    Request<P> *rq) {
    if (ctx->present == 0 || (inEoc != 0 && ctx->eocSeen != 0))
        return 1;
    if (Mandatory ? !mandatoryTag<P>(st, rq, Tag) : !tagTest(st, Tag))
        return 1;
    return octetFieldsElement<P, TagId, LengthId, ValueId>(st, ctx, rq, name);
}

template <Pass P>
int decodeInvokeId(DecodeState *st, ElementContext *ctx, uint32_t inEoc, Request<P> *rq) {
    return decodeIdElement<P, 0x02, true, 3703, 3704, 3705>(st, ctx, inEoc, "Invoke Id", rq);
}

template <Pass P>
int decodeLinkedId(DecodeState *st, ElementContext *ctx, uint32_t inEoc, Request<P> *rq) {
    return decodeIdElement<P, 0x80, false, 3706, 3707, 3708>(st, ctx, inEoc, "Linked Id", rq);
}

// The Reject's problem identifier (80 to 83), kept in `choiceTag` for the
// problem that follows.
template <Pass P>
int decodeProblemIdentifier(DecodeState *st, ElementContext *ctx, uint32_t inEoc,
                            Request<P> *rq) {
    if (ctx->present == 0 || (inEoc != 0 && ctx->eocSeen != 0))
        return 1;
    if (!octetField<P, 3701>(st, ctx, rq))
        return 0;
    if (ctx->present != 0)
        g_scratch<P>.choiceTag = st->field.value;
    return 1;
}

// The problem the identifier selected: its length octet and its code, each
// one octet.  An identifier outside 80 to 83 selects nothing.
template <Pass P>
int decodeProblem(DecodeState *st, ElementContext *ctx, uint32_t inEoc, Request<P> *rq) {
    if (ctx->present == 0 || (inEoc != 0 && ctx->eocSeen != 0))
        return 1;
    switch (g_scratch<P>.choiceTag) {
    case 0x80:
        return octetFieldsElement<P, 3709, 3710>(st, ctx, rq, "General Problem");
    case 0x81:
        return octetFieldsElement<P, 3711, 3712>(st, ctx, rq, "Invoke Problem");
    case 0x82:
        return octetFieldsElement<P, 3713, 3714>(st, ctx, rq, "Return Result Problem");
    case 0x83:
        return octetFieldsElement<P, 3715, 3716>(st, ctx, rq, "Return Error Problem");
    default:
        return 1;
    }
}

// A component whose tag test has succeeded: tag and length fields, its
// encoded size for the list's budget, then its members in a windowed block
// (definite length) or an EOC-delimited one (indefinite length).
template <Pass P, uint32_t TagId, uint32_t LengthId, class... Members>
int decodeComponentBody(DecodeState *st, ElementContext *ctx, const char *name, Request<P> *rq,
                        Members &&...members) {
    if (!elementStart(st, name))
        return 0;
    if (!octetField<P, TagId>(st, ctx, rq) || !lengthField<P, LengthId>(st, ctx, rq))
        return 0;
    Scratch &s = g_scratch<P>;
    if (ctx->present != 0)
        s.componentSize = componentSizeOf(s);
    if (!contentBlock<P>(st, ctx, rq, "INLINE BLOCK", members...))
        return 0;
    return elementEnd<P>(st, rq);
}

// The four components.  Each is optional where it stands: a failed tag
// test returns at once with nothing reported.

template <Pass P>
int decodeInvoke(DecodeState *st, ElementContext *ctx, uint32_t inEoc, Request<P> *rq) {
    if (ctx->present == 0 || (inEoc != 0 && ctx->eocSeen != 0) || !tagTest(st, 0xA1))
        return 1;
    return decodeComponentBody<P, 3660, 3661>(
        st, ctx, "Invoke Component", rq,
        [&](ElementContext *c, uint32_t e) { return decodeInvokeId<P>(st, c, e, rq); },
        [&](ElementContext *c, uint32_t e) { return decodeLinkedId<P>(st, c, e, rq); },
        [&](ElementContext *c, uint32_t e) { return decodeOperation<P>(st, c, e, rq); });
}

template <Pass P>
int decodeReturnResultLast(DecodeState *st, ElementContext *ctx, uint32_t inEoc,
                           Request<P> *rq) {
    if (ctx->present == 0 || (inEoc != 0 && ctx->eocSeen != 0) || !tagTest(st, 0xA2))
        return 1;
    return decodeComponentBody<P, 3669, 3670>(
        st, ctx, "Return Result (Last)", rq,
        [&](ElementContext *c, uint32_t e) { return decodeInvokeId<P>(st, c, e, rq); },
        [&](ElementContext *c, uint32_t e) { return decodeResult<P>(st, c, e, rq); });
}

template <Pass P>
int decodeReturnError(DecodeState *st, ElementContext *ctx, uint32_t inEoc, Request<P> *rq) {
    if (ctx->present == 0 || (inEoc != 0 && ctx->eocSeen != 0) || !tagTest(st, 0xA3))
        return 1;
    return decodeComponentBody<P, 3685, 3686>(
        st, ctx, "Return Error Component", rq,
        [&](ElementContext *c, uint32_t e) { return decodeInvokeId<P>(st, c, e, rq); },
        [&](ElementContext *c, uint32_t e) { return decodeError<P>(st, c, e, rq); });
}

template <Pass P>
int decodeReject(DecodeState *st, ElementContext *ctx, uint32_t inEoc, Request<P> *rq) {
    if (ctx->present == 0 || (inEoc != 0 && ctx->eocSeen != 0) || !tagTest(st, 0xA4))
        return 1;
    return decodeComponentBody<P, 3694, 3695>(
        st, ctx, "Reject", rq,
        [&](ElementContext *c, uint32_t e) { return decodeInvokeId<P>(st, c, e, rq); },
        [&](ElementContext *c, uint32_t e) { return decodeProblemIdentifier<P>(st, c, e, rq); },
        [&](ElementContext *c, uint32_t e) { return decodeProblem<P>(st, c, e, rq); });
}

// The components of a definite-length portion, one after the other while
// the portion's octet budget lasts.  Each round is one "Component Portion
// Data" element holding the first of the four components whose tag is
// next.  The list ends when the budget is used up, when a component clears
// the present flag (truncated or too long), or at the first round that
// recognises no component (a Return Result Not Last, say, or nothing left):
// the bits from there on are left-over bits of the portion's window.
// Written as a loop so that a long list does not grow the host's stack.
template <Pass P>
int decodeComponentList(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    Scratch &s = g_scratch<P>;
    while (ctx->present != 0) {
        if (!elementStart(st, "Component Portion Data"))
            return 0;
        s.componentSize = 0;
        bool ok = true;
        auto tryAlternative = [&](auto decode) {
            if (ok && ctx->present != 0 && s.componentSize == 0)
                ok = decode(st, ctx, 0u, rq) != 0;
        };
        tryAlternative(decodeInvoke<P>);
        tryAlternative(decodeReturnResultLast<P>);
        tryAlternative(decodeReturnError<P>);
        tryAlternative(decodeReject<P>);
        if (!ok)
            return 0;
        const bool recognised = s.componentSize != 0;
        if (ctx->present != 0)
            s.componentBudget = budgetAfter(s.componentBudget, s.componentSize);
        popPos(st);
        noteStatus<P>(st, rq);
        if (!recognised || s.componentBudget < 1)
            break;
    }
    return 1;
}

} // namespace

// Component portion (tag 6C).  A definite length bounds a list of
// components counted against the portion's length; the indefinite form
// holds at most one component of each kind, in the order Invoke, Return
// Result (Last), Return Error, Reject, closed by the first end-of-contents.
template <Pass P>
int decodeComponentPortion(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (ctx->present == 0 || !tagTest(st, 0x6C))
        return 1;
    if (!elementStart(st, "Component Portion"))
        return 0;
    if (!octetField<P, 3629>(st, ctx, rq) || !lengthField<P, 3630>(st, ctx, rq))
        return 0;
    Scratch &s = g_scratch<P>;
    if (ctx->present != 0)
        s.componentBudget = s.lengthValue > INT32_MAX ? INT32_MAX
                                                      : static_cast<int32_t>(s.lengthValue);
    int ok;
    if (s.lengthValue != 0) {
        ok = contentBlock<P>(st, ctx, rq, "INLINE BLOCK", [&](ElementContext *c, uint32_t) {
            return decodeComponentList<P>(st, c, rq);
        });
    } else {
        ok = contentBlock<P>(
            st, ctx, rq, "INLINE BLOCK",
            [&](ElementContext *c, uint32_t e) { return decodeInvoke<P>(st, c, e, rq); },
            [&](ElementContext *c, uint32_t e) { return decodeReturnResultLast<P>(st, c, e, rq); },
            [&](ElementContext *c, uint32_t e) { return decodeReturnError<P>(st, c, e, rq); },
            [&](ElementContext *c, uint32_t e) { return decodeReject<P>(st, c, e, rq); });
    }
    if (!ok)
        return 0;
    return elementEnd<P>(st, rq);
}

// The identifier octet of an operation code: no value is compared, the
// octet is shown ("Local Operation Code", "Global Operation Code" or an
// empty name) and consumed.
template <Pass P>
int decodeOperationCodeTag(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (ctx->present == 0)
        return 1;
    return octetFieldsElement<P, 3876>(st, ctx, rq, "Operation Code Tag");
}

CAMEL_INSTANTIATE_UNIT(decodeComponentPortion, DecodeState *, ElementContext *);
CAMEL_INSTANTIATE_UNIT(decodeOperationCodeTag, DecodeState *, ElementContext *);

} // namespace camel
