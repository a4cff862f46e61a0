// Printing one decoded message: readable text or one JSON object a line.
#pragma once

#include <cstdint>
#include <iosfwd>
#include <string>

#include "input/input.h"
#include "module.h"

namespace dpxdecode {

struct TextOptions {
    bool spans = false; // append each field's bit ranges
};

// Header line, decoded-field lines, display count, message-view verdict and
// key fields, followed by a blank line.
// A message of a capture is headed by a line saying where it was found.
void writeText(std::ostream &os, uint64_t index, const std::string &hex, const MessageResult &r,
               const TextOptions &options, const CaptureOrigin *origin = nullptr);

// One JSON object on one line; a message of a capture has the members
// frame, time, opc, dpc, calledSsn and callingSsn after hex.
void writeJson(std::ostream &os, uint64_t index, const std::string &hex, const MessageResult &r,
               const CaptureOrigin *origin = nullptr);

// "SECONDS.NANOSECONDS", nine digits after the point.
std::string formatTime(int64_t seconds, uint32_t nanoseconds);

// Names of the error flags set in `flags`, comma-separated; unknown bits
// as hexadecimal.
std::string describeErrorFlags(uint32_t flags);

} // namespace dpxdecode
