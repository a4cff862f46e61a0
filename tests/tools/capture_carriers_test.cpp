// The frame walker and its carriers on frames built with the capture
// writer's layer builders: every link type and adaptation down to the TCAP
// message, every prefix of those frames (nothing found, one skip counted,
// no read past the frame), SCTP bundling, fragments, reordering and
// duplicates, XUDT segments, and frames that carry no CAMEL message.

#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

#include "carriers/link.h"
#include "support/capture_frames.h"

namespace {

using namespace captest;

const Bytes kTcap{0x62, 0x06, 0x48, 0x04, 0x01, 0x02, 0x03, 0x04};
const Bytes kTcap2{0x64, 0x06, 0x49, 0x04, 0x0A, 0x0B, 0x0C, 0x0D};
const cw::RoutingLabel kLabel{1234, 5678, 3, 2, false};
const cw::SccpAddress kCalled{146, false, 0}, kCalling{146, true, 1234};

Bytes m3uaUdt(const Bytes &tcap = kTcap) {
    return cw::m3uaData(kLabel, cw::sccpUdt(tcap, kCalled, kCalling, {}));
}
Bytes msuUdt() { return cw::mtp3(kLabel, cw::sccpUdt(kTcap, kCalled, kCalling, {})); }

struct CarrierCase {
    const char *name;
    uint32_t link;
    Bytes frame;
    bool ansi = false;
};

std::vector<CarrierCase> carrierCases() {
    const Bytes ip4 = overIpv4(sctpData(m3uaUdt(), cw::kPpidM3ua));
    const Bytes ip6 = cw::ipv6(kIp6A, kIp6B, cw::kIpProtoSctp, sctpData(m3uaUdt(), cw::kPpidM3ua), true);
    const cw::SccpOptions xudt{cw::SccpType::Xudt, false, false, 15};
    const cw::SccpOptions ludt{cw::SccpType::Ludt, false, false, 15};
    cw::RoutingLabel ansiLabel = kLabel;
    ansiLabel.ansi = true;
    ansiLabel.opc = 0x010203;
    ansiLabel.dpc = 0x040506;
    const cw::SccpOptions ansiSccp{cw::SccpType::Udt, true, false, 15};
    const cw::SccpAddress ansiCalling{146, true, 0x010203};
    return {
        {"ethernet", cap::linktype::kEthernet, cw::ethernet(kMacB, kMacA, cw::kEtherIpv4, ip4)},
        {"ethernet-8021q", cap::linktype::kEthernet, cw::ethernet(kMacB, kMacA, cw::kEtherIpv4, ip4, {100})},
        {"ethernet-qinq", cap::linktype::kEthernet, cw::ethernet(kMacB, kMacA, cw::kEtherIpv6, ip6, {10, 20})},
        {"sll", cap::linktype::kLinuxSll, cw::linuxSll(0, kMacA, cw::kEtherIpv4, ip4)},
        {"sll2", cap::linktype::kLinuxSll2, cw::linuxSll2(4, kMacA, cw::kEtherIpv6, ip6)},
        {"raw-ipv4", cap::linktype::kRaw, ip4},
        {"raw-ipv6", cap::linktype::kRawOpenBsd, ip6},
        {"loopback-ipv4", cap::linktype::kNull, cw::loopback(false, ip4)},
        {"loopback-ipv6", cap::linktype::kNull, cw::loopback(true, ip6)},
        {"ipv4-options", cap::linktype::kRaw,
         cw::ipv4(kIpA, kIpB, cw::kIpProtoSctp, sctpData(m3uaUdt(), cw::kPpidM3ua), 1, Bytes{1, 1, 1, 0})},
        {"m3ua-port", cap::linktype::kRaw, overIpv4(sctpData(m3uaUdt(), 0))},
        {"m2ua", cap::linktype::kRaw, overIpv4(sctpData(cw::m2uaData(msuUdt()), cw::kPpidM2ua))},
        {"m2pa", cap::linktype::kRaw, overIpv4(sctpData(cw::m2paData(msuUdt(), 1, 2), 0, 1, cw::kPortM2pa))},
        {"sua", cap::linktype::kRaw,
         overIpv4(sctpData(cw::suaCldt(kTcap, {146, true, 5678}, {146, true, 1234}), cw::kPpidSua))},
        {"mtp2", cap::linktype::kMtp2, cw::mtp2(msuUdt(), 5, 6)},
        {"mtp2-phdr", cap::linktype::kMtp2WithPhdr, [] {
             Bytes f = cw::mtp2PseudoHeader(true, 3);
             const Bytes u = cw::mtp2(msuUdt(), 5, 6);
             f.insert(f.end(), u.begin(), u.end());
             return f;
         }()},
        {"mtp3-xudt", cap::linktype::kMtp3, cw::mtp3(kLabel, cw::sccpXudt(kTcap, kCalled, kCalling, xudt))},
        {"mtp3-ludt", cap::linktype::kMtp3, cw::mtp3(kLabel, cw::sccpLudt(kTcap, kCalled, kCalling, ludt))},
        {"mtp3-ansi", cap::linktype::kMtp3,
         cw::mtp3(ansiLabel, cw::sccpUdt(kTcap, kCalled, ansiCalling, ansiSccp)), true},
    };
}

// The whole frame leads to the TCAP message and its origin; every shorter
// prefix finds nothing and counts one skip.
TEST(CaptureCarriers, EveryCarrierLeadsToTheTcapMessageAndNoPrefixDoes) {
    for (const CarrierCase &c : carrierCases()) {
        cap::WalkOptions o;
        o.ansi = c.ansi;
        Walk walk(o);
        SCOPED_TRACE(c.name);
        ASSERT_EQ(walk(c.link, c.frame), 1u);
        EXPECT_EQ(skipTotal(walk.walker), 0u);
        const Found &f = walk.sink.found.at(0);
        EXPECT_EQ(f.tcap, kTcap);
        EXPECT_TRUE(f.where.hasPointCodes);
        EXPECT_EQ(std::vector<uint32_t>({f.where.opc, f.where.dpc, f.where.calledSsn, f.where.callingSsn}),
                  std::vector<uint32_t>({c.ansi ? 0x010203u : 1234u, c.ansi ? 0x040506u : 5678u, 146, 146}));
        for (size_t n = 0; n < c.frame.size(); ++n) {
            SCOPED_TRACE("cut to " + std::to_string(n));
            Walk cut(o);
            EXPECT_EQ(cut(c.link, Bytes(c.frame.begin(), c.frame.begin() + long(n))), 0u);
            EXPECT_EQ(skipTotal(cut.walker), 1u);
            EXPECT_EQ(cut.skipped(cap::Skip::SctpDuplicate), 0u);
        }
    }
}

TEST(CaptureCarriers, ServiceVariantsCarryTheReturnedMessage) {
    // UDTS, XUDTS and LUDTS share the layout of their data form with the
    // protocol class replaced by the return cause.
    for (const auto &[type, serviceType] :
         std::vector<std::pair<cw::SccpType, uint8_t>>{{cw::SccpType::Udt, cap::sccptype::kUdts},
                                                      {cw::SccpType::Xudt, cap::sccptype::kXudts},
                                                      {cw::SccpType::Ludt, cap::sccptype::kLudts}}) {
        Bytes sccp = type == cw::SccpType::Ludt ? cw::sccpLudt(kTcap, kCalled, kCalling, {type, false, false, 15})
                     : type == cw::SccpType::Xudt ? cw::sccpXudt(kTcap, kCalled, kCalling, {type, false, false, 15})
                                                  : cw::sccpUdt(kTcap, kCalled, kCalling, {});
        sccp[0] = serviceType;
        sccp[1] = 0x01; // no translation for an address of such nature
        const cap::SccpOut out = cap::parseSccp(cap::Bytes{sccp.data(), sccp.size()}, false);
        SCOPED_TRACE(int(serviceType));
        ASSERT_EQ(out.skip, cap::Skip::None);
        EXPECT_EQ(out.type, serviceType);
        EXPECT_EQ(Bytes(out.data.data, out.data.data + out.data.size), kTcap);
        EXPECT_EQ(out.calling.pointCode, 1234u);
    }
}

TEST(CaptureCarriers, FramesWithoutCamelAreCountedByReason) {
    Bytes ssn6 = cw::m3uaData(kLabel, cw::sccpUdt(kTcap, {6, false, 0}, {7, false, 0}, {}));
    Bytes aspUp{1, 0, 3, 1, 0, 0, 0, 8};
    Bytes isup = cw::mtp3(kLabel, Bytes{1, 2, 3}, 5);
    Bytes fisu = cw::mtp2({}, 1, 1);
    Bytes udp = cw::ipv4(kIpA, kIpB, 17, Bytes(12, 0), 1);
    Bytes cr = cw::mtp3(kLabel, Bytes{0x01, 0, 0, 1, 2, 2, 0, 0});
    cw::DataChunk c;
    c.ppid = 46; // Diameter
    c.data = Bytes(8, 0);
    Bytes diameter = overIpv4(cw::sctpPacket(3868, 3868, 1, {c}));
    Bytes sackOnly = overIpv4(Bytes{0, 1, 0, 2, 0, 0, 0, 1, 0, 0, 0, 0, 3, 0, 0, 4});
    const struct {
        uint32_t link;
        Bytes frame;
        cap::Skip why;
    } cases[] = {
        {cap::linktype::kRaw, overIpv4(sctpData(ssn6, 3)), cap::Skip::TcapNotCamel},
        {cap::linktype::kRaw, overIpv4(sctpData(aspUp, 3)), cap::Skip::M3uaNotData},
        {cap::linktype::kMtp3, isup, cap::Skip::Mtp3NotSccp},
        {cap::linktype::kMtp2, fisu, cap::Skip::Mtp2NotMsu},
        {cap::linktype::kRaw, udp, cap::Skip::IpNotSctp},
        {cap::linktype::kMtp3, cr, cap::Skip::SccpUnsupportedType},
        {cap::linktype::kRaw, diameter, cap::Skip::SctpUnknownPayload},
        {cap::linktype::kRaw, sackOnly, cap::Skip::SctpNoData},
        {cap::linktype::kEthernet, cw::ethernet(kMacA, kMacB, 0x0806, Bytes(28, 0)), cap::Skip::LinkNotIpOrSs7},
        {147, Bytes(20, 0), cap::Skip::LinkTypeUnsupported},
    };
    for (const auto &c : cases) {
        SCOPED_TRACE(cap::skipName(c.why));
        Walk walk;
        EXPECT_EQ(walk(c.link, c.frame), 0u);
        EXPECT_EQ(walk.skipped(c.why), 1u);
        EXPECT_EQ(skipTotal(walk.walker), 1u);
    }
}

TEST(CaptureCarriers, SsnListSelectsTheMessages) {
    const Bytes frame = overIpv4(sctpData(cw::m3uaData(kLabel, cw::sccpUdt(kTcap, {6, false, 0}, {8, false, 0}, {})), 3));
    for (const auto &[ssns, want] : std::vector<std::pair<std::vector<int>, size_t>>{
             {{146}, 0}, {{6}, 1}, {{8}, 1}, {{7, 9}, 0}}) {
        cap::WalkOptions o;
        o.ssns.reset();
        for (int s : ssns)
            o.ssns.set(size_t(s));
        Walk walk(o);
        EXPECT_EQ(walk(cap::linktype::kRaw, frame), want) << ssns.front();
    }
}

// ---- SCTP -------------------------------------------------------------------

cw::DataChunk chunk(uint32_t tsn, const Bytes &data, bool begin = true, bool end = true, uint16_t stream = 1) {
    cw::DataChunk c;
    c.tsn = tsn;
    c.stream = stream;
    c.ppid = cw::kPpidM3ua;
    c.begin = begin;
    c.end = end;
    c.data = data;
    return c;
}

Bytes packet(const std::vector<cw::DataChunk> &chunks, uint32_t vtag = 1) {
    return overIpv4(cw::sctpPacket(2905, 2905, vtag, chunks));
}

// The user message cut in `n` fragments with consecutive TSNs from `tsn`.
std::vector<cw::DataChunk> fragments(const Bytes &user, size_t n, uint32_t tsn, uint16_t stream = 1) {
    std::vector<cw::DataChunk> out;
    const size_t step = (user.size() + n - 1) / n;
    for (size_t i = 0; i < n; ++i) {
        const size_t from = i * step, to = std::min(user.size(), from + step);
        out.push_back(chunk(tsn + uint32_t(i), Bytes(user.begin() + long(from), user.begin() + long(to)), i == 0,
                            i + 1 == n, stream));
    }
    return out;
}

TEST(CaptureSctp, BundledFragmentedReorderedAndRepeatedChunks) {
    const Bytes one = m3uaUdt(kTcap), two = m3uaUdt(kTcap2);
    const auto f1 = fragments(one, 3, 10);
    const auto f2 = fragments(two, 2, 20, 2);
    const struct {
        const char *name;
        std::vector<Bytes> packets;
        std::vector<Bytes> want;
        uint64_t duplicates;
    } cases[] = {
        {"bundle", {packet({chunk(1, one), chunk(2, two), chunk(3, one)})}, {kTcap, kTcap2, kTcap}, 0},
        {"fragments in order", {packet({f1[0]}), packet({f1[1]}), packet({f1[2]})}, {kTcap}, 0},
        {"fragments reversed", {packet({f1[2]}), packet({f1[1]}), packet({f1[0]})}, {kTcap}, 0},
        {"fragments bundled", {packet({f1[0], f1[1], f1[2]})}, {kTcap}, 0},
        {"two streams interleaved",
         {packet({f1[0], f2[0]}), packet({f2[1]}), packet({f1[1]}), packet({f1[2]})},
         {kTcap2, kTcap},
         0},
        {"whole packet again", {packet({chunk(1, one), chunk(2, two)}), packet({chunk(1, one), chunk(2, two)})},
         {kTcap, kTcap2},
         2},
        {"fragment again", {packet({f1[0]}), packet({f1[1]}), packet({f1[1]}), packet({f1[2]})}, {kTcap}, 1},
        {"whole message after its fragments", {packet({f1[0], f1[1], f1[2]}), packet({chunk(10, one)})}, {kTcap}, 1},
        {"other association same TSN", {packet({chunk(1, one)}, 1), packet({chunk(1, two)}, 2)}, {kTcap, kTcap2}, 0},
        {"middle fragment lost", {packet({f1[0]}), packet({f1[2]})}, {}, 0},
    };
    for (const auto &c : cases) {
        SCOPED_TRACE(c.name);
        Walk walk;
        for (const Bytes &p : c.packets)
            walk(cap::linktype::kRaw, p);
        std::vector<Bytes> got;
        for (const Found &f : walk.sink.found)
            got.push_back(f.tcap);
        EXPECT_EQ(got, c.want);
        EXPECT_EQ(walk.skipped(cap::Skip::SctpDuplicate), c.duplicates);
    }
}

TEST(CaptureSctp, ReassemblyStaysWithinItsLimits) {
    cap::SctpLimits limits;
    limits.messageBytes = 64;
    limits.pendingBytes = 100;
    limits.flows = 2;
    cap::SctpReassembler r(limits);
    const Bytes big(60, 0xAA);
    const auto frag = [&](uint32_t tsn, bool b, bool e, size_t size) {
        cap::SctpData d;
        d.tsn = tsn;
        d.first = b;
        d.last = e;
        d.data = cap::Bytes{big.data(), size};
        return d;
    };
    cap::SctpFlowKey k;
    cap::Bytes msg;
    using V = cap::SctpReassembler::Verdict;
    EXPECT_EQ(r.add(k, frag(1, true, false, 40), msg), V::Pending);
    EXPECT_EQ(r.add(k, frag(2, false, true, 40), msg), V::Dropped) << "80 octets over the 64-octet message limit";
    EXPECT_EQ(r.pendingBytes(), 0u);
    EXPECT_EQ(r.add(k, frag(3, true, false, 60), msg), V::Pending);
    EXPECT_EQ(r.add(k, frag(5, true, false, 60), msg), V::Dropped) << "held octets over 100";
    EXPECT_EQ(r.pendingFragments(), 0u);
    // More flows than the limit: the least recently used one goes.
    for (uint16_t port = 1; port <= 3; ++port) {
        k.sourcePort = port;
        EXPECT_EQ(r.add(k, frag(1, true, false, 10), msg), V::Pending) << port;
    }
    EXPECT_EQ(r.pendingFragments(), 2u);
    // TSNs far behind the remembered window count as repeats.
    EXPECT_EQ(r.add(k, frag(1u - 5000u, true, true, 1), msg), V::Duplicate);
    EXPECT_EQ(r.add(k, frag(2, true, true, 1), msg), V::Message);
}

// ---- SCCP segments -----------------------------------------------------------------

TEST(CaptureSccp, XudtSegmentsAreReassembledInSequenceOnly) {
    Bytes tcap(300, 0);
    for (size_t i = 0; i < tcap.size(); ++i)
        tcap[i] = uint8_t(i);
    const cw::SccpOptions xudt{cw::SccpType::Xudt, false, false, 15};
    const auto segments = cw::sccpXudtSegments(tcap, kCalled, kCalling, xudt, 100, 0x123456);
    ASSERT_EQ(segments.size(), 3u);
    const auto other = cw::sccpXudtSegments(tcap, kCalled, kCalling, xudt, 100, 0x654321);
    const struct {
        const char *name;
        std::vector<Bytes> sccp;
        size_t messages;
        uint64_t dropped;
    } cases[] = {
        {"in order", {segments[0], segments[1], segments[2]}, 1, 0},
        {"two references interleaved", {segments[0], other[0], segments[1], other[1], other[2], segments[2]}, 2, 0},
        {"first missing", {segments[1], segments[2]}, 0, 2},
        {"one repeated", {segments[0], segments[1], segments[1], segments[2]}, 0, 2},
        {"out of order", {segments[0], segments[2], segments[1]}, 0, 2},
    };
    for (const auto &c : cases) {
        SCOPED_TRACE(c.name);
        Walk walk;
        for (const Bytes &s : c.sccp)
            walk(cap::linktype::kMtp3, cw::mtp3(kLabel, s));
        ASSERT_EQ(walk.sink.found.size(), c.messages);
        for (const Found &f : walk.sink.found)
            EXPECT_EQ(f.tcap, tcap);
        EXPECT_EQ(walk.skipped(cap::Skip::SccpSegmentDropped), c.dropped);
    }
}

TEST(CaptureSccp, PointersAndLengthsOutsideTheMessageAreRejected) {
    Bytes udt = cw::sccpUdt(kTcap, kCalled, kCalling, {});
    // Each pointer, and each length octet, set to run past the message.
    const size_t calledLength = 2 + udt[2], callingLength = 3 + udt[3], dataLength = 4 + udt[4];
    for (const size_t at : {size_t(2), size_t(3), size_t(4), calledLength, callingLength, dataLength}) {
        for (const uint8_t value : {uint8_t(0), uint8_t(0xFF)}) {
            if (value == 0 && at > 4)
                continue; // a zero length is legal
            Bytes bad = udt;
            bad[at] = value;
            const cap::SccpOut out = cap::parseSccp(cap::Bytes{bad.data(), bad.size()}, false);
            EXPECT_EQ(out.skip, cap::Skip::SccpBadPointer) << at << " = " << int(value);
        }
    }
}

} // namespace
