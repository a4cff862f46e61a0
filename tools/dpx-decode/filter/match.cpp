#include "filter/match.h"

#include <algorithm>
#include <charconv>
#include <unordered_set>

#include "dialogues/cap_codes.h"
#include "fields/field_table.h"

namespace dpxdecode {
namespace {

using dialogues::Component;
using dialogues::MessageFacts;
using What = MessageFilter::Condition::What;

// Lower case without blanks, dashes, underscores and dots: "Initial DP",
// "initialDP" and "initial-dp" are one name.
std::string fold(const std::string &s) {
    std::string out;
    for (char c : s) {
        if (c == ' ' || c == '-' || c == '_' || c == '.')
            continue;
        out += (c >= 'A' && c <= 'Z') ? char(c - 'A' + 'a') : c;
    }
    return out;
}

// Blanks at both ends removed, lower case (for labels and values).
std::string trimLower(std::string_view s) {
    const size_t a = s.find_first_not_of(' ');
    if (a == std::string_view::npos)
        return {};
    const size_t b = s.find_last_not_of(' ');
    std::string out(s.substr(a, b - a + 1));
    for (char &c : out)
        if (c >= 'A' && c <= 'Z')
            c = char(c - 'A' + 'a');
    return out;
}

bool parseNumber(const std::string &s, int64_t &out) {
    if (s.empty())
        return false;
    const auto r = std::from_chars(s.data(), s.data() + s.size(), out);
    return r.ec == std::errc() && r.ptr == s.data() + s.size() && out >= 0;
}

bool startsWith(const std::string &s, const std::string &p) { return s.compare(0, p.size(), p) == 0; }

bool textHolds(const std::string &have, const std::string &want, bool prefix) {
    return prefix ? startsWith(have, want) : have == want;
}

struct Name {
    const char *name;
    What what;
};
constexpr Name kNames[] = {
    {"imsi", What::Imsi},           {"called", What::Called},   {"calling", What::Calling},
    {"charge", What::Charge},       {"operation", What::Operation}, {"op", What::Operation},
    {"error", What::Error},         {"cause", What::Cause},     {"event", What::Event},
    {"servicekey", What::ServiceKey}, {"tid", What::Tid},       {"otid", What::Otid},
    {"dtid", What::Dtid},           {"ssn", What::Ssn},         {"pc", What::Pc},
    {"opc", What::Opc},             {"dpc", What::Dpc},         {"type", What::Type},
};

const std::unordered_set<std::string> &knownLabels() {
    static const std::unordered_set<std::string> labels = [] {
        std::unordered_set<std::string> s;
        for (const camel::FieldDef &f : camel::kFields)
            s.insert(trimLower(f.label));
        return s;
    }();
    return labels;
}

// The codes a name (or a name prefix) stands for, in both our names and
// the ASN.1 names; a number stands for itself.
template <size_t N, size_t M>
bool resolveCodes(const std::string &value, bool prefix, const dialogues::CodeName (&asn)[N],
                  const camel::ValueName (&ours)[M], std::vector<int32_t> &codes) {
    int64_t n = 0;
    if (!prefix && parseNumber(value, n)) {
        codes.push_back(int32_t(n));
        return n <= 255;
    }
    const std::string want = fold(value);
    for (const dialogues::CodeName &c : asn)
        if (textHolds(fold(c.name), want, prefix))
            codes.push_back(c.code);
    for (const camel::ValueName &c : ours)
        if (textHolds(fold(c.name), want, prefix))
            codes.push_back(int32_t(c.code));
    return !want.empty() && !codes.empty();
}

bool anyComponent(const MessageFacts &m, const std::vector<int32_t> &codes, bool errors) {
    for (const Component &c : m.components) {
        const bool kindOk = errors ? c.kind == Component::Kind::Error
                                   : (c.kind == Component::Kind::Invoke || c.kind == Component::Kind::Result);
        if (kindOk && c.code >= 0 && std::find(codes.begin(), codes.end(), c.code) != codes.end())
            return true;
    }
    return false;
}

bool numberHolds(uint64_t have, const MessageFilter::Condition &c) {
    return c.prefix ? startsWith(std::to_string(have), c.text) : int64_t(have) == c.number;
}

} // namespace

bool MessageFilter::parse(const std::vector<std::string> &expressions, std::string &error) {
    conditions_.clear();
    for (const std::string &e : expressions) {
        const size_t op = e.find_first_of("=~");
        if (op == std::string::npos || op == 0) {
            error = "--match '" + e + "': expected NAME=VALUE or NAME~PREFIX";
            return false;
        }
        Condition c;
        c.prefix = e[op] == '~';
        const std::string name = e.substr(0, op);
        const std::string value = e.substr(op + 1);
        const std::string folded = fold(name);
        const auto builtin = std::find_if(std::begin(kNames), std::end(kNames),
                                          [&](const Name &n) { return folded == n.name; });
        if (builtin != std::end(kNames)) {
            c.what = builtin->what;
        } else if (knownLabels().count(trimLower(name)) != 0) {
            c.what = What::Label;
            c.label = trimLower(name);
        } else {
            error = "--match '" + e + "': no filter or field label '" + name +
                    "' (filters: imsi, called, calling, charge, operation, error, cause, event, serviceKey, "
                    "tid, otid, dtid, ssn, pc, opc, dpc, type; or a field label)";
            return false;
        }
        const auto bad = [&](const char *what) {
            error = "--match '" + e + "': " + what;
            return false;
        };
        switch (c.what) {
        case What::Imsi: case What::Called: case What::Calling: case What::Charge:
        case What::Tid: case What::Otid: case What::Dtid:
            c.text = trimLower(value);
            if (c.text.empty() || c.text.find_first_not_of("0123456789abcdef") != std::string::npos)
                return bad("expected digits (hexadecimal for transaction ids)");
            break;
        case What::Operation:
            if (!resolveCodes(value, c.prefix, dialogues::kOperations, camel::names::kOperation, c.codes))
                return bad("unknown operation (a code 0-255 or a name such as initialDP)");
            break;
        case What::Error:
            if (!resolveCodes(value, c.prefix, dialogues::kErrors, camel::names::kErrorCode, c.codes))
                return bad("unknown error (a code 0-255 or a name such as missingParameter)");
            break;
        case What::Event:
            // A number, or the event's name as decoded ("Collected Info.").
            c.text = fold(value);
            if (!parseNumber(value, c.number) && c.text.empty())
                return bad("expected an event type number or name");
            break;
        case What::Cause: case What::ServiceKey: case What::Ssn: case What::Pc: case What::Opc: case What::Dpc:
            c.text = value;
            if (!parseNumber(value, c.number))
                return bad("expected a decimal number");
            break;
        case What::Type: {
            c.text = fold(value);
            static const char *const types[] = {"begin", "continue", "end", "abort", "unidirectional"};
            if (std::none_of(std::begin(types), std::end(types),
                             [&](const char *t) { return textHolds(t, c.text, c.prefix); }))
                return bad("expected begin, continue, end, abort or unidirectional");
            break;
        }
        case What::Label:
            c.text = trimLower(value);
            break;
        }
        conditions_.push_back(std::move(c));
    }
    return true;
}

bool MessageFilter::holds(const Condition &c, const MessageFacts &m, const MdOut *md) const {
    switch (c.what) {
    case What::Imsi: return textHolds(m.imsi, c.text, c.prefix) && !m.imsi.empty();
    case What::Called: return textHolds(m.called, c.text, c.prefix) && !m.called.empty();
    case What::Calling: return textHolds(m.calling, c.text, c.prefix) && !m.calling.empty();
    case What::Charge: return textHolds(m.charge, c.text, c.prefix) && !m.charge.empty();
    case What::Otid: return !m.otid.empty() && textHolds(trimLower(m.otid), c.text, c.prefix);
    case What::Dtid: return !m.dtid.empty() && textHolds(trimLower(m.dtid), c.text, c.prefix);
    case What::Tid:
        return (!m.otid.empty() && textHolds(trimLower(m.otid), c.text, c.prefix)) ||
               (!m.dtid.empty() && textHolds(trimLower(m.dtid), c.text, c.prefix));
    case What::Operation: return anyComponent(m, c.codes, false);
    case What::Error: return anyComponent(m, c.codes, true);
    case What::Cause:
        return std::any_of(m.causes.begin(), m.causes.end(),
                           [&](const dialogues::ValueIn &v) { return numberHolds(v.value, c); });
    case What::Event:
        return std::any_of(m.eventTypes.begin(), m.eventTypes.end(), [&](const dialogues::ValueIn &v) {
            return c.number >= 0 ? numberHolds(v.value, c) : textHolds(fold(v.name), c.text, c.prefix);
        });
    case What::ServiceKey: return m.hasServiceKey && numberHolds(m.serviceKey, c);
    case What::Ssn:
        return (m.from.hasSsn && numberHolds(m.from.ssn, c)) || (m.to.hasSsn && numberHolds(m.to.ssn, c));
    case What::Pc:
        return m.from.hasPc && (numberHolds(m.from.pc, c) || numberHolds(m.to.pc, c));
    case What::Opc: return m.from.hasPc && numberHolds(m.from.pc, c);
    case What::Dpc: return m.to.hasPc && numberHolds(m.to.pc, c);
    case What::Type: return textHolds(fold(dialogues::messageTypeName(m.type)), c.text, c.prefix);
    case What::Label:
        if (md == nullptr)
            return false;
        for (const DecodedOut &f : md->fields) {
            if (trimLower(f.label) != c.label)
                continue;
            const size_t eq = f.text.find('=');
            if (eq != std::string::npos && textHolds(trimLower(f.text.substr(eq + 1)), c.text, c.prefix))
                return true;
        }
        return false;
    }
    return false;
}

bool MessageFilter::matches(const MessageFacts &m, const MdOut *md) const {
    return std::all_of(conditions_.begin(), conditions_.end(),
                       [&](const Condition &c) { return holds(c, m, md); });
}

} // namespace dpxdecode
