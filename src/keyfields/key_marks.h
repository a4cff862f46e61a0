// Key-field marking: presence bits and values of the key fields, written
// into the host's key buffer through the offsets the host put in the key
// table.
#pragma once

#include <cstdint>

#include "dpx_camel.h"

namespace camel {

// The module's key table, handed to kf_InitialiseOptKFE.
extern KeyTableEntry g_keyTable[DPX_KEY_ENTRY_COUNT];

// Entry-point prologue of the key-field pass: initialises the key table
// with the host when needed, remembers where this call's variable values
// start and sets the selected entry's presence bit.  Returns 1 to go on
// decoding, or the negative initialisation result to return at once.
int32_t keyFieldPrologue(KeyFieldRequest *request);

// Marks entry `entry` present and stores the low byte of `value`.
int markOctetKey(KeyFieldRequest *request, uint32_t entry, uint32_t value);
// Marks entry `entry` present and stores the low 16 bits of `value`,
// little-endian.
int markWordKey(KeyFieldRequest *request, uint32_t entry, uint32_t value);
// Marks entry `entry` present and packs the field's spans into the data
// area, with the entry's slot pointing at them.  Returns 0 when the value
// does not fit (the slot is then marked as overflowed).
int markVariableKey(KeyFieldRequest *request, uint32_t entry, const FieldRecord *field);

} // namespace camel
