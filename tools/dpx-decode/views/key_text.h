// Key-field values as people and indexes read them: digits as text,
// transaction ids and access point names as text, codes as numbers.
#pragma once

#include <cstdint>
#include <string>

#include "module.h"

namespace dpxdecode {

struct KeyText {
    bool isNumber = false; // a code: `number` holds it, `text` its decimal form
    uint32_t number = 0;
    std::string text;
};

// False for an entry whose value overflowed (nothing to show).
bool keyText(const KeyEntryOut &e, KeyText &out);

// The name the decoded-field pass gave the value of key entry `entry`
// (the last field of the message that set it, when that field shows a
// name); empty when there is none.
std::string_view keyValueName(const MdOut *md, uint32_t entry);

} // namespace dpxdecode
