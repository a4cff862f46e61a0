// JSON output written straight into a buffer, without building a document
// per message.
#include <ostream>
#include <string>

#include "json_writer.h"
#include "key_text.h"
#include "output.h"
#include "tables.h"

namespace dpxdecode {
namespace {

using Writer = JsonWriter;

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
        w.raw(",").key("value").string(fieldValue(f));
        w.raw(",").key("selector").number(f.selector).raw(",").key("spans").raw("[");
        bool firstSpan = true;
        for (const SpanOut &s : f.spans) {
            w.raw(firstSpan ? "[" : ",[").number(s.firstBit).raw(",").number(s.lastBit).raw(",").number(s.value).raw("]");
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
    static thread_local KeyText text;
    common(w, k);
    w.raw(",").key("entries").raw("[");
    bool first = true;
    for (const KeyEntryOut &e : k.entries) {
        w.raw(first ? "{" : ",{").key("index").number(e.index).raw(",").key("name").string(keyEntryName(e.index));
        w.raw(",").key("value").string(e.value).raw(",").key("bits").number(e.bits);
        if (keyText(e, text))
            w.raw(",").key("text").string(text.text);
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
        const auto gt = [&w](const char *name, const capture::GlobalTitle &g) {
            w.raw(",").key(name);
            if (g.size == 0)
                w.raw("null");
            else
                w.string(std::string(g.digits, g.size));
        };
        gt("calledGt", c.calledGt);
        gt("callingGt", c.callingGt);
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
