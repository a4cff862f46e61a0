// libFuzzer target over dpx-decode's capture reader: pcap and pcapng
// headers, records and blocks, and (when the input starts with their magic
// number) the gzip, zstd and lz4 decompressors underneath.
//
// The input is a whole file.  The stream hands it out in pieces whose
// sizes come from the input itself, so a block split across reads is
// covered.  Every frame is read in full: the address sanitizer sees a read
// past its data; a frame longer than the reader's limit, or frame numbers
// out of step, abort.

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <memory>

#include "input/capture_file.h"
#include "input/streams.h"

namespace {

using namespace dpxdecode;

// Hands the input out in pieces of 1 to 64 octets (by the input's own
// octets) and then in large reads.
class ChoppyStream final : public ByteStream {
public:
    ChoppyStream(const uint8_t *data, size_t size) : data_(data), size_(size) {}
    long read(uint8_t *buf, size_t n) override {
        if (pos_ == size_)
            return 0;
        size_t k = pos_ < 4096 ? 1 + data_[pos_] % 64 : n;
        k = std::min({k, n, size_ - pos_});
        for (size_t i = 0; i < k; ++i)
            buf[i] = data_[pos_ + i];
        pos_ += k;
        return long(k);
    }

private:
    const uint8_t *data_;
    size_t size_;
    size_t pos_ = 0;
};

[[noreturn]] void fail(const char *what) {
    std::fprintf(stderr, "capture reader: %s\n", what);
    std::abort();
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
    ChoppyStream raw(data, size);
    PeekStream outer(raw);
    if (!outer.peek(4))
        fail("a memory stream failed");
    std::unique_ptr<ByteStream> decompressed;
    const Compression c = compressionOf(outer.head(), outer.headSize());
    std::string error;
    if (c != Compression::None && (decompressed = decompressing(c, outer, error)) == nullptr)
        return 0;
    ByteStream &content = decompressed ? *decompressed : static_cast<ByteStream &>(outer);
    CaptureReader reader(content);
    Frame frame;
    unsigned checksum = 0;
    uint64_t expected = 1;
    while (reader.next(frame) == CaptureReader::Next::Frame) {
        if (frame.number != expected++)
            fail("frame numbers out of step");
        if (frame.size > CaptureReader::kMaxBlock || frame.nanoseconds >= 1000000000u)
            fail("a frame beyond the reader's limits");
        for (uint32_t i = 0; i < frame.size; ++i)
            checksum += frame.data[i];
    }
    if (reader.frames() != expected - 1)
        fail("frame count differs from the frames handed out");
    return int(checksum & 0);
}
