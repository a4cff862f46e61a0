// Time per message of each pass over a generated corpus of every operation.
//
// The corpus is DPX_BENCH_CORPUS (a file of hex messages, one a line) when
// that is set, else 5,000 random messages of every operation, message type
// and component kind made by the reference generator
// (../shared/tools/capgen.py corpus, seed 1), else the bundled samples
// (samples/*.txt), which cover far fewer operations; the benchmark's label
// says which.  Each message is decoded the way dpx-decode's session does it:
// one decoding state and request reused for every message, the host's
// records cleared before each pass, so memory stays flat however long the
// benchmark runs.  `time/message` is the figure to compare; callgrind gives
// instructions per message on a busy machine.

#include <benchmark/benchmark.h>
#include <unistd.h>

#include <algorithm>
#include <climits>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

#include "../tools/dpx-decode/input/hex_line.h"
#include "dpx_camel.h"
#include "dpx_standin_host.h"

namespace {

namespace fs = std::filesystem;

fs::path sourceDir() {
#ifdef DPX_SOURCE_DIR
    return fs::path(DPX_SOURCE_DIR);
#else
    // build/<preset>/camel_bench -> the source directory
    char exe[PATH_MAX];
    const ssize_t n = readlink("/proc/self/exe", exe, sizeof exe - 1);
    const fs::path self = n > 0 ? fs::path(std::string(exe, static_cast<size_t>(n))) : fs::path(".");
    return self.parent_path() / ".." / "..";
#endif
}

struct Corpus {
    std::vector<std::vector<uint8_t>> messages;
    std::string source; // where the messages came from
};

void addLines(std::istream &in, Corpus &c) {
    dpxdecode::HexLine l;
    for (std::string line; std::getline(in, line);) {
        dpxdecode::parseHexLine(line, l);
        if (l.kind == dpxdecode::LineKind::Message)
            c.messages.push_back(l.bytes);
    }
}

bool fromGenerator(Corpus &c) {
    const fs::path capgen = sourceDir() / ".." / "shared" / "tools" / "capgen.py";
    std::error_code ec;
    if (!fs::exists(capgen, ec))
        return false;
    const std::string command = "python3 '" + capgen.string() + "' corpus -n 5000 --seed 1 --no-comments";
    FILE *pipe = popen(command.c_str(), "r");
    if (pipe == nullptr)
        return false;
    std::string text;
    char chunk[1 << 16];
    for (size_t n; (n = std::fread(chunk, 1, sizeof chunk, pipe)) > 0;)
        text.append(chunk, n);
    if (pclose(pipe) != 0)
        return false;
    std::istringstream in(text);
    addLines(in, c);
    c.source = "capgen corpus -n 5000 --seed 1";
    return !c.messages.empty();
}

Corpus loadCorpus() {
    Corpus c;
    if (const char *file = std::getenv("DPX_BENCH_CORPUS"); file != nullptr && *file != '\0') {
        std::ifstream in(file);
        addLines(in, c);
        c.source = file;
        return c;
    }
    if (fromGenerator(c))
        return c;
    c.messages.clear();
    std::vector<fs::path> files;
    std::error_code ec;
    for (const fs::directory_entry &e : fs::directory_iterator(sourceDir() / "samples", ec))
        if (e.path().extension() == ".txt")
            files.push_back(e.path());
    std::sort(files.begin(), files.end());
    for (const fs::path &file : files) {
        std::ifstream in(file);
        addLines(in, c);
    }
    c.source = "samples/*.txt (capgen.py not found)";
    return c;
}

const Corpus &corpus() {
    static const Corpus c = loadCorpus();
    return c;
}

// One state and one request, pointed at message after message as
// dpx-decode's session does.
class Session {
public:
    Session() : state_(host_NewState(nullptr, 0)) {
        if (state_ == nullptr)
            return;
        own_ = state_->buffer;
        host_InitRequest(&request_, state_, 1, 0);
    }
    ~Session() {
        if (state_ == nullptr)
            return;
        host_FreeRequest(&request_);
        state_->buffer = own_;
        host_FreeState(state_);
    }
    Session(const Session &) = delete;
    Session &operator=(const Session &) = delete;

    bool ok() const { return state_ != nullptr; }

