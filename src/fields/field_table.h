// Every field the grammar reports, declared once, in catalogue order: the
// order in which a depth-first walk of the grammar first meets each field
// (message types 0x61, 0x62, 0x64, 0x65, 0x67; each unit's fields and child
// units in decoding order).  Display ids are derived from this order, so a
// new unit's fields go where the walk first meets them, not at the end.
#pragma once

#include <cstddef>
#include <cstdint>

#include "fields/field_def.h"
#include "fields/names_call_control.h"
#include "fields/names_cap.h"
#include "fields/names_results.h"
#include "fields/names_party.h"
#include "fields/names_mobile.h"
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

    // ---- CAMEL operation arguments, in the order the dispatcher's walk first
    // ---- meets them (tools/catalogue/order_fields.py keeps this order)
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
    tagField(1481, "Extensions Tag"),
    tagField(1549, "Party to Charge Tag"),
    tagField(4198, "AChChargingAddress Tag", 16),
    argLength(4199),
    argLength(1550),
    enumField(1551, "Choice", names::kSendingSideChoice),
    argLength(1553),
    enumField(1554, "Side Id Value", names::kLegType).indented(),
    hexField(4200, "AChChargingAddress Type", 5),
    tagField(4203, "AChChargingAddress Tag (legID)"),
    tagField(4205, "AChChargingAddress Tag (srfConnection)", 16),
    tagField(1401, "Call Result Tag"),
    argLength(1402),
    tagField(1404, "Time Duration Charging Result"),
    argLength(1405),
    tagField(1545, "Receiving Side ID Tag"),
    argLength(1546),
    enumField(1547, "Choice", names::kReceivingSideChoice),
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
    tagField(1079, "Sequence Tag"),
    argLength(1080),
    tagField(1429, "Correlation Id Tag"),
    argLength(1430),
    argLength(2009),
    tagField(2011, "Generic Number Tag"),
    argLength(2012),
    enumField(1657, "Number Qualifier Indicator", names::kNumberQualifier)
        .indented()
        .otherwise("Reserved"),
    enumField(3554, "Nature Of Address Ind", names::kGenericNatureOfAddress, 7)
        .indented()
        .display(names::kSpare127Shown),
    enumField(1661, "Odd/even Indicator", names::kOddEven, 1).indented().display(names::kOddEvenShown),
    enumField(3563, "Screening Indicator", names::kGenericScreening, 2).indented(),
    enumField(3566, "Numbering Plan Indicator", names::kGenericNumberingPlan, 3).indented(),
    enumField(3572, "Ni Indicator", names::kNiIndicator, 1).indented(),
    enumField(1662, "Pres. Restric. Indicator", names::kPresentation, 2).indented(),
    digitsField(1663, "Address Signal In Generic").indented(),
    tagField(1431, "IP Ssp Capabilities Tag"),
    argLength(1432),
    enumField(1433, "IP Routing Address Support", names::kSupported, 1).indented(),
    enumField(1434, "Voiceback", names::kSupported, 1).indented(),
    enumField(1435, "Voiceinformation Via Speech", names::kVoiceViaSpeech, 1).indented(),
    enumField(1436, "Voiceinformation Via Voice", names::kVoiceViaVoice, 1).indented(),
    enumField(1437, "Generation Of Voice Announ", names::kSupported, 1).indented(),
    enumField(1438, "End Of Standard Part", names::kEndOfStandardPart, 1).indented(),
    tagField(1084, "Sequence Tag"),
    argLength(1085),
    tagField(1440, "Gap Criteria Tag"),
    argLength(1441),
    enumField(1442, "Choice", names::kGapCriteria).display(names::kGapCriteriaShown),
    argLength(1521),
    argLength(1451),
    tagField(1609, "Service Key Tag"),
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
    tagField(1538, "SCF ID Tag"),
    argLength(1610),
    unsignedField(1611, "Service Key", 0).indented(),
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
    charsField(3542, "IA5 Characters"),
    charsField(3545, "IA5 Characters").indented(),
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
    hexField(1371, "Price Value", 0).indented().followedBy("h"),
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
    argLength(1954),
    enumField(1955, "Carrier Selection", names::kCarrierSelection)
        .indented()
        .display(names::kCarrierSelectionShown),
    hexField(1956, "NA Carrier Id", 0).indented().spanSelector(1),
    argLength(1126),
    hexField(1127, "Alerting Pattern(spare)", 16).indented(),
    enumField(1128, "Type Of Alerting", names::kTypeOfAlerting).indented().otherwise("Reserved"),
    argLength(1475),
    enumField(1476, "Location", names::kCauseLocation, 4)
        .indented()
        .display(names::kCauseLocationShown),
    enumField(1477, "Coding Standard", names::kCauseCodingStandard, 2)
        .indented()
        .display(names::kCauseCodingStandardShown),
    enumField(1480, "Cause Value", names::kCauseValue, 7)
        .indented()
        .display(names::kCauseValueShown)
        .key(8, KeyForm::Octet),
    enumField(1478, "Extension Indicator", names::kExtensionIndicator, 1).indented(),
    tagField(1092, "Sequence Tag"),
    argLength(1093),
    tagField(1497, "Requested Information List Tag"),
    argLength(1498),
    hexField(1439, "Bilateral Part", 0).indented(),
    argLength(1482),
    tagField(1484, "Extension Field Tag"),
    argLength(1485),
    tagField(1487, "Extension Type Tag"),
    argLength(1488),
    digitsField(1489, "Extension Type Info").indented(),
    tagField(1490, "Extension Criticality Tag"),
    argLength(1491),
    enumField(1492, "Extension Criticality Value", names::kExtensionCriticality).indented(),
    enumField(1493, "Extension Val Tag", names::kExtensionValueTag),
    argLength(1495),
    digitsField(1496, "Extension Val Info").indented(),
    tagField(1500, "Requested Information Tag"),
    argLength(1501),
    tagField(1502, "Request Info Type Tag"),
    argLength(1503),
    enumField(1504, "Request Info Type Data", names::kRequestedInfoType).indented(),
    tagField(1505, "Requested Information Value Tag"),
    argLength(1506),
    enumField(1507, "Choice", names::kRequestedInfoValueChoice)
        .display(names::kRequestedInfoValueChoiceShown),
    argLength(1509),
    unsignedField(1510, "Call Att Elaps Time Value Data").indented(),
    argLength(1511),
    hexField(1512, "Year", 16).indented(),
    hexField(1513, "Month"),
    hexField(1514, "Day"),
    hexField(1515, "Hour"),
    hexField(1516, "Minute"),
    hexField(1517, "Second"),
    argLength(1518),
    unsignedField(1519, "Call Connect Elapsed Time Value Data(100 milliseconds)", 0).indented(),
    tagField(1098, "Sequence Tag"),
    argLength(1099),
    tagField(1522, "Request Info. Type List Tag"),
    argLength(1523),
    tagField(1525, "Requested Information Type Tag"),
    argLength(1526),
    enumField(1527, "Requested Information Type ", names::kRequestedInfoType).indented(),
    enumField(1103, "Choice", names::kCancelChoice).display(names::kCancelChoiceShown),
    argLength(1530),
    unsignedField(1531, "Invoke Id").indented(),
    argLength(1528),
    argLength(4206),
    tagField(1529, "Invoke Id Tag"),
    tagField(4178, "CallSegmentID Tag"),
    tagField(1105, "Sequence Tag"),
    argLength(1106),
    tagField(1830, "Destination Routing Address Tag"),
    argLength(1831),
    tagField(1614, "Called Party Number Tag"),
    tagField(1125, "Alerting Pattern Tag"),
    tagField(1910, "DP Specific Criteria Tag"),
    argLength(1911),
    enumField(1912, "Choice", names::kDpSpecificCriteriaChoice)
        .display(names::kDpSpecificCriteriaChoiceShown),
    argLength(1915),
    unsignedField(1916, "Application Timer Value(second)", 0).indented(),
    argLength(4284),
    tagField(4292, "minimumNumberOfDigits Tag"),
    argLength(4293),
    unsignedField(4294, "minimumNumberOfDigits").indented(),
    tagField(4295, "maximumNumberOfDigits Tag"),
    argLength(4296),
    unsignedField(4297, "maximumNumberOfDigits").indented(),
    tagField(4301, "endOfReplyDigit Tag"),
    argLength(4302),
    digitsField(4303, "endOfReplyDigit").indented(),
    tagField(4304, "cancelDigit Tag"),
    argLength(4305),
    digitsField(4306, "cancelDigit").indented(),
    tagField(4307, "startDigit Tag"),
    argLength(4308),
    digitsField(4309, "startDigit").indented(),
    tagField(4298, "interDigitTimeout Tag"),
    argLength(4299),
    unsignedField(4300, "interDigitTimeout (in seconds)").indented(),
    argLength(4310),
    tagField(4331, "automaticRearm Tag", 16),
    argLength(4332, "LENGTH(null)"),
    argLength(1616),
    enumField(1819, "Nature Of Address Ind", names::kCalledNatureOfAddress, 7).indented(),
    enumField(1820, "Odd/even Indicator", names::kOddEven, 1)
        .indented()
        .display(names::kCalledOddEvenShown),
    unsignedField(1821, "Spare", 4),
    enumField(1822, "Numbering Plan Indicator", names::kNumberingPlan, 3)
        .indented()
        .display(names::kSpare7Shown),
    enumField(1823, "Internal Network Num Ind", names::kCalledInn, 1),
    digitsField(3589, "Called Party Num").indented().key(10, KeyForm::Variable),
    hexField(3590, "Filler", 4),
    digitsField(3592, "Called Party Num").indented().key(10, KeyForm::Variable),
    tagField(1640, "Original Called Party Id Tag"),
    tagField(1952, "Carrier Tag"),
    argLength(1641),
    enumField(1642, "Nature Of Address Ind", names::kNatureOfAddress, 7).indented(),
    enumField(1643, "Odd/even Indicator", names::kOddEven, 1).indented().display(names::kOddEvenShown),
    enumField(1644, "Numbering Plan Indicator", names::kNumberingPlan, 3)
        .indented()
        .display(names::kSpare7Shown),
    enumField(1645, "Pres. Restric. Indicator", names::kOriginalPresentation, 2).indented(),
    digitsField(1646, "Address Signal In Called").indented(),
    tagField(1632, "Calling Partys Category Tag"),
    tagField(1812, "Redirecting Party Id Tag"),
    tagField(1824, "Redirection Information Tag"),
    tagField(2008, "Generic Numbers Tag"),
    tagField(1957, "Service Interaction Ind Two Tag"),
    tagField(1939, "Charge Number Tag"),
    argLength(1941),
    enumField(1942, "Nature Of Address Ind", names::kChargeNatureOfAddress, 7).indented(),
    enumField(1943, "Odd/even Indicator", names::kOddEven, 1).indented().display(names::kOddEvenShown),
    enumField(1944, "Numbering Plan Indicator", names::kPrivateNumberingPlan, 3)
        .indented()
        .display(names::kSpare7Shown),
    digitsField(3600, "Address Signal").indented().key(12, KeyForm::Variable),
    hexField(3601, "Filler", 4),
    digitsField(3603, "Address Signal").indented().key(12, KeyForm::Variable),
    tagField(1946, "CUG Interlock Tag", 16),
    tagField(1950, "CUG Outgoing Access Tag", 16),
    enumField(1659, "Number Qualifier Indicator", names::kNumberQualifier)
        .indented()
        .otherwise("Reserved"),
    enumField(1664, "Nature Of Address Ind", names::kAdditionalNatureOfAddress, 7).indented(),
    enumField(1665, "Odd/even Indicator", names::kOddEven, 1).indented().display(names::kOddEvenShown),
    enumField(1666, "Screening Indicator", names::kGenericScreening, 2).indented(),
    enumField(1667, "Numbering Plan Indicator", names::kPrivateNumberingPlan, 3)
        .indented()
        .display(names::kSpare7Shown),
    enumField(1668, "Ni Indicator", names::kNiIndicator, 1).indented(),
    enumField(1669, "Pres. Restric. Indicator", names::kPresentation, 2).indented(),
    digitsField(1670, "Address Signal In Anon").indented(),
    argLength(1633),
    enumField(1634, "Calling Partys Category", names::kCallingPartysCategory).indented(),
    tagField(2013, "Suppression Of Announcement Tag", 16),
    tagField(2014, "OCSI applicable", 16),
    tagField(2015, "NA Oli Info Tag", 16),
    tagField(4326, " bor_InterrogationRequested Tag", 16),
    argLength(4327),
    argLength(1959),
    tagField(1969, "Forward service interaction ind"),
    argLength(1970),
    tagField(1975, "Conference Treatment Indicator Tag"),
    argLength(1976),
    enumField(1977, "Conference Treatment Indicator", names::kConferenceTreatment)
        .display(names::kConferenceTreatmentShown)
        .indented(),
    tagField(1978, "Call Diversion Treatment Ind Tag"),
    argLength(1979),
    enumField(1980, "Call Diversion Treatment Ind", names::kCallDiversionTreatment)
        .display(names::kCallDiversionTreatmentShown)
        .indented(),
    tagField(1981, "Calling Party Restriction Ind Tag"),
    argLength(1982),
    enumField(1983, "Calling Party Restriction Ind", names::kCallingPartyRestriction).indented(),
    tagField(1984, "Backward service interaction ind"),
    argLength(1985),
    tagField(1988, "Call Completion Treatment Ind Tag"),
    argLength(1989),
    enumField(1990, "Call Completion Treatment Ind", names::kCallCompletionTreatment)
        .display(names::kCallCompletionTreatmentShown)
        .indented(),
    tagField(1991, "Bothway through connection Ind"),
    argLength(1992),
    enumField(1993, "Bothway Through Connection Ind", names::kBothwayThroughConnection).indented(),
    tagField(1994, "Connected number treatment ind"),
    argLength(1995),
    enumField(1996, "Connected Number Treatment Ind", names::kConnectedNumberTreatment, 2)
        .indented(),
    tagField(1997, "Non CUG Call Tag"),
    argLength(1998, "LENGTH(null)"),
    tagField(1999, "Hold Treatment Indicator Tag", 16),
    argLength(2000),
    enumField(2001, "Hold Treatment Indicator", names::kHoldTreatment, 2)
        .display(names::kHoldTreatmentShown)
        .indented(),
    tagField(2002, "Cw Treatment Indicator Tag", 16),
    argLength(2003),
    enumField(2004, "Cw Treatment Indicator", names::kCwTreatment, 2).indented(),
    tagField(2005, "Ect Treatment Indicator Tag", 16),
    argLength(2006),
    enumField(2007, "Ect Treatment Indicator", names::kEctTreatment, 2).indented(),
    argLength(1947),
    hexField(1948, "CUG Interlock", 0).indented(),
    argLength(1951, "LENGTH(null)"),
    argLength(1535),
    tagField(1129, "Sequence Tag"),
    argLength(1130),
    enumField(1532, "Resource Address(choice)", names::kResourceAddress)
        .display(names::kResourceAddressShown),
    argLength(1534),
    tagField(4179, "CallSegmentID Tag", 16),
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
    tagField(1134, "Sequence Tag"),
    argLength(1135),
    tagField(1536, "Assisting Ssp IP Routing Address Tag"),
    argLength(1537),
    tagField(1427, "Correlation Id Tag"),
    argLength(1428),
    tagField(1144, "Sequence Tag"),
    argLength(1145),
    tagField(1555, "Event Type BCSM Tag"),
    argLength(1539),
    digitsField(1540, "SCF ID Value"),
    argLength(1556),
    enumField(1557, "Event Type BCSM Value", names::kEventTypeBcsm)
        .indented()
        .key(13, KeyForm::Octet),
    tagField(1558, "Event Specific Info BCSM Tag"),
    argLength(1559),
    enumField(1563, "Choice", names::kEventSpecificInfoChoice)
        .display(names::kEventSpecificInfoChoiceShown),
    enumField(1565, "Choice", names::kEventSpecificInfoChoice16, 16)
        .display(names::kEventSpecificInfoChoice16Shown),
    argLength(1560),
    tagField(1474, "Cause Tag"),
    digitsField(2131, "Reserved Ts Code").indented(),
    tagField(1579, "Release Cause Tag"),
    tagField(1602, "Misc Call Info Tag"),
    tagField(1600, "Call forwarded", 16),
    argLength(1601, "LENGTH(null)"),
    tagField(1580, "Route Not Permitted Tag", 16),
    argLength(2606, "LENGTH(null)"),
    tagField(1581, "LocationInformation Tag", 16),
    argLength(1582),
    digitsField(1583, "LocationInformation Info").indented(),
    tagField(1584, "routeNotPermitted Tag", 16),
    argLength(1585, "LENGTH(null)"),
    argLength(1603),
    tagField(1606, "Message Type Tag"),
    argLength(1607),
    enumField(1608, "Message Type", names::kMiscMessageType).indented(),
    tagField(1151, "Furnish Charging Information Tag"),
    argLength(1152),
    tagField(1153, "Camel Fci Bill Cha Char Tag"),
    argLength(1154),
    tagField(2186, "Free Format Data Tag"),
    argLength(2187),
    digitsField(2188, "Free Format Data").indented(),
    tagField(2189, "Append Free FORMAT Data").indented(),
    argLength(2190),
    tagField(1159, "Sequence Tag"),
    argLength(1160),
    tagField(1612, "Calling Party Number Tag"),
    tagField(1635, "Cg Encountered Tag"),
    argLength(1613),
    enumField(1617, "Nature Of Address Ind", names::kNatureOfAddress, 7).indented(),
    enumField(1618, "Odd/even Indicator", names::kOddEven, 1).indented().display(names::kOddEvenShown),
    enumField(1619, "Screening Indicator", names::kCallingScreening, 2).indented(),
    enumField(1620, "Pres. Restric. Indicator", names::kPresentation, 2).indented(),
    enumField(1621, "Numbering Plan Ind", names::kCallingNumberingPlan, 3)
        .indented()
        .display(names::kSpare7Shown),
    enumField(1622, "Ni Ind", names::kNiIndicator, 1).indented(),
    digitsField(1628, "Calling Party Num").indented().key(15, KeyForm::Variable),
    digitsField(1631, "Calling Party Num").indented().key(15, KeyForm::Variable),
    hexField(1629, "Filler", 4),
    tagField(1638, "Location Number Tag"),
    tagField(1671, "High Layer Compatibility Tag"),
    tagField(1686, "Add. Calling Party No. Tag"),
    argLength(1687),
    tagField(1698, "Bearer Capability Tag"),
    tagField(1958, "Service Interaction Ind Two Tag", 16),
    tagField(1191, "CUG Index Tag", 16),
    argLength(1813),
    enumField(1814, "Nature Of Address Ind", names::kNatureOfAddress, 7).indented(),
    enumField(1815, "Odd/even Indicator", names::kOddEven, 1).indented().display(names::kOddEvenShown),
    enumField(1816, "Numbering Plan Indicator", names::kPrivateNumberingPlan, 3)
        .indented()
        .display(names::kSpare7Shown),
    enumField(1817, "Pres. Restric. Indicator", names::kPresentation, 2).indented(),
    digitsField(1818, "Address Signal In Redir").indented(),
    argLength(1825),
    enumField(1826, "Redirecting Indicator", names::kRedirectingIndicator, 3).indented(),
    enumField(1827, "Original Redirection Reasons", names::kOriginalRedirectionReason, 4).indented(),
    unsignedField(1828, "Redirection Counter", 3).indented(),
    enumField(1829, "Redirecting Reason", names::kRedirectingReason, 4).indented(),
    argLength(1639),
    enumField(3557, "Nature Of Address Ind", names::kLocationNatureOfAddress, 7)
        .indented()
        .display(names::kSpare127Shown),
    enumField(3560, "Screening Indicator", names::kLocationScreening, 2).indented(),
    enumField(3569, "Numbering Plan Indicator", names::kLocationNumberingPlan, 3).indented(),
    enumField(3575, "Internal Network Num Ind", names::kLocationInn, 1),
    tagField(2018, "IMSI Tag", 16),
    tagField(2110, "Subscriber State Tag", 16),
    argLength(2111),
    hexField(1479, "Diagnostics", 0).indented(),
    argLength(1672),
    enumField(1673, "Coding Standard", names::kHlcCodingStandard, 2).indented(),
    enumField(1675, "Interpretation", names::kHlcInterpretation, 3).indented(),
    enumField(1676, "Presentation Method", names::kHlcPresentation, 2)
        .indented()
        .display(names::kHlcPresentationShown),
    enumField(1677, "High Layer Charac Identification", names::kHighLayerCharacteristics, 7)
        .indented()
        .otherwise("Reserved"),
    enumField(1678, "Extension Indicator", names::kExtensionIndicator, 1).indented(),
    enumField(1680, "Interpretation", names::kHlcInterpretation, 3).indented(),
    enumField(1681, "Presentation Method", names::kHlcPresentation, 2)
        .indented()
        .display(names::kHlcPresentationShown),
    enumField(1682, "Etsi High Layer Char Identi", names::kEtsiHighLayer, 7)
        .indented()
        .otherwise("Reserved"),
    enumField(1683, "Extension Indicator", names::kExtensionIndicator, 1).indented(),
    enumField(1685, "Extended High Layer", names::kExtendedHighLayer, 7)
        .indented()
        .otherwise("Reserved"),
    argLength(1699),
    enumField(1700, "Choice", names::kBearerChoice).display(names::kBearerChoiceShown),
    argLength(1702),
    enumField(1704, "Information Transfer Capability", names::kTransferCapability, 5)
        .indented()
        .otherwise("Reserved"),
    enumField(1705, "Coding Standard", names::kBearerCodingStandard, 2)
        .indented()
        .display(names::kBearerCodingStandardShown),
    enumField(1706, "  Extension Bit", names::kBearerExtension, 1),
    enumField(1707, "Information Transfer Rate", names::kTransferRate, 5)
        .indented()
        .otherwise("Reserved"),
    enumField(1708, "Transfer Mode", names::kTransferMode, 2).indented(),
    unsignedField(1712, "  Rate multiplier", 7),
    enumField(1714, "  Extension Bit", names::kBearerExtension, 1),
    enumField(1715, "  Layer Id", names::kLayerId, 2).otherwise("Invalid"),
    hexField(1719, "  Invalid Data", 5),
    enumField(1725, "  User information layer 1 protocol", names::kLayer1Protocol, 5)
        .otherwise("Reserved"),
    enumField(1730, "  Synchronous/Asynchronous", names::kSynchronous, 1),
    enumField(1729, "  In-band negotiation", names::kInBandNegotiation, 1),
    enumField(1728, "  User rate", names::kUserRate, 5).otherwise("Reserved"),
    enumField(1734, "  Intermediate rate", names::kIntermediateRate, 2),
    enumField(1735, "  Network independent clock on transmission (Tx)", names::kRequired, 1),
    enumField(1736, "  Network independent clock on reception (Rx)", names::kAccepted, 1),
    enumField(1737, "  Flow control on transmission (Tx)", names::kRequired, 1),
    enumField(1738, "  Flow control on reception (Rx)", names::kAccepted, 1),
    unsignedField(1739, "  Spare", 1),
    enumField(1742, "  Rate adaption header", names::kRateAdaptionHeader, 1),
    enumField(1743, "  Multiple frame establishment support in data link", names::kFrameSupport, 1),
    enumField(1744, "  Mode of operation", names::kModeOfOperation, 1),
    enumField(1745, "  Logical link identifier negotiation", names::kLliNegotiation, 1),
    enumField(1746, "  Assignor/assignee", names::kAssignor, 1),
    enumField(1747, "  In-band/out-band negotiation", names::kNegotiationBand, 1),
    unsignedField(1748, "  Spare", 1),
    enumField(1750, "  Parity information", names::kParity, 3).otherwise("Reserved"),
    enumField(1751, "  Number of data bits excluding parity Bit", names::kDataBits, 2),
    enumField(1752, "  Number of stop bits", names::kStopBits, 2),
    enumField(1755, "  Modem type", names::kModemType, 6).otherwise("Reserved"),
    enumField(1756, "  Mode duplex", names::kDuplex, 1),
    enumField(1758, "  User information layer 2 protocol", names::kLayer2Protocol, 5)
        .otherwise("Reserved"),
    enumField(1760, " User information layer 3 protocol", names::kLayer3Protocol, 5)
        .otherwise("Reserved"),
    unsignedField(1764, "  Spare", 3),
    enumField(1763, "  Additional layer 3 protocol info.", names::kAdditionalLayer3, 8),
    unsignedField(1766, "  Spare", 3),
    enumField(1765, "  Extension Bit", names::kBearerExtension, 1),
    hexField(1723, " Raw Data", 0),
    argLength(1192),
    unsignedField(1193, "CUG Index", 0).indented(),
    argLength(2020),
    digitsField(2025, "IMSI Digits").indented().key(17, KeyForm::Variable),
    hexField(2026, "filler", 4),
    tagField(2031, "Location Information Tag", 16),
    digitsField(2029, "IMSI Digits").indented().key(17, KeyForm::Variable),
    tagField(2116, "Assumed Idle").indented(),
    argLength(2117),
    tagField(2118, "Camel Busy").indented(),
    argLength(2119),
    tagField(2120, "Net Det Not Reachable").indented(),
    argLength(2121),
    enumField(2122, "Not Reachable Reason", names::mobile::kNotReachableReason).indented(),
    tagField(2123, "Not Provided From VLR").indented(),
    argLength(2124),
    argLength(2032),
    tagField(2044, "Age Of Location Information").indented(),
    argLength(2045),
    unsignedField(2046, "Age Of Location Information", 0).indented(),
    tagField(2047, "Geographical Information Tag"),
    argLength(2048),
    enumField(2049, "Type Of Shape", names::mobile::kTypeOfShape, 4)
        .display(names::mobile::kTypeOfShapeShown)
        .indented(),
    hexField(2050, "Latitude", 24).indented(),
    hexField(2051, "Degrees Of Longitude", 24),
    unsignedField(2052, "Uncertainty Code", 7),
    tagField(2059, "VLR Number"),
    argLength(2060),
    tagField(2125, "Ext Basic Service Code Tag", 16),
    argLength(2126),
    tagField(1615, "Called Party Number Tag", 16),
    tagField(1575, "Or Call Tag", 16),
    argLength(1576, "LENGTH(null)"),
    tagField(1577, "Forwarded call", 16),
    argLength(1578, "LENGTH(null)"),
    tagField(4280, "ChargeIndicator Tag", 16),
    argLength(4281),
    enumField(4282, "Charge Indicator", names::kChargeIndicator, 2).indented(),
    hexField(4283, "Spare", 6).indented(),
    enumField(2127, "Choice", names::kExtBasicServiceChoice)
        .display(names::kExtBasicServiceChoiceShown),
    argLength(2128),
    enumField(2053, "Bs Code", names::kBearerService).indented(),
    digitsField(2129, "Reserved Bs Code").indented(),
    argLength(2130),
    enumField(2057, "Ts Code", names::kTeleService).display(names::kTeleServiceShown).indented(),
    tagField(2133, "Call Reference Number Tag", 16),
    argLength(2134),
    digitsField(2135, "Call Reference Number Value").indented(),
    tagField(2159, "SMS MSC Address Tag", 16),
    tagField(2090, "Extension Container Tag"),
    argLength(2091),
    tagField(2094, "Private Extension List").indented(),
    argLength(2095),
    tagField(2097, "Private Extension").indented(),
    argLength(2098),
    tagField(2100, "Ext Id Tag"),
    argLength(2101),
    digitsField(2102, "Extension Id").indented(),
    digitsField(2099, "Ext Type").indented(),
    tagField(2103, "PCS-Extensions").indented(),
    argLength(2104),
    tagField(2215, "Selected LSA-id").indented(),
    argLength(2216),
    hexField(2217, "Selected LSA-Id Value", 24).indented(),
    tagField(2153, "SMS MSC Number Tag"),
    argLength(2160),
    enumField(2054, "Numbering Plan Ind", names::mobile::kAddressNumberingPlan, 4).indented(),
    enumField(2055, "Nature Of Address", names::mobile::kAddressNature, 3).indented(),
    enumField(2056, "Extension Indicator", names::mobile::kAddressExtension, 1).indented(),
    digitsField(2058, "ISDN Address Digits").indented(),
    tagField(2061, "Location Number").indented(),
    argLength(2062),
    enumField(2063, "Odd/even Indicator", names::mobile::kOddEven, 1)
        .display(names::mobile::kOddEvenShown)
        .indented(),
    enumField(2064, "Nature Of Address Indicator", names::mobile::kLocationNature, 7).indented(),
    enumField(2065, "Internal Network Number Ind", names::mobile::kInternalNetworkNumber, 1)
        .display(names::mobile::kInternalNetworkNumberShown)
        .indented(),
    enumField(2066, "Numbering Plan Indicator", names::mobile::kLocationNumberingPlan, 3)
        .indented(),
    enumField(2067, "Presentation Indicator", names::mobile::kPresentation, 2).indented(),
    enumField(2068, "Screening Indicator", names::mobile::kScreening, 2).indented(),
    digitsField(2069, "Address Signals").indented(),
    tagField(2070, "Cell Id Or Sai Or LAI Tag"),
    argLength(2071),
    tagField(2074, "laiFixedLength Tag"),
    argLength(2075),
    tagField(2077, "CellGlobalIdOrServiceAreaIdFixedLength Tag"),
    argLength(2078),
    digitsField(2079, "  MCC"),
    hexField(2080, "NAS Filler Don't Show", 4),
    hexField(2085, "  Filler", 4),
    // The three-digit MNC comes first: every "MNC" is shown under 2083.
    digitsField(2083, "MNC").indented().spanSelector(2),
    digitsField(2086, "MNC").indented(),
    unsignedField(2087, "Location Area Code", 16).indented(),
    hexField(2088, "Cell Identity", 16).indented(),
    tagField(2137, "Called Party Bcd Number Tag", 16),
    tagField(2107, "Geodetic Information").indented(),
    argLength(2108),
    digitsField(2109, "Geodetic Information").indented(),
    tagField(2105, "Current Location Retrieved").indented(),
    argLength(2106, "LENGTH(null)"),
    argLength(2138),
    enumField(2139, "Number Plan Identification", names::mobile::kBcdNumberingPlan, 4)
        .otherwise("Reserved")
        .indented(),
    enumField(2140, "Type Of Number", names::mobile::kBcdTypeOfNumber, 3).indented(),
    digitsField(2141, "Number Digits").indented(),
    tagField(2230, "Timeand Timezone Tag", 16),
    argLength(2232),
    hexField(2233, "Year", 16).indented(),
    hexField(2234, "Month").indented(),
    hexField(2235, "Day").indented(),
    hexField(2236, "Hour").indented(),
    hexField(2237, "Minute").indented(),
    hexField(2238, "Second").indented(),
    enumField(2239, "Time Zone Algebraic Sign", names::mobile::kTimeZoneSign, 1).indented(),
    unsignedField(2240, "Time Zone ", 7).indented(),
    tagField(1194, "Gsm Forwarding Pending Tag", 16),
    argLength(1195),
    tagField(1196, "Initial DP Arg Extension Tag", 16),
    argLength(1197),
    enumField(2191, "Append Free Format Data", names::kAppendFreeFormatData, 2).indented(),
    tagField(1209, "Sequence Tag"),
    argLength(1210),
    tagField(1302, "Information To Send Tag"),
    tagField(1833, "Disconnect From IP Forbidden Tag"),
    tagField(2149, "GSMC Address Tag"),
    tagField(4216, "MS_Classmark2 Tag").indented(),
    argLength(4217),
    digitsField(4218, "MS_Classmark2 Info").indented(),
    tagField(4219, "IMEI Tag").indented(),
    argLength(4220),
    digitsField(4221, "IMEI Info").indented(),
    tagField(4190, "SupportedCamelPhases Tag").indented(),
    argLength(4191),
    digitsField(4192, "SupportedCamelPhases Info").indented(),
    tagField(4193, "OfferedCamel4Functionalities Tag").indented(),
    argLength(4194),
    digitsField(4195, "OfferedCamel4Functionalities Info").indented(),
    tagField(4222, "Ext_BasicServiceCode Tag").indented(),
    argLength(4223),
    digitsField(4224, "Ext_BasicServiceCode Info").indented(),
    tagField(4229, "HighLayerCompatibility Tag").indented(),
    argLength(4230),
    digitsField(4231, "HighLayerCompatibility Info").indented(),
    tagField(4226, "LowLayerCompatibility Tag").indented(),
    argLength(4227),
    digitsField(4228, "LowLayerCompatibility Info").indented(),
    argLength(1834),
    names::mobile::boolean(1835, "Disconnect Forbidden Value"),
    tagField(1837, "Request Announce Complete Tag"),
    tagField(4328, "requestAnnouncementStartedNotification Tag", 16).indented(),
    argLength(1838),
    names::mobile::boolean(1839, "Request Announce Value"),
    tagField(1217, "Sequence Tag"),
    argLength(1218),
    tagField(1841, "Collect Info Tag"),
    argLength(1842),
    enumField(1843, "Choice", names::mobile::kCollectInfoChoice).indented(),
    argLength(1848),
    tagField(1861, "Minimum Number Of Digits Tag").indented(),
    argLength(1862),
    unsignedField(1863, "Number Of Digits").indented(),
    tagField(1864, "Maximum Number Of Digits Tag"),
    argLength(1865),
    unsignedField(1866, "Number Of Digits").indented(),
    tagField(1867, "End Of Reply Digit Tag"),
    argLength(1868),
    hexField(1869, "End Of Reply Digit Value", 0).indented(),
    tagField(1870, "Cancel Digit Tag"),
    argLength(1871),
    hexField(1872, "Cancel Digit Value", 0).indented(),
    tagField(1873, "Start Digit Tag"),
    argLength(1874),
    hexField(1875, "Start Digit Value", 0).indented(),
    tagField(1876, "First Digit Time Out Tag"),
    argLength(1877),
    unsignedField(1878, "First Digit Time Out Value").indented(),
    tagField(1879, "Inter Digit Time Out Tag"),
    argLength(1880),
    unsignedField(1881, "Inter Digit Time Out Value").indented(),
    tagField(1224, "Sequence Tag"),
    argLength(1225),
    tagField(1897, "BCSM Events Tag"),
    argLength(1898),
    argLength(1636),
    enumField(1637, "Type of CG (Call Gapping) encountered", names::kCgEncountered).indented(),
    tagField(1900, "BCSM Event Tag"),
    argLength(1901),
    tagField(1907, "Monitor Mode Tag"),
    argLength(1908),
    enumField(1909, "Monitor Mode Data", names::kMonitorMode).indented(),
    tagField(1541, "Leg ID Tag"),
    argLength(2016),
    hexField(2017, "NA Oli Info Value").indented(),
    tagField(4182, "suppress_D_CSI Tag"),
    argLength(4183),
    tagField(4184, "suppress_N_CSI Tag"),
    argLength(4185),
    tagField(4211, "suppressOutgoingCallBarring Tag"),
    argLength(4212),
    argLength(1542),
    enumField(1543, "Choice", names::kLegIdChoice).display(names::kLegIdChoiceShown).indented(),
    tagField(1228, "Sequence Tag"),
    argLength(1229),
    tagField(2304, "Timer Id Tag").indented(),
    tagField(1882, "Error Treatment Tag"),
    argLength(1883),
    enumField(1884, "Error Treatment Value", names::mobile::kErrorTreatment).indented(),
    tagField(1885, "Interruptable Ann Ind Tag").indented(),
    argLength(1886),
    names::mobile::boolean(1887, "Interruptable Ann Ind Value"),
    tagField(1889, "Voice Information Tag").indented(),
    argLength(1890),
    names::mobile::boolean(1891, "Voice Information Value"),
    tagField(1893, "Voice Back Tag").indented(),
    argLength(1894),
    names::mobile::boolean(1895, "Voice Back Value"),
    argLength(2305),
    enumField(2306, "Timer Id Value", names::mobile::kTimerId).indented(),
    tagField(1374, "Timer Value Tag").indented(),
    argLength(1375),
    unsignedField(1376, "Timer Value Info(second)", 0).indented(),
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
    enumField(1238, "SpecializedResourceReportArg Choice", names::kSpecializedResourceReport, 16),
    argLength(1240),
    // ---- SMS operations (62, 65, 64, 61, 60, 66, 63, 67) ----

    // ---- GPRS operations (70 to 83) ----

    // ---- Call-control operations of CAP v4 (86, 32, 88, 90, 93, 95, 96, 97) ----
    tagField(4140, "DisconnectForwardConnectionWithArgumentArg Tag"),
    argLength(4141),
    argLength(4180),
    digitsField(4181, "Call Segment ID").indented(),
    tagField(4144, "InitiateCallAttemptArg Tag"),
    argLength(4145),
    tagField(4175, "CallReferenceNumber Tag", 16),
    argLength(4176),
    digitsField(4177, "Call Reference Number Value").indented(),
    tagField(4333, "suppress_T_CSI Tag", 16),
    argLength(4334),
    tagField(4153, "Disconnect Leg Arg Tag"),
    argLength(4154),
    tagField(4158, "Move Leg Arg Tag"),
    argLength(4159),
    tagField(4161, "SplitLegArg Tag"),
    argLength(4162),
    enumField(4164, "EntityReleased Type", names::kEntityReleasedType),
    argLength(4165),
    tagField(4167, "PlayToneArg Tag"),
    argLength(4168),
    tagField(4186, "LegOrCallSegment Tag"),
    argLength(4187),
    enumField(4188, "LegOrCallSegment Type", names::kLegOrCallSegment),

    // Return Result (Last), Return Error, Reject
    tagField(3669, "Return Result (Last)").key(27, KeyForm::Octet),
    blockLength(3670),
    // The result of a Return Result (Last)
    tagField(3677, "Sequence Tag"),
    blockLength(3678),
    octetLength(3684),
    enumField(1068, "Operation ID(RetRes)", names::kResultOperation).key(22, KeyForm::Octet),
    enumField(1918, "Choice", names::kReceivedInformation).indented(),
    headerLength(1917),
    enumField(1647, "Type Of Digits", names::kTypeOfDigits, 5).indented().otherwise("Spare"),
    tagField(4169, "initiateCallAttemptRes Tag").indented(),
    argLength(4170),
    tagField(3685, "Return Error").key(28, KeyForm::Octet),
    blockLength(3686),
    // The error code and parameter of a Return Error
    enumField(3692, "Error Code Tag", names::kErrorCodeTag),
    octetLength(3693),
    enumField(1070, "Error Code", names::kErrorCode).key(23, KeyForm::Octet),
    tagField(1920, "Sequence Tag").indented(),
    argLength(1921),
    tagField(1922, "Problem Tag").indented(),
    argLength(1923),
    enumField(1924, "Problem", names::kCancelProblem).indented(),
    tagField(1925, "Operation Tag").indented(),
    argLength(1926),
    unsignedField(1927, "Invoke Id").indented(),
    tagField(1928, "Requested Parameter Tag"),
    argLength(1929),
    enumField(1930, "Value", names::kRequestedInfoError).indented(),
    tagField(1931, "Parameter Tag").indented(),
    argLength(1933),
    enumField(1934, "Unavailable Network Resource", names::kUnavailableNetworkResource).indented(),
    tagField(1935, "Parameter Tag").indented(),
    argLength(1936),
    enumField(1937, "Parameter Value", names::kTaskRefused).indented(),
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

