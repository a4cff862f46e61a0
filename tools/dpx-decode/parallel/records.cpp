#include "records.h"

#include <cstring>
#include <type_traits>

namespace dpxdecode::parallel {
namespace {

struct Out {
    std::string &s;
    template <typename T>
    Out &operator<<(const T &v) {
        static_assert(std::is_trivially_copyable_v<T>);
        s.append(reinterpret_cast<const char *>(&v), sizeof v);
        return *this;
    }
    Out &operator<<(const std::string &v) {
        *this << uint32_t(v.size());
        s += v;
        return *this;
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
    template <typename T>
    In &operator>>(T &v) {
        static_assert(std::is_trivially_copyable_v<T>);
        if (has(sizeof v)) {
            std::memcpy(&v, data + pos, sizeof v);
            pos += sizeof v;
        }
        return *this;
    }
    In &operator>>(std::string &v) {
        uint32_t n = 0;
        if ((*this >> n).has(n)) {
            v.assign(data + pos, n);
            pos += n;
        }
        return *this;
    }
    // A vector's length, checked against what is left (each element takes
    // at least one byte) before anything is sized by it.
    template <typename T>
    In &count(std::vector<T> &v) {
        uint32_t n = 0;
        if ((*this >> n).has(n))
            v.resize(n);
        return *this;
    }
};

Out &operator<<(Out &o, const dialogues::End &e) { return o << e.hasPc << e.pc << e.hasSsn << e.ssn; }
In &operator>>(In &i, dialogues::End &e) { return i >> e.hasPc >> e.pc >> e.hasSsn >> e.ssn; }

Out &operator<<(Out &o, const std::vector<dialogues::ValueIn> &values) {
    o << uint32_t(values.size());
    for (const dialogues::ValueIn &v : values)
        o << v.value << v.operation << v.name;
    return o;
}
In &operator>>(In &i, std::vector<dialogues::ValueIn> &values) {
    i.count(values);
    for (dialogues::ValueIn &v : values)
        i >> v.value >> v.operation >> v.name;
    return i;
}

} // namespace

void putFacts(std::string &out, const dialogues::MessageFacts &f) {
    Out o{out};
    o << f.index << f.hasOrigin << f.frame << f.seconds << f.nanoseconds << f.from << f.to << f.type << f.otid
      << f.dtid;
    o << uint32_t(f.components.size());
    for (const dialogues::Component &c : f.components)
        o << c.kind << c.hasInvokeId << c.invokeId << c.code << c.name;
    o << f.imsi << f.called << f.calling << f.charge << f.causes << f.eventTypes << f.hasServiceKey << f.serviceKey
      << f.abortCause << f.applicationContext << f.contextName << f.capVersion;
}

bool getFacts(const char *data, size_t size, size_t &pos, dialogues::MessageFacts &f) {
    In i{data, size, pos};
    i >> f.index >> f.hasOrigin >> f.frame >> f.seconds >> f.nanoseconds >> f.from >> f.to >> f.type >> f.otid >>
        f.dtid;
    i.count(f.components);
    for (dialogues::Component &c : f.components)
        i >> c.kind >> c.hasInvokeId >> c.invokeId >> c.code >> c.name;
    i >> f.imsi >> f.called >> f.calling >> f.charge >> f.causes >> f.eventTypes >> f.hasServiceKey >> f.serviceKey >>
        f.abortCause >> f.applicationContext >> f.contextName >> f.capVersion;
    return i.ok;
}

void putSummary(std::string &out, const MessageSummary &s) {
    Out o{out};
    o << s.type << s.otid << s.dtid << s.capVersion << s.abortCause << s.errorFlags << uint32_t(s.componentCount);
    for (size_t k = 0; k < s.componentCount; ++k) {
        const ComponentSummary &c = s.components[k];
        o << c.kind << c.invokeId << c.name << c.serviceKey << c.imsi << c.called << c.calling << c.cause << c.event
          << c.eventCount;
    }
}

bool getSummary(const char *data, size_t size, size_t &pos, MessageSummary &s) {
    In i{data, size, pos};
    uint32_t count = 0;
    i >> s.type >> s.otid >> s.dtid >> s.capVersion >> s.abortCause >> s.errorFlags >> count;
    if (!i.has(count))
        return false;
    // The vector only grows: the entries past the count keep their strings.
    if (s.components.size() < count)
        s.components.resize(count);
    s.componentCount = count;
    for (size_t k = 0; k < count; ++k) {
        ComponentSummary &c = s.components[k];
        i >> c.kind >> c.invokeId >> c.name >> c.serviceKey >> c.imsi >> c.called >> c.calling >> c.cause >> c.event >>
            c.eventCount;
    }
    return i.ok;
}

} // namespace dpxdecode::parallel
