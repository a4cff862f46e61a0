// Runtime routines every grammar unit shares: bit extraction, growth of the
// host's arrays, field reset and layer frames.
#pragma once

#include <cstdint>

#include "dpx_camel.h"

namespace camel {

// Value of the message bits between the 1-based positions `from` and `to`
// (both inclusive).  A read across octets assembles them least significant
// octet first.  When from > to the bits come back in reverse order.  The
// caller keeps the range within 32 bits and within the message.
uint32_t ExtractBitsAnyRange(const uint8_t *buffer, uint32_t from, uint32_t to);

// The same; bits in order within one octet (most reads) are taken inline.
inline uint32_t ExtractBits(const uint8_t *buffer, uint32_t from, uint32_t to) {
    const uint32_t lo = from - 1;
    const uint32_t hi = to - 1;
    if (from != 0 && from <= to && lo >> 3 == hi >> 3)
        return static_cast<uint32_t>(buffer[lo >> 3] >> (lo & 7u)) & ((2u << (hi - lo)) - 1u);
    return ExtractBitsAnyRange(buffer, from, to);
}

// The low n bits of value in reverse order.
uint32_t ReverseBits(uint32_t value, uint32_t n);

// Makes element `index` of a host array writable, growing the array to
// index + 1 elements through pu_Realloc.  On failure the array pointer is
// set to null and 0 is returned.
int EnsureSlot(void **array, uint32_t index, uint32_t *count, uint32_t elementSize);

// Doubles the capacity of a host array until `index` fits; 0 when pu_Realloc
// fails (the array pointer is then null).
int EnsureCapacityDoubling(void **array, uint32_t index, uint32_t *capacity,
                           uint32_t elementSize);

// Clears the parts of the field record that every field sets anew.
void ResetFieldRecord(FieldRecord *field);

// Opens the layer frame for the current cursor (the array already holds
// frameIndex + 1 frames).
void PushLayerFrame(DecodeState *state);

} // namespace camel
