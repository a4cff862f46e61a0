#include "cap/units.h"
#include "engine/members.h"
namespace camel {
template <Pass P>
int decodeGenericDigits(DecodeState *, ElementContext *, Request<P> *) { return 1; }
CAMEL_INSTANTIATE_UNIT(decodeGenericDigits, DecodeState *, ElementContext *);
}
