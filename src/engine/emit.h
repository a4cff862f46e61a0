// Building a field in the field record and reporting it in each pass's way.
//
// A unit builds a field in four steps (reset and label, spans, finish,
// report) through the helpers below; only `report` differs per pass, and
// it is the one place where a pass shows.
#pragma once

#include <cstdint>
#include <cstring>
#include <string>

#include "dpx_camel.h"
#include "engine/cursor.h"
#include "engine/pass.h"
#include "engine/scratch.h"
#include "engine/text.h"
#include "fields/field_table.h"
#include "keyfields/key_marks.h"

namespace camel {

// Message-view pass: any error flag makes the message invalid.
template <Pass P>
inline void noteStatus(const DecodeState *st, Request<P> *rq) {
    if constexpr (P == Pass::MessageView) {
        if (st->errorFlags != 0)
            rq->status = DPX_STATUS_INVALID;
    } else {
        (void)st;
        (void)rq;
    }
}

// Reset the field record and copy the field's label into it.
constexpr bool labelsFitTheHostBuffer() {
    for (size_t i = 0; i < kFieldCount; ++i)
        if (kLabelLengths.n[i] >= DPX_TEXT_BUFFER_SIZE)
            return false;
    return true;
}
static_assert(labelsFitTheHostBuffer(), "a label is longer than the host's label buffer");

inline void beginField(DecodeState *st, FieldIndex f) {
    ResetFieldRecord(&st->field);
    if (st->field.label != nullptr)
        std::memcpy(st->field.label, kFields[f].label, kLabelLengths.n[f] + 1u);
}

template <uint32_t Id>
inline void beginField(DecodeState *st) {
    beginField(st, Field<Id>::index);
}

// Makes span `highest` writable; flags and fails when the array cannot grow.
inline int ensureSpans(DecodeState *st, uint32_t highest) {
    void *spans = st->field.spans;
    if (!EnsureSlot(&spans, highest, &st->field.spanCapacity, sizeof(ValueSpan))) {
        st->field.spans = nullptr;
        st->errorFlags |= DPX_ERR_SPAN_GROWTH;
        return 0;
    }
    st->field.spans = static_cast<ValueSpan *>(spans);
    return 1;
}

// Fills span `index` over the message bits [first, last] (positions, last
// >= first, at most 32 bits) and returns its value.
inline uint32_t setSpanAt(DecodeState *st, uint32_t index, uint32_t first, uint32_t last) {
    ValueSpan &s = st->field.spans[index];
    s.firstBit = first;
    s.lastBit = last;
    s.value = ExtractBits(st->buffer, first, last);
    s.flags = 0;
    st->field.spansFilled = index + 1;
    return s.value;
}

// Fills span `index` over the bits [cursor + from, cursor + to] (offsets
// from the cursor) and returns its value.
inline uint32_t setSpan(DecodeState *st, uint32_t index, uint32_t from, uint32_t to) {
    return setSpanAt(st, index, st->bitCursor + from, st->bitCursor + to);
}

namespace detail {

inline const char *nameOf(const FieldDef &f, uint32_t value, bool display) {
    if (display)
        for (uint16_t i = 0; i < f.displayNameCount; ++i)
            if (f.displayNames[i].code == value)
                return f.displayNames[i].name;
    for (uint16_t i = 0; i < f.nameCount; ++i)
        if (f.names[i].code == value)
            return f.names[i].name;
    return f.otherName;
}

inline void renderValue(const FieldDef &f, const FieldRecord &field, TextBuf &out, bool display) {
    switch (f.render) {
    case Render::Tag:
    case Render::Hex:
        out.hex(field.value);
        break;
    case Render::Unsigned:
        out.decimal(field.value);
        break;
    case Render::LenHeader:
        out.decimal(field.value);
        out.append(" octet(s)");
        break;
    case Render::LenBlock:
        if (field.value == 0) {
            out.append("Indefinite Length");
        } else {
            out.decimal(field.value);
            out.append(" Octet(s)");
        }
        break;
    case Render::Digits:
        for (uint32_t i = 0; i < field.spansReported; ++i)
            out.hex(field.spans[i].value);
        break;
    case Render::Enum:
        out.append(nameOf(f, field.value, display));
        break;
    case Render::Chars:
        for (uint32_t i = 0; i < field.spansReported; ++i) {
            const uint32_t c = field.spans[i].value;
            const char shown = c >= 0x20 && c < 0x7F ? static_cast<char>(c) : '.';
            out.append(&shown, 1);
        }
        break;
    case Render::Dotted:
        for (uint32_t i = 0; i < field.spansReported; ++i) {
            if (i != 0)
                out.append(".", 1);
            out.decimal(field.spans[i].value);
        }
        break;
    case Render::AccessPointName:
        break; // the host appends the name (see report)
    }
}

// 0 for a field of one span; for several: the field's own selector, 1 for
// values shown span by span, else spans - 1 (integers built octet by octet).
inline uint32_t spanSelector(const FieldDef &f, uint32_t spans) {
    if (spans <= 1)
        return 0;
    if (f.selector != 0xFF)
        return f.selector;
    if (f.render == Render::Digits)
        return 1;
    return spans - 1;
}

} // namespace detail

// Step 8 of every field: hand the finished field to the host in the pass's
// way.  Returns 0 only when the pass must end (a key value that does not fit).
template <Pass P>
int report(DecodeState *st, Request<P> *rq, FieldIndex index) {
    const FieldDef &f = kFields[index];
    if constexpr (P == Pass::Decoded || P == Pass::Display) {
        TextBuffers &buf = g_text<P>;
        TextBuf text{buf.text, sizeof buf.text, 0};
        text.clear();
        if constexpr (P == Pass::Decoded) {
            if (rq->outputLines != nullptr) {
                char *line = rq->outputLines +
                             static_cast<size_t>(rq->currentLineIndex) * DPX_OUTPUT_LINE_SIZE;
                line[0] = static_cast<char>(rq->layerCode);
                line[1] = 0;
                line[2] = 0;
            }
            // Indent, label and '=' in one copy, then the value and its suffix.
            text.append(kTextPrefixes.chars + kTextPrefixes.at[index], kTextPrefixes.length[index]);
        }
        detail::renderValue(f, st->field, text, P == Pass::Display);
        if constexpr (P == Pass::Decoded)
            text.append(f.suffix, kTextPrefixes.suffixLength[index]);
        // An access point name is rendered by the host; its failure ends the pass.
        if (f.render == Render::AccessPointName &&
            pu_access_point_name(text.data, st->field.value, st) == 0)
            return 0;
        if constexpr (P == Pass::Decoded)
            pu_AddDecodedFieldsData(rq, st->field.spansReported, st->field.spans, text.data,
                                    detail::spanSelector(f, st->field.spansReported),
                                    st->field.label, f.id, 0, 0);
        else
            pu_AddFieldsToDisplayData(rq, text.data, kDisplayIds.id[index]);
    } else if constexpr (P == Pass::MessageView) {
        noteStatus<P>(st, rq);
    } else {
        switch (f.keyForm) {
        case KeyForm::Octet:
            return markOctetKey(rq, static_cast<uint32_t>(f.keyEntry), st->field.value);
        case KeyForm::Word:
            return markWordKey(rq, static_cast<uint32_t>(f.keyEntry), st->field.value);
        case KeyForm::Variable:
            return markVariableKey(rq, static_cast<uint32_t>(f.keyEntry), &st->field);
        case KeyForm::None:
            break;
        }
    }
    return 1;
}

template <Pass P, uint32_t Id>
inline int report(DecodeState *st, Request<P> *rq) {
    return report<P>(st, rq, Field<Id>::index);
}

// Steps 6 to 8: spans reported, field id, consume `width` bits, report.
template <Pass P>
inline int finishField(DecodeState *st, Request<P> *rq, FieldIndex f, uint32_t width) {
    st->field.spansReported = st->field.spansFilled;
    st->field.fieldId = kFields[f].id;
    consume(st, width);
    return report<P>(st, rq, f);
}

// ---- Common field shapes ---------------------------------------------------
//
// Each shape takes the field's catalogue position at run time, so one
// instance per pass serves every field; the wrappers taking the field id as
// a template argument check at compile time that the id is declared.

// A field of `width` bits (1..32) at `offset` bits after the cursor, one
// span, consuming `consumed` bits.  The caller has made sure the bits are
// in the window.
template <Pass P>
int bitsField(DecodeState *st, Request<P> *rq, FieldIndex f, uint32_t offset, uint32_t width,
              uint32_t consumed) {
    beginField(st, f);
    if (!ensureSpans(st, 0))
        return 0;
    st->field.value = setSpan(st, 0, offset, offset + width - 1);
    return finishField<P>(st, rq, f, consumed);
}

// A field of `spans` runs of `width` bits each from `offset` bits after the
// cursor, the first run most significant (value = value << width | run),
// consuming `consumed` bits (0: the field only shows bits a later field of
// the octet consumes).  It must fit in the window: when the bits are not
// there the element is marked absent and nothing is shown.
template <Pass P>
int spansField(DecodeState *st, ElementContext *ctx, Request<P> *rq, FieldIndex f,
               uint32_t offset, uint32_t width, uint32_t spans, uint32_t consumed) {
    if (ctx->present == 0)
        return 1;
    const uint32_t end = offset + width * spans;
    if (!room(st, end > consumed ? end : consumed)) {
        ctx->present = 0;
        return 1;
    }
    beginField(st, f);
    if (!ensureSpans(st, spans - 1))
        return 0;
    uint32_t value = 0;
    for (uint32_t i = 0; i < spans; ++i) {
        const uint32_t run = setSpan(st, i, offset + width * i, offset + width * (i + 1) - 1);
        value = width >= 32 ? run : (value << width) | run;
    }
    st->field.value = value;
    return finishField<P>(st, rq, f, consumed);
}

// A field of `width` bits at `offset` that must fit in the window (one run
// of spansField).
template <Pass P>
int fittedBitsField(DecodeState *st, ElementContext *ctx, Request<P> *rq, FieldIndex f,
                    uint32_t offset, uint32_t width, uint32_t consumed) {
    return spansField<P>(st, ctx, rq, f, offset, width, 1, consumed);
}

// A one-octet field (tag, fixed length octet, one-octet value).  Emitted
// only while the element is present and the octet is in the window;
// otherwise the element is marked absent.
template <Pass P>
int octetField(DecodeState *st, ElementContext *ctx, Request<P> *rq, FieldIndex f) {
    return fittedBitsField<P>(st, ctx, rq, f, 0, 8, 8);
}

// A tag field of the class-and-number form: two spans (bits 8-7 and bits
// 5-1), value class * 32 + number, so [0] shows as 40 in either form.
template <Pass P>
int classNumberTagField(DecodeState *st, ElementContext *ctx, Request<P> *rq, FieldIndex f) {
    if (ctx->present == 0)
        return 1;
    if (!room(st, 8)) {
        ctx->present = 0;
        return 1;
    }
    beginField(st, f);
    if (!ensureSpans(st, 1))
        return 0;
    const uint32_t cls = setSpan(st, 0, 6, 7);
    const uint32_t number = setSpan(st, 1, 0, 4);
    st->field.value = cls * 32 + number;
    return finishField<P>(st, rq, f, 8);
}

// The general BER length field (short, long or indefinite form): one span
// over all length octets, value to `lengthValue`.  A length whose octets
// are not all in the window is treated like any field that does not fit,
// and flagged like any length that runs past its window: the element it
// belongs to is cut short.
template <Pass P>
int lengthField(DecodeState *st, ElementContext *ctx, Request<P> *rq, FieldIndex f) {
    if (ctx->present == 0)
        return 1;
    const LengthPeek len = peekLength(st, 0);
    if (!len.fits) {
        st->testFlag = 0;
        st->errorFlags |= DPX_ERR_LENGTH_BEYOND;
        ctx->present = 0;
        noteStatus<P>(st, rq);
        return 1;
    }
    beginField(st, f);
    if (!ensureSpans(st, 0))
        return 0;
    setSpan(st, 0, 0, (len.bits > 32 ? 32 : len.bits) - 1);
    st->field.spans[0].lastBit = st->bitCursor + len.bits - 1;
    st->field.value = static_cast<uint32_t>(len.value);
    st->field.lengthFieldStart = 0;
    st->field.lengthFieldBits = len.bits;
    Scratch &s = g_scratch<P>;
    s.lengthValue = static_cast<uint32_t>(len.value);
    s.lengthOctetCount = len.octetCount;
    return finishField<P>(st, rq, f, len.bits);
}

// A value of up to `maxOctets` octets (at most what the window holds) as
// half-octet spans, high half first: value = value * 16 + half.
template <Pass P>
int halfOctetField(DecodeState *st, ElementContext *ctx, Request<P> *rq, FieldIndex f,
                   uint32_t maxOctets) {
    if (ctx->present == 0 || maxOctets == 0)
        return 1;
    if (!room(st, 8)) {
        ctx->present = 0;
        return 1;
    }
    uint32_t n = st->remainingBits / 8;
    if (n > maxOctets)
        n = maxOctets;
    beginField(st, f);
    if (!ensureSpans(st, 2 * n - 1))
        return 0;
    uint32_t value = 0;
    for (uint32_t i = 0; i < n; ++i) {
        value = value * 16 + setSpan(st, 2 * i, 8 * i + 4, 8 * i + 7);
        value = value * 16 + setSpan(st, 2 * i + 1, 8 * i, 8 * i + 3);
    }
    st->field.value = value;
    return finishField<P>(st, rq, f, 8 * n);
}

// Up to `maxDigits` half-octet digits (at most what the window holds), LOW
// half of each octet first (BCD telephony digits): one span per digit,
// value = value * 16 + digit.  A field of no digits is not shown.
template <Pass P>
int bcdDigitsField(DecodeState *st, ElementContext *ctx, Request<P> *rq, FieldIndex f,
                   uint32_t maxDigits) {
    if (ctx->present == 0)
        return 1;
    uint32_t n = st->remainingBits / 4;
    if (n > maxDigits)
        n = maxDigits;
    if (n == 0)
        return 1;
    beginField(st, f);
    if (!ensureSpans(st, n - 1))
        return 0;
    uint32_t value = 0;
    for (uint32_t i = 0; i < n; ++i) {
        const uint32_t low = 8 * (i / 2) + ((i & 1u) != 0 ? 4 : 0);
        value = value * 16 + setSpan(st, i, low, low + 3);
    }
    st->field.value = value;
    return finishField<P>(st, rq, f, 4 * n);
}

// A value of up to `maxOctets` octets, one span per octet, value = value *
// 256 + octet.
template <Pass P>
int octetsField(DecodeState *st, ElementContext *ctx, Request<P> *rq, FieldIndex f,
                uint32_t maxOctets) {
    if (ctx->present == 0 || maxOctets == 0)
        return 1;
    if (!room(st, 8)) {
        ctx->present = 0;
        return 1;
    }
    uint32_t n = st->remainingBits / 8;
    if (n > maxOctets)
        n = maxOctets;
    beginField(st, f);
    if (!ensureSpans(st, n - 1))
        return 0;
    uint32_t value = 0;
    for (uint32_t i = 0; i < n; ++i)
        value = value * 256 + setSpan(st, i, 8 * i, 8 * i + 7);
    st->field.value = value;
    return finishField<P>(st, rq, f, 8 * n);
}

// ---- Compile-time-checked wrappers -------------------------------------------

template <Pass P, uint32_t Id>
inline int finishField(DecodeState *st, Request<P> *rq, uint32_t width) {
    return finishField<P>(st, rq, Field<Id>::index, width);
}
template <Pass P, uint32_t Id>
inline int bitsField(DecodeState *st, Request<P> *rq, uint32_t offset, uint32_t width,
                     uint32_t consumed) {
    return bitsField<P>(st, rq, Field<Id>::index, offset, width, consumed);
}
template <Pass P, uint32_t Id>
inline int octetField(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return octetField<P>(st, ctx, rq, Field<Id>::index);
}
template <Pass P, uint32_t Id>
inline int classNumberTagField(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return classNumberTagField<P>(st, ctx, rq, Field<Id>::index);
}
template <Pass P, uint32_t Id>
inline int lengthField(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    return lengthField<P>(st, ctx, rq, Field<Id>::index);
}
template <Pass P, uint32_t Id>
inline int halfOctetField(DecodeState *st, ElementContext *ctx, Request<P> *rq,
                          uint32_t maxOctets) {
    return halfOctetField<P>(st, ctx, rq, Field<Id>::index, maxOctets);
}
template <Pass P, uint32_t Id>
inline int octetsField(DecodeState *st, ElementContext *ctx, Request<P> *rq, uint32_t maxOctets) {
    return octetsField<P>(st, ctx, rq, Field<Id>::index, maxOctets);
}

} // namespace camel
