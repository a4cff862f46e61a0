// dpx-decode end to end: the built executable is run on the bundled samples
// and on hand-made input, and its text and JSON output, diagnostics and exit
// status are checked.  The key-buffer reader it is built from is checked on
// hand-made buffers first.

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>
#include <sys/wait.h>

#include <algorithm>
#include <cstdio>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

#include "../../tools/dpx-decode/input/hex_line.h"
#include "../../tools/dpx-decode/key_layout.h"
#include "support/dpx_decode_run.h"

namespace {

using nlohmann::json;
using Lines = std::vector<std::string>;

// Sets the presence bit of a key entry and writes its slot.
void mark(std::vector<uint8_t> &buf, uint32_t entry, std::vector<uint8_t> slot) {
    buf[entry / 8] |= uint8_t(1u << (entry % 8));
    std::copy(slot.begin(), slot.end(), buf.begin() + HOST_KEY_SLOT_BASE + 4 * entry);
}

Lines show(const std::vector<dpxdecode::KeyEntryOut> &entries) {
    Lines got;
    for (const auto &e : entries)
        got.push_back(std::to_string(e.index) + ":" + e.value + "/" + std::to_string(e.bits) +
                      (e.overflow ? " overflow" : ""));
    return got;
}

TEST(DpxDecodeKeys, PresentEntriesAreReadInTheirStoredFormWithinTheBuffer) {
    std::vector<uint8_t> buf(256, 0);
    mark(buf, 0, {0x62, 0xEE});         // octet: one byte
    mark(buf, 20, {0x10, 0x00});        // word: both bytes
    mark(buf, 26, {12, 0, 200, 0});     // variable: 12 bits at 200
    mark(buf, 21, {0, 0, 0x2C, 0x81});  // variable that did not fit
    mark(buf, 29, {64, 0, 252, 0});     // 8 bytes wanted, 4 there
    mark(buf, 17, {16, 0, 0xA0, 0x0F}); // wholly outside
    mark(buf, 30, {0x99});              // an entry the module never sets
    buf[HOST_KEY_SLOT_BASE + 4] = 0x77; // entry 1 without its presence bit
    buf[200] = 0xAB;
    buf[201] = 0xC0;
    buf[252] = 0x01;
    buf[255] = 0x04;
    EXPECT_EQ(show(dpxdecode::readKeyEntries(buf.data(), uint32_t(buf.size()))), (Lines{"0:62/8", "17:/16", "20:1000/16", "21:/0 overflow", "26:ABC0/12", "29:01000004/64",
                          "30:/0"}));
}

// One key-entry vector read into again and again, as dpx-decode's session
// does: a message with fewer or shorter entries shows nothing of the one
// before.
TEST(DpxDecodeKeys, AReusedEntryListHoldsOnlyTheLastBuffersEntries) {
    std::vector<uint8_t> many(512, 0), few(512, 0);
    mark(many, 0, {0x65});
    mark(many, 17, {64, 0, 200, 0}); // 16 hex digits: longer than a short string holds
    mark(many, 21, {0, 0, 0x2C, 0x81});
    mark(many, 26, {32, 0, 208, 0});
    for (int i = 0; i < 12; ++i)
        many[200 + i] = uint8_t(0x11 * (i + 1));
    mark(few, 17, {8, 0, 128, 0});
    few[128] = 0x5A;
    std::vector<dpxdecode::KeyEntryOut> entries;
    dpxdecode::readKeyEntries(many.data(), 512, entries);
    EXPECT_EQ(show(entries), (Lines{"0:65/8", "17:1122334455667788/64", "21:/0 overflow", "26:99AABBCC/32"}));
    dpxdecode::readKeyEntries(few.data(), 512, entries);
    EXPECT_EQ(show(entries), (Lines{"17:5A/8"}));
    dpxdecode::readKeyEntries(many.data(), 512, entries);
    EXPECT_EQ(show(entries), show(dpxdecode::readKeyEntries(many.data(), 512)));
}

// One HexLine parsed into line after line: each result is that line's
// alone, whatever the line before held.
TEST(DpxDecodeHexLine, AReusedLineHoldsOnlyTheLastLinesMessageOrError) {
    struct Case {
        const char *line;
        dpxdecode::LineKind kind;
        const char *hexOrError;
    };
    using K = dpxdecode::LineKind;
    const Case cases[] = {
        {"62 0A:48 04\t0102A3fF 6B00  # comment 99", K::Message, "620A480401 02A3FF6B00"},
        {"a1", K::Message, "A1"},
        {"  # only a comment", K::Empty, ""},
        {"0102 030", K::Bad, "odd number of hex digits (7)"},
        {"\r", K::Empty, ""},
        {"01 02 0g", K::Bad, "bad character 'g' at column 8"},
        {"00\x01", K::Bad, "bad character byte 0x01 at column 3"},
        {"F0:0F", K::Message, "F00F"},
    };
    dpxdecode::HexLine l;
    for (const Case &c : cases) {
        SCOPED_TRACE(c.line);
        dpxdecode::parseHexLine(c.line, l);
        EXPECT_EQ(l.kind, c.kind);
        std::string want = c.hexOrError;
        if (c.kind == K::Bad) {
            EXPECT_EQ(l.error, want);
            EXPECT_TRUE(l.bytes.empty());
        } else {
            want.erase(std::remove(want.begin(), want.end(), ' '), want.end());
            EXPECT_EQ(dpxdecode::toHex(l.bytes), want);
            EXPECT_EQ(l.error, "");
        }
    }
}

using dpxtest::Outcome;
using dpxtest::quote;
using dpxtest::run;
using dpxtest::tempFile;

TEST(DpxDecodeRun, JsonOfTheSamplesFollowsTheSchema) {
    const std::string samples = DPX_SOURCE_DIR "/samples/messages.txt";
    std::vector<std::string> hex;
    std::ifstream in(samples);
    for (std::string line; std::getline(in, line);)
        if (const auto l = dpxdecode::parseHexLine(line); l.kind == dpxdecode::LineKind::Message)
            hex.push_back(dpxdecode::toHex(l.bytes));
    ASSERT_GE(hex.size(), 5u);
    const Outcome r = run("--format json " + quote(samples));
    ASSERT_EQ(r.status, 0) << r.err;
    EXPECT_EQ(r.err, "");
    const std::vector<json> objects = r.objects();
    ASSERT_EQ(objects.size(), hex.size());

    // Every message with the member of each pass (the passes' agreement over
    // the samples is checked by the samples test).
    for (size_t i = 0; i < objects.size(); ++i) {
        const json &o = objects[i];
        SCOPED_TRACE(hex[i]);
        EXPECT_EQ(o["index"], i);
        EXPECT_EQ(o["hex"], hex[i]);
        for (const char *pass : {"md", "display", "view", "keys"}) {
            EXPECT_EQ(o[pass]["result"], 1) << pass;
            EXPECT_EQ(o[pass]["errorFlags"], o["md"]["errorFlags"]) << pass;
        }
        EXPECT_EQ(o["view"]["status"], o["md"]["errorFlags"] == 0 ? 0 : DPX_STATUS_INVALID);
    }

    ASSERT_EQ(hex[0], "6206480401020304"); // the first sample in full
    const json &o = objects[0];
    EXPECT_EQ(o["md"]["layer"], json::parse(R"({"first":1,"last":64})"));
    EXPECT_EQ(o["md"]["fields"][0],
              json::parse(R"({"id":3604,"label":"MT","text":"MT=Begin","value":"Begin","selector":0,"spans":[[1,8,98]]})"));
    EXPECT_EQ(o["display"]["fields"][0], json::parse(R"({"displayId":3604,"text":"Begin","label":"MT"})"));
    EXPECT_EQ(o["keys"]["entries"][1],
              json::parse(
                  R"({"index":26,"name":"Originating Transaction Id","value":"01020304","bits":32,"text":"01020304"})"));
}

// The session reuses its state, key buffer and the host's records from
// message to message: every message must decode as if it came first.  All
// samples are run forward and backward, and each message's four passes
// must agree between the two runs.
TEST(DpxDecodeRun, EachMessageDecodesTheSameWhateverCameBefore) {
    std::string forward;
    std::vector<std::string> lines;
    for (const char *name : {"messages", "malformed", "call_control", "charging", "gprs", "sms", "components",
                             "dialogue", "results"}) {
        std::ifstream in(std::string(DPX_SOURCE_DIR "/samples/") + name + ".txt");
        for (std::string line; std::getline(in, line);)
            if (dpxdecode::parseHexLine(line).kind == dpxdecode::LineKind::Message)
                lines.push_back(line);
    }
    ASSERT_GE(lines.size(), 50u);
    std::string backward;
    for (size_t i = 0; i < lines.size(); ++i) {
        forward += lines[i] + "\n";
        backward += lines[lines.size() - 1 - i] + "\n";
    }
    const Outcome a = run("--format json -", forward);
    const Outcome b = run("--format json -", backward);
    ASSERT_EQ(a.status, b.status);
    std::vector<json> first = a.objects(), second = b.objects();
    ASSERT_EQ(first.size(), lines.size());
    ASSERT_EQ(second.size(), lines.size());
    for (size_t i = 0; i < lines.size(); ++i) {
        json x = first[i], y = second[lines.size() - 1 - i];
        x.erase("index");
        y.erase("index");
        EXPECT_EQ(x, y) << lines[i];
    }
}

TEST(DpxDecodeRun, TextShowsFieldLinesVerdictAndKeys) {
    const Outcome r =
        run("--fields list --pass md,display,view,keys --hex 6206480401020304 --hex '62 06 49 04 01 02 03 04'");
    ASSERT_EQ(r.status, 0) << r.err;
    const Lines lines = r.lines();
    ASSERT_GE(lines.size(), 14u);
    EXPECT_EQ(Lines(lines.begin(), lines.begin() + 14),
              (Lines{"message 0: 6206480401020304", "MT=Begin", "LENGTH=6 octet(s)", "Originating Trans Id Tag=48",
                     "LENGTH=4 octet(s)", "  Originating Transaction Id=01020304", "display: 5 values",
                     "view: valid", "key 0 MT: 62", "key 26 Originating Transaction Id: 01020304 (32 bits)", "",
                     "message 1: 6206490401020304", "MT=Begin", "LENGTH=6 octet(s)"}));
    // The destination id where the originating id belongs.
    EXPECT_NE(r.out.find("view: invalid: mandatory element missing, left-over bits skipped\n"),
              std::string::npos) << r.out;

    const Lines spans = run("--spans --pass md --fields list --hex 6206480401020304").lines();
    ASSERT_GE(spans.size(), 6u);
    EXPECT_EQ(spans[1], "MT=Begin  [1-8]=98");
    EXPECT_EQ(spans[2], "LENGTH=6 octet(s)  [9-16]=6");
    EXPECT_EQ(spans[5].rfind("  Originating Transaction Id=01020304  [37-40]=0 [33-36]=1 ", 0), 0u) << spans[5];
}

TEST(DpxDecodeRun, OnlySelectedPassesRunAndShow) {
    for (const auto &[passes, members] : std::vector<std::pair<std::string, Lines>>{
             {"md", {"md"}}, {"view,keys", {"view", "keys"}}, {"keys,display", {"display", "keys"}}}) {
        const Outcome r = run("--format json --pass " + passes + " --hex 6206480401020304");
        ASSERT_EQ(r.status, 0) << r.err;
        const auto o = nlohmann::ordered_json::parse(r.out);
        Lines keys;
        for (const auto &item : o.items())
            keys.push_back(item.key());
        Lines want{"index", "hex"};
        want.insert(want.end(), members.begin(), members.end());
        EXPECT_EQ(keys, want) << passes;
    }
    const std::string module = quote(DPX_BUILD_DIR "/3gpp_camel_400_DLL.so");
    EXPECT_EQ(run("--pass view --module " + module + " --hex 6206480401020304").out,
              "message 0: 6206480401020304\nview: valid\n\n");
    const Outcome bad = run("--pass md,nonsense --hex 62");
    EXPECT_EQ(bad.status, 64);
    EXPECT_EQ(bad.out, "");
}

TEST(DpxDecodeRun, BadLinesAreReportedAndTheRestIsDecoded) {
    const std::string file = tempFile("input.txt", "# first a comment\n"
                                                   "62 06 48:04\t01 02 03 04\r\n"
                                                   "62 06 48 04 01 02 03 0\n"
                                                   "\n"
                                                   "62 06 48 04 01 02 03 0G\n"
                                                   "67:09:49:04:aa:bb:cc:dd:4a:01:01  # abort\n"
                                                   "62\x01\n");
    const Outcome r = run("--format json " + quote(file));
    EXPECT_EQ(r.status, 1);
    EXPECT_EQ(r.err, "dpx-decode: " + file + ":3: odd number of hex digits (15)\n" +
                         "dpx-decode: " + file + ":5: bad character 'G' at column 23\n" +
                         "dpx-decode: " + file + ":7: bad character byte 0x01 at column 3\n");
    const std::vector<json> o = r.objects();
    ASSERT_EQ(o.size(), 2u);
    EXPECT_EQ(o[0]["hex"], "6206480401020304");
    EXPECT_EQ(o[1]["index"], 1);
    EXPECT_EQ(o[1]["hex"], "67094904AABBCCDD4A0101");

    const Outcome hexArg = run("--pass view --hex 620 --hex '62064804010203 04'");
    EXPECT_EQ(hexArg.status, 1);
    EXPECT_EQ(hexArg.err, "dpx-decode: --hex #1: odd number of hex digits (3)\n");
    EXPECT_EQ(hexArg.out, "message 0: 6206480401020304\nview: valid\n\n");

    // A missing file does not stop the next one; '-' reads standard input.
    const Outcome missing = run("--pass view " + quote(file + ".absent") + " " + quote(file) + " -", "zz\n6104\n");
    EXPECT_EQ(missing.status, 1);
    EXPECT_NE(missing.err.find(file + ".absent: "), std::string::npos) << missing.err;
    EXPECT_NE(missing.err.find("<stdin>:1: bad character 'z'"), std::string::npos) << missing.err;
    EXPECT_NE(missing.out.find("message 2: 6104\n"), std::string::npos) << missing.out;

    const Outcome implicit = run("--format json --pass view", "6206480401020304\n# c\n6104\n");
    EXPECT_EQ(implicit.status, 0) << implicit.err;
    EXPECT_EQ(implicit.objects().size(), 2u);
}

TEST(DpxDecodeRun, ModuleThatCannotBeLoadedExitsWithTwo) {
    for (const auto &[module, error] : std::vector<std::pair<std::string, std::string>>{
             {::testing::TempDir() + "no-such-module.so", "cannot load module"},
             {DPX_BUILD_DIR "/libkf_OptSupport.so", "dpx_PreDecodeMD"}}) {
        // The module is loaded once, before any worker starts.
        for (const char *jobs : {"--jobs 1", "--jobs 4"}) {
            const Outcome r = run(std::string(jobs) + " --module " + quote(module) + " --hex 6206480401020304");
            EXPECT_EQ(r.status, 2) << module;
            EXPECT_EQ(r.out, "");
            EXPECT_NE(r.err.find(error), std::string::npos) << r.err;
        }
    }
}

} // namespace
