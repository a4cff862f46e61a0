// Operation dispatch: the operation code of an Invoke, named from the
// operation table, and the hand-over of the argument to the unit that
// decodes that operation's argument.
#include <cstdint>

#include "cap/arguments.h"
#include "cap/units.h"
#include "engine/ber.h"
#include "tcap/units.h"

namespace camel {

namespace {

// The argument table of an operation code: the first entry of the code in
// the dispatcher's order.  A code not listed has no argument the module
// decodes: its argument octets are left where they are (in a definite-length
// Invoke they are skipped as left-over bits of its window).
const MemberTable *argumentOf(uint32_t code) {
    for (uint32_t i = 0; i < kArgumentCount; ++i)
        if (kArguments[i].code == code)
            return kArguments[i].table;
    return nullptr;
}

} // namespace

// Operation code tag, then the "Operation Codes" element: a one-octet
// length that does not bound the code, and the one-octet code, kept in
// `choiceTag`.  When either octet is missing the element is absent and no
// argument is decoded.
template <Pass P>
int decodeOperation(DecodeState *st, ElementContext *ctx, uint32_t inEoc, Request<P> *rq) {
    if (ctx->present == 0 || (inEoc != 0 && ctx->eocSeen != 0))
        return 1;
    if (!decodeOperationCodeTag<P>(st, ctx, rq))
        return 0;
    if (!elementStart(st, "Operation Codes"))
        return 0;
    if (!octetField<P, 3668>(st, ctx, rq) || !octetField<P, 1066>(st, ctx, rq))
        return 0;
    if (ctx->present != 0) {
        const uint32_t code = st->field.value;
        g_scratch<P>.choiceTag = code;
        const MemberTable *argument = argumentOf(code);
        if (argument != nullptr && !walkTable<P>(st, ctx, rq, *argument))
            return 0;
    }
    return elementEnd<P>(st, rq);
}

CAMEL_INSTANTIATE_UNIT(decodeOperation, DecodeState *, ElementContext *, uint32_t);

} // namespace camel
