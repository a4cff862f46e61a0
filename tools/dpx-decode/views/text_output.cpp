#include <charconv>
#include <cstdio>
#include <ostream>
#include <string>
#include <type_traits>
#include <vector>

#include "field_kinds.h"
#include "output.h"

namespace dpxdecode {
namespace {

// A message's text is put together in one reused string and written at
// once, rather than a stream insertion per value.
struct Text {
    std::string s;
    Text &operator<<(std::string_view v) {
        s += v;
        return *this;
    }
    Text &operator<<(const char *v) {
        s += v;
        return *this;
    }
    Text &operator<<(char v) {
        s += v;
        return *this;
    }
    template <typename T, typename = std::enable_if_t<std::is_integral_v<T>>>
    Text &operator<<(T v) {
        char buf[24];
        const auto r = std::to_chars(buf, buf + sizeof buf, v);
        s.append(buf, size_t(r.ptr - buf));
        return *this;
    }
};

struct FlagName {
    uint32_t bit;
    const char *name;
};

constexpr FlagName kFlagNames[] = {
    {DPX_ERR_MANDATORY_MISSING, "mandatory element missing"},
    {DPX_ERR_LENGTH_BEYOND, "length beyond window"},
    {DPX_ERR_LEFTOVER, "left-over bits skipped"},
    {DPX_ERR_FRAME_GROWTH, "layer frame growth failed"},
    {DPX_ERR_STACK_GROWTH, "stack growth failed"},
    {DPX_ERR_SPAN_GROWTH, "span growth failed"},
};

std::string hex32(uint32_t v) {
    static const char digits[] = "0123456789abcdef";
    std::string s;
    do {
        s.insert(s.begin(), digits[v & 0xF]);
        v >>= 4;
    } while (v != 0);
    return "0x" + s;
}

// A pass that did not finish says so on its own line.
void writeFailure(Text &os, const char *pass, const PassOutcome &p) {
    if (p.result == 1)
        return;
    os << pass << ": pass failed (result " << p.result;
    if (p.errorFlags != 0)
        os << ": " << describeErrorFlags(p.errorFlags);
    os << ")\n";
}

void writeVerdict(Text &os, const ViewOut &v) {
    const bool valid = v.result == 1 && v.errorFlags == 0 && v.status == 0;
    os << "view: " << (valid ? "valid" : "invalid");
    if (v.errorFlags != 0)
        os << ": " << describeErrorFlags(v.errorFlags);
    // The status goes with the flags: -52 exactly when a flag is set.
    if ((v.status == DPX_STATUS_INVALID) != (v.errorFlags != 0))
        os << " (status " << v.status << ')';
    os << '\n';
}

void writeKeys(Text &os, const KeysOut &k) {
    if (k.entries.empty()) {
        os << "keys: none\n";
        return;
    }
    for (const KeyEntryOut &e : k.entries) {
        os << "key " << e.index << ' ' << keyEntryName(e.index) << ": ";
        if (e.overflow)
            os << "overflow";
        else
            os << e.value;
        if (keyEntryForm(e.index) == KeyForm::Variable && !e.overflow)
            os << " (" << e.bits << " bits)";
        os << '\n';
    }
}

void writeSpans(Text &os, const DecodedOut &f) {
    os << ' ';
    for (const SpanOut &s : f.spans)
        os << " [" << s.firstBit << '-' << s.lastBit << "]=" << s.value;
}

// The decoded fields as a tree.  An element is a tag field, the length
// field right after it and every field whose bits lie inside the length
// it gives; an indefinite length runs to its end-of-contents.  The tree is
// worked out in one sweep over the fields' bit spans, kept in arrays that
// are reused from message to message.
class FieldTree {
public:
    void write(Text &os, const MdOut &md, const TextOptions &options);

private:
    static constexpr int32_t kNone = -1;
    struct Open {
        int32_t tag;  // index of the element's tag field
        uint32_t end; // last bit of the element
        uint32_t tagLast;
        bool indefinite;
        bool awaitingLength;
    };
    void build(const MdOut &md);
    bool collapsed(size_t tag) const {
        return shown_[tag] == 1 && kinds_[size_t(only_[tag])] == FieldKind::Value;
    }

