"""Argument, result and error values: random messages built from the area
tables (areas.py), their values as tshark shows them, and the same values as
dpx-decode reports them.

Each area describes its operations' arguments once, in a small notation
read by `build`:

    value := term ['+' term ...]   the terms' octets one after the other
    term  := '{' row, ... '}'      SEQUENCE or SET contents: each row present
                                   with its probability (default 1)
           | '<' row, ... '>'      CHOICE: one row, picked by weight
           | '[' TAG lo hi value ']'   lo..hi repetitions of TAG value
           | '(' TAG value ')'     one element
           | name | name(args)     a named type (areas.TYPES) or a typed value
                                   generator (GEN); args: numbers, lo..hi, a|b|c
    row   := TAG [probability or weight] value      TAG '-': no identifier

Two checks run over the messages:

* values: tshark's PDML gives every shown field with its octet position;
  the area's rows say which of our decoded-field ids show the same value
  and how tshark's value is normalised.  A tshark field is paired with our
  field of a listed id in the same octets, so a value is compared with the
  one that comes from the same bits.
* coverage: every message decodes in the four passes with result 1, no
  error flag and no bits left over, and every octet of the payload (the
  Invoke's argument, the Return Result's SEQUENCE, the Return Error's code
  and parameter) lies in the bit span of a reported field.

Where our decoder's rules make a value differ from tshark's, the expected
value is tshark's adjusted by the named rule.
"""

import random
import re
import xml.etree.ElementTree as ET

C = None            # capgen, set by init()


def init(capgen):
    global C
    C = capgen


# --------------------------------------------------------------------------
# Typed value generators: rng -> content octets
# --------------------------------------------------------------------------
# C._digits: digits never starting with 8 (tshark's E.164 code trips on "883x")
def octets(rng, lo, hi):
    return bytes(rng.randrange(256) for _ in range(rng.randint(lo, hi)))


def one(*values):
    """One octet chosen from values (a range: every value in it)."""
    pool = [v for x in values for v in (x if isinstance(x, range) else (x,))]
    return lambda rng: bytes([rng.choice(pool)])


def ints(*ranges):
    """INTEGER content: a random one of ranges, then a value in it."""
    return lambda rng: C.int_content(rng.randint(*rng.choice(ranges)))


def uint(lo, hi):
    """INTEGER content of a value in one of a few magnitudes between lo and hi."""
    def f(rng):
        top = rng.choice([min(hi, 127), min(hi, 65535), hi])
        return C.int_content(rng.randint(lo, max(lo, top)))
    return f


def isup_number(kind, lo):
    """ISUP number: odd/even and nature of address, then INN and numbering
    plan (called), NI, plan, presentation and screening (calling layout), or
    plan and presentation (original called / redirecting)."""
    def f(rng):
        d = C._digits(rng, lo, 16)
        first = C._oe(d) | rng.choice([1, 2, 3, 4, rng.randint(0, 127)])
        if kind == 'original':
            second = (rng.randint(0, 7) << 4) | (rng.choice([0, 0, 1, 3]) << 2)
        else:
            second = (rng.randint(0, 1) << 7) | (rng.randint(0, 7) << 4)
        if kind == 'calling':
            second |= (rng.choice([0, 0, 1, 3]) << 2) | rng.randint(0, 3)
        return bytes([first, second]) + C.bcd_isup(d)
    return f


isup_called, isup_calling = isup_number('called', 1), isup_number('calling', 2)
isup_original = isup_number('original', 1)


def generic_number(qualifier=None):
    return lambda rng: bytes([rng.randint(0, 10) if qualifier is None else qualifier]) \
        + isup_calling(rng)


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


def address_string(lo=6, hi=15):
    return lambda rng: bytes([0x80 | (rng.randint(0, 7) << 4)
                              | rng.choice([1, 1, 0, 3, 4, 6, 8, 9])]) \
        + C.tbcd(C._digits(rng, lo, hi))


def imsi(rng):
    mcc, mnc = rng.choice([('262', '01'), ('234', '15'), ('310', '410'), ('208', '10')])
    n = rng.choice([14, 15, 15]) - len(mcc) - len(mnc)
    return C.tbcd(mcc + mnc + C._digits(rng, n, n))


def plmn_lac(rng):
    mcc = '%d%d%d' % (rng.randint(2, 7), rng.randint(0, 9), rng.randint(0, 9))
    mnc = '%02d' % rng.randint(0, 99) if rng.random() < .6 else '%03d' % rng.randint(0, 999)
    return C.plmn(mcc, mnc) + rng.randint(0, 65535).to_bytes(2, 'big')


