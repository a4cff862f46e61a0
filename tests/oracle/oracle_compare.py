#!/usr/bin/env python3
"""Compare dpx-decode with an independent reference decoder (tshark).

Builds TCAP/CAMEL messages with capgen.py, decodes them with the reference
wrapper oracle.py (tshark) and with `dpx-decode --format json --pass md`,
and checks that both agree on the message-level and component-level values:
message type, transaction ids, P-Abort cause, dialogue PDU, application
context name, dialogue result, abort source, and per component its type,
invoke id, linked id, operation code, error code and reject problem.

Our decoder follows its own rules where they differ from tshark (messages
and dialogue [0] wrappers are read with definite lengths only, an
indefinite-length component portion holds at most one component of each
kind, a component list ends at a component it does not know, application
contexts are read arc by arc only down to the CAP generation for CAP v4,
...).  The expectation for each message is therefore tshark's value
adjusted by those rules, worked out from the message's own BER structure;
every adjustment is counted and shown with an example in the summary.

It also decodes malformed variants (capgen mutate) with all four passes and
checks that every pass returns 1, that every reported bit span lies inside
the message and that the decoder does not crash.

The arguments, results and errors of the areas in areas.py (call control;
charging, call gap and announcements; SMS; GPRS) are checked value by value
against tshark on messages with random values, and every octet of each
argument, result or error must lie in a reported field of a clean four-pass
decode (arguments.py).

Exit status: 0 all agree, 1 disagreements or a crash, 77 skipped (the
reference tools or tshark are missing).  Python 3 standard library only.
"""

import argparse
import json
import os
import random
import shutil
import subprocess
import sys
import tempfile
import time
from pathlib import Path

sys.dont_write_bytecode = True     # leave the source and shared tools folders as they are
sys.path.insert(0, str(Path(__file__).resolve().parent))
import arguments  # noqa: E402
import areas  # noqa: E402

SKIP = 77
MSG_TYPES = ('begin', 'continue', 'end', 'abort', 'unidirectional')
TYPE_BY_OCTET = {0x61: 'unidirectional', 0x62: 'begin', 0x64: 'end',
                 0x65: 'continue', 0x67: 'abort'}

# Field ids of the decoded-field pass (see src/fields/field_table.h).
F_MT = 3604
F_OTID, F_DTID = 3653, 3656
F_PABORT = 3659
F_DIALOGUE_PDU = 3760          # structured dialogue: the PDU's identifier octet
F_UNI_DIALOGUE_TAG = 3728      # unidirectional dialogue tag (AUDT)
F_RESULT = 3774
F_ABORT_SOURCE = 3785
ACN_ARCS = (3793, 3794, 3795, 3796, 3797)          # 0.4 / 0 / 0 / 1 / cap
ACN_TAILS = ((3799, 3800), (3877, 3878), (3879, 3880))
F_INVOKE, F_RESULT_LAST, F_ERROR, F_REJECT = 3660, 3669, 3685, 3694
F_INVOKE_ID, F_LINKED_ID = 3705, 3708
F_OPCODE, F_RESULT_OPCODE, F_ERROR_CODE = 1066, 1068, 1070
F_PROBLEM_TYPE = 3701

PROBLEM_CODE_FIELDS = {3710: 0x80, 3712: 0x81, 3714: 0x82, 3716: 0x83}

COMPONENT_BY_FIELD = {F_INVOKE: 'invoke', F_RESULT_LAST: 'returnResultLast',
                      F_ERROR: 'returnError', F_REJECT: 'reject'}
COMPONENT_BY_TAG = {0xA1: 'invoke', 0xA2: 'returnResultLast',
                    0xA3: 'returnError', 0xA4: 'reject'}
COMPONENT_ORDER = (0xA1, 0xA2, 0xA3, 0xA4)
PROBLEM_KIND = {0x80: 'general', 0x81: 'invoke', 0x82: 'returnResult',
                0x83: 'returnError'}
DIALOGUE_BY_OCTET = {0x60: 'aarq', 0x61: 'aare', 0x64: 'abrt'}

# Value names our decoder must show next to the values compared here.
DIALOGUE_NAMES = {0x60: 'DialogueRequest', 0x61: 'Dialogue Response',
                  0x64: 'Dialogue Abort'}
