#include "ip.h"

#include <cstring>

namespace dpxdecode::capture {
namespace {

IpOut skipped(Skip s) {
    IpOut o;
    o.skip = s;
    return o;
}

} // namespace

IpOut parseIpv4(Bytes p) {
    if (!p.has(0, 20) || (p.u8(0) >> 4) != 4)
        return skipped(Skip::Ipv4Truncated);
    const size_t headerLength = size_t(p.u8(0) & 0x0F) * 4;
    const size_t total = p.be16(2);
    if (headerLength < 20 || total < headerLength || total > p.size)
        return skipped(Skip::Ipv4Truncated);
    // More fragments, or an offset: a piece of a larger packet.
    if ((p.be16(6) & 0x3FFF) != 0)
        return skipped(Skip::Ipv4Fragment);
    IpOut o;
    o.protocol = p.u8(9);
    o.addressLength = 4;
    std::memcpy(o.source, p.data + 12, 4);
    std::memcpy(o.destination, p.data + 16, 4);
    o.payload = p.sub(headerLength, total - headerLength);
    return o;
}

IpOut parseIpv6(Bytes p) {
    if (!p.has(0, 40) || (p.u8(0) >> 4) != 6)
        return skipped(Skip::Ipv6Truncated);
    const size_t payloadLength = p.be16(4);
    // A zero payload length is a jumbogram; those do not carry signalling.
    if (payloadLength == 0 || !p.has(40, payloadLength))
        return skipped(Skip::Ipv6Truncated);
    IpOut o;
    o.addressLength = 16;
    std::memcpy(o.source, p.data + 8, 16);
    std::memcpy(o.destination, p.data + 24, 16);
    Bytes rest = p.sub(40, payloadLength);
    uint8_t next = p.u8(6);
    for (;;) {
        switch (next) {
        case 0:  // hop-by-hop options
        case 43: // routing
        case 60: // destination options: length in 8-octet units, minus 1
        case 51: // authentication header: length in 4-octet units, minus 2
        {
            if (!rest.has(0, 2))
                return skipped(Skip::Ipv6Truncated);
            const size_t units = rest.u8(1);
            const size_t length = next == 51 ? (units + 2) * 4 : (units + 1) * 8;
            if (!rest.has(0, length))
                return skipped(Skip::Ipv6Truncated);
            next = rest.u8(0);
            rest = rest.from(length);
            continue;
        }
        case 44: // fragment: only an atomic fragment (offset 0, no more) is whole
        {
            if (!rest.has(0, 8))
                return skipped(Skip::Ipv6Truncated);
            if ((rest.be16(2) & 0xFFF9) != 0)
                return skipped(Skip::Ipv6Fragment);
            next = rest.u8(0);
            rest = rest.from(8);
            continue;
        }
        default:
            o.protocol = next;
            o.payload = rest;
            return o;
        }
    }
}

} // namespace dpxdecode::capture
