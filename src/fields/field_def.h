// How a field is declared: once, as data.  Units refer to fields by id;
// label, text form, value names and key entry come from the declaration.
#pragma once

#include <cstddef>
#include <cstdint>

namespace camel {

// How a field's value becomes text.
enum class Render : uint8_t {
    Tag,         // "%x" of the value
    LenHeader,   // "%u octet(s)"
    LenBlock,    // "Indefinite Length" for 0, else "%u Octet(s)"
    Unsigned,    // "%u"
    Hex,         // "%x"
    Digits,      // "%x" of every span, in span order
    Enum,        // the value's name; empty when it has none
    Chars,       // every span as a character (IA5), '.' for what cannot be shown
    Dotted,      // "%u" of every span, with "." between them (an IPv4 address)
    AccessPointName, // the host's pu_access_point_name renders the spans
};

// Where a key field's value goes in the key buffer.
enum class KeyForm : uint8_t {
    None,
    Octet,    // low byte of the value
    Word,     // low 16 bits, little-endian
    Variable, // packed spans in the data area, slot at the value offset
};

struct ValueName {
    uint32_t code;
    const char *name;
};

struct FieldDef {
    uint32_t id = 0;
    const char *label = "";        // with its leading blanks
    uint8_t textIndent = 0;        // extra blanks before the label in the text line
    Render render = Render::Unsigned;
    uint16_t width = 0;            // bits; 0 for variable width
    const ValueName *names = nullptr;
    uint16_t nameCount = 0;
    // Display-pass names where they differ from the decoded-field names;
    // a value not listed here is shown with its decoded-field name.
    const ValueName *displayNames = nullptr;
    uint16_t displayNameCount = 0;
    // The name of a value that neither table lists ("Reserved" in some
    // tables); empty by default.
    const char *otherName = "";
    // The value table has an entry for every other value, naming it
    // otherName (which may be the empty text).
    bool othersNamed = false;
    // Text that follows the value in the decoded-field text ("h" after a
    // value shown in hexadecimal); the display pass shows the value alone.
    const char *suffix = "";
    int8_t keyEntry = -1;          // key table entry, -1 for none
    KeyForm keyForm = KeyForm::None;
    uint8_t selector = 0xFF;       // span selector override; 0xFF: derived
    uint32_t shownUnder = 0;       // display id override; 0: derived from the label

    // Modifiers used in the declaration table.
    constexpr FieldDef indented() const {
        FieldDef f = *this;
        f.textIndent = 2;
        return f;
    }
    constexpr FieldDef key(int entry, KeyForm form) const {
        FieldDef f = *this;
        f.keyEntry = static_cast<int8_t>(entry);
        f.keyForm = form;
        return f;
    }
    template <size_t N>
    constexpr FieldDef display(const ValueName (&shown)[N]) const {
        FieldDef f = *this;
        f.displayNames = shown;
        f.displayNameCount = static_cast<uint16_t>(N);
        return f;
    }
    constexpr FieldDef followedBy(const char *text) const {
        FieldDef f = *this;
        f.suffix = text;
        return f;
    }
    constexpr FieldDef otherwise(const char *name) const {
        FieldDef f = *this;
        f.otherName = name;
        f.othersNamed = true;
        return f;
    }
    // A field the display pass reports under another field's display id
    // than the label rule gives.
    constexpr FieldDef displayId(uint32_t id) const {
        FieldDef f = *this;
        f.shownUnder = id;
        return f;
    }
    constexpr FieldDef spanSelector(uint8_t s) const {
        FieldDef f = *this;
        f.selector = s;
        return f;
    }
};

// Declaration helpers for the common field kinds.
constexpr FieldDef tagField(uint32_t id, const char *label, uint16_t width = 8) {
    return FieldDef{.id = id, .label = label, .render = Render::Tag, .width = width};
}
constexpr FieldDef headerLength(uint32_t id, const char *label = "LENGTH") {
    return FieldDef{.id = id, .label = label, .render = Render::LenHeader, .width = 0};
}
constexpr FieldDef blockLength(uint32_t id, const char *label = "LENGTH") {
    return FieldDef{.id = id, .label = label, .render = Render::LenBlock, .width = 0};
}
// The general length field of a CAMEL argument element: "LENGTH", shown
// with two extra blanks.
constexpr FieldDef argLength(uint32_t id, const char *label = "LENGTH") {
    return FieldDef{.id = id, .label = label, .textIndent = 2, .render = Render::LenHeader, .width = 0};
}
// A length octet read as a plain one-octet count.
constexpr FieldDef octetLength(uint32_t id, const char *label = "  Length") {
    return FieldDef{.id = id, .label = label, .render = Render::LenHeader, .width = 8};
}
constexpr FieldDef unsignedField(uint32_t id, const char *label, uint16_t width = 8) {
    return FieldDef{.id = id, .label = label, .render = Render::Unsigned, .width = width};
}
constexpr FieldDef hexField(uint32_t id, const char *label, uint16_t width = 8) {
    return FieldDef{.id = id, .label = label, .render = Render::Hex, .width = width};
}
constexpr FieldDef digitsField(uint32_t id, const char *label) {
    return FieldDef{.id = id, .label = label, .render = Render::Digits, .width = 0};
}
constexpr FieldDef charsField(uint32_t id, const char *label) {
    return FieldDef{.id = id, .label = label, .render = Render::Chars, .width = 0};
}
// A value every code of which shows one name (`.otherwise(...)`).
constexpr FieldDef enumField(uint32_t id, const char *label, uint16_t width = 8) {
    return FieldDef{.id = id, .label = label, .render = Render::Enum, .width = width};
}
// Every span "%u", with "." between them (an IPv4 address).
constexpr FieldDef dottedField(uint32_t id, const char *label, uint16_t width = 32) {
    return FieldDef{.id = id, .label = label, .render = Render::Dotted, .width = width};
}
// Octets the host renders as an access point name.
constexpr FieldDef accessPointNameField(uint32_t id, const char *label) {
    return FieldDef{.id = id, .label = label, .render = Render::AccessPointName, .width = 0};
}
template <size_t N>
constexpr FieldDef enumField(uint32_t id, const char *label, const ValueName (&names)[N],
                             uint16_t width = 8) {
    return FieldDef{.id = id,
                    .label = label,
                    .render = Render::Enum,
                    .width = width,
                    .names = names,
                    .nameCount = static_cast<uint16_t>(N)};
}

} // namespace camel
