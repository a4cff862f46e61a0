// The SMS operations' arguments as member tables (see cap/arguments.cpp for
// the call-control ones), and the TP fields of the short message that SMS
// Initial DP carries: octets of bit fields whose layout some of their own
// bits choose.
#include "cap/arguments_sms.h"

#include "cap/bit_fields.h"
#include "cap/gprs.h"
#include "cap/mobile.h"
#include "cap/ms_capability.h"
#include "cap/rows.h"
#include "cap/units.h"

namespace camel {

namespace {

// ---- TP Short Message Submission Info: the first octet of the TPDU -------------------------

// Reply path bit 8, user data header indicator bit 7, status report
// request bit 6, validity period format bits 5-4, reject duplicates bit 3,
// message type indicator bits 2-1 (the SMS-SUBMIT first octet).
constexpr BitField kSubmissionInfo[] = {
    {fx(2243), 7, 1}, {fx(2244), 6, 1}, {fx(2245), 5, 1},
    {fx(2246), 3, 2}, {fx(2247), 2, 1}, {fx(2248), 0, 2},
};

template <Pass P>
int submissionInfo(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return octetFields<P>(st, ctx, rq, kSubmissionInfo);
}

// ---- TP Protocol Identifier: bits 8-7 choose the meaning of bits 6-1 ------------------------

constexpr BitField kPidUse[] = {{fx(2251), 6, 2}};
constexpr BitField kTelematic[] = {{fx(2253), 0, 5}, {fx(2254), 5, 1}};
constexpr BitField kShortMessageType[] = {{fx(2255), 0, 6}};
constexpr BitField kPidOther[] = {{fx(2252), 0, 6}};

template <Pass P>
int protocolIdentifier(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    uint32_t use = 0;
    if (!bitFields<P>(st, ctx, rq, kPidUse, false, &use))
        return 0;
    if (ctx->present == 0)
        return 1;
    switch (use) {
    case 0:
        return octetFields<P>(st, ctx, rq, kTelematic);
    case 1:
        return octetFields<P>(st, ctx, rq, kShortMessageType);
    default:
        return octetFields<P>(st, ctx, rq, kPidOther);
    }
}

// ---- TP Data Coding Scheme: the coding group (bits 8-5) chooses the rest ----------------------

constexpr BitField kCodingGroup[] = {{fx(2274), 4, 4}};
// General data coding (groups 0-3) and automatic deletion (4-7): compressed
// bit 6, class meaning bit 5, alphabet bits 4-3, message class bits 2-1.
constexpr BitField kGeneralCoding[] = {
    {fx(2279), 5, 1}, {fx(2276), 4, 1}, {fx(2278), 2, 2}, {fx(2280), 0, 2}};
constexpr BitField kAutomaticDeletion[] = {
    {fx(2282), 5, 1}, {fx(2276), 4, 1}, {fx(2281), 2, 2}, {fx(2280), 0, 2}};
// Message waiting (groups 12-14): indication sense bit 4, type bits 2-1.
constexpr BitField kMessageWaiting[] = {{fx(2284), 3, 1}, {fx(2283), 0, 2}};
// Data coding and message class (group 15): coding bit 3, class bits 2-1.
constexpr BitField kDataCodingClass[] = {{fx(2286), 2, 1}, {fx(2285), 0, 2}};

// The reserved groups (8-11) carry nothing more: their coding group
// consumes the octet.
template <Pass P>
int dataCodingScheme(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    const uint32_t next = ctx->present != 0 && room(st, 8) ? peekOctet(st) >> 4 : 0;
    if (next >= 8 && next <= 11)
        return octetFields<P>(st, ctx, rq, kCodingGroup);
    uint32_t group = 0;
    if (!bitFields<P>(st, ctx, rq, kCodingGroup, false, &group))
        return 0;
    if (ctx->present == 0)
        return 1;
    if (group < 4)
        return octetFields<P>(st, ctx, rq, kGeneralCoding);
    if (group < 8)
        return octetFields<P>(st, ctx, rq, kAutomaticDeletion);
    if (group < 15)
        return octetFields<P>(st, ctx, rq, kMessageWaiting);
    return octetFields<P>(st, ctx, rq, kDataCodingClass);
}

// ---- TP Validity Period: its form follows from its length ---------------------------------

// The time zone of an absolute validity period: quarters of an hour as two
// BCD digits, the tens in bits 3-1 (bit 4 is the sign), the units in bits
// 8-5; shown as the two digits.
template <Pass P>
int validityTimeZone(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    needBits(st, ctx, 8);
    if (ctx->present == 0)
        return 1;
    beginField(st, fx(2270));
    if (!ensureSpans(st, 1))
        return 0;
    const uint32_t tens = setSpan(st, 0, 0, 2);
    const uint32_t units = setSpan(st, 1, 4, 7);
    st->field.value = tens * 16 + units;
    return finishField<P>(st, rq, fx(2270), 8);
}

// Year to second as swapped BCD digits (0x21 shows as 12), then the time
// zone's sign (bit 4, read in place) and quarters.
template <Pass P>
int absoluteValidity(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    constexpr FieldIndex kParts[] = {fx(2263), fx(2264), fx(2265), fx(2266), fx(2267), fx(2268)};
    for (FieldIndex f : kParts)
        if (!fixedBcd<P>(st, ctx, rq, f, 2))
            return 0;
    return fittedBitsField<P>(st, ctx, rq, fx(2269), 3, 1, 0) &&
           validityTimeZone<P>(st, ctx, rq);
}

// The length octet is shown twice: in place, then as the length.  One octet
// is a relative period, seven an absolute one (an enhanced period, also
// seven octets, is shown as absolute); any other length is left over.
template <Pass P>
int validityPeriod(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (!fittedBitsField<P>(st, ctx, rq, fx(2257), 0, 8, 0) ||
        !lengthField<P>(st, ctx, rq, fx(2258)))
        return 0;
    const uint32_t length = g_scratch<P>.lengthValue;
    if (ctx->present == 0 || (length != 1 && length != 7))
        return 1;
    if (!elementStart(st, length == 1 ? "Relative FORMAT validity period"
                                      : "Absolute Validity Period"))
        return 0;
    if (!(length == 1 ? octetField<P>(st, ctx, rq, fx(2271)) : absoluteValidity<P>(st, ctx, rq)))
        return 0;
    return elementEnd<P>(st, rq);
}

// ---- RP causes: the cause value is bits 7-1, bit 8 the extension bit --------------------------

template <Pass P>
int rpCause(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return fittedBitsField<P>(st, ctx, rq, fx(2290), 0, 7, 8);
}
template <Pass P>
int mtSmsCause(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return fittedBitsField<P>(st, ctx, rq, fx(4315), 0, 7, 8);
}

// ---- Rows shared by the SMS arguments -------------------------------------------------------

consteval Member eventTypeSms(uint32_t tag) {
    return el(tag, "Event Type SMS", 2167, 2168, octet(2169));
}
consteval Member destinationSubscriberNumber() { return calledPartyBcdNumber(0x81, 2136); }
consteval Member smsMscAddress(uint32_t tag) { return isdnAddressString(tag, 2154); }

// ---- SMS Connect (62) -------------------------------------------------------------------------

constexpr Member kConnectSms[] = {
    isdnAddressString(0x80, 2158),
    destinationSubscriberNumber(),
    smsMscAddress(0x82),
    extensions(0xAA),
};
constexpr MemberTable kConnectSmsLoop = members(Walk::Loop, kConnectSms);
constexpr Member kConnectSmsArg[] = {sequence("SMS Connect", 2142, 2143, kConnectSmsLoop)};

// ---- Event Report SMS (64) ----------------------------------------------------------------------

// The failure alternatives carry a cause: a mobile-originated one, or a
// mobile-terminated one that is an RP cause.
constexpr Member kOSmsFailure[] = {el(0x80, "Failure Cause", 2177, 2178, octet(2179))};
constexpr MemberTable kOSmsFailureMembers = members(Walk::InOrder, kOSmsFailure);
constexpr Member kTSmsFailure[] = {el(0x80, "MT SMS Cause", 4313, 4314, CAMEL_UNIT(mtSmsCause))};
constexpr MemberTable kTSmsFailureMembers = members(Walk::InOrder, kTSmsFailure);
constexpr Member kEventSpecificInfoSms[] = {
    alt(0xA0, "O. SMS Failure Specific Info", 2171, table(kOSmsFailureMembers)),
    alt(0xA1, "O. SMS Submitted Specific Info", 2171, none()),
    alt(0xA2, "T. SMS Failure Specific Info", 2171, table(kTSmsFailureMembers)),
    alt(0xA3, "T. SMS Delivery Specific Info", 2171, none()),
};
constexpr MemberTable kEventSpecificInfoSmsChoice =
    members(Walk::Choice, kEventSpecificInfoSms, 2172);

constexpr Member kEventReportSms[] = {
    eventTypeSms(0x80),
    el(0xA1, "Event Specific Info SMS", 2170, 2171, table(kEventSpecificInfoSmsChoice)),
    miscCallInfo(0xA2),
    extensions(0xAA),
};
constexpr MemberTable kEventReportSmsLoop = members(Walk::Loop, kEventReportSms);
constexpr Member kEventReportSmsArg[] = {
    sequence("Event Report SMS", 2161, 2162, kEventReportSmsLoop)};

// ---- SMS Furnish Charging Information (61): an OCTET STRING holding the billing data ----------

constexpr Member kFciSmsBillingCharging[] = {freeFormatData(0x80), appendFreeFormatData(0x81)};
constexpr MemberTable kFciSmsBillingChargingLoop = members(Walk::Loop, kFciSmsBillingCharging);
constexpr Member kFciSmsBillingChargingCharacteristics[] = {
    el(0xA0, "Camel Fci SMS Bill Cha Char", 2182, 2183, table(kFciSmsBillingChargingLoop))};
constexpr MemberTable kFciSmsBillingChargingCharacteristicsLoop =
    members(Walk::Loop, kFciSmsBillingChargingCharacteristics);
constexpr Member kFurnishChargingInformationSmsArg[] = {
    el(0x04, "SMS Furnish Charging Information", 2180, 2181,
       table(kFciSmsBillingChargingCharacteristicsLoop))};

// ---- SMS Initial DP (60) --------------------------------------------------------------------------

constexpr Member kInitialDpSms[] = {
    serviceKey(0x80),
    destinationSubscriberNumber(),
    isdnAddressString(0x82, 2150),
    eventTypeSms(0x83),
    imsi(0x84, 2019),
    locationInformation(0xA5, 2030),
    locationInformationGprs(0xA6),
    isdnAddressString(0x87, 2152),
    timeAndTimezone(0x88, 2231),
    el(0x89, "TP Short Messagesubscriber Info", 2241, 2242, CAMEL_UNIT(submissionInfo)),
    el(0x8A, "TP Protocol Identifier", 2249, 2250, CAMEL_UNIT(protocolIdentifier)),
    el(0x8B, "TP Data Coding Scheme ", 2272, 2273, CAMEL_UNIT(dataCodingScheme)),
    el(0x8C, "TP Validity Period", 2256, 0, CAMEL_UNIT(validityPeriod)),
    extensions(0xAD),
    callReferenceNumber(0x8E, 4174),
    isdnAddressString(0x8F, 2155),
    isdnAddressString(0x90, 2156),
    octetString(0x91, "MS_Classmark2", 4216),
    gprsmsClass(0xB2),
    octetString(0x93, "IMEI", 4219),
    isdnAddressString(0x94, 2157),
};
constexpr MemberTable kInitialDpSmsLoop = members(Walk::Loop, kInitialDpSms);
constexpr Member kInitialDpSmsArg[] = {sequence("SMS Initial DP", 2192, 2193, kInitialDpSmsLoop)};

// ---- SMS Release (66): an OCTET STRING holding the RP cause -----------------------------------

constexpr Member kReleaseSmsArg[] = {el(0x04, "RP Cause", 2288, 2289, CAMEL_UNIT(rpCause))};

// ---- SMS Request Report Event (63) ------------------------------------------------------------------

constexpr Member kSmsEvent[] = {eventTypeSms(0x80), monitorMode(0x81)};
constexpr MemberTable kSmsEventMembers = members(Walk::InOrder, kSmsEvent);
constexpr Member kSmsEventItem[] = {el(0x30, "SMS Event", 2298, 2299, table(kSmsEventMembers))};
constexpr MemberTable kSmsEvents = members(Walk::Repeat, kSmsEventItem);
constexpr Member kRequestReportSmsEvent[] = {
    el(0xA0, "SMS Events", 2295, 2296, table(kSmsEvents)),
    extensions(0xAA),
};
constexpr MemberTable kRequestReportSmsEventLoop = members(Walk::Loop, kRequestReportSmsEvent);
constexpr Member kRequestReportSmsEventArg[] = {
    sequence("SMS Request Report Event", 2291, 2292, kRequestReportSmsEventLoop)};

// ---- SMS Reset Timer (67) -----------------------------------------------------------------------------

constexpr Member kResetTimerSms[] = {timerId(0x80), timerValue(0x81), extensions(0xA2)};
constexpr MemberTable kResetTimerSmsLoop = members(Walk::Loop, kResetTimerSms);
constexpr Member kResetTimerSmsArg[] = {
    sequence("SMS Reset Timer", 2301, 2302, kResetTimerSmsLoop)};

} // namespace

constexpr MemberTable kConnectSmsTable = argument(kConnectSmsArg);
constexpr MemberTable kEventReportSmsTable = argument(kEventReportSmsArg);
constexpr MemberTable kFurnishChargingInformationSmsTable =
    argument(kFurnishChargingInformationSmsArg);
constexpr MemberTable kInitialDpSmsTable = argument(kInitialDpSmsArg);
constexpr MemberTable kReleaseSmsTable = argument(kReleaseSmsArg);
constexpr MemberTable kRequestReportSmsEventTable = argument(kRequestReportSmsEventArg);
constexpr MemberTable kResetTimerSmsTable = argument(kResetTimerSmsArg);

} // namespace camel
