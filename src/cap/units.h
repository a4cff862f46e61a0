// The CAMEL grammar units other units call across files.
#pragma once

#include <cstdint>

#include "engine/pass.h"

namespace camel {

// The operation of an Invoke: operation code tag, length and code, then the
// argument of that operation.  Called by the Invoke's content block with
// the cursor at the operation code's identifier octet; inEoc is 1 when the
// Invoke has the indefinite form.
template <Pass P>
int decodeOperation(DecodeState *st, ElementContext *ctx, uint32_t inEoc, Request<P> *rq);

} // namespace camel
