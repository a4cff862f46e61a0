"""Call-control arguments: random messages, their values as tshark shows them,
and the same values as dpx-decode reports them.

Used by oracle_compare.py.  For every call-control operation the corpus holds
messages with random argument values (every optional element present or not,
random number formats, causes, legs, locations, times); the argument itself
is always definite, the TCAP levels around it definite or indefinite.

Two checks run over them:

* values: tshark's PDML gives every shown field with its octet position;
  VALUES (a data table) says which of our decoded-field ids show the same
  value, and how each side's value is normalised.  A tshark field is paired
  with our field of a listed id that lies in the same octets, so a value is
  compared with the one that comes from the same bits.
* coverage: every message of these operations decodes in the four passes
  with result 1, no error flag and no bits left over, and every octet of the
  argument (the Invoke's last element) lies in the bit span of a reported
  field.

Where our decoder's rules make a value differ from tshark's, the expected
value is tshark's adjusted by the rule; every rule applied is counted.
"""

import random
import xml.etree.ElementTree as ET

# --------------------------------------------------------------------------
# Random arguments of the call-control operations (OPERATIONS below).
# --------------------------------------------------------------------------


def _c():
    import capgen  # found at run time (the reference tools folder)
    return capgen


def digits(rng, lo, hi):
    # tshark's E.164 code trips on "883x": no 8 first (capgen does the same)
    return _c()._digits(rng, lo, hi)


def octets(rng, lo, hi):
    return bytes(rng.randrange(256) for _ in range(rng.randint(lo, hi)))


def one(*values):
    """Content of one octet chosen from values (a range: every value in it)."""
    pool = [v for x in values for v in (x if isinstance(x, range) else (x,))]
    return lambda rng: bytes([rng.choice(pool)])


def integer(lo, hi):
    return lambda rng: _c().int_content(rng.randint(lo, hi))


def null(rng):
    return b''


def nai(rng):
    return rng.choice([1, 2, 3, 4, rng.randint(0, 127)])


def isup_called(rng):
    """ISUP Called Party Number: random NAI, INN, numbering plan, digits."""
    c = _c()
    d = digits(rng, 1, 16)
    return bytes([c._oe(d) | nai(rng), (rng.randint(0, 1) << 7) | (rng.randint(0, 7) << 4)]) \
        + c.bcd_isup(d)


def isup_calling(rng):
    """Calling Party Number / Location Number / Charge Number layout."""
    c = _c()
    d = digits(rng, 2, 16)
    return bytes([c._oe(d) | nai(rng),
                  (rng.randint(0, 1) << 7) | (rng.randint(0, 7) << 4)
                  | (rng.choice([0, 0, 1, 3]) << 2) | rng.randint(0, 3)]) + c.bcd_isup(d)


def isup_original(rng):
    """Original Called / Redirecting number layout (no screening)."""
    c = _c()
    d = digits(rng, 1, 16)
    return bytes([c._oe(d) | nai(rng),
                  (rng.randint(0, 7) << 4) | (rng.choice([0, 0, 1, 3]) << 2)]) + c.bcd_isup(d)


def generic_number(rng, qualifier=None):
    q = rng.randint(0, 10) if qualifier is None else qualifier
    return bytes([q]) + isup_calling(rng)


def cause(rng):
    # coding standard mostly ITU-T: tshark shows location and value only then
    b = bytes([0x80 | (rng.choice([0, 0, 0, rng.randint(1, 3)]) << 5)
               | rng.choice([0, 1, 2, 3, 4, 5, 7, 10]), 0x80 | rng.randint(1, 127)])
    return b + (octets(rng, 1, 3) if rng.random() < .2 else b'')


def bearer_cap(rng):
    """Q.931 bearer capability: transfer capability and rate (multirate with
    its rate multiplier, octet 4.1), maybe layer 1."""
    rate = rng.choice([17, 19, 21, 23, 24])
    b = bytes([0x80 | rng.choice([0, 8, 9, 16, 17, 24]), 0x80 | rate])
    b += bytes([0x80 | rng.randint(2, 30)]) if rate == 24 else b''
    return b + (bytes([0xA0 | rng.choice([2, 3, 5])]) if rng.random() < .5 else b'')


def redirection_info(rng):
    return bytes([(rng.randint(0, 3) << 4) | rng.randint(0, 6),
                  (rng.randint(0, 6) << 4) | rng.randint(1, 5)])


def address_string(rng, lo=6, hi=15):
    return bytes([0x80 | (rng.randint(0, 7) << 4) | rng.choice([1, 1, 0, 3, 4, 6, 8, 9])]) \
        + _c().tbcd(digits(rng, lo, hi))


def bcd_number(rng):
    return address_string(rng, 1, 24)


def imsi(rng):
    mcc, mnc = rng.choice([('262', '01'), ('234', '15'), ('310', '410'), ('208', '10')])
    n = rng.choice([14, 15, 15]) - len(mcc) - len(mnc)
    return _c().tbcd(mcc + mnc + digits(rng, n, n))


def plmn_lac(rng):
    mcc = '%d%d%d' % (rng.randint(2, 7), rng.randint(0, 9), rng.randint(0, 9))
    mnc = '%02d' % rng.randint(0, 99) if rng.random() < .6 else '%03d' % rng.randint(0, 999)
    return _c().plmn(mcc, mnc) + rng.randint(0, 65535).to_bytes(2, 'big')


def cell_id(rng):
    return plmn_lac(rng) + rng.randint(0, 65535).to_bytes(2, 'big')


def time_and_timezone(rng):
    return _c().time_and_timezone(rng.randint(2000, 2030), rng.randint(1, 12),
                                  rng.randint(1, 28), rng.randint(0, 23), rng.randint(0, 59),
                                  rng.randint(0, 59), rng.randint(-47, 56))


def date_and_time(rng):
    return _c().date_and_time(rng.randint(2000, 2030), rng.randint(1, 12), rng.randint(1, 28),
                              rng.randint(0, 23), rng.randint(0, 59), rng.randint(0, 59))


def leg(side):
    """LegID (a CHOICE): sendingSideID [0] or receivingSideID [1]; side None:
    either."""
    def f(rng):
        s = rng.randint(0, 1) if side is None else side
        return _c().ctx(s, bytes([rng.choice([1, 2, rng.randint(1, 30)])]))
    return f


def service_key(rng):
    return _c().int_content(rng.choice([rng.randint(0, 255), rng.randint(0, 65535),
                                        rng.randint(0, 2 ** 31 - 1)]))


def extensions(rng):
    """ExtensionField list: local type, criticality, value [1]."""
    c = _c()
    return b''.join(c.seq(c.integer(rng.randint(0, 127)), c.tlv(0x0A, bytes([rng.randint(0, 1)])),
                          c.ctxc(1, c.octets(octets(rng, 1, 4))))
                    for _ in range(rng.randint(1, 2)))


