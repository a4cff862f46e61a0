// dpx-decode on capture files built in memory with the capture writer:
// where each message came from in text and JSON, standard input, captures
// without CAMEL traffic, and damaged captures
// (every frame before the damage decoded, then exit status 3 with the
// frame number).

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <cstdio>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

#include "support/capture_frames.h"
#include "support/dpx_decode_run.h"

namespace {

namespace cw = capwrite;
using cw::Bytes;
using nlohmann::json;
using Lines = std::vector<std::string>;

const Bytes kBegin{0x62, 0x06, 0x48, 0x04, 0x01, 0x02, 0x03, 0x04};
const Bytes kEnd{0x64, 0x06, 0x49, 0x04, 0x01, 0x02, 0x03, 0x04};

using dpxtest::Outcome;
using dpxtest::quote;

std::string tempFile(const std::string &name, const Bytes &content) {
    return dpxtest::tempFile(name, std::string(content.begin(), content.end()));
}

Outcome run(const std::string &args, const Bytes &input = {}) {
    return dpxtest::run(args, std::string(input.begin(), input.end()));
}

// Frame i carries `messages[i]` (empty: an ARP frame) over
// Ethernet/IPv4/SCTP/M3UA/SCCP UDT, one millisecond apart.
Bytes capture(const std::vector<Bytes> &messages, cw::FileFormat format = cw::FileFormat::Pcap) {
    std::vector<std::pair<uint64_t, Bytes>> frames;
    for (size_t i = 0; i < messages.size(); ++i) {
        const Bytes frame = messages[i].empty() ? cw::ethernet(captest::kMacB, captest::kMacA, 0x0806, Bytes(28, 0))
                                                : captest::m3uaFrame(messages[i], {100, 200, 0, 2, false}, {146, false, 0},
                                                                     {147, false, 0}, uint32_t(i + 1), uint16_t(i));
        frames.emplace_back(captest::kStart + i * 1000000, frame);
    }
    cw::FileOptions options;
    options.format = format;
    return cw::captureBytes(options, frames);
}

class DpxDecodeCapture : public ::testing::Test {};

TEST_F(DpxDecodeCapture, JsonAndTextSayWhereEachMessageCameFrom) {
    for (const cw::FileFormat format : {cw::FileFormat::Pcap, cw::FileFormat::Pcapng}) {
        const std::string file = tempFile("two", capture({{}, kBegin, kEnd}, format));
        const Outcome j = run("--format json --pass view " + quote(file));
        ASSERT_EQ(j.status, 0) << j.err;
        const Lines lines = j.lines();
        ASSERT_EQ(lines.size(), 2u);
        const auto first = nlohmann::ordered_json::parse(lines[0]);
        Lines members;
        for (const auto &item : first.items())
            members.push_back(item.key());
        EXPECT_EQ(members, (Lines{"index", "hex", "frame", "time", "opc", "dpc", "calledSsn", "callingSsn", "calledGt",
                                  "callingGt", "view"}));
        EXPECT_EQ(first["frame"], 2);
        EXPECT_EQ(first["time"], "1767225600.001000000");
        EXPECT_EQ(first["opc"], 100);
        EXPECT_EQ(first["dpc"], 200);
        EXPECT_EQ(first["calledSsn"], 146);
        EXPECT_EQ(first["callingSsn"], 147);
        EXPECT_EQ(first["hex"], "6206480401020304");
        EXPECT_EQ(json::parse(lines[1])["index"], 1);

        const Outcome t = run("--pass view " + quote(file));
        ASSERT_EQ(t.status, 0) << t.err;
        EXPECT_EQ(t.out, "frame 2 at 2026-01-01T00:00:00.001000Z: opc 100, dpc 200, called SSN 146, calling SSN 147, "
                         "called GT -, calling GT -\n"
                         "message 0: 6206480401020304\nview: valid\n\n"
                         "frame 3 at 2026-01-01T00:00:00.002000Z: opc 100, dpc 200, called SSN 146, calling SSN 147, "
                         "called GT -, calling GT -\n"
                         "message 1: 6406490401020304\nview: valid\n\n");
    }
}

TEST_F(DpxDecodeCapture, StandardInputMayHoldACaptureOrHex) {
    const Outcome c = run("--pass view -", capture({kBegin}));
    EXPECT_EQ(c.status, 0) << c.err;
    EXPECT_NE(c.out.find("frame 1 at "), std::string::npos) << c.out;
    const std::string hex = "6206480401020304\n";
    const Outcome h = run("--pass view", Bytes(hex.begin(), hex.end()));
    EXPECT_EQ(h.status, 0) << h.err;
    EXPECT_EQ(h.out, "message 0: 6206480401020304\nview: valid\n\n");
}

TEST_F(DpxDecodeCapture, CaptureWithoutCamelSaysWhatItHoldsAndExitsWithFour) {
    const std::string arp = tempFile("arp", capture({{}, {}}));
    const Outcome r = run(quote(arp));
    EXPECT_EQ(r.status, 4) << r.err;
    EXPECT_EQ(r.out, "");
    EXPECT_EQ(r.err, "dpx-decode: " + arp + ": no CAMEL message in 2 frames\n" + "dpx-decode: " + arp +
                         ":   skipped: link: neither IP nor SS7: 2\n");
    // SCCP messages to SSN 146, but --ssn takes only 7.
    const std::string flow = tempFile("flow", capture({kBegin, kEnd}));
    const Outcome s = run("--ssn 7 " + quote(flow));
    EXPECT_EQ(s.status, 4) << s.err;
    EXPECT_NE(s.err.find(":   2 SCCP messages: 2 to SSN 146; taken: SSN 7 only\n"), std::string::npos) << s.err;
    // One capture with CAMEL and one without: the status still says so.
    EXPECT_EQ(run(quote(flow) + " " + quote(arp)).status, 4);
    EXPECT_EQ(run(quote(flow)).status, 0);
}

TEST_F(DpxDecodeCapture, DamagedCaptureDecodesTheFramesBeforeAndExitsWithThree) {
    const Bytes whole = capture({kBegin, kEnd, kBegin});
    const Bytes twoFrames = capture({kBegin, kEnd});
    const Bytes oneFrame = capture({kBegin});
    Bytes badLength = twoFrames;
    // The second record's captured length (at 16 + header + data + 8) far
    // beyond any snap length.
    const size_t secondRecord = oneFrame.size();
    badLength[secondRecord + 8] = 0xFF;
    badLength[secondRecord + 9] = 0xFF;
    badLength[secondRecord + 10] = 0xFF;
    const struct {
        const char *name;
        Bytes file;
        size_t messages;
        const char *frame;
    } cases[] = {
        {"cut in the third record header", Bytes(whole.begin(), whole.begin() + long(twoFrames.size() + 5)), 2,
         "frame 3: "},
        {"cut in the third frame", Bytes(whole.begin(), whole.end() - 7), 2, "frame 3: "},
        {"second record too long", badLength, 1, "frame 2: "},
        {"cut in the file header", Bytes(whole.begin(), whole.begin() + 10), 0, "frame 1: "},
    };
    for (const auto &c : cases) {
        SCOPED_TRACE(c.name);
        const std::string file = tempFile("damaged", c.file);
        const Outcome r = run("--pass view " + quote(file));
        EXPECT_EQ(r.status, 3) << r.err;
        EXPECT_EQ(r.lines().size(), 4 * c.messages); // frame, message, verdict, blank
        EXPECT_NE(r.err.find("dpx-decode: " + file + ": " + c.frame), std::string::npos) << r.err;
    }
    // The next file is still read, as a capture of its own (same TSNs); the
    // exit status stays 3.
    const std::string good = tempFile("good", oneFrame);
    const Outcome r = run("--pass view " + quote(tempFile("cut", Bytes(whole.begin(), whole.end() - 1))) + " " +
                          quote(good));
    EXPECT_EQ(r.status, 3);
    EXPECT_EQ(r.lines().size(), 4u * 3);
}

TEST_F(DpxDecodeCapture, BadSsnListIsAUsageError) {
    for (const char *list : {"x", "300", "5-2", "1,", "-3"}) {
        const Outcome r = run(std::string("--ssn ") + quote(list) + " --hex 62");
        EXPECT_EQ(r.status, 64) << list;
    }
    EXPECT_EQ(run("--ssn 6-8,146 --hex 6206480401020304 --pass view").status, 0);
}

} // namespace
