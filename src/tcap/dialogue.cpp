// The dialogue portion: the structured dialogue of Begin, Continue, End and
// Abort (dialogue request, response and abort inside an EXTERNAL), and the
// EXTERNAL of the Unidirectional message's unidirectional dialogue.
#include "tcap/dialogue_units.h"
#include "tcap/units.h"

namespace camel {

namespace {

enum : uint32_t {
    kDialogueRequest = 0x60,
    kDialogueResponse = 0x61,
    kDialogueAbort = 0x64,
};

// ---- Result and its diagnostic (dialogue response) ------------------------

// The result INTEGER (tag 02, mandatory) as fixed one-octet fields.
template <Pass P>
int decodeResultInteger(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (ctx->present == 0)
        return 1;
    if (!mandatoryTag<P>(st, rq, 0x02))
        return 1;
    return octetFieldsElement<P, 3772, 3773, 3774>(st, ctx, rq, "Integer");
}

template <Pass P>
int decodeResult(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (ctx->present == 0 || !tagTest(st, 0xA2))
        return 1;
    return delimitedConstruct<P, 3766, 3767>(
        st, ctx, rq, "Result", "INLINE BLOCK",
        [&](ElementContext *c, uint32_t) { return decodeResultInteger<P>(st, c, rq); });
}

// A diagnostic alternative: a delimited construct holding an INTEGER whose
// tag, length and value octets are taken without a tag test (in the
// end-of-contents form each after an end-of-contents check).
template <Pass P, uint32_t TagId, uint32_t LengthId, uint32_t IntTagId, uint32_t IntLengthId,
          uint32_t ValueId>
int decodeDiagnosticAlternative(DecodeState *st, ElementContext *ctx, const char *name,
                                Request<P> *rq) {
    return delimitedConstruct<P, TagId, LengthId>(
        st, ctx, rq, name, "INLINE BLOCK",
        [&](ElementContext *c, uint32_t) { return octetField<P, IntTagId>(st, c, rq); },
        [&](ElementContext *c, uint32_t) { return octetField<P, IntLengthId>(st, c, rq); },
        [&](ElementContext *c, uint32_t) { return octetField<P, ValueId>(st, c, rq); });
}

// Dialogue service diagnostic: service user (A1) or, when that does not
// match, service provider (A2); neither is no error.
template <Pass P>
int decodeDiagnostic(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (ctx->present == 0)
        return 1;
    if (!elementStart(st, "INLINE BLOCK"))
        return 0;
    int ok = 1;
    if (tagTest(st, 0xA1))
        ok = decodeDiagnosticAlternative<P, 3858, 3859, 3864, 3865, 3866>(st, ctx, "Service User",
                                                                         rq);
    else if (tagTest(st, 0xA2))
        ok = decodeDiagnosticAlternative<P, 3867, 3868, 3873, 3874, 3875>(
            st, ctx, "Service Provider", rq);
    if (!ok)
        return 0;
    return elementEnd<P>(st, rq);
}

template <Pass P>
int decodeResultSourceDiagnostic(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (ctx->present == 0 || !tagTest(st, 0xA3))
        return 1;
    return delimitedConstruct<P, 3775, 3776>(
        st, ctx, rq, "Result Source Diagnostic", "INLINE BLOCK",
        [&](ElementContext *c, uint32_t) { return decodeDiagnostic<P>(st, c, rq); });
}

// Abort source (tag 80, optional) as fixed one-octet fields.
template <Pass P>
int decodeAbortSource(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (ctx->present == 0 || !tagTest(st, 0x80))
        return 1;
    return octetFieldsElement<P, 3783, 3784, 3785>(st, ctx, rq, "Abort Source");
}

// ---- Structured dialogue -------------------------------------------------------

// A dialogue PDU whose identifier the "Dialogue PDU" field has consumed:
// its window comes from its length octets (definite lengths only), then its
// members in order with the PDU's own context.
template <Pass P, uint32_t LengthId, class... Members>
int decodeDialoguePdu(DecodeState *st, ElementContext *ctx, const char *name, Request<P> *rq,
                      Members &&...members) {
    return preBoundedElement<P>(st, ctx, rq, name, 0, [&](ElementContext *own) {
        if (!lengthField<P, LengthId>(st, own, rq))
            return 0;
        bool ok = true;
        ((ok = ok && members(own) != 0), ...);
        return ok ? 1 : 0;
    });
}

// The contents of the [0] wrapper: the "Dialogue PDU" identifier, kept in
// choiceTag, selects the PDU.  Other identifiers are shown by value only.
template <Pass P>
int decodeStructuredDialogue(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (ctx->present == 0)
        return 1;
    if (!elementStart(st, "Structured Dialogue") || !choiceField<P, 3760>(st, ctx, rq))
        return 0;
    auto protocolVersion = [&](ElementContext *c) { return decodeProtocolVersion<P>(st, c, 0, rq); };
    auto contextName = [&](ElementContext *c) {
        return decodeApplicationContextName<P>(st, c, 0, rq);
    };
    auto userInformation = [&](ElementContext *c) { return decodeUserInformation<P>(st, c, 0, rq); };
    int ok = 1;
    if (ctx->present != 0) {
        switch (g_scratch<P>.choiceTag) {
        case kDialogueRequest:
            ok = decodeDialoguePdu<P, 3762>(st, ctx, "DialogueRequest", rq, protocolVersion,
                                            contextName, userInformation);
            break;
        case kDialogueResponse:
            ok = decodeDialoguePdu<P, 3763>(
                st, ctx, "DialogueResponse", rq, protocolVersion, contextName,
                [&](ElementContext *c) { return decodeResult<P>(st, c, rq); },
                [&](ElementContext *c) { return decodeResultSourceDiagnostic<P>(st, c, rq); },
                userInformation);
            break;
        case kDialogueAbort:
            ok = decodeDialoguePdu<P, 3781>(
                st, ctx, "Dialogue Abort", rq,
                [&](ElementContext *c) { return decodeAbortSource<P>(st, c, rq); },
                userInformation);
            break;
        default:
            break;
        }
    }
    if (!ok)
        return 0;
    return elementEnd<P>(st, rq);
}

// An External of a dialogue portion (tag 28, mandatory): the dialogue-as
// identifier as fixed arcs, then the [0] wrapper whose contents `pdu`
// decodes.
template <Pass P, uint32_t TagId, uint32_t LengthId, uint32_t WrapperTagId,
          uint32_t WrapperLengthId, uint32_t... OidIds, class Pdu>
int decodeDialogueExternal(DecodeState *st, ElementContext *ctx, Request<P> *rq, Pdu &&pdu) {
    if (ctx->present == 0 || !mandatoryTag<P>(st, rq, 0x28))
        return 1;
    return delimitedConstruct<P, TagId, LengthId>(
        st, ctx, rq, "External", "INLINE BLOCK",
        [&](ElementContext *c, uint32_t) {
            return fixedObjectIdentifier<P, true, OidIds...>(st, c, rq);
        },
        [&](ElementContext *c, uint32_t) {
            return wrapperElement<P, WrapperTagId, WrapperLengthId>(st, c, rq, "Single ASN.1 Type",
                                                                   0, true, pdu);
        });
}

// ---- Unidirectional dialogue -----------------------------------------------------

// The unidirectional dialogue PDU (tag 60, mandatory): a delimited
// construct of the shared PDU members.
template <Pass P>
int decodeUnidirectionalDialogue(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (ctx->present == 0)
        return 1;
    if (!mandatoryTag<P>(st, rq, 0x60))
        return 1;
    return delimitedConstruct<P, 3728, 3729>(
        st, ctx, rq, "Unidirectional Dialogue", "INLINE BLOCK",
        [&](ElementContext *c, uint32_t inEoc) { return decodeProtocolVersion<P>(st, c, inEoc, rq); },
        [&](ElementContext *c, uint32_t inEoc) {
            return decodeApplicationContextName<P>(st, c, inEoc, rq);
        },
        [&](ElementContext *c, uint32_t inEoc) { return decodeUserInformation<P>(st, c, inEoc, rq); });
}

} // namespace

template <Pass P>
int decodeDialoguePortion(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (ctx->present == 0 || !tagTest(st, 0x6B))
        return 1;
    return delimitedConstruct<P, 3737, 3738>(
        st, ctx, rq, "Dialogue Portion", "INLINE BLOCK", [&](ElementContext *c, uint32_t) {
            return decodeDialogueExternal<P, 3743, 3744, 3758, 3759, 3749, 3750, 3751, 3752, 3753,
                                          3754, 3755, 3756, 3757>(
                st, c, rq,
                [&](ElementContext *own) { return decodeStructuredDialogue<P>(st, own, rq); });
        });
}

template <Pass P>
int decodeUniExternal(DecodeState *st, ElementContext *ctx, uint32_t inEoc, Request<P> *rq) {
    if (inEoc != 0 && ctx->eocSeen != 0)
        return 1;
    return decodeDialogueExternal<P, 3622, 3623, 3726, 3727, 3717, 3718, 3719, 3720, 3721, 3722,
                                  3723, 3724, 3725>(
        st, ctx, rq,
        [&](ElementContext *own) { return decodeUnidirectionalDialogue<P>(st, own, rq); });
}

CAMEL_INSTANTIATE_UNIT(decodeDialoguePortion, DecodeState *, ElementContext *);
CAMEL_INSTANTIATE_UNIT(decodeUniExternal, DecodeState *, ElementContext *, uint32_t);

} // namespace camel