def some(rows):
    """Content of a SEQUENCE (or SET): rows of (probability, identifier,
    content builder), in ASN.1 order; each row present with its probability."""
    def f(rng):
        c = _c()
        return b''.join(c.tlv(bytes.fromhex(tag), build(rng)) for p, tag, build in rows
                        if rng.random() < p)
    return f


def choice(rows):
    """Content of a CHOICE: one of rows (weight, identifier, content builder)."""
    def f(rng):
        _, tag, build = rng.choices(rows, weights=[r[0] for r in rows])[0]
        return _c().tlv(bytes.fromhex(tag), build(rng))
    return f


def repeat(tag, build, lo, hi):
    def f(rng):
        return b''.join(_c().tlv(bytes.fromhex(tag), build(rng))
                        for _ in range(rng.randint(lo, hi)))
    return f


CS_ID = integer(1, 127)
SIDE = one(1, 2)
SERVICE_INTERACTION = some((
    (.4, 'A0', some(((1, '81', SIDE), (.5, '82', SIDE), (.5, '84', SIDE)))),
    (.3, 'A1', some(((1, '81', SIDE), (.5, '82', SIDE)))),
    (.4, '82', one(0, 1)),
    (.3, '84', one(range(4))),
    (.2, '8D', null),
    (.3, '9F32', SIDE), (.3, '9F33', SIDE), (.3, '9F34', SIDE),
))
CARRIER = (lambda rng: bytes([rng.randint(0, 4)]) + octets(rng, 3, 3))
CUG_INTERLOCK = (lambda rng: octets(rng, 4, 4))
ALERTING = (lambda rng: bytes([0, 0, rng.choice([0, 1, 2, 4, 5, 6, 7, 8, rng.randrange(256)])]))
CATEGORY = one(10, 11, 15, range(256))
EVENT_TYPE = one(2, 3, 4, 5, 6, 7, 9, 10, 12, 13, 14, 15, 17, 18)
CALLED_NUMBERS = repeat('04', isup_called, 1, 3)
GENERIC_NUMBERS = repeat('04', generic_number, 1, 2)
LOCATION_INFORMATION = some((
    (.6, '02', integer(0, 32767)),
    (.6, '81', address_string),
    (.2, '82', isup_calling),
    (.8, 'A3', choice(((9, '80', cell_id), (7, '81', plmn_lac)))),
    (.3, '86', address_string),
))
BASIC_SERVICE = choice(((1, '82', one(0x11, 0x12, 0x21, 0x10)), (1, '83', one(0x11, 0x12, 0x21))))
BEARER = some(((1, '80', bearer_cap),))
# The Initial DP argument extension as CAP v4 has it (its high layer
# compatibility [8] is left out: an OCTET STRING, primitive 88, where our
# decoder expects A8).
IDP_EXTENSION = some((
    (.6, '80', address_string), (.5, '81', isup_called), (.5, '82', lambda rng: b'\x53\x19\x92'),
    (.5, '83', lambda rng: _c().tbcd(digits(rng, 16, 16))),
    (.5, '84', lambda rng: bytes([4, rng.choice([0x80, 0xC0, 0xE0, 0xF0])])),
    (.3, '85', lambda rng: bytes([rng.randint(0, 7)]) + octets(rng, 1, 1)),
    (.5, 'A6', BEARER), (.4, 'A7', BASIC_SERVICE),
    (.3, '89', lambda rng: b'\x88\x90'), (.2, '8A', lambda rng: b'\x88\x90\xa2'),
))

# --- arguments: outer identifier (None: the choice itself) and contents,
# in the ASN.1 order of each type ------------------------------------------
INITIAL_DP = some((
    (1, '80', service_key), (.9, '82', isup_called), (.9, '83', isup_calling),
    (.7, '85', CATEGORY), (.2, '87', one(range(8))), (.2, '88', one(range(256))),
    (.4, '8A', isup_calling), (.4, '8C', isup_original), (.2, 'AF', extensions),
    (.2, '97', lambda rng: bytes([0x91, rng.choice([0x81, 0x84, 0xA1])])),
    (.3, '99', lambda rng: generic_number(rng, 6)), (.5, 'BB', BEARER),
    (.8, '9C', EVENT_TYPE), (.3, '9D', isup_original), (.3, '9E', redirection_info),
    (.3, '91', cause), (.2, 'BF20', SERVICE_INTERACTION), (.2, '9F25', CARRIER),
    (.2, '9F2D', integer(0, 32767)), (.2, '9F2E', CUG_INTERLOCK), (.1, '9F2F', null),
    (.8, '9F32', imsi),
    (.3, 'BF33', choice(((1, '80', null), (1, '81', null), (1, '82', null),
                         (1, '0A', one(range(4)))))),
    (.7, 'BF34', LOCATION_INFORMATION), (.5, 'BF35', BASIC_SERVICE),
    (.5, '9F36', lambda rng: octets(rng, 1, 8)), (.6, '9F37', address_string),
    (.4, '9F38', bcd_number), (.5, '9F39', time_and_timezone), (.1, '9F3A', null),
    (.4, 'BF3B', IDP_EXTENSION),
))
ASSIST_REQUEST_INSTRUCTIONS = some((
    (1, '80', generic_number), (1, '82', one(range(256))), (.2, 'A3', extensions)))
ESTABLISH_TEMPORARY_CONNECTION = some((
    (1, '80', generic_number), (.6, '81', generic_number),
    (.3, '83', lambda rng: octets(rng, 1, 4)), (.2, 'A4', extensions), (.2, '85', CARRIER),
    (.2, 'A6', SERVICE_INTERACTION), (.2, '9F32', one(range(256))), (.4, '9F33', isup_calling),
))
RESOURCE_ADDRESS = choice(((6, '80', isup_called), (4, '83', null)))
CONNECT_TO_RESOURCE = (lambda rng: RESOURCE_ADDRESS(rng) + CONNECT_TO_RESOURCE_REST(rng))
CONNECT_TO_RESOURCE_REST = some((
    (.2, 'A4', extensions),
    (.2, 'A7', SERVICE_INTERACTION), (.3, '9F32', CS_ID),
))
CONNECT = some((
    (1, 'A0', CALLED_NUMBERS), (.2, '81', ALERTING), (.4, '86', isup_original),
    (.2, 'AA', extensions), (.2, '8B', CARRIER), (.4, '9C', CATEGORY), (.3, '9D', isup_original),
    (.3, '9E', redirection_info), (.3, 'AE', GENERIC_NUMBERS), (.2, 'AF', SERVICE_INTERACTION),
    (.4, '93', isup_calling), (.2, '9F1F', CUG_INTERLOCK), (.1, '9F20', null),
    (.2, '9F37', null), (.2, '9F38', null), (.2, '9F39', one(range(256))), (.1, '9F3A', null),
))
BCSM_EVENT = some((
    (1, '80', EVENT_TYPE), (1, '81', one(0, 1, 2)), (.7, 'A2', leg(0)),
    (.2, 'BE', some(((1, '81', integer(0, 2047)),))), (.1, '9F32', null),
))
REQUEST_REPORT_BCSM_EVENT = some((
    (1, 'A0', repeat('30', BCSM_EVENT, 1, 4)), (.2, 'A2', extensions)))


