"""GPRS operations' arguments: random messages, their values as tshark shows
them, and the same values as dpx-decode reports them.

Used by oracle_compare.py beside call_control.py and charging.py, whose
normalisers, extractors, value comparison and coverage check it shares.
The corpus holds, per GPRS operation (71 to 83), messages with random
argument values in the CAP encodings: charging characteristics, results
and roll-overs with and without tariff switch, quality of service in both
formats, end user and GSN addresses, access point names, routing area
identities, GPRS location information, the event-specific information of
every GPRS event.  The TCAP levels around them are definite or indefinite;
the argument is definite.
"""

import random

import call_control as cc
import charging as ch
from call_control import (choice, extensions, null, octets, one, repeat, some, o_digits,
                          o_num, t_digits, t_filler_f, t_int, t_hexint, t_mnc, t_octets)


def _c():
    return cc._c()


# --------------------------------------------------------------------------
# Random values
# --------------------------------------------------------------------------
def uint(lo, hi):
    """INTEGER content of a value in one of a few magnitudes between lo and hi."""
    def f(rng):
        top = rng.choice([min(hi, 127), min(hi, 65535), hi])
        return _c().int_content(rng.randint(lo, max(lo, top)))
    return f


def plmn(rng):
    mcc = '%03d' % rng.randint(200, 799)
    mnc = '%02d' % rng.randint(0, 99) if rng.random() < .6 else '%03d' % rng.randint(0, 999)
    return mcc, mnc


def rai(rng):
    return _c().rai(*plmn(rng), rng.randrange(65536), rng.randrange(256))


def cell_or_lai(rng):
    """The location information's cell, service area or location area id:
    MCC-MNC-LAC and, for a cell or service area, its two-octet identity."""
    c = _c()
    mcc, mnc = plmn(rng)
    if rng.random() < .7:
        return c.cgi(mcc, mnc, rng.randrange(65536), rng.randrange(65536))
    return c.lai(mcc, mnc, rng.randrange(65536))


def apn(rng):
    labels = [''.join(rng.choice('abcdefghijklmnopqrstuvwxyz0123456789-')
                      for _ in range(rng.randint(1, 12))) for _ in range(rng.randint(1, 4))]
    return _c().apn('.'.join(labels))


def gsn_address(rng):
    """GSN address with the address type in bits 2-1 and the address length
    in bits 8-3 of its first octet (0x10: IPv4, four octets; 0x41: IPv6)."""
    if rng.random() < .6:
        return bytes([0x10]) + octets(rng, 4, 4)
    return bytes([0x41]) + octets(rng, 16, 16)


def pdp_address(rng):
    return octets(rng, 4, 4) if rng.random() < .7 else octets(rng, 16, 16)


PDP_ID = lambda rng: bytes([rng.randrange(256)])
EVENT_TYPE = one(1, 2, 3, 11, 12, 13, 14)
VOLUME = uint(0, 2 ** 32 - 1)
TIME = uint(0, 86400)
ROLL_OVER = uint(0, 255)
QOS_FORMAT = choice(((1, '80', lambda rng: octets(rng, 3, 3)),
                     (1, '81', lambda rng: octets(rng, 1, 9))))
QOS_EXTENSION = some(((1, '80', lambda rng: octets(rng, 1, 3)),))
QOS = some((
    (.6, 'A0', QOS_FORMAT), (.6, 'A1', QOS_FORMAT), (.6, 'A2', QOS_FORMAT),
    (.2, 'A3', QOS_EXTENSION), (.2, 'A4', QOS_EXTENSION), (.2, 'A5', QOS_EXTENSION),
))
END_USER_ADDRESS = some((
    (1, '80', one(0xF1, 0xF0)), (1, '81', one(0x21, 0x57, 0x8D, 0x01)), (.7, '82', pdp_address),
))
LOCATION_INFORMATION_GPRS = some((
    (.7, '80', cell_or_lai), (.6, '81', rai),
    (.2, '82', lambda rng: bytes([0x10]) + octets(rng, 7, 7)),
    (.4, '83', lambda rng: cc.address_string(rng)), (.3, '84', lambda rng: octets(rng, 3, 3)),
    (.3, '86', null),
))
CHARGING_ID = lambda rng: octets(rng, 4, 4)
TIME_AND_TIMEZONE = cc.time_and_timezone


