// The CAMEL grammar units other units and the argument tables call across
// files.  Unless a comment says otherwise, a type unit is called inside its
// element's window right after the element's tag field and starts at its
// own length field.
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

#define CAMEL_DECLARE_UNIT(unit)                                                            \
    template <Pass P>                                                                       \
    int unit(DecodeState *st, ElementContext *ctx, Request<P> *rq)

// ---- Party numbers and ISUP / Q.931 parameters (party_numbers.cpp, isup.cpp,
// ---- q931.cpp)
CAMEL_DECLARE_UNIT(decodeCalledPartyNumber);
CAMEL_DECLARE_UNIT(decodeIsupAddress);              // after its length: the called-party address body
CAMEL_DECLARE_UNIT(decodeCallingPartyNumber);
CAMEL_DECLARE_UNIT(decodeOriginalCalledPartyId);
CAMEL_DECLARE_UNIT(decodeRedirectingPartyId);
CAMEL_DECLARE_UNIT(decodeRedirectionInformation);
CAMEL_DECLARE_UNIT(decodeChargeNumber);
CAMEL_DECLARE_UNIT(decodeLocationNumber);
CAMEL_DECLARE_UNIT(decodeGenericNumbers);
CAMEL_DECLARE_UNIT(decodeGenericNumber);            // after its length: the digits form
CAMEL_DECLARE_UNIT(decodeAdditionalCallingPartyNumber); // after its length
CAMEL_DECLARE_UNIT(decodeCallingPartysCategory);
CAMEL_DECLARE_UNIT(decodeCarrier);
CAMEL_DECLARE_UNIT(decodeAlertingPattern);
CAMEL_DECLARE_UNIT(decodeCause);
CAMEL_DECLARE_UNIT(decodeHighLayerCompatibility);
CAMEL_DECLARE_UNIT(decodeBearerCapability);

// ---- Call-control types (call_control.cpp, bcsm.cpp)
CAMEL_DECLARE_UNIT(decodeExtensions);
CAMEL_DECLARE_UNIT(decodeSendingSideId);
CAMEL_DECLARE_UNIT(decodeReceivingSideId);
CAMEL_DECLARE_UNIT(decodeLegId);
CAMEL_DECLARE_UNIT(decodeCallSegmentId);
CAMEL_DECLARE_UNIT(decodeServiceKey);
CAMEL_DECLARE_UNIT(decodeRequestedInformationList); // after its length
CAMEL_DECLARE_UNIT(decodeRequestedInfoTypeList);    // after its length
CAMEL_DECLARE_UNIT(decodeServiceInteractionIndicatorsTwo);
CAMEL_DECLARE_UNIT(decodeCugInterlock);
CAMEL_DECLARE_UNIT(decodeCugOutgoingAccess);
CAMEL_DECLARE_UNIT(decodeNoneNull);                 // the "None" NULL: its length only
CAMEL_DECLARE_UNIT(decodeNaOliInfo);
CAMEL_DECLARE_UNIT(decodeContinueWithArgumentArgExtension); // after its length
CAMEL_DECLARE_UNIT(decodeEventTypeBcsm);
CAMEL_DECLARE_UNIT(decodeBcsmEvents);               // after its length
CAMEL_DECLARE_UNIT(decodeEventSpecificInfoBcsm);
CAMEL_DECLARE_UNIT(decodeExtBasicServiceCode);      // after its length
CAMEL_DECLARE_UNIT(decodeIpSspCapabilities);
CAMEL_DECLARE_UNIT(decodeCgEncountered);
CAMEL_DECLARE_UNIT(decodeMiscCallInfo);
CAMEL_DECLARE_UNIT(decodeScfId);

// ---- Mobile identities, location and time (mobile.cpp, location.cpp)
CAMEL_DECLARE_UNIT(decodeCugIndex);
CAMEL_DECLARE_UNIT(decodeImsi);
CAMEL_DECLARE_UNIT(decodeSubscriberState);          // after its length
CAMEL_DECLARE_UNIT(decodeLocationInformation);
CAMEL_DECLARE_UNIT(decodeIsdnAddressString);
CAMEL_DECLARE_UNIT(decodeCalledPartyBcdNumber);
CAMEL_DECLARE_UNIT(decodeTimeAndTimezone);
CAMEL_DECLARE_UNIT(decodeTimerId);
CAMEL_DECLARE_UNIT(decodeTimerValue);
CAMEL_DECLARE_UNIT(decodeDisconnectFromIpForbidden);
CAMEL_DECLARE_UNIT(decodeRequestAnnounceComplete);
CAMEL_DECLARE_UNIT(decodeRequestAnnouncementStartedNotification);
CAMEL_DECLARE_UNIT(decodeCollectInfo);

// ---- Charging, call gap and information to send (charging.cpp,
// ---- information_to_send.cpp)
CAMEL_DECLARE_UNIT(decodeAChChargingAddress);       // after its length
CAMEL_DECLARE_UNIT(decodeAppendFreeFormatData);     // after its length
// Generic Digits from the octet that starts with the type of digits, right
// after the "Type Of Digits" field (which consumes nothing): the encoding
// scheme, then the digits it names.  Bit 23 of `tagContext` selects the
// first of the two field-id sets.
CAMEL_DECLARE_UNIT(decodeGenericDigits);

} // namespace camel
