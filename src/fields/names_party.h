// Value names of the party numbers and of the ISUP / Q.931 parameters:
// called, calling, redirection, charge, location and generic numbers,
// category, carrier, alerting pattern, cause, high layer compatibility and
// bearer capability.
#pragma once

#include "fields/field_def.h"

namespace camel::names {

// ---- Numbers -----------------------------------------------------------------

inline constexpr ValueName kCalledNatureOfAddress[] = {
    {0, "Spare (0)"},
    {1, "Subscriber Number"},
    {2, "Unknown"},
    {3, "National (significant) Num"},
    {4, "International Number"},
    {5, "Network Spec Num(national Use)"},
    {127, "Spare (127)"},
};
inline constexpr ValueName kNatureOfAddress[] = {
    {0, "Spare (0)"},
    {1, "Subscriber Number"},
    {2, "Unknown"},
    {3, "National (significant) Num"},
    {4, "International Number"},
    {127, "Spare (127)"},
};
inline constexpr ValueName kChargeNatureOfAddress[] = {
    {0, "Spare (0)"},
    {1, "Resv. For Subs. Number"},
    {2, "Resv. Forunknown"},
    {3, "National (significant) Num"},
    {4, "International Number"},
};
inline constexpr ValueName kGenericNatureOfAddress[] = {
    {0, "Spare (0)"},
    {1, "Subscriber Number"},
    {2, "Unknown"},
    {3, "National (significant) Num"},
    {4, "International Number"},
    {5, "Pisn Specific Num (national Use)"},
    {127, "Spare(127)"},
};
inline constexpr ValueName kAdditionalNatureOfAddress[] = {
    {0, "Spare (0)"},
    {1, "Subscriber Number"},
    {2, "Unknown"},
    {3, "National (significant) Num"},
    {4, "International Number"},
    {5, "Pisn Specific Num (national Use)"},
    {127, "Spare (127)"},
};
inline constexpr ValueName kLocationNatureOfAddress[] = {
    {0, "Spare (0)"},
    {1, "Resv. For Subs. Number"},
    {2, "Resv. For Unknown"},
    {3, "National (significant) Num"},
    {4, "International Number"},
    {127, "Spare(127)"},
};
inline constexpr ValueName kSpare127Shown[] = {{127, "Spare (127)"}};

inline constexpr ValueName kOddEven[] = {{0, "Even"}, {1, "Odd"}};
inline constexpr ValueName kCalledOddEvenShown[] = {
    {0, "Even Number Of Address signals"},
    {1, "Odd Number Of Address signals"},
};
inline constexpr ValueName kOddEvenShown[] = {
    {0, "Even Num Of Addresssignals"},
    {1, "Odd Num Of Addresssignals"},
};

// Numbering plans with codes 5 and 6 reserved for national use.
inline constexpr ValueName kNumberingPlan[] = {
    {0, "Spare (0)"},
    {1, "ISDN/telephony"},
    {2, "Spare (2)"},
    {3, "Data"},
    {4, "Telex"},
    {5, "Res For Nationaluse(05)"},
    {6, "Res For Nationaluse(06)"},
    {7, "Spare(7)"},
};
inline constexpr ValueName kCallingNumberingPlan[] = {
    {0, "Spare (0)"},
    {1, "ISDN/telephony"},
    {2, "Spare (2)"},
    {3, "Data"},
    {4, "Telex"},
    {5, "Res For Nationaluse (5)"},
    {6, "Res For Nationaluse (6)"},
    {7, "Spare(7)"},
};
// Numbering plans with code 5 the private numbering plan.
inline constexpr ValueName kPrivateNumberingPlan[] = {
    {0, "Spare (0)"},
    {1, "ISDN/telephony"},
    {2, "Spare (2)"},
    {3, "Data"},
    {4, "Telex"},
    {5, "Private Numbering Plan"},
    {6, "Resv For National Use"},
    {7, "Spare(7)"},
};
inline constexpr ValueName kGenericNumberingPlan[] = {
    {0, "Unknown (national Use)"},
    {1, "ISDN/telephony"},
    {2, "Spare (2)"},
    {3, "Data"},
    {4, "Telex"},
    {5, "Private Numbering Plan"},
    {6, "Resv For National Use"},
    {7, "Spare (7)"},
};
inline constexpr ValueName kLocationNumberingPlan[] = {
    {0, "Spare(0)"},
    {1, "ISDN/telephony"},
    {2, "Spare (2)"},
    {3, "Data"},
    {4, "Telex"},
    {5, "Private Numbering Plan"},
    {6, "Resv For National Use"},
    {7, "Spare (7)"},
};
inline constexpr ValueName kSpare7Shown[] = {{7, "Spare (7)"}};

inline constexpr ValueName kCalledInn[] = {
    {0, "Routing to Innallowed"},
    {1, "Routing to Inn Notallowed"},
};
inline constexpr ValueName kLocationInn[] = {
    {0, "Routing to Inn Allowed"},
    {1, "Routing to Inn Not Allowed"},
};
inline constexpr ValueName kNiIndicator[] = {{0, "Complete"}, {1, "Incomplete"}};

inline constexpr ValueName kCallingScreening[] = {
    {0, "reserved"},
    {1, "user provided, verified and passed"},
    {2, "reserved"},
    {3, "network provided"},
};
inline constexpr ValueName kGenericScreening[] = {
    {0, "User Provided Not Verified"},
    {1, "User Provided, Verify & Pass"},
    {2, "User Provided, Verify & Fail"},
    {3, "Network Provided"},
};
inline constexpr ValueName kLocationScreening[] = {
    {0, "Reserved"},
    {1, "User Provided, Verify & Pass"},
    {2, "Reserved"},
    {3, "Network Provided"},
};

inline constexpr ValueName kPresentation[] = {
    {0, "Presentationallowed"},
    {1, "Presentation Restricted"},
    {2, "Address Not Available"},
    {3, "Spare"},
};
inline constexpr ValueName kOriginalPresentation[] = {
    {0, "Presentationallowed"},
    {1, "Presentation Restricted"},
    {2, "Address Not Aavailable"},
    {3, "Spare"},
};

// Number qualifier of a generic number; other values are "Reserved".
inline constexpr ValueName kNumberQualifier[] = {
    {0, "Reserved (dialleddigits)"},
    {1, "Additional Called Number"},
    {2, "Res (failed Netwk Screening)"},
    {3, "Res (not Screened)"},
    {4, "Res (redirect Terminate Num)"},
    {5, "Addit Connected Num"},
    {6, "Addit Calling Party Num"},
    {7, "Addit Original Called Num"},
    {8, "Addit Redirecting Num"},
    {9, "Addit Redirection Num"},
    {10, "Called Freephone Num"},
};

// ---- Redirection information, category, carrier, alerting -------------------------

inline constexpr ValueName kRedirectingIndicator[] = {
    {0, "No Redirection"},
    {1, "Call Rerouted"},
    {2, "Call Rerouted, Redir. Restr."},
    {3, "Call Diverted"},
    {4, "Call Diverted, Redir. Restr."},
    {5, "Call Rerouted, Num Restrict"},
    {6, "Call Diverted, Num Restrict"},
};
inline constexpr ValueName kOriginalRedirectionReason[] = {
    {0, "Unknown/not Available"},
    {1, "User Busy"},
    {2, "No Reply"},
    {3, "Unconditional"},
};
inline constexpr ValueName kRedirectingReason[] = {
    {0, "Unknown/not Available"},
    {1, "User Busy"},
    {2, "No Reply"},
    {3, "Unconditional"},
    {4, "Deflection During Alerting"},
    {5, "Deflection Immediate Response"},
    {6, "Mobile Subscriber Not Reachable"},
};

inline constexpr ValueName kCallingPartysCategory[] = {
    {0, "Unknown At This Time"},
    {1, "Operator Language French"},
    {2, "Operator Languageenglish"},
    {3, "Operator Language German"},
    {4, "Operator Languagerussian"},
    {5, "Operator Languagespanish"},
    {6, "For Particular Language (6)"},
    {7, "For Particular Language (7)"},
    {8, "For Particular Language (8)"},
    {10, "Ordinary Calling Subscriber"},
    {11, "Calling Subscriber With Priority"},
    {12, "Data Call (voice Band Data)"},
    {15, "Payphone"},
};

inline constexpr ValueName kCarrierSelection[] = {
    {0, "No Indication"},
    {1, "Pre Subscribed And Not Input By Calling Party"},
    {2, "Pre Subscribed And Input By Calling Party"},
    {3, "Pre Subscribed No Indication Of IF Input By Calling Party"},
    {4, "Not Subscribed And Input By Calling Party"},
    {255, "Reserved"},
};
inline constexpr ValueName kCarrierSelectionShown[] = {
    {1, "Pre Subs And Not Input"},
    {2, "Pre Subs And Input"},
    {3, "Pre Subs, No Indication"},
    {4, "Not Subs And Input"},
};

// Type of alerting; other values are "Reserved".
inline constexpr ValueName kTypeOfAlerting[] = {
    {0, "Alertinglevel 0"},
    {1, "Alertinglevel 1"},
    {2, "Alertinglevel 2"},
    {4, "Alertingcategory 1"},
    {5, "Alertingcategory 2"},
    {6, "Alertingcategory 3"},
    {7, "Alertingcategory 4"},
    {8, "Alertingcategory 5"},
};

// ---- Cause -------------------------------------------------------------------------

inline constexpr ValueName kCauseLocation[] = {
    {0, "User"},
    {1, "Private Network Serving The Local User"},
    {2, "Public Network Serving The Llocal User"},
    {3, "Transitnetwork"},
    {4, "Public Network Serving The Remote User"},
    {5, "Private Network Serving The Remote User"},
    {7, "Internationalnetwork"},
    {10, "Beyond An Interworking Point"},
};
inline constexpr ValueName kCauseLocationShown[] = {
    {1, "Private Ntwk / Local User"},
    {2, "Public Ntwk / Local User"},
    {4, "Public Ntwk / Remote User"},
    {5, "Private Ntwk / Remote User"},
    {10, "Beyond Interworking"},
};
inline constexpr ValueName kCauseCodingStandard[] = {
    {0, "ITU-T standardized coding"},
    {1, "Reserved For Other International Standards (national Use)"},
    {2, "National Standard (national Use)"},
    {3, "Standard Specific TO Identified Location"},
};
inline constexpr ValueName kCauseCodingStandardShown[] = {
    {1, "Reserved"},
    {2, "National"},
    {3, "Location Specific"},
};
inline constexpr ValueName kCauseValue[] = {
    {1, "Unallocated (unassigned) Number (1)"},
    {2, "No Route TO Specified Transit Network (2)"},
    {3, "No Route TO Destination (3)"},
    {4, "Send Special Information Tone (4)"},
    {5, "Misdialled Trunk Prefix (5)"},
    {6, "Channel Unacceptable (6)"},
    {7, "Call Awarded & Delivered In An Estab. Chan (7)"},
    {8, "Preemption (8)"},
    {9, "Preemption-cir Resv Reuse (9)"},
    {16, "Normal Call Clearing (16)"},
    {17, "User Busy (17)"},
    {18, "No User Responding (18)"},
    {19, "No Answer From User (user Alerted) (19)"},
    {20, "Absent Subsciber (20)"},
    {21, "Call Rejected (21)"},
    {22, "Number Changed (22)"},
    {26, "Non-selected User Clearing (26)"},
    {27, "Destination Out Of Order (27)"},
    {28, "Address Incomplete (28)"},
    {29, "Facility Rejected (29)"},
    {30, "Response TO Status Enquiry (30)"},
    {31, "Normal, Unspecified (31)"},
    {34, "No Circuit Available (34)"},
    {38, "Network Out Of Order (38)"},
    {39, "Permanent Frame Mode Connection Out Of Serv (39)"},
    {40, "Permanent Frame Mode Connection Operational (40)"},
    {41, "Temporary Failure (41)"},
    {42, "Switching Equipment Congestion (42)"},
    {43, "Access Info Discarded (43)"},
    {44, "Requested Circuit/channel Not Available (44)"},
    {46, "Precedence Call Blocked (46)"},
    {47, "Resource Unavailable Unspecified (47)"},
    {50, "Requested Facility Not Subscibed (50)"},
    {53, "Out Calls Barred In CUG (53)"},
    {55, "Incoming Calls Barred Within CUG (55)"},
    {57, "Bearer Capability Not Authorized (57)"},
    {58, "Bearer Capability Not Presently Available (58)"},
    {62, "Inconsis In Designated Out Access Info & Subs Class (62)"},
    {63, "Service Or Option Unavailable (unspecified) (63)"},
    {65, "Bearer Capability Not Implemented (65)"},
    {66, "Chan Type Not Implemented (66)"},
    {69, "Requested Facility Not Implemented (69)"},
    {70, "Only Restricted Digital Information Bearer Capability Is Available (70)"},
    {79, "Service Or Option Not Implemented, Unspecified (79)"},
    {81, "Invalid Call Ref. Value (81)"},
    {82, "Identified Cha Not Exist (82)"},
    {83, "A Suspended Call Exists, But This Call Identity Does Not (83)"},
    {84, "Call Identity In Use (84)"},
    {85, "No Call Suspended (85)"},
    {86, "Call Having The Requested Call Identity Has Been Cleared (86)"},
    {87, "User Not Member Of CUG (87)"},
    {88, "Incompatible Destination (88)"},
    {89, "Non-existent CUG (89)"},
    {91, "Invalid Transit Network Selection (91)"},
    {95, "Invalid Msg, Unspecified (95)"},
    {96, "Mandatory Ie. Is Missing (96)"},
    {97, "Message Non-existant Or Not Implemented (discarded) (97)"},
    {98, "Msg Not Compatible With Call State,msg Type Non-existent,not Implemented (98)"},
    {99, "Parameter Non-existant Or Not Iimplemented (discarded) (99)"},
    {100, "Invalid Ie. CONTENTS (100)"},
    {101, "Msg Not Compatible With Call State (101)"},
    {102, "Recovery On Timer Expiry (102)"},
    {103, "Parameter Non-existsnt Or Not Implemented, Passed On (103)"},
    {110, "Message With Unrecognised Parameter Discarded (110)"},
    {111, "Prot. Err, Unspecified (111)"},
    {127, "Interworking Unspecified (127)"},
};
inline constexpr ValueName kCauseValueShown[] = {
    {1, "Unallocated Number (1)"},
    {2, "No Route TO Transit Network (2)"},
    {4, "Send Special Info. Tone (4)"},
    {7, "Call Awarded & Deliverd (7)"},
    {19, "No Answer From User (19)"},
    {39, "Frame Mode Con. Out Serv (39)"},
    {40, "Frame Mod Operational (40)"},
    {42, "Switching Equip. Congestion (42)"},
    {44, "Req. Cct/chan. Not Avai. (44)"},
    {47, "Resource Unavail., Unspec. (47)"},
    {50, "Req. Faci Not Subscribed (50)"},
    {55, "In Calls Barred In CUG (55)"},
    {57, "Bearer Cap. Not Authorized (57)"},
    {58, "Bearer Cap. Not Available (58)"},
    {62, "Inconsis Inf & Subs Class (62)"},
    {63, "Service Or Option Unavail. (63)"},
    {65, "Bearer Cap. Not Implemented (65)"},
    {69, "Req. Faci Not Implemented (69)"},
    {70, "Only R. Inf Bearer Capav (70)"},
    {79, "Serv/opt Not Implemented (79)"},
    {83, "Susp Call Ext, This Not (83)"},
    {86, "Call With Req Iden Clear (86)"},
    {91, "Inval Transit Ntwk Sel. (91)"},
    {97, "Msg Non-existant/not Imp. (97)"},
    {98, "Msg Not Comp./not Impl. (98)"},
    {99, "Para Non-exist/not Impl. (99)"},
    {101, "Not Compatible With State (101)"},
    {103, "Para. Non-exist, Pass On (103)"},
    {110, "Msg With Unrec Par. (110)"},
};
inline constexpr ValueName kExtensionIndicator[] = {{0, "Extension"}, {1, "No Extension"}};

// ---- High layer compatibility ---------------------------------------------------------

inline constexpr ValueName kHlcCodingStandard[] = {{0, "CCITT Standard"}, {2, "National Standard"}};
inline constexpr ValueName kHlcInterpretation[] = {{4, "First High Layer Character"}};
inline constexpr ValueName kHlcPresentation[] = {{1, "High Layer Protocol Profile"}};
inline constexpr ValueName kHlcPresentationShown[] = {{1, "High Layer Protocolprofile"}};
// High layer characteristics; other values are "Reserved".
inline constexpr ValueName kHighLayerCharacteristics[] = {
    {1, "Telephony"},
    {4, "Facsimile Group 2/3"},
    {33, "Fax Group 4class I"},
    {36, "Teletex & Fax Mixed Mode"},
    {40, "Teletex F220"},
    {49, "Teletext"},
    {50, "Syntax Bbased Videotex"},
    {51, "International Videotex"},
    {53, "Telex"},
    {56, "Message Handling System"},
    {65, "Osi APPLICATION"},
    {66, "Ftam APPLICATION"},
    {94, "Maintenance"},
    {95, "Management"},
    {96, "Videotelephony"},
    {97, "Vidoeconfrencing"},
    {98, "Audiographic Conferencing"},
    {99, "Reserved For Audiovisual(63h)"},
    {100, "Reserved For Audiovisual(64h)"},
    {101, "Reserved For Audiovisual(65h)"},
    {102, "Reserved For Audiovisual(66h)"},
    {103, "Reserved For Audiovisual(67h)"},
    {104, "Multimedia Services"},
    {105, "Reserved For Audiovisual(69h)"},
    {106, "Reserved For Audiovisual(6ah)"},
    {107, "Reserved For Audiovisual(6bh)"},
    {108, "Reserved For Audiovisual(6ch)"},
    {109, "Reserved For Audiovisual(6dh)"},
    {110, "Reserved For Audiovisual(6eh)"},
    {111, "Reserved For Audiovisual(6fh)"},
};
inline constexpr ValueName kEtsiHighLayer[] = {{65, "Eurofile Transfer"}};
inline constexpr ValueName kExtendedHighLayer[] = {
    {1, "Initial Channel Of H.221"},
    {2, "Subsequent Channel Of H.221"},
    {33, "Ini Cha 3.1khz Audio Or Speech"},
};

// ---- Bearer capability ----------------------------------------------------------------

inline constexpr ValueName kBearerChoice[] = {{128, "Bearer Cap TAG"}};
inline constexpr ValueName kBearerChoiceShown[] = {{128, "Bearer Cap"}};
inline constexpr ValueName kTransferCapability[] = {
    {0, "Speech"},
    {8, "Unrestricted Digital Information"},
    {9, "Restricted Digital Information"},
    {16, "3.1 Khz Audio"},
    {17, "7 Khz Audio"},
    {24, "Video"},
};
inline constexpr ValueName kBearerCodingStandard[] = {
    {0, "CCITT Standardised Coding"},
    {1, "Other International Standard"},
    {2, "National Standard"},
    {3, "Network Standard"},
};
inline constexpr ValueName kBearerCodingStandardShown[] = {
    {0, "ITU-T standardized coding"},
    {1, "ISO/IEC standard"},
};
inline constexpr ValueName kBearerExtension[] = {{0, "Extension"}, {1, "No extension"}};
inline constexpr ValueName kTransferRate[] = {
    {0, "Packet-mode Calls"},
    {16, "64 Kbit/s"},
    {17, "2 X 64 Kbit/s"},
    {19, "384 Kbit/s"},
    {21, "1536 Kbit/s"},
    {23, "1920 Kbit/s"},
    {24, "Multirate(64 Kbit/s Base Rate)"},
};
inline constexpr ValueName kTransferMode[] = {{0, "Circuit Mode"}, {2, "Packet Mode"}};
// Layer identification; other values are "Invalid".
inline constexpr ValueName kLayerId[] = {{1, "Layer 1"}, {2, "Layer 2"}, {3, "Layer 3"}};
inline constexpr ValueName kLayer1Protocol[] = {
    {1, "ITU-T standardized rate adaption V.110, I.460 and X.30"},
    {2, "Recommendation G.711 u-law"},
    {3, "Recommendation G.711 A-law"},
    {4, "Recommendation G.721 32 kbit/s ADPCM and Recommendation I.460"},
    {5, "Recommendations H.221 and H.242"},
    {6, "Recommendations H.223 and H.245"},
    {7, "Non-ITU-T standardized rate adaption"},
    {8, "ITU-T standardized rate adaption V.120"},
    {9, "ITU-T standardized rate adaption X.31 HDLC flag stuffing"},
};
inline constexpr ValueName kSynchronous[] = {{0, "Synchronous data"}, {1, "Asynchronous data"}};
inline constexpr ValueName kInBandNegotiation[] = {{0, "Not possible"}, {1, "Possible"}};
inline constexpr ValueName kUserRate[] = {
    {1, "0.6 kbit/s Recommendation X.1"},
    {2, "1.2 kbit/s"},
    {3, "2.4 kbit/s Recommendation X.1"},
    {4, "3.6 kbit/s"},
    {5, "4.8 kbit/s Recommendation X.1"},
    {6, "7.2 kbit/s"},
    {7, "8 kbit/s Recommendation I.460"},
    {8, "9.6 kbit/s Recommendation X.1"},
    {9, "14.4 kbit/s"},
    {10, "16 kbit/s Recommendation I.460"},
    {11, "19.2 kbit/s"},
    {12, "32 kbit/s Recommendation I.460"},
    {13, "38.4 kbit/s Recommendation V.110"},
    {14, "48 kbit/s Recommendations X.1"},
    {15, "56 kbit/s"},
    {18, "57.6 kbit/s Recommendation V.14 extended"},
    {19, "28.8 kbit/s Recommendation V.110"},
    {20, "24 kbit/s Recommendation V.110"},
    {21, "0.1345 kbit/s Recommendation X.1"},
    {22, "0.100 kbit/s Recommendation X.1"},
    {23, "0.075/1.2 kbit/s Recommendation X.1"},
    {24, "1.2/0.075 kbit/s Recommendation X.1"},
    {25, "0.050 kbit/s Recommendation X.1"},
    {26, "0.075 kbit/s Recommendation X.1"},
    {27, "0.110 kbit/s Recommendation X.1"},
    {28, "0.150 kbit/s Recommendation X.1"},
    {29, "0.200 kbit/s Recommendation X.1"},
    {30, "0.300 kbit/s Recommendation X.1"},
    {31, "12 kbit/s"},
};
// Octet 5b for V.110 / X.30 rate adaption.
inline constexpr ValueName kIntermediateRate[] = {
    {0, "Not used"},
    {1, "8 kbit/s"},
    {2, "16 kbit/s"},
    {3, "32 kbit/s"},
};
inline constexpr ValueName kRequired[] = {{0, "Not required"}, {1, "Required"}};
inline constexpr ValueName kAccepted[] = {{0, "Cannot accept"}, {1, "Can accept"}};
// Octet 5b for V.120 rate adaption.
inline constexpr ValueName kRateAdaptionHeader[] = {{0, "Not included"}, {1, "Included"}};
inline constexpr ValueName kFrameSupport[] = {{0, "Not supported"}, {1, "Supported"}};
inline constexpr ValueName kModeOfOperation[] = {
    {0, "Bit transparent mode of operation"},
    {1, "Protocol sensitive mode of operation"},
};
inline constexpr ValueName kLliNegotiation[] = {
    {0, "Default, LLI=256 only"},
    {1, "Full protocol negotiation"},
};
inline constexpr ValueName kAssignor[] = {
    {0, "Message originator is default assignee"},
    {1, "Message originator is assignor only"},
};
inline constexpr ValueName kNegotiationBand[] = {
    {0, "Out-band negotiation"},
    {1, "In-band negotiation"},
};
inline constexpr ValueName kParity[] = {
    {0, "Odd"},
    {2, "Even"},
    {3, "None"},
    {4, "Forced to 0"},
    {5, "Forced to 1"},
};
inline constexpr ValueName kDataBits[] = {
    {0, "Not used"},
    {1, "5 bits"},
    {2, "7 bits"},
    {3, "8 bits"},
};
inline constexpr ValueName kStopBits[] = {
    {0, "Not used"},
    {1, "1 bit"},
    {2, "1.5 bits"},
    {3, "2 bits"},
};
// Modem types, with the code-point ranges for national use and user
// specified types; other values are "Reserved".
inline constexpr ValueName kModemType[] = {
    {0, "National use"},
    {1, "National use"},
    {2, "National use"},
    {3, "National use"},
    {4, "National use"},
    {5, "National use"},
    {17, "Recommendation V.21"},
    {18, "Recommendation V.22"},
    {19, "Recommendation V.22 bis"},
    {20, "Recommendation V.23"},
    {21, "Recommendation V.26"},
    {22, "Recommendation V.26 bis"},
    {23, "Recommendation V.26 ter"},
    {24, "Recommendation V.27"},
    {25, "Recommendation V.27 bis"},
    {26, "Recommendation V.27 ter"},
    {27, "Recommendation V.29"},
    {29, "Recommendation V.32"},
    {30, "Recommendation V.34"},
    {32, "National use"},
    {33, "National use"},
    {34, "National use"},
    {35, "National use"},
    {36, "National use"},
    {37, "National use"},
    {38, "National use"},
    {39, "National use"},
    {40, "National use"},
    {41, "National use"},
    {42, "National use"},
    {43, "National use"},
    {44, "National use"},
    {45, "National use"},
    {46, "National use"},
    {47, "National use"},
    {48, "User specified"},
    {49, "User specified"},
    {50, "User specified"},
    {51, "User specified"},
    {52, "User specified"},
    {53, "User specified"},
    {54, "User specified"},
    {55, "User specified"},
    {56, "User specified"},
    {57, "User specified"},
    {58, "User specified"},
    {59, "User specified"},
    {60, "User specified"},
    {61, "User specified"},
    {62, "User specified"},
    {63, "User specified"},
};
inline constexpr ValueName kDuplex[] = {{0, "Half duplex"}, {1, "Full duplex"}};
inline constexpr ValueName kLayer2Protocol[] = {
    {2, "Recommendation Q.921/I.441"},
    {6, "Recommendation X.25 link layer"},
    {12, "LAN logical link control (ISO/IEC 8802-2)"},
};
inline constexpr ValueName kLayer3Protocol[] = {
    {2, "Recommendation Q.931"},
    {6, "Recommendation X.25, packet layer"},
    {11, "ISO/IEC TR 9577 (Protocol identification in the network layer)"},
};
inline constexpr ValueName kAdditionalLayer3[] = {
    {204, "Internet Protocol (RFC 791) (ISO/IEC TR 9577)"},
    {207, "Point-to-point Protocol (RFC 1548)"},
};

} // namespace camel::names
