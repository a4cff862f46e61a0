"""Charging, call gap and announcement arguments, results and errors:
random messages, their values as tshark shows them, and the same values as
dpx-decode reports them.

Used by oracle_compare.py beside call_control.py, whose normalisers,
extractors, value comparison and coverage check it shares.  The corpus
holds, per operation 34, 35, 36, 41, 46, 47, 48, 49 and 97, messages with
random argument values; per result operation code (55, 70, 72, 76, 80, 48
with a digits response, 32 with its result) Return Result (Last)
components; per error code (the 17 codes, with the parameter of 1, 10, 11
and 12) Return Error components.  The TCAP levels around them are definite
or indefinite; the argument, result and error parameter are definite.

The checked part of a message ("payload") is the Invoke's argument, the
Return Result's SEQUENCE, or the Return Error's error code and parameter.
"""

import random

import call_control as cc
from call_control import (choice, extensions, integer, leg, null, octets, one, repeat, some,
                          o_digits, o_num, t_int, t_octets, t_all_halves)


def _c():
    return cc._c()


# --------------------------------------------------------------------------
# Random values
# --------------------------------------------------------------------------
def int_in(*ranges):
    """INTEGER content: a random range of ranges, then a value in it."""
    return lambda rng: _c().int_content(rng.randint(*rng.choice(ranges)))


def boolean(rng):
    return bytes([rng.choice([0, 0xFF, rng.randint(1, 255)])])


def generic_digits(rng, schemes=(0, 1, 3)):
    """Generic Digits: type of digits (bits 5-1), encoding scheme (bits 8-6),
    BCD digits (low half first) or binary octets."""
    scheme = rng.choice(schemes)
    head = bytes([(scheme << 5) | rng.randint(0, 31)])
    if scheme in (0, 1):
        n = rng.randint(1, 8) * 2 - (scheme == 1)
        d = cc.digits(rng, n, n)
        return head + _c().bcd_isup(d)
    if scheme == 2:
        return head + bytes(rng.randint(0x30, 0x39) for _ in range(rng.randint(1, 8)))
    return head + octets(rng, 1, 8)


SIDE = one(1, 2)
SENDING = leg(0)
BURST = some((
    (.6, '80', int_in((1, 3))), (.6, '81', int_in((1, 127), (1, 127), (128, 1200))),
    (.6, '82', int_in((1, 3))),
    (.6, '83', int_in((1, 20))), (.6, '84', int_in((1, 20))),
))
AUDIBLE_INDICATOR = choice((
    (1, '01', boolean),
    (1, 'A1', some(((.6, '80', int_in((1, 127), (128, 1200))), (1, 'A1', BURST)))),
))
# maxCallPeriodDuration 1..864000, tariffSwitchInterval 1..86400
TIME_DURATION_CHARGING = some((
    (1, '80', int_in((1, 127), (128, 32767), (32768, 864000))),
    (.6, '81', boolean),
    (.5, '82', int_in((1, 127), (128, 86400))),
    (.4, 'A3', AUDIBLE_INDICATOR),
    (.1, 'A4', extensions),
))
# AChChargingAddress: legID [2] or srfConnection [50]
CHARGING_ADDRESS = choice(((1, 'A2', leg(None)), (1, '9F32', integer(1, 127))))
APPLY_CHARGING = some((
    (1, '80', lambda rng: _c().tlv(0xA0, TIME_DURATION_CHARGING(rng))),
    (.7, 'A2', SENDING), (.1, 'A3', extensions), (.3, 'BF32', CHARGING_ADDRESS),
))
TIME_VALUE = int_in((0, 127), (128, 32767), (32768, 864000))
TIME_INFORMATION = choice((
    (1, '80', TIME_VALUE),
    (1, 'A1', some(((1, '80', TIME_VALUE), (.6, '81', int_in((1, 86400)))))),
))
CALL_RESULT = some((
    (1, 'A0', some((
        (1, 'A0', leg(1)), (1, 'A1', TIME_INFORMATION), (.7, '82', boolean),
        (.3, '83', null), (.1, 'A4', extensions), (.3, 'A5', CHARGING_ADDRESS),
    ))),
))
FCI = some((
    (1, 'A0', some((
        (1, '80', lambda rng: octets(rng, 1, rng.choice((8, 40, 52, 160)))),
        (.6, 'A1', SENDING), (.5, '82', one(0, 1)),
    ))),
))
SERVICE_KEY = lambda rng: _c().int_content(rng.choice([rng.randint(0, 255),
                                                       rng.randint(0, 2 ** 31 - 1)]))
