// What the dialogue layer, the filters and the follow-a-call views need to
// know about one message, read once out of the session's results: the
// decoded-field records (by field id), the key entries and where the message
// came from.  No view reads another view's text.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "input/input.h"
#include "module.h"

namespace dpxdecode::dialogues {

// One end of a TCAP dialogue: an SCCP user at a point code.
struct End {
    bool hasPc = false;
    uint32_t pc = 0;
    bool hasSsn = false;
    uint8_t ssn = 0;
    bool operator==(const End &o) const {
        return hasPc == o.hasPc && pc == o.pc && hasSsn == o.hasSsn && ssn == o.ssn;
    }
};

enum class MessageType : uint8_t { Unknown, Unidirectional, Begin, End, Continue, Abort };
const char *messageTypeName(MessageType t);

struct Component {
    enum class Kind : uint8_t { Invoke, Result, Error, Reject } kind = Kind::Invoke;
    bool hasInvokeId = false;
    int32_t invokeId = 0;
    int32_t code = -1; // operation code (invoke, result) or error code; -1 when not decoded
    std::string name;  // the module's name for the code or the reject problem
};

// A value met inside a component, with the operation of the Invoke it was
// found in (-1 outside any Invoke).
struct ValueIn {
    uint32_t value = 0;
    int32_t operation = -1;
    std::string name;
};

struct MessageFacts {
    uint64_t index = 0; // among the messages decoded, from 0
    bool hasOrigin = false;
    uint64_t frame = 0;
    int64_t seconds = 0;
    uint32_t nanoseconds = 0;
    End from, to; // sender (calling address, OPC) and receiver (called address, DPC)

    MessageType type = MessageType::Unknown;
    std::string otid, dtid; // hexadecimal as received; empty when absent
    std::vector<Component> components;

    // Key fields: digit strings, empty when the message carries none.
    std::string imsi, called, calling, charge;
    std::vector<ValueIn> causes;     // every Cause value
    std::vector<ValueIn> eventTypes; // every BCSM event type
    bool hasServiceKey = false;
    uint32_t serviceKey = 0;
    std::string abortCause; // P-Abort cause name, or "user abort" for an ABRT dialogue PDU

    std::string applicationContext; // dotted object identifier; empty without one
    std::string contextName;        // the module's name for it
    int capVersion = 0;             // 1-4 from the application context, 0 unknown

    double time() const { return double(seconds) + nanoseconds / 1e9; }
    // Nanoseconds since the epoch, for exact differences.
    int64_t timeNs() const { return seconds * 1000000000LL + nanoseconds; }
};

// Fills `out` from the decoded-field and key-field passes of one message
// (either may be missing: what it would give stays empty).  `bytes` is the
// message, for the application context's octets.
void extractFacts(uint64_t index, const uint8_t *bytes, size_t size, const MessageResult &result,
                  const CaptureOrigin *origin, MessageFacts &out);

// CAP phase of an application-context object identifier's octets
// (04 00 00 01 x y z): 1-4, or 0 when it is not a CAP context.
int capVersionOf(const uint8_t *oid, size_t size);

// Digits of a packed key value (half-octet digits, right-aligned in whole
// octets): `hex` as dpx-decode shows key values, `bits` the value's length.
std::string keyDigits(const std::string &hex, uint32_t bits);

} // namespace dpxdecode::dialogues
