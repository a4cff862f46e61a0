// Mobile identities and time (CUG index, IMSI, subscriber state, called
// party BCD number, time and time zone), the mobile members of the Initial
// DP argument extension, the announcement flags, the collected-information
// request and the timers.  Location information is in location.cpp.
#include "cap/mobile.h"
#include "cap/rows.h"
#include "cap/units.h"

namespace camel {

namespace {

// IMSI digits, low half of each octet first.  Eight octets hold fifteen
// digits and a filler half-octet; any other length holds two digits an
// octet.
template <Pass P>
int imsiDigits(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    const uint32_t octets = g_scratch<P>.lengthValue;
    if (octets != 8) {
        const uint32_t digits = octets > 0x7FFFFFFFu ? 0xFFFFFFFFu : 2 * octets;
        return bcdDigitsField<P>(st, ctx, rq, fx(2029), digits);
    }
    return bcdDigitsField<P>(st, ctx, rq, fx(2025), 15) &&
           fittedBitsField<P>(st, ctx, rq, fx(2026), 0, 4, 4);
}

// Numbering plan (bits 4-1), type of number (bits 7-5), up to 24 digits.
template <Pass P>
int calledPartyBcdNumber(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return fittedBitsField<P>(st, ctx, rq, fx(2139), 0, 4, 0) &&
           fittedBitsField<P>(st, ctx, rq, fx(2140), 4, 3, 8) &&
           bcdDigitsField<P>(st, ctx, rq, fx(2141), 24);
}

// Year, month, day, hour, minute and second as swapped half-octets read as
// hexadecimal digits (so 0x02 0x50 shows as 2005), then the time zone's
// sign bit and its value.
template <Pass P>
int timeAndTimezone(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return fixedBcd<P>(st, ctx, rq, fx(2233), 4) && fixedBcd<P>(st, ctx, rq, fx(2234), 2) &&
           fixedBcd<P>(st, ctx, rq, fx(2235), 2) && fixedBcd<P>(st, ctx, rq, fx(2236), 2) &&
           fixedBcd<P>(st, ctx, rq, fx(2237), 2) && fixedBcd<P>(st, ctx, rq, fx(2238), 2) &&
           fittedBitsField<P>(st, ctx, rq, fx(2239), 7, 1, 0) &&
           fittedBitsField<P>(st, ctx, rq, fx(2240), 0, 7, 8);
}

constexpr Member kCugIndex = body("CUG Index", 1192, integer(1193, 2));
constexpr Member kImsi = body("IMSI", 2020, CAMEL_UNIT(imsiDigits));
constexpr Member kCalledPartyBcdNumber =
    body("Called Party Bcd Number", 2138, CAMEL_UNIT(calledPartyBcdNumber));
constexpr Member kTimeAndTimezone = body("Timeand Timezone", 2232, CAMEL_UNIT(timeAndTimezone));

// ---- Subscriber State: the alternative whose identifier comes first ----------------------

constexpr Member kSubscriberState[] = {
    el(0x80, "Assumed Idle", 2116, 2117, none()),
    el(0x81, "Camel Busy", 2118, 2119, none()),
    el(0x0A, "Net Det Not Reachable", 2120, 2121, octet(2122)),
    el(0x82, "Not Provided From VLR", 2123, 2124, none()),
};
constexpr MemberTable kSubscriberStateChoice = members(Walk::FirstMatch, kSubscriberState);

// ---- Initial DP Arg Extension -----------------------------------------------------------

constexpr Member kInitialDpArgExtension[] = {
    el(0x80, "ISDN Address String", 2149, 0, CAMEL_UNIT(decodeIsdnAddressString)),
    el(0x81, "Called Party Number", 1614, 0, CAMEL_UNIT(decodeCalledPartyNumber)),
    octetString(0x82, "MS_Classmark2", 4216),
    octetString(0x83, "IMEI", 4219),
    octetString(0x84, "Supported Camel Phases", 4190),
    octetString(0x85, "Offered Camel4 Functionalities", 4193),
    el(0xA6, "Bearer Capability", 1698, 0, CAMEL_UNIT(decodeBearerCapability)),
    octetString(0xA7, "Ext_BasicServiceCode", 4222),
    octetString(0xA8, "High Layer Compatibility", 4229),
    octetString(0x89, "Low Layer Compatibility", 4226),
    octetString(0x8A, "Low Layer Compatibility", 4226),
};

// ---- Announcement flags and timers -----------------------------------------------------------

constexpr Member kDisconnectFromIpForbidden =
    body("Disconnect From IP Forbidden", 1834, octet(1835));
constexpr Member kRequestAnnounceComplete = body("Request Announce Complete", 1838, octet(1839));
constexpr Member kRequestAnnouncementStartedNotification =
    body("requestAnnouncementStartedNotification", 4236, octet(4237));
constexpr Member kTimerId = body("Timer Id", 2305, octet(2306));
constexpr Member kTimerValue = body("Timer Value", 1375, integer(1376, 4));

// ---- Collect Info: a choice whose only alternative is the collected digits ------------------

constexpr Member kCollectedDigits[] = {
    el(0x80, "Minimum Number Of Digits", 1861, 1862, octet(1863)),
    el(0x81, "Maximum Number Of Digits", 1864, 1865, octet(1866)),
    el(0x82, "End Of Reply Digit", 1867, 1868, integer(1869, 2)),
    el(0x83, "Cancel Digit", 1870, 1871, integer(1872, 2)),
    el(0x84, "Start Digit", 1873, 1874, integer(1875, 2)),
    el(0x85, "First Digit Time Out", 1876, 1877, octet(1878)),
    el(0x86, "Inter Digit Time Out", 1879, 1880, octet(1881)),
    el(0x87, "Error Treatment", 1882, 1883, octet(1884)),
    el(0x88, "Interruptable Ann Ind", 1885, 1886, octet(1887)),
    el(0x89, "Voice Information", 1889, 1890, octet(1891)),
    el(0x8A, "Voice Back", 1893, 1894, octet(1895)),
};
constexpr MemberTable kCollectedDigitsMembers = members(Walk::InOrder, kCollectedDigits);
constexpr Member kCollectedInfo[] = {
    alt(0xA0, "Collected Digits", 1848, table(kCollectedDigitsMembers))};
constexpr MemberTable kCollectedInfoChoice = members(Walk::Choice, kCollectedInfo, 1843);
constexpr Member kCollectInfo = body("Collect Info", 1842, table(kCollectedInfoChoice));

} // namespace

CAMEL_BODY_UNIT(decodeCugIndex, kCugIndex);
CAMEL_BODY_UNIT(decodeImsi, kImsi);
CAMEL_BODY_UNIT(decodeCalledPartyBcdNumber, kCalledPartyBcdNumber);
CAMEL_BODY_UNIT(decodeTimeAndTimezone, kTimeAndTimezone);
CAMEL_BODY_UNIT(decodeDisconnectFromIpForbidden, kDisconnectFromIpForbidden);
CAMEL_BODY_UNIT(decodeRequestAnnounceComplete, kRequestAnnounceComplete);
CAMEL_BODY_UNIT(decodeRequestAnnouncementStartedNotification,
                kRequestAnnouncementStartedNotification);
CAMEL_BODY_UNIT(decodeTimerId, kTimerId);
CAMEL_BODY_UNIT(decodeTimerValue, kTimerValue);
CAMEL_BODY_UNIT(decodeCollectInfo, kCollectInfo);

// Units called right after their element's length field.
CAMEL_TABLE_UNIT(decodeSubscriberState, kSubscriberStateChoice);

constexpr MemberTable kInitialDpArgExtensionTable = members(Walk::Loop, kInitialDpArgExtension);

} // namespace camel
