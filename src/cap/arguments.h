// The argument of every operation whose argument the module decodes, as a
// member table: the argument's outer element (SEQUENCE or OCTET STRING
// wrapper, mandatory) or, for the arguments without one, their choice.
#pragma once

#include <cstdint>

#include "engine/members.h"

namespace camel {

struct Argument {
    uint32_t code;              // operation code
    const MemberTable *table;   // null: the operation carries no argument
};

// In the dispatcher's comparison order; the first entry of a code wins.
extern const Argument kArguments[];
extern const uint32_t kArgumentCount;

} // namespace camel
