#include "summary.h"

#include <nlohmann/json.hpp>

#include <charconv>
#include <ostream>

#include "field_kinds.h"
#include "output.h"

namespace dpxdecode {
namespace {

// Decoded-field ids of the message, dialogue and component level.
constexpr uint32_t kFieldMessageType = 3604;
constexpr uint32_t kFieldOtid = 3653;
constexpr uint32_t kFieldDtid = 3656;
constexpr uint32_t kFieldAbortCause = 3659;
constexpr uint32_t kFieldContextCap = 3797;     // application context arc: 0, or 20 to 23
constexpr uint32_t kFieldContextVersion = 3800; // its last arc after 0.4.0.0.1.0.5x
constexpr uint32_t kFieldInvoke = 3660;
constexpr uint32_t kFieldResultLast = 3669;
constexpr uint32_t kFieldError = 3685;
constexpr uint32_t kFieldReject = 3694;
constexpr uint32_t kFieldInvokeId = 3705;
constexpr uint32_t kFieldOperation = 1066;
constexpr uint32_t kFieldResultOperation = 1068;
constexpr uint32_t kFieldErrorCode = 1070;
constexpr uint32_t kFieldServiceKey = 1611;
constexpr uint32_t kFieldProblems[] = {3701, 3710, 3712, 3714, 3716}; // problem type, then problem

// Key entries of the values a summary names.
constexpr int kKeyCalled = 10;
constexpr int kKeyCalling = 15;
constexpr int kKeyImsi = 17;
constexpr int kKeyCause = 8;
constexpr int kKeyEvent = 13;

bool isProblem(uint32_t id) {
    for (const uint32_t p : kFieldProblems)
        if (p == id)
            return true;
    return false;
}

void assign(std::string &to, const DecodedOut &f) { to.assign(fieldValue(f)); }

uint32_t spanValue(const DecodedOut &f) { return f.spans.empty() ? 0 : f.spans[0].value; }

// The CAP version an application context names.
const char *capVersion(uint32_t capArc, uint32_t versionArc) {
    switch (capArc) {
    case 0:
        return versionArc == 0 ? "CAP v1" : versionArc == 1 ? "CAP v2" : "";
    case 20:
    case 21:
        return "CAP v3";
    case 22:
    case 23:
        return "CAP v4";
    default:
        return "";
    }
}

void appendGt(std::string &out, const capture::GlobalTitle &gt) {
    if (gt.size == 0)
        out += '-';
    else
        out.append(gt.digits, gt.size);
}

nlohmann::ordered_json optionalText(const std::string &s) {
    return s.empty() ? nlohmann::ordered_json(nullptr) : nlohmann::ordered_json(s);
}

nlohmann::ordered_json gtJson(const capture::GlobalTitle &gt) {
    return gt.size == 0 ? nlohmann::ordered_json(nullptr) : nlohmann::ordered_json(std::string(gt.digits, gt.size));
}

} // namespace

const char *componentKindName(ComponentSummary::Kind kind) {
    static const char *const kinds[] = {"invoke", "result", "error", "reject"};
    return kinds[size_t(kind)];
}

void summarize(const MdOut &md, MessageSummary &out) {
    out.type.clear();
    out.otid.clear();
    out.dtid.clear();
    out.capVersion.clear();
    out.abortCause.clear();
    out.errorFlags = md.errorFlags;
    out.componentCount = 0;
    ComponentSummary *current = nullptr;
    uint32_t capArc = UINT32_MAX;
    const auto start = [&](ComponentSummary::Kind kind) {
        if (out.componentCount == out.components.size())
            out.components.emplace_back();
        current = &out.components[out.componentCount++];
        current->kind = kind;
        for (std::string *s : {&current->invokeId, &current->name, &current->serviceKey, &current->imsi,
                               &current->called, &current->calling, &current->cause, &current->event})
            s->clear();
        current->eventCount = 0;
    };
    for (const DecodedOut &f : md.fields) {
        switch (f.id) {
        case kFieldMessageType:
            assign(out.type, f);
            continue;
        case kFieldOtid:
            assign(out.otid, f);
            continue;
        case kFieldDtid:
            assign(out.dtid, f);
            continue;
        case kFieldAbortCause:
            assign(out.abortCause, f);
            continue;
        case kFieldContextCap:
            capArc = spanValue(f);
            if (capArc != 0)
                out.capVersion = capVersion(capArc, 0);
            continue;
        case kFieldContextVersion:
            if (capArc == 0)
                out.capVersion = capVersion(0, spanValue(f));
            continue;
        case kFieldInvoke:
            start(ComponentSummary::Kind::Invoke);
            continue;
        case kFieldResultLast:
            start(ComponentSummary::Kind::Result);
            continue;
        case kFieldError:
            start(ComponentSummary::Kind::Error);
            continue;
        case kFieldReject:
            start(ComponentSummary::Kind::Reject);
            continue;
        default:
            break;
        }
        if (current == nullptr)
            continue;
        if (f.id == kFieldInvokeId) {
            if (current->invokeId.empty())
                assign(current->invokeId, f);
        } else if (f.id == kFieldOperation || f.id == kFieldResultOperation || f.id == kFieldErrorCode) {
            if (current->name.empty())
                assign(current->name, f);
        } else if (isProblem(f.id)) {
            assign(current->name, f); // the problem itself after its type
        } else if (f.id == kFieldServiceKey) {
            assign(current->serviceKey, f);
        } else {
            switch (fieldKeyEntry(f.id)) {
            case kKeyImsi:
                assign(current->imsi, f);
                break;
            case kKeyCalled:
                assign(current->called, f);
                break;
            case kKeyCalling:
                assign(current->calling, f);
                break;
            case kKeyCause:
                assign(current->cause, f);
                break;
            case kKeyEvent:
                if (current->eventCount++ != 0)
                    current->event += ", ";
                current->event += fieldValue(f);
                break;
            default:
                break;
            }
        }
    }
}

void writeSummary(std::ostream &os, uint64_t index, const CaptureOrigin *origin, const MessageSummary &s,
                  TimeFormatter &time, bool json) {
    static thread_local std::string line;
    line.clear();
    if (json) {
        nlohmann::ordered_json j{{"index", index}};
        if (origin != nullptr) {
            const capture::TcapMessage &c = origin->carrier;
            time.append(line, origin->seconds, origin->nanoseconds);
            j["frame"] = origin->frame;
            j["time"] = line;
            j["opc"] = c.hasPointCodes ? nlohmann::ordered_json(c.opc) : nlohmann::ordered_json(nullptr);
            j["dpc"] = c.hasPointCodes ? nlohmann::ordered_json(c.dpc) : nlohmann::ordered_json(nullptr);
            j["calledSsn"] = c.hasCalledSsn ? nlohmann::ordered_json(c.calledSsn) : nlohmann::ordered_json(nullptr);
            j["callingSsn"] = c.hasCallingSsn ? nlohmann::ordered_json(c.callingSsn) : nlohmann::ordered_json(nullptr);
            j["calledGt"] = gtJson(c.calledGt);
            j["callingGt"] = gtJson(c.callingGt);
        }
        j["type"] = optionalText(s.type);
        j["otid"] = optionalText(s.otid);
        j["dtid"] = optionalText(s.dtid);
        j["capVersion"] = optionalText(s.capVersion);
        j["abortCause"] = optionalText(s.abortCause);
        nlohmann::ordered_json components = nlohmann::ordered_json::array();
        for (size_t i = 0; i < s.componentCount; ++i) {
            const ComponentSummary &c = s.components[i];
            components.push_back({{"kind", componentKindName(c.kind)},
                                  {"invokeId", optionalText(c.invokeId)},
                                  {"name", optionalText(c.name)},
                                  {"serviceKey", optionalText(c.serviceKey)},
                                  {"imsi", optionalText(c.imsi)},
                                  {"called", optionalText(c.called)},
                                  {"calling", optionalText(c.calling)},
                                  {"cause", optionalText(c.cause)},
                                  {"event", optionalText(c.event)}});
        }
        j["components"] = std::move(components);
        j["errorFlags"] = s.errorFlags;
        line = j.dump(-1, ' ', false, nlohmann::json::error_handler_t::replace);
        line += '\n';
        os.write(line.data(), std::streamsize(line.size()));
        return;
    }
    const auto number = [](std::string &out, uint64_t v) {
        char buf[24];
        const auto r = std::to_chars(buf, buf + sizeof buf, v);
        out.append(buf, size_t(r.ptr - buf));
    };
    const auto orDash = [](const std::string &v) {
        if (v.empty())
            line += '-';
        else
            line += v;
    };
    if (origin != nullptr) {
        const capture::TcapMessage &c = origin->carrier;
        line += "frame ";
        number(line, origin->frame);
        line += ' ';
        time.append(line, origin->seconds, origin->nanoseconds);
        line += " pc ";
        if (c.hasPointCodes) {
            number(line, c.opc);
            line += '>';
            number(line, c.dpc);
        } else {
            line += '-';
        }
        line += " ssn ";
        if (c.hasCallingSsn)
            number(line, c.callingSsn);
        else
            line += '-';
        line += '>';
        if (c.hasCalledSsn)
            number(line, c.calledSsn);
        else
            line += '-';
        line += " gt ";
        appendGt(line, c.callingGt);
        line += '>';
        appendGt(line, c.calledGt);
    } else {
        line += "message ";
        number(line, index);
    }
    line += ' ';
    line += s.type.empty() ? "?" : s.type;
    line += " otid=";
    orDash(s.otid);
    line += " dtid=";
    orDash(s.dtid);
    if (!s.capVersion.empty()) {
        line += ' ';
        line += s.capVersion;
    }
    if (!s.abortCause.empty()) {
        line += " abort=";
        line += s.abortCause;
    }
    for (size_t i = 0; i < s.componentCount; ++i) {
        const ComponentSummary &c = s.components[i];
        line += " | ";
        line += componentKindName(c.kind);
        line += ' ';
        orDash(c.invokeId);
        const std::pair<const char *, const std::string *> parts[] = {
            {"", &c.name},          {"sk=", &c.serviceKey}, {"imsi=", &c.imsi},   {"called=", &c.called},
            {"calling=", &c.calling}, {"cause=", &c.cause}, {"event=", &c.event}};
        for (const auto &[what, value] : parts)
            if (!value->empty()) {
                line += ' ';
                line += what;
                line += *value;
            }
    }
    if (s.errorFlags != 0) {
        line += " ! ";
        line += describeErrorFlags(s.errorFlags);
    }
    line += '\n';
    os.write(line.data(), std::streamsize(line.size()));
}

void Statistics::add(const MessageSummary &s) {
    ++messages_;
    ++types_[s.type.empty() ? "(none)" : s.type];
    if (!s.capVersion.empty())
        ++versions_[s.capVersion];
    for (size_t i = 0; i < s.componentCount; ++i) {
        const ComponentSummary &c = s.components[i];
        const std::string name = c.name.empty() ? "(not decoded)" : c.name;
        std::map<std::string, uint64_t> *const byKind[] = {&operations_, &results_, &errors_, &rejects_};
        ++(*byKind[size_t(c.kind)])[name];
        if (!c.serviceKey.empty())
            ++serviceKeys_[c.serviceKey];
        if (!c.cause.empty())
            ++causes_[c.cause];
        // A list of several is what is armed, not what happened.
        if (c.eventCount == 1)
            ++events_[c.event];
    }
    for (uint32_t bit = 1; bit != 0; bit <<= 1)
        if (s.errorFlags & bit)
            ++flags_[describeErrorFlags(bit)];
}

void Statistics::write(std::ostream &os, const InputReport &input, bool json) const {
    std::map<std::string, uint64_t> skipped;
    for (size_t i = 1; i < capture::kSkipCount; ++i)
        if (input.skips[i] != 0)
            skipped[capture::skipName(capture::Skip(i))] = input.skips[i];
    const struct {
        const char *json, *text;
        const std::map<std::string, uint64_t> *counts;
    } groups[] = {{"messageTypes", "message type", &types_},
                  {"capVersions", "CAP version", &versions_},
                  {"operations", "operation", &operations_},
                  {"results", "result", &results_},
                  {"errors", "error", &errors_},
                  {"rejects", "reject", &rejects_},
                  {"serviceKeys", "service key", &serviceKeys_},
                  {"causes", "cause", &causes_},
                  {"events", "event", &events_},
                  {"errorFlags", "error flag", &flags_},
                  {"skipped", "skipped", &skipped}};
    if (json) {
        nlohmann::ordered_json j{{"frames", input.frames}, {"messages", messages_}};
        for (const auto &g : groups)
            j[g.json] = *g.counts;
        os << nlohmann::ordered_json{{"stats", std::move(j)}}.dump(-1, ' ', false,
                                                                  nlohmann::json::error_handler_t::replace)
           << '\n';
        return;
    }
    os << "stats: " << input.frames << " frames, " << messages_ << " messages\n";
    for (const auto &g : groups)
        for (const auto &[name, count] : *g.counts)
            os << g.text << ' ' << name << ": " << count << '\n';
}

} // namespace dpxdecode
