// Stand-in for the host's parser utility library (libpu_ParserUtilities.so).
//
// It provides the pu_* functions the module imports, prepares decoding states
// and requests the way a host does, and records every field the module
// reports so that dpx-decode and the tests see exactly what a host would see.
// Single-threaded by design, like the host calls the module.

#include "host_export.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <deque>
#include <vector>

namespace {

constexpr uint32_t kStackCapacity = 16;        // position and end stacks
constexpr uint32_t kFrameCapacity = 4;         // layer frames
constexpr size_t kTextBufferBytes = 256;       // 255 characters + NUL
constexpr size_t kTextLimit = kTextBufferBytes - 1;

// ---- allocation ------------------------------------------------------------
// Everything the module may grow is allocated with malloc so that pu_Realloc
// (plain realloc) can move it and host_FreeState can free the final block.

[[noreturn]] void outOfMemory(const char *what) {
    std::fprintf(stderr, "stand-in host: out of memory (%s)\n", what);
    std::abort();
}

template <typename T>
T *allocArray(size_t count) {
    void *block = std::calloc(count ? count : 1, sizeof(T));
    return static_cast<T *>(block);
}

// ---- failure injection -------------------------------------------------------

uint32_t g_reallocCalls = 0;
uint32_t g_reallocFailAt = 0;
uint8_t g_accessPointNameResult = 1;

// ---- recorder ----------------------------------------------------------------
//
// Each kind of record appends its texts to one character arena and its
// spans to one pool, so recording a field costs two bounded copies and no
// allocation once the arenas have grown to a message's size.  The fixed-size
// HostDecodedField / HostDisplayField copies are made only when asked for.

struct DecodedEntry {
    uint32_t text, textLength, label, labelLength; // offsets into Recorder::decodedChars
    uint32_t fieldId, selector, firstSpan, spanCount, arg8, arg9;
    uint8_t lineLayerCode;
};

struct DisplayEntry {
    uint32_t text, textLength, displayId; // offset into Recorder::displayChars
};

// Texts one after the other, each NUL-terminated; only grows, so that
// recording costs one length scan and one copy per text.
struct CharArena {
    std::vector<char> bytes;
    size_t used = 0;

    // Appends at most 255 characters of `src` and a NUL; returns the offset
    // of the copy and stores its length in `length`.
    uint32_t append(const char *src, uint32_t &length) {
        const size_t n = src != nullptr ? strnlen(src, kTextLimit) : 0;
        if (bytes.size() - used < n + 1) {
            bytes.resize(std::max(bytes.size() * 2, used + n + 1));
        }
        char *at = bytes.data() + used;
        if (n != 0) {
            std::memcpy(at, src, n);
        }
        at[n] = '\0';
        const size_t offset = used;
        used += n + 1;
        length = static_cast<uint32_t>(n);
        return static_cast<uint32_t>(offset);
    }
    const char *at(uint32_t offset) const { return bytes.data() + offset; }
};

struct Recorder {
    CharArena decodedChars;
    std::vector<DecodedEntry> decoded;
    std::vector<HostSpan> spans; // grows only; spansUsed are in use
    size_t spansUsed = 0;
    CharArena displayChars;
    std::vector<DisplayEntry> display;
    // host_Decoded / host_Display results: a deque, so the ones handed out
    // stay where they are while more are made.
    std::deque<HostDecodedField> decodedCopies;
    std::deque<HostDisplayField> displayCopies;
    uint32_t createLayerCalls = 0;

