#include "tcap.h"

namespace dpxdecode::capture {
namespace {

// One BER element with a one-octet tag.  An indefinite length runs to the
// end of what encloses it: such an element can be entered, not skipped.
struct Element {
    uint8_t tag = 0;
    bool indefinite = false;
    Bytes value;
    size_t next = 0; // where the following element starts
};

bool element(Bytes b, size_t at, Element &e) {
    if (!b.has(at, 2) || (b.u8(at) & 0x1F) == 0x1F)
        return false;
    e.tag = b.u8(at);
    const uint8_t first = b.u8(at + 1);
    at += 2;
    size_t length = first;
    e.indefinite = first == 0x80;
    if (e.indefinite) {
        if ((e.tag & 0x20) == 0) // only constructed elements may be indefinite
            return false;
        e.value = b.from(at);
        e.next = b.size;
        return true;
    }
    if (first > 0x80) {
        const size_t octets = first & 0x7F;
        if (octets > 4 || !b.has(at, octets))
            return false;
        length = 0;
        for (size_t i = 0; i < octets; ++i)
            length = length << 8 | b.u8(at + i);
        at += octets;
    }
    if (!b.has(at, length))
        return false;
    e.value = b.sub(at, length);
    e.next = at + length;
    return true;
}

// The first element tagged `tag` among those of `b`, stepping over the
// ones before it (which must have definite lengths).
bool child(Bytes b, uint8_t tag, Element &e) {
    for (size_t at = 0; b.has(at, 2) && !(b.u8(at) == 0 && b.u8(at + 1) == 0);) {
        if (!element(b, at, e))
            return false;
        if (e.tag == tag)
            return true;
        if (e.indefinite)
            return false;
        at = e.next;
    }
    return false;
}

bool transactionId(const Element &e, uint32_t &id, uint8_t &length) {
    if (e.value.size < 1 || e.value.size > 4)
        return false;
    id = 0;
    for (size_t i = 0; i < e.value.size; ++i)
        id = id << 8 | e.value.u8(i);
    length = uint8_t(e.value.size);
    return true;
}

// Dialogue portion: EXTERNAL, its single-ASN1-type, the dialogue APDU
// (request, response, abort or unidirectional), its context name.
bool namesCamelContext(Bytes dialoguePortion) {
    Element external, single, apdu, name, oid;
    return child(dialoguePortion, 0x28, external) && child(external.value, 0xA0, single) &&
           element(single.value, 0, apdu) && child(apdu.value, 0xA1, name) && child(name.value, 0x06, oid) &&
           isCamelContext(oid.value);
}

uint64_t keyOf(uint32_t id, uint8_t length) {
    // Never 0 (a free entry's key): the length is 1 to 4.
    return uint64_t(length) << 32 | id;
}

} // namespace

bool isCamelContext(Bytes o) {
    if (o.size != 7 || o.u8(0) != 0x04 || o.u8(1) != 0 || o.u8(2) != 0 || o.u8(3) != 1 || o.u8(6) >= 0x80)
        return false;
    const uint8_t a = o.u8(4), b = o.u8(5);
    return (a == 0 && b >= 50 && b <= 52) || (a >= 20 && a <= 23 && b == 3);
}

TcapPeek peekTcap(Bytes m) {
    TcapPeek p;
    Element msg;
    if (!element(m, 0, msg))
        return p;
    switch (msg.tag) {
    case tcaptype::kUnidirectional:
    case tcaptype::kBegin:
    case tcaptype::kEnd:
    case tcaptype::kContinue:
    case tcaptype::kAbort:
        break;
    default:
        return p;
    }
    p.type = msg.tag;
    Element e;
    for (size_t at = 0; msg.value.has(at, 2) && element(msg.value, at, e); at = e.next) {
        if (e.tag == 0x48)
            p.hasOtid = transactionId(e, p.otid, p.otidLength);
        else if (e.tag == 0x49)
            p.hasDtid = transactionId(e, p.dtid, p.dtidLength);
        else if (e.tag == 0x6B)
            p.camelContext = namesCamelContext(e.value);
        if (e.tag == 0x6B || e.tag == 0x6C || e.indefinite)
            break; // nothing the carriers need comes after these
    }
    switch (p.type) {
    case tcaptype::kBegin: p.ok = p.hasOtid; break;
    case tcaptype::kContinue: p.ok = p.hasOtid && p.hasDtid; break;
    case tcaptype::kEnd:
    case tcaptype::kAbort: p.ok = p.hasDtid; break;
    default: p.ok = true; break;
    }
    return p;
}

CamelDialogues::Entry *CamelDialogues::find(uint64_t key) {
    if (table_.empty())
        return nullptr;
    Entry *set = &table_[(key * 0x9E3779B97F4A7C15ull >> 40) % kSets * kWays];
    for (size_t w = 0; w < kWays; ++w)
        if (set[w].key == key)
            return &set[w];
    return nullptr;
}

CamelDialogues::Entry &CamelDialogues::insert(uint64_t key) {
    if (table_.empty())
        table_.resize(kSets * kWays);
    Entry *e = find(key);
    if (e == nullptr) {
        Entry *set = &table_[(key * 0x9E3779B97F4A7C15ull >> 40) % kSets * kWays];
        e = &set[0];
        for (size_t w = 1; w < kWays; ++w)
            if (set[w].lastUse < e->lastUse)
                e = &set[w];
        *e = Entry{key, 0, 0};
    }
    e->lastUse = ++clock_;
    return *e;
}

void CamelDialogues::erase(uint64_t key) {
    if (Entry *e = find(key))
        *e = Entry{};
}

size_t CamelDialogues::known() const {
    size_t n = 0;
    for (const Entry &e : table_)
        n += e.key != 0;
    return n;
}

bool CamelDialogues::take(const TcapPeek &t, bool camelBySsn) {
    const bool named = t.camelContext || camelBySsn;
    if (!t.ok)
        return named;
    const uint64_t mine = t.hasOtid ? keyOf(t.otid, t.otidLength) : 0;
    const uint64_t theirs = t.hasDtid ? keyOf(t.dtid, t.dtidLength) : 0;
    switch (t.type) {
    case tcaptype::kBegin:
        // A Begin that names another context reuses the id for a dialogue
        // that is not CAMEL.
        if (named)
            insert(mine).peer = 0;
        else
            erase(mine);
        return named;
    case tcaptype::kContinue: {
        // Either id will do: the message that told the other one may have
        // been lost to the capture.
        if (!named && find(theirs) == nullptr && find(mine) == nullptr)
            return false;
        insert(mine).peer = theirs;
        insert(theirs).peer = mine;
        return true;
    }
    case tcaptype::kEnd:
    case tcaptype::kAbort: {
        const Entry *e = find(theirs);
        if (!named && e == nullptr)
            return false;
        if (e != nullptr && e->peer != 0)
            erase(e->peer);
        erase(theirs);
        return true;
    }
    default:
        return named;
    }
}

} // namespace dpxdecode::capture
