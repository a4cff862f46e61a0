"""SMS operation arguments: random messages, their values as tshark shows
them, and the same values as dpx-decode reports them.

Used by oracle_compare.py beside call_control.py, whose normalisers,
extractors, value comparison and coverage check it shares.  The corpus
holds, per SMS operation with an argument (60 to 64, 66, 67), messages
with random argument values: every optional element present or not,
random addresses, event types, causes, TP octets of every layout and both
validity period forms.  The TCAP levels around them are definite or
indefinite; the argument is definite.

tshark shows the TP octets of SMS Initial DP as octets only: their fields
are compared with the octet tshark locates, read by the layouts of the
short message's first octet (SMS-SUBMIT), protocol identifier and data
coding scheme groups; a field that the octet's layout does not carry must
not be reported.
"""

import random

import call_control as cc
import charging as ch
from call_control import (choice, extensions, null, octets, one, repeat, some, o_digits, o_num,
                          t_int, t_octets)


def _c():
    return cc._c()


# --------------------------------------------------------------------------
# Random arguments
# --------------------------------------------------------------------------
def _any_octet(rng):
    return bytes([rng.randrange(256)])


def bcd_pair(lo, hi):
    """Two swapped BCD digits of a value in lo..hi (0x21 for 12)."""
    def f(rng):
        v = rng.randint(lo, hi)
        return (v % 10) << 4 | v // 10
    return f


def validity_period(rng):
    """A relative period (one octet) or an absolute one (seven octets:
    year to second as swapped BCD, then the time zone's quarters with the
    sign in bit 4)."""
    if rng.random() < .5:
        return _any_octet(rng)
    parts = [bcd_pair(0, 99), bcd_pair(1, 12), bcd_pair(1, 28), bcd_pair(0, 23),
             bcd_pair(0, 59), bcd_pair(0, 59)]
    quarters = rng.randint(0, 79)
    tz = (quarters % 10) << 4 | rng.randint(0, 1) << 3 | quarters // 10
    return bytes([p(rng) for p in parts] + [tz])


SMS_ADDRESS = cc.address_string
EVENT_TYPE_SMS = one(1, 2, 3, 11, 12, 13, range(256))
MESSAGE_TYPE = some(((1, '80', one(0, 1)),))
# The GPRS elements of SMS Initial DP (location information GPRS [6], GPRS
# MS class [18]), in about one message in thirteen: decoded as in the GPRS
# arguments, where the GPRS suite compares their values.
LOCATION_GPRS = some(((1, '80', cc.cell_id), (.5, '81', lambda rng: cc.plmn_lac(rng) + b'\x07')))
# MS network capability (two octets) and radio access capabilities of
# several access technologies (GSM E then GSM 1800 with A5 and multislot
# classes; GSM P with the HSCSD class; GSM 1800 then an additional
# technology list).
MS_RADIO_ACCESS = ('1433822a9719892800', '0288db0a', '3327466f6f8ba580')
GPRS_MS_CLASS = some(((1, '80', lambda rng: octets(rng, 2, 2)),
                      (.5, '81', lambda rng: bytes.fromhex(rng.choice(MS_RADIO_ACCESS)))))


def initial_dp_sms(rng):
    """SMS Initial DP; about one message in thirteen also carries [6] or [18]."""
    other = rng.random() < .1
    return some((
        (1, '80', cc.service_key), (.8, '81', cc.bcd_number), (.8, '82', SMS_ADDRESS),
        (.8, '83', one(1, 11, range(256))), (.8, '84', cc.imsi),
        (.5, 'A5', cc.LOCATION_INFORMATION), (.5 if other else 0, 'A6', LOCATION_GPRS),
        (.7, '87', SMS_ADDRESS), (.6, '88', cc.time_and_timezone), (.6, '89', _any_octet),
        (.6, '8A', _any_octet), (.6, '8B', _any_octet), (.5, '8C', validity_period),
        (.1, 'AD', extensions), (.5, '8E', lambda rng: octets(rng, 1, 8)),
        (.5, '8F', SMS_ADDRESS), (.3, '90', SMS_ADDRESS),
        (.4, '91', lambda rng: octets(rng, 3, 3)), (.5 if other else 0, 'B2', GPRS_MS_CLASS),
        (.4, '93', lambda rng: _c().tbcd(cc.digits(rng, 15, 16))), (.3, '94', SMS_ADDRESS),
    ))(rng)