def when(rng):
    """Year, month, day, hour, minute, second."""
    return [rng.randint(lo, hi) for lo, hi in ((2000, 2030), (1, 12), (1, 28), (0, 23),
                                               (0, 59), (0, 59))]


def service_key(*tops):
    """INTEGER content of a value up to one of tops (each drawn, one kept)."""
    tops = tops or (255, 65535, 2 ** 31 - 1)
    return lambda rng: C.int_content(rng.choice([rng.randint(0, t) for t in tops]))


def octs(*values):
    """Octets, each a constant, one of a few (a list) or in a range (lo, hi)."""
    return lambda rng: bytes(v if isinstance(v, int) else rng.choice(v) if isinstance(v, list)
                             else rng.randint(*v) for v in values)


def generic_digits(rng):
    """Type of digits (bits 5-1), encoding scheme (bits 8-6), BCD digits
    (low half first) or binary octets."""
    scheme = rng.choice((0, 1, 3))
    head = bytes([(scheme << 5) | rng.randint(0, 31)])
    if scheme in (0, 1):
        n = rng.randint(1, 8) * 2 - (scheme == 1)
        return head + C.bcd_isup(C._digits(rng, n, n))
    return head + octets(rng, 1, 8)


def validity_period(rng):
    """Relative (one octet) or absolute (swapped BCD year to second, then the
    time zone's quarters with the sign in bit 4)."""
    if rng.random() < .5:
        return bytes([rng.randrange(256)])
    quarters = rng.randint(0, 79)
    tz = (quarters % 10) << 4 | rng.randint(0, 1) << 3 | quarters // 10
    out = []
    for lo, hi in ((0, 99), (1, 12), (1, 28), (0, 23), (0, 59), (0, 59)):
        v = rng.randint(lo, hi)
        out.append((v % 10) << 4 | v // 10)
    return bytes(out + [tz])


def apn(rng):
    labels = [''.join(rng.choice('abcdefghijklmnopqrstuvwxyz0123456789-')
                      for _ in range(rng.randint(1, 12))) for _ in range(rng.randint(1, 4))]
    return C.apn('.'.join(labels))


def pick(*hexes):
    """A constant, or one of a few."""
    return lambda rng: bytes.fromhex(rng.choice(hexes))


GEN = {  # name -> builder; with (arguments): name -> factory of a builder
    'null': lambda rng: b'', 'one': one, 'ints': ints, 'uint': uint,
    'int': lambda lo, hi: (lambda rng: C.int_content(rng.randint(lo, hi))),
    'oct': lambda lo, hi: (lambda rng: octets(rng, lo, hi)), 'hex': pick,
    'gnum': generic_number, 'addr': address_string, 'called': isup_called,
    'calling': isup_calling, 'original': isup_original, 'cause': cause, 'bearer': bearer_cap,
    'imsi': imsi, 'lai': plmn_lac,
    'time': lambda rng: C.time_and_timezone(*when(rng), rng.randint(-47, 56)),
    'dtime': lambda rng: C.date_and_time(*when(rng)),
    'cell': lambda rng: plmn_lac(rng) + rng.randint(0, 65535).to_bytes(2, 'big'),
    'skey': service_key, 'octs': octs,
    'gdigits': generic_digits, 'validity': validity_period, 'apn': apn,
    'tbcd': lambda lo, hi: (lambda rng: C.tbcd(C._digits(rng, lo, hi))),
    'redirection': lambda rng: bytes([(rng.randint(0, 3) << 4) | rng.randint(0, 6),
                                      (rng.randint(0, 6) << 4) | rng.randint(1, 5)]),
    'text': lambda lo, hi: (lambda rng: bytes(rng.randint(0x20, 0x7E)
                                              for _ in range(rng.randint(lo, hi)))),
}
DEFAULTS = ('addr', 'gnum', 'skey')      # factories also named without arguments


# --------------------------------------------------------------------------
# The notation -> builder (rng -> octets)
# --------------------------------------------------------------------------
TOKEN = re.compile(r'[{}<>\[\](),+]|[^\s{}<>\[\](),+]+')


def build(text, types, memo):
    """The builder of one row written 'TAG value' or '- value' (an argument),
    with the named types of its area."""
    toks = TOKEN.findall(text) + ['']
    pos = [0]

    def nxt():
        pos[0] += 1
        return toks[pos[0] - 1]

    def rows(close):
        out = []
        while True:
            tag = nxt()
            w = float(nxt()) if re.fullmatch(r'\d*\.?\d+', toks[pos[0]]) else 1
            out.append((w, None if tag == '-' else bytes.fromhex(tag), value()))
            if nxt() == close:
                return out

    def value():
        b = term()
        while toks[pos[0]] == '+':
            nxt()
            b = (lambda x, y: lambda rng: x(rng) + y(rng))(b, term())
        return b

    def term():
        t = nxt()
        if t == '(':
            tag, b = bytes.fromhex(nxt()), value()
            nxt()
            return lambda rng: wrap(tag, b(rng))
        if t == '{':
            rs = rows('}')
            return lambda rng: b''.join(wrap(tag, b(rng)) for p, tag, b in rs
                                        if rng.random() < p)
        if t == '<':
            rs = rows('>')

            def choose(rng):
                _, tag, b = rng.choices(rs, weights=[r[0] for r in rs])[0]
                return wrap(tag, b(rng))
            return choose
        if t == '[':
            tag, lo, hi, b = nxt(), int(nxt()), int(nxt()), value()
            tag = None if tag == '-' else bytes.fromhex(tag)
            nxt()
            return lambda rng: b''.join(wrap(tag, b(rng)) for _ in range(rng.randint(lo, hi)))
        if toks[pos[0]] == '(':
            args = []
            while nxt() != ')':
                a = nxt()
                args.append(a if t == 'hex' else None if a == 'None' else
                            (int(a.split('..')[0]), int(a.split('..')[1])) if '..' in a
                            else [int(v, 0) for v in a.split('|')] if '|' in a else int(a, 0))
            if t == 'one':
                args = [range(a[0], a[1] + 1) if isinstance(a, tuple) else a for a in args]
            return GEN[t](*args)
        if t in types:
            if t not in memo:
                memo[t] = build('- ' + types[t], types, memo)
            return lambda rng: memo[t](rng)
        return GEN[t]() if t in DEFAULTS else GEN[t]

    tag = nxt()
    b = value()
    return b if tag == '-' else (lambda rng: wrap(bytes.fromhex(tag), b(rng)))


def wrap(tag, content):
    return content if tag is None else C.tlv(tag, content)


# --------------------------------------------------------------------------
# Normalisers: one shown tshark field -> the value our field must report,
# f(show, off, size, data) -> (value, rule or None).  A value None: our
# field must not be reported.  Named in the rows as NAME or NAME:ARG:...
# --------------------------------------------------------------------------
def nibbles(octets):
    return ''.join('%x%x' % (b & 15, b >> 4) for b in octets)


def plmn_at(data, p):
    """(mcc, mnc as our decoder shows it, lac) of an MCC-MNC-LAC block."""
    o1, o2, o3 = data[p], data[p + 1], data[p + 2]
    mcc = '%x%x%x' % (o1 & 15, o1 >> 4, o2 & 15)
    mnc = '%x%x' % (o3 >> 4, o3 & 15) + ('' if o2 >> 4 == 15 else '%x' % (o2 >> 4))
    return mcc, mnc, int.from_bytes(data[p + 3:p + 5], 'big')


def n_octet(show, off, size, data):
    """The octet itself: tshark shows some one-octet values through a
    mis-sized integer (category 0x0b as 4294967290 in some arguments)."""
    return data[off], (None if show == str(data[off]) else 'tshark-shows-octet-garbled')


def n_half_octets(rule, filler):
    """Digits where our decoder shows every half-octet (an odd count ends
    with the filler digit; TBCD: the filler half-octet shown as f)."""
    def f(show, off, size, data):
        full = nibbles(data[off:off + size])
        if show.lower() == full[:-1] and (not filler or full.endswith('f')):
            return full, rule
        return show.lower(), None
    return f


def n_mnc(show, off, size, data):
    """tshark shows the MNC as a number (01 as 1) from octets 2-3 of the
    MCC-MNC block; ours shows its digits in span order: octet 3 bits 8-5,
    bits 4-1, then (three digits) octet 2 bits 8-5."""
    o2, o3 = data[off], data[off + 1]
    real = '%x%x' % (o3 & 15, o3 >> 4) + ('' if o2 >> 4 == 15 else '%x' % (o2 >> 4))
    if int(show) != int(real):
        return show, None
    ours = plmn_at(data, off - 1)[1]
    return ours, ('mnc-high-half-first' if ours != real else None)


def n_cgi(part):
    """A cell or location area id shown by tshark as octets: its parts."""
    def f(show, off, size, data):
        mcc, mnc, lac = plmn_at(data, off)
        rule = 'mnc-high-half-first' if part == 'mnc' and mnc[0] != mnc[1] else None
        return {'mcc': mcc, 'mnc': mnc, 'lac': lac,
                'ci': int.from_bytes(data[off + 5:off + 7], 'big')}[part], rule
    return f


TIME_PARTS = ('year', 'month', 'day', 'hour', 'minute', 'second')


def n_time(part):
    """Time and time zone, shown by tshark as octets.  Year to second:
    half-octets low first, read as hexadecimal digits; the zone: sign in bit
    8, value in bits 7-1 (3GPP codes the zone as swapped BCD quarters with
    the sign in bit 4, so our reading differs from the zone's meaning)."""
    def f(show, off, size, data):
        b = data[off:off + size]
        if part in TIME_PARTS:
            i = TIME_PARTS.index(part) + 1
            return int(nibbles(b[0:2] if i == 1 else b[i:i + 1]), 16), None
        tz = b[7]
        real = (1 if tz & 0x08 else 0, (tz & 0x07) * 10 + (tz >> 4))
        mine = (tz >> 7, tz & 0x7F)
        return mine[part == 'zone'], ('time-zone-bit-layout' if mine != real else None)
    return f


def n_validity(part):
    """A validity period: one octet relative, seven absolute (swapped BCD
    year to second, zone tens in bits 3-1, sign in bit 4, units in bits
    8-5); None for the form the period does not have."""
    def f(show, off, size, data):
        b = data[off:off + size]
        if part == 'relative':
            return (b[0] if size == 1 else None), None
        if size != 7:
            return None, None
        if part in TIME_PARTS:
            o = b[TIME_PARTS.index(part)]
            return (o & 15) << 4 | o >> 4, None
        return (b[6] >> 3 & 1 if part == 'sign' else (b[6] & 7) << 4 | b[6] >> 4), None
    return f


def n_bits(offset, width, shift=0, values=None):
    """Bits offset+1 .. offset+width of the octet tshark shows; None when the
    octet's layout (its bits from shift+1 up, in values lo..hi) lacks them."""
    def f(show, off, size, data):
        b = data[off]
        if values is not None and not values[0] <= b >> shift <= values[1]:
            return None, None
        return (b >> offset) & ((1 << width) - 1), None
    return f


def n_generic_digits(show, off, size, data):
    """Generic Digits (the type-of-digits octet first): BCD digits low half
    first, every half-octet, or the binary octets in hexadecimal."""
    b = data[off:off + size]
    return (nibbles(b[1:]) if b[0] >> 5 in (0, 1) else b[1:].hex()), None


def n_capped(limit, rule):
    """A value our decoder reads from at most `limit` octets (the rest is
    left over, flag 0x10): as octets (gap interval: as a number)."""
    def f(show, off, size, data):
        b = data[off:off + min(size, limit)]
        return (int.from_bytes(b, 'big') if limit == 2 else b.hex()), \
            (rule if size > limit else None)
    return f


NORMS = {
    'int': lambda base='0': lambda show, off, size, data: (int(show, int(base)), None),
    'int8': lambda show, off, size, data: (int(show) % 256, None),      # shown signed
    'bool': lambda show, off, size, data: (int(show, 0) != 0, None),
    'digits': lambda show, off, size, data: (show.lower(), None),
    'const': lambda v: lambda show, off, size, data: (int(v), None),
    # the octets tshark's field covers; octets:N: from N octets after its
    # start (a BIT STRING's field starts after the unused-bits octet, an
    # explicitly tagged CHOICE's at its inner value, ours at the content)
    'octets': lambda first='0': lambda show, off, size, data: (
        data[off + int(first):off + size].hex(), None),
    # a value shown by tshark as octets, read as one unsigned number (of at
    # most N octets)
    'uint': lambda n=None: lambda show, off, size, data: (
        int.from_bytes(data[off:off + (size if n is None else int(n))], 'big'), None),
    'at': lambda i: lambda show, off, size, data: (data[off + int(i)], None),
    'octet': n_octet, 'mnc': n_mnc, 'cgi': n_cgi, 'time': n_time, 'validity': n_validity,
    'halves': n_half_octets('digits-all-half-octets', False),
    'filler': n_half_octets('tbcd-filler-shown', True),
    # call stop time: octets as on the wire, the year one 16-bit read, low
    # octet first (tshark: 'hh:mm:ss;dd/mm/yyyy' from swapped BCD)
    'stop': lambda i: lambda show, off, size, data: (
        int.from_bytes(data[off:off + 2], 'little') if i == '0' else data[off + int(i) + 1],
        'stop-time-octets'),
    'bits': lambda *a: n_bits(*[int(x) for x in a[:3]],
                              *([tuple(int(v) for v in a[3].split('-'))] if len(a) > 3 else [])),
    'gdigits': n_generic_digits,
    'gapinterval': n_capped(2, 'gap-interval-two-octets'),
    'freeformat': n_capped(52, 'free-format-data-52-octets'),
    # a CHOICE tshark shows by its index: the identifier [n] constructed
    'choice': lambda show, off, size, data: (0xA0 + int(show), None),
}
FACTORIES = ('int', 'const', 'octets', 'uint', 'at', 'cgi', 'time', 'validity', 'stop', 'bits')


def normaliser(spec):
    name, *args = spec.split(':')
    return NORMS[name](*args) if name in FACTORIES else NORMS[name]


def o_value(f, want):
    """Our field as a value of the kind of `want`: digits (every span as
    hexadecimal digits, one per half-octet), a truth value, or a number."""
    if isinstance(want, str):
        return ''.join('%0*x' % ((s[1] - s[0] + 4) // 4, s[2]) for s in f['spans'])
    v = 0
    for first, last, val in f['spans']:
        v = (v << (last - first + 1)) | val
    return v != 0 if isinstance(want, bool) else v


def read_rows(text, area):
    """The rows of one area from the value table: name, containers (None:
    anywhere), tshark field names, our field ids, normaliser, octet shift
    from tshark's field to ours.  Names without a dot are camel's."""
    def names(s):
        return tuple(n if '.' in n else 'camel.' + n for n in s.split())
    out = []
    for line in text.strip().splitlines():
        cols = [c.strip() for c in line.split('|')]
        if area not in cols[0]:
            continue
        try:
            out.append((cols[1], names(cols[2]) or None, names(cols[3]),
                        {int(i) for i in cols[4].split()}, normaliser(cols[5]),
                        int(cols[6]) if len(cols) > 6 else 0))
        except (KeyError, ValueError, IndexError, TypeError) as exc:
            raise ValueError('value row %r: %r' % (line, exc)) from None
    return out


# --------------------------------------------------------------------------
# BER structure of a generated message (well-formed by construction)
# --------------------------------------------------------------------------
class Node:
    """One element: identifier, offset, indefinite length, end (after any
    end-of-contents) and the elements inside it."""
    __slots__ = ('tag', 'off', 'indef', 'end', 'kids')

    def kid(self, tag):
        return next((k for k in self.kids if k.tag == tag), None)


def parse_message(data):
    """The message's element tree, from capgen's strict BER reader."""
    path = []
    for off, header, length, _, depth, tag, content_end in C.parse_ber(data):
        n = Node()
        n.tag, n.off, n.indef, n.kids = int.from_bytes(tag, 'big'), off, length is None, []
        n.end = content_end + 2 * n.indef
        del path[depth:]
        if path:
            path[-1].kids.append(n)
        path.append(n)
    return path[0]


# --------------------------------------------------------------------------
# tshark's PDML -> per message: [(field name, show, offset, size)], offsets
# counted from the first octet of the TCAP message
# --------------------------------------------------------------------------
def read_pdml(path):
    out = []
    root = None
    for ev, el in ET.iterparse(path, events=('start', 'end')):
        if root is None:
            root = el
        if ev == 'start' or el.tag != 'packet':
            continue
        base = next((int(p.get('pos')) for p in el if p.get('name') == 'tcap'), None)
        fields = []
        for f in el.iter('field') if base is not None else ():
            name = f.get('name')
            if name and not name.startswith('_ws.') and f.get('pos') is not None \
                    and int(f.get('pos')) >= base:
                fields.append((name, f.get('show'), int(f.get('pos')) - base,
                               int(f.get('size') or 0)))
        out.append(fields)
        root.clear()
    return out


# --------------------------------------------------------------------------
# Comparison and coverage
# --------------------------------------------------------------------------
class Stats:
    def __init__(self):
        self.compared = {}         # value -> [compared, agreed]
        self.rules = {}            # rule -> [count, example hex]
        self.failures = []         # (what, label, text, hex)
        self.by_value = {}         # value -> {(expected, got): [count, label, example hex]}

    def rule(self, name, hexmsg):
        self.rules.setdefault(name, [0, hexmsg])[0] += 1

    def count(self, key, ok):
        c = self.compared.setdefault(key, [0, 0])
        c[0] += 1
        c[1] += bool(ok)

    def value(self, name, want, have, label, hexmsg):
        """One compared value; the differences are grouped by value."""
        self.count(name, have == want)
        if have != want:
            key = (repr(want), 'not reported' if have is None else repr(have))
            self.by_value.setdefault(name, {}).setdefault(key, [0, label, hexmsg])[0] += 1


def compare_values(label, hexmsg, tfields, md, payload, rows, stats):
    """tfields: tshark's fields of one message; md: our decoded-field pass.
    -> the rules applied."""
    data = bytes.fromhex(hexmsg)
    lo, hi = payload
    ours = [((f['spans'][0][0] - 1) // 8, f) for f in md.get('fields', []) if f.get('spans')]
    tf = [t for t in tfields if lo <= t[2] < hi]
    rules = set()
    for name, containers, tnames, ids, norm, shift in rows:
        boxes = containers and [(o, o + s) for n, _, o, s in tf if n in containers]
        for tname, show, off, size in tf:
            if tname not in tnames or show is None or \
                    (containers and not any(a <= off < b for a, b in boxes)):
                continue
            try:
                want, rule = norm(show, off, size, data)
            except (ValueError, IndexError) as exc:
                stats.failures.append(('tshark value', label, '%s: %s %r not understood (%s)'
                                       % (name, tname, show, exc), hexmsg))
                continue
            rules.add(rule)
            a, b = off + shift, off + shift + max(size, 1)
            mine = [f for o, f in ours if f['id'] in ids and a <= o < b]
            stats.value(name, want, o_value(mine[0], want) if mine else None, label, hexmsg)
    rules.discard(None)
    return rules


PASSES = ('md', 'display', 'view', 'keys')
# Rules of ours that leave bits of a valid message unread, and the error
# flags they raise: TCAP-level ones around the payload ...
FLAGGING_RULES = {'asn1-indefinite': 0x12, 'pdu-indefinite': 0x10, 'invoke-indefinite': 0x10,
                  'component-indefinite': 0x10, 'external-indefinite': 0x10}
# ... and inside the payload, where they also leave octets out of any field.
FLAGGING_PAYLOAD_RULES = {'gap-interval-two-octets': 0x10, 'result-sequence-indefinite': 0x10,
                          'free-format-data-52-octets': 0x10,
                          'call-attempt-result-three-members': 0x10}


def check_coverage(label, hexmsg, out, payload, stats, flagging):
    """Four passes: result 1, no error flag, no bits left over; every octet of
    the payload inside a reported field's bit span.  Error flags (and, for a
    rule inside the payload, the octets it skips) that a rule of ours raises
    on a valid encoding are counted under the rule."""
    problems = []
    for what, key, bad in (('result', 'result', lambda v: v != 1),
                           ('error flags', 'errorFlags', bool),
                           ('bits left over', 'remainingBits', bool)):
        hit = [(p, (out.get(p) or {}).get(key)) for p in PASSES
               if bad((out.get(p) or {}).get(key))]
        allowed = 0
        for r in flagging:
            allowed |= FLAGGING_RULES.get(r, 0) | FLAGGING_PAYLOAD_RULES.get(r, 0)
        if hit and key == 'errorFlags' and all(v & ~allowed == 0 for _, v in hit):
            for r in flagging:
                stats.rule('flags accepted under %s' % r, hexmsg)
        elif hit:
            problems.append('%s: %s' % (what, ', '.join(
                '%s %s' % (p, hex(v) if key == 'errorFlags' else v) for p, v in hit)))
    covered = set()
    for f in (out.get('md') or {}).get('fields', []):
        for first, last, _ in f.get('spans') or []:
            covered.update(range((first - 1) // 8, (last - 1) // 8 + 1))
    gaps = [o for o in range(*payload) if o not in covered]
    skipping = flagging & set(FLAGGING_PAYLOAD_RULES)
    for r in skipping if gaps else ():
        stats.rule('octets skipped under %s' % r, hexmsg)
    if gaps and not skipping:
        problems.append('payload octets not in any field: %s' % ranges(gaps))
    stats.count('coverage: %s' % label, not problems)
    for what in problems[:3]:
        stats.failures.append(('coverage', label, what, hexmsg))


def ranges(octets):
    out = []
    for o in octets:
        if out and out[-1][1] == o - 1:
            out[-1][1] = o
        else:
            out.append([o, o])
    return ','.join('%d' % a if a == b else '%d-%d' % (a, b) for a, b in out[:6]) + \
        (' ...' if len(out) > 6 else '')


def payload(root, stats, hexmsg):
    """(first, end, rule names) of the checked octets of the message's
    component: an Invoke's argument, a Return Result's SEQUENCE, a Return
    Error's code and parameter; None if the message holds none."""
    cp = root.kid(0x6C)
    comp = cp.kids[0] if cp is not None and cp.kids else None
    first = 2 if comp is not None and comp.tag == 0xA1 else 1
    if comp is None or comp.tag not in (0xA1, 0xA2, 0xA3) or len(comp.kids) <= first:
        return None
    notes = set()
    if comp.indef:
        notes.add('invoke-indefinite' if comp.tag == 0xA1 else 'component-indefinite')
    dlg = root.kid(0x6B)
    if dlg is not None and not dlg.indef and dlg.kids and dlg.kids[0].indef:
        notes.add('external-indefinite')
    if comp.tag == 0xA2:
        result = comp.kids[1]
        if result.indef:
            notes.add('result-sequence-indefinite')
        if len(result.kids) > 1 and any(k.tag == 0x83 for k in result.kids[1].kids):
            notes.add('call-attempt-result-three-members')
    return comp.kids[-1 if comp.tag == 0xA1 else 1].off, comp.kids[-1].end, notes


def check(area, corpus, pdml, oracle, ours, tcap_rules):
    """corpus [(label, hex)], tshark's PDML fields and oracle summaries, our
    four-pass outputs; tcap_rules(data, root, ora)
    -> TCAP-level rule names (oracle_compare's expectations)."""
    stats = Stats()
    rows = area['rows']
    for (label, hexmsg), tfields, ora, out in zip(corpus, pdml, oracle, ours):
        data = bytes.fromhex(hexmsg)
        root = parse_message(data)
        for tname, rule in area.get('field_rules', {}).items():
            if any(t[0] == tname for t in tfields):
                stats.rule(rule, hexmsg)
        notes = tcap_rules(data, root, ora)
        if notes & {'msg-indefinite', 'dialogue-indefinite'}:
            stats.rule('components-not-reached', hexmsg)
            continue
        found = payload(root, stats, hexmsg)
        if found is None:
            stats.failures.append(('corpus', label, 'no payload found', hexmsg))
            continue
        lo, hi, more = found
        notes |= more
        for r in more & set(FLAGGING_PAYLOAD_RULES):
            stats.rule(r, hexmsg)
        hidden = [(k.off, k.end) for k in root.kid(0x6C).kids[0].kids[-1].kids
                  if k.tag in area.get('hidden', ())]
        tfields = [t for t in tfields if not any(a <= t[2] < b for a, b in hidden)]
        rules = set()
        if label in area.get('not_decoded_by_tshark', {}):
            stats.rule(area['not_decoded_by_tshark'][label], hexmsg)
        else:
            rules = compare_values(label, hexmsg, tfields, out.get('md') or {}, (lo, hi),
                                   rows, stats)
        for r in rules:
            stats.rule(r, hexmsg)
        check_coverage(label, hexmsg, out, (lo, hi), stats,
                       (notes | rules) & (set(FLAGGING_PAYLOAD_RULES) | set(FLAGGING_RULES)))
    return stats


def report(title, stats, rows, rules, rule_text, show=20):
    """Summary lines and the number of disagreements: every compared value
    (agreed / compared), every named rule with its count, the differences;
    a row never compared and a named rule never needed are failures."""
    missing = ['NEVER COMPARED %s: tshark showed it nowhere (table or corpus wrong?)' % r
               for r in rows if r not in stats.compared] + \
        ['RULE NEVER APPLIED %s: no message needed it (rule or corpus wrong?)' % r
         for r in rules if r not in stats.rules]
    lines = ['%s (value: agreed / compared; rule: messages):' % title] + \
        ['  ' + m for m in missing]
    bad = len(missing)
    for key in sorted(stats.compared, key=lambda k: (k.startswith('coverage'), k)):
        n, a = stats.compared[key]
        lines.append('  %-48s %6d / %-6d%s' % (key, a, n, '' if a == n else
                                                 '  <-- %d differ' % (n - a)))
    for key in sorted(set(rules) | set(stats.rules)):
        lines.append('  rule %-43s %6d  %s' % (key, stats.rules.get(key, [0])[0],
                                               rule_text.get(key, '')))
    for name in sorted(stats.by_value):
        bad += sum(v[0] for v in stats.by_value[name].values())
        for (want, got), (cnt, label, hexmsg) in sorted(stats.by_value[name].items(),
                                                      key=lambda kv: -kv[1][0])[:show]:
            lines.append('  DIFFER %s: expected %s, ours %s (%d, e.g. %s)\n      %s'
                         % (name, want, got, cnt, label, hexmsg))
    seen = {}
    for what, label, text, hexmsg in stats.failures:
        bad += 1
        k = (label, text.split(':')[0])
        if seen.get(k, 0) < max(1, show // 4):
            seen[k] = seen.get(k, 0) + 1
            lines.append('  FAIL %s %s: %s\n      %s' % (what, label, text, hexmsg))
    lines.append('PASSED (%s)' % title if not bad else 'FAILED (%s): %d disagreements'
                 % (title, bad))
    return lines, bad


# --------------------------------------------------------------------------
# Corpus
# --------------------------------------------------------------------------
PARTS = ('ext', 'asn1', 'pdu', 'cp', 'comp')


def length_forms(i, rng, parts=PARTS):
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


def wrap_component(rng, component, acn, indef, kinds):
    """One component in a random message of one of kinds, with or without a
    dialogue portion."""
    msg = rng.choice(kinds)
    dlg = None
    if rng.random() < .6:
        pdu = 'audt' if msg == 'unidirectional' else ('aarq' if msg == 'begin' else 'aare')
        dlg = C.dialogue_portion(pdu, acn, indef=indef)
    otid, dtid = rng.getrandbits(32), rng.getrandbits(32)
    m = {'begin': lambda: C.tcap_begin(otid, dlg, [component], indef),
         'continue': lambda: C.tcap_continue(otid, dtid, dlg, [component], indef),
         'end': lambda: C.tcap_end(dtid, dlg, [component], indef),
         'unidirectional': lambda: C.tcap_unidirectional([component], dlg, indef)}[msg]()
    return C.hx(m)


EVERYWHERE = ('begin', 'continue', 'end', 'unidirectional')


def build_corpus(area, per_op, seed):
    """per_op messages per operation, result and error code of the area:
    half of them with indefinite TCAP-level lengths; the payload is always
    definite.  -> [(label, hex)]"""
    types, memo, out = area['types'], {}, []
    errors = area.get('errors')
    if errors is not None:      # every error code; the parameter of those that carry one
        errors = {code: errors.get(code, '- null') for code in C.ERRORS.values()}
    for kind, base, specs in (('op', 0, area['ops']), ('result', 300, area.get('results', {})),
                              ('error', 500, errors or {})):
        for code, spec in sorted(specs.items()):
            rng = random.Random(seed * 1000 + area['seed'] + base + code)
            text = spec if isinstance(spec, str) else spec[1]
            try:
                b = build(text, types, memo)
            except (KeyError, ValueError, IndexError, TypeError) as exc:
                raise ValueError('%s %s %d: notation %r: %r' % (area['name'], kind, code, text,
                                                                exc)) from None
            for i in range(per_op):
                indef = length_forms(i, rng, PARTS + (('seq',) if kind == 'result' else ()))
                if kind == 'op':
                    arg, phase = b(rng), area.get('phase')
                    if code in area.get('plain_null', ()) and i % 3 == 0:
                        # phases 2 and 3 send a plain NULL, in their own dialogues
                        arg, phase = bytes.fromhex('0500'), 2 + i // 3 % 2
                    comp = C.invoke(rng.randint(-128, 127), code, arg, indef=indef)
                    acn = C.default_acn(spec[0], phase)
                elif kind == 'result':
                    comp = C.return_result(rng.randint(-128, 127), code, b(rng), indef=indef)
                    acn = C.default_acn(C.OPCODES.get(code, 'initialDP'), 4)
                else:
                    comp = C.return_error(rng.randint(-128, 127), code, b(rng), indef=indef)
                    acn = C.default_acn('applyCharging', 4)
                out.append(('%s %d' % (kind, code), wrap_component(
                    rng, comp, acn, indef, EVERYWHERE if kind == 'op' else ('continue', 'end'))))
    return out
