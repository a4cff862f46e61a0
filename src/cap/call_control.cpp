// PLACEHOLDER: every unit below still has to be written (it decodes nothing yet).
#include "cap/units.h"
#include "engine/members.h"

namespace camel {

template <Pass P>
int decodeExtensions(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeExtensions, DecodeState *, ElementContext *);

template <Pass P>
int decodeSendingSideId(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeSendingSideId, DecodeState *, ElementContext *);

template <Pass P>
int decodeReceivingSideId(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeReceivingSideId, DecodeState *, ElementContext *);

template <Pass P>
int decodeLegId(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeLegId, DecodeState *, ElementContext *);

template <Pass P>
int decodeCallSegmentId(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeCallSegmentId, DecodeState *, ElementContext *);

template <Pass P>
int decodeServiceKey(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeServiceKey, DecodeState *, ElementContext *);

template <Pass P>
int decodeRequestedInformationList(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeRequestedInformationList, DecodeState *, ElementContext *);

template <Pass P>
int decodeRequestedInfoTypeList(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeRequestedInfoTypeList, DecodeState *, ElementContext *);

template <Pass P>
int decodeServiceInteractionIndicatorsTwo(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeServiceInteractionIndicatorsTwo, DecodeState *, ElementContext *);

template <Pass P>
int decodeCugInterlock(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeCugInterlock, DecodeState *, ElementContext *);

template <Pass P>
int decodeCugOutgoingAccess(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeCugOutgoingAccess, DecodeState *, ElementContext *);

template <Pass P>
int decodeNoneNull(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeNoneNull, DecodeState *, ElementContext *);

template <Pass P>
int decodeNaOliInfo(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeNaOliInfo, DecodeState *, ElementContext *);

template <Pass P>
int decodeContinueWithArgumentArgExtension(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeContinueWithArgumentArgExtension, DecodeState *, ElementContext *);

template <Pass P>
int decodeEventTypeBcsm(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeEventTypeBcsm, DecodeState *, ElementContext *);

template <Pass P>
int decodeBcsmEvents(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeBcsmEvents, DecodeState *, ElementContext *);

template <Pass P>
int decodeEventSpecificInfoBcsm(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeEventSpecificInfoBcsm, DecodeState *, ElementContext *);

template <Pass P>
int decodeExtBasicServiceCode(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeExtBasicServiceCode, DecodeState *, ElementContext *);

template <Pass P>
int decodeIpSspCapabilities(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeIpSspCapabilities, DecodeState *, ElementContext *);

template <Pass P>
int decodeCgEncountered(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeCgEncountered, DecodeState *, ElementContext *);

template <Pass P>
int decodeMiscCallInfo(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeMiscCallInfo, DecodeState *, ElementContext *);

template <Pass P>
int decodeScfId(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeScfId, DecodeState *, ElementContext *);

} // namespace camel
