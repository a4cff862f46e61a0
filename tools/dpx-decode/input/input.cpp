#include "input.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <chrono>
#include <cstdio>
#include <cstring>
#include <ostream>

#include "capture_file.h"
#include "hex_line.h"

namespace dpxdecode {
namespace {

// An input file or standard input as a stdio stream whose first octets
// were already read to look at the magic number: they are handed out
// again before the rest.  Counts the octets read, for the progress line.
struct Source {
    int fd = -1;
    bool ownsFd = false;
    uint8_t head[4] = {};
    size_t headSize = 0;
    size_t headPos = 0;
    uint64_t consumed = 0;
    uint64_t fileSize = 0; // 0 when not a regular file
    int error = 0;

    static ssize_t read(void *cookie, char *buf, size_t n) {
        auto *s = static_cast<Source *>(cookie);
        if (s->headPos < s->headSize) {
            const size_t k = std::min(n, s->headSize - s->headPos);
            std::memcpy(buf, s->head + s->headPos, k);
            s->headPos += k;
            s->consumed += k;
            return ssize_t(k);
        }
        for (;;) {
            const ssize_t got = ::read(s->fd, buf, n);
            if (got < 0 && errno == EINTR)
                continue;
            if (got < 0)
                s->error = errno;
            else
                s->consumed += uint64_t(got);
            return got;
        }
    }
    static int close(void *cookie) {
        auto *s = static_cast<Source *>(cookie);
        if (s->ownsFd && s->fd >= 0)
            ::close(s->fd);
        s->fd = -1;
        return 0;
    }
};

// Reads up to four octets: fewer only at the end of the input.
bool readHead(Source &s) {
    while (s.headSize < sizeof s.head) {
        const ssize_t got = ::read(s.fd, s.head + s.headSize, sizeof s.head - s.headSize);
        if (got < 0 && errno == EINTR)
            continue;
        if (got < 0) {
            s.error = errno;
            return false;
        }
        if (got == 0)
            break;
        s.headSize += size_t(got);
    }
    return true;
}

FILE *openStream(Source &s) {
    cookie_io_functions_t io{};
    io.read = &Source::read;
    io.close = &Source::close;
    FILE *f = fopencookie(&s, "r", io);
    if (f != nullptr)
        std::setvbuf(f, nullptr, _IOFBF, 1 << 16);
    return f;
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
        Source s;
        const bool stdinput = path == "-";
        const std::string name = stdinput ? "<stdin>" : path;
        if (stdinput) {
            s.fd = STDIN_FILENO;
        } else {
            s.fd = ::open(path.c_str(), O_RDONLY | O_CLOEXEC);
            s.ownsFd = true;
            if (s.fd < 0) {
                errors_ << "dpx-decode: " << path << ": " << std::strerror(errno) << '\n';
                report_.badInput = true;
                return;
            }
        }
        struct stat st{};
        if (fstat(s.fd, &st) == 0 && S_ISREG(st.st_mode))
            s.fileSize = uint64_t(st.st_size);
        if (!readHead(s)) {
            errors_ << "dpx-decode: " << name << ": " << std::strerror(s.error) << '\n';
            report_.badInput = true;
            Source::close(&s);
            return;
        }
        FILE *f = openStream(s);
        if (f == nullptr) {
            errors_ << "dpx-decode: " << name << ": " << std::strerror(errno) << '\n';
            report_.badInput = true;
            Source::close(&s);
            return;
        }
        if (s.headSize == sizeof s.head && isCaptureMagic(s.head))
            captureStream(f, s, name);
        else
            hexStream(f, s, name);
    }

    InputReport report() {
        report_.skips = walker_.skips();
        return report_;
    }

private:
    void hexStream(FILE *f, Source &s, const std::string &name) {
        InputMessage msg;
        msg.source = name;
        char *line = nullptr;
        size_t capacity = 0;
        size_t lineNo = 0;
        for (ssize_t n; (n = getline(&line, &capacity, f)) >= 0;) {
            ++lineNo;
            std::string_view text(line, size_t(n));
            if (!text.empty() && text.back() == '\n')
                text.remove_suffix(1);
            HexLine parsed = parseHexLine(text);
            if (parsed.kind == LineKind::Empty)
                continue;
            if (parsed.kind == LineKind::Bad) {
                errors_ << "dpx-decode: " << name << ':' << lineNo << ": " << parsed.error << '\n';
                report_.badInput = true;
                continue;
            }
            msg.line = lineNo;
            msg.bytes = std::move(parsed.bytes);
            onMessage_(msg);
        }
        std::free(line);
        if (s.error != 0) {
            errors_ << "dpx-decode: " << name << ": read error: " << std::strerror(s.error) << '\n';
            report_.badInput = true;
        }
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

    void captureStream(FILE *f, Source &s, const std::string &name) {
        message_.source = name;
        message_.line = 0;
        message_.capture = &origin_;
        walker_.newCapture();
        Sink sink;
        sink.reader = this;
        const auto start = std::chrono::steady_clock::now();
        auto lastShown = start;
        bool shown = false;
        const CaptureResult r = readCaptureFile(f, [&](const Frame &frame) {
            origin_.frame = frame.number;
            origin_.seconds = frame.seconds;
            origin_.nanoseconds = frame.nanoseconds;
            walker_.walk(frame.linkType, capture::Bytes{frame.data, frame.size}, sink);
            // After the first second, about five updates a second.
            if (options_.progress && (frame.number & 0x3FF) == 0) {
                const auto now = std::chrono::steady_clock::now();
                if (now - start > std::chrono::seconds(1) && now - lastShown > std::chrono::milliseconds(200)) {
                    showProgress(name, frame.number, s);
                    shown = true;
                    lastShown = now;
                }
            }
        });
        if (shown)
            std::fputs("\r\033[K", stderr);
        report_.frames += r.frames;
        if (!r.ok) {
            errors_ << "dpx-decode: " << name << ": " << r.error << '\n';
            report_.damagedCapture = true;
        }
    }

    void showProgress(const std::string &name, uint64_t frames, const Source &s) {
        char line[256];
        if (s.fileSize != 0)
            std::snprintf(line, sizeof line, "\r%s: %llu frames, %llu messages, %.0f%%", name.c_str(),
                          static_cast<unsigned long long>(frames), static_cast<unsigned long long>(messages_),
                          100.0 * double(s.consumed) / double(s.fileSize));
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
