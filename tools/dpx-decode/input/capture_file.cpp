#include "capture_file.h"

#include <initializer_list>
#include <string>

#if DPX_HAVE_PCAP
#include <pcap/pcap.h>
#endif

namespace dpxdecode {

bool isCaptureMagic(const uint8_t m[4]) {
    const uint32_t be = uint32_t(m[0]) << 24 | uint32_t(m[1]) << 16 | uint32_t(m[2]) << 8 | m[3];
    const uint32_t le = uint32_t(m[3]) << 24 | uint32_t(m[2]) << 16 | uint32_t(m[1]) << 8 | m[0];
    for (const uint32_t magic : {0xA1B2C3D4u, 0xA1B23C4Du, 0xA1B2CD34u})
        if (be == magic || le == magic)
            return true;
    return be == 0x0A0D0D0Au; // pcapng section header block
}

#if DPX_HAVE_PCAP

bool captureSupported() { return true; }

CaptureResult readCaptureFile(FILE *file, const std::function<void(const Frame &)> &onFrame) {
    CaptureResult r;
    char err[PCAP_ERRBUF_SIZE] = {};
    pcap_t *p = pcap_fopen_offline_with_tstamp_precision(file, PCAP_TSTAMP_PRECISION_NANO, err);
    if (p == nullptr) {
        std::fclose(file);
        r.ok = false;
        r.error = std::string("frame 1: ") + err;
        return r;
    }
    Frame f;
    f.linkType = uint32_t(pcap_datalink(p));
    for (;;) {
        pcap_pkthdr *header = nullptr;
        const u_char *data = nullptr;
        const int rc = pcap_next_ex(p, &header, &data);
        if (rc == PCAP_ERROR_BREAK)
            break;
        if (rc != 1) {
            r.ok = false;
            r.error = "frame " + std::to_string(r.frames + 1) + ": " + pcap_geterr(p);
            break;
        }
        ++r.frames;
        f.number = r.frames;
        f.seconds = header->ts.tv_sec;
        f.nanoseconds = uint32_t(header->ts.tv_usec);
        f.data = data;
        f.size = header->caplen;
        onFrame(f);
    }
    pcap_close(p); // closes `file` as well
    return r;
}

#else

bool captureSupported() { return false; }

CaptureResult readCaptureFile(FILE *file, const std::function<void(const Frame &)> &) {
    std::fclose(file);
    CaptureResult r;
    r.ok = false;
    r.error = "this dpx-decode was built without libpcap: captures cannot be read";
    return r;
}

#endif

} // namespace dpxdecode
