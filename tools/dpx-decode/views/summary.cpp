#include "summary.h"

#include <nlohmann/json.hpp>

#include <ostream>

#include "output.h"

namespace dpxdecode {
namespace {

// Decoded-field ids of the message and component level.
constexpr uint32_t kFieldMessageType = 3604;
constexpr uint32_t kFieldOtid = 3653;
constexpr uint32_t kFieldDtid = 3656;
constexpr uint32_t kFieldInvoke = 3660;
constexpr uint32_t kFieldResultLast = 3669;
constexpr uint32_t kFieldError = 3685;
constexpr uint32_t kFieldReject = 3694;
constexpr uint32_t kFieldInvokeId = 3705;
constexpr uint32_t kFieldOperation = 1066;

// The value part of a field text: after the first '=', blanks trimmed.
std::string valueOf(const DecodedOut &f) {
    const size_t eq = f.text.find('=');
    if (eq == std::string::npos)
        return {};
    return f.text.substr(eq + 1);
}

bool labelHas(const DecodedOut &f, const char *what) { return f.label.find(what) != std::string::npos; }

} // namespace

void summarize(const MdOut &md, MessageSummary &out) {
    out.type.clear();
    out.otid.clear();
    out.dtid.clear();
    out.components.clear();
    ComponentSummary *current = nullptr;
    const auto start = [&](ComponentSummary::Kind kind) {
        out.components.push_back(ComponentSummary{kind, {}, {}});
        current = &out.components.back();
    };
    for (const DecodedOut &f : md.fields) {
        switch (f.id) {
        case kFieldMessageType:
            out.type = valueOf(f);
            continue;
        case kFieldOtid:
            out.otid = valueOf(f);
            continue;
        case kFieldDtid:
            out.dtid = valueOf(f);
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
                current->invokeId = valueOf(f);
        } else if (f.id == kFieldOperation || labelHas(f, "Operation ID") || labelHas(f, "Error Code") ||
                   labelHas(f, "Problem Code")) {
            if (current->name.empty())
                current->name = valueOf(f);
        }
    }
}

void writeSummary(std::ostream &os, uint64_t index, const CaptureOrigin *origin, const MessageSummary &s) {
    if (origin != nullptr)
        os << "frame " << origin->frame << ' ' << formatTime(origin->seconds, origin->nanoseconds);
    else
        os << "message " << index;
    os << ' ' << (s.type.empty() ? "?" : s.type);
    os << " otid=" << (s.otid.empty() ? "-" : s.otid);
    os << " dtid=" << (s.dtid.empty() ? "-" : s.dtid);
    static const char *const kinds[] = {"invoke", "result", "error", "reject"};
    for (const ComponentSummary &c : s.components) {
        os << " | " << kinds[size_t(c.kind)] << ' ' << (c.invokeId.empty() ? "-" : c.invokeId);
        if (!c.name.empty())
            os << ' ' << c.name;
    }
    os << '\n';
}

void Statistics::add(const MessageSummary &s, uint32_t errorFlags) {
    ++messages_;
    ++types_[s.type.empty() ? "(none)" : s.type];
    for (const ComponentSummary &c : s.components) {
        const std::string name = c.name.empty() ? "(not decoded)" : c.name;
        switch (c.kind) {
        case ComponentSummary::Kind::Invoke:
            ++operations_[name];
            break;
        case ComponentSummary::Kind::Result:
            ++results_[name];
            break;
        case ComponentSummary::Kind::Error:
            ++errors_[name];
            break;
        case ComponentSummary::Kind::Reject:
            ++rejects_[name];
            break;
        }
    }
    for (uint32_t bit = 1; bit != 0; bit <<= 1)
        if (errorFlags & bit)
            ++flags_[describeErrorFlags(bit)];
}

void Statistics::write(std::ostream &os, const InputReport &input, bool json) const {
    std::map<std::string, uint64_t> skipped;
    for (size_t i = 1; i < capture::kSkipCount; ++i)
        if (input.skips[i] != 0)
            skipped[capture::skipName(capture::Skip(i))] = input.skips[i];
    const std::pair<const char *, const std::map<std::string, uint64_t> *> groups[] = {
        {"messageTypes", &types_}, {"operations", &operations_}, {"results", &results_},
        {"errors", &errors_},      {"rejects", &rejects_},       {"errorFlags", &flags_},
        {"skipped", &skipped}};
    if (json) {
        nlohmann::ordered_json j{{"frames", input.frames}, {"messages", messages_}};
        for (const auto &[name, counts] : groups)
            j[name] = *counts;
        os << nlohmann::ordered_json{{"stats", std::move(j)}}.dump(-1, ' ', false,
                                                                  nlohmann::json::error_handler_t::replace)
           << '\n';
        return;
    }
    static const char *const textNames[] = {"message type", "operation", "result", "error", "reject",
                                            "error flag", "skipped"};
    os << "stats: " << input.frames << " frames, " << messages_ << " messages\n";
    for (size_t g = 0; g < std::size(groups); ++g)
        for (const auto &[name, count] : *groups[g].second)
            os << textNames[g] << ' ' << name << ": " << count << '\n';
}

} // namespace dpxdecode
