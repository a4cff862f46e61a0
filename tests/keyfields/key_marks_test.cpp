// Key-field marking against a key buffer laid out by the stand-in host's
// kf_InitialiseOptKFE: presence bits in bytes 0..3, slots at 4 + 4 * entry,
// packed values from byte 128.

#include "keyfields/key_marks.h"
#include "keyfields/key_state.h"

#include "dpx_standin_host.h"
#include "key_test_field.h"

#include <gtest/gtest.h>

#include <bit>
#include <cstdint>
#include <vector>

namespace {

using camel::keyFieldPrologue;
using camel::markOctetKey;
using camel::markVariableKey;
using camel::markWordKey;
using keytest::digits;
using keytest::Field;
using Bytes = std::vector<uint8_t>;

constexpr uint16_t kData = HOST_KEY_DATA_START;

struct Slot {
    uint16_t bitLength, dataOffset;
    bool operator==(const Slot &) const = default;
};
uint16_t overflowAt(uint32_t offset) { return static_cast<uint16_t>(offset | DPX_KEY_OVERFLOW_BIT); }

// The module as just loaded and the host's default behaviour, before and
// after every test, so no test sees another's initialisation result.
class KeyState : public ::testing::Test {
protected:
    void SetUp() override {
        TearDown();
        prepare(64, 512);
    }
    void TearDown() override {
        camel::resetKeyInitForTests();
        host_ClearKfInitOverride();
    }
    // A new message in a cleared key buffer, as the host hands it over.
    void prepare(uint16_t room, size_t size) {
        buffer.assign(size, 0);
        request.keyBuffer = buffer.data();
        request.dataOffset = kData;
        request.valueRoom = room;
    }
    int32_t newCall(uint16_t room) {
        prepare(room, buffer.size());
        return keyFieldPrologue(&request);
    }
    bool present(uint32_t e) const { return (buffer[e / 8] >> (e % 8)) & 1u; }
    int presentCount() const {
        return std::popcount(uint32_t(buffer[0] | buffer[1] << 8 | buffer[2] << 16 | buffer[3] << 24));
    }
    uint8_t *value(uint32_t e) { return buffer.data() + HOST_KEY_SLOT_BASE + HOST_KEY_SLOT_SIZE * e; }
    Slot slot(uint32_t e) {
        const uint8_t *s = value(e);
        return {uint16_t(s[0] | s[1] << 8), uint16_t(s[2] | s[3] << 8)};
    }
    Bytes data(size_t offset, size_t n) const { return {&buffer[offset], &buffer[offset] + n}; }

