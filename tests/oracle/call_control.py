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
# Operations of the call-control issue: (opcode, capgen operation name used
# for the ACN, argument builder below).  56 and 88 share one layout.
# --------------------------------------------------------------------------


def _c():
    import capgen  # found at run time (the reference tools folder)
    return capgen


def digits(rng, lo, hi):
    # tshark's E.164 code trips on "883x": no 8 first (capgen does the same)
    return _c()._digits(rng, lo, hi)


def maybe(rng, p):
    return rng.random() < p


def isup_called(rng, nd=None):
    """ISUP Called Party Number: random NAI, INN, numbering plan, digits."""
    c = _c()
    d = digits(rng, 1, 16) if nd is None else digits(rng, nd[0], nd[1])
    return bytes([c._oe(d) | rng.choice([1, 2, 3, 4, rng.randint(0, 127)]),
                  (rng.randint(0, 1) << 7) | (rng.randint(0, 7) << 4)]) + c.bcd_isup(d)


def isup_calling_like(rng, lo=1, hi=16):
    """Calling Party Number / Location Number / Charge Number layout."""
    c = _c()
    d = digits(rng, lo, hi)
    return bytes([c._oe(d) | rng.choice([1, 2, 3, 4, rng.randint(0, 127)]),
                  (rng.randint(0, 1) << 7) | (rng.randint(0, 7) << 4)
                  | (rng.choice([0, 0, 1, 3]) << 2) | rng.randint(0, 3)]) + c.bcd_isup(d)


def isup_original(rng):
    """Original Called / Redirecting number layout (no screening)."""
    c = _c()
    d = digits(rng, 1, 16)
    return bytes([c._oe(d) | rng.choice([1, 2, 3, 4, rng.randint(0, 127)]),
                  (rng.randint(0, 7) << 4) | (rng.choice([0, 0, 1, 3]) << 2)]) + c.bcd_isup(d)


def generic_number(rng, nqi=None):
    c = _c()
    q = rng.randint(0, 10) if nqi is None else nqi
    return bytes([q]) + isup_calling_like(rng, 1, 16)


def cause(rng, diag=True):
    # coding standard mostly ITU-T: tshark shows location and value only then
    b = bytes([0x80 | (rng.choice([0, 0, 0, rng.randint(1, 3)]) << 5) | rng.choice([0, 1, 2, 3, 4, 5, 7, 10]),
               0x80 | rng.randint(1, 127)])
    if diag and maybe(rng, .2):
        b += bytes(rng.randrange(256) for _ in range(rng.randint(1, 3)))
    return b


def bearer_cap(rng):
    """Q.931 bearer capability: transfer capability and rate, maybe layer 1."""
    b = bytes([0x80 | rng.choice([0, 8, 9, 16, 17, 24]),
               0x80 | rng.choice([17, 19, 21, 23])])
    if maybe(rng, .5):
        b += bytes([0xA0 | rng.choice([2, 3, 5])])
    return b


def redirection_info(rng):
    return bytes([(rng.randint(0, 3) << 4) | rng.randint(0, 6),
                  (rng.randint(0, 6) << 4) | rng.randint(1, 5)])


def address_string(rng, lo=4, hi=15):
    c = _c()
    return bytes([0x80 | (rng.randint(0, 7) << 4) | rng.choice([1, 1, 0, 3, 4, 6, 8, 9])]) \
        + c.tbcd(digits(rng, lo, hi))


def imsi(rng):
    c = _c()
    mcc, mnc = rng.choice([('262', '01'), ('234', '15'), ('310', '410'), ('208', '10')])
    n = rng.choice([14, 15, 15])
    return c.tbcd(mcc + mnc + digits(rng, n - 5 - len(mnc) + 2, n - 5 - len(mnc) + 2))


def plmn_lac(rng):
    mcc = '%d%d%d' % (rng.randint(2, 7), rng.randint(0, 9), rng.randint(0, 9))
    mnc = '%02d' % rng.randint(0, 99) if maybe(rng, .6) else '%03d' % rng.randint(0, 999)
    return _c().plmn(mcc, mnc) + rng.randint(0, 65535).to_bytes(2, 'big')


def location_information(rng):
    c = _c()
    b = b''
    if maybe(rng, .6):
        b += c.integer(rng.randint(0, 32767))
    if maybe(rng, .6):
        b += c.ctx(1, address_string(rng, 6, 15))
    if maybe(rng, .2):
        b += c.ctx(2, isup_calling_like(rng, 2, 16))
    r = rng.random()
    if r < .45:
        b += c.ctxc(3, c.ctx(0, plmn_lac(rng) + rng.randint(0, 65535).to_bytes(2, 'big')))
    elif r < .8:
        b += c.ctxc(3, c.ctx(1, plmn_lac(rng)))
    if maybe(rng, .3):
        b += c.ctx(6, address_string(rng, 6, 15))
    return b


def time_and_timezone(rng):
    c = _c()
    return c.time_and_timezone(rng.randint(2000, 2030), rng.randint(1, 12), rng.randint(1, 28),
                               rng.randint(0, 23), rng.randint(0, 59), rng.randint(0, 59),
                               rng.randint(-47, 56))


