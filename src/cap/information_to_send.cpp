// Information To Send, the announcement and tone description of Play
// Announcement, Prompt And Collect User Information and the call gap
// treatment: inband information (message ids, texts, variable messages with
// their variable parts, repetitions, duration, interval) or a tone; and the
// Generic Digits of a variable part and of a collected-digits response.
#include "cap/charging.h"

#include "cap/units.h"

namespace camel {

namespace {

// ---- Fixed octet layouts ---------------------------------------------------------------

// One field over a fixed number of octets, value octet by octet.
struct OctetRun {
    FieldIndex field;
    uint8_t octets;
};

template <Pass P, size_t N>
int octetRuns(DecodeState *st, ElementContext *ctx, Request<P> *rq, const OctetRun (&runs)[N]) {
    for (const OctetRun &r : runs)
        if (!octetsField<P>(st, ctx, rq, r.field, r.octets))
            return 0;
    return 1;
}

// A time variable part: hour and minute, one octet each, shown as stored.
constexpr OctetRun kTime[] = {{fx(1362), 1}, {fx(1363), 1}};
// A date variable part: a two-octet year, then month and day.
constexpr OctetRun kDate[] = {{fx(1366), 2}, {fx(1367), 1}, {fx(1368), 1}};

template <Pass P>
int decodeTimeVariablePart(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return octetRuns<P>(st, ctx, rq, kTime);
}
template <Pass P>
int decodeDateVariablePart(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return octetRuns<P>(st, ctx, rq, kDate);
}

// ---- Generic Digits -----------------------------------------------------------------------

// The two field-id sets of the Generic Digits fields.
struct GenericDigitsIds {
    FieldIndex scheme;
    FieldIndex bcd;
    FieldIndex ia5;
    FieldIndex binary;
};
constexpr GenericDigitsIds kDigitsInGenericContext{fx(3530), fx(3536), fx(3542), fx(3548)};
constexpr GenericDigitsIds kDigitsElsewhere{fx(3533), fx(3539), fx(3545), fx(3551)};
constexpr uint32_t kGenericContextBit = 0x800000;

// A number variable part: the type of digits (bits 1-5, nothing consumed),
// then the Generic Digits.
template <Pass P>
int decodeDigitsVariablePart(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (!fittedBitsField<P>(st, ctx, rq, fx(1649), 0, 5, 0))
        return 0;
    return decodeGenericDigits<P>(st, ctx, rq);
}

// ---- Message ids and variable parts ----------------------------------------------------------

// A SEQUENCE OF the CHOICE of variable parts: the element loop takes each
// part by its identifier, a repeated one again in a later sweep.
constexpr Member kVariableParts[] = {
    el(0x80, "Integer", 1357, 1358, integer(1359, 4)),
    el(0x81, "Digits", 1372, 1373, CAMEL_UNIT(decodeDigitsVariablePart)),
    el(0x82, "Time", 1360, 1361, CAMEL_UNIT(decodeTimeVariablePart)),
    el(0x83, "Date", 1364, 1365, CAMEL_UNIT(decodeDateVariablePart)),
    el(0x84, "Price", 1369, 1370, halfOctets(1371, 4)),
};
constexpr MemberTable kVariablePartsMembers = members(Walk::Loop, kVariableParts);

constexpr Member kVariableMessage[] = {
    el(0x80, "Elementary Message Id", 1333, 1334, integer(1335, 4)),
    el(0xA1, "Variable Parts", 1354, 1355, table(kVariablePartsMembers)),
};
constexpr MemberTable kVariableMessageMembers = members(Walk::Loop, kVariableMessage);

// Message content and attributes: every octet as two hexadecimal digits.
constexpr Member kText[] = {
    el(0x80, "Message Content", 1339, 1340, halfOctets(1341, 255)),
    el(0x81, "Attributes", 1342, 1343, halfOctets(1344, 255)),
};
constexpr MemberTable kTextMembers = members(Walk::Loop, kText);

constexpr Member kElementaryMessageIds[] = {
    el(0x02, "Elementary Id", 1347, 1348, integer(1349, 4)),
};
constexpr MemberTable kElementaryMessageIdsItems = members(Walk::Repeat, kElementaryMessageIds);

constexpr Member kMessageId[] = {
    alt(0x80, "Elementary Message Id", 1334, integer(1335, 4)),
    alt(0xA1, "Text", 1336, table(kTextMembers)),
    alt(0xBD, "Elementary Message Id's", 1345, table(kElementaryMessageIdsItems)),
    alt(0xBE, "Variable Message", 1350, table(kVariableMessageMembers)),
};
constexpr MemberTable kMessageIdChoice = members(Walk::Choice, kMessageId, 1331);

// ---- Inband information and tone ---------------------------------------------------------------

constexpr Member kInbandInfo[] = {
    el(0xA0, "Message Id", 1329, 1330, table(kMessageIdChoice)),
    el(0x81, "Number Of Repetitions", 1320, 1321, octet(1322)),
    el(0x82, "Duration", 1323, 1324, integer(1325, 4)),
    el(0x83, "Interval", 1326, 1327, integer(1328, 4)),
};
constexpr MemberTable kInbandInfoMembers = members(Walk::Loop, kInbandInfo);

constexpr Member kTone[] = {
    el(0x80, "Tone Id", 1309, 1310, integer(1311, 4)),
    el(0x81, "Tone Duration", 1312, 1313, integer(1314, 4)),
};
constexpr MemberTable kToneMembers = members(Walk::Loop, kTone);

constexpr Member kInformationToSend[] = {
    alt(0xA0, "Inband Info", 1315, table(kInbandInfoMembers)),
    alt(0xA1, "Tone", 1306, table(kToneMembers)),
};

} // namespace

constexpr MemberTable kInformationToSendTable = members(Walk::Choice, kInformationToSend, 1304);

// Encoding scheme (bits 6-8 of the octet whose bits 1-5 the type of digits
// has shown), then the digits: BCD digits low half first, or binary-coded
// octets as hexadecimal digits, as many as the element holds, or IA5
// characters (at most 20).  The spare schemes are not shown: their octets
// stay in the element's window.
template <Pass P>
int decodeGenericDigits(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    const GenericDigitsIds &ids = (g_scratch<P>.tagContext & kGenericContextBit) != 0
                                      ? kDigitsInGenericContext
                                      : kDigitsElsewhere;
    if (!fittedBitsField<P>(st, ctx, rq, ids.scheme, 5, 3, 8))
        return 0;
    if (ctx->present == 0)
        return 1;
    switch (st->field.value) {
    case 0: // BCD, even number of digits
    case 1: // BCD, odd number of digits: the filler is shown as a digit
        return bcdDigitsField<P>(st, ctx, rq, ids.bcd, st->remainingBits / 4);
    case 2: // IA5 characters, at most 20
        return octetsField<P>(st, ctx, rq, ids.ia5, 20);
    case 3: // binary coded
        return halfOctetField<P>(st, ctx, rq, ids.binary, st->remainingBits / 8);
    default:
        return 1;
    }
}
CAMEL_INSTANTIATE_UNIT(decodeGenericDigits, DecodeState *, ElementContext *);

} // namespace camel