    Bytes buffer;
    KeyFieldRequest request{};
};

TEST_F(KeyState, OctetAndWordKeys) {
    ASSERT_EQ(newCall(64), 1);
    value(0)[1] = 0xAB;
    EXPECT_EQ(markOctetKey(&request, 0, 0x1362), 1);
    EXPECT_EQ(data(HOST_KEY_SLOT_BASE, 2), (Bytes{0x62, 0xAB})) << "the low byte only";
    EXPECT_EQ(markWordKey(&request, 18, 0x10234), 1);
    EXPECT_EQ(Bytes(value(18), value(18) + 3), (Bytes{0x34, 0x02, 0x00})) << "little-endian";
    // A later occurrence overwrites: a two-digit MNC after a three-digit one.
    markWordKey(&request, 20, 0x0512);
    markOctetKey(&request, 20, 0x21);
    EXPECT_EQ(Bytes(value(20), value(20) + 2), (Bytes{0x21, 0x05}));
    EXPECT_TRUE(present(0) && present(18) && present(20));
    EXPECT_EQ(presentCount(), 3);
    EXPECT_EQ(request.dataOffset, kData);

    const Bytes before = buffer;
    const Field f = digits(3);
    EXPECT_EQ(markOctetKey(&request, DPX_KEY_ENTRY_COUNT, 1), 1);
    EXPECT_EQ(markWordKey(&request, 200, 1), 1);
    EXPECT_EQ(markVariableKey(&request, DPX_KEY_ENTRY_COUNT, &f.record), 1);
    EXPECT_EQ(buffer, before) << "entries outside the table mark nothing";
    EXPECT_EQ(request.dataOffset, kData);
}

TEST_F(KeyState, VariableValuesOfOneCallFollowEachOther) {
    ASSERT_EQ(newCall(64), 1);
    const Field otid = keytest::runs({0x0A, 0x0B, 0x0C, 0x0D}, 4);
    const Field called = digits(5);
    const Field again = digits(2);
    ASSERT_EQ(markVariableKey(&request, 26, &otid.record), 1);
    ASSERT_EQ(markVariableKey(&request, 10, &called.record), 1);
    ASSERT_EQ(markVariableKey(&request, 10, &again.record), 1);
    EXPECT_TRUE(present(26) && present(10));
    EXPECT_EQ(slot(26), (Slot{16, kData}));
    // The second occurrence wins the slot; the first stays in the data area.
    EXPECT_EQ(slot(10), (Slot{8, kData + 5}));
    EXPECT_EQ(data(kData, 7), (Bytes{0xAB, 0xCD, 0x01, 0x23, 0x45, 0x12, 0x00}));
    EXPECT_EQ(request.dataOffset, kData + 6);
}

TEST_F(KeyState, RoomIsSharedByTheValuesOfOneCall) {
    const struct {
        const char *name;
        uint16_t room;
        uint32_t digits[2];
        int results[2];
    } cases[] = {
        {"both fit", 6, {5, 5}, {1, 1}},
        {"exact fit, then exhausted", 3, {5, 0}, {1, 0}},
        {"second passes the room", 5, {5, 5}, {1, 0}},
        {"no room at all", 0, {0, 1}, {0, 0}},
        {"empty value in room", 1, {0, 1}, {1, 1}},
    };
    for (const auto &c : cases) {
        SCOPED_TRACE(c.name);
        ASSERT_EQ(newCall(c.room), 1);
        for (const uint32_t i : {0u, 1u}) {
            const uint32_t entry = i == 0 ? 26 : 29;
            const Field f = digits(c.digits[i]);
            const uint16_t at = request.dataOffset;
            const Bytes before = data(kData, 16);
            EXPECT_EQ(markVariableKey(&request, entry, &f.record), c.results[i]);
            EXPECT_TRUE(present(entry));
            if (c.results[i] == 0) { // the pass ends here
                EXPECT_EQ(slot(entry), (Slot{0, overflowAt(at)}));
                EXPECT_EQ(request.dataOffset, at);
                EXPECT_EQ(data(kData, 16), before);
                break;
            }
            EXPECT_EQ(slot(entry), (Slot{uint16_t(4 * c.digits[i]), at}));
        }
        EXPECT_LE(request.dataOffset - kData, c.room);
    }

    // The next call gets the whole room again; the host keeps the data
    // offset running into the next message.
    const Field six = digits(6);
    ASSERT_EQ(newCall(3), 1);
    ASSERT_EQ(markVariableKey(&request, 17, &six.record), 1);
    const uint16_t next = request.dataOffset;
    ASSERT_EQ(keyFieldPrologue(&request), 1);
    EXPECT_EQ(markVariableKey(&request, 17, &six.record), 1);
    EXPECT_EQ(slot(17), (Slot{24, next}));
    EXPECT_EQ(request.dataOffset, next + 3);
}

TEST_F(KeyState, SixteenBitLimitsOfOffsetAndBitLength) {
    prepare(100, 0x10000);
    request.dataOffset = 0xFFFD;
    ASSERT_EQ(keyFieldPrologue(&request), 1);
    const Field three = digits(6);
    const Field two = digits(4);
    EXPECT_EQ(markVariableKey(&request, 21, &three.record), 0) << "0xFFFD + 3 wraps to 0";
    EXPECT_EQ(slot(21), (Slot{0, overflowAt(0xFFFD)}));
    EXPECT_EQ(request.dataOffset, 0xFFFD);
    EXPECT_EQ(markVariableKey(&request, 21, &two.record), 1);
    EXPECT_EQ(slot(21), (Slot{16, 0xFFFD}));
    EXPECT_EQ(request.dataOffset, 0xFFFF);
    EXPECT_EQ(buffer[0xFFFE], 0x34);

    // 8192 octets are 65536 bits, one more than a slot can describe,
    // although the room would take them.
    ASSERT_EQ(newCall(0xFFFF), 1);
    const Field apn(std::vector<ValueSpan>(8192, ValueSpan{0x61, 1, 8, 0, {0, 0}}));
    EXPECT_EQ(markVariableKey(&request, 21, &apn.record), 0);
    EXPECT_EQ(slot(21), (Slot{0, overflowAt(kData)}));
    EXPECT_EQ(buffer[kData], 0);
}

TEST_F(KeyState, NegativeInitialisationIsKeptAndStopsTheEntryPoint) {
    const uint32_t calls = host_KfInitCalls();
    host_SetKfInitResult(-7, 0);
    EXPECT_EQ(keyFieldPrologue(&request), -7);
    host_ClearKfInitOverride(); // the host would succeed now
    EXPECT_EQ(keyFieldPrologue(&request), -7);
    const uint8_t message[] = {0x62, 0x00};
    DecodeState *st = host_NewState(message, sizeof message);
    request.state = st;
    request.remainingBits = 0xCAFE;
    EXPECT_EQ(KFE_3gpp_camel_400(&request), -7);
    EXPECT_EQ(request.remainingBits, 0xCAFEu);
    EXPECT_EQ(st->bitCursor, 1u);
    host_FreeState(st);
    EXPECT_EQ(host_KfInitCalls(), calls + 1);
    EXPECT_EQ(presentCount(), 0);
}

// Above 1 the selected entry is marked in every message; 0 asks the host
// again at the next call.
TEST_F(KeyState, InitialisationResultsAndTheSelectedEntry) {
    const struct {
        int32_t result;
        uint16_t index;
        int marked; // -1: none
        uint32_t hostCalls;
    } cases[] = {{2, 13, 13, 1}, {2, 0, 0, 1}, {1, 5, -1, 1}, {0, 5, -1, 2},
                 {2, DPX_KEY_ENTRY_COUNT, -1, 1}, {2, 0xFFFF, -1, 1}};
    for (const auto &c : cases) {
        SCOPED_TRACE(testing::Message() << c.result << " " << c.index);
        camel::resetKeyInitForTests();
        host_SetKfInitResult(c.result, c.index);
        const uint32_t calls = host_KfInitCalls();
        Bytes want(buffer.size(), 0);
        if (c.marked >= 0)
            want[c.marked / 8] = uint8_t(1u << (c.marked % 8));
        for (int message = 0; message < 2; ++message) {
            ASSERT_EQ(newCall(8), 1);
            EXPECT_EQ(buffer, want);
        }
        EXPECT_EQ(host_KfInitCalls(), calls + c.hostCalls);
    }
}

TEST_F(KeyState, NoKeyBufferRecordsNothingAndGoesOn) {
    host_SetKfInitResult(2, 0);
    request.keyBuffer = nullptr;
    const Field f = digits(3);
    EXPECT_EQ(keyFieldPrologue(&request), 1);
    EXPECT_EQ(markOctetKey(&request, 0, 0x62), 1);
    EXPECT_EQ(markWordKey(&request, 18, 0x234), 1);
    EXPECT_EQ(markVariableKey(&request, 10, &f.record), 1);
    EXPECT_EQ(request.dataOffset, kData);
}

} // namespace
