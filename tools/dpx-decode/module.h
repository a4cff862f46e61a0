// Loading the decoder module and running its passes over one message with
// the stand-in host libraries.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "dpx_camel.h"
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

// 3gpp_camel_400_DLL.so in the directory of the running executable; empty
// when that directory cannot be found.
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

struct SpanOut {
    uint32_t first = 0;
    uint32_t last = 0;
    uint32_t value = 0;
};

struct DecodedOut {
    uint32_t id = 0;
    std::string label;
    std::string text;
    uint32_t selector = 0;
    std::vector<SpanOut> spans;
};

struct MdOut : PassOutcome {
    uint32_t layerFirst = 0;
    uint32_t layerLast = 0;
    std::vector<DecodedOut> fields;
};

struct DisplayOut {
    uint32_t displayId = 0;
    std::string text;
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

// Runs the selected passes over `message`, each on a freshly prepared
// decoding state.  Returns false only when the host cannot allocate a state.
bool runPasses(const Module &module, const std::vector<uint8_t> &message,
               const PassSelection &passes, MessageResult &out);

} // namespace dpxdecode
