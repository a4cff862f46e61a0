#include "sctp.h"

#include <cstring>

namespace dpxdecode::capture {

SctpHeader parseSctpHeader(Bytes p) {
    SctpHeader h;
    if (!p.has(0, 12)) {
        h.skip = Skip::SctpTruncated;
        return h;
    }
    h.sourcePort = p.be16(0);
    h.destinationPort = p.be16(2);
    h.verificationTag = p.be32(4);
    h.chunks = p.from(12);
    return h;
}

bool SctpChunkWalker::next(SctpChunk &chunk) {
    if (skip_ != Skip::None || rest_.size == 0)
        return false;
    if (!rest_.has(0, 4)) {
        skip_ = Skip::SctpChunkTruncated;
        return false;
    }
    const size_t length = rest_.be16(2);
    if (length < 4 || !rest_.has(0, length)) {
        skip_ = Skip::SctpChunkTruncated;
        return false;
    }
    chunk.type = rest_.u8(0);
    chunk.flags = rest_.u8(1);
    chunk.value = rest_.sub(4, length - 4);
    // Chunks are padded to four octets; the last one may lack its padding.
    const size_t padded = (length + 3) & ~size_t(3);
    rest_ = padded >= rest_.size ? Bytes{rest_.data + rest_.size, 0} : rest_.from(padded);
    return true;
}

SctpData parseSctpData(uint8_t flags, Bytes v) {
    SctpData d;
    // TSN, stream identifier, stream sequence number, payload protocol.
    if (!v.has(0, 12)) {
        d.skip = Skip::SctpChunkTruncated;
        return d;
    }
    d.unordered = flags & 0x04;
    d.first = flags & 0x02;
    d.last = flags & 0x01;
    d.tsn = v.be32(0);
    d.stream = v.be16(4);
    d.streamSequence = v.be16(6);
    d.protocolId = v.be32(8);
    d.data = v.from(12);
    return d;
}

size_t SctpFlowKeyHash::operator()(const SctpFlowKey &k) const {
    uint64_t h = 1469598103934665603ull;
    const auto mix = [&h](const uint8_t *p, size_t n) {
        for (size_t i = 0; i < n; ++i)
            h = (h ^ p[i]) * 1099511628211ull;
    };
    mix(k.source, k.addressLength);
    mix(k.destination, k.addressLength);
    const uint32_t ports = uint32_t(k.sourcePort) << 16 | k.destinationPort;
    mix(reinterpret_cast<const uint8_t *>(&ports), sizeof ports);
    mix(reinterpret_cast<const uint8_t *>(&k.verificationTag), sizeof k.verificationTag);
    return size_t(h ^ (h >> 32));
}

bool SctpReassembler::seenBefore(Flow &f, uint32_t tsn) {
    const uint32_t window = limits_.tsnWindow;
    if (f.seen.empty())
        f.seen.assign((window + 63) / 64, 0);
    const auto bit = [&](uint32_t t) -> uint64_t & { return f.seen[(t % window) / 64]; };
    const auto mask = [&](uint32_t t) { return uint64_t(1) << ((t % window) % 64); };
    if (!f.started) {
        f.started = true;
        f.highest = tsn;
        bit(tsn) |= mask(tsn);
        return false;
    }
    const auto ahead = int32_t(tsn - f.highest); // serial-number arithmetic
    if (ahead > 0) {
        if (uint32_t(ahead) >= window) {
            std::fill(f.seen.begin(), f.seen.end(), 0);
        } else {
            for (uint32_t t = f.highest + 1; t != tsn; ++t)
                bit(t) &= ~mask(t);
        }
        f.highest = tsn;
        bit(tsn) |= mask(tsn);
        return false;
    }
    // Too far behind to remember: taken for a retransmission.
    if (uint32_t(-int64_t(ahead)) >= window)
        return true;
    if (bit(tsn) & mask(tsn))
        return true;
    bit(tsn) |= mask(tsn);
    return false;
}

void SctpReassembler::dropFragments(Flow &f) {
    for (const auto &[tsn, frag] : f.fragments)
        pendingBytes_ -= frag.bytes.size();
    f.fragments.clear();
}

SctpReassembler::Flow &SctpReassembler::flowFor(const SctpFlowKey &key) {
    auto it = flows_.find(key);
    if (it == flows_.end()) {
        if (flows_.size() >= limits_.flows) {
            auto oldest = flows_.begin();
            for (auto i = flows_.begin(); i != flows_.end(); ++i)
                if (i->second.lastUse < oldest->second.lastUse)
                    oldest = i;
            dropFragments(oldest->second);
            flows_.erase(oldest);
        }
        it = flows_.emplace(key, Flow{}).first;
    }
    it->second.lastUse = ++clock_;
    return it->second;
}

size_t SctpReassembler::pendingFragments() const {
    size_t n = 0;
    for (const auto &[key, flow] : flows_)
        n += flow.fragments.size();
    return n;
}

SctpReassembler::Verdict SctpReassembler::add(const SctpFlowKey &key, const SctpData &chunk, Bytes &message) {
    Flow &f = flowFor(key);
    if (seenBefore(f, chunk.tsn))
        return Verdict::Duplicate;
    if (chunk.first && chunk.last) {
        message = chunk.data;
        return Verdict::Message;
    }
    if (chunk.data.size > limits_.messageBytes)
        return Verdict::Dropped;
    if (pendingBytes_ + chunk.data.size > limits_.pendingBytes) {
        for (auto &[k, other] : flows_)
            dropFragments(other);
        return Verdict::Dropped;
    }
    Fragment &frag = f.fragments[chunk.tsn];
    frag.first = chunk.first;
    frag.last = chunk.last;
    frag.bytes.assign(chunk.data.data, chunk.data.data + chunk.data.size);
    pendingBytes_ += frag.bytes.size();

    // The fragments of one user message carry consecutive TSNs.
    uint32_t begin = chunk.tsn;
    size_t total = frag.bytes.size();
    for (auto it = f.fragments.find(begin); !it->second.first;) {
        it = f.fragments.find(begin - 1);
        if (it == f.fragments.end() || it->second.last)
            return Verdict::Pending;
        --begin;
        total += it->second.bytes.size();
    }
    uint32_t end = chunk.tsn;
    for (auto it = f.fragments.find(end); !it->second.last;) {
        it = f.fragments.find(end + 1);
        if (it == f.fragments.end() || it->second.first)
            return Verdict::Pending;
        ++end;
        total += it->second.bytes.size();
    }
    if (total > limits_.messageBytes) {
        for (uint32_t t = begin;; ++t) {
            auto it = f.fragments.find(t);
            pendingBytes_ -= it->second.bytes.size();
            f.fragments.erase(it);
            if (t == end)
                break;
        }
        return Verdict::Dropped;
    }
    assembled_.clear();
    for (uint32_t t = begin;; ++t) {
        auto it = f.fragments.find(t);
        assembled_.insert(assembled_.end(), it->second.bytes.begin(), it->second.bytes.end());
        pendingBytes_ -= it->second.bytes.size();
        f.fragments.erase(it);
        if (t == end)
            break;
    }
    message = Bytes{assembled_.data(), assembled_.size()};
    return Verdict::Message;
}

} // namespace dpxdecode::capture
