// What the carriers need to know of a TCAP message to find CAMEL on
// subsystems other than 146: its type, its transaction ids and whether its
// dialogue portion names a CAMEL application context; and the dialogues
// found to be CAMEL, by their transaction ids.
#pragma once

#include <cstdint>
#include <vector>

#include "bytes.h"

namespace dpxdecode::capture {

namespace tcaptype {
inline constexpr uint8_t kUnidirectional = 0x61;
inline constexpr uint8_t kBegin = 0x62;
inline constexpr uint8_t kEnd = 0x64;
inline constexpr uint8_t kContinue = 0x65;
inline constexpr uint8_t kAbort = 0x67;
} // namespace tcaptype

struct TcapPeek {
    bool ok = false; // a TCAP message type with well-formed transaction ids
    uint8_t type = 0;
    bool hasOtid = false;
    bool hasDtid = false;
    uint32_t otid = 0; // 1 to 4 octets, as a number
    uint32_t dtid = 0;
    uint8_t otidLength = 0;
    uint8_t dtidLength = 0;
    bool camelContext = false; // the dialogue portion names a CAMEL application context
};

// Reads the message type, the transaction ids and the dialogue portion's
// application context name; the components are not looked at.
TcapPeek peekTcap(Bytes message);

// The contents octets of an OBJECT IDENTIFIER: whether it is one of the
// CAMEL application contexts (phases 1 to 4: 0.4.0.0.1.0.50-52.x and
// 0.4.0.0.1.20-23.3.x).
bool isCamelContext(Bytes oid);

// The transaction ids of dialogues known to be CAMEL.  A Begin that names
// a CAMEL context makes its dialogue known; Continue, End and Abort
// belong to a known dialogue by their destination id (the id the receiver
// gave), so both directions are followed, and a Continue by its
// originating id too; End and Abort forget it.  Ids
// are kept without point codes: one dialogue may be seen on links that
// give different ones (an SCCP relay, SUA routed on global titles, two
// probes).  Bounded: a fixed table where, when full, the entry used
// longest ago gives way.
class CamelDialogues {
public:
    static constexpr size_t kSets = 4096;
    static constexpr size_t kWays = 4;

    // Whether the message is CAMEL: it names a CAMEL context, belongs to a
    // known dialogue, or `camelBySsn` (it went to or came from a CAMEL
    // subsystem).  Learns and forgets ids as it goes.
    bool take(const TcapPeek &message, bool camelBySsn = false);
    size_t known() const;

private:
    struct Entry {
        uint64_t key = 0; // 0: free
        uint64_t peer = 0;
        uint64_t lastUse = 0;
    };
    Entry *find(uint64_t key);
    Entry &insert(uint64_t key);
    void erase(uint64_t key);

    std::vector<Entry> table_;
    uint64_t clock_ = 0;
};

} // namespace dpxdecode::capture
