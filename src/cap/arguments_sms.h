// The arguments of the SMS operations (cap/arguments_sms.cpp), in the
// dispatcher's order.  SMS Continue (65) carries none.
#pragma once

#include "engine/members.h"

namespace camel {

extern const MemberTable kConnectSmsTable;              // 62
extern const MemberTable kEventReportSmsTable;          // 64
extern const MemberTable kFurnishChargingInformationSmsTable; // 61
extern const MemberTable kInitialDpSmsTable;            // 60
extern const MemberTable kReleaseSmsTable;              // 66
extern const MemberTable kRequestReportSmsEventTable;   // 63
extern const MemberTable kResetTimerSmsTable;           // 67

} // namespace camel
