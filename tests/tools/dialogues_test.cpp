// Dialogue grouping and the message filters on hand-made message facts:
// every way a dialogue starts and ends, ids reused between other ends, the
// time-out, the limit on open dialogues; filter expressions and their
// errors.

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "dialogues/tracker.h"
#include "filter/match.h"

namespace {

using namespace dpxdecode::dialogues;
using dpxdecode::MessageFilter;

End end(uint32_t pc) { return End{true, pc, true, 146}; }

struct Msg {
    MessageType type;
    const char *otid, *dtid;
    uint32_t fromPc, toPc;
    int64_t ms;
    std::vector<int32_t> ops = {};
};

MessageFacts facts(const Msg &m, uint64_t index) {
    MessageFacts f;
    f.index = index;
    f.hasOrigin = true;
    f.frame = index + 1;
    f.seconds = 1767225600 + m.ms / 1000;
    f.nanoseconds = uint32_t(m.ms % 1000) * 1000000u;
    f.from = end(m.fromPc);
    f.to = end(m.toPc);
    f.type = m.type;
    f.otid = m.otid;
    f.dtid = m.dtid;
    for (int32_t op : m.ops)
        f.components.push_back(Component{Component::Kind::Invoke, true, 1, op, {}});
    return f;
}

// What the tracker wrote out, one line per dialogue:
// "outcome/closedBy frames direction-letters" (B: Begin not seen).
std::vector<std::string> track(const std::vector<Msg> &msgs, TrackerLimits limits = {}) {
    std::vector<std::string> out;
    DialogueTracker t(limits, [&](const Dialogue &d) {
        std::string s = std::string(outcomeName(d.outcome)) + '/' + closedByName(d.closedBy) + ' ';
        for (const DialogueMessage &m : d.messages)
            s += std::to_string(m.facts.frame) + (m.forward ? '>' : '<');
        if (!d.beginSeen)
            s += " B";
        out.push_back(s);
    });
    for (size_t i = 0; i < msgs.size(); ++i)
        t.add(facts(msgs[i], i), false);
    t.finish();
    return out;
}

constexpr auto B = MessageType::Begin, C = MessageType::Continue, E = MessageType::End, A = MessageType::Abort;

TEST(Dialogues, EveryWayADialogueStartsAndEnds) {
    struct Case {
        const char *what;
        std::vector<Msg> msgs;
        std::vector<std::string> want;
    };
    const Case cases[] = {
        {"ended", {{B, "0a", "", 1, 2, 0}, {C, "0b", "0a", 2, 1, 5}, {C, "0a", "0b", 1, 2, 9}, {E, "", "0a", 2, 1, 12}},
         {"ended/end 1>2<3>4<"}},
        {"aborted by the responder", {{B, "0a", "", 1, 2, 0}, {A, "", "0a", 2, 1, 5}}, {"aborted/abort 1>2<"}},
        {"aborted by the initiator",
         {{B, "0a", "", 1, 2, 0}, {C, "0b", "0a", 2, 1, 5}, {A, "", "0b", 1, 2, 7}},
         {"aborted/abort 1>2<3>"}},
        {"ended by the initiator", {{B, "0a", "", 1, 2, 0}, {C, "0b", "0a", 2, 1, 5}, {E, "", "0b", 1, 2, 7}},
         {"ended/end 1>2<3>"}},
        {"pre-arranged end: the id given out again",
         {{B, "0a", "", 1, 2, 0}, {C, "0b", "0a", 2, 1, 5}, {B, "0a", "", 1, 2, 9}},
         {"ended/prearranged 1>2<", "open/captureEnd 3>"}},
        {"pre-arranged end: silence after a release",
         {{B, "0a", "", 1, 2, 0}, {C, "0b", "0a", 2, 1, 5, {22}}, {B, "77", "", 5, 6, 70000}},
         {"ended/prearranged 1>2<", "open/captureEnd 3>"}},
        {"silent past the time-out",
         {{B, "0a", "", 1, 2, 0}, {C, "0b", "0a", 2, 1, 5, {31}}, {B, "77", "", 5, 6, 60006}},
         {"open/timeout 1>2<", "open/captureEnd 3>"}},
        {"not yet silent for the time-out", {{B, "0a", "", 1, 2, 0}, {C, "0b", "0a", 2, 1, 5}, {C, "0a", "0b", 1, 2, 60004}},
         {"open/captureEnd 1>2<3>"}},
        {"Begin outside the input",
         {{C, "0b", "0a", 2, 1, 0}, {C, "0a", "0b", 1, 2, 3}, {E, "", "0a", 2, 1, 4}},
         {"ended/end 1<2>3< B"}},
        {"End alone", {{E, "", "0a", 2, 1, 0}}, {"ended/end 1< B"}},
        {"the same ids between other ends, interleaved",
         {{B, "0a", "", 1, 2, 0}, {B, "0a", "", 3, 2, 1}, {C, "0b", "0a", 2, 3, 2}, {C, "0b", "0a", 2, 1, 3},
          {C, "0a", "0b", 3, 2, 4}, {E, "", "0a", 2, 1, 5}, {A, "", "0b", 3, 2, 6}},
         {"ended/end 1>4<6<", "aborted/abort 2>3<5>7>"}},
    };
    for (const Case &c : cases)
        EXPECT_EQ(track(c.msgs), c.want) << c.what;
}

TEST(Dialogues, OpenDialoguesAreBounded) {
    TrackerLimits limits;
    limits.maxOpen = 100;
    limits.maxMessages = 2;
    size_t written = 0, evicted = 0, kept = 0;
    uint64_t dropped = 0;
    DialogueTracker t(limits, [&](const Dialogue &d) {
        ++written;
        evicted += d.closedBy == ClosedBy::Evicted;
        kept += d.messages.size();
        dropped += d.droppedMessages;
    });
    for (uint32_t i = 0; i < 1000; ++i) {
        const std::string tid = std::to_string(i);
        t.add(facts({B, tid.c_str(), "", 1, 2, i}, i), false);
        ASSERT_LE(t.openCount(), 100u);
    }
    // One dialogue of five messages keeps two and counts the rest.
    for (uint32_t i = 0; i < 4; ++i)
        t.add(facts({C, "x", "999", 2, 1, 1000 + i}, 1000 + i), false);
    t.finish();
    EXPECT_EQ(written, 1000u);
    EXPECT_EQ(evicted, 900u);
    EXPECT_EQ(kept, 1001u);
    EXPECT_EQ(dropped, 3u);
}

TEST(Filters, ExpressionsSelectByKeyFactsAndLabels) {
    MessageFacts f = facts({C, "10000001", "80000001", 100, 200, 0, {0, 23}}, 0);
    f.imsi = "262011234567890";
    f.called = "4912345";
    f.causes.push_back(ValueIn{17, 22, "User Busy"});
    f.hasServiceKey = true;
    f.serviceKey = 1256;
    f.components.push_back(Component{Component::Kind::Error, true, 2, 7, "Missing Parameter"});
    dpxdecode::MdOut md;
    md.fields.push_back(dpxdecode::DecodedOut{1611, "Service Key", "  Service Key=1256", 0, {}});

    const std::pair<std::vector<std::string>, bool> cases[] = {
        {{"imsi=262011234567890"}, true},
        {{"imsi~26201"}, true},
        {{"imsi=26201"}, false},
        {{"called~49", "calling~49"}, false}, // no calling number: all must hold
        {{"operation=initialDP"}, true},
        {{"operation=Initial DP", "op=23"}, true},
        {{"operation=connect"}, false},
        {{"op~initialDP"}, true},
        {{"error=missingParameter"}, true},
        {{"error=7"}, true},
        {{"cause=17", "serviceKey=1256"}, true},
        {{"tid=80000001"}, true},
        {{"otid=80000001"}, false},
        {{"pc=200", "ssn=146"}, true},
        {{"opc=200"}, false},
        {{"type=continue"}, true},
        {{"Service Key=1256"}, true},
        {{"service key~12"}, true},
        {{"Service Key=7"}, false},
    };
    for (const auto &[exprs, want] : cases) {
        MessageFilter filter;
        std::string error;
        ASSERT_TRUE(filter.parse(exprs, error)) << exprs[0] << ": " << error;
        EXPECT_EQ(filter.matches(f, &md), want) << exprs[0];
    }
}

TEST(Filters, WhatNamesNothingKnownIsRefused) {
    for (const char *bad : {"imsi", "=5", "colour=blue", "operation=frobnicate", "error=noSuchError",
                            "cause=abc", "imsi=12x4", "type=hello", "operation=300"}) {
        MessageFilter filter;
        std::string error;
        EXPECT_FALSE(filter.parse({bad}, error)) << bad;
        EXPECT_NE(error.find("--match"), std::string::npos) << bad;
    }
}

} // namespace