def event_report_bcsm(rng):
    """Event type and, for most types, its event-specific information."""
    c = _c()
    et = rng.choice((2, 3, 4, 5, 6, 7, 9, 10, 12, 13, 14, 15, 17, 18))
    b = c.cint(0, et)
    # event type -> identifier of its specific information and its contents
    specific = {4: ('A2', some(((.8, '80', cause),))), 5: ('A3', some(((.8, '80', cause),))),
                6: ('A4', null), 7: ('A5', some(((.5, '9F32', isup_called),))),
                9: ('A7', some(((.8, '80', cause),))),
                13: ('A8', some(((.8, '80', cause), (.3, '9F32', null)))),
                14: ('A9', some(((.3, '9F32', null),))),
                15: ('AA', some(((.5, '9F32', isup_called),))),
                17: ('AC', some(((.8, '80', cause),)))}
    if et in specific and rng.random() < .8:
        tag, build = specific[et]
        b += c.ctxc(2, c.tlv(bytes.fromhex(tag), build(rng)))
    return b + some(((.7, 'A3', leg(1)), (.7, 'A4', some(((1, '80', one(0, 1)),)))))(rng)


INITIATE_CALL_ATTEMPT = some((
    (1, 'A0', CALLED_NUMBERS), (.2, 'A4', extensions), (.5, 'A5', leg(0)), (.4, '86', CS_ID),
    (.6, '9E', isup_calling), (.4, '9F33', lambda rng: octets(rng, 1, 8)),
    (.4, '9F34', address_string), (.2, '9F35', null),
))
RESET_TIMER = some((
    (1, '80', one(0)), (1, '81', lambda rng: _c().int_content(
        rng.choice([rng.randint(0, 255), rng.randint(0, 2 ** 31 - 1)]))),
    (.2, 'A2', extensions), (.3, '83', CS_ID),
))


def requested_information(rng):
    c = _c()
    values = {0: ('80', integer(0, 255)), 1: ('81', date_and_time),
              2: ('82', integer(0, 2 ** 31 - 1)), 30: ('9E', cause)}
    items = []
    for t in rng.sample(sorted(values), rng.randint(1, 4)):
        tag, build = values[t]
        items.append(c.seq(c.cint(0, t), c.ctxc(1, c.tlv(bytes.fromhex(tag), build(rng)))))
    return b''.join(items)


CALL_INFORMATION_REPORT = some((
    (1, 'A0', requested_information), (.2, 'A2', extensions), (.7, 'A3', leg(1))))
CALL_INFORMATION_REQUEST = some((
    (1, 'A0', lambda rng: b''.join(_c().enumerated(t) for t in rng.sample([0, 1, 2, 30],
                                                                         rng.randint(1, 4)))),
    (.2, 'A2', extensions), (.7, 'A3', leg(0)),
))
CANCEL = choice(((6, '80', lambda rng: _c().int_content(rng.randint(-128, 127))), (4, '81', null)))
CONTINUE_WITH_ARGUMENT = some((
    (.2, '81', ALERTING), (.2, 'A6', extensions), (.2, 'A7', SERVICE_INTERACTION),
    (.5, '8C', CATEGORY), (.3, 'B0', GENERIC_NUMBERS), (.2, '91', CUG_INTERLOCK),
    (.1, '92', null), (.4, '9F32', isup_calling), (.2, '9F34', CARRIER), (.3, '9F37', null),
    (.2, '9F38', one(range(256))), (.1, '9F39', null), (.1, '9F3A', null),
    (.3, 'BF3B', some(((.4, '80', null), (.4, '81', null), (.4, '82', null),
                       (.6, 'A3', choice(((1, '80', CS_ID), (1, 'A1', leg(None)))))))),
))
DFC_WITH_ARGUMENT = some(((.7, '81', CS_ID), (.3, 'A2', extensions)))
DISCONNECT_LEG = some(((1, 'A0', leg(None)), (.6, '81', cause), (.2, 'A2', extensions)))
MOVE_LEG = some(((1, 'A0', leg(None)), (.2, 'A2', extensions)))
SPLIT_LEG = some(((1, 'A0', leg(None)), (.6, '81', CS_ID), (.2, 'A2', extensions)))
# callSegmentFailure [0] { callSegmentID [0], cause [2] } or
# bCSM-Failure [1] { legID [0], cause [2] }
ENTITY_RELEASED = choice((
    (1, 'A0', some(((.8, '80', CS_ID), (.8, '82', cause)))),
    (1, 'A1', some(((.8, 'A0', leg(None)), (.8, '82', cause)))),
))

# opcode -> (capgen operation giving the application context, outer
# identifier of the argument or None for an untagged choice, contents)
OPERATIONS = {
    0: ('initialDP', '30', INITIAL_DP),
    16: ('assistRequestInstructions', '30', ASSIST_REQUEST_INSTRUCTIONS),
    17: ('establishTemporaryConnection', '30', ESTABLISH_TEMPORARY_CONNECTION),
    19: ('connectToResource', '30', CONNECT_TO_RESOURCE),
    20: ('connect', '30', CONNECT),
    22: ('releaseCall', '04', cause),
    23: ('requestReportBCSMEvent', '30', REQUEST_REPORT_BCSM_EVENT),
    24: ('eventReportBCSM', '30', event_report_bcsm),
    32: ('initiateCallAttempt', '30', INITIATE_CALL_ATTEMPT),
    33: ('resetTimer', '30', RESET_TIMER),
    44: ('callInformationReport', '30', CALL_INFORMATION_REPORT),
    45: ('callInformationRequest', '30', CALL_INFORMATION_REQUEST),
    53: ('cancel', None, CANCEL),
    56: ('continueWithArgument', '30', CONTINUE_WITH_ARGUMENT),
    86: ('dFCWithArgument', '30', DFC_WITH_ARGUMENT),
    88: ('continueWithArgument', '30', CONTINUE_WITH_ARGUMENT),
    90: ('disconnectLeg', '30', DISCONNECT_LEG),
    93: ('moveLeg', '30', MOVE_LEG),
    95: ('splitLeg', '30', SPLIT_LEG),
    96: ('entityReleased', None, ENTITY_RELEASED),
}


CONTENTS = '%d operations' % len(OPERATIONS)


def argument(code, rng):
    _, outer, build = OPERATIONS[code]
    content = build(rng)
    return content if outer is None else _c().tlv(bytes.fromhex(outer), content)


