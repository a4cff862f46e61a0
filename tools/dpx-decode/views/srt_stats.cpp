#include "views/srt_stats.h"

#include <nlohmann/json.hpp>

#include <algorithm>
#include <cstdio>
#include <ostream>
#include <unordered_map>

#include "dialogues/cap_codes.h"

namespace dpxdecode::views {
namespace {

using dialogues::ClosedBy;
using dialogues::Component;
using dialogues::Dialogue;
using dialogues::DialogueMessage;
using nlohmann::ordered_json;

// How a category measures.
enum class Rule : uint8_t {
    Session,   // Begin to the End, Abort or pre-arranged end that closes the dialogue
    Pair,      // an Invoke of `start` to the next Invoke of an `ends` operation from the other end
    AnyAnswer, // the first Invoke of `start` to the next message from the other end, whatever it is
    ResultOf,  // an Invoke of `start` to the Return Result or Return Error with its invoke id
};

struct Category {
    const char *name;
    Rule rule;
    int32_t start = -1;
    int32_t ends[2] = {-1, -1};
    bool restart = false; // Pair: a new `start` while one waits starts the time again
    uint8_t slice = 0;    // Pair: only the n-th pair of the dialogue counts (0: every pair)
};

// The first nine under the names and with the meaning other analyzers give
// them; then the pairs an IN engineer asks about.
constexpr Category kCategories[] = {
    {"TCAP_Session", Rule::Session},
    {"InitialDP/Continue", Rule::Pair, 0, {31, -1}},
    {"Slice1_ACR/ACH", Rule::Pair, 36, {35, -1}, false, 1},
    {"Slice2_ACR/ACH", Rule::Pair, 36, {35, -1}, false, 2},
    {"Slice3_ACR/ACH", Rule::Pair, 36, {35, -1}, false, 3},
    {"EvtRepBSCM/Release", Rule::Pair, 24, {22, -1}, true},
    {"InitialDP/ContinueGPRS", Rule::Pair, 78, {75, -1}},
    {"EvtRepGPRS/ContinueGPRS", Rule::Pair, 80, {75, -1}, true},
    {"InitialDP/ContinueSMS", Rule::Pair, 60, {65, -1}},
    {"InitialDP/FirstAnswer", Rule::AnyAnswer, 0},
    {"InitialDPSMS/FirstAnswer", Rule::AnyAnswer, 60},
    {"InitialDPGPRS/FirstAnswer", Rule::AnyAnswer, 78},
    {"RRBE/EvtRepBSCM", Rule::Pair, 23, {24, -1}},
    {"PromptAndCollect/Result", Rule::ResultOf, 48},
    {"ActivityTest/Result", Rule::ResultOf, 55},
    {"ActivityTestGPRS/Result", Rule::ResultOf, 70},
};

constexpr const char *kOutcomes[] = {"open", "ended", "aborted"};

bool isInvokeOf(const Component &c, int32_t code) { return c.kind == Component::Kind::Invoke && c.code == code; }

void measure(const Category &cat, const Dialogue &d, std::vector<int64_t> &out) {
    const auto &msgs = d.messages;
    switch (cat.rule) {
    case Rule::Session:
        if (d.beginSeen && !msgs.empty() &&
            (d.closedBy == ClosedBy::End || d.closedBy == ClosedBy::Abort || d.closedBy == ClosedBy::Prearranged))
            out.push_back(msgs.back().facts.timeNs() - msgs.front().facts.timeNs());
        return;
    case Rule::Pair: {
        bool waiting = false, from = false;
        int64_t t0 = 0;
        unsigned done = 0;
        for (const DialogueMessage &m : msgs)
            for (const Component &c : m.facts.components) {
                if (isInvokeOf(c, cat.start)) {
                    if (!waiting || cat.restart) {
                        waiting = true;
                        from = m.forward;
                        t0 = m.facts.timeNs();
                    }
                } else if (waiting && m.forward != from && (isInvokeOf(c, cat.ends[0]) || isInvokeOf(c, cat.ends[1]))) {
                    waiting = false;
                    ++done;
                    if (cat.slice == 0 || done == cat.slice)
                        out.push_back(m.facts.timeNs() - t0);
                }
            }
        return;
    }
    case Rule::AnyAnswer:
        for (size_t i = 0; i < msgs.size(); ++i) {
            const auto &cs = msgs[i].facts.components;
            if (std::none_of(cs.begin(), cs.end(), [&](const Component &c) { return isInvokeOf(c, cat.start); }))
                continue;
            for (size_t k = i + 1; k < msgs.size(); ++k)
                if (msgs[k].forward != msgs[i].forward) {
                    out.push_back(msgs[k].facts.timeNs() - msgs[i].facts.timeNs());
                    break;
                }
            return;
        }
        return;
    case Rule::ResultOf: {
        std::unordered_map<int32_t, const DialogueMessage *> waiting; // by invoke id
        for (const DialogueMessage &m : msgs)
            for (const Component &c : m.facts.components) {
                if (!c.hasInvokeId)
                    continue;
                if (isInvokeOf(c, cat.start)) {
                    waiting[c.invokeId] = &m;
                } else if (c.kind == Component::Kind::Result || c.kind == Component::Kind::Error) {
                    const auto it = waiting.find(c.invokeId);
                    if (it != waiting.end() && it->second->forward != m.forward) {
                        out.push_back(m.facts.timeNs() - it->second->facts.timeNs());
                        waiting.erase(it);
                    }
                }
            }
        return;
    }
    }
}

void count(std::map<int64_t, std::pair<std::string, uint64_t>> &counts, int64_t value, const std::string &name) {
    auto &slot = counts[value];
    if (slot.first.empty())
        slot.first = name;
    ++slot.second;
}

ordered_json summaryJson(const char *category, const TimeSummary &s) {
    return ordered_json{{"category", category}, {"count", s.count}, {"min", s.min}, {"max", s.max},
                        {"mean", s.mean},       {"p50", s.p50},     {"p90", s.p90}, {"p99", s.p99}};
}

void summaryText(std::ostream &os, const char *category, const TimeSummary &s) {
    char line[200];
    std::snprintf(line, sizeof line, "%-28s %8llu %11.6f %11.6f %11.6f %11.6f %11.6f %11.6f\n", category,
                  static_cast<unsigned long long>(s.count), s.min, s.max, s.mean, s.p50, s.p90, s.p99);
    os << line;
}

} // namespace

TimeSummary summarizeTimes(std::vector<int64_t> ns) {
    TimeSummary s;
    if (ns.empty())
        return s;
    std::sort(ns.begin(), ns.end());
    s.count = ns.size();
    long double sum = 0;
    for (int64_t v : ns)
        sum += v;
    // Nearest rank: the smallest value with at least p% of the values at or below it.
    const auto rank = [&](unsigned p) {
        const size_t r = (size_t(p) * ns.size() + 99) / 100;
        return double(ns[r == 0 ? 0 : r - 1]) / 1e9;
    };
    s.min = double(ns.front()) / 1e9;
    s.max = double(ns.back()) / 1e9;
    s.mean = double(sum / ns.size() / 1e9);
    s.p50 = rank(50);
    s.p90 = rank(90);
    s.p99 = rank(99);
    return s;
}

ResponseTimes::ResponseTimes() : pairs_(std::size(kCategories)), durations_(std::size(kOutcomes)) {}

const std::vector<int64_t> *ResponseTimes::samples(const std::string &category) const {
    for (size_t i = 0; i < std::size(kCategories); ++i)
        if (category == kCategories[i].name)
            return &pairs_[i];
    return nullptr;
}

void ResponseTimes::add(const Dialogue &d) {
    ++dialogues_;
    for (size_t i = 0; i < std::size(kCategories); ++i)
        measure(kCategories[i], d, pairs_[i]);
    if (!d.messages.empty())
        durations_[size_t(d.outcome)].push_back(d.messages.back().facts.timeNs() - d.messages.front().facts.timeNs());
    for (const DialogueMessage &m : d.messages) {
        const dialogues::MessageFacts &f = m.facts;
        for (const Component &c : f.components) {
            if (c.kind == Component::Kind::Invoke)
                count(operations_, c.code, codeName(dialogues::kOperations, c.code));
            else if (c.kind == Component::Kind::Error)
                count(errors_, c.code, codeName(dialogues::kErrors, c.code));
        }
        for (const dialogues::ValueIn &v : f.causes)
            if (v.operation == 22)
                count(releaseCauses_, v.value, v.name);
        for (const dialogues::ValueIn &v : f.eventTypes)
            if (v.operation == 24)
                count(eventTypes_, v.value, v.name);
        if (f.hasServiceKey)
            count(serviceKeys_, f.serviceKey, "");
    }
}

void ResponseTimes::write(std::ostream &os, bool json) const {
    const std::pair<const char *, const Counts *> groups[] = {{"operations", &operations_},
                                                               {"errors", &errors_},
                                                               {"releaseCauses", &releaseCauses_},
                                                               {"eventTypes", &eventTypes_},
                                                               {"serviceKeys", &serviceKeys_}};
    if (json) {
        ordered_json srt = ordered_json::array(), durations = ordered_json::array();
        for (size_t i = 0; i < std::size(kCategories); ++i)
            srt.push_back(summaryJson(kCategories[i].name, summarizeTimes(pairs_[i])));
        for (size_t i = 0; i < std::size(kOutcomes); ++i)
            durations.push_back(summaryJson(kOutcomes[i], summarizeTimes(durations_[i])));
        ordered_json j{{"srt", std::move(srt)}, {"dialogues", dialogues_}, {"durations", std::move(durations)}};
        for (const auto &[name, counts] : groups) {
            ordered_json list = ordered_json::array();
            for (const auto &[value, entry] : *counts)
                list.push_back(ordered_json{{"code", value},
                                            {"name", entry.first.empty() ? ordered_json(nullptr) : ordered_json(entry.first)},
                                            {"count", entry.second}});
            j[name] = std::move(list);
        }
        os << j.dump(-1, ' ', false, nlohmann::json::error_handler_t::replace) << '\n';
        return;
    }
    char head[200];
    std::snprintf(head, sizeof head, "%-28s %8s %11s %11s %11s %11s %11s %11s\n", "response times (s)", "count",
                  "min", "max", "mean", "p50", "p90", "p99");
    os << head;
    for (size_t i = 0; i < std::size(kCategories); ++i)
        summaryText(os, kCategories[i].name, summarizeTimes(pairs_[i]));
    os << "\ndialogue durations (s), " << dialogues_ << " dialogues\n";
    for (size_t i = 0; i < std::size(kOutcomes); ++i)
        summaryText(os, kOutcomes[i], summarizeTimes(durations_[i]));
    static const char *const titles[] = {"operations", "errors", "release causes", "event types", "service keys"};
    for (size_t g = 0; g < std::size(groups); ++g) {
        os << '\n' << titles[g] << ":\n";
        for (const auto &[value, entry] : *groups[g].second) {
            os << "  " << value;
            if (!entry.first.empty())
                os << ' ' << entry.first;
            os << ": " << entry.second << '\n';
        }
    }
}

} // namespace dpxdecode::views
