// Value names of Return Result (Last) and Return Error contents.
#pragma once

#include "fields/field_def.h"

namespace camel::names {

inline constexpr ValueName kResultOperation[] = {
    {55, "Activity Test"},
    {70, "GPRS Activity Test"},
    {72, "GPRS Apply Charging Report"},
    {76, "GPRS Entityrelease"},
    {80, "GPRS Event Report"},
    {48, "Prompt And Collect User Info."},
    {32, "Initiate Call Attempt"},
};

inline constexpr ValueName kReceivedInformation[] = {{0x80, "Digits Response Tag"}};

inline constexpr ValueName kErrorCodeTag[] = {{0x02, "Local Error Code"},
                                              {0x06, "Global Error Code"}};

inline constexpr ValueName kErrorCode[] = {
    {0, "Cancelled"},
    {1, "Cancel Failed"},
    {3, "Etc Failed"},
    {4, "Improper Caller Response"},
    {6, "Missing Customer Record"},
    {7, "Missing Parameter"},
    {8, "Parameter Out Of Range"},
    {10, "Requested Info"},
    {11, "Systemfailure"},
    {12, "Taskrefused"},
    {13, "Unavailable Resource"},
    {14, "Unexpected Component Sequence"},
    {15, "Unexpected Data Value"},
    {16, "Unexpected Parameter"},
    {17, "Unknown Leg Id"},
    {50, "Unknown PDP ID"},
    {51, "Unknown CSID"},
};

inline constexpr ValueName kCancelProblem[] = {
    {0, "Unknown Operation"}, {1, "Too Late"}, {2, "Operation Not Cancellable"}};

inline constexpr ValueName kRequestedInfoError[] = {{1, "Unknown Requested Info"},
                                                    {2, "Requested Info Not Available"}};

inline constexpr ValueName kUnavailableNetworkResource[] = {
    {0, "Unavailableresources"},
    {1, "Component Failure"},
    {2, "Basic Call Processingexception"},
    {3, "Resource Status Failure"},
    {4, "End User Failure"},
};

inline constexpr ValueName kTaskRefused[] = {{0, "Generic"}, {1, "Unobtainable"}, {2, "Congestion"}};

} // namespace camel::names
