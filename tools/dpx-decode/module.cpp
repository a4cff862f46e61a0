#include "module.h"

#include <dlfcn.h>
#include <unistd.h>

#include <climits>
#include <cstring>
#include <memory>

#include "dpx_standin_host.h"

namespace dpxdecode {
namespace {

constexpr const char *kModuleFile = "3gpp_camel_400_DLL.so";

struct StateDeleter {
    void operator()(DecodeState *s) const { host_FreeState(s); }
};
using StatePtr = std::unique_ptr<DecodeState, StateDeleter>;

// A request as the host fills it for one pre-decode call: one output line,
// one layer entry.
struct PreRequest {
    PreDecodeRequest rq{};
    explicit PreRequest(DecodeState *st) { host_InitRequest(&rq, st, 1, 0); }
    ~PreRequest() { host_FreeRequest(&rq); }
    PreRequest(const PreRequest &) = delete;
    PreRequest &operator=(const PreRequest &) = delete;
};

template <typename F>
bool resolve(void *handle, const char *name, F &fn, std::string &error) {
    void *sym = dlsym(handle, name);
    if (sym == nullptr) {
        error = std::string("entry point ") + name + " not found";
        return false;
    }
    fn = reinterpret_cast<F>(sym);
    return true;
}

void collectDecoded(MdOut &out) {
    const uint32_t n = host_DecodedCount();
    out.fields.reserve(n);
    for (uint32_t i = 0; i < n; ++i) {
        const HostDecodedField *f = host_Decoded(i);
        DecodedOut d;
        d.id = f->fieldId;
        d.label = f->label;
        d.text = f->text;
        d.selector = f->selector;
        d.spans.reserve(f->spanCount);
        for (uint32_t k = 0; k < f->spanCount; ++k)
            d.spans.push_back(SpanOut{f->spans[k].firstBit, f->spans[k].lastBit, f->spans[k].value});
        out.fields.push_back(std::move(d));
    }
}

void collectDisplay(DisplayPassOut &out) {
    const uint32_t n = host_DisplayCount();
    out.fields.reserve(n);
    for (uint32_t i = 0; i < n; ++i) {
        const HostDisplayField *f = host_Display(i);
        out.fields.push_back(DisplayOut{f->displayId, f->text});
    }
}

MdOut runMd(const Module &m, DecodeState *st) {
    MdOut out;
    host_ResetState(st);
    host_ClearRecords();
    PreRequest req(st);
    out.result = m.preDecodeMD(&req.rq);
    out.remainingBits = req.rq.remainingBits;
    out.errorFlags = st->errorFlags;
    out.layerFirst = req.rq.layerEntries[0].firstBit;
    out.layerLast = req.rq.layerEntries[0].lastBit;
    collectDecoded(out);
    host_ClearRecords();
    return out;
}

DisplayPassOut runDisplay(const Module &m, DecodeState *st) {
    DisplayPassOut out;
    host_ResetState(st);
    host_ClearRecords();
    PreRequest req(st);
    out.result = m.preDecodeTO(&req.rq);
    out.remainingBits = req.rq.remainingBits;
    out.errorFlags = st->errorFlags;
    collectDisplay(out);
    host_ClearRecords();
    return out;
}

ViewOut runView(const Module &m, DecodeState *st) {
    ViewOut out;
    host_ResetState(st);
    PreRequest req(st);
    out.result = m.preDecodeMV(&req.rq);
    out.remainingBits = req.rq.remainingBits;
    out.errorFlags = st->errorFlags;
    out.status = req.rq.status;
    return out;
}

KeysOut runKeys(const Module &m, DecodeState *st) {
    KeysOut out;
    host_ResetState(st);
    std::vector<uint8_t> buffer(kKeyBufferSize, 0);
    KeyFieldRequest rq{};
    rq.keyBuffer = buffer.data();
    rq.dataOffset = HOST_KEY_DATA_START;
    rq.valueRoom = kKeyBufferSize - HOST_KEY_DATA_START;
    rq.state = st;
    out.result = m.keyFields(&rq);
    out.remainingBits = rq.remainingBits;
    out.errorFlags = st->errorFlags;
    out.entries = readKeyEntries(buffer.data(), kKeyBufferSize);
    return out;
}

} // namespace

std::string defaultModulePath() {
    char exe[PATH_MAX];
    const ssize_t n = readlink("/proc/self/exe", exe, sizeof exe - 1);
    if (n <= 0)
        return {};
    std::string path(exe, static_cast<size_t>(n));
    const size_t slash = path.rfind('/');
    if (slash == std::string::npos)
        return {};
    return path.substr(0, slash + 1) + kModuleFile;
}

bool loadModule(const std::string &path, Module &module, std::string &error) {
    // A bare file name would make dlopen search the library path; the user
    // means the file in the current directory.
    const std::string file = path.find('/') == std::string::npos ? "./" + path : path;
    void *handle = dlopen(file.c_str(), RTLD_NOW | RTLD_LOCAL);
    if (handle == nullptr) {
        const char *why = dlerror();
        error = why != nullptr ? why : "dlopen failed";
        return false;
    }
    Module m;
    m.handle = handle;
    if (!resolve(handle, "dpx_PreDecodeMD", m.preDecodeMD, error) ||
        !resolve(handle, "dpx_PreDecodeMV", m.preDecodeMV, error) ||
        !resolve(handle, "dpx_PreDecodeTO", m.preDecodeTO, error) ||
        !resolve(handle, "KFE_3gpp_camel_400", m.keyFields, error) ||
        !resolve(handle, "dp_DLLGetPtr", m.getPtr, error) ||
        !resolve(handle, "dp_DLLGetTable", m.getTable, error) ||
        !resolve(handle, "date_conv", m.dateConv, error)) {
        error = file + ": " + error;
        dlclose(handle);
        return false;
    }
    module = m;
    return true;
}

bool runPasses(const Module &module, const std::vector<uint8_t> &message,
               const PassSelection &passes, MessageResult &out) {
    StatePtr st(host_NewState(message.data(), static_cast<uint32_t>(message.size())));
    if (!st)
        return false;
    out = MessageResult{};
    if (passes.md)
        out.md = runMd(module, st.get());
    if (passes.display)
        out.display = runDisplay(module, st.get());
    if (passes.view)
        out.view = runView(module, st.get());
    if (passes.keys)
        out.keys = runKeys(module, st.get());
    return true;
}

} // namespace dpxdecode
