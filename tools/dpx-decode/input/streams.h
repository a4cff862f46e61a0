// Byte streams the capture reader and the hex-line reader pull octets from:
// octets in memory, and the gzip, zstd and lz4 decompressors stacked on
// another stream.  dpx-decode puts a file descriptor underneath.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>

namespace dpxdecode {

class ByteStream {
public:
    virtual ~ByteStream() = default;
    // Reads up to n octets into buf: the number read (> 0), 0 at the end of
    // the stream, or -1 on an error (error() says what went wrong).
    virtual long read(uint8_t *buf, size_t n) = 0;
    const std::string &error() const { return error_; }

protected:
    long fail(std::string why) {
        error_ = std::move(why);
        return -1;
    }
    std::string error_;
};

class MemoryStream final : public ByteStream {
public:
    MemoryStream(const uint8_t *data, size_t size) : data_(data), size_(size) {}
    long read(uint8_t *buf, size_t n) override;

private:
    const uint8_t *data_;
    size_t size_;
};

// Hands out the first octets of a stream twice: once to peek() (to tell the
// kind of content by its magic number), then again to read().
class PeekStream final : public ByteStream {
public:
    explicit PeekStream(ByteStream &inner) : inner_(inner) {}
    // Up to n (at most 8) first octets; fewer only at the end of the stream.
    // False on a read error.
    bool peek(size_t n);
    const uint8_t *head() const { return head_; }
    size_t headSize() const { return headSize_; }
    long read(uint8_t *buf, size_t n) override;

private:
    ByteStream &inner_;
    uint8_t head_[8] = {};
    size_t headSize_ = 0;
    size_t headPos_ = 0;
};

enum class Compression : uint8_t { None, Gzip, Zstd, Lz4 };

// From a stream's first four octets.
Compression compressionOf(const uint8_t *head, size_t n);
const char *compressionName(Compression c);
// Whether this build reads that compression.
bool compressionSupported(Compression c);

// A stream of the decompressed octets of `inner`, which must outlive it.
// Concatenated members (gzip) and frames (zstd, lz4) are read one after the
// other; input cut short is an error.  Null when this build does not read
// the compression, or the decompressor cannot be set up; `error` says why.
std::unique_ptr<ByteStream> decompressing(Compression c, ByteStream &inner, std::string &error);

} // namespace dpxdecode
