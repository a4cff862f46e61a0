#include "input.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <chrono>
#include <cstdio>
#include <cstring>
#include <memory>
#include <ostream>

#include "capture_file.h"
#include "hex_line.h"
#include "streams.h"

namespace dpxdecode {
namespace {

// An input file or standard input.  Counts the octets read, for the
// progress line.
class FdStream final : public ByteStream {
public:
    FdStream(int fd, bool owned) : fd_(fd), owned_(owned) {
        struct stat st{};
        if (fstat(fd_, &st) == 0 && S_ISREG(st.st_mode))
            fileSize_ = uint64_t(st.st_size);
    }
    ~FdStream() override {
        if (owned_)
            ::close(fd_);
    }
    long read(uint8_t *buf, size_t n) override {
        for (;;) {
            const ssize_t got = ::read(fd_, buf, n);
            if (got < 0 && errno == EINTR)
                continue;
            if (got < 0)
                return fail(std::strerror(errno));
            consumed_ += uint64_t(got);
            return long(got);
        }
    }
    uint64_t consumed() const { return consumed_; }
    uint64_t fileSize() const { return fileSize_; } // 0 when not a regular file

private:
    int fd_;
    bool owned_;
    uint64_t consumed_ = 0;
    uint64_t fileSize_ = 0;
};

// A ByteStream as a stdio stream, for reading hex lines with getline.
struct CookieStream {
    ByteStream *stream = nullptr;
    bool failed = false;

    static ssize_t read(void *cookie, char *buf, size_t n) {
        auto *c = static_cast<CookieStream *>(cookie);
        const long got = c->stream->read(reinterpret_cast<uint8_t *>(buf), n);
        c->failed |= got < 0;
        return got;
    }
};

FILE *openStream(CookieStream &c) {
    cookie_io_functions_t io{};
    io.read = &CookieStream::read;
    FILE *f = fopencookie(&c, "r", io);
    if (f != nullptr)
        std::setvbuf(f, nullptr, _IOFBF, 1 << 16);
    return f;
}

// Which SCCP messages the walker takes, for the note on a capture without
// any: "SSN 146 and ..." or the --ssn list ("SSN 6-8, 146").
std::string describeSelection(const capture::WalkOptions &walk) {
    std::string list;
    for (size_t s = 0; s < walk.ssns.size(); ++s) {
        if (!walk.ssns.test(s) || (s > 0 && walk.ssns.test(s - 1)))
            continue;
        size_t last = s;
        while (last + 1 < walk.ssns.size() && walk.ssns.test(last + 1))
            ++last;
        list += (list.empty() ? "" : ", ") + std::to_string(s) + (last != s ? "-" + std::to_string(last) : "");
    }
    if (list.empty())
        list = "none";
    if (walk.camelDialogues)
        return "SSN " + list + ", and dialogues naming a CAMEL application context on any SSN";
    return "SSN " + list + " only";
}

class Reader {
public:
    Reader(const InputOptions &options, const std::function<void(const InputMessage &)> &onMessage,
           std::ostream &errors)
        : options_(options), onMessage_(onMessage), errors_(errors), walker_(options.walk) {}

    void hexArgument(size_t number, const std::string &text) {
        const std::string name = "--hex #" + std::to_string(number);
        HexLine parsed = parseHexLine(text);
        if (parsed.kind == LineKind::Empty) {
            parsed.kind = LineKind::Bad;
            parsed.error = "no hex digits";
        }
        if (parsed.kind == LineKind::Bad) {
            errors_ << "dpx-decode: " << name << ": " << parsed.error << '\n';
            report_.badInput = true;
            return;
        }
        onMessage_(InputMessage{name, 1, std::move(parsed.bytes), nullptr});
    }

