// A field record over owned spans, as a grammar unit leaves it when it
// reports a variable key field.
#pragma once

#include "dpx_camel.h"

#include <algorithm>
#include <cstdint>
#include <initializer_list>
#include <utility>
#include <vector>

namespace keytest {

struct Field {
    std::vector<ValueSpan> spans;
    FieldRecord record{};

    // `reported` below the span count leaves the spans after it filled only.
    explicit Field(std::vector<ValueSpan> s, uint32_t reported = UINT32_MAX) : spans(std::move(s)) {
        record.spans = spans.empty() ? nullptr : spans.data();
        record.spansFilled = record.spanCapacity = static_cast<uint32_t>(spans.size());
        record.spansReported = std::min(reported, record.spansFilled);
    }
    Field(const Field &o) : Field(o.spans, o.record.spansReported) {}
    Field &operator=(const Field &) = delete;
};

// Consecutive runs of `width` bits, one per value, from bit 9 on.
inline Field runs(std::initializer_list<uint32_t> values, uint32_t width) {
    std::vector<ValueSpan> s;
    for (uint32_t v : values)
        s.push_back(ValueSpan{v, 9 + width * uint32_t(s.size()), 8 + width * uint32_t(s.size() + 1), 0, {0, 0}});
    return Field(std::move(s));
}

// `count` digits 1, 2, ..., 9, 0, 1, ... as 4-bit spans.
inline Field digits(uint32_t count) {
    std::vector<ValueSpan> s;
    for (uint32_t i = 0; i < count; ++i)
        s.push_back(ValueSpan{(i + 1) % 10, 9 + 4 * i, 12 + 4 * i, 0, {0, 0}});
    return Field(std::move(s));
}

} // namespace keytest
