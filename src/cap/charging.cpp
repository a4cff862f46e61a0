// Charging and call gap types: Apply Charging's time duration charging with
// its audible indicator and bursts, the charging report's time information,
// the charging address, Furnish Charging Information's append indicator,
// the advice-of-charge parameters of Send Charging Information, and the
// call gap criteria, indicators and treatment.
#include "cap/charging.h"

#include "cap/rows.h"
#include "cap/units.h"

namespace camel {

namespace {

consteval Member tariffSwitchInterval(uint32_t tag) {
    return el(tag, "Tariff Switch Interval", 1394, 1395, integer(1396, 3));
}

// ---- Bursts and the audible indicator ------------------------------------------------

// Every member of a burst is a small integer counted in its own unit (a
// burst interval of 128 to 1200 takes two octets).
constexpr Member kBurst[] = {
    el(0x80, "numberOfBursts", 4252, 4253, integer(4254, 2)),
    el(0x81, "Burst Interval", 4255, 4256, integer(4257, 2)),
    el(0x82, "numberOfTonesInBurst", 4258, 4259, integer(4260, 2)),
    el(0x83, "toneDuration", 4261, 4262, integer(4263, 2)),
    el(0x84, "toneInterval", 4264, 4265, integer(4266, 2)),
};

constexpr Member kBurstList[] = {
    el(0x80, "Warning Period", 4241, 4242, integer(4243, 2)),
    burst(0xA1),
};
constexpr MemberTable kBurstListMembers = members(Walk::Loop, kBurstList);

// The audible indicator is an untagged CHOICE of a BOOLEAN (universal tag
// 01) and the burst list; the choice field names the identifier.
constexpr Member kAudibleIndicator[] = {
    alt(0x01, "tone", 4236, octet(4237)),
    alt(0xA1, "Burst List", 4239, table(kBurstListMembers)),
};
constexpr MemberTable kAudibleIndicatorChoice = members(Walk::Choice, kAudibleIndicator, 4234);

// ---- Time duration charging -------------------------------------------------------------

// The tariff switch interval and the extensions stand under tag overrides;
// their identifiers are compared by class and number (either form), so
// that an element that is not there is not read in place of another.
constexpr Member kTimeDurationCharging[] = {
    el(0x80, "Max Call Period Duration", 1387, 1388, integer(1389, 3)),
    el(0x81, "Release IF Duration Exceeded", 1390, 1391, octet(1392)),
    tariffSwitchInterval(anyForm(0x82)),
    el(0xA3, "Audible Indicator", 4232, 4233, table(kAudibleIndicatorChoice)),
    el(anyForm(0x84), "Extensions", 1481, 0, CAMEL_UNIT(decodeExtensions)),
};
constexpr MemberTable kTimeDurationChargingMembers = members(Walk::Loop, kTimeDurationCharging);

constexpr Member kAChBillingChargingCharacteristics[] = {
    el(0xA0, "Time Duration Charging", 1380, 1382, table(kTimeDurationChargingMembers)),
};

// ---- Charging report: time information ---------------------------------------------------

constexpr Member kTimeIfTariffSwitch[] = {
    el(0x80, "Time Since Tariff Switch", 1418, 1419, integer(1420, 3)),
    tariffSwitchInterval(0x81),
};
constexpr MemberTable kTimeIfTariffSwitchMembers = members(Walk::Loop, kTimeIfTariffSwitch);

constexpr Member kTimeInformation[] = {
    alt(0x80, "Time IF No Tariff Switch", 1414, integer(1415, 3)),
    alt(0xA1, "Time IF Tariff Switch", 1416, table(kTimeIfTariffSwitchMembers)),
};

// ---- Charging address ---------------------------------------------------------------------

// The two alternatives of the charging address, chosen by the tag number.
constexpr Member kChargingAddressLeg =
    el(0xA2, "AChChargingAddress", 4203, 0, CAMEL_UNIT(decodeLegId));
constexpr Member kChargingAddressSrf =
    el(0x9F32, "AChChargingAddress", 4205, 0, CAMEL_UNIT(decodeCallSegmentId));

// ---- Send Charging Information: advice of charge ---------------------------------------------

// CAI GSM 02.24: E1 to E7, each an integer of at most two octets.
consteval Member eParameter(uint32_t n) {
    constexpr const char *kNames[] = {"E1", "E2", "E3", "E4", "E5", "E6", "E7"};
    const uint32_t base = 1281 + 3 * (n - 1);
    return el(0x80 + n - 1, kNames[n - 1], base, base + 1, integer(base + 2, 2));
}
constexpr Member kCaiGsm0224[] = {eParameter(1), eParameter(2), eParameter(3), eParameter(4),
                                  eParameter(5), eParameter(6), eParameter(7)};
constexpr MemberTable kCaiGsm0224Members = members(Walk::Loop, kCaiGsm0224);
consteval Member caiGsm0224() {
    return el(0xA0, "CAI GSM0224", 1271, 1272, table(kCaiGsm0224Members));
}

constexpr Member kAocSubsequent[] = {
    caiGsm0224(),
    tariffSwitchInterval(0x81),
};
constexpr MemberTable kAocSubsequentMembers = members(Walk::Loop, kAocSubsequent);

constexpr Member kAocBeforeAnswer[] = {
    caiGsm0224(),
    el(0xA1, "AOC Subsequent", 1264, 1265, table(kAocSubsequentMembers)),
};
constexpr MemberTable kAocBeforeAnswerMembers = members(Walk::Loop, kAocBeforeAnswer);

constexpr Member kSciBillingCharging[] = {
    alt(0xA0, "AOC Before Answer", 1260, table(kAocBeforeAnswerMembers)),
    alt(0xA1, "AOC After Answer", 1265, table(kAocSubsequentMembers)),
    alt(0xA2, "AOC Extension", 0, CAMEL_UNIT(decodeSendingSideId)),
};

// ---- Call gap --------------------------------------------------------------------------------

constexpr Member kGapOnService[] = {serviceKey(0x80)};
constexpr MemberTable kGapOnServiceMembers = members(Walk::Loop, kGapOnService);
constexpr Member kCalledAddressAndService[] = {
    el(0x80, "Called Address Value", 1520, 1521, CAMEL_UNIT(decodeGenericNumber)),
    serviceKey(0x81),
};
constexpr MemberTable kCalledAddressAndServiceMembers =
    members(Walk::Loop, kCalledAddressAndService);
constexpr Member kCallingAddressAndService[] = {
    el(0x80, "Calling Address", 1454, 1455, CAMEL_UNIT(decodeGenericNumber)),
    serviceKey(0x81),
};
constexpr MemberTable kCallingAddressAndServiceMembers =
    members(Walk::Loop, kCallingAddressAndService);

// The four basic criteria, alternatives of both the gap criteria and the
// basic gap criteria of a compound criterion.
consteval Member basicCriterion(uint32_t i) {
    switch (i) {
    case 0:
        return alt(0x80, "Called Address Value", 1521, CAMEL_UNIT(decodeGenericNumber));
    case 1:
        return alt(0xA2, "Gap On Service", 1451, table(kGapOnServiceMembers));
    case 2:
        return alt(0xBD, "Called Address And Service", 1452,
                   table(kCalledAddressAndServiceMembers));
    default:
        return alt(0xBE, "Calling Address And Service", 1453,
                   table(kCallingAddressAndServiceMembers));
    }
}
constexpr Member kBasicGapCriteria[] = {basicCriterion(0), basicCriterion(1), basicCriterion(2),
                                        basicCriterion(3)};
constexpr MemberTable kBasicGapCriteriaChoice = members(Walk::Choice, kBasicGapCriteria, 1446);

constexpr Member kCompoundGapCriteria[] = {
    el(0xA0, "Basic Gap Criteria", 1444, 1445, table(kBasicGapCriteriaChoice)),
    el(0x81, "SCF Id", 1538, 0, CAMEL_UNIT(decodeScfId)),
};
constexpr MemberTable kCompoundGapCriteriaMembers = members(Walk::Loop, kCompoundGapCriteria);

constexpr Member kGapCriteria[] = {
    basicCriterion(0),
    basicCriterion(1),
    basicCriterion(2),
    basicCriterion(3),
    alt(0x30, "Compound Gap Criteria", 1448, table(kCompoundGapCriteriaMembers)),
};

// Duration and interval are shown as hexadecimal values of their octets.
constexpr Member kGapIndicators[] = {
    el(0x80, "Duration", 1464, 1465, halfOctets(1466, 3)),
    el(0x81, "Gap Interval", 1461, 1462, halfOctets(1463, 2)),
};

constexpr Member kGapTreatment[] = {
    alt(0xA0, "Information To Send", 1303, table(kInformationToSendTable)),
    alt(0x81, "Release Cause", 0, CAMEL_UNIT(decodeCause)),
};

} // namespace

constexpr MemberTable kBurstTable = members(Walk::Loop, kBurst);
constexpr MemberTable kAChBillingChargingCharacteristicsTable =
    members(Walk::Loop, kAChBillingChargingCharacteristics);
constexpr MemberTable kTimeInformationTable = members(Walk::Choice, kTimeInformation, 1412);
constexpr MemberTable kSciBillingChargingTable =
    members(Walk::Choice, kSciBillingCharging, 1257);
constexpr MemberTable kGapCriteriaTable = members(Walk::Choice, kGapCriteria, 1442);
constexpr MemberTable kGapIndicatorsTable = members(Walk::Loop, kGapIndicators);
constexpr MemberTable kGapTreatmentTable = members(Walk::Choice, kGapTreatment, 1472);

// The charging address: the tag number of the next identifier (shown, not
// consumed) chooses the alternative: [2] is the leg, anything else the SRF
// connection, whose identifier takes two octets.
template <Pass P>
int decodeAChChargingAddress(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (!fittedBitsField<P>(st, ctx, rq, fx(4200), 0, 5, 0))
        return 0;
    if (ctx->present == 0)
        return 1;
    if (st->field.value == 2)
        return decodeMember<P>(st, ctx, rq, kChargingAddressLeg, 8);
    return decodeMember<P>(st, ctx, rq, kChargingAddressSrf, 16);
}
CAMEL_INSTANTIATE_UNIT(decodeAChChargingAddress, DecodeState *, ElementContext *);

// Append Free Format Data: bits 1-2 of its one octet.
template <Pass P>
int decodeAppendFreeFormatData(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return fittedBitsField<P>(st, ctx, rq, fx(2191), 0, 2, 8);
}
CAMEL_INSTANTIATE_UNIT(decodeAppendFreeFormatData, DecodeState *, ElementContext *);

} // namespace camel
