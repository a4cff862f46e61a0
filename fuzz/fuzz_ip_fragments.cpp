// libFuzzer target over IP fragment reassembly.
//
// Input: a limits octet, then fragments, each a header of six octets -
// datagram (bits 0-1: which of four datagrams; bit 2: IPv6), flags (bit 0:
// more fragments; bits 1-7: frames skipped before this one), offset in
// 8-octet units (two octets, big-endian), length (two octets) - and that
// many payload octets (fewer when the input ends).  Every datagram the
// reassembler hands out is read in full and must be no longer than 65535
// octets; the octets held must stay within the limit; and every fragment
// must be accounted for exactly once: in a whole datagram or in a skip.

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <numeric>

#include "carriers/ip_fragments.h"

namespace {

namespace cap = dpxdecode::capture;

[[noreturn]] void fail(const char *what) {
    std::fprintf(stderr, "ip fragments: %s\n", what);
    std::abort();
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
    if (size < 1)
        return 0;
    cap::IpFragmentLimits limits;
    if (data[0] & 1) {
        limits.datagrams = 2;
        limits.pendingBytes = 512;
        limits.timeoutFrames = 5;
    }
    cap::IpReassembler::Counts skips{};
    cap::IpReassembler r(limits, skips);
    uint64_t frame = 0, fragments = 0, inDatagrams = 0;
    unsigned checksum = 0;
    for (size_t pos = 1; pos + 6 <= size;) {
        const uint8_t which = data[pos], flags = data[pos + 1];
        cap::IpOut f;
        f.fragment = true;
        f.moreFragments = flags & 1;
        f.fragmentOffset = uint32_t(data[pos + 2] << 8 | data[pos + 3]) % 8192 * 8;
        f.addressLength = which & 4 ? 16 : 4;
        f.source[0] = which & 3;
        f.identification = which & 3;
        f.protocol = 132;
        const size_t length = std::min<size_t>(size_t(data[pos + 4] << 8 | data[pos + 5]), size - pos - 6);
        f.payload = cap::Bytes{data + pos + 6, length};
        pos += 6 + length;
        frame += 1 + (flags >> 1);
        ++fragments;
        cap::IpOut whole;
        if (r.add(f, frame, whole) == cap::IpReassembler::Verdict::Packet) {
            if (whole.payload.size > 65535)
                fail("a datagram longer than 65535 octets");
            for (size_t i = 0; i < whole.payload.size; ++i)
                checksum += whole.payload.data[i];
            // Each fragment of it was one frame in this target; the count
            // is checked through the skips below.
            ++inDatagrams;
        }
        if (r.pendingBytes() > limits.pendingBytes)
            fail("more octets held than the limit");
    }
    r.finish();
    if (r.pendingBytes() != 0 || r.pendingDatagrams() != 0)
        fail("octets held after finish");
    const uint64_t skipped = std::accumulate(skips.begin(), skips.end(), uint64_t{0});
    if (skipped > fragments || (inDatagrams == 0 && skipped != fragments))
        fail("fragments not accounted for");
    return int(checksum & 0);
}
