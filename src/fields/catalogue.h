// The description tables a host reads through the table-access entry
// points, generated at compile time from the field declarations: the field
// catalogue (one entry per field, in declaration order), the value table,
// the value-code list and the string table.  Nothing here is typed twice:
// labels, formats, value names, widths and key entries all come from kFields.
//
// Every derivation is one linear pass (texts are deduplicated through an
// open-addressing hash table), so the tables stay inside the compilers'
// default constexpr limits at any realistic number of fields.
#pragma once

#include <cstddef>
#include <cstdint>

#include "dpx_camel.h"
#include "fields/field_table.h"

namespace camel::catalogue {

// ---- What a field contributes -------------------------------------------------------

// Value-entry kinds.
inline constexpr uint32_t kNamedValue = 1;        // applies when the value equals the code
inline constexpr uint32_t kEveryOtherValue = 0x10000; // renders any other value

// The one field in group 6 (every other field is in group 5).
inline constexpr uint32_t kGroupSixField = 2412;
// The 32-bit address field shown as dotted decimals: display variant 3.
inline constexpr uint32_t kDottedAddressField = 2594;

// The code word of an every-other-value entry: never compared with the
// value; hosts find 50 there.
inline constexpr uint32_t kOtherwiseCode = 50;

inline constexpr char kBlockNumberFormat[] = "%u Octet(s)";
inline constexpr char kIndefiniteLength[] = "Indefinite Length";
inline constexpr char kFinalString[] = "$$_FINAL_STRING_$$";
inline constexpr char kLastField[] = "$_$LAST_FIELD$_$";

// The host conversion that stands for the field's value in its summary format.
constexpr const char *conversion(const FieldDef &f) {
    if (f.id == kDottedAddressField)
        return "%-[\"%u\":\".\"]";
    switch (f.render) {
    case Render::Tag:
    case Render::Hex:
        return "%x";
    case Render::LenHeader:
        return "%u octet(s)";
    case Render::Unsigned:
        return "%u";
    case Render::Digits:
        return "%-[\"%x\"]";
    case Render::LenBlock:
    case Render::Enum:
        return "%-S";
    case Render::Chars:
    case Render::AccessPointName:
        return "%s";
    case Render::Dotted:
        return "%-[\"%u\":\".\"]";
    }
    return "%u";
}

// Storage class by width: 1 for 1 to 8 bits, 2 up to 16, 3 up to 32, 4 for
// variable width and anything wider.
constexpr uint32_t storageClass(const FieldDef &f) {
    if (f.width == 0 || f.width > 32)
        return 4;
    return f.width <= 8 ? 1 : f.width <= 16 ? 2 : 3;
}

constexpr uint32_t widthWord(const FieldDef &f) {
    return f.width == 0 ? 0xFFFFFFFFu : 0xFFFF0000u + f.width;
}

// The host's key numbers: the key fields in the order the host numbers
// them (1 to 26), which is the order the grammar's walk first meets them.
inline constexpr uint32_t kKeyFieldOrder[] = {3604, 3705, 1066, 1480, 3589, 3592, 3600, 3603, 1557,
                                               1628, 1631, 2025, 2029, 2179, 2442, 2446, 2449, 2290,
                                               2413, 3669, 1068, 3685, 1070, 3653, 3656, 3659};

constexpr uint32_t keyNumberOf(uint32_t id) {
    for (uint32_t k = 0; k < sizeof kKeyFieldOrder / sizeof kKeyFieldOrder[0]; ++k)
        if (kKeyFieldOrder[k] == id)
            return k + 1;
    return 0;
}

// Every key field has its number.
constexpr bool keyFieldsNumbered() {
    for (size_t i = 0; i < kFieldCount; ++i)
        if (kFields[i].keyEntry >= 0 && keyNumberOf(kFields[i].id) == 0)
            return false;
    return true;
}
static_assert(keyFieldsNumbered(), "a key field is missing from kKeyFieldOrder");

// One value entry a field contributes, before indexes are assigned.
struct ValueSource {
    uint32_t kind;
    uint32_t code;
    const char *text;
};

// The field's value entries: its names, then the name of every other value;
// a block-form length renders the number and names the indefinite form.
constexpr uint32_t valueCountOf(const FieldDef &f) {
    if (f.render == Render::LenBlock)
        return 2;
    if (f.render != Render::Enum)
        return 0;
    return f.nameCount + (f.othersNamed ? 1u : 0u);
}
constexpr ValueSource valueOf(const FieldDef &f, uint32_t k) {
    if (f.render == Render::LenBlock)
        return k == 0 ? ValueSource{kEveryOtherValue, kOtherwiseCode, kBlockNumberFormat}
                      : ValueSource{kNamedValue, 0, kIndefiniteLength};
    if (k < f.nameCount)
        return ValueSource{kNamedValue, f.names[k].code, f.names[k].name};
    return ValueSource{kEveryOtherValue, kOtherwiseCode, f.otherName};
}

// ---- Summary formats ------------------------------------------------------------------

namespace detail {
constexpr size_t textLength(const char *s) {
    size_t n = 0;
    while (s[n] != '\0')
        ++n;
    return n;
}
// The summary format's length: extra blanks, label, "=", conversion, suffix.
constexpr size_t formatLength(const FieldDef &f) {
    return f.textIndent + textLength(f.label) + 1 + textLength(conversion(f)) + textLength(f.suffix);
}
constexpr size_t formatPoolSize() {
    size_t n = 0;
    for (const FieldDef &f : kFields)
        n += formatLength(f) + 1;
    return n;
}
} // namespace detail

// Every field's summary format, NUL-terminated texts back to back.
struct FormatPool {
    char text[detail::formatPoolSize()];
    uint32_t at[kFieldCount];
};
constexpr FormatPool buildFormats() {
    FormatPool out{};
    size_t n = 0;
    const auto put = [&](const char *s) {
        while (*s != '\0')
            out.text[n++] = *s++;
    };
    for (size_t i = 0; i < kFieldCount; ++i) {
        const FieldDef &f = kFields[i];
        out.at[i] = static_cast<uint32_t>(n);
        for (uint8_t b = 0; b < f.textIndent; ++b)
            out.text[n++] = ' ';
        put(f.label);
        out.text[n++] = '=';
        put(conversion(f));
        put(f.suffix);
        out.text[n++] = '\0';
    }
    return out;
}
inline constexpr FormatPool kFormats = buildFormats();

constexpr const char *formatOf(size_t field) { return kFormats.text + kFormats.at[field]; }

// ---- Display attributes -----------------------------------------------------------------

// The display attribute table: length-prefixed records (a 16-bit
// little-endian payload size, then the payload), one per kind of field.
// One-octet tags share the record at offset 0, every length field the one
// at 32, two-octet tags and the end-of-contents field the one at 37; the
// value fields get one record per rendering and storage class, and the
// table ends with the dotted address field's record at 3961.
//
// Payload of the records after offset 0: 0xFF, storage class, rendering
// (1 + the Render value), then for value fields the justification (1: left)
// and the base (16 or 10).
inline constexpr size_t kRenderKinds = static_cast<size_t>(Render::Chars) + 1;
inline constexpr uint32_t kOctetTagAttributes = 0;
inline constexpr uint32_t kLengthAttributes = 32;
inline constexpr uint32_t kWordTagAttributes = 37;
inline constexpr uint32_t kValueAttributes = 45; // 8 bytes per rendering and class
inline constexpr uint32_t kDottedAttributes = 3961;
static_assert(kValueAttributes + 8 * kRenderKinds * 4 + 3 <= kDottedAttributes,
              "the value records fit before the last record");

constexpr uint32_t attributeOffset(const FieldDef &f) {
    if (f.id == kDottedAddressField)
        return kDottedAttributes;
    if (f.render == Render::LenHeader || f.render == Render::LenBlock)
        return kLengthAttributes;
    if (f.id == fid::kEndOfContents || (f.render == Render::Tag && f.width > 8))
        return kWordTagAttributes;
    if (f.render == Render::Tag)
        return kOctetTagAttributes;
    return kValueAttributes + 8 * (static_cast<uint32_t>(f.render) * 4 + storageClass(f) - 1);
}

struct Attributes {
    uint8_t byte[DPX_ATTRIBUTE_TABLE_SIZE];
};
constexpr Attributes buildAttributes() {
    Attributes out{};
    const auto record = [&](uint32_t at, uint32_t size, const uint8_t *payload, uint32_t n) {
        out.byte[at] = static_cast<uint8_t>((size - 2) & 0xFF);
        out.byte[at + 1] = static_cast<uint8_t>((size - 2) >> 8);
        for (uint32_t k = 0; k < n; ++k)
            out.byte[at + 2 + k] = payload[k];
    };
    constexpr uint8_t kOctetTag[] = {0xFF, 0x02, 0x55, 0x01, 0x04, 0x01, 0x05, 0x10,
                                     0x00, 0x00, 0x00, 0x01, 0x10, 0x00};
    record(kOctetTagAttributes, kLengthAttributes - kOctetTagAttributes, kOctetTag, sizeof kOctetTag);
    constexpr uint8_t kLength[] = {0xFF, 4, 1 + static_cast<uint8_t>(Render::LenHeader)};
    record(kLengthAttributes, kWordTagAttributes - kLengthAttributes, kLength, sizeof kLength);
    constexpr uint8_t kWordTag[] = {0xFF, 2, 1 + static_cast<uint8_t>(Render::Tag), 1, 16, 0};
    record(kWordTagAttributes, kValueAttributes - kWordTagAttributes, kWordTag, sizeof kWordTag);
    uint32_t at = kValueAttributes;
    for (uint8_t render = 0; render < kRenderKinds; ++render)
        for (uint8_t cls = 1; cls <= 4; ++cls, at += 8) {
            const bool hex = render == static_cast<uint8_t>(Render::Hex) ||
                             render == static_cast<uint8_t>(Render::Digits) ||
                             render == static_cast<uint8_t>(Render::Tag);
            const uint8_t payload[] = {0xFF, cls, static_cast<uint8_t>(render + 1), 1,
                                       static_cast<uint8_t>(hex ? 16 : 10), 0};
            record(at, 8, payload, sizeof payload);
        }
    // Unused room up to the last record: one record of zeros.
    record(at, kDottedAttributes - at, nullptr, 0);
    constexpr uint8_t kDotted[] = {0xFF, 3, 1 + static_cast<uint8_t>(Render::Unsigned), 1, 10, 3, '.'};
    record(kDottedAttributes, DPX_ATTRIBUTE_TABLE_SIZE - kDottedAttributes, kDotted, sizeof kDotted);
    return out;
}

// ---- Plan: every index, before the tables get their exact sizes ----------------------------

namespace detail {
constexpr size_t valueTotal() {
    size_t n = 0;
    for (const FieldDef &f : kFields)
        n += valueCountOf(f);
    return n;
}
constexpr size_t slotsFor(size_t n) {
    size_t s = 64;
    while (s < 2 * n)
        s *= 2;
    return s;
}
} // namespace detail

inline constexpr size_t kValueCount = detail::valueTotal();
// Upper bounds: every text distinct, every code distinct; the final string.
inline constexpr size_t kStringBound = kFieldCount + kValueCount + 1;
inline constexpr size_t kCodeBound = kValueCount + 1;

// Every index the tables hold, with the texts and codes in their table order.
struct Plan {
    uint32_t formatString[kFieldCount]; // string index of each field's format
    uint32_t firstValue[kFieldCount];   // value-table index of its first entry
    uint32_t keyNumber[kFieldCount];    // 1 to n in catalogue order; 0 for other fields
    ValueEntry values[kValueCount + 1];  // the last one all zero
    const char *strings[kStringBound];
    uint32_t stringCount;
    uint32_t codes[kCodeBound];
    uint32_t codeCount;
};

constexpr Plan buildPlan() {
    Plan p{};
    // Texts are kept once: an open-addressing table of string indexes by
    // text hash.
    constexpr size_t kTextSlots = detail::slotsFor(kStringBound);
    uint32_t textSlot[kTextSlots]{};
    for (size_t s = 0; s < kTextSlots; ++s)
        textSlot[s] = 0xFFFFFFFFu;
    const auto stringIndex = [&](const char *text) -> uint32_t {
        size_t s = camel::detail::textHash(text) & (kTextSlots - 1);
        while (textSlot[s] != 0xFFFFFFFFu) {
            if (camel::detail::sameText(p.strings[textSlot[s]], text))
                return textSlot[s];
            s = (s + 1) & (kTextSlots - 1);
        }
        textSlot[s] = p.stringCount;
        p.strings[p.stringCount] = text;
        return p.stringCount++;
    };
    // Codes likewise, by value.
    constexpr size_t kCodeSlots = detail::slotsFor(kCodeBound);
    uint32_t codeSlot[kCodeSlots]{};
    for (size_t s = 0; s < kCodeSlots; ++s)
        codeSlot[s] = 0xFFFFFFFFu;
    const auto codeIndex = [&](uint32_t code) -> uint32_t {
        size_t s = (code * 2654435761u) & (kCodeSlots - 1);
        while (codeSlot[s] != 0xFFFFFFFFu) {
            if (p.codes[codeSlot[s]] == code)
                return codeSlot[s];
            s = (s + 1) & (kCodeSlots - 1);
        }
        codeSlot[s] = p.codeCount;
        p.codes[p.codeCount] = code;
        return p.codeCount++;
    };

    uint32_t value = 0;
    for (size_t i = 0; i < kFieldCount; ++i) {
        const FieldDef &f = kFields[i];
        p.formatString[i] = stringIndex(formatOf(i));
        p.keyNumber[i] = f.keyEntry >= 0 ? keyNumberOf(f.id) : 0;
        const uint32_t n = valueCountOf(f);
        p.firstValue[i] = n == 0 ? 0xFFFFFFFFu : value;
        for (uint32_t k = 0; k < n; ++k, ++value) {
            const ValueSource v = valueOf(f, k);
            p.values[value] = ValueEntry{v.kind, codeIndex(v.code), stringIndex(v.text)};
        }
    }
    p.strings[p.stringCount++] = kFinalString;
    return p;
}
inline constexpr Plan kPlan = buildPlan();

inline constexpr size_t kStringCount = kPlan.stringCount;
inline constexpr size_t kCodeCount = kPlan.codeCount;

// ---- The served tables ---------------------------------------------------------------------

// An entry's words that carry nothing: 0xFFFFFFFF.
constexpr void markUnused(CatalogueEntry &e) {
    for (uint32_t &w : e.unused1)
        w = 0xFFFFFFFFu;
    for (uint32_t &w : e.unused2)
        w = 0xFFFFFFFFu;
}

// The catalogue: one entry per field, then the terminator.
struct Catalogue {
    CatalogueEntry entry[kFieldCount + 1];
};
constexpr Catalogue buildCatalogue() {
    Catalogue out{};
    for (size_t i = 0; i < kFieldCount; ++i) {
        const FieldDef &f = kFields[i];
        CatalogueEntry &e = out.entry[i];
        const uint32_t variant = f.id == kDottedAddressField ? 3u : 0u;
        const uint32_t group = f.id == kGroupSixField ? 6u : 5u;
        e.packed = storageClass(f) | variant << 8 | (f.keyEntry >= 0 ? 1u : 0u) << 16 | group << 24;
        e.fieldId = f.id;
        e.keyNumber = kPlan.keyNumber[i];
        e.label = camel::detail::skipBlanks(f.label);
        e.labelCopy = e.label;
        e.valueCount = valueCountOf(f);
        e.firstValue = kPlan.firstValue[i];
        e.width = widthWord(f);
        e.formatIndex = kPlan.formatString[i];
        e.attributeOffset = attributeOffset(f);
        markUnused(e);
    }
    CatalogueEntry &last = out.entry[kFieldCount];
    last.packed = 0xFFFFFFFFu;
    last.fieldId = 0xFFFF;
    last.label = kLastField;
    last.labelCopy = kLastField;
    last.firstValue = 0xFFFFFFFFu;
    last.width = 0xFFFFFFFFu;
    markUnused(last);
    return out;
}

// The first N items of a planned table, as the table served.
template <typename T, size_t N>
struct Table {
    T item[N];
};
template <typename T, size_t N>
constexpr Table<T, N> firstOf(const T *planned) {
    Table<T, N> out{};
    for (size_t i = 0; i < N; ++i)
        out.item[i] = planned[i];
    return out;
}

// The value table with its all-zero terminator, the value-code list and the
// string table (its last text kFinalString).
inline constexpr Table<ValueEntry, kValueCount + 1> kValues =
    firstOf<ValueEntry, kValueCount + 1>(kPlan.values);
inline constexpr Table<uint32_t, kCodeCount> kCodes = firstOf<uint32_t, kCodeCount>(kPlan.codes);
inline constexpr Table<const char *, kStringCount> kStrings =
    firstOf<const char *, kStringCount>(kPlan.strings);

} // namespace camel::catalogue
