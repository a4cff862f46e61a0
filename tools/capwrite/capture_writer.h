// capwrite: writes pcap and pcapng captures that carry TCAP messages over a
// chosen SS7 or SIGTRAN carrier.
//
// Two levels.  The layer builders (sccpUdt, m3uaData, sctpPacket, ipv4,
// ethernet, ...) each put one protocol's header around a payload and know
// nothing of the others, so a test can assemble any frame, odd ones
// included.  FlowWriter stacks them by a Carrier description, keeps the
// per-direction state a real link has (SCTP TSNs and stream sequence
// numbers, MTP2 sequence numbers, XUDT local references, time), bundles
// and fragments SCTP user messages and segments XUDTs.
//
// All multi-octet fields are written in network order except where the
// protocol says otherwise (MTP3 routing label, SCCP long pointers, loopback
// family, pcap headers: little-endian).
#pragma once

#include <cstdint>
#include <cstdio>
#include <span>
#include <stdexcept>
#include <string>
#include <vector>

namespace capwrite {

using Bytes = std::vector<std::uint8_t>;
using View = std::span<const std::uint8_t>;

// A carrier that cannot take the message or the options (too long for UDT,
// too many XUDT segments, SUA over MTP2, ...).
struct CarrierError : std::runtime_error {
    using std::runtime_error::runtime_error;
};

// ---- SCCP ------------------------------------------------------------------

struct SccpAddress {
    std::uint8_t ssn = 146;
    bool withPc = false; // put the point code in the address
    std::uint32_t pc = 0;
};

enum class SccpType { Udt, Xudt, Ludt };

struct SccpOptions {
    SccpType type = SccpType::Udt;
    bool ansi = false;         // ANSI address indicator layout
    bool returnOnError = false; // protocol class: return message on error
    std::uint8_t hopCounter = 15;
};

// Q.713 address: length octet not included.
Bytes sccpAddress(const SccpAddress &a, bool ansi);
Bytes sccpUdt(View data, const SccpAddress &called, const SccpAddress &calling, const SccpOptions &o);
Bytes sccpLudt(View data, const SccpAddress &called, const SccpAddress &calling, const SccpOptions &o);
// An XUDT; with a segmentation parameter when `segment` is given.
struct XudtSegment {
    bool first = true;
    std::uint8_t remaining = 0; // segments still to come after this one
    std::uint32_t localRef = 0; // 24 bits
};
Bytes sccpXudt(View data, const SccpAddress &called, const SccpAddress &calling, const SccpOptions &o,
               const XudtSegment *segment = nullptr);
// The message split into XUDTs of at most `maxData` data octets (1 to 16
// segments); one XUDT without a segmentation parameter when maxData is 0 or
// the data fits.
std::vector<Bytes> sccpXudtSegments(View data, const SccpAddress &called, const SccpAddress &calling,
                                    const SccpOptions &o, std::size_t maxData, std::uint32_t localRef);

// ---- MTP -------------------------------------------------------------------

struct RoutingLabel {
    std::uint32_t opc = 1, dpc = 2;
    std::uint8_t sls = 0;
    std::uint8_t ni = 2; // network indicator: 0 international, 2 national
    bool ansi = false;   // 24-bit point codes, 7-octet label
};

inline constexpr std::uint8_t kServiceSccp = 3;

// MSU as MTP3 sees it: SIO, routing label, SIF.
Bytes mtp3(const RoutingLabel &label, View sif, std::uint8_t si = kServiceSccp);
// MTP2 signal unit: BSN/BIB, FSN/FIB, LI, then the MSU (no FCS).
Bytes mtp2(View msu, std::uint8_t fsn, std::uint8_t bsn);
// The 4-octet pseudo-header of the MTP2-with-pseudo-header link type.
Bytes mtp2PseudoHeader(bool sent, std::uint16_t linkNumber, bool annexA = false);

// ---- SIGTRAN adaptation layers ------------------------------------------

inline constexpr std::uint32_t kPpidM2ua = 2, kPpidM3ua = 3, kPpidSua = 4, kPpidM2pa = 5;
inline constexpr std::uint16_t kPortM2ua = 2904, kPortM3ua = 2905, kPortSua = 14001, kPortM2pa = 3565;

// M3UA DATA with Routing Context and Protocol Data (label fields, SI = SCCP).
Bytes m3uaData(const RoutingLabel &label, View sccp, std::uint32_t routingContext = 1);
// M2UA DATA with an integer interface identifier; msu starts with the SIO.
Bytes m2uaData(View msu, std::uint32_t interfaceId = 0);
// M2PA User Data; msu starts with the SIO.
Bytes m2paData(View msu, std::uint32_t bsn, std::uint32_t fsn);
// SUA connectionless data (CLDT): route on SSN and point code.
Bytes suaCldt(View data, const SccpAddress &called, const SccpAddress &calling, std::uint32_t routingContext = 1);

// ---- SCTP, IP, link layers ------------------------------------------------

struct DataChunk {
    std::uint32_t tsn = 0;
    std::uint16_t stream = 0, ssn = 0;
    std::uint32_t ppid = 0;
    bool begin = true, end = true, unordered = false;
    Bytes data;
};

std::uint32_t crc32c(View data);
// SCTP packet of DATA chunks, checksum filled in.
Bytes sctpPacket(std::uint16_t srcPort, std::uint16_t dstPort, std::uint32_t vtag, const std::vector<DataChunk> &chunks);

inline constexpr std::uint8_t kIpProtoSctp = 132;

struct Ipv4Address {
    std::uint8_t b[4];
};
struct Ipv6Address {
    std::uint8_t b[16];
};
// IPv4 header with checksum; `options` are padded to a multiple of 4.
// fragOffset is in octets (a multiple of 8), moreFragments sets MF.
Bytes ipv4(Ipv4Address src, Ipv4Address dst, std::uint8_t proto, View payload, std::uint16_t id,
           View options = {}, std::uint16_t fragOffset = 0, bool moreFragments = false);
// IPv6 header; hopByHop adds an 8-octet hop-by-hop options header.  With
// `fragment`, the payload is a fragment at that offset (octets, a multiple
// of 8), after a fragment header.
struct Ipv6Fragment {
    std::uint32_t id = 0;
    std::uint16_t offset = 0;
    bool more = false;
};
Bytes ipv6(const Ipv6Address &src, const Ipv6Address &dst, std::uint8_t proto, View payload, bool hopByHop = false,
           const Ipv6Fragment *fragment = nullptr);

inline constexpr std::uint16_t kEtherIpv4 = 0x0800, kEtherIpv6 = 0x86DD;

struct Mac {
    std::uint8_t b[6];
};
// Ethernet II; each entry of `vlans` is one tag, outermost first (two tags:
// 802.1ad outer, 802.1Q inner).
Bytes ethernet(const Mac &dst, const Mac &src, std::uint16_t etherType, View payload,
               const std::vector<std::uint16_t> &vlans = {});
// Linux cooked headers; packetType 0 "to us", 4 "sent by us".
Bytes linuxSll(std::uint16_t packetType, const Mac &addr, std::uint16_t etherType, View payload);
Bytes linuxSll2(std::uint16_t packetType, const Mac &addr, std::uint16_t etherType, View payload,
                std::uint32_t ifIndex = 1);
// BSD loopback: address family in the capturing host's (little-endian) order.
Bytes loopback(bool v6, View payload);

// ---- capture files ------------------------------------------------------------

// pcap LINKTYPE_ values.
enum class Link : std::uint16_t {
    Loopback = 0,
    Ethernet = 1,
    RawIp = 101,
    LinuxSll = 113,
    Mtp2WithPhdr = 139,
    Mtp2 = 140,
    Mtp3 = 141,
    LinuxSll2 = 276,
};

enum class FileFormat { Pcap, Pcapng };

struct FileOptions {
    FileFormat format = FileFormat::Pcap;
    Link link = Link::Ethernet;
    bool nanoseconds = false;   // nanosecond time stamps (pcap magic, pcapng if_tsresol)
    std::uint32_t snaplen = 0;  // 0: 262144; frames longer are cut to it
    // pcapng: further interfaces (1, 2, ...) after the first, of `link`.
    std::vector<Link> moreLinks;
};

// Writes frames to a stdio stream (not closed here).  Time stamps are in
// nanoseconds since the epoch.
class CaptureFile {
public:
    CaptureFile(std::FILE *out, const FileOptions &o);
    void frame(std::uint64_t timeNs, View data, std::size_t interface = 0);
    std::size_t interfaces() const { return 1 + opt_.moreLinks.size(); }
    Link link(std::size_t interface) const { return interface == 0 ? opt_.link : opt_.moreLinks.at(interface - 1); }
    std::uint64_t frames() const { return frames_; }
    const FileOptions &options() const { return opt_; }

private:
    void put(const Bytes &b);
    std::FILE *out_;
    FileOptions opt_;
    std::uint32_t snaplen_;
    std::uint64_t frames_ = 0;
};

// The whole capture in memory: for tests.
Bytes captureBytes(const FileOptions &o, const std::vector<std::pair<std::uint64_t, Bytes>> &frames);

// How the fragments of one IP datagram are sent: in order, last first,
// each after the first reaching 8 octets back into the one before (the
// same octets again), each but the last twice, or all but the last.
enum class FragmentOrder { InOrder, Reverse, Overlap, Duplicate, Missing };

// ---- flows -----------------------------------------------------------------------

enum class Adaptation { M3ua, M2ua, M2pa, Sua };

// How a message is carried.  Side "a" sends with the addresses as given;
// reverse = true sends from side "b" (addresses, ports, point codes and SSNs
// swapped).
struct Carrier {
    // Above the link: SIGTRAN over SCTP over IP for the IP link types,
    // MTP3 directly for the MTP link types.
    Adaptation adaptation = Adaptation::M3ua;
    std::vector<std::uint16_t> vlans; // Ethernet only
    bool ipv6 = false;
    bool ipOptions = false; // IPv4 options / IPv6 hop-by-hop header
    std::uint16_t stream = 1;
    std::uint32_t ppid = 0;       // 0: the adaptation's own
    std::uint16_t portA = 0, portB = 0; // 0: the adaptation's own
    std::size_t bundle = 1;       // DATA chunks per SCTP packet
    std::size_t fragment = 0;     // at most this many octets per DATA chunk (0: whole)
    std::size_t ipFragment = 0;   // at most this many payload octets per IP fragment (0: whole)
    FragmentOrder fragmentOrder = FragmentOrder::InOrder;
    std::size_t interface = 0;    // pcapng interface the frames go out on
    RoutingLabel label;           // opc = side a, dpc = side b
    SccpOptions sccp;
    std::size_t segment = 0;      // XUDT: at most this many data octets per segment
    SccpAddress calledA{146, false, 0}, callingA{146, false, 0}; // as side a sends them
    bool reverse = false;
    std::uint64_t intervalNs = 1000000; // between frames
};

class FlowWriter {
public:
    FlowWriter(CaptureFile &file, std::uint64_t startNs);
    // Carries one TCAP message; SCTP chunks may wait for bundling.
    void message(View tcap, const Carrier &c);
    // Sends the SCTP chunks still waiting.
    void flush();
    std::uint64_t messages() const { return messages_; }
    std::uint64_t now() const { return now_; }
    void setTime(std::uint64_t ns) { now_ = ns; }

private:
    struct Side {
        std::uint32_t tsn = 0;
        std::vector<std::uint16_t> streamSeq;
        std::uint8_t fsn = 0, bsn = 0; // MTP2 (7 bits)
        std::uint32_t m2paFsn = 0;
        std::uint16_t ipId = 0;
    };
    std::vector<Bytes> userMessages(View tcap, const Carrier &c);
    void queue(const Bytes &userMessage, const Carrier &c);
    void sendPackets(bool all);
    void emit(View frame, const Carrier &c);
    std::vector<Bytes> ipPackets(View sctp, const Carrier &c);
    Bytes linkFrame(View ipPacket, const Carrier &c, bool fromB);

    CaptureFile &file_;
    std::uint64_t now_;
    std::uint64_t messages_ = 0;
    std::uint32_t localRef_ = 1;
    Side side_[2];
    std::vector<DataChunk> pending_;
    Carrier pendingCarrier_;
};

} // namespace capwrite
