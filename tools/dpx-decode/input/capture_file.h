// Capture files read with libpcap, frame by frame.
#pragma once

#include <cstdint>
#include <cstdio>
#include <functional>
#include <string>

namespace dpxdecode {

// The first four octets of a pcap (either byte order, micro- or
// nanosecond) or pcapng file.
bool isCaptureMagic(const uint8_t magic[4]);

struct Frame {
    uint64_t number = 0; // from 1
    int64_t seconds = 0;
    uint32_t nanoseconds = 0;
    uint32_t linkType = 0;
    const uint8_t *data = nullptr;
    uint32_t size = 0; // captured octets
};

struct CaptureResult {
    bool ok = true;        // read to its regular end
    uint64_t frames = 0;   // frames read
    std::string error;     // why not, with the frame number where known
};

// Reads the capture in `file` (positioned at its start) and hands every
// frame to onFrame.  The capture takes `file` over and closes it.
CaptureResult readCaptureFile(FILE *file, const std::function<void(const Frame &)> &onFrame);

// Whether capture input is available in this build.
bool captureSupported();

} // namespace dpxdecode
