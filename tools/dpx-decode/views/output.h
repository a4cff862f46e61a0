// Printing one decoded message: the readable field tree or the flat list,
// one JSON object a line, or a bulk-index action and document.
#pragma once

#include <cstdint>
#include <iosfwd>
#include <string>
#include <string_view>

#include "input/input.h"
#include "module.h"

namespace dpxdecode {

// How the decoded fields are shown in text.
enum class FieldsMode : uint8_t {
    Values, // nested under their elements, tag and length lines folded away
    All,    // nested, every field including tags, lengths and end-of-contents
    List,   // flat, each field's text as the module reported it
};

enum class TimeFormat : uint8_t { Utc, Epoch, Relative };

// Capture times as text.  Relative times count from the first time
// formatted.  UTC times need the module's date_conv; without it, and for
// times it cannot take (before 1970, after 2106), epoch seconds are shown.
class TimeFormatter {
public:
    TimeFormatter(TimeFormat format, decltype(&date_conv) dateConv) : format_(format), dateConv_(dateConv) {}
    void append(std::string &out, int64_t seconds, uint32_t nanoseconds);
    // "2026-01-01T00:00:00.011000Z": ISO 8601 UTC, microseconds (truncated).
    void appendUtc(std::string &out, int64_t seconds, uint32_t nanoseconds) const;

private:
    TimeFormat format_;
    decltype(&date_conv) dateConv_;
    // The last second the module formatted and its text: frames come many
    // to a second, and the module's formatter is the costly part.
    mutable int64_t cachedSecond_ = -1;
    mutable std::string cachedDate_;
    bool based_ = false;
    int64_t baseSeconds_ = 0;
    uint32_t baseNanoseconds_ = 0;
};

struct TextOptions {
    bool spans = false; // append each field's bit ranges
    FieldsMode fields = FieldsMode::Values;
    TimeFormatter *time = nullptr; // capture times; epoch seconds when null
};

// Header line, decoded fields, then the other passes' results (display
// count, message-view verdict, key fields) for those that ran, and a blank
// line.  A message of a capture is headed by a line saying where it was
// found.
void writeText(std::ostream &os, uint64_t index, const std::string &hex, const MessageResult &r,
               const TextOptions &options, const CaptureOrigin *origin = nullptr);

// One JSON object on one line; a message of a capture has the members
// frame, time, opc, dpc, calledSsn, callingSsn, calledGt and callingGt
// after hex.
void writeJson(std::ostream &os, uint64_t index, const std::string &hex, const MessageResult &r,
               const CaptureOrigin *origin = nullptr);

// "SECONDS.NANOSECONDS", nine digits after the point.
std::string formatTime(int64_t seconds, uint32_t nanoseconds);

// Names of the error flags set in `flags`, comma-separated; unknown bits
// as hexadecimal.
std::string describeErrorFlags(uint32_t flags);

// The value part of a decoded field's text: everything after the first
// '=', the whole text when there is none.
std::string_view fieldValue(const DecodedOut &f);

// The field's label without its leading blanks.
std::string_view fieldName(const DecodedOut &f);

} // namespace dpxdecode
