#include "views/dialogue_view.h"

#include <nlohmann/json.hpp>

#include <ostream>

#include "views/output.h"

namespace dpxdecode::views {
namespace {

using dialogues::Component;
using dialogues::Dialogue;
using dialogues::DialogueMessage;
using dialogues::MessageFacts;
using nlohmann::ordered_json;

std::string timeText(const MessageFacts &m) { return formatTime(m.seconds, m.nanoseconds); }

std::string durationText(int64_t ns) {
    const int64_t s = ns / 1000000000, frac = ns % 1000000000;
    return formatTime(s, uint32_t(frac)) + " s";
}

int64_t durationNs(const Dialogue &d) {
    return d.messages.empty() ? 0 : d.messages.back().facts.timeNs() - d.messages.front().facts.timeNs();
}

ordered_json orNull(const std::string &s) { return s.empty() ? ordered_json(nullptr) : ordered_json(s); }

ordered_json endJson(const dialogues::End &e, const std::string &tid) {
    return ordered_json{{"pc", e.hasPc ? ordered_json(e.pc) : ordered_json(nullptr)},
                        {"ssn", e.hasSsn ? ordered_json(e.ssn) : ordered_json(nullptr)},
                        {"tid", orNull(tid)}};
}

} // namespace

std::string componentLabel(const Component &c) {
    static const char *const prefixes[] = {"", "result ", "error ", "reject "};
    const std::string what = !c.name.empty() ? c.name
                             : c.hasInvokeId ? "invoke id " + std::to_string(c.invokeId)
                                             : std::string("?");
    return prefixes[size_t(c.kind)] + what;
}

std::string endName(const dialogues::End &e) {
    std::string s;
    if (e.hasPc)
        s = "pc " + std::to_string(e.pc);
    if (e.hasSsn)
        s += (s.empty() ? "ssn " : " ssn ") + std::to_string(e.ssn);
    return s.empty() ? "-" : s;
}

void writeDialogueText(std::ostream &os, const Dialogue &d) {
    const bool capture = !d.messages.empty() && d.messages.front().facts.hasOrigin;
    os << "dialogue " << d.id << ": " << outcomeName(d.outcome) << " (" << closedByName(d.closedBy) << ')';
    if (!d.abortCause.empty())
        os << ", " << d.abortCause;
    os << ", " << d.messages.size() + d.droppedMessages << " messages";
    if (capture && !d.messages.empty()) {
        const MessageFacts &a = d.messages.front().facts, &b = d.messages.back().facts;
        os << ", frames " << a.frame << '-' << b.frame << ", " << timeText(a) << " to " << timeText(b) << " ("
           << durationText(durationNs(d)) << ')';
    }
    if (!d.beginSeen)
        os << ", Begin not seen";
    os << '\n';
    os << "  initiator " << endName(d.initiator) << " tid " << (d.initiatorTid.empty() ? "-" : d.initiatorTid)
       << ", responder " << endName(d.responder) << " tid " << (d.responderTid.empty() ? "-" : d.responderTid)
       << '\n';
    if (!d.applicationContext.empty()) {
        os << "  ";
        if (d.capVersion != 0)
            os << "CAP v" << d.capVersion << ", ";
        os << d.applicationContext;
        if (!d.contextName.empty())
            os << " (" << d.contextName << ')';
        os << '\n';
    }
    if (!d.imsi.empty() || !d.called.empty() || !d.calling.empty() || d.hasServiceKey) {
        os << "  imsi " << (d.imsi.empty() ? "-" : d.imsi) << ", called " << (d.called.empty() ? "-" : d.called)
           << ", calling " << (d.calling.empty() ? "-" : d.calling) << ", service key ";
        if (d.hasServiceKey)
            os << d.serviceKey;
        else
            os << '-';
        os << '\n';
    }
    for (const DialogueMessage &m : d.messages) {
        const MessageFacts &f = m.facts;
        os << (m.matched ? "* " : "  ");
        if (f.hasOrigin)
            os << "frame " << f.frame << ' ' << timeText(f);
        else
            os << "message " << f.index;
        os << (m.forward ? " -> " : " <- ") << messageTypeName(f.type);
        if (!f.otid.empty())
            os << " otid=" << f.otid;
        if (!f.dtid.empty())
            os << " dtid=" << f.dtid;
        for (const Component &c : f.components)
            os << " | " << componentLabel(c);
        os << '\n';
    }
    if (d.droppedMessages != 0)
        os << "  (" << d.droppedMessages << " more messages not kept)\n";
    os << '\n';
}

void writeDialogueJson(std::ostream &os, const Dialogue &d) {
    ordered_json frames = ordered_json::array(), messages = ordered_json::array();
    for (const DialogueMessage &m : d.messages) {
        const MessageFacts &f = m.facts;
        ordered_json ops = ordered_json::array();
        for (const Component &c : f.components)
            ops.push_back(componentLabel(c));
        if (f.hasOrigin)
            frames.push_back(f.frame);
        messages.push_back(ordered_json{
            {"frame", f.hasOrigin ? ordered_json(f.frame) : ordered_json(nullptr)},
            {"index", f.index},
            {"time", f.hasOrigin ? ordered_json(f.time()) : ordered_json(nullptr)},
            {"direction", m.forward ? "forward" : "backward"},
            {"type", messageTypeName(f.type)},
            {"otid", orNull(f.otid)},
            {"dtid", orNull(f.dtid)},
            {"operations", std::move(ops)},
            {"matched", m.matched}});
    }
    const bool timed = !d.messages.empty() && d.messages.front().facts.hasOrigin;
    ordered_json j{
        {"dialogue", d.id},
        {"outcome", outcomeName(d.outcome)},
        {"closedBy", closedByName(d.closedBy)},
        {"abortCause", orNull(d.abortCause)},
        {"beginSeen", d.beginSeen},
        {"frames", std::move(frames)},
        {"start", timed ? ordered_json(d.messages.front().facts.time()) : ordered_json(nullptr)},
        {"end", timed ? ordered_json(d.messages.back().facts.time()) : ordered_json(nullptr)},
        {"duration", timed ? ordered_json(double(durationNs(d)) / 1e9) : ordered_json(nullptr)},
        {"initiator", endJson(d.initiator, d.initiatorTid)},
        {"responder", endJson(d.responder, d.responderTid)},
        {"capVersion", d.capVersion != 0 ? ordered_json(d.capVersion) : ordered_json(nullptr)},
        {"applicationContext", orNull(d.applicationContext)},
        {"imsi", orNull(d.imsi)},
        {"called", orNull(d.called)},
        {"calling", orNull(d.calling)},
        {"serviceKey", d.hasServiceKey ? ordered_json(d.serviceKey) : ordered_json(nullptr)},
        {"messages", std::move(messages)},
        {"droppedMessages", d.droppedMessages}};
    os << j.dump(-1, ' ', false, nlohmann::json::error_handler_t::replace) << '\n';
}

} // namespace dpxdecode::views
