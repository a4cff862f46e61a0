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
    IpOut o;
    // More fragments, or an offset: a piece of a larger packet.
    const uint16_t flagsOffset = p.be16(6);
    o.fragment = (flagsOffset & 0x3FFF) != 0;
    o.moreFragments = (flagsOffset & 0x2000) != 0;
    o.fragmentOffset = uint32_t(flagsOffset & 0x1FFF) * 8;
    o.identification = p.be16(4);
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
    return ipv6Upper(o, p.u8(6), p.sub(40, payloadLength));
}

IpOut ipv6Upper(IpOut o, uint8_t next, Bytes rest) {
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
        case 44: // fragment: an atomic fragment (offset 0, no more) is whole
        {
            if (!rest.has(0, 8))
                return skipped(Skip::Ipv6Truncated);
            const uint16_t offsetFlags = rest.be16(2);
            if ((offsetFlags & 0xFFF9) != 0) {
                if (o.fragment) // a fragment header inside a reassembled datagram
                    return skipped(Skip::Ipv6Truncated);
                o.fragment = true;
                o.moreFragments = (offsetFlags & 1) != 0;
                o.fragmentOffset = offsetFlags & 0xFFF8;
                o.identification = rest.be32(4);
                o.protocol = rest.u8(0);
                o.payload = rest.from(8);
                return o;
            }
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
