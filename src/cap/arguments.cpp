// The call-control operations' arguments as member tables.  Each row names
// the element's identifier, its element name, its tag and length field ids
// and how its value is decoded (see engine/members.h); the type units the
// rows call are in the other files of this folder.
#include "cap/arguments.h"

#include "cap/arguments_sms.h"
#include "cap/charging.h"
#include "cap/mobile.h"
#include "cap/rows.h"
#include "cap/units.h"

namespace camel {

namespace {

// ---- Rows shared by several arguments ------------------------------------------

consteval Member alertingPattern() {
    return el(0x81, "Alerting Pattern", 1125, 0, CAMEL_UNIT(decodeAlertingPattern));
}
consteval Member serviceInteraction(uint32_t tag, uint32_t tagId = 1957) {
    return el(tag, "Service Interaction Ind Two", tagId, 0,
              CAMEL_UNIT(decodeServiceInteractionIndicatorsTwo));
}
consteval Member callingPartysCategory(uint32_t tag) {
    return el(tag, "Calling Partys Category", 1632, 0, CAMEL_UNIT(decodeCallingPartysCategory));
}
consteval Member genericNumbers(uint32_t tag) {
    return el(tag, "Generic Numbers", 2008, 0, CAMEL_UNIT(decodeGenericNumbers));
}
consteval Member cugInterlock(uint32_t tag, uint32_t tagId) {
    return el(tag, "CUG Interlock", tagId, 0, CAMEL_UNIT(decodeCugInterlock));
}
consteval Member cugOutgoingAccess(uint32_t tag, uint32_t tagId) {
    return el(tag, "CUG Outgoing Access", tagId, 0, CAMEL_UNIT(decodeCugOutgoingAccess));
}
consteval Member chargeNumber(uint32_t tag, uint32_t tagId) {
    return el(tag, "Charge Number", tagId, 0, CAMEL_UNIT(decodeChargeNumber));
}
consteval Member carrier(uint32_t tag, uint32_t tagId) {
    return el(tag, "Carrier", tagId, 0, CAMEL_UNIT(decodeCarrier));
}
consteval Member suppressionOfAnnouncement() {
    return el(0x9F37, "Suppression Of Announcement", 2013, 0, CAMEL_UNIT(decodeNoneNull));
}
consteval Member naOliInfo(uint32_t tag) {
    return el(tag, "NA Oli Info", 2015, 0, CAMEL_UNIT(decodeNaOliInfo));
}
consteval Member borInterrogationRequested(uint32_t tag) {
    return el(tag, "bor_InterrogationRequested", 4326, 4327, none());
}
consteval Member redirectingPartyId() {
    return el(0x9D, "Redirecting Party Id", 1812, 0, CAMEL_UNIT(decodeRedirectingPartyId));
}
consteval Member redirectionInformation() {
    return el(0x9E, "Redirection Information", 1824, 0, CAMEL_UNIT(decodeRedirectionInformation));
}
consteval Member originalCalledPartyId(uint32_t tag) {
    return el(tag, "Original Called Party Id", 1640, 0, CAMEL_UNIT(decodeOriginalCalledPartyId));
}
consteval Member eventTypeBcsm(uint32_t tag) {
    return el(tag, "Event Type BCSM", 1555, 0, CAMEL_UNIT(decodeEventTypeBcsm));
}
consteval Member callingPartyNumber(uint32_t tag) {
    return el(tag, "Calling Party Number", 1612, 0, CAMEL_UNIT(decodeCallingPartyNumber));
}

// Destination Routing Address: called party numbers while the next
// identifier is 04.
constexpr Member kCalledPartyNumberItem[] = {
    el(0x04, "Called Party Number", 1614, 0, CAMEL_UNIT(decodeCalledPartyNumber))};
constexpr MemberTable kCalledPartyNumbers = members(Walk::Repeat, kCalledPartyNumberItem);
consteval Member destinationRoutingAddress() {
    return el(0xA0, "Destination Routing Address", 1830, 1831, table(kCalledPartyNumbers));
}


// ---- Assist Request Instructions (16) -----------------------------------------------

constexpr Member kAssistRequestInstructions[] = {
    el(0x80, "Correlation Id ", 1429, 1430, CAMEL_UNIT(decodeGenericNumber)),
    el(0x82, "Ipssp Capabilities", 1431, 0, CAMEL_UNIT(decodeIpSspCapabilities)),
    extensions(0xA3),
};
constexpr MemberTable kAssistRequestInstructionsLoop =
    members(Walk::Loop, kAssistRequestInstructions);
constexpr Member kAssistRequestInstructionsArg[] = {sequence(
    "Assist Request Instructions", 1079, 1080, kAssistRequestInstructionsLoop)};

// ---- Call Information Report (44) and Request (45) -------------------------------------

constexpr Member kCallInformationReport[] = {
    el(0xA0, "Requested Information List", 1497, 1498,
       CAMEL_UNIT(decodeRequestedInformationList)),
    extensions(0xA2),
    receivingSideId(0xA3),
};
constexpr MemberTable kCallInformationReportLoop = members(Walk::Loop, kCallInformationReport);
constexpr Member kCallInformationReportArg[] = {
    sequence("Call Information Report", 1092, 1093, kCallInformationReportLoop)};

constexpr Member kCallInformationRequest[] = {
    el(0xA0, "Req. Info Type List", 1522, 1523, CAMEL_UNIT(decodeRequestedInfoTypeList)),
    extensions(0xA2),
    sendingSideId(0xA3),
};
constexpr MemberTable kCallInformationRequestLoop = members(Walk::Loop, kCallInformationRequest);
constexpr Member kCallInformationRequestArg[] = {
    sequence("Call Information Request", 1098, 1099, kCallInformationRequestLoop)};

// ---- Cancel (53): a choice without an outer SEQUENCE ---------------------------------------

constexpr Member kCallSegmentToCancel[] = {
    el(0x80, "Invoke Id", 1529, 1530, octet(1531)),
    callSegmentId(0x81),
};
constexpr MemberTable kCallSegmentToCancelMembers = members(Walk::InOrder, kCallSegmentToCancel);
constexpr Member kCancel[] = {
    alt(0x80, "Invoke Id", 1530, octet(1531)),
    alt(0x81, "All Requests", 1528, none()),
    alt(0xA2, "Call Segment To Cancel", 4206, table(kCallSegmentToCancelMembers)),
};

// ---- Connect (20) -----------------------------------------------------------------------

constexpr Member kConnect[] = {
    destinationRoutingAddress(),
    alertingPattern(),
    originalCalledPartyId(0x86),
    extensions(0xAA),
    carrier(0x8B, 1952),
    callingPartysCategory(0x9C),
    redirectingPartyId(),
    redirectionInformation(),
    genericNumbers(0xAE),
    serviceInteraction(0xAF),
    chargeNumber(0x93, 1939),
    cugInterlock(0x9F1F, 1946),
    cugOutgoingAccess(0x9F20, 1950),
    suppressionOfAnnouncement(),
    el(0x9F38, "OCSI Applicable", 2014, 0, CAMEL_UNIT(decodeNoneNull)),
    naOliInfo(0x9F39),
    borInterrogationRequested(0x9F3A),
};
constexpr MemberTable kConnectLoop = members(Walk::Loop, kConnect);
constexpr Member kConnectArg[] = {sequence("Connect", 1105, 1106, kConnectLoop)};

// ---- Connect to Resource (19) --------------------------------------------------------------

// The resource address is an untagged CHOICE: its identifier is shown as
// the choice field in place of a tag.
constexpr Member kConnectToResource[] = {
    el(0x80, "Resource Address", 1532, 1534, CAMEL_UNIT(decodeIsupAddress)),
    el(0x83, "Resource Address", 1532, 0, CAMEL_UNIT(decodeNoneNull)),
    extensions(0xA4),
    serviceInteraction(0xA7),
    callSegmentId(0x9F32, 4179),
};
constexpr MemberTable kConnectToResourceLoop = members(Walk::Loop, kConnectToResource);
constexpr Member kConnectToResourceArg[] = {
    sequence("Connect to Resource", 1129, 1130, kConnectToResourceLoop)};

// ---- Continue With Argument (56 and 88) -----------------------------------------------------

constexpr Member kContinueWithArgument[] = {
    alertingPattern(),
    extensions(0xA6),
    serviceInteraction(0xA7),
    callingPartysCategory(0x8C),
    genericNumbers(0xB0),
    cugInterlock(0x91, 1945),
    cugOutgoingAccess(0x92, 1949),
    chargeNumber(0x9F32, 1940),
    carrier(0x9F34, 1953),
    suppressionOfAnnouncement(),
    naOliInfo(0x9F38),
    borInterrogationRequested(0x9F39),
    el(0x9F3A, "suppress_O_CSI", 4329, 4330, none()),
    el(0xBF3B, "Continue With Argument Arg Extension", 4209, 4210,
       CAMEL_UNIT(decodeContinueWithArgumentArgExtension)),
};
constexpr MemberTable kContinueWithArgumentLoop = members(Walk::Loop, kContinueWithArgument);
constexpr Member kContinueWithArgumentArg[] = {
    sequence("Continue With Argument", 1241, 1242, kContinueWithArgumentLoop)};

// ---- Establish Temporary Connection (17) ---------------------------------------------------

constexpr Member kEstablishTemporaryConnection[] = {
    el(0x80, "Assisting Ssp IP Routing Address", 1536, 1537, CAMEL_UNIT(decodeGenericNumber)),
    el(0x81, "Correlation Id ", 1427, 1428, CAMEL_UNIT(decodeGenericNumber)),
    el(0x83, "SCF Id", 1538, 0, CAMEL_UNIT(decodeScfId)),
    extensions(0xA4),
    carrier(0x85, 1952),
    serviceInteraction(0xA6),
    naOliInfo(0x9F32),
    chargeNumber(0x9F33, 1940),
};
constexpr MemberTable kEstablishTemporaryConnectionLoop =
    members(Walk::Loop, kEstablishTemporaryConnection);
constexpr Member kEstablishTemporaryConnectionArg[] = {sequence(
    "Establish Temporary Connection", 1134, 1135, kEstablishTemporaryConnectionLoop)};

// ---- Event Report BCSM (24) ---------------------------------------------------------------

constexpr Member kEventReportBcsm[] = {
    eventTypeBcsm(0x80),
    el(0xA2, "Event Specific Info BCSM", 1558, 0, CAMEL_UNIT(decodeEventSpecificInfoBcsm)),
    receivingSideId(0xA3),
    miscCallInfo(0xA4),
    extensions(0xA5),
};
constexpr MemberTable kEventReportBcsmLoop = members(Walk::Loop, kEventReportBcsm);
constexpr Member kEventReportBcsmArg[] = {
    sequence("Event Report BCSM", 1144, 1145, kEventReportBcsmLoop)};

// ---- Initial DP (0) -------------------------------------------------------------------------

constexpr Member kInitialDp[] = {
    serviceKey(0x80),
    el(0x82, "Called Party Number", 1614, 0, CAMEL_UNIT(decodeCalledPartyNumber)),
    callingPartyNumber(0x83),
    callingPartysCategory(0x85),
    el(0x87, "Cg Encountered", 1635, 0, CAMEL_UNIT(decodeCgEncountered)),
    el(0x88, "Ipssp Capabilities", 1431, 0, CAMEL_UNIT(decodeIpSspCapabilities)),
    el(0x8A, "Location Number", 1638, 0, CAMEL_UNIT(decodeLocationNumber)),
    originalCalledPartyId(0x8C),
    extensions(0xAF),
    el(0x97, "High Layer Compatibility", 1671, 0, CAMEL_UNIT(decodeHighLayerCompatibility)),
    el(0x99, "Add. Calling Party No.", 1686, 1687,
       CAMEL_UNIT(decodeAdditionalCallingPartyNumber)),
    el(0xBB, "Bearer Capability", 1698, 0, CAMEL_UNIT(decodeBearerCapability)),
    eventTypeBcsm(0x9C),
    redirectingPartyId(),
    redirectionInformation(),
    cause(0x91),
    serviceInteraction(0xBF20, 1958),
    carrier(0x9F25, 1953),
    el(0x9F2D, "CUG Index", 1191, 0, CAMEL_UNIT(decodeCugIndex)),
    cugInterlock(0x9F2E, 1946),
    cugOutgoingAccess(0x9F2F, 1950),
    imsi(0x9F32, 2018),
    el(0xBF33, "Subscriber State", 2110, 2111, CAMEL_UNIT(decodeSubscriberState)),
    locationInformation(0xBF34, 2031),
    el(0xBF35, "Ext Basic Service Code", 2125, 2126, CAMEL_UNIT(decodeExtBasicServiceCode)),
    callReferenceNumber(0x9F36, 2133, 2134, 2135),
    isdnAddressString(0x9F37),
    calledPartyBcdNumber(0x9F38, 2137),
    timeAndTimezone(0x9F39, 2230),
    el(0x9F3A, "Gsm Forwarding Pending", 1194, 1195, none()),
    el(0xBF3B, "Initial DP Arg Extension", 1196, 1197, table(kInitialDpArgExtensionTable)),
};
constexpr MemberTable kInitialDpLoop = members(Walk::Loop, kInitialDp);
constexpr Member kInitialDpArg[] = {sequence("Initial DP", 1159, 1160, kInitialDpLoop)};

// ---- Release Call (22): a Cause whose identifier is not checked ---------------------------------

constexpr Member kReleaseCallArg[] = {cause(kAnyTag)};

// ---- Request Report BCSM Event (23) ------------------------------------------------------------

constexpr Member kRequestReportBcsmEvent[] = {
    el(0xA0, "BCSM Events", 1897, 1898, CAMEL_UNIT(decodeBcsmEvents)),
    extensions(0xA2),
};
constexpr MemberTable kRequestReportBcsmEventLoop = members(Walk::Loop, kRequestReportBcsmEvent);
constexpr Member kRequestReportBcsmEventArg[] = {
    sequence("Request Report BCSM Event", 1224, 1225, kRequestReportBcsmEventLoop)};

// ---- Reset Timer (33) -------------------------------------------------------------------------

constexpr Member kResetTimer[] = {
    timerId(0x80),
    timerValue(0x81),
    extensions(0xA2),
    callSegmentId(0x83),
};
constexpr MemberTable kResetTimerLoop = members(Walk::Loop, kResetTimer);
constexpr Member kResetTimerArg[] = {sequence("Reset Timer", 1228, 1229, kResetTimerLoop)};

// ---- Call-party handling (32, 86, 90, 93, 95, 96) ------------------------------------------------

constexpr Member kDisconnectForwardConnectionWithArgument[] = {callSegmentId(0x81),
                                                               extensions(0xA2)};
constexpr MemberTable kDisconnectForwardConnectionWithArgumentLoop =
    members(Walk::Loop, kDisconnectForwardConnectionWithArgument);
constexpr Member kDisconnectForwardConnectionWithArgumentArg[] = {
    sequence("Disconnect Forward Connection With Argument Arg", 4140, 4141,
             kDisconnectForwardConnectionWithArgumentLoop)};

constexpr Member kInitiateCallAttempt[] = {
    destinationRoutingAddress(),
    extensions(0xA4),
    legId(0xA5),
    callSegmentId(0x86),
    callingPartyNumber(0x9E),
    callReferenceNumber(0x9F33, 4175),
    isdnAddressString(0x9F34),
    el(0x9F35, "suppress_T_CSI", 4333, 4334, none()),
};
constexpr MemberTable kInitiateCallAttemptLoop = members(Walk::Loop, kInitiateCallAttempt);
constexpr Member kInitiateCallAttemptArg[] = {
    sequence("Initiate Call Attempt Arg", 4144, 4145, kInitiateCallAttemptLoop)};

constexpr Member kDisconnectLeg[] = {legId(0xA0), cause(0x81), extensions(0xA2)};
constexpr MemberTable kDisconnectLegLoop = members(Walk::Loop, kDisconnectLeg);
constexpr Member kDisconnectLegArg[] = {
    sequence("Disconnect Leg Arg", 4153, 4154, kDisconnectLegLoop)};

constexpr Member kMoveLeg[] = {legId(0xA0), extensions(0xA2)};
constexpr MemberTable kMoveLegLoop = members(Walk::Loop, kMoveLeg);
constexpr Member kMoveLegArg[] = {sequence("Move Leg Arg", 4158, 4159, kMoveLegLoop)};

constexpr Member kSplitLeg[] = {legId(0xA0), callSegmentId(0x81), extensions(0xA2)};
constexpr MemberTable kSplitLegLoop = members(Walk::Loop, kSplitLeg);
constexpr Member kSplitLegArg[] = {sequence("Split Leg Arg", 4161, 4162, kSplitLegLoop)};

constexpr Member kCallSegmentFailure[] = {callSegmentId(0x80), cause(0x82)};
constexpr MemberTable kCallSegmentFailureMembers = members(Walk::Loop, kCallSegmentFailure);
constexpr Member kBcsmFailure[] = {legId(0xA0), cause(0x82)};
constexpr MemberTable kBcsmFailureMembers = members(Walk::Loop, kBcsmFailure);
constexpr Member kEntityReleased[] = {
    alt(0xA0, "Call Segment Failure", 4165, table(kCallSegmentFailureMembers)),
    alt(0xA1, "BCSM Failure", 4165, table(kBcsmFailureMembers)),
};

// ---- The argument tables ----------------------------------------------------------------------


constexpr MemberTable kAssistRequestInstructionsTable = argument(kAssistRequestInstructionsArg);
constexpr MemberTable kCallInformationReportTable = argument(kCallInformationReportArg);
constexpr MemberTable kCallInformationRequestTable = argument(kCallInformationRequestArg);
constexpr MemberTable kCancelTable = members(Walk::Choice, kCancel, 1103);
constexpr MemberTable kConnectTable = argument(kConnectArg);
constexpr MemberTable kConnectToResourceTable = argument(kConnectToResourceArg);
constexpr MemberTable kContinueWithArgumentTable = argument(kContinueWithArgumentArg);
constexpr MemberTable kEstablishTemporaryConnectionTable =
    argument(kEstablishTemporaryConnectionArg);
constexpr MemberTable kEventReportBcsmTable = argument(kEventReportBcsmArg);
constexpr MemberTable kInitialDpTable = argument(kInitialDpArg);
constexpr MemberTable kReleaseCallTable = argument(kReleaseCallArg);
constexpr MemberTable kRequestReportBcsmEventTable = argument(kRequestReportBcsmEventArg);
constexpr MemberTable kResetTimerTable = argument(kResetTimerArg);
constexpr MemberTable kDisconnectForwardConnectionWithArgumentTable =
    argument(kDisconnectForwardConnectionWithArgumentArg);
constexpr MemberTable kInitiateCallAttemptTable = argument(kInitiateCallAttemptArg);
constexpr MemberTable kDisconnectLegTable = argument(kDisconnectLegArg);
constexpr MemberTable kMoveLegTable = argument(kMoveLegArg);
constexpr MemberTable kSplitLegTable = argument(kSplitLegArg);
constexpr MemberTable kEntityReleasedTable = members(Walk::Choice, kEntityReleased, 4164);

} // namespace

const Argument kArguments[] = {
    {55, nullptr}, // Activity Test
    {35, &kApplyChargingTable},
    {36, &kApplyChargingReportTable},
    {16, &kAssistRequestInstructionsTable},
    {41, &kCallGapTable},
    {44, &kCallInformationReportTable},
    {45, &kCallInformationRequestTable},
    {53, &kCancelTable},
    {20, &kConnectTable},
    {19, &kConnectToResourceTable},
    {31, nullptr}, // Continue
    {56, &kContinueWithArgumentTable},
    {18, nullptr}, // Disconnect Forward Connection
    {17, &kEstablishTemporaryConnectionTable},
    {24, &kEventReportBcsmTable},
    {34, &kFurnishChargingInformationTable},
    {0, &kInitialDpTable},
    {47, &kPlayAnnouncementTable},
    {48, &kPromptAndCollectUserInformationTable},
    {22, &kReleaseCallTable},
    {23, &kRequestReportBcsmEventTable},
    {33, &kResetTimerTable},
    {46, &kSendChargingInformationTable},
    {49, &kSpecializedResourceReportTable},
    {62, &kConnectSmsTable},
    {65, nullptr}, // SMS Continue
    {64, &kEventReportSmsTable},
    {61, &kFurnishChargingInformationSmsTable},
    {60, &kInitialDpSmsTable},
    {66, &kReleaseSmsTable},
    {63, &kRequestReportSmsEventTable},
    {67, &kResetTimerSmsTable},
    {70, nullptr}, // GPRS Activity Test
    {86, &kDisconnectForwardConnectionWithArgumentTable},
    {32, &kInitiateCallAttemptTable},
    {88, &kContinueWithArgumentTable},
    {90, &kDisconnectLegTable},
    {93, &kMoveLegTable},
    {95, &kSplitLegTable},
    {96, &kEntityReleasedTable},
    {97, &kPlayToneTable},
};
const uint32_t kArgumentCount = sizeof(kArguments) / sizeof(kArguments[0]);

} // namespace camel
