// The opaque walker: shows the contents of an element whose ASN.1 type the
// grammar does not name (the single-ASN.1-type encoding of user
// information) as a flat run of identifier, length and value fields.
//
// The caller sets `opaqueBudget` to the number of content octets and calls
// the head part.  Each element's identifier costs two octets of the budget
// (identifier and length); a primitive element also costs its value octets
// and is walked inside a window of its own, while a constructed element
// only shows its length and the walk goes on with its first inner element.
// Nested elements are thus walked flat in one loop, whatever their depth.
// Only one-octet identifiers and short-form lengths are understood.
#pragma once

#include <cstdint>

#include "engine/pass.h"

namespace camel {

// Head part: walks elements while budget remains and `ctx` is present.
template <Pass P>
int opaqueHead(DecodeState *st, ElementContext *ctx, Request<P> *rq);

// Value part: one "ASN Type VALUE" field per octet of the primitive element
// whose length is in `opaqueLength`, as far as its window goes.
template <Pass P>
int opaqueValue(DecodeState *st, ElementContext *ctx, Request<P> *rq);

} // namespace camel
