// SIGTRAN user adaptations: M3UA, M2UA, M2PA and SUA messages down to what
// they carry.
#pragma once

#include "bytes.h"

namespace dpxdecode::capture {

// SCTP payload protocol identifiers, and the ports that stand in for them
// when the identifier is 0.
enum class Adaptation : uint8_t { None, M2ua, M3ua, Sua, M2pa };
Adaptation adaptationFor(uint32_t protocolId, uint16_t sourcePort, uint16_t destinationPort);

// Point codes and service indicator of an MTP3 user message.
struct Routing {
    bool hasPointCodes = false;
    uint32_t opc = 0;
    uint32_t dpc = 0;
    uint8_t serviceIndicator = 0;
};

struct M3uaOut {
    Skip skip = Skip::None;
    Routing routing;
    Bytes userData; // the SCCP message when the service indicator is 3
};

// A Transfer DATA message: its Protocol Data parameter.  Management and
// other classes give M3uaNotData.
M3uaOut parseM3ua(Bytes message);

// An M2UA DATA message: the MSU (SIO and SIF) of its Protocol Data.
Inner parseM2ua(Bytes message);

// An M2PA User Data message: the MSU (SIO and SIF) after the priority
// octet.  Link status and empty user data give M2paNotData.
Inner parseM2pa(Bytes message);

struct SuaAddress {
    bool hasPointCode = false;
    uint32_t pointCode = 0;
    uint8_t ssn = 0;
};

struct SuaOut {
    Skip skip = Skip::None;
    SuaAddress calling; // source address
    SuaAddress called;  // destination address
    Bytes data;         // the TCAP message
};

// A connectionless data transfer (CLDT).  Segmented data is skipped.
SuaOut parseSua(Bytes message);

} // namespace dpxdecode::capture
