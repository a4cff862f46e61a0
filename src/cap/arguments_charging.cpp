// The arguments of the charging, call gap and announcement operations as
// member tables (see cap/arguments.cpp for the call-control ones).
#include "cap/charging.h"
#include "cap/rows.h"
#include "cap/units.h"

namespace camel {

namespace {

consteval Member informationToSend(uint32_t tag) {
    return el(tag, "Information To Send", 1302, 1303, table(kInformationToSendTable));
}
consteval Member disconnectFromIpForbidden() {
    return el(0x81, "Disconnect From IP Forbidden", 1833, 0,
              CAMEL_UNIT(decodeDisconnectFromIpForbidden));
}
consteval Member requestAnnouncementStartedNotification() {
    return el(0x9F33, "requestAnnouncementStartedNotification", 4328, 0,
              CAMEL_UNIT(decodeRequestAnnouncementStartedNotification));
}

// ---- Apply Charging (35) ------------------------------------------------------------------

constexpr Member kApplyCharging[] = {
    el(0x80, "Ach Bill Charging Char", 1377, 1378, table(kAChBillingChargingCharacteristicsTable)),
    sendingSideId(0xA2),
    extensions(0xA3),
    el(0xBF32, "ACh Charging Address", 4198, 4199, CAMEL_UNIT(decodeAChChargingAddress)),
};
constexpr MemberTable kApplyChargingLoop = members(Walk::Loop, kApplyCharging);
constexpr Member kApplyChargingArg[] = {
    sequence("Apply Charging", 1072, 1073, kApplyChargingLoop)};

// ---- Apply Charging Report (36): an OCTET STRING holding the call result -----------------------

// In order.  The party to charge and the extensions stand under tag
// overrides; their identifiers are compared by class and number (either form),
// so that an element that is not there is not read in place of another.
constexpr Member kTimeDurationChargingResult[] = {
    receivingSideId(anyForm(0xA0)),
    el(0xA1, "Time Information", 1410, 1411, table(kTimeInformationTable)),
    el(0x82, "Call Active", 1421, 1422, octet(1423)),
    el(0x83, "Call Released At Tcp Expiry", 1425, 1426, none()),
    extensions(anyForm(0x84)),
    el(0xA5, "ACh Charging Address", 4196, 4197, CAMEL_UNIT(decodeAChChargingAddress)),
};
constexpr MemberTable kTimeDurationChargingResultMembers =
    members(Walk::InOrder, kTimeDurationChargingResult);
constexpr Member kCallResult[] = {
    el(0xA0, "Camel Call Result", 1404, 1405, table(kTimeDurationChargingResultMembers)),
};
constexpr MemberTable kCallResultLoop = members(Walk::Loop, kCallResult);
constexpr Member kApplyChargingReportArg[] = {
    el(0x04, "Call Result", 1401, 1402, table(kCallResultLoop))};

// ---- Call Gap (41) -------------------------------------------------------------------------

constexpr Member kCallGap[] = {
    el(0xA0, "Gap Criteria", 1440, 1441, table(kGapCriteriaTable)),
    el(0xA1, "Gap Indicators", 1456, 1457, table(kGapIndicatorsTable)),
    el(0x82, "Control Type", 1467, 1468, octet(1469)),
    el(0xA3, "Gap Treatment", 1470, 1471, table(kGapTreatmentTable)),
    extensions(anyForm(0x84)),
};
constexpr MemberTable kCallGapLoop = members(Walk::Loop, kCallGap);
constexpr Member kCallGapArg[] = {sequence("Call Gap", 1084, 1085, kCallGapLoop)};

// ---- Furnish Charging Information (34): an OCTET STRING holding the billing data ----------------

constexpr Member kFciBillingCharging[] = {
    freeFormatData(0x80),
    sendingSideId(0xA1),
    appendFreeFormatData(0x82),
};
constexpr MemberTable kFciBillingChargingLoop = members(Walk::Loop, kFciBillingCharging);
constexpr Member kFciBillingChargingCharacteristics[] = {
    el(0xA0, "Camel Fci Bill Cha Char", 1153, 1154, table(kFciBillingChargingLoop)),
};
constexpr MemberTable kFciBillingChargingCharacteristicsLoop =
    members(Walk::Loop, kFciBillingChargingCharacteristics);
constexpr Member kFurnishChargingInformationArg[] = {
    el(0x04, "Furnish Charging Information", 1151, 1152,
       table(kFciBillingChargingCharacteristicsLoop))};

// ---- Play Announcement (47) ------------------------------------------------------------------

constexpr Member kPlayAnnouncement[] = {
    informationToSend(0xA0),
    disconnectFromIpForbidden(),
    el(0x82, "Request Announce Complete", 1837, 0, CAMEL_UNIT(decodeRequestAnnounceComplete)),
    extensions(0xA3),
    callSegmentId(0x85),
    requestAnnouncementStartedNotification(),
};
constexpr MemberTable kPlayAnnouncementLoop = members(Walk::Loop, kPlayAnnouncement);
constexpr Member kPlayAnnouncementArg[] = {
    sequence("Play Announcement", 1209, 1210, kPlayAnnouncementLoop)};

// ---- Prompt And Collect User Information (48) --------------------------------------------------

constexpr Member kPromptAndCollectUserInformation[] = {
    el(0xA0, "Collect Info", 1841, 0, CAMEL_UNIT(decodeCollectInfo)),
    disconnectFromIpForbidden(),
    informationToSend(0xA2),
    extensions(0xA3),
    callSegmentId(0x84),
    requestAnnouncementStartedNotification(),
};
constexpr MemberTable kPromptAndCollectUserInformationLoop =
    members(Walk::Loop, kPromptAndCollectUserInformation);
constexpr Member kPromptAndCollectUserInformationArg[] = {sequence(
    "Prompt And Collect User Info", 1217, 1218, kPromptAndCollectUserInformationLoop)};

// ---- Send Charging Information (46) ------------------------------------------------------------

constexpr Member kSendChargingInformation[] = {
    el(0x80, "SCI Bill & Charg Char", 1255, 1256, table(kSciBillingChargingTable)),
    sendingSideId(0xA1),
    extensions(0xA2),
};
constexpr MemberTable kSendChargingInformationLoop = members(Walk::Loop, kSendChargingInformation);
constexpr Member kSendChargingInformationArg[] = {
    sequence("Send Charging Information", 1234, 1235, kSendChargingInformationLoop)};

// ---- Specialized Resource Report (49) ---------------------------------------------------------
// A choice field over the first two octets: one of the two NULLs of the
// CAP v4 choice, whose length follows, or the whole plain NULL (05 00) of
// the earlier phases, shown with no name.

constexpr Member kSpecializedResourceReport[] = {
    alt(0x9F32, "allAnnouncementsComplete", 1240, none()),
    alt(0x9F33, "firstAnnouncementStarted", 1240, none()),
};

// ---- Play Tone (97) ---------------------------------------------------------------------------

constexpr Member kLegOrCallSegment[] = {
    alt(0x80, "callSegmentID", 0, CAMEL_UNIT(decodeCallSegmentId)),
    alt(0xA1, "legID", 0, CAMEL_UNIT(decodeLegId)),
};
constexpr MemberTable kLegOrCallSegmentChoice = members(Walk::Choice, kLegOrCallSegment, 4188);
constexpr Member kPlayTone[] = {
    el(0xA0, "Leg Or Call Segment", 4186, 4187, table(kLegOrCallSegmentChoice)),
    burst(0xA1),
    extensions(0xA2),
};
constexpr MemberTable kPlayToneLoop = members(Walk::Loop, kPlayTone);
constexpr Member kPlayToneArg[] = {sequence("Play Tone Arg", 4167, 4168, kPlayToneLoop)};

} // namespace

constexpr MemberTable kApplyChargingTable = argument(kApplyChargingArg);
constexpr MemberTable kApplyChargingReportTable = argument(kApplyChargingReportArg);
constexpr MemberTable kCallGapTable = argument(kCallGapArg);
constexpr MemberTable kFurnishChargingInformationTable = argument(kFurnishChargingInformationArg);
constexpr MemberTable kPlayAnnouncementTable = argument(kPlayAnnouncementArg);
constexpr MemberTable kPromptAndCollectUserInformationTable =
    argument(kPromptAndCollectUserInformationArg);
constexpr MemberTable kSendChargingInformationTable = argument(kSendChargingInformationArg);
constexpr MemberTable kSpecializedResourceReportTable =
    members(Walk::Choice, kSpecializedResourceReport, 1238);
constexpr MemberTable kPlayToneTable = argument(kPlayToneArg);

} // namespace camel
