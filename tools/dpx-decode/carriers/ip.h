// IPv4 and IPv6 down to their transport payload.
#pragma once

#include "bytes.h"

namespace dpxdecode::capture {

inline constexpr uint8_t kProtocolSctp = 132;

struct IpOut {
    Skip skip = Skip::None;
    uint8_t protocol = 0;
    uint8_t addressLength = 0; // 4 or 16
    uint8_t source[16] = {};
    uint8_t destination[16] = {};
    Bytes payload;
    // A piece of a larger datagram: `payload` is this piece, at
    // `fragmentOffset` octets into the datagram's payload.  For IPv6,
    // `protocol` is the next header after the fragment header.
    bool fragment = false;
    bool moreFragments = false;
    uint32_t fragmentOffset = 0;
    uint32_t identification = 0;
};

// The header with its options is stripped, link-layer padding after the
// total length is cut off.  Any protocol is returned: the caller decides
// what it takes.
IpOut parseIpv4(Bytes packet);

// Hop-by-hop, routing, destination-option and authentication headers are
// stepped over, and a fragment header of an atomic fragment.
IpOut parseIpv6(Bytes packet);

// The extension headers of a reassembled IPv6 datagram's payload, whose
// first header is `next`, stepped over: `packet` with its protocol and
// payload set, or skipped (Ipv6Truncated).
IpOut ipv6Upper(IpOut packet, uint8_t next, Bytes payload);

} // namespace dpxdecode::capture