    void file(const std::string &path) {
        const bool stdinput = path == "-";
        const std::string name = stdinput ? "<stdin>" : path;
        const int fd = stdinput ? STDIN_FILENO : ::open(path.c_str(), O_RDONLY | O_CLOEXEC);
        if (fd < 0) {
            fileError(name, std::strerror(errno));
            return;
        }
        FdStream raw(fd, !stdinput);
        // A compressed file is looked at again once decompressed: it may
        // hold a capture or hex lines.
        PeekStream outer(raw);
        if (!outer.peek(4)) {
            fileError(name, outer.error());
            return;
        }
        const Compression compression = compressionOf(outer.head(), outer.headSize());
        std::unique_ptr<ByteStream> decompressed;
        if (compression != Compression::None) {
            std::string why;
            decompressed = decompressing(compression, outer, why);
            if (decompressed == nullptr) {
                fileError(name, why);
                return;
            }
        }
        PeekStream content(decompressed != nullptr ? *decompressed : static_cast<ByteStream &>(outer));
        if (!content.peek(4)) {
            fileError(name, content.error());
            return;
        }
        if (content.headSize() == 4 && isCaptureMagic(content.head()))
            captureStream(content, raw, name);
        else
            hexStream(content, name);
    }

    InputReport report() {
        report_.skips = walker_.skips();
        return report_;
    }

private:
    void fileError(const std::string &name, const std::string &why) {
        errors_ << "dpx-decode: " << name << ": " << why << '\n';
        report_.badInput = true;
    }

    void hexStream(ByteStream &stream, const std::string &name) {
        CookieStream cookie{&stream, false};
        FILE *f = openStream(cookie);
        if (f == nullptr) {
            fileError(name, std::strerror(errno));
            return;
        }
        InputMessage msg;
        msg.source = name;
        char *line = nullptr;
        size_t capacity = 0;
        size_t lineNo = 0;
        HexLine parsed; // its byte vector and the message's trade places, keeping both capacities
        for (ssize_t n; (n = getline(&line, &capacity, f)) >= 0;) {
            ++lineNo;
            std::string_view text(line, size_t(n));
            if (!text.empty() && text.back() == '\n')
                text.remove_suffix(1);
            parseHexLine(text, parsed);
            if (parsed.kind == LineKind::Empty)
                continue;
            if (parsed.kind == LineKind::Bad) {
                errors_ << "dpx-decode: " << name << ':' << lineNo << ": " << parsed.error << '\n';
                report_.badInput = true;
                continue;
            }
            msg.line = lineNo;
            msg.bytes.swap(parsed.bytes);
            onMessage_(msg);
        }
        std::free(line);
        if (cookie.failed)
            fileError(name, "read error: " + stream.error());
        std::fclose(f);
    }

    struct Sink final : capture::MessageSink {
        Reader *reader = nullptr;
        void onTcap(const capture::TcapMessage &m) override { reader->tcap(m); }
    };

    void tcap(const capture::TcapMessage &m) {
        origin_.carrier = m;
        message_.bytes.assign(m.tcap.data, m.tcap.data + m.tcap.size);
        ++messages_;
        onMessage_(message_);
    }

    void captureStream(ByteStream &stream, const FdStream &raw, const std::string &name) {
        message_.source = name;
        message_.line = 0;
        message_.capture = &origin_;
        walker_.newCapture();
        const CaptureCounts before = counts();
        Sink sink;
        sink.reader = this;
        const auto start = std::chrono::steady_clock::now();
        auto lastShown = start;
        bool shown = false;
        CaptureReader reader(stream);
        Frame frame;
        CaptureReader::Next next;
        while ((next = reader.next(frame)) == CaptureReader::Next::Frame) {
            origin_.frame = frame.number;
            origin_.seconds = frame.seconds;
            origin_.nanoseconds = frame.nanoseconds;
            walker_.walk(frame.linkType, capture::Bytes{frame.data, frame.size}, sink);
            // After the first second, about five updates a second.
            if (options_.progress && (frame.number & 0x3FF) == 0) {
                const auto now = std::chrono::steady_clock::now();
                if (now - start > std::chrono::seconds(1) && now - lastShown > std::chrono::milliseconds(200)) {
                    showProgress(name, frame.number, raw);
                    shown = true;
                    lastShown = now;
                }
            }
        }
        walker_.endCapture();
        if (shown)
            std::fputs("\r\033[K", stderr);
        report_.frames += reader.frames();
        if (next == CaptureReader::Next::Damaged) {
            errors_ << "dpx-decode: " << name << ": " << reader.error() << '\n';
            report_.damagedCapture = true;
        }
        if (messages_ == before.messages) {
            report_.captureWithoutCamel = true;
            explainNoCamel(name, before, reader.frames());
        }
    }

