#include "ek_output.h"

#include <ostream>

#include "json_writer.h"
#include "key_text.h"

namespace dpxdecode {
namespace {

void optionalNumber(JsonWriter &w, const char *name, bool present, uint32_t value) {
    w.raw(",").key(name);
    if (present)
        w.number(value);
    else
        w.raw("null");
}

void optionalText(JsonWriter &w, const char *name, std::string_view text) {
    w.raw(",").key(name);
    if (text.empty())
        w.raw("null");
    else
        w.string(text);
}

void globalTitle(JsonWriter &w, const char *name, const capture::GlobalTitle &gt) {
    optionalText(w, name, std::string_view(gt.digits, gt.size));
}

// The names of one kind of component, in message order.
void names(JsonWriter &w, const char *member, const MessageSummary &s, ComponentSummary::Kind kind) {
    w.raw(",").key(member).raw("[");
    bool first = true;
    for (size_t i = 0; i < s.componentCount; ++i) {
        const ComponentSummary &c = s.components[i];
        if (c.kind != kind || c.name.empty())
            continue;
        w.raw(first ? "" : ",").string(c.name);
        first = false;
    }
    w.raw("]");
}

} // namespace

void writeEk(std::ostream &os, const InputMessage &msg, uint64_t index, const std::string &hex,
             const MessageResult &r, const MessageSummary &s, const TimeFormatter &time) {
    static thread_local std::string out, stamp;
    static thread_local KeyText key;
    out.clear();
    stamp.clear();
    JsonWriter w(out);
    const CaptureOrigin *origin = msg.capture;
    if (origin != nullptr)
        time.appendUtc(stamp, origin->seconds, origin->nanoseconds);
    // A time stamp that is not a calendar date (none, or out of the
    // formatter's range) sends the document to the undated index.
    const bool dated = stamp.size() > 10 && stamp[10] == 'T';
    w.raw("{\"index\":{\"_index\":");
    w.string(dated ? "dpx-camel-" + stamp.substr(0, 10) : std::string("dpx-camel"));
    w.raw("}}\n{");
    if (dated)
        w.key("@timestamp").string(stamp).raw(",");
    w.key("source").string(msg.source);
    w.raw(",").key("message").number(index);
    if (origin != nullptr) {
        const capture::TcapMessage &c = origin->carrier;
        w.raw(",").key("frame").number(origin->frame);
        optionalNumber(w, "opc", c.hasPointCodes, c.opc);
        optionalNumber(w, "dpc", c.hasPointCodes, c.dpc);
        optionalNumber(w, "calledSsn", c.hasCalledSsn, c.calledSsn);
        optionalNumber(w, "callingSsn", c.hasCallingSsn, c.callingSsn);
        globalTitle(w, "calledGt", c.calledGt);
        globalTitle(w, "callingGt", c.callingGt);
    }
    optionalText(w, "type", s.type);
    optionalText(w, "otid", s.otid);
    optionalText(w, "dtid", s.dtid);
    optionalText(w, "capVersion", s.capVersion);
    optionalText(w, "abortCause", s.abortCause);
    names(w, "operations", s, ComponentSummary::Kind::Invoke);
    names(w, "results", s, ComponentSummary::Kind::Result);
    names(w, "errors", s, ComponentSummary::Kind::Error);
    names(w, "rejects", s, ComponentSummary::Kind::Reject);
    w.raw(",").key("errorFlags").number(s.errorFlags);
    w.raw(",").key("flags").raw("[");
    bool first = true;
    for (uint32_t bit = 1; bit != 0; bit <<= 1) {
        if ((s.errorFlags & bit) == 0)
            continue;
        w.raw(first ? "" : ",").string(describeErrorFlags(bit));
        first = false;
    }
    w.raw("]");
    // Every key field under its name: codes as {"code", "name"}, the rest
    // as text.  The key-field pass keeps the last of several occurrences.
    w.raw(",").key("keys").raw("{");
    first = true;
    if (r.keys) {
        for (const KeyEntryOut &e : r.keys->entries) {
            if (!keyText(e, key))
                continue;
            w.raw(first ? "" : ",").keyText(keyEntryName(e.index));
            first = false;
            if (!key.isNumber) {
                w.string(key.text);
                continue;
            }
            w.raw("{").key("code").number(key.number);
            const std::string_view name = keyValueName(r.md ? &*r.md : nullptr, e.index);
            if (!name.empty())
                w.raw(",").key("name").string(name);
            w.raw("}");
        }
    }
    w.raw("}");
    w.raw(",").key("hex").string(hex);
    out += "}\n";
    os.write(out.data(), std::streamsize(out.size()));
}

} // namespace dpxdecode
