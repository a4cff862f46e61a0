// Module-level scratch of one pass.  Each pass has its own instance (a
// variable template over the pass), reset by its entry point, so the four
// passes never share scratch.
#pragma once

#include <cstdint>

#include "engine/pass.h"

namespace camel {

struct Scratch {
    uint32_t lengthValue;      // value of the last length field (0: indefinite)
    uint32_t lengthOctetCount; // octets of that length field (0: indefinite)
    uint32_t choiceTag;        // last alternative identifier / operation code
    int32_t opaqueBudget;      // content octets the opaque walker may still use
    uint32_t opaqueLength;     // octets of the current primitive opaque value
    uint32_t opaqueForm;       // form bit of the current opaque identifier
    int32_t componentBudget;   // octets of the component list not yet used
    uint32_t componentSize;    // encoded size of the component just recognised
    uint32_t tagContext;       // tag override (top octet) and number layouts
    uint32_t oddEven;          // odd/even indicator of the current number
    uint32_t messageType;      // first octet of the message
};

template <Pass P>
inline Scratch g_scratch{};

// Text buffers of the reporting passes.
struct TextBuffers {
    char text[256];
};

template <Pass P>
inline TextBuffers g_text{};

} // namespace camel
