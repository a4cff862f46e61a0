// libFuzzer target over the module's four pass entry points.
//
// Input: one option octet, then the message.  Each input is decoded by
// dpx_PreDecodeMD, dpx_PreDecodeTO, dpx_PreDecodeMV and KFE_3gpp_camel_400,
// each on a freshly prepared state whose buffer is an exact-size copy (so
// the address sanitizer sees any read past the message), and the results
// are checked against the invariants every host relies on.  A violated
// invariant prints what was wrong and traps, which libFuzzer reports as a
// crash with the input saved.
//
// Option octet:
//   bits 0-1  octets of a lower layer before the message (value % 3): the
//             host decoded them first, so the cursor does not start at 1,
//             the lower layer's frame is the current one and one layer
//             entry is already filled
//   bit 2     minimal host arrays: position and end stacks, span array and
//             layer frames hold one entry each (allocated to exactly that
//             size), so every growth path runs
//   bits 3-4  room for variable key values: 3968, 64, 4 or 0 bytes (the key
//             buffer is allocated to exactly 128 + room bytes)
//   bit 5     run the four passes in reverse order
//   bit 6     the request's layer entries are full: pu_CreateNewLayerInfo
//             has to be called before the pass fills its entry
//   bit 7     the key-field request has no key buffer

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

#include "dpx_camel.h"
#include "dpx_standin_host.h"
#include "fields/field_table.h"

