#include <nlohmann/json.hpp>

#include <ostream>

#include "output.h"

namespace dpxdecode {
namespace {

using Json = nlohmann::ordered_json;

Json common(const PassOutcome &p) {
    return Json{{"result", p.result}, {"remainingBits", p.remainingBits}, {"errorFlags", p.errorFlags}};
}

Json mdJson(const MdOut &md) {
    Json j = common(md);
    j["layer"] = Json{{"first", md.layerFirst}, {"last", md.layerLast}};
    Json fields = Json::array();
    for (const DecodedOut &f : md.fields) {
        Json spans = Json::array();
        for (const SpanOut &s : f.spans)
            spans.push_back(Json::array({s.first, s.last, s.value}));
        fields.push_back(Json{{"id", f.id},
                              {"label", f.label},
                              {"text", f.text},
                              {"selector", f.selector},
                              {"spans", std::move(spans)}});
    }
    j["fields"] = std::move(fields);
    return j;
}

Json displayJson(const DisplayPassOut &d) {
    Json j = common(d);
    Json fields = Json::array();
    for (const DisplayOut &f : d.fields)
        fields.push_back(Json{{"displayId", f.displayId}, {"text", f.text}});
    j["fields"] = std::move(fields);
    return j;
}

Json viewJson(const ViewOut &v) {
    Json j = common(v);
    j["status"] = v.status;
    return j;
}

Json keysJson(const KeysOut &k) {
    Json j = common(k);
    Json entries = Json::array();
    for (const KeyEntryOut &e : k.entries) {
        Json entry{{"index", e.index}, {"name", keyEntryName(e.index)}, {"value", e.value}, {"bits", e.bits}};
        if (e.overflow)
            entry["overflow"] = true;
        entries.push_back(std::move(entry));
    }
    j["entries"] = std::move(entries);
    return j;
}

} // namespace

void writeJson(std::ostream &os, uint64_t index, const std::string &hex, const MessageResult &r,
               const CaptureOrigin *origin) {
    Json j{{"index", index}, {"hex", hex}};
    if (origin != nullptr) {
        const capture::TcapMessage &c = origin->carrier;
        j["frame"] = origin->frame;
        j["time"] = formatTime(origin->seconds, origin->nanoseconds);
        j["opc"] = c.hasPointCodes ? Json(c.opc) : Json(nullptr);
        j["dpc"] = c.hasPointCodes ? Json(c.dpc) : Json(nullptr);
        j["calledSsn"] = c.hasCalledSsn ? Json(c.calledSsn) : Json(nullptr);
        j["callingSsn"] = c.hasCallingSsn ? Json(c.callingSsn) : Json(nullptr);
    }
    if (r.md)
        j["md"] = mdJson(*r.md);
    if (r.display)
        j["display"] = displayJson(*r.display);
    if (r.view)
        j["view"] = viewJson(*r.view);
    if (r.keys)
        j["keys"] = keysJson(*r.keys);
    // Field texts are the module's bytes; anything that is not UTF-8 is
    // replaced rather than aborting the output.
    os << j.dump(-1, ' ', false, Json::error_handler_t::replace) << '\n';
}

} // namespace dpxdecode
