// libFuzzer target over dpx-decode's frame walker: link layer, IP, SCTP
// (with duplicate and fragment state), SIGTRAN adaptations, MTP2, MTP3 and
// SCCP (with XUDT segment state) down to the TCAP message.
//
// Input: a link-type octet (an index into kLinkTypes), an option octet, then
// frames, each a two-octet big-endian length and that many octets (a
// length running past the input takes what is left).  The frames go
// through one walker in turn, each copied into a buffer of exactly its
// size, so the reassembly state carries over between them and the address
// sanitizer sees a read past any frame.
//
// Option octet:
//   bit 0  ANSI routing labels and SCCP addresses
//   bit 1  every SSN is selected (not only 146)
//   bit 2  tight reassembly limits (a few flows, small messages), so the
//          eviction and drop paths run
//
// Every TCAP message found is read in full, must be no longer than the
// largest message the limits allow, and the walker's count of messages
// must match the sink's.

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <vector>

#include "carriers/link.h"
#include "carriers/walker.h"

namespace {

namespace cap = dpxdecode::capture;

constexpr uint32_t kLinkTypes[] = {
    cap::linktype::kEthernet,  cap::linktype::kLinuxSll, cap::linktype::kLinuxSll2,
    cap::linktype::kRaw,       cap::linktype::kNull,     cap::linktype::kLoop,
    cap::linktype::kMtp2,      cap::linktype::kMtp2WithPhdr, cap::linktype::kMtp3,
    cap::linktype::kIpv6,
};

struct Sink final : cap::MessageSink {
    size_t messages = 0;
    size_t largest = 0;
    unsigned checksum = 0;
    void onTcap(const cap::TcapMessage &m) override {
        ++messages;
        if (m.tcap.size > largest)
            largest = m.tcap.size;
        for (size_t i = 0; i < m.tcap.size; ++i)
            checksum += m.tcap.data[i];
    }
};

[[noreturn]] void fail(const char *what) {
    std::fprintf(stderr, "frame walker: %s\n", what);
    std::abort();
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
    if (size < 2)
        return 0;
    const uint32_t link = kLinkTypes[data[0] % (sizeof kLinkTypes / sizeof kLinkTypes[0])];
    const uint8_t option = data[1];
    cap::WalkOptions o;
    o.ansi = option & 1;
    if (option & 2)
        o.ssns.set();
    if (option & 4) {
        o.sctp.flows = 2;
        o.sctp.messageBytes = 64;
        o.sctp.pendingBytes = 128;
        o.sctp.tsnWindow = 64;
        o.sccp.messages = 2;
        o.sccp.messageBytes = 64;
    }
    const size_t largestAllowed = std::max<size_t>(o.sctp.messageBytes, 0xFFFF);
    cap::FrameWalker walker(o);
    Sink sink;
    size_t pos = 2;
    std::vector<uint8_t> frame;
    while (pos < size) {
        size_t length = size - pos;
        if (length >= 2) {
            length = std::min<size_t>(size_t(data[pos]) << 8 | data[pos + 1], size - pos - 2);
            pos += 2;
        }
        frame.assign(data + pos, data + pos + length);
        frame.shrink_to_fit();
        pos += length;
        const size_t before = sink.messages;
        const size_t found = walker.walk(link, cap::Bytes{frame.data(), frame.size()}, sink);
        if (found != sink.messages - before)
            fail("message count differs from the messages handed out");
    }
    if (sink.largest > largestAllowed)
        fail("a message longer than the reassembly limits allow");
    return 0;
}