GENERIC_NUMBER = cc.generic_number
BASIC_GAP_CRITERIA = choice((
    (4, '80', GENERIC_NUMBER),
    (3, 'A2', some(((1, '80', SERVICE_KEY),))),
    (2, 'BD', some(((1, '80', GENERIC_NUMBER), (1, '81', SERVICE_KEY)))),
    (2, 'BE', some(((1, '80', GENERIC_NUMBER), (1, '81', SERVICE_KEY)))),
))
VARIABLE_PART = choice((
    (1, '80', int_in((0, 127), (128, 2 ** 31 - 1))),
    (1, '81', generic_digits),
    (1, '82', lambda rng: bytes([rng.randint(0, 0x23), rng.randint(0, 0x59)])),
    (1, '83', lambda rng: octets(rng, 4, 4)),
    (1, '84', lambda rng: octets(rng, 4, 4)),
))
MESSAGE_ID = choice((
    (4, '80', int_in((0, 127), (128, 2 ** 31 - 1))),
    (2, 'A1', some(((1, '80', lambda rng: bytes(rng.randint(0x20, 0x7E)
                                                 for _ in range(rng.randint(1, 30)))),
                    (.5, '81', lambda rng: octets(rng, 1, 2))))),
    (2, 'BD', repeat('02', int_in((0, 127), (128, 2 ** 31 - 1)), 1, 4)),
    (2, 'BE', some(((1, '80', int_in((0, 127), (128, 2 ** 31 - 1))),
                    (1, 'A1', lambda rng: b''.join(VARIABLE_PART(rng)
                                                   for _ in range(rng.randint(1, 5))))))),
))
INFORMATION_TO_SEND = choice((
    (3, 'A0', some(((1, 'A0', MESSAGE_ID), (.6, '81', int_in((1, 127))),
                    (.5, '82', int_in((0, 127), (128, 32767))),
                    (.5, '83', int_in((0, 127), (128, 32767)))))),
    (1, 'A1', some(((1, '80', int_in((0, 127), (128, 2 ** 31 - 1))),
                    (.5, '81', int_in((0, 127), (128, 2 ** 31 - 1)))))),
))
# duration -2..86400, gapInterval -1..60000 (our interval: two octets)
COMPOUND_GAP_CRITERIA = some((
    (1, 'A0', BASIC_GAP_CRITERIA), (.5, '81', lambda rng: octets(rng, 1, 4))))


def gap_criteria(rng):
    """GapCriteria: a basic criterion, or the compound one (30)."""
    if rng.random() < .8:
        return BASIC_GAP_CRITERIA(rng)
    return _c().tlv(0x30, COMPOUND_GAP_CRITERIA(rng))



