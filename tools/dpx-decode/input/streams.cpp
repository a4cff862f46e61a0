#include "streams.h"

#include <algorithm>
#include <cstring>

#if DPX_HAVE_ZLIB
#include <zlib.h>
#endif
#if DPX_HAVE_ZSTD
#include <zstd.h>
#endif
#if DPX_HAVE_LZ4
#include <lz4frame.h>
#endif

namespace dpxdecode {

long MemoryStream::read(uint8_t *buf, size_t n) {
    const size_t k = std::min(n, size_);
    if (k != 0)
        std::memcpy(buf, data_, k);
    data_ += k;
    size_ -= k;
    return long(k);
}

bool PeekStream::peek(size_t n) {
    n = std::min(n, sizeof head_);
    while (headSize_ < n) {
        const long got = inner_.read(head_ + headSize_, n - headSize_);
        if (got < 0) {
            error_ = inner_.error();
            return false;
        }
        if (got == 0)
            break;
        headSize_ += size_t(got);
    }
    return true;
}

long PeekStream::read(uint8_t *buf, size_t n) {
    if (headPos_ < headSize_) {
        const size_t k = std::min(n, headSize_ - headPos_);
        std::memcpy(buf, head_ + headPos_, k);
        headPos_ += k;
        return long(k);
    }
    const long got = inner_.read(buf, n);
    if (got < 0)
        error_ = inner_.error();
    return got;
}

Compression compressionOf(const uint8_t *h, size_t n) {
    if (n >= 2 && h[0] == 0x1F && h[1] == 0x8B)
        return Compression::Gzip;
    if (n >= 4 && h[0] == 0x28 && h[1] == 0xB5 && h[2] == 0x2F && h[3] == 0xFD)
        return Compression::Zstd;
    if (n >= 4 && h[0] == 0x04 && h[1] == 0x22 && h[2] == 0x4D && h[3] == 0x18)
        return Compression::Lz4;
    return Compression::None;
}

const char *compressionName(Compression c) {
    switch (c) {
    case Compression::Gzip: return "gzip";
    case Compression::Zstd: return "zstd";
    case Compression::Lz4: return "lz4";
    case Compression::None: break;
    }
    return "none";
}

bool compressionSupported(Compression c) {
    switch (c) {
    case Compression::Gzip: return DPX_HAVE_ZLIB;
    case Compression::Zstd: return DPX_HAVE_ZSTD;
    case Compression::Lz4: return DPX_HAVE_LZ4;
    case Compression::None: break;
    }
    return true;
}

namespace {

// What every decompressor shares: a buffer of compressed input refilled
// from the inner stream, and the loop that fills the caller's buffer.
class Decompressor : public ByteStream {
public:
    explicit Decompressor(ByteStream &inner) : inner_(inner) {}

    long read(uint8_t *buf, size_t n) override {
        if (!error_.empty())
            return -1;
        size_t produced = 0;
        while (produced == 0 && n != 0 && !finished_) {
            if (inPos_ == inSize_ && !innerEnded_) {
                const long got = inner_.read(in_, sizeof in_);
                if (got < 0)
                    return fail(inner_.error());
                inPos_ = 0;
                inSize_ = size_t(got);
                innerEnded_ = got == 0;
            }
            const bool noInput = inPos_ == inSize_;
            if (!step(buf, n, produced))
                return -1;
            if (produced == 0 && noInput && innerEnded_) {
                if (!atBoundary())
                    return fail(std::string(compressionName(kind())) + ": the compressed data is cut short");
                finished_ = true;
            }
        }
        return long(produced);
    }

protected:
    // Decompresses from in_[inPos_, inSize_) into buf, advancing inPos_ and
    // adding to `produced`; false (with error_ set) on corrupt input.
    virtual bool step(uint8_t *buf, size_t n, size_t &produced) = 0;
    // Whether the input read so far ends where a member or frame ends.
    virtual bool atBoundary() const = 0;
    virtual Compression kind() const = 0;