def tariff_switch(value, optional_since=False):
    """Without a tariff switch [0] one value, with one [1] the value since
    the last switch and the switch interval."""
    return choice(((1, '80', value),
                   (1, 'A1', some(((.7 if optional_since else 1, '80', value),
                                   (.6, '81', value))))))


CHARGING_RESULT = choice(((1, 'A0', tariff_switch(VOLUME)), (1, 'A1', tariff_switch(TIME))))
CHARGING_ROLL_OVER = choice(((1, 'A0', tariff_switch(ROLL_OVER, True)),
                             (1, 'A1', tariff_switch(ROLL_OVER, True))))
DETACH_OR_DISCONNECT = some(((.8, '80', one(0, 1, 2, 3)), (.4, '81', null)))
EVENT_SPECIFIC_INFORMATION = choice((
    (1, 'A0', some(((.8, 'A0', LOCATION_INFORMATION_GPRS),))),
    (1, 'A1', some(((.6, '80', apn), (.6, '81', CHARGING_ID), (.6, 'A2', LOCATION_INFORMATION_GPRS),
                    (.6, 'A3', END_USER_ADDRESS), (.5, 'A4', QOS), (.5, '85', TIME_AND_TIMEZONE),
                    (.5, '86', gsn_address)))),
    (1, 'A2', DETACH_OR_DISCONNECT),
    (1, 'A3', DETACH_OR_DISCONNECT),
    (1, 'A4', some(((.6, '80', apn), (.6, 'A1', END_USER_ADDRESS), (.5, 'A2', QOS),
                    (.6, 'A3', LOCATION_INFORMATION_GPRS), (.5, '84', TIME_AND_TIMEZONE),
                    (.5, '85', one(0, 1)), (.2, '86', null)))),
    (1, 'A5', some(((.6, '80', apn), (.6, '81', CHARGING_ID), (.6, 'A2', END_USER_ADDRESS),
                    (.5, 'A3', QOS), (.6, 'A4', LOCATION_INFORMATION_GPRS),
                    (.5, '85', TIME_AND_TIMEZONE), (.5, '86', gsn_address)))),
))
# MS network capability (two octets) and radio access capabilities of
# several access technologies (GSM E then GSM 1800 with A5 and multislot
# classes; GSM P with the HSCSD class; GSM 1800 then an additional
# technology list).
MS_RADIO_ACCESS = ('1433822a9719892800', '0288db0a', '3327466f6f8ba580')
GPRS_MS_CLASS = some(((1, '80', lambda rng: octets(rng, 2, 2)),
                      (.5, '81', lambda rng: bytes.fromhex(rng.choice(MS_RADIO_ACCESS)))))


def connect_gprs(rng):
    c = _c()
    return c.tlv(b'\x80', apn(rng)) + (c.tlv(b'\x81', PDP_ID(rng)) if rng.random() < .5 else b'')


def furnish_charging_information_gprs(rng):
    c = _c()
    return c.tlv(b'\x30', c.tlv(b'\xA0', some((
        (1, '80', lambda rng: octets(rng, 1, 40)), (.5, '81', PDP_ID), (.5, '82', one(0, 1)),
    ))(rng)))


def send_charging_information_gprs(rng):
    c = _c()
    aoc = c.tlv(b'\xA0', some(((1, 'A0', ch.CAI), (.5, 'A1', ch.AOC_SUBSEQUENT)))(rng))
    pdp = c.tlv(b'\x81', PDP_ID(rng)) if rng.random() < .4 else b''
    return c.tlv(b'\x80', c.tlv(b'\x30', aoc + pdp))


