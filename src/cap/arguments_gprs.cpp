// The arguments of the GPRS operations as member tables (see
// cap/arguments.cpp for the call-control ones); the GPRS types they carry
// are in cap/gprs.cpp.
#include "cap/charging.h"
#include "cap/gprs.h"
#include "cap/ms_capability.h"
#include "cap/rows.h"
#include "cap/units.h"

namespace camel {

namespace {

// An argument SEQUENCE whose members are walked as an element loop.
#define CAMEL_GPRS_ARGUMENT_(name, label, tagId, lengthId, ...)                                 \
    constexpr Member name##Members[] = {__VA_ARGS__};                                          \
    constexpr MemberTable name##Loop = members(Walk::Loop, name##Members);                     \
    constexpr Member name##Arg[] = {sequence(label, tagId, lengthId, name##Loop)}

consteval Member gprsCause() { return el(0x80, "GPRS Cause", 2422, 2423, octet(2424)); }

// ---- GPRS Apply Charging (71) and its report (72) ------------------------------------------

CAMEL_GPRS_ARGUMENT_(kGprsApplyCharging, "GPRS Apply Charging", 2307, 2308,
                     el(0xA0, "Charging Characteristics", 2312, 2313,
                        table(kChargingCharacteristicsTable)),
                     tariffSwitchInterval(0x81), pdpId(0x82));

CAMEL_GPRS_ARGUMENT_(kGprsApplyChargingReport, "GPRS Apply Charging Report", 2320, 2321,
                     el(0xA0, "Charging Result", 2328, 2329, table(kChargingResultTable)),
                     qualityOfService(0xA1), el(0x82, "Active", 2362, 2363, octet(2364)),
                     pdpId(0x83),
                     el(0xA4, "Charging Roll Over", 3881, 3882, table(kChargingRollOverTable)));

// ---- GPRS Cancel (73), Continue (75), Entity Released (76), Release (79) --------------------

CAMEL_GPRS_ARGUMENT_(kGprsCancel, "GPRS Cancel", 2403, 2404, pdpId(0x80));
CAMEL_GPRS_ARGUMENT_(kGprsContinue, "GPRS Continue", 2414, 2415, pdpId(0x80));
CAMEL_GPRS_ARGUMENT_(kGprsEntityReleased, "GPRS Entity Released", 2417, 2418, gprsCause(),
                     pdpId(0x81));
CAMEL_GPRS_ARGUMENT_(kGprsRelease, "GPRS Release", 2555, 2556, gprsCause(), pdpId(0x81));

// ---- GPRS Connect (74): two members in order, their identifiers not checked ------------------

constexpr Member kGprsConnectMembers[] = {
    accessPointName(kAnyTag),
    pdpId(kAnyTag),
};
constexpr MemberTable kGprsConnectInOrder = members(Walk::InOrder, kGprsConnectMembers);
constexpr Member kGprsConnectArg[] = {
    sequence("GPRS Connect", 2407, 2408, kGprsConnectInOrder)};

// ---- GPRS Event Report (80) ----------------------------------------------------------------

CAMEL_GPRS_ARGUMENT_(kGprsEventReport, "GPRS Event Report", 2425, 2426, eventTypeGprs(0x80),
                     el(0xA1, "Misc Call Info", 1602, 0, CAMEL_UNIT(decodeMiscCallInfo)),
                     el(0xA2, "Event Specific Info GPRS", 2434, 2435,
                        table(kEventSpecificInfoGprsTable)),
                     pdpId(0x83));

// ---- Furnish Charging Info GPRS (77): an OCTET STRING holding the billing data ------------------

constexpr Member kFciGprsSequence1[] = {
    el(0x80, "Free Format Data", 2186, 2187, halfOctets(2188, 52)),
    pdpId(0x81),
    appendFreeFormatData(0x82),
};
constexpr MemberTable kFciGprsSequence1Loop = members(Walk::Loop, kFciGprsSequence1);
constexpr Member kFciGprsBillingCharging[] = {
    el(0xA0, "Fci GPRS Bill Cha Char Sequence", 2504, 2505, table(kFciGprsSequence1Loop))};
constexpr MemberTable kFciGprsBillingChargingLoop = members(Walk::Loop, kFciGprsBillingCharging);
constexpr Member kFciGprsCharacteristics[] = {
    el(0x30, "Camel Fci GPRS Bill Cha Char", 2502, 2503, table(kFciGprsBillingChargingLoop))};
constexpr MemberTable kFciGprsCharacteristicsLoop = members(Walk::Loop, kFciGprsCharacteristics);
constexpr Member kFurnishChargingInfoGprsArg[] = {
    el(0x04, "Furnish Charg Info GPRS", 2500, 2501, table(kFciGprsCharacteristicsLoop))};

// ---- GPRS Initial DP (78) --------------------------------------------------------------------

CAMEL_GPRS_ARGUMENT_(kGprsInitialDp, "GPRS Initial DP", 2509, 2510, serviceKey(0x80),
                     eventTypeGprs(0x81), isdnAddressString(0x82, 2154), imsi(0x83, 2019),
                     timeAndTimezone(0x84, 2231), gprsmsClass(0xA5), endUserAddress(0xA6), qualityOfService(0xA7), accessPointName(0x88),
                     routingAreaIdentity(0x89), chargingId(0x8A),
                     el(0x8B, "Sgsn Capabilities", 2552, 2553, bits(kSgsnCapabilitiesLayout)),
                     locationInformationGprs(0xAC), pdpInitiationType(0x8D), extensions(0xAE),
                     gsnAddress(0x8F), nullWindow(0x90), octetString(0x91, "IMEI", 4219));

// ---- Request Report GPRS Event (81) --------------------------------------------------------

constexpr Member kGprsEvent[] = {
    eventTypeGprs(0x80),
    monitorMode(0x81),
};
constexpr MemberTable kGprsEventLoop = members(Walk::Loop, kGprsEvent);
constexpr Member kGprsEventItem[] = {el(0x30, "GPRS Events", 2564, 2565, table(kGprsEventLoop))};
constexpr MemberTable kGprsEvents = members(Walk::Repeat, kGprsEventItem);
CAMEL_GPRS_ARGUMENT_(kRequestReportGprsEvent, "Request Report GPRS Event", 2558, 2559,
                     el(0xA0, "GPRS Event", 2561, 2562, table(kGprsEvents)), pdpId(0x81));

// ---- GPRS Reset Timer (82) and Send Charging Information (83) ---------------------------------

CAMEL_GPRS_ARGUMENT_(kGprsResetTimer, "GPRS Reset Timer", 2566, 2567, timerId(0x80),
                     timerValue(0x81));
CAMEL_GPRS_ARGUMENT_(kGprsSendChargingInformation, "GPRS Send Charging Information", 2569,
                     2570,
                     el(0x80, "Camel Scigprs Billing Charg Char", 2573, 2575,
                        table(kSciGprsBillingChargingTable)));

#undef CAMEL_GPRS_ARGUMENT_

} // namespace

constexpr MemberTable kGprsApplyChargingTable = argument(kGprsApplyChargingArg);
constexpr MemberTable kGprsApplyChargingReportTable = argument(kGprsApplyChargingReportArg);
constexpr MemberTable kGprsCancelTable = argument(kGprsCancelArg);
constexpr MemberTable kGprsConnectTable = argument(kGprsConnectArg);
constexpr MemberTable kGprsContinueTable = argument(kGprsContinueArg);
constexpr MemberTable kGprsEntityReleasedTable = argument(kGprsEntityReleasedArg);
constexpr MemberTable kGprsEventReportTable = argument(kGprsEventReportArg);
constexpr MemberTable kFurnishChargingInfoGprsTable = argument(kFurnishChargingInfoGprsArg);
constexpr MemberTable kGprsInitialDpTable = argument(kGprsInitialDpArg);
constexpr MemberTable kGprsReleaseTable = argument(kGprsReleaseArg);
constexpr MemberTable kRequestReportGprsEventTable = argument(kRequestReportGprsEventArg);
constexpr MemberTable kGprsResetTimerTable = argument(kGprsResetTimerArg);
constexpr MemberTable kGprsSendChargingInformationTable =
    argument(kGprsSendChargingInformationArg);

} // namespace camel