def leg(rng, side=None, tag=0):
    """LegID inside its element: sendingSideID [0] or receivingSideID [1]."""
    c = _c()
    s = rng.randint(0, 1) if side is None else side
    return c.ctx(s, bytes([rng.choice([1, 2, rng.randint(1, 30)])]))


def service_key(rng):
    return rng.choice([rng.randint(0, 255), rng.randint(0, 65535), rng.randint(0, 2 ** 31 - 1)])


def extensions(rng):
    """ExtensionField list: local type, criticality, value [1]."""
    c = _c()
    n = rng.randint(1, 2)
    return b''.join(c.seq(c.integer(rng.randint(0, 127)), c.tlv(0x0A, bytes([rng.randint(0, 1)])),
                          c.ctxc(1, c.octets(bytes(rng.randrange(256)
                                                  for _ in range(rng.randint(1, 4))))))
                    for _ in range(n))


def cs_id(rng):
    return rng.randint(1, 127)


def service_interaction(rng):
    """ServiceInteractionIndicatorsTwo SEQUENCE contents."""
    c = _c()
    b = b''
    if maybe(rng, .4):
        b += c.ctxc(0, c.ctx(1, bytes([rng.randint(1, 2)])) +
                    (c.ctx(2, bytes([rng.randint(1, 2)])) if maybe(rng, .5) else b'') +
                    (c.ctx(4, bytes([rng.randint(1, 2)])) if maybe(rng, .5) else b''))
    if maybe(rng, .3):
        b += c.ctxc(1, c.ctx(1, bytes([rng.randint(1, 2)])) +
                    (c.ctx(2, bytes([rng.randint(1, 2)])) if maybe(rng, .5) else b''))
    if maybe(rng, .4):
        b += c.cint(2, rng.randint(0, 1))
    if maybe(rng, .3):
        b += c.cint(4, rng.randint(0, 3))
    if maybe(rng, .2):
        b += c.cnull(13)
    for tag in (50, 51, 52):
        if maybe(rng, .3):
            b += c.ctx(tag, bytes([rng.randint(1, 2)]))
    return b


def carrier(rng):
    return bytes([rng.randint(0, 4)]) + bytes(rng.randrange(256) for _ in range(3))


def cug_interlock(rng):
    return bytes(rng.randrange(256) for _ in range(4))


EVENT_TYPES = (2, 3, 4, 5, 6, 7, 9, 10, 12, 13, 14, 15, 17, 18)


# --- arguments, in the ASN.1 order of each type --------------------------
def arg_initial_dp(rng):
    c = _c()
    b = c.cint(0, service_key(rng))
    if maybe(rng, .9):
        b += c.ctx(2, isup_called(rng))
    if maybe(rng, .9):
        b += c.ctx(3, isup_calling_like(rng))
    if maybe(rng, .7):
        b += c.ctx(5, bytes([rng.choice([10, 11, 15, rng.randint(0, 255)])]))
    if maybe(rng, .2):
        b += c.cint(7, rng.randint(0, 7))
    if maybe(rng, .2):
        b += c.ctx(8, bytes([rng.randrange(256)]))
    if maybe(rng, .4):
        b += c.ctx(10, isup_calling_like(rng))
    if maybe(rng, .4):
        b += c.ctx(12, isup_original(rng))
    if maybe(rng, .2):
        b += c.ctxc(15, extensions(rng))
    if maybe(rng, .2):
        b += c.ctx(23, bytes([0x91, rng.choice([0x81, 0x84, 0xA1])]))
    if maybe(rng, .3):
        b += c.ctx(25, generic_number(rng, 6))
    if maybe(rng, .5):
        b += c.ctxc(27, c.ctx(0, bearer_cap(rng)))
    if maybe(rng, .8):
        b += c.cint(28, rng.choice(EVENT_TYPES))
    if maybe(rng, .3):
        b += c.ctx(29, isup_original(rng))
    if maybe(rng, .3):
        b += c.ctx(30, redirection_info(rng))
    if maybe(rng, .3):
        b += c.ctx(17, cause(rng))
    if maybe(rng, .2):
        b += c.ctxc(32, service_interaction(rng))
    if maybe(rng, .2):
        b += c.ctx(37, carrier(rng))
    if maybe(rng, .2):
        b += c.ctx(45, c.int_content(rng.randint(0, 32767)))
    if maybe(rng, .2):
        b += c.ctx(46, cug_interlock(rng))
    if maybe(rng, .1):
        b += c.cnull(47)
    if maybe(rng, .8):
        b += c.ctx(50, imsi(rng))
    if maybe(rng, .3):
        b += c.ctxc(51, rng.choice([c.cnull(0), c.cnull(1), c.cnull(2),
                                    c.enumerated(rng.randint(0, 3))]))
    if maybe(rng, .7):
        b += c.ctxc(52, location_information(rng))
    if maybe(rng, .5):
        b += c.ctxc(53, c.ctx(rng.choice([2, 3]), bytes([rng.choice([0x11, 0x12, 0x21, 0x10])])))
    if maybe(rng, .5):
        b += c.ctx(54, bytes(rng.randrange(256) for _ in range(rng.randint(1, 8))))
    if maybe(rng, .6):
        b += c.ctx(55, address_string(rng, 6, 15))
    if maybe(rng, .4):
        b += c.ctx(56, address_string(rng, 1, 24))
    if maybe(rng, .5):
        b += c.ctx(57, time_and_timezone(rng))
    if maybe(rng, .1):
        b += c.cnull(58)
    if maybe(rng, .4):
        b += c.ctxc(59, idp_extension(rng))
    return c.seq(b)


