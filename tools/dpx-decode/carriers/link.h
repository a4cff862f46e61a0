// Link layers: what a capture's link type puts in front of IP or of the SS7
// signalling units.
#pragma once

#include "bytes.h"

namespace dpxdecode::capture {

// Link-type numbers as libpcap reports them (pcap_datalink), with the
// file-format numbers of raw IP accepted as well.
namespace linktype {
inline constexpr uint32_t kNull = 0;      // BSD loopback, host byte order
inline constexpr uint32_t kEthernet = 1;
inline constexpr uint32_t kRawOpenBsd = 12; // DLT_RAW on most systems
inline constexpr uint32_t kRawBsd = 14;
inline constexpr uint32_t kRaw = 101;
inline constexpr uint32_t kLoop = 108;    // BSD loopback, network byte order
inline constexpr uint32_t kLinuxSll = 113;
inline constexpr uint32_t kMtp2WithPhdr = 139;
inline constexpr uint32_t kMtp2 = 140;
inline constexpr uint32_t kMtp3 = 141;
inline constexpr uint32_t kIpv4 = 228;
inline constexpr uint32_t kIpv6 = 229;
inline constexpr uint32_t kLinuxSll2 = 276;
} // namespace linktype

enum class Network : uint8_t {
    Ipv4,
    Ipv6,
    Mtp3, // a message signal unit's SIO and SIF
};

struct LinkOut {
    Skip skip = Skip::None;
    Network network = Network::Ipv4;
    Bytes payload;
};

// Strips the link layer of one frame.
LinkOut parseLink(uint32_t linkType, Bytes frame);

// An MTP2 signal unit (no pseudo-header): the MSU's SIO and SIF, or
// Mtp2NotMsu for fill-in and link-status units.  `extended` selects the
// six-octet header of extended sequence numbering.
Inner parseMtp2(Bytes unit, bool extended);

} // namespace dpxdecode::capture
