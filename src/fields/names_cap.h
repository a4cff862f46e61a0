// Value names of the CAMEL operation level.
#pragma once

#include "fields/field_def.h"

namespace camel::names {

// Operation codes in the order the dispatcher compares them.
inline constexpr ValueName kOperation[] = {
    {55, "Activity Test"},
    {35, "Apply Charging"},
    {36, "Apply Charging Report"},
    {16, "Assist Request Instructions"},
    {41, "Call Gap"},
    {44, "Call Information Report"},
    {45, "Call Informationrequest"},
    {53, "Cancel"},
    {20, "Connect"},
    {19, "Connect TO Resource"},
    {31, "Continue"},
    {56, "Continue With Argument"},
    {18, "Disconnect Forward Connection"},
    {17, "Establish Temporary Connection"},
    {24, "Event Report BCSM"},
    {34, "Furnish Charging Info"},
    {0, "Initial DP"},
    {47, "Play Announcement"},
    {48, "Prompt And Collect User Info."},
    {22, "Release Call"},
    {23, "Request Report BCSM Event"},
    {33, "Reset Timer"},
    {46, "Send Charging Information"},
    {49, "Specialized Resource Report"},
    {62, "SMSconnect"},
    {65, "SMS Continue"},
    {64, "Event Report SMS"},
    {61, "SMS Furnish Charging Info"},
    {60, "SMS Initial DP"},
    {66, "SMS Release"},
    {63, "SMS Request Report Event"},
    {67, "SMS Reset Timer"},
    {70, "GPRS Activity Test"},
    {71, "GPRS Apply Charging"},
    {72, "GPRS Apply Charging Report"},
    {73, "GPRS Cancel"},
    {74, "GPRS Connect"},
    {75, "GPRS Continue"},
    {76, "GPRS Entity Released"},
    {80, "Event Report GPRS"},
    {77, "Furnish Charging Info GPRS"},
    {78, "GPRS Initial DP"},
    {79, "GPRS Release"},
    {81, "Request Report GPRS Event"},
    {82, "GPRS Reset Timer"},
    {83, "GPRS Send Charging Information"},
    {86, "DFC With Argument"},
    {32, "Initiate Call Attempt"},
    {88, "Continue With Argument"},
    {90, "Disconnect Leg"},
    {93, "Move Leg"},
    {95, "Split Leg"},
    {96, "Entity Released"},
    {97, "Play Tone"},
};

} // namespace camel::names

namespace camel::names {

// Cancel: the alternative's identifier.
inline constexpr ValueName kCancelChoice[] = {
    {0x80, "Invoke Tag"}, {0x81, "All RequestsTAG"}, {0xA2, "Call Segment To Cancel"}};
inline constexpr ValueName kCancelChoiceShown[] = {{0x80, "Invoke Id"}, {0x81, "All Requests"}};

// Connect to Resource: the resource address alternative.
inline constexpr ValueName kResourceAddress[] = {{0x80, "IP Routing Address Tag"},
                                                 {0x83, "None (null Tag)"}};
inline constexpr ValueName kResourceAddressShown[] = {{0x80, "IP Routingaddress"}, {0x83, "None"}};

// Entity Released: the alternative's identifier.
inline constexpr ValueName kEntityReleasedType[] = {{0xA0, "callSegmentFailure"},
                                                    {0xA1, "bCSM_Failure"}};

} // namespace camel::names
