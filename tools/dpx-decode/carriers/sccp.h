// SCCP connectionless messages: addresses, user data and the segments of
// an XUDT put back together.
#pragma once

#include <cstdint>
#include <string>
#include <unordered_map>
#include <vector>

#include "bytes.h"

namespace dpxdecode::capture {

namespace sccptype {
inline constexpr uint8_t kUdt = 0x09;
inline constexpr uint8_t kUdts = 0x0A;
inline constexpr uint8_t kXudt = 0x11;
inline constexpr uint8_t kXudts = 0x12;
inline constexpr uint8_t kLudt = 0x13;
inline constexpr uint8_t kLudts = 0x14;
} // namespace sccptype

struct SccpAddress {
    bool hasPointCode = false;
    bool hasSsn = false;
    uint32_t pointCode = 0;
    uint8_t ssn = 0;
    Bytes raw; // the whole address, for telling segments apart
};

struct SccpSegmentation {
    bool present = false;
    bool first = false;
    uint8_t remaining = 0;        // segments still to come after this one
    uint32_t localReference = 0;
};

struct SccpOut {
    Skip skip = Skip::None;
    uint8_t type = 0;
    SccpAddress called;
    SccpAddress calling;
    SccpSegmentation segmentation;
    Bytes data;
};

// UDT, XUDT, LUDT and their service variants.  `ansi`: address indicator
// bits and point codes as in ANSI (SSN before a 24-bit point code).
SccpOut parseSccp(Bytes message, bool ansi);

struct SccpLimits {
    size_t messages = 1024;         // reassemblies in progress at once
    size_t messageBytes = 64u << 10; // largest reassembled message
};

// Puts XUDT (and XUDTS) segments back together, keyed by originating point
// code, calling address and local reference.  A segment out of sequence,
// or one that breaks a limit, drops its message.
class SccpReassembler {
public:
    explicit SccpReassembler(SccpLimits limits = {}) : limits_(limits) {}

    enum class Verdict : uint8_t { Message, Pending, Dropped };

    // `message` stays valid until the next call.
    Verdict add(uint32_t opc, const SccpOut &segment, Bytes &message);
    size_t pending() const { return inProgress_.size(); }

private:
    struct Partial {
        uint8_t remaining = 0;
        uint64_t lastUse = 0;
        std::vector<uint8_t> bytes;
    };
    SccpLimits limits_;
    std::unordered_map<std::string, Partial> inProgress_;
    uint64_t clock_ = 0;
    std::vector<uint8_t> assembled_;
};

} // namespace dpxdecode::capture
