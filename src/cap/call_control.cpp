// The call-control types: extensions, side and leg identifiers, call
// segment ids, service key, requested information, service interaction
// indicators, CUG data, the BCSM event types and the event-specific
// information of Event Report BCSM, basic service codes, IP SSP
// capabilities, call gapping and misc call info.
//
// Almost every type is a member table (engine/members.h).  A type whose
// unit starts at its own length field is described by one "body" row: the
// row is decoded from its length field on, exactly like a choice
// alternative whose identifier has been consumed.  Hand-written code is
// kept for bit-level layouts and for the event-specific choice, whose
// identifiers are one or two octets long.
#include "cap/rows.h"
#include "cap/units.h"
#include "engine/members.h"

namespace camel {

namespace {

// ---- Building blocks -----------------------------------------------------------


// A row value decoded by the static member template `U::run<P>`: lets one
// hand-written piece, parameterised by field ids, serve several rows.
template <class U, Pass P>
int runUnit(DecodeState *st, ElementContext *ctx, void *rq) {
    return U::template run<P>(st, ctx, static_cast<Request<P> *>(rq));
}
template <class U>
consteval Value unitOf() {
    return unitValue(UnitRef{{&runUnit<U, Pass::Decoded>, &runUnit<U, Pass::Display>,
                              &runUnit<U, Pass::MessageView>, &runUnit<U, Pass::KeyField>}});
}

// Bits 1-2 of the one content octet (treatment indicators).
template <uint32_t Id>
struct LowTwoBits {
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
        return fittedBitsField<P>(st, ctx, rq, Field<Id>::index, 0, 2, 8);
    }
};

// A NULL: its tag and its length, nothing else.
consteval Member null(uint32_t tag, const char *name, uint32_t tagId, uint32_t lengthId) {
    return el(tag, name, tagId, lengthId, none());
}

// ---- Extensions ------------------------------------------------------------------

constexpr Member kExtensionField[] = {
    el(kAnyTag, "Extension Type", 1487, 1488, halfOctets(1489, 52)),
    el(0x0A, "Extension Criticality", 1490, 1491, octet(1492)),
    el(0x81, "Extension Value", 1493, 1495, halfOctets(1496, 52)),
    el(0xA1, "Extension Value", 1493, 1495, halfOctets(1496, 52)),
};
constexpr MemberTable kExtensionFieldMembers = members(Walk::InOrder, kExtensionField);
constexpr Member kExtensionList[] = {
    el(0x30, "Extension Field", 1484, 1485, table(kExtensionFieldMembers))};
constexpr MemberTable kExtensionListItems = members(Walk::Repeat, kExtensionList);
constexpr Member kExtensions = body("Extensions", 1482, table(kExtensionListItems));

// ---- Side and leg identifiers ------------------------------------------------------

// Every side and leg id ends with the side id: its length and the leg type.
consteval Member sideId(uint32_t tag) { return alt(tag, "Side Id", 1553, octet(1554)); }

constexpr Member kSendingSide[] = {sideId(0x80)};
constexpr MemberTable kSendingSideChoice = members(Walk::Choice, kSendingSide, 1551);
constexpr Member kSendingSideId = body("Sending Side Id", 1550, table(kSendingSideChoice));

constexpr Member kReceivingSide[] = {sideId(0x81)};
constexpr MemberTable kReceivingSideChoice = members(Walk::Choice, kReceivingSide, 1547);
constexpr Member kReceivingSideId = body("Receiving Side ID", 1546, table(kReceivingSideChoice));

constexpr Member kLegSide[] = {sideId(0x80), sideId(0x81)};
constexpr MemberTable kLegSideChoice = members(Walk::Choice, kLegSide, 1543);
constexpr Member kLegId = body("Leg ID", 1542, table(kLegSideChoice));

constexpr Member kCallSegmentId = body("Call Segment ID", 4180, halfOctets(4181, 4));

// ---- Service key, CUG data, small values -------------------------------------------------

constexpr Member kServiceKey = body("Service Key", 1610, integer(1611, 4));
constexpr Member kCugInterlock = body("CUG Interlock", 1947, halfOctets(1948, 4));
constexpr Member kCugOutgoingAccess = body("CUG Outgoing Access", 1951, none());
constexpr Member kNoneNull = body("None", 1535, none());
constexpr Member kNaOliInfo = body("NA Oli Info", 2016, octet(2017));
constexpr Member kScfId = body("SCF Id", 1539, halfOctets(1540, 52));
constexpr Member kCgEncountered = body("Cg Encountered", 1636, octet(1637));
constexpr Member kEventTypeBcsm = body("Event Type BCSM", 1556, octet(1557));

constexpr Member kMiscCallInfoRows[] = {el(0x80, "Message Type", 1606, 1607, octet(1608))};
constexpr MemberTable kMiscCallInfoBlock = members(Walk::InOrder, kMiscCallInfoRows);
constexpr Member kMiscCallInfo = body("Misc Call Info", 1603, table(kMiscCallInfoBlock));

// ---- IP SSP capabilities: flag bits of the first octet, then the bilateral part ----

struct IpSspCapabilityBits {
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
        // Bits 1 to 5 are read in place; bit 8 closes the octet.
        constexpr FieldIndex kFlags[] = {fx(1433), fx(1434), fx(1435), fx(1436), fx(1437)};
        for (uint32_t bit = 0; bit < 5; ++bit)
            if (!fittedBitsField<P>(st, ctx, rq, kFlags[bit], bit, 1, 0))
                return 0;
        if (!fittedBitsField<P>(st, ctx, rq, fx(1438), 7, 1, 8))
            return 0;
        if (ctx->present == 0 || !room(st, 8))
            return 1;
        return halfOctetField<P>(st, ctx, rq, fx(1439), 3);
    }
};
constexpr Member kIpSspCapabilities =
    body("Ipssp Capabilities", 1432, unitOf<IpSspCapabilityBits>());

