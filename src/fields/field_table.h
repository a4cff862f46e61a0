// Every field the grammar reports, declared once, in catalogue order: the
// order in which a depth-first walk of the grammar first meets each field
// (message types 0x61, 0x62, 0x64, 0x65, 0x67; each unit's fields and child
// units in decoding order).  Display ids are derived from this order, so a
// new unit's fields go where the walk first meets them, not at the end.
#pragma once

#include <cstddef>
#include <cstdint>

#include "fields/field_def.h"
#include "fields/names_cap.h"
#include "fields/names_charging.h"
#include "fields/names_tcap.h"

namespace camel {

namespace fid {
// Field ids the engine itself reports.
inline constexpr uint32_t kEndOfContents = 1065;
} // namespace fid

inline constexpr FieldDef kFields[] = {
    // ---- Message level: message type, then the Unidirectional message ----
    enumField(3604, "MT", names::kMessageType).key(0, KeyForm::Octet),
    headerLength(3606),
    // Unidirectional dialogue portion, decoded inline by the message
    tagField(3615, "Dialogue Portion Tag"),
    blockLength(3616),
    hexField(fid::kEndOfContents, "End of contents", 16),
    // Unidirectional External
    tagField(3622, "External Tag"),
    blockLength(3623),
    tagField(3717, "Object Identifier Tag"),
    octetLength(3718),
    hexField(3719, "  Dialogue-as-ID ccitt recommendation"),
    hexField(3720, "  q"),
    hexField(3721, "  773"),
    hexField(3722, "  Space Character"),
    hexField(3723, "  as(1)"),
    hexField(3724, "  UnidialoguePDU"),
    hexField(3725, "  version1(1)"),
    tagField(3726, "Single ASN.1 Type Tag"),
    headerLength(3727),
    tagField(3728, "Unidirectional Dialogue Tag"),
    blockLength(3729),
    // PDU members shared by the request, response and unidirectional PDUs
    tagField(3786, "Protocol Version Tag"),
    octetLength(3787),
    digitsField(3788, "  Protocol Version").indented(),
    tagField(3789, "Application Context Name Tag"),
    octetLength(3790, "  Application Context Name Length"),
    tagField(3791, "Object Identifier Tag"),
    octetLength(3792),
    hexField(3793, "  Application Context Name CCITT recommendation"),
    hexField(3794, "  etsi"),
    hexField(3795, "  mobile Domain"),
    hexField(3796, "  umts/gsm Network"),
    enumField(3797, "cap", names::kAcCap).indented(),
    enumField(3799, "dialoguePDU", names::kAcDialoguePdu).indented(),
    enumField(3800, "version", names::kAcVersion).indented(),
    hexField(3877, "ac").indented(),
    enumField(3878, "Context", names::kCap3Context),
    hexField(3879, "ac").indented(),
    enumField(3880, "Context", names::kCap3OeContext),
    tagField(3801, "User Information Tag"),
    blockLength(3802),
    tagField(3808, "External Tag"),
    blockLength(3809),
    tagField(3819, "Object Identifier Tag"),
    octetLength(3820),
    hexField(3821, "CCITT Identified Organisation"),
    hexField(3822, "ETSI"),
    hexField(3823, "Mobile Domain"),
    hexField(3824, "GSM/UMTS_Network"),
    hexField(3825, "As_id"),
    enumField(3826, "Cap-datatypes", names::kCapDatatypes),
    hexField(3827, "Version3(2)"),
    tagField(3828, "Integer Tag"),
    octetLength(3829),
    digitsField(3830, "  Indirect Reference").indented(),
    tagField(3831, "Single ASN.1 Type Tag"),
    headerLength(3832),
    // Opaque walker over a Single ASN.1 Type of the user information
    hexField(3835, "", 1),
    enumField(3848, "ASN.1 Tag CLASS", names::kAsn1TagClass, 2).indented(),
    enumField(3849, "ASN.1 Tag FORM", names::kAsn1TagForm, 1).indented(),
    enumField(3850, "ASN.1 Tag Number", names::kAsn1TagNumber, 5).indented(),
    octetLength(3842, "Single-ASN.1 Length").indented(),
    hexField(3844, "ASN Type VALUE").indented(),
    octetLength(3841, "Single-ASN.1 Length").indented(),
    tagField(3851, "Octet Aligned Tag"),
    headerLength(3852),
    digitsField(3853, "Octet-Aligned Value").indented(),
    tagField(3854, "Arbitrary Tag"),
    headerLength(3855),
    digitsField(3856, "  Arbitrary Value").indented(),
    // Component portion (the Unidirectional message's, then every message's)
    tagField(3629, "Component Portion Tag"),
    blockLength(3630),
    tagField(3660, "Invoke"),
    blockLength(3661),
    tagField(3703, "Invoke Id Tag"),
    octetLength(3704),
    unsignedField(3705, "  Invoke Id").key(4, KeyForm::Octet),
    tagField(3706, "Linked Id Tag"),
    octetLength(3707),
    unsignedField(3708, "  Linked Id"),
    // Operation dispatch
    enumField(3876, "Operation Code Tag", names::kOperationCodeTag),
    octetLength(3668),
    enumField(1066, "Operation ID(Invoke)", names::kOperation).key(5, KeyForm::Octet),

    // ==== Charging, call gap and information to send (cap/charging.cpp): fields in decoding order
    // Apply Charging
    tagField(1072, "Sequence Tag"),
    argLength(1073),
    tagField(1377, "Ach Bill Charging Chars Tag"),
    argLength(1378),
    tagField(1380, "Time Duration Charging Tag"),
    argLength(1382),
    tagField(1387, "Max Call Period Duration Tag"),
    argLength(1388),
    unsignedField(1389, "Max Call Period Duration(100 milliseconds)", 0).indented(),
    tagField(1390, "Release IF Duration Exceeded Tag"),
    argLength(1391),
    enumField(1392, "Release If Duration Exceeded Value", names::kFalse).otherwise("True").indented(),
    tagField(1394, "Tariff Switch Interval Tag"),
    argLength(1395),
    unsignedField(1396, "Tariff Switch Interval(second)", 0).indented(),
    tagField(4232, "AudibleIndicator Tag"),
    argLength(4233),
    enumField(4234, "AudibleIndicator Type", names::kAudibleIndicator),
    argLength(4236),
    enumField(4237, "Boolean Value", names::kFalse).otherwise("True").indented(),
    argLength(4239),
    tagField(4241, "WarningPeriod Tag"),
    argLength(4242),
    unsignedField(4243, "Warning Period (in seconds)", 0).indented(),
    tagField(4244, "Burst Tag"),
    argLength(4245),
    tagField(4252, "numberOfBursts Tag"),
    argLength(4253),
    unsignedField(4254, "Number Of Bursts").indented(),
    tagField(4255, "burstInterval Tag"),
    argLength(4256),
    unsignedField(4257, "Burst Interval (in 100 msec units)").indented(),
    tagField(4258, "numberOfTonesInBurst Tag"),
    argLength(4259),
    unsignedField(4260, "Number Of Tones In Burst").indented(),
    tagField(4261, "toneDuration Tag"),
    argLength(4262),
    unsignedField(4263, "Tone Duration (in 100 msec units)").indented(),
    tagField(4264, "toneInterval Tag"),
    argLength(4265),
    unsignedField(4266, "Tone Interval (in 100 msec units)").indented(),
    tagField(4198, "AChChargingAddress Tag", 16),
    argLength(4199),
    hexField(4200, "AChChargingAddress Type", 5),
    tagField(4203, "AChChargingAddress Tag (legID)"),
    tagField(4205, "AChChargingAddress Tag (srfConnection)", 16),
    // Apply Charging Report
    tagField(1401, "Call Result Tag"),
    argLength(1402),
    tagField(1404, "Time Duration Charging Result"),
    argLength(1405),
    tagField(1410, "Time Information").indented(),
    argLength(1411),
    enumField(1412, "Choice", names::kTimeInformation),
    argLength(1414),
    unsignedField(1415, "Time If No Tariff Switch(100 millisecond)", 0).indented(),
    argLength(1416),
    tagField(1418, "Time Since Tariff Switch Tag"),
    argLength(1419),
    unsignedField(1420, "Time Since Tariff Switch Value(100 millisecond)", 0).indented(),
    tagField(1421, "Call Active Tag"),
    argLength(1422),
    enumField(1423, "Call Active", names::kFalse).otherwise("True").indented(),
    tagField(1425, "Call Released At Tcp Expiry"),
    argLength(1426, "LENGTH(null)"),
    tagField(4196, "AChChargingAddress Tag"),
    argLength(4197),
    // Call Gap
    tagField(1084, "Sequence Tag"),
    argLength(1085),
    tagField(1440, "Gap Criteria Tag"),
    argLength(1441),
    enumField(1442, "Choice", names::kGapCriteria).display(names::kGapCriteriaShown),
    argLength(1521),
    argLength(1451),
    argLength(1452),
    tagField(1520, "Called Address Value Tag"),
    argLength(1453),
    tagField(1454, "Calling Address Tag"),
    argLength(1455),
    argLength(1448),
    tagField(1444, "Basic Gap Criteria Tag"),
    argLength(1445),
    names::firstNames(enumField(1446, "Choice", names::kGapCriteria).display(names::kGapCriteriaShown),
                      names::kBasicGapCriteriaCount),
    tagField(1456, "Gap Indicator Tag"),
    argLength(1457),
    tagField(1464, "Duration Tag"),
    argLength(1465),
    hexField(1466, "Duration Value", 0).indented(),
    tagField(1461, "Gap Interval Tag"),
    argLength(1462),
    hexField(1463, "Gap Interval Data", 0).indented(),
    tagField(1467, "Control Type Tag"),
    argLength(1468),
    enumField(1469, "Control Type", names::kControlType).indented(),
    tagField(1470, "Gap Treatment Tag"),
    argLength(1471),
    enumField(1472, "Choice", names::kGapTreatment).display(names::kGapTreatmentShown),
    // Information To Send
    argLength(1303),
    enumField(1304, "Choice", names::kInformationToSend).display(names::kInformationToSendShown),
    argLength(1315),
    tagField(1329, "Message Id Tag"),
    argLength(1330),
    enumField(1331, "Choice", names::kMessageId).display(names::kMessageIdShown),
    argLength(1334),
    unsignedField(1335, "Elementary ID Value", 0).indented(),
    argLength(1336),
    tagField(1339, "Message Content Tag"),
    argLength(1340),
    digitsField(1341, "Message Content Info").indented(),
    tagField(1342, "Attributes Tag"),
    argLength(1343),
    digitsField(1344, "Attributes Info").indented(),
    argLength(1345),
    tagField(1347, "Elementary Id Tag"),
    argLength(1348),
    unsignedField(1349, "Elementary Id Value", 0).indented(),
    argLength(1350),
    tagField(1333, "Elementary Message Tag"),
    tagField(1354, "Variable Parts Tag"),
    argLength(1355),
    tagField(1357, "Integer Tag").indented(),
    argLength(1358),
    unsignedField(1359, "Integer Value", 0).indented(),
    tagField(1372, "Number Tag").indented(),
    argLength(1373),
    enumField(1649, "Type Of Digits", names::kTypeOfDigits, 5).otherwise("Spare").indented(),
    enumField(3530, "Encoding Scheme", names::kEncodingScheme, 3).indented(),
    enumField(3533, "Encoding Scheme", names::kEncodingScheme, 3).indented(),
    digitsField(3536, "Bcd Digits"),
    digitsField(3539, "Bcd Digits").indented(),
    digitsField(3548, "Binary Digits").indented(),
    digitsField(3551, "Binary Digits").indented(),
    tagField(1360, "Time Tag"),
    argLength(1361),
    hexField(1362, "Hour").indented(),
    hexField(1363, "Minute").indented(),
    tagField(1364, "Date Tag"),
    argLength(1365),
    hexField(1366, "Year", 16).indented(),
    hexField(1367, "Month").indented(),
    hexField(1368, "Day").indented(),
    tagField(1369, "Price Tag"),
    argLength(1370),
    hexField(1371, "Price Value", 0).indented(),
    tagField(1320, "Number Of Repetitions Tag"),
    argLength(1321),
    unsignedField(1322, "Number Of Rep. Value").indented(),
    tagField(1323, "Duration Tag"),
    argLength(1324),
    unsignedField(1325, "Duration Value", 0).indented(),
    tagField(1326, "Interval Tag"),
    argLength(1327),
    unsignedField(1328, "Interval Data", 0).indented(),
    argLength(1306),
    tagField(1309, "Tone Id Tag"),
    argLength(1310),
    hexField(1311, "Tone Id Info", 0).indented(),
    tagField(1312, "Duration Tag"),
    argLength(1313),
    unsignedField(1314, "Duration Info", 0).indented(),
    // Furnish Charging Information
    tagField(1151, "Furnish Charging Information Tag"),
    argLength(1152),
    tagField(1153, "Camel Fci Bill Cha Char Tag"),
    argLength(1154),
    tagField(2186, "Free Format Data Tag"),
    argLength(2187),
    digitsField(2188, "Free Format Data").indented(),
    tagField(2189, "Append Free FORMAT Data").indented(),
    argLength(2190),
    enumField(2191, "Append Free Format Data", names::kAppendFreeFormatData, 2).indented(),
    // Play Announcement, Prompt And Collect User Info
    tagField(1209, "Sequence Tag"),
    argLength(1210),
    tagField(1302, "Information To Send Tag"),
    tagField(1833, "Disconnect From IP Forbidden Tag"),
    tagField(1837, "Request Announce Complete Tag"),
    tagField(4328, "requestAnnouncementStartedNotification Tag", 16).indented(),
    tagField(1217, "Sequence Tag"),
    argLength(1218),
    tagField(1841, "Collect Info Tag"),
    // Send Charging Information
    tagField(1234, "Sequence Tag"),
    argLength(1235),
    tagField(1255, "SCI Bill & Charg Char Tag"),
    argLength(1256),
    enumField(1257, "Choice", names::kSciBillingCharging).display(names::kSciBillingChargingShown),
    argLength(1260),
    tagField(1271, "CAI GSM0224 Tag").indented(),
    argLength(1272),
    tagField(1281, "E1 Tag").indented(),
    argLength(1282),
    unsignedField(1283, "E1", 0).indented(),
    tagField(1284, "E2 Tag"),
    argLength(1285),
    unsignedField(1286, "E2", 0).indented(),
    tagField(1287, "E3 Tag"),
    argLength(1288),
    unsignedField(1289, "E3", 0).indented(),
    tagField(1290, "E4 Tag"),
    argLength(1291),
    unsignedField(1292, "E4", 0).indented(),
    tagField(1293, "E5 Tag"),
    argLength(1294),
    unsignedField(1295, "E5", 0).indented(),
    tagField(1296, "E6 Tag"),
    argLength(1297),
    unsignedField(1298, "E6", 0).indented(),
    tagField(1299, "E7 Tag"),
    argLength(1300),
    unsignedField(1301, "E7", 0).indented(),
    tagField(1264, "AOC Subsequent Tag"),
    argLength(1265),
    // Specialized Resource Report
    enumField(1238, "SpecializedResourceReportArg Choice", names::kSpecializedResourceReport, 16),
    argLength(1240),
    // Play Tone
    tagField(4167, "PlayToneArg Tag"),
    argLength(4168),
    tagField(4186, "LegOrCallSegment Tag"),
    argLength(4187),
    enumField(4188, "LegOrCallSegment Type", names::kLegOrCallSegment),

    // ==== CAMEL operation arguments: argument skeletons and the element
    // ==== tags the argument tables show (cap/arguments.cpp)
    // Assist Request Instructions
    tagField(1079, "Sequence Tag"),
    argLength(1080),
    tagField(1429, "Correlation Id Tag"),
    argLength(1430),
    tagField(1431, "IP Ssp Capabilities Tag"),
    tagField(1481, "Extensions Tag"),
    // Call Information Report, Call Information Request
    tagField(1092, "Sequence Tag"),
    argLength(1093),
    tagField(1497, "Requested Information List Tag"),
    argLength(1498),
    tagField(1545, "Receiving Side ID Tag"),
    tagField(1098, "Sequence Tag"),
    argLength(1099),
    tagField(1522, "Request Info. Type List Tag"),
    argLength(1523),
    tagField(1549, "Party to Charge Tag"),
    // Cancel
    enumField(1103, "Choice", names::kCancelChoice).display(names::kCancelChoiceShown),
    argLength(1530),
    unsignedField(1531, "Invoke Id").indented(),
    argLength(1528),
    argLength(4206),
    tagField(1529, "Invoke Id Tag"),
    tagField(4178, "CallSegmentID Tag"),
    // Connect
    tagField(1105, "Sequence Tag"),
    argLength(1106),
    tagField(1830, "Destination Routing Address Tag"),
    argLength(1831),
    tagField(1614, "Called Party Number Tag"),
    tagField(1125, "Alerting Pattern Tag"),
    tagField(1640, "Original Called Party Id Tag"),
    tagField(1952, "Carrier Tag"),
    tagField(1632, "Calling Partys Category Tag"),
    tagField(1812, "Redirecting Party Id Tag"),
    tagField(1824, "Redirection Information Tag"),
    tagField(2008, "Generic Numbers Tag"),
    tagField(1957, "Service Interaction Ind Two Tag"),
    tagField(1939, "Charge Number Tag"),
    tagField(1946, "CUG Interlock Tag", 16),
    tagField(1950, "CUG Outgoing Access Tag", 16),
    tagField(2013, "Suppression Of Announcement Tag", 16),
    tagField(2014, "OCSI applicable", 16),
    tagField(2015, "NA Oli Info Tag", 16),
    tagField(4326, " bor_InterrogationRequested Tag", 16),
    argLength(4327),
    // Connect to Resource
    tagField(1129, "Sequence Tag"),
    argLength(1130),
    enumField(1532, "Resource Address(choice)", names::kResourceAddress)
        .display(names::kResourceAddressShown),
    argLength(1534),
    tagField(4179, "CallSegmentID Tag", 16),
    // Continue With Argument
    tagField(1241, "Sequence Tag"),
    argLength(1242),
    tagField(1945, "CUG Interlock Tag"),
    tagField(1949, "CUG Outgoing Access Tag"),
    tagField(1940, "Charge Number Tag", 16),
    tagField(1953, "Carrier Tag", 16),
    tagField(4329, "suppress_O_CSI Tag", 16),
    argLength(4330),
    tagField(4209, "ContinueWithArgumentArgExtension Tag", 16),
    argLength(4210),
    // Establish Temporary Connection
    tagField(1134, "Sequence Tag"),
    argLength(1135),
    tagField(1536, "Assisting Ssp IP Routing Address Tag"),
    argLength(1537),
    tagField(1427, "Correlation Id Tag"),
    argLength(1428),
    tagField(1538, "SCF ID Tag"),
    // Event Report BCSM
    tagField(1144, "Sequence Tag"),
    argLength(1145),
    tagField(1555, "Event Type BCSM Tag"),
    tagField(1558, "Event Specific Info BCSM Tag"),
    tagField(1602, "Misc Call Info Tag"),
    // Initial DP
    tagField(1159, "Sequence Tag"),
    argLength(1160),
    tagField(1609, "Service Key Tag"),
    tagField(1612, "Calling Party Number Tag"),
    tagField(1635, "Cg Encountered Tag"),
    tagField(1638, "Location Number Tag"),
    tagField(1671, "High Layer Compatibility Tag"),
    tagField(1686, "Add. Calling Party No. Tag"),
    argLength(1687),
    tagField(1698, "Bearer Capability Tag"),
    tagField(1474, "Cause Tag"),
    tagField(1958, "Service Interaction Ind Two Tag", 16),
    tagField(1191, "CUG Index Tag", 16),
    tagField(2018, "IMSI Tag", 16),
    tagField(2110, "Subscriber State Tag", 16),
    argLength(2111),
    tagField(2031, "Location Information Tag", 16),
    tagField(2125, "Ext Basic Service Code Tag", 16),
    argLength(2126),
    tagField(2133, "Call Reference Number Tag", 16),
    argLength(2134),
    digitsField(2135, "Call Reference Number Value").indented(),
    tagField(2159, "SMS MSC Address Tag", 16),
    tagField(2137, "Called Party Bcd Number Tag", 16),
    tagField(2230, "Timeand Timezone Tag", 16),
    tagField(1194, "Gsm Forwarding Pending Tag", 16),
    argLength(1195),
    tagField(1196, "Initial DP Arg Extension Tag", 16),
    argLength(1197),
    // Release Call, Request Report BCSM Event, Reset Timer
    tagField(1224, "Sequence Tag"),
    argLength(1225),
    tagField(1897, "BCSM Events Tag"),
    argLength(1898),
    tagField(1228, "Sequence Tag"),
    argLength(1229),
    tagField(2304, "Timer Id Tag").indented(),
    tagField(1374, "Timer Value Tag").indented(),
    // Disconnect Forward Connection With Argument, Initiate Call Attempt
    tagField(4140, "DisconnectForwardConnectionWithArgumentArg Tag"),
    argLength(4141),
    tagField(4144, "InitiateCallAttemptArg Tag"),
    argLength(4145),
    tagField(1541, "Leg ID Tag"),
    tagField(4175, "CallReferenceNumber Tag", 16),
    argLength(4176),
    digitsField(4177, "Call Reference Number Value").indented(),
    tagField(4333, "suppress_T_CSI Tag", 16),
    argLength(4334),
    // Disconnect Leg, Move Leg, Split Leg, Entity Released
    tagField(4153, "Disconnect Leg Arg Tag"),
    argLength(4154),
    tagField(4158, "Move Leg Arg Tag"),
    argLength(4159),
    tagField(4161, "SplitLegArg Tag"),
    argLength(4162),
    enumField(4164, "EntityReleased Type", names::kEntityReleasedType),
    argLength(4165),

    // ==== Call-control types (cap/call_control.cpp): fields in decoding order

    // ==== Party numbers and ISUP / Q.931 parameters (cap/party_numbers.cpp):
    // ==== fields in decoding order

    // ==== Mobile identities, location and time (cap/mobile.cpp): fields in
    // ==== decoding order

    // Return Result (Last), Return Error, Reject
    tagField(3669, "Return Result (Last)").key(27, KeyForm::Octet),
    blockLength(3670),
    tagField(3685, "Return Error").key(28, KeyForm::Octet),
    blockLength(3686),
    tagField(3694, "Reject"),
    blockLength(3695),
    enumField(3701, "  Problem Code", names::kProblemType),
    octetLength(3709),
    enumField(3710, "  Problem Code", names::kGeneralProblem),
    octetLength(3711),
    enumField(3712, "  Problem Code", names::kInvokeProblem),
    octetLength(3713),
    enumField(3714, "  Problem Code", names::kReturnResultProblem),
    octetLength(3715),
    enumField(3716, "  Problem Code", names::kReturnErrorProblem),

    // ---- Begin ----
    headerLength(3608),
    tagField(3651, "Originating Trans Id Tag"),
    headerLength(3652),
    digitsField(3653, "Originating Transaction Id").indented().key(26, KeyForm::Variable),
    // Structured dialogue portion
    tagField(3737, "Dialogue Portion Tag"),
    blockLength(3738),
    tagField(3743, "External Tag"),
    blockLength(3744),
    tagField(3749, "Object Identifier Tag"),
    octetLength(3750),
    hexField(3751, "  CCITT recommendation"),
    hexField(3752, "  q"),
    hexField(3753, "  773"),
    hexField(3754, "  Space Character"),
    hexField(3755, "  as(1)"),
    hexField(3756, "  DialoguePDU"),
    hexField(3757, "  version1(1)"),
    tagField(3758, "Single ASN.1 Type Tag"),
    headerLength(3759),
    enumField(3760, "  Dialogue PDU", names::kDialoguePdu),
    headerLength(3762),
    headerLength(3763),
    tagField(3766, "Result Tag"),
    blockLength(3767),
    tagField(3772, "Integer Tag"),
    octetLength(3773),
    enumField(3774, "  Result", names::kResult),
    tagField(3775, "Result Source Diagnostic Tag"),
    blockLength(3776),
    tagField(3858, "Service User Tag"),
    blockLength(3859),
    tagField(3864, "Integer Tag"),
    octetLength(3865),
    enumField(3866, "  Service User Value", names::kServiceUser),
    tagField(3867, "Service Provider Tag"),
    blockLength(3868),
    tagField(3873, "Integer Tag"),
    octetLength(3874),
    enumField(3875, "  Service Provider Value", names::kServiceProvider),
    headerLength(3781),
    tagField(3783, "Abort Source Tag"),
    octetLength(3784),
    enumField(3785, "  Abort Source Value", names::kAbortSource),

    // ---- End ----
    headerLength(3611),
    tagField(3654, "Destination Trans Id Tag"),
    headerLength(3655),
    digitsField(3656, "Destination Transaction Id").indented().key(29, KeyForm::Variable),

    // ---- Continue ----
    headerLength(3612),

    // ---- Abort ----
    headerLength(3613),
    tagField(3657, "P-Abort Cause Tag"),
    octetLength(3658),
    enumField(3659, "  P-Abort Cause", names::kPAbortCause).key(3, KeyForm::Octet),
};

inline constexpr size_t kFieldCount = sizeof(kFields) / sizeof(kFields[0]);

// Position of a field id in the catalogue; kFieldCount when it is unknown.
constexpr size_t fieldIndex(uint32_t id) {
    for (size_t i = 0; i < kFieldCount; ++i)
        if (kFields[i].id == id)
            return i;
    return kFieldCount;
}

namespace detail {
constexpr const char *skipBlanks(const char *s) {
    while (*s == ' ')
        ++s;
    return s;
}
constexpr bool sameText(const char *a, const char *b) {
    while (*a != '\0' && *a == *b) {
        ++a;
        ++b;
    }
    return *a == *b;
}
} // namespace detail

// A field's position in the catalogue, as units and member tables hold it.
using FieldIndex = uint16_t;
static_assert(kFieldCount < 0xFFFF, "field positions are 16-bit");
inline constexpr FieldIndex kNoField = 0xFFFF;

// The display id of every field, by catalogue position: the id of the first
// catalogue entry whose label equals the field's label with leading blanks
// ignored.
struct DisplayIds {
    uint32_t id[kFieldCount];
};
constexpr DisplayIds computeDisplayIds() {
    DisplayIds out{};
    for (size_t i = 0; i < kFieldCount; ++i) {
        const char *label = detail::skipBlanks(kFields[i].label);
        out.id[i] = kFields[i].id;
        for (size_t j = 0; j < i; ++j)
            if (detail::sameText(detail::skipBlanks(kFields[j].label), label)) {
                out.id[i] = kFields[j].id;
                break;
            }
    }
    return out;
}
inline constexpr DisplayIds kDisplayIds = computeDisplayIds();

constexpr uint32_t displayIdOf(uint32_t id) { return kDisplayIds.id[fieldIndex(id)]; }

namespace detail {
inline void fieldIdNotDeclared() {} // not constexpr: using it stops compilation
} // namespace detail

// The catalogue position of a declared field id, for tables built at
// compile time; an undeclared id does not compile.
consteval FieldIndex fx(uint32_t id) {
    const size_t i = fieldIndex(id);
    if (i >= kFieldCount)
        detail::fieldIdNotDeclared();
    return static_cast<FieldIndex>(i);
}

constexpr bool idsAreUnique() {
    for (size_t i = 0; i < kFieldCount; ++i)
        for (size_t j = i + 1; j < kFieldCount; ++j)
            if (kFields[i].id == kFields[j].id)
                return false;
    return true;
}
static_assert(idsAreUnique(), "a field id is declared twice");

// The declaration of a field known at compile time.
template <uint32_t Id>
struct Field {
    static_assert(fieldIndex(Id) < kFieldCount, "field id is not declared in kFields");
    static constexpr FieldIndex index = static_cast<FieldIndex>(fieldIndex(Id));
    static constexpr const FieldDef &def = kFields[index];
    static constexpr uint32_t displayId = kDisplayIds.id[index];
};

} // namespace camel
