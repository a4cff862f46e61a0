#include <charconv>
#include <cstdio>
#include <ostream>
#include <string>
#include <type_traits>

#include "output.h"

namespace dpxdecode {
namespace {

// A message's text is put together in one reused string and written at
// once, rather than a stream insertion per value.
struct Text {
    std::string s;
    Text &operator<<(const std::string &v) {
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

} // namespace

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
    os.s.clear();
    if (origin != nullptr) {
        const capture::TcapMessage &c = origin->carrier;
        os << "frame " << origin->frame << " at " << formatTime(origin->seconds, origin->nanoseconds);
        if (c.hasPointCodes)
            os << ": opc " << c.opc << ", dpc " << c.dpc;
        else
            os << ": no point codes";
        os << ", called SSN ";
        if (c.hasCalledSsn)
            os << unsigned(c.calledSsn);
        else
            os << '-';
        os << ", calling SSN ";
        if (c.hasCallingSsn)
            os << unsigned(c.callingSsn);
        else
            os << '-';
        os << '\n';
    }
    os << "message " << index << ": " << hex << '\n';
    if (r.md) {
        for (const DecodedOut &f : r.md->fields) {
            os << f.text;
            if (options.spans) {
                os << ' ';
                for (const SpanOut &s : f.spans)
                    os << " [" << s.first << '-' << s.last << "]=" << s.value;
            }
            os << '\n';
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
