// One line of hex message input: the message it holds, or why it holds
// none.  Shared by dpx-decode and the benchmarks so both read sample files
// the same way.
//
// A line carries at most one message.  Blanks (space, tab, carriage return)
// and colons may separate the digits anywhere; '#' starts a comment that
// runs to the end of the line.  A line with no digits left is skipped.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace dpxdecode {

enum class LineKind {
    Message, // bytes holds the message
    Empty,   // blank or comment only: nothing to decode
    Bad,     // error says what is wrong
};

struct HexLine {
    LineKind kind = LineKind::Empty;
    std::vector<uint8_t> bytes;
    std::string error;
};

inline int hexDigitValue(char c) {
    if (c >= '0' && c <= '9')
        return c - '0';
    if (c >= 'a' && c <= 'f')
        return c - 'a' + 10;
    if (c >= 'A' && c <= 'F')
        return c - 'A' + 10;
    return -1;
}

inline std::string describeChar(char c) {
    const auto u = static_cast<unsigned char>(c);
    if (u >= 0x21 && u <= 0x7E)
        return std::string("'") + c + "'";
    static const char digits[] = "0123456789ABCDEF";
    return std::string("byte 0x") + digits[u >> 4] + digits[u & 0xF];
}

inline HexLine parseHexLine(std::string_view line) {
    HexLine out;
    int pending = -1; // high nibble waiting for its low nibble
    size_t digits = 0;
    for (size_t i = 0; i < line.size(); ++i) {
        const char c = line[i];
        if (c == '#')
            break;
        if (c == ' ' || c == '\t' || c == '\r' || c == ':')
            continue;
        const int v = hexDigitValue(c);
        if (v < 0) {
            out.kind = LineKind::Bad;
            out.bytes.clear();
            out.error = "bad character " + describeChar(c) + " at column " + std::to_string(i + 1);
            return out;
        }
        ++digits;
        if (pending < 0) {
            pending = v;
        } else {
            out.bytes.push_back(static_cast<uint8_t>(pending << 4 | v));
            pending = -1;
        }
    }
    if (pending >= 0) {
        out.kind = LineKind::Bad;
        out.bytes.clear();
        out.error = "odd number of hex digits (" + std::to_string(digits) + ")";
        return out;
    }
    out.kind = out.bytes.empty() ? LineKind::Empty : LineKind::Message;
    return out;
}

// Upper-case hex digits of `bytes`, no separators.
inline std::string toHex(const uint8_t *bytes, size_t n) {
    static const char digits[] = "0123456789ABCDEF";
    std::string s;
    s.reserve(2 * n);
    for (size_t i = 0; i < n; ++i) {
        s.push_back(digits[bytes[i] >> 4]);
        s.push_back(digits[bytes[i] & 0xF]);
    }
    return s;
}

inline std::string toHex(const std::vector<uint8_t> &bytes) { return toHex(bytes.data(), bytes.size()); }

} // namespace dpxdecode
