// Value names of the charging, call gap and information-to-send types.
#pragma once

#include "fields/field_def.h"

namespace camel::names {

// BOOLEAN octets: zero is false, anything else true (`.otherwise("True")`).
inline constexpr ValueName kFalse[] = {{0, "False"}};

inline constexpr ValueName kAudibleIndicator[] = {{0x01, "tone"}, {0xA1, "burstList"}};

inline constexpr ValueName kTimeInformation[] = {
    {0x80, "Time If No Tariff Switch"},
    {0xA1, "Time If Tariff Switch"},
};

inline constexpr ValueName kAppendFreeFormatData[] = {{0, "Overwrite"}, {1, "Append"}};

// The gap criteria: the four basic criteria first, so that the Basic Gap
// Criteria choice names only them (see firstNames).
inline constexpr ValueName kGapCriteria[] = {
    {0x80, "Called Address Value Tag"},
    {0xA2, "Gap On Service Tag"},
    {0xBD, "Called Address And Service Tag"},
    {0xBE, "Calling Address And Service Tag"},
    {0x30, "Compound Gap Criteria Tag"},
};
inline constexpr ValueName kGapCriteriaShown[] = {
    {0x80, "Called Address Value"},
    {0xA2, "Gap Onservice"},
    {0xBD, "Called Addressservice"},
    {0xBE, "Calling Addressservice"},
    {0x30, "Compound Gap Criteria"},
};
inline constexpr uint16_t kBasicGapCriteriaCount = 4;

inline constexpr ValueName kControlType[] = {{0, "Scp Overload"}, {1, "Manually Initiated"}};

inline constexpr ValueName kGapTreatment[] = {
    {0xA0, "Information To Send Tag"},
    {0x81, "Release Cause Tag"},
};
inline constexpr ValueName kGapTreatmentShown[] = {
    {0xA0, "InformationTO Send"},
    {0x81, "Release Cause"},
};

inline constexpr ValueName kInformationToSend[] = {{0xA0, "Inband Info Tag"}, {0xA1, "Tone Tag"}};
inline constexpr ValueName kInformationToSendShown[] = {{0xA0, "Inband Info"}, {0xA1, "Tone"}};

inline constexpr ValueName kMessageId[] = {
    {0x80, "Elementary Message Id Tag"},
    {0xA1, "Text Tag"},
    {0xBD, "Elementary Messageids Tag"},
    {0xBE, "Variable Message Tag"},
};
inline constexpr ValueName kMessageIdShown[] = {
    {0x80, "Elementary Message Id"},
    {0xA1, "Text"},
    {0xBD, "Elementary Message Ids"},
    {0xBE, "Variablemessage"},
};

// Generic Digits: type of digits (bits 1-5; other values "Spare") and
// encoding scheme (bits 6-8).
inline constexpr ValueName kTypeOfDigits[] = {
    {0, "Res Account Code"},
    {1, "Res Authorisation Code"},
    {2, "Res Private Networking"},
    {3, "Res Business "},
    {31, "Res For Extension"},
};
inline constexpr ValueName kEncodingScheme[] = {
    {0, "Bcd Even"},    {1, "Bcd Odd"},     {2, "Ia5character"},
    {3, "Binary Coded"}, {6, "Spare (6)"}, {7, "Spare (7)"},
};

inline constexpr ValueName kSciBillingCharging[] = {
    {0xA0, "AOC Before Answer Tag"},
    {0xA1, "AOC After Answer"},
    {0xA2, "AOC Extension"},
};
inline constexpr ValueName kSciBillingChargingShown[] = {{0xA0, "AOC Before Answer"}};

// The two identifier octets 9F 32 / 9F 33 as read (first octet low).
inline constexpr ValueName kSpecializedResourceReport[] = {
    {0x329F, "allAnnouncementsComplete"},
    {0x339F, "firstAnnouncementStarted"},
};


// A choice field that names only the first `n` values of its table (and of
// its display table).
constexpr FieldDef firstNames(FieldDef f, uint16_t n) {
    f.nameCount = n < f.nameCount ? n : f.nameCount;
    f.displayNameCount = n < f.displayNameCount ? n : f.displayNameCount;
    return f;
}

} // namespace camel::names
