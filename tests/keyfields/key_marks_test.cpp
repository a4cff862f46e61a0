// Key-field marking against a key buffer laid out by the stand-in host's
// kf_InitialiseOptKFE: presence bits in bytes 0..3, slots at 4 + 4 * entry,
// packed values from byte 128.

#include "keyfields/key_marks.h"
#include "keyfields/key_state.h"

#include "dpx_standin_host.h"
#include "key_test_field.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <vector>

namespace {

using camel::keyFieldPrologue;
using camel::markOctetKey;
using camel::markVariableKey;
using camel::markWordKey;
using keytest::digits;
using keytest::Field;

constexpr uint16_t kData = HOST_KEY_DATA_START;

struct Slot {
    uint16_t bitLength;
    uint16_t dataOffset;
    bool operator==(const Slot &) const = default;
};

// The module's state as just loaded and the host's default behaviour, before
// and after every test, so no test sees another's initialisation result.
class KeyState : public ::testing::Test {
protected:
    void SetUp() override {
        camel::resetKeyInitForTests();
        host_ClearKfInitOverride();
        buffer.assign(512, 0);
        request = KeyFieldRequest{};
        request.keyBuffer = buffer.data();
        request.dataOffset = kData;
        request.valueRoom = 64;
    }
    void TearDown() override {
        camel::resetKeyInitForTests();
        host_ClearKfInitOverride();
    }

    // A new message in the same key buffer, cleared as the host clears it.
    int32_t newCall(uint16_t room) {
        std::memset(buffer.data(), 0, buffer.size());
        request.dataOffset = kData;
        request.valueRoom = room;
        return keyFieldPrologue(&request);
    }

    bool present(uint32_t entry) const {
        return (buffer[entry / 8] >> (entry % 8)) & 1u;
    }
    uint32_t presentCount() const {
        uint32_t n = 0;
        for (uint32_t e = 0; e < DPX_KEY_ENTRY_COUNT; ++e)
            n += present(e) ? 1 : 0;
        return n;
    }
    const uint8_t *value(uint32_t entry) const {
        return buffer.data() + HOST_KEY_SLOT_BASE + HOST_KEY_SLOT_SIZE * entry;
    }
    Slot slot(uint32_t entry) const {
        const uint8_t *s = value(entry);
        return {static_cast<uint16_t>(s[0] | s[1] << 8), static_cast<uint16_t>(s[2] | s[3] << 8)};
    }
    std::vector<uint8_t> data(uint16_t offset, size_t n) const {
        return {buffer.begin() + offset, buffer.begin() + offset + static_cast<long>(n)};
    }

