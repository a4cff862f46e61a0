// Cursor, window and stack operations over the decoding state.
//
// The cursor is the 1-based position of the next bit; the remaining bits
// count from the cursor to the last bit of the current window.  Every read
// is preceded by a room test against the remaining bits, and the outermost
// window is the message itself, so no read leaves the message.
#pragma once

#include <cstdint>
#include <cstring>

#include "dpx_camel.h"
#include "engine/runtime.h"

namespace camel {

// Room test: records the answer in the state's test flag as units do.
inline bool room(DecodeState *st, uint32_t bits) {
    const bool ok = st->remainingBits >= bits;
    st->testFlag = ok ? 1 : 0;
    return ok;
}

// The octet starting `offsetBits` after the cursor; the caller made sure it
// lies in the window.
inline uint32_t octetAt(const DecodeState *st, uint32_t offsetBits) {
    const uint32_t p = st->bitCursor + offsetBits;
    if (((p - 1) & 7u) == 0)
        return st->buffer[(p - 1) >> 3];
    return ExtractBits(st->buffer, p, p + 7);
}

inline uint32_t peekOctet(const DecodeState *st) { return octetAt(st, 0); }

inline void consume(DecodeState *st, uint32_t bits) {
    st->fieldWidth = bits;
    st->bitCursor += bits;
    st->remainingBits -= bits;
}

// Names the element being decoded in the host's element-name buffer.
inline void setElementName(DecodeState *st, const char *name) {
    char *dst = st->elementName;
    if (dst == nullptr)
        return;
    size_t n = std::strlen(name);
    if (n > DPX_TEXT_BUFFER_SIZE - 1)
        n = DPX_TEXT_BUFFER_SIZE - 1;
    std::memcpy(dst, name, n);
    dst[n] = '\0';
}

// Pushes the cursor on the position stack (start of an element, block or
// group).  0 when the stack cannot grow.
inline int pushPos(DecodeState *st) {
    uint32_t index = static_cast<uint32_t>(st->posTop - st->posStack) + 1;
    st->posIndex = index;
    void *stack = st->posStack;
    if (!EnsureCapacityDoubling(&stack, index, &st->posCapacity, sizeof(uint32_t))) {
        st->posStack = nullptr;
        st->errorFlags |= DPX_ERR_STACK_GROWTH;
        return 0;
    }
    st->posStack = static_cast<uint32_t *>(stack);
    st->posTop = st->posStack + index;
    *st->posTop = st->bitCursor;
    return 1;
}

inline void popPos(DecodeState *st) { --st->posTop; }

// Element start: name the element and push its start position.
inline int elementStart(DecodeState *st, const char *name) {
    setElementName(st, name);
    return pushPos(st);
}

// Pushes the last bit of the current window (cursor + remaining - 1).
inline int pushEnd(DecodeState *st) {
    uint32_t index = static_cast<uint32_t>(st->endTop - st->endStack) + 1;
    st->endIndex = index;
    void *stack = st->endStack;
    if (!EnsureCapacityDoubling(&stack, index, &st->endCapacity, sizeof(uint32_t))) {
        st->endStack = nullptr;
        st->errorFlags |= DPX_ERR_STACK_GROWTH;
        return 0;
    }
    st->endStack = static_cast<uint32_t *>(stack);
    st->endTop = st->endStack + index;
    *st->endTop = st->bitCursor + st->remainingBits - 1;
    return 1;
}

// Closes the current window and restores the enclosing one as seen from
// the cursor.  The cursor never stands past the enclosing window's end, but
// the subtraction is guarded so the remaining bits can never wrap.
inline void popEnd(DecodeState *st) {
    --st->endTop;
    const uint32_t last = *st->endTop;
    st->remainingBits = last + 1 >= st->bitCursor ? last + 1 - st->bitCursor : 0;
}

// Narrows the window to `bits` when they fit.  Otherwise sets the
// length-beyond flag, keeps the enclosing window and returns false.
inline bool narrowWindow(DecodeState *st, uint64_t bits) {
    if (bits > st->remainingBits) {
        st->errorFlags |= DPX_ERR_LENGTH_BEYOND;
        return false;
    }
    st->remainingBits = static_cast<uint32_t>(bits);
    return true;
}

// Bits left at the end of a window are skipped and flagged.
inline void skipLeftover(DecodeState *st) {
    if (st->remainingBits != 0) {
        st->errorFlags |= DPX_ERR_LEFTOVER;
        st->bitCursor += st->remainingBits;
        st->remainingBits = 0;
    }
}

// A BER length read without consuming it.
struct LengthPeek {
    bool fits = false;        // all length octets lie in the window
    uint64_t value = 0;       // saturated to 0xFFFFFFFF when wider than 32 bits
    uint32_t bits = 0;        // bits of the length octets
    uint32_t octetCount = 0;  // 1 short form, N+1 long form, 0 indefinite
};

// Reads the BER length that starts `offsetBits` after the cursor, looking
// only at octets inside the window.
inline LengthPeek peekLength(const DecodeState *st, uint32_t offsetBits) {
    LengthPeek len;
    if (st->remainingBits < offsetBits + 8)
        return len;
    const uint32_t first = octetAt(st, offsetBits);
    if (first == 0x80) {
        len.fits = true;
        len.bits = 8;
        return len;
    }
    if ((first & 0x80u) == 0) {
        len.fits = true;
        len.value = first;
        len.bits = 8;
        len.octetCount = 1;
        return len;
    }
    const uint32_t n = first & 0x7Fu;
    const uint64_t bits = 8ull * (n + 1);
    if (bits > static_cast<uint64_t>(st->remainingBits) - offsetBits)
        return len;
    uint64_t value = 0;
    for (uint32_t i = 1; i <= n; ++i) {
        value = value * 256u + octetAt(st, offsetBits + 8 * i);
        if (value > 0xFFFFFFFFull)
            value = 0x100000000ull; // keeps growing past any window; never wraps
    }
    len.fits = true;
    len.value = value > 0xFFFFFFFFull ? 0xFFFFFFFFull : value;
    len.bits = static_cast<uint32_t>(bits);
    len.octetCount = n + 1;
    return len;
}

// The bits of the whole element at the cursor (identifier, definite length
// and contents) when it is well formed and lies in the window, else 0: an
// identifier 00 (end-of-contents), a tag number over more than four octets
// or with a leading zero octet, an indefinite length or one that does not
// fit, contents past the window.
inline uint64_t wholeElementBits(const DecodeState *st) {
    if (st->remainingBits < 8 || octetAt(st, 0) == 0)
        return 0;
    uint32_t idBits = 8;
    if ((octetAt(st, 0) & 0x1Fu) == 0x1Fu) {
        uint32_t next = 0x80;
        while ((next & 0x80u) != 0) {
            if (idBits > 32 || st->remainingBits < idBits + 8)
                return 0;
            next = octetAt(st, idBits);
            if (idBits == 8 && (next & 0x7Fu) == 0)
                return 0;
            idBits += 8;
        }
    }
    const LengthPeek len = peekLength(st, idBits);
    if (!len.fits || len.octetCount == 0)
        return 0;
    const uint64_t bits = idBits + len.bits + len.value * 8;
    return bits <= st->remainingBits ? bits : 0;
}

} // namespace camel