CONNECT_SMS = some(((.6, '80', SMS_ADDRESS), (.8, '81', cc.bcd_number), (.6, '82', SMS_ADDRESS),
                    (.1, 'AA', extensions)))
EVENT_SPECIFIC_INFO_SMS = choice((
    (1, 'A0', some(((.7, '80', one(0, 1, 2, 3, 4, range(256))),))),
    (1, 'A1', null),
    (1, 'A2', some(((.7, '80', one(1, 21, 22, 27, 111, range(256))),))),
    (1, 'A3', null),
))
EVENT_REPORT_SMS = some(((1, '80', EVENT_TYPE_SMS), (.7, 'A1', EVENT_SPECIFIC_INFO_SMS),
                         (.6, 'A2', MESSAGE_TYPE), (.1, 'AA', extensions)))
FCI_SMS = some(((1, 'A0', some((
    (1, '80', lambda rng: octets(rng, 1, rng.choice((8, 40, 52, 160)))),
    (.5, '81', one(0, 1)),
))),))
SMS_EVENT = some(((1, '80', EVENT_TYPE_SMS), (1, '81', one(0, 1, 2))))
REQUEST_REPORT_SMS_EVENT = some(((1, 'A0', repeat('30', SMS_EVENT, 1, 5)),
                                 (.1, 'AA', extensions)))
RESET_TIMER_SMS = some(((.5, '80', one(0)), (1, '81', ch.int_in((1, 127), (128, 86400))),
                        (.1, 'A2', extensions)))

# opcode -> (capgen operation giving the application context, outer
# identifier of the argument, contents)
OPERATIONS = {
    60: ('initialDPSMS', '30', initial_dp_sms),
    61: ('furnishChargingInformationSMS', '04', FCI_SMS),
    62: ('connectSMS', '30', CONNECT_SMS),
    63: ('requestReportSMSEvent', '30', REQUEST_REPORT_SMS_EVENT),
    64: ('eventReportSMS', '30', EVENT_REPORT_SMS),
    66: ('releaseSMS', '04', one(1, 8, 10, 21, 27, 41, 47, 111, range(256))),
    67: ('resetTimerSMS', '30', RESET_TIMER_SMS),
}
CONTENTS = '%d operations' % len(OPERATIONS)


def build_corpus(per_op, seed):
    """per_op messages per operation, half of them with indefinite TCAP
    lengths (as charging.py chooses them) -> [(group, hex)]."""
    c = _c()
    out = []
    kinds = ('begin', 'continue', 'end', 'unidirectional')
    for code, (name, outer, build) in sorted(OPERATIONS.items()):
        rng = random.Random(seed * 1000 + 600 + code)
        for i in range(per_op):
            indef = ch._indef(i, rng)
            arg = c.tlv(bytes.fromhex(outer), build(rng))
            comp = c.invoke(rng.randint(-128, 127), code, arg, indef=indef)
            out.append(('%d/%s' % (code, 'indefinite' if indef else 'definite'),
                        ch._wrap(rng, comp, c.default_acn(name, 4), indef, kinds)))
    return out


# --------------------------------------------------------------------------
# Normalisers
# --------------------------------------------------------------------------
def t_bits(offset, width, applies=None):
    """Bits offset+1 .. offset+width of the octet tshark shows; None (the
    field must not be reported) when `applies` says the octet's layout does
    not carry it."""
    def f(show, raw, off, size, data):
        b = data[off]
        if applies is not None and not applies(b):
            return None, None
        return (b >> offset) & ((1 << width) - 1), None
    return f


