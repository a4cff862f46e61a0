// Operation dispatch: the operation code of an Invoke, named from the
// operation table, and the hand-over of the argument to the unit that
// decodes that operation's argument.
#include <cstdint>

#include "cap/units.h"
#include "engine/ber.h"
#include "tcap/units.h"

namespace camel {

namespace {

// The unit that decodes one operation's argument, starting at the
// argument's identifier octet.
template <Pass P>
using ArgumentUnit = int (*)(DecodeState *, ElementContext *, Request<P> *);

template <Pass P>
struct ArgumentEntry {
    uint32_t code;
    ArgumentUnit<P> decode; // null: the operation carries no argument
};

// Argument units by operation code, compared in this order; the first
// match wins.  A code not listed here has no argument the module decodes:
// its argument octets are left where they are (in a definite-length Invoke
// they are skipped as left-over bits of its window).
template <Pass P>
inline constexpr ArgumentEntry<P> kArgumentUnits[] = {
    {55, nullptr}, // Activity Test
    {31, nullptr}, // Continue
    {18, nullptr}, // Disconnect Forward Connection
    {65, nullptr}, // SMS Continue
    {70, nullptr}, // GPRS Activity Test
};

template <Pass P>
ArgumentUnit<P> argumentUnitOf(uint32_t code) {
    for (const ArgumentEntry<P> &entry : kArgumentUnits<P>)
        if (entry.code == code)
            return entry.decode;
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
        const ArgumentUnit<P> decodeArgument = argumentUnitOf<P>(code);
        if (decodeArgument != nullptr && !decodeArgument(st, ctx, rq))
            return 0;
    }
    return elementEnd<P>(st, rq);
}

CAMEL_INSTANTIATE_UNIT(decodeOperation, DecodeState *, ElementContext *, uint32_t);

} // namespace camel
