// Key-field marking: presence bits and values of the key fields, written
// into the host's key buffer through the offsets the host put in the key
// table.
//
// All writes into the key buffer go byte by byte: the host chooses the
// offsets, so nothing in the buffer is assumed to be aligned.
//
// A request without a key buffer records nothing: the marks succeed and
// the pass still walks the whole message.

#include "keyfields/key_marks.h"

#include "keyfields/key_pack.h"
#include "keyfields/key_state.h"

namespace camel {
namespace {

// Result of kf_InitialiseOptKFE, kept for the life of the module: negative
// makes every call fail at once, 0 asks for another try at the next call,
// above 1 means entry keySelectedIndex is marked in every message.
int32_t keyInitResult = 0;
uint16_t keySelectedIndex = 0;

// Data offset of the request when the current call began.  The value room
// is shared by all variable values of one call, so every value is checked
// against what earlier values of the same call have already used.
uint16_t callDataStart = 0;

void setPresence(uint8_t *keyBuffer, const KeyTableEntry &e) {
    uint8_t &b = keyBuffer[e.presenceOffset];
    b = static_cast<uint8_t>(b | static_cast<uint8_t>(e.presenceMask));
}

void writeSlot(uint8_t *slot, uint16_t bitLength, uint16_t dataOffset) {
    slot[0] = static_cast<uint8_t>(bitLength);
    slot[1] = static_cast<uint8_t>(bitLength >> 8);
    slot[2] = static_cast<uint8_t>(dataOffset);
    slot[3] = static_cast<uint8_t>(dataOffset >> 8);
}

// Bytes the next variable value of this call may take at the request's data
// offset: what is left of the room, and never so much that the data offset
// would pass 0xFFFF.
uint32_t valueCapacity(const KeyFieldRequest *request) {
    const uint32_t offset = request->dataOffset;
    if (offset < callDataStart)
        return 0;
    const uint32_t used = offset - callDataStart;
    if (used >= request->valueRoom)
        return 0;
    const uint32_t left = request->valueRoom - used;
    const uint32_t addressable = 0xFFFFu - offset;
    return left < addressable ? left : addressable;
}

} // namespace

void resetKeyInitForTests() {
    keyInitResult = 0;
    keySelectedIndex = 0;
    callDataStart = 0;
}

int32_t keyFieldPrologue(KeyFieldRequest *request) {
    if (keyInitResult < 0)
        return keyInitResult;
    if (keyInitResult == 0) {
        keyInitResult = kf_InitialiseOptKFE(g_keyTable, DPX_KEY_ENTRY_COUNT, &keySelectedIndex);
        if (keyInitResult < 0)
            return keyInitResult;
    }
    callDataStart = request->dataOffset;
    // An index outside the table names no entry: nothing is marked.
    if (keyInitResult > 1 && keySelectedIndex < DPX_KEY_ENTRY_COUNT &&
        request->keyBuffer != nullptr)
        setPresence(request->keyBuffer, g_keyTable[keySelectedIndex]);
    return 1;
}

namespace {

// Marks a fixed-size key: presence bit, then the low `bytes` bytes of the
// value, little-endian, at the entry's value offset.
int markFixedKey(KeyFieldRequest *request, uint32_t entry, uint32_t value, uint32_t bytes) {
    uint8_t *keyBuffer = request->keyBuffer;
    if (keyBuffer == nullptr || entry >= DPX_KEY_ENTRY_COUNT)
        return 1;
    const KeyTableEntry &e = g_keyTable[entry];
    setPresence(keyBuffer, e);
    for (uint32_t i = 0; i < bytes; ++i)
        keyBuffer[e.valueOffset + i] = static_cast<uint8_t>(value >> (8 * i));
    return 1;
}

} // namespace

int markOctetKey(KeyFieldRequest *request, uint32_t entry, uint32_t value) {
    return markFixedKey(request, entry, value, 1);
}

int markWordKey(KeyFieldRequest *request, uint32_t entry, uint32_t value) {
    return markFixedKey(request, entry, value, 2);
}

int markVariableKey(KeyFieldRequest *request, uint32_t entry, const FieldRecord *field) {
    uint8_t *keyBuffer = request->keyBuffer;
    if (keyBuffer == nullptr || entry >= DPX_KEY_ENTRY_COUNT)
        return 1;
    const KeyTableEntry &e = g_keyTable[entry];
    // Set first, so the bit stays set when the value does not fit.
    setPresence(keyBuffer, e);

    uint8_t *slot = keyBuffer + e.valueOffset;
    const uint16_t offset = request->dataOffset;
    const int32_t bits = ValueBitLength(*field);
    // The slot's bit length is 16 bits wide: a longer value cannot be
    // described and is treated like one that does not fit.
    const bool fits = bits <= 0xFFFF &&
                      PackKeyValue(*field, keyBuffer + offset, valueCapacity(request)) < 0;
    if (!fits) {
        writeSlot(slot, 0, static_cast<uint16_t>(offset | DPX_KEY_OVERFLOW_BIT));
        return 0;
    }
    writeSlot(slot, static_cast<uint16_t>(bits), offset);
    request->dataOffset = static_cast<uint16_t>(offset + ValueByteLength(*field));
    return 1;
}

} // namespace camel