CALL_GAP = some((
    (1, 'A0', gap_criteria),
    (1, 'A1', some(((1, '80', int_in((-2, 127), (128, 86400))),
                    (1, '81', int_in((-1, 127), (128, 32767), (32768, 60000)))))),
    (.4, '82', one(0, 1)),
    (.5, 'A3', choice(((1, 'A0', INFORMATION_TO_SEND), (1, '81', cc.cause)))),
    (.1, 'A4', extensions),
))
CAI = some([(.8, '%02X' % (0x80 + i), int_in((0, 127), (128, 8191))) for i in range(7)])
AOC_SUBSEQUENT = some(((1, 'A0', CAI), (.5, '81', int_in((1, 86400)))))
SEND_CHARGING_INFORMATION = some((
    (1, '80', choice(((1, 'A0', some(((1, 'A0', CAI), (.5, 'A1', AOC_SUBSEQUENT)))),
                      (1, 'A1', AOC_SUBSEQUENT)))),
    (1, 'A1', SENDING), (.1, 'A2', extensions),
))
PLAY_ANNOUNCEMENT = some((
    (1, 'A0', INFORMATION_TO_SEND), (.6, '81', boolean), (.6, '82', boolean),
    (.1, 'A3', extensions), (.3, '85', integer(1, 127)), (.3, '9F33', boolean),
))
COLLECTED_DIGITS = some((
    (.6, '80', int_in((1, 30))), (1, '81', int_in((1, 30))),
    (.3, '82', lambda rng: octets(rng, 1, 2)), (.3, '83', lambda rng: octets(rng, 1, 2)),
    (.3, '84', lambda rng: octets(rng, 1, 2)), (.4, '85', int_in((1, 127))),
    (.4, '86', int_in((1, 127))), (.3, '87', one(0, 1, 2)), (.3, '88', boolean),
    (.3, '89', boolean), (.3, '8A', boolean),
))
PROMPT_AND_COLLECT = some((
    (1, 'A0', some(((1, 'A0', COLLECTED_DIGITS),))), (.6, '81', boolean),
    (.6, 'A2', INFORMATION_TO_SEND), (.1, 'A3', extensions), (.3, '84', integer(1, 127)),
    (.3, '9F33', boolean),
))
SPECIALIZED_RESOURCE_REPORT = choice(((1, '9F32', null), (1, '9F33', null)))
# Phases 2 and 3 send a plain NULL instead, in their own SRF dialogues.
PLAIN_NULL = bytes.fromhex('0500')
PLAY_TONE = some((
    (1, 'A0', choice(((1, '80', integer(1, 127)), (2, 'A1', leg(None))))),
    (1, 'A1', BURST), (.1, 'A2', extensions),
))

# opcode -> (capgen operation giving the application context, outer
# identifier of the argument or None for an untagged choice, contents)
OPERATIONS = {
    34: ('furnishChargingInformation', '04', FCI),
    35: ('applyCharging', '30', APPLY_CHARGING),
    36: ('applyChargingReport', '04', CALL_RESULT),
    41: ('callGap', '30', CALL_GAP),
    46: ('sendChargingInformation', '30', SEND_CHARGING_INFORMATION),
    47: ('playAnnouncement', '30', PLAY_ANNOUNCEMENT),
    48: ('promptAndCollectUserInformation', '30', PROMPT_AND_COLLECT),
    49: ('specializedResourceReport', None, SPECIALIZED_RESOURCE_REPORT),
    97: ('playTone', '30', PLAY_TONE),
}

# Results: operation code -> what follows it in the result SEQUENCE.
RESULTS = {
    55: lambda rng: b'', 70: lambda rng: b'', 72: lambda rng: b'', 76: lambda rng: b'',
    80: lambda rng: b'',
    48: lambda rng: _c().ctx(0, generic_digits(rng)),
    32: lambda rng: _c().seq(some((
        (.7, '80', lambda rng: bytes([rng.randint(0, 7)]) + bytes([rng.choice([0x80, 0xC0,
                                                                               0xE0, 0xF0])])),
        (.6, '81', lambda rng: bytes([rng.randint(0, 7)]) + octets(rng, 1, 2)),
        (.1, 'A2', extensions), (.2, '83', null)))(rng)),
}


CONTENTS = '%d operations, %d result operation codes, every error code' % (
    len(OPERATIONS), len(RESULTS))


def _error_parameter(code, rng):
    """The parameter of the errors that carry one: Cancel Failed's problem
    and invoke id, the requested-info error, the unavailable network
    resource, the task-refused reason."""
    c = _c()
    if code == 1:
        return c.seq(c.cint(0, rng.randint(0, 2)), c.cint(1, rng.randint(-128, 127)))
    if code == 10:
        return c.enumerated(rng.randint(1, 2))
    if code == 11:
        return c.enumerated(rng.randint(0, 6))
    if code == 12:
        return c.enumerated(rng.randint(0, 2))
    return b''


def error_codes():
    """The 17 error codes."""
    return sorted(_c().ERRORS.values())


# --------------------------------------------------------------------------
# Corpus
# --------------------------------------------------------------------------
PARTS = ('ext', 'asn1', 'pdu', 'cp', 'comp')


