#include "capture_file.h"

#include <algorithm>
#include <cstring>
#include <initializer_list>

namespace dpxdecode {
namespace {

constexpr uint32_t kPcapMicro = 0xA1B2C3D4;
constexpr uint32_t kPcapNano = 0xA1B23C4D;
constexpr uint32_t kPcapModified = 0xA1B2CD34; // 24-octet record headers
constexpr uint32_t kBlockSection = 0x0A0D0D0A;
constexpr uint32_t kBlockInterface = 1;
constexpr uint32_t kBlockObsoletePacket = 2;
constexpr uint32_t kBlockSimplePacket = 3;
constexpr uint32_t kBlockEnhancedPacket = 6;
constexpr uint16_t kOptionEnd = 0;
constexpr uint16_t kOptionTsResolution = 9;
constexpr uint16_t kOptionTsOffset = 14;
constexpr size_t kReadSize = 1 << 16;

uint32_t be32(const uint8_t *p) { return uint32_t(p[0]) << 24 | uint32_t(p[1]) << 16 | uint32_t(p[2]) << 8 | p[3]; }
uint32_t le32(const uint8_t *p) { return uint32_t(p[3]) << 24 | uint32_t(p[2]) << 16 | uint32_t(p[1]) << 8 | p[0]; }

uint64_t power(uint64_t base, unsigned exponent) {
    uint64_t v = 1;
    while (exponent-- != 0)
        v *= base;
    return v;
}

} // namespace

bool isCaptureMagic(const uint8_t m[4]) {
    for (const uint32_t magic : {kPcapMicro, kPcapNano, kPcapModified})
        if (be32(m) == magic || le32(m) == magic)
            return true;
    return be32(m) == kBlockSection;
}

bool CaptureReader::fill(size_t n, bool &ended) {
    ended = false;
    if (end_ - pos_ >= n)
        return true;
    if (buf_.size() - pos_ < n) {
        if (end_ != pos_)
            std::memmove(buf_.data(), buf_.data() + pos_, end_ - pos_);
        end_ -= pos_;
        pos_ = 0;
        if (buf_.size() < n)
            buf_.resize(std::max(n, kReadSize));
    }
    while (end_ - pos_ < n) {
        const long got = in_.read(buf_.data() + end_, buf_.size() - end_);
        if (got < 0) {
            error_ = "frame " + std::to_string(frames_ + 1) + ": read error: " + in_.error();
            return false;
        }
        if (got == 0) {
            ended = true;
            return true;
        }
        end_ += size_t(got);
    }
    return true;
}

uint16_t CaptureReader::u16(size_t at) const {
    const uint8_t *p = buf_.data() + pos_ + at;
    return bigEndian_ ? uint16_t(p[0] << 8 | p[1]) : uint16_t(p[1] << 8 | p[0]);
}

uint32_t CaptureReader::u32(size_t at) const {
    const uint8_t *p = buf_.data() + pos_ + at;
    return bigEndian_ ? be32(p) : le32(p);
}

CaptureReader::Next CaptureReader::damaged(const std::string &what) {
    done_ = true;
    error_ = "frame " + std::to_string(frames_ + 1) + ": " + what;
    return Next::Damaged;
}

CaptureReader::Next CaptureReader::cutShort(size_t have, size_t want) {
    return damaged("the capture is cut short (" + std::to_string(have) + " of " + std::to_string(want) +
                   " octets of a " + (format_ == Format::Pcap ? "record" : "block") + ")");
}

CaptureReader::Next CaptureReader::start() {
    bool ended = false;
    if (!fill(4, ended)) {
        done_ = true;
        return Next::Damaged;
    }
    if (ended || !isCaptureMagic(buf_.data()))
        return damaged("not a pcap or pcapng capture");
    const uint8_t *m = buf_.data();
    if (be32(m) == kBlockSection) {
        format_ = Format::Pcapng;
        return Next::Frame;
    }
    format_ = Format::Pcap;
    bigEndian_ = be32(m) == kPcapMicro || be32(m) == kPcapNano || be32(m) == kPcapModified;
    const uint32_t magic = bigEndian_ ? be32(m) : le32(m);
    if (!fill(24, ended)) {
        done_ = true;
        return Next::Damaged;
    }
    if (ended)
        return cutShort(end_ - pos_, 24);
    if (u16(4) != 2)
        return damaged("pcap version " + std::to_string(u16(4)) + "." + std::to_string(u16(6)) + " is not read");
    pcapNanoseconds_ = magic == kPcapNano;
    pcapRecordHeader_ = magic == kPcapModified ? 24 : 16;
    // The upper bits of the link type carry the FCS length, not the type.
    pcapLinkType_ = u32(20) & 0x03FFFFFF;
    pos_ += 24;
    return Next::Frame;
}

CaptureReader::Next CaptureReader::next(Frame &frame) {
    if (done_)
        return error_.empty() ? Next::End : Next::Damaged;
    if (format_ == Format::Unknown) {
        const Next n = start();
        if (n != Next::Frame)
            return n;
    }
    if (format_ == Format::Pcap)
        return pcapRecord(frame);
    for (;;) {
        bool isFrame = false;
        const Next n = pcapngBlock(frame, isFrame);
        if (n != Next::Frame || isFrame)
            return n;
    }
}

CaptureReader::Next CaptureReader::pcapRecord(Frame &frame) {
    bool ended = false;
    const size_t header = pcapRecordHeader_;
    if (!fill(header, ended)) {
        done_ = true;
        return Next::Damaged;
    }
    if (ended) {
        done_ = true;
        return end_ == pos_ ? Next::End : cutShort(end_ - pos_, header);
    }
    const uint32_t captured = u32(8);
    if (captured > kMaxBlock)
        return damaged("a record of " + std::to_string(captured) + " octets");
    if (!fill(header + captured, ended)) {
        done_ = true;
        return Next::Damaged;
    }
    if (ended)
        return cutShort(end_ - pos_, header + captured);
    ++frames_;
    frame.number = frames_;
    const uint32_t fraction = u32(4);
    const uint64_t nanoseconds = pcapNanoseconds_ ? fraction : uint64_t(fraction) * 1000;
    frame.seconds = int64_t(u32(0)) + int64_t(nanoseconds / 1000000000u);
    frame.nanoseconds = uint32_t(nanoseconds % 1000000000u);
    frame.linkType = pcapLinkType_;
    frame.interface = 0;
    frame.data = buf_.data() + pos_ + header;
    frame.size = captured;
    frame.originalSize = u32(12);
    pos_ += header + captured;
    return Next::Frame;
}

CaptureReader::Next CaptureReader::pcapngBlock(Frame &frame, bool &isFrame) {
    bool ended = false;
    if (!fill(8, ended)) {
        done_ = true;
        return Next::Damaged;
    }
    if (ended) {
        done_ = true;
        return end_ == pos_ ? Next::End : cutShort(end_ - pos_, 8);
    }
    if (be32(buf_.data() + pos_) == kBlockSection) {
        // The byte-order magic decides how this section's numbers read,
        // the section header's own length included.
        if (!fill(12, ended)) {
            done_ = true;
            return Next::Damaged;
        }
        if (ended)
            return cutShort(end_ - pos_, 12);
        const uint32_t order = be32(buf_.data() + pos_ + 8);
        if (order != 0x1A2B3C4D && order != 0x4D3C2B1A)
            return damaged("a section header with an unknown byte-order magic");
        bigEndian_ = order == 0x1A2B3C4D;
    }
    const uint32_t type = u32(0);
    const uint32_t length = u32(4);
    if (length < 12 || length % 4 != 0 || length > kMaxBlock)
        return damaged("a block (type " + std::to_string(type) + ") of " + std::to_string(length) + " octets");
    if (!fill(length, ended)) {
        done_ = true;
        return Next::Damaged;
    }
    if (ended)
        return cutShort(end_ - pos_, length);
    if (u32(length - 4) != length)
        return damaged("a block whose two lengths differ");
    const size_t bodyLength = length - 12;
    Next n = Next::Frame;
    switch (type) {
    case kBlockSection:
        n = sectionHeader();
        break;
    case kBlockInterface:
        n = interfaceDescription(8, bodyLength);
        break;
    case kBlockEnhancedPacket:
    case kBlockObsoletePacket: {
        if (bodyLength < 20)
            return damaged("a packet block too short for its fields");
        const uint32_t captured = u32(20);
        if (captured > bodyLength - 20)
            return damaged("a packet longer than its block");
        const uint32_t interface = type == kBlockEnhancedPacket ? u32(8) : u16(8);
        isFrame = true;
        n = packet(frame, interface, uint64_t(u32(12)) << 32 | u32(16), 28, captured, u32(24));
        break;
    }
    case kBlockSimplePacket: {
        if (bodyLength < 4)
            return damaged("a simple packet block too short for its fields");
        const uint32_t original = u32(8);
        isFrame = true;
        n = packet(frame, 0, 0, 12, uint32_t(std::min<size_t>(original, bodyLength - 4)), original);
        break;
    }
    default: // name resolution, statistics, secrets, custom blocks
        break;
    }
    if (n == Next::Frame)
        pos_ += length;
    return n;
}

CaptureReader::Next CaptureReader::sectionHeader() {
    if (u16(12) != 1)
        return damaged("pcapng version " + std::to_string(u16(12)) + "." + std::to_string(u16(14)) +
                       " is not read");
    interfaces_.clear();
    return Next::Frame;
}

CaptureReader::Next CaptureReader::interfaceDescription(size_t body, size_t bodyLength) {
    if (bodyLength < 8)
        return damaged("an interface description too short for its fields");
    if (interfaces_.size() >= kMaxInterfaces)
        return damaged("more than " + std::to_string(kMaxInterfaces) + " interfaces in a section");
    Interface i;
    i.linkType = u16(body);
    // Options: code, length, value padded to four octets.  Options are
    // read while they fit in the block; what does not fit is ignored.
    for (size_t at = body + 8; at + 4 <= body + bodyLength;) {
        const uint16_t code = u16(at);
        const size_t length = u16(at + 2);
        const size_t value = at + 4;
        if (code == kOptionEnd || value + length > body + bodyLength)
            break;
        if (code == kOptionTsResolution && length >= 1) {
            const uint8_t r = buf_[pos_ + value];
            i.binary = (r & 0x80) != 0;
            i.exponent = r & 0x7F;
            if (i.binary ? i.exponent > 63 : i.exponent > 19)
                return damaged("interface " + std::to_string(interfaces_.size()) +
                               ": a time stamp resolution finer than this reader takes");
            i.unitsPerSecond = i.binary ? uint64_t(1) << i.exponent : power(10, i.exponent);
        } else if (code == kOptionTsOffset && length >= 8) {
            const uint64_t hi = u32(value + (bigEndian_ ? 0 : 4));
            const uint64_t lo = u32(value + (bigEndian_ ? 4 : 0));
            i.offsetSeconds = int64_t(hi << 32 | lo);
        }
        at = value + ((length + 3) & ~size_t(3));
    }
    interfaces_.push_back(i);
    return Next::Frame;
}

CaptureReader::Next CaptureReader::packet(Frame &frame, uint32_t interface, uint64_t timestamp, size_t data,
                                          uint32_t captured, uint32_t original) {
    if (interface >= interfaces_.size())
        return damaged("a packet of interface " + std::to_string(interface) +
                       ", which its section does not describe");
    const Interface &i = interfaces_[interface];
    ++frames_;
    frame.number = frames_;
    setTime(frame, i, timestamp);
    frame.linkType = i.linkType;
    frame.interface = interface;
    frame.data = buf_.data() + pos_ + data;
    frame.size = captured;
    frame.originalSize = original;
    return Next::Frame;
}

void CaptureReader::setTime(Frame &frame, const Interface &i, uint64_t timestamp) const {
    uint64_t rest = timestamp % i.unitsPerSecond;
    frame.seconds = int64_t(timestamp / i.unitsPerSecond) + i.offsetSeconds;
    if (!i.binary) {
        frame.nanoseconds = uint32_t(i.exponent <= 9 ? rest * power(10, 9u - i.exponent)
                                                     : rest / power(10, i.exponent - 9u));
        return;
    }
    // rest < 2^exponent; below 2^-34 s the fraction is finer than a nanosecond.
    unsigned e = i.exponent;
    if (e > 34) {
        rest >>= e - 34;
        e = 34;
    }
    frame.nanoseconds = uint32_t((rest * 1000000000u) >> e);
}

} // namespace dpxdecode
