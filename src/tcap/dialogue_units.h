// Units and element shapes shared by the dialogue portion's files: the PDU
// members every dialogue PDU may carry, and the element shapes the dialogue
// grammar uses again and again.
#pragma once

#include <cstdint>

#include "engine/ber.h"

namespace camel {

// ---- PDU members shared by the request, response, abort and unidirectional
// PDUs.  Each is optional and returns at once when its tag is not next.

// Protocol Version (tag 80): up to two octets.
template <Pass P>
int decodeProtocolVersion(DecodeState *st, ElementContext *ctx, uint32_t inEoc, Request<P> *rq);

// Application Context Name (tag A1) and its OBJECT IDENTIFIER, decoded down
// to the CAMEL application context.
template <Pass P>
int decodeApplicationContextName(DecodeState *st, ElementContext *ctx, uint32_t inEoc,
                                 Request<P> *rq);

// User Information (tag BE): up to 100 EXTERNALs.
template <Pass P>
int decodeUserInformation(DecodeState *st, ElementContext *ctx, uint32_t inEoc, Request<P> *rq);

// ---- Element shapes ----------------------------------------------------------

// A run of fixed one-octet fields (tags, one-octet lengths, OBJECT
// IDENTIFIER arcs): each taken while the element is present and its octet
// is in the window, whatever the length octets say.
template <Pass P, uint32_t... Ids>
inline int octetFields(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return ((octetField<P, Ids>(st, ctx, rq) != 0) && ...) ? 1 : 0;
}

// An OBJECT IDENTIFIER (tag 06) read as fixed one-octet fields: tag, length
// and one field per arc.  No arc value is compared.
template <Pass P, bool Mandatory, uint32_t... Ids>
int fixedObjectIdentifier(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (ctx->present == 0)
        return 1;
    if (!tagTest(st, 0x06)) {
        if (Mandatory)
            mandatoryMissing(st);
        noteStatus<P>(st, rq);
        return 1;
    }
    if (!elementStart(st, "Object Identifier") || !octetFields<P, Ids...>(st, ctx, rq))
        return 0;
    popPos(st);
    noteStatus<P>(st, rq);
    return 1;
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

} // namespace camel
