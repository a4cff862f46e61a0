// Test harness: runs the four passes over one message through the real
// entry points, with the stand-in host recording what a host would see.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "dpx_camel.h"
#include "dpx_standin_host.h"

namespace camel {
struct MemberTable;
}

namespace camel::test {

using Bytes = std::vector<uint8_t>;

// Hex digits to bytes; blanks and colons are ignored.
Bytes hexBytes(std::string_view hex);

// Every message of the bundled samples/*.txt files (one a line, `#`
// comments), in file and line order.
std::vector<Bytes> sampleMessages();

struct Span {
    uint32_t first, last, value;
    bool operator==(const Span &) const = default;
};

// One field as the decoded-field pass reported it.
struct Field {
    uint32_t id;
    std::string label;
    std::string text;
    uint32_t selector;
    std::vector<Span> spans;
};

// One field as the display pass reported it.
struct Shown {
    uint32_t displayId;
    std::string text;
};

// One key entry found present in the key buffer.
struct Key {
    uint32_t index;
    Bytes value;       // as stored: 1 byte, 2 bytes, or the packed bytes
    uint32_t bits;     // 8, 16, or the slot's bit length
    bool overflow;
};

// How a pass ended.
struct PassEnd {
    int result = -1;
    uint32_t remainingBits = 0;
    uint32_t errorFlags = 0;
    uint32_t cursor = 0;
};

struct Decoded {
    PassEnd md, display, view, keys;
    std::vector<Field> fields;
    std::vector<Shown> shown;
    int32_t status = 0;         // the message-view pass's request status
    LayerInfoEntry layer{};     // the decoded-field pass's layer entry
    std::vector<Key> keyEntries;

    // The decoded-field texts in order, for compact assertions.
    std::vector<std::string> texts() const;
    const Field *find(uint32_t id) const; // first field with this id
    const Key *key(uint32_t index) const;
};

// Runs all four passes (each on a freshly prepared state) and checks the
// cross-pass invariant: the same cursor, remaining bits and error flags at
// the end of every pass, the display pass reporting the same fields in the
// same order as the decoded-field pass, the message-view status matching
// the flags.  Failures are reported through gtest.
Decoded decode(const Bytes &message);
inline Decoded decode(std::string_view hex) { return decode(hexBytes(hex)); }

// Runs all four passes like decode(), but each pass walks the member table
// `table` from the message's first octet (with the scratch values reset, as
// an entry point resets them) instead of decoding a TCAP message; with
// `windowBits` not 0 the walk runs inside a window of that many bits.  Lets
// a type unit be tested before any argument carries it.
Decoded walk(const Bytes &message, const MemberTable &table, uint32_t windowBits = 0);

// Runs the key-field pass only, with a given key room; the key buffer is
// returned so a test can look at the raw bytes.
struct KeyRun {
    int32_t result;
    PassEnd end;
    Bytes buffer;
    uint16_t dataOffset;
    std::vector<Key> entries;
};
KeyRun runKeys(const Bytes &message, uint16_t room);

// Makes pu_Realloc fail at every call a pass reaches on this message (the
// state's arrays start at capacity 1 so that growth happens) and checks,
// for every pass and every n, that the pass returns 0 with the flag of the
// array that failed, writes no layer entry end and does not advance the
// layer index.  Returns the number of failure points exercised.
uint32_t checkReallocFailures(const Bytes &message);
// The same for a member table walked as walk() walks it.
uint32_t checkReallocFailures(const Bytes &message, const MemberTable &table);

// The decoded-field texts of a message joined by newlines.
std::string textDump(const Decoded &d);

// ---- Building messages and reading them back -----------------------------------

// A BER element with a definite length (short or long form).
Bytes tlv(uint8_t tag, const Bytes &content);

// A Begin (originating id 01) carrying one Invoke (id 1) of operation `op`
// whose argument octets are `argumentHex`.
Bytes invoke(uint8_t op, std::string_view argumentHex);

// The decoded-field texts from the first field with id `fieldId` on (none
// when there is no such field).
std::vector<std::string> textsFrom(const Decoded &d, uint32_t fieldId);

// The display text of the first field with id `fieldId` ("?" when none).
std::string shownOf(const Decoded &d, uint32_t fieldId);

// The decoded-field texts after the first field with id `fieldId` (
// none when there is no such field).
std::vector<std::string> textsAfter(const Decoded &d, uint32_t fieldId);

// The texts of an Invoke's argument: those after its operation code.
inline std::vector<std::string> argumentTexts(const Decoded &d) { return textsAfter(d, 1066); }

} // namespace camel::test
