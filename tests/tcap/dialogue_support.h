// Small BER builder for dialogue-portion tests: messages are assembled from
// named parts so that each test shows only what it varies.
#pragma once

#include <string>
#include <vector>

#include "support/harness.h"

namespace camel::test::dlg {

inline Bytes cat(std::initializer_list<Bytes> parts) {
    Bytes out;
    for (const Bytes &p : parts)
        out.insert(out.end(), p.begin(), p.end());
    return out;
}

// Indefinite length closed by 00 00.
inline Bytes indef(uint8_t tag, const Bytes &content) {
    return cat({Bytes{tag, 0x80}, content, Bytes{0, 0}});
}

inline const Bytes kDialogueAs = hexBytes("06 07 00 11 86 05 01 01 01");
inline const Bytes kUniDialogueAs = hexBytes("06 07 00 11 86 05 01 02 01");
inline const Bytes kProtocolVersion = hexBytes("80 02 07 80");

// Application context name A1 around an OBJECT IDENTIFIER of the given arcs.
inline Bytes acn(const char *arcs) { return tlv(0xA1, tlv(0x06, hexBytes(arcs))); }
inline Bytes cap2() { return acn("04 00 00 01 00 32 01"); }

// 6B { 28 { dialogue-as, A0 { pdu } } }, all definite.
inline Bytes structured(const Bytes &pdu) {
    return tlv(0x6B, tlv(0x28, cat({kDialogueAs, tlv(0xA0, pdu)})));
}

inline Bytes begin(const Bytes &portions) {
    return tlv(0x62, cat({hexBytes("48 04 01 02 03 04"), portions}));
}


inline size_t countId(const Decoded &d, uint32_t id) {
    size_t n = 0;
    for (const Field &f : d.fields)
        n += f.id == id ? 1 : 0;
    return n;
}

} // namespace camel::test::dlg
