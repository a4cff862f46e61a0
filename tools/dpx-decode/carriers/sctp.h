// SCTP: the DATA chunks of a packet, duplicate TSNs, and user messages
// sent in fragments put back together.
#pragma once

#include <cstdint>
#include <map>
#include <unordered_map>
#include <vector>

#include "bytes.h"

namespace dpxdecode::capture {

struct SctpHeader {
    Skip skip = Skip::None;
    uint16_t sourcePort = 0;
    uint16_t destinationPort = 0;
    uint32_t verificationTag = 0;
    Bytes chunks; // everything after the common header
};

SctpHeader parseSctpHeader(Bytes packet);

struct SctpChunk {
    uint8_t type = 0;
    uint8_t flags = 0;
    Bytes value; // after type, flags and length; without padding
};

// Walks the chunks of a packet.  next() returns false at the end, or with
// skip() set when a chunk runs past the packet (the rest is not read).
class SctpChunkWalker {
public:
    explicit SctpChunkWalker(Bytes chunks) : rest_(chunks) {}
    bool next(SctpChunk &chunk);
    Skip skip() const { return skip_; }

private:
    Bytes rest_;
    Skip skip_ = Skip::None;
};

inline constexpr uint8_t kChunkData = 0;

struct SctpData {
    Skip skip = Skip::None;
    bool unordered = false;
    bool first = false; // B: first fragment
    bool last = false;  // E: last fragment
    uint32_t tsn = 0;
    uint16_t stream = 0;
    uint16_t streamSequence = 0;
    uint32_t protocolId = 0;
    Bytes data;
};

// The fields of a DATA chunk's value (as SctpChunkWalker returns it).
SctpData parseSctpData(uint8_t flags, Bytes value);

// One direction of one association: addresses, ports and verification tag.
struct SctpFlowKey {
    uint8_t addressLength = 0;
    uint8_t source[16] = {};
    uint8_t destination[16] = {};
    uint16_t sourcePort = 0;
    uint16_t destinationPort = 0;
    uint32_t verificationTag = 0;
    bool operator==(const SctpFlowKey &) const = default;
};

struct SctpFlowKeyHash {
    size_t operator()(const SctpFlowKey &k) const;
};

struct SctpLimits {
    size_t flows = 4096;             // directions tracked at once
    size_t messageBytes = 1u << 20;  // largest reassembled user message
    size_t pendingBytes = 16u << 20; // fragments held, all flows together
    uint32_t tsnWindow = 4096;       // TSNs remembered per flow for duplicates
};

// Remembers the TSNs seen per flow and holds fragments until their user
// message is whole.  Memory is bounded by SctpLimits: when a limit is
// reached, held fragments (or whole flows) are dropped and counted.
class SctpReassembler {
public:
    explicit SctpReassembler(SctpLimits limits = {}) : limits_(limits) {}

    enum class Verdict : uint8_t {
        Message,   // `message` holds a whole user message
        Pending,   // a fragment was kept; its message is not whole yet
        Duplicate, // this TSN was seen before on this flow
        Dropped,   // a fragment that broke a limit, or its message did
    };

    // Takes one DATA chunk.  `message` stays valid until the next call.
    Verdict add(const SctpFlowKey &flow, const SctpData &chunk, Bytes &message);

    // Fragments and bytes held now.
    size_t pendingFragments() const;
    size_t pendingBytes() const { return pendingBytes_; }

private:
    struct Fragment {
        bool first = false;
        bool last = false;
        std::vector<uint8_t> bytes;
    };
    struct Flow {
        bool started = false;
        uint32_t highest = 0;           // highest TSN seen
        std::vector<uint64_t> seen;     // bit per TSN below and at `highest`
        std::map<uint32_t, Fragment> fragments; // by TSN
        uint64_t lastUse = 0;
    };

    bool seenBefore(Flow &flow, uint32_t tsn);
    void dropFragments(Flow &flow);
    Flow &flowFor(const SctpFlowKey &key);

    SctpLimits limits_;
    std::unordered_map<SctpFlowKey, Flow, SctpFlowKeyHash> flows_;
    size_t pendingBytes_ = 0;
    uint64_t clock_ = 0;
    std::vector<uint8_t> assembled_;
};

} // namespace dpxdecode::capture
