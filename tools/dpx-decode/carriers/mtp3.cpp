#include "mtp3.h"

namespace dpxdecode::capture {

Mtp3Out parseMtp3(Bytes m, bool ansi) {
    Mtp3Out o;
    const size_t label = ansi ? 7 : 4;
    if (!m.has(0, 1 + label)) {
        o.skip = Skip::Mtp3Truncated;
        return o;
    }
    o.routing.hasPointCodes = true;
    o.routing.serviceIndicator = m.u8(0) & 0x0F;
    if (ansi) {
        o.routing.dpc = m.le24(1);
        o.routing.opc = m.le24(4);
    } else {
        const uint32_t l = m.le32(1);
        o.routing.dpc = l & 0x3FFF;
        o.routing.opc = (l >> 14) & 0x3FFF;
    }
    if (o.routing.serviceIndicator != kServiceSccp) {
        o.skip = Skip::Mtp3NotSccp;
        return o;
    }
    o.userData = m.from(1 + label);
    return o;
}

} // namespace dpxdecode::capture