    uint8_t in_[1 << 16];
    size_t inPos_ = 0;
    size_t inSize_ = 0;
    bool finished_ = false;

private:
    ByteStream &inner_;
    bool innerEnded_ = false;
};

#if DPX_HAVE_ZLIB
class GzipStream final : public Decompressor {
public:
    explicit GzipStream(ByteStream &inner) : Decompressor(inner) {}
    ~GzipStream() override {
        if (ready_)
            inflateEnd(&z_);
    }
    bool init() {
        ready_ = inflateInit2(&z_, 15 + 16) == Z_OK; // gzip wrapper only
        return ready_;
    }

private:
    bool step(uint8_t *buf, size_t n, size_t &produced) override {
        if (memberEnded_) {
            // Another member follows, or what follows is not gzip (padding
            // some writers leave) and is ignored as gzip itself does.
            if (inPos_ == inSize_)
                return true;
            if (in_[inPos_] != 0x1F) {
                inPos_ = inSize_;
                finished_ = true;
                return true;
            }
            inflateReset(&z_);
            memberEnded_ = false;
        }
        z_.next_in = in_ + inPos_;
        z_.avail_in = uInt(inSize_ - inPos_);
        z_.next_out = buf + produced;
        z_.avail_out = uInt(std::min<size_t>(n - produced, 1u << 30));
        const int rc = inflate(&z_, Z_NO_FLUSH);
        produced = size_t(z_.next_out - buf);
        inPos_ = size_t(z_.next_in - in_);
        if (rc == Z_STREAM_END) {
            memberEnded_ = true;
            return true;
        }
        if (rc == Z_OK || rc == Z_BUF_ERROR)
            return true;
        fail(std::string("gzip: ") + (z_.msg != nullptr ? z_.msg : "corrupt data"));
        return false;
    }
    bool atBoundary() const override { return memberEnded_; }
    Compression kind() const override { return Compression::Gzip; }

    z_stream z_{};
    bool ready_ = false;
    bool memberEnded_ = false;
};
#endif

#if DPX_HAVE_ZSTD
class ZstdStream final : public Decompressor {
public:
    explicit ZstdStream(ByteStream &inner) : Decompressor(inner), z_(ZSTD_createDStream()) {}
    ~ZstdStream() override { ZSTD_freeDStream(z_); }
    bool init() { return z_ != nullptr && !ZSTD_isError(ZSTD_initDStream(z_)); }

private:
    bool step(uint8_t *buf, size_t n, size_t &produced) override {
        ZSTD_inBuffer in{in_, inSize_, inPos_};
        ZSTD_outBuffer out{buf, n, produced};
        const size_t rc = ZSTD_decompressStream(z_, &out, &in);
        const bool moved = in.pos != inPos_ || out.pos != produced;
        inPos_ = in.pos;
        produced = out.pos;
        if (ZSTD_isError(rc)) {
            fail(std::string("zstd: ") + ZSTD_getErrorName(rc));
            return false;
        }
        if (moved)
            frameEnded_ = rc == 0;
        return true;
    }
    bool atBoundary() const override { return frameEnded_; }
    Compression kind() const override { return Compression::Zstd; }

    ZSTD_DStream *z_;
    bool frameEnded_ = true;
};
#endif

#if DPX_HAVE_LZ4
class Lz4Stream final : public Decompressor {
public:
    explicit Lz4Stream(ByteStream &inner) : Decompressor(inner) {}
    ~Lz4Stream() override { LZ4F_freeDecompressionContext(z_); }
    bool init() { return !LZ4F_isError(LZ4F_createDecompressionContext(&z_, LZ4F_VERSION)); }

private:
    bool step(uint8_t *buf, size_t n, size_t &produced) override {
        size_t outSize = n - produced;
        size_t inSize = inSize_ - inPos_;
        const size_t rc = LZ4F_decompress(z_, buf + produced, &outSize, in_ + inPos_, &inSize, nullptr);
        inPos_ += inSize;
        produced += outSize;
        if (LZ4F_isError(rc)) {
            fail(std::string("lz4: ") + LZ4F_getErrorName(rc));
            return false;
        }
        if (inSize != 0 || outSize != 0)
            frameEnded_ = rc == 0;
        return true;
    }
    bool atBoundary() const override { return frameEnded_; }
    Compression kind() const override { return Compression::Lz4; }

    LZ4F_dctx *z_ = nullptr;
    bool frameEnded_ = true;
};
#endif

template <class S> std::unique_ptr<ByteStream> started(ByteStream &inner, std::string &error) {
    auto s = std::make_unique<S>(inner);
    if (!s->init()) {
        error = "cannot set up the decompressor";
        return nullptr;
    }
    return s;
}

} // namespace

// `inner` is unused in a build without any decompression library.
std::unique_ptr<ByteStream> decompressing(Compression c, [[maybe_unused]] ByteStream &inner,
                                          std::string &error) {
    switch (c) {
#if DPX_HAVE_ZLIB
    case Compression::Gzip: return started<GzipStream>(inner, error);
#endif
#if DPX_HAVE_ZSTD
    case Compression::Zstd: return started<ZstdStream>(inner, error);
#endif
#if DPX_HAVE_LZ4
    case Compression::Lz4: return started<Lz4Stream>(inner, error);
#endif
    default: break;
    }
    error = std::string("this dpx-decode was built without ") + compressionName(c) +
            " support: the file cannot be read";
    return nullptr;
}

} // namespace dpxdecode
