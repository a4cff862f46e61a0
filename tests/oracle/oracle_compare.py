#!/usr/bin/env python3
"""Compare dpx-decode with an independent reference decoder (tshark).

Three message sets, each decoded by tshark (through oracle.py) and by
`dpx-decode --format json`:

* TCAP messages of every type from capgen.py, definite and indefinite: the
  message type, transaction ids, P-Abort cause, dialogue PDU, application
  context name, dialogue result, abort source and, per component, its type,
  invoke and linked ids, operation or error code and reject problem
  (TCAP_VALUES: our field ids and the texts they must show).
* malformed variants of them (capgen mutate), decoded with all four passes:
  every pass returns 1, reports its bit spans inside the message, no crash.
* the arguments, results and errors of the areas in areas.py, compared value
  by value and checked for coverage (arguments.py).

Where our decoder follows its own rules (messages and dialogue [0] wrappers
read with definite lengths only, an indefinite component portion holding at
most one component of each kind, ...), the expected value is tshark's
adjusted by the rule, worked out from the message's own BER structure; every
rule is named and counted, and a named rule that no message needed fails.

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
PER_GROUP = 1000    # TCAP messages per message type and length form
MUTATIONS = 2000    # malformed messages
PER_OP = 200        # argument messages per operation, result operation code and error code
MSG_TYPES = ('begin', 'continue', 'end', 'abort', 'unidirectional')
TYPE_BY_OCTET = {0x61: 'unidirectional', 0x62: 'begin', 0x64: 'end',
                 0x65: 'continue', 0x67: 'abort'}

# Field ids of the decoded-field pass (see src/fields/field_table.h) that
# are not compared values (TCAP_VALUES): the application context name's
# arcs (0.4 / 0 / 0 / 1 / cap, then one of three tails), the components and
# the problem codes under their problem type.
ACN_ARCS = (3793, 3794, 3795, 3796, 3797)
ACN_TAILS = ((3799, 3800), (3877, 3878), (3879, 3880))
COMPONENT_BY_FIELD = {3660: 'invoke', 3669: 'returnResultLast', 3685: 'returnError',
                      3694: 'reject'}
PROBLEM_CODE_FIELDS = {3710: 0x80, 3712: 0x81, 3714: 0x82, 3716: 0x83}
SCALARS = ('type', 'otid', 'dtid', 'p_abort', 'dialogue', 'acn', 'result', 'abort_source')
COMPONENT_BY_TAG = {0xA1: 'invoke', 0xA2: 'returnResultLast',
                    0xA3: 'returnError', 0xA4: 'reject'}
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
# Our decoder's output -> summary
# --------------------------------------------------------------------------
DIGITS, NUMBER, OPCODE = 'digits', 'number', 'opcode'
# The compared fields of the decoded-field pass: field id -> value, message
# or component level, how its text is checked (DIGITS: the text after '='
# gives the spans' half-octets; NUMBER: the text after '=' is the value;
# OPCODE: named exactly when the code is in our table; (prefix, names):
# the text is the prefix and the value's name) and the names of the octet
# kept as the value (None: the octet itself; DIGITS: the text's digits).
TCAP_VALUES = {
    3604: ('type', 'message', None, TYPE_BY_OCTET),
    3653: ('otid', 'message', DIGITS, DIGITS),
    3656: ('dtid', 'message', DIGITS, DIGITS),
    3659: ('p_abort', 'message', ('  P-Abort Cause=', PABORT_NAMES), None),
    3760: ('dialogue', 'message', ('  Dialogue PDU=', DIALOGUE_NAMES), DIALOGUE_BY_OCTET),
    3728: ('dialogue', 'message', None, {0x60: 'audt'}),      # unidirectional dialogue (AUDT)
    3774: ('result', 'message', ('  Result=', RESULT_NAMES), None),
    3785: ('abort_source', 'message', ('  Abort Source Value=', ABORT_SOURCE_NAMES), None),
    3705: ('invoke_id', 'component', NUMBER, None),
    3708: ('linked_id', 'component', NUMBER, None),
    1066: ('opcode', 'component', OPCODE, None),
    1068: ('opcode', 'component', None, None),                # Return Result's operation code
    1070: ('error_code', 'component', None, None),
    3701: ('problem_type', 'component', ('  Problem Code=', PROBLEM_TYPE_NAMES), None),
}


def after_eq(text):
    return text.split('=', 1)[1] if '=' in text else None


def text_ok(f, v, check):
    text = f['text']
    if check == DIGITS:
        return after_eq(text) == ''.join('%x' % sp[2] for sp in f['spans'])
    if check == NUMBER:
        return after_eq(text) == str(v)
    if check == OPCODE:
        return text.startswith('Operation ID(Invoke)=') and \
            bool(after_eq(text)) == (v in NAMED_OPCODES)
    return check is None or text == check[0] + check[1].get(v, '')


def summarize_ours(md):
    """Values of the compared fields from one decoded-field pass.  Problems
    with the rendering (text that does not match the value) go to 'texts'."""
    s = dict.fromkeys(SCALARS)
    s.update(components=[], texts=[])
    arcs, comp = {}, None
    for f in md.get('fields', []):
        fid = f['id']
        v = f['spans'][0][2] if f.get('spans') else None
        if fid in COMPONENT_BY_FIELD:
            comp = {'type': COMPONENT_BY_FIELD[fid]}
            s['components'].append(comp)
            continue
        if fid in ACN_ARCS or any(fid in t for t in ACN_TAILS):
            arcs[fid] = v
            continue
        if fid in PROBLEM_CODE_FIELDS:
            key, where, value = 'problem_code', 'component', (PROBLEM_CODE_FIELDS[fid], v)
        elif fid in TCAP_VALUES:
            key, where, check, names = TCAP_VALUES[fid]
            if not text_ok(f, v, check):
                s['texts'].append('field %d value %r shown %r' % (fid, v, f['text']))
            value = after_eq(f['text']) if names == DIGITS else \
                v if names is None else names.get(v, 'octet %02x' % v)
        else:
            continue
        target = s if where == 'message' else comp
        if target is None:
            continue
        if target.get(key) is not None:
            s['texts'].append('field %d reported twice in one %s' % (fid, where))
        target[key] = value
    for c in s['components']:
        pt, pc = c.pop('problem_type', None), c.pop('problem_code', None)
        if pc is not None and pc[0] != pt:
            s['texts'].append('problem code field of %02x under problem type %r' % (pc[0], pt))
        if pt is not None and pc is not None and pt in PROBLEM_KIND:
            c['problem'] = '%s:%d' % (PROBLEM_KIND[pt], pc[1])
        elif pt is not None or pc is not None:
            c['problem'] = 'type %r code %r' % (pt, pc and pc[1])
    if arcs:
        parts = [str(arcs[3793] // 40), str(arcs[3793] % 40)] if 3793 in arcs else []
        parts += [str(arcs[fid]) for fid in ACN_ARCS[1:] + sum(ACN_TAILS, ()) if fid in arcs]
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
        for kind in COMPONENT_BY_TAG:
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
COMPONENT_KEYS = ('type', 'invoke_id', 'linked_id', 'opcode', 'error_code', 'problem')


def compare(index, group, hexmsg, ora, ours, stats):
    data = bytes.fromhex(hexmsg)
    notes = set()
    problems = []
    try:
        root = arguments.parse_message(data)
        if ora.get('error'):
            raise Disagreement('oracle: %s' % ora['error'])
        exp = expect(data, root, ora, notes)
    except (Disagreement, ValueError, IndexError) as exc:
        stats.failures.append((index, group, 'reference: %s' % exc, hexmsg))
        return
    for n in notes:
        stats.rule(n, hexmsg)
    if ours.get('result') != 1:
        problems.append('md pass result %r' % ours.get('result'))
    got = summarize_ours(ours)
    for t in got['texts']:
        stats.count('value names', False)
        problems.append(t)
    for key in SCALARS:
        if exp[key] is not None or got[key] is not None:
            stats.value(key, exp[key], got[key], group, hexmsg)
    wc, hc = exp['components'], got['components']
    n_ok = len(hc) == len(wc) or (exp['extra_components_ok'] and len(hc) > len(wc))
    if wc or hc:
        stats.count('component count', n_ok)
    if not n_ok:
        problems.append('components: ours %d %s, expected %d %s'
                        % (len(hc), [c['type'] for c in hc], len(wc), [c['type'] for c in wc]))
    for w, h in zip(wc, hc):
        for key in COMPONENT_KEYS:
            if key in w or key in h:
                stats.value('component ' + key, w.get(key), h.get(key), group, hexmsg)
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
def check_mutated(mutated, outputs, stats):
    """Every pass returns 1 on a malformed message (the key-field pass may
    return 0 for a key value too long for its slot) and reports bit spans
    and remaining bits inside it."""
    for i, ((why, hexmsg), o) in enumerate(zip(mutated, outputs)):
        nbits = len(hexmsg) // 2 * 8
        problems = []
        for p in arguments.PASSES:
            out = o.get(p) or {}
            ok = out.get('result') == 1
            if p == 'keys' and out.get('result') == 0 and \
                    any(k.get('overflow') for k in out.get('entries', [])):
                ok = True
                stats.rule('key-overflow', hexmsg)
            stats.count('mutated: %s result 1' % p, ok)
            if not ok:
                problems.append('%s pass result %r' % (p, out.get('result')))
            if not 0 <= (out.get('remainingBits') or 0) <= nbits:
                problems.append('%s pass remainingBits %r' % (p, out['remainingBits']))
        bad = [(f['id'], sp) for f in (o.get('md') or {}).get('fields', [])
               for sp in f.get('spans') or [] if not 1 <= sp[0] <= sp[1] <= nbits]
        stats.count('mutated: spans inside the message', not bad)
        problems += ['field %d span %r outside bits 1..%d' % (b[0], b[1], nbits) for b in bad[:1]]
        stats.failures += [('m%d' % i, 'mutated ' + why, p, hexmsg) for p in problems]


def run(jobs):
    """Runs the (command, file taking its standard output or None) jobs side
    by side; -> what went wrong in those that failed."""
    procs = []
    for cmd, out in jobs:
        f = open(out, 'w') if out else subprocess.DEVNULL
        procs.append((cmd, f, subprocess.Popen(cmd, stdout=f, stderr=subprocess.PIPE, text=True)))
    crashed = []
    for cmd, f, p in procs:
        _, err = p.communicate()
        if f is not subprocess.DEVNULL:
            f.close()
        if p.returncode != 0:
            crashed.append('%s exited with %d%s' % (' '.join(cmd), p.returncode,
                                                    (':\n' + err.strip()[-3000:]) if err else ''))
    return crashed


def read_jsonl(path):
    with open(path) as f:
        return [json.loads(line) for line in f if line.strip()]


def main(argv=None):
    repo = Path(__file__).resolve().parent.parent.parent
    ap = argparse.ArgumentParser(description=__doc__.split('\n')[0])
    ap.add_argument('--decoder', default=str(repo / 'build' / 'native' / 'dpx-decode'),
                    help='dpx-decode executable')
    ap.add_argument('--emulator', help='run dpx-decode under this program (e.g. qemu-i386)')
    ap.add_argument('--tools', default=os.environ.get('DPX_REFERENCE_TOOLS',
                                                      str(repo.parent / 'shared' / 'tools')),
                    help='folder holding capgen.py and oracle.py')
    ap.add_argument('--seed', type=int, default=29078)
    args = ap.parse_args(argv)

    tools = Path(args.tools)
    if not (tools / 'capgen.py').is_file() or not (tools / 'oracle.py').is_file():
        print('SKIPPED: reference tools not found in %s' % tools)
        return SKIP
    if shutil.which('tshark') is None:
        print('SKIPPED: tshark not found')
        return SKIP
    if not os.access(args.decoder, os.X_OK):
        print('FAILED: decoder %s not found' % args.decoder)
        return 1
    decoder = [args.emulator, args.decoder] if args.emulator else [args.decoder]
    sys.path.insert(0, str(tools))
    import capgen  # noqa: E402 (found only at run time)
    arguments.init(capgen)

    started = time.time()
    corpus = build_corpus(capgen, PER_GROUP, args.seed)
    mutated = build_mutations(capgen, corpus, MUTATIONS, args.seed)
    suites = []
    for area in areas.AREAS:
        area.update(types=areas.TYPES, rows=arguments.read_rows(areas.VALUES, area['letter']))
        suites.append((area, arguments.build_corpus(area, PER_OP, args.seed)))

    work = Path(tempfile.mkdtemp(prefix='oracle_compare.'))
    try:
        # the reference reads each area's messages in a process of its own;
        # ours decodes all argument messages in one run
        names = ['tcap', 'mutated'] + [area['name'].replace(' ', '_') for area, _ in suites]
        for name, msgs in zip(names, [corpus, mutated] + [c for _, c in suites]):
            with open(work / (name + '.txt'), 'w') as f:
                f.write(''.join(h + '\n' for _, h in msgs))
        reference = [sys.executable, str(tools / 'oracle.py'), '--jsonl', '-q', '--no-hex']
        ours = decoder + ['--format', 'json', '--pass']
        txt = [str(work / (n + '.txt')) for n in names]
        crashed = run([(reference + [txt[0], '-o', str(work / 'tcap.oracle.jsonl')], None),
                       (ours + ['md', txt[0]], work / 'tcap.ours.jsonl'),
                       (ours + ['md,display,view,keys', txt[1]], work / 'mutated.ours.jsonl'),
                       (ours + ['md,display,view,keys'] + txt[2:], work / 'arguments.ours.jsonl')] +
                      [(reference + [txt[i], '-o', str(work / (n + '.oracle.jsonl')), '--pdml',
                                     str(work / (n + '.pdml'))], None)
                       for i, n in enumerate(names) if i >= 2])
        if crashed:
            print('FAILED:\n' + '\n'.join(crashed))
            return 1
        outputs = [read_jsonl(work / (n + '.jsonl')) for n in ('tcap.oracle', 'tcap.ours',
                                                                'mutated.ours')]
        arg_outputs = ([x for n in names[2:] for x in arguments.read_pdml(work / (n + '.pdml'))],
                       [x for n in names[2:] for x in read_jsonl(work / (n + '.oracle.jsonl'))],
                       read_jsonl(work / 'arguments.ours.jsonl'))
    finally:
        shutil.rmtree(work, ignore_errors=True)
    n_args = sum(len(c) for _, c in suites)
    counts = [len(x) for x in outputs + list(arg_outputs)]
    if counts != [len(corpus)] * 2 + [len(mutated)] + [n_args] * 3:
        print('FAILED: output counts (tshark and ours of the TCAP messages, ours of the '
              'malformed, tshark\'s PDML and summary and ours of the arguments): %s of %d, %d, %d'
              % (counts, len(corpus), len(mutated), n_args))
        return 1

    stats = arguments.Stats()
    for i, ((group, hexmsg), o, u) in enumerate(zip(corpus, *outputs[:2])):
        compare(i, group, hexmsg, o, u.get('md') or {}, stats)
    check_mutated(mutated, outputs[2], stats)
    print('oracle_compare: %d TCAP messages and %d argument messages compared with tshark, %d '
          'malformed messages decoded with all passes, %.1f s'
          % (len(corpus), n_args, len(mutated), time.time() - started))
    # every TCAP rule but key-overflow (malformed messages only) must be needed
    lines, bad = arguments.report('TCAP messages, components and malformed messages', stats,
                                  (), [r for r in RULE_TEXT if r != 'key-overflow'], RULE_TEXT)
    first = 0
    for area, suite_corpus in suites:
        part = [x[first:first + len(suite_corpus)] for x in arg_outputs]
        first += len(suite_corpus)
        area_lines, area_bad = arguments.report(
            area['title'], arguments.check(area, suite_corpus, *part, tcap_rules),
            [r[0] for r in area['rows']], area['rules'].split(),
            areas.RULE_TEXT)
        lines += area_lines
        bad += area_bad
    print('\n'.join(lines))
    return 1 if bad else 0


if __name__ == '__main__':
    sys.exit(main())