    // What the walker has counted so far, to tell one capture's share.
    struct CaptureCounts {
        uint64_t messages = 0;
        std::array<uint64_t, capture::kSkipCount> skips{};
        capture::SccpCounts sccp;
    };
    CaptureCounts counts() const { return CaptureCounts{messages_, walker_.skips(), walker_.sccpCounts()}; }

    // Says why a capture gave no message: how many frames it has, which
    // subsystems its SCCP messages went to, what was skipped.
    void explainNoCamel(const std::string &name, const CaptureCounts &before, uint64_t frames) {
        const CaptureCounts after = counts();
        const std::string lead = "dpx-decode: " + name + ": ";
        errors_ << lead << "no CAMEL message in " << frames << (frames == 1 ? " frame" : " frames") << '\n';
        uint64_t sccp = after.sccp.withoutSsn - before.sccp.withoutSsn;
        std::string bySsn;
        for (size_t ssn = 0; ssn < after.sccp.byCalledSsn.size(); ++ssn) {
            const uint64_t n = after.sccp.byCalledSsn[ssn] - before.sccp.byCalledSsn[ssn];
            if (n == 0)
                continue;
            sccp += n;
            bySsn += (bySsn.empty() ? "" : ", ") + std::to_string(n) + " to SSN " + std::to_string(ssn);
        }
        if (after.sccp.withoutSsn != before.sccp.withoutSsn)
            bySsn += (bySsn.empty() ? "" : ", ") + std::to_string(after.sccp.withoutSsn - before.sccp.withoutSsn) +
                     " routed without an SSN";
        if (sccp != 0)
            errors_ << lead << "  " << sccp << " SCCP messages: " << bySsn << "; taken: "
                    << describeSelection(options_.walk) << '\n';
        std::string skipped;
        for (size_t i = 1; i < capture::kSkipCount; ++i) {
            const uint64_t n = after.skips[i] - before.skips[i];
            if (n != 0)
                skipped += (skipped.empty() ? "" : "; ") + std::string(capture::skipName(capture::Skip(i))) + ": " +
                           std::to_string(n);
        }
        if (!skipped.empty())
            errors_ << lead << "  skipped: " << skipped << '\n';
    }

    void showProgress(const std::string &name, uint64_t frames, const FdStream &raw) {
        char line[256];
        if (raw.fileSize() != 0)
            std::snprintf(line, sizeof line, "\r%s: %llu frames, %llu messages, %.0f%%", name.c_str(),
                          static_cast<unsigned long long>(frames), static_cast<unsigned long long>(messages_),
                          100.0 * double(raw.consumed()) / double(raw.fileSize()));
        else
            std::snprintf(line, sizeof line, "\r%s: %llu frames, %llu messages", name.c_str(),
                          static_cast<unsigned long long>(frames), static_cast<unsigned long long>(messages_));
        std::fputs(line, stderr);
        std::fflush(stderr);
    }

    const InputOptions &options_;
    const std::function<void(const InputMessage &)> &onMessage_;
    std::ostream &errors_;
    capture::FrameWalker walker_;
    InputReport report_;
    CaptureOrigin origin_;
    InputMessage message_;
    uint64_t messages_ = 0;
};

} // namespace

InputReport readMessages(const std::vector<std::string> &hexArgs, const std::vector<std::string> &files,
                         const InputOptions &options, const std::function<void(const InputMessage &)> &onMessage,
                         std::ostream &errors) {
    Reader reader(options, onMessage, errors);
    for (size_t i = 0; i < hexArgs.size(); ++i)
        reader.hexArgument(i + 1, hexArgs[i]);
    if (hexArgs.empty() && files.empty())
        reader.file("-");
    for (const std::string &file : files)
        reader.file(file);
    return reader.report();
}

} // namespace dpxdecode
