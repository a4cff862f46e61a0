// Conversion of a variable key value (digits, octets, transaction ids) from
// the spans of its field record into the packed byte string stored in the
// key buffer's data area.
//
// Packed form: the spans' bit strings one after another, the first span
// most significant, right-aligned in ceil(bits / 8) bytes with zero fill on
// top.  Digits 1 2 3 4 5 give 01 23 45; octets 61 62 give 61 62.
#pragma once

#include <cstdint>

#include "dpx_camel.h"

namespace camel {

// Bytes of one span value handed from SplitValueBytes to WriteBitRange.
inline constexpr uint32_t kSpanValueBytes = 4;

// Total bits of the field's reported spans.  A span whose last bit lies
// before its first counts 0 bits; the sum saturates at INT32_MAX.
int32_t ValueBitLength(const FieldRecord &field);

// Bytes the packed value takes: ceil(ValueBitLength / 8).
uint32_t ValueByteLength(const FieldRecord &field);

// Packs the field's value into dst[0 .. ValueByteLength - 1].  Returns -1
// when the value was packed; any result >= 0 means it did not fit:
// a capacity of 0 (nothing is written), a packed length above the capacity
// or too large to measure (nothing is written) or a span value that is negative as a signed 32-bit
// number (dst partly written, but never beyond the packed length).
int32_t PackKeyValue(const FieldRecord &field, uint8_t *dst, uint32_t capacity);

// Reverses the order of n bytes in place.
void ReverseBytes(uint8_t *buffer, uint32_t n);

// Writes the bytes of a non-negative value least significant first, as
// many as the value needs (only out[0] for 0), and returns 1; returns 0
// and writes nothing for a negative value.
int SplitValueBytes(int32_t value, uint8_t (&out)[kSpanValueBytes]);

// Copies source bits into destination bits first..last (0-based, bit 0 =
// least significant bit of dst[0], bit 8 = least significant bit of dst[1]):
// source bit i goes to destination bit first + i.  Bits outside the range
// are left unchanged; range bits past the source's 32 bits are written 0.
void WriteBitRange(uint8_t *dst, uint32_t lastBit, uint32_t firstBit,
                   const uint8_t (&src)[kSpanValueBytes]);

} // namespace camel
