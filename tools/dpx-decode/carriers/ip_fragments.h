// IPv4 and IPv6 datagrams sent in fragments, put back together.
#pragma once

#include <array>
#include <cstdint>
#include <vector>

#include "bytes.h"
#include "ip.h"

namespace dpxdecode::capture {

struct IpFragmentLimits {
    size_t datagrams = 256;             // in reassembly at once
    size_t pendingBytes = 8u << 20;     // held, all datagrams together
    uint64_t timeoutFrames = 10000;     // frames a datagram may take to become whole
};

// Holds fragments until their datagram is whole.  A datagram is keyed by
// its addresses, its identification and (IPv4) its protocol.  Fragments
// may come in any order; a fragment whose octets were all seen before is a
// duplicate, and overlapping fragments are taken when the octets they share
// are equal.  A datagram is dropped, and every fragment of it counted under
// one reason, when fragments overlap with different octets, when one lies
// past the end the last fragment set or past 65535 octets, when it is not
// whole `timeoutFrames` frames after its first fragment (or at the end of
// the capture), or when the limits leave no room.  Memory is bounded by
// IpFragmentLimits; buffers are kept and reused.
class IpReassembler {
public:
    using Counts = std::array<uint64_t, kSkipCount>;

    IpReassembler(IpFragmentLimits limits, Counts &skips) : limits_(limits), skips_(&skips) {}

    enum class Verdict : uint8_t {
        Packet,  // `whole` holds the datagram (its payload valid until the next call)
        Pending, // kept; the datagram is not whole yet
        Dropped, // counted in the skips
    };

    // Takes one fragment (parseIpv4 or parseIpv6 set `fragment`) of frame
    // number `frame` (frame numbers never go down).
    Verdict add(const IpOut &fragment, uint64_t frame, IpOut &whole);

    // Counts every fragment still held as never completed and forgets it:
    // the capture has ended.
    void finish();

    size_t pendingDatagrams() const;
    size_t pendingBytes() const { return pendingBytes_; }

private:
    struct Range {
        uint32_t begin, end;
    };
    struct Datagram {
        bool used = false;
        bool poisoned = false; // dropped: later fragments are counted, not kept
        Skip reason = Skip::None;
        uint8_t addressLength = 0;
        uint8_t source[16] = {};
        uint8_t destination[16] = {};
        uint32_t identification = 0;
        uint8_t protocol = 0; // IPv4: part of the key; IPv6: from the first fragment
        bool haveFirst = false;
        bool haveLast = false;
        uint32_t total = 0; // octets, once the last fragment is in
        uint64_t firstFrame = 0;
        uint32_t fragments = 0;
        std::vector<Range> ranges; // received, sorted, merged
        std::vector<uint8_t> bytes;
        size_t held = 0; // octets of `bytes` counted in pendingBytes_
    };

    Datagram *find(const IpOut &f);
    Datagram *open(const IpOut &f, uint64_t frame);
    void expire(uint64_t frame);
    void drop(Datagram &d, Skip reason, bool keepPoisoned);
    void release(Datagram &d);
    Verdict place(Datagram &d, const IpOut &f);

    IpFragmentLimits limits_;
    Counts *skips_;
    std::vector<Datagram> slots_;
    size_t pendingBytes_ = 0;
};

} // namespace dpxdecode::capture
