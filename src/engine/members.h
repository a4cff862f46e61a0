// Member tables: most CAMEL argument and type units are a SEQUENCE, SET,
// SEQUENCE OF or CHOICE of tagged elements.  Each such unit is declared
// once as a constexpr table of rows (identifier, element name, tag and
// length fields, how the value is decoded) and walked by one generic walker
// per pass, which carries out the BER conventions: tag tests, pre-bounded
// element windows, the element loop's sweeps, repetition and choice.
//
// A row's value is a field shape (one octet, an integer, half-octet digits,
// BCD digits), a child table, or a hand-written unit for what is irregular
// (bit-level layouts, digit decoders).  A unit called from a row starts at
// the element's length field when the row names none, otherwise right
// after it; it runs inside the element's window, which the walker closes.
#pragma once

#include <cstdint>

#include "engine/ber.h"
#include "fields/field_table.h"

namespace camel {

// A hand-written unit reachable from a row, one instance per pass.
struct UnitRef {
    using Fn = int (*)(DecodeState *, ElementContext *, void *);
    Fn fn[4] = {};

    template <Pass P>
    int call(DecodeState *st, ElementContext *ctx, Request<P> *rq) const {
        return fn[static_cast<int>(P)](st, ctx, rq);
    }
};

// Calls the pass instance `Unit` of a unit template through UnitRef's
// common signature.  (A named function rather than a lambda: clang 14 passes
// null arguments through the invoker of a lambda converted at compile time.)
template <Pass P, auto Unit>
int unitThunk(DecodeState *st, ElementContext *ctx, void *rq) {
    return Unit(st, ctx, static_cast<Request<P> *>(rq));
}
#define CAMEL_UNIT_FN_(unit, pass) &::camel::unitThunk<pass, &unit<pass>>
// A row value decoded by the unit template `unit` (template <Pass P> int
// unit(DecodeState *, ElementContext *, Request<P> *)).
#define CAMEL_UNIT(unit)                                                                      \
    ::camel::unitValue(::camel::UnitRef{{CAMEL_UNIT_FN_(unit, ::camel::Pass::Decoded),         \
                                         CAMEL_UNIT_FN_(unit, ::camel::Pass::Display),         \
                                         CAMEL_UNIT_FN_(unit, ::camel::Pass::MessageView),     \
                                         CAMEL_UNIT_FN_(unit, ::camel::Pass::KeyField)}})

enum class ValueKind : uint8_t {
    None,       // nothing after the length (NULL, or a length-only element)
    Octet,      // one octet, rendered by its field (names, boolean, %u, %x)
    Integer,    // the first min(content, limit) octets, value * 256 + octet
    HalfOctets, // the first min(content, limit) octets, two spans each, high half first
    Bcd,        // at most `limit` digits, low half of each octet first
    Table,      // a child member table
    Unit,       // a hand-written unit
    Bits,       // a bit layout: fields at fixed bit offsets, see BitField
};

struct MemberTable;

// One field of a bit layout: `spans` runs of `width` bits from `offset`
// bits after the cursor, the first run most significant, then `consumed`
// bits consumed.  The fields of one octet show its bits without consuming
// them (consumed 0) until the last, which consumes the octet.
struct BitField {
    FieldIndex field = kNoField;
    uint8_t offset = 0;
    uint8_t width = 8;
    uint8_t spans = 1;
    uint8_t consumed = 0;
};
struct BitLayout {
    const BitField *rows = nullptr;
    uint8_t count = 0;
};

struct Value {
    ValueKind kind = ValueKind::None;
    FieldIndex field = kNoField;
    uint8_t limit = 0;
    const MemberTable *table = nullptr;
    UnitRef unit{};
    const BitLayout *bits = nullptr;
};

// The identifier "read without a value check" under a tag override.
inline constexpr uint32_t kAnyTag = 0x10000;
// A one-octet identifier compared by class and number only, so that [n]
// matches in either form (an element under a tag override whose primitive
// and constructed encodings are both met).
constexpr uint32_t anyForm(uint32_t tag) { return 0x20000u | tag; }

struct Member {
    uint32_t tag = 0;            // one octet, or two as read (first octet low: BF 32 -> 0x32BF)
    uint8_t tagBits = 8;         // 8 or 16; 0 for kAnyTag; 1 for anyForm (class and number)
    const char *name = "";       // element name
    FieldIndex tagField = kNoField;
    FieldIndex lengthField = kNoField;
    Value value{};
};

enum class Walk : uint8_t {
    Loop,       // element loop: members in any order, sweeps until N consecutive misses
    InOrder,    // each member at most once, in table order, when its identifier is next
    Mandatory,  // each member once, in table order; a missing identifier is flagged
    Repeat,     // SEQUENCE OF: the single member while its identifier is next, at most 255
    FirstMatch, // a choice written as tag tests: the first member whose identifier is next
    Choice,     // a choice field shows the next identifier; the member it names follows
                // from its length field on
};

struct MemberTable {
    Walk walk = Walk::Loop;
    const Member *rows = nullptr;
    uint8_t count = 0;
    FieldIndex choiceField = kNoField; // Choice only
};

// ---- Declaring rows -------------------------------------------------------------

consteval Value none() { return Value{}; }
consteval Value octet(uint32_t id) { return Value{ValueKind::Octet, fx(id)}; }
consteval Value integer(uint32_t id, uint8_t limit) {
    return Value{ValueKind::Integer, fx(id), limit};
}
consteval Value halfOctets(uint32_t id, uint8_t limit) {
    return Value{ValueKind::HalfOctets, fx(id), limit};
}
consteval Value bcd(uint32_t id, uint8_t digits) { return Value{ValueKind::Bcd, fx(id), digits}; }
constexpr Value unitValue(UnitRef unit) { return Value{ValueKind::Unit, kNoField, 0, nullptr, unit}; }
consteval Value table(const MemberTable &t) { return Value{ValueKind::Table, kNoField, 0, &t}; }
consteval Value bits(const BitLayout &b) {
    return Value{ValueKind::Bits, kNoField, 0, nullptr, UnitRef{}, &b};
}

// A bit-layout row: field id, offset and width of the bits shown, bits
// consumed; `spans` runs of `width` bits when the value is read in pieces.
consteval BitField bitField(uint32_t id, uint8_t offset, uint8_t width, uint8_t consumed,
                            uint8_t spans = 1) {
    return BitField{fx(id), offset, width, spans, consumed};
}
template <size_t N>
consteval BitLayout layout(const BitField (&rows)[N]) {
    static_assert(N > 0 && N < 256, "a bit layout has 1 to 255 fields");
    return BitLayout{rows, static_cast<uint8_t>(N)};
}

// A row: identifier as written (0x9F32 for the two octets 9F 32), element
// name, tag and length field ids (0: none), value.
consteval Member el(uint32_t tag, const char *name, uint32_t tagId, uint32_t lengthId, Value value) {
    Member m;
    if (tag == kAnyTag) {
        m.tag = kAnyTag;
        m.tagBits = 0;
    } else if ((tag & 0x20000u) != 0) {
        m.tag = ((tag >> 6) & 3u) * 32 + (tag & 0x1Fu);
        m.tagBits = 1;
    } else if (tag > 0xFF) {
        m.tag = ((tag & 0xFFu) << 8) | (tag >> 8);
        m.tagBits = 16;
    } else {
        m.tag = tag;
        m.tagBits = 8;
    }
    m.name = name;
    m.tagField = tagId != 0 ? fx(tagId) : kNoField;
    m.lengthField = lengthId != 0 ? fx(lengthId) : kNoField;
    m.value = value;
    return m;
}

// A choice alternative: the identifier the choice field must show, the
// element name, its length field id (0: the value decoder reads it).
consteval Member alt(uint32_t tag, const char *name, uint32_t lengthId, Value value) {
    Member m = el(tag, name, 0, lengthId, value);
    m.tag = tag;
    m.tagBits = tag > 0xFF ? 16 : 8;
    return m;
}

template <size_t N>
consteval MemberTable members(Walk walk, const Member (&rows)[N], uint32_t choiceId = 0) {
    static_assert(N > 0 && N < 256, "a member table has 1 to 255 rows");
    return MemberTable{walk, rows, static_cast<uint8_t>(N),
                       choiceId != 0 ? fx(choiceId) : kNoField};
}

// A type whose unit starts at its own length field is the body of a row
// without identifier: decodeMember opens the body's window from the length
// at the cursor, shows the length field and decodes the row's value.
consteval Member body(const char *name, uint32_t lengthId, Value value) {
    return alt(0, name, lengthId, value);
}

// ---- Walking ----------------------------------------------------------------------

// Walks table `t` in the current window with the caller's context.
template <Pass P>
int walkTable(DecodeState *st, ElementContext *ctx, Request<P> *rq, const MemberTable &t);

// Reads the fields of bit layout `b` at the cursor.
template <Pass P>
int readBits(DecodeState *st, ElementContext *ctx, Request<P> *rq, const BitLayout &b);

// Whether row `m`'s identifier is next (a peek; nothing consumed).
bool memberTagNext(DecodeState *st, const Member &m);

// The element of row `m`, whose identifier is next: a pre-bounded element
// with the row's tag field, length field and value.  `idBits` is 0 for a
// choice alternative, whose identifier the choice field has consumed.
template <Pass P>
int decodeMember(DecodeState *st, ElementContext *ctx, Request<P> *rq, const Member &m,
                 uint32_t idBits);

// Decodes row `m` when its identifier is next; a mandatory row whose
// identifier is not next sets the mandatory-missing flag.
template <Pass P>
int decodeRow(DecodeState *st, ElementContext *ctx, Request<P> *rq, const Member &m,
              bool mandatory);

// Decodes the body row `row` (see body()) from the length field at the cursor.
template <Pass P>
inline int decodeBody(DecodeState *st, ElementContext *ctx, Request<P> *rq, const Member &row) {
    if (ctx->present == 0)
        return 1;
    return decodeMember<P>(st, ctx, rq, row, 0);
}

// A type unit that is one body row (it starts at its length field) or one
// table (walked right after its length field), stamped out for every pass.
#define CAMEL_TYPE_UNIT_(unit, decode, what)                                                 \
    template <Pass P>                                                                       \
    int unit(DecodeState *st, ElementContext *ctx, Request<P> *rq) {                        \
        return decode<P>(st, ctx, rq, what);                                                \
    }                                                                                       \
    CAMEL_INSTANTIATE_UNIT(unit, DecodeState *, ElementContext *)
#define CAMEL_BODY_UNIT(unit, row) CAMEL_TYPE_UNIT_(unit, ::camel::decodeBody, row)
#define CAMEL_TABLE_UNIT(unit, table) CAMEL_TYPE_UNIT_(unit, ::camel::walkTable, table)

} // namespace camel
