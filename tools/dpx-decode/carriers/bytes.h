// Byte spans, bounds-checked big- and little-endian reads, and the reasons
// a frame (or one chunk of it) is skipped on its way to a TCAP message.
// Every carrier parser takes a Bytes and returns the inner Bytes or a Skip.
#pragma once

#include <cstddef>
#include <cstdint>

namespace dpxdecode::capture {

struct Bytes {
    const uint8_t *data = nullptr;
    size_t size = 0;

    bool has(size_t at, size_t n) const { return at <= size && n <= size - at; }
    uint8_t u8(size_t at) const { return data[at]; }
    uint16_t be16(size_t at) const { return uint16_t(data[at] << 8 | data[at + 1]); }
    uint16_t le16(size_t at) const { return uint16_t(data[at] | data[at + 1] << 8); }
    uint32_t be32(size_t at) const {
        return uint32_t(data[at]) << 24 | uint32_t(data[at + 1]) << 16 | uint32_t(data[at + 2]) << 8 | data[at + 3];
    }
    uint32_t le24(size_t at) const { return data[at] | uint32_t(data[at + 1]) << 8 | uint32_t(data[at + 2]) << 16; }
    uint32_t le32(size_t at) const { return le24(at) | uint32_t(data[at + 3]) << 24; }
    // The n bytes from `at`; callers check has(at, n) first.
    Bytes sub(size_t at, size_t n) const { return Bytes{data + at, n}; }
    Bytes from(size_t at) const { return Bytes{data + at, size - at}; }
};

// Why nothing (more) was taken from a frame.  Each is counted.
enum class Skip : uint8_t {
    None,
    LinkTypeUnsupported,
    LinkTruncated,
    LinkNotIpOrSs7,
    Mtp2Truncated,
    Mtp2NotMsu,
    Ipv4Truncated,
    Ipv4Fragment,
    Ipv6Truncated,
    Ipv6Fragment,
    IpNotSctp,
    SctpTruncated,
    SctpChunkTruncated,
    SctpNoData,
    SctpDuplicate,
    SctpUnknownPayload,
    SctpReassemblyDropped,
    M3uaTruncated,
    M3uaNotData,
    M2uaTruncated,
    M2uaNotData,
    M2paTruncated,
    M2paNotData,
    SuaTruncated,
    SuaNotCldt,
    SuaSegmented,
    Mtp3Truncated,
    Mtp3NotSccp,
    SccpTruncated,
    SccpBadPointer,
    SccpUnsupportedType,
    SccpSsnNotSelected,
    SccpSegmentDropped,
    Count
};

inline constexpr size_t kSkipCount = size_t(Skip::Count);

// "layer: what", e.g. "sctp: duplicate TSN".
const char *skipName(Skip s);

// What a carrier returns: the inner bytes, or why there are none.
struct Inner {
    Skip skip = Skip::None;
    Bytes bytes;
    bool ok() const { return skip == Skip::None; }
};

} // namespace dpxdecode::capture
