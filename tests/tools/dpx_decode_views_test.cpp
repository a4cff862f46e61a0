// dpx-decode's views for people and for indexing, end to end: the readable
// field tree, the summary and statistics, JSON values and key texts, the
// bulk-index documents and the global-title digits of captured addresses.
// Exact output for a few messages; over every sample, invariants that tie
// each view to what the decoded-field and key-field passes reported.

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <fstream>
#include <map>
#include <string>
#include <vector>

#include "../../tools/dpx-decode/carriers/sccp.h"
#include "fields/field_table.h"
#include "support/dpx_decode_run.h"

namespace {

using nlohmann::json;
using Lines = std::vector<std::string>;
using dpxtest::Outcome;
using dpxtest::quote;
using dpxtest::run;

const std::string kSamples = DPX_SOURCE_DIR "/samples/";
const std::string kCapture = kSamples + "callflow-m3ua.pcap";
const std::string kInitialDp = "62484804010203046B1E281C060700118605010101A011600F80020780A1090607040000010032016C20A11E0"
                               "20101020100301680010782068410942143059F320862021132547698F0";

std::string allSampleFiles() {
    std::string files;
    for (const char *f : {"messages.txt", "call_control.txt", "charging.txt", "components.txt", "dialogue.txt",
                          "malformed.txt", "results.txt"})
        files += quote(kSamples + f) + " ";
    return files;
}

// Messages of a text output, each as its lines without the header and the
// closing blank line.
std::vector<Lines> messages(const Outcome &r) {
    std::vector<Lines> out;
    for (const std::string &l : r.lines()) {
        if (l.rfind("message ", 0) == 0)
            out.emplace_back();
        else if (!l.empty() && !out.empty())
            out.back().push_back(l);
    }
    return out;
}

std::string trimmed(const std::string &s) { return s.substr(std::min(s.find_first_not_of(' '), s.size())); }

enum class Kind { Value, Tag, Structure };

Kind kindOf(uint32_t id) {
    const size_t i = camel::fieldIndex(id);
    if (id == camel::fid::kEndOfContents)
        return Kind::Structure;
    if (i == camel::kFieldCount)
        return Kind::Value;
    switch (camel::kFields[i].render) {
    case camel::Render::Tag:
        return Kind::Tag;
    case camel::Render::LenHeader:
    case camel::Render::LenBlock:
        return Kind::Structure;
    default:
        return Kind::Value;
    }
}

std::string valueOf(const json &f) {
    const std::string text = f["text"];
    return text.substr(text.find('=') + 1);
}

TEST(DpxDecodeViews, ReadableViewOfAMessage) {
    const Outcome r = run("--hex " + kInitialDp + " --hex 6206480401020304");
    ASSERT_EQ(r.status, 0) << r.err;
    EXPECT_EQ(r.out, "message 0: " + kInitialDp + "\n" + R"(MT: Begin
Originating Transaction Id: 01020304
Dialogue Portion
  External
    Object Identifier
      CCITT recommendation: 0
      q: 11
      773: 86
      Space Character: 5
      as(1): 1
      DialoguePDU: 1
      version1(1): 1
    Single ASN.1 Type
      Dialogue PDU: DialogueRequest
      Protocol Version: 780
      Application Context Name
        Object Identifier
          Application Context Name CCITT recommendation: 4
          etsi: 0
          mobile Domain: 0
          umts/gsm Network: 1
          cap: ac_id
          dialoguePDU: cap gsmssf to gsmscf
          version: 2
Component Portion
  Invoke
    Invoke Id: 1
    Operation Code Tag: Local Operation Code
    Operation ID(Invoke): Initial DP
    Sequence
      Service Key: 7
      Called Party Number
        Nature Of Address Ind: International Number
        Odd/even Indicator: Odd
        Spare: 0
        Numbering Plan Indicator: ISDN/telephony
        Internal Network Num Ind: Routing to Innallowed
        Called Party Num: 4912345
        Filler: 0
      IMSI
        IMSI Digits: 262011234567890
        filler: f

message 1: 6206480401020304
MT: Begin
Originating Transaction Id: 01020304

)");
    // An indefinite component portion holds its components up to its
    // end-of-contents; a code without a name shows its number; flags.
    const Outcome indefinite =
        run("--hex 652548040102030449040A0B0C0D6C80A106020101020137A203020102A3060201030201090000 "
            "--hex '62 07 48 05 01 02 03 04 05' --spans");
    ASSERT_EQ(indefinite.status, 0) << indefinite.err;
    EXPECT_EQ(messages(indefinite), (std::vector<Lines>{
                                        {"MT: Continue  [1-8]=101",
                                         "Originating Transaction Id: 01020304  [37-40]=0 [33-36]=1 [45-48]=0 "
                                         "[41-44]=2 [53-56]=0 [49-52]=3 [61-64]=0 [57-60]=4",
                                         "Destination Transaction Id: 0a0b0c0d  [85-88]=0 [81-84]=10 [93-96]=0 "
                                         "[89-92]=11 [101-104]=0 [97-100]=12 [109-112]=0 [105-108]=13",
                                         "Component Portion  [113-120]=108", "  Invoke  [129-136]=161",
                                         "    Invoke Id: 1  [161-168]=1",
                                         "    Operation Code Tag: Local Operation Code  [169-176]=2",
                                         "    Operation ID(Invoke): Activity Test  [185-192]=55",
                                         "  Return Result (Last)  [193-200]=162", "    Invoke Id: 2  [225-232]=2",
                                         "  Return Error  [233-240]=163", "    Invoke Id: 3  [265-272]=3",
                                         "    Error Code Tag: Local Error Code  [273-280]=2",
                                         "    Error Code: (9)  [289-296]=9"},
                                        {"MT: Begin  [1-8]=98",
                                         "Originating Transaction Id: 01020304  [37-40]=0 [33-36]=1 [45-48]=0 "
                                         "[41-44]=2 [53-56]=0 [49-52]=3 [61-64]=0 [57-60]=4",
                                         "errors: left-over bits skipped"}}));
}

// Over every sample: --fields all shows each reported field once, in
// order, nested so that a line is at most one level deeper than the one
// before; the values view shows every value field of the decoded-field
// pass once, in order, and nothing else but the names of elements.
TEST(DpxDecodeViews, TreesShowWhatTheDecodedFieldPassReported) {
    const std::string files = allSampleFiles();
    const Outcome js = run("--format json --pass md " + files);
    const Outcome all = run("--fields all " + files);
    const Outcome values = run(files);
    const Outcome list = run("--fields list --pass md " + files);
    ASSERT_EQ(js.status, 0) << js.err;
    const std::vector<json> objects = js.objects();
    const std::vector<Lines> allTrees = messages(all), valueTrees = messages(values), lists = messages(list);
    ASSERT_EQ(allTrees.size(), objects.size());
    ASSERT_EQ(valueTrees.size(), objects.size());
    ASSERT_EQ(lists.size(), objects.size());
    size_t folded = 0;
    for (size_t m = 0; m < objects.size(); ++m) {
        SCOPED_TRACE(objects[m]["hex"].get<std::string>());
        const json &fields = objects[m]["md"]["fields"];
        const Lines &a = allTrees[m], &v = valueTrees[m];
        const bool flagged = objects[m]["md"]["errorFlags"] != 0;
        ASSERT_EQ(a.size(), fields.size() + (flagged ? 1 : 0));
        ASSERT_EQ(lists[m].size(), fields.size());
        size_t depth = 0, next = 0;
        for (size_t i = 0; i < fields.size(); ++i) {
            const json &f = fields[i];
            const std::string label = trimmed(f["label"]);
            const std::string value = valueOf(f);
            EXPECT_EQ(f["value"], value);
            EXPECT_EQ(lists[m][i], f["text"]);
            EXPECT_EQ(trimmed(a[i]), label.empty() ? value : label + ": " + value);
            const size_t d = (a[i].size() - trimmed(a[i]).size()) / 2;
            EXPECT_LE(d, depth + 1) << a[i];
            depth = d;
            switch (kindOf(f["id"])) {
            case Kind::Value: {
                ASSERT_LT(next, v.size()) << label;
                const std::string shown = value.empty() && f["spans"].size() == 1
                                              ? "(" + std::to_string(f["spans"][0][2].get<uint32_t>()) + ")"
                                              : value;
                EXPECT_EQ(trimmed(v[next++]), label.empty() ? shown : label + ": " + shown);
                break;
            }
            case Kind::Tag: {
                // The element's name, unless it holds one value only.
                const std::string name =
                    label.size() > 4 && label.substr(label.size() - 4) == " Tag" ? label.substr(0, label.size() - 4)
                                                                                 : label;
                if (next < v.size() && trimmed(v[next]) == name)
                    ++next;
                ++folded;
                break;
            }
            case Kind::Structure:
                ++folded;
                break;
            }
        }
        if (flagged) {
            ASSERT_LT(next, v.size());
            EXPECT_EQ(v[next++].rfind("errors: ", 0), 0u);
        }
        EXPECT_EQ(next, v.size()) << "lines the decoded-field pass did not report";
    }
    EXPECT_GT(folded, objects.size() * 4); // the samples have tags and lengths to fold
}

TEST(DpxDecodeViews, SummaryNamesErrorsSubscribersAndTimes) {
    const Outcome r = run("--summary " + quote(kCapture));
    ASSERT_EQ(r.status, 0) << r.err;
    const Lines l = r.lines();
    ASSERT_GE(l.size(), 8u);
    EXPECT_EQ(l[0], "frame 4 2026-01-01T00:00:00.003000Z pc 1>2 ssn 146>146 gt ->- Begin otid=10000000 dtid=- "
                    "CAP v3 | invoke 1 Initial DP sk=1256 imsi=262012301289161 called=49542205879 "
                    "calling=491589062762 event=Collected Info.");
    EXPECT_EQ(l[7], "frame 8 2026-01-01T00:00:00.007000Z pc 2>1 ssn 146>146 gt ->- End otid=- dtid=10000002 | "
                    "error 1 Parameter Out Of Range");
    EXPECT_EQ(l[10], "frame 10 2026-01-01T00:00:00.009000Z pc 2>1 ssn 146>146 gt ->- End otid=- dtid=10000001 | "
                     "invoke 4 Release Call cause=User Busy (17)");

    // The same times in each form, the first message being the base of the
    // relative ones.
    for (const auto &[form, first, second] : std::vector<std::tuple<std::string, std::string, std::string>>{
             {"utc", "2026-01-01T00:00:00.003000Z", "2026-01-01T00:00:00.004000Z"},
             {"epoch", "1767225600.003000000", "1767225600.004000000"},
             {"relative", "0.000000", "0.001000"}}) {
        const Lines t = run("--summary --time " + form + " " + quote(kCapture)).lines();
        ASSERT_GE(t.size(), 2u);
        EXPECT_EQ(t[0].substr(0, 8 + first.size()), "frame 4 " + first) << form;
        EXPECT_EQ(t[1].substr(0, 8 + second.size()), "frame 5 " + second) << form;
        const Lines text = run("--pass view --time " + form + " " + quote(kCapture)).lines();
        EXPECT_EQ(text[0].rfind("frame 4 at " + first + ": opc 1, dpc 2, called SSN 146, calling SSN 146, "
                                                         "called GT -, calling GT -",
                                0),
                  0u)
            << text[0];
    }

    // JSON: one object a message, the statistics by name.
    const Outcome j = run("--summary --stats --format json " + quote(kCapture));
    ASSERT_EQ(j.status, 0) << j.err;
    const std::vector<json> o = j.objects();
    ASSERT_EQ(o.size(), l.size() + 1);
    EXPECT_EQ(o[0]["time"], "2026-01-01T00:00:00.003000Z");
    EXPECT_EQ(o[0]["capVersion"], "CAP v3");
    EXPECT_EQ(o[0]["calledGt"], nullptr);
    EXPECT_EQ(o[0]["components"][0]["imsi"], "262012301289161");
    EXPECT_EQ(o[0]["components"][0]["serviceKey"], "1256");
    EXPECT_EQ(o[7]["components"][0]["name"], "Parameter Out Of Range");
    const json &stats = o.back()["stats"];
    EXPECT_EQ(stats["errors"], json::parse(R"({"Missing Parameter":1,"Parameter Out Of Range":1})"));
    EXPECT_EQ(stats["operations"]["Initial DP"], 7);
    EXPECT_EQ(stats["causes"]["User Busy (17)"], 3);
}

// Every key entry's text against the decoded-field pass: digits and
// transaction ids as the field shows them, codes as the field's number.
TEST(DpxDecodeViews, KeyTextsAndBulkDocumentsCarryTheKeyFieldValues) {
    const std::string files = allSampleFiles() + quote(kCapture);
    const Outcome js = run("--format json --pass md,keys " + files);
    const Outcome ek = run("--format ek " + files);
    ASSERT_EQ(js.status, 0) << js.err;
    ASSERT_EQ(ek.status, 0) << ek.err;
    const std::vector<json> objects = js.objects();
    const Lines lines = ek.lines();
    ASSERT_EQ(lines.size(), 2 * objects.size());
    std::map<uint32_t, size_t> checked;
    for (size_t m = 0; m < objects.size(); ++m) {
        const json &o = objects[m];
        SCOPED_TRACE(o["hex"].get<std::string>());
        const json action = json::parse(lines[2 * m]);
        const json doc = json::parse(lines[2 * m + 1]);
        const bool captured = o.contains("frame");
        EXPECT_EQ(action, json({{"index", {{"_index", captured ? "dpx-camel-2026-01-01" : "dpx-camel"}}}}));
        EXPECT_EQ(doc["message"], m);
        EXPECT_EQ(doc["hex"], o["hex"]);
        EXPECT_EQ(doc.contains("@timestamp"), captured);
        if (captured) {
            EXPECT_EQ(doc["frame"], o["frame"]);
        }
        EXPECT_EQ(doc["errorFlags"], o["md"]["errorFlags"]);
        size_t keys = 0;
        for (const json &e : o["keys"]["entries"]) {
            if (e.contains("overflow"))
                continue;
            ++keys;
            const uint32_t entry = e["index"];
            // The last field that set this entry.
            const json *field = nullptr;
            for (const json &f : o["md"]["fields"]) {
                const size_t i = camel::fieldIndex(f["id"]);
                if (i < camel::kFieldCount && camel::kFields[i].keyEntry == int(entry))
                    field = &f;
            }
            ASSERT_NE(field, nullptr) << entry;
            const json &indexed = doc["keys"][e["name"].get<std::string>()];
            // An octet key read from one span is a code; one read from two
            // half-octet spans (a two-digit MNC) is digits.
            if (camel::kFields[camel::fieldIndex((*field)["id"])].keyForm == camel::KeyForm::Octet &&
                (*field)["spans"].size() == 1) {
                const uint32_t code = (*field)["spans"][0][2].get<uint32_t>() & 0xFF;
                EXPECT_EQ(e["text"], std::to_string(code));
                EXPECT_EQ(indexed["code"], code);
                if (camel::kFields[camel::fieldIndex((*field)["id"])].render == camel::Render::Enum &&
                    !valueOf(*field).empty()) {
                    EXPECT_EQ(indexed["name"], valueOf(*field));
                }
            } else {
                EXPECT_EQ(e["text"], valueOf(*field)) << entry;
                EXPECT_EQ(indexed, valueOf(*field)) << entry;
            }
            ++checked[entry];
        }
        EXPECT_EQ(doc["keys"].size(), keys);
    }
    // Codes, digits and transaction ids were all met.
    for (const uint32_t entry : {0u, 4u, 5u, 8u, 10u, 15u, 17u, 23u, 26u, 29u})
        EXPECT_GT(checked[entry], 0u) << entry;
}

TEST(DpxDecodeViews, BulkDocumentOfACallFlowMessage) {
    const Outcome r = run("--format ek " + quote(kCapture));
    ASSERT_EQ(r.status, 0) << r.err;
    const Lines l = r.lines();
    ASSERT_GE(l.size(), 16u);
    json want = json::parse(R"({"@timestamp":"2026-01-01T00:00:00.007000Z","source":"","message":7,
        "frame":8,"opc":2,"dpc":1,"calledSsn":146,"callingSsn":146,"calledGt":null,"callingGt":null,
        "type":"End","otid":null,"dtid":"10000002","capVersion":null,"abortCause":null,"operations":[],
        "results":[],"errors":["Parameter Out Of Range"],"rejects":[],"errorFlags":0,"flags":[],
        "keys":{"MT":{"code":100,"name":"End"},"Invoke Id":{"code":1},
                "Error Code":{"code":8,"name":"Parameter Out Of Range"},"Return Error":{"code":163},
                "Destination Transaction Id":"10000002"},
        "hex":"64104904100000026C08A306020101020108"})");
    want["source"] = kCapture;
    EXPECT_EQ(json::parse(l[15]), want);
    EXPECT_EQ(run("--format ek --stats " + quote(kCapture)).status, 64);
}