def _indef(i, rng, parts=PARTS):
    """Length forms of message i: even ones definite; odd ones indefinite
    (all parts in one of eight, dialogue and component portion in another,
    a random choice of the other parts otherwise)."""
    if i % 2 == 0:
        return False
    if i % 16 == 1:
        return set(parts) | {'msg', 'dlg'}
    if i % 16 == 3:
        return {'dlg', 'cp'}
    return set(rng.sample(parts, rng.randint(1, len(parts))))


def _wrap(rng, component, acn, indef, kinds):
    """One component in a random message of one of kinds, with or without a
    dialogue portion."""
    c = _c()
    msg = rng.choice(kinds)
    dlg = None
    if rng.random() < .6:
        pdu = 'audt' if msg == 'unidirectional' else ('aarq' if msg == 'begin' else 'aare')
        dlg = c.dialogue_portion(pdu, acn, indef=indef)
    otid, dtid = rng.getrandbits(32), rng.getrandbits(32)
    if msg == 'begin':
        m = c.tcap_begin(otid, dlg, [component], indef)
    elif msg == 'continue':
        m = c.tcap_continue(otid, dtid, dlg, [component], indef)
    elif msg == 'end':
        m = c.tcap_end(dtid, dlg, [component], indef)
    else:
        m = c.tcap_unidirectional([component], dlg, indef)
    return c.hx(m)


def build_corpus(per_op, seed):
    """-> [(group, hex)]; group 'op N/...', 'result N/...' or 'error N/...'."""
    c = _c()
    out = []
    everywhere = ('begin', 'continue', 'end', 'unidirectional')
    for code, (name, outer, build) in sorted(OPERATIONS.items()):
        rng = random.Random(seed * 1000 + code)
        for i in range(per_op):
            indef = _indef(i, rng)
            content = build(rng)
            arg = content if outer is None else c.tlv(bytes.fromhex(outer), content)
            phase = 4
            if code == 49 and i % 3 == 0:
                arg, phase = PLAIN_NULL, 2 + i // 3 % 2
            comp = c.invoke(rng.randint(-128, 127), code, arg, indef=indef)
            out.append(('op %d/%s' % (code, 'indefinite' if indef else 'definite'),
                        _wrap(rng, comp, c.default_acn(name, phase), indef,
                              everywhere)))
    for code, build in sorted(RESULTS.items()):
        rng = random.Random(seed * 1000 + 300 + code)
        for i in range(per_op):
            indef = _indef(i, rng, PARTS + ('seq',))
            comp = c.return_result(rng.randint(-128, 127), code, build(rng), indef=indef)
            out.append(('result %d/%s' % (code, 'indefinite' if indef else 'definite'),
                        _wrap(rng, comp, c.default_acn(c.OPCODES.get(code, 'initialDP'), 4),
                              indef, ('continue', 'end'))))
    for code in error_codes():
        rng = random.Random(seed * 1000 + 500 + code)
        for i in range(per_op):
            indef = _indef(i, rng)
            comp = c.return_error(rng.randint(-128, 127), code, _error_parameter(code, rng),
                                  indef=indef)
            out.append(('error %d/%s' % (code, 'indefinite' if indef else 'definite'),
                        _wrap(rng, comp, c.default_acn('applyCharging', 4), indef,
                              ('continue', 'end'))))
    return out


# --------------------------------------------------------------------------
# Normalisers (beside call_control's)
# --------------------------------------------------------------------------
def t_bool(show, raw, off, size, data):
    return int(show, 0) != 0, None


def o_bool(f):
    return o_num(f) != 0


def t_signed_octets(show, raw, off, size, data):
    """A value our decoder shows as its content octets (hexadecimal): the
    octets read as one unsigned number."""
    return int.from_bytes(data[off:off + size], 'big'), None


def t_gap_interval(show, raw, off, size, data):
    """Gap interval: our decoder reads at most two octets; 32768-60000 take
    three in BER (00 8x xx): ours shows the first two and the third is left
    over (flag 0x10)."""
    if size > 2:
        return int.from_bytes(data[off:off + 2], 'big'), 'gap-interval-two-octets'
    return int.from_bytes(data[off:off + size], 'big'), None



