// --summary and --stats: one line per message and counts at the end, made
// from the decoded-field pass's own fields.
#pragma once

#include <cstdint>
#include <iosfwd>
#include <map>
#include <string>
#include <vector>

#include "input/input.h"
#include "module.h"

namespace dpxdecode {

struct ComponentSummary {
    enum class Kind : uint8_t { Invoke, Result, Error, Reject } kind = Kind::Invoke;
    std::string invokeId;
    std::string name; // operation, error or reject problem; empty when not decoded
};

struct MessageSummary {
    std::string type; // "Begin", ...; empty when the pass found none
    std::string otid;
    std::string dtid;
    std::vector<ComponentSummary> components;
};

// Reads the message type, transaction ids and components out of the
// decoded-field records.  Fields the module does not produce are left
// empty.
void summarize(const MdOut &md, MessageSummary &out);

// "frame 12 1700000000.000000000 Begin otid=01020304 dtid=- | invoke 1
// InitialDP | result 1 | error 3 12 | reject 5 Return Result Unexpected".
// Without a capture the message index stands in for the frame and time.
void writeSummary(std::ostream &os, uint64_t index, const CaptureOrigin *origin, const MessageSummary &s);

class Statistics {
public:
    void add(const MessageSummary &s, uint32_t errorFlags);
    // Text: one "what name: count" line each; JSON: one object.
    void write(std::ostream &os, const InputReport &input, bool json) const;

private:
    uint64_t messages_ = 0;
    std::map<std::string, uint64_t> types_, operations_, results_, errors_, rejects_, flags_;
};

} // namespace dpxdecode