    std::vector<uint8_t> buffer;
    KeyFieldRequest request{};
};

class KeyMarks : public KeyState {
protected:
    void SetUp() override {
        KeyState::SetUp();
        ASSERT_EQ(keyFieldPrologue(&request), 1);
    }
};

// ---- octet and word keys ------------------------------------------------------------

TEST_F(KeyMarks, OctetKeyStoresTheLowByteOnly) {
    buffer[HOST_KEY_SLOT_BASE + 1] = 0xAB;
    EXPECT_EQ(markOctetKey(&request, 0, 0x1362), 1);
    EXPECT_TRUE(present(0));
    EXPECT_EQ(value(0)[0], 0x62);
    EXPECT_EQ(value(0)[1], 0xAB);
    EXPECT_EQ(presentCount(), 1u);
    EXPECT_EQ(request.dataOffset, kData);
}

TEST_F(KeyMarks, WordKeyIsLittleEndian) {
    EXPECT_EQ(markWordKey(&request, 18, 0x10234), 1);
    EXPECT_TRUE(present(18));
    EXPECT_EQ(value(18)[0], 0x34);
    EXPECT_EQ(value(18)[1], 0x02);
    EXPECT_EQ(value(18)[2], 0x00);
    EXPECT_EQ(presentCount(), 1u);
}

TEST_F(KeyMarks, LaterOccurrenceOverwritesTheValue) {
    markWordKey(&request, 20, 0x0512);
    markOctetKey(&request, 20, 0x21); // a two-digit MNC: first byte only
    EXPECT_EQ(value(20)[0], 0x21);
    EXPECT_EQ(value(20)[1], 0x05);
}

TEST_F(KeyMarks, EntriesOutsideTheTableMarkNothing) {
    const Field f = digits(3);
    EXPECT_EQ(markOctetKey(&request, DPX_KEY_ENTRY_COUNT, 1), 1);
    EXPECT_EQ(markWordKey(&request, 200, 1), 1);
    EXPECT_EQ(markVariableKey(&request, DPX_KEY_ENTRY_COUNT, &f.record), 1);
    EXPECT_EQ(std::vector<uint8_t>(buffer.size(), 0), buffer);
    EXPECT_EQ(request.dataOffset, kData);
}

// ---- variable keys ----------------------------------------------------------------

TEST_F(KeyMarks, VariableKeyPointsItsSlotAtThePackedValue) {
    const Field f = digits(5);
    EXPECT_EQ(markVariableKey(&request, 10, &f.record), 1);
    EXPECT_TRUE(present(10));
    EXPECT_EQ(slot(10), (Slot{20, kData}));
    EXPECT_EQ(data(kData, 4), (std::vector<uint8_t>{0x01, 0x23, 0x45, 0x00}));
    EXPECT_EQ(request.dataOffset, kData + 3);
}

TEST_F(KeyMarks, ValuesOfOneCallFollowEachOther) {
    const Field otid({0x0A, 0x0B, 0x0C, 0x0D}, 4);
    const Field called = digits(3);
    const Field again = digits(2);
    ASSERT_EQ(markVariableKey(&request, 26, &otid.record), 1);
    ASSERT_EQ(markVariableKey(&request, 10, &called.record), 1);
    ASSERT_EQ(markVariableKey(&request, 10, &again.record), 1);
    EXPECT_EQ(slot(26), (Slot{16, kData}));
    // The second occurrence wins the slot; the first stays in the data area.
    EXPECT_EQ(slot(10), (Slot{8, kData + 4}));
    EXPECT_EQ(data(kData, 5), (std::vector<uint8_t>{0xAB, 0xCD, 0x01, 0x23, 0x12}));
    EXPECT_EQ(request.dataOffset, kData + 5);
}

// The room is shared by all variable values of one call.
struct RoomCase {
    const char *name;
    uint16_t room;
    uint32_t firstDigits;
    uint32_t secondDigits;
    int firstResult;
    int secondResult;
};

TEST_F(KeyState, RoomIsSharedByTheValuesOfOneCall) {
    const RoomCase cases[] = {
        {"both fit", 6, 5, 5, 1, 1},
        {"exact fit, then exhausted", 3, 5, 0, 1, 0},
        {"second passes the room", 5, 5, 5, 1, 0},
        {"no room at all", 0, 0, 1, 0, 0},
        {"empty value in room", 1, 0, 1, 1, 1},
    };
    for (const RoomCase &c : cases) {
        SCOPED_TRACE(c.name);
        ASSERT_EQ(newCall(c.room), 1);
        const Field first = digits(c.firstDigits);
        const Field second = digits(c.secondDigits);
        const std::vector<uint8_t> before = data(kData, 16);

        EXPECT_EQ(markVariableKey(&request, 26, &first.record), c.firstResult);
        if (c.firstResult == 0) {
            EXPECT_TRUE(present(26));
            EXPECT_EQ(slot(26), (Slot{0, kData | DPX_KEY_OVERFLOW_BIT}));
            EXPECT_EQ(request.dataOffset, kData);
            EXPECT_EQ(data(kData, 16), before);
            continue; // the pass ends here
        }
        const uint16_t afterFirst = request.dataOffset;
        const std::vector<uint8_t> written = data(kData, 16);
        EXPECT_EQ(markVariableKey(&request, 29, &second.record), c.secondResult);
        EXPECT_TRUE(present(29));
        if (c.secondResult == 0) {
            EXPECT_EQ(slot(29), (Slot{0, static_cast<uint16_t>(afterFirst | DPX_KEY_OVERFLOW_BIT)}));
            EXPECT_EQ(request.dataOffset, afterFirst);
            EXPECT_EQ(data(kData, 16), written);
        } else {
            EXPECT_EQ(slot(29), (Slot{static_cast<uint16_t>(4 * c.secondDigits), afterFirst}));
        }
        EXPECT_LE(request.dataOffset - kData, c.room);
    }
}

TEST_F(KeyMarks, EachCallGetsTheWholeRoomAgain) {
    const Field f = digits(6);
    ASSERT_EQ(newCall(3), 1);
    ASSERT_EQ(markVariableKey(&request, 17, &f.record), 1);
    // The host keeps the data offset running into the next message.
    const uint16_t next = request.dataOffset;
    request.valueRoom = 3;
    ASSERT_EQ(keyFieldPrologue(&request), 1);
    EXPECT_EQ(markVariableKey(&request, 17, &f.record), 1);
    EXPECT_EQ(slot(17), (Slot{24, next}));
    EXPECT_EQ(request.dataOffset, next + 3);
}

TEST_F(KeyState, DataOffsetNeverWraps) {
    buffer.assign(0x10000, 0);
    request.keyBuffer = buffer.data();
    request.dataOffset = 0xFFFD;
    request.valueRoom = 100;
    ASSERT_EQ(keyFieldPrologue(&request), 1);
    const Field two = digits(4);
    const Field three = digits(6);
    // 0xFFFD + 3 would wrap to 0: refused.
    EXPECT_EQ(markVariableKey(&request, 21, &three.record), 0);
    EXPECT_EQ(slot(21), (Slot{0, 0xFFFD}));
    EXPECT_EQ(request.dataOffset, 0xFFFD);
    EXPECT_EQ(markVariableKey(&request, 21, &two.record), 1);
    EXPECT_EQ(slot(21), (Slot{16, 0xFFFD}));
    EXPECT_EQ(request.dataOffset, 0xFFFF);
    EXPECT_EQ(buffer[0xFFFE], 0x34);
}

TEST_F(KeyMarks, ValueTooLongForTheSlotOverflows) {
    // 8192 octets: 65536 bits, one more than the slot's bit length holds,
    // although the room would take them.
    buffer.assign(0x10000, 0);
    request.keyBuffer = buffer.data();
    request.valueRoom = 0xFFFF;
    ASSERT_EQ(keyFieldPrologue(&request), 1);
    std::vector<ValueSpan> spans(8192, ValueSpan{0x61, 1, 8, 0, {0, 0}});
    const Field apn(std::move(spans));
    EXPECT_EQ(markVariableKey(&request, 21, &apn.record), 0);
    EXPECT_EQ(slot(21), (Slot{0, kData | DPX_KEY_OVERFLOW_BIT}));
    EXPECT_EQ(buffer[kData], 0);
}

// ---- prologue ---------------------------------------------------------------------

TEST_F(KeyState, FailedInitialisationIsReturnedForEverWithoutAskingAgain) {
    const uint32_t calls = host_KfInitCalls();
    host_SetKfInitResult(-7, 0);
    EXPECT_EQ(keyFieldPrologue(&request), -7);
    host_ClearKfInitOverride(); // the host would succeed now
    EXPECT_EQ(keyFieldPrologue(&request), -7);
    EXPECT_EQ(keyFieldPrologue(&request), -7);
    EXPECT_EQ(host_KfInitCalls(), calls + 1);
    EXPECT_EQ(presentCount(), 0u);
}

TEST_F(KeyState, FailedInitialisationStopsTheEntryPointBeforeDecoding) {
    const uint8_t message[] = {0x62, 0x00};
    DecodeState *st = host_NewState(message, sizeof message);
    ASSERT_NE(st, nullptr);
    request.state = st;
    request.remainingBits = 0xCAFE;
    host_SetKfInitResult(-3, 0);
    EXPECT_EQ(KFE_3gpp_camel_400(&request), -3);
    EXPECT_EQ(KFE_3gpp_camel_400(&request), -3);
    EXPECT_EQ(request.remainingBits, 0xCAFEu);
    EXPECT_EQ(st->bitCursor, 1u);
    EXPECT_EQ(presentCount(), 0u);
    host_FreeState(st);
}

TEST_F(KeyState, ZeroResultIsRetriedAtTheNextCall) {
    const uint32_t calls = host_KfInitCalls();
    host_SetKfInitResult(0, 0);
    EXPECT_EQ(keyFieldPrologue(&request), 1);
    EXPECT_EQ(keyFieldPrologue(&request), 1);
    EXPECT_EQ(host_KfInitCalls(), calls + 2);
    host_ClearKfInitOverride();
    EXPECT_EQ(keyFieldPrologue(&request), 1);
    EXPECT_EQ(keyFieldPrologue(&request), 1);
    EXPECT_EQ(host_KfInitCalls(), calls + 3);
    EXPECT_EQ(presentCount(), 0u);
}

TEST_F(KeyState, SelectedEntryIsMarkedInEveryMessage) {
    host_SetKfInitResult(2, 13);
    ASSERT_EQ(newCall(8), 1);
    EXPECT_TRUE(present(13));
    EXPECT_EQ(presentCount(), 1u);
    ASSERT_EQ(newCall(8), 1); // no host call now, still marked
    EXPECT_TRUE(present(13));
    EXPECT_EQ(presentCount(), 1u);

    camel::resetKeyInitForTests();
    host_SetKfInitResult(2, 0);
    ASSERT_EQ(newCall(8), 1);
    EXPECT_TRUE(present(0));
    EXPECT_EQ(presentCount(), 1u);
}

TEST_F(KeyState, NoSelectionMarksNothing) {
    for (const auto &[result, index] : {std::pair<int32_t, uint16_t>{1, 5},
                                       {2, DPX_KEY_ENTRY_COUNT},
                                       {2, 0xFFFF}}) {
        SCOPED_TRACE(index);
        camel::resetKeyInitForTests();
        host_SetKfInitResult(result, index);
        ASSERT_EQ(newCall(8), 1);
        EXPECT_EQ(std::vector<uint8_t>(buffer.size(), 0), buffer);
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