// ---- Requested information ------------------------------------------------------------

// Call stop time: the year's two octets read as one 16-bit value (first
// octet low), then month, day, hour, minute and second, one octet each.
struct CallStopTime {
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
        if (!fittedBitsField<P>(st, ctx, rq, fx(1512), 0, 16, 16))
            return 0;
        return octetFields<P, 1513, 1514, 1515, 1516, 1517>(st, ctx, rq);
    }
};

constexpr Member kRequestedInfoValue[] = {
    // INTEGER (0..255): 128 to 255 take two octets (00 xx).
    alt(0x80, "Call Attempt Elapsed Time Value", 1509, integer(1510, 2)),
    alt(0x81, "Call Stop Time Value", 1511, unitOf<CallStopTime>()),
    alt(0x82, "Call Connect Elapsed Time Value", 1518, integer(1519, 4)),
    alt(0x9E, "Release Cause", 0, CAMEL_UNIT(decodeCause)),
};
constexpr MemberTable kRequestedInfoValueChoice = members(Walk::Choice, kRequestedInfoValue, 1507);
constexpr Member kRequestedInformation[] = {
    el(0x80, "Requested Info Type", 1502, 1503, octet(1504)),
    el(0xA1, "Requested Info Value", 1505, 1506, table(kRequestedInfoValueChoice)),
};
constexpr MemberTable kRequestedInformationMembers =
    members(Walk::InOrder, kRequestedInformation);
constexpr Member kRequestedInformationItem[] = {
    el(0x30, "Requested Information", 1500, 1501, table(kRequestedInformationMembers))};
constexpr MemberTable kRequestedInformationList =
    members(Walk::Repeat, kRequestedInformationItem);

constexpr Member kRequestedInfoTypeItem[] = {
    el(0x0A, "Requested Information Type", 1525, 1526, octet(1527))};
constexpr MemberTable kRequestedInfoTypeList = members(Walk::Repeat, kRequestedInfoTypeItem);

// ---- Service interaction indicators two ---------------------------------------------------

consteval Member conferenceTreatment() {
    return el(0x81, "Conference Treatment Indicator", 1975, 1976, octet(1977));
}
constexpr Member kForwardServiceInteraction[] = {
    conferenceTreatment(),
    el(0x82, "Call Diversion Treatment Ind", 1978, 1979, octet(1980)),
    el(0x84, "Calling Party Restriction Ind", 1981, 1982, octet(1983)),
};
constexpr MemberTable kForwardServiceInteractionBlock =
    members(Walk::InOrder, kForwardServiceInteraction);
constexpr Member kBackwardServiceInteraction[] = {
    conferenceTreatment(),
    el(0x82, "Call Completion Treatment Ind", 1988, 1989, octet(1990)),
};
constexpr MemberTable kBackwardServiceInteractionBlock =
    members(Walk::InOrder, kBackwardServiceInteraction);
