// The member tables of the charging, call gap and information-to-send
// types (cap/charging.cpp, cap/information_to_send.cpp) and the arguments
// of the operations that carry them (cap/arguments_charging.cpp).
#pragma once

#include "engine/members.h"

namespace camel {

// ---- Types --------------------------------------------------------------------------
// Contents of Apply Charging's billing characteristics (the OCTET STRING's
// CHOICE): the time duration charging element.
extern const MemberTable kAChBillingChargingCharacteristicsTable;
// Time Information: a choice field, then the alternative from its length.
extern const MemberTable kTimeInformationTable;
// Gap Criteria: a choice field, then the alternative from its length.
extern const MemberTable kGapCriteriaTable;
// Gap Indicators: duration and gap interval.
extern const MemberTable kGapIndicatorsTable;
// Gap Treatment: a choice field, then Information To Send or a cause.
extern const MemberTable kGapTreatmentTable;
// Information To Send: a choice field, then inband info or tone.
extern const MemberTable kInformationToSendTable;
// Burst: the members of a tone burst.
extern const MemberTable kBurstTable;
consteval Member burst(uint32_t tag) { return el(tag, "Burst", 4244, 4245, table(kBurstTable)); }
// Send Charging Information's billing characteristics: a choice field,
// then the advice-of-charge alternative.
extern const MemberTable kSciBillingChargingTable;
// Advice of charge before answer (and of GPRS): CAI GSM0224 and the
// optional AOC Subsequent.
extern const MemberTable kAocBeforeAnswerMembers;

// ---- Arguments, in the dispatcher's order ----------------------------------------------
extern const MemberTable kApplyChargingTable;                    // 35
extern const MemberTable kApplyChargingReportTable;              // 36
extern const MemberTable kCallGapTable;                          // 41
extern const MemberTable kFurnishChargingInformationTable;       // 34
extern const MemberTable kPlayAnnouncementTable;                 // 47
extern const MemberTable kPromptAndCollectUserInformationTable;  // 48
extern const MemberTable kSendChargingInformationTable;          // 46
extern const MemberTable kSpecializedResourceReportTable;        // 49
extern const MemberTable kPlayToneTable;                         // 97

} // namespace camel
