// Location information of a mobile subscriber and the address types it
// carries: geographical information, ISDN addresses, the location number,
// cell or location area identities and the extension container.
#include "cap/mobile.h"
#include "cap/units.h"

namespace camel {

// ---- MCC-MNC-LAC block ------------------------------------------------------------------

namespace {

// Three MNC digits: bits 8-5 and 4-1 of octet 3, then bits 8-5 of octet 2,
// where the cursor stands (the filler test did not consume them).
template <Pass P>
int threeDigitMnc(DecodeState *st, ElementContext *ctx, Request<P> *rq, FieldIndex f) {
    needBits(st, ctx, 12);
    if (ctx->present == 0)
        return 1;
    beginField(st, f);
    if (!ensureSpans(st, 2))
        return 0;
    uint32_t value = setSpan(st, 0, 8, 11);
    value = value * 16 + setSpan(st, 1, 4, 7);
    value = value * 16 + setSpan(st, 2, 0, 3);
    st->field.value = value;
    return finishField<P>(st, rq, f, 12);
}

} // namespace

template <Pass P>
int mccMncBlock(DecodeState *st, ElementContext *ctx, Request<P> *rq, const MccMncFields &f) {
    if (!fixedBcd<P>(st, ctx, rq, f.mcc, 3) ||
        !fittedBitsField<P>(st, ctx, rq, f.fillerTest, 0, 4, 0))
        return 0;
    if (ctx->present == 0)
        return 1;
    if (st->field.value == 0xF) {
        if (!fittedBitsField<P>(st, ctx, rq, f.filler, 0, 4, 4) ||
            !halfOctetField<P>(st, ctx, rq, f.twoDigitMnc, 1))
            return 0;
    } else if (!threeDigitMnc<P>(st, ctx, rq, f.threeDigitMnc)) {
        return 0;
    }
    return fixedOctets<P>(st, ctx, rq, f.areaCode, 2);
}
#define CAMEL_INSTANTIATE_MCC_MNC(P)                                                         \
    template int mccMncBlock<P>(DecodeState *, ElementContext *, Request<P> *,                \
                                const MccMncFields &)
CAMEL_INSTANTIATE_MCC_MNC(Pass::Decoded);
CAMEL_INSTANTIATE_MCC_MNC(Pass::Display);
CAMEL_INSTANTIATE_MCC_MNC(Pass::MessageView);
CAMEL_INSTANTIATE_MCC_MNC(Pass::KeyField);

namespace {

constexpr MccMncFields kLocationArea{fx(2079), fx(2080), fx(2085), fx(2086), fx(2083), fx(2087)};

// ---- Bodies after their length field ------------------------------------------------------

// Cell global id: the location area, then the cell identity.
template <Pass P>
int cellGlobalId(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return mccMncBlock<P>(st, ctx, rq, kLocationArea) && fixedOctets<P>(st, ctx, rq, fx(2088), 2);
}
template <Pass P>
int locationAreaId(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return mccMncBlock<P>(st, ctx, rq, kLocationArea);
}

// Type of shape (bits 8-5 of its octet), latitude, longitude, uncertainty.
template <Pass P>
int geographicalInformation(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return fittedBitsField<P>(st, ctx, rq, fx(2049), 4, 4, 8) &&
           fixedOctets<P>(st, ctx, rq, fx(2050), 3) && fixedOctets<P>(st, ctx, rq, fx(2051), 3) &&
           fittedBitsField<P>(st, ctx, rq, fx(2052), 0, 7, 8);
}

// Numbering plan, nature of address, extension bit, then up to 16 digits.
template <Pass P>
int isdnAddressBody(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return fittedBitsField<P>(st, ctx, rq, fx(2054), 0, 4, 0) &&
           fittedBitsField<P>(st, ctx, rq, fx(2055), 4, 3, 0) &&
           fittedBitsField<P>(st, ctx, rq, fx(2056), 7, 1, 8) &&
           bcdDigitsField<P>(st, ctx, rq, fx(2058), 16);
}

// The ISUP location number layout: two octets of indicators, then up to 16
// address signals whatever the odd/even indicator says.
template <Pass P>
int locationNumber(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return fittedBitsField<P>(st, ctx, rq, fx(2063), 7, 1, 0) &&
           fittedBitsField<P>(st, ctx, rq, fx(2064), 0, 7, 8) &&
           fittedBitsField<P>(st, ctx, rq, fx(2065), 7, 1, 0) &&
           fittedBitsField<P>(st, ctx, rq, fx(2066), 4, 3, 0) &&
           fittedBitsField<P>(st, ctx, rq, fx(2067), 2, 2, 0) &&
           fittedBitsField<P>(st, ctx, rq, fx(2068), 0, 2, 8) &&
           bcdDigitsField<P>(st, ctx, rq, fx(2069), 16);
}

template <Pass P>
int selectedLsaId(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return fixedOctets<P>(st, ctx, rq, fx(2217), 3);
}

// ---- Extension Container ----------------------------------------------------------------

constexpr Member kExtensionId = el(0x06, "Ext Id", 2100, 2101, halfOctets(2102, 52));

// The extension id when it comes first, then the rest as the extension type.
template <Pass P>
int privateExtension(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return decodeRow<P>(st, ctx, rq, kExtensionId, false) &&
           halfOctetField<P>(st, ctx, rq, fx(2099), 52);
}

constexpr Member kPrivateExtension[] = {
    el(0x30, "Private Extension", 2097, 2098, CAMEL_UNIT(privateExtension))};
constexpr MemberTable kPrivateExtensionList = members(Walk::Repeat, kPrivateExtension);
constexpr Member kExtensionContainer[] = {
    el(0xA0, "Private Extension List", 2094, 2095, table(kPrivateExtensionList)),
    el(0xA1, "PCS-Extensions", 2103, 2104, none()),
};
constexpr MemberTable kExtensionContainerMembers = members(Walk::InOrder, kExtensionContainer);
constexpr Member kExtensionContainerBody =
    body("Extension Container", 2091, table(kExtensionContainerMembers));

} // namespace

template <Pass P>
int decodeExtensionContainer(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return decodeBody<P>(st, ctx, rq, kExtensionContainerBody);
}
CAMEL_INSTANTIATE_UNIT(decodeExtensionContainer, DecodeState *, ElementContext *);

// ---- ISDN Address String ----------------------------------------------------------------

namespace {
constexpr Member kIsdnAddressString =
    body("ISDN Address String", 2160, CAMEL_UNIT(isdnAddressBody));
}
CAMEL_BODY_UNIT(decodeIsdnAddressString, kIsdnAddressString);

// ---- Location Information ---------------------------------------------------------------

namespace {

constexpr Member kCellIdOrLai[] = {
    el(0x80, "CellGlobalIdOrServiceAreaIdFixedLength", 2077, 2078, CAMEL_UNIT(cellGlobalId)),
    el(0x81, "laiFixedLength", 2074, 2075, CAMEL_UNIT(locationAreaId)),
};
constexpr MemberTable kCellIdOrLaiChoice = members(Walk::FirstMatch, kCellIdOrLai);

constexpr Member kLocationInformation[] = {
    el(0x02, "Age Of Location Information", 2044, 2045, integer(2046, 2)),
    el(0x80, "Geographical Information", 2047, 2048, CAMEL_UNIT(decodeGeographicalInformation)),
    el(0x81, "VLR Number", 2059, 2060, CAMEL_UNIT(isdnAddressBody)),
    el(0x82, "Location Number", 2061, 2062, CAMEL_UNIT(locationNumber)),
    el(0xA3, "Cell Id Or Sai Or LAI", 2070, 2071, table(kCellIdOrLaiChoice)),
    el(0xA4, "Extension Container", 2090, 0, CAMEL_UNIT(decodeExtensionContainer)),
    el(0x85, "Selected LSA-id", 2215, 2216, CAMEL_UNIT(selectedLsaId)),
    el(0x86, "MSC Number", 2153, 0, CAMEL_UNIT(decodeIsdnAddressString)),
    el(0x87, "Geodetic Information", 2107, 2108, halfOctets(2109, 10)),
    el(0x88, "Current Location Retrieved", 2105, 2106, none()),
};
constexpr MemberTable kLocationInformationMembers = members(Walk::InOrder, kLocationInformation);
constexpr Member kLocationInformationBody =
    body("Location Information", 2032, table(kLocationInformationMembers));

} // namespace

CAMEL_BODY_UNIT(decodeLocationInformation, kLocationInformationBody);

// The cell global id, service area id or location area id as bare octets
// (the GPRS location information's form): the MCC-MNC-LAC block, then the
// cell identity when the element holds one.
template <Pass P>
int decodeCellIdOrLaiOctets(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (!mccMncBlock<P>(st, ctx, rq, kLocationArea))
        return 0;
    if (ctx->present == 0 || st->remainingBits == 0)
        return 1;
    return fixedOctets<P>(st, ctx, rq, fx(2088), 2);
}
CAMEL_INSTANTIATE_UNIT(decodeCellIdOrLaiOctets, DecodeState *, ElementContext *);

template <Pass P>
int decodeGeographicalInformation(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return geographicalInformation<P>(st, ctx, rq);
}
CAMEL_INSTANTIATE_UNIT(decodeGeographicalInformation, DecodeState *, ElementContext *);

} // namespace camel