    PreDecodeRequest &prepare(const std::vector<uint8_t> &m) {
        state_->buffer = m.data();
        state_->totalBits = static_cast<uint32_t>(m.size() * 8);
        host_ResetState(state_);
        request_.layerIndex = 0;
        request_.status = 0;
        request_.remainingBits = 0;
        return request_;
    }
    DecodeState *state() { return state_; }

private:
    DecodeState *state_;
    const uint8_t *own_ = nullptr;
    PreDecodeRequest request_{};
};

void finish(benchmark::State &state, const Corpus &c, int64_t failed, double fields) {
    const double messages = static_cast<double>(c.messages.size());
    const double calls = static_cast<double>(state.iterations()) * messages;
    state.SetItemsProcessed(state.iterations() * static_cast<int64_t>(c.messages.size()));
    state.SetLabel(c.source);
    state.counters["messages"] = messages;
    state.counters["failed"] = static_cast<double>(failed);
    if (fields > 0)
        state.counters["fields/message"] = fields / messages;
    // After the warm-up sweep the host's arrays are large enough: a pass
    // should grow nothing.
    state.counters["reallocs/message"] = calls > 0 ? host_ReallocCalls() / calls : 0.0;
    // Seconds per message (shown with an SI prefix: 9.5u is 9.5 microseconds).
    state.counters["time/message"] = benchmark::Counter(messages, benchmark::Counter::kIsIterationInvariantRate |
                                                                      benchmark::Counter::kInvert);
}

// Runs `one` over every message once as a warm-up, then per iteration.
template <class One>
void sweepCorpus(benchmark::State &state, One one) {
    const Corpus &c = corpus();
    Session s;
    if (c.messages.empty() || !s.ok()) {
        state.SkipWithError(c.messages.empty() ? "no messages in the corpus" : "host_NewState failed");
        return;
    }
    int64_t failed = 0;
    double fields = 0;
    for (const std::vector<uint8_t> &m : c.messages)
        fields += one(s, m, failed);
    failed = 0;
    host_SetReallocFailAt(0);
    for (auto _ : state)
        for (const std::vector<uint8_t> &m : c.messages)
            one(s, m, failed);
    finish(state, c, failed, fields);
}

// The decoded-field, display and message-view passes; returns the fields
// the host recorded.
template <uint8_t (*Pass)(PreDecodeRequest *), void (*Clear)(), uint32_t (*Count)()>
void BM_PreDecode(benchmark::State &state) {
    sweepCorpus(state, [](Session &s, const std::vector<uint8_t> &m, int64_t &failed) {
        Clear();
        const uint8_t ok = Pass(&s.prepare(m));
        benchmark::DoNotOptimize(ok);
        failed += ok != 1;
        return Count();
    });
}

uint32_t noCount() { return 0; }
void noClear() {}

void BM_KeyFieldPass(benchmark::State &state) {
    constexpr uint32_t kBufferSize = 4096;
    std::vector<uint8_t> buffer(kBufferSize, 0);
    sweepCorpus(state, [&buffer](Session &s, const std::vector<uint8_t> &m, int64_t &failed) {
        s.prepare(m);
        KeyFieldRequest rq{};
        rq.keyBuffer = buffer.data();
        rq.dataOffset = HOST_KEY_DATA_START;
        rq.valueRoom = kBufferSize - HOST_KEY_DATA_START;
        rq.state = s.state();
        const int32_t ok = KFE_3gpp_camel_400(&rq);
        benchmark::DoNotOptimize(ok);
        benchmark::ClobberMemory();
        failed += ok != 1;
        // Zero what this call wrote: presence bits, slots and the data
        // area up to where the values ended (all of it after a failure).
        const size_t used = ok == 1 ? std::max<size_t>(rq.dataOffset, HOST_KEY_DATA_START) : kBufferSize;
        std::memset(buffer.data(), 0, std::min<size_t>(used, kBufferSize));
        return 0u;
    });
}

BENCHMARK(BM_PreDecode<dpx_PreDecodeMD, host_ClearDecodedRecords, host_DecodedCount>)->Name("BM_DecodedFieldPass");
BENCHMARK(BM_PreDecode<dpx_PreDecodeTO, host_ClearDisplayRecords, host_DisplayCount>)->Name("BM_DisplayPass");
BENCHMARK(BM_PreDecode<dpx_PreDecodeMV, noClear, noCount>)->Name("BM_MessageViewPass");
BENCHMARK(BM_KeyFieldPass);

} // namespace
