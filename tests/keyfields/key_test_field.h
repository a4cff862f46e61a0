// A field record over owned spans, as a grammar unit leaves it when it
// reports a variable key field.
#pragma once

#include "dpx_camel.h"

#include <cstdint>
#include <initializer_list>
#include <utility>
#include <vector>

namespace keytest {

struct Field {
    std::vector<ValueSpan> spans;
    FieldRecord record{};

    // Consecutive runs of `width` bits, one per value, from bit 9 on.
    Field(std::initializer_list<uint32_t> values, uint32_t width) {
        uint32_t bit = 9;
        for (uint32_t v : values) {
            spans.push_back(ValueSpan{v, bit, bit + width - 1, 0, {0, 0}});
            bit += width;
        }
        seal();
    }
    explicit Field(std::vector<ValueSpan> s) : spans(std::move(s)) { seal(); }
    Field(const Field &other) : spans(other.spans), record(other.record) { seal(); }
    Field &operator=(const Field &) = delete;

    void seal() {
        record.spans = spans.empty() ? nullptr : spans.data();
        record.spansFilled = static_cast<uint32_t>(spans.size());
        record.spansReported = record.spansFilled;
        record.spanCapacity = record.spansFilled;
    }
};

// `count` digits 1, 2, ..., 9, 0, 1, ... as 4-bit spans.
inline Field digits(uint32_t count) {
    std::vector<ValueSpan> s;
    for (uint32_t i = 0; i < count; ++i)
        s.push_back(ValueSpan{(i + 1) % 10, 9 + 4 * i, 12 + 4 * i, 0, {0, 0}});
    return Field(std::move(s));
}

} // namespace keytest