def t_free_format_data(show, raw, off, size, data):
    """Free format data: at most 52 octets shown, the rest (up to 160 in
    CAP v3 and v4) is left over (flag 0x10)."""
    if size > 52:
        return data[off:off + 52].hex(), 'free-format-data-52-octets'
    return data[off:off + size].hex(), None


def t_generic_digits(show, raw, off, size, data):
    """Generic Digits as tshark shows them (all octets, the type-of-digits
    octet first): BCD digits low half first, every half-octet (an odd count
    ends with the filler), or the binary octets in hexadecimal."""
    b = data[off:off + size]
    if b[0] >> 5 in (0, 1):
        return cc.nibbles(b[1:]), None
    return b[1:].hex(), None


def t_scheme(show, raw, off, size, data):
    return data[off] >> 5, None


def t_type_of_digits(show, raw, off, size, data):
    return data[off] & 31, None


def t_year(show, raw, off, size, data):
    return int.from_bytes(data[off:off + 2], 'big'), None


def t_int_octets(show, raw, off, size, data):
    """An integer our decoder shows from its content octets, unsigned."""
    return int.from_bytes(data[off:off + size], 'big'), None


# --------------------------------------------------------------------------
# The compared values (rows as in call_control.VALUES)
# --------------------------------------------------------------------------
GAP_ADDRESS = ('camel.calledAddressValue', 'camel.callingAddressValue')
VALUES = (
    # Apply Charging
    ('max call period duration', None, ('camel.maxCallPeriodDuration',), (1389,), t_int, o_num),
    ('release if duration exceeded', None, ('camel.releaseIfdurationExceeded',), (1392,), t_bool,
     o_bool),
    ('tariff switch interval', None, ('camel.tariffSwitchInterval',), (1396,), t_int, o_num),
    ('warning tone', None, ('camel.tone',), (4237,), t_bool, o_bool),
    ('warning period', None, ('camel.warningPeriod',), (4243,), t_int, o_num),
    ('burst: number of bursts', None, ('camel.numberOfBursts',), (4254,), t_int, o_num),
    ('burst: interval', None, ('camel.burstInterval',), (4257,), t_int, o_num),
    ('burst: tones in burst', None, ('camel.numberOfTonesInBurst',), (4260,), t_int,
     o_num),
    ('burst: tone duration', ('camel.bursts_element', 'camel.PlayToneArg_element'),
     ('camel.toneDuration',), (4263,), t_int, o_num),
    ('burst: tone interval', None, ('camel.toneInterval',), (4266,), t_int, o_num),
    # Apply Charging Report
    ('time if no tariff switch', None, ('camel.timeIfNoTariffSwitch',), (1415,), t_int, o_num),
    ('time since tariff switch', None, ('camel.timeSinceTariffSwitch',), (1420,), t_int, o_num),
    ('call active', None, ('camel.legActive',), (1423,), t_bool, o_bool),
    # Furnish / Send Charging Information
    ('free format data', None, ('camel.freeFormatData',), (2188,), t_free_format_data,
     o_digits),
    ('append free format data', None, ('camel.appendFreeFormatData',), (2191,), t_int, o_num),
    ('AOC: E1-E7', None, tuple('camel.e%d' % n for n in range(1, 8)),
     tuple(1283 + 3 * n for n in range(7)), t_int, o_num),
    # Call Gap
    ('gap criteria: address digits', GAP_ADDRESS, ('isup.generic_number',), (1663,),
     t_all_halves, o_digits),
    ('service key', None, ('camel.serviceKey',), (1611,), t_int, o_num),
    ('gap duration', None, ('camel.gapIndicatorsDuration',), (1466,), t_int_octets, o_num),
    ('gap interval', None, ('camel.gapInterval',), (1463,), t_gap_interval, o_num),
    ('control type', None, ('camel.controlType',), (1469,), t_int, o_num),
    # Information To Send
    ('elementary message id', None, ('camel.elementaryMessageID',), (1335,), t_int, o_num),
    ('elementary message ids', None, ('camel.Integer4',), (1349,), t_int, o_num),
    ('message content', None, ('camel.messageContent',), (1341,), t_octets, o_digits),
    ('message attributes', None, ('camel.attributes',), (1344,), t_octets, o_digits),
    ('number of repetitions', None, ('camel.numberOfRepetitions',), (1322,), t_int, o_num),
    ('inband duration', None, ('camel.inbandInfoDuration',), (1325,), t_int, o_num),
    ('inband interval', None, ('camel.interval',), (1328,), t_int, o_num),
    ('tone id', None, ('camel.toneID',), (1311,), t_int_octets, o_num),
    ('tone duration', ('camel.tone_element',), ('camel.toneDuration',), (1314,), t_int, o_num),
    ('variable part: integer', None, ('camel.integer',), (1359,), t_int, o_num),
    ('variable part: number type of digits', ('camel.number',), ('isup.generic_digits',),
     (1649,), t_type_of_digits, o_num),
    ('variable part: number digits', ('camel.number',), ('isup.generic_digits',),
     (3539, 3551), t_generic_digits, o_digits),
    ('variable part: time hour', None, ('camel.time',), (1362,), cc.t_octet_at(0), o_num),
    ('variable part: time minute', None, ('camel.time',), (1363,), cc.t_octet_at(1), o_num),
    ('variable part: date year', None, ('camel.date',), (1366,), t_year, o_num),
    ('variable part: date month', None, ('camel.date',), (1367,), cc.t_octet_at(2), o_num),
    ('variable part: date day', None, ('camel.date',), (1368,), cc.t_octet_at(3), o_num),
    ('variable part: price', None, ('camel.price',), (1371,), t_octets, o_digits),
    ('call segment id', None, ('camel.callSegmentID', 'camel.srfConnection'), (4181,),
     t_octets, o_digits),
    # Play Announcement and Prompt And Collect: flags and collected digits
    ('disconnect from IP forbidden', None, ('camel.disconnectFromIPForbidden',), (1835,),
     t_bool, o_bool),
    ('request announcement complete', None, ('camel.requestAnnouncementCompleteNotification',),
     (1839,), t_bool, o_bool),
    ('request announcement started', None, ('camel.requestAnnouncementStartedNotification',),
     (4237,), t_bool, o_bool),
) + tuple((name, None, ('camel.' + tname,), (fid,), norm, extract)
          for name, tname, fid, norm, extract in (
    ('collected digits: minimum', 'minimumNbOfDigits', 1863, t_int, o_num),
    ('collected digits: maximum', 'maximumNbOfDigits', 1866, t_int, o_num),
    ('collected digits: end of reply digit', 'endOfReplyDigit', 1869, t_int_octets, o_num),
    ('collected digits: cancel digit', 'cancelDigit', 1872, t_int_octets, o_num),
    ('collected digits: start digit', 'startDigit', 1875, t_int_octets, o_num),
    ('collected digits: first digit time-out', 'firstDigitTimeOut', 1878, t_int, o_num),
    ('collected digits: inter-digit time-out', 'interDigitTimeOut', 1881, t_int, o_num),
    ('collected digits: error treatment', 'errorTreatment', 1884, t_int, o_num),
    ('collected digits: interruptable announcement', 'interruptableAnnInd', 1887, t_bool,
     o_bool),
    ('collected digits: voice information', 'voiceInformation', 1891, t_bool, o_bool),
    ('collected digits: voice back', 'voiceBack', 1895, t_bool, o_bool),
)) + (
    # Results
    ('digits response: type of digits', ('camel.digitsResponse',), ('isup.generic_digits',),
     (1647,), t_type_of_digits, o_num),
    ('digits response: digits', ('camel.digitsResponse',), ('isup.generic_digits',),
     (3536, 3548), t_generic_digits, o_digits),
    ('initiate call attempt: supported CAMEL phases', None, ('camel.supportedCamelPhases',),
     (4192,), cc.t_bit_string, o_digits, -1),
    ('initiate call attempt: offered CAMEL4 functionalities', None,
     ('camel.offeredCamel4Functionalities',), (4195,), cc.t_bit_string, o_digits, -1),
    # Errors
    ('cancel failed: problem', None, ('camel.problem',), (1924,), t_int, o_num),
    ('cancel failed: operation', None, ('camel.operation',), (1927,), cc.t_int8, o_num),
    ('requested info error', None, ('camel.PAR_requestedInfoError',), (1930,), t_int, o_num),
    ('system failure: unavailable network resource', None,
     ('camel.UnavailableNetworkResource',), (1934,), t_int, o_num),
    ('task refused', None, ('camel.PAR_taskRefused',), (1937,), t_int, o_num),
) + tuple(r for r in cc.VALUES if r[0] in (
    'leg id: sending side', 'leg id: receiving side', 'leg id: side value', 'cause value',
    'cause location')) + tuple(
    # the gap criteria's Generic Numbers: call_control's generic number
    # attributes, inside the gap criteria's address elements
    ('gap criteria: address %s' % attr, GAP_ADDRESS, tnames, (fid,), t_int, o_num)
    for number, _, _, _, _, fids in cc.NUMBERS if number == 'generic number'
    for (attr, tnames), fid in zip(cc.NUMBER_ATTRIBUTES, fids) if fid)

