// Value names of the mobile identities, location, time and user-interaction
// types.
#pragma once

#include "fields/field_def.h"

namespace camel::names::mobile {

// A one-octet BOOLEAN value shown as "  <label>=": 0 is False, any other
// value True.
inline constexpr ValueName kFalse[] = {{0, "False"}};
constexpr FieldDef boolean(uint32_t id, const char *label) {
    return enumField(id, label, kFalse).otherwise("True").indented();
}

inline constexpr ValueName kNotReachableReason[] = {
    {0, "MS Purged"}, {1, "IMSI Detached"}, {2, "Restricted Area"}, {3, "Not Registered"}};

// Geographical information
inline constexpr ValueName kTypeOfShape[] = {{0, "Ellipsoid Point (invalid)"},
                                             {1, "Ellipsoid Point With Uncertainty Circle"},
                                             {5, "Polygon (invalid)"}};
inline constexpr ValueName kTypeOfShapeShown[] = {{1, "Ellips Pt With Uncertain Circle"}};

// ISDN address body (VLR number, ISDN Address String)
inline constexpr ValueName kAddressNumberingPlan[] = {
    {0, "Unknown"},
    {1, "ISDN/telephony Number Plan"},
    {3, "Data Numbering Plan"},
    {4, "Telex Numbering Plan"},
    {6, "Land Mobile Numbering Plan"},
    {8, "National Numbering Plan"},
    {9, "Private Numbering Plan"},
    {15, "Reserved For Extension"},
};
inline constexpr ValueName kAddressNature[] = {
    {0, "Unknown"},
    {1, "International Number"},
    {2, "National Significant Number"},
    {3, "Network Specific Number"},
    {4, "Subscriber Number"},
    {6, "Abbreviated Number"},
    {7, "Reserved For Extension"},
};
inline constexpr ValueName kAddressExtension[] = {{0, "Extension"}, {1, "No Extension"}};

// Location number body
inline constexpr ValueName kOddEven[] = {{0, "Even"}, {1, "Odd"}};
inline constexpr ValueName kOddEvenShown[] = {{0, "Even Number Of Aaddresssignals"},
                                              {1, "Odd Number Of Addresssignals"}};
inline constexpr ValueName kLocationNature[] = {
    {1, "Reserved For Subscriber Number"},
    {2, "Reserved Forunknown"},
    {3, "National (significant) Number"},
    {4, "International Number"},
};
inline constexpr ValueName kInternalNetworkNumber[] = {
    {0, "Routing to Internal Numberallowed"}, {1, "Routing to Internal Number Not Allowed"}};
inline constexpr ValueName kInternalNetworkNumberShown[] = {
    {0, "Routing to Internal Numallowed"}, {1, "Rout TO Internal Num Notallowed"}};
inline constexpr ValueName kLocationNumberingPlan[] = {
    {0, "Spare"},
    {1, "ISDN/telephony (rec. E.164)"},
    {2, "Spare"},
    {3, "Data Numbering Plan(x.121)"},
    {4, "Telex Numbering Plan (f.69)"},
    {5, "Private Numbering Plan"},
    {6, "Reserved For National Use"},
    {7, "Spare"},
};
inline constexpr ValueName kPresentation[] = {{0, "Presentationallowed"},
                                              {1, "Presentation Restricted"},
                                              {2, "Address Not Available"},
                                              {3, "Spare"}};
inline constexpr ValueName kScreening[] = {{0, "Reserved"},
                                           {1, "User Provided,verified & Passed"},
                                           {2, "Reserved"},
                                           {3, "Network Provided"}};

// Called party BCD number
inline constexpr ValueName kBcdNumberingPlan[] = {
    {0, "Unknown"},
    {1, "ISDN/tele Num Plan (e.164/e.163)"},
    {3, "Data Numbering Plan(x.121)"},
    {4, "Telex Numbering Plan (f.69)"},
    {8, "National Numbering Plan"},
    {9, "Private Numbering Plan"},
    {11, "Reserved For Cts (see Gsm 04.56)"},
    {15, "Reserved For Extension"},
};
inline constexpr ValueName kBcdTypeOfNumber[] = {
    {0, "Unknown"},
    {1, "International Number"},
    {2, "National Number"},
    {3, "Network Specific Number"},
    {4, "Dedicated Pad Access, Short Code"},
    {5, "Reserved"},
    {6, "Reserved"},
    {7, "Reserved For Extension"},
};

// Time and time zone
inline constexpr ValueName kTimeZoneSign[] = {{0, " + "}, {1, " - "}};

// Collect info
inline constexpr ValueName kCollectInfoChoice[] = {{0xA0, "Collected Digits"}};
inline constexpr ValueName kErrorTreatment[] = {
    {0, "Std Error And Info."}, {1, "Help"}, {2, "Repeat Prompt"}};

// Timers
inline constexpr ValueName kTimerId[] = {{0, "Tssf"}};

} // namespace camel::names::mobile
