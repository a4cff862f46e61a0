// --stats srt: response times measured inside each dialogue (the categories
// other analyzers use, under their names, and the pairs an IN engineer asks
// about), dialogue durations, and counts per operation, error, release
// cause, event type and service key.  Fed with dialogues as the dialogue
// layer closes them.
#pragma once

#include <cstdint>
#include <iosfwd>
#include <map>
#include <string>
#include <utility>
#include <vector>

#include "dialogues/tracker.h"

namespace dpxdecode::views {

// count, min, max, mean and nearest-rank percentiles of a set of times.
struct TimeSummary {
    uint64_t count = 0;
    double min = 0, max = 0, mean = 0, p50 = 0, p90 = 0, p99 = 0; // seconds
};
TimeSummary summarizeTimes(std::vector<int64_t> ns);

class ResponseTimes {
public:
    ResponseTimes();
    void add(const dialogues::Dialogue &d);
    void write(std::ostream &os, bool json) const;

    // Samples of one category (nanoseconds), for tests.
    const std::vector<int64_t> *samples(const std::string &category) const;

private:
    // value -> (name, count)
    using Counts = std::map<int64_t, std::pair<std::string, uint64_t>>;
    std::vector<std::vector<int64_t>> pairs_;     // by category
    std::vector<std::vector<int64_t>> durations_; // by outcome
    Counts operations_, errors_, releaseCauses_, eventTypes_, serviceKeys_;
    uint64_t dialogues_ = 0;
};

} // namespace dpxdecode::views