RESULT_NAMES = {0: 'Accepted', 1: 'Reject-permanent'}
ABORT_SOURCE_NAMES = {0: 'Dialogue Service User', 1: 'Dialogue Service Provider'}
PABORT_NAMES = {0: 'Unrecognized Message Type', 1: 'Unrecognized Transaction ID',
                2: 'Badly Formatted Trans Part', 3: 'Incorrect Transaction Part',
                4: 'Resource Limitation'}
PROBLEM_TYPE_NAMES = {0x80: 'General Problem', 0x81: 'Invoke',
                      0x82: 'Return Result', 0x83: 'Return Error'}
# Operation codes our operation table names (any other code shows an empty
# name); capgen's collectInformation (27) is not among them.
NAMED_OPCODES = {0, 16, 17, 18, 19, 20, 22, 23, 24, 31, 32, 33, 34, 35, 36, 41,
                 44, 45, 46, 47, 48, 49, 53, 55, 56, 60, 61, 62, 63, 64, 65, 66,
                 67, 70, 71, 72, 73, 74, 75, 76, 77, 78, 79, 80, 81, 82, 83, 86,
                 88, 90, 93, 95, 96, 97}

# What each rule-aware adjustment means (for the summary).
RULE_TEXT = {
    'msg-indefinite': 'indefinite message length: only the message type is decoded',
    'dialogue-indefinite': 'indefinite dialogue portion: its closing EOC is left in '
                           'the message window, so the component portion is not found',
    'asn1-indefinite': 'indefinite [0] single-ASN.1-type wrapper: no dialogue PDU decoded',
    'pdu-indefinite': 'indefinite AARQ/AARE/ABRT: PDU identifier only, no members '
                      '(ACN, result, abort source)',
    'cp-indefinite-kinds': 'indefinite component portion: at most one component of '
                           'each kind, in the order Invoke, ReturnResult, ReturnError, Reject',
    'component-indefinite-ends-list': 'indefinite-length component: the list ends after it',
    'rrnl-ends-list': 'Return Result Not Last (A7) ends the component list',
    'rrnl-hidden-by-tshark': 'Return Result Not Last (A7): tshark shows nothing',
    'reject-null-invoke-id': 'Reject with a NULL (not derivable) invoke id: the NULL '
                             'identifier is read as the problem identifier, no problem code',
    'opcode-unnamed': 'operation code outside our operation table (27 '
                      'collectInformation): value shown with an empty name',
    'argument-read-as-component': 'indefinite Invoke with an indefinite argument '
                                  'SEQUENCE: argument members may be read as components',
    'key-overflow': 'malformed message: a key value does not fit its slot, the '
                    'key-field pass returns 0',
}


class Disagreement(Exception):
    pass


# --------------------------------------------------------------------------
# BER structure of a generated message (well-formed by construction)
# --------------------------------------------------------------------------
class Node:
    __slots__ = ('tag', 'off', 'indef', 'cstart', 'cend', 'end', 'kids')

    def content(self, data):
        return data[self.cstart:self.cend]

    def kid(self, tag):
        for k in self.kids:
            if k.tag == tag:
                return k
        return None


def parse_node(data, pos):
    """One BER element at pos -> Node (children parsed for constructed ones)."""
    n = Node()
    n.off = pos
    first = data[pos]
    p = pos + 1
    if first & 0x1F == 0x1F:
        while data[p] & 0x80:
            p += 1
        p += 1
        n.tag = int.from_bytes(data[pos:p], 'big')
    else:
        n.tag = first
    lb = data[p]
    p += 1
    n.indef = lb == 0x80
    if n.indef:
        length = None
    elif lb & 0x80:
        cnt = lb & 0x7F
        length = int.from_bytes(data[p:p + cnt], 'big')
        p += cnt
    else:
        length = lb
    n.cstart = p
    n.kids = []
    if first & 0x20:
        q = p
        while (q < p + length) if length is not None else not (data[q] == 0 and data[q + 1] == 0):
            k = parse_node(data, q)
            n.kids.append(k)
            q = k.end
        n.cend = q
        n.end = q + 2 if length is None else q
    else:
        n.cend = p + length
        n.end = n.cend
    if n.end > len(data):
        raise ValueError('element at %d runs past the message' % pos)
    return n


