// Table access entry points and the time-stamp formatter.
#include <cstdio>
#include <cstring>

#include "dpx_camel.h"
#include "fields/catalogue.h"

#define CAMEL_EXPORT extern "C" __attribute__((visibility("default")))

namespace camel {
namespace {

constexpr char kInterfaceVersion[] = "QZ1.02.01";

// ---- Protocol description record --------------------------------------------------------

// The record's writable text areas, empty at load.
char g_text7[DPX_DESCRIPTION_TEXT_SIZE];
char g_text9[DPX_DESCRIPTION_TEXT_SIZE];
char g_text15[DPX_DESCRIPTION_TEXT_SIZE];
char g_text16[DPX_DESCRIPTION_TEXT_SIZE];

constexpr char kShortName[] = "CAP";
constexpr char kFileName[] = "3gpp_v400_cap";
constexpr char kGenerator[] = "Release RERAZODA_A.02.20";

const ProtocolDescriptionBlock kDescription = {
    {7, 0, 0, 0},
    {"3GPP", kShortName, "3GPP R5 09-2004 CAP", "Release 5 v5.9.0 (2004-09)", "UMTS",
     "Backward Compatible with v4.0.0", g_text7, kFileName, g_text9, kGenerator, kGenerator, "146",
     "SSN", "3GPP TS 29.078 (v5.9.0)", g_text15, g_text16, 0, 5, 0, kShortName, kFileName, 1, 255,
     255, 0},
};

// ---- Field catalogue and its companion tables ---------------------------------------------

constexpr catalogue::Catalogue kCatalogue = catalogue::buildCatalogue();
constexpr catalogue::Attributes kAttributes = catalogue::buildAttributes();
static_assert(sizeof kAttributes == DPX_ATTRIBUTE_TABLE_SIZE);

// ---- Layout prototype blocks --------------------------------------------------------------

// A relocatable block: the header, a sample record at 16 filled with 0xA5
// where it carries no value, the texts it points to, then the fix-up list
// of (pointer member, target) block offsets.  A pointer member holds its
// target's block offset; the host adds the block's address.
template <size_t N>
struct Prototype {
    uint8_t byte[N];

    constexpr void word(size_t at, uint32_t v) {
        for (size_t k = 0; k < 4; ++k)
            byte[at + k] = static_cast<uint8_t>(v >> (8 * k));
    }
    constexpr void half(size_t at, uint16_t v) {
        byte[at] = static_cast<uint8_t>(v);
        byte[at + 1] = static_cast<uint8_t>(v >> 8);
    }
    constexpr void text(size_t at, const char *s) {
        do
            byte[at++] = static_cast<uint8_t>(*s);
        while (*s++ != '\0');
    }
};

struct Fixup {
    uint32_t pointer;
    uint32_t target;
};

constexpr uint32_t kSampleRecordSize = 60;

template <size_t N, size_t F>
constexpr Prototype<N> prototype(uint32_t type, uint32_t listAt, const Fixup (&fixups)[F]) {
    Prototype<N> p{};
    for (size_t k = 16; k < listAt; ++k)
        p.byte[k] = 0xA5;
    p.word(0, type);
    p.word(4, N);
    p.word(8, listAt);
    p.word(12, kSampleRecordSize);
    for (size_t k = 0; k < F; ++k) {
        p.word(fixups[k].pointer, fixups[k].target);
        p.word(listAt + 8 * k, fixups[k].pointer);
        p.word(listAt + 8 * k + 4, fixups[k].target);
    }
    return p;
}

constexpr Fixup kFixupsA[] = {{16, 36}, {20, 32}, {24, 32}, {44, 56}};
constexpr Prototype<124> buildPrototypeA() {
    Prototype<124> p = prototype<124>(4, 92, kFixupsA);
    p.word(28, 1);
    p.word(32, 0xFFFD);
    p.word(36, 0x106);
    p.word(40, 0xFFFF);
    p.word(48, 0x4B4B4B4B);
    p.half(52, 8);
    p.half(54, 13);
    p.text(56, "DPX Protocol Prototype dummy field");
    return p;
}
constexpr Fixup kFixupsB[] = {{16, 88}, {20, 104}, {24, 120}, {28, 156}, {32, 164}, {44, 112}};
constexpr Prototype<220> buildPrototypeB() {
    Prototype<220> p = prototype<220>(5, 172, kFixupsB);
    p.text(88, "DPX Prototype");
    p.text(104, kShortName);
    p.text(112, "SSN");
    p.text(120, "test_dpx_protocol_DLL.dll");
    p.text(156, "146");
    p.text(164, "UMTS");
    return p;
}

constexpr Prototype<124> kPrototypeA = buildPrototypeA();
constexpr Prototype<220> kPrototypeB = buildPrototypeB();

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

// Index 1 is the interface version string, 2 the protocol description
// record (with its header, through dp_DLLGetPtr), 4 and 5 the layout
// prototypes (dp_DLLGetPtr) or the catalogue and block B's sample record
// (dp_DLLGetTable), 6 to 9 the value table, the value-code list, the string
// table and the attribute table.  Anything else is refused.
CAMEL_EXPORT uint32_t dp_DLLGetPtr(int32_t index, const void **out) {
    using namespace camel;
    switch (index) {
    case DPX_TABLE_VERSION:
        return serve(kInterfaceVersion, out);
    case DPX_TABLE_DESCRIPTION:
        return serve(kDescription.header, out);
    case DPX_TABLE_PROTOTYPE_A:
        return serve(kPrototypeA.byte, out);
    case DPX_TABLE_PROTOTYPE_B:
        return serve(kPrototypeB.byte, out);
    default:
        return refuse(out);
    }
}

CAMEL_EXPORT uint32_t dp_DLLGetTable(int32_t index, const void **out) {
    using namespace camel;
    switch (index) {
    case DPX_TABLE_VERSION:
        return serve(kInterfaceVersion, out);
    case DPX_TABLE_DESCRIPTION:
        return serve(&kDescription.record, out);
    case DPX_TABLE_CATALOGUE:
        return serve(kCatalogue.entry, out);
    case DPX_TABLE_PROTOTYPE_B:
        return serve(kPrototypeB.byte + sizeof(PrototypeHeader), out);
    case DPX_TABLE_VALUES:
        return serve(catalogue::kValues.item, out);
    case DPX_TABLE_CODES:
        return serve(catalogue::kCodes.item, out);
    case DPX_TABLE_STRINGS:
        return serve(catalogue::kStrings.item, out);
    case DPX_TABLE_ATTRIBUTES:
        return serve(kAttributes.byte, out);
    default:
        return refuse(out);
    }
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
