#include "link.h"

namespace dpxdecode::capture {
namespace {

constexpr uint16_t kEtherIpv4 = 0x0800;
constexpr uint16_t kEtherIpv6 = 0x86DD;

bool isVlanTag(uint16_t type) { return type == 0x8100 || type == 0x88A8 || type == 0x9100; }

LinkOut byEtherType(uint16_t type, Bytes payload) {
    if (type == kEtherIpv4)
        return LinkOut{Skip::None, Network::Ipv4, payload};
    if (type == kEtherIpv6)
        return LinkOut{Skip::None, Network::Ipv6, payload};
    return LinkOut{Skip::LinkNotIpOrSs7, Network::Ipv4, {}};
}

LinkOut truncated() { return LinkOut{Skip::LinkTruncated, Network::Ipv4, {}}; }

LinkOut ethernet(Bytes f) {
    size_t at = 12;
    if (!f.has(at, 2))
        return truncated();
    uint16_t type = f.be16(at);
    // 802.1Q, 802.1ad (QinQ) and the older QinQ type: four octets each.
    while (isVlanTag(type)) {
        at += 4;
        if (!f.has(at, 2))
            return truncated();
        type = f.be16(at);
    }
    return byEtherType(type, f.from(at + 2));
}

// BSD loopback: the address family in four octets, in the capturing host's
// byte order (kNull) or in network order (kLoop).
LinkOut loopback(Bytes f, bool networkOrder) {
    if (!f.has(0, 4))
        return truncated();
    const uint32_t family = networkOrder ? f.be32(0) : (f.le32(0) > 0xFFFF ? f.be32(0) : f.le32(0));
    const Bytes p = f.from(4);
    if (family == 2)
        return LinkOut{Skip::None, Network::Ipv4, p};
    // AF_INET6 differs between systems: Linux, BSD, FreeBSD, Darwin.
    if (family == 10 || family == 24 || family == 28 || family == 30)
        return LinkOut{Skip::None, Network::Ipv6, p};
    return LinkOut{Skip::LinkNotIpOrSs7, Network::Ipv4, {}};
}

LinkOut rawIp(Bytes f) {
    if (!f.has(0, 1))
        return truncated();
    switch (f.u8(0) >> 4) {
    case 4:
        return LinkOut{Skip::None, Network::Ipv4, f};
    case 6:
        return LinkOut{Skip::None, Network::Ipv6, f};
    default:
        return LinkOut{Skip::LinkNotIpOrSs7, Network::Ipv4, {}};
    }
}

LinkOut fromMtp2(Inner in) { return LinkOut{in.skip, Network::Mtp3, in.bytes}; }

} // namespace

Inner parseMtp2(Bytes u, bool extended) {
    // BSN/BIB, FSN/FIB, length indicator: one octet each, or two each with
    // extended sequence numbers (9-bit length indicator).
    const size_t header = extended ? 6 : 3;
    if (!u.has(0, header))
        return Inner{Skip::Mtp2Truncated, {}};
    const size_t li = extended ? (u.le16(4) & 0x1FF) : (u.u8(2) & 0x3F);
    if (li < 3)
        return Inner{Skip::Mtp2NotMsu, {}}; // fill-in (0) or link status (1, 2)
    Bytes msu = u.from(header);
    // A length indicator below its maximum is exact: what follows is a
    // check sequence or padding.
    const size_t liMax = extended ? 0x1FF : 63;
    if (li < liMax) {
        if (msu.size < li)
            return Inner{Skip::Mtp2Truncated, {}};
        msu.size = li;
    }
    return Inner{Skip::None, msu};
}

LinkOut parseLink(uint32_t linkType, Bytes f) {
    switch (linkType) {
    case linktype::kEthernet:
        return ethernet(f);
    case linktype::kLinuxSll:
        if (!f.has(0, 16))
            return truncated();
        return byEtherType(f.be16(14), f.from(16));
    case linktype::kLinuxSll2:
        if (!f.has(0, 20))
            return truncated();
        return byEtherType(f.be16(0), f.from(20));
    case linktype::kRaw:
    case linktype::kRawOpenBsd:
    case linktype::kRawBsd:
        return rawIp(f);
    case linktype::kIpv4:
        return LinkOut{Skip::None, Network::Ipv4, f};
    case linktype::kIpv6:
        return LinkOut{Skip::None, Network::Ipv6, f};
    case linktype::kNull:
        return loopback(f, false);
    case linktype::kLoop:
        return loopback(f, true);
    case linktype::kMtp2:
        return fromMtp2(parseMtp2(f, false));
    case linktype::kMtp2WithPhdr: {
        // Pseudo-header: SAPI, Annex A in use (1) or not, link number.
        if (!f.has(0, 4))
            return truncated();
        return fromMtp2(parseMtp2(f.from(4), f.u8(1) == 1));
    }
    case linktype::kMtp3:
        return LinkOut{Skip::None, Network::Mtp3, f};
    default:
        return LinkOut{Skip::LinkTypeUnsupported, Network::Ipv4, {}};
    }
}

} // namespace dpxdecode::capture
