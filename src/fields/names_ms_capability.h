// Value names of the MS network capability and of the MS radio access
// capability body, and the declaration of each body field family: every
// record of the body repeats the families under field ids of its own, so a
// family's label, width and names are written once, here.
#pragma once

#include "fields/field_def.h"

namespace camel::names::mscap {

// ---- MS network capability ----------------------------------------------------------

inline constexpr ValueName kAvailable[] = {{0, "Not Available"}, {1, "Available"}};
inline constexpr ValueName kSupported[] = {{0, "Not Supported"}, {1, "Supported"}};
inline constexpr ValueName kUcs2[] = {{0, "Prefer Defau Alphabet Over Ucs2"},
                                      {1, "No Prefer Defau Alphabet & Ucs2"}};
inline constexpr ValueName kSsScreening[] = {{0, "Default Value Ofphase 1"},
                                             {1, "Cap Han Elli Nota&phas 2 Err(1)"},
                                             {2, "Cap Han Elli Nota&phas 2 Err(2)"},
                                             {3, "Cap Han Elli Nota&phas 2 Err(3)"}};
inline constexpr ValueName kSolsa[] = {{0, "Not Supported"}, {1, "Support"}};
inline constexpr ValueName kRevisionLevel[] = {{0, "Used By MS Sup Earlierver Pro"},
                                               {1, "Used By MS Sup This Verpro"}};
inline constexpr ValueName kRevisionLevelShown[] = {{1, "Used By MS Sup Thisver Pro"}};

// ---- MS radio access capability body --------------------------------------------------

inline constexpr ValueName kAccessTechnologyType[] = {
    {0, "GSM P"}, {1, "GSM E"}, {2, "GSM R"}, {3, "GSM 1800"}, {4, "GSM 1900"}};
inline constexpr ValueName kSelector[] = {{0, "0"}, {1, "1"}};
inline constexpr ValueName kA5_1[] = {{0, "Encryption Algorithm A5/1 Not Available"},
                                      {1, "Encryption Algorithm A5/1 Available"}};
inline constexpr ValueName kA5_2[] = {{0, "Encryption Algorithm A5/2 Not Available"},
                                      {1, "Encryption Algorithm A5/2 Available"}};
inline constexpr ValueName kA5_3[] = {{0, "Encryption Algorithm A5/3 Not Available"},
                                      {1, "Encryption Algorithm A5/3 Available"}};
inline constexpr ValueName kA5_4[] = {{0, "Encryption Algorithm A5/4 Not Available"},
                                      {1, "Encryption Algorithm A5/4 Available"}};
inline constexpr ValueName kA5_5[] = {{0, "Encryption Algorithm A5/5 Not Available"},
                                      {1, "Encryption Algorithm A5/5 Available"}};
inline constexpr ValueName kA5_6[] = {{0, "Encryption Algorithm A5/6 Not Available"},
                                      {1, "Encryption Algorithm A5/6 Available"}};
inline constexpr ValueName kA5_7[] = {{0, "Encryption Algorithm A5/7 Not Available"},
                                      {1, "Encryption Algorithm A5/7 Available"}};
inline constexpr ValueName kEsInd[] = {
    {0, "Controlled Early Classmark Sending Option Is Not Implemented"},
    {1, "Controlled Early Classmark Sending Option Is Implemented"}};
inline constexpr ValueName kPs[] = {{0, "PS Capability Not Present"}, {1, "PS Capability Present"}};
inline constexpr ValueName kVgcs[] = {{0, "No VGCS Capability Or No Notifications Wanted"},
                                      {1, "VGCS Capability And Notifications Wanted"}};
inline constexpr ValueName kVbs[] = {{0, "No VBS Capability Or No Notifications Wanted"},
                                     {1, "VBS Capability And Notifications Wanted"}};
inline constexpr ValueName kImplemented[] = {{0, "Not Implemented"}, {1, "Implemented"}};
inline constexpr ValueName kTimeslots[] = {
    {0, "1/4 Timeslot(~144 Microseconds)"},   {1, "2/4 Timeslot(~288 Microseconds)"},
    {2, "3/4 Timeslot(~433 Microseconds)"},   {3, "4/4 Timeslot(~577 Microseconds)"},
    {4, "5/4 Timeslot(~721 Microseconds)"},   {5, "6/4 Timeslot(~865 Microseconds)"},
    {6, "7/4 Timeslot(~1009 Microseconds)"},  {7, "8/4 Timeslot(~1154 Microseconds)"},
    {8, "9/4 Timeslot(~1298 Microseconds)"},  {9, "10/4 Timeslot(~1442 Microseconds)"},
    {10, "11/4 Timeslot(~1586 Microseconds)"}, {11, "12/4 Timeslot(~1730 Microseconds)"},
    {12, "13/4 Timeslot(~1874 Microseconds)"}, {13, "14/4 Timeslot(~2019 Microseconds)"},
    {14, "15/4 Timeslot(~2163 Microseconds)"}, {15, "16/4 Timeslot(~2307 Microseconds)"}};

// The field families of the body.  Their texts are the label and "=" with
// no indentation; a family's display id is that of its first field in the
// catalogue.
constexpr FieldDef accessCapabilities(uint32_t id) { return unsignedField(id, "Access Capabilities", 4); }
constexpr FieldDef accessTechnologyType(uint32_t id) {
    return enumField(id, "Access Technology Type", kAccessTechnologyType, 4).otherwise("Reserved");
}
constexpr FieldDef capabilitiesLength(uint32_t id) { return unsignedField(id, "Length", 7); }
constexpr FieldDef rfPowerCapability(uint32_t id) { return unsignedField(id, "RF Power Capability", 3); }
constexpr FieldDef selector(uint32_t id) { return enumField(id, "Selector", kSelector, 1); }
constexpr FieldDef a5_1(uint32_t id) { return enumField(id, "A5/1", kA5_1, 1); }
constexpr FieldDef a5_2(uint32_t id) { return enumField(id, "A5/2", kA5_2, 1); }
constexpr FieldDef a5_3(uint32_t id) { return enumField(id, "A5/3", kA5_3, 1); }
constexpr FieldDef a5_4(uint32_t id) { return enumField(id, "A5/4", kA5_4, 1); }
constexpr FieldDef a5_5(uint32_t id) { return enumField(id, "A5/5", kA5_5, 1); }
constexpr FieldDef a5_6(uint32_t id) { return enumField(id, "A5/6", kA5_6, 1); }
constexpr FieldDef a5_7(uint32_t id) { return enumField(id, "A5/7", kA5_7, 1); }
constexpr FieldDef esInd(uint32_t id) { return enumField(id, "ES IND", kEsInd, 1); }
constexpr FieldDef ps(uint32_t id) { return enumField(id, "PS", kPs, 1); }
constexpr FieldDef vgcs(uint32_t id) { return enumField(id, "VGCS", kVgcs, 1); }
constexpr FieldDef vbs(uint32_t id) { return enumField(id, "VBS", kVbs, 1); }
constexpr FieldDef hscsdClass(uint32_t id) { return unsignedField(id, "HSCSD Multi Slot Class", 5); }
constexpr FieldDef gprsClass(uint32_t id) { return unsignedField(id, "GPRS Multi Slot Class", 5); }
constexpr FieldDef gprsDynamicAllocation(uint32_t id) {
    return enumField(id, "GPRS Extended Dynamic Allocation Capability", kImplemented, 1);
}
constexpr FieldDef smsValue(uint32_t id) { return enumField(id, "SMS_VALUE", kTimeslots, 4); }
constexpr FieldDef smValue(uint32_t id) { return enumField(id, "SM_VALUE", kTimeslots, 4); }
// As many bits as the structure leaves; shown as a number.
constexpr FieldDef spare(uint32_t id) { return unsignedField(id, "Spare", 0); }

} // namespace camel::names::mscap

namespace camel {
namespace mscap = names::mscap;
} // namespace camel