def idp_extension(rng):
    c = _c()
    b = b''
    if maybe(rng, .6):
        b += c.ctx(0, address_string(rng, 6, 15))
    if maybe(rng, .5):
        b += c.ctx(1, isup_called(rng))
    if maybe(rng, .5):
        b += c.ctx(2, bytes([0x53, 0x19, 0x92]))
    if maybe(rng, .5):
        b += c.ctx(3, c.tbcd(digits(rng, 16, 16)))
    if maybe(rng, .5):
        b += c.ctx(4, bytes([4, rng.choice([0x80, 0xC0, 0xE0, 0xF0])]))
    if maybe(rng, .3):
        b += c.ctx(5, bytes([rng.randint(0, 7), rng.randrange(256)]))
    if maybe(rng, .5):
        b += c.ctxc(6, c.ctx(0, bearer_cap(rng)))
    if maybe(rng, .4):
        b += c.ctxc(7, c.ctx(rng.choice([2, 3]), bytes([rng.choice([0x11, 0x12, 0x21])])))
    if maybe(rng, .3):
        b += c.ctx(9, bytes([0x88, 0x90]))
    if maybe(rng, .2):
        b += c.ctx(10, bytes([0x88, 0x90, 0xA2]))
    return b


def arg_assist_request_instructions(rng):
    c = _c()
    b = c.ctx(0, generic_number(rng)) + c.ctx(2, bytes([rng.randrange(256)]))
    if maybe(rng, .2):
        b += c.ctxc(3, extensions(rng))
    return c.seq(b)


def arg_establish_temporary_connection(rng):
    c = _c()
    b = c.ctx(0, generic_number(rng))
    if maybe(rng, .6):
        b += c.ctx(1, generic_number(rng))
    if maybe(rng, .3):
        b += c.ctx(3, bytes(rng.randrange(256) for _ in range(rng.randint(1, 4))))
    if maybe(rng, .2):
        b += c.ctxc(4, extensions(rng))
    if maybe(rng, .2):
        b += c.ctx(5, carrier(rng))
    if maybe(rng, .2):
        b += c.ctxc(6, service_interaction(rng))
    if maybe(rng, .2):
        b += c.ctx(50, bytes([rng.randrange(256)]))
    if maybe(rng, .4):
        b += c.ctx(51, isup_calling_like(rng))
    return c.seq(b)


def arg_connect_to_resource(rng):
    c = _c()
    b = c.ctx(0, isup_called(rng)) if maybe(rng, .6) else c.cnull(3)
    if maybe(rng, .2):
        b += c.ctxc(4, extensions(rng))
    if maybe(rng, .2):
        b += c.ctxc(7, service_interaction(rng))
    if maybe(rng, .3):
        b += c.ctx(50, bytes([cs_id(rng)]))
    return c.seq(b)


def arg_connect(rng):
    c = _c()
    b = c.ctxc(0, *[c.octets(isup_called(rng)) for _ in range(rng.randint(1, 3))])
    if maybe(rng, .2):
        b += c.ctx(1, bytes([0, 0, rng.choice([0, 1, 2, 4, 5, 6, 7, 8, rng.randrange(256)])]))
    if maybe(rng, .4):
        b += c.ctx(6, isup_original(rng))
    if maybe(rng, .2):
        b += c.ctxc(10, extensions(rng))
    if maybe(rng, .2):
        b += c.ctx(11, carrier(rng))
    if maybe(rng, .4):
        b += c.ctx(28, bytes([rng.choice([10, 11, rng.randint(0, 255)])]))
    if maybe(rng, .3):
        b += c.ctx(29, isup_original(rng))
    if maybe(rng, .3):
        b += c.ctx(30, redirection_info(rng))
    if maybe(rng, .3):
        b += c.ctxc(14, *[c.octets(generic_number(rng)) for _ in range(rng.randint(1, 2))])
    if maybe(rng, .2):
        b += c.ctxc(15, service_interaction(rng))
    if maybe(rng, .4):
        b += c.ctx(19, isup_calling_like(rng))
    if maybe(rng, .2):
        b += c.ctx(31, cug_interlock(rng))
    if maybe(rng, .1):
        b += c.cnull(32)
    if maybe(rng, .2):
        b += c.cnull(55)
    if maybe(rng, .2):
        b += c.cnull(56)
    if maybe(rng, .2):
        b += c.ctx(57, bytes([rng.randrange(256)]))
    if maybe(rng, .1):
        b += c.cnull(58)
    return c.seq(b)


def arg_release_call(rng):
    return _c().octets(cause(rng))