constexpr Member kServiceInteractionTwoRows[] = {
    el(0xA0, "Forward Service Interaction Ind", 1969, 1970, table(kForwardServiceInteractionBlock)),
    el(0xA1, "Backward Service Interactionind", 1984, 1985,
       table(kBackwardServiceInteractionBlock)),
    el(0x82, "Bothway Through Connection Ind", 1991, 1992, octet(1993)),
    el(0x84, "Connected Number Treatment Ind", 1994, 1995, unitOf<LowTwoBits<1996>>()),
    null(0x8D, "Non CUG Call", 1997, 1998),
    el(0x9F32, "Hold Treatment Indicator", 1999, 2000, unitOf<LowTwoBits<2001>>()),
    el(0x9F33, "Cw Treatment Indicator", 2002, 2003, unitOf<LowTwoBits<2004>>()),
    el(0x9F34, "Ect Treatment Indicator", 2005, 2006, unitOf<LowTwoBits<2007>>()),
};
constexpr MemberTable kServiceInteractionTwoBlock =
    members(Walk::InOrder, kServiceInteractionTwoRows);
constexpr Member kServiceInteractionTwo =
    body("Service Interaction Ind Two", 1959, table(kServiceInteractionTwoBlock));

// ---- Continue With Argument Arg Extension ------------------------------------------------

constexpr Member kLegOrCallSegment[] = {
    alt(0x80, "Call Segment ID", 0, CAMEL_UNIT(decodeCallSegmentId)),
    alt(0xA1, "Leg ID", 0, CAMEL_UNIT(decodeLegId)),
};
constexpr MemberTable kLegOrCallSegmentChoice = members(Walk::Choice, kLegOrCallSegment, 4188);
constexpr Member kContinueWithArgumentArgExtensionRows[] = {
    null(0x80, "suppress_D_CSI", 4182, 1535),
    null(0x81, "suppress_N_CSI", 4184, 1535),
    null(0x82, "suppressOutgoingCallBarring", 4211, 1535),
    el(0xA3, "Leg Or Call Segment", 4186, 4187, table(kLegOrCallSegmentChoice)),
};
constexpr MemberTable kContinueWithArgumentArgExtension =
    members(Walk::InOrder, kContinueWithArgumentArgExtensionRows);

// ---- BCSM events ---------------------------------------------------------------------------

consteval Member digitCount(uint32_t tag, const char *name, uint32_t tagId) {
    return el(tag, name, tagId, tagId + 1, octet(tagId + 2));
}
consteval Member digit(uint32_t tag, const char *name, uint32_t tagId) {
    return el(tag, name, tagId, tagId + 1, halfOctets(tagId + 2, 2));
}
constexpr Member kMidCallControlInfoRows[] = {
    digitCount(0x80, "Minimum Number Of Digits", 4292),
    digitCount(0x81, "Maximum Number Of Digits", 4295),
    digit(0x82, "endOfReplyDigit", 4301),
    digit(0x83, "cancelDigit", 4304),
    digit(0x84, "startDigit", 4307),
    digitCount(0x85, "Inter Digit Timeout", 4298),
};
constexpr MemberTable kMidCallControlInfo = members(Walk::InOrder, kMidCallControlInfoRows);
constexpr Member kDpSpecificCriteriaAlternatives[] = {
    alt(0x81, "APPLICATION Timer", 1915, integer(1916, 2)),
    alt(0xA2, "Mid Call Control Info", 4284, table(kMidCallControlInfo)),
    alt(0xA3, "DP Specific Criteria Alt", 4310, none()),
};
constexpr MemberTable kDpSpecificCriteria =
    members(Walk::Choice, kDpSpecificCriteriaAlternatives, 1912);
constexpr Member kBcsmEventRows[] = {
    el(0x80, "Event Type BCSM", 1555, 0, CAMEL_UNIT(decodeEventTypeBcsm)),
    monitorMode(0x81),
    el(0xA2, "Leg Id", 1541, 0, CAMEL_UNIT(decodeLegId)),
    el(0xBE, "DP Specific Criteria", 1910, 1911, table(kDpSpecificCriteria)),
    null(0x9F32, "automaticRearm", 4331, 4332),
};
constexpr MemberTable kBcsmEvent = members(Walk::InOrder, kBcsmEventRows);
constexpr Member kBcsmEventItem[] = {el(0x30, "BCSM Event", 1900, 1901, table(kBcsmEvent))};
constexpr MemberTable kBcsmEvents = members(Walk::Repeat, kBcsmEventItem);