# --------------------------------------------------------------------------
# Our decoder's output -> summary
# --------------------------------------------------------------------------
def after_eq(text):
    return text.split('=', 1)[1] if '=' in text else None


def summarize_ours(md):
    """Values of the compared fields from one decoded-field pass.  Problems
    with the rendering (text that does not match the value) go to 'texts'."""
    s = {'type': None, 'otid': None, 'dtid': None, 'p_abort': None, 'dialogue': None,
         'result': None, 'abort_source': None, 'acn': None, 'components': [],
         'texts': []}
    arcs = {}
    comp = None

    def check_name(f, value, names, prefix):
        want = names.get(value, '')
        if f['text'] != prefix + want:
            s['texts'].append('field %d value %d shown %r, expected %r'
                              % (f['id'], value, f['text'], prefix + want))

    def set_once(d, key, value, fid):
        if d.get(key) is not None:
            s['texts'].append('field %d reported twice in one %s'
                              % (fid, 'component' if d is comp else 'message'))
        d[key] = value

    for f in md.get('fields', []):
        fid = f['id']
        spans = f.get('spans') or []
        v = spans[0][2] if spans else None
        if fid == F_MT:
            s['type'] = TYPE_BY_OCTET.get(v, 'octet %02x' % v)
        elif fid in (F_OTID, F_DTID):
            digits = after_eq(f['text'])
            from_spans = ''.join('%x' % sp[2] for sp in spans)
            if digits != from_spans:
                s['texts'].append('field %d text %r, spans give %r' % (fid, f['text'], from_spans))
            set_once(s, 'otid' if fid == F_OTID else 'dtid', digits, fid)
        elif fid == F_PABORT:
            check_name(f, v, PABORT_NAMES, '  P-Abort Cause=')
            set_once(s, 'p_abort', v, fid)
        elif fid == F_DIALOGUE_PDU:
            check_name(f, v, DIALOGUE_NAMES, '  Dialogue PDU=')
            set_once(s, 'dialogue', DIALOGUE_BY_OCTET.get(v, 'octet %02x' % v), fid)
        elif fid == F_UNI_DIALOGUE_TAG:
            set_once(s, 'dialogue', 'audt' if v == 0x60 else 'octet %02x' % v, fid)
        elif fid == F_RESULT:
            check_name(f, v, RESULT_NAMES, '  Result=')
            set_once(s, 'result', v, fid)
        elif fid == F_ABORT_SOURCE:
            check_name(f, v, ABORT_SOURCE_NAMES, '  Abort Source Value=')
            set_once(s, 'abort_source', v, fid)
        elif fid in ACN_ARCS or any(fid in t for t in ACN_TAILS):
            arcs[fid] = v
        elif fid in COMPONENT_BY_FIELD:
            comp = {'type': COMPONENT_BY_FIELD[fid]}
            s['components'].append(comp)
        elif comp is None:
            continue
        elif fid in (F_INVOKE_ID, F_LINKED_ID):
            if after_eq(f['text']) != str(v):
                s['texts'].append('field %d value %d shown %r' % (fid, v, f['text']))
            set_once(comp, 'invoke_id' if fid == F_INVOKE_ID else 'linked_id', v, fid)
        elif fid == F_OPCODE:
            name = after_eq(f['text'])
            if not f['text'].startswith('Operation ID(Invoke)=') or \
                    bool(name) != (v in NAMED_OPCODES):
                s['texts'].append('operation %d shown %r' % (v, f['text']))
            set_once(comp, 'opcode', v, fid)
        elif fid == F_RESULT_OPCODE:
            set_once(comp, 'opcode', v, fid)
        elif fid == F_ERROR_CODE:
            set_once(comp, 'error_code', v, fid)
        elif fid == F_PROBLEM_TYPE:
            check_name(f, v, PROBLEM_TYPE_NAMES, '  Problem Code=')
            set_once(comp, 'problem_type', v, fid)
        elif fid in PROBLEM_CODE_FIELDS:
            set_once(comp, 'problem_code', (PROBLEM_CODE_FIELDS[fid], v), fid)
    for c in s['components']:
        pt, pc = c.pop('problem_type', None), c.pop('problem_code', None)
        if pc is not None and pc[0] != pt:
            s['texts'].append('problem code field of %02x under problem type %r' % (pc[0], pt))
        if pt is not None and pc is not None and pt in PROBLEM_KIND:
            c['problem'] = '%s:%d' % (PROBLEM_KIND[pt], pc[1])
        elif pt is not None or pc is not None:
            c['problem'] = 'type %r code %r' % (pt, pc and pc[1])
    if arcs:
        parts = []
        if 3793 in arcs:
            parts += [str(arcs[3793] // 40), str(arcs[3793] % 40)]
        for fid in ACN_ARCS[1:]:
            if fid in arcs:
                parts.append(str(arcs[fid]))
        for a, b in ACN_TAILS:
            for fid in (a, b):
                if fid in arcs:
                    parts.append(str(arcs[fid]))
        s['acn'] = '.'.join(parts)
    return s


# --------------------------------------------------------------------------
# Expectation: tshark's values adjusted by our decoder's rules
# --------------------------------------------------------------------------
def signed_octet(v):
    return None if v is None else v % 256


def expect(data, root, ora, notes):
    """-> dict like summarize_ours's (without 'texts'), plus 'extra_components_ok'.
    Adds the names of the rules applied to the set notes."""
    tc = ora.get('tcap') or {}
    e = {'type': tc.get('type'), 'otid': None, 'dtid': None, 'p_abort': None,
         'dialogue': None, 'result': None, 'abort_source': None, 'acn': None,
         'components': [], 'extra_components_ok': False}
    if root.indef:
        notes.add('msg-indefinite')
        return e
    uni = root.tag == 0x61
    e['otid'] = (tc.get('otid') or '').lower() or None
    e['dtid'] = (tc.get('dtid') or '').lower() or None
    e['p_abort'] = tc.get('p_abort_cause')

    dlg = root.kid(0x6B)
    cp = root.kid(0x6C)
    components_reachable = True
    if dlg is not None:
        if dlg.indef and cp is not None:
            notes.add('dialogue-indefinite')
            components_reachable = False
        dialogue_expectations(dlg, tc, uni, e, notes)

    if cp is not None and components_reachable:
        component_expectations(cp, ora.get('components') or [], e, notes)
    elif cp is not None and any(k.tag == 0xA7 for k in cp.kids):
        notes.add('rrnl-hidden-by-tshark')
    return e


def dialogue_expectations(dlg, tc, uni, e, notes):
    ext = dlg.kid(0x28)
    asn1 = ext.kid(0xA0) if ext is not None else None
    if asn1 is None:
        return
    if asn1.indef:
        notes.add('asn1-indefinite')
        return
    pdu = asn1.kids[0]
    e['dialogue'] = tc.get('dialogue')
    if pdu.indef and not uni:
        notes.add('pdu-indefinite')
        return
    e['acn'] = tc.get('acn')
    if pdu.tag == 0x61:
        e['result'] = tc.get('result')
    e['abort_source'] = tc.get('abort_source')


def component_expectations(cp, ora_comps, e, notes):
    kids = cp.kids
    decoded = []
    if not cp.indef:
        for k in kids:
            if k.tag not in COMPONENT_BY_TAG:
                notes.add('rrnl-ends-list' if k.tag == 0xA7 else 'unknown-component-ends-list')
                break
            decoded.append(k)
            if k.indef:
                if len(decoded) < len(kids):
                    notes.add('component-indefinite-ends-list')
                break
    else:
        pos = 0
        for kind in COMPONENT_ORDER:
            if pos >= len(kids) or kids[pos].tag != kind:
                continue
            decoded.append(kids[pos])
            pos += 1
            if decoded[-1].indef:
                break
        if len(decoded) < len(kids):
            k = kids[len(decoded)]
            if decoded and decoded[-1].indef and k.tag in COMPONENT_BY_TAG:
                notes.add('component-indefinite-ends-list')
            elif k.tag == 0xA7:
                notes.add('rrnl-ends-list')
            else:
                notes.add('cp-indefinite-kinds')
    if any(k.tag == 0xA7 for k in kids):
        notes.add('rrnl-hidden-by-tshark')
    if decoded and decoded[-1].indef and decoded[-1].tag == 0xA1:
        # An indefinite Invoke's argument that is not consumed (an indefinite
        # SEQUENCE stops at its first member; an argument our dispatcher does
        # not decode stays whole) leaves the cursor at an identifier that the
        # list may read as a further component.
        inv = decoded[-1].kids
        arg = inv[-1] if len(inv) >= 3 and inv[-1].tag not in (0x02, 0x80) else None
        if arg is not None and (arg.tag in COMPONENT_BY_TAG or
                                (arg.indef and arg.kids and arg.kids[0].tag in COMPONENT_BY_TAG)):
            notes.add('argument-read-as-component')
            e['extra_components_ok'] = True
    # tshark lists every component but A7; the decoded ones come before any A7.
    for i, k in enumerate(decoded):
        if i >= len(ora_comps):
            raise Disagreement('tshark shows %d components, our rules decode %d'
                               % (len(ora_comps), len(decoded)))
        oc = ora_comps[i]
        ctype = COMPONENT_BY_TAG[k.tag]
        if oc.get('type') != ctype:
            raise Disagreement('tshark component %d is %s, the message has %s'
                               % (i, oc.get('type'), ctype))
        c = {'type': ctype, 'invoke_id': signed_octet(oc.get('invoke_id'))}
        if ctype == 'invoke':
            c['linked_id'] = signed_octet(oc.get('linked_id'))
            c['opcode'] = oc.get('opcode')
            if oc.get('opcode') not in NAMED_OPCODES:
                notes.add('opcode-unnamed')
        elif ctype == 'returnResultLast':
            c['opcode'] = oc.get('opcode')
        elif ctype == 'returnError':
            c['error_code'] = oc.get('error_code')
        else:
            if oc.get('invoke_id') is None:
                notes.add('reject-null-invoke-id')
                c['problem'] = 'type 5 code None'
            else:
                c['problem'] = oc.get('problem')
        e['components'].append(c)


def tcap_rules(data, root, ora):
    """The TCAP-level rules that apply to a message (names of RULE_TEXT)."""
    notes = set()
    try:
        expect(data, root, ora, notes)
    except Disagreement:
        pass
    return notes


# --------------------------------------------------------------------------
# Comparison
# --------------------------------------------------------------------------
SCALARS = ('type', 'otid', 'dtid', 'p_abort', 'dialogue', 'acn', 'result', 'abort_source')
COMPONENT_KEYS = ('type', 'invoke_id', 'linked_id', 'opcode', 'error_code', 'problem')


def compare(index, group, hexmsg, ora, ours, stats):
    data = bytes.fromhex(hexmsg)
    notes = set()
    problems = []
    try:
        root = parse_node(data, 0)
        if ora.get('error'):
            raise Disagreement('oracle: %s' % ora['error'])
        exp = expect(data, root, ora, notes)
    except (Disagreement, ValueError, IndexError) as exc:
        stats.failures.append((index, group, 'reference: %s' % exc, hexmsg))
        return
    for n in notes:
        stats.rule(n, hexmsg)
    if not notes:
        fl = stats.flags.setdefault(ours.get('errorFlags'), [0, hexmsg])
        fl[0] += 1
    if ours.get('result') != 1:
        problems.append('md pass result %r' % ours.get('result'))
    got = summarize_ours(ours)
    for t in got['texts']:
        stats.count('value names', False)
        problems.append(t)
    for key in SCALARS:
        want, have = exp[key], got[key]
        if want is None and have is None:
            continue
        ok = want == have
        stats.count(key, ok)
        if not ok:
            problems.append('%s: ours %r, expected %r' % (key, have, want))
    wc, hc = exp['components'], got['components']
    n_ok = len(hc) == len(wc) or (exp['extra_components_ok'] and len(hc) > len(wc))
    if wc or hc:
        stats.count('component count', n_ok)
    if not n_ok:
        problems.append('components: ours %d %s, expected %d %s'
                        % (len(hc), [c['type'] for c in hc], len(wc), [c['type'] for c in wc]))
    for i, (w, h) in enumerate(zip(wc, hc)):
        for key in COMPONENT_KEYS:
            if key not in w and key not in h:
                continue
            ok = w.get(key) == h.get(key)
            stats.count('component ' + key, ok)
            if not ok:
                problems.append('component %d %s: ours %r, expected %r'
                                % (i, key, h.get(key), w.get(key)))
    for p in problems:
        stats.failures.append((index, group, p, hexmsg))


# --------------------------------------------------------------------------
# Corpus
# --------------------------------------------------------------------------
def build_corpus(capgen, per_group, seed):
    """Per message type: per_group messages with definite lengths only and
    per_group with indefinite lengths (all of them for one in eight,
    otherwise a random selection of the TCAP-level parts)."""
    parts = [p for p in capgen.INDEF_PARTS if p != 'msg']
    out = []
    for ti, mt in enumerate(MSG_TYPES):
        rng = random.Random(seed * 1000 + 10 * ti)
        for _ in range(per_group):
            out.append(('%s/definite' % mt, capgen.make_message(rng, msg=mt, indef=False)['hex']))
        rng = random.Random(seed * 1000 + 10 * ti + 1)
        pick = random.Random(seed * 1000 + 10 * ti + 2)
        for i in range(per_group):
            indef = True if i % 8 == 0 else set(pick.sample(parts, pick.randint(1, len(parts))))
            out.append(('%s/indefinite' % mt, capgen.make_message(rng, msg=mt, indef=indef)['hex']))
    return out


def build_mutations(capgen, corpus, count, seed):
    kinds = list(capgen.MUTATIONS) + list(getattr(capgen, 'EXTRA_MUTATIONS', ()))
    rng = random.Random(seed)
    out = []
    attempt = 0
    while len(out) < count and attempt < 4 * count:
        group, hexmsg = corpus[rng.randrange(len(corpus))]
        kind = kinds[len(out) % len(kinds)]
        attempt += 1
        try:
            bad, why = capgen.mutate_ex(hexmsg, seed * 100000 + attempt, kind)
        except (ValueError, IndexError):
            continue            # nothing of this kind in the message (drop_eoc)
        out.append(('%s %s' % (group, why), bad))
    return out


# --------------------------------------------------------------------------
# Running the decoders
# --------------------------------------------------------------------------
def write_hex(path, msgs):
    with open(path, 'w') as f:
        for _, h in msgs:
            f.write(h + '\n')


def read_jsonl(path):
    with open(path) as f:
        return [json.loads(line) for line in f if line.strip()]


def check_mutated(mutated, outputs, stats):
    passes = ('md', 'display', 'view', 'keys')
    for i, ((why, hexmsg), o) in enumerate(zip(mutated, outputs)):
        nbits = len(hexmsg) // 2 * 8
        for p in passes:
            r = (o.get(p) or {}).get('result')
            ok = r == 1
            if p == 'keys' and r == 0 and any(k.get('overflow') for k in o[p].get('entries', [])):
                # A key value that does not fit its slot ends the key-field
                # pass with 0: that is the pass's answer, not a fault.
                ok = True
                stats.rule('key-overflow', hexmsg)
            stats.count('mutated: %s result 1' % p, ok)
            if not ok:
                stats.failures.append(('m%d' % i, 'mutated ' + why, '%s pass result %r' % (p, r), hexmsg))
            rem = (o.get(p) or {}).get('remainingBits')
            if rem is not None and not 0 <= rem <= nbits:
                stats.failures.append(('m%d' % i, 'mutated ' + why,
                                       '%s pass remainingBits %r' % (p, rem), hexmsg))
        bad = [(f['id'], sp) for f in (o.get('md') or {}).get('fields', [])
               for sp in f.get('spans') or [] if not 1 <= sp[0] <= sp[1] <= nbits]
        stats.count('mutated: spans inside the message', not bad)
        if bad:
            stats.failures.append(('m%d' % i, 'mutated ' + why, 'field %d span %r outside bits 1..%d'
                                   % (bad[0][0], bad[0][1], nbits), hexmsg))


def main(argv=None):
    repo = Path(__file__).resolve().parent.parent.parent
    ap = argparse.ArgumentParser(description=__doc__.split('\n')[0])
    ap.add_argument('--decoder', default=str(repo / 'build' / 'native' / 'dpx-decode'),
                    help='dpx-decode executable')
    ap.add_argument('--emulator', help='run dpx-decode under this program (e.g. qemu-i386)')
    ap.add_argument('--tools', default=os.environ.get('DPX_REFERENCE_TOOLS',
                                                      str(repo.parent / 'shared' / 'tools')),
                    help='folder holding capgen.py and oracle.py')
    ap.add_argument('--tshark', default='tshark')
    ap.add_argument('--per-group', type=int, default=1000,
                    help='messages per message type and length form (default 1000)')
    ap.add_argument('--mutations', type=int, default=2000,
                    help='malformed messages decoded with all passes (default 2000)')
    ap.add_argument('--per-op', type=int, default=200,
                    help='messages per call-control, charging, SMS or GPRS operation, result '
                         'operation code and error code (default 200)')
    ap.add_argument('--seed', type=int, default=29078)
    ap.add_argument('--show', type=int, default=20, help='disagreements listed (default 20)')
    ap.add_argument('--keep', help='keep the generated and decoded files in this folder')
    args = ap.parse_args(argv)

    tools = Path(args.tools)
    if not (tools / 'capgen.py').is_file() or not (tools / 'oracle.py').is_file():
        print('SKIPPED: reference tools not found in %s' % tools)
        return SKIP
    if shutil.which(args.tshark) is None:
        print('SKIPPED: tshark not found (%s)' % args.tshark)
        return SKIP
    if not os.access(args.decoder, os.X_OK):
        print('FAILED: decoder %s not found' % args.decoder)
        return 1
    decoder = [args.emulator, args.decoder] if args.emulator else [args.decoder]
    sys.path.insert(0, str(tools))
    import capgen  # noqa: E402 (found only at run time)
    arguments.init(capgen)

    started = time.time()
    corpus = build_corpus(capgen, args.per_group, args.seed)
    mutated = build_mutations(capgen, corpus, args.mutations, args.seed)
    # The argument areas and their messages, decoded in one run of each decoder
    suites = []
    for area in areas.AREAS:
        area.update(types=areas.TYPES, rows=arguments.read_rows(areas.VALUES, area['letter']),
                    rules=area['rules'].split())
        suites.append((area, arguments.build_corpus(area, args.per_op, args.seed)))
    arg_corpus = [m for _, c in suites for m in c]

    work = Path(args.keep) if args.keep else Path(tempfile.mkdtemp(prefix='oracle_compare.'))
    work.mkdir(parents=True, exist_ok=True)
    try:
        # the reference reads each area's messages in a process of its own
        parts = [area['name'].replace(' ', '_') + '.' for area, _ in suites]
        f = {k: work / k for k in ['corpus.txt', 'mutated.txt', 'oracle.jsonl', 'ours.jsonl',
                                   'mutated.jsonl', 'arguments.ours.jsonl'] +
             [a + k for a in parts for k in ('txt', 'oracle.jsonl', 'pdml')]}
        for name, msgs in [('corpus.txt', corpus), ('mutated.txt', mutated)] + \
                [(a + 'txt', c) for a, (_, c) in zip(parts, suites)]:
            write_hex(f[name], msgs)
        reference = [sys.executable, str(tools / 'oracle.py'), '--jsonl', '-q', '--no-hex',
                     '--tshark', args.tshark]
        json_out = decoder + ['--format', 'json', '--pass']
        jobs = [  # command, file taking its standard output
            (reference + [str(f['corpus.txt']), '-o', str(f['oracle.jsonl'])], None),
            (json_out + ['md', str(f['corpus.txt'])], f['ours.jsonl']),
            (json_out + ['md,display,view,keys', str(f['mutated.txt'])], f['mutated.jsonl']),
            (json_out + ['md,display,view,keys'] + [str(f[a + 'txt']) for a in parts],
             f['arguments.ours.jsonl'])] + [
            (reference + [str(f[a + 'txt']), '-o', str(f[a + 'oracle.jsonl']),
                          '--pdml', str(f[a + 'pdml'])], None) for a in parts]
        procs = [(cmd, open(out, 'w') if out else subprocess.DEVNULL) for cmd, out in jobs]
        procs = [(cmd, subprocess.Popen(cmd, stdout=out, stderr=subprocess.PIPE, text=True), out)
                 for cmd, out in procs]
        crashed = []
        for cmd, p, out in procs:
            _, err = p.communicate()
            if out is not subprocess.DEVNULL:
                out.close()
            if p.returncode != 0:
                crashed.append('%s exited with %d%s' % (' '.join(cmd), p.returncode,
                                                        (':\n' + err.strip()[-3000:]) if err else ''))
        if crashed:
            print('FAILED:\n' + '\n'.join(crashed))
            return 1
        oracle, ours, mut = (read_jsonl(f[k]) for k in ('oracle.jsonl', 'ours.jsonl',
                                                        'mutated.jsonl'))
        arg_outputs = ([x for a in parts for x in arguments.read_pdml(f[a + 'pdml'])],
                       [x for a in parts for x in read_jsonl(f[a + 'oracle.jsonl'])],
                       read_jsonl(f['arguments.ours.jsonl']))
        counts = [len(oracle), len(ours), len(mut)] + [len(x) for x in arg_outputs]
        if counts != [len(corpus)] * 2 + [len(mutated)] + [len(arg_corpus)] * 3:
            print('FAILED: output counts (oracle, ours, mutated, tshark, oracle and ours of the '
                  'arguments): %s of %d, %d, %d' % (counts, len(corpus), len(mutated),
                                                    len(arg_corpus)))
            return 1
    finally:
        if not args.keep:
            shutil.rmtree(work, ignore_errors=True)
    stats = arguments.Stats()
    stats.flags = {}        # error flags of messages no rule adjusts -> [count, hex]
    for i, ((group, hexmsg), o, u) in enumerate(zip(corpus, oracle, ours)):
        compare(i, group, hexmsg, o, u.get('md') or {}, stats)
    check_mutated(mutated, mut, stats)
    suite_stats, first = [], 0
    for area, suite_corpus in suites:
        part = [x[first:first + len(suite_corpus)] for x in arg_outputs]
        first += len(suite_corpus)
        suite_stats.append(arguments.check(area, suite_corpus, *part, parse_node, tcap_rules))

    if args.per_group >= 1000:      # large enough that every rule must have been needed
        stats.failures += [('-', 'rules', 'RULE NEVER APPLIED %s: no message needed it' % r, '')
                           for r in RULE_TEXT if r not in stats.rules and r != 'key-overflow']
    report(stats, len(corpus), len(mutated), time.time() - started, args.show)
    bad = 0
    for (area, suite_corpus), suite in zip(suites, suite_stats):
        lines, suite_bad = arguments.report(area, suite, args.show, args.per_op >= 200,
                                            areas.RULE_TEXT)
        print('%d %s messages (%d operations%s) compared with tshark and decoded with all passes'
              % (len(suite_corpus), area['name'], len(area['ops']), ', %d result operation '
                 'codes, every error code' % len(area['results']) if 'results' in area else ''))
        print('\n'.join(lines))
        print('PASSED (%s)' % area['name'] if not suite_bad else
              'FAILED (%s): %d disagreements' % (area['name'], suite_bad))
        bad += suite_bad
    return 1 if stats.failures or bad else 0


def report(stats, n, n_mut, seconds, show):
    print('oracle_compare: %d generated messages compared with tshark, %d malformed '
          'messages decoded with all passes, %.1f s' % (n, n_mut, seconds))
    print('agreement (values compared where tshark or our rules give one):')
    for key in sorted(stats.compared):
        c, a = stats.compared[key]
        print('  %-34s %6d / %-6d%s' % (key, a, c, '' if a == c else '  <-- %d differ' % (c - a)))
    if stats.rules:
        print('rule-aware adjustments (our rules, tshark differs; messages, example):')
        for key in sorted(stats.rules):
            cnt, ex = stats.rules[key]
            print('  %-32s %6d  %s' % (key, cnt, RULE_TEXT.get(key, '')))
            print('  %32s         e.g. %s' % ('', ex if len(ex) <= 120 else ex[:117] + '...'))
    if stats.flags:
        print('error flags of the messages no rule adjusts (information only):')
        for fl in sorted(stats.flags, key=lambda x: (x is None, x or 0)):
            cnt, ex = stats.flags[fl]
            print('  %-10s %6d  e.g. %s' % ('none' if fl is None else '0x%x' % fl, cnt,
                                             ex if len(ex) <= 100 else ex[:97] + '...'))
    if not stats.failures:
        print('PASSED')
        return
    msgs = len({f[0] for f in stats.failures})
    print('FAILED: %d disagreements in %d messages; first %d:'
          % (len(stats.failures), msgs, min(show, len(stats.failures))))
    for index, group, what, hexmsg in stats.failures[:show]:
        print('  #%s [%s] %s\n      %s' % (index, group, what, hexmsg))


if __name__ == '__main__':
    sys.exit(main())
