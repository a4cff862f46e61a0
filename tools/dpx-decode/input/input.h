// Where dpx-decode's messages come from: --hex arguments, files of hex
// lines, pcap and pcapng captures, standard input.
#pragma once

#include <array>
#include <cstdint>
#include <functional>
#include <iosfwd>
#include <string>
#include <vector>

#include "carriers/walker.h"

namespace dpxdecode {

// Where a message of a capture was found.
struct CaptureOrigin {
    uint64_t frame = 0;       // 1-based frame number in its file
    int64_t seconds = 0;      // time stamp, seconds since the epoch
    uint32_t nanoseconds = 0; // and the fraction
    capture::TcapMessage carrier; // point codes and SSNs (its tcap is the message)
};

struct InputMessage {
    std::string source; // file name, "<stdin>" or "--hex #N"
    size_t line = 0;    // 1-based line in the source (0 for captures)
    std::vector<uint8_t> bytes;
    const CaptureOrigin *capture = nullptr; // set for messages of a capture
};

struct InputOptions {
    capture::WalkOptions walk;
    bool progress = false; // a progress line on standard error for long captures
};

// What reading found besides the messages.
struct InputReport {
    bool badInput = false;        // a line was not hex, or a file could not be read
    bool damagedCapture = false;  // a capture ended in a damaged or cut frame
    uint64_t frames = 0;          // frames read from captures
    std::array<uint64_t, capture::kSkipCount> skips{}; // by reason, all captures
};

// Reads the --hex arguments (one message each), then the files in order;
// "-" is standard input, and with neither --hex arguments nor files only
// standard input is read.  A file (or standard input) that starts with a
// pcap or pcapng magic number is read as a capture, frame by frame; any
// other as hex lines.  Every message goes to onMessage as soon as it is
// read.  Lines that are not hex, files that cannot be read and damaged
// captures are reported on `errors` ("source:line: what", "source: frame
// N: what"); the rest is still read.
InputReport readMessages(const std::vector<std::string> &hexArgs, const std::vector<std::string> &files,
                         const InputOptions &options, const std::function<void(const InputMessage &)> &onMessage,
                         std::ostream &errors);

} // namespace dpxdecode
