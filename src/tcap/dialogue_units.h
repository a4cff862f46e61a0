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

// An OBJECT IDENTIFIER (tag 06) read as fixed one-octet fields: tag, length
// and one field per arc.  No arc value is compared.
template <Pass P, bool Mandatory, uint32_t... Ids>
int fixedObjectIdentifier(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (ctx->present == 0)
        return 1;
    if (Mandatory ? !mandatoryTag<P>(st, rq, 0x06) : !tagTest(st, 0x06))
        return 1;
    return octetFieldsElement<P, Ids...>(st, ctx, rq, "Object Identifier");
}

} // namespace camel