RULE_TEXT = dict(cc.RULE_TEXT, **{
    'gap-interval-two-octets': 'gap interval read from at most two octets: 32768-60000 (BER '
                               '00 8x xx) show the first two, the third is left over '
                               '(flag 0x10)',
    'component-indefinite': 'TCAP: an indefinite Return Result or Return Error\'s '
                            'end-of-contents is not read (flag 0x10)',
    'free-format-data-52-octets': 'free format data shows at most 52 octets; the rest of a '
                                  'longer one (CAP v3/v4: up to 160) is left over (flag 0x10)',
    'call-attempt-result-three-members': 'Initiate Call Attempt result: a loop of three members '
                                         '(phases, functionalities, extensions); '
                                         'releaseCallArgExtensionAllowed [3] is stepped over '
                                         '(flag 0x10)',
    'result-sequence-indefinite': 'indefinite result SEQUENCE: one end-of-contents check '
                                  'before the operation code, none after the result, so its '
                                  'end-of-contents is left over (flag 0x10)',
})
# Rules inside the payload that leave octets of a valid encoding unread,
# and the error flags they raise.
FLAGGING_PAYLOAD_RULES = {'gap-interval-two-octets': 0x10, 'result-sequence-indefinite': 0x10,
                         'free-format-data-52-octets': 0x10,
                         'call-attempt-result-three-members': 0x10}

