// dpx-decode end to end: the built executable is run on the bundled samples
// and on hand-made input, and its text and JSON output, diagnostics and exit
// status are checked.  The input-line and key-buffer readers it is built
// from are checked directly first.

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>
#include <sys/wait.h>

#include <cstdio>
#include <cstring>
#include <fstream>
#include <map>
#include <sstream>
#include <string>
#include <vector>

#include "../../tools/dpx-decode/hex_line.h"
#include "../../tools/dpx-decode/key_layout.h"

namespace {

using nlohmann::json;

// ---- input lines -------------------------------------------------------------------

TEST(DpxDecodeInput, LinesAreReadAsOneMessageEach) {
    struct Case {
        const char *line;
        dpxdecode::LineKind kind;
        const char *hex;   // normalised message when kind is Message
        const char *error; // part of the error when kind is Bad
    };
    using dpxdecode::LineKind;
    const Case cases[] = {
        {"6206480401020304", LineKind::Message, "6206480401020304", ""},
        {"62 06 48:04\t01 02 03 04\r", LineKind::Message, "6206480401020304", ""},
        {"  aa:BB:cC  # trailing comment 12", LineKind::Message, "AABBCC", ""},
        {"", LineKind::Empty, "", ""},
        {"   \t ", LineKind::Empty, "", ""},
        {"# 62 06 only a comment", LineKind::Empty, "", ""},
        {"620", LineKind::Bad, "", "odd number of hex digits (3)"},
        {"62 0 # 6", LineKind::Bad, "", "odd number of hex digits (3)"},
        {"62 0g 00", LineKind::Bad, "", "bad character 'g' at column 5"},
        {"0x62", LineKind::Bad, "", "bad character 'x' at column 2"},
        {"62\x01", LineKind::Bad, "", "bad character byte 0x01 at column 3"},
    };
    for (const Case &c : cases) {
        SCOPED_TRACE(c.line);
        const dpxdecode::HexLine got = dpxdecode::parseHexLine(c.line);
        EXPECT_EQ(got.kind, c.kind);
        EXPECT_EQ(dpxdecode::toHex(got.bytes), c.hex);
        EXPECT_NE(got.error.find(c.error), std::string::npos) << got.error;
    }
}

// ---- key buffer --------------------------------------------------------------------

void setPresent(std::vector<uint8_t> &buf, uint32_t entry) { buf[entry / 8] |= uint8_t(1u << (entry % 8)); }

uint32_t slotOf(uint32_t entry) { return HOST_KEY_SLOT_BASE + HOST_KEY_SLOT_SIZE * entry; }

void setVariable(std::vector<uint8_t> &buf, uint32_t entry, uint16_t bits, uint16_t offset) {
    const uint32_t slot = slotOf(entry);
    buf[slot] = uint8_t(bits);
    buf[slot + 1] = uint8_t(bits >> 8);
    buf[slot + 2] = uint8_t(offset);
    buf[slot + 3] = uint8_t(offset >> 8);
}

TEST(DpxDecodeKeys, PresentEntriesAreReadInTheirStoredForm) {
    std::vector<uint8_t> buf(dpxdecode::kKeyBufferSize, 0);
    setPresent(buf, 0); // octet
    buf[slotOf(0)] = 0x62;
    buf[slotOf(0) + 1] = 0xEE; // not part of an octet key
    setPresent(buf, 20); // word: both bytes as stored
    buf[slotOf(20)] = 0x10;
    setPresent(buf, 26); // variable: 12 bits -> 2 bytes at the data offset
    setVariable(buf, 26, 12, 200);
    buf[200] = 0xAB;
    buf[201] = 0xC0;
    buf[202] = 0xFF;
    setPresent(buf, 21); // variable that did not fit
    setVariable(buf, 21, 0, DPX_KEY_OVERFLOW_BIT | 300);
    setPresent(buf, 30); // an entry the module never sets: no value
    buf[slotOf(30)] = 0x99;
    buf[slotOf(1)] = 0x77; // value without presence bit: not shown

    const std::vector<dpxdecode::KeyEntryOut> got = dpxdecode::readKeyEntries(buf.data(), uint32_t(buf.size()));
    ASSERT_EQ(got.size(), 5u);
    EXPECT_EQ(got[0].index, 0u);
    EXPECT_EQ(got[0].value, "62");
    EXPECT_EQ(got[0].bits, 8u);
    EXPECT_EQ(got[1].index, 20u);
    EXPECT_EQ(got[1].value, "1000");
    EXPECT_EQ(got[1].bits, 16u);
    EXPECT_EQ(got[2].index, 21u);
    EXPECT_TRUE(got[2].overflow);
    EXPECT_EQ(got[2].value, "");
    EXPECT_EQ(got[3].index, 26u);
    EXPECT_EQ(got[3].value, "ABC0");
    EXPECT_EQ(got[3].bits, 12u);
    EXPECT_FALSE(got[3].overflow);
    EXPECT_EQ(got[4].index, 30u);
    EXPECT_EQ(got[4].value, "");
    EXPECT_EQ(got[4].bits, 0u);
}

TEST(DpxDecodeKeys, ValueReachingPastTheBufferIsCutAtItsEnd) {
    std::vector<uint8_t> buf(256, 0);
    setPresent(buf, 29);
    setVariable(buf, 29, 64, 252); // 8 bytes wanted, 4 there
    buf[252] = 0x01;
    buf[255] = 0x04;
    setPresent(buf, 17);
    setVariable(buf, 17, 16, 4000); // wholly outside
    const auto got = dpxdecode::readKeyEntries(buf.data(), uint32_t(buf.size()));
    ASSERT_EQ(got.size(), 2u);
    EXPECT_EQ(got[0].value, "");
    EXPECT_EQ(got[1].value, "01000004");
    EXPECT_EQ(got[1].bits, 64u);
}

// ---- running the executable ----------------------------------------------------------

struct Outcome {
    int status = -1; // exit status, or -1 when it did not exit normally
    std::string out;
    std::string err;
    std::vector<std::string> outLines() const {
        std::vector<std::string> lines;
        std::istringstream in(out);
        for (std::string l; std::getline(in, l);)
            lines.push_back(l);
        return lines;
    }
};

std::string quote(const std::string &s) {
    std::string q = "'";
    for (char c : s) {
        if (c == '\'')
            q += "'\\''";
        else
            q += c;
    }
    return q + "'";
}

std::string tempPath(const std::string &name) {
    const ::testing::TestInfo *t = ::testing::UnitTest::GetInstance()->current_test_info();
    return ::testing::TempDir() + "dpx_decode_" + t->name() + "_" + name;
}

std::string writeTemp(const std::string &name, const std::string &content) {
    const std::string path = tempPath(name);
    std::ofstream(path, std::ios::binary) << content;
    return path;
}

std::string readFile(const std::string &path) {
    std::ifstream in(path, std::ios::binary);
    std::ostringstream s;
    s << in.rdbuf();
    return s.str();
}

// Runs dpx-decode with `args` (already quoted as needed), standard input
// from `stdinText`.
Outcome runDecode(const std::string &args, const std::string &stdinText = "") {
    const std::string in = writeTemp("stdin", stdinText);
    const std::string errPath = tempPath("stderr");
    const std::string cmd = quote(std::string(DPX_BUILD_DIR) + "/dpx-decode") + " " + args + " <" + quote(in) +
                            " 2>" + quote(errPath);
    Outcome r;
    FILE *p = popen(cmd.c_str(), "r");
    if (p == nullptr)
        return r;
    char buf[4096];
    for (size_t n; (n = fread(buf, 1, sizeof buf, p)) > 0;)
        r.out.append(buf, n);
    const int st = pclose(p);
    r.status = WIFEXITED(st) ? WEXITSTATUS(st) : -1;
    r.err = readFile(errPath);
    return r;
}

std::vector<json> jsonLines(const Outcome &r) {
    std::vector<json> objects;
    for (const std::string &line : r.outLines()) {
        EXPECT_TRUE(json::accept(line)) << line;
        if (json::accept(line))
            objects.push_back(json::parse(line));
    }
    return objects;
}

const std::string kSamples = std::string(DPX_SOURCE_DIR) + "/samples/messages.txt";

// The messages of the sample file, normalised as dpx-decode shows them.
std::vector<std::string> sampleHex() {
    std::vector<std::string> hex;
    std::ifstream in(kSamples);
    for (std::string line; std::getline(in, line);) {
        const dpxdecode::HexLine l = dpxdecode::parseHexLine(line);
        if (l.kind == dpxdecode::LineKind::Message)
            hex.push_back(dpxdecode::toHex(l.bytes));
    }
    return hex;
}

const std::map<std::string, std::string> kTypeNames = {
    {"61", "Unidirectional"}, {"62", "Begin"}, {"64", "End"}, {"65", "Continue"}, {"67", "Abort"}};

bool endsWith(const std::string &s, const std::string &tail) {
    return s.size() >= tail.size() && s.compare(s.size() - tail.size(), tail.size(), tail) == 0;
}

TEST(DpxDecodeRun, JsonOfTheSamplesFollowsTheSchema) {
    const std::vector<std::string> hex = sampleHex();
    ASSERT_GE(hex.size(), 5u);
    const Outcome r = runDecode("--format json " + quote(kSamples));
    ASSERT_EQ(r.status, 0) << r.err;
    EXPECT_EQ(r.err, "");
    const std::vector<json> objects = jsonLines(r);
    ASSERT_EQ(objects.size(), hex.size());

    std::map<std::string, int> typesSeen;
    for (size_t i = 0; i < objects.size(); ++i) {
        const json &o = objects[i];
        SCOPED_TRACE(hex[i]);
        EXPECT_EQ(o["index"], i);
        EXPECT_EQ(o["hex"], hex[i]);
        for (const char *pass : {"md", "display", "view", "keys"}) {
            ASSERT_TRUE(o.contains(pass)) << pass;
            EXPECT_EQ(o[pass]["result"], 1) << pass;
            for (const char *key : {"remainingBits", "errorFlags"})
                EXPECT_TRUE(o[pass][key].is_number_unsigned()) << pass << "." << key;
        }
        const json &md = o["md"];
        ASSERT_FALSE(md["fields"].empty());
        for (const json &f : md["fields"]) {
            for (const char *key : {"id", "label", "text", "selector", "spans"})
                ASSERT_TRUE(f.contains(key)) << key;
            for (const json &s : f["spans"]) {
                ASSERT_EQ(s.size(), 3u);
                EXPECT_LE(s[0].get<uint32_t>(), s[1].get<uint32_t>());
            }
        }
        EXPECT_EQ(md["layer"]["first"], 1);

        // Every message starts with its type, bits 1 to 8.
        const std::string type = hex[i].substr(0, 2);
        ASSERT_TRUE(kTypeNames.count(type)) << type;
        const json &mt = md["fields"][0];
        EXPECT_EQ(mt["id"], 3604);
        EXPECT_EQ(mt["label"], "MT");
        EXPECT_EQ(mt["text"], "MT=" + kTypeNames.at(type));
        EXPECT_EQ(mt["spans"], json::parse("[[1,8," + std::to_string(std::stoi(type, nullptr, 16)) + "]]"));
        ++typesSeen[type];

        // The passes walk the same bits and reach the same verdict: one
        // display value per decoded field, the same flags everywhere.
        const json &display = o["display"]["fields"];
        ASSERT_EQ(display.size(), md["fields"].size());
        for (size_t k = 0; k < display.size(); ++k) {
            EXPECT_TRUE(display[k].contains("displayId"));
            EXPECT_TRUE(endsWith(md["fields"][k]["text"], display[k]["text"]))
                << md["fields"][k]["text"] << " / " << display[k]["text"];
        }
        for (const char *pass : {"display", "view", "keys"}) {
            EXPECT_EQ(o[pass]["errorFlags"], md["errorFlags"]) << pass;
            EXPECT_EQ(o[pass]["remainingBits"], md["remainingBits"]) << pass;
        }
        EXPECT_EQ(o["view"]["status"], md["errorFlags"] == 0 ? 0 : DPX_STATUS_INVALID);

        const json &keys = o["keys"]["entries"];
        ASSERT_FALSE(keys.empty());
        EXPECT_EQ(keys[0], json::parse(R"({"index":0,"name":"MT","value":")" + type + R"(","bits":8})"));
    }
    EXPECT_EQ(typesSeen.size(), kTypeNames.size()) << "samples cover every message type";
}

TEST(DpxDecodeRun, MessageLevelExamplesDecodeExactly) {
    const Outcome r = runDecode("--format json --hex '62 06 48 04 01 02 03 04' --hex '67 09 49 04 aa bb cc dd 4a 01 01'");
    ASSERT_EQ(r.status, 0) << r.err;
    const std::vector<json> o = jsonLines(r);
    ASSERT_EQ(o.size(), 2u);

    EXPECT_EQ(o[0]["hex"], "6206480401020304");
    EXPECT_EQ(o[0]["md"]["layer"], json::parse(R"({"first":1,"last":64})"));
    EXPECT_EQ(o[0]["md"]["fields"][0],
              json::parse(R"({"id":3604,"label":"MT","text":"MT=Begin","selector":0,"spans":[[1,8,98]]})"));
    const json &otid = o[0]["md"]["fields"].back();
    EXPECT_EQ(otid["id"], 3653);
    EXPECT_EQ(otid["text"], "  Originating Transaction Id=01020304");
    EXPECT_EQ(o[0]["display"]["fields"][0], json::parse(R"({"displayId":3604,"text":"Begin"})"));
    EXPECT_EQ(o[0]["view"], json::parse(R"({"result":1,"remainingBits":0,"errorFlags":0,"status":0})"));
    EXPECT_EQ(o[0]["keys"]["entries"], json::parse(R"([{"index":0,"name":"MT","value":"62","bits":8},
        {"index":26,"name":"Originating Transaction Id","value":"01020304","bits":32}])"));

    EXPECT_EQ(o[1]["index"], 1);
    EXPECT_EQ(o[1]["hex"], "67094904AABBCCDD4A0101");
    EXPECT_EQ(o[1]["md"]["fields"].back()["text"], "  P-Abort Cause=Unrecognized Transaction ID");
    EXPECT_EQ(o[1]["keys"]["entries"], json::parse(R"([{"index":0,"name":"MT","value":"67","bits":8},
        {"index":3,"name":"P-Abort Cause","value":"01","bits":8},
        {"index":29,"name":"Destination Transaction Id","value":"AABBCCDD","bits":32}])"));
}

TEST(DpxDecodeRun, TextShowsFieldLinesVerdictAndKeys) {
    const Outcome r = runDecode("--hex 6206480401020304 --hex '62 06 49 04 01 02 03 04'");
    ASSERT_EQ(r.status, 0) << r.err;
    const std::vector<std::string> lines = r.outLines();
    const std::vector<std::string> first(lines.begin(), lines.begin() + 11);
    EXPECT_EQ(first, (std::vector<std::string>{
                         "message 0: 6206480401020304",
                         "MT=Begin",
                         "LENGTH=6 octet(s)",
                         "Originating Trans Id Tag=48",
                         "LENGTH=4 octet(s)",
                         "  Originating Transaction Id=01020304",
                         "display: 5 values",
                         "view: valid",
                         "key 0 MT: 62",
                         "key 26 Originating Transaction Id: 01020304 (32 bits)",
                         "",
                     }));
    // The destination id where the originating id belongs: mandatory element
    // missing, and the rest of the message is left over.
    EXPECT_NE(r.out.find("message 1: 6206490401020304\nMT=Begin\n"), std::string::npos);
    EXPECT_NE(r.out.find("view: invalid: mandatory element missing, left-over bits skipped\n"),
              std::string::npos)
        << r.out;
}

TEST(DpxDecodeRun, SpansFollowEachFieldLine) {
    const Outcome r = runDecode("--spans --pass md --hex 6206480401020304");
    ASSERT_EQ(r.status, 0) << r.err;
    const std::vector<std::string> lines = r.outLines();
    ASSERT_GE(lines.size(), 6u);
    EXPECT_EQ(lines[1], "MT=Begin  [1-8]=98");
    EXPECT_EQ(lines[2], "LENGTH=6 octet(s)  [9-16]=6");
    EXPECT_EQ(lines[5].rfind("  Originating Transaction Id=01020304  [37-40]=0 [33-36]=1 ", 0), 0u) << lines[5];
}

TEST(DpxDecodeRun, OnlySelectedPassesRunAndShow) {
    struct Case {
        const char *passes;
        std::vector<std::string> present;
    };
    const Case cases[] = {
        {"md", {"md"}},
        {"view,keys", {"view", "keys"}},
        {"keys,display", {"display", "keys"}},
        {"md,display,view,keys", {"md", "display", "view", "keys"}},
    };
    for (const Case &c : cases) {
        SCOPED_TRACE(c.passes);
        const Outcome r = runDecode(std::string("--format json --pass ") + c.passes + " --hex 6206480401020304");
        ASSERT_EQ(r.status, 0) << r.err;
        // Members in the documented order.
        const nlohmann::ordered_json o = nlohmann::ordered_json::parse(r.out);
        std::vector<std::string> keys;
        for (auto it = o.begin(); it != o.end(); ++it)
            keys.push_back(it.key());
        std::vector<std::string> want{"index", "hex"};
        want.insert(want.end(), c.present.begin(), c.present.end());
        EXPECT_EQ(keys, want);
    }

    const Outcome view = runDecode("--pass view --hex 6206480401020304");
    EXPECT_EQ(view.out, "message 0: 6206480401020304\nview: valid\n\n");
    const Outcome md = runDecode("--pass md --hex 6206480401020304");
    EXPECT_EQ(md.out.find("view:"), std::string::npos);
    EXPECT_EQ(md.out.find("key "), std::string::npos);
    EXPECT_NE(md.out.find("MT=Begin"), std::string::npos);

    const Outcome bad = runDecode("--pass md,nonsense --hex 62");
    EXPECT_EQ(bad.status, 64);
    EXPECT_EQ(bad.out, "");
}

TEST(DpxDecodeRun, BadLinesAreReportedAndTheRestIsDecoded) {
    const std::string file = writeTemp("input.txt",
                                       "# first a comment\n"
                                       "6206480401020304\n"
                                       "62 06 48 04 01 02 03 0\n"
                                       "\n"
                                       "62 06 48 04 01 02 03 0G\n"
                                       "67:09:49:04:aa:bb:cc:dd:4a:01:01  # abort\n");
    const Outcome r = runDecode("--format json " + quote(file));
    EXPECT_EQ(r.status, 1);
    EXPECT_NE(r.err.find(file + ":3: odd number of hex digits (15)"), std::string::npos) << r.err;
    EXPECT_NE(r.err.find(file + ":5: bad character 'G' at column 23"), std::string::npos) << r.err;
    const std::vector<json> o = jsonLines(r);
    ASSERT_EQ(o.size(), 2u);
    EXPECT_EQ(o[0]["index"], 0);
    EXPECT_EQ(o[0]["hex"], "6206480401020304");
    EXPECT_EQ(o[1]["index"], 1);
    EXPECT_EQ(o[1]["hex"], "67094904AABBCCDD4A0101");

    const Outcome hexArg = runDecode("--pass view --hex 620 --hex '62064804010203 04'");
    EXPECT_EQ(hexArg.status, 1);
    EXPECT_NE(hexArg.err.find("--hex #1: odd number of hex digits (3)"), std::string::npos) << hexArg.err;

    const Outcome missing = runDecode("--pass view " + quote(tempPath("absent.txt")) + " " + quote(file));
    EXPECT_EQ(missing.status, 1);
    EXPECT_NE(missing.err.find("absent.txt"), std::string::npos);
    EXPECT_NE(missing.out.find("message 1: 67094904AABBCCDD4A0101"), std::string::npos) << missing.out;
}

TEST(DpxDecodeRun, StandardInputWhenNoOtherInputOrDash) {
    const std::string input = "6206480401020304\n# c\n67094904AABBCCDD4A0101\n";
    const Outcome implicit = runDecode("--format json --pass view", input);
    EXPECT_EQ(implicit.status, 0) << implicit.err;
    EXPECT_EQ(jsonLines(implicit).size(), 2u);

    const std::string file = writeTemp("one.txt", "6104\n");
    const Outcome dash = runDecode("--format json --pass view " + quote(file) + " -", input);
    EXPECT_EQ(dash.status, 0) << dash.err;
    const std::vector<json> o = jsonLines(dash);
    ASSERT_EQ(o.size(), 3u);
    EXPECT_EQ(o[0]["hex"], "6104");
    EXPECT_EQ(o[2]["hex"], "67094904AABBCCDD4A0101");
    EXPECT_EQ(o[2]["index"], 2);

    const Outcome badStdin = runDecode("--pass view", "zz\n");
    EXPECT_EQ(badStdin.status, 1);
    EXPECT_NE(badStdin.err.find("<stdin>:1: bad character 'z'"), std::string::npos) << badStdin.err;
}

TEST(DpxDecodeRun, ModuleThatCannotBeLoadedExitsWithTwo) {
    const Outcome absent = runDecode("--module " + quote(tempPath("no-such-module.so")) + " --hex 6206480401020304");
    EXPECT_EQ(absent.status, 2);
    EXPECT_EQ(absent.out, "");
    EXPECT_NE(absent.err.find("cannot load module"), std::string::npos) << absent.err;

    // A loadable library that is not the decoder module.
    const Outcome notModule = runDecode("--module " + quote(std::string(DPX_BUILD_DIR) + "/libkf_OptSupport.so") +
                                    " --hex 6206480401020304");
    EXPECT_EQ(notModule.status, 2);
    EXPECT_NE(notModule.err.find("dpx_PreDecodeMD"), std::string::npos) << notModule.err;

    const Outcome explicitModule = runDecode("--pass view --module " +
                                         quote(std::string(DPX_BUILD_DIR) + "/3gpp_camel_400_DLL.so") +
                                         " --hex 6206480401020304");
    EXPECT_EQ(explicitModule.status, 0) << explicitModule.err;
    EXPECT_EQ(explicitModule.out, "message 0: 6206480401020304\nview: valid\n\n");
}

} // namespace
