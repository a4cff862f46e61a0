// The GPRS types: location information with its routing area and LSA
// identities, quality of service in its short and long formats, the access
// point name, end user and GSN addresses, the charging characteristics,
// result and roll-over, and the event-specific information of a GPRS event
// report.
#include "cap/gprs.h"

#include "cap/charging.h"
#include "cap/mobile.h"
#include "cap/rows.h"
#include "cap/units.h"

namespace camel {

// ---- Access Point Name ---------------------------------------------------------------

// The length octet and the name octets form one block that must fit in the
// window; a block that does not is not shown and ends the element.
template <Pass P>
int decodeAccessPointName(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (ctx->present == 0)
        return 1;
    if (!room(st, 8) || !room(st, 8 + 8 * peekOctet(st))) {
        ctx->present = 0;
        return 1;
    }
    const uint32_t octets = peekOctet(st);
    return octetField<P, 2412>(st, ctx, rq) && octetsField<P, 2413>(st, ctx, rq, octets);
}
CAMEL_INSTANTIATE_UNIT(decodeAccessPointName, DecodeState *, ElementContext *);

// ---- Routing area identity --------------------------------------------------------------

namespace {
constexpr MccMncFields kRoutingArea{fx(2442), fx(2443), fx(2448), fx(2449), fx(2446), fx(2450)};
}

// The MCC-MNC-LAC block, then the routing area code: its octet as two
// half-octets, bits 8-5 first.
template <Pass P>
int decodeRoutingAreaIdentity(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (!mccMncBlock<P>(st, ctx, rq, kRoutingArea))
        return 0;
    needBits(st, ctx, 8);
    return halfOctetField<P, 2451>(st, ctx, rq, 1);
}
CAMEL_INSTANTIATE_UNIT(decodeRoutingAreaIdentity, DecodeState *, ElementContext *);

// ---- GSN address ---------------------------------------------------------------------------

// Address type (bits 2-1 of octet 1, not consumed) and the address length
// (bits 8-3); an IPv4 address is four octets shown in dotted decimal, any
// other type the remaining octets (at most 16) as hexadecimal digits.
template <Pass P>
int decodeGsnAddress(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (!fittedBitsField<P>(st, ctx, rq, fx(2586), 0, 2, 0))
        return 0;
    if (ctx->present == 0)
        return 1;
    if (st->field.value == 0) {
        if (!fittedBitsField<P>(st, ctx, rq, fx(2593), 2, 6, 8))
            return 0;
        return fixedOctets<P>(st, ctx, rq, fx(2594), 4);
    }
    return fittedBitsField<P>(st, ctx, rq, fx(2589), 2, 6, 8) &&
           halfOctetField<P, 2590>(st, ctx, rq, 16);
}
CAMEL_INSTANTIATE_UNIT(decodeGsnAddress, DecodeState *, ElementContext *);

namespace {

consteval Member timeAndTimezone(uint32_t tag) {
    return el(tag, "Timeand Timezone", 2231, 0, CAMEL_UNIT(decodeTimeAndTimezone));
}

// ---- GPRS location information ----------------------------------------------------------

// LSA identity: the type bit, then 20 bits read as five half-octets and
// the last three bits of the third octet.
constexpr BitField kLsaIdentity[] = {
    bitField(2597, 0, 1, 1),
    bitField(2598, 0, 4, 20, 5),
    bitField(2599, 0, 3, 3),
};
constexpr BitLayout kLsaIdentityLayout = layout(kLsaIdentity);

// In order.  The cell, service area or location area identity is an
// OCTET STRING here, its kind told by its length.
constexpr Member kLocationInformationGprs[] = {
    el(0x80, "Cell Id Or Sai Or LAI", 2070, 2071, CAMEL_UNIT(decodeCellIdOrLaiOctets)),
    routingAreaIdentity(0x81),
    el(0x82, "Geographical Information", 2047, 2048, CAMEL_UNIT(decodeGeographicalInformation)),
    el(0x83, "SGSN Number", 2151, 0, CAMEL_UNIT(decodeIsdnAddressString)),
    el(0x84, "LSA Identity", 2595, 2596, bits(kLsaIdentityLayout)),
    el(0xA5, "Extension Container", 2090, 0, CAMEL_UNIT(decodeExtensionContainer)),
    el(0x86, "SAI Present", 2601, 2606, none()),
};

// ---- Quality of service -----------------------------------------------------------------

// The short format: reliability and delay class, precedence and peak
// throughput, mean throughput; each octet's fields show its bits and the
// last consumes it.
#define CAMEL_SHORT_QOS_(reliability, delay, precedence, peak, mean)                           \
    bitField(reliability, 0, 3, 0), bitField(delay, 3, 3, 8), bitField(precedence, 0, 3, 0),    \
        bitField(peak, 4, 4, 8), bitField(mean, 0, 5, 8)
constexpr BitField kShortQos[] = {CAMEL_SHORT_QOS_(2380, 2381, 2382, 2383, 2384)};
// The long format: the three octets of the short format, then octets 4 to 11.
constexpr BitField kLongQos[] = {
    CAMEL_SHORT_QOS_(2386, 2387, 2388, 2389, 2390),
    bitField(2391, 0, 3, 0), bitField(2392, 3, 2, 0), bitField(2393, 5, 3, 8),
    bitField(2394, 0, 8, 8),
    bitField(2395, 0, 8, 8),
    bitField(2396, 0, 8, 8),
    bitField(2397, 0, 4, 0), bitField(2398, 4, 4, 8),
    bitField(2399, 0, 2, 0), bitField(2400, 2, 6, 8),
    bitField(2401, 0, 8, 8),
    bitField(2402, 0, 8, 8),
};
#undef CAMEL_SHORT_QOS_
constexpr BitLayout kShortQosLayout = layout(kShortQos);
constexpr BitLayout kLongQosLayout = layout(kLongQos);

constexpr Member kGprsQos[] = {
    alt(0x80, "Short QoS format", 2379, bits(kShortQosLayout)),
    alt(0x81, "Long QoS format", 2385, bits(kLongQosLayout)),
};
constexpr MemberTable kGprsQosChoice = members(Walk::Choice, kGprsQos, 2377);

constexpr Member kQosExtension[] = {
    el(0x80, "Ext2_QoS_Subscribed", 4320, 4321, halfOctets(4322, 255))};
constexpr MemberTable kQosExtensionMembers = members(Walk::InOrder, kQosExtension);

// Requested, subscribed and negotiated QoS share their fields.
constexpr Member kQualityOfService[] = {
    el(0xA0, "Requested QoS", 2375, 2376, table(kGprsQosChoice)),
    el(0xA1, "Subscribed QoS", 2375, 2376, table(kGprsQosChoice)),
    el(0xA2, "Negotiated QoS", 2375, 2376, table(kGprsQosChoice)),
    el(0xA3, "Requested_QoS_Extension", 4316, 4319, table(kQosExtensionMembers)),
    el(0xA4, "Subscribed_QoS_Extension", 4317, 4319, table(kQosExtensionMembers)),
    el(0xA5, "Negotiated_QoS_Extension", 4318, 4319, table(kQosExtensionMembers)),
};

// ---- End user address ------------------------------------------------------------------

constexpr Member kEndUserAddress[] = {
    el(0x80, "PDP Type Origination", 2470, 2471, halfOctets(2472, 1)),
    el(0x81, "PDP Type Number", 2473, 2474, halfOctets(2475, 1)),
    el(0x82, "PDP Type Address", 2476, 2477, halfOctets(2478, 52)),
};

// ---- Charging -----------------------------------------------------------------------------

// Volumes and times are unsigned 32-bit integers: up to five content
// octets, the first of them a zero when the value is 2^31 or more.
constexpr uint8_t kCounterOctets = 5;

constexpr Member kChargingCharacteristics[] = {
    alt(0x80, "Max Transferred Volume", 2315, integer(2317, kCounterOctets)),
    alt(0x81, "Max Elapsed Time", 2316, integer(2318, kCounterOctets)),
};

// The tariff-switch sequence of a volume or time: the value since the last
// switch [0] and the one of the switch interval [1], each with a tag,
// length and value field of consecutive ids.
consteval Member counter(uint32_t tag, const char *name, uint32_t tagId) {
    return el(tag, name, tagId, tagId + 1, integer(tagId + 2, kCounterOctets));
}
#define CAMEL_TARIFF_SWITCH_(table, sinceName, sinceId, intervalName, intervalId)               \
    constexpr Member table##Rows[] = {counter(0x80, sinceName, sinceId),                       \
                                      counter(0x81, intervalName, intervalId)};                \
    constexpr MemberTable table = members(Walk::Loop, table##Rows)
CAMEL_TARIFF_SWITCH_(kVolumeIfTariffSwitch, "Volume Since Last Tariff Switch", 2341,
                     "Volume Tariff Switch Interval", 2344);
CAMEL_TARIFF_SWITCH_(kTimeIfTariffSwitch, "Time GPRS Since Last Tariff Switch", 2356,
                     "Time GPRS Tariff Switch Interval", 2359);
CAMEL_TARIFF_SWITCH_(kVolumeRollOverIfTariffSwitch, "RO-volume Since Last Tariff Switch", 3894,
                     "RO-volume Tariff Switch Interval", 3897);
CAMEL_TARIFF_SWITCH_(kTimeRollOverIfTariffSwitch, "RO-time GPRS Since Last Tariff Switch", 3909,
                     "RO-time GPRS Tariff Switch Interval", 3912);
#undef CAMEL_TARIFF_SWITCH_

// A volume or time: without a tariff switch [0] one value, with one [1]
// the tariff-switch sequence; the choice field tells them apart.
consteval Member withoutSwitch(const char *name, uint32_t lengthId) {
    return alt(0x80, name, lengthId, integer(lengthId + 1, kCounterOctets));
}
consteval Member withSwitch(const char *name, uint32_t lengthId, const MemberTable &sequence) {
    return alt(0xA1, name, lengthId, table(sequence));
}
constexpr Member kTransferredVolume[] = {
    withoutSwitch("Volume If No Tariff Switch", 2334),
    withSwitch("Volume If Tariff Switch", 2336, kVolumeIfTariffSwitch)};
constexpr Member kElapsedTime[] = {
    withoutSwitch("Time GPRS If No Tariff Switch", 2349),
    withSwitch("Time GPRS If Tariff Switch", 2351, kTimeIfTariffSwitch)};
constexpr Member kVolumeRollOver[] = {
    withoutSwitch("RO-volume If No Tariff Switch", 3887),
    withSwitch("RO-volume If Tariff Switch", 3889, kVolumeRollOverIfTariffSwitch)};
constexpr Member kTimeRollOver[] = {
    withoutSwitch("RO-time GPRS If No Tariff Switch", 3902),
    withSwitch("RO-time GPRS If Tariff Switch", 3904, kTimeRollOverIfTariffSwitch)};
constexpr MemberTable kTransferredVolumeChoice = members(Walk::Choice, kTransferredVolume, 2333);
constexpr MemberTable kElapsedTimeChoice = members(Walk::Choice, kElapsedTime, 2348);
constexpr MemberTable kVolumeRollOverChoice = members(Walk::Choice, kVolumeRollOver, 3886);
constexpr MemberTable kTimeRollOverChoice = members(Walk::Choice, kTimeRollOver, 3901);

constexpr Member kChargingResult[] = {
    alt(0xA0, "Transferred Volume", 2331, table(kTransferredVolumeChoice)),
    alt(0xA1, "Elapsed Time", 2332, table(kElapsedTimeChoice)),
};
constexpr Member kChargingRollOver[] = {
    alt(0xA0, "Transferred Volume Roll Over", 3884, table(kVolumeRollOverChoice)),
    alt(0xA1, "Elapsed Time Roll Over", 3885, table(kTimeRollOverChoice)),
};

// ---- Event Specific Info GPRS -------------------------------------------------------------

consteval Member initiatingEntity() {
    return el(0x80, "Initiating Entity", 2482, 2483, octet(2484));
}

constexpr Member kAttachChangeOfPosition[] = {locationInformationGprs(0xA0)};
constexpr Member kPdpContextChangeOfPosition[] = {
    accessPointName(0x80), chargingId(0x81), locationInformationGprs(0xA2),
    endUserAddress(0xA3),  qualityOfService(0xA4), timeAndTimezone(0x85),
    gsnAddress(0x86),
};
constexpr Member kDetachOrDisconnect[] = {
    initiatingEntity(),
    el(0x81, "Routing Area Update", 2603, 2606, none()),
};
constexpr Member kPdpContextEstablishment[] = {
    accessPointName(0x80), endUserAddress(0xA1),     qualityOfService(0xA2),
    locationInformationGprs(0xA3), timeAndTimezone(0x84), pdpInitiationType(0x85),
    nullWindow(0x86),
};
constexpr Member kPdpContextEstablishmentAck[] = {
    accessPointName(0x80), chargingId(0x81),       endUserAddress(0xA2),
    qualityOfService(0xA3), locationInformationGprs(0xA4), timeAndTimezone(0x85),
    gsnAddress(0x86),
};
constexpr MemberTable kAttachChangeOfPositionLoop = members(Walk::Loop, kAttachChangeOfPosition);
constexpr MemberTable kPdpContextChangeOfPositionLoop =
    members(Walk::Loop, kPdpContextChangeOfPosition);
constexpr MemberTable kDetachOrDisconnectLoop = members(Walk::Loop, kDetachOrDisconnect);
constexpr MemberTable kPdpContextEstablishmentLoop = members(Walk::Loop, kPdpContextEstablishment);
constexpr MemberTable kPdpContextEstablishmentAckLoop =
    members(Walk::Loop, kPdpContextEstablishmentAck);

constexpr Member kEventSpecificInfoGprs[] = {
    alt(0xA0, "Attach Change Of Pos Specific Info", 2437, table(kAttachChangeOfPositionLoop)),
    alt(0xA1, "PDP Context Change Of Posi Spec Info", 2437,
        table(kPdpContextChangeOfPositionLoop)),
    alt(0xA2, "Detach Specific Info", 2437, table(kDetachOrDisconnectLoop)),
    alt(0xA3, "Disconnect Specific Info", 2437, table(kDetachOrDisconnectLoop)),
    alt(0xA4, "PDP Context Establishment Specific Info", 2437,
        table(kPdpContextEstablishmentLoop)),
    alt(0xA5, "PDP Context Establishment Acknowledgement Specific Info", 2437,
        table(kPdpContextEstablishmentAckLoop)),
};

// ---- AOC GPRS ----------------------------------------------------------------------------------

constexpr Member kAocGprs[] = {
    el(0xA0, "AOC GPRS", 1259, 1260, table(kAocBeforeAnswerMembers)),
    pdpId(0x81),
};
constexpr MemberTable kAocGprsLoop = members(Walk::Loop, kAocGprs);
constexpr Member kSciGprsBillingCharging[] = {el(0x30, "Sequence", 2576, 2578, table(kAocGprsLoop))};

constexpr BitField kSgsnCapabilities[] = {bitField(2554, 0, 1, 8)};

} // namespace

constexpr MemberTable kLocationInformationGprsTable =
    members(Walk::InOrder, kLocationInformationGprs);
constexpr MemberTable kQualityOfServiceTable = members(Walk::InOrder, kQualityOfService);
constexpr MemberTable kEndUserAddressTable = members(Walk::InOrder, kEndUserAddress);
constexpr MemberTable kChargingCharacteristicsTable =
    members(Walk::Choice, kChargingCharacteristics, 2314);
constexpr MemberTable kChargingResultTable = members(Walk::Choice, kChargingResult, 2330);
constexpr MemberTable kChargingRollOverTable = members(Walk::Choice, kChargingRollOver, 3883);
constexpr MemberTable kEventSpecificInfoGprsTable =
    members(Walk::Choice, kEventSpecificInfoGprs, 2436);
constexpr MemberTable kSciGprsBillingChargingTable = members(Walk::Loop, kSciGprsBillingCharging);
constexpr BitLayout kSgsnCapabilitiesLayout = layout(kSgsnCapabilities);

} // namespace camel
