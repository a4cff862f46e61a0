// TCAP messages joined into dialogues.  A Begin opens a dialogue, keyed by
// its originating transaction id and both ends (the one that allocated the
// id first); Continue, End and Abort find it by their transaction ids at
// the end that allocated each (the destination id at the receiver, the
// originating id at the sender), so the same ids used at once between other
// ends stay apart.
// End and Abort close a dialogue; so does a pre-arranged end, recognised
// when a new Begin between the same ends reuses the originating id, or when
// the dialogue falls silent for the time-out after a Continue that releases
// the call, SMS or GPRS session.  A dialogue silent longer than the time-out
// (capture time) is written out as open.  Every closed dialogue goes to the
// sink at once and is forgotten: memory holds only the open ones.
#pragma once

#include <cstdint>
#include <functional>
#include <list>
#include <string>
#include <unordered_map>
#include <vector>

#include "dialogues/message_facts.h"

namespace dpxdecode::dialogues {

enum class Outcome : uint8_t { Open, Ended, Aborted };
const char *outcomeName(Outcome o);

// What closed the dialogue (or why it is written out while open).
enum class ClosedBy : uint8_t {
    End,            // an End message
    Abort,          // an Abort message
    Prearranged,    // a pre-arranged end
    Unidirectional, // a Unidirectional message: a dialogue of its own
    Timeout,        // silent longer than the time-out: open
    CaptureEnd,     // still open when the input ended
    Evicted,        // pushed out by the limit on open dialogues: open
    Undecoded,      // no message type could be read: a dialogue of its own
};
const char *closedByName(ClosedBy c);

struct DialogueMessage {
    MessageFacts facts;
    bool forward = true;  // sent by the dialogue's initiator
    bool matched = false; // selected by the filters
};

struct Dialogue {
    uint64_t id = 0; // 1, 2, ... in the order their first messages arrived
    End initiator, responder;
    std::string initiatorTid, responderTid;
    bool beginSeen = false; // false: the Begin was not in the input
    Outcome outcome = Outcome::Open;
    ClosedBy closedBy = ClosedBy::CaptureEnd;
    std::string abortCause;
    std::string imsi, called, calling;
    bool hasServiceKey = false;
    uint32_t serviceKey = 0;
    int capVersion = 0;
    std::string applicationContext, contextName;
    std::vector<DialogueMessage> messages;
    uint64_t droppedMessages = 0; // beyond the per-dialogue limit: counted, not kept
    bool matched = false;         // some message matched the filters
    int64_t lastNs = 0;           // time of the last message
};

struct TrackerLimits {
    int64_t timeoutNs = 60LL * 1000000000LL; // capture time
    size_t maxOpen = 1000000;                // open dialogues held at once
    size_t maxMessages = 10000;              // messages kept per dialogue
};

class DialogueTracker {
public:
    using Sink = std::function<void(const Dialogue &)>;
    DialogueTracker(const TrackerLimits &limits, Sink sink) : limits_(limits), sink_(std::move(sink)) {}

    // Joins one message to its dialogue (opening one when needed) and writes
    // out what it closes and what has timed out by its time.
    void add(const MessageFacts &m, bool matched);
    // Writes out every dialogue still open, oldest first.
    void finish();

    size_t openCount() const { return open_.size(); }

private:
    // A transaction id, the end that allocated it and the other end.
    struct Key {
        End owner, peer;
        std::string tid;
        bool operator==(const Key &o) const { return owner == o.owner && peer == o.peer && tid == o.tid; }
    };
    struct KeyHash {
        size_t operator()(const Key &k) const;
    };
    using Slot = std::list<Dialogue>::iterator;

    Slot find(const End &owner, const End &peer, const std::string &tid);
    Slot open(const MessageFacts &m, bool beginSeen);
    void join(Slot d, const MessageFacts &m, bool matched, bool forward);
    void bind(Slot d, const End &owner, const End &peer, const std::string &tid);
    void close(Slot d, Outcome outcome, ClosedBy by);
    void expire(int64_t nowNs);

    TrackerLimits limits_;
    Sink sink_;
    std::list<Dialogue> open_; // least recently active first
    std::unordered_map<Key, Slot, KeyHash> index_;
    uint64_t nextId_ = 1;
    bool haveTime_ = false;
    int64_t nowNs_ = 0;
};

} // namespace dpxdecode::dialogues
