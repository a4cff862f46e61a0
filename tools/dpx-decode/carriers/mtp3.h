// MTP3: the routing label of a message signal unit.
#pragma once

#include "bytes.h"
#include "sigtran.h"

namespace dpxdecode::capture {

inline constexpr uint8_t kServiceSccp = 3;

struct Mtp3Out {
    Skip skip = Skip::None;
    Routing routing;
    Bytes userData; // the SCCP message
};

// SIO and SIF of an MSU.  ITU routing label (14-bit point codes, four
// octets) or, with `ansi`, the ANSI one (24-bit point codes, seven octets).
// A service indicator other than SCCP gives Mtp3NotSccp.
Mtp3Out parseMtp3(Bytes msu, bool ansi);

} // namespace dpxdecode::capture
