// Message level through the real entry points: types, windows, transaction
// ids, P-Abort cause, and the flags of malformed messages.
#include <gtest/gtest.h>

#include <algorithm>

#include "support/harness.h"

using namespace camel::test;
using Texts = std::vector<std::string>;

namespace {

TEST(Message, BeginWithFourOctetTransactionId) {
    const auto d = decode("62 06 48 04 01 02 03 04");
    EXPECT_EQ(d.texts(), (Texts{"MT=Begin", "LENGTH=6 octet(s)", "Originating Trans Id Tag=48",
                                "LENGTH=4 octet(s)", "  Originating Transaction Id=01020304"}));
    ASSERT_EQ(d.fields.size(), 5u);
    EXPECT_EQ(d.fields[0].id, 3604u);
    EXPECT_EQ(d.fields[0].label, "MT");
    EXPECT_EQ(d.fields[0].selector, 0u);
    EXPECT_EQ(d.fields[0].spans, (std::vector<Span>{{1, 8, 0x62}}));
    EXPECT_EQ(d.fields[1].id, 3608u);
    EXPECT_EQ(d.fields[1].spans, (std::vector<Span>{{9, 16, 6}}));
    EXPECT_EQ(d.fields[2].id, 3651u);
    EXPECT_EQ(d.fields[3].id, 3652u);
    const auto &tid = d.fields[4];
    EXPECT_EQ(tid.id, 3653u);
    EXPECT_EQ(tid.label, "Originating Transaction Id");
    EXPECT_EQ(tid.selector, 1u);
    // High nibble before low nibble of each octet.
    EXPECT_EQ(tid.spans, (std::vector<Span>{{37, 40, 0}, {33, 36, 1}, {45, 48, 0}, {41, 44, 2},
                                            {53, 56, 0}, {49, 52, 3}, {61, 64, 0}, {57, 60, 4}}));
    EXPECT_EQ(d.md.errorFlags, 0u);
    EXPECT_EQ(d.md.remainingBits, 0u);
    EXPECT_EQ(d.layer.firstBit, 1u);
    EXPECT_EQ(d.layer.lastBit, 64u);
    EXPECT_EQ(d.layer.layerTag, 0x1234u);
    EXPECT_EQ(d.layer.layerCode, 0x5Au);

    ASSERT_EQ(d.shown.size(), 5u);
    EXPECT_EQ(d.shown[0].text, "Begin");
    EXPECT_EQ(d.shown[0].displayId, 3604u);
    EXPECT_EQ(d.shown[1].displayId, 3606u); // every "LENGTH" shares 3606
    EXPECT_EQ(d.shown[1].text, "6 octet(s)");
    EXPECT_EQ(d.shown[2].displayId, 3651u);
    EXPECT_EQ(d.shown[3].displayId, 3606u);
    EXPECT_EQ(d.shown[4].displayId, 3653u);
    EXPECT_EQ(d.shown[4].text, "01020304");

    ASSERT_NE(d.key(0), nullptr);
    EXPECT_EQ(d.key(0)->value, Bytes{0x62});
    ASSERT_NE(d.key(26), nullptr);
    EXPECT_EQ(d.key(26)->value, (Bytes{1, 2, 3, 4}));
    EXPECT_EQ(d.key(26)->bits, 32u);
}

// Short messages: the texts, flags and key entries each leaves.
TEST(Message, TypesTransactionIdsAndAbortCause) {
    using Keys = std::vector<std::pair<uint32_t, Bytes>>;
    const struct {
        const char *hex;
        Texts texts; // from the last field of the header on (all when short)
        uint32_t flags;
        Keys keys;
    } cases[] = {
        {"62 06 48 04 0A 1B 2C 3D", {"  Originating Transaction Id=0a1b2c3d"}, 0,
         {{0, {0x62}}, {26, {0x0A, 0x1B, 0x2C, 0x3D}}}},
        // Four octets at most; the fifth is left over.
        {"62 07 48 05 01 02 03 04 05", {"  Originating Transaction Id=01020304"}, DPX_ERR_LEFTOVER,
         {{0, {0x62}}, {26, {1, 2, 3, 4}}}},
        // A Continue without its originating id still shows the destination.
        {"65 03 49 01 07",
         {"MT=Continue", "LENGTH=3 octet(s)", "Destination Trans Id Tag=49", "LENGTH=1 octet(s)",
          "  Destination Transaction Id=07"},
         DPX_ERR_MANDATORY_MISSING, {{0, {0x65}}, {29, {0x07}}}},
        {"67 09 49 04 aa bb cc dd 4a 01 01",
         {"P-Abort Cause Tag=4a", "  Length=1 octet(s)", "  P-Abort Cause=Unrecognized Transaction ID"}, 0,
         {{0, {0x67}}, {3, {0x01}}, {29, {0xAA, 0xBB, 0xCC, 0xDD}}}},
        {"63", {"MT="}, 0, {{0, {0x63}}}},
        {"", {}, 0, {}},
        {"61 00", {"MT=Unidirectional", "LENGTH=0 octet(s)"}, DPX_ERR_MANDATORY_MISSING, {{0, {0x61}}}},
    };
    for (const auto &c : cases) {
        SCOPED_TRACE(c.hex);
        const auto d = decode(c.hex);
        const Texts all = d.texts();
        EXPECT_EQ(Texts(all.end() - long(std::min(all.size(), c.texts.size())), all.end()), c.texts);
        EXPECT_EQ(d.md.errorFlags, c.flags);
        Keys keys;
        for (const auto &k : d.keyEntries)
            keys.push_back({k.index, k.value});
        EXPECT_EQ(keys, c.keys);
    }
    const auto abort = decode("67 09 49 04 aa bb cc dd 4a 01 01");
    EXPECT_EQ(abort.shown[6].displayId, 3718u); // "  Length" is shown under 3718
    EXPECT_EQ(abort.shown[7].text, "Unrecognized Transaction ID");
}

// Malformed lengths: flags, and nothing read beyond the message (the
// harness's state holds an exact copy of the bytes, so ASan would see it).
TEST(Message, MalformedLengths) {
    struct Case {
        const char *hex;
        uint32_t flags;
        size_t fields;
    } cases[] = {
        {"62", DPX_ERR_LENGTH_BEYOND, 1},                 // type octet only
        {"62 81", DPX_ERR_LENGTH_BEYOND | DPX_ERR_LEFTOVER, 1}, // long form cut
        {"62 84 ff ff ff f0 48", DPX_ERR_LENGTH_BEYOND, 3},
        {"62 10 48 04 01 02 03 04", DPX_ERR_LENGTH_BEYOND, 5},  // message longer than data
        {"62 06 48 09 01 02 03 04", DPX_ERR_LENGTH_BEYOND, 5},  // tid longer than window
        {"62 02 48 85", DPX_ERR_LENGTH_BEYOND | DPX_ERR_LEFTOVER, 3}, // tid length cut
        {"62 89 00 00 00 00 00 00 00 00 06 48 04 01 02 03 04", 0, 5}, // non-minimal length
        {"67 06 49 01 01 4a 05 01", DPX_ERR_LENGTH_BEYOND, 8},
        {"62 08 48 04 01 02 03 04 00 00", DPX_ERR_LEFTOVER, 5},
        // a portion's long-form length cut by the message window
        {"62 08 48 04 01 02 03 04 6b 81", DPX_ERR_LENGTH_BEYOND | DPX_ERR_LEFTOVER, 6},
        {"62 07 48 04 01 02 03 04 6c", DPX_ERR_LENGTH_BEYOND, 6},
    };
    for (const Case &c : cases) {
        SCOPED_TRACE(c.hex);
        const auto d = decode(c.hex);
        EXPECT_EQ(d.md.errorFlags, c.flags) << camel::test::textDump(d);
        EXPECT_EQ(d.fields.size(), c.fields) << camel::test::textDump(d);
        EXPECT_EQ(d.md.remainingBits, 0u);
    }
}

} // namespace
