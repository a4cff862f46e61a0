// Messages decoded by worker processes, written in capture order.
//
// Each worker is a fork of dpx-decode with the module already loaded: its
// own copy of the module (whose scratch is module-level) and of the host
// libraries, so nothing is shared between decoders.  The reading side
// packs messages into batches in shared memory; batch j goes to worker
// j % workers and lives in slot j % slots, so at most `slots` batches are
// in flight and memory does not grow with the input.  A worker decodes the
// batch and formats each message's text and facts into the slot; the
// ordered side takes them batch by batch, feeding the dialogue tracker and
// the statistics, and writing the text.  Whatever a worker leaves undone
// (a message too large for a slot, text that does not fit, a relative time
// before its base is known, a worker that died) is decoded on the ordered
// side itself, so no message is lost and the output stays the same.
#pragma once

#include <sys/types.h>

#include <cstdint>
#include <string>
#include <vector>

#include "decoder.h"

namespace dpxdecode::parallel {

// Most workers --jobs starts.
constexpr unsigned kMaxJobs = 32;

class WorkerPool {
public:
    // `local` decodes on the ordered side; `sinks` receive every message in
    // order.  Workers start with the second batch: an input of one batch
    // is decoded here.
    WorkerPool(const Module &module, const DecodeSettings &settings, MessageDecoder &local,
               const OrderedSinks &sinks, unsigned workers);
    ~WorkerPool();
    WorkerPool(const WorkerPool &) = delete;
    WorkerPool &operator=(const WorkerPool &) = delete;

    void add(const InputMessage &msg, uint64_t index);
    // Writes out every batch still in flight and stops the workers.
    void finish();

    // Messages per batch and bytes of each slot's areas.
    static constexpr uint32_t kBatchMessages = 256;
    static constexpr size_t kInputBytes = size_t(1) << 20;
    static constexpr size_t kOutputBytes = size_t(6) << 20;

private:
    struct Slot;
    struct Worker {
        pid_t pid = -1;
        int fd = -1; // socket to the worker: slot numbers both ways
    };
    Slot &slot(uint64_t batch);
    void submit();
    void emit(uint64_t batch);
    void startWorkers();
    void stopWorkers();
    void workerLoop(int fd);
    void retire(Worker &w, const char *why);

    const Module &module_;
    const DecodeSettings &settings_;
    MessageDecoder &local_;
    const OrderedSinks &sinks_;
    unsigned workerCount_;
    std::vector<Worker> workers_;
    bool started_ = false;
    uint8_t *shared_ = nullptr; // every slot's header and areas
    size_t sharedSize_ = 0;
    std::vector<Slot> slots_;
    uint64_t filling_ = 0; // batch being filled
    uint64_t emitted_ = 0; // batches written out
    // The ordered side's scratch for a worker's records.
    dialogues::MessageFacts facts_;
    MessageSummary summary_;
    InputMessage message_;
    CaptureOrigin origin_;
};

} // namespace dpxdecode::parallel
