// JSON output written straight into a buffer: the same text nlohmann's
// compact dump gives (members in order, no blanks), without building a
// document per message.
#include <nlohmann/json.hpp>

#include <ostream>
#include <string>

#include "output.h"
#include "tables.h"

namespace dpxdecode {
namespace {

class Writer {
public:
    explicit Writer(std::string &out) : out_(out) {}

    Writer &raw(const char *s) {
        out_ += s;
        return *this;
    }
    Writer &number(uint64_t v) {
        char buf[24];
        char *p = buf + sizeof buf;
        do {
            *--p = char('0' + v % 10);
            v /= 10;
        } while (v != 0);
        out_.append(p, size_t(buf + sizeof buf - p));
        return *this;
    }
    Writer &number(int64_t v) {
        if (v < 0) {
            out_ += '-';
            return number(uint64_t(0) - uint64_t(v));
        }
        return number(uint64_t(v));
    }
    Writer &number(uint32_t v) { return number(uint64_t(v)); }
    Writer &number(int32_t v) { return number(int64_t(v)); }

    // Plain printable ASCII is copied; anything else (escapes, UTF-8, bytes
    // that are not UTF-8) goes through nlohmann's serializer so the
    // escaping and the U+FFFD replacement stay exactly its own.
    Writer &string(const std::string &s) {
        for (const char c : s) {
            const auto u = static_cast<unsigned char>(c);
            if (u < 0x20 || u >= 0x7F || c == '"' || c == '\\') {
                out_ += nlohmann::json(s).dump(-1, ' ', false, nlohmann::json::error_handler_t::replace);
                return *this;
            }
        }
        out_ += '"';
        out_ += s;
        out_ += '"';
        return *this;
    }
    Writer &key(const char *name) {
        out_ += '"';
        out_ += name;
        out_ += "\":";
        return *this;
    }

private:
    std::string &out_;
};

void common(Writer &w, const PassOutcome &p) {
    w.raw("{").key("result").number(p.result).raw(",").key("remainingBits").number(p.remainingBits);
    w.raw(",").key("errorFlags").number(p.errorFlags);
}

void mdJson(Writer &w, const MdOut &md) {
    common(w, md);
    w.raw(",").key("layer").raw("{").key("first").number(md.layerFirst).raw(",").key("last").number(md.layerLast);
    w.raw("},").key("fields").raw("[");
    bool firstField = true;
    for (const DecodedOut &f : md.fields) {
        w.raw(firstField ? "{" : ",{");
        firstField = false;
        w.key("id").number(f.id).raw(",").key("label").string(f.label).raw(",").key("text").string(f.text);
        w.raw(",").key("selector").number(f.selector).raw(",").key("spans").raw("[");
        bool firstSpan = true;
        for (const SpanOut &s : f.spans) {
            w.raw(firstSpan ? "[" : ",[").number(s.first).raw(",").number(s.last).raw(",").number(s.value).raw("]");
            firstSpan = false;
        }
        w.raw("]}");
    }
    w.raw("]}");
}

void displayJson(Writer &w, const DisplayPassOut &d) {
    common(w, d);
    w.raw(",").key("fields").raw("[");
    bool first = true;
    for (const DisplayOut &f : d.fields) {
        w.raw(first ? "{" : ",{").key("displayId").number(f.displayId).raw(",").key("text").string(f.text);
        w.raw(",").key("label").string(catalogueLabel(f.displayId)).raw("}");
        first = false;
    }
    w.raw("]}");
}

void viewJson(Writer &w, const ViewOut &v) {
    common(w, v);
    w.raw(",").key("status").number(v.status).raw("}");
}

void keysJson(Writer &w, const KeysOut &k) {
    common(w, k);
    w.raw(",").key("entries").raw("[");
    bool first = true;
    for (const KeyEntryOut &e : k.entries) {
        w.raw(first ? "{" : ",{").key("index").number(e.index).raw(",").key("name").string(keyEntryName(e.index));
        w.raw(",").key("value").string(e.value).raw(",").key("bits").number(e.bits);
        if (e.overflow)
            w.raw(",").key("overflow").raw("true");
        w.raw("}");
        first = false;
    }
    w.raw("]}");
}

} // namespace

void writeJson(std::ostream &os, uint64_t index, const std::string &hex, const MessageResult &r,
               const CaptureOrigin *origin) {
    static thread_local std::string out;
    out.clear();
    Writer w(out);
    w.raw("{").key("index").number(index).raw(",").key("hex").string(hex);
    if (origin != nullptr) {
        const capture::TcapMessage &c = origin->carrier;
        w.raw(",").key("frame").number(origin->frame);
        w.raw(",").key("time").string(formatTime(origin->seconds, origin->nanoseconds));
        const auto optional = [&w](const char *name, bool present, uint32_t value) {
            w.raw(",").key(name);
            if (present)
                w.number(value);
            else
                w.raw("null");
        };
        optional("opc", c.hasPointCodes, c.opc);
        optional("dpc", c.hasPointCodes, c.dpc);
        optional("calledSsn", c.hasCalledSsn, c.calledSsn);
        optional("callingSsn", c.hasCallingSsn, c.callingSsn);
    }
    if (r.md)
        mdJson(w.raw(",").key("md"), *r.md);
    if (r.display)
        displayJson(w.raw(",").key("display"), *r.display);
    if (r.view)
        viewJson(w.raw(",").key("view"), *r.view);
    if (r.keys)
        keysJson(w.raw(",").key("keys"), *r.keys);
    out += "}\n";
    os.write(out.data(), std::streamsize(out.size()));
}

} // namespace dpxdecode
