// Table access entry points and the time-stamp formatter.
#include <cstdio>
#include <cstring>

#include "dpx_camel.h"

#define CAMEL_EXPORT extern "C" __attribute__((visibility("default")))

namespace camel {
namespace {

constexpr char kInterfaceVersion[] = "QZ1.02.01";

uint32_t refuse(const void **out) {
    if (out != nullptr)
        *out = nullptr;
    return DPX_TABLE_BAD_INDEX;
}

uint32_t serve(const void *table, const void **out) {
    if (out == nullptr)
        return DPX_TABLE_BAD_INDEX;
    *out = table;
    return 0;
}

// Days since 1970-01-01 to a proleptic Gregorian date.
void civilFromDays(int64_t days, int *year, int *month, int *day) {
    days += 719468;
    const int64_t era = (days >= 0 ? days : days - 146096) / 146097;
    const int64_t doe = days - era * 146097;
    const int64_t yoe = (doe - doe / 1460 + doe / 36524 - doe / 146096) / 365;
    const int64_t doy = doe - (365 * yoe + yoe / 4 - yoe / 100);
    const int64_t mp = (5 * doy + 2) / 153;
    *day = static_cast<int>(doy - (153 * mp + 2) / 5 + 1);
    *month = static_cast<int>(mp < 10 ? mp + 3 : mp - 9);
    *year = static_cast<int>(yoe + era * 400 + (*month <= 2 ? 1 : 0));
}

} // namespace
} // namespace camel

// Index 1 is the interface version string; the description tables behind
// the other indexes are not served yet and are refused like bad indexes.
CAMEL_EXPORT uint32_t dp_DLLGetPtr(int32_t index, const void **out) {
    if (index == 1)
        return camel::serve(camel::kInterfaceVersion, out);
    return camel::refuse(out);
}

CAMEL_EXPORT uint32_t dp_DLLGetTable(int32_t index, const void **out) {
    if (index == 1)
        return camel::serve(camel::kInterfaceVersion, out);
    return camel::refuse(out);
}

// Appends the UTC time held at byte 212 of `record` (seconds since 1970) to
// dst as "YYYY-MM-DD hh:mm:ss".  The conversion is done here, on 64-bit
// arithmetic, so every 32-bit value converts whatever the platform's time_t.
CAMEL_EXPORT char *date_conv(char *dst, uint32_t unused, const void *record) {
    (void)unused;
    if (dst == nullptr || record == nullptr)
        return dst;
    uint32_t seconds;
    std::memcpy(&seconds, static_cast<const unsigned char *>(record) + 212, sizeof seconds);
    int year, month, day;
    camel::civilFromDays(seconds / 86400, &year, &month, &day);
    const uint32_t rest = seconds % 86400;
    char text[32];
    std::snprintf(text, sizeof text, "%04d-%02d-%02d %02d:%02d:%02d", year, month, day,
                  static_cast<int>(rest / 3600), static_cast<int>(rest / 60 % 60),
                  static_cast<int>(rest % 60));
    std::strcat(dst, text);
    return dst;
}
