// The "Gprsms Class" element of SMS Initial DP and GPRS Initial DP: the MS
// network capability and, when it follows, the MS radio access capability.
#pragma once

#include <cstdint>

#include "cap/units.h"
#include "engine/members.h"

namespace camel {

// The network capability bits, after their length field.
CAMEL_DECLARE_UNIT(decodeMsNetworkCapability);
// The radio access capability body (its records), after its length field.
CAMEL_DECLARE_UNIT(decodeMsRadioAccessCapability);

inline constexpr Member kGprsmsClassRows[] = {
    el(0x80, "MS Network Capability", 2533, 2534, CAMEL_UNIT(decodeMsNetworkCapability)),
    el(0x81, "MS Radio Access Capability", 2550, 2551, CAMEL_UNIT(decodeMsRadioAccessCapability)),
};
inline constexpr MemberTable kGprsmsClass = members(Walk::InOrder, kGprsmsClassRows);

// The element under the identifier each argument gives it (B2 in SMS
// Initial DP, A5 in GPRS Initial DP).
consteval Member gprsmsClass(uint32_t tag) {
    return el(tag, "Gprsms Class", 2528, 2529, table(kGprsmsClass));
}

} // namespace camel
