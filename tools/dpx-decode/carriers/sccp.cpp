#include "sccp.h"

namespace dpxdecode::capture {
namespace {

constexpr uint8_t kParamEnd = 0x00;
constexpr uint8_t kParamSegmentation = 0x10;

bool parseAddress(Bytes a, bool ansi, SccpAddress &out) {
    out.raw = a;
    if (!a.has(0, 1))
        return false;
    const uint8_t indicator = a.u8(0);
    size_t at = 1;
    if (ansi) {
        out.hasSsn = indicator & 0x01;
        out.hasPointCode = indicator & 0x02;
        if (out.hasSsn) {
            if (!a.has(at, 1))
                return false;
            out.ssn = a.u8(at++);
        }
        if (out.hasPointCode) {
            if (!a.has(at, 3))
                return false;
            out.pointCode = a.le24(at);
        }
        return true;
    }
    out.hasPointCode = indicator & 0x01;
    out.hasSsn = indicator & 0x02;
    if (out.hasPointCode) {
        if (!a.has(at, 2))
            return false;
        out.pointCode = a.le16(at) & 0x3FFF;
        at += 2;
    }
    if (out.hasSsn) {
        if (!a.has(at, 1))
            return false;
        out.ssn = a.u8(at);
    }
    return true;
}

// A mandatory variable part: the pointer at `at` counts from itself to a
// length octet (two for long data) and the value.  The two-octet pointers
// of LUDT and LUDTS (least significant octet first) count from their second
// octet, as tshark reads them.
bool variablePart(Bytes m, size_t at, bool widePointer, bool wideLength, Bytes &value) {
    const size_t pointerSize = widePointer ? 2 : 1;
    if (!m.has(at, pointerSize))
        return false;
    const size_t pointer = widePointer ? m.le16(at) : m.u8(at);
    if (pointer == 0)
        return false;
    const size_t start = at + pointerSize - 1 + pointer;
    const size_t lengthSize = wideLength ? 2 : 1;
    if (!m.has(start, lengthSize))
        return false;
    const size_t length = wideLength ? m.le16(start) : m.u8(start);
    if (!m.has(start + lengthSize, length))
        return false;
    value = m.sub(start + lengthSize, length);
    return true;
}

// The optional part: name, length, value until the end-of-parameters name.
bool optionalPart(Bytes m, size_t at, bool widePointer, SccpSegmentation &seg) {
    const size_t pointerSize = widePointer ? 2 : 1;
    if (!m.has(at, pointerSize))
        return false;
    const size_t pointer = widePointer ? m.le16(at) : m.u8(at);
    if (pointer == 0)
        return true; // no optional part
    size_t pos = at + pointerSize - 1 + pointer;
    for (;;) {
        if (!m.has(pos, 1))
            return false;
        const uint8_t name = m.u8(pos);
        if (name == kParamEnd)
            return true;
        if (!m.has(pos + 1, 1))
            return false;
        const size_t length = m.u8(pos + 1);
        if (!m.has(pos + 2, length))
            return false;
        if (name == kParamSegmentation && length >= 4) {
            const uint8_t first = m.u8(pos + 2);
            seg.present = true;
            seg.first = first & 0x80;
            seg.remaining = first & 0x0F;
            seg.localReference = m.le24(pos + 3);
        }
        pos += 2 + length;
    }
}

} // namespace

SccpOut parseSccp(Bytes m, bool ansi) {
    SccpOut o;
    if (!m.has(0, 1)) {
        o.skip = Skip::SccpTruncated;
        return o;
    }
    o.type = m.u8(0);
    // Where the pointers start, their width, and whether there is an
    // optional part.
    size_t pointers = 0;
    bool wide = false;
    bool optional = false;
    switch (o.type) {
    case sccptype::kUdt:
    case sccptype::kUdts:
        pointers = 2; // protocol class or return cause
        break;
    case sccptype::kXudt:
    case sccptype::kXudts:
        pointers = 3; // and the hop counter
        optional = true;
        break;
    case sccptype::kLudt:
    case sccptype::kLudts:
        pointers = 3;
        wide = true;
        optional = true;
        break;
    default:
        o.skip = Skip::SccpUnsupportedType;
        return o;
    }
    if (!m.has(0, pointers + (wide ? 8 : optional ? 4 : 3))) {
        o.skip = Skip::SccpTruncated;
        return o;
    }
    const size_t step = wide ? 2 : 1;
    Bytes called, calling;
    if (!variablePart(m, pointers, wide, false, called) ||
        !variablePart(m, pointers + step, wide, false, calling) ||
        !variablePart(m, pointers + 2 * step, wide, wide, o.data) ||
        (optional && !optionalPart(m, pointers + 3 * step, wide, o.segmentation))) {
        o.skip = Skip::SccpBadPointer;
        return o;
    }
    if (!parseAddress(called, ansi, o.called) || !parseAddress(calling, ansi, o.calling)) {
        o.skip = Skip::SccpBadPointer;
        return o;
    }
    return o;
}

SccpReassembler::Verdict SccpReassembler::add(uint32_t opc, const SccpOut &s, Bytes &message) {
    const SccpSegmentation &seg = s.segmentation;
    if (!seg.present || (seg.first && seg.remaining == 0)) {
        message = s.data;
        return Verdict::Message;
    }
    std::string key(reinterpret_cast<const char *>(&opc), sizeof opc);
    key.append(reinterpret_cast<const char *>(&seg.localReference), sizeof seg.localReference);
    key.append(reinterpret_cast<const char *>(s.calling.raw.data), s.calling.raw.size);
    ++clock_;
    if (seg.first) {
        if (s.data.size > limits_.messageBytes)
            return Verdict::Dropped;
        if (inProgress_.size() >= limits_.messages && inProgress_.find(key) == inProgress_.end()) {
            auto oldest = inProgress_.begin();
            for (auto i = inProgress_.begin(); i != inProgress_.end(); ++i)
                if (i->second.lastUse < oldest->second.lastUse)
                    oldest = i;
            inProgress_.erase(oldest);
        }
        Partial &p = inProgress_[key];
        p.remaining = seg.remaining;
        p.lastUse = clock_;
        p.bytes.assign(s.data.data, s.data.data + s.data.size);
        return Verdict::Pending;
    }
    auto it = inProgress_.find(key);
    if (it == inProgress_.end())
        return Verdict::Dropped;
    Partial &p = it->second;
    if (seg.remaining + 1 != p.remaining || p.bytes.size() + s.data.size > limits_.messageBytes) {
        inProgress_.erase(it);
        return Verdict::Dropped;
    }
    p.bytes.insert(p.bytes.end(), s.data.data, s.data.data + s.data.size);
    p.remaining = seg.remaining;
    p.lastUse = clock_;
    if (p.remaining != 0)
        return Verdict::Pending;
    assembled_.swap(p.bytes);
    inProgress_.erase(it);
    message = Bytes{assembled_.data(), assembled_.size()};
    return Verdict::Message;
}

} // namespace dpxdecode::capture
