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

// The fields are views into the host's records; the vectors keep their
// capacity from message to message, and their elements own nothing.
void collectDecoded(MdOut &out) {
    const uint32_t n = host_DecodedCount();
    out.fields.resize(n);
    HostFieldView f{};
    for (uint32_t i = 0; i < n && host_DecodedView(i, &f) != 0; ++i)
        out.fields[i] = DecodedOut{f.fieldId, std::string_view(f.label, f.labelLength),
                                   std::string_view(f.text, f.textLength), f.selector,
                                   std::span<const SpanOut>(f.spans, f.spanCount)};
}

void collectDisplay(DisplayPassOut &out) {
    const uint32_t n = host_DisplayCount();
    out.fields.resize(n);
    HostDisplayView f{};
    for (uint32_t i = 0; i < n && host_DisplayView(i, &f) != 0; ++i)
        out.fields[i] = DisplayOut{f.displayId, std::string_view(f.text, f.textLength)};
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
    // Beside the executable (a build directory), else where an install
    // puts it (PREFIX/bin/dpx-decode, PREFIX/lib/dpx-camel/).
    const std::string beside = path.substr(0, slash + 1) + kModuleFile;
    const std::string installed = path.substr(0, slash + 1) + "../lib/dpx-camel/" + kModuleFile;
    return access(beside.c_str(), F_OK) != 0 && access(installed.c_str(), F_OK) == 0 ? installed : beside;
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

Session::Session(const Module &module) : module_(module), keyBuffer_(kKeyBufferSize, 0) {
    static_assert(HOST_KEY_DATA_START <= kKeyBufferSize);
    state_ = host_NewState(nullptr, 0);
    if (state_ == nullptr)
        return;
    ownBuffer_ = state_->buffer;
    host_InitRequest(&request_, state_, 1, 0);
}

Session::~Session() {
    if (state_ == nullptr)
        return;
    host_FreeRequest(&request_);
    state_->buffer = ownBuffer_;
    host_FreeState(state_);
}

// The request as host_InitRequest leaves it, in the arrays it allocated (a
// pass may have grown the layer entries: they are kept, only one is
// offered).
void Session::prepareRequest() {
    char *lines = request_.outputLines;
    LayerInfoEntry *entries = request_.layerEntries;
    const uint32_t entryCount = request_.layerLimit + 1;
    std::memset(lines, 0, DPX_OUTPUT_LINE_SIZE);
    std::memset(entries, 0, entryCount * sizeof *entries);
    std::memset(&request_, 0, sizeof request_);
    request_.outputLines = lines;
    request_.layerEntries = entries;
    request_.state = state_;
}

void Session::runMd(MdOut &out) {
    host_ResetState(state_);
    host_ClearDecodedRecords();
    prepareRequest();
    out.result = module_.preDecodeMD(&request_);
    out.remainingBits = request_.remainingBits;
    out.errorFlags = state_->errorFlags;
    out.layerFirst = request_.layerEntries[0].firstBit;
    out.layerLast = request_.layerEntries[0].lastBit;
    collectDecoded(out); // the records stay until the next message's pass
}

void Session::runDisplay(DisplayPassOut &out) {
    host_ResetState(state_);
    host_ClearDisplayRecords();
    prepareRequest();
    out.result = module_.preDecodeTO(&request_);
    out.remainingBits = request_.remainingBits;
    out.errorFlags = state_->errorFlags;
    collectDisplay(out);
}

void Session::runView(ViewOut &out) {
    host_ResetState(state_);
    prepareRequest();
    out.result = module_.preDecodeMV(&request_);
    out.remainingBits = request_.remainingBits;
    out.errorFlags = state_->errorFlags;
    out.status = request_.status;
}

void Session::runKeys(KeysOut &out) {
    host_ResetState(state_);
    // The pass writes the presence bits and slots, and its values from the
    // data start up to the data offset it leaves; only what the last pass
    // may have written is cleared.
    std::memset(keyBuffer_.data(), 0, keyBufferUsed_);
    KeyFieldRequest rq{};
    rq.keyBuffer = keyBuffer_.data();
    rq.dataOffset = HOST_KEY_DATA_START;
    rq.valueRoom = kKeyBufferSize - HOST_KEY_DATA_START;
    rq.state = state_;
    out.result = module_.keyFields(&rq);
    out.remainingBits = rq.remainingBits;
    out.errorFlags = state_->errorFlags;
    // A value that did not fit may have been written in part past the data
    // offset: after a failed pass the whole buffer is cleared next time.
    keyBufferUsed_ = out.result == 1 && rq.dataOffset >= HOST_KEY_DATA_START && rq.dataOffset <= kKeyBufferSize
                         ? rq.dataOffset
                         : kKeyBufferSize;
    readKeyEntries(keyBuffer_.data(), kKeyBufferSize, out.entries);
}

void Session::run(const uint8_t *message, size_t size, const PassSelection &passes, MessageResult &out) {
    // The state reads the caller's bytes; its own buffer is put back before
    // it is freed.
    state_->buffer = message;
    state_->totalBits = static_cast<uint32_t>(size * 8);
    const auto select = [](bool wanted, auto &slot) {
        if (!wanted)
            slot.reset();
        else if (!slot)
            slot.emplace();
        return wanted;
    };
    if (select(passes.md, out.md))
        runMd(*out.md);
    if (select(passes.display, out.display))
        runDisplay(*out.display);
    if (select(passes.view, out.view))
        runView(*out.view);
    if (select(passes.keys, out.keys))
        runKeys(*out.keys);
}

} // namespace dpxdecode