// A field's position in the catalogue, as units and member tables hold it.
using FieldIndex = uint16_t;
static_assert(kFieldCount < 0xFFFF, "field positions are 16-bit");
inline constexpr FieldIndex kNoField = 0xFFFF;

// The derivations below run at compile time over the whole table.  Each is
// linear in the number of fields (a lookup array by id, a hash over the
// labels), so that they stay inside the compilers' default constexpr limits
// however many fields are declared.

namespace detail {
constexpr uint32_t idLimit() {
    uint32_t limit = 0;
    for (const FieldDef &f : kFields)
        limit = f.id >= limit ? f.id + 1 : limit;
    return limit;
}
} // namespace detail

// One past the largest declared field id.
inline constexpr uint32_t kIdLimit = detail::idLimit();

// Catalogue position by field id (kNoField for an id not declared), and the
// first id declared twice (0 when every id is declared once).
struct IdIndex {
    FieldIndex at[kIdLimit];
    uint32_t duplicate;
};
constexpr IdIndex computeIdIndex() {
    IdIndex out{};
    for (uint32_t id = 0; id < kIdLimit; ++id)
        out.at[id] = kNoField;
    for (size_t i = 0; i < kFieldCount; ++i) {
        FieldIndex &slot = out.at[kFields[i].id];
        if (slot != kNoField && out.duplicate == 0)
            out.duplicate = kFields[i].id;
        slot = static_cast<FieldIndex>(i);
    }
    return out;
}
inline constexpr IdIndex kIdIndex = computeIdIndex();
static_assert(kIdIndex.duplicate == 0, "a field id is declared twice (kIdIndex.duplicate names it)");