namespace {

// Octets standing for the lower layer.  They look like the start of a TCAP
// message with a long-form length, so a pass that reads before its cursor
// gets something it would act on.
constexpr uint8_t kLowerLayer[2] = {0x62, 0x81};

constexpr uint16_t kKeyRooms[4] = {3968, 64, 4, 0};

constexpr uint32_t kVariableKeys[] = {10, 12, 15, 17, 21, 26, 29};

struct Options {
    uint32_t junk;
    bool smallArrays;
    uint16_t keyRoom;
    bool reverse;
    bool layersFull;
    bool noKeyBuffer;
};

Options optionsOf(uint8_t o) {
    return Options{static_cast<uint32_t>(o & 3u) % 3u, (o & 0x04u) != 0,
                   kKeyRooms[(o >> 3) & 3u],          (o & 0x20u) != 0,
                   (o & 0x40u) != 0,                  (o & 0x80u) != 0};
}

const uint8_t *g_message = nullptr;
size_t g_messageSize = 0;

[[noreturn]] void fail(const char *what, uint32_t a, uint32_t b) {
    std::fprintf(stderr, "camel_fuzz: invariant violated: %s (%u, %u)\nmessage:", what, a, b);
    for (size_t i = 0; i < g_messageSize; ++i)
        std::fprintf(stderr, " %02X", g_message[i]);
    std::fprintf(stderr, "\n");
    __builtin_trap();
}

#define CHECK(cond, what, a, b)                                                                  \
    do {                                                                                         \
        if (!(cond))                                                                             \
            fail(what, static_cast<uint32_t>(a), static_cast<uint32_t>(b));                      \
    } while (0)

template <typename T>
T *exactArray(T *block, uint32_t count) {
    void *p = std::realloc(block, count * sizeof(T));
    if (p == nullptr)
        std::abort();
    return static_cast<T *>(p);
}

// A state over `junk` lower-layer octets followed by the message, prepared
// as a host does after decoding the lower layer.
DecodeState *newState(const Options &opt, const std::vector<uint8_t> &buffer) {
    DecodeState *st = host_NewState(buffer.data(), static_cast<uint32_t>(buffer.size()));
    if (st == nullptr)
        std::abort();
    if (opt.smallArrays) {
        st->posStack = exactArray(st->posStack, 1);
        st->posTop = st->posStack;
        st->posCapacity = 1;
        st->endStack = exactArray(st->endStack, 1);
        st->endTop = st->endStack;
        st->endCapacity = 1;
        st->field.spans = exactArray(st->field.spans, 1);
        st->field.spanCapacity = 1;
        st->layerFrames = exactArray(st->layerFrames, 1);
        st->frameCapacity = 1;
    }
    if (opt.junk != 0) {
        st->bitCursor = opt.junk * 8 + 1;
        st->remainingBits = st->totalBits - opt.junk * 8;
        st->firstFrameFlag = 0;
        st->frameIndex = 0;
        st->layerFrames[0].startBit = 1;
    }
    return st;
}

struct End {
    uint32_t cursor, remainingBits, errorFlags;
    uint32_t posDepth, endDepth;
};

End endOf(const DecodeState *st) {
    CHECK(st->posStack != nullptr && st->endStack != nullptr, "stack freed", 0, 0);
    return End{st->bitCursor, st->remainingBits, st->errorFlags,
               static_cast<uint32_t>(st->posTop - st->posStack),
               static_cast<uint32_t>(st->endTop - st->endStack)};
}

struct Run {
    uint32_t firstBit;      // first message bit (after the lower layer)
    uint32_t totalBits;     // last bit of the buffer
    End md{}, to{}, mv{}, kf{};
    bool keysComplete = false;
    uint32_t decodedCount = 0, displayCount = 0;
    std::vector<std::string> decodedTexts, displayTexts;
    std::vector<uint32_t> decodedIds, displayIds;
};

void checkSpans(const Run &run) {
    for (uint32_t i = 0; i < host_DecodedCount(); ++i) {
        const HostDecodedField *f = host_Decoded(i);
        for (uint32_t k = 0; k < f->spanCount; ++k) {
            const HostSpan &s = f->spans[k];
            CHECK(s.firstBit >= run.firstBit && s.firstBit <= run.totalBits,
                  "span starts outside the message", s.firstBit, f->fieldId);
            CHECK(s.lastBit >= run.firstBit && s.lastBit <= run.totalBits,
                  "span ends outside the message", s.lastBit, f->fieldId);
            CHECK(s.firstBit <= s.lastBit, "span runs backwards", s.firstBit, s.lastBit);
        }
    }
}

void checkStacks(const End &e) {
    CHECK(e.posDepth == 0, "position stack not balanced", e.posDepth, 0);
    CHECK(e.endDepth == 0, "end stack not balanced", e.endDepth, 0);
}

// The pre-decode passes.  Which: 0 decoded fields, 1 display, 2 view.
void runPreDecode(const Options &opt, const std::vector<uint8_t> &buffer, int which, Run &run) {
    DecodeState *st = newState(opt, buffer);
    PreDecodeRequest rq;
    const uint32_t layerLimit = opt.layersFull ? 0 : 4;
    host_InitRequest(&rq, st, 4, layerLimit);
    rq.layerCode = 0x5A;
    rq.layerTag = 0x1234;
    rq.remainingBits = 0xDEAD;
    // A lower layer took the first entry; with full entries the module has
    // to ask for another one.
    const uint32_t layerIndex = opt.layersFull ? 1 : (opt.junk != 0 ? 1 : 0);
    rq.layerIndex = layerIndex;
    host_ClearRecords();

    uint8_t result = 0;
    switch (which) {
    case 0: result = dpx_PreDecodeMD(&rq); break;
    case 1: result = dpx_PreDecodeTO(&rq); break;
    default: result = dpx_PreDecodeMV(&rq); break;
    }
    CHECK(result == 1, "pre-decode pass did not return 1", which, result);
    const End e = endOf(st);
    checkStacks(e);
    CHECK(rq.remainingBits == st->remainingBits, "request remaining bits differ from the state's",
          rq.remainingBits, st->remainingBits);
    CHECK(st->bitCursor >= run.firstBit && st->bitCursor <= run.totalBits + 1,
          "cursor outside the message", st->bitCursor, which);
    CHECK(st->bitCursor - 1 + st->remainingBits <= run.totalBits, "window past the message",
          st->bitCursor, st->remainingBits);
    if (which == 2) {
        CHECK(rq.layerIndex == layerIndex, "message-view pass moved the layer index",
              rq.layerIndex, layerIndex);
        CHECK(rq.status == (st->errorFlags != 0 ? DPX_STATUS_INVALID : 0),
              "message-view status does not match the error flags", rq.status, st->errorFlags);
        CHECK(host_DecodedCount() == 0 && host_DisplayCount() == 0,
              "message-view pass reported fields", host_DecodedCount(), host_DisplayCount());
        run.mv = e;
    } else {
        CHECK(rq.layerIndex == layerIndex + 1, "layer index not advanced", rq.layerIndex,
              layerIndex);
        CHECK(rq.layerLimit >= layerIndex, "layer entry filled past the limit", rq.layerLimit,
              layerIndex);
        const LayerInfoEntry &entry = rq.layerEntries[layerIndex];
        CHECK(entry.firstBit == run.firstBit, "layer entry first bit", entry.firstBit,
              run.firstBit);
        CHECK(entry.lastBit == st->bitCursor - 1, "layer entry last bit", entry.lastBit,
              st->bitCursor);
        CHECK(entry.layerTag == 0x1234 && entry.layerCode == 0x5A, "layer entry tag and code",
              entry.layerTag, entry.layerCode);
        if (which == 0) {
            CHECK(host_DisplayCount() == 0, "decoded-field pass reported display values",
                  host_DisplayCount(), 0);
            checkSpans(run);
            run.decodedCount = host_DecodedCount();
            for (uint32_t i = 0; i < run.decodedCount; ++i) {
                const HostDecodedField *f = host_Decoded(i);
                run.decodedTexts.emplace_back(f->text);
                run.decodedIds.push_back(f->fieldId);
            }
            run.md = e;
        } else {
            CHECK(host_DecodedCount() == 0, "display pass reported decoded fields",
                  host_DecodedCount(), 0);
            run.displayCount = host_DisplayCount();
            for (uint32_t i = 0; i < run.displayCount; ++i) {
                run.displayTexts.emplace_back(host_Display(i)->text);
                run.displayIds.push_back(host_Display(i)->displayId);
            }
            run.to = e;
        }
    }
    host_ClearRecords();
    host_FreeRequest(&rq);
    host_FreeState(st);
}

void runKeys(const Options &opt, const std::vector<uint8_t> &buffer, Run &run) {
    DecodeState *st = newState(opt, buffer);
    const size_t size = HOST_KEY_DATA_START + opt.keyRoom;
    uint8_t *keys = opt.noKeyBuffer ? nullptr : static_cast<uint8_t *>(std::calloc(size, 1));
    KeyFieldRequest rq;
    std::memset(&rq, 0, sizeof rq);
    rq.keyBuffer = keys;
    rq.dataOffset = HOST_KEY_DATA_START;
    rq.valueRoom = opt.keyRoom;
    rq.remainingBits = 0xDEAD;
    rq.state = st;
    host_ClearRecords();

    const int32_t result = KFE_3gpp_camel_400(&rq);
    CHECK(result == 1 || result == 0, "key-field pass result", result, 0);
    CHECK(rq.dataOffset >= HOST_KEY_DATA_START && rq.dataOffset <= size,
          "key data offset outside the data area", rq.dataOffset, size);
    CHECK(host_DecodedCount() == 0 && host_DisplayCount() == 0, "key-field pass reported fields",
          host_DecodedCount(), host_DisplayCount());
    if (result == 0) {
        // Only a variable value that did not fit may end the pass early.
        bool overflow = false;
        if (keys != nullptr) {
            for (uint32_t entry : kVariableKeys) {
                const uint8_t *slot = keys + HOST_KEY_SLOT_BASE + HOST_KEY_SLOT_SIZE * entry;
                const uint32_t offset = slot[2] | (slot[3] << 8);
                const bool present = (keys[entry / 8] & (1u << (entry % 8))) != 0;
                if (present && (offset & DPX_KEY_OVERFLOW_BIT) != 0)
                    overflow = true;
            }
        }
        CHECK(overflow, "key-field pass returned 0 without a key overflow", opt.keyRoom, 0);
        run.keysComplete = false;
    } else {
        const End e = endOf(st);
        checkStacks(e);
        CHECK(rq.remainingBits == st->remainingBits,
              "key request remaining bits differ from the state's", rq.remainingBits,
              st->remainingBits);
        run.kf = e;
        run.keysComplete = true;
    }
    host_ClearRecords();
    std::free(keys);
    host_FreeState(st);
}

bool sameEnd(const End &a, const End &b) {
    return a.cursor == b.cursor && a.remainingBits == b.remainingBits &&
           a.errorFlags == b.errorFlags;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
    if (size == 0 || size > 4096)
        return 0;
    const Options opt = optionsOf(data[0]);
    g_message = data + 1;
    g_messageSize = size - 1;

    std::vector<uint8_t> buffer(kLowerLayer, kLowerLayer + opt.junk);
    buffer.insert(buffer.end(), data + 1, data + size);

    Run run;
    run.firstBit = opt.junk * 8 + 1;
    run.totalBits = static_cast<uint32_t>(buffer.size()) * 8;

    if (opt.reverse) {
        runKeys(opt, buffer, run);
        for (int which = 2; which >= 0; --which)
            runPreDecode(opt, buffer, which, run);
    } else {
        for (int which = 0; which <= 2; ++which)
            runPreDecode(opt, buffer, which, run);
        runKeys(opt, buffer, run);
    }

    CHECK(sameEnd(run.to, run.md), "display pass ends elsewhere than the decoded-field pass",
          run.to.cursor, run.md.cursor);
    CHECK(sameEnd(run.mv, run.md), "message-view pass ends elsewhere than the decoded-field pass",
          run.mv.cursor, run.md.cursor);
    if (run.keysComplete)
        CHECK(sameEnd(run.kf, run.md), "key-field pass ends elsewhere than the decoded-field pass",
              run.kf.cursor, run.md.cursor);
    CHECK(run.displayCount == run.decodedCount,
          "display pass reported another number of fields than the decoded-field pass",
          run.displayCount, run.decodedCount);
    // Every field is declared, shown under its label's display id, and its
    // display value is the value part of its decoded-field text (before the
    // field's suffix), except where the display pass names values its own way.
    for (size_t i = 0; i < run.decodedTexts.size(); ++i) {
        const size_t at = camel::fieldIndex(run.decodedIds[i]);
        CHECK(at < camel::kFieldCount, "reported field id is not declared", i, run.decodedIds[i]);
        CHECK(run.displayIds[i] == camel::kDisplayIds.id[at], "display id is not the label's",
              run.decodedIds[i], run.displayIds[i]);
        const camel::FieldDef &def = camel::kFields[at];
        if (def.displayNameCount != 0 || run.decodedTexts[i].size() + 1 >= DPX_TEXT_BUFFER_SIZE)
            continue; // named its own way, or cut to the host's line
        const std::string &text = run.decodedTexts[i];
        const std::string value = run.displayTexts[i] + def.suffix;
        CHECK(text.size() >= value.size() &&
                  text.compare(text.size() - value.size(), value.size(), value) == 0,
              "display value does not end its decoded-field text", i, value.size());
    }
    return 0;
}
