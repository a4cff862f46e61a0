#include <cstdio>
#include <cstring>
#include <string>

#include "output.h"

namespace dpxdecode {

// The calendar date and time of day come from the module's own time-stamp
// formatter, which a host hands the 32-bit seconds in a record.
void TimeFormatter::appendUtc(std::string &out, int64_t seconds, uint32_t nanoseconds) const {
    if (dateConv_ == nullptr || seconds < 0 || seconds > int64_t(UINT32_MAX)) {
        out += formatTime(seconds, nanoseconds);
        return;
    }
    if (seconds != cachedSecond_) {
        unsigned char record[216] = {};
        const auto s = uint32_t(seconds);
        std::memcpy(record + 212, &s, sizeof s);
        char date[48] = {};
        dateConv_(date, 0, record);
        date[10] = 'T'; // "YYYY-MM-DD hh:mm:ss"
        cachedDate_.assign(date, strnlen(date, sizeof date - 1));
        cachedSecond_ = seconds;
    }
    out += cachedDate_;
    // ".uuuuuuZ": microseconds, truncated.
    char fraction[9] = {'.', '0', '0', '0', '0', '0', '0', 'Z', 0};
    for (uint32_t v = nanoseconds / 1000 % 1000000, i = 6; i > 0; v /= 10, --i)
        fraction[i] = char('0' + v % 10);
    out.append(fraction, 8);
}

void TimeFormatter::append(std::string &out, int64_t seconds, uint32_t nanoseconds) {
    switch (format_) {
    case TimeFormat::Utc:
        appendUtc(out, seconds, nanoseconds);
        return;
    case TimeFormat::Epoch:
        out += formatTime(seconds, nanoseconds);
        return;
    case TimeFormat::Relative:
        break;
    }
    if (!based_) {
        based_ = true;
        baseSeconds_ = seconds;
        baseNanoseconds_ = nanoseconds;
    }
    // Microseconds since the first time; earlier frames come out negative.
    const int64_t micros = (seconds - baseSeconds_) * 1000000 +
                           (int64_t(nanoseconds / 1000) - int64_t(baseNanoseconds_ / 1000));
    const uint64_t magnitude = micros < 0 ? uint64_t(0) - uint64_t(micros) : uint64_t(micros);
    char buf[48];
    const int n = std::snprintf(buf, sizeof buf, "%s%llu.%06llu", micros < 0 ? "-" : "",
                                static_cast<unsigned long long>(magnitude / 1000000),
                                static_cast<unsigned long long>(magnitude % 1000000));
    out.append(buf, size_t(n));
}

} // namespace dpxdecode