// Position of a field id in the catalogue; kFieldCount when it is unknown.
constexpr size_t fieldIndex(uint32_t id) {
    if (id >= kIdLimit || kIdIndex.at[id] == kNoField)
        return kFieldCount;
    return kIdIndex.at[id];
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
// FNV-1a of a text.
constexpr uint32_t textHash(const char *s) {
    uint32_t h = 2166136261u;
    for (; *s != '\0'; ++s)
        h = (h ^ static_cast<uint8_t>(*s)) * 16777619u;
    return h;
}
constexpr size_t labelSlots() {
    size_t n = 64;
    while (n < 2 * kFieldCount)
        n *= 2;
    return n;
}
} // namespace detail

// The display id of every field, by catalogue position: the id of the first
// catalogue entry whose label equals the field's label with leading blanks
// ignored.  One pass in catalogue order over an open-addressing table of the
// labels met so far: the first field with a label claims its slot.
struct DisplayIds {
    uint32_t id[kFieldCount];
};
constexpr DisplayIds computeDisplayIds() {
    constexpr size_t kSlots = detail::labelSlots();
    FieldIndex first[kSlots]{};
    for (size_t s = 0; s < kSlots; ++s)
        first[s] = kNoField;
    DisplayIds out{};
    for (size_t i = 0; i < kFieldCount; ++i) {
        const char *label = detail::skipBlanks(kFields[i].label);
        size_t s = detail::textHash(label) & (kSlots - 1);
        while (first[s] != kNoField && !detail::sameText(detail::skipBlanks(kFields[first[s]].label), label))
            s = (s + 1) & (kSlots - 1);
        if (first[s] == kNoField)
            first[s] = static_cast<FieldIndex>(i);
        out.id[i] = kFields[first[s]].id;
    }
    return out;
}
inline constexpr DisplayIds kDisplayIds = computeDisplayIds();