    Recorder() {
        decodedChars.bytes.resize(1 << 16);
        decoded.reserve(4096);
        spans.resize(16384);
        displayChars.bytes.resize(1 << 15);
        display.reserve(4096);
    }
};

Recorder g_recorder;

void copyText(char (&dst)[kTextBufferBytes], const char *src, uint32_t n) {
    std::memcpy(dst, src, n);
    dst[n] = '\0';
}

bool printable(uint8_t octet) { return octet >= 0x20 && octet <= 0x7E; }

// Brings a state's arrays back to what a host provides before a pass.  An
// array a failed growth left null is allocated again at its initial size; an
// array that grew keeps its size.
bool prepareArrays(DecodeState *s) {
    if (s->posStack == nullptr) {
        s->posStack = allocArray<uint32_t>(kStackCapacity);
        s->posCapacity = kStackCapacity;
    }
    if (s->endStack == nullptr) {
        s->endStack = allocArray<uint32_t>(kStackCapacity);
        s->endCapacity = kStackCapacity;
    }
    if (s->elementName == nullptr) {
        s->elementName = allocArray<char>(kTextBufferBytes);
    }
    if (s->field.label == nullptr) {
        s->field.label = allocArray<char>(kTextBufferBytes);
    }
    if (s->field.valueText == nullptr) {
        s->field.valueText = allocArray<char>(kTextBufferBytes);
    }
    if (s->field.spans == nullptr) {
        s->field.spans = allocArray<ValueSpan>(DPX_INITIAL_SPANS);
        s->field.spanCapacity = DPX_INITIAL_SPANS;
    }
    if (s->layerFrames == nullptr) {
        s->layerFrames = allocArray<LayerFrame>(kFrameCapacity);
        s->frameCapacity = kFrameCapacity;
    }
    return s->posStack && s->endStack && s->elementName && s->field.label &&
           s->field.valueText && s->field.spans && s->layerFrames;
}

void resetMembers(DecodeState *s) {
    const uint32_t bits = s->totalBits;
    s->bitCursor = 1;
    std::memset(s->reserved0, 0, sizeof s->reserved0);
    s->remainingBits = bits;
    s->errorFlags = 0;

    s->posStack[0] = 1;
    s->posTop = s->posStack;
    s->posIndex = 0;
    s->endStack[0] = bits;
    s->endTop = s->endStack;
    s->endIndex = 0;

    s->testFlag = 0;
    std::memset(s->reserved1, 0, sizeof s->reserved1);
    s->fieldWidth = 0;
    s->occurrenceCounter = 0;
    s->elementName[0] = '\0';
    std::memset(s->reservedArea, 0, sizeof s->reservedArea);

    FieldRecord &f = s->field;
    f.fieldId = 0;
    f.label[0] = '\0';
    f.value = 0;
    f.valueText[0] = '\0';
    f.spansFilled = 0;
    f.spansReported = 0;
    f.lengthFieldStart = 0;
    f.lengthFieldBits = 0;
    std::memset(f.reserved, 0, sizeof f.reserved);
    f.valueKind = 0;

    std::memset(s->reserved2, 0, sizeof s->reserved2);
    s->firstFrameFlag = 1;
    s->frameIndex = 0;
}

} // namespace

