#include "engine/runtime.h"

#include <array>
#include <cstring>

namespace camel {

namespace {

constexpr std::array<uint8_t, 256> makeReverseTable() {
    std::array<uint8_t, 256> table{};
    for (unsigned v = 0; v < 256; ++v) {
        unsigned r = 0;
        for (unsigned b = 0; b < 8; ++b)
            r |= ((v >> b) & 1u) << (7 - b);
        table[v] = static_cast<uint8_t>(r);
    }
    return table;
}
constexpr auto kReverseByte = makeReverseTable();

uint32_t swapPairs16(uint32_t v) {
    v = ((v >> 1) & 0x5555u) | ((v & 0x5555u) << 1);
    v = ((v >> 2) & 0x3333u) | ((v & 0x3333u) << 2);
    v = ((v >> 4) & 0x0F0Fu) | ((v & 0x0F0Fu) << 4);
    return ((v >> 8) & 0x00FFu) | ((v & 0x00FFu) << 8);
}

uint32_t swapPairs32(uint32_t v) {
    v = ((v >> 1) & 0x55555555u) | ((v & 0x55555555u) << 1);
    v = ((v >> 2) & 0x33333333u) | ((v & 0x33333333u) << 2);
    v = ((v >> 4) & 0x0F0F0F0Fu) | ((v & 0x0F0F0F0Fu) << 4);
    v = ((v >> 8) & 0x00FF00FFu) | ((v & 0x00FF00FFu) << 8);
    return (v >> 16) | (v << 16);
}

// Sizes above this are refused rather than wrapped: no message needs them.
constexpr uint64_t kMaxArrayBytes = 0x40000000u;

} // namespace

uint32_t ReverseBits(uint32_t value, uint32_t n) {
    if (value == 0 || n == 0)
        return 0;
    if (n == 8)
        return kReverseByte[value & 0xFFu];
    if (n == 16)
        return swapPairs16(value & 0xFFFFu);
    if (n == 32)
        return swapPairs32(value);
    uint32_t result = 0;
    for (uint32_t i = 0; i < n; ++i) {
        result = (result << 1) | (value & 1u);
        value >>= 1;
    }
    return result;
}

uint32_t ExtractBitsAnyRange(const uint8_t *buffer, uint32_t from, uint32_t to) {
    static constexpr uint8_t kMask[8] = {1, 3, 7, 15, 31, 63, 127, 255};
    const bool reversed = static_cast<int32_t>(from) > static_cast<int32_t>(to);
    const uint32_t lo = (reversed ? to : from) - 1;
    const uint32_t hi = (reversed ? from : to) - 1;
    const uint32_t lowByte = lo >> 3;
    const uint32_t highByte = hi >> 3;
    const uint32_t l = lo & 7u;
    const uint32_t h = hi & 7u;
    uint32_t value;
    if (lowByte == highByte) {
        value = static_cast<uint32_t>(buffer[lowByte] & kMask[h]) >> l;
    } else {
        value = buffer[highByte] & kMask[h];
        for (uint32_t i = highByte - 1; i > lowByte; --i)
            value = value * 256u + buffer[i];
        value = (value << (8 - l)) + (static_cast<uint32_t>(buffer[lowByte]) >> l);
    }
    return reversed ? ReverseBits(value, from - to + 1) : value;
}

int EnsureSlot(void **array, uint32_t index, uint32_t *count, uint32_t elementSize) {
    const uint64_t n = static_cast<uint64_t>(index) + 1;
    if (n < *count)
        return 1;
    const uint64_t bytes = n * elementSize;
    void *grown = bytes > kMaxArrayBytes ? nullptr : pu_Realloc(*array, static_cast<size_t>(bytes));
    if (grown == nullptr) {
        *array = nullptr;
        return 0;
    }
    *array = grown;
    *count = static_cast<uint32_t>(n);
    return 1;
}

int EnsureCapacityDoubling(void **array, uint32_t index, uint32_t *capacity,
                           uint32_t elementSize) {
    while (index >= *capacity) {
        // A capacity of 0 would never grow by doubling; start it at one.
        const uint64_t next = *capacity == 0 ? 1 : static_cast<uint64_t>(*capacity) * 2;
        const uint64_t bytes = next * elementSize;
        void *grown = bytes > kMaxArrayBytes ? nullptr : pu_Realloc(*array, static_cast<size_t>(bytes));
        if (grown == nullptr) {
            *array = nullptr;
            return 0;
        }
        *array = grown;
        *capacity = static_cast<uint32_t>(next);
    }
    return 1;
}

void ResetFieldRecord(FieldRecord *field) {
    field->value = 0;
    if (field->valueText != nullptr)
        field->valueText[0] = '\0';
    field->spansFilled = 0;
    if (field->label != nullptr)
        field->label[0] = '\0';
    field->valueKind = 0;
}

void PushLayerFrame(DecodeState *state) {
    if (state->bitCursor != 1)
        ++state->frameIndex;
    state->firstFrameFlag = 0;
    LayerFrame &frame = state->layerFrames[state->frameIndex];
    frame.startBit = state->bitCursor;
    std::memset(frame.cleared, 0, sizeof frame.cleared);
}

} // namespace camel
