// Bounded text building for the pass text buffers: every append stops at
// the buffer's end and leaves it terminated.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string_view>

namespace camel {

struct TextBuf {
    char *data;
    size_t size; // bytes including the terminator
    size_t len;

    void clear() {
        len = 0;
        data[0] = '\0';
    }
    void append(const char *s, size_t n) {
        const size_t space = size - 1 - len;
        if (n > space)
            n = space;
        std::memcpy(data + len, s, n);
        len += n;
        data[len] = '\0';
    }
    // A literal's length is known at compile time.
    void append(std::string_view s) { append(s.data(), s.size()); }
    void decimal(uint32_t v) {
        char tmp[12];
        size_t i = sizeof tmp;
        do {
            tmp[--i] = static_cast<char>('0' + v % 10);
            v /= 10;
        } while (v != 0);
        append(tmp + i, sizeof tmp - i);
    }
    void hex(uint32_t v) {
        static constexpr char kDigits[] = "0123456789abcdef";
        char tmp[8];
        size_t i = sizeof tmp;
        do {
            tmp[--i] = kDigits[v & 15u];
            v >>= 4;
        } while (v != 0);
        append(tmp + i, sizeof tmp - i);
    }
};

} // namespace camel
