// What follows the invoke id of a Return Result (Last) and of a Return
// Error: the result SEQUENCE with the answered operation's code and, for
// Prompt And Collect User Information and Initiate Call Attempt, their
// results; the error code and the parameters of the four errors that have
// one.
#include <cstdint>

#include "cap/units.h"
#include "engine/members.h"
#include "tcap/units.h"

namespace camel {

namespace {

// ---- Results -------------------------------------------------------------------------

// The digits a Prompt And Collect User Information collected: the type of
// digits (bits 5 to 1 of the first octet, read without consuming it), then
// the generic digits, decoded with the results' field ids.
template <Pass P>
int decodeDigitsResponse(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    Scratch &s = g_scratch<P>;
    const uint32_t saved = s.tagContext;
    s.tagContext |= 0x800000u;
    int ok = fittedBitsField<P>(st, ctx, rq, fx(1647), 0, 5, 0);
    if (ok && ctx->present != 0) {
        s.choiceTag = st->field.value;
        ok = decodeGenericDigits<P>(st, ctx, rq);
    }
    s.tagContext = saved;
    return ok;
}

constexpr Member kReceivedInformation[] = {
    alt(0x80, "Digits Response", 1917, CAMEL_UNIT(decodeDigitsResponse)),
};
constexpr MemberTable kReceivedInformationChoice =
    members(Walk::Choice, kReceivedInformation, 1918);

constexpr Member kInitiateCallAttemptResult[] = {
    el(0x80, "Supported Camel Phases", 4190, 4191, halfOctets(4192, 255)),
    el(0x81, "Offered Camel4 Functionalities", 4193, 4194, halfOctets(4195, 255)),
    el(0xA2, "Extensions", 1481, 0, CAMEL_UNIT(decodeExtensions)),
};
constexpr MemberTable kInitiateCallAttemptResultLoop =
    members(Walk::Loop, kInitiateCallAttemptResult);
// Its identifier is taken whatever it is.
constexpr Member kInitiateCallAttemptRes[] = {
    el(kAnyTag, "Initiate Call Attempt Res", 4169, 4170, table(kInitiateCallAttemptResultLoop)),
};
constexpr MemberTable kInitiateCallAttemptResTable =
    members(Walk::InOrder, kInitiateCallAttemptRes);

// The result decoded after the operation code, by code; codes not listed
// end the result there.
const MemberTable *resultOf(uint32_t code) {
    switch (code) {
    case 48:
        return &kReceivedInformationChoice;
    case 32:
        return &kInitiateCallAttemptResTable;
    default:
        return nullptr;
    }
}

// The operation code group: tag, "  Length" (which does not bound the
// code), the code.
template <Pass P>
int decodeResultOperation(DecodeState *st, ElementContext *ctx, uint32_t inEoc, Request<P> *rq) {
    if (ctx->present == 0 || (inEoc != 0 && ctx->eocSeen != 0))
        return 1;
    if (!decodeOperationCodeTag<P>(st, ctx, rq))
        return 0;
    if (!elementStart(st, "Operation Code (ret Result)"))
        return 0;
    if (!octetField<P>(st, ctx, rq, fx(3684)) || !octetField<P>(st, ctx, rq, fx(1068)))
        return 0;
    if (ctx->present != 0) {
        g_scratch<P>.choiceTag = st->field.value;
        const MemberTable *result = resultOf(st->field.value);
        if (result != nullptr && !walkTable<P>(st, ctx, rq, *result))
            return 0;
    }
    return elementEnd<P>(st, rq);
}

// ---- Errors ---------------------------------------------------------------------------

constexpr Member kCancelFailedMembers[] = {
    el(0x80, "Problem", 1922, 1923, octet(1924)),
    el(0x81, "Operation", 1925, 1926, octet(1927)),
};
constexpr MemberTable kCancelFailedSequence = members(Walk::Mandatory, kCancelFailedMembers);

constexpr Member kCancelFailed[] = {
    el(0x30, "Cancel Failed", 1920, 1921, table(kCancelFailedSequence))};
constexpr Member kRequestedInfoError[] = {
    el(0x0A, "Requested Info Error", 1928, 1929, octet(1930))};
constexpr Member kSystemFailure[] = {el(0x0A, "System Failure", 1931, 1933, octet(1934))};
constexpr Member kTaskRefused[] = {el(0x0A, "Task Refused", 1935, 1936, octet(1937))};

// The parameter of an error code, mandatory where there is one.
const Member *errorParameterOf(uint32_t code) {
    switch (code) {
    case 1:
        return kCancelFailed;
    case 10:
        return kRequestedInfoError;
    case 11:
        return kSystemFailure;
    case 12:
        return kTaskRefused;
    default:
        return nullptr;
    }
}

} // namespace

// The optional result SEQUENCE of a Return Result (Last).
template <Pass P>
int decodeResult(DecodeState *st, ElementContext *ctx, uint32_t inEoc, Request<P> *rq) {
    if (ctx->present == 0 || (inEoc != 0 && ctx->eocSeen != 0) || !tagTest(st, 0x30))
        return 1;
    return delimitedConstruct<P, 3677, 3678>(
        st, ctx, rq, "Sequence", "INLINE BLOCK",
        [&](ElementContext *c, uint32_t e) { return decodeResultOperation<P>(st, c, e, rq); });
}

// The error code of a Return Error, taken whatever its identifier, and the
// error's parameter.
template <Pass P>
int decodeError(DecodeState *st, ElementContext *ctx, uint32_t inEoc, Request<P> *rq) {
    if (ctx->present == 0 || (inEoc != 0 && ctx->eocSeen != 0))
        return 1;
    if (!elementStart(st, "Error Code"))
        return 0;
    if (!octetField<P>(st, ctx, rq, fx(3692)) || !octetField<P>(st, ctx, rq, fx(3693)))
        return 0;
    if (!elementStart(st, "Error Code") || !elementStart(st, "Error Code"))
        return 0;
    if (!octetField<P>(st, ctx, rq, fx(1070)))
        return 0;
    if (ctx->present != 0) {
        g_scratch<P>.choiceTag = st->field.value;
        const Member *parameter = errorParameterOf(st->field.value);
        if (parameter != nullptr && !decodeRow<P>(st, ctx, rq, *parameter, true))
            return 0;
    }
    popPos(st);
    popPos(st);
    return elementEnd<P>(st, rq);
}

CAMEL_INSTANTIATE_UNIT(decodeResult, DecodeState *, ElementContext *, uint32_t);
CAMEL_INSTANTIATE_UNIT(decodeError, DecodeState *, ElementContext *, uint32_t);

} // namespace camel
