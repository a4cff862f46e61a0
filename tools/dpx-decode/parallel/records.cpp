#include "records.h"

#include <cstring>
#include <type_traits>

namespace dpxdecode::parallel {
namespace {

// Each record's members are listed once, in `members`, and walked by the
// writer (Out) and by the reader (In) alike.  Numbers travel as their
// bytes, strings and vectors as a 32-bit count and their contents, records
// member by member.
template <typename A, typename E>
    requires std::is_same_v<std::remove_const_t<E>, dialogues::End>
void members(A &a, E &e) {
    a(e.hasPc, e.pc, e.hasSsn, e.ssn);
}
template <typename A, typename V>
    requires std::is_same_v<std::remove_const_t<V>, dialogues::ValueIn>
void members(A &a, V &v) {
    a(v.value, v.operation, v.name);
}
template <typename A, typename C>
    requires std::is_same_v<std::remove_const_t<C>, dialogues::Component>
void members(A &a, C &c) {
    a(c.kind, c.hasInvokeId, c.invokeId, c.code, c.name);
}
template <typename A, typename C>
    requires std::is_same_v<std::remove_const_t<C>, ComponentSummary>
void members(A &a, C &c) {
    a(c.kind, c.invokeId, c.name, c.serviceKey, c.imsi, c.called, c.calling, c.cause, c.event, c.eventCount);
}
template <typename A, typename F>
    requires std::is_same_v<std::remove_const_t<F>, dialogues::MessageFacts>
void members(A &a, F &f) {
    a(f.index, f.hasOrigin, f.frame, f.seconds, f.nanoseconds, f.from, f.to, f.type, f.otid, f.dtid,
      f.components, f.imsi, f.called, f.calling, f.charge, f.causes, f.eventTypes, f.hasServiceKey,
      f.serviceKey, f.abortCause, f.applicationContext, f.contextName, f.capVersion);
}
// The summary's components are its first `componentCount` entries.
template <typename A, typename S>
    requires std::is_same_v<std::remove_const_t<S>, MessageSummary>
void headMembers(A &a, S &s) {
    a(s.type, s.otid, s.dtid, s.capVersion, s.abortCause, s.errorFlags);
}

struct Out {
    std::string &s;
    template <typename... T>
    void operator()(const T &...v) {
        (put(v), ...);
    }
    template <typename T>
    void put(const T &v) {
        if constexpr (std::is_arithmetic_v<T> || std::is_enum_v<T>) {
            s.append(reinterpret_cast<const char *>(&v), sizeof v);
        } else {
            members(*this, v);
        }
    }
    void put(const std::string &v) {
        put(uint32_t(v.size()));
        s += v;
    }
    template <typename T>
    void put(const std::vector<T> &v) {
        put(uint32_t(v.size()));
        for (const T &e : v)
            put(e);
    }
};

struct In {
    const char *data;
    size_t size;
    size_t &pos;
    bool ok = true;
    bool has(size_t n) {
        ok = ok && n <= size - pos;
        return ok;
    }
    template <typename... T>
    void operator()(T &...v) {
        (get(v), ...);
    }
    template <typename T>
    void get(T &v) {
        if constexpr (std::is_arithmetic_v<T> || std::is_enum_v<T>) {
            if (has(sizeof v)) {
                std::memcpy(&v, data + pos, sizeof v);
                pos += sizeof v;
            }
        } else {
            members(*this, v);
        }
    }
    void get(std::string &v) {
        uint32_t n = 0;
        get(n);
        if (has(n)) {
            v.assign(data + pos, n);
            pos += n;
        }
    }
    // A vector's length is checked against what is left (each element
    // takes at least one byte) before anything is sized by it.
    template <typename T>
    void get(std::vector<T> &v) {
        uint32_t n = 0;
        get(n);
        if (!has(n))
            return;
        v.resize(n);
        for (T &e : v)
            get(e);
    }
};

} // namespace

void putFacts(std::string &out, const dialogues::MessageFacts &f) {
    Out{out}.put(f);
}

bool getFacts(const char *data, size_t size, size_t &pos, dialogues::MessageFacts &f) {
    In i{data, size, pos};
    i.get(f);
    return i.ok;
}

void putSummary(std::string &out, const MessageSummary &s) {
    Out o{out};
    headMembers(o, s);
    o.put(uint32_t(s.componentCount));
    for (size_t k = 0; k < s.componentCount; ++k)
        o.put(s.components[k]);
}

bool getSummary(const char *data, size_t size, size_t &pos, MessageSummary &s) {
    In i{data, size, pos};
    uint32_t count = 0;
    headMembers(i, s);
    i.get(count);
    if (!i.has(count))
        return false;
    // The vector only grows: the entries past the count keep their strings.
    if (s.components.size() < count)
        s.components.resize(count);
    s.componentCount = count;
    for (size_t k = 0; k < count; ++k)
        i.get(s.components[k]);
    return i.ok;
}

} // namespace dpxdecode::parallel