// ---- Extended basic service code ------------------------------------------------------------

// The first content octet names the service; any further octets are shown
// together as the reserved part.
template <uint32_t CodeId, uint32_t ReservedId>
struct ServiceCode {
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
        if (!octetField<P>(st, ctx, rq, Field<CodeId>::index))
            return 0;
        if (ctx->present == 0 || !room(st, 8))
            return 1;
        return halfOctetField<P>(st, ctx, rq, Field<ReservedId>::index, 4);
    }
};
constexpr Member kExtBasicServiceCodeAlternatives[] = {
    alt(0x82, "Bs Code", 2128, unitOf<ServiceCode<2053, 2129>>()),
    alt(0x83, "Tele Service Code", 2130, unitOf<ServiceCode<2057, 2131>>()),
};
constexpr MemberTable kExtBasicServiceCode =
    members(Walk::Choice, kExtBasicServiceCodeAlternatives, 2127);

// ---- Event-specific information of Event Report BCSM ------------------------------------------

constexpr Member kCauseOnlyRows[] = {el(kAnyTag, "Cause", 1474, 0, CAMEL_UNIT(decodeCause))};
constexpr MemberTable kCauseOnly = members(Walk::InOrder, kCauseOnlyRows);

consteval Member calledPartyNumber(uint32_t tag) {
    return el(tag, "Called Party Number", 1615, 0, CAMEL_UNIT(decodeCalledPartyNumber));
}
consteval Member extBasicServiceCode(uint32_t tag) {
    return el(tag, "Ext Basic Service Code", 2125, 2126, table(kExtBasicServiceCode));
}
// The charge indicator's two low bits, then the rest of the octet as spare.
struct ChargeIndicatorBits {
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
        if (!fittedBitsField<P>(st, ctx, rq, fx(4282), 0, 2, 0))
            return 0;
        return fittedBitsField<P>(st, ctx, rq, fx(4283), 2, 6, 8);
    }
};
constexpr Member kAnswerRows[] = {
    calledPartyNumber(0x9F32),
    null(0x9F33, "Or Call", 1575, 1576),
    null(0x9F34, "Forwarded Call", 1577, 2606),
    el(0x9F35, "Charge Indicator", 4280, 4281, unitOf<ChargeIndicatorBits>()),
    extBasicServiceCode(0xBF36),
    extBasicServiceCode(0xBF37),
};
constexpr MemberTable kAnswer = members(Walk::InOrder, kAnswerRows);

constexpr Member kReleaseCauseRows[] = {
    el(0x80, "Release Cause", 1579, 0, CAMEL_UNIT(decodeCause))};
constexpr MemberTable kReleaseCause = members(Walk::InOrder, kReleaseCauseRows);

consteval Member callForwarded() { return null(0x9F32, "Call Forwarded", 1600, 1601); }
consteval Member routeNotPermitted() { return null(0x9F33, "Route Not Permitted", 1580, 2606); }
constexpr Member kBusyRows[] = {
    el(0x80, "Cause", 1474, 0, CAMEL_UNIT(decodeCause)),
    callForwarded(),
    routeNotPermitted(),
    calledPartyNumber(0x9F34),
};
constexpr MemberTable kBusy = members(Walk::InOrder, kBusyRows);
constexpr Member kNoAnswerRows[] = {callForwarded(), routeNotPermitted(), calledPartyNumber(0x9F34)};
constexpr MemberTable kNoAnswer = members(Walk::InOrder, kNoAnswerRows);

// Location information as a plain octet string.
constexpr Member kLocationRows[] = {
    el(0xBF32, "Location Information", 1581, 2032, halfOctets(1583, 255))};
constexpr MemberTable kLocation = members(Walk::InOrder, kLocationRows);

constexpr Member kAbandonRows[] = {null(0x9F32, "routeNotPermitted", 1584, 2606)};
constexpr MemberTable kAbandon = members(Walk::InOrder, kAbandonRows);


