// From a captured frame to the TCAP messages in it: link layer, IP, SCTP,
// the SIGTRAN adaptation or MTP2, MTP3, SCCP.  Reassembly state (SCTP
// fragments and duplicates, XUDT segments) lives here between frames.
#pragma once

#include <array>
#include <bitset>
#include <cstdint>

#include "bytes.h"
#include "ip_fragments.h"
#include "sccp.h"
#include "sctp.h"
#include "tcap.h"

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
    GlobalTitle calledGt; // size 0 when the address has none
    GlobalTitle callingGt;
};

struct WalkOptions {
    bool ansi = false;        // ANSI MTP3 routing label and SCCP addresses
    std::bitset<256> ssns;    // a message is taken when either SSN is here
    // ... and, on any other SSN, when its dialogue is CAMEL (CamelDialogues).
    bool camelDialogues = true;
    SctpLimits sctp;
    SccpLimits sccp;
    IpFragmentLimits ip;
    WalkOptions() { ssns.set(146); }
};

// SCCP messages read (each XUDT segment counted), by called SSN.
struct SccpCounts {
    std::array<uint64_t, 256> byCalledSsn{};
    uint64_t withoutSsn = 0;
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
        : options_(options), ip_(options.ip, skips_), sctp_(options.sctp), sccp_(options.sccp) {}
    FrameWalker(const FrameWalker &) = delete;
    FrameWalker &operator=(const FrameWalker &) = delete;

    // Hands every TCAP message of the frame to `sink`, in order; the
    // message's bytes are valid during the call only.  Returns the number
    // of messages found.
    size_t walk(uint32_t linkType, Bytes frame, MessageSink &sink);

    // Counts the IP fragments still waiting for the rest of their datagram
    // (the capture has ended) and forgets them.
    void endCapture() { ip_.finish(); }

    // Forgets reassembly state, TSNs and dialogues: the next frame starts a
    // capture of its own.  The counts go on.
    void newCapture() {
        endCapture();
        sctp_ = SctpReassembler(options_.sctp);
        sccp_ = SccpReassembler(options_.sccp);
        dialogues_ = CamelDialogues();
    }

    // Skips by reason since construction.
    const std::array<uint64_t, kSkipCount> &skips() const { return skips_; }
    const SccpCounts &sccpCounts() const { return sccpCounts_; }

private:
    struct Origin {
        bool hasPointCodes = false;
        uint32_t opc = 0;
        uint32_t dpc = 0;
    };
    void count(Skip s) { ++skips_[size_t(s)]; }
    void mtp3(Bytes msu, MessageSink &sink);
    void sccp(Bytes message, const Origin &origin, MessageSink &sink);
    void ip(IpOut ip, MessageSink &sink);
    void sctp(const IpOut &ip, MessageSink &sink);
    void userMessage(uint32_t protocolId, uint16_t sport, uint16_t dport, Bytes message, MessageSink &sink);
    void countSsn(bool hasSsn, uint8_t ssn);
    bool listed(const TcapMessage &m) const;
    bool taken(const TcapMessage &m);
    void emit(const TcapMessage &m, MessageSink &sink);

    WalkOptions options_;
    std::array<uint64_t, kSkipCount> skips_{};
    IpReassembler ip_;
    SctpReassembler sctp_;
    SccpReassembler sccp_;
    CamelDialogues dialogues_;
    SccpCounts sccpCounts_;
    uint64_t frames_ = 0;
    size_t found_ = 0;
};

} // namespace dpxdecode::capture
