// dpx-decode --jobs N: messages decoded by worker processes come out in
// input order, byte for byte as with --jobs 1, in every view: the samples
// and sample captures together, a generated capture of many batches, and
// input with a message too large for a batch.  Statistics, dialogues,
// response times, the flow picture and relative times depend on the
// messages before, so they are in the table too.

#include <gtest/gtest.h>

#include <fstream>
#include <sstream>
#include <string>
#include <vector>

#include "parallel/records.h"
#include "support/capture_frames.h"
#include "support/dpx_decode_run.h"

namespace {

namespace cw = capwrite;
using dpxtest::quote;

std::string slurp(const std::string &path) {
    std::ostringstream s;
    s << std::ifstream(path, std::ios::binary).rdbuf();
    return s.str();
}

std::vector<cw::Bytes> sampleMessages() {
    std::vector<cw::Bytes> messages;
    std::ifstream in(DPX_SOURCE_DIR "/samples/callflow.hex");
    for (std::string line; std::getline(in, line);) {
        if (line.empty() || line[0] == '#')
            continue;
        cw::Bytes m;
        for (size_t i = 0; i + 1 < line.size(); i += 2)
            m.push_back(uint8_t(std::stoi(line.substr(i, 2), nullptr, 16)));
        messages.push_back(m);
    }
    return messages;
}

// The sample call flow 40 times over (many batches), each message in its
// own frame, both directions, a millisecond apart.
std::string generatedCapture() {
    const std::vector<cw::Bytes> flow = sampleMessages();
    std::vector<std::pair<uint64_t, cw::Bytes>> frames;
    for (size_t i = 0; i < flow.size() * 40; ++i) {
        const bool forward = i % 2 == 0;
        const cw::RoutingLabel label{forward ? 100u : 200u, forward ? 200u : 100u, 0, 2, false};
        frames.emplace_back(captest::kStart + i * 1000000,
                            captest::m3uaFrame(flow[i % flow.size()], label, {146, false, 0}, {146, false, 0},
                                               uint32_t(i + 1), uint16_t(i), forward));
    }
    const cw::Bytes bytes = cw::captureBytes(cw::FileOptions{}, frames);
    return dpxtest::tempFile("generated.pcap", std::string(bytes.begin(), bytes.end()));
}

TEST(DpxDecodeJobs, OutputIsTheSameWithAnyNumberOfWorkers) {
    std::string samples;
    for (const char *f : {"messages.txt", "call_control.txt", "charging.txt", "components.txt", "dialogue.txt",
                          "gprs.txt", "malformed.txt", "results.txt", "sms.txt", "callflow-m3ua.pcap",
                          "callflow-mtp2.pcapng"})
        samples += quote(std::string(DPX_SOURCE_DIR "/samples/") + f) + ' ';
    // A message larger than a batch holds, among small ones.
    std::string large;
    for (int i = 0; i < 300; ++i)
        large += "6206480401020304\n";
    large += "62" + std::string(2 * (1 << 20) + 2, '4') + "\n";
    for (int i = 0; i < 300; ++i)
        large += "640649040102030" + std::to_string(i % 10) + "\n";
    const struct {
        const char *name;
        std::string files;
        std::vector<std::string> modes;
    } inputs[] = {
        {"samples and captures, three times", samples + samples + samples,
         {"", "--fields all --spans --time relative", "--format json", "--format ek", "--summary --time epoch",
          "--summary --format json --match type=Begin", "--stats --format json", "--stats srt",
          "--dialogues --pass md,keys", "--match imsi~2 --time relative --summary --pass view"}},
        {"generated capture", quote(generatedCapture()),
         {"--fields list", "--format json --pass md,display,view,keys", "--format ek", "--summary --time relative",
          "--stats", "--stats srt --format json", "--dialogues --format json", "--match imsi~2620 --dialogues",
          "--match operation=InitialDP --time relative --summary --stats"}},
        {"a message beyond a batch", quote(dpxtest::tempFile("large.txt", large)),
         {"--pass md,keys", "--summary --stats"}},
    };
    const std::string flow = ::testing::TempDir() + "dpx_decode_jobs_" + std::to_string(getpid()) + ".svg";
    for (const auto &input : inputs) {
        for (const std::string &mode : input.modes) {
            const dpxtest::Outcome one = dpxtest::run("--jobs 1 " + mode + ' ' + input.files);
            ASSERT_FALSE(one.out.empty()) << input.name << ": " << mode;
            for (const char *jobs : {"--jobs 2 ", "--jobs 4 "}) {
                const dpxtest::Outcome many = dpxtest::run(jobs + mode + ' ' + input.files);
                EXPECT_EQ(many.status, one.status) << input.name << ": " << jobs << mode;
                EXPECT_EQ(many.err, one.err) << input.name << ": " << jobs << mode;
                EXPECT_TRUE(many.out == one.out) << input.name << ": " << jobs << mode;
            }
        }
        // The call-flow picture is drawn from the dialogues in order.
        ASSERT_EQ(dpxtest::run("--jobs 1 --flow " + quote(flow) + ' ' + input.files).status,
                  dpxtest::run("--jobs 4 --flow " + quote(flow + "4") + ' ' + input.files).status);
        EXPECT_TRUE(slurp(flow) == slurp(flow + "4")) << input.name;
    }
}

// What a worker sends back reads as it was written, into objects that held
// more before; cut short anywhere, it is refused without reading beyond.
TEST(DpxDecodeJobs, FactsAndSummariesSurviveTheTripBack) {
    namespace dl = dpxdecode::dialogues;
    dl::MessageFacts f;
    f.index = 41;
    f.hasOrigin = true;
    f.frame = 7;
    f.seconds = -3;
    f.nanoseconds = 999999999;
    f.from = dl::End{true, 0x3FFF, true, 146};
    f.type = dl::MessageType::Continue;
    f.otid = "0a0b";
    f.components = {{dl::Component::Kind::Error, true, -128, 7, "unknownLegID"}, {}};
    f.imsi = "262011234567890";
    f.causes = {{31, 22, "normal, unspecified"}};
    f.eventTypes = {{4, 23, "routeSelectFailure"}, {7, -1, ""}};
    f.hasServiceKey = true;
    f.serviceKey = 0xFFFFFFFF;
    f.applicationContext = "0.4.0.0.1.21.3.4";
    f.capVersion = 3;
    dpxdecode::MessageSummary s;
    s.type = "End";
    s.errorFlags = 0x81;
    s.components.resize(3);
    s.componentCount = 2;
    s.components[1].kind = dpxdecode::ComponentSummary::Kind::Reject;
    s.components[1].event = "a, b";
    s.components[1].eventCount = 2;
    std::string bytes;
    dpxdecode::parallel::putFacts(bytes, f);
    dpxdecode::parallel::putSummary(bytes, s);

    dl::MessageFacts f2;
    f2.components.resize(5);
    f2.causes.resize(3);
    dpxdecode::MessageSummary s2;
    s2.components.resize(6);
    s2.componentCount = 6;
    size_t pos = 0;
    ASSERT_TRUE(dpxdecode::parallel::getFacts(bytes.data(), bytes.size(), pos, f2));
    ASSERT_TRUE(dpxdecode::parallel::getSummary(bytes.data(), bytes.size(), pos, s2));
    EXPECT_EQ(pos, bytes.size());
    std::string again;
    dpxdecode::parallel::putFacts(again, f2);
    dpxdecode::parallel::putSummary(again, s2);
    EXPECT_TRUE(again == bytes);
    EXPECT_EQ(s2.componentCount, 2u);

    for (size_t cut = 0; cut < bytes.size(); ++cut) {
        // A copy of exactly `cut` bytes, so a read beyond is caught.
        const std::vector<char> part(bytes.begin(), bytes.begin() + long(cut));
        size_t at = 0;
        const bool whole = dpxdecode::parallel::getFacts(part.data(), cut, at, f2) &&
                           dpxdecode::parallel::getSummary(part.data(), cut, at, s2);
        EXPECT_FALSE(whole) << cut;
        EXPECT_LE(at, cut);
    }
}

TEST(DpxDecodeJobs, JobsOutsideItsRangeAreAUsageError) {
    for (const char *jobs : {"0", "33", "many"})
        EXPECT_EQ(dpxtest::run(std::string("--jobs ") + jobs + " --hex 6206480401020304").status, 64) << jobs;
}

} // namespace
