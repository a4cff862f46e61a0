// PLACEHOLDER: every unit below still has to be written (it decodes nothing yet).
#include "cap/units.h"
#include "engine/members.h"

namespace camel {

template <Pass P>
int decodeCugIndex(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeCugIndex, DecodeState *, ElementContext *);

template <Pass P>
int decodeImsi(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeImsi, DecodeState *, ElementContext *);

template <Pass P>
int decodeSubscriberState(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeSubscriberState, DecodeState *, ElementContext *);

template <Pass P>
int decodeLocationInformation(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeLocationInformation, DecodeState *, ElementContext *);

template <Pass P>
int decodeIsdnAddressString(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeIsdnAddressString, DecodeState *, ElementContext *);

template <Pass P>
int decodeCalledPartyBcdNumber(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeCalledPartyBcdNumber, DecodeState *, ElementContext *);

template <Pass P>
int decodeTimeAndTimezone(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeTimeAndTimezone, DecodeState *, ElementContext *);

template <Pass P>
int decodeInitialDpArgExtension(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeInitialDpArgExtension, DecodeState *, ElementContext *);

template <Pass P>
int decodeTimerId(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeTimerId, DecodeState *, ElementContext *);

template <Pass P>
int decodeTimerValue(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeTimerValue, DecodeState *, ElementContext *);

template <Pass P>
int decodeDisconnectFromIpForbidden(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeDisconnectFromIpForbidden, DecodeState *, ElementContext *);

template <Pass P>
int decodeRequestAnnounceComplete(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeRequestAnnounceComplete, DecodeState *, ElementContext *);

template <Pass P>
int decodeRequestAnnouncementStartedNotification(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeRequestAnnouncementStartedNotification, DecodeState *, ElementContext *);

template <Pass P>
int decodeCollectInfo(DecodeState *, ElementContext *, Request<P> *) {
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeCollectInfo, DecodeState *, ElementContext *);

} // namespace camel
