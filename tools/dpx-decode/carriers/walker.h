// From a captured frame to the TCAP messages in it: link layer, IP, SCTP,
// the SIGTRAN adaptation or MTP2, MTP3, SCCP.  Reassembly state (SCTP
// fragments and duplicates, XUDT segments) lives here between frames.
#pragma once

#include <array>
#include <bitset>
#include <cstdint>

#include "bytes.h"
#include "sccp.h"
#include "sctp.h"

namespace dpxdecode::capture {

// Where a TCAP message came from.
struct TcapMessage {
    Bytes tcap;
    bool hasPointCodes = false;
    uint32_t opc = 0;
    uint32_t dpc = 0;
    bool hasCalledSsn = false;
    bool hasCallingSsn = false;
    uint8_t calledSsn = 0;
    uint8_t callingSsn = 0;
};

struct WalkOptions {
    bool ansi = false;        // ANSI MTP3 routing label and SCCP addresses
    std::bitset<256> ssns;    // a message is taken when either SSN is here
    SctpLimits sctp;
    SccpLimits sccp;
    WalkOptions() { ssns.set(146); }
};

class MessageSink {
public:
    virtual void onTcap(const TcapMessage &message) = 0;

protected:
    ~MessageSink() = default;
};

class FrameWalker {
public:
    explicit FrameWalker(const WalkOptions &options = {})
        : options_(options), sctp_(options.sctp), sccp_(options.sccp) {}

    // Hands every TCAP message of the frame to `sink`, in order; the
    // message's bytes are valid during the call only.  Returns the number
    // of messages found.
    size_t walk(uint32_t linkType, Bytes frame, MessageSink &sink);

    // Forgets reassembly state and TSNs: the next frame starts a capture
    // of its own.  The skip counts go on.
    void newCapture() {
        sctp_ = SctpReassembler(options_.sctp);
        sccp_ = SccpReassembler(options_.sccp);
    }

    // Skips by reason since construction.
    const std::array<uint64_t, kSkipCount> &skips() const { return skips_; }

private:
    struct Origin {
        bool hasPointCodes = false;
        uint32_t opc = 0;
        uint32_t dpc = 0;
    };
    void count(Skip s) { ++skips_[size_t(s)]; }
    void mtp3(Bytes msu, MessageSink &sink);
    void sccp(Bytes message, const Origin &origin, MessageSink &sink);
    void sctp(const struct IpOut &ip, MessageSink &sink);
    void userMessage(uint32_t protocolId, uint16_t sport, uint16_t dport, Bytes message, MessageSink &sink);
    bool selected(const TcapMessage &m);
    void emit(const TcapMessage &m, MessageSink &sink);

    WalkOptions options_;
    SctpReassembler sctp_;
    SccpReassembler sccp_;
    std::array<uint64_t, kSkipCount> skips_{};
    size_t found_ = 0;
};

} // namespace dpxdecode::capture
