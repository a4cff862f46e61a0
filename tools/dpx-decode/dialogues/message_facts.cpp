#include "dialogues/message_facts.h"

#include <algorithm>
#include <iterator>

namespace dpxdecode::dialogues {
namespace {

// Decoded-field ids the facts are read from.
namespace fid {
constexpr uint32_t kMessageType = 3604;
constexpr uint32_t kInvoke = 3660, kResultLast = 3669, kError = 3685, kReject = 3694;
constexpr uint32_t kInvokeId = 3705;
constexpr uint32_t kOperation = 1066, kResultOperation = 1068, kErrorCode = 1070;
constexpr uint32_t kProblems[] = {3701, 3710, 3712, 3714, 3716}; // the "Problem Code" fields
constexpr uint32_t kCauseValue = 1480;
constexpr uint32_t kEventTypeBcsm = 1557;
constexpr uint32_t kServiceKey = 1611;
constexpr uint32_t kPAbortCause = 3659, kAbortSource = 3785;
constexpr uint32_t kContextNameTag = 3789, kObjectIdLength = 3792;
constexpr uint32_t kCap3Context = 3878, kCap3OeContext = 3880;
} // namespace fid

// Key entries (see key_layout.h).
namespace key {
constexpr uint32_t kCalled = 10, kCharge = 12, kCalling = 15, kImsi = 17, kOtid = 26, kDtid = 29;
} // namespace key

std::string valueText(const DecodedOut &f) {
    const size_t eq = f.text.find('=');
    return eq == std::string::npos ? std::string() : std::string(f.text.substr(eq + 1));
}

// The field's spans read as one number, first span most significant.
uint64_t spanValue(const DecodedOut &f) {
    uint64_t v = 0;
    for (const SpanOut &s : f.spans) {
        const uint32_t width = s.lastBit >= s.firstBit ? s.lastBit - s.firstBit + 1 : 0;
        v = width >= 32 ? s.value : (v << width) | s.value;
    }
    return v;
}

MessageType typeOf(uint32_t octet) {
    switch (octet) {
    case 0x61: return MessageType::Unidirectional;
    case 0x62: return MessageType::Begin;
    case 0x64: return MessageType::End;
    case 0x65: return MessageType::Continue;
    case 0x67: return MessageType::Abort;
    default: return MessageType::Unknown;
    }
}

std::string lower(std::string s) {
    for (char &c : s)
        if (c >= 'A' && c <= 'Z')
            c = char(c - 'A' + 'a');
    return s;
}

// Object identifier octets as dotted numbers (the first octet holds two).
std::string dottedOid(const uint8_t *p, size_t n) {
    std::string out;
    uint64_t v = 0;
    bool first = true;
    for (size_t i = 0; i < n; ++i) {
        v = (v << 7) | (p[i] & 0x7F);
        if (p[i] & 0x80)
            continue;
        if (first) {
            const uint64_t a = v < 40 ? 0 : v < 80 ? 1 : 2;
            out = std::to_string(a) + '.' + std::to_string(v - 40 * a);
            first = false;
        } else {
            out += '.' + std::to_string(v);
        }
        v = 0;
    }
    return out;
}

void setEnd(End &e, bool hasPc, uint32_t pc, bool hasSsn, uint8_t ssn) {
    e.hasPc = hasPc;
    e.pc = hasPc ? pc : 0;
    e.hasSsn = hasSsn;
    e.ssn = hasSsn ? ssn : 0;
}

} // namespace

const char *messageTypeName(MessageType t) {
    static const char *const names[] = {"?", "Unidirectional", "Begin", "End", "Continue", "Abort"};
    return names[size_t(t)];
}

int capVersionOf(const uint8_t *oid, size_t size) {
    // 0.4.0.0.1 is encoded 04 00 00 01.
    if (size < 7 || oid[0] != 0x04 || oid[1] != 0x00 || oid[2] != 0x00 || oid[3] != 0x01)
        return 0;
    switch (oid[4]) {
    case 0: // 50, 51, 52: phase 1 with version 0, phase 2 with version 1
        if (oid[5] < 50 || oid[5] > 52)
            return 0;
        return oid[6] == 0 ? 1 : 2;
    case 20: case 21: return 3;
    case 22: case 23: return 4;
    default: return 0;
    }
}

std::string keyDigits(const std::string &hex, uint32_t bits) {
    const size_t digits = bits / 4;
    if (digits > hex.size())
        return lower(hex);
    return lower(hex.substr(hex.size() - digits));
}

void extractFacts(uint64_t index, const uint8_t *bytes, size_t size, const MessageResult &result,
                  const CaptureOrigin *origin, MessageFacts &out) {
    out = MessageFacts{};
    out.index = index;
    if (origin != nullptr) {
        out.hasOrigin = true;
        out.frame = origin->frame;
        out.seconds = origin->seconds;
        out.nanoseconds = origin->nanoseconds;
        const capture::TcapMessage &c = origin->carrier;
        setEnd(out.from, c.hasPointCodes, c.opc, c.hasCallingSsn, c.callingSsn);
        setEnd(out.to, c.hasPointCodes, c.dpc, c.hasCalledSsn, c.calledSsn);
    }

    if (result.keys) {
        for (const KeyEntryOut &e : result.keys->entries) {
            if (e.overflow)
                continue;
            switch (e.index) {
            case key::kImsi: out.imsi = keyDigits(e.value, e.bits); break;
            case key::kCalled: out.called = keyDigits(e.value, e.bits); break;
            case key::kCalling: out.calling = keyDigits(e.value, e.bits); break;
            case key::kCharge: out.charge = keyDigits(e.value, e.bits); break;
            case key::kOtid: out.otid = e.value; break;
            case key::kDtid: out.dtid = e.value; break;
            default: break;
            }
        }
    }
    if (!result.md)
        return;

    Component *current = nullptr;
    int32_t operation = -1;
    bool inContextName = false;
    const auto start = [&](Component::Kind kind) {
        out.components.push_back(Component{kind, false, 0, -1, {}});
        current = &out.components.back();
        operation = -1;
    };
    for (const DecodedOut &f : result.md->fields) {
        switch (f.id) {
        case fid::kMessageType:
            out.type = typeOf(uint32_t(spanValue(f)));
            break;
        case fid::kInvoke: start(Component::Kind::Invoke); break;
        case fid::kResultLast: start(Component::Kind::Result); break;
        case fid::kError: start(Component::Kind::Error); break;
        case fid::kReject: start(Component::Kind::Reject); break;
        case fid::kInvokeId:
            if (current != nullptr && !current->hasInvokeId) {
                current->hasInvokeId = true;
                current->invokeId = int32_t(spanValue(f));
            }
            break;
        case fid::kOperation:
        case fid::kResultOperation:
        case fid::kErrorCode:
            if (current != nullptr && current->code < 0) {
                current->code = int32_t(spanValue(f));
                current->name = valueText(f);
                if (f.id == fid::kOperation)
                    operation = current->code;
            }
            break;
        case fid::kCauseValue:
            out.causes.push_back(ValueIn{uint32_t(spanValue(f)), operation, valueText(f)});
            break;
        case fid::kEventTypeBcsm:
            out.eventTypes.push_back(ValueIn{uint32_t(spanValue(f)), operation, valueText(f)});
            break;
        case fid::kServiceKey:
            if (!out.hasServiceKey) {
                out.hasServiceKey = true;
                out.serviceKey = uint32_t(spanValue(f));
            }
            break;
        case fid::kPAbortCause:
            out.abortCause = valueText(f);
            break;
        case fid::kAbortSource:
            if (out.abortCause.empty())
                out.abortCause = "user abort (" + valueText(f) + ")";
            break;
        case fid::kContextNameTag:
            inContextName = true;
            break;
        case fid::kObjectIdLength:
            // The context name's octets follow its length octet.
            if (inContextName && !f.spans.empty() && out.applicationContext.empty()) {
                const size_t at = f.spans.back().lastBit / 8;
                const size_t n = f.spans.back().value;
                if (at <= size && n <= size - at) {
                    out.applicationContext = dottedOid(bytes + at, n);
                    out.capVersion = capVersionOf(bytes + at, n);
                }
            }
            inContextName = false;
            break;
        case fid::kCap3Context:
        case fid::kCap3OeContext:
            out.contextName = valueText(f);
            break;
        default:
            if (current != nullptr && current->kind == Component::Kind::Reject && current->name.empty() &&
                std::find(std::begin(fid::kProblems), std::end(fid::kProblems), f.id) != std::end(fid::kProblems))
                current->name = valueText(f);
            break;
        }
    }
}

} // namespace dpxdecode::dialogues