def pid_use(*uses):
    return lambda b: b >> 6 in uses


def coding_group(*groups):
    return lambda b: b >> 4 in groups


GENERAL, DELETION, WAITING = range(0, 4), range(4, 8), range(12, 15)


def t_validity(part):
    """A validity period: one octet relative, seven absolute (swapped BCD
    year to second, time zone tens in bits 3-1, sign in bit 4, units in
    bits 8-5); None for the form the period does not have."""
    def f(show, raw, off, size, data):
        b = data[off:off + size]
        if part == 'relative':
            return (b[0] if size == 1 else None), None
        if size != 7:
            return None, None
        if part == 'sign':
            return b[6] >> 3 & 1, None
        if part == 'zone':
            return (b[6] & 7) << 4 | b[6] >> 4, None
        o = b[('year', 'month', 'day', 'hour', 'minute', 'second').index(part)]
        return (o & 15) << 4 | o >> 4, None
    return f


def t_choice(show, raw, off, size, data):
    """A CHOICE tshark shows by its index: the identifier [n] constructed."""
    return 0xA0 + int(show), None


# --------------------------------------------------------------------------
# The compared values (rows as in call_control.VALUES)
# --------------------------------------------------------------------------
SMS_ADDRESSES = ('camel.callingPartyNumber', 'camel.callingPartysNumber', 'camel.sMSCAddress',
                 'camel.mscAddress', 'camel.sgsn_Number', 'camel.calledPartyNumber')
SM_INFO, PID, DCS, VP = ('camel.tPShortMessageSpecificInfo',), ('camel.tPProtocolIdentifier',), \
    ('camel.tPDataCodingScheme',), ('camel.tPValidityPeriod',)