# opcode -> (capgen operation giving the application context, outer
# identifier of the argument, contents)
OPERATIONS = {
    71: ('applyChargingGPRS', '30', some((
        (1, 'A0', choice(((1, '80', VOLUME), (1, '81', TIME)))),
        (.4, '81', uint(1, 86400)), (.5, '82', PDP_ID)))),
    72: ('applyChargingReportGPRS', '30', some((
        (1, 'A0', CHARGING_RESULT), (.4, 'A1', QOS), (.6, '82', ch.boolean), (.5, '83', PDP_ID),
        (.3, 'A4', CHARGING_ROLL_OVER)))),
    73: ('cancelGPRS', '30', some(((.7, '80', PDP_ID),))),
    74: ('connectGPRS', '30', connect_gprs),
    75: ('continueGPRS', '30', some(((.7, '80', PDP_ID),))),
    76: ('entityReleasedGPRS', '30', some(((1, '80', one(range(256))), (.5, '81', PDP_ID)))),
    77: ('furnishChargingInformationGPRS', '04', furnish_charging_information_gprs),
    78: ('initialDPGPRS', '30', some((
        (1, '80', cc.service_key), (1, '81', EVENT_TYPE), (1, '82', cc.address_string),
        (1, '83', cc.imsi), (1, '84', TIME_AND_TIMEZONE), (.05, 'A5', GPRS_MS_CLASS),
        (.6, 'A6', END_USER_ADDRESS), (.5, 'A7', QOS), (.7, '88', apn), (.6, '89', rai),
        (.5, '8A', CHARGING_ID), (.4, '8B', one(0, 1)), (.6, 'AC', LOCATION_INFORMATION_GPRS),
        (.5, '8D', one(0, 1)), (.1, 'AE', extensions), (.5, '8F', gsn_address),
        (.2, '90', null), (.3, '91', lambda rng: octets(rng, 8, 8))))),
    79: ('releaseGPRS', '30', some(((1, '80', one(range(256))), (.5, '81', PDP_ID)))),
    80: ('eventReportGPRS', '30', some((
        (1, '80', EVENT_TYPE), (1, 'A1', some(((1, '80', one(0, 1)),))),
        (.8, 'A2', EVENT_SPECIFIC_INFORMATION), (.5, '83', PDP_ID)))),
    81: ('requestReportGPRSEvent', '30', some((
        (1, 'A0', repeat('30', some(((1, '80', EVENT_TYPE), (1, '81', one(0, 1, 2)))), 1, 5)),
        (.5, '81', PDP_ID)))),
    82: ('resetTimerGPRS', '30', some(((.5, '80', one(0)), (1, '81', uint(1, 86400))))),
    83: ('sendChargingInformationGPRS', '30', send_charging_information_gprs),
}

CONTENTS = '%d operations' % len(OPERATIONS)


def build_corpus(per_op, seed):
    """-> [(group, hex)]; group 'op N/definite' or 'op N/indefinite'."""
    c = _c()
    out = []
    kinds = ('begin', 'continue', 'end', 'unidirectional')
    for code, (name, outer, build) in sorted(OPERATIONS.items()):
        rng = random.Random(seed * 1000 + 700 + code)
        for i in range(per_op):
            indef = ch._indef(i, rng)
            arg = c.tlv(bytes.fromhex(outer), build(rng))
            comp = c.invoke(rng.randint(-128, 127), code, arg, indef=indef)
            out.append(('op %d/%s' % (code, 'indefinite' if indef else 'definite'),
                        ch._wrap(rng, comp, c.default_acn(name), indef, kinds)))
    return out


# --------------------------------------------------------------------------
# Normalisers (beside call_control's and charging's)
# --------------------------------------------------------------------------
def t_cell_part(part):
    """The location information's cell or location area id (shown by tshark
    as octets only): its MCC, MNC, LAC or cell identity."""
    def f(show, raw, off, size, data):
        mcc, mnc, lac = cc.plmn_at(data, off)
        if part == 'ci':
            return int.from_bytes(data[off + 5:off + 7], 'big'), None
        o3 = data[off + 2]
        rule = 'mnc-high-half-first' if part == 'mnc' and o3 >> 4 != o3 & 15 else None
        return {'mcc': mcc, 'mnc': mnc, 'lac': lac}[part], rule
    return f


def t_gsn_body(show, raw, off, size, data):
    """GSN address: the address octets after the type-and-length octet."""
    return data[off + 1:off + size].hex(), None


def t_aoc_support(show, raw, off, size, data):
    return data[off] & 1, None


def o_bool(f):
    return o_num(f) != 0


