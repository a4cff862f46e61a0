#include "capture_writer.h"

#include <algorithm>
#include <array>
#include <cstdlib>

namespace capwrite {

namespace {

void put8(Bytes &b, unsigned v) { b.push_back(static_cast<std::uint8_t>(v)); }
void put16(Bytes &b, unsigned v) {
    put8(b, v >> 8);
    put8(b, v);
}
void put32(Bytes &b, std::uint32_t v) {
    put16(b, v >> 16);
    put16(b, v & 0xFFFF);
}
void put16le(Bytes &b, unsigned v) {
    put8(b, v);
    put8(b, v >> 8);
}
void put32le(Bytes &b, std::uint32_t v) {
    put16le(b, v & 0xFFFF);
    put16le(b, v >> 16);
}
void append(Bytes &b, View v) { b.insert(b.end(), v.begin(), v.end()); }
void pad4(Bytes &b) {
    while (b.size() % 4)
        b.push_back(0);
}
void set16(Bytes &b, std::size_t at, unsigned v) {
    b[at] = static_cast<std::uint8_t>(v >> 8);
    b[at + 1] = static_cast<std::uint8_t>(v);
}

// SIGTRAN: common header (version 1) and one tag-length-value parameter,
// padded to four octets; the length counts the header, not the padding.
Bytes sigtranMessage(unsigned msgClass, unsigned msgType, View body) {
    Bytes b;
    put8(b, 1);
    put8(b, 0);
    put8(b, msgClass);
    put8(b, msgType);
    put32(b, static_cast<std::uint32_t>(8 + body.size()));
    append(b, body);
    return b;
}
void sigtranParam(Bytes &b, unsigned tag, View value) {
    put16(b, tag);
    put16(b, static_cast<unsigned>(4 + value.size()));
    append(b, value);
    pad4(b);
}
Bytes word(std::uint32_t v) {
    Bytes b;
    put32(b, v);
    return b;
}

std::uint8_t protocolClass(const SccpOptions &o, unsigned cls) {
    return static_cast<std::uint8_t>(cls | (o.returnOnError ? 0x80 : 0));
}

void checkFits(std::size_t n, std::size_t max, const char *what) {
    if (n > max)
        throw CarrierError(std::string(what) + ": " + std::to_string(n) + " octets, at most " +
                           std::to_string(max) + " fit");
}

// SCCP called and calling party addresses, each after its length octet.
void putAddresses(Bytes &b, const Bytes &called, const Bytes &calling) {
    put8(b, static_cast<unsigned>(called.size()));
    append(b, called);
    put8(b, static_cast<unsigned>(calling.size()));
    append(b, calling);
}

std::uint16_t ipChecksum(View header) {
    std::uint32_t sum = 0;
    for (std::size_t i = 0; i + 1 < header.size(); i += 2)
        sum += static_cast<std::uint32_t>(header[i] << 8 | header[i + 1]);
    while (sum >> 16)
        sum = (sum & 0xFFFF) + (sum >> 16);
    return static_cast<std::uint16_t>(~sum);
}

} // namespace

// ---- SCCP ------------------------------------------------------------------

Bytes sccpAddress(const SccpAddress &a, bool ansi) {
    Bytes b;
    if (ansi) {
        // national, route on SSN, SSN indicator bit 1, PC indicator bit 2;
        // SSN before the 24-bit point code.
        put8(b, 0xC1 | (a.withPc ? 0x02 : 0));
        put8(b, a.ssn);
        if (a.withPc) {
            put16le(b, a.pc & 0xFFFF);
            put8(b, (a.pc >> 16) & 0xFF);
        }
    } else {
        // route on SSN, SSN indicator bit 2, PC indicator bit 1; the 14-bit
        // point code before the SSN.
        put8(b, 0x42 | (a.withPc ? 0x01 : 0));
        if (a.withPc)
            put16le(b, a.pc & 0x3FFF);
        put8(b, a.ssn);
    }
    return b;
}

Bytes sccpUdt(View data, const SccpAddress &called, const SccpAddress &calling, const SccpOptions &o) {
    const Bytes cd = sccpAddress(called, o.ansi), cg = sccpAddress(calling, o.ansi);
    checkFits(data.size(), 255, "UDT data");
    // Each pointer counts from itself to the length octet of its part.
    Bytes b{0x09, protocolClass(o, 0), 3, static_cast<std::uint8_t>(3 + cd.size()),
            static_cast<std::uint8_t>(3 + cd.size() + cg.size())};
    putAddresses(b, cd, cg);
    put8(b, static_cast<unsigned>(data.size()));
    append(b, data);
    return b;
}

Bytes sccpXudt(View data, const SccpAddress &called, const SccpAddress &calling, const SccpOptions &o,
               const XudtSegment *segment) {
    const Bytes cd = sccpAddress(called, o.ansi), cg = sccpAddress(calling, o.ansi);
    const std::size_t toOptional = 4 + cd.size() + cg.size() + data.size();
    checkFits(data.size(), 255, "XUDT data");
    if (segment) // the optional part's pointer is one octet too
        checkFits(toOptional, 255, "XUDT data and addresses");
    Bytes b{0x11, protocolClass(o, segment ? 1 : 0), o.hopCounter, 4, static_cast<std::uint8_t>(4 + cd.size()),
            static_cast<std::uint8_t>(4 + cd.size() + cg.size()),
            static_cast<std::uint8_t>(segment ? toOptional : 0)};
    putAddresses(b, cd, cg);
    put8(b, static_cast<unsigned>(data.size()));
    append(b, data);
    if (segment) {
        // Segmentation: F (first) bit 8, C (in-sequence class) bit 7,
        // remaining segments in bits 1-4, then the 24-bit local reference.
        put8(b, 0x10);
        put8(b, 4);
        put8(b, (segment->first ? 0x80 : 0) | 0x40 | (segment->remaining & 0x0F));
        put16le(b, segment->localRef & 0xFFFF);
        put8(b, (segment->localRef >> 16) & 0xFF);
        put8(b, 0); // end of optional parameters
    }
    return b;
}

std::vector<Bytes> sccpXudtSegments(View data, const SccpAddress &called, const SccpAddress &calling,
                                    const SccpOptions &o, std::size_t maxData, std::uint32_t localRef) {
    if (maxData == 0 || data.size() <= maxData)
        return {sccpXudt(data, called, calling, o)};
    const std::size_t count = (data.size() + maxData - 1) / maxData;
    if (count > 16)
        throw CarrierError("XUDT segmentation: " + std::to_string(count) + " segments of " + std::to_string(maxData) +
                           " octets, at most 16");
    std::vector<Bytes> out;
    for (std::size_t i = 0; i < count; ++i) {
        const XudtSegment seg{i == 0, static_cast<std::uint8_t>(count - 1 - i), localRef};
        const std::size_t at = i * maxData;
        out.push_back(sccpXudt(data.subspan(at, std::min(maxData, data.size() - at)), called, calling, o, &seg));
    }
    return out;
}

Bytes sccpLudt(View data, const SccpAddress &called, const SccpAddress &calling, const SccpOptions &o) {
    const Bytes cd = sccpAddress(called, o.ansi), cg = sccpAddress(calling, o.ansi);
    checkFits(data.size(), 3952, "LUDT data");
    // Two-octet pointers, least significant octet first, counted from the
    // pointer's second octet (as the reference decoder reads them).
    Bytes b{0x13, protocolClass(o, 0), o.hopCounter};
    const std::size_t p1 = 7, p2 = p1 - 2 + 1 + cd.size(), p3 = p2 - 2 + 1 + cg.size();
    put16le(b, static_cast<unsigned>(p1));
    put16le(b, static_cast<unsigned>(p2));
    put16le(b, static_cast<unsigned>(p3));
    put16le(b, 0);
    putAddresses(b, cd, cg);
    put16le(b, static_cast<unsigned>(data.size()));
    append(b, data);
    return b;
}

// ---- MTP -------------------------------------------------------------------

Bytes mtp3(const RoutingLabel &l, View sif, std::uint8_t si) {
    Bytes b;
    put8(b, static_cast<unsigned>((l.ni & 3) << 6 | (si & 0x0F)));
    if (l.ansi) {
        put16le(b, l.dpc & 0xFFFF);
        put8(b, (l.dpc >> 16) & 0xFF);
        put16le(b, l.opc & 0xFFFF);
        put8(b, (l.opc >> 16) & 0xFF);
        put8(b, l.sls & 0x1F);
    } else {
        put32le(b, (l.dpc & 0x3FFF) | (l.opc & 0x3FFF) << 14 | static_cast<std::uint32_t>(l.sls & 0x0F) << 28);
    }
    append(b, sif);
    return b;
}

Bytes mtp2(View msu, std::uint8_t fsn, std::uint8_t bsn) {
    Bytes b{static_cast<std::uint8_t>(0x80 | (bsn & 0x7F)), static_cast<std::uint8_t>(0x80 | (fsn & 0x7F)),
            static_cast<std::uint8_t>(std::min<std::size_t>(msu.size(), 63))};
    append(b, msu);
    return b;
}

Bytes mtp2PseudoHeader(bool sent, std::uint16_t linkNumber, bool annexA) {
    Bytes b{static_cast<std::uint8_t>(sent), static_cast<std::uint8_t>(annexA)};
    put16(b, linkNumber);
    return b;
}

// ---- SIGTRAN -------------------------------------------------------------

Bytes m3uaData(const RoutingLabel &l, View sccp, std::uint32_t routingContext) {
    Bytes body;
    sigtranParam(body, 0x0006, word(routingContext));
    Bytes pd = word(l.opc);
    put32(pd, l.dpc);
    put8(pd, kServiceSccp);
    put8(pd, l.ni);
    put8(pd, 0); // message priority
    put8(pd, l.sls);
    append(pd, sccp);
    sigtranParam(body, 0x0210, pd);
    return sigtranMessage(1, 1, body);
}

Bytes m2uaData(View msu, std::uint32_t interfaceId) {
    Bytes body;
    sigtranParam(body, 0x0001, word(interfaceId));
    sigtranParam(body, 0x0300, msu);
    return sigtranMessage(6, 1, body);
}

Bytes m2paData(View msu, std::uint32_t bsn, std::uint32_t fsn) {
    Bytes body = word(bsn & 0xFFFFFF);
    put32(body, fsn & 0xFFFFFF);
    put8(body, 0); // priority and spare
    append(body, msu);
    return sigtranMessage(11, 1, body);
}

namespace {
Bytes suaAddress(const SccpAddress &a) {
    Bytes b;
    put16(b, 2);                  // routing indicator: route on SSN + PC
    put16(b, a.withPc ? 3 : 1);   // address indicator: SSN, point code
    if (a.withPc)
        sigtranParam(b, 0x8002, word(a.pc));
    sigtranParam(b, 0x8003, word(a.ssn));
    return b;
}
} // namespace

Bytes suaCldt(View data, const SccpAddress &called, const SccpAddress &calling, std::uint32_t routingContext) {
    Bytes body;
    sigtranParam(body, 0x0006, word(routingContext));
    sigtranParam(body, 0x0115, word(0)); // protocol class 0
    sigtranParam(body, 0x0102, suaAddress(calling));
    sigtranParam(body, 0x0103, suaAddress(called));
    sigtranParam(body, 0x0116, word(0)); // sequence control
    sigtranParam(body, 0x010B, data);
    return sigtranMessage(7, 1, body);
}

// ---- SCTP, IP, link layers ------------------------------------------------

std::uint32_t crc32c(View data) {
    static const auto table = [] {
        std::array<std::uint32_t, 256> t{};
        for (std::uint32_t i = 0; i < 256; ++i) {
            std::uint32_t c = i;
            for (int k = 0; k < 8; ++k)
                c = (c & 1) ? (c >> 1) ^ 0x82F63B78u : c >> 1;
            t[i] = c;
        }
        return t;
    }();
    std::uint32_t c = 0xFFFFFFFFu;
    for (const std::uint8_t x : data)
        c = table[(c ^ x) & 0xFF] ^ (c >> 8);
    return ~c;
}

Bytes sctpPacket(std::uint16_t srcPort, std::uint16_t dstPort, std::uint32_t vtag, const std::vector<DataChunk> &chunks) {
    Bytes b;
    put16(b, srcPort);
    put16(b, dstPort);
    put32(b, vtag);
    put32(b, 0);
    for (const DataChunk &c : chunks) {
        put8(b, 0); // DATA
        put8(b, (c.unordered ? 4 : 0) | (c.begin ? 2 : 0) | (c.end ? 1 : 0));
        put16(b, static_cast<unsigned>(16 + c.data.size()));
        put32(b, c.tsn);
        put16(b, c.stream);
        put16(b, c.ssn);
        put32(b, c.ppid);
        append(b, c.data);
        pad4(b);
    }
    // The CRC32c goes out least significant octet first.
    const std::uint32_t crc = crc32c(b);
    b[8] = static_cast<std::uint8_t>(crc);
    b[9] = static_cast<std::uint8_t>(crc >> 8);
    b[10] = static_cast<std::uint8_t>(crc >> 16);
    b[11] = static_cast<std::uint8_t>(crc >> 24);
    return b;
}

Bytes ipv4(Ipv4Address src, Ipv4Address dst, std::uint8_t proto, View payload, std::uint16_t id, View options,
           std::uint16_t fragOffset, bool moreFragments) {
    Bytes opts(options.begin(), options.end());
    pad4(opts);
    checkFits(opts.size(), 40, "IPv4 options");
    const std::size_t headerLen = 20 + opts.size();
    checkFits(headerLen + payload.size(), 65535, "IPv4 packet");
    Bytes b;
    put8(b, static_cast<unsigned>(0x40 | headerLen / 4));
    put8(b, 0);
    put16(b, static_cast<unsigned>(headerLen + payload.size()));
    put16(b, id);
    const bool fragmented = fragOffset != 0 || moreFragments;
    put16(b, (fragmented ? 0 : 0x4000) | (moreFragments ? 0x2000 : 0) | (fragOffset / 8 & 0x1FFF));
    put8(b, 64);
    put8(b, proto);
    put16(b, 0);
    append(b, src.b);
    append(b, dst.b);
    append(b, opts);
    set16(b, 10, ipChecksum(b));
    append(b, payload);
    return b;
}

Bytes ipv6(const Ipv6Address &src, const Ipv6Address &dst, std::uint8_t proto, View payload, bool hopByHop,
           const Ipv6Fragment *fragment) {
    constexpr std::uint8_t kFragmentHeader = 44;
    const std::size_t extLen = (hopByHop ? 8 : 0) + (fragment ? 8 : 0);
    checkFits(extLen + payload.size(), 65535, "IPv6 payload");
    const std::uint8_t afterHopByHop = fragment ? kFragmentHeader : proto;
    Bytes b{0x60, 0, 0, 0};
    put16(b, static_cast<unsigned>(extLen + payload.size()));
    put8(b, hopByHop ? 0 : afterHopByHop);
    put8(b, 64);
    append(b, src.b);
    append(b, dst.b);
    if (hopByHop) // next header, length 0 (8 octets), PadN of 4 octets
        append(b, Bytes{afterHopByHop, 0, 1, 4, 0, 0, 0, 0});
    if (fragment) { // next header, reserved, offset and M flag, identification
        append(b, Bytes{proto, 0});
        put16(b, static_cast<unsigned>((fragment->offset & 0xFFF8) | (fragment->more ? 1 : 0)));
        put32(b, fragment->id);
    }
    append(b, payload);
    return b;
}

Bytes ethernet(const Mac &dst, const Mac &src, std::uint16_t etherType, View payload, const std::vector<std::uint16_t> &vlans) {
    Bytes b;
    append(b, dst.b);
    append(b, src.b);
    for (std::size_t i = 0; i < vlans.size(); ++i) {
        put16(b, i + 1 < vlans.size() ? 0x88A8 : 0x8100);
        put16(b, vlans[i] & 0x0FFF);
    }
    put16(b, etherType);
    append(b, payload);
    return b;
}

Bytes linuxSll(std::uint16_t packetType, const Mac &addr, std::uint16_t etherType, View payload) {
    Bytes b;
    put16(b, packetType);
    put16(b, 1); // ARPHRD_ETHER
    put16(b, 6);
    append(b, addr.b);
    put16(b, 0);
    put16(b, etherType);
    append(b, payload);
    return b;
}

Bytes linuxSll2(std::uint16_t packetType, const Mac &addr, std::uint16_t etherType, View payload, std::uint32_t ifIndex) {
    Bytes b;
    put16(b, etherType);
    put16(b, 0);
    put32(b, ifIndex);
    put16(b, 1); // ARPHRD_ETHER
    put8(b, packetType);
    put8(b, 6);
    append(b, addr.b);
    put16(b, 0);
    append(b, payload);
    return b;
}

Bytes loopback(bool v6, View payload) {
    Bytes b;
    put32le(b, v6 ? 24 : 2); // AF_INET6 as the BSDs number it, AF_INET
    append(b, payload);
    return b;
}

// ---- capture files ------------------------------------------------------------

CaptureFile::CaptureFile(std::FILE *out, const FileOptions &o)
    : out_(out), opt_(o), snaplen_(o.snaplen ? o.snaplen : 262144) {
    Bytes h;
    if (o.format == FileFormat::Pcap) {
        put32le(h, o.nanoseconds ? 0xA1B23C4D : 0xA1B2C3D4);
        put16le(h, 2);
        put16le(h, 4);
        put32le(h, 0); // time zone
        put32le(h, 0); // accuracy
        put32le(h, snaplen_);
        put32le(h, static_cast<std::uint32_t>(o.link));
    } else {
        // Section header: byte-order magic, version 1.0, section length unknown.
        put32le(h, 0x0A0D0D0A);
        put32le(h, 28);
        put32le(h, 0x1A2B3C4D);
        put16le(h, 1);
        put16le(h, 0);
        put32le(h, 0xFFFFFFFF);
        put32le(h, 0xFFFFFFFF);
        put32le(h, 28);
        // Interface descriptions; if_tsresol 9 for nanoseconds (default: microseconds).
        for (std::size_t i = 0; i < interfaces(); ++i) {
            const std::uint32_t idbLen = o.nanoseconds ? 32 : 20;
            put32le(h, 1);
            put32le(h, idbLen);
            put16le(h, static_cast<unsigned>(link(i)));
            put16le(h, 0);
            put32le(h, snaplen_);
            if (o.nanoseconds) {
                put16le(h, 9);
                put16le(h, 1);
                append(h, Bytes{9, 0, 0, 0});
                put32le(h, 0); // end of options
            }
            put32le(h, idbLen);
        }
    }
    if (o.format == FileFormat::Pcap && !o.moreLinks.empty())
        throw CarrierError("a pcap file has one link type: several interfaces need pcapng");
    put(h);
}

void CaptureFile::frame(std::uint64_t timeNs, View data, std::size_t interface) {
    if (interface >= interfaces())
        throw CarrierError("no interface " + std::to_string(interface) + " in this capture");
    const auto captured = static_cast<std::uint32_t>(std::min<std::size_t>(data.size(), snaplen_));
    const auto original = static_cast<std::uint32_t>(data.size());
    Bytes h;
    if (opt_.format == FileFormat::Pcap) {
        put32le(h, static_cast<std::uint32_t>(timeNs / 1000000000u));
        put32le(h, static_cast<std::uint32_t>(opt_.nanoseconds ? timeNs % 1000000000u : timeNs % 1000000000u / 1000u));
        put32le(h, captured);
        put32le(h, original);
        append(h, data.first(captured));
    } else {
        const std::uint64_t ts = opt_.nanoseconds ? timeNs : timeNs / 1000u;
        const std::uint32_t padded = (captured + 3) & ~3u;
        put32le(h, 6);
        put32le(h, 32 + padded);
        put32le(h, static_cast<std::uint32_t>(interface));
        put32le(h, static_cast<std::uint32_t>(ts >> 32));
        put32le(h, static_cast<std::uint32_t>(ts));
        put32le(h, captured);
        put32le(h, original);
        append(h, data.first(captured));
        pad4(h);
        put32le(h, 32 + padded);
    }
    put(h);
    ++frames_;
}

void CaptureFile::put(const Bytes &b) {
    if (std::fwrite(b.data(), 1, b.size(), out_) != b.size())
        throw std::runtime_error("capture write failed");
}

Bytes captureBytes(const FileOptions &o, const std::vector<std::pair<std::uint64_t, Bytes>> &frames) {
    char *buf = nullptr;
    std::size_t len = 0;
    std::FILE *f = open_memstream(&buf, &len);
    if (!f)
        throw std::runtime_error("open_memstream failed");
    {
        CaptureFile cap(f, o);
        for (const auto &[t, data] : frames)
            cap.frame(t, data);
    }
    std::fclose(f);
    Bytes out(buf, buf + len);
    std::free(buf);
    return out;
}

// ---- flows -----------------------------------------------------------------------

namespace {

constexpr Mac kMac[2] = {{{0x02, 0x00, 0x00, 0x00, 0x00, 0x0A}}, {{0x02, 0x00, 0x00, 0x00, 0x00, 0x0B}}};
constexpr Ipv4Address kIpv4[2] = {{{10, 0, 0, 1}}, {{10, 0, 0, 2}}};
constexpr Ipv6Address kIpv6[2] = {{{0xFD, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 1}},
                                  {{0xFD, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 2}}};
// The verification tag each side puts in what it sends (the peer's tag).
constexpr std::uint32_t kVtag[2] = {0x5EED0B0B, 0x5EED0A0A};
constexpr std::uint32_t kFirstTsn[2] = {1000, 5000};
const std::uint8_t kRouterAlert[] = {0x94, 0x04, 0x00, 0x00};

// Chunks share an SCTP packet only when they travel the same way.
bool samePath(const Carrier &x, const Carrier &y) {
    return x.reverse == y.reverse && x.vlans == y.vlans && x.ipv6 == y.ipv6 && x.ipOptions == y.ipOptions &&
           x.adaptation == y.adaptation && x.portA == y.portA && x.portB == y.portB && x.interface == y.interface &&
           x.ipFragment == y.ipFragment && x.fragmentOrder == y.fragmentOrder;
}

bool isMtpLink(Link l) { return l == Link::Mtp2 || l == Link::Mtp2WithPhdr || l == Link::Mtp3; }

// Payload protocol id and well-known port of each adaptation.
struct SctpUser {
    std::uint32_t ppid;
    std::uint16_t port;
};
SctpUser sctpUser(Adaptation a) {
    switch (a) {
    case Adaptation::M2ua:
        return {kPpidM2ua, kPortM2ua};
    case Adaptation::M2pa:
        return {kPpidM2pa, kPortM2pa};
    case Adaptation::Sua:
        return {kPpidSua, kPortSua};
    case Adaptation::M3ua:
        break;
    }
    return {kPpidM3ua, kPortM3ua};
}

} // namespace

FlowWriter::FlowWriter(CaptureFile &file, std::uint64_t startNs) : file_(file), now_(startNs) {
    for (int s = 0; s < 2; ++s)
        side_[s].tsn = kFirstTsn[s];
}

std::vector<Bytes> FlowWriter::userMessages(View tcap, const Carrier &c) {
    const bool b = c.reverse;
    const SccpAddress &called = b ? c.callingA : c.calledA;
    const SccpAddress &calling = b ? c.calledA : c.callingA;
    RoutingLabel label = c.label;
    if (b)
        std::swap(label.opc, label.dpc);
    const bool mtpLink = isMtpLink(file_.link(c.interface));
    if (c.adaptation == Adaptation::Sua) {
        if (mtpLink)
            throw CarrierError("SUA needs an IP link type");
        return {suaCldt(tcap, called, calling)};
    }
    std::vector<Bytes> sccp;
    switch (c.sccp.type) {
    case SccpType::Udt:
        sccp.push_back(sccpUdt(tcap, called, calling, c.sccp));
        break;
    case SccpType::Ludt:
        sccp.push_back(sccpLudt(tcap, called, calling, c.sccp));
        break;
    case SccpType::Xudt:
        sccp = sccpXudtSegments(tcap, called, calling, c.sccp, c.segment, localRef_);
        if (sccp.size() > 1)
            localRef_ = (localRef_ + 1) & 0xFFFFFF;
        break;
    }
    std::vector<Bytes> out;
    Side &side = side_[b];
    for (const Bytes &s : sccp) {
        if (mtpLink || c.adaptation != Adaptation::M3ua) {
            const Bytes msu = mtp3(label, s);
            if (c.adaptation == Adaptation::M2pa && !mtpLink)
                out.push_back(m2paData(msu, side_[!b].m2paFsn - 1, side.m2paFsn++)); // BSN: the peer's last
            else if (c.adaptation == Adaptation::M2ua && !mtpLink)
                out.push_back(m2uaData(msu));
            else
                out.push_back(msu);
        } else {
            out.push_back(m3uaData(label, s));
        }
    }
    return out;
}

void FlowWriter::message(View tcap, const Carrier &c) {
    if (!pending_.empty() && !samePath(c, pendingCarrier_))
        flush();
    std::vector<Bytes> units = userMessages(tcap, c);
    const Link link = file_.link(c.interface);
    ++messages_;
    if (isMtpLink(link)) {
        Side &side = side_[c.reverse];
        for (const Bytes &msu : units) {
            Bytes frame;
            if (link == Link::Mtp3) {
                frame = msu;
            } else {
                if (link == Link::Mtp2WithPhdr)
                    frame = mtp2PseudoHeader(!c.reverse, 1);
                append(frame, mtp2(msu, side.fsn, static_cast<std::uint8_t>(side_[!c.reverse].fsn - 1))); // BSN: the peer's last
                side.fsn = (side.fsn + 1) & 0x7F;
            }
            emit(frame, c);
        }
        return;
    }
    for (const Bytes &u : units)
        queue(u, c);
    sendPackets(false);
}

void FlowWriter::queue(const Bytes &userMessage, const Carrier &c) {
    Side &side = side_[c.reverse];
    if (side.streamSeq.size() <= c.stream)
        side.streamSeq.resize(c.stream + 1u, 0);
    const std::uint16_t ssn = side.streamSeq[c.stream]++;
    const std::size_t piece = c.fragment ? c.fragment : userMessage.size();
    const std::uint32_t ppid = c.ppid ? c.ppid : sctpUser(c.adaptation).ppid;
    std::size_t at = 0;
    do {
        DataChunk chunk;
        const std::size_t n = std::min(piece, userMessage.size() - at);
        chunk.tsn = side.tsn++;
        chunk.stream = c.stream;
        chunk.ssn = ssn;
        chunk.ppid = ppid;
        chunk.begin = at == 0;
        chunk.end = at + n == userMessage.size();
        chunk.data.assign(userMessage.begin() + static_cast<std::ptrdiff_t>(at),
                          userMessage.begin() + static_cast<std::ptrdiff_t>(at + n));
        pending_.push_back(std::move(chunk));
        at += n;
    } while (at < userMessage.size());
    pendingCarrier_ = c;
}

void FlowWriter::flush() { sendPackets(true); }

void FlowWriter::sendPackets(bool all) {
    const Carrier &c = pendingCarrier_;
    const std::size_t bundle = std::max<std::size_t>(1, c.bundle);
    const bool b = c.reverse;
    std::size_t done = 0;
    while (pending_.size() - done >= bundle || (all && done < pending_.size())) {
        const std::size_t n = std::min(bundle, pending_.size() - done);
        const std::vector<DataChunk> chunks(pending_.begin() + static_cast<std::ptrdiff_t>(done),
                                            pending_.begin() + static_cast<std::ptrdiff_t>(done + n));
        done += n;
        const std::uint16_t portA = c.portA ? c.portA : sctpUser(c.adaptation).port;
        const std::uint16_t portB = c.portB ? c.portB : sctpUser(c.adaptation).port;
        const Bytes sctp = sctpPacket(b ? portB : portA, b ? portA : portB, kVtag[b], chunks);
        for (const Bytes &ip : ipPackets(sctp, c))
            emit(linkFrame(ip, c, b), c);
    }
    pending_.erase(pending_.begin(), pending_.begin() + static_cast<std::ptrdiff_t>(done));
}

std::vector<Bytes> FlowWriter::ipPackets(View sctp, const Carrier &c) {
    const bool b = c.reverse;
    const std::uint16_t id = side_[b].ipId++;
    const View opts = c.ipOptions ? View(kRouterAlert) : View();
    const auto packet = [&](View piece, std::size_t offset, bool more) {
        if (c.ipv6) {
            const Ipv6Fragment f{id, static_cast<std::uint16_t>(offset), more};
            return ipv6(kIpv6[b], kIpv6[!b], kIpProtoSctp, piece, c.ipOptions, more || offset ? &f : nullptr);
        }
        return ipv4(kIpv4[b], kIpv4[!b], kIpProtoSctp, piece, id, opts, static_cast<std::uint16_t>(offset), more);
    };
    const std::size_t piece = c.ipFragment & ~std::size_t(7);
    if (piece == 0 || sctp.size() <= piece)
        return {packet(sctp, 0, false)};
    // Fragments of `piece` octets; with Overlap each after the first starts
    // 8 octets earlier, carrying those octets again.
    std::vector<Bytes> out;
    for (std::size_t at = 0; at < sctp.size(); at += piece) {
        const std::size_t from = c.fragmentOrder == FragmentOrder::Overlap && at != 0 ? at - 8 : at;
        const std::size_t to = std::min(at + piece, sctp.size());
        out.push_back(packet(sctp.subspan(from, to - from), from, to < sctp.size()));
        if (c.fragmentOrder == FragmentOrder::Duplicate && to < sctp.size())
            out.push_back(out.back());
    }
    if (c.fragmentOrder == FragmentOrder::Reverse)
        std::reverse(out.begin(), out.end());
    if (c.fragmentOrder == FragmentOrder::Missing)
        out.pop_back();
    return out;
}

Bytes FlowWriter::linkFrame(View ip, const Carrier &c, bool fromB) {
    const std::uint16_t etherType = c.ipv6 ? kEtherIpv6 : kEtherIpv4;
    switch (file_.link(c.interface)) {
    case Link::Ethernet:
        return ethernet(kMac[!fromB], kMac[fromB], etherType, ip, c.vlans);
    case Link::LinuxSll:
        return linuxSll(fromB ? 0 : 4, kMac[fromB], etherType, ip);
    case Link::LinuxSll2:
        return linuxSll2(fromB ? 0 : 4, kMac[fromB], etherType, ip);
    case Link::Loopback:
        return loopback(c.ipv6, ip);
    case Link::RawIp:
        break;
    case Link::Mtp2:
    case Link::Mtp2WithPhdr:
    case Link::Mtp3:
        throw CarrierError("an IP packet on an MTP link");
    }
    return Bytes(ip.begin(), ip.end());
}

void FlowWriter::emit(View frame, const Carrier &c) {
    file_.frame(now_, frame, c.interface);
    now_ += c.intervalNs;
}

} // namespace capwrite
