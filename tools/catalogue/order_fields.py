#!/usr/bin/env python3
"""Puts the CAMEL argument fields of src/fields/field_table.h in the order
a depth-first walk of the grammar first meets them.

The member tables' rows are walked as they are declared (catalogue-walk);
what the hand-written units show is observed: capgen.py (the test tooling's
message builder) makes many messages of every operation with random
argument values, dpx-decode reports their fields, and the first-occurrence
order of the fields in each message gives "a before b" edges; the bundled
samples' messages with one Invoke add theirs (they show elements the
generator leaves out).  Operations are taken in the dispatcher's comparison
order; within one operation the edges are sorted topologically, ties keeping
the declared order.  A field no message showed keeps its place before the
next declared field one did.

    tools/catalogue/order_fields.py --decoder build/native/dpx-decode \
        [--tools ../shared/tools] [--messages 60] [--check]

With --check nothing is written: the exit status says whether the table is
already in that order.
"""
import argparse
import collections
import glob
import json
import os
import re
import subprocess
import sys

ROOT = os.path.dirname(os.path.dirname(os.path.dirname(os.path.abspath(__file__))))
TABLE = os.path.join(ROOT, 'src', 'fields', 'field_table.h')

# The dispatcher's comparison order (operation codes).
DISPATCH = [55, 35, 36, 16, 41, 44, 45, 53, 20, 19, 31, 56, 18, 17, 24, 34, 0, 47, 48, 22,
            23, 33, 46, 49, 62, 65, 64, 61, 60, 66, 63, 67, 70, 71, 72, 73, 74, 75, 76, 80,
            77, 78, 79, 81, 82, 83, 86, 32, 88, 90, 93, 95, 96, 97]
FIRST_ARGUMENT_AFTER = 1066   # the operation code field
ARGUMENTS_END_BEFORE = 3669   # the Return Result (Last) tag


def capgen_ops(tools):
    out = subprocess.run([sys.executable, os.path.join(tools, 'capgen.py'), 'ops'],
                         capture_output=True, text=True, check=True).stdout
    ops = {}
    for line in out.splitlines():
        m = re.match(r'\s*(\d+)\s+(\w+)', line)
        if m:
            ops.setdefault(int(m.group(1)), m.group(2))
    return ops


def messages_of(tools, name, count):
    r = subprocess.run([sys.executable, os.path.join(tools, 'capgen.py'), 'corpus', '-n', str(count),
                        '--seed', '1', '--msg', 'continue', '--ops', name, '--definite',
                        '--no-comments', '--no-expect', '--phase', '4'],
                       capture_output=True, text=True)
    return [l for l in r.stdout.splitlines() if l and not l.startswith('#')]


def field_sequences(decoder, hexes):
    r = subprocess.run([decoder, '--format', 'json', '--pass', 'md', '-'], input='\n'.join(hexes),
                       capture_output=True, text=True)
    seqs = []
    for line in r.stdout.splitlines():
        ids = [f['id'] for f in json.loads(line)['md']['fields']]
        if FIRST_ARGUMENT_AFTER in ids:
            ids = ids[ids.index(FIRST_ARGUMENT_AFTER) + 1:]
        seen, first = set(), []
        for i in ids:
            if i not in seen:
                seen.add(i)
                first.append(i)
        seqs.append(first)
    return seqs


def sample_sequences(decoder):
    """First-occurrence field sequences of the bundled samples' messages that
    carry one Invoke, by operation code: the samples show elements the
    generator leaves out (a routing area identity in an SMS Initial DP)."""
    files = sorted(glob.glob(os.path.join(ROOT, 'samples', '*.txt')))
    r = subprocess.run([decoder, '--format', 'json', '--pass', 'md'] + files,
                       capture_output=True, text=True)
    out = collections.defaultdict(list)
    for line in r.stdout.splitlines():
        fields = json.loads(line)['md']['fields']
        codes = [f['spans'][-1][2] for f in fields if f['id'] == FIRST_ARGUMENT_AFTER and f['spans']]
        if len(codes) != 1:
            continue
        ids = [f['id'] for f in fields]
        ids = ids[ids.index(FIRST_ARGUMENT_AFTER) + 1:]
        out[codes[0]].append(list(dict.fromkeys(ids)))
    return out


