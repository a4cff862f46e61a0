// Capture files, frame by frame: pcap (either byte order, micro- or
// nanosecond time stamps, the modified format with longer record headers)
// and pcapng (any number of sections and interfaces; each frame carries the
// link type of its own interface).  The reader pulls octets from a
// ByteStream, so it reads plain and decompressed files alike, and octets
// in memory.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "streams.h"

namespace dpxdecode {

// The first four octets of a pcap or pcapng file.
bool isCaptureMagic(const uint8_t magic[4]);

struct Frame {
    uint64_t number = 0; // from 1
    int64_t seconds = 0;
    uint32_t nanoseconds = 0;
    uint32_t linkType = 0;  // LINKTYPE_ value of the frame's interface
    uint32_t interface = 0; // pcapng interface (0 for pcap)
    const uint8_t *data = nullptr;
    uint32_t size = 0;         // captured octets
    uint32_t originalSize = 0; // octets on the wire
};

class CaptureReader {
public:
    // A frame or block longer than this is taken for damage.
    static constexpr uint32_t kMaxBlock = 16u << 20;
    // At most this many interfaces per pcapng section.
    static constexpr size_t kMaxInterfaces = 1u << 16;

    explicit CaptureReader(ByteStream &in) : in_(in) {}

    enum class Next : uint8_t {
        Frame,   // `frame` is set; its data stays valid until the next call
        End,     // the capture ended where a frame or block ends
        Damaged, // error() says what and where; nothing more is read
    };
    Next next(Frame &frame);

    const std::string &error() const { return error_; }
    uint64_t frames() const { return frames_; }

private:
    struct Interface {
        uint32_t linkType = 0;
        uint64_t unitsPerSecond = 1000000; // time stamp resolution
        bool binary = false;               // resolution a power of 2 (exponent in `exponent`)
        uint8_t exponent = 6;
        int64_t offsetSeconds = 0;
    };
    enum class Format : uint8_t { Unknown, Pcap, Pcapng };

    bool fill(size_t n, bool &ended);
    Next damaged(const std::string &what);
    Next cutShort(size_t have, size_t want);
    uint16_t u16(size_t at) const;
    uint32_t u32(size_t at) const;
    Next start();
    Next pcapRecord(Frame &frame);
    Next pcapngBlock(Frame &frame, bool &isFrame);
    Next sectionHeader();
    Next interfaceDescription(size_t body, size_t bodyLength);
    Next packet(Frame &frame, uint32_t interface, uint64_t timestamp, size_t data, uint32_t captured,
                uint32_t original);
    void setTime(Frame &frame, const Interface &i, uint64_t timestamp) const;

    ByteStream &in_;
    std::vector<uint8_t> buf_;
    size_t pos_ = 0; // start of the current record or block in buf_
    size_t end_ = 0; // octets read into buf_
    Format format_ = Format::Unknown;
    bool bigEndian_ = false;
    bool done_ = false;
    // pcap
    uint32_t pcapLinkType_ = 0;
    bool pcapNanoseconds_ = false;
    size_t pcapRecordHeader_ = 16;
    // pcapng
    std::vector<Interface> interfaces_;
    uint64_t frames_ = 0;
    std::string error_;
};

} // namespace dpxdecode
