#include "support/harness.h"

#include "engine/members.h"
#include "fields/field_table.h"

#include "../../tools/dpx-decode/key_layout.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <stdexcept>

namespace camel::test {

Bytes hexBytes(std::string_view hex) {
    Bytes out;
    int high = -1;
    for (char c : hex) {
        int v;
        if (c >= '0' && c <= '9')
            v = c - '0';
        else if (c >= 'a' && c <= 'f')
            v = c - 'a' + 10;
        else if (c >= 'A' && c <= 'F')
            v = c - 'A' + 10;
        else if (c == ' ' || c == ':' || c == '\n')
            continue;
        else
            throw std::invalid_argument("bad hex digit");
        if (high < 0) {
            high = v;
        } else {
            out.push_back(static_cast<uint8_t>(high * 16 + v));
            high = -1;
        }
    }
    if (high >= 0)
        throw std::invalid_argument("odd number of hex digits");
    return out;
}

std::vector<Bytes> sampleMessages() {
    std::vector<std::filesystem::path> files;
    for (const auto &entry : std::filesystem::directory_iterator(DPX_SOURCE_DIR "/samples"))
        if (entry.path().extension() == ".txt")
            files.push_back(entry.path());
    std::sort(files.begin(), files.end());
    std::vector<Bytes> out;
    for (const auto &file : files) {
        std::ifstream in(file);
        std::string line;
        while (std::getline(in, line)) {
            line.resize(std::min(line.size(), line.find('#')));
            Bytes m = hexBytes(line);
            if (!m.empty())
                out.push_back(std::move(m));
        }
    }
    return out;
}

std::vector<std::string> Decoded::texts() const {
    std::vector<std::string> out;
    for (const Field &f : fields)
        out.push_back(f.text);
    return out;
}

const Field *Decoded::find(uint32_t id) const {
    for (const Field &f : fields)
        if (f.id == id)
            return &f;
    return nullptr;
}

const Key *Decoded::key(uint32_t index) const {
    for (const Key &k : keyEntries)
        if (k.index == index)
            return &k;
    return nullptr;
}

std::string textDump(const Decoded &d) {
    std::string out;
    for (const Field &f : d.fields) {
        out += f.text;
        out += '\n';
    }
    return out;
}

namespace {

constexpr size_t kKeyBufferSize = 4096;

PassEnd endOf(int result, const DecodeState *st) {
    return PassEnd{result, st->remainingBits, st->errorFlags, st->bitCursor};
}

// The key entries present in a buffer of the stand-in key layout, read the
// way dpx-decode reads them.
std::vector<Key> readKeys(const Bytes &buffer) {
    std::vector<Key> keys;
    for (const auto &e : dpxdecode::readKeyEntries(buffer.data(), static_cast<uint32_t>(buffer.size())))
        keys.push_back({e.index, hexBytes(e.value), e.bits, e.overflow});
    return keys;
}

struct State {
    DecodeState *st;
    explicit State(const Bytes &m)
        : st(host_NewState(m.data(), static_cast<uint32_t>(m.size()))) {}
    ~State() { host_FreeState(st); }
    State(const State &) = delete;
    State &operator=(const State &) = delete;
};

struct PreRequest {
    PreDecodeRequest rq{};
    PreRequest(DecodeState *st, uint32_t layerLimit = 4) {
        host_InitRequest(&rq, st, 4, layerLimit);
        rq.layerCode = 0x5A;
        rq.layerTag = 0x1234;
    }
    ~PreRequest() { host_FreeRequest(&rq); }
    PreRequest(const PreRequest &) = delete;
    PreRequest &operator=(const PreRequest &) = delete;
};

// The passes as a host runs them, through the entry points.
struct EntryPoints {
    int md(PreDecodeRequest *rq) const { return dpx_PreDecodeMD(rq); }
    int display(PreDecodeRequest *rq) const { return dpx_PreDecodeTO(rq); }
    int view(PreDecodeRequest *rq) const { return dpx_PreDecodeMV(rq); }
    int keys(KeyFieldRequest *rq) const { return KFE_3gpp_camel_400(rq); }
};

// A member table walked in each pass, inside a window of `windowBits` bits
// from the message's start when it is not 0.
struct TableWalk {
    const MemberTable &table;
    uint32_t windowBits;
    template <Pass P>
    int run(Request<P> *rq) const {
        DecodeState *st = rq->state;
        g_scratch<P> = Scratch{};
        if (windowBits != 0) {
            st->remainingBits = windowBits;
            if (!pushEnd(st))
                return 0;
        }
        ElementContext ctx{0, 1, 0, 0};
        const int result = walkTable<P>(st, &ctx, rq, table);
        if (result == 1) // as an entry point hands them back
            rq->remainingBits = st->remainingBits;
        return result;
    }
    int md(PreDecodeRequest *rq) const { return run<Pass::Decoded>(rq); }
    int display(PreDecodeRequest *rq) const { return run<Pass::Display>(rq); }
    int view(PreDecodeRequest *rq) const { return run<Pass::MessageView>(rq); }
    int keys(KeyFieldRequest *rq) const { return run<Pass::KeyField>(rq); }
};

// A key-field request over `state` with `room` octets for the values, in
// `buffer`.
KeyFieldRequest keyRequest(Bytes &buffer, DecodeState *state,
                           uint16_t room = static_cast<uint16_t>(kKeyBufferSize - HOST_KEY_DATA_START)) {
    buffer.assign(kKeyBufferSize, 0);
    KeyFieldRequest kr{};
    kr.keyBuffer = buffer.data();
    kr.dataOffset = HOST_KEY_DATA_START;
    kr.valueRoom = room;
    kr.state = state;
    return kr;
}

template <class Passes>
KeyRun runKeysWith(const Bytes &message, uint16_t room, const Passes &passes) {
    State s(message);
    KeyRun run{};
    KeyFieldRequest rq = keyRequest(run.buffer, s.st, room);
    run.result = passes.keys(&rq);
    run.end = endOf(run.result, s.st);
    run.dataOffset = rq.dataOffset;
    run.entries = readKeys(run.buffer);
    return run;
}

// All four passes, each on a freshly prepared state, and the cross-pass
// invariant.
template <class Passes>
Decoded decodeWith(const Bytes &message, const Passes &passes) {
    Decoded d;
    host_ClearRecords();
    {
        State s(message);
        PreRequest r(s.st);
        d.md = endOf(passes.md(&r.rq), s.st);
        d.layer = r.rq.layerEntries[0];
        EXPECT_EQ(r.rq.remainingBits, s.st->remainingBits);
        for (uint32_t i = 0; i < host_DecodedCount(); ++i) {
            const HostDecodedField *f = host_Decoded(i);
            Field field{f->fieldId, f->label, f->text, f->selector, {}};
            for (uint32_t k = 0; k < f->spanCount; ++k)
                field.spans.push_back({f->spans[k].firstBit, f->spans[k].lastBit, f->spans[k].value});
            EXPECT_EQ(f->arg8, 0u);
            EXPECT_EQ(f->arg9, 0u);
            EXPECT_EQ(f->lineLayerCode, 0x5A);
            d.fields.push_back(std::move(field));
        }
    }
    host_ClearRecords();
    {
        State s(message);
        PreRequest r(s.st);
        d.display = endOf(passes.display(&r.rq), s.st);
        for (uint32_t i = 0; i < host_DisplayCount(); ++i)
            d.shown.push_back({host_Display(i)->displayId, host_Display(i)->text});
    }
    host_ClearRecords();
    {
        State s(message);
        PreRequest r(s.st);
        d.view = endOf(passes.view(&r.rq), s.st);
        d.status = r.rq.status;
        EXPECT_EQ(r.rq.layerIndex, 0u) << "the message-view pass fills no layer entry";
    }
    {
        KeyRun k = runKeysWith(message, static_cast<uint16_t>(kKeyBufferSize - HOST_KEY_DATA_START), passes);
        d.keyEntries = std::move(k.entries);
        d.keys = k.end;
    }
    host_ClearRecords();

    // Cross-pass invariant.
    for (const PassEnd *p : {&d.display, &d.view, &d.keys}) {
        EXPECT_EQ(p->cursor, d.md.cursor);
        EXPECT_EQ(p->remainingBits, d.md.remainingBits);
        EXPECT_EQ(p->errorFlags, d.md.errorFlags);
        EXPECT_EQ(p->result, d.md.result);
    }
    EXPECT_EQ(d.md.result, 1);
    EXPECT_EQ(d.status, d.md.errorFlags != 0 ? DPX_STATUS_INVALID : 0);
    EXPECT_EQ(d.shown.size(), d.fields.size());
    for (size_t i = 0; i < d.fields.size() && i < d.shown.size(); ++i) {
        std::string text = d.fields[i].text;
        const std::string &value = d.shown[i].text;
        // A field with display names of its own may show another name.
        const size_t at = camel::fieldIndex(d.fields[i].id);
        if (at < camel::kFieldCount && camel::kFields[at].displayNameCount != 0)
            continue;
        // ... and a value with a suffix in its text is shown without it.
        const std::string suffix = at < camel::kFieldCount ? camel::kFields[at].suffix : "";
        if (!suffix.empty() && text.size() >= suffix.size() &&
            text.compare(text.size() - suffix.size(), suffix.size(), suffix) == 0)
            text.resize(text.size() - suffix.size());
        EXPECT_TRUE(text.size() >= value.size() &&
                    text.compare(text.size() - value.size(), value.size(), value) == 0)
            << "display text '" << value << "' does not end the field text '" << text << "'";
    }
    return d;
}

} // namespace

KeyRun runKeys(const Bytes &message, uint16_t room) { return runKeysWith(message, room, EntryPoints{}); }

Decoded decode(const Bytes &message) { return decodeWith(message, EntryPoints{}); }

Decoded walk(const Bytes &message, const MemberTable &table, uint32_t windowBits) {
    return decodeWith(message, TableWalk{table, windowBits});
}

namespace {

// Shrinks a prepared state's growable arrays to one entry each, as a host
// with minimal arrays would hand it over, so that a pass has to grow them.
void shrinkArrays(DecodeState *st) {
    st->posCapacity = 1;
    st->endCapacity = 1;
    st->field.spanCapacity = 1;
    st->frameCapacity = 1;
}

uint32_t growthFlagOf(const DecodeState *st) {
    uint32_t flag = 0;
    if (st->posStack == nullptr || st->endStack == nullptr)
        flag |= DPX_ERR_STACK_GROWTH;
    if (st->field.spans == nullptr)
        flag |= DPX_ERR_SPAN_GROWTH;
    if (st->layerFrames == nullptr)
        flag |= DPX_ERR_FRAME_GROWTH;
    return flag;
}

enum class Which { MD, TO, MV, KF };

// One pass over the state of `r`; the key-field pass with room for every key.
template <class Passes>
int runPass(const Passes &passes, Which which, PreRequest &r) {
    Bytes keyBuffer;
    KeyFieldRequest kr = keyRequest(keyBuffer, r.rq.state);
    switch (which) {
    case Which::MD: return passes.md(&r.rq);
    case Which::TO: return passes.display(&r.rq);
    case Which::MV: return passes.view(&r.rq);
    case Which::KF: return passes.keys(&kr);
    }
    return -1;
}

// Runs one pass with pu_Realloc failing at call n; returns whether the
// failure was reached.
template <class Passes>
bool runFailing(const Bytes &message, const Passes &passes, Which which, uint32_t n) {
    State s(message);
    shrinkArrays(s.st);
    PreRequest r(s.st);
    host_SetReallocFailAt(n);
    const int result = runPass(passes, which, r);
    const bool reached = host_ReallocCalls() >= n;
    host_SetReallocFailAt(0);
    host_ClearRecords();
    const uint32_t nulled = growthFlagOf(s.st);
    if (reached) {
        EXPECT_EQ(result, 0) << "pass " << int(which) << " failing at realloc " << n;
        EXPECT_NE(nulled, 0u);
        EXPECT_EQ(s.st->errorFlags & 0x70000000u, nulled);
        if (which == Which::MD || which == Which::TO) {
            EXPECT_EQ(r.rq.layerIndex, 0u);
            EXPECT_EQ(r.rq.layerEntries[0].lastBit, 0u);
            EXPECT_EQ(r.rq.remainingBits, 0u);
        }
    } else {
        EXPECT_EQ(result, 1);
        EXPECT_EQ(nulled, 0u);
    }
    return reached;
}

template <class Passes>
uint32_t checkReallocFailuresWith(const Bytes &message, const Passes &passes) {
    uint32_t points = 0;
    for (Which w : {Which::MD, Which::TO, Which::MV, Which::KF}) {
        for (uint32_t n = 1;; ++n) {
            if (!runFailing(message, passes, w, n))
                break;
            ++points;
        }
    }
    return points;
}

} // namespace

uint32_t checkReallocFailures(const Bytes &message) { return checkReallocFailuresWith(message, EntryPoints{}); }

uint32_t checkReallocFailures(const Bytes &message, const MemberTable &table) {
    return checkReallocFailuresWith(message, TableWalk{table, 0});
}

uint32_t checkAccessPointNameFailure(const Bytes &message) {
    uint32_t ended = 0;
    host_SetAccessPointNameResult(0);
    for (Which w : {Which::MD, Which::TO, Which::MV, Which::KF}) {
        State s(message);
        PreRequest r(s.st);
        const int result = runPass(EntryPoints{}, w, r);
        host_ClearRecords();
        if (w == Which::MD || w == Which::TO) {
            EXPECT_EQ(result, 0) << "pass " << int(w);
            EXPECT_EQ(r.rq.layerIndex, 0u);
            EXPECT_EQ(r.rq.layerEntries[0].lastBit, 0u);
            EXPECT_EQ(s.st->errorFlags & 0x70000000u, 0u) << "no growth failure";
            ended += result == 0 ? 1 : 0;
        } else {
            EXPECT_EQ(result, 1) << "pass " << int(w) << " renders no name";
        }
    }
    host_SetAccessPointNameResult(1);
    return ended;
}

Bytes tlv(uint8_t tag, const Bytes &content) {
    Bytes out{tag};
    const auto n = static_cast<uint32_t>(content.size());
    const int octets = n < 0x80 ? 0 : n < 0x100 ? 1 : n < 0x10000 ? 2 : 3;
    if (octets != 0)
        out.push_back(static_cast<uint8_t>(0x80 + octets));
    for (int i = octets > 0 ? octets - 1 : 0; i >= 0; --i)
        out.push_back(static_cast<uint8_t>(n >> (8 * i)));
    out.insert(out.end(), content.begin(), content.end());
    return out;
}

Bytes invoke(uint8_t op, std::string_view argumentHex) {
    Bytes component = hexBytes("02 01 01 02 01");
    component.push_back(op);
    const Bytes argument = hexBytes(argumentHex);
    component.insert(component.end(), argument.begin(), argument.end());
    Bytes content = hexBytes("48 01 01");
    const Bytes portion = tlv(0x6C, tlv(0xA1, component));
    content.insert(content.end(), portion.begin(), portion.end());
    return tlv(0x62, content);
}

std::vector<std::string> textsFrom(const Decoded &d, uint32_t fieldId) {
    const std::vector<std::string> all = d.texts();
    for (size_t i = 0; i < d.fields.size(); ++i)
        if (d.fields[i].id == fieldId)
            return std::vector<std::string>(all.begin() + long(i), all.end());
    return {};
}

std::vector<std::string> textsAfter(const Decoded &d, uint32_t fieldId) {
    std::vector<std::string> from = textsFrom(d, fieldId);
    if (!from.empty())
        from.erase(from.begin());
    return from;
}

std::string shownOf(const Decoded &d, uint32_t fieldId) {
    for (size_t i = 0; i < d.fields.size() && i < d.shown.size(); ++i)
        if (d.fields[i].id == fieldId)
            return d.shown[i].text;
    return "?";
}

} // namespace camel::test