def entries(segment):
    """Splits a run of declaration lines into (id, text) entries."""
    out, cur, depth = [], [], 0
    for line in segment.splitlines(keepends=True):
        if depth == 0 and (not line.strip() or line.strip().startswith('//')):
            continue
        cur.append(line)
        depth += line.count('(') - line.count(')')
        if depth == 0 and line.rstrip().endswith(','):
            text = ''.join(cur)
            m = re.search(r'\((\d+)[,)]', text)
            out.append((int(m.group(1)), text))
            cur = []
    return out


def order(declared, seqs_by_op):
    placed, result = set(), []
    for seqs in seqs_by_op:
        nodes, first_seen, edges = set(), {}, collections.defaultdict(set)
        indeg = collections.Counter()
        for n, seq in enumerate(seqs):
            seq = [i for i in seq if i in declared and i not in placed]
            for k, i in enumerate(seq):
                nodes.add(i)
                first_seen.setdefault(i, (n, k))
            for a, b in zip(seq, seq[1:]):
                if b not in edges[a]:
                    edges[a].add(b)
                    indeg[b] += 1
        while nodes:
            # Fields no walk orders (alternatives of one choice, elements
            # of different messages) keep their declared order, so a table
            # that agrees with every observed edge is left as it is.
            ready = [i for i in nodes if indeg[i] == 0] or list(nodes)  # a cycle: earliest wins
            pick = min(ready, key=lambda i: (declared_at.get(i, len(declared_at)), first_seen[i]))
            nodes.discard(pick)
            for b in edges.pop(pick, ()):
                indeg[b] -= 1
            result.append(pick)
            placed.add(pick)
    # Fields no message showed go before the next declared field that one
    # did: units declare their fields in decoding order, so a run of unseen
    # fields (a rare branch, an element the generator leaves out) stays
    # with what follows it.
    order_ids = [i for i, _ in declared_list]
    for k in range(len(order_ids) - 1, -1, -1):
        i = order_ids[k]
        if i in placed:
            continue
        after = next((order_ids[j] for j in range(k + 1, len(order_ids)) if order_ids[j] in placed),
                     None)
        result.insert(result.index(after) if after is not None else len(result), i)
        placed.add(i)
    return result


if __name__ == '__main__':
    ap = argparse.ArgumentParser(description=__doc__.split('\n')[0])
    ap.add_argument('--decoder', required=True)
    ap.add_argument('--walk', help='catalogue-walk (default: beside the decoder)')
    ap.add_argument('--tools', default=os.path.join(ROOT, '..', 'shared', 'tools'))
    ap.add_argument('--messages', type=int, default=60)
    ap.add_argument('--check', action='store_true')
    a = ap.parse_args()

    if not os.path.exists(os.path.join(a.tools, 'capgen.py')):
        print('reference tools not found at %s: skipped' % a.tools)
        sys.exit(77)
    text = open(TABLE).read()
    start = re.search(r'\n[^\n]*\(%d,[^\n]*\n' % FIRST_ARGUMENT_AFTER, text).end()
    end = re.search(r'\n[^\n]*\(%d,' % ARGUMENTS_END_BEFORE, text).start() + 1
    end = text.rfind('\n', start, text.rfind('\n', start, end)) + 1  # keep the comment above it
    declared_list = entries(text[start:end])
    declared = dict(declared_list)
    declared_at = {i: k for k, (i, _) in enumerate(declared_list)}

    walk = a.walk or os.path.join(os.path.dirname(a.decoder), 'catalogue-walk')
    static = {}
    for line in subprocess.run([walk], capture_output=True, text=True, check=True).stdout.splitlines():
        code, *ids = map(int, line.split())
        static.setdefault(code, ids)
    ops = capgen_ops(a.tools)
    samples = sample_sequences(a.decoder)
    seqs_by_op = []
    for code in DISPATCH:
        seqs = [static[code]] if code in static else []
        if code in ops:
            seqs += field_sequences(a.decoder, messages_of(a.tools, ops[code], a.messages))
        seqs_by_op.append(seqs + samples.get(code, []))
    new = order(declared, seqs_by_op)
    if new == [i for i, _ in declared_list]:
        print('field table already in walk order')
        sys.exit(0)
    if a.check:
        print('field table not in walk order')
        sys.exit(1)
    body = ('\n    // ---- CAMEL operation arguments, in the order the dispatcher\'s walk first\n'
            '    // ---- meets them (tools/catalogue/order_fields.py keeps this order)\n')
    body += ''.join(declared[i] for i in new) + '\n'
    open(TABLE, 'w').write(text[:start] + body + text[end:])
    print('%d fields reordered' % len(new))
