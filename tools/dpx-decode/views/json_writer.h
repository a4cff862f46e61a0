// Compact JSON written straight into a string: the same text nlohmann's
// compact dump gives (members in order, no blanks).
#pragma once

#include <nlohmann/json.hpp>

#include <cstdint>
#include <string>
#include <string_view>

namespace dpxdecode {

class JsonWriter {
public:
    explicit JsonWriter(std::string &out) : out_(out) {}

    JsonWriter &raw(const char *s) {
        out_ += s;
        return *this;
    }
    JsonWriter &number(uint64_t v) {
        char buf[24];
        char *p = buf + sizeof buf;
        do {
            *--p = char('0' + v % 10);
            v /= 10;
        } while (v != 0);
        out_.append(p, size_t(buf + sizeof buf - p));
        return *this;
    }
    JsonWriter &number(int64_t v) {
        if (v < 0) {
            out_ += '-';
            return number(uint64_t(0) - uint64_t(v));
        }
        return number(uint64_t(v));
    }
    JsonWriter &number(uint32_t v) { return number(uint64_t(v)); }
    JsonWriter &number(int32_t v) { return number(int64_t(v)); }

    // Plain printable ASCII is copied; anything else (escapes, UTF-8, bytes
    // that are not UTF-8) goes through nlohmann's serializer so the
    // escaping and the U+FFFD replacement stay exactly its own.
    JsonWriter &string(std::string_view s) {
        for (const char c : s) {
            const auto u = static_cast<unsigned char>(c);
            if (u < 0x20 || u >= 0x7F || c == '"' || c == '\\') {
                out_ += nlohmann::json(std::string(s))
                            .dump(-1, ' ', false, nlohmann::json::error_handler_t::replace);
                return *this;
            }
        }
        out_ += '"';
        out_ += s;
        out_ += '"';
        return *this;
    }
    // A member name that needs no escaping.
    JsonWriter &key(const char *name) {
        out_ += '"';
        out_ += name;
        out_ += "\":";
        return *this;
    }
    // Any member name.
    JsonWriter &keyText(std::string_view name) {
        string(name);
        out_ += ':';
        return *this;
    }

private:
    std::string &out_;
};

} // namespace dpxdecode
