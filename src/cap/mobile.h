// Pieces of the mobile types that other CAMEL areas reuse: fixed-size value
// fields, the MCC-MNC-LAC block and the Extension Container.
#pragma once

#include <cstdint>

#include "engine/members.h"

namespace camel {

// Fixed-size values: when the window holds fewer bits than the field, the
// field is absent and the rest of the element is skipped.
inline void needBits(DecodeState *st, ElementContext *ctx, uint32_t bits) {
    if (ctx->present != 0 && !room(st, bits))
        ctx->present = 0;
}
template <Pass P>
inline int fixedOctets(DecodeState *st, ElementContext *ctx, Request<P> *rq, FieldIndex f,
                       uint32_t octets) {
    needBits(st, ctx, 8 * octets);
    return octetsField<P>(st, ctx, rq, f, octets);
}
template <Pass P>
inline int fixedBcd(DecodeState *st, ElementContext *ctx, Request<P> *rq, FieldIndex f,
                    uint32_t digits) {
    needBits(st, ctx, 4 * digits);
    return bcdDigitsField<P>(st, ctx, rq, f, digits);
}

// The field ids of one MCC-MNC-LAC block: the location area identity of a
// cell or location area here, the routing area identity of GPRS.
struct MccMncFields {
    FieldIndex mcc;           // three digits, low half of octet 1 first
    FieldIndex fillerTest;    // bits 8-5 of octet 2, shown but not consumed
    FieldIndex filler;        // the same half-octet when it is 0xF
    FieldIndex twoDigitMnc;   // octet 3, bits 8-5 first
    FieldIndex threeDigitMnc; // octet 3 bits 8-5, bits 4-1, then the filler-test half-octet
    FieldIndex areaCode;      // octets 4-5
};

// MCC, filler test, filler and MNC or three-digit MNC, location area code.
template <Pass P>
int mccMncBlock(DecodeState *st, ElementContext *ctx, Request<P> *rq, const MccMncFields &f);

// The members of the Initial DP argument extension, an element loop.
extern const MemberTable kInitialDpArgExtensionTable;

// Extension Container, from its length field on.
template <Pass P>
int decodeExtensionContainer(DecodeState *st, ElementContext *ctx, Request<P> *rq);

} // namespace camel
