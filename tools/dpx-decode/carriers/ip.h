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
};

// The header with its options is stripped, link-layer padding after the
// total length is cut off; fragments are skipped (Ipv4Fragment).  Any
// protocol is returned: the caller decides what it takes.
IpOut parseIpv4(Bytes packet);

// Hop-by-hop, routing, destination-option and authentication headers are
// stepped over; a fragment of a larger packet is skipped (Ipv6Fragment).
IpOut parseIpv6(Bytes packet);

} // namespace dpxdecode::capture
