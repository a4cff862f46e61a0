// Rows and table shapes that several argument files share: the elements
// that many arguments carry under identifiers of their own, and the outer
// element of an argument.
#pragma once

#include <cstddef>
#include <cstdint>

#include "cap/units.h"
#include "engine/members.h"

namespace camel {

// Extensions under the identifier each argument gives them.
consteval Member extensions(uint32_t tag) {
    return el(tag, "Extensions", 1481, 0, CAMEL_UNIT(decodeExtensions));
}
consteval Member callSegmentId(uint32_t tag, uint32_t tagId = 4178) {
    return el(tag, "Call Segment ID", tagId, 0, CAMEL_UNIT(decodeCallSegmentId));
}
consteval Member legId(uint32_t tag) { return el(tag, "Leg Id", 1541, 0, CAMEL_UNIT(decodeLegId)); }
consteval Member cause(uint32_t tag) { return el(tag, "Cause", 1474, 0, CAMEL_UNIT(decodeCause)); }
consteval Member receivingSideId(uint32_t tag) {
    return el(tag, "Receiving Side ID", 1545, 0, CAMEL_UNIT(decodeReceivingSideId));
}
consteval Member sendingSideId(uint32_t tag) {
    return el(tag, "Sending Side Id", 1549, 0, CAMEL_UNIT(decodeSendingSideId));
}

consteval Member serviceKey(uint32_t tag) {
    return el(tag, "Service Key", 1609, 0, CAMEL_UNIT(decodeServiceKey));
}
consteval Member imsi(uint32_t tag, uint32_t tagId) {
    return el(tag, "IMSI", tagId, 0, CAMEL_UNIT(decodeImsi));
}
consteval Member locationInformation(uint32_t tag, uint32_t tagId) {
    return el(tag, "Location Information", tagId, 0, CAMEL_UNIT(decodeLocationInformation));
}
consteval Member timeAndTimezone(uint32_t tag, uint32_t tagId) {
    return el(tag, "Timeand Timezone", tagId, 0, CAMEL_UNIT(decodeTimeAndTimezone));
}
// An ISDN address string under the tag field each argument gives it.
consteval Member isdnAddressString(uint32_t tag, uint32_t tagId = 2159) {
    return el(tag, "ISDN Address String", tagId, 0, CAMEL_UNIT(decodeIsdnAddressString));
}
consteval Member calledPartyBcdNumber(uint32_t tag, uint32_t tagId) {
    return el(tag, "Called Party Bcd Number", tagId, 0, CAMEL_UNIT(decodeCalledPartyBcdNumber));
}
consteval Member callReferenceNumber(uint32_t tag, uint32_t tagId, uint32_t lengthId = 4176,
                                     uint32_t valueId = 4177) {
    return el(tag, "Call Reference Number", tagId, lengthId, halfOctets(valueId, 8));
}
consteval Member miscCallInfo(uint32_t tag) {
    return el(tag, "Misc Call Info", 1602, 0, CAMEL_UNIT(decodeMiscCallInfo));
}
consteval Member monitorMode(uint32_t tag) {
    return el(tag, "Monitor Mode", 1907, 1908, octet(1909));
}
consteval Member timerId(uint32_t tag) {
    return el(tag, "Timer Id", 2304, 0, CAMEL_UNIT(decodeTimerId));
}
consteval Member timerValue(uint32_t tag) {
    return el(tag, "Timer Value", 1374, 0, CAMEL_UNIT(decodeTimerValue));
}
consteval Member freeFormatData(uint32_t tag) {
    return el(tag, "Free Format Data", 2186, 2187, halfOctets(2188, 52));
}
consteval Member appendFreeFormatData(uint32_t tag) {
    return el(tag, "Append freee FORMAT data", 2189, 2190, CAMEL_UNIT(decodeAppendFreeFormatData));
}
// An octet string member whose tag, length and value fields have
// consecutive ids; its value takes all content octets.
consteval Member octetString(uint32_t tag, const char *name, uint32_t tagId) {
    return el(tag, name, tagId, tagId + 1, halfOctets(tagId + 2, 255));
}

// The outer SEQUENCE of an argument, a mandatory element walked as an
// element loop.
consteval Member sequence(const char *name, uint32_t tagId, uint32_t lengthId,
                          const MemberTable &loop) {
    return el(0x30, name, tagId, lengthId, table(loop));
}

// An argument with an outer element: that element is mandatory.
template <size_t N>
consteval MemberTable argument(const Member (&outer)[N]) {
    return members(Walk::Mandatory, outer);
}

} // namespace camel
