// Reading key fields back out of a key buffer laid out by the stand-in
// key-field library (see dpx_standin_host.h): presence bits in bytes 0..3,
// a 4-byte slot per entry from byte 4, packed variable values from byte 128.
// Header-only so the tests can check it on hand-made buffers.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "dpx_camel.h"
#include "dpx_standin_host.h"
#include "input/hex_line.h"

namespace dpxdecode {

struct KeyEntryOut {
    uint32_t index = 0;
    std::string value; // hexadecimal bytes as stored in the key buffer
    uint32_t bits = 0;
    bool overflow = false;
};

// Size of the key buffer dpx-decode hands to the key-field pass.
inline constexpr uint32_t kKeyBufferSize = 4096;

// How the module stores each key entry's value.
enum class KeyForm { None, Octet, Word, Variable };

inline KeyForm keyEntryForm(uint32_t index) {
    switch (index) {
    case 0: case 3: case 4: case 5: case 6: case 7: case 8:
    case 13: case 22: case 23: case 27: case 28:
        return KeyForm::Octet;
    case 18: case 20:
        return KeyForm::Word; // a two-digit MNC fills only the first byte
    case 10: case 12: case 15: case 17: case 21: case 26: case 29:
        return KeyForm::Variable;
    default:
        return KeyForm::None;
    }
}

// The host cannot read names out of the module's key table, so dpx-decode
// keeps its own.
inline const char *keyEntryName(uint32_t index) {
    static const char *const names[DPX_KEY_ENTRY_COUNT] = {
        "MT",
        "Return Result (Last)",
        "Return Error",
        "P-Abort Cause",
        "Invoke Id",
        "Operation ID(Invoke)",
        "Failure Cause Value",
        "RP Cause Value",
        "Cause Value",
        "Called Party Num",
        "Called Party Num",
        "Address Signal",
        "Address Signal",
        "Event Type BCSM Value",
        "Calling Party Num",
        "Calling Party Num",
        "IMSI Digits",
        "IMSI Digits",
        "MCC",
        "MNC",
        "MNC",
        "Access Point Name Value",
        "Operation ID(RetRes)",
        "Error Code",
        "Return Result (Last)",
        "Return Error",
        "Originating Transaction Id",
        "Return Result (Last)",
        "Return Error",
        "Destination Transaction Id",
        "",
    };
    return index < DPX_KEY_ENTRY_COUNT ? names[index] : "";
}

inline uint16_t readLe16(const uint8_t *p) { return static_cast<uint16_t>(p[0] | p[1] << 8); }

// Entries whose presence bit is set, in entry order, into `out` (whose
// entries keep their string capacity from call to call).  Nothing outside
// buffer[0, size) is read: a value reaching past the buffer is cut at its
// end.
inline void readKeyEntries(const uint8_t *buffer, uint32_t size, std::vector<KeyEntryOut> &out) {
    size_t count = 0;
    for (uint32_t i = 0; i < DPX_KEY_ENTRY_COUNT; ++i) {
        const uint32_t presence = i / 8;
        if (presence >= size || (buffer[presence] & (1u << (i % 8))) == 0)
            continue;
        if (count == out.size())
            out.emplace_back();
        KeyEntryOut &e = out[count++];
        e.index = i;
        e.value.clear();
        e.bits = 0;
        e.overflow = false;
        const uint32_t slot = HOST_KEY_SLOT_BASE + HOST_KEY_SLOT_SIZE * i;
        if (slot + HOST_KEY_SLOT_SIZE > size)
            continue;
        switch (keyEntryForm(i)) {
        case KeyForm::Octet:
            appendHex(e.value, buffer + slot, 1);
            e.bits = 8;
            break;
        case KeyForm::Word:
            appendHex(e.value, buffer + slot, 2);
            e.bits = 16;
            break;
        case KeyForm::Variable: {
            const uint16_t bits = readLe16(buffer + slot);
            const uint16_t offset = readLe16(buffer + slot + 2);
            e.bits = bits;
            if (offset & DPX_KEY_OVERFLOW_BIT) {
                e.overflow = true;
                break;
            }
            const uint32_t want = (uint32_t{bits} + 7) / 8;
            const uint32_t have = offset < size ? size - offset : 0;
            appendHex(e.value, buffer + offset, want < have ? want : have);
            break;
        }
        case KeyForm::None:
            break;
        }
    }
    out.resize(count);
}

inline std::vector<KeyEntryOut> readKeyEntries(const uint8_t *buffer, uint32_t size) {
    std::vector<KeyEntryOut> out;
    readKeyEntries(buffer, size, out);
    return out;
}

} // namespace dpxdecode