// Global-title digits of SCCP addresses: the indicator says what precedes
// the digits and whether an odd count leaves a filler.
TEST(DpxDecodeViews, GlobalTitleDigitsOfSccpAddresses) {
    namespace cap = dpxdecode::capture;
    const struct {
        const char *name;
        std::vector<uint8_t> called;
        bool ansi;
        const char *digits;
    } cases[] = {
        {"ITU GTI 4, odd", {0x12, 0x92, 0x00, 0x11, 0x04, 0x94, 0x21, 0x43, 0x05}, false, "4912345"},
        {"ITU GTI 4 after point code, even", {0x13, 0x01, 0x02, 0x92, 0x00, 0x12, 0x04, 0x94, 0x21}, false, "4912"},
        {"ITU GTI 1, odd", {0x06, 0x92, 0x84, 0x21, 0x03}, false, "123"},
        {"ITU GTI 2: every half-octet", {0x0A, 0x92, 0x07, 0x21, 0x43}, false, "1234"},
        {"ITU without global title", {0x42, 0x92}, false, ""},
        {"ANSI GTI 1, odd", {0x05, 0x92, 0x00, 0x11, 0x21, 0x03}, true, "123"},
    };
    for (const auto &c : cases) {
        SCOPED_TRACE(c.name);
        // UDT, class 0, pointers to called, calling and data.
        std::vector<uint8_t> m{0x09, 0x00, 0x03, uint8_t(3 + c.called.size()), uint8_t(5 + c.called.size()),
                               uint8_t(c.called.size())};
        m.insert(m.end(), c.called.begin(), c.called.end());
        // Calling: SSN only (the SSN indicator is bit 1 in ANSI, bit 2 in ITU).
        m.insert(m.end(), {0x02, uint8_t(c.ansi ? 0x41 : 0x42), 0x92, 0x02, 0x61, 0x00});
        const cap::SccpOut s = cap::parseSccp(cap::Bytes{m.data(), m.size()}, c.ansi);
        ASSERT_EQ(s.skip, cap::Skip::None);
        EXPECT_EQ(std::string(s.called.gt.digits, s.called.gt.size), c.digits);
        EXPECT_EQ(s.called.ssn, 0x92);
        EXPECT_EQ(s.calling.gt.size, 0);
        EXPECT_EQ(s.data.size, 2u);
    }
}

TEST(DpxDecodeViews, VersionNamesTheInterface) {
    const Outcome r = run("--version");
    EXPECT_EQ(r.status, 0) << r.err;
    const Lines l = r.lines();
    ASSERT_EQ(l.size(), 3u);
    EXPECT_EQ(l[0].rfind("dpx-decode ", 0), 0u);
    EXPECT_EQ(l[2], "interface version QZ1.02.01");
}

} // namespace
