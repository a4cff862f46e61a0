// Frames for the capture tests, built with the capture writer's layer
// builders, and a walker that collects what it finds in them.
#pragma once

#include <cstdint>
#include <numeric>
#include <vector>

#include "capture_writer.h"
#include "carriers/walker.h"

namespace captest {

namespace cw = capwrite;
namespace cap = dpxdecode::capture;
using cw::Bytes;

const cw::Mac kMacA{{2, 0, 0, 0, 0, 1}}, kMacB{{2, 0, 0, 0, 0, 2}};
const cw::Ipv4Address kIpA{{10, 0, 0, 1}}, kIpB{{10, 0, 0, 2}};
const cw::Ipv6Address kIp6A{{0x20, 0x01, 0x0d, 0xb8, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 1}};
const cw::Ipv6Address kIp6B{{0x20, 0x01, 0x0d, 0xb8, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 2}};
constexpr uint64_t kStart = 1767225600ull * 1000000000ull; // 2026-01-01, in nanoseconds

// One SCTP packet holding `user` in one whole DATA chunk.
inline Bytes sctpData(const Bytes &user, uint32_t ppid, uint32_t tsn = 1, uint16_t port = cw::kPortM3ua,
                      uint32_t vtag = 0x11223344) {
    cw::DataChunk c;
    c.tsn = tsn;
    c.ppid = ppid;
    c.data = user;
    return cw::sctpPacket(port, port, vtag, {c});
}

// `tcap` in an SCCP UDT over M3UA in one SCTP packet.
inline Bytes m3uaPacket(const Bytes &tcap, const cw::RoutingLabel &label, const cw::SccpAddress &called,
                        const cw::SccpAddress &calling, uint32_t tsn, uint32_t vtag) {
    return sctpData(cw::m3uaData(label, cw::sccpUdt(tcap, called, calling, {})), cw::kPpidM3ua, tsn,
                    cw::kPortM3ua, vtag);
}

inline Bytes overIpv4(const Bytes &sctp, uint16_t id = 7) { return cw::ipv4(kIpA, kIpB, cw::kIpProtoSctp, sctp, id); }

// `tcap` over Ethernet/IPv4/SCTP/M3UA/SCCP UDT, from MAC A to B when
// `forward`, else back.
inline Bytes m3uaFrame(const Bytes &tcap, const cw::RoutingLabel &label, const cw::SccpAddress &called,
                       const cw::SccpAddress &calling, uint32_t tsn, uint16_t ipId, bool forward = true) {
    return cw::ethernet(forward ? kMacB : kMacA, forward ? kMacA : kMacB, cw::kEtherIpv4,
                        overIpv4(m3uaPacket(tcap, label, called, calling, tsn, 1), ipId));
}

struct Found {
    Bytes tcap;
    cap::TcapMessage where;
};

struct Collect final : cap::MessageSink {
    std::vector<Found> found;
    void onTcap(const cap::TcapMessage &m) override {
        found.push_back(Found{Bytes(m.tcap.data, m.tcap.data + m.tcap.size), m});
    }
};

inline uint64_t skipTotal(const cap::FrameWalker &w) {
    const auto &s = w.skips();
    return std::accumulate(s.begin(), s.end(), uint64_t{0});
}

// Walks each frame in turn on one walker; the frames are copied into
// buffers of exactly their size so a read past one is caught by ASan.
struct Walk {
    cap::FrameWalker walker;
    Collect sink;
    explicit Walk(const cap::WalkOptions &o = {}) : walker(o) {}
    size_t operator()(uint32_t link, const Bytes &frame) {
        std::vector<uint8_t> exact(frame);
        return walker.walk(link, cap::Bytes{exact.data(), exact.size()}, sink);
    }
    uint64_t skipped(cap::Skip s) const { return walker.skips()[size_t(s)]; }
};

} // namespace captest