def arg_request_report_bcsm_event(rng):
    c = _c()
    events = []
    for _ in range(rng.randint(1, 4)):
        b = c.cint(0, rng.choice(EVENT_TYPES)) + c.cint(1, rng.randint(0, 2))
        if maybe(rng, .7):
            b += c.ctxc(2, leg(rng, 0))
        if maybe(rng, .2):
            b += c.ctxc(30, c.cint(1, rng.randint(0, 2047)))
        if maybe(rng, .1):
            b += c.cnull(50)
        events.append(c.seq(b))
    b = c.ctxc(0, *events)
    if maybe(rng, .2):
        b += c.ctxc(2, extensions(rng))
    return c.seq(b)


# event type -> tag number of its event-specific information, and whether
# that alternative carries a cause [0]
ESI = {4: (2, True), 5: (3, True), 6: (4, False), 7: (5, False), 9: (7, True),
       13: (8, True), 14: (9, False), 15: (10, False), 17: (12, True)}


def arg_event_report_bcsm(rng):
    c = _c()
    et = rng.choice(EVENT_TYPES)
    b = c.cint(0, et)
    if et in ESI and maybe(rng, .8):
        tag, has_cause = ESI[et]
        inner = c.ctx(0, cause(rng)) if has_cause and maybe(rng, .8) else b''
        if et in (7, 15) and maybe(rng, .5):
            inner = c.ctx(50, isup_called(rng))          # destinationAddress
        if et in (13, 14) and maybe(rng, .3):
            inner += c.cnull(50)                           # callForwarded
        b += c.ctxc(2, c.ctxc(tag, inner))
    if maybe(rng, .7):
        b += c.ctxc(3, leg(rng, 1))
    if maybe(rng, .7):
        b += c.ctxc(4, c.cint(0, rng.randint(0, 1)))
    return c.seq(b)


def arg_initiate_call_attempt(rng):
    c = _c()
    b = c.ctxc(0, c.octets(isup_called(rng)))
    if maybe(rng, .2):
        b += c.ctxc(4, extensions(rng))
    if maybe(rng, .5):
        b += c.ctxc(5, leg(rng, 0))
    if maybe(rng, .4):
        b += c.ctx(6, bytes([cs_id(rng)]))
    if maybe(rng, .6):
        b += c.ctx(30, isup_calling_like(rng))
    if maybe(rng, .4):
        b += c.ctx(51, bytes(rng.randrange(256) for _ in range(rng.randint(1, 8))))
    if maybe(rng, .4):
        b += c.ctx(52, address_string(rng, 6, 15))
    if maybe(rng, .2):
        b += c.cnull(53)
    return c.seq(b)


def arg_reset_timer(rng):
    c = _c()
    b = c.cint(0, 0) + c.cint(1, rng.choice([rng.randint(0, 255), rng.randint(0, 2 ** 31 - 1)]))
    if maybe(rng, .2):
        b += c.ctxc(2, extensions(rng))
    if maybe(rng, .3):
        b += c.ctx(3, bytes([cs_id(rng)]))
    return c.seq(b)


def arg_call_information_report(rng):
    c = _c()
    items = []
    for t in rng.sample([0, 1, 2, 30], rng.randint(1, 4)):
        if t == 0:
            v = c.cint(0, rng.randint(0, 255))
        elif t == 1:
            v = c.ctx(1, c.date_and_time(rng.randint(2000, 2030), rng.randint(1, 12),
                                         rng.randint(1, 28), rng.randint(0, 23),
                                         rng.randint(0, 59), rng.randint(0, 59)))
        elif t == 2:
            v = c.cint(2, rng.randint(0, 2 ** 31 - 1))
        else:
            v = c.ctx(30, cause(rng))
        items.append(c.seq(c.cint(0, t), c.ctxc(1, v)))
    b = c.ctxc(0, *items)
    if maybe(rng, .2):
        b += c.ctxc(2, extensions(rng))
    if maybe(rng, .7):
        b += c.ctxc(3, leg(rng, 1))
    return c.seq(b)


def arg_call_information_request(rng):
    c = _c()
    b = c.ctxc(0, *[c.enumerated(t) for t in rng.sample([0, 1, 2, 30], rng.randint(1, 4))])
    if maybe(rng, .2):
        b += c.ctxc(2, extensions(rng))
    if maybe(rng, .7):
        b += c.ctxc(3, leg(rng, 0))
    return c.seq(b)


def arg_cancel(rng):
    c = _c()
    return c.cint(0, rng.randint(-128, 127)) if maybe(rng, .6) else c.cnull(1)