def build_corpus(per_op, seed):
    """per_op messages per operation: half with definite lengths, half with
    indefinite TCAP-level lengths (all of them in one of eight, an indefinite
    dialogue portion in another one of eight, a random choice of the parts
    inside the dialogue portion and of the component parts otherwise).  The argument is
    always definite.  -> [(group, hex)]"""
    c = _c()
    parts = ('ext', 'asn1', 'pdu', 'cp', 'comp')
    out = []
    for code, (name, _, _) in sorted(OPERATIONS.items()):
        rng = random.Random(seed * 1000 + code)
        for i in range(per_op):
            definite = i % 2 == 0
            if definite:
                indef = False
            elif i % 16 == 1:
                indef = set(parts) | {'msg', 'dlg'}
            elif i % 16 == 3:
                indef = {'dlg', 'cp'}
            else:
                indef = set(rng.sample(parts, rng.randint(1, len(parts))))
            msg = rng.choice(('begin', 'continue', 'end', 'unidirectional'))
            dialogue = rng.random() < .6
            hexmsg = c.wrap_invoke(code, argument(code, rng), msg=msg,
                                   invoke_id=rng.randint(-128, 127), dialogue=dialogue,
                                   acn=c.default_acn(name, 4), indef=indef,
                                   otid='%08X' % rng.getrandbits(32),
                                   dtid='%08X' % rng.getrandbits(32))
            out.append(('%d/%s' % (code, 'definite' if definite else 'indefinite'), hexmsg))
    return out


# --------------------------------------------------------------------------
# tshark's PDML -> per message: [(field name, show, raw value, offset, size)]
# with offsets counted from the first octet of the TCAP message
# --------------------------------------------------------------------------
def read_pdml(path):
    out = []
    ctx = ET.iterparse(path, events=('start', 'end'))
    root = None
    for ev, el in ctx:
        if ev == 'start':
            if root is None:
                root = el
            continue
        if el.tag != 'packet':
            continue
        base = None
        fields = []
        for proto in el:
            if proto.get('name') == 'tcap' and base is None:
                base = int(proto.get('pos'))
        if base is not None:
            for f in el.iter('field'):
                name = f.get('name')
                if not name or name.startswith('_ws.') or f.get('pos') is None:
                    continue
                off = int(f.get('pos')) - base
                if off < 0:
                    continue
                fields.append((name, f.get('show'), f.get('value'), off, int(f.get('size') or 0)))
        out.append(fields)
        root.clear()
    return out


# --------------------------------------------------------------------------
# Normalisers.  A tshark-side normaliser turns one shown field into the value
# our field must report: f(show, raw, off, size, data) -> (value, rule or
# None).  An our-side extractor turns one of our
# fields into a comparable value.
# --------------------------------------------------------------------------
def nibbles(octets):
    return ''.join('%x%x' % (b & 15, b >> 4) for b in octets)


def t_int(show, raw, off, size, data):
    return int(show, 0), None


def t_int8(show, raw, off, size, data):            # tshark shows it signed
    return int(show) % 256, None


def t_hexint(show, raw, off, size, data):          # "02" (leg ids are hex)
    return int(show, 16), None


def t_octet(show, raw, off, size, data):
    """The octet itself: tshark shows some one-octet values through a
    mis-sized integer (category 0x0b as 4294967290 in some arguments)."""
    return data[off], (None if show == str(data[off]) else 'tshark-shows-octet-garbled')


def t_digits(show, raw, off, size, data):
    return show.lower(), None


def t_all_halves(show, raw, off, size, data):
    """Our decoder shows every half-octet of the digit octets (the odd/even
    indicator is not applied), so an odd count ends with the filler digit."""
    full = nibbles(data[off:off + size])
    if show.lower() == full[:-1]:
        return full, 'digits-all-half-octets'
    return show.lower(), None


def t_filler_f(show, raw, off, size, data):
    """TBCD digits: our decoder shows the filler half-octet as f."""
    full = nibbles(data[off:off + size])
    if full.endswith('f') and show.lower() == full[:-1]:
        return full, 'tbcd-filler-shown'
    return show.lower(), None


def t_mnc(show, raw, off, size, data):
    """tshark shows the MNC as a number (01 as 1) from octets 2-3 of the
    MCC-MNC block; our decoder shows its digits in span order: octet 3 bits
    8-5, bits 4-1, then (three digits) octet 2 bits 8-5."""
    o2, o3 = data[off], data[off + 1]
    real = '%x%x' % (o3 & 15, o3 >> 4) + ('' if o2 >> 4 == 15 else '%x' % (o2 >> 4))
    if int(show) != int(real):
        return show, None
    ours = plmn_at(data, off - 1)[1]
    return ours, ('mnc-high-half-first' if ours != real else None)


def plmn_at(data, p):
    """(mcc, mnc as our decoder shows it, lac) of an MCC-MNC-LAC block."""
    o1, o2, o3 = data[p], data[p + 1], data[p + 2]
    mcc = '%x%x%x' % (o1 & 15, o1 >> 4, o2 & 15)
    mnc = '%x%x' % (o3 >> 4, o3 & 15) + ('' if o2 >> 4 == 15 else '%x' % (o2 >> 4))
    return mcc, mnc, int.from_bytes(data[p + 3:p + 5], 'big')


def t_cgi(part):
    """Cell global id shown by tshark as octets only: the parts from them."""
    def f(show, raw, off, size, data):
        mcc, mnc, lac = plmn_at(data, off)
        rule = 'mnc-high-half-first' if part == 'mnc' and mnc[0] != mnc[1] else None
        return {'mcc': mcc, 'mnc': mnc, 'lac': lac,
                'ci': int.from_bytes(data[off + 5:off + 7], 'big')}[part], rule
    return f


def t_lai_lac(show, raw, off, size, data):
    return plmn_at(data, off)[2], None


def t_time(part):
    """Time and time zone, shown by tshark as octets only.  Year to second:
    half-octets low first, read as hexadecimal digits; the zone: sign in bit
    8, value in bits 7-1 (3GPP codes the zone as swapped BCD quarters with
    the sign in bit 4, so our reading differs from the zone's meaning)."""
    def f(show, raw, off, size, data):
        b = data[off:off + size]
        if part == 'year':
            return int(nibbles(b[0:2]), 16), None
        if part in ('month', 'day', 'hour', 'minute', 'second'):
            i = ('month', 'day', 'hour', 'minute', 'second').index(part) + 2
            return int(nibbles(b[i:i + 1]), 16), None
        tz = b[7]
        quarters = (tz & 0x07) * 10 + (tz >> 4)
        sign = 1 if tz & 0x08 else 0
        mine = (tz >> 7, tz & 0x7F)
        rule = 'time-zone-bit-layout' if mine != (sign, quarters) else None
        return (mine[0] if part == 'sign' else mine[1]), rule
    return f


