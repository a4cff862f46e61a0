// PLACEHOLDER: every unit below still has to be written (it decodes nothing yet).
#include "cap/units.h"
#include "engine/members.h"

namespace camel {

template <Pass P>
int decodeCalledPartyNumber(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeCalledPartyNumber, DecodeState *, ElementContext *);

template <Pass P>
int decodeIsupAddress(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeIsupAddress, DecodeState *, ElementContext *);

template <Pass P>
int decodeCallingPartyNumber(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeCallingPartyNumber, DecodeState *, ElementContext *);

template <Pass P>
int decodeOriginalCalledPartyId(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeOriginalCalledPartyId, DecodeState *, ElementContext *);

template <Pass P>
int decodeRedirectingPartyId(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeRedirectingPartyId, DecodeState *, ElementContext *);

template <Pass P>
int decodeRedirectionInformation(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeRedirectionInformation, DecodeState *, ElementContext *);

template <Pass P>
int decodeChargeNumber(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeChargeNumber, DecodeState *, ElementContext *);

template <Pass P>
int decodeLocationNumber(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeLocationNumber, DecodeState *, ElementContext *);

template <Pass P>
int decodeGenericNumbers(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeGenericNumbers, DecodeState *, ElementContext *);

template <Pass P>
int decodeGenericNumber(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeGenericNumber, DecodeState *, ElementContext *);

template <Pass P>
int decodeAdditionalCallingPartyNumber(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeAdditionalCallingPartyNumber, DecodeState *, ElementContext *);

template <Pass P>
int decodeCallingPartysCategory(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeCallingPartysCategory, DecodeState *, ElementContext *);

template <Pass P>
int decodeCarrier(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeCarrier, DecodeState *, ElementContext *);

template <Pass P>
int decodeAlertingPattern(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeAlertingPattern, DecodeState *, ElementContext *);

template <Pass P>
int decodeCause(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeCause, DecodeState *, ElementContext *);

template <Pass P>
int decodeHighLayerCompatibility(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeHighLayerCompatibility, DecodeState *, ElementContext *);

template <Pass P>
int decodeBearerCapability(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeBearerCapability, DecodeState *, ElementContext *);

} // namespace camel
