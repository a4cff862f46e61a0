#include "pool.h"

#include <sys/mman.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <iostream>
#include <new>
#include <type_traits>

#include "records.h"

namespace dpxdecode::parallel {
namespace {

constexpr size_t align8(size_t n) { return (n + 7) & ~size_t(7); }

// The head of a slot, written by the ordered side before the batch is sent
// and by the worker (done, outputUsed) before it is sent back.
struct SlotHeader {
    uint32_t count = 0; // messages in the input area
    uint32_t done = 0;  // the first `done` have their output in the output area
    uint64_t inputUsed = 0;
    uint64_t outputUsed = 0;
    int64_t baseSeconds = 0; // relative times count from here when baseKnown
    uint32_t baseNanoseconds = 0;
    uint32_t baseKnown = 0;
};
constexpr size_t kHeaderBytes = align8(sizeof(SlotHeader));

// A message in the input area: this head, its source name, its bytes.
struct InputHead {
    uint64_t index;
    uint64_t line;
    uint32_t size;
    uint32_t sourceSize;
    uint32_t hasOrigin;
    CaptureOrigin origin; // carrier.tcap cleared: it pointed into the reader's frame
};
static_assert(std::is_trivially_copyable_v<InputHead>);

// A message in the output area: this head, its text, its records (facts
// when following calls, then the summary when counted).
struct OutputHead {
    uint32_t textSize;
    uint32_t recordSize;
    uint32_t selected;
};

size_t inputBytes(const InputMessage &msg) { return align8(sizeof(InputHead) + msg.source.size() + msg.bytes.size()); }

void writeInput(uint8_t *at, const InputMessage &msg, uint64_t index) {
    InputHead head{};
    head.index = index;
    head.line = msg.line;
    head.size = uint32_t(msg.bytes.size());
    head.sourceSize = uint32_t(msg.source.size());
    head.hasOrigin = msg.capture != nullptr;
    if (msg.capture != nullptr) {
        head.origin = *msg.capture;
        head.origin.carrier.tcap = {};
    }
    std::memcpy(at, &head, sizeof head);
    std::memcpy(at + sizeof head, msg.source.data(), msg.source.size());
    std::memcpy(at + sizeof head + msg.source.size(), msg.bytes.data(), msg.bytes.size());
}

// The message at `at` into `msg` (whose capture points at `origin`);
// returns its size in the area.
size_t readInput(const uint8_t *at, InputMessage &msg, CaptureOrigin &origin, uint64_t &index) {
    InputHead head;
    std::memcpy(&head, at, sizeof head);
    index = head.index;
    msg.line = size_t(head.line);
    const auto *source = reinterpret_cast<const char *>(at + sizeof head);
    msg.source.assign(source, head.sourceSize);
    const uint8_t *bytes = at + sizeof head + head.sourceSize;
    msg.bytes.assign(bytes, bytes + head.size);
    origin = head.origin;
    msg.capture = head.hasOrigin != 0 ? &origin : nullptr;
    return align8(sizeof head + head.sourceSize + head.size);
}

// A slot number over a worker's socket, one way or the other; false when
// the other side has gone.
bool transfer(int fd, uint32_t &slot, bool sending) {
    for (;;) {
        const ssize_t n = sending ? send(fd, &slot, sizeof slot, MSG_NOSIGNAL) : recv(fd, &slot, sizeof slot, MSG_WAITALL);
        if (n == ssize_t(sizeof slot))
            return true;
        if (n < 0 && errno == EINTR)
            continue;
        return false;
    }
}

bool sendSlot(int fd, uint32_t slot) { return transfer(fd, slot, true); }
bool receiveSlot(int fd, uint32_t &slot) { return transfer(fd, slot, false); }

} // namespace

struct WorkerPool::Slot {
    SlotHeader *header = nullptr;
    uint8_t *input = nullptr;
    uint8_t *output = nullptr;
    bool sent = false; // handed to its worker
    // A message too large for the input area travels alone and is decoded
    // on the ordered side.
    bool hasLarge = false;
    uint64_t largeIndex = 0;
    InputMessage large;
    CaptureOrigin largeOrigin;
};

WorkerPool::WorkerPool(const Module &module, const DecodeSettings &settings, MessageDecoder &local,
                       const OrderedSinks &sinks, unsigned workers)
    : module_(module), settings_(settings), local_(local), sinks_(sinks), workerCount_(workers),
      workers_(workers), slots_(size_t(workers) * 2) {
    const size_t slotBytes = kHeaderBytes + kInputBytes + kOutputBytes;
    sharedSize_ = slotBytes * slots_.size();
    void *p = mmap(nullptr, sharedSize_, PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS | MAP_NORESERVE, -1, 0);
    if (p == MAP_FAILED) {
        // Without shared memory every batch is decoded here.
        std::cerr << "dpx-decode: --jobs: no shared memory (" << std::strerror(errno)
                  << "): decoding on one core\n";
        workerCount_ = 0;
        slots_.assign(1, Slot{});
        sharedSize_ = slotBytes;
        p = mmap(nullptr, sharedSize_, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS | MAP_NORESERVE, -1, 0);
        if (p == MAP_FAILED)
            throw std::bad_alloc();
    }
    shared_ = static_cast<uint8_t *>(p);
    for (size_t i = 0; i < slots_.size(); ++i) {
        uint8_t *base = shared_ + i * slotBytes;
        slots_[i].header = new (base) SlotHeader();
        slots_[i].input = base + kHeaderBytes;
        slots_[i].output = base + kHeaderBytes + kInputBytes;
    }
}

WorkerPool::~WorkerPool() {
    stopWorkers();
    if (shared_ != nullptr)
        munmap(shared_, sharedSize_);
}

WorkerPool::Slot &WorkerPool::slot(uint64_t batch) { return slots_[size_t(batch % slots_.size())]; }

void WorkerPool::add(const InputMessage &msg, uint64_t index) {
    // Without filters every message is shown, so the first one with a
    // capture time is the base of relative times.
    if (!local_.timeBased() && (settings_.filter == nullptr || settings_.filter->empty()) &&
        settings_.formatsTime(msg.capture))
        local_.setTimeBase(msg.capture->seconds, msg.capture->nanoseconds);
    const size_t need = inputBytes(msg);
    Slot *s = &slot(filling_);
    const auto next = [&] {
        submit();
        s = &slot(filling_);
    };
    if (s->hasLarge || s->header->count == kBatchMessages || s->header->inputUsed + need > kInputBytes)
        next();
    if (need > kInputBytes) {
        if (s->header->count != 0)
            next();
        s->hasLarge = true;
        s->largeIndex = index;
        s->large.source = msg.source;
        s->large.line = msg.line;
        s->large.bytes = msg.bytes;
        if (msg.capture != nullptr)
            s->largeOrigin = *msg.capture;
        s->large.capture = msg.capture != nullptr ? &s->largeOrigin : nullptr;
        return;
    }
    writeInput(s->input + s->header->inputUsed, msg, index);
    s->header->inputUsed += need;
    ++s->header->count;
}

// Hands the batch being filled to its worker and starts the next one,
// writing out the batch whose slot it takes.
void WorkerPool::submit() {
    if (!started_) {
        started_ = true;
        startWorkers();
    }
    Slot &s = slot(filling_);
    SlotHeader &h = *s.header;
    h.done = 0;
    h.outputUsed = 0;
    h.baseKnown = local_.timeBased();
    h.baseSeconds = local_.baseSeconds();
    h.baseNanoseconds = local_.baseNanoseconds();
    if (workerCount_ != 0 && !s.hasLarge) {
        Worker &w = workers_[size_t(filling_ % workerCount_)];
        if (w.fd >= 0 && !sendSlot(w.fd, uint32_t(filling_ % slots_.size())))
            retire(w, "cannot be reached");
        s.sent = w.fd >= 0;
    }
    ++filling_;
    while (emitted_ + slots_.size() <= filling_)
        emit(emitted_++);
    Slot &n = slot(filling_);
    n.header->count = 0;
    n.header->inputUsed = 0;
    n.sent = false;
    n.hasLarge = false;
}

void WorkerPool::emit(uint64_t batch) {
    Slot &s = slot(batch);
    const SlotHeader &h = *s.header;
    uint32_t done = 0;
    if (s.sent) {
        Worker &w = workers_[size_t(batch % workerCount_)];
        uint32_t back = 0;
        if (w.fd >= 0 && receiveSlot(w.fd, back) && back == batch % slots_.size())
            done = h.done;
        else if (w.fd >= 0)
            retire(w, "ended");
    }
    size_t in = 0, out = 0;
    for (uint32_t i = 0; i < h.count; ++i) {
        uint64_t index = 0;
        in += readInput(s.input + in, message_, origin_, index);
        if (i < done) {
            OutputHead head{};
            if (h.outputUsed <= kOutputBytes && sizeof head <= h.outputUsed - out)
                std::memcpy(&head, s.output + out, sizeof head);
            const auto *text = reinterpret_cast<const char *>(s.output + out + sizeof head);
            const char *record = text + head.textSize;
            size_t pos = 0;
            const bool selected = head.selected != 0;
            const bool counted = settings_.stats && selected;
            const bool inside = h.outputUsed <= kOutputBytes && sizeof head <= h.outputUsed - out &&
                                uint64_t(head.textSize) + head.recordSize <= h.outputUsed - out - sizeof head;
            if (inside && (!settings_.follow || getFacts(record, head.recordSize, pos, facts_)) &&
                (!counted || getSummary(record, head.recordSize, pos, summary_))) {
                sinks_.take(settings_.follow ? &facts_ : nullptr, selected, counted ? &summary_ : nullptr,
                            std::string_view(text, head.textSize));
                out += align8(sizeof head + head.textSize + head.recordSize);
                continue;
            }
            done = i; // unreadable: decoded here from this message on
        }
        local_.decode(message_, index, true);
        sinks_.take(local_.facts(), local_.selected(), local_.summary(), local_.text());
    }
    if (s.hasLarge) {
        local_.decode(s.large, s.largeIndex, true);
        sinks_.take(local_.facts(), local_.selected(), local_.summary(), local_.text());
    }
}

void WorkerPool::finish() {
    const Slot &s = slot(filling_);
    if (s.header->count != 0 || s.hasLarge) {
        // One batch in all: decoded here, without starting workers.
        started_ = true;
        submit();
    }
    while (emitted_ < filling_)
        emit(emitted_++);
    stopWorkers();
}

void WorkerPool::startWorkers() {
    std::vector<int> ours; // the ordered side's ends, closed in every worker
    for (unsigned i = 0; i < workerCount_; ++i) {
        int sv[2];
        if (socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, sv) != 0) {
            std::cerr << "dpx-decode: --jobs: cannot start worker " << i + 1 << ": " << std::strerror(errno) << '\n';
            break;
        }
        const pid_t pid = fork();
        if (pid == 0) {
            for (const int fd : ours)
                close(fd);
            close(sv[0]);
            workerLoop(sv[1]);
        }
        close(sv[1]);
        if (pid < 0) {
            std::cerr << "dpx-decode: --jobs: cannot start worker " << i + 1 << ": " << std::strerror(errno) << '\n';
            close(sv[0]);
            break;
        }
        ours.push_back(sv[0]);
        workers_[i] = Worker{pid, sv[0]};
    }
}