def t_stop_time(part):
    """Call stop time: tshark shows 'hh:mm:ss;dd/mm/yyyy' from swapped BCD
    octets; our decoder shows each octet as on the wire, the year as one
    16-bit read (octets assembled least significant first)."""
    def f(show, raw, off, size, data):
        b = data[off:off + size]
        v = int.from_bytes(b[0:2], 'little') if part == 0 else b[part + 1]
        return v, 'stop-time-octets'
    return f


def t_octets(show, raw, off, size, data):
    """The content octets of the element tshark shows at this place."""
    return data[off:off + size].hex(), None


def t_bit_string(show, raw, off, size, data):
    """A BIT STRING: tshark's field starts after the unused-bits octet; our
    field shows every content octet."""
    return data[off - 1:off + size].hex(), None


def t_explicit(show, raw, off, size, data):
    """An explicitly tagged CHOICE shown by tshark at its inner value; our
    field shows the whole content: inner identifier, length and value."""
    return data[off - 2:off + size].hex(), None


def t_octet_at(i):
    """One octet of a value tshark shows as octets only."""
    def f(show, raw, off, size, data):
        return data[off + i], None
    return f


def t_octets_int(show, raw, off, size, data):
    """Octets shown by tshark as bytes, read as one number."""
    return int.from_bytes(data[off:off + size], 'big'), None


def t_sending(show, raw, off, size, data):
    return 128, None


def t_receiving(show, raw, off, size, data):
    return 129, None


def o_num(f):
    v = 0
    for first, last, val in f['spans']:
        v = (v << (last - first + 1)) | val
    return v