# tshark's short QoS fields, inside the short format only (the long format
# is read by tshark as MAP's Ext-QoS-Subscribed, a different layout).
SHORT_QOS = ('camel.short_QoS_format',)
RAI = ('camel.routeingAreaIdentity',)
CELL = ('camel.cellGlobalIdOrServiceAreaIdOrLAI',)
VALUES = (
    ('service key', None, ('camel.serviceKey',), (1611,), t_int, o_num),
    ('event type GPRS', None, ('camel.gPRSEventType',), (2433,), t_int, o_num),
    ('IMSI digits', ('camel.iMSI',), ('e212.imsi',), (2025, 2029), t_digits, o_digits),
    ('MSISDN digits', ('camel.mSISDN',), ('e164.msisdn', 'gsm_map.address.digits', 'e212.imsi'),
     (2058,), t_filler_f, o_digits),
    ('PDP type organisation', None, ('camel.pDPTypeOrganization',), (2472,), t_hexint, o_num),
    ('PDP type number', None, ('camel.pDPTypeNumber',), (2475,), t_hexint, o_num),
    ('PDP address', None, ('camel.pDPAddress',), (2478,), t_octets, o_digits),
    ('QoS: reliability class', SHORT_QOS, ('gsm_a.gm.sm.qos.reliability_cls',), (2380,), t_int,
     o_num),
    ('QoS: delay class', SHORT_QOS, ('gsm_a.gm.sm.qos.delay_cls',), (2381,), t_int, o_num),
    ('QoS: precedence class', SHORT_QOS, ('gsm_a.gm.sm.qos.prec_class',), (2382,), t_int, o_num),
    ('QoS: peak throughput', SHORT_QOS, ('gsm_a.gm.sm.qos.peak_throughput',), (2383,), t_int,
     o_num),
    ('QoS: mean throughput', SHORT_QOS, ('gsm_a.gm.sm.qos.mean_throughput',), (2384,), t_int,
     o_num),
    ('access point name octets', None, ('camel.accessPointName',), (2413,), t_octets, o_digits),
    ('RAI: MCC', RAI, ('e212.rai.mcc',), (2442,), t_digits, o_digits),
    ('RAI: MNC', RAI, ('e212.rai.mnc',), (2449, 2446), t_mnc, o_digits),
    ('RAI: LAC', RAI, ('gsm_a.lac',), (2450,), t_int, o_num),
    ('RAI: RAC', RAI, ('gsm_a.gm.gmm.rac',), (2451,), t_int, o_num),
    ('location: cell or LAI MCC', None, CELL, (2079,), t_cell_part('mcc'), o_digits),
    ('location: cell or LAI MNC', None, CELL, (2083, 2086), t_cell_part('mnc'), o_digits),
    ('location: cell or LAI LAC', None, CELL, (2087,), t_cell_part('lac'), o_num),
    ('charging id', None, ('camel.chargingID',), (2463,), t_octets, o_digits),
    ('SGSN capabilities: AOC support', None, ('camel.sGSNCapabilities',), (2554,),
     t_aoc_support, o_num),
    ('GSN address', None, ('camel.gsn_Address', 'camel.gGSNAddress'), (2594, 2590), t_gsn_body,
     o_digits),
    ('PDP initiation type', None, ('camel.pDPInitiationType',), (2583,), t_int, o_num),
    ('initiating entity', None, ('camel.initiatingEntity',), (2484,), t_int, o_num),
    ('GPRS cause', None, ('camel.gprsCause', 'camel.gPRSCause'), (2424,), t_hexint, o_num),
    ('PDP ID', None, ('camel.pDPID', 'camel.pdpID'), (1270,), t_hexint, o_num),
    ('monitor mode', None, ('camel.monitorMode',), (1909,), t_int, o_num),
    ('misc info: message type', None, ('inap.messageType', 'camel.messageType'), (1608,), t_int,
     o_num),
    ('active', None, ('camel.active',), (2364,), ch.t_bool, o_bool),
    ('max transferred volume', None, ('camel.maxTransferredVolume',), (2317,), t_int, o_num),
    ('max elapsed time', None, ('camel.maxElapsedTime',), (2318,), t_int, o_num),
    ('tariff switch interval', None, ('camel.tariffSwitchInterval',), (1396,), t_int, o_num),
    ('volume if no tariff switch', None, ('camel.volumeIfNoTariffSwitch',), (2335,), t_int,
     o_num),
    ('volume since last tariff switch', None, ('camel.volumeSinceLastTariffSwitch',), (2343,),
     t_int, o_num),
    ('volume tariff switch interval', None, ('camel.volumeTariffSwitchInterval',), (2346,),
     t_int, o_num),
    ('time if no tariff switch', None, ('camel.timeGPRSIfNoTariffSwitch',), (2350,), t_int,
     o_num),
    ('time since last tariff switch', None, ('camel.timeGPRSSinceLastTariffSwitch',), (2358,),
     t_int, o_num),
    ('time tariff switch interval', None, ('camel.timeGPRSTariffSwitchInterval',), (2361,),
     t_int, o_num),
    ('roll-over volume if no tariff switch', None, ('camel.rO_VolumeIfNoTariffSwitch',),
     (3888,), t_int, o_num),
    ('roll-over volume since last switch', None, ('camel.rO_VolumeSinceLastTariffSwitch',),
     (3896,), t_int, o_num),
    ('roll-over volume switch interval', None, ('camel.rO_VolumeTariffSwitchInterval',),
     (3899,), t_int, o_num),
    ('roll-over time if no tariff switch', None, ('camel.rO_TimeGPRSIfNoTariffSwitch',),
     (3903,), t_int, o_num),
    ('roll-over time since last switch', None, ('camel.rO_TimeGPRSSinceLastTariffSwitch',),
     (3911,), t_int, o_num),
    ('roll-over time switch interval', None, ('camel.rO_TimeGPRSTariffSwitchInterval',),
     (3914,), t_int, o_num),
    ('timer value', None, ('camel.timervalue',), (1376,), t_int, o_num),
    ('free format data', None, ('camel.fCIBCCCAMELsequence1_freeFormatData',
                                'camel.freeFormatData'), (2188,), ch.t_free_format_data,
     o_digits),
    ('append free format data', None, ('camel.appendFreeFormatData',), (2191,), t_int, o_num),
    ('AOC: E1-E7', None, tuple('camel.e%d' % n for n in range(1, 8)),
     tuple(1283 + 3 * n for n in range(7)), t_int, o_num),
)

