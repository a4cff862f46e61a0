// Value names of the call-control types: extensions, side and leg ids,
// requested information, service interaction indicators, BCSM events and
// event-specific information, basic service codes, IP SSP capabilities.
#pragma once

#include "fields/field_def.h"

namespace camel::names {

// ---- Extensions ----
inline constexpr ValueName kExtensionCriticality[] = {{0, "Ignore"}, {1, "Abort"}};
// The extension value's identifier, [1] in either form.
inline constexpr ValueName kExtensionValueTag[] = {{0x81, "81"}, {0xA1, "A1"}};

// ---- Side and leg identifiers ----
inline constexpr ValueName kSendingSideChoice[] = {{0x80, "Sending Side Id"}};
inline constexpr ValueName kReceivingSideChoice[] = {{0x81, "Receiving Side ID"}};
inline constexpr ValueName kLegIdChoice[] = {{0x80, "Sending Side Id Tag"},
                                             {0x81, "Receiving Side IdTAG"}};
inline constexpr ValueName kLegIdChoiceShown[] = {{0x80, "Sendingside ID"},
                                                  {0x81, "Receiving Side ID"}};
inline constexpr ValueName kLegType[] = {{1, "Leg 1 Legtype"}, {2, "Leg 2 Legtype"}};
inline constexpr ValueName kLegOrCallSegment[] = {{0x80, "callSegmentID"}, {0xA1, "legID"}};

// ---- Requested information ----
inline constexpr ValueName kRequestedInfoType[] = {{0, "Call Attempt Elapsed Time"},
                                                   {1, "Call Stop Time"},
                                                   {2, "Call Connected Elapsed Time"},
                                                   {30, "Release Cause"}};
inline constexpr ValueName kRequestedInfoValueChoice[] = {
    {0x80, "Call Attempt Elapsed Time Value Tag"},
    {0x81, "Call Stop Time Value Tag"},
    {0x82, "Call Connected Elapsed Time Value Tag"},
    {0x9E, "Release Cause Tag"}};
inline constexpr ValueName kRequestedInfoValueChoiceShown[] = {
    {0x80, "Call Attempt El. Time Val"},
    {0x81, "Call Stop Time Value"},
    {0x82, "Call Connect El. Time Val"},
    {0x9E, "Release Cause Value"}};

// ---- Service interaction indicators two ----
inline constexpr ValueName kConferenceTreatment[] = {{1, "Accept Conferencerequest"},
                                                     {2, "Reject Conference Request"}};
inline constexpr ValueName kConferenceTreatmentShown[] = {{2, "Reject Conferencerequest"}};
inline constexpr ValueName kCallDiversionTreatment[] = {{1, "Call Diversionallowed"},
                                                        {2, "Call Diversion Not Allowed"}};
inline constexpr ValueName kCallDiversionTreatmentShown[] = {{2, "Call Diversion Notallowed"}};
inline constexpr ValueName kCallingPartyRestriction[] = {{1, "No IN Impact"},
                                                         {2, "Presentation Resticted"}};
inline constexpr ValueName kCallCompletionTreatment[] = {{1, "Accept Call Comple. Service Req"},
                                                         {2, "Reject Call Comple. Servicereq"}};
inline constexpr ValueName kCallCompletionTreatmentShown[] = {
    {2, "Reject Call Comple. Service Req"}};
inline constexpr ValueName kBothwayThroughConnection[] = {{0, "Bothway Path Required"},
                                                          {1, "Bothway Path Not Required"}};
inline constexpr ValueName kConnectedNumberTreatment[] = {{0, "No In Impact"},
                                                          {1, "Presentation Restricted"},
                                                          {2, "Present Called In Number"},
                                                          {3, "Present Called In Num Res."}};
inline constexpr ValueName kHoldTreatment[] = {{1, "Accept Holdrequest"},
                                               {2, "Reject Hold Request"}};
inline constexpr ValueName kHoldTreatmentShown[] = {{2, "Reject Holdrequest"}};
inline constexpr ValueName kCwTreatment[] = {{1, "Accept Cw"}, {2, "Reject Cw"}};
inline constexpr ValueName kEctTreatment[] = {{1, "Accept Ect Request"},
                                              {2, "Reject Ect Request"}};

// ---- BCSM events ----
inline constexpr ValueName kEventTypeBcsm[] = {
    {2, "Collected Info."},        {3, "Analyzed Info."},      {4, "Route Selectfailure"},
    {5, "O. Called Party Busy"},   {6, "O. No Answer"},        {7, "O. Answer"},
    {9, "O. Disconnect"},          {10, "O.abandon"},          {12, "T. Attempt Authorised"},
    {13, "T. Busy"},               {14, "T. No Answer"},       {15, "T. Answer"},
    {16, "T. Midcall"},            {17, "T. Disconnect"},      {18, "T. Abandon"},
    {19, "O. TermSeized"},         {27, "CallAccepted"},       {50, "O. ChangeOfPosition"},
    {51, "T. ChangeOfPosition"}};
inline constexpr ValueName kMonitorMode[] = {
    {0, "Interrupted"}, {1, "Notify And Continue"}, {2, "Transparent"}};
inline constexpr ValueName kDpSpecificCriteriaChoice[] = {{0x81, "APPLICATION TimerTAG"},
                                                          {0xA2, "Mid Call Control Info"},
                                                          {0xA3, "DP Specific Criteria Alt"}};
inline constexpr ValueName kDpSpecificCriteriaChoiceShown[] = {{0x81, "APPLICATION Timer"}};

// Event-specific information: one-octet identifiers, and two-octet ones as
// read (first octet low: BF 32 -> 0x32BF).
inline constexpr ValueName kEventSpecificInfoChoice[] = {
    {0xA2, "Route Select Failure Specific Info Tag"},
    {0xA3, "O. Called Party Busy Spec. Tag"},
    {0xA4, "O. No Answer Specific Tag"},
    {0xA5, "O. Answer Specific Info Tag"},
    {0xA7, "O. Disconnect Specific Info Tag"},
    {0xA8, "T. Busy Specific Info Tag"},
    {0xA9, "T. No Answer Specific Info Tag"},
    {0xAA, "T. Answer Specific Info Tag"},
    {0xAC, "T. Disconnect Specific Info Tag"},
    {0xAD, "O. Term Seized Specific Info Tag"},
    {0xB4, "Call Accepted Specific Info Tag"},
    {0xB5, "O. Abandon Specific Info Tag"}};
inline constexpr ValueName kEventSpecificInfoChoiceShown[] = {
    {0xA2, "Route Select Failure Specific"},
    {0xA3, "O. Called Party Busy Spec."},
    {0xA4, "O. No Answer Specific"},
    {0xA5, "O. Answer Specific"},
    {0xA7, "O. Disconnect Specific"},
    {0xA8, "T. Busy Specific"},
    {0xA9, "T. No Answer"},
    {0xAA, "T. Answer Specific Info"},
    {0xAC, "T. Disconnect Specific Info"},
    {0xAD, "O. Term Seized Specific Info"},
    {0xB4, "Call Accepted Specific Info"},
    {0xB5, "O. Abandon Specific Info"}};
inline constexpr ValueName kEventSpecificInfoChoice16[] = {
    {0x32BF, "O. Change Of Position Specific Info Tag"},
    {0x33BF, "T. Change Of Position Specific Info Tag"},
    {0x35BF, "DP Specific Info Alt"}};
inline constexpr ValueName kEventSpecificInfoChoice16Shown[] = {
    {0x32BF, "O. Change Of Position Specific Info"},
    {0x33BF, "T. Change Of Position Specific Info"}};
inline constexpr ValueName kChargeIndicator[] = {
    {0, "no indication"}, {1, "no charge"}, {2, "charge"}, {3, "spare"}};

// ---- Misc call info, call gapping ----
inline constexpr ValueName kMiscMessageType[] = {{0, "Request"}, {1, "Notification"}};
inline constexpr ValueName kCgEncountered[] = {
    {0, "No CG Encountered"}, {1, "Manual CG Encountered"}, {2, "SCP Overload"}};

// ---- IP SSP capabilities ----
inline constexpr ValueName kSupported[] = {{0, "Not Supported"}, {1, "Supported"}};
inline constexpr ValueName kVoiceViaSpeech[] = {{0, "Not Supported,via Speech Recog."},
                                                {1, "Supported,via Speech Recognition"}};
inline constexpr ValueName kVoiceViaVoice[] = {{0, "Not Supported,via Voice Recog."},
                                               {1, "Supported,via Voice Recognition"}};
inline constexpr ValueName kEndOfStandardPart[] = {{0, "End Of Standard Part"}, {1, "Reserved"}};

// ---- Extended basic service code ----
inline constexpr ValueName kExtBasicServiceChoice[] = {{0x82, "Bs Code Tag"},
                                                       {0x83, "Tele Service Code Tag"}};
inline constexpr ValueName kExtBasicServiceChoiceShown[] = {{0x82, "Bs Code"},
                                                            {0x83, "Tele Service Code"}};
inline constexpr ValueName kBearerService[] = {
    {0, "All Bearer Services"},
    {16, "Data Cda - All Services"},
    {17, "Data Cda - 300b/s"},
    {18, "Data Cda -1200b/s"},
    {19, "Data Cda - 1200-75b/s"},
    {20, "Data Cda -2400b/s"},
    {21, "Data Cda -4800b/s"},
    {22, "Data Cda -9600b/s"},
    {23, "General Data Cda"},
    {24, "Data Cds - All Services"},
    {26, "Data Cds -1200b/s"},
    {28, "Data Cds -2400b/s"},
    {29, "Data Cds -4800b/s"},
    {30, "Data Cds -9600b/s"},
    {31, "General Data Cds"},
    {32, "Pad Access Ca - Allservices"},
    {33, "Pad Access Ca - 300b/s"},
    {34, "Pad Access Ca -1200b/s"},
    {35, "Pad Access Ca - 1200-75b/s"},
    {36, "Pad Access Ca -2400b/s"},
    {37, "Pad Access Ca -4800b/s"},
    {38, "Pad Access Ca -9600b/s"},
    {39, "General Pad Access Ca"},
    {40, "Data Pds - All Services"},
    {44, "Data Pds -2400b/s"},
    {45, "Data Pds -4800b/s"},
    {46, "Data Pds -9600b/s"},
    {47, "General Data Pds"},
    {48, "Alternate Speech/data Cda"},
    {56, "Alternate Speech/data Cds"},
    {64, "Speech Followed By Data Cda"},
    {72, "Speech Followed By Ddata Cds"},
    {80, "All Data Circuit Asynchronous"},
    {88, "All Data Circuit Synchronous"},
    {96, "All Asynchronous Services"},
    {104, "All Synchronous Services"},
    {120, "12 Kb/s Unrestricteddigital"},
    {208, "All Plmn Specific Bs"},
    {209, "Plmn Specific Bs 1"},
    {210, "Plmn Specific Bs 2"},
    {211, "Plmn Specific Bs 3"},
    {212, "Plmn Specific Bs 4"},
    {213, "Plmn Specific Bs 5"},
    {214, "Plmn Specific Bs 6"},
    {215, "Plmn Specific Bs 7"},
    {216, "Plmn Specific Bs 8"},
    {217, "Plmn Specific Bs 9"},
    {218, "Plmn Specific Bs A"},
    {219, "Plmn Specific Bs B"},
    {220, "Plmn Specific Bs C"},
    {221, "Plmn Specific Bs D"},
    {222, "Plmn Specific Bs E"},
    {223, "Plmn Specific Bs F"}};
inline constexpr ValueName kTeleService[] = {
    {0, "All Tele Services"},
    {16, "All Speech Ttransmission Services"},
    {17, "Telephony"},
    {18, "Emergency Calls"},
    {32, "All Short Message Services"},
    {33, "Short Message Mt-pp"},
    {34, "Short Message Mo-pp"},
    {96, "All Facsimile Transmission Services"},
    {97, "Facsimile Group 3 And Alternate Speech"},
    {98, "Automatic Facsimilegroup 3"},
    {99, "Facsimile G4"},
    {112, "All Data Teleservices"},
    {128, "All Teleservices Except SMS"},
    {144, "All Voice Group Call Services"},
    {145, "Voice Group Call"},
    {146, "Voice Broadcast Call"},
    {208, "All Plmn Specific Ts"},
    {209, "Plmn Specific Ts 1"},
    {210, "Plmn Specific Ts 2"},
    {211, "Plmn Specific Ts 3"},
    {212, "Plmn Specific Ts 4"},
    {213, "Plmn Specific Ts 5"},
    {214, "Plmn Specific Ts 6"},
    {215, "Plmn Specific Ts 7"},
    {216, "Plmn Specific Ts 8"},
    {217, "Plmn Specific Ts 9"},
    {218, "Plmn Specific Ts A"},
    {219, "Plmn Specific Ts B"},
    {220, "Plmn Specific Ts C"},
    {221, "Plmn Specific Ts D"},
    {222, "Plmn Specific Ts E"},
    {223, "Plmn Specific Ts F"}};
inline constexpr ValueName kTeleServiceShown[] = {{16, "Speech Transmission"},
                                                  {32, "Short Messages Services"},
                                                  {96, "Facsimile"},
                                                  {97, "Fax G3 And Alternate Speech"},
                                                  {128, "All Ts Except SMS"}};

} // namespace camel::names