extern "C" {

// ---- pu_* imported by the module ---------------------------------------------

void *pu_Realloc(void *block, size_t size) {
    ++g_reallocCalls;
    if (g_reallocFailAt != 0 && g_reallocCalls == g_reallocFailAt) {
        // The module drops its pointer when growth fails and never frees it;
        // the host releases the block here so nothing leaks, and any later
        // touch of the old block by the module shows up under ASan.
        std::free(block);
        return nullptr;
    }
    return std::realloc(block, size != 0 ? size : 1);
}

void *pu_Malloc(size_t size) { return std::malloc(size != 0 ? size : 1); }

void pu_CreateNewLayerInfo(PreDecodeRequest *request) {
    ++g_recorder.createLayerCalls;
    if (request == nullptr) {
        return;
    }
    const uint64_t have = request->layerEntries ? uint64_t{request->layerLimit} + 1 : 0;
    if (request->layerIndex < have) {
        return;
    }
    uint64_t capacity = have != 0 ? have : 1;
    while (capacity <= request->layerIndex) {
        capacity *= 2;
    }
    void *grown = std::realloc(request->layerEntries, capacity * sizeof(LayerInfoEntry));
    if (grown == nullptr) {
        outOfMemory("layer entries");
    }
    auto *entries = static_cast<LayerInfoEntry *>(grown);
    std::memset(entries + have, 0, (capacity - have) * sizeof(LayerInfoEntry));
    request->layerEntries = entries;
    request->layerLimit = static_cast<uint32_t>(capacity - 1);
}

int32_t pu_AddDecodedFieldsData(PreDecodeRequest *request, uint32_t spanCount,
                                ValueSpan *spans, char *text, uint32_t spanSelector,
                                char *label, uint32_t fieldId, uint32_t zero1,
                                uint32_t zero2) {
    Recorder &r = g_recorder;
    DecodedEntry e{};
    e.text = r.decodedChars.append(text, e.textLength);
    e.label = r.decodedChars.append(label, e.labelLength);
    e.fieldId = fieldId;
    e.selector = spanSelector;
    e.arg8 = zero1;
    e.arg9 = zero2;
    if (request != nullptr && request->outputLines != nullptr) {
        const size_t line = size_t{request->currentLineIndex} * DPX_OUTPUT_LINE_SIZE;
        e.lineLayerCode = static_cast<uint8_t>(request->outputLines[line]);
    }
    e.firstSpan = static_cast<uint32_t>(r.spansUsed);
    e.spanCount = spans != nullptr ? spanCount : 0;
    if (r.spans.size() - r.spansUsed < e.spanCount) {
        r.spans.resize(std::max(r.spans.size() * 2, r.spansUsed + e.spanCount));
    }
    r.spansUsed += e.spanCount;
    HostSpan *to = r.spans.data() + e.firstSpan;
    for (uint32_t i = 0; i < e.spanCount; ++i) {
        to[i] = HostSpan{spans[i].value, spans[i].firstBit, spans[i].lastBit};
    }
    r.decoded.push_back(e);
    return 1;
}

int32_t pu_AddFieldsToDisplayData(PreDecodeRequest * /*request*/, char *text,
                                  uint32_t displayId) {
    Recorder &r = g_recorder;
    DisplayEntry e{};
    e.text = r.displayChars.append(text, e.textLength);
    e.displayId = displayId;
    r.display.push_back(e);
    return 1;
}

// Appends the access point name held in the current field's reported spans
// (one octet per span) as dot-separated labels: each label is a length octet
// followed by that many characters.
uint8_t pu_access_point_name(char *text, uint32_t /*value*/, DecodeState *state) {
    if (g_accessPointNameResult == 0) {
        return 0;
    }
    if (text == nullptr) {
        return 1;
    }
    size_t len = strnlen(text, kTextLimit);
    auto put = [&](char c) {
        if (len < kTextLimit) {
            text[len++] = c;
        }
    };
    if (state != nullptr && state->field.spans != nullptr) {
        const ValueSpan *octets = state->field.spans;
        const uint32_t count = state->field.spansReported;
        uint32_t i = 0;
        bool firstLabel = true;
        while (i < count) {
            uint32_t labelLength = octets[i++].value & 0xFFu;
            if (!firstLabel) {
                put('.');
            }
            firstLabel = false;
            for (; labelLength > 0 && i < count; --labelLength, ++i) {
                const auto octet = static_cast<uint8_t>(octets[i].value & 0xFFu);
                put(printable(octet) ? static_cast<char>(octet) : '?');
            }
        }
    }
    text[len] = '\0';
    return 1;
}

// ---- state and request preparation -------------------------------------------

DecodeState *host_NewState(const uint8_t *message, uint32_t length) {
    if (length > UINT32_MAX / 8) {
        return nullptr;
    }
    auto *state = allocArray<DecodeState>(1);
    if (state == nullptr) {
        return nullptr;
    }
    // Exactly `length` bytes, so a read past the message is an ASan error.
    auto *bytes = static_cast<uint8_t *>(std::malloc(length != 0 ? length : 1));
    if (bytes == nullptr) {
        std::free(state);
        return nullptr;
    }
    if (length != 0) {
        std::memcpy(bytes, message, length);
    }
    state->buffer = bytes;
    state->totalBits = length * 8;
    if (!prepareArrays(state)) {
        host_FreeState(state);
        return nullptr;
    }
    resetMembers(state);
    return state;
}

void host_ResetState(DecodeState *state) {
    if (state == nullptr) {
        return;
    }
    if (!prepareArrays(state)) {
        outOfMemory("decode state");
    }
    resetMembers(state);
}

void host_FreeState(DecodeState *state) {
    if (state == nullptr) {
        return;
    }
    std::free(const_cast<uint8_t *>(state->buffer));
    std::free(state->posStack);
    std::free(state->endStack);
    std::free(state->elementName);
    std::free(state->field.label);
    std::free(state->field.valueText);
    std::free(state->field.spans);
    std::free(state->layerFrames);
    std::free(state);
}

void host_InitRequest(PreDecodeRequest *request, DecodeState *state, uint32_t lines,
                      uint32_t layerLimit) {
    std::memset(request, 0, sizeof *request);
    if (lines != 0) {
        request->outputLines = allocArray<char>(size_t{lines} * DPX_OUTPUT_LINE_SIZE);
        if (request->outputLines == nullptr) {
            outOfMemory("output lines");
        }
    }
    request->layerEntries = allocArray<LayerInfoEntry>(size_t{layerLimit} + 1);
    if (request->layerEntries == nullptr) {
        outOfMemory("layer entries");
    }
    request->layerIndex = 0;
    request->layerLimit = layerLimit;
    request->status = 0;
    request->state = state;
}

void host_FreeRequest(PreDecodeRequest *request) {
    if (request == nullptr) {
        return;
    }
    std::free(request->outputLines);
    std::free(request->layerEntries);
    request->outputLines = nullptr;
    request->layerEntries = nullptr;
}

// ---- what the module reported --------------------------------------------------

void host_ClearDecodedRecords(void) {
    Recorder &r = g_recorder;
    r.decodedChars.used = 0;
    r.decoded.clear();
    r.spansUsed = 0;
    r.decodedCopies.clear();
}

void host_ClearDisplayRecords(void) {
    Recorder &r = g_recorder;
    r.displayChars.used = 0;
    r.display.clear();
    r.displayCopies.clear();
}

void host_ClearRecords(void) {
    host_ClearDecodedRecords();
    host_ClearDisplayRecords();
    g_recorder.createLayerCalls = 0;
}

uint32_t host_DecodedCount(void) { return static_cast<uint32_t>(g_recorder.decoded.size()); }

int host_DecodedView(uint32_t index, HostFieldView *out) {
    const Recorder &r = g_recorder;
    if (index >= r.decoded.size() || out == nullptr) {
        return 0;
    }
    const DecodedEntry &e = r.decoded[index];
    out->text = r.decodedChars.at(e.text);
    out->textLength = e.textLength;
    out->label = r.decodedChars.at(e.label);
    out->labelLength = e.labelLength;
    out->fieldId = e.fieldId;
    out->selector = e.selector;
    out->spanCount = e.spanCount;
    out->spans = e.spanCount != 0 ? r.spans.data() + e.firstSpan : nullptr;
    out->arg8 = e.arg8;
    out->arg9 = e.arg9;
    out->lineLayerCode = e.lineLayerCode;
    return 1;
}

// The span pointer is bound on every lookup because the span pool may have
// moved since the field was recorded.
const HostDecodedField *host_Decoded(uint32_t index) {
    Recorder &r = g_recorder;
    if (index >= r.decoded.size()) {
        return nullptr;
    }
    while (r.decodedCopies.size() <= index) {
        HostFieldView v{};
        host_DecodedView(static_cast<uint32_t>(r.decodedCopies.size()), &v);
        HostDecodedField &f = r.decodedCopies.emplace_back();
        copyText(f.text, v.text, v.textLength);
        copyText(f.label, v.label, v.labelLength);
        f.fieldId = v.fieldId;
        f.selector = v.selector;
        f.spanCount = v.spanCount;
        f.arg8 = v.arg8;
        f.arg9 = v.arg9;
        f.lineLayerCode = v.lineLayerCode;
    }
    HostDecodedField &f = r.decodedCopies[index];
    f.spans = f.spanCount != 0 ? r.spans.data() + r.decoded[index].firstSpan : nullptr;
    return &f;
}

uint32_t host_DisplayCount(void) { return static_cast<uint32_t>(g_recorder.display.size()); }

int host_DisplayView(uint32_t index, HostDisplayView *out) {
    const Recorder &r = g_recorder;
    if (index >= r.display.size() || out == nullptr) {
        return 0;
    }
    const DisplayEntry &e = r.display[index];
    out->text = r.displayChars.at(e.text);
    out->textLength = e.textLength;
    out->displayId = e.displayId;
    return 1;
}

const HostDisplayField *host_Display(uint32_t index) {
    Recorder &r = g_recorder;
    if (index >= r.display.size()) {
        return nullptr;
    }
    while (r.displayCopies.size() <= index) {
        const DisplayEntry &e = r.display[r.displayCopies.size()];
        HostDisplayField &f = r.displayCopies.emplace_back();
        copyText(f.text, r.displayChars.at(e.text), e.textLength);
        f.displayId = e.displayId;
    }
    return &r.displayCopies[index];
}

uint32_t host_CreateLayerCalls(void) { return g_recorder.createLayerCalls; }

// ---- failure injection ------------------------------------------------------------

void host_SetReallocFailAt(uint32_t n) {
    g_reallocFailAt = n;
    g_reallocCalls = 0;
}

uint32_t host_ReallocCalls(void) { return g_reallocCalls; }

void host_SetAccessPointNameResult(uint8_t ok) { g_accessPointNameResult = ok; }

} // extern "C"