def arg_continue_with_argument(rng):
    c = _c()
    b = b''
    if maybe(rng, .2):
        b += c.ctx(1, bytes([0, 0, rng.choice([0, 1, 2, 4, 5, 6, 7, 8])]))
    if maybe(rng, .2):
        b += c.ctxc(6, extensions(rng))
    if maybe(rng, .2):
        b += c.ctxc(7, service_interaction(rng))
    if maybe(rng, .5):
        b += c.ctx(12, bytes([rng.choice([10, 11, rng.randint(0, 255)])]))
    if maybe(rng, .3):
        b += c.ctxc(16, *[c.octets(generic_number(rng)) for _ in range(rng.randint(1, 2))])
    if maybe(rng, .2):
        b += c.ctx(17, cug_interlock(rng))
    if maybe(rng, .1):
        b += c.cnull(18)
    if maybe(rng, .4):
        b += c.ctx(50, isup_calling_like(rng))
    if maybe(rng, .2):
        b += c.ctx(52, carrier(rng))
    if maybe(rng, .3):
        b += c.cnull(55)
    if maybe(rng, .2):
        b += c.ctx(56, bytes([rng.randrange(256)]))
    if maybe(rng, .1):
        b += c.cnull(57)
    if maybe(rng, .1):
        b += c.cnull(58)
    if maybe(rng, .3):
        x = b''.join(c.cnull(t) for t in (0, 1, 2) if maybe(rng, .4))
        if maybe(rng, .6):
            x += c.ctxc(3, c.ctx(0, bytes([cs_id(rng)])) if maybe(rng, .5)
                        else c.ctxc(1, leg(rng)))
        b += c.ctxc(59, x)
    return c.seq(b)


def arg_dfc_with_argument(rng):
    c = _c()
    b = c.ctx(1, bytes([cs_id(rng)])) if maybe(rng, .7) else b''
    if maybe(rng, .3):
        b += c.ctxc(2, extensions(rng))
    return c.seq(b)


def arg_disconnect_leg(rng):
    c = _c()
    b = c.ctxc(0, leg(rng))
    if maybe(rng, .6):
        b += c.ctx(1, cause(rng))
    if maybe(rng, .2):
        b += c.ctxc(2, extensions(rng))
    return c.seq(b)


def arg_move_leg(rng):
    c = _c()
    b = c.ctxc(0, leg(rng))
    if maybe(rng, .2):
        b += c.ctxc(2, extensions(rng))
    return c.seq(b)


def arg_split_leg(rng):
    c = _c()
    b = c.ctxc(0, leg(rng))
    if maybe(rng, .6):
        b += c.ctx(1, bytes([cs_id(rng)]))
    if maybe(rng, .2):
        b += c.ctxc(2, extensions(rng))
    return c.seq(b)


def arg_entity_released(rng):
    c = _c()
    # callSegmentFailure [0] { callSegmentID [0], cause [2] } or
    # bCSM-Failure [1] { legID [0], cause [2] }
    if maybe(rng, .5):
        b = c.ctx(0, bytes([cs_id(rng)])) if maybe(rng, .8) else b''
        b += c.ctx(2, cause(rng)) if maybe(rng, .8) else b''
        return c.ctxc(0, b)
    b = c.ctxc(0, leg(rng)) if maybe(rng, .8) else b''
    b += c.ctx(2, cause(rng)) if maybe(rng, .8) else b''
    return c.ctxc(1, b)


# opcode -> (capgen operation giving the application context, builder)
OPERATIONS = {
    0: ('initialDP', arg_initial_dp),
    16: ('assistRequestInstructions', arg_assist_request_instructions),
    17: ('establishTemporaryConnection', arg_establish_temporary_connection),
    19: ('connectToResource', arg_connect_to_resource),
    20: ('connect', arg_connect),
    22: ('releaseCall', arg_release_call),
    23: ('requestReportBCSMEvent', arg_request_report_bcsm_event),
    24: ('eventReportBCSM', arg_event_report_bcsm),
    32: ('initiateCallAttempt', arg_initiate_call_attempt),
    33: ('resetTimer', arg_reset_timer),
    44: ('callInformationReport', arg_call_information_report),
    45: ('callInformationRequest', arg_call_information_request),
    53: ('cancel', arg_cancel),
    56: ('continueWithArgument', arg_continue_with_argument),
    86: ('dFCWithArgument', arg_dfc_with_argument),
    88: ('continueWithArgument', arg_continue_with_argument),
    90: ('disconnectLeg', arg_disconnect_leg),
    93: ('moveLeg', arg_move_leg),
    95: ('splitLeg', arg_split_leg),
    96: ('entityReleased', arg_entity_released),
}