// A worker: decodes the batches it is sent until its socket closes, and
// leaves without running the destructors or flushing the streams it
// inherited.
void WorkerPool::workerLoop(int fd) {
    MessageDecoder decoder(module_, settings_);
    if (!decoder.ok())
        _exit(1);
    std::string record;
    uint32_t number = 0;
    while (receiveSlot(fd, number) && number < slots_.size()) {
        Slot &s = slots_[number];
        SlotHeader &h = *s.header;
        if (h.baseKnown != 0 && !decoder.timeBased())
            decoder.setTimeBase(h.baseSeconds, h.baseNanoseconds);
        size_t in = 0, out = 0;
        uint32_t done = 0;
        for (; done < h.count; ++done) {
            uint64_t index = 0;
            in += readInput(s.input + in, message_, origin_, index);
            if (!decoder.decode(message_, index, false))
                break;
            record.clear();
            if (const dialogues::MessageFacts *f = decoder.facts())
                putFacts(record, *f);
            if (const MessageSummary *summary = decoder.summary())
                putSummary(record, *summary);
            const std::string &text = decoder.text();
            const OutputHead head{uint32_t(text.size()), uint32_t(record.size()), decoder.selected() ? 1u : 0u};
            const size_t need = align8(sizeof head + text.size() + record.size());
            if (need > kOutputBytes - out)
                break;
            std::memcpy(s.output + out, &head, sizeof head);
            std::memcpy(s.output + out + sizeof head, text.data(), text.size());
            std::memcpy(s.output + out + sizeof head + text.size(), record.data(), record.size());
            out += need;
        }
        h.done = done;
        h.outputUsed = out;
        if (!sendSlot(fd, number))
            break;
    }
    _exit(0);
}

void WorkerPool::retire(Worker &w, const char *why) {
    int status = 0;
    close(w.fd);
    w.fd = -1;
    std::cerr << "dpx-decode: worker process " << w.pid << ' ' << why;
    if (waitpid(w.pid, &status, 0) == w.pid && WIFSIGNALED(status))
        std::cerr << " (signal " << WTERMSIG(status) << ')';
    std::cerr << ": its messages are decoded by dpx-decode itself\n";
    w.pid = -1;
}

void WorkerPool::stopWorkers() {
    for (Worker &w : workers_)
        if (w.fd >= 0) {
            close(w.fd);
            w.fd = -1;
        }
    for (Worker &w : workers_)
        if (w.pid > 0) {
            int status = 0;
            while (waitpid(w.pid, &status, 0) < 0 && errno == EINTR) {
            }
            w.pid = -1;
        }
}

} // namespace dpxdecode::parallel
