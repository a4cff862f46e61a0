// IP fragments put back together by the frame walker (IPv4 and IPv6, in
// order, reversed, overlapping, duplicated, missing, conflicting, past the
// end, timed out, beyond the memory limits), and CAMEL found on other
// subsystems by its dialogue.

#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

#include "carriers/link.h"
#include "support/capture_frames.h"

namespace {

using namespace captest;

const cw::RoutingLabel kLabel{1234, 5678, 3, 2, false};

// A Begin with a 72-octet component portion: an SCTP packet of some 150
// octets, five fragments of at most 32.
const Bytes kTcap = [] {
    Bytes b{0x62, 0x50, 0x48, 0x04, 0x0A, 0x0B, 0x0C, 0x0D, 0x6C, 0x48};
    for (uint8_t i = 0; i < 0x48; ++i)
        b.push_back(uint8_t(0x30 + i));
    return b;
}();

Bytes sctpWith(const Bytes &tcap, uint8_t calledSsn = 146, uint8_t callingSsn = 146, uint32_t tsn = 1) {
    return m3uaPacket(tcap, kLabel, {calledSsn, false, 0}, {callingSsn, false, 0}, tsn, 7);
}

struct Piece {
    size_t from, to; // octets of the SCTP packet
    bool more;
};

// The fragments of `payload` in 32-octet pieces.
std::vector<Piece> pieces(size_t size) {
    std::vector<Piece> out;
    for (size_t at = 0; at < size; at += 32)
        out.push_back({at, std::min(at + 32, size), at + 32 < size});
    return out;
}

// `source` holds the octets of the piece (the payload, or octets that are
// not its own).
Bytes fragmentFrame(bool v6, const Bytes &source, const Piece &p, uint16_t id = 77) {
    const cw::View piece(source.data() + p.from, p.to - p.from);
    if (v6) {
        const cw::Ipv6Fragment f{id, uint16_t(p.from), p.more};
        return cw::ipv6(kIp6A, kIp6B, cw::kIpProtoSctp, piece, true, &f);
    }
    return cw::ipv4(kIpA, kIpB, cw::kIpProtoSctp, piece, id, {}, uint16_t(p.from), p.more);
}

TEST(CaptureIpFragments, EveryOrderAndFault) {
    const Bytes payload = sctpWith(kTcap);
    const std::vector<Piece> in = pieces(payload.size());
    ASSERT_EQ(in.size(), 5u);
    std::vector<Piece> reversed(in.rbegin(), in.rend());
    std::vector<Piece> overlapping = in;
    for (size_t i = 1; i < overlapping.size(); ++i)
        overlapping[i].from -= 8;
    std::vector<Piece> duplicated;
    for (const Piece &p : in) {
        duplicated.push_back(p);
        if (p.more)
            duplicated.push_back(p);
    }
    const std::vector<Piece> missing(in.begin(), in.end() - 1);
    std::vector<Piece> pastTheEnd{in.back(), Piece{in.back().to + 8, in.back().to + 16, true}};
    pastTheEnd.insert(pastTheEnd.end(), in.begin(), in.end() - 1);
    // Octets past the payload for the piece past the end; one octet of the
    // first fragment changed for the conflicting copy.
    Bytes padded = payload;
    padded.resize(payload.size() + 16, 0xEE);
    Bytes altered = padded;
    altered[10] ^= 0xFF;

    const struct {
        const char *name;
        std::vector<Piece> order;
        size_t alteredAt; // index in `order` sent with the altered octets (none: SIZE_MAX)
        size_t messages;
        cap::Skip why;
        uint64_t skipped;
    } cases[] = {
        {"in order", in, SIZE_MAX, 1, cap::Skip::None, 0},
        {"reversed", reversed, SIZE_MAX, 1, cap::Skip::None, 0},
        {"overlapping with the same octets", overlapping, SIZE_MAX, 1, cap::Skip::None, 0},
        {"each but the last twice", duplicated, SIZE_MAX, 1, cap::Skip::IpFragmentDuplicate, 4},
        {"last one missing", missing, SIZE_MAX, 0, cap::Skip::IpFragmentIncomplete, 4},
        {"overlapping with other octets", duplicated, 1, 0, cap::Skip::IpFragmentOverlap, 9},
        {"one past the last one's end", pastTheEnd, SIZE_MAX, 0, cap::Skip::IpFragmentBeyondEnd, 6},
    };
    for (const bool v6 : {false, true}) {
        for (const auto &c : cases) {
            SCOPED_TRACE(std::string(v6 ? "IPv6: " : "IPv4: ") + c.name);
            Walk walk;
            for (size_t i = 0; i < c.order.size(); ++i)
                walk(cap::linktype::kRaw, fragmentFrame(v6, i == c.alteredAt ? altered : padded, c.order[i]));
            walk.walker.endCapture();
            ASSERT_EQ(walk.sink.found.size(), c.messages);
            if (c.messages != 0) {
                EXPECT_EQ(walk.sink.found[0].tcap, kTcap);
            }
            EXPECT_EQ(skipTotal(walk.walker), c.skipped);
            if (c.why != cap::Skip::None) {
                EXPECT_EQ(walk.skipped(c.why), c.skipped) << cap::skipName(c.why);
            }
        }
    }
}

TEST(CaptureIpFragments, TimeOutsAndLimitsDropTheOldest) {
    const Bytes payload = sctpWith(kTcap);
    const std::vector<Piece> in = pieces(payload.size());
    // The first fragment, four frames of something else, the rest.
    std::vector<Bytes> interrupted{fragmentFrame(false, payload, in[0])};
    for (int i = 0; i < 4; ++i)
        interrupted.push_back(cw::ipv4(kIpA, kIpB, 17, Bytes(8, 0), uint16_t(i)));
    std::vector<Bytes> interleaved, v6;
    for (const Piece &p : in) {
        interleaved.push_back(fragmentFrame(false, payload, p, 1));
        interleaved.push_back(fragmentFrame(false, payload, p, 2));
        v6.push_back(fragmentFrame(true, payload, p));
        if (&p != &in[0])
            interrupted.push_back(fragmentFrame(false, payload, p));
    }
    struct Case {
        const char *name;
        cap::IpFragmentLimits limits;
        const std::vector<Bytes> &frames;
        cap::Skip skip;
        uint64_t skipped;
        size_t found;
    } cases[] = {
        {"the first times out, the rest never complete", {.timeoutFrames = 3}, interrupted,
         cap::Skip::IpFragmentIncomplete, 5, 0},
        {"room for one datagram: the older of two gives way", {.datagrams = 1}, interleaved,
         cap::Skip::IpFragmentNoRoom, 9, 0},
        {"fewer octets held than one datagram needs", {.pendingBytes = 64}, v6, cap::Skip::IpFragmentNoRoom, 5, 0},
    };
    for (const Case &c : cases) {
        cap::WalkOptions o;
        o.ip = c.limits;
        Walk walk(o);
        for (const Bytes &f : c.frames)
            walk(cap::linktype::kRaw, f);
        walk.walker.endCapture();
        EXPECT_EQ(walk.sink.found.size(), c.found) << c.name;
        EXPECT_EQ(walk.skipped(c.skip), c.skipped) << c.name;
    }
}

// ---- CAMEL on other subsystems ---------------------------------------------------

Bytes tcapMessage(uint8_t type, const Bytes &otid, const Bytes &dtid, const Bytes &context) {
    Bytes body;
    if (!otid.empty()) {
        body.insert(body.end(), {0x48, uint8_t(otid.size())});
        body.insert(body.end(), otid.begin(), otid.end());
    }
    if (!dtid.empty()) {
        body.insert(body.end(), {0x49, uint8_t(dtid.size())});
        body.insert(body.end(), dtid.begin(), dtid.end());
    }
    if (!context.empty()) {
        // EXPORT: dialogue-as id, [0] { AARQ { protocol version, [1] { OID } } }
        Bytes name{0x06, uint8_t(context.size())};
        name.insert(name.end(), context.begin(), context.end());
        Bytes aarq{0x80, 0x02, 0x07, 0x80, 0xA1, uint8_t(name.size())};
        aarq.insert(aarq.end(), name.begin(), name.end());
        Bytes single{0x60, uint8_t(aarq.size())};
        single.insert(single.end(), aarq.begin(), aarq.end());
        Bytes external{0x06, 0x07, 0x00, 0x11, 0x86, 0x05, 0x01, 0x01, 0x01, 0xA0, uint8_t(single.size())};
        external.insert(external.end(), single.begin(), single.end());
        body.insert(body.end(), {0x6B, uint8_t(external.size() + 2), 0x28, uint8_t(external.size())});
        body.insert(body.end(), external.begin(), external.end());
    }
    body.insert(body.end(), {0x6C, 0x00});
    Bytes m{type, uint8_t(body.size())};
    m.insert(m.end(), body.begin(), body.end());
    return m;
}

const Bytes kCap4{0x04, 0x00, 0x00, 0x01, 0x17, 0x03, 0x04};   // 0.4.0.0.1.23.3.4
const Bytes kCap2{0x04, 0x00, 0x00, 0x01, 0x00, 0x32, 0x01};   // 0.4.0.0.1.0.50.1
const Bytes kMapLoc{0x04, 0x00, 0x00, 0x01, 0x00, 0x01, 0x03}; // 0.4.0.0.1.0.1.3
const Bytes kA{0x10, 0, 0, 1}, kB{0x80, 0, 0, 1};

TEST(CaptureCamelDialogues, ContextsThatAreCamel) {
    const struct {
        Bytes oid;
        bool camel;
    } cases[] = {
        {kCap4, true},
        {kCap2, true},
        {{0x04, 0x00, 0x00, 0x01, 0x14, 0x03, 0x0E}, true},  // CAP v3 gsmSRF
        {{0x04, 0x00, 0x00, 0x01, 0x15, 0x03, 0x3D}, true},  // CAP v3 SMS
        {kMapLoc, false},
        {{0x04, 0x00, 0x00, 0x01, 0x00, 0x35, 0x01}, false}, // 0.50-0.52 only
        {{0x04, 0x00, 0x00, 0x01, 0x18, 0x03, 0x04}, false}, // 24 is not a CAP arc
        {{0x04, 0x00, 0x00, 0x01, 0x17, 0x03}, false},
        {{0x04, 0x00, 0x00, 0x01, 0x17, 0x03, 0x81, 0x00}, false},
    };
    for (const auto &c : cases)
        EXPECT_EQ(cap::isCamelContext(cap::Bytes{c.oid.data(), c.oid.size()}), c.camel);
}

TEST(CaptureCamelDialogues, FollowedBothWaysByTheirTransactionIds) {
    const Bytes otherA{0x20, 0, 0, 9}, otherB{0x90, 0, 0, 9};
    // (message, called SSN, calling SSN, taken by default)
    const struct {
        const char *name;
        Bytes tcap;
        uint8_t called, calling;
        bool taken;
    } flow[] = {
        {"CAMEL Begin on SSN 10", tcapMessage(0x62, kA, {}, kCap4), 10, 10, true},
        {"MAP Begin on SSN 6", tcapMessage(0x62, otherA, {}, kMapLoc), 6, 7, false},
        {"its Continue", tcapMessage(0x65, kB, kA, {}), 10, 10, true},
        {"MAP Continue", tcapMessage(0x65, otherB, otherA, {}), 7, 6, false},
        {"the other way", tcapMessage(0x65, kA, kB, {}), 10, 10, true},
        {"End", tcapMessage(0x64, {}, kA, {}), 10, 10, true},
        {"the ids are forgotten", tcapMessage(0x65, kA, kB, {}), 10, 10, false},
        {"a Continue is known by its own id too", tcapMessage(0x62, kA, {}, kCap4), 10, 10, true},
        {"", tcapMessage(0x65, kA, otherB, {}), 10, 10, true},
        {"", tcapMessage(0x67, {}, kA, {}), 10, 10, true},
        {"SSN 146 is CAMEL by its SSN", tcapMessage(0x62, otherA, {}, {}), 146, 146, true},
        {"and its dialogue goes on on SSN 12", tcapMessage(0x65, otherB, otherA, {}), 12, 12, true},
        {"Abort", tcapMessage(0x67, {}, otherB, {}), 12, 12, true},
        {"Unidirectional naming CAP v2", tcapMessage(0x61, {}, {}, kCap2), 8, 8, true},
    };
    for (const bool byDialogue : {true, false}) {
        SCOPED_TRACE(byDialogue ? "default" : "--ssn 146");
        cap::WalkOptions o;
        o.camelDialogues = byDialogue;
        Walk walk(o);
        uint32_t tsn = 1;
        for (const auto &m : flow) {
            SCOPED_TRACE(m.name);
            const size_t found = walk(cap::linktype::kRaw, overIpv4(sctpWith(m.tcap, m.called, m.calling, tsn++), 1));
            EXPECT_EQ(found, (byDialogue ? m.taken : m.called == 146) ? 1u : 0u);
        }
        const cap::Skip why = byDialogue ? cap::Skip::TcapNotCamel : cap::Skip::SccpSsnNotSelected;
        EXPECT_EQ(walk.skipped(why), byDialogue ? 3u : 13u);
        EXPECT_EQ(walk.walker.sccpCounts().byCalledSsn[10], 8u);
        EXPECT_EQ(walk.walker.sccpCounts().byCalledSsn[6] + walk.walker.sccpCounts().byCalledSsn[7], 2u);
    }
}

TEST(CaptureCamelDialogues, EveryPrefixOfADialogueMessagePeeksSafely) {
    const Bytes m = tcapMessage(0x62, kA, {}, kCap4);
    for (size_t n = 0; n <= m.size(); ++n) {
        const Bytes prefix(m.begin(), m.begin() + long(n));
        const cap::TcapPeek p = cap::peekTcap(cap::Bytes{prefix.data(), prefix.size()});
        EXPECT_EQ(p.camelContext, n == m.size()) << n;
    }
}

} // namespace
