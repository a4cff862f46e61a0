#include "walker.h"

#include <cstring>

#include "ip.h"
#include "link.h"
#include "mtp3.h"
#include "sigtran.h"

namespace dpxdecode::capture {

const char *skipName(Skip s) {
    switch (s) {
    case Skip::None: return "none";
    case Skip::LinkTypeUnsupported: return "link: type not supported";
    case Skip::LinkTruncated: return "link: truncated";
    case Skip::LinkNotIpOrSs7: return "link: neither IP nor SS7";
    case Skip::Mtp2Truncated: return "mtp2: truncated";
    case Skip::Mtp2NotMsu: return "mtp2: fill-in or link status unit";
    case Skip::Ipv4Truncated: return "ipv4: truncated or bad header";
    case Skip::Ipv4Fragment: return "ipv4: fragment";
    case Skip::Ipv6Truncated: return "ipv6: truncated or bad header";
    case Skip::Ipv6Fragment: return "ipv6: fragment";
    case Skip::IpNotSctp: return "ip: not SCTP";
    case Skip::SctpTruncated: return "sctp: truncated";
    case Skip::SctpChunkTruncated: return "sctp: chunk truncated";
    case Skip::SctpNoData: return "sctp: no DATA chunk";
    case Skip::SctpDuplicate: return "sctp: duplicate TSN";
    case Skip::SctpUnknownPayload: return "sctp: payload not M3UA, M2UA, M2PA or SUA";
    case Skip::SctpReassemblyDropped: return "sctp: fragment dropped";
    case Skip::M3uaTruncated: return "m3ua: truncated";
    case Skip::M3uaNotData: return "m3ua: not DATA";
    case Skip::M2uaTruncated: return "m2ua: truncated";
    case Skip::M2uaNotData: return "m2ua: not DATA";
    case Skip::M2paTruncated: return "m2pa: truncated";
    case Skip::M2paNotData: return "m2pa: not user data";
    case Skip::SuaTruncated: return "sua: truncated";
    case Skip::SuaNotCldt: return "sua: not CLDT";
    case Skip::SuaSegmented: return "sua: segmented";
    case Skip::Mtp3Truncated: return "mtp3: truncated";
    case Skip::Mtp3NotSccp: return "mtp3: not SCCP";
    case Skip::SccpTruncated: return "sccp: truncated";
    case Skip::SccpBadPointer: return "sccp: pointer or address out of bounds";
    case Skip::SccpUnsupportedType: return "sccp: not UDT, XUDT or LUDT";
    case Skip::SccpSsnNotSelected: return "sccp: SSN not selected";
    case Skip::SccpSegmentDropped: return "sccp: segment dropped";
    case Skip::Count: break;
    }
    return "?";
}

size_t FrameWalker::walk(uint32_t linkType, Bytes frame, MessageSink &sink) {
    found_ = 0;
    const LinkOut link = parseLink(linkType, frame);
    if (link.skip != Skip::None) {
        count(link.skip);
        return 0;
    }
    if (link.network == Network::Mtp3) {
        mtp3(link.payload, sink);
        return found_;
    }
    const IpOut ip = link.network == Network::Ipv4 ? parseIpv4(link.payload) : parseIpv6(link.payload);
    if (ip.skip != Skip::None) {
        count(ip.skip);
        return 0;
    }
    if (ip.protocol != kProtocolSctp) {
        count(Skip::IpNotSctp);
        return 0;
    }
    sctp(ip, sink);
    return found_;
}

void FrameWalker::sctp(const IpOut &ip, MessageSink &sink) {
    const SctpHeader h = parseSctpHeader(ip.payload);
    if (h.skip != Skip::None) {
        count(h.skip);
        return;
    }
    SctpFlowKey key;
    key.addressLength = ip.addressLength;
    std::memcpy(key.source, ip.source, sizeof key.source);
    std::memcpy(key.destination, ip.destination, sizeof key.destination);
    key.sourcePort = h.sourcePort;
    key.destinationPort = h.destinationPort;
    key.verificationTag = h.verificationTag;

    SctpChunkWalker chunks(h.chunks);
    SctpChunk chunk;
    bool anyData = false;
    while (chunks.next(chunk)) {
        if (chunk.type != kChunkData)
            continue;
        anyData = true;
        const SctpData data = parseSctpData(chunk.flags, chunk.value);
        if (data.skip != Skip::None) {
            count(data.skip);
            continue;
        }
        Bytes message;
        switch (sctp_.add(key, data, message)) {
        case SctpReassembler::Verdict::Message:
            userMessage(data.protocolId, h.sourcePort, h.destinationPort, message, sink);
            break;
        case SctpReassembler::Verdict::Pending:
            break;
        case SctpReassembler::Verdict::Duplicate:
            count(Skip::SctpDuplicate);
            break;
        case SctpReassembler::Verdict::Dropped:
            count(Skip::SctpReassemblyDropped);
            break;
        }
    }
    if (chunks.skip() != Skip::None)
        count(chunks.skip());
    else if (!anyData)
        count(Skip::SctpNoData);
}

void FrameWalker::userMessage(uint32_t protocolId, uint16_t sport, uint16_t dport, Bytes message,
                              MessageSink &sink) {
    const Adaptation adaptation = adaptationFor(protocolId, sport, dport);
    switch (adaptation) {
    case Adaptation::M3ua: {
        const M3uaOut m = parseM3ua(message);
        if (m.skip != Skip::None) {
            count(m.skip);
            return;
        }
        if (m.routing.serviceIndicator != kServiceSccp) {
            count(Skip::Mtp3NotSccp);
            return;
        }
        sccp(m.userData, Origin{true, m.routing.opc, m.routing.dpc}, sink);
        return;
    }
    case Adaptation::M2ua:
    case Adaptation::M2pa: {
        const Inner msu = adaptation == Adaptation::M2ua ? parseM2ua(message) : parseM2pa(message);
        if (!msu.ok())
            count(msu.skip);
        else
            mtp3(msu.bytes, sink);
        return;
    }
    case Adaptation::Sua: {
        const SuaOut s = parseSua(message);
        if (s.skip != Skip::None) {
            count(s.skip);
            return;
        }
        TcapMessage m;
        m.tcap = s.data;
        m.hasPointCodes = s.calling.hasPointCode || s.called.hasPointCode;
        m.opc = s.calling.pointCode;
        m.dpc = s.called.pointCode;
        m.hasCalledSsn = s.called.ssn != 0;
        m.hasCallingSsn = s.calling.ssn != 0;
        m.calledSsn = s.called.ssn;
        m.callingSsn = s.calling.ssn;
        emit(m, sink);
        return;
    }
    case Adaptation::None:
        count(Skip::SctpUnknownPayload);
        return;
    }
}

void FrameWalker::mtp3(Bytes msu, MessageSink &sink) {
    const Mtp3Out m = parseMtp3(msu, options_.ansi);
    if (m.skip != Skip::None) {
        count(m.skip);
        return;
    }
    sccp(m.userData, Origin{true, m.routing.opc, m.routing.dpc}, sink);
}

void FrameWalker::sccp(Bytes message, const Origin &origin, MessageSink &sink) {
    const SccpOut s = parseSccp(message, options_.ansi);
    if (s.skip != Skip::None) {
        count(s.skip);
        return;
    }
    TcapMessage m;
    m.hasPointCodes = origin.hasPointCodes || s.calling.hasPointCode || s.called.hasPointCode;
    m.opc = origin.hasPointCodes ? origin.opc : s.calling.pointCode;
    m.dpc = origin.hasPointCodes ? origin.dpc : s.called.pointCode;
    m.hasCalledSsn = s.called.hasSsn;
    m.hasCallingSsn = s.calling.hasSsn;
    m.calledSsn = s.called.ssn;
    m.callingSsn = s.calling.ssn;
    if (!selected(m))
        return;
    switch (sccp_.add(m.opc, s, m.tcap)) {
    case SccpReassembler::Verdict::Message:
        sink.onTcap(m);
        ++found_;
        return;
    case SccpReassembler::Verdict::Pending:
        return;
    case SccpReassembler::Verdict::Dropped:
        count(Skip::SccpSegmentDropped);
        return;
    }
}

bool FrameWalker::selected(const TcapMessage &m) {
    if ((m.hasCalledSsn && options_.ssns.test(m.calledSsn)) || (m.hasCallingSsn && options_.ssns.test(m.callingSsn)))
        return true;
    count(Skip::SccpSsnNotSelected);
    return false;
}

void FrameWalker::emit(const TcapMessage &m, MessageSink &sink) {
    if (!selected(m))
        return;
    sink.onTcap(m);
    ++found_;
}

} // namespace dpxdecode::capture