    std::vector<Open> stack_;
    std::vector<int32_t> parent_; // per field: its element's tag field
    std::vector<FieldKind> kinds_; // per field, looked up once
    std::vector<uint16_t> shown_; // per tag field: children shown in the values view
    std::vector<int32_t> only_;   // per tag field: its first such child
    std::vector<uint16_t> depth_;
};

// The count at the front of a length field's value ("22 octet(s)");
// false for "Indefinite Length".
bool lengthOctets(const DecodedOut &f, uint32_t &octets) {
    const std::string_view v = fieldValue(f);
    const auto r = std::from_chars(v.data(), v.data() + v.size(), octets);
    return r.ec == std::errc() && r.ptr != v.data();
}

void FieldTree::build(const MdOut &md) {
    const size_t n = md.fields.size();
    stack_.clear();
    parent_.assign(n, kNone);
    kinds_.resize(n);
    shown_.assign(n, 0);
    only_.assign(n, kNone);
    uint32_t lastBit = 0;
    for (size_t i = 0; i < n; ++i) {
        const DecodedOut &f = md.fields[i];
        const FieldKind kind = kinds_[i] = fieldKind(f.id);
        uint32_t first = lastBit, last = lastBit;
        if (!f.spans.empty()) {
            first = f.spans[0].firstBit;
            last = f.spans[0].lastBit;
            for (const SpanOut &s : f.spans) {
                first = s.firstBit < first ? s.firstBit : first;
                last = s.lastBit > last ? s.lastBit : last;
            }
        }
        lastBit = last;
        // A tag without a length right after it is an element of its own
        // bits only.
        if (!stack_.empty() && stack_.back().awaitingLength && kind != FieldKind::Length) {
            stack_.back().awaitingLength = false;
            stack_.back().end = stack_.back().tagLast;
        }
        while (!stack_.empty() && stack_.back().end < first)
            stack_.pop_back();
        if (kind == FieldKind::EndOfContents) {
            // Closes the innermost indefinite element, to which it belongs.
            size_t k = stack_.size();
            while (k > 0 && !stack_[k - 1].indefinite)
                --k;
            if (k > 0) {
                parent_[i] = stack_[k - 1].tag;
                stack_.resize(k - 1);
                continue;
            }
        }
        if (!stack_.empty())
            parent_[i] = stack_.back().tag;
        const uint32_t outerEnd = stack_.empty() ? UINT32_MAX : stack_.back().end;
        if (kind == FieldKind::Length && !stack_.empty() && stack_.back().awaitingLength) {
            Open &e = stack_.back();
            e.awaitingLength = false;
            uint32_t octets = 0;
            if (lengthOctets(f, octets)) {
                const uint64_t end = uint64_t(last) + uint64_t(octets) * 8;
                e.end = end < e.end ? uint32_t(end) : e.end;
            } else {
                e.indefinite = true;
            }
        }
        if (parent_[i] != kNone && (kind == FieldKind::Value || kind == FieldKind::Tag)) {
            const size_t p = size_t(parent_[i]);
            if (shown_[p]++ == 0)
                only_[p] = int32_t(i);
        }
        if (kind == FieldKind::Tag)
            stack_.push_back(Open{int32_t(i), outerEnd, last, false, true});
    }
}

void FieldTree::write(Text &os, const MdOut &md, const TextOptions &options) {
    build(md);
    const bool all = options.fields == FieldsMode::All;
    depth_.assign(md.fields.size(), 0);
    for (size_t i = 0; i < md.fields.size(); ++i) {
        const DecodedOut &f = md.fields[i];
        const FieldKind kind = kinds_[i];
        if (parent_[i] != kNone) {
            const size_t p = size_t(parent_[i]);
            depth_[i] = uint16_t(depth_[p] + (all || !collapsed(p) ? 1 : 0));
        }
        if (!all && (kind == FieldKind::Length || kind == FieldKind::EndOfContents ||
                     (kind == FieldKind::Tag && collapsed(i))))
            continue;
        os.s.append(size_t(depth_[i]) * 2, ' ');
        std::string_view name = fieldName(f);
        if (!all && kind == FieldKind::Tag) {
            // The element's name: its tag field's label without " Tag".
            constexpr std::string_view suffix = " Tag";
            if (name.size() > suffix.size() && name.substr(name.size() - suffix.size()) == suffix)
                name.remove_suffix(suffix.size());
            os << name;
        } else {
            if (!name.empty())
                os << name << ": ";
            // A code without a name in the module's tables shows as
            // empty text; people are shown the number.
            const std::string_view value = fieldValue(f);
            if (value.empty() && !all && f.spans.size() == 1)
                os << '(' << f.spans[0].value << ')';
            else
                os << value;
        }
        if (options.spans)
            writeSpans(os, f);
        os << '\n';
    }
}

void writeOrigin(Text &os, const CaptureOrigin &origin, TimeFormatter *time) {
    const capture::TcapMessage &c = origin.carrier;
    os << "frame " << origin.frame << " at ";
    if (time != nullptr)
        time->append(os.s, origin.seconds, origin.nanoseconds);
    else
        os << formatTime(origin.seconds, origin.nanoseconds);
    if (c.hasPointCodes)
        os << ": opc " << c.opc << ", dpc " << c.dpc;
    else
        os << ": no point codes";
    const auto ssn = [&os](const char *what, bool has, uint8_t value) {
        os << what;
        if (has)
            os << unsigned(value);
        else
            os << '-';
    };
    ssn(", called SSN ", c.hasCalledSsn, c.calledSsn);
    ssn(", calling SSN ", c.hasCallingSsn, c.callingSsn);
    const auto gt = [&os](const char *what, const capture::GlobalTitle &g) {
        os << what;
        if (g.size == 0)
            os << '-';
        else
            os << std::string_view(g.digits, g.size);
    };
    gt(", called GT ", c.calledGt);
    gt(", calling GT ", c.callingGt);
    os << '\n';
}

} // namespace

std::string_view fieldValue(const DecodedOut &f) {
    const size_t eq = f.text.find('=');
    return eq == std::string::npos ? std::string_view(f.text) : std::string_view(f.text).substr(eq + 1);
}

std::string_view fieldName(const DecodedOut &f) {
    std::string_view name = f.label;
    while (!name.empty() && name.front() == ' ')
        name.remove_prefix(1);
    return name;
}

std::string describeErrorFlags(uint32_t flags) {
    std::string s;
    auto add = [&s](const std::string &part) {
        if (!s.empty())
            s += ", ";
        s += part;
    };
    for (const FlagName &f : kFlagNames) {
        if (flags & f.bit) {
            add(f.name);
            flags &= ~f.bit;
        }
    }
    if (flags != 0)
        add(hex32(flags));
    return s;
}

std::string formatTime(int64_t seconds, uint32_t nanoseconds) {
    char buf[48];
    std::snprintf(buf, sizeof buf, "%lld.%09u", static_cast<long long>(seconds), nanoseconds);
    return buf;
}

void writeText(std::ostream &stream, uint64_t index, const std::string &hex, const MessageResult &r,
               const TextOptions &options, const CaptureOrigin *origin) {
    static thread_local Text os;
    static thread_local FieldTree tree;
    os.s.clear();
    if (origin != nullptr)
        writeOrigin(os, *origin, options.time);
    os << "message " << index << ": " << hex << '\n';
    if (r.md) {
        if (options.fields == FieldsMode::List) {
            for (const DecodedOut &f : r.md->fields) {
                os << f.text;
                if (options.spans)
                    writeSpans(os, f);
                os << '\n';
            }
        } else {
            tree.write(os, *r.md, options);
            if (r.md->errorFlags != 0 && r.md->result == 1)
                os << "errors: " << describeErrorFlags(r.md->errorFlags) << '\n';
        }
        writeFailure(os, "md", *r.md);
    }
    if (r.display) {
        os << "display: " << r.display->fields.size() << " values\n";
        writeFailure(os, "display", *r.display);
    }
    if (r.view)
        writeVerdict(os, *r.view);
    if (r.keys) {
        writeKeys(os, *r.keys);
        writeFailure(os, "keys", *r.keys);
    }
    os << '\n';
    stream.write(os.s.data(), std::streamsize(os.s.size()));
}

} // namespace dpxdecode
