// Loading the decoder module and running its passes over one message with
// the stand-in host libraries.
#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "dpx_camel.h"
#include "dpx_standin_host.h"
#include "key_layout.h"

namespace dpxdecode {

// The module's seven entry points, resolved by name.
struct Module {
    void *handle = nullptr;
    decltype(&dpx_PreDecodeMD) preDecodeMD = nullptr;
    decltype(&dpx_PreDecodeMV) preDecodeMV = nullptr;
    decltype(&dpx_PreDecodeTO) preDecodeTO = nullptr;
    decltype(&KFE_3gpp_camel_400) keyFields = nullptr;
    decltype(&dp_DLLGetPtr) getPtr = nullptr;
    decltype(&dp_DLLGetTable) getTable = nullptr;
    decltype(&date_conv) dateConv = nullptr;
};

// 3gpp_camel_400_DLL.so in the directory of the running executable, or in
// ../lib/dpx-camel from there when only that one exists; empty when the
// directory cannot be found.
std::string defaultModulePath();

// Loads the module at `path` and resolves every entry point.  On failure
// returns false with the reason in `error`.
bool loadModule(const std::string &path, Module &module, std::string &error);

struct PassSelection {
    bool md = true;
    bool display = true;
    bool view = true;
    bool keys = true;
};

// What every pass reports: the entry point's result, the remaining bits it
// stored in the request, and the state's error flags afterwards.
struct PassOutcome {
    int32_t result = 0;
    uint32_t remainingBits = 0;
    uint32_t errorFlags = 0;
};

// A bit range of a field and its value, as the host recorded it.
using SpanOut = HostSpan;

// One decoded field.  The texts and spans are views into what the host
// recorded: valid until the session runs the next message.
struct DecodedOut {
    uint32_t id = 0;
    std::string_view label;
    std::string_view text;
    uint32_t selector = 0;
    std::span<const SpanOut> spans;
};

struct MdOut : PassOutcome {
    uint32_t layerFirst = 0;
    uint32_t layerLast = 0;
    std::vector<DecodedOut> fields;
};

struct DisplayOut {
    uint32_t displayId = 0;
    std::string_view text; // valid until the session runs the next message
};

struct DisplayPassOut : PassOutcome {
    std::vector<DisplayOut> fields;
};

struct ViewOut : PassOutcome {
    int32_t status = 0;
};

struct KeysOut : PassOutcome {
    std::vector<KeyEntryOut> entries;
};

// Only the passes that ran are set.
struct MessageResult {
    std::optional<MdOut> md;
    std::optional<DisplayPassOut> display;
    std::optional<ViewOut> view;
    std::optional<KeysOut> keys;
};

// One decoding state, one request and one key buffer, prepared once and
// used for message after message: each pass starts from host_ResetState and
// a request as host_InitRequest leaves it (one output line, one layer
// entry), without allocating anything per message.
class Session {
public:
    explicit Session(const Module &module);
    ~Session();
    Session(const Session &) = delete;
    Session &operator=(const Session &) = delete;

    // False when the host could not allocate the state.
    bool ok() const { return state_ != nullptr; }

    // Runs the selected passes over `message` (which must stay valid during
    // the call).  `out` is filled in place; the passes not selected are
    // reset.  The decoded and display fields in `out` view what the host
    // recorded and stay valid until the next call: nothing is copied or
    // allocated per field.
    void run(const uint8_t *message, size_t size, const PassSelection &passes, MessageResult &out);

private:
    void prepareRequest();
    void runMd(MdOut &out);
    void runDisplay(DisplayPassOut &out);
    void runView(ViewOut &out);
    void runKeys(KeysOut &out);

    const Module &module_;
    DecodeState *state_ = nullptr;
    const uint8_t *ownBuffer_ = nullptr; // the state's own (empty) message buffer
    PreDecodeRequest request_{};
    std::vector<uint8_t> keyBuffer_;
    uint32_t keyBufferUsed_ = 0; // bytes the last key pass may have written
};

} // namespace dpxdecode
