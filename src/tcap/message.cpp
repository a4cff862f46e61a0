// The TCAP message: message type, message window, transaction ids, P-Abort
// cause, and the hand-over to the dialogue and component portions.
#include "engine/ber.h"
#include "tcap/units.h"

namespace camel {

namespace {

enum : uint32_t {
    kUnidirectional = 0x61,
    kBegin = 0x62,
    kEnd = 0x64,
    kContinue = 0x65,
    kAbort = 0x67,
};

// Originating (tag 48) and destination (tag 49) transaction ids: tag,
// length and up to four octets shown as hexadecimal digits.  Mandatory.
template <Pass P, uint32_t Tag, uint32_t TagId, uint32_t LengthId, uint32_t ValueId>
int decodeTransactionId(DecodeState *st, ElementContext *ctx, const char *name,
                        Request<P> *rq) {
    if (ctx->present == 0 || !mandatoryTag<P>(st, rq, Tag))
        return 1;
    // A length beyond the message clears ctx: the later elements are not
    // decoded.  Octets beyond the fourth are skipped and flagged.
    return preBoundedElement<P>(st, ctx, rq, name, 8, [&](ElementContext *own) {
        return octetField<P, TagId>(st, own, rq) && lengthField<P, LengthId>(st, own, rq) &&
               halfOctetField<P, ValueId>(st, own, rq, 4);
    });
}

template <Pass P>
int decodeOriginatingId(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return decodeTransactionId<P, 0x48, 3651, 3652, 3653>(st, ctx, "Originating Transaction Id", rq);
}

template <Pass P>
int decodeDestinationId(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return decodeTransactionId<P, 0x49, 3654, 3655, 3656>(st, ctx, "Destination Transaction Id", rq);
}

// P-Abort cause (tag 4A, optional): its length octet is a plain count and
// the cause is always one octet.
template <Pass P>
int decodePAbortCause(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (ctx->present == 0 || !tagTest(st, 0x4A))
        return 1;
    if (!elementStart(st, "P-Abort Cause"))
        return 0;
    const uint64_t window = room(st, 16) ? 16 + 8ull * octetAt(st, 8) : ~0ull;
    if (!narrowWindow(st, window))
        ctx->present = 0; // the dialogue portion that may follow is not decoded
    if (!pushEnd(st))
        return 0;
    ElementContext own{0, 1, 0, 0};
    if (!octetFields<P, 3657, 3658, 3659>(st, &own, rq))
        return 0;
    closeElementWindow<P>(st, rq);
    return 1;
}

// The Unidirectional message's dialogue portion, decoded inline: its block
// holds the unidirectional External.
template <Pass P>
int decodeUnstructDialoguePortion(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (ctx->present == 0 || !tagTest(st, 0x6B))
        return 1;
    return delimitedConstruct<P, 3615, 3616>(
        st, ctx, rq, "Unstruct Dialogue Portion", "INLINE BLOCK",
        [&](ElementContext *c, uint32_t inEoc) { return decodeUniExternal<P>(st, c, inEoc, rq); });
}

// The contents of one message type, in decoding order.
template <Pass P>
int decodeContents(DecodeState *st, ElementContext *ctx, uint32_t type, Request<P> *rq) {
    switch (type) {
    case kUnidirectional:
        if (!decodeUnstructDialoguePortion<P>(st, ctx, rq))
            return 0;
        if (ctx->present != 0 && !mandatoryTag<P>(st, rq, 0x6C))
            return 1;
        return decodeComponentPortion<P>(st, ctx, rq);
    case kBegin:
        return decodeOriginatingId<P>(st, ctx, rq) && decodeDialoguePortion<P>(st, ctx, rq) &&
               decodeComponentPortion<P>(st, ctx, rq);
    case kEnd:
        return decodeDestinationId<P>(st, ctx, rq) && decodeDialoguePortion<P>(st, ctx, rq) &&
               decodeComponentPortion<P>(st, ctx, rq);
    case kContinue:
        return decodeOriginatingId<P>(st, ctx, rq) && decodeDestinationId<P>(st, ctx, rq) &&
               decodeDialoguePortion<P>(st, ctx, rq) && decodeComponentPortion<P>(st, ctx, rq);
    case kAbort:
        return decodeDestinationId<P>(st, ctx, rq) && decodePAbortCause<P>(st, ctx, rq) &&
               decodeDialoguePortion<P>(st, ctx, rq);
    default:
        return 1;
    }
}

// The message window: the length after the type octet bounds the message.
// A length that runs past the data (or whose octets are missing) is flagged
// and the contents are decoded against what is there.
template <Pass P, uint32_t LengthId>
int decodeMessageBody(DecodeState *st, uint32_t type, const char *name, Request<P> *rq) {
    ElementContext message{0, 1, 0, 0};
    if (!elementStart(st, name))
        return 0;
    const LengthPeek len = peekLength(st, 0);
    if (len.fits)
        narrowWindow(st, len.bits + len.value * 8);
    else
        st->errorFlags |= DPX_ERR_LENGTH_BEYOND;
    if (!pushEnd(st))
        return 0;
    if (!lengthField<P, LengthId>(st, &message, rq))
        return 0;
    if (!decodeContents<P>(st, &message, type, rq))
        return 0;
    closeElementWindow<P>(st, rq);
    return 1;
}

} // namespace

template <Pass P>
int decodeMessage(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    (void)ctx;
    if (!elementStart(st, "Operation code (invoke)") || !elementStart(st, "CCITT White Book TCAP "))
        return 0;
    if (room(st, 8)) {
        if (!bitsField<P, 3604>(st, rq, 0, 8, 8))
            return 0;
        const uint32_t type = st->field.value;
        g_scratch<P>.messageType = type;
        int ok = 1;
        switch (type) {
        case kUnidirectional:
            ok = decodeMessageBody<P, 3606>(st, type, "Unidirectional Message", rq);
            break;
        case kBegin:
            ok = decodeMessageBody<P, 3608>(st, type, "Begin Message", rq);
            break;
        case kEnd:
            ok = decodeMessageBody<P, 3611>(st, type, "EndMessage", rq);
            break;
        case kContinue:
            ok = decodeMessageBody<P, 3612>(st, type, "Continue Message", rq);
            break;
        case kAbort:
            ok = decodeMessageBody<P, 3613>(st, type, "Abort Message", rq);
            break;
        default:
            break;
        }
        if (!ok)
            return 0;
    }
    popPos(st);
    return elementEnd<P>(st, rq);
}

CAMEL_INSTANTIATE_UNIT(decodeMessage, DecodeState *, ElementContext *);

} // namespace camel
