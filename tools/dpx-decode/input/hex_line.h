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

namespace detail {

// What each input character is to a hex line: a digit's value, a blank
// (skipped), the comment start or anything else.
enum : uint8_t { kHexBlank = 16, kHexComment = 17, kHexOther = 18 };

struct HexInTable {
    uint8_t of[256];
    constexpr HexInTable() : of() {
        for (int c = 0; c < 256; ++c)
            of[c] = kHexOther;
        for (int c = 0; c < 10; ++c)
            of['0' + c] = uint8_t(c);
        for (int c = 0; c < 6; ++c) {
            of['a' + c] = uint8_t(10 + c);
            of['A' + c] = uint8_t(10 + c);
        }
        of[' '] = of['\t'] = of['\r'] = of[':'] = kHexBlank;
        of['#'] = kHexComment;
    }
};
inline constexpr HexInTable kHexIn;

// The two upper-case digits of every octet.
struct HexOutTable {
    char pair[256][2];
    constexpr HexOutTable() : pair() {
        constexpr char digits[] = "0123456789ABCDEF";
        for (int b = 0; b < 256; ++b) {
            pair[b][0] = digits[b >> 4];
            pair[b][1] = digits[b & 0xF];
        }
    }
};
inline constexpr HexOutTable kHexOut;

} // namespace detail

inline int hexDigitValue(char c) {
    const uint8_t v = detail::kHexIn.of[static_cast<unsigned char>(c)];
    return v < 16 ? v : -1;
}

inline std::string describeChar(char c) {
    const auto u = static_cast<unsigned char>(c);
    if (u >= 0x21 && u <= 0x7E)
        return std::string("'") + c + "'";
    return std::string("byte 0x") + detail::kHexOut.pair[u][0] + detail::kHexOut.pair[u][1];
}

// Parses `line` into `out`, whose byte vector keeps its capacity from line
// to line.
inline void parseHexLine(std::string_view line, HexLine &out) {
    out.kind = LineKind::Empty;
    out.error.clear();
    out.bytes.resize(line.size() / 2); // at most one octet per two characters
    uint8_t *bytes = out.bytes.data();
    size_t count = 0;
    int pending = -1; // high nibble waiting for its low nibble
    size_t digits = 0;
    for (size_t i = 0; i < line.size(); ++i) {
        const uint8_t v = detail::kHexIn.of[static_cast<unsigned char>(line[i])];
        if (v < 16) {
            ++digits;
            if (pending < 0) {
                pending = v;
            } else {
                bytes[count++] = static_cast<uint8_t>(pending << 4 | v);
                pending = -1;
            }
        } else if (v == detail::kHexComment) {
            break;
        } else if (v == detail::kHexOther) {
            out.kind = LineKind::Bad;
            out.bytes.clear();
            out.error = "bad character " + describeChar(line[i]) + " at column " + std::to_string(i + 1);
            return;
        }
    }
    out.bytes.resize(count);
    if (pending >= 0) {
        out.kind = LineKind::Bad;
        out.bytes.clear();
        out.error = "odd number of hex digits (" + std::to_string(digits) + ")";
        return;
    }
    out.kind = count == 0 ? LineKind::Empty : LineKind::Message;
}

inline HexLine parseHexLine(std::string_view line) {
    HexLine out;
    parseHexLine(line, out);
    return out;
}

// Appends the upper-case hex digits of `bytes` to `out`, no separators.
inline void appendHex(std::string &out, const uint8_t *bytes, size_t n) {
    const size_t at = out.size();
    out.resize(at + 2 * n);
    char *p = out.data() + at;
    for (size_t i = 0; i < n; ++i, p += 2) {
        p[0] = detail::kHexOut.pair[bytes[i]][0];
        p[1] = detail::kHexOut.pair[bytes[i]][1];
    }
}

// Upper-case hex digits of `bytes`, no separators.
inline std::string toHex(const uint8_t *bytes, size_t n) {
    std::string s;
    appendHex(s, bytes, n);
    return s;
}

inline std::string toHex(const std::vector<uint8_t> &bytes) { return toHex(bytes.data(), bytes.size()); }

} // namespace dpxdecode
