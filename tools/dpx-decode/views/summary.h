// --summary and --stats: one line (or JSON object) per message and counts
// at the end, made from the decoded-field pass's own fields.
#pragma once

#include <cstdint>
#include <iosfwd>
#include <map>
#include <string>
#include <vector>

#include "input/input.h"
#include "module.h"

namespace dpxdecode {

class TimeFormatter;

// What one component says, by name where the module names it.  Empty
// strings: not in the message.
struct ComponentSummary {
    enum class Kind : uint8_t { Invoke, Result, Error, Reject } kind = Kind::Invoke;
    std::string invokeId;
    std::string name; // operation, result's operation, error or reject problem
    std::string serviceKey;
    std::string imsi;
    std::string called;
    std::string calling;
    std::string cause; // release or other cause value
    std::string event; // BCSM event types, ", " between several (an armed list)
    uint32_t eventCount = 0;
};

struct MessageSummary {
    std::string type; // "Begin", ...; empty when the pass found none
    std::string otid;
    std::string dtid;
    std::string capVersion; // "CAP v2", ...: from the dialogue's application context
    std::string abortCause; // P-Abort cause
    uint32_t errorFlags = 0;
    // The first `componentCount` entries are this message's; the vector
    // keeps the others' strings for the next message.
    std::vector<ComponentSummary> components;
    size_t componentCount = 0;
};

const char *componentKindName(ComponentSummary::Kind kind);

// Reads the message type, transaction ids, dialogue and components out of
// the decoded-field records.  Fields the module does not produce are left
// empty.
void summarize(const MdOut &md, MessageSummary &out);

// Text: "frame 12 2026-01-01T00:00:00.011000Z pc 100>200 ssn 146>146 gt
// 4912345>- Begin otid=01020304 dtid=- CAP v2 | invoke 1 Initial DP sk=7
// imsi=262011234567890 called=4912345".  Without a capture the message
// index stands in for the frame, time and addresses.  JSON: one object a
// line with the same content.
void writeSummary(std::ostream &os, uint64_t index, const CaptureOrigin *origin, const MessageSummary &s,
                  TimeFormatter &time, bool json);

class Statistics {
public:
    void add(const MessageSummary &s);
    // Text: one "what name: count" line each; JSON: one object.
    void write(std::ostream &os, const InputReport &input, bool json) const;

private:
    uint64_t messages_ = 0;
    std::map<std::string, uint64_t> types_, versions_, operations_, results_, errors_, rejects_, serviceKeys_,
        causes_, events_, flags_;
};

} // namespace dpxdecode
