// Messages per second of each pass over every bundled sample message
// (samples/*.txt).  Each message gets its decoding state and request once;
// an iteration resets them the way a host does before a call and runs the
// pass over all messages, so one iteration is one sweep of the samples.

#include <benchmark/benchmark.h>
#include <unistd.h>

#include <algorithm>
#include <climits>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

#include "../tools/dpx-decode/input/hex_line.h"
#include "dpx_camel.h"
#include "dpx_standin_host.h"

namespace {

namespace fs = std::filesystem;

fs::path samplesDir() {
#ifdef DPX_SOURCE_DIR
    return fs::path(DPX_SOURCE_DIR) / "samples";
#else
    // build/<preset>/camel_bench -> samples/
    char exe[PATH_MAX];
    const ssize_t n = readlink("/proc/self/exe", exe, sizeof exe - 1);
    const fs::path self = n > 0 ? fs::path(std::string(exe, static_cast<size_t>(n))) : fs::path(".");
    return self.parent_path() / ".." / ".." / "samples";
#endif
}

struct Corpus {
    std::vector<std::vector<uint8_t>> messages;
    std::string error; // why there are no messages
};

Corpus loadCorpus() {
    Corpus c;
    const fs::path dir = samplesDir();
    std::error_code ec;
    std::vector<fs::path> files;
    for (const fs::directory_entry &e : fs::directory_iterator(dir, ec))
        if (e.path().extension() == ".txt")
            files.push_back(e.path());
    std::sort(files.begin(), files.end());
    for (const fs::path &file : files) {
        std::ifstream in(file);
        for (std::string line; std::getline(in, line);) {
            dpxdecode::HexLine l = dpxdecode::parseHexLine(line);
            if (l.kind == dpxdecode::LineKind::Message)
                c.messages.push_back(std::move(l.bytes));
        }
    }
    if (c.messages.empty())
        c.error = "no sample messages in " + dir.string();
    return c;
}

const Corpus &corpus() {
    static const Corpus c = loadCorpus();
    return c;
}

// One decoding state and request per message, made once per benchmark.
struct Prepared {
    std::vector<DecodeState *> states;
    std::vector<PreDecodeRequest> requests;

    explicit Prepared(const Corpus &c) {
        states.reserve(c.messages.size());
        requests.resize(c.messages.size());
        for (size_t i = 0; i < c.messages.size(); ++i) {
            const std::vector<uint8_t> &m = c.messages[i];
            states.push_back(host_NewState(m.data(), static_cast<uint32_t>(m.size())));
            host_InitRequest(&requests[i], states.back(), 1, 0);
        }
    }
    ~Prepared() {
        for (PreDecodeRequest &r : requests)
            host_FreeRequest(&r);
        for (DecodeState *s : states)
            host_FreeState(s);
    }
    Prepared(const Prepared &) = delete;
    Prepared &operator=(const Prepared &) = delete;

    bool ok() const { return std::find(states.begin(), states.end(), nullptr) == states.end(); }
};

// Counts host array growth from here on (after a warm-up sweep, the
// states' arrays are large enough: a pass should grow nothing).
void startCountingReallocs() { host_SetReallocFailAt(0); }

void finish(benchmark::State &state, size_t messages, int64_t failed) {
    const double calls = static_cast<double>(state.iterations()) * static_cast<double>(messages);
    state.SetItemsProcessed(state.iterations() * static_cast<int64_t>(messages));
    state.counters["messages"] = static_cast<double>(messages);
    state.counters["failed"] = static_cast<double>(failed);
    state.counters["reallocsPerMessage"] = calls > 0 ? host_ReallocCalls() / calls : 0.0;
}

// Why a benchmark cannot run (empty when it can): the corpus could not be
// read, or a state could not be prepared.
const char *setupError(const Corpus &c, const Prepared &p) {
    if (!c.error.empty())
        return c.error.c_str();
    return p.ok() ? "" : "host_NewState failed";
}

// The decoded-field, display and message-view passes.
void runPreDecode(benchmark::State &state, uint8_t (*pass)(PreDecodeRequest *)) {
    const Corpus &c = corpus();
    Prepared p(c);
    if (const char *error = setupError(c, p); *error != '\0') {
        state.SkipWithError(error);
        return;
    }
    host_ClearRecords();
    int64_t failed = 0;
    const auto sweep = [&] {
        for (size_t i = 0; i < p.states.size(); ++i) {
            host_ResetState(p.states[i]);
            PreDecodeRequest &rq = p.requests[i];
            rq.layerIndex = 0;
            rq.status = 0;
            rq.remainingBits = 0;
            const uint8_t ok = pass(&rq);
            benchmark::DoNotOptimize(ok);
            failed += ok != 1;
        }
        // The stand-in host keeps every reported field; forget them after
        // each sweep so memory stays flat.
        host_ClearRecords();
    };
    sweep();
    failed = 0;
    startCountingReallocs();
    for (auto _ : state)
        sweep();
    finish(state, p.states.size(), failed);
}

void BM_DecodedFieldPass(benchmark::State &state) { runPreDecode(state, dpx_PreDecodeMD); }
void BM_DisplayPass(benchmark::State &state) { runPreDecode(state, dpx_PreDecodeTO); }
void BM_MessageViewPass(benchmark::State &state) { runPreDecode(state, dpx_PreDecodeMV); }

void BM_KeyFieldPass(benchmark::State &state) {
    constexpr uint32_t kBufferSize = 4096;
    const Corpus &c = corpus();
    Prepared p(c);
    if (const char *error = setupError(c, p); *error != '\0') {
        state.SkipWithError(error);
        return;
    }
    std::vector<uint8_t> buffer(kBufferSize, 0);
    int64_t failed = 0;
    const auto sweep = [&] {
        for (DecodeState *st : p.states) {
            host_ResetState(st);
            KeyFieldRequest rq{};
            rq.keyBuffer = buffer.data();
            rq.dataOffset = HOST_KEY_DATA_START;
            rq.valueRoom = kBufferSize - HOST_KEY_DATA_START;
            rq.state = st;
            const int32_t ok = KFE_3gpp_camel_400(&rq);
            benchmark::DoNotOptimize(ok);
            benchmark::ClobberMemory();
            failed += ok != 1;
            // Zero what this call wrote: presence bits, slots and the data
            // area up to where the values ended.
            const size_t used = std::max<size_t>(rq.dataOffset, HOST_KEY_DATA_START);
            std::memset(buffer.data(), 0, std::min<size_t>(used, kBufferSize));
        }
    };
    sweep();
    failed = 0;
    startCountingReallocs();
    for (auto _ : state)
        sweep();
    finish(state, p.states.size(), failed);
}

BENCHMARK(BM_DecodedFieldPass);
BENCHMARK(BM_DisplayPass);
BENCHMARK(BM_MessageViewPass);
BENCHMARK(BM_KeyFieldPass);

} // namespace
