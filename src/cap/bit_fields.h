// Bit fields of an octet, declared as data: the ISUP and Q.931 number
// layouts and the TP octets of a short message are rows of these.
#pragma once

#include <cstddef>
#include <cstdint>

#include "engine/emit.h"

namespace camel {

// One bit field of an octet: its field, the offset of its lowest bit from
// the octet's first bit (ITU bit n is offset n - 1) and its width.
struct BitField {
    FieldIndex field;
    uint8_t offset;
    uint8_t width;
};

// Fields of one octet read in place, in the order they are shown; with
// `finish` the last one moves the cursor on to the next octet.  `values`,
// when given, receives each field's value (valid while the element is
// present).
template <Pass P, size_t N>
int bitFields(DecodeState *st, ElementContext *ctx, Request<P> *rq, const BitField (&fields)[N],
              bool finish, uint32_t *values) {
    for (size_t i = 0; i < N; ++i) {
        if (!fittedBitsField<P>(st, ctx, rq, fields[i].field, fields[i].offset, fields[i].width,
                                finish && i + 1 == N ? 8 : 0))
            return 0;
        if (values != nullptr)
            values[i] = st->field.value;
    }
    return 1;
}

// The fields of one octet; the last one moves the cursor to the next octet.
template <Pass P, size_t N>
int octetFields(DecodeState *st, ElementContext *ctx, Request<P> *rq, const BitField (&fields)[N],
                uint32_t *values = nullptr) {
    return bitFields<P>(st, ctx, rq, fields, true, values);
}

// Fields that follow each other bit by bit from the cursor, each moving the
// cursor by its own width (the offsets are not used).  Returns the value
// of the first field through `first` when asked.
template <Pass P, size_t N>
int successiveFields(DecodeState *st, ElementContext *ctx, Request<P> *rq,
                     const BitField (&fields)[N], uint32_t *first = nullptr) {
    for (size_t i = 0; i < N; ++i) {
        if (!fittedBitsField<P>(st, ctx, rq, fields[i].field, 0, fields[i].width, fields[i].width))
            return 0;
        if (i == 0 && first != nullptr)
            *first = st->field.value;
    }
    return 1;
}

} // namespace camel