def o_digits(f):
    """Every span as hexadecimal digits: one per half-octet, two per octet."""
    return ''.join('%0*x' % ((s[1] - s[0] + 4) // 4, s[2]) for s in f['spans'])


# --------------------------------------------------------------------------
# The compared values.  Each row: value name, tshark containers (an
# occurrence counts only inside one of them; None: anywhere), tshark field
# names, our field ids, tshark-side normaliser, our-side extractor, octet
# shift from tshark's field to ours (leg ids: the choice is the identifier
# two octets before the side value).
# --------------------------------------------------------------------------
CALLED = ('camel.calledPartyNumber', 'camel.CalledPartyNumber', 'camel.ipRoutingAddress',
          'camel.forwardingDestinationNumber', 'camel.destinationAddress')
CALLING = ('camel.callingPartyNumber',)
LOCATION = ('camel.locationNumber',)
MS_LOCATION = ('gsm_map.ms.locationNumber',)
ORIGINAL = ('camel.originalCalledPartyID',)
REDIRECTING = ('camel.redirectingPartyID',)
ADDITIONAL = ('camel.additionalCallingPartyNumber',)
CHARGE = ('camel.chargeNumber',)
GENERIC = ('camel.GenericNumber', 'camel.assistingSSPIPRoutingAddress', 'camel.correlationID')
ISDN = ('gsm_map.ms.vlr_number', 'gsm_map.ms.msc_Number', 'camel.mscAddress',
        'camel.gsmSCFAddress', 'camel.gmscAddress')
# tshark shows the digits by numbering plan: E.164, land mobile (as an IMSI)
# or other
ISDN_DIGITS = ('e164.msisdn', 'e212.imsi', 'gsm_map.address.digits')
NAI = 'isup.calling_party_nature_of_address_indicator'
NPI = 'isup.numbering_plan_indicator'
APRI = 'isup.address_presentation_restricted_indicator'

# ISUP-format numbers: our field ids of each attribute (0: not shown).
NUMBER_ATTRIBUTES = (
    ('nature of address', (NAI, 'isup.called_party_nature_of_address_indicator')),
    ('numbering plan', (NPI,)),
    ('presentation', (APRI,)),
    ('screening', ('isup.screening_indicator', 'isup.screening_indicator_enhanced')),
    ('NI', ('isup.ni_indicator',)),
    ('INN', ('isup.inn_indicator',)),
    ('qualifier', ('isup.number_qualifier_indicator',)),
)
NUMBERS = (
    # number, containers, tshark's digits, our digit ids, digits normaliser,
    # our ids in NUMBER_ATTRIBUTES order
    ('called number', CALLED, 'isup.called', (3589, 3592), t_digits,
     (1819, 1822, 0, 0, 0, 1823, 0)),
    ('calling number', CALLING, 'isup.calling', (1628, 1631), t_digits,
     (1617, 1621, 1620, 1619, 1622, 0, 0)),
    ('location number', LOCATION, 'isup.location_number', (1663,), t_all_halves,
     (3557, 3569, 1662, 3560, 0, 3575, 0)),
    ('location information: location number', MS_LOCATION, 'isup.location_number', (2069,),
     t_all_halves, (2064, 2066, 2067, 2068, 0, 2065, 0)),
    ('original called', ORIGINAL, 'isup.original_called_number', (1646,), t_all_halves,
     (1642, 1644, 1645, 0, 0, 0, 0)),
    ('redirecting', REDIRECTING, 'isup.redirecting', (1818,), t_all_halves,
     (1814, 1816, 1817, 0, 0, 0, 0)),
    ('additional calling', ADDITIONAL, 'isup.generic_number', (1670,), t_all_halves,
     (1664, 1667, 1669, 1666, 1668, 0, 1659)),
    ('generic number', GENERIC, 'isup.generic_number', (1663,), t_all_halves,
     (3554, 3566, 1662, 3563, 3572, 0, 1657)),
    ('charge number', CHARGE, 'isup.location_number', (3600, 3603), t_digits,
     (1942, 1944, 0, 0, 0, 0, 0)),
)
VALUES = tuple(
    [(number + ' digits', boxes, (tdigits,), ids, norm, o_digits)
     for number, boxes, tdigits, ids, norm, _ in NUMBERS] +
    [('%s %s' % (number, attr), boxes, tnames, (fid,), t_int, o_num)
     for number, boxes, _, _, _, fids in NUMBERS
     for (attr, tnames), fid in zip(NUMBER_ATTRIBUTES, fids) if fid]) + (
    ('service key', None, ('camel.serviceKey',), (1611,), t_int, o_num),
    ('event type BCSM', None, ('camel.eventTypeBCSM',), (1557,), t_int, o_num),
    ('calling party\'s category', None, ('camel.callingPartysCategory',), (1634,), t_octet,
     o_num),
    ('cause value', None, ('camel.cause_indicator',), (1480,), t_int, o_num),
    ('cause location', None, ('q931.cause_location',), (1476,), t_int, o_num),
    ('cause / bearer / high layer coding standard', None, ('q931.coding_standard',),
     (1477, 1705, 1673), t_int, o_num),
    ('high layer interpretation', None, ('q931.interpretation',), (1675,), t_int, o_num),
    ('high layer presentation method', None, ('q931.presentation_method_protocol_profile',),
     (1676,), t_int, o_num),
    ('high layer characteristics', None, ('q931.high_layer_characteristics',), (1677,), t_int,
     o_num),
    ('bearer transfer capability', None, ('q931.information_transfer_capability',), (1704,),
     t_int, o_num),
    ('bearer transfer rate', None, ('q931.information_transfer_rate',), (1707,), t_int, o_num),
    ('bearer rate multiplier', None, ('q931.bearer_capability.rate_multiplier',), (1712,),
     t_int, o_num),
    ('bearer transfer mode', None, ('q931.transfer_mode',), (1708,), t_int, o_num),
    ('bearer layer 1 protocol', None, ('q931.uil1',), (1725,), t_int, o_num),
    ('IMSI digits', ('camel.iMSI',), ('e212.imsi',), (2025, 2029), t_digits, o_digits),
    ('ISDN address digits (VLR, MSC, gsmSCF)', ISDN, ISDN_DIGITS, (2058,), t_filler_f, o_digits),
    ('ISDN address nature of address', ISDN, ('gsm_map.nature_of_number',), (2055,), t_int,
     o_num),
    ('ISDN address numbering plan', ISDN, ('gsm_map.number_plan',), (2054,), t_int, o_num),
    ('called BCD digits', None, ('gsm_a.dtap.cld_party_bcd_num',), (2141,), t_filler_f,
     o_digits),
    ('called BCD type of number', None, ('gsm_a.dtap.type_of_number',), (2140,), t_int, o_num),
    ('called BCD numbering plan', None, ('gsm_a.dtap.numbering_plan_id',), (2139,), t_int, o_num),
    ('age of location information', None, ('gsm_map.ms.ageOfLocationInformation',), (2046,),
     t_int, o_num),
    ('cell id: MCC', None, ('gsm_map.cellGlobalIdOrServiceAreaIdFixedLength',), (2079,),
     t_cgi('mcc'), o_digits),
    ('cell id: MNC', None, ('gsm_map.cellGlobalIdOrServiceAreaIdFixedLength',), (2083, 2086),
     t_cgi('mnc'), o_digits),
    ('cell id: LAC', None, ('gsm_map.cellGlobalIdOrServiceAreaIdFixedLength',), (2087,),
     t_cgi('lac'), o_num),
    ('cell id: cell identity', None, ('gsm_map.cellGlobalIdOrServiceAreaIdFixedLength',),
     (2088,), t_cgi('ci'), o_num),
    ('LAI: MCC', None, ('e212.lai.mcc',), (2079,), t_digits, o_digits),
    ('LAI: MNC', None, ('e212.lai.mnc',), (2083, 2086), t_mnc, o_digits),
    ('LAI: LAC', None, ('gsm_map.laiFixedLength',), (2087,), t_lai_lac, o_num),
    ('time: year', None, ('camel.timeAndTimezone',), (2233,), t_time('year'), o_num),
    ('time: month', None, ('camel.timeAndTimezone',), (2234,), t_time('month'), o_num),
    ('time: day', None, ('camel.timeAndTimezone',), (2235,), t_time('day'), o_num),
    ('time: hour', None, ('camel.timeAndTimezone',), (2236,), t_time('hour'), o_num),
    ('time: minute', None, ('camel.timeAndTimezone',), (2237,), t_time('minute'), o_num),
    ('time: second', None, ('camel.timeAndTimezone',), (2238,), t_time('second'), o_num),
    ('time zone sign', None, ('camel.timeAndTimezone',), (2239,), t_time('sign'), o_num),
    ('time zone', None, ('camel.timeAndTimezone',), (2240,), t_time('zone'), o_num),
    ('leg id: sending side', None, ('inap.sendingSideID', 'camel.sendingSideID'),
     (1543, 1551), t_sending, o_num, -2),
    ('leg id: receiving side', None, ('inap.receivingSideID', 'camel.receivingSideID'),
     (1543, 1547), t_receiving, o_num, -2),
    ('leg id: side value', None, ('inap.sendingSideID', 'inap.receivingSideID',
                                  'camel.sendingSideID', 'camel.receivingSideID'),
     (1554,), t_hexint, o_num),
    ('monitor mode', None, ('camel.monitorMode',), (1909,), t_int, o_num),
    ('application timer', None, ('camel.applicationTimer',), (1916,), t_int, o_num),
    ('misc call info: message type', None, ('inap.messageType',), (1608,), t_int, o_num),
    ('CG encountered', None, ('camel.cGEncountered',), (1637,), t_int, o_num),
    ('call segment id', None, ('camel.callSegmentID', 'camel.newCallSegment'), (4181,),
     t_octets, o_digits),
    ('CUG index', None, ('camel.cug_Index',), (1193,), t_int, o_num),
    ('CUG interlock', None, ('camel.cug_Interlock',), (1948,), t_octets_int, o_num),
    ('NA Oli info', None, ('camel.naOliInfo',), (2017,), t_hexint, o_num),
    ('carrier selection', None, ('camel.carrier',), (1955,), t_octet_at(0), o_num),
    ('alerting pattern: type', None, ('camel.alertingPattern',), (1128,), t_octet_at(2), o_num),
    ('service interaction: conference treatment', None,
     ('camel.conferenceTreatmentIndicator',), (1977,), t_hexint, o_num),
    ('service interaction: hold treatment', None, ('camel.holdTreatmentIndicator',), (2001,),
     t_int, o_num),
    ('service interaction: bothway through connection', None,
     ('camel.bothwayThroughConnectionInd',), (1993,), t_int, o_num),
    ('service interaction: connected number treatment', None,
     ('camel.connectedNumberTreatmentInd',), (1996,), t_int, o_num),
    ('cancel: invoke id', None, ('camel.invokeID',), (1531,), t_int8, o_num),
    ('timer id', None, ('camel.timerID',), (2306,), t_int, o_num),
    ('timer value', None, ('camel.timervalue',), (1376,), t_int, o_num),
    ('requested info type (report)', None, ('camel.requestedInformationType',), (1504,), t_int,
     o_num),
    ('requested info type (request)', None, ('camel.RequestedInformationType',), (1527,),
     t_int, o_num),
    ('call attempt elapsed time', None, ('camel.callAttemptElapsedTimeValue',), (1510,),
     t_int, o_num),
    ('call connected elapsed time', None, ('camel.callConnectedElapsedTimeValue',), (1519,),
     t_int, o_num),
    ('call stop time: year', None, ('camel.callStopTimeValue',), (1512,), t_stop_time(0), o_num),
    ('call stop time: month', None, ('camel.callStopTimeValue',), (1513,), t_stop_time(1),
     o_num),
    ('call stop time: second', None, ('camel.callStopTimeValue',), (1517,), t_stop_time(5),
     o_num),
    ('redirecting indicator', None, ('isup.redirecting_ind',), (1826,), t_int, o_num),
    ('original redirection reason', None, ('isup.original_redirection_reason',), (1827,), t_int,
     o_num),
    ('redirection counter', None, ('isup.redirection_counter',), (1828,), t_int, o_num),
    ('redirecting reason', None, ('isup.redirection_reason',), (1829,), t_int, o_num),
    ('ext basic service code: bearer', ('camel.ext_basicServiceCode',),
     ('gsm_map.ext_BearerService',), (2053,), t_int, o_num),
    ('ext basic service code: teleservice', ('camel.ext_basicServiceCode',),
     ('gsm_map.ext_Teleservice',), (2057,), t_int, o_num),
    ('call reference number', None, ('camel.callReferenceNumber',), (2135, 4177), t_octets,
     o_digits),
    # Initial DP argument extension (CAP v4 layout: tshark reads it so under a
    # CAP v4 context or without one)
    ('IDP extension: MS classmark 2', None, ('camel.ms_Classmark2',), (4218,), t_octets,
     o_digits),
    ('IDP extension: IMEI', None, ('camel.iMEI',), (4221,), t_octets, o_digits),
    ('IDP extension: supported CAMEL phases', None, ('camel.supportedCamelPhases',), (4192,),
     t_bit_string, o_digits, -1),
    ('IDP extension: offered CAMEL4 functionalities', None,
     ('camel.offeredCamel4Functionalities',), (4195,), t_bit_string, o_digits, -1),
    ('IDP extension: basic service code', None, ('camel.ext_basicServiceCode2',), (4224,),
     t_explicit, o_digits, -2),
    ('IDP extension: low layer compatibility', None,
     ('camel.lowLayerCompatibility', 'camel.lowLayerCompatibility2'), (4228,), t_octets,
     o_digits),
)

# What each rule means (for the summary).
RULE_TEXT = {
    'digits-all-half-octets': 'location, original called, redirecting, generic and additional '
                              'calling numbers show every half-octet (odd/even not applied): '
                              'an odd count ends with the filler digit',
    'tbcd-filler-shown': 'ISDN address and called BCD digits show the filler half-octet as f',
    'mnc-high-half-first': 'MNC shown in span order, octet 3 bits 8-5 before bits 4-1 '
                           '(tshark: 15, ours: 51)',
    'time-zone-bit-layout': 'time zone read as sign in bit 8 and value in bits 7-1 (3GPP: '
                            'swapped BCD quarters, sign in bit 4)',
    'stop-time-octets': 'call stop time shows its octets as on the wire, the year as one '
                        '16-bit read, low octet first (tshark: swapped BCD date and time)',
    'invoke-indefinite': 'TCAP: an indefinite Invoke\'s end-of-contents is not read (flag 0x10)',
    'external-indefinite': 'TCAP: an indefinite EXTERNAL in a definite dialogue portion is '
                           'read in definite mode: its end-of-contents is left in the dialogue '
                           'portion\'s window (flag 0x10)',
    'tshark-shows-octet-garbled': 'not our rule: tshark shows the calling party\'s category '
                                  'through a mis-sized integer; the octet is compared',
    'opcode-56-not-decoded-by-tshark': 'operation 56 (Continue With Argument, old code): '
                                       'tshark does not decode its argument',
    'components-not-reached': 'TCAP-level rule (indefinite message or dialogue portion): the '
                              'component is not decoded, so neither is its argument',
}


def _row(r):
    name, containers, tnames, ids, norm, ours = r[:6]
    return name, containers, tnames, set(ids), norm, ours, (r[6] if len(r) > 6 else 0)


ROWS = [_row(r) for r in VALUES]


def octet_of(f):
    return (f['spans'][0][0] - 1) // 8 if f.get('spans') else None


class Stats:
    def __init__(self):
        self.compared = {}         # value -> [compared, agreed]
        self.rules = {}            # rule -> [count, example hex]
        self.failures = []         # (value, op, what, hex)
        self.by_value = {}         # value -> {(expected, got): [count, example hex]}

    def rule(self, name, hexmsg):
        self.rules.setdefault(name, [0, hexmsg])[0] += 1


def compare_values(op, hexmsg, tfields, md, arg_range, stats, rows=None):
    """tfields: tshark's fields of one message; md: our decoded-field pass."""
    data = bytes.fromhex(hexmsg)
    lo, hi = arg_range
    ours = [(octet_of(f), f) for f in md.get('fields', []) if f.get('spans')]
    tf = [t for t in tfields if lo <= t[3] < hi]
    rules = set()
    for name, containers, tnames, ids, norm, extract, shift in rows or ROWS:
        boxes = None
        if containers:
            boxes = [(o, o + s) for n, _, _, o, s in tf if n in containers]
        for tname, show, raw, off, size in tf:
            if tname not in tnames or show is None:
                continue
            if boxes is not None and not any(a <= off < b for a, b in boxes):
                continue
            try:
                want, rule = norm(show, raw, off, size, data)
            except (ValueError, IndexError) as exc:
                stats.failures.append(('tshark value', op, '%s: %s %r not understood (%s)'
                                       % (name, tname, show, exc), hexmsg))
                continue
            if rule:
                rules.add(rule)
            a, b = off + shift, off + shift + max(size, 1)
            mine = [f for o, f in ours if f['id'] in ids and o is not None and a <= o < b]
            have = extract(mine[0]) if mine else None
            c = stats.compared.setdefault(name, [0, 0])
            c[0] += 1
            if have == want:
                c[1] += 1
                continue
            key = (repr(want), 'not reported' if have is None else repr(have))
            stats.by_value.setdefault(name, {}).setdefault(key, [0, op, hexmsg])[0] += 1
    for r in rules:
        stats.rule(r, hexmsg)
    return rules


def argument_range(root):
    """(first, end) octets of the argument of the message's Invoke, or None."""
    cp = root.kid(0x6C)
    if cp is None or not cp.kids or cp.kids[0].tag != 0xA1:
        return None
    inv = cp.kids[0]
    if len(inv.kids) < 3:
        return None
    return inv.kids[-1].off, inv.kids[-1].end


PASSES = ('md', 'display', 'view', 'keys')
# Rules of ours that leave bits of a valid message unread, and the error
# flags they raise: TCAP-level ones (the dialogue portion's, and the
# end-of-contents of an indefinite Invoke) and one inside an argument.
FLAGGING_RULES = {'asn1-indefinite': 0x12, 'pdu-indefinite': 0x10, 'invoke-indefinite': 0x10,
                  'component-indefinite': 0x10, 'external-indefinite': 0x10}
FLAGGING_ARGUMENT_RULES = {}


def check_coverage(op, hexmsg, out, arg_range, stats, flagging, argument_rules=None):
    """Four passes: result 1, no error flag, no bits left over; every octet of
    the argument inside a reported field's bit span.  Error flags (and, for
    a rule inside the argument, the octets it skips) that a rule of ours
    raises on a valid encoding are counted under the rule."""
    problems = []
    for what, key, bad in (('result', 'result', lambda v: v != 1),
                           ('error flags', 'errorFlags', bool),
                           ('bits left over', 'remainingBits', bool)):
        hit = [(p, (out.get(p) or {}).get(key)) for p in PASSES
               if bad((out.get(p) or {}).get(key))]
        if not hit:
            continue
        argument_rules = FLAGGING_ARGUMENT_RULES if argument_rules is None else argument_rules
        allowed = 0
        for r in flagging:
            allowed |= FLAGGING_RULES.get(r, 0) | argument_rules.get(r, 0)
        if key == 'errorFlags' and all(v & ~allowed == 0 for _, v in hit):
            for r in flagging:
                stats.rule('flags accepted under %s' % r, hexmsg)
            continue
        problems.append('%s: %s' % (what, ', '.join('%s %s' % (p, hex(v) if key == 'errorFlags'
                                                             else v) for p, v in hit)))
    covered = set()
    for f in (out.get('md') or {}).get('fields', []):
        for first, last, _ in f.get('spans') or []:
            covered.update(range((first - 1) // 8, (last - 1) // 8 + 1))
    lo, hi = arg_range
    gaps = [o for o in range(lo, hi) if o not in covered]
    skipping = flagging & set(FLAGGING_ARGUMENT_RULES if argument_rules is None
                              else argument_rules)
    if gaps and skipping:
        for r in skipping:
            stats.rule('octets skipped under %s' % r, hexmsg)
    elif gaps:
        problems.append('argument octets not in any field: %s' % _ranges(gaps))
    c = stats.compared.setdefault('coverage: %s' % (op if isinstance(op, str) else 'op %d' % op),
                                  [0, 0])
    c[0] += 1
    if not problems:
        c[1] += 1
    for what in problems[:3]:
        stats.failures.append(('coverage', op, what, hexmsg))


def _ranges(octets):
    out, start, prev = [], None, None
    for o in octets + [None]:
        if start is None:
            start = prev = o
        elif o is not None and o == prev + 1:
            prev = o
        else:
            out.append('%d' % start if start == prev else '%d-%d' % (start, prev))
            start = prev = o
    return ','.join(out[:6]) + (' ...' if len(out) > 6 else '')


# --------------------------------------------------------------------------
# Driver
# --------------------------------------------------------------------------
def tcap_payload_rules(root, comp):
    """Rules of the TCAP levels around the component comp that leave an
    end-of-contents of a valid message unread."""
    notes = set()
    if comp.indef:
        notes.add('invoke-indefinite' if comp.tag == 0xA1 else 'component-indefinite')
    dlg = root.kid(0x6B)
    if dlg is not None and not dlg.indef and dlg.kids and dlg.kids[0].indef:
        notes.add('external-indefinite')
    return notes


def argument_payload(root, stats, hexmsg):
    """(first, end, rule names) of the Invoke's argument, or None."""
    rng = argument_range(root)
    if rng is None:
        return None
    return rng[0], rng[1], tcap_payload_rules(root, root.kid(0x6C).kids[0])


def check(corpus, pdml, oracle, ours, parse_node, tcap_rules, payload=argument_payload,
          label=lambda group: int(group.split('/')[0]), rows=None, payload_rules=None):
    """corpus [(group, hex)], tshark's PDML fields and oracle summaries, our
    four-pass outputs; parse_node: BER reader; tcap_rules(data, root, ora)
    -> set of TCAP-level rule names (oracle_compare's expectations).
    payload(root, stats, hex) -> (first, end, rule names) of the checked
    octets; label(group) names the message's operation in the summary;
    rows: the compared values (VALUES); payload_rules: rules inside the
    payload that leave octets unread, and their flags."""
    payload_rules = FLAGGING_ARGUMENT_RULES if payload_rules is None else payload_rules
    stats = Stats()
    for (group, hexmsg), tfields, ora, out in zip(corpus, pdml, oracle, ours):
        op = label(group)
        data = bytes.fromhex(hexmsg)
        root = parse_node(data, 0)
        notes = tcap_rules(data, root, ora)
        if notes & {'msg-indefinite', 'dialogue-indefinite'}:
            stats.rule('components-not-reached', hexmsg)
            continue
        found = payload(root, stats, hexmsg)
        if found is None:
            stats.failures.append(('corpus', op, 'no argument found', hexmsg))
            continue
        lo, hi, more = found
        notes |= more
        rules = set()
        if op == 56:
            stats.rule('opcode-56-not-decoded-by-tshark', hexmsg)
        else:
            rules = compare_values(op, hexmsg, tfields, out.get('md') or {}, (lo, hi), stats,
                                   rows)
        check_coverage(op, hexmsg, out, (lo, hi), stats,
                       ((notes | rules) & set(payload_rules)) | (notes & set(FLAGGING_RULES)),
                       payload_rules)
    return stats


def report(stats, show, complete=True, rows=None, texts=None, title='call-control arguments'):
    """Summary lines and the number of disagreements.  complete: the corpus
    is large enough that every value of the table must have been met."""
    rows, texts = rows or ROWS, texts or RULE_TEXT
    lines = ['%s (value: agreed / compared):' % title]
    bad = 0
    for name in [r[0] for r in rows if r[0] not in stats.compared] if complete else []:
        bad += 1
        lines.append('  NEVER COMPARED %s: tshark showed it nowhere (table or corpus wrong?)'
                     % name)
    for key in sorted(stats.compared, key=lambda k: (k.startswith('coverage'), k)):
        n, a = stats.compared[key]
        lines.append('  %-48s %6d / %-6d%s' % (key, a, n, '' if a == n else
                                                 '  <-- %d differ' % (n - a)))
    if stats.rules:
        lines.append('%s: rules (our rules, tshark differs; messages, example):' % title)
        for key in sorted(stats.rules):
            cnt, ex = stats.rules[key]
            lines.append('  %-36s %6d  %s' % (key, cnt, texts.get(key, '')))
            lines.append('  %36s         e.g. %s'
                         % ('', ex if len(ex) <= 120 else ex[:117] + '...'))
    for name in sorted(stats.by_value):
        for (want, got), (cnt, op, hexmsg) in sorted(stats.by_value[name].items(),
                                                   key=lambda kv: -kv[1][0])[:show]:
            bad += cnt
            lines.append('  DIFFER %s: expected %s, ours %s (%d, e.g. op %s)\n      %s'
                         % (name, want, got, cnt, op, hexmsg))
    seen = {}
    for what, op, text, hexmsg in stats.failures:
        bad += 1
        k = (op, text.split(':')[0])
        if seen.get(k, 0) < max(1, show // 4):
            seen[k] = seen.get(k, 0) + 1
            lines.append('  FAIL %s op %s: %s\n      %s' % (what, op, text, hexmsg))
    return lines, bad
