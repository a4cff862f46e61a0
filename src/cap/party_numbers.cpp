// Party numbers and the ISUP / Q.931 parameters that CAMEL carries inside
// OCTET STRINGs: called, calling, redirection, charge, location and generic
// numbers (ISUP, Q.763), category, carrier, alerting pattern, cause
// (Q.850), high layer compatibility and bearer capability (Q.931).
//
// Each unit starts at its length field unless units.h says otherwise and
// takes the octet string apart bit by bit inside the element's window.  A
// field whose bits are not in the window marks the element absent, so
// nothing after it is shown; the walker then skips what is left.
#include "cap/bit_fields.h"
#include "cap/units.h"
#include "engine/members.h"

namespace camel {

namespace {

// ---- Shared pieces ----------------------------------------------------------------

// The format bits of `tagContext` that select number layouts.
constexpr uint32_t kCalledPartyContext = 1u << 21;
constexpr uint32_t kChargeNumberContext = 1u << 22;
constexpr uint32_t kGenericNumberContext = 1u << 23;
constexpr uint32_t kFormatBitsAndOverride = ~((1u << 21) - 1); // bits 21 to 31

// Runs `inner` with the bits `clear` of `tagContext` cleared and `set`
// set, and restores the word afterwards.
template <Pass P, class Inner>
int withTagContext(uint32_t clear, uint32_t set, Inner &&inner) {
    uint32_t &word = g_scratch<P>.tagContext;
    const uint32_t saved = word;
    word = (word & ~clear) | set;
    const int ok = inner();
    word = saved;
    return ok;
}

// Whole octets left in the element's window after the cursor.
inline uint32_t octetsLeft(const DecodeState *st) { return st->remainingBits / 8; }

// ---- Digit strings -------------------------------------------------------------------

// The digit field of a number whose digit count follows from its length
// octet and odd/even indicator, by indicator, and its filler.
struct CountedDigits {
    FieldIndex odd;
    FieldIndex even;
    FieldIndex filler;
};

constexpr CountedDigits kCalledPartyDigits{fx(3589), fx(3592), fx(3590)};
constexpr CountedDigits kChargeNumberDigits{fx(3600), fx(3603), fx(3601)};
constexpr CountedDigits kCallingPartyDigits{fx(1628), fx(1631), fx(1629)};

// (length - 2) x 2 digits, one less when the indicator says odd, low half
// of each octet first, then the filler half-octet after an odd count.  The
// length is the one of the enclosing number, still in `lengthValue`.
template <Pass P>
int countedDigits(DecodeState *st, ElementContext *ctx, Request<P> *rq, const CountedDigits &f,
                  uint32_t oddEven) {
    if (ctx->present == 0)
        return 1;
    const uint32_t length = g_scratch<P>.lengthValue;
    uint64_t n = length > 2 ? (static_cast<uint64_t>(length) - 2) * 2 : 0;
    if (oddEven == 1 && n > 0)
        --n;
    if (n == 0)
        return 1;
    if (4 * n > st->remainingBits) {
        st->testFlag = 0;
        ctx->present = 0;
        return 1;
    }
    if (!bcdDigitsField<P>(st, ctx, rq, oddEven == 1 ? f.odd : f.even, static_cast<uint32_t>(n)))
        return 0;
    if ((n & 1u) != 0)
        return fittedBitsField<P>(st, ctx, rq, f.filler, 0, 4, 4);
    return 1;
}

// The address signal of a called party number or a charge number, chosen
// by the format bits of `tagContext`; in any other context it decodes
// nothing.
template <Pass P>
int addressSignal(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    const uint32_t format = g_scratch<P>.tagContext & kFormatBitsAndOverride;
    if (format == kCalledPartyContext)
        return countedDigits<P>(st, ctx, rq, kCalledPartyDigits, g_scratch<P>.oddEven);
    if (format == kChargeNumberContext)
        return countedDigits<P>(st, ctx, rq, kChargeNumberDigits, g_scratch<P>.oddEven);
    return 1;
}

// ---- Called party number and the charge number ------------------------------------------

constexpr BitField kCalledOctet1[] = {{fx(1819), 0, 7}, {fx(1820), 7, 1}};
constexpr BitField kCalledOctet2[] = {{fx(1821), 0, 4}, {fx(1822), 4, 3}, {fx(1823), 7, 1}};

// Nature of address and odd/even indicator (kept in `oddEven`), numbering
// plan octet, then the address signal.
template <Pass P>
int calledAddressBody(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    uint32_t octet1[2] = {};
    if (!octetFields<P>(st, ctx, rq, kCalledOctet1, octet1))
        return 0;
    if (ctx->present != 0)
        g_scratch<P>.oddEven = octet1[1];
    return octetFields<P>(st, ctx, rq, kCalledOctet2) && addressSignal<P>(st, ctx, rq);
}

constexpr BitField kChargeOctet1[] = {{fx(1942), 0, 7}, {fx(1943), 7, 1}};
constexpr BitField kChargeOctet2[] = {{fx(1944), 4, 3}};

// ---- Calling party number ----------------------------------------------------------------

constexpr BitField kCallingOctet1[] = {{fx(1617), 0, 7}, {fx(1618), 7, 1}};
constexpr BitField kCallingOctet2[] = {
    {fx(1619), 0, 2}, {fx(1620), 2, 2}, {fx(1621), 4, 3}, {fx(1622), 7, 1}};

// ---- Original called party id and redirecting party id ----------------------------------------

// One layout, two sets of fields.
struct RedirectionNumber {
    FieldIndex length;
    BitField octet1[2];
    BitField octet2[2];
    FieldIndex digits;
};

constexpr RedirectionNumber kOriginalCalledPartyId{
    fx(1641), {{fx(1642), 0, 7}, {fx(1643), 7, 1}}, {{fx(1644), 4, 3}, {fx(1645), 2, 2}}, fx(1646)};
constexpr RedirectionNumber kRedirectingPartyId{
    fx(1813), {{fx(1814), 0, 7}, {fx(1815), 7, 1}}, {{fx(1816), 4, 3}, {fx(1817), 2, 2}}, fx(1818)};

// At most 16 digits: every half-octet left, whatever the odd/even
// indicator says.
constexpr uint32_t kRedirectionDigits = 16;

template <Pass P>
int redirectionNumber(DecodeState *st, ElementContext *ctx, Request<P> *rq,
                      const RedirectionNumber &f) {
    return lengthField<P>(st, ctx, rq, f.length) && octetFields<P>(st, ctx, rq, f.octet1) &&
           octetFields<P>(st, ctx, rq, f.octet2) &&
           bcdDigitsField<P>(st, ctx, rq, f.digits, kRedirectionDigits);
}

// ---- Generic address body: generic, location and additional numbers ----------------------------

struct GenericAddress {
    BitField octet1[2]; // nature of address, odd/even
    BitField octet2[4]; // screening, numbering plan, NI or INN, presentation
    FieldIndex digits;
};

constexpr GenericAddress kGenericNumberLayout{
    {{fx(3554), 0, 7}, {fx(1661), 7, 1}},
    {{fx(3563), 0, 2}, {fx(3566), 4, 3}, {fx(3572), 7, 1}, {fx(1662), 2, 2}},
    fx(1663)};
constexpr GenericAddress kLocationNumberLayout{
    {{fx(3557), 0, 7}, {fx(1661), 7, 1}},
    {{fx(3560), 0, 2}, {fx(3569), 4, 3}, {fx(3575), 7, 1}, {fx(1662), 2, 2}},
    fx(1663)};
constexpr GenericAddress kAdditionalCallingLayout{
    {{fx(1664), 0, 7}, {fx(1665), 7, 1}},
    {{fx(1666), 0, 2}, {fx(1667), 4, 3}, {fx(1668), 7, 1}, {fx(1669), 2, 2}},
    fx(1670)};

constexpr uint32_t kGenericDigits = 28;

template <Pass P>
int genericAddress(DecodeState *st, ElementContext *ctx, Request<P> *rq, const GenericAddress &f) {
    return octetFields<P>(st, ctx, rq, f.octet1) && octetFields<P>(st, ctx, rq, f.octet2) &&
           bcdDigitsField<P>(st, ctx, rq, f.digits, kGenericDigits);
}

// The generic address body in the layout `tagContext` selects: generic
// number when bit 23 is set, location number when it is clear.
template <Pass P>
int genericAddressBody(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    const bool generic = (g_scratch<P>.tagContext & kGenericNumberContext) != 0;
    return genericAddress<P>(st, ctx, rq, generic ? kGenericNumberLayout : kLocationNumberLayout);
}

// Generic Numbers: OCTET STRING items (identifier 04) while they come.
constexpr Member kGenericNumberItem[] = {
    el(0x04, "Generic Number", 2011, 2012, CAMEL_UNIT(decodeGenericNumber))};
constexpr MemberTable kGenericNumberList = members(Walk::Repeat, kGenericNumberItem);

// ---- ISUP parameters of one or two octets -----------------------------------------------------

constexpr BitField kRedirectionOctet1[] = {{fx(1826), 0, 3}, {fx(1827), 4, 4}};
constexpr BitField kRedirectionOctet2[] = {{fx(1828), 0, 3}, {fx(1829), 4, 4}};

// NA carrier id: at most three octets of two digits each.
constexpr uint32_t kCarrierDigits = 6;

constexpr BitField kCauseOctet1[] = {{fx(1476), 0, 4}, {fx(1477), 5, 2}};
constexpr BitField kCauseOctet2[] = {{fx(1480), 0, 7}, {fx(1478), 7, 1}};

// ---- High layer compatibility ----------------------------------------------------------------

// The fields after the coding standard, for the ITU-T (CCITT) coding and
// for every other coding (national part).
struct HighLayerPart {
    BitField octet3[2]; // interpretation, presentation method
    BitField octet4[2]; // characteristics identification, extension
};
constexpr HighLayerPart kCcittHighLayer{{{fx(1675), 2, 3}, {fx(1676), 0, 2}},
                                        {{fx(1677), 0, 7}, {fx(1678), 7, 1}}};
constexpr HighLayerPart kNationalHighLayer{{{fx(1680), 2, 3}, {fx(1681), 0, 2}},
                                           {{fx(1682), 0, 7}, {fx(1683), 7, 1}}};
constexpr BitField kExtendedHighLayer[] = {{fx(1685), 0, 7}};

// ---- Bearer capability --------------------------------------------------------------------------

constexpr BitField kBearerOctet3[] = {{fx(1704), 0, 5}, {fx(1705), 0, 2}, {fx(1706), 0, 1}};
constexpr BitField kBearerOctet4[] = {{fx(1707), 0, 5}, {fx(1708), 0, 2}, {fx(1706), 0, 1}};
constexpr BitField kBearerOctet41[] = {{fx(1712), 0, 7}, {fx(1706), 0, 1}};

// The information transfer rate after which octet 4.1 (rate multiplier)
// follows: multirate only.  After 64 kbit/s, the common rate, the next
// octet is the layer 1 octet.
constexpr uint32_t kMultirate = 24;

// A layer octet opens with its extension bit and layer identification.
constexpr BitField kLayerHead[] = {{fx(1714), 7, 1}, {fx(1715), 5, 2}};
// The rest of a layer octet per layer; anything else is invalid data.
constexpr BitField kLayer1Protocol[] = {{fx(1725), 0, 5}};
constexpr BitField kLayer2Protocol[] = {{fx(1758), 0, 5}};
constexpr BitField kLayer3Protocol[] = {{fx(1760), 0, 5}};
constexpr BitField kInvalidLayer[] = {{fx(1719), 0, 5}};

// Layer 1 extension octets 5a to 5d; each opens with its extension bit.
constexpr BitField kOctet5a[] = {{fx(1714), 7, 1}, {fx(1730), 6, 1}, {fx(1729), 5, 1}, {fx(1728), 0, 5}};
constexpr BitField kOctet5bV110[] = {{fx(1714), 7, 1}, {fx(1734), 5, 2}, {fx(1735), 4, 1},
                                     {fx(1736), 3, 1}, {fx(1737), 2, 1}, {fx(1738), 1, 1},
                                     {fx(1739), 0, 1}};
constexpr BitField kOctet5bV120[] = {{fx(1714), 7, 1}, {fx(1742), 6, 1}, {fx(1743), 5, 1},
                                     {fx(1744), 4, 1}, {fx(1745), 3, 1}, {fx(1746), 2, 1},
                                     {fx(1747), 1, 1}, {fx(1748), 0, 1}};
constexpr BitField kOctet5c[] = {{fx(1714), 7, 1}, {fx(1750), 0, 3}, {fx(1751), 3, 2}, {fx(1752), 5, 2}};
constexpr BitField kOctet5d[] = {{fx(1714), 7, 1}, {fx(1755), 0, 6}, {fx(1756), 6, 1}};

// Layer 1 protocols whose octet 5b is defined: V.110 / X.30 and V.120.
constexpr uint32_t kRateAdaptionV110 = 1;
constexpr uint32_t kRateAdaptionV120 = 8;
// Layer 3 protocol followed by octets 7a and 7b (additional information).
constexpr uint32_t kLayer3Tr9577 = 11;

constexpr BitField kOctet7a[] = {{fx(1714), 7, 1}, {fx(1764), 4, 3}};
constexpr BitField kOctet7b[] = {{fx(1766), 4, 3}, {fx(1765), 7, 1}};

// Octets 5a to 5d after a layer 1 octet whose extension bit is 0.  `more`
// comes back false when an extension octet follows that is not decoded.
template <Pass P>
int layer1Extensions(DecodeState *st, ElementContext *ctx, Request<P> *rq, uint32_t protocol,
                     bool *more) {
    uint32_t v[8] = {};
    if (!octetFields<P>(st, ctx, rq, kOctet5a, v))
        return 0;
    if (ctx->present == 0 || v[0] != 0)
        return 1;
    if (protocol == kRateAdaptionV110 || protocol == kRateAdaptionV120) {
        const bool v110 = protocol == kRateAdaptionV110;
        if (!(v110 ? octetFields<P>(st, ctx, rq, kOctet5bV110, v)
                   : octetFields<P>(st, ctx, rq, kOctet5bV120, v)))
            return 0;
        if (ctx->present == 0 || v[0] != 0)
            return 1;
    }
    if (!octetFields<P>(st, ctx, rq, kOctet5c, v))
        return 0;
    if (ctx->present == 0 || v[0] != 0)
        return 1;
    if (!octetFields<P>(st, ctx, rq, kOctet5d, v))
        return 0;
    *more = ctx->present == 0 || v[0] != 0;
    return 1;
}

// Octets 7a and 7b: extension and spare bits of each, and the additional
// layer 3 protocol information, high half in 7a and low half in 7b, as one
// field of two spans.
template <Pass P>
int layer3Information(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (!bitFields<P>(st, ctx, rq, kOctet7a, false, nullptr))
        return 0;
    if (ctx->present == 0)
        return 1;
    if (!room(st, 16)) {
        ctx->present = 0;
        return 1;
    }
    const FieldIndex f = fx(1763);
    beginField(st, f);
    if (!ensureSpans(st, 1))
        return 0;
    const uint32_t high = setSpan(st, 0, 0, 3);
    st->field.value = high * 16 + setSpan(st, 1, 8, 11);
    return finishField<P>(st, rq, f, 8) && octetFields<P>(st, ctx, rq, kOctet7b);
}

// One layer octet: extension bit and layer identification, then the
// protocol of that layer and its extension octets.  `more` comes back
// false after the last layer octet that can be decoded.
template <Pass P>
int layerOctet(DecodeState *st, ElementContext *ctx, Request<P> *rq, bool *more) {
    uint32_t head[2] = {};
    if (!bitFields<P>(st, ctx, rq, kLayerHead, false, head))
        return 0;
    *more = false;
    if (ctx->present == 0)
        return 1;
    const uint32_t extension = head[0];
    uint32_t protocol = 0;
    switch (head[1]) {
    case 1:
        if (!octetFields<P>(st, ctx, rq, kLayer1Protocol, &protocol))
            return 0;
        *more = true;
        return extension != 0 || layer1Extensions<P>(st, ctx, rq, protocol, more);
    case 2:
        *more = extension != 0;
        return octetFields<P>(st, ctx, rq, kLayer2Protocol);
    case 3:
        if (!octetFields<P>(st, ctx, rq, kLayer3Protocol, &protocol))
            return 0;
        if (ctx->present == 0 || extension != 0 || protocol != kLayer3Tr9577)
            return 1;
        return layer3Information<P>(st, ctx, rq);
    default:
        return octetFields<P>(st, ctx, rq, kInvalidLayer);
    }
}

// The bearer capability information element: octets 3 and 4, octet 4.1
// for multirate, up to three layer octets, then whatever is left as raw
// data.
template <Pass P>
int bearerCapabilityBody(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    uint32_t rate = 0;
    if (!successiveFields<P>(st, ctx, rq, kBearerOctet3) ||
        !successiveFields<P>(st, ctx, rq, kBearerOctet4, &rate))
        return 0;
    if (ctx->present != 0 && rate == kMultirate && !successiveFields<P>(st, ctx, rq, kBearerOctet41))
        return 0;
    bool more = true;
    for (int layer = 0; layer < 3 && more && ctx->present != 0 && room(st, 8); ++layer)
        if (!layerOctet<P>(st, ctx, rq, &more))
            return 0;
    if (ctx->present == 0 || octetsLeft(st) == 0)
        return 1;
    return octetsField<P>(st, ctx, rq, fx(1723), octetsLeft(st));
}

// Bearer Capability is a CHOICE of one alternative, [0] bearerCap.
constexpr Member kBearerCapabilityAlternatives[] = {
    alt(0x80, "Bearer Cap", 1702, CAMEL_UNIT(bearerCapabilityBody))};
constexpr MemberTable kBearerCapability =
    members(Walk::Choice, kBearerCapabilityAlternatives, 1700);

} // namespace

// ---- Units ---------------------------------------------------------------------------------------

template <Pass P>
int decodeIsupAddress(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return withTagContext<P>(kFormatBitsAndOverride, kCalledPartyContext,
                             [&] { return calledAddressBody<P>(st, ctx, rq); });
}
CAMEL_INSTANTIATE_UNIT(decodeIsupAddress, DecodeState *, ElementContext *);

template <Pass P>
int decodeCalledPartyNumber(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return lengthField<P, 1616>(st, ctx, rq) && decodeIsupAddress<P>(st, ctx, rq);
}
CAMEL_INSTANTIATE_UNIT(decodeCalledPartyNumber, DecodeState *, ElementContext *);

template <Pass P>
int decodeCallingPartyNumber(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    uint32_t octet1[2] = {};
    if (!lengthField<P, 1613>(st, ctx, rq) || !octetFields<P>(st, ctx, rq, kCallingOctet1, octet1) ||
        !octetFields<P>(st, ctx, rq, kCallingOctet2))
        return 0;
    return countedDigits<P>(st, ctx, rq, kCallingPartyDigits, octet1[1]);
}
CAMEL_INSTANTIATE_UNIT(decodeCallingPartyNumber, DecodeState *, ElementContext *);

template <Pass P>
int decodeOriginalCalledPartyId(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return redirectionNumber<P>(st, ctx, rq, kOriginalCalledPartyId);
}
CAMEL_INSTANTIATE_UNIT(decodeOriginalCalledPartyId, DecodeState *, ElementContext *);

template <Pass P>
int decodeRedirectingPartyId(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return redirectionNumber<P>(st, ctx, rq, kRedirectingPartyId);
}
CAMEL_INSTANTIATE_UNIT(decodeRedirectingPartyId, DecodeState *, ElementContext *);

template <Pass P>
int decodeRedirectionInformation(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return lengthField<P, 1825>(st, ctx, rq) && octetFields<P>(st, ctx, rq, kRedirectionOctet1) &&
           octetFields<P>(st, ctx, rq, kRedirectionOctet2);
}
CAMEL_INSTANTIATE_UNIT(decodeRedirectionInformation, DecodeState *, ElementContext *);

template <Pass P>
int decodeChargeNumber(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    uint32_t octet1[2] = {};
    if (!lengthField<P, 1941>(st, ctx, rq) || !octetFields<P>(st, ctx, rq, kChargeOctet1, octet1))
        return 0;
    if (ctx->present != 0)
        g_scratch<P>.oddEven = octet1[1];
    if (!octetFields<P>(st, ctx, rq, kChargeOctet2))
        return 0;
    return withTagContext<P>(kFormatBitsAndOverride, kChargeNumberContext,
                             [&] { return addressSignal<P>(st, ctx, rq); });
}
CAMEL_INSTANTIATE_UNIT(decodeChargeNumber, DecodeState *, ElementContext *);

template <Pass P>
int decodeLocationNumber(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return lengthField<P, 1639>(st, ctx, rq) &&
           withTagContext<P>(kGenericNumberContext, 0,
                             [&] { return genericAddressBody<P>(st, ctx, rq); });
}
CAMEL_INSTANTIATE_UNIT(decodeLocationNumber, DecodeState *, ElementContext *);

template <Pass P>
int decodeGenericNumbers(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return lengthField<P, 2009>(st, ctx, rq) && walkTable<P>(st, ctx, rq, kGenericNumberList);
}
CAMEL_INSTANTIATE_UNIT(decodeGenericNumbers, DecodeState *, ElementContext *);

template <Pass P>
int decodeGenericNumber(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return octetField<P, 1657>(st, ctx, rq) &&
           withTagContext<P>(0, kGenericNumberContext,
                             [&] { return genericAddressBody<P>(st, ctx, rq); });
}
CAMEL_INSTANTIATE_UNIT(decodeGenericNumber, DecodeState *, ElementContext *);

template <Pass P>
int decodeAdditionalCallingPartyNumber(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return octetField<P, 1659>(st, ctx, rq) &&
           genericAddress<P>(st, ctx, rq, kAdditionalCallingLayout);
}
CAMEL_INSTANTIATE_UNIT(decodeAdditionalCallingPartyNumber, DecodeState *, ElementContext *);

template <Pass P>
int decodeCallingPartysCategory(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return lengthField<P, 1633>(st, ctx, rq) && octetField<P, 1634>(st, ctx, rq);
}
CAMEL_INSTANTIATE_UNIT(decodeCallingPartysCategory, DecodeState *, ElementContext *);

// Carrier selection, then the NA carrier id digits, low half of each octet
// first (as the carrier identification digits of ANSI ISUP are coded),
// shown as one hexadecimal number.
template <Pass P>
int decodeCarrier(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return lengthField<P, 1954>(st, ctx, rq) && octetField<P, 1955>(st, ctx, rq) &&
           bcdDigitsField<P>(st, ctx, rq, fx(1956), kCarrierDigits);
}
CAMEL_INSTANTIATE_UNIT(decodeCarrier, DecodeState *, ElementContext *);

template <Pass P>
int decodeAlertingPattern(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (!lengthField<P, 1126>(st, ctx, rq))
        return 0;
    if (ctx->present != 0 && !room(st, 16))
        ctx->present = 0;
    return octetsField<P, 1127>(st, ctx, rq, 2) && octetField<P, 1128>(st, ctx, rq);
}
CAMEL_INSTANTIATE_UNIT(decodeAlertingPattern, DecodeState *, ElementContext *);

template <Pass P>
int decodeCause(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (!lengthField<P, 1475>(st, ctx, rq) || !octetFields<P>(st, ctx, rq, kCauseOctet1) ||
        !octetFields<P>(st, ctx, rq, kCauseOctet2))
        return 0;
    if (ctx->present == 0 || octetsLeft(st) == 0)
        return 1;
    return octetsField<P, 1479>(st, ctx, rq, octetsLeft(st));
}
CAMEL_INSTANTIATE_UNIT(decodeCause, DecodeState *, ElementContext *);

template <Pass P>
int decodeHighLayerCompatibility(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (!lengthField<P, 1672>(st, ctx, rq) || !fittedBitsField<P>(st, ctx, rq, fx(1673), 5, 2, 0))
        return 0;
    if (ctx->present == 0)
        return 1;
    const HighLayerPart &part = st->field.value == 0 ? kCcittHighLayer : kNationalHighLayer;
    uint32_t octet4[2] = {};
    if (!octetFields<P>(st, ctx, rq, part.octet3) ||
        !octetFields<P>(st, ctx, rq, part.octet4, octet4))
        return 0;
    if (ctx->present == 0 || octet4[1] != 0)
        return 1;
    return octetFields<P>(st, ctx, rq, kExtendedHighLayer);
}
CAMEL_INSTANTIATE_UNIT(decodeHighLayerCompatibility, DecodeState *, ElementContext *);

template <Pass P>
int decodeBearerCapability(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return lengthField<P, 1699>(st, ctx, rq) && walkTable<P>(st, ctx, rq, kBearerCapability);
}
CAMEL_INSTANTIATE_UNIT(decodeBearerCapability, DecodeState *, ElementContext *);

} // namespace camel