RULE_TEXT = dict(ch.RULE_TEXT, **{
    'long-qos-format-not-compared': 'long QoS format: read as the short format\'s three octets '
                                    'then octets 4 to 11; tshark reads MAP\'s Ext-QoS-Subscribed '
                                    '(allocation priority first), so its values are not compared',
})
FLAGGING_PAYLOAD_RULES = ch.FLAGGING_PAYLOAD_RULES
ROWS = [cc._row(r) for r in VALUES]


def _argument(root):
    cp = root.kid(0x6C)
    if cp is None or not cp.kids or cp.kids[0].tag != 0xA1 or len(cp.kids[0].kids) < 3:
        return None
    return cp.kids[0].kids[-1]


def payload(root, stats, hexmsg):
    """(first, end, rule names) of the Invoke's argument, or None."""
    arg = _argument(root)
    if arg is None:
        return None
    notes = {'invoke-indefinite'} if root.kid(0x6C).kids[0].indef else set()
    dlg = root.kid(0x6B)
    if dlg is not None and not dlg.indef and dlg.kids and dlg.kids[0].indef:
        notes.add('external-indefinite')
    return arg.off, arg.end, notes



def check(corpus, pdml, oracle, ours, parse_node, tcap_rules):
    """call_control.check over this module's corpus, payloads and values."""
    stats = cc.check(corpus, pdml, oracle, ours, parse_node, tcap_rules, payload,
                     lambda group: group.split('/')[0], ROWS, FLAGGING_PAYLOAD_RULES)
    for (_, hexmsg), tfields in zip(corpus, pdml):
        if any(t[0] == 'camel.long_QoS_format' for t in tfields):
            stats.rule('long-qos-format-not-compared', hexmsg)
    return stats


def report(stats, show, complete=True):
    return cc.report(stats, show, complete, ROWS, RULE_TEXT, 'GPRS arguments')