// The length of every label (the emission copies it once per field).
struct LabelLengths {
    uint16_t n[kFieldCount];
};
constexpr LabelLengths computeLabelLengths() {
    LabelLengths out{};
    for (size_t i = 0; i < kFieldCount; ++i)
        while (kFields[i].label[out.n[i]] != '\0')
            ++out.n[i];
    return out;
}
inline constexpr LabelLengths kLabelLengths = computeLabelLengths();

constexpr uint32_t displayIdOf(uint32_t id) { return kDisplayIds.id[fieldIndex(id)]; }

namespace detail {
inline void fieldIdNotDeclared() {} // not constexpr: using it stops compilation
} // namespace detail

// The catalogue position of a declared field id, for tables built at
// compile time; an undeclared id does not compile.  (Inside a template,
// where some compilers reject a consteval call on a template parameter,
// use Field<Id>::index.)
consteval FieldIndex fx(uint32_t id) {
    const size_t i = fieldIndex(id);
    if (i >= kFieldCount)
        detail::fieldIdNotDeclared();
    return static_cast<FieldIndex>(i);
}

// The declaration of a field known at compile time.
template <uint32_t Id>
struct Field {
    static_assert(fieldIndex(Id) < kFieldCount, "field id is not declared in kFields");
    static constexpr FieldIndex index = static_cast<FieldIndex>(fieldIndex(Id));
    static constexpr const FieldDef &def = kFields[index];
    static constexpr uint32_t displayId = kDisplayIds.id[index];
};

} // namespace camel