VALUES = (
    ('event type SMS', None, ('camel.eventTypeSMS',), (2169,), t_int, o_num),
    ('event specific info SMS', None, ('camel.eventSpecificInformationSMS',), (2172,), t_choice,
     o_num, -2),
    ('O SMS failure cause', None, ('camel.mo-smsfailureCause',), (2179,), t_int, o_num),
    ('MT SMS cause', None, ('camel.t-smsfailureCause',), (4315,), t_bits(0, 7), o_num),
    ('RP cause', None, ('camel.RP_Cause',), (2290,), t_int, o_num),
    ('SMS reference number', None, ('camel.smsReferenceNumber',), (4177,), t_octets, o_digits),
    ('SMS address digits', SMS_ADDRESSES, cc.ISDN_DIGITS, (2058,), cc.t_filler_f, o_digits),
    ('SMS address nature of address', SMS_ADDRESSES, ('gsm_map.nature_of_number',), (2055,),
     t_int, o_num),
    ('SMS address numbering plan', SMS_ADDRESSES, ('gsm_map.number_plan',), (2054,), t_int,
     o_num),
) + tuple((name, None, tnames, (fid,), norm, o_num) for name, tnames, fid, norm in (
    ('TP reply path', SM_INFO, 2243, t_bits(7, 1)),
    ('TP user data header indicator', SM_INFO, 2244, t_bits(6, 1)),
    ('TP status report request', SM_INFO, 2245, t_bits(5, 1)),
    ('TP validity period format', SM_INFO, 2246, t_bits(3, 2)),
    ('TP reject duplicates', SM_INFO, 2247, t_bits(2, 1)),
    ('TP message type indicator', SM_INFO, 2248, t_bits(0, 2)),
    ('TP-PID use', PID, 2251, t_bits(6, 2)),
    ('TP-PID telematic device', PID, 2253, t_bits(0, 5, pid_use(0))),
    ('TP-PID telematic interworking', PID, 2254, t_bits(5, 1, pid_use(0))),
    ('TP-PID short message type', PID, 2255, t_bits(0, 6, pid_use(1))),
    ('TP-PID reserved or SC specific', PID, 2252, t_bits(0, 6, pid_use(2, 3))),
    ('TP-DCS coding group', DCS, 2274, t_bits(4, 4)),
    ('TP-DCS compressed', DCS, 2279, t_bits(5, 1, coding_group(*GENERAL))),
    ('TP-DCS compressed (automatic deletion)', DCS, 2282, t_bits(5, 1, coding_group(*DELETION))),
    ('TP-DCS class meaning', DCS, 2276, t_bits(4, 1, coding_group(*GENERAL, *DELETION))),
    ('TP-DCS alphabet', DCS, 2278, t_bits(2, 2, coding_group(*GENERAL))),
    ('TP-DCS alphabet (automatic deletion)', DCS, 2281, t_bits(2, 2, coding_group(*DELETION))),
    ('TP-DCS message class', DCS, 2280, t_bits(0, 2, coding_group(*GENERAL, *DELETION))),
    ('TP-DCS indication sense', DCS, 2284, t_bits(3, 1, coding_group(*WAITING))),
    ('TP-DCS indication type', DCS, 2283, t_bits(0, 2, coding_group(*WAITING))),
    ('TP-DCS message coding', DCS, 2286, t_bits(2, 1, coding_group(15))),
    ('TP-DCS data coding class', DCS, 2285, t_bits(0, 2, coding_group(15))),
    ('TP validity period: relative', VP, 2271, t_validity('relative')),
) + tuple(('TP validity period: %s' % part, VP, fid, t_validity(part)) for part, fid in (
    ('year', 2263), ('month', 2264), ('day', 2265), ('hour', 2266), ('minute', 2267),
    ('second', 2268), ('sign', 2269), ('zone', 2270)))) + tuple(
    r for r in cc.VALUES if r[0] in (
        'service key', 'IMSI digits', 'called BCD digits', 'called BCD type of number',
        'called BCD numbering plan', 'monitor mode', 'timer id', 'timer value',
        'misc call info: message type', 'age of location information', 'cell id: MCC',
        'cell id: MNC', 'cell id: LAC', 'cell id: cell identity', 'LAI: MCC', 'LAI: MNC',
        'LAI: LAC', 'time: year', 'time: month', 'time: day', 'time: hour', 'time: minute',
        'time: second', 'time zone sign', 'time zone', 'ISDN address digits (VLR, MSC, gsmSCF)',
        'IDP extension: MS classmark 2', 'IDP extension: IMEI') or
    r[0].startswith('location information: location number')) + tuple(
    r for r in ch.VALUES if r[0] in ('free format data', 'append free format data'))

RULE_TEXT = ch.RULE_TEXT
FLAGGING_PAYLOAD_RULES = ch.FLAGGING_PAYLOAD_RULES

ROWS = [cc._row(r) for r in VALUES]


def _gprs_elements(root):
    """(first, end) octets of the [6] and [18] elements (SMS Initial DP's
    location information GPRS and GPRS MS class) in the message's Invoke
    argument."""
    cp = root.kid(0x6C)
    if cp is None or not cp.kids or cp.kids[0].tag != 0xA1 or len(cp.kids[0].kids) < 3:
        return []
    return [(k.off, k.end) for k in cp.kids[0].kids[-1].kids if k.tag in (0xA6, 0xB2)]


def check(corpus, pdml, oracle, ours, parse_node, tcap_rules):
    """call_control.check over this module's corpus, payloads and values;
    what tshark shows inside the GPRS elements is compared by the GPRS
    suite, not here."""
    def outside(fields, hexmsg):
        skipped = _gprs_elements(parse_node(bytes.fromhex(hexmsg), 0))
        return [f for f in fields if not any(a <= f[3] < b for a, b in skipped)]
    pdml = [outside(p, h) for (_, h), p in zip(corpus, pdml)]
    return cc.check(corpus, pdml, oracle, ours, parse_node, tcap_rules, cc.argument_payload,
                    lambda group: int(group.split('/')[0]), ROWS, FLAGGING_PAYLOAD_RULES)


def report(stats, show, complete=True):
    return cc.report(stats, show, complete, ROWS, RULE_TEXT, 'SMS arguments')
