// The TCAP grammar units other units call across files.
#pragma once

#include <cstdint>

#include "engine/pass.h"

namespace camel {

// The TCAP message: the top unit of every pass.
template <Pass P>
int decodeMessage(DecodeState *st, ElementContext *ctx, Request<P> *rq);

// Structured dialogue portion (tag 6B) of Begin, End, Continue and Abort;
// optional: returns at once when the tag is not next.
template <Pass P>
int decodeDialoguePortion(DecodeState *st, ElementContext *ctx, Request<P> *rq);

// External of the Unidirectional message's dialogue portion (tag 28,
// mandatory), in an EOC-delimited block when inEoc is 1.
template <Pass P>
int decodeUniExternal(DecodeState *st, ElementContext *ctx, uint32_t inEoc, Request<P> *rq);

// Component portion (tag 6C); optional: returns at once when the tag is
// not next.
template <Pass P>
int decodeComponentPortion(DecodeState *st, ElementContext *ctx, Request<P> *rq);

// The identifier octet of an operation code, shown and consumed whatever it
// is; the first step of the operation dispatcher and of the result decoder.
template <Pass P>
int decodeOperationCodeTag(DecodeState *st, ElementContext *ctx, Request<P> *rq);

// The optional result SEQUENCE of a Return Result (Last), after its invoke
// id; inEoc is 1 when the component has the indefinite form.
template <Pass P>
int decodeResult(DecodeState *st, ElementContext *ctx, uint32_t inEoc, Request<P> *rq);

// The error code and parameter of a Return Error, after its invoke id.
template <Pass P>
int decodeError(DecodeState *st, ElementContext *ctx, uint32_t inEoc, Request<P> *rq);

} // namespace camel
