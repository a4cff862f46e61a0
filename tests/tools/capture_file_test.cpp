// The capture reader on pcap and pcapng files built octet by octet: both
// byte orders, time stamp resolutions and offsets, several sections and
// interfaces of different link types, the blocks it steps over, damaged
// files; and the decompressing streams over compressed copies.  Streams
// hand their octets out a few at a time, so blocks straddle reads.

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "input/capture_file.h"
#include "input/streams.h"

#if DPX_HAVE_ZLIB
#include <zlib.h>
#endif
#if DPX_HAVE_ZSTD
#include <zstd.h>
#endif
#if DPX_HAVE_LZ4
#include <lz4frame.h>
#endif

namespace {

using namespace dpxdecode;
using Bytes = std::vector<uint8_t>;

struct Out {
    bool big = false;
    Bytes b;
    Out &u8(unsigned v) {
        b.push_back(uint8_t(v));
        return *this;
    }
    Out &u16(unsigned v) { return big ? u8(v >> 8).u8(v) : u8(v).u8(v >> 8); }
    Out &u32(uint32_t v) { return big ? u16(v >> 16).u16(v & 0xFFFF) : u16(v & 0xFFFF).u16(v >> 16); }
    Out &raw(const Bytes &x) {
        b.insert(b.end(), x.begin(), x.end());
        return *this;
    }
};

// A pcapng block: type, length, body padded to four octets, length.
Bytes block(bool big, uint32_t type, Bytes body) {
    body.resize((body.size() + 3) & ~size_t(3));
    const auto length = uint32_t(body.size() + 12);
    return Out{big, {}}.u32(type).u32(length).raw(body).u32(length).b;
}
Bytes section(bool big) {
    return block(big, 0x0A0D0D0A, Out{big, {}}.u32(0x1A2B3C4D).u16(1).u16(0).u32(0xFFFFFFFF).u32(0xFFFFFFFF).b);
}
Bytes option(bool big, uint16_t code, const Bytes &value) {
    Out o{big, {}};
    o.u16(code).u16(unsigned(value.size())).raw(value);
    o.b.resize((o.b.size() + 3) & ~size_t(3));
    return o.b;
}
Bytes interfaceBlock(bool big, uint16_t link, const Bytes &options = {}) {
    return block(big, 1, Out{big, {}}.u16(link).u16(0).u32(65535).raw(options).b);
}
Bytes enhancedPacket(bool big, uint32_t interface, uint64_t ts, const Bytes &data) {
    return block(big, 6,
                 Out{big, {}}.u32(interface).u32(uint32_t(ts >> 32)).u32(uint32_t(ts)).u32(uint32_t(data.size()))
                     .u32(uint32_t(data.size())).raw(data).b);
}
Bytes cat(std::initializer_list<Bytes> parts) {
    Bytes all;
    for (const Bytes &p : parts)
        all.insert(all.end(), p.begin(), p.end());
    return all;
}

// Hands out at most `piece` octets a read.
class Trickle final : public ByteStream {
public:
    Trickle(const Bytes &b, size_t piece) : b_(b), piece_(piece) {}
    long read(uint8_t *buf, size_t n) override {
        const size_t k = std::min({n, piece_, b_.size() - pos_});
        std::copy(b_.begin() + long(pos_), b_.begin() + long(pos_ + k), buf);
        pos_ += k;
        return long(k);
    }

private:
    const Bytes &b_;
    size_t piece_;
    size_t pos_ = 0;
};

struct Got {
    uint64_t number;
    uint32_t link, interface;
    int64_t seconds;
    uint32_t nanoseconds;
    Bytes data;
    bool operator==(const Got &) const = default;
};
std::ostream &operator<<(std::ostream &o, const Got &g) {
    return o << "frame " << g.number << " link " << g.link << " if " << g.interface << " at " << g.seconds << "."
             << g.nanoseconds << " (" << g.data.size() << " octets)";
}

struct ReadAll {
    std::vector<Got> frames;
    CaptureReader::Next last = CaptureReader::Next::Frame;
    std::string error;
};
ReadAll readAll(ByteStream &in) {
    CaptureReader reader(in);
    ReadAll r;
    Frame f;
    while ((r.last = reader.next(f)) == CaptureReader::Next::Frame)
        r.frames.push_back(Got{f.number, f.linkType, f.interface, f.seconds, f.nanoseconds,
                               Bytes(f.data, f.data + f.size)});
    r.error = reader.error();
    return r;
}
ReadAll readAll(const Bytes &file, size_t piece = 7) {
    Trickle t(file, piece);
    return readAll(t);
}

const Bytes kA{0xA1, 0x02, 0x03}, kB{0xB1, 0xB2, 0xB3, 0xB4, 0xB5}, kC{0xC1};

// Two sections of opposite byte order; interfaces of four link types with
// their own time resolutions and offset; a name-resolution block and a
// simple packet among them.
Bytes twoSections() {
    const bool le = false, be = true;
    const Bytes nanoseconds = option(le, 9, {9});
    const Bytes binary = cat({option(le, 9, {0x8A}), option(le, 14, {100, 0, 0, 0, 0, 0, 0, 0})});
    return cat({section(le), interfaceBlock(le, 1), interfaceBlock(le, 113, nanoseconds),
                interfaceBlock(le, 101, binary), block(le, 4, {0, 0, 0, 0}),
                enhancedPacket(le, 0, 1700000000123456ull, kA), enhancedPacket(le, 1, 1700000000000000789ull, kB),
                enhancedPacket(le, 2, 5 * 1024 + 512, kC),
                block(le, 3, Out{le, {}}.u32(uint32_t(kB.size())).raw(kB).b), section(be), interfaceBlock(be, 141),
                enhancedPacket(be, 0, 2000000, kA)});
}

TEST(CaptureFile, PcapngFramesCarryTheirOwnInterfacesLinkTypeAndTime) {
    for (const size_t piece : {size_t(1), size_t(7), size_t(1) << 20}) {
        SCOPED_TRACE(piece);
        const ReadAll r = readAll(twoSections(), piece);
        EXPECT_EQ(r.last, CaptureReader::Next::End) << r.error;
        EXPECT_EQ(r.frames, (std::vector<Got>{{1, 1, 0, 1700000000, 123456000, kA},
                                              {2, 113, 1, 1700000000, 789, kB},
                                              {3, 101, 2, 105, 500000000, kC},
                                              {4, 1, 0, 0, 0, kB},
                                              {5, 141, 0, 2, 0, kA}}));
    }
}

TEST(CaptureFile, PcapByteOrdersResolutionsAndRecordHeaders) {
    const struct {
        const char *name;
        bool big;
        uint32_t magic;
        size_t extra; // octets after the 16-octet record header
        uint32_t nanoseconds;
    } cases[] = {
        {"little-endian, microseconds", false, 0xA1B2C3D4, 0, 7000},
        {"big-endian, nanoseconds", true, 0xA1B23C4D, 0, 7},
        {"modified, 24-octet records", false, 0xA1B2CD34, 8, 7000},
    };
    for (const auto &c : cases) {
        SCOPED_TRACE(c.name);
        Out o{c.big, {}};
        // The upper bits of the link type field (FCS length) are not the type.
        o.u32(c.magic).u16(2).u16(4).u32(0).u32(0).u32(65535).u32(0x10000000 | 140);
        for (const Bytes *d : {&kA, &kB}) {
            o.u32(1767225600).u32(7).u32(uint32_t(d->size())).u32(uint32_t(d->size()));
            o.raw(Bytes(c.extra, 0xEE)).raw(*d);
        }
        const ReadAll r = readAll(o.b);
        EXPECT_EQ(r.last, CaptureReader::Next::End) << r.error;
        EXPECT_EQ(r.frames, (std::vector<Got>{{1, 140, 0, 1767225600, c.nanoseconds, kA},
                                              {2, 140, 0, 1767225600, c.nanoseconds, kB}}));
    }
}

TEST(CaptureFile, DamageStopsTheReadingWithTheFrameNumberAndWhat) {
    const Bytes head = cat({section(false), interfaceBlock(false, 1), enhancedPacket(false, 0, 0, kA)});
    Bytes lengthsDiffer = cat({head, enhancedPacket(false, 0, 0, kB)});
    lengthsDiffer[lengthsDiffer.size() - 4] ^= 4;
    Bytes oddLength = cat({head, enhancedPacket(false, 0, 0, kB)});
    oddLength[head.size() + 4] -= 2;
    Bytes longPacket = cat({head, enhancedPacket(false, 0, 0, kB)});
    longPacket[head.size() + 20] = 200; // captured length
    Bytes badOrder = section(false);
    badOrder[8] = 0x11;
    Bytes pcap = Out{false, {}}.u32(0xA1B2C3D4).u16(2).u16(4).u32(0).u32(0).u32(65535).u32(1).b;
    const Bytes pcapRecord = Out{false, {}}.u32(1).u32(0).u32(3).u32(3).raw(kA).b;
    Bytes pcapVersion = pcap;
    pcapVersion[4] = 3;
    Bytes pcapHuge = cat({pcap, pcapRecord, pcapRecord});
    pcapHuge[pcap.size() + pcapRecord.size() + 11] = 0x7F;
    const Bytes empty;
    const struct {
        const char *name;
        Bytes file;
        size_t frames;
        const char *error;
    } cases[] = {
        {"pcapng cut in a block", Bytes(head.begin(), head.end() - 3), 0, "frame 1: the capture is cut short (33 of 36"},
        {"block lengths differ", lengthsDiffer, 1, "frame 2: a block whose two lengths differ"},
        {"block length not a multiple of four", oddLength, 1, "frame 2: a block (type 6) of 38 octets"},
        {"packet longer than its block", longPacket, 1, "frame 2: a packet longer than its block"},
        {"undeclared interface", cat({head, enhancedPacket(false, 3, 0, kB)}), 1,
         "frame 2: a packet of interface 3, which its section does not describe"},
        {"a new section forgets the interfaces", cat({head, section(false), enhancedPacket(false, 0, 0, kB)}), 1,
         "frame 2: a packet of interface 0"},
        {"unknown byte-order magic", badOrder, 0, "frame 1: a section header with an unknown byte-order magic"},
        {"pcap cut in a record", cat({pcap, pcapRecord, Bytes(pcapRecord.begin(), pcapRecord.end() - 1)}), 1,
         "frame 2: the capture is cut short (18 of 19 octets of a record)"},
        {"pcap cut in the file header", Bytes(pcap.begin(), pcap.begin() + 10), 0, "frame 1: the capture is cut short"},
        {"pcap version", pcapVersion, 0, "frame 1: pcap version 3.4 is not read"},
        {"pcap record beyond any frame", pcapHuge, 1, "frame 2: a record of 2130706435 octets"},
        {"not a capture", Bytes{'6', '2', '0', '6'}, 0, "frame 1: not a pcap or pcapng capture"},
        {"empty", empty, 0, "frame 1: not a pcap or pcapng capture"},
    };
    for (const auto &c : cases) {
        SCOPED_TRACE(c.name);
        const ReadAll r = readAll(c.file);
        EXPECT_EQ(r.last, CaptureReader::Next::Damaged);
        EXPECT_EQ(r.frames.size(), c.frames);
        EXPECT_EQ(r.error.rfind(c.error, 0), 0u) << r.error;
    }
}

// ---- compressed streams ----------------------------------------------------------

// `in` is unused in a build without any compression library.
Bytes compress(Compression c, [[maybe_unused]] const Bytes &in) {
    Bytes out;
    switch (c) {
#if DPX_HAVE_ZLIB
    case Compression::Gzip: {
        z_stream z{};
        deflateInit2(&z, Z_DEFAULT_COMPRESSION, Z_DEFLATED, 15 + 16, 8, Z_DEFAULT_STRATEGY);
        out.resize(deflateBound(&z, uLong(in.size())) + 32);
        z.next_in = const_cast<uint8_t *>(in.data());
        z.avail_in = uInt(in.size());
        z.next_out = out.data();
        z.avail_out = uInt(out.size());
        deflate(&z, Z_FINISH);
        out.resize(z.total_out);
        deflateEnd(&z);
        break;
    }
#endif
#if DPX_HAVE_ZSTD
    case Compression::Zstd:
        out.resize(ZSTD_compressBound(in.size()));
        out.resize(ZSTD_compress(out.data(), out.size(), in.data(), in.size(), 1));
        break;
#endif
#if DPX_HAVE_LZ4
    case Compression::Lz4:
        out.resize(LZ4F_compressFrameBound(in.size(), nullptr));
        out.resize(LZ4F_compressFrame(out.data(), out.size(), in.data(), in.size(), nullptr));
        break;
#endif
    default:
        break;
    }
    return out;
}

struct Inflated {
    Bytes bytes;
    bool failed = false;
    std::string error;
};
Inflated decompress(const Bytes &file) {
    Trickle raw(file, 5);
    PeekStream peek(raw);
    Inflated r;
    EXPECT_TRUE(peek.peek(4));
    std::string why;
    auto s = decompressing(compressionOf(peek.head(), peek.headSize()), peek, why);
    EXPECT_NE(s, nullptr) << why;
    if (s == nullptr)
        return r;
    uint8_t buf[3];
    long n;
    while ((n = s->read(buf, sizeof buf)) > 0)
        r.bytes.insert(r.bytes.end(), buf, buf + n);
    r.failed = n < 0;
    r.error = s->error();
    return r;
}

TEST(CaptureFile, CompressedFilesReadAsTheirContent) {
    Bytes content = twoSections();
    for (int i = 0; i < 50; ++i) // long enough for several output buffers
        content.insert(content.end(), content.begin(), content.begin() + 40);
    for (const Compression c : {Compression::Gzip, Compression::Zstd, Compression::Lz4}) {
        SCOPED_TRACE(compressionName(c));
        if (!compressionSupported(c)) {
            std::string why;
            Bytes junk{0, 0, 0, 0};
            MemoryStream m(junk.data(), junk.size());
            EXPECT_EQ(decompressing(c, m, why), nullptr);
            EXPECT_NE(why.find("built without"), std::string::npos);
            continue;
        }
        const Bytes packed = compress(c, content);
        EXPECT_EQ(compressionOf(packed.data(), packed.size()), c);
        const Inflated whole = decompress(packed);
        EXPECT_FALSE(whole.failed) << whole.error;
        EXPECT_EQ(whole.bytes, content);
        // Members or frames one after the other read as one stream.
        const Inflated twice = decompress(cat({packed, packed}));
        EXPECT_FALSE(twice.failed) << twice.error;
        EXPECT_EQ(twice.bytes, cat({content, content}));
        // Cut short: an error, never a quiet end.
        const Inflated cut = decompress(Bytes(packed.begin(), packed.end() - 5));
        EXPECT_TRUE(cut.failed);
        EXPECT_FALSE(cut.error.empty());
        // Through the capture reader: the frames of the plain file.
        Trickle raw(packed, 11);
        PeekStream peek(raw);
        ASSERT_TRUE(peek.peek(4));
        std::string why;
        auto s = decompressing(c, peek, why);
        ASSERT_NE(s, nullptr) << why;
        const ReadAll fromPacked = readAll(*s);
        EXPECT_EQ(fromPacked.frames.size(), 5u);
        EXPECT_EQ(fromPacked.frames[4].data, kA);
    }
}

} // namespace
