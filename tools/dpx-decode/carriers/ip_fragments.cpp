#include "ip_fragments.h"

#include <algorithm>
#include <cstring>

namespace dpxdecode::capture {
namespace {

// The largest payload a datagram can have: its 16-bit length field.
constexpr uint32_t kMaxDatagram = 65535;

} // namespace

IpReassembler::Datagram *IpReassembler::find(const IpOut &f) {
    for (Datagram &d : slots_)
        if (d.used && d.identification == f.identification && d.addressLength == f.addressLength &&
            std::memcmp(d.source, f.source, f.addressLength) == 0 &&
            std::memcmp(d.destination, f.destination, f.addressLength) == 0 &&
            (f.addressLength != 4 || d.protocol == f.protocol))
            return &d;
    return nullptr;
}

IpReassembler::Datagram *IpReassembler::open(const IpOut &f, uint64_t frame) {
    Datagram *slot = nullptr;
    for (Datagram &d : slots_)
        if (!d.used) {
            slot = &d;
            break;
        }
    if (slot == nullptr && slots_.size() < limits_.datagrams)
        slot = &slots_.emplace_back();
    if (slot == nullptr) {
        // Every slot is taken: the oldest datagram gives way.
        for (Datagram &d : slots_)
            if (slot == nullptr || d.firstFrame < slot->firstFrame)
                slot = &d;
        if (slot == nullptr)
            return nullptr; // no slots at all (limits of zero)
        if (!slot->poisoned)
            drop(*slot, Skip::IpFragmentNoRoom, false);
        release(*slot);
    }
    Datagram &d = *slot;
    d.used = true;
    d.poisoned = false;
    d.reason = Skip::None;
    d.addressLength = f.addressLength;
    std::memcpy(d.source, f.source, sizeof d.source);
    std::memcpy(d.destination, f.destination, sizeof d.destination);
    d.identification = f.identification;
    d.protocol = f.addressLength == 4 ? f.protocol : 0;
    d.haveLast = false;
    d.total = 0;
    d.firstFrame = frame;
    d.fragments = 0;
    d.bytes.clear();
    return &d;
}

void IpReassembler::release(Datagram &d) {
    pendingBytes_ -= d.held;
    d.held = 0;
    d.bytes.clear();
    d.ranges.clear();
    d.used = false;
}

void IpReassembler::drop(Datagram &d, Skip reason, bool keepPoisoned) {
    (*skips_)[size_t(reason)] += d.fragments;
    release(d);
    if (keepPoisoned) {
        d.used = true;
        d.poisoned = true;
        d.reason = reason;
        d.fragments = 0;
    }
}

void IpReassembler::expire(uint64_t frame) {
    for (Datagram &d : slots_) {
        if (!d.used || frame - d.firstFrame <= limits_.timeoutFrames)
            continue;
        if (d.poisoned)
            release(d);
        else
            drop(d, Skip::IpFragmentIncomplete, false);
    }
}

void IpReassembler::finish() {
    for (Datagram &d : slots_)
        if (d.used) {
            if (!d.poisoned)
                drop(d, Skip::IpFragmentIncomplete, false);
            release(d);
        }
}

size_t IpReassembler::pendingDatagrams() const {
    size_t n = 0;
    for (const Datagram &d : slots_)
        n += d.used && !d.poisoned;
    return n;
}

IpReassembler::Verdict IpReassembler::add(const IpOut &f, uint64_t frame, IpOut &whole) {
    expire(frame);
    Datagram *d = find(f);
    if (d == nullptr)
        d = open(f, frame);
    if (d == nullptr) {
        ++(*skips_)[size_t(Skip::IpFragmentNoRoom)];
        return Verdict::Dropped;
    }
    ++d->fragments;
    if (d->poisoned) {
        drop(*d, d->reason, true);
        return Verdict::Dropped;
    }
    const Verdict v = place(*d, f);
    if (v != Verdict::Packet)
        return v;
    whole = f;
    whole.moreFragments = false;
    whole.fragmentOffset = 0;
    whole.protocol = d->protocol;
    whole.payload = Bytes{d->bytes.data(), d->total};
    // The octets stay where they are until the slot is next opened.
    pendingBytes_ -= d->held;
    d->held = 0;
    d->ranges.clear();
    d->used = false;
    return Verdict::Packet;
}

IpReassembler::Verdict IpReassembler::place(Datagram &d, const IpOut &f) {
    const uint32_t begin = f.fragmentOffset;
    const size_t size = f.payload.size;
    const uint32_t received = d.ranges.empty() ? 0 : d.ranges.back().end;
    if (size > kMaxDatagram - begin || (d.haveLast && begin + size > d.total) ||
        (!f.moreFragments && ((d.haveLast && begin + size != d.total) || begin + size < received))) {
        drop(d, Skip::IpFragmentBeyondEnd, true);
        return Verdict::Dropped;
    }
    const auto end = uint32_t(begin + size);
    // Octets seen before must be the same octets.
    bool covered = false;
    for (const Range &r : d.ranges) {
        const uint32_t from = std::max(r.begin, begin), to = std::min(r.end, end);
        if (from >= to)
            continue;
        if (std::memcmp(d.bytes.data() + from, f.payload.data + (from - begin), to - from) != 0) {
            drop(d, Skip::IpFragmentOverlap, true);
            return Verdict::Dropped;
        }
        covered |= r.begin <= begin && end <= r.end;
    }
    if (covered && (f.moreFragments || d.haveLast)) {
        --d.fragments;
        ++(*skips_)[size_t(Skip::IpFragmentDuplicate)];
        return Verdict::Dropped;
    }
    if (end > d.bytes.size()) {
        const size_t growth = end - d.bytes.size();
        if (pendingBytes_ + growth > limits_.pendingBytes) {
            drop(d, Skip::IpFragmentNoRoom, true);
            return Verdict::Dropped;
        }
        d.bytes.resize(end);
        d.held += growth;
        pendingBytes_ += growth;
    }
    if (size != 0)
        std::memcpy(d.bytes.data() + begin, f.payload.data, size);
    if (!f.moreFragments) {
        d.haveLast = true;
        d.total = end;
    }
    if (begin == 0 && f.addressLength == 16)
        d.protocol = f.protocol;
    // Insert [begin, end) and merge it with the ranges it touches.
    auto at = std::lower_bound(d.ranges.begin(), d.ranges.end(), begin,
                               [](const Range &r, uint32_t b) { return r.end < b; });
    Range merged{begin, end};
    auto last = at;
    while (last != d.ranges.end() && last->begin <= end) {
        merged.begin = std::min(merged.begin, last->begin);
        merged.end = std::max(merged.end, last->end);
        ++last;
    }
    at = d.ranges.erase(at, last);
    d.ranges.insert(at, merged);
    const bool whole = d.haveLast && d.ranges.size() == 1 && d.ranges[0].begin == 0 && d.ranges[0].end == d.total;
    return whole ? Verdict::Packet : Verdict::Pending;
}

} // namespace dpxdecode::capture