ROWS = [cc._row(r) for r in VALUES]


def payload(root, stats, hexmsg):
    """(first, end, rule names) of the checked octets of the message's
    component: an Invoke's argument, a Return Result's SEQUENCE, a Return
    Error's code and parameter; None if the message holds none."""
    cp = root.kid(0x6C)
    if cp is None or not cp.kids:
        return None
    comp = cp.kids[0]
    first = 2 if comp.tag == 0xA1 else 1
    if comp.tag not in (0xA1, 0xA2, 0xA3) or len(comp.kids) <= first:
        return None
    notes = cc.tcap_payload_rules(root, comp)
    if comp.tag == 0xA2:
        result = comp.kids[1]
        if result.indef:
            notes.add('result-sequence-indefinite')
        if len(result.kids) > 1 and any(k.tag == 0x83 for k in result.kids[1].kids):
            stats.rule('call-attempt-result-three-members', hexmsg)
            notes.add('call-attempt-result-three-members')
    return comp.kids[-1 if comp.tag == 0xA1 else 1].off, comp.kids[-1].end, notes


def check(corpus, pdml, oracle, ours, parse_node, tcap_rules):
    """call_control.check over this module's corpus, payloads and values."""
    return cc.check(corpus, pdml, oracle, ours, parse_node, tcap_rules, payload,
                    lambda group: group.split('/')[0], ROWS, FLAGGING_PAYLOAD_RULES)


def report(stats, show, complete=True):
    return cc.report(stats, show, complete, ROWS, RULE_TEXT,
                     'charging, call gap and announcement arguments, results and errors')