// The alternatives, by their identifier as written (two-octet ones first
// octet high).
constexpr Member kEventSpecificAlternatives[] = {
    alt(0xA2, "Specific Information", 1560, table(kCauseOnly)),
    alt(0xA3, "Specific Information", 1560, table(kCauseOnly)),
    alt(0xA4, "O No Answer Specific Info", 1560, none()),
    alt(0xA5, "O Answer Specific Info", 1560, table(kAnswer)),
    alt(0xA7, "O Dis. Specific Info", 1560, table(kReleaseCause)),
    alt(0xA8, "Specific Information", 1560, table(kBusy)),
    alt(0xA9, "T No Answer Specific Info", 1560, table(kNoAnswer)),
    alt(0xAA, "O Answer Specific Info", 1560, table(kAnswer)),
    alt(0xAC, "T Dis. Specific Info", 1560, table(kReleaseCause)),
    alt(0xAD, "O.Term Seized Specific Info", 1560, table(kLocation)),
    alt(0xB4, "Call Accepted Specific Info", 1560, table(kLocation)),
    alt(0xB5, "O.Abandon Specific Info", 1560, table(kAbandon)),
    alt(0xBF32, "O.Change Of Position Specific Info", 1560, table(kLocation)),
    alt(0xBF33, "T.Change Of Position Specific Info", 1560, table(kLocation)),
    alt(0xBF35, "DP Specific Info Alt", 1560, none()),
};

// The choice of the event-specific information: a one-octet identifier,
// or a two-octet one (BF xx) shown under its own choice field.  The
// alternative follows from its length field on.
struct EventSpecificChoice {
    template <Pass P>
    static int run(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
        const bool twoOctets = room(st, 8) && peekOctet(st) == 0xBF;
        uint32_t chosen = 0;
        if (twoOctets) {
            if (!fittedBitsField<P>(st, ctx, rq, fx(1565), 0, 16, 16))
                return 0;
            if (ctx->present == 0)
                return 1;
            // Read first octet low; the alternatives are written first octet high.
            chosen = ((st->field.value & 0xFFu) << 8) | (st->field.value >> 8);
            g_scratch<P>.choiceTag = chosen;
        } else {
            if (!choiceField<P>(st, ctx, rq, fx(1563)))
                return 0;
            if (ctx->present == 0)
                return 1;
            chosen = g_scratch<P>.choiceTag;
        }
        for (const Member &m : kEventSpecificAlternatives)
            if (m.tag == chosen)
                return decodeMember<P>(st, ctx, rq, m, 0);
        return 1;
    }
};
constexpr Member kEventSpecificInfoBcsm =
    body("Event Specific Info BCSM", 1559, unitOf<EventSpecificChoice>());

} // namespace

// ---- The units ------------------------------------------------------------------------------


CAMEL_BODY_UNIT(decodeExtensions, kExtensions);
CAMEL_BODY_UNIT(decodeSendingSideId, kSendingSideId);
CAMEL_BODY_UNIT(decodeReceivingSideId, kReceivingSideId);
CAMEL_BODY_UNIT(decodeLegId, kLegId);
CAMEL_BODY_UNIT(decodeCallSegmentId, kCallSegmentId);
CAMEL_BODY_UNIT(decodeServiceKey, kServiceKey);
CAMEL_TABLE_UNIT(decodeRequestedInformationList, kRequestedInformationList);
CAMEL_TABLE_UNIT(decodeRequestedInfoTypeList, kRequestedInfoTypeList);
CAMEL_BODY_UNIT(decodeServiceInteractionIndicatorsTwo, kServiceInteractionTwo);
CAMEL_BODY_UNIT(decodeCugInterlock, kCugInterlock);
CAMEL_BODY_UNIT(decodeCugOutgoingAccess, kCugOutgoingAccess);
CAMEL_BODY_UNIT(decodeNoneNull, kNoneNull);
CAMEL_BODY_UNIT(decodeNaOliInfo, kNaOliInfo);
CAMEL_TABLE_UNIT(decodeContinueWithArgumentArgExtension, kContinueWithArgumentArgExtension);
CAMEL_BODY_UNIT(decodeEventTypeBcsm, kEventTypeBcsm);
CAMEL_TABLE_UNIT(decodeBcsmEvents, kBcsmEvents);
CAMEL_BODY_UNIT(decodeEventSpecificInfoBcsm, kEventSpecificInfoBcsm);
CAMEL_TABLE_UNIT(decodeExtBasicServiceCode, kExtBasicServiceCode);
CAMEL_BODY_UNIT(decodeIpSspCapabilities, kIpSspCapabilities);
CAMEL_BODY_UNIT(decodeCgEncountered, kCgEncountered);
CAMEL_BODY_UNIT(decodeMiscCallInfo, kMiscCallInfo);
CAMEL_BODY_UNIT(decodeScfId, kScfId);

} // namespace camel
