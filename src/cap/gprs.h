// The GPRS types (cap/gprs.cpp) as rows other units use, and the GPRS
// operations' arguments (cap/arguments_gprs.cpp).
#pragma once

#include <cstdint>

#include "engine/members.h"

namespace camel {

// ---- Types ---------------------------------------------------------------------------
// The members of the GPRS location information, from the cell identity to
// SAI present.
extern const MemberTable kLocationInformationGprsTable;
// Quality of service: requested, subscribed and negotiated QoS and their
// extensions.
extern const MemberTable kQualityOfServiceTable;
// End user address: PDP type origination and number, PDP address.
extern const MemberTable kEndUserAddressTable;
// Charging characteristics, charging result and charging roll-over: a
// choice field, then the alternative from its length.
extern const MemberTable kChargingCharacteristicsTable;
extern const MemberTable kChargingResultTable;
extern const MemberTable kChargingRollOverTable;
// Event Specific Info GPRS: a choice field, then the alternative.
extern const MemberTable kEventSpecificInfoGprsTable;
// Send Charging Information GPRS's billing characteristics: the AOC GPRS
// sequence.
extern const MemberTable kSciGprsBillingChargingTable;
// Sgsn Capabilities: the AOC support bit of its octet.
extern const BitLayout kSgsnCapabilitiesLayout;

// The GPRS location information under identifier `tag` (SMS Initial DP
// carries it too).
consteval Member locationInformationGprs(uint32_t tag) {
    return el(tag, "Location Infomation GPRS", 2218, 2219, table(kLocationInformationGprsTable));
}
consteval Member qualityOfService(uint32_t tag) {
    return el(tag, "Quality Of Service", 2366, 2367, table(kQualityOfServiceTable));
}
consteval Member endUserAddress(uint32_t tag) {
    return el(tag, "Enduser Address", 2468, 2469, table(kEndUserAddressTable));
}
consteval Member pdpId(uint32_t tag) { return el(tag, "PDP ID", 1268, 1269, halfOctets(1270, 1)); }
consteval Member eventTypeGprs(uint32_t tag) {
    return el(tag, "Event Type GPRS", 2431, 2432, octet(2433));
}
consteval Member chargingId(uint32_t tag) {
    return el(tag, "Charging Id", 2461, 2462, halfOctets(2463, 4));
}
consteval Member pdpInitiationType(uint32_t tag) {
    return el(tag, "PDP Initiation Type", 2581, 2582, octet(2583));
}
consteval Member nullWindow(uint32_t tag) { return el(tag, "Null Window", 2602, 2606, none()); }

// ---- Units (after their tag field) ------------------------------------------------------
// Access Point Name: its one-octet length, then the name octets, which the
// host renders (pu_access_point_name; its failure ends the pass).
template <Pass P>
int decodeAccessPointName(DecodeState *st, ElementContext *ctx, Request<P> *rq);
// Routing area identity (after its length): MCC, MNC, location area code
// and routing area code.
template <Pass P>
int decodeRoutingAreaIdentity(DecodeState *st, ElementContext *ctx, Request<P> *rq);
// GSN address (after its length): address type, then the IPv4 or IPv6 body.
template <Pass P>
int decodeGsnAddress(DecodeState *st, ElementContext *ctx, Request<P> *rq);

consteval Member accessPointName(uint32_t tag) {
    return el(tag, "Access Point Name", 2410, 0, CAMEL_UNIT(decodeAccessPointName));
}
consteval Member routingAreaIdentity(uint32_t tag) {
    return el(tag, "Routing Area Identity", 2440, 2441, CAMEL_UNIT(decodeRoutingAreaIdentity));
}
consteval Member gsnAddress(uint32_t tag) {
    return el(tag, "Gsn Address", 2584, 2585, CAMEL_UNIT(decodeGsnAddress));
}

// ---- Arguments, in the dispatcher's order ----------------------------------------------
extern const MemberTable kGprsApplyChargingTable;           // 71
extern const MemberTable kGprsApplyChargingReportTable;     // 72
extern const MemberTable kGprsCancelTable;                  // 73
extern const MemberTable kGprsConnectTable;                 // 74
extern const MemberTable kGprsContinueTable;                // 75
extern const MemberTable kGprsEntityReleasedTable;          // 76
extern const MemberTable kGprsEventReportTable;             // 80
extern const MemberTable kFurnishChargingInfoGprsTable;     // 77
extern const MemberTable kGprsInitialDpTable;               // 78
extern const MemberTable kGprsReleaseTable;                 // 79
extern const MemberTable kRequestReportGprsEventTable;      // 81
extern const MemberTable kGprsResetTimerTable;              // 82
extern const MemberTable kGprsSendChargingInformationTable; // 83

} // namespace camel
