#include "dialogues/tracker.h"

#include <algorithm>

namespace dpxdecode::dialogues {
namespace {

// Operations after which the dialogue has nothing left to do: a Continue
// carrying one and then silence is a pre-arranged end.
bool releases(const MessageFacts &m) {
    if (m.type != MessageType::Continue)
        return false;
    for (const Component &c : m.components)
        if (c.kind == Component::Kind::Invoke && (c.code == 22 || c.code == 66 || c.code == 79))
            return true;
    return false;
}

template <typename T>
void keepFirst(T &slot, const T &value) {
    if (slot.empty())
        slot = value;
}

} // namespace

const char *outcomeName(Outcome o) {
    static const char *const names[] = {"open", "ended", "aborted"};
    return names[size_t(o)];
}

const char *closedByName(ClosedBy c) {
    static const char *const names[] = {"end",     "abort",      "prearranged", "unidirectional",
                                        "timeout", "captureEnd", "evicted",     "undecoded"};
    return names[size_t(c)];
}

size_t DialogueTracker::KeyHash::operator()(const Key &k) const {
    size_t h = std::hash<std::string>()(k.tid);
    for (const End &e : {k.owner, k.peer}) {
        const uint64_t v = (uint64_t(e.pc) << 16) | (uint64_t(e.ssn) << 2) | (e.hasPc ? 2u : 0u) | (e.hasSsn ? 1u : 0u);
        h ^= std::hash<uint64_t>()(v) + 0x9e3779b97f4a7c15ull + (h << 6) + (h >> 2);
    }
    return h;
}

DialogueTracker::Slot DialogueTracker::find(const End &owner, const End &peer, const std::string &tid) {
    if (tid.empty())
        return open_.end();
    const auto it = index_.find(Key{owner, peer, tid});
    return it == index_.end() ? open_.end() : it->second;
}

void DialogueTracker::bind(Slot d, const End &owner, const End &peer, const std::string &tid) {
    if (!tid.empty())
        index_[Key{owner, peer, tid}] = d;
}

DialogueTracker::Slot DialogueTracker::open(const MessageFacts &m, bool beginSeen) {
    if (open_.size() >= limits_.maxOpen && !open_.empty())
        close(open_.begin(), Outcome::Open, ClosedBy::Evicted);
    Dialogue d;
    d.id = nextId_++;
    d.beginSeen = beginSeen;
    // Without its Begin, the dialogue's initiator is taken to be the end
    // that allocated the destination id of the first message seen.
    d.initiator = beginSeen ? m.from : m.to;
    d.responder = beginSeen ? m.to : m.from;
    open_.push_back(std::move(d));
    return std::prev(open_.end());
}

void DialogueTracker::join(Slot d, const MessageFacts &m, bool matched, bool forward) {
    d->lastNs = m.timeNs();
    d->matched |= matched;
    keepFirst(d->imsi, m.imsi);
    keepFirst(d->called, m.called);
    keepFirst(d->calling, m.calling);
    if (!d->hasServiceKey && m.hasServiceKey) {
        d->hasServiceKey = true;
        d->serviceKey = m.serviceKey;
    }
    if (d->applicationContext.empty() && !m.applicationContext.empty()) {
        d->applicationContext = m.applicationContext;
        d->capVersion = m.capVersion;
        d->contextName = m.contextName;
    }
    if (d->messages.size() < limits_.maxMessages)
        d->messages.push_back(DialogueMessage{m, forward, matched});
    else
        ++d->droppedMessages;
    open_.splice(open_.end(), open_, d); // most recently active last
}

void DialogueTracker::close(Slot d, Outcome outcome, ClosedBy by) {
    d->outcome = outcome;
    d->closedBy = by;
    for (const Key &k : {Key{d->initiator, d->responder, d->initiatorTid}, Key{d->responder, d->initiator, d->responderTid}}) {
        const auto it = index_.find(k);
        if (it != index_.end() && it->second == d)
            index_.erase(it);
    }
    sink_(*d);
    open_.erase(d);
}

void DialogueTracker::expire(int64_t nowNs) {
    while (!open_.empty() && nowNs - open_.front().lastNs > limits_.timeoutNs) {
        const Slot d = open_.begin();
        const bool prearranged = !d->messages.empty() && releases(d->messages.back().facts);
        close(d, prearranged ? Outcome::Ended : Outcome::Open,
              prearranged ? ClosedBy::Prearranged : ClosedBy::Timeout);
    }
}

void DialogueTracker::add(const MessageFacts &m, bool matched) {
    if (m.hasOrigin) {
        const int64_t t = m.timeNs();
        if (!haveTime_ || t > nowNs_)
            nowNs_ = t;
        haveTime_ = true;
        expire(nowNs_);
    }
    switch (m.type) {
    case MessageType::Begin: {
        // The same id from the same end again: the earlier dialogue ended
        // without a message (pre-arranged) and its id was given out anew.
        const Slot old = find(m.from, m.to, m.otid);
        if (old != open_.end())
            close(old, Outcome::Ended, ClosedBy::Prearranged);
        const Slot d = open(m, true);
        d->initiatorTid = m.otid;
        bind(d, m.from, m.to, m.otid);
        join(d, m, matched, true);
        return;
    }
    case MessageType::Continue:
    case MessageType::End:
    case MessageType::Abort: {
        Slot d = find(m.to, m.from, m.dtid);
        bool forward = false;
        if (d != open_.end()) {
            // The receiver allocated the destination id: it is the initiator
            // when that id is the initiator's.
            forward = !(m.to == d->initiator && m.dtid == d->initiatorTid);
        } else if ((d = find(m.from, m.to, m.otid)) != open_.end()) {
            forward = m.from == d->initiator && m.otid == d->initiatorTid;
        } else {
            d = open(m, false);
            d->initiatorTid = m.dtid;
            bind(d, m.to, m.from, m.dtid);
        }
        if (m.type == MessageType::Continue && !m.otid.empty()) {
            std::string &own = forward ? d->initiatorTid : d->responderTid;
            if (own.empty()) {
                own = m.otid;
                bind(d, m.from, m.to, m.otid);
            }
        }
        join(d, m, matched, forward);
        if (m.type == MessageType::End)
            close(d, Outcome::Ended, ClosedBy::End);
        else if (m.type == MessageType::Abort) {
            d->abortCause = m.abortCause;
            close(d, Outcome::Aborted, ClosedBy::Abort);
        }
        return;
    }
    case MessageType::Unidirectional:
    case MessageType::Unknown: {
        const Slot d = open(m, m.type == MessageType::Unidirectional);
        join(d, m, matched, true);
        if (m.type == MessageType::Unidirectional)
            close(d, Outcome::Ended, ClosedBy::Unidirectional);
        else
            close(d, Outcome::Open, ClosedBy::Undecoded);
        return;
    }
    }
}

void DialogueTracker::finish() {
    // Oldest first: by the order the dialogues were opened.
    std::vector<Slot> rest;
    for (Slot d = open_.begin(); d != open_.end(); ++d)
        rest.push_back(d);
    std::sort(rest.begin(), rest.end(), [](Slot a, Slot b) { return a->id < b->id; });
    for (Slot d : rest)
        close(d, Outcome::Open, ClosedBy::CaptureEnd);
}

} // namespace dpxdecode::dialogues