def build_corpus(per_op, seed):
    """per_op messages per operation: half with definite lengths, half with
    indefinite TCAP-level lengths (all of them in one of eight, an indefinite
    dialogue portion in another one of eight, a random choice of the parts
    inside the dialogue portion and of the component parts otherwise).  The argument is
    always definite.  -> [(group, hex)]"""
    c = _c()
    parts = ('ext', 'asn1', 'pdu', 'cp', 'comp')
    out = []
    for code, (name, builder) in sorted(OPERATIONS.items()):
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
            hexmsg = c.wrap_invoke(code, builder(rng), msg=msg, invoke_id=rng.randint(-128, 127),
                                   dialogue=dialogue, acn=c.default_acn(name),
                                   indef=indef, otid='%08X' % rng.getrandbits(32),
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
# None); None skips the occurrence.  An our-side extractor turns one of our
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
    """MNC shown by us in span order: octet 3 bits 8-5, bits 4-1, then (three
    digits) octet 2 bits 8-5; tshark shows the digits in their real order."""
    s = show.lower()
    return (s[1] + s[0] + s[2:]), ('mnc-high-half-first' if s[1] + s[0] != s[:2] else None)


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
    octets; our decoder shows each octet as on the wire (year: 16 bits)."""
    def f(show, raw, off, size, data):
        b = data[off:off + size]
        v = int.from_bytes(b[0:2], 'big') if part == 0 else b[part + 1]
        return v, 'stop-time-octets'
    return f


def t_octets(show, raw, off, size, data):
    """The content octets of the element tshark shows at this place."""
    return data[off:off + size].hex(), None


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
    return ''.join('%x' % s[2] for s in f['spans'])


# --------------------------------------------------------------------------
# The compared values.  Each row: value name, tshark containers (an
# occurrence counts only inside one of them; None: anywhere), tshark field
# names, our field ids, tshark-side normaliser, our-side extractor, octet
# shift from tshark's field to ours (leg ids: the choice is the identifier
# two octets before the side value).
# --------------------------------------------------------------------------
CALLED = ('camel.calledPartyNumber', 'camel.CalledPartyNumber', 'camel.ipRoutingAddress')
CALLING = ('camel.callingPartyNumber',)
LOCATION = ('camel.locationNumber',)
MS_LOCATION = ('gsm_map.ms.locationNumber',)
ORIGINAL = ('camel.originalCalledPartyID',)
REDIRECTING = ('camel.redirectingPartyID',)
ADDITIONAL = ('camel.additionalCallingPartyNumber',)
CHARGE = ('camel.chargeNumber',)
GENERIC = ('camel.GenericNumber', 'camel.assistingSSPIPRoutingAddress', 'camel.correlationID')
ISDN = ('gsm_map.ms.vlr_number', 'gsm_map.ms.msc_Number', 'camel.mscAddress',
        'camel.gsmSCFAddress')
# tshark shows the digits by numbering plan: E.164, land mobile (as an IMSI)
# or other
ISDN_DIGITS = ('e164.msisdn', 'e212.imsi', 'gsm_map.address.digits')
NAI = 'isup.calling_party_nature_of_address_indicator'
NPI = 'isup.numbering_plan_indicator'
APRI = 'isup.address_presentation_restricted_indicator'

VALUES = (
    ('service key', None, ('camel.serviceKey',), (1611,), t_int, o_num),
    ('event type BCSM', None, ('camel.eventTypeBCSM',), (1557,), t_int, o_num),
    ('called number digits', CALLED, ('isup.called',), (3589, 3592), t_digits, o_digits),
    ('called number nature of address', CALLED,
     ('isup.called_party_nature_of_address_indicator',), (1819,), t_int, o_num),
    ('called number numbering plan', CALLED, (NPI,), (1822,), t_int, o_num),
    ('called number INN', CALLED, ('isup.inn_indicator',), (1823,), t_int, o_num),
    ('calling number digits', CALLING, ('isup.calling',), (1628, 1631), t_digits, o_digits),
    ('calling number nature of address', CALLING, (NAI,), (1617,), t_int, o_num),
    ('calling number numbering plan', CALLING, (NPI,), (1621,), t_int, o_num),
    ('calling number presentation', CALLING, (APRI,), (1620,), t_int, o_num),
    ('calling number screening', CALLING, ('isup.screening_indicator',), (1619,), t_int, o_num),
    ('calling number NI', CALLING, ('isup.ni_indicator',), (1622,), t_int, o_num),
    ('location number digits', LOCATION, ('isup.location_number',), (1663,), t_all_halves,
     o_digits),
    ('location number nature of address', LOCATION, (NAI,), (3557,), t_int, o_num),
    ('location number numbering plan', LOCATION, (NPI,), (3569,), t_int, o_num),
    ('location number presentation', LOCATION, (APRI,), (1662,), t_int, o_num),
    ('location number screening', LOCATION, ('isup.screening_indicator',), (3560,), t_int, o_num),
    ('location number INN', LOCATION, ('isup.inn_indicator',), (3575,), t_int, o_num),
    ('location information: location number digits', MS_LOCATION, ('isup.location_number',),
     (2069,), t_all_halves, o_digits),
    ('location information: location number nature of address', MS_LOCATION, (NAI,), (2064,),
     t_int, o_num),
    ('location information: location number numbering plan', MS_LOCATION, (NPI,), (2066,),
     t_int, o_num),
    ('location information: location number presentation', MS_LOCATION, (APRI,), (2067,),
     t_int, o_num),
    ('location information: location number screening', MS_LOCATION,
     ('isup.screening_indicator',), (2068,), t_int, o_num),
    ('location information: location number INN', MS_LOCATION, ('isup.inn_indicator',), (2065,),
     t_int, o_num),
    ('original called digits', ORIGINAL, ('isup.original_called_number',), (1646,),
     t_all_halves, o_digits),
    ('original called nature of address', ORIGINAL, (NAI,), (1642,), t_int, o_num),
    ('original called numbering plan', ORIGINAL, (NPI,), (1644,), t_int, o_num),
    ('original called presentation', ORIGINAL, (APRI,), (1645,), t_int, o_num),
    ('redirecting digits', REDIRECTING, ('isup.redirecting',), (1818,), t_all_halves, o_digits),
    ('redirecting nature of address', REDIRECTING, (NAI,), (1814,), t_int, o_num),
    ('redirecting numbering plan', REDIRECTING, (NPI,), (1816,), t_int, o_num),
    ('redirecting presentation', REDIRECTING, (APRI,), (1817,), t_int, o_num),
    ('additional calling digits', ADDITIONAL, ('isup.generic_number',), (1670,), t_all_halves,
     o_digits),
    ('additional calling qualifier', ADDITIONAL, ('isup.number_qualifier_indicator',), (1659,),
     t_int, o_num),
    ('additional calling nature of address', ADDITIONAL, (NAI,), (1664,), t_int, o_num),
    ('additional calling numbering plan', ADDITIONAL, (NPI,), (1667,), t_int, o_num),
    ('additional calling presentation', ADDITIONAL, (APRI,), (1669,), t_int, o_num),
    ('additional calling screening', ADDITIONAL, ('isup.screening_indicator_enhanced',), (1666,),
     t_int, o_num),
    ('additional calling NI', ADDITIONAL, ('isup.ni_indicator',), (1668,), t_int, o_num),
    ('generic number digits', GENERIC, ('isup.generic_number',), (1663,), t_all_halves,
     o_digits),
    ('generic number qualifier', GENERIC, ('isup.number_qualifier_indicator',), (1657,),
     t_int, o_num),
    ('generic number nature of address', GENERIC, (NAI,), (3554,), t_int, o_num),
    ('generic number numbering plan', GENERIC, (NPI,), (3566,), t_int, o_num),
    ('generic number presentation', GENERIC, (APRI,), (1662,), t_int, o_num),
    ('generic number screening', GENERIC, ('isup.screening_indicator_enhanced',), (3563,),
     t_int, o_num),
    ('generic number NI', GENERIC, ('isup.ni_indicator',), (3572,), t_int, o_num),
    ('charge number digits', CHARGE, ('isup.location_number',), (3600, 3603), t_digits,
     o_digits),
    ('charge number nature of address', CHARGE, (NAI,), (1942,), t_int, o_num),
    ('charge number numbering plan', CHARGE, (NPI,), (1944,), t_int, o_num),
    ('calling party\'s category', None, ('camel.callingPartysCategory',), (1634,), t_octet,
     o_num),
    ('cause value', None, ('camel.cause_indicator',), (1480,), t_int, o_num),
    ('cause location', None, ('q931.cause_location',), (1476,), t_int, o_num),
    ('cause / bearer coding standard', None, ('q931.coding_standard',), (1477, 1705), t_int,
     o_num),
    ('bearer transfer capability', None, ('q931.information_transfer_capability',), (1704,),
     t_int, o_num),
    ('bearer transfer rate', None, ('q931.information_transfer_rate',), (1707,), t_int, o_num),
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
    ('cancel: invoke id', None, ('camel.invokeID',), (1531,), t_int8, o_num),
    ('timer id', None, ('camel.timerID',), (2306,), t_int, o_num),
    ('timer value', None, ('camel.timervalue',), (1376,), t_int, o_num),
    ('requested info type (report)', None, ('camel.requestedInformationType',), (1504,), t_int,
     o_num),
    ('requested info type (request)', None, ('camel.RequestedInformationType',), (1527,),
     t_int, o_num),
    ('call attempt elapsed time', None, ('camel.callAttemptElapsedTimeValue',), (1510,), t_int,
     o_num),
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
    ('ext basic service code: bearer', None, ('gsm_map.ext_BearerService',), (2053,), t_int,
     o_num),
    ('ext basic service code: teleservice', None, ('gsm_map.ext_Teleservice',), (2057,), t_int,
     o_num),
    ('call reference number', None, ('camel.callReferenceNumber',), (2135, 4177), t_octets,
     o_digits),
    # Initial DP extension: our member tags are one below tshark's (it reads
    # naCarrierInformation [0] first), so each octet-string member is
    # compared by its octets under the name tshark gives that identifier.
    ('IDP extension: MS classmark 2 (82)', None, ('camel.forwardingDestinationNumber',), (4218,),
     t_octets, o_digits),
    ('IDP extension: IMEI (83)', None, ('camel.ms_Classmark2',), (4221,), t_octets, o_digits),
    ('IDP extension: supported CAMEL phases (84)', None, ('camel.iMEI',), (4192,), t_octets,
     o_digits),
    ('IDP extension: low layer compatibility (89, 8A)', None,
     ('camel.highLayerCompatibility2', 'camel.lowLayerCompatibility'), (4228,), t_octets,
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
    'stop-time-octets': 'call stop time shows its octets as on the wire (tshark: swapped BCD '
                        'date and time)',
    'idp-extension-tags': 'Initial DP argument extension members sit one tag below tshark\'s '
                          '(naCarrierInformation [0] first there): compared by their octets; '
                          'the GMSC address (80), forwarding number (81), bearer capability '
                          '(A6) and basic service code (A7) are not compared',
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


def compare_values(op, hexmsg, tfields, md, arg_range, stats):
    """tfields: tshark's fields of one message; md: our decoded-field pass."""
    data = bytes.fromhex(hexmsg)
    lo, hi = arg_range
    ours = [(octet_of(f), f) for f in md.get('fields', []) if f.get('spans')]
    tf = [t for t in tfields if lo <= t[3] < hi]
    rules = set()
    for name, containers, tnames, ids, norm, extract, shift in ROWS:
        boxes = None
        if containers:
            boxes = [(o, o + s) for n, _, _, o, s in tf if n in containers]
        for tname, show, raw, off, size in tf:
            if tname not in tnames or show is None:
                continue
            if boxes is not None and not any(a <= off < b for a, b in boxes):
                continue
            try:
                got = norm(show, raw, off, size, data)
            except (ValueError, IndexError):
                continue
            if got is None:
                continue
            want, rule = got
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
# TCAP-level rules that leave bits unread in the dialogue portion of a valid
# message (flag 0x10, or 0x2 for the members not found after them).
FLAGGING_RULES = {'acn-partial', 'result-after-partial-acn', 'asn1-indefinite',
                  'pdu-indefinite'}


def check_coverage(op, hexmsg, out, arg_range, stats, notes):
    """Four passes: result 1, no error flag, no bits left over; every octet of
    the argument inside a reported field's bit span.  Error flags that a
    TCAP-level rule raises on a valid encoding are counted under the rule."""
    problems = []
    for what, key, bad in (('result', 'result', lambda v: v != 1),
                           ('error flags', 'errorFlags', bool),
                           ('bits left over', 'remainingBits', bool)):
        hit = [(p, (out.get(p) or {}).get(key)) for p in PASSES
               if bad((out.get(p) or {}).get(key))]
        if not hit:
            continue
        if key == 'errorFlags' and notes & FLAGGING_RULES:
            stats.rule('flags 0x%x under %s' % (hit[0][1], '+'.join(sorted(notes))), hexmsg)
            continue
        problems.append('%s: %s' % (what, ', '.join('%s %s' % (p, hex(v) if key == 'errorFlags'
                                                             else v) for p, v in hit)))
    covered = set()
    for f in (out.get('md') or {}).get('fields', []):
        for first, last, _ in f.get('spans') or []:
            covered.update(range((first - 1) // 8, (last - 1) // 8 + 1))
    lo, hi = arg_range
    gaps = [o for o in range(lo, hi) if o not in covered]
    if gaps:
        problems.append('argument octets not in any field: %s' % _ranges(gaps))
    c = stats.compared.setdefault('coverage: op %d' % op, [0, 0])
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
def check(corpus, pdml, oracle, ours, parse_node, tcap_rules):
    """corpus [(group, hex)], tshark's PDML fields and oracle summaries, our
    four-pass outputs; parse_node: BER reader; tcap_rules(data, root, ora)
    -> set of TCAP-level rule names (oracle_compare's expectations)."""
    stats = Stats()
    for (group, hexmsg), tfields, ora, out in zip(corpus, pdml, oracle, ours):
        op = int(group.split('/')[0])
        data = bytes.fromhex(hexmsg)
        root = parse_node(data, 0)
        notes = tcap_rules(data, root, ora)
        if notes & {'msg-indefinite', 'dialogue-indefinite'}:
            stats.rule('components-not-reached', hexmsg)
            continue
        rng = argument_range(root)
        if rng is None:
            stats.failures.append(('corpus', op, 'no argument found', hexmsg))
            continue
        if op == 56:
            stats.rule('opcode-56-not-decoded-by-tshark', hexmsg)
        else:
            if op == 0 and b'\xbf\x3b' in data[rng[0]:rng[1]]:
                stats.rule('idp-extension-tags', hexmsg)
            compare_values(op, hexmsg, tfields, out.get('md') or {}, rng, stats)
        check_coverage(op, hexmsg, out, rng, stats, notes)
    return stats


def report(stats, show):
    """Summary lines and the number of disagreements."""
    lines = ['call-control arguments (value: agreed / compared):']
    bad = 0
    for key in sorted(stats.compared, key=lambda k: (k.startswith('coverage'), k)):
        n, a = stats.compared[key]
        lines.append('  %-48s %6d / %-6d%s' % (key, a, n, '' if a == n else
                                                 '  <-- %d differ' % (n - a)))
    if stats.rules:
        lines.append('call-control rules (our rules, tshark differs; messages, example):')
        for key in sorted(stats.rules):
            cnt, ex = stats.rules[key]
            lines.append('  %-36s %6d  %s' % (key, cnt, RULE_TEXT.get(key, '')))
            lines.append('  %36s         e.g. %s' % ('', ex if len(ex) <= 120 else ex[:117] + '...'))
    for name in sorted(stats.by_value):
        for (want, got), (cnt, op, hexmsg) in sorted(stats.by_value[name].items(),
                                                   key=lambda kv: -kv[1][0])[:show]:
            bad += cnt
            lines.append('  DIFFER %s: expected %s, ours %s (%d, e.g. op %d)\n      %s'
                         % (name, want, got, cnt, op, hexmsg))
    seen = {}
    for what, op, text, hexmsg in stats.failures:
        bad += 1
        k = (op, text.split(':')[0])
        if seen.get(k, 0) < max(1, show // 4):
            seen[k] = seen.get(k, 0) + 1
            lines.append('  FAIL %s op %d: %s\n      %s' % (what, op, text, hexmsg))
    return lines, bad
