// Printing one decoded message: readable text or one JSON object a line.
#pragma once

#include <cstdint>
#include <iosfwd>
#include <string>

#include "module.h"

namespace dpxdecode {

struct TextOptions {
    bool spans = false; // append each field's bit ranges
};

// Header line, decoded-field lines, display count, message-view verdict and
// key fields, followed by a blank line.
void writeText(std::ostream &os, uint64_t index, const std::string &hex, const MessageResult &r,
               const TextOptions &options);

// One JSON object on one line.
void writeJson(std::ostream &os, uint64_t index, const std::string &hex, const MessageResult &r);

// Names of the error flags set in `flags`, comma-separated; unknown bits
// as hexadecimal.
std::string describeErrorFlags(uint32_t flags);

} // namespace dpxdecode
