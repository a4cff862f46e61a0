#include "sigtran.h"

#include <initializer_list>

namespace dpxdecode::capture {
namespace {

// Common header: version 1, reserved, class, type, length of the whole
// message.  Returns the parameters, cut to the message length, or an empty
// span with ok false.
struct Common {
    bool ok = false;
    uint8_t messageClass = 0;
    uint8_t type = 0;
    Bytes parameters;
};

Common common(Bytes m) {
    Common c;
    if (!m.has(0, 8) || m.u8(0) != 1)
        return c;
    const size_t length = m.be32(4);
    if (length < 8 || length > m.size)
        return c;
    c.ok = true;
    c.messageClass = m.u8(2);
    c.type = m.u8(3);
    c.parameters = m.sub(8, length - 8);
    return c;
}

// Tag-length-value parameters padded to four octets.
class Parameters {
public:
    explicit Parameters(Bytes b) : rest_(b) {}
    // False at the end or when a parameter runs past the message (bad()).
    bool next(uint16_t &tag, Bytes &value) {
        if (rest_.size == 0 || bad_)
            return false;
        if (!rest_.has(0, 4) || rest_.be16(2) < 4 || !rest_.has(0, rest_.be16(2))) {
            bad_ = true;
            return false;
        }
        const size_t length = rest_.be16(2);
        tag = rest_.be16(0);
        value = rest_.sub(4, length - 4);
        const size_t padded = (length + 3) & ~size_t(3);
        rest_ = padded >= rest_.size ? Bytes{rest_.data + rest_.size, 0} : rest_.from(padded);
        return true;
    }
    bool bad() const { return bad_; }

private:
    Bytes rest_;
    bool bad_ = false;
};

SuaAddress suaAddress(Bytes v) {
    // Routing indicator, address indicator, then sub-parameters.
    SuaAddress a;
    if (!v.has(0, 4))
        return a;
    Parameters sub(v.from(4));
    uint16_t tag = 0;
    Bytes value;
    while (sub.next(tag, value)) {
        if (tag == 0x8002 && value.has(0, 4)) {
            a.hasPointCode = true;
            a.pointCode = value.be32(0) & 0xFFFFFF;
        } else if (tag == 0x8003 && value.has(0, 4)) {
            a.ssn = value.u8(3);
        }
    }
    return a;
}

} // namespace

Adaptation adaptationFor(uint32_t protocolId, uint16_t sport, uint16_t dport) {
    switch (protocolId) {
    case 2:
        return Adaptation::M2ua;
    case 3:
        return Adaptation::M3ua;
    case 4:
        return Adaptation::Sua;
    case 5:
        return Adaptation::M2pa;
    case 0:
        break;
    default:
        return Adaptation::None;
    }
    for (const uint16_t port : {dport, sport}) {
        switch (port) {
        case 2904:
            return Adaptation::M2ua;
        case 2905:
            return Adaptation::M3ua;
        case 14001:
            return Adaptation::Sua;
        case 3565:
            return Adaptation::M2pa;
        default:
            break;
        }
    }
    return Adaptation::None;
}

M3uaOut parseM3ua(Bytes m) {
    M3uaOut o;
    const Common c = common(m);
    if (!c.ok) {
        o.skip = Skip::M3uaTruncated;
        return o;
    }
    if (c.messageClass != 1 || c.type != 1) { // Transfer, DATA
        o.skip = Skip::M3uaNotData;
        return o;
    }
    Parameters params(c.parameters);
    uint16_t tag = 0;
    Bytes value;
    while (params.next(tag, value)) {
        if (tag != 0x0210)
            continue;
        // OPC, DPC, SI, NI, MP, SLS, user data.
        if (!value.has(0, 12))
            break;
        o.routing.hasPointCodes = true;
        o.routing.opc = value.be32(0) & 0xFFFFFF;
        o.routing.dpc = value.be32(4) & 0xFFFFFF;
        o.routing.serviceIndicator = value.u8(8);
        o.userData = value.from(12);
        return o;
    }
    o.skip = Skip::M3uaTruncated;
    return o;
}

Inner parseM2ua(Bytes m) {
    const Common c = common(m);
    if (!c.ok)
        return Inner{Skip::M2uaTruncated, {}};
    if (c.messageClass != 6 || c.type != 1) // MTP2 user adaptation, DATA
        return Inner{Skip::M2uaNotData, {}};
    Parameters params(c.parameters);
    uint16_t tag = 0;
    Bytes value;
    while (params.next(tag, value)) {
        if (tag == 0x0300)
            return Inner{Skip::None, value};
        // Protocol Data 2 starts with a priority octet.
        if (tag == 0x0301) {
            if (!value.has(0, 1))
                break;
            return Inner{Skip::None, value.from(1)};
        }
    }
    return Inner{Skip::M2uaTruncated, {}};
}

Inner parseM2pa(Bytes m) {
    const Common c = common(m);
    if (!c.ok)
        return Inner{Skip::M2paTruncated, {}};
    if (c.messageClass != 11 || c.type != 1) // M2PA, User Data
        return Inner{Skip::M2paNotData, {}};
    // BSN and FSN, four octets each, then the priority octet and the MSU.
    if (!c.parameters.has(0, 8))
        return Inner{Skip::M2paTruncated, {}};
    if (c.parameters.size <= 9)
        return Inner{Skip::M2paNotData, {}};
    return Inner{Skip::None, c.parameters.from(9)};
}

SuaOut parseSua(Bytes m) {
    SuaOut o;
    const Common c = common(m);
    if (!c.ok) {
        o.skip = Skip::SuaTruncated;
        return o;
    }
    if (c.messageClass != 7 || c.type != 1) { // connectionless, CLDT
        o.skip = Skip::SuaNotCldt;
        return o;
    }
    Parameters params(c.parameters);
    uint16_t tag = 0;
    Bytes value;
    bool haveData = false;
    while (params.next(tag, value)) {
        switch (tag) {
        case 0x0102:
            o.calling = suaAddress(value);
            break;
        case 0x0103:
            o.called = suaAddress(value);
            break;
        case 0x0117: // segmentation
            o.skip = Skip::SuaSegmented;
            return o;
        case 0x010B:
            o.data = value;
            haveData = true;
            break;
        default:
            break;
        }
    }
    if (!haveData || params.bad())
        o.skip = Skip::SuaTruncated;
    return o;
}

} // namespace dpxdecode::capture
