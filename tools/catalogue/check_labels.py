#!/usr/bin/env python3
"""Checks the field catalogue against what the passes report.

Over generated messages of every operation (CAP phases 2, 3 and 4) and the
sample messages: every field id the decoded-field pass reports has exactly
one catalogue entry, whose label is the label the module hands the host
without its leading blanks; every display id the display pass uses is the id of the first
catalogue entry with the field's label.  The catalogue is read as a host
reads it (dpx-decode --tables).

    tools/catalogue/check_labels.py --decoder build/native/dpx-decode [--tools ../shared/tools]

Exit status 77 (skipped) without the message generator.
"""
import argparse
import glob
import json
import os
import subprocess
import sys

ROOT = os.path.dirname(os.path.dirname(os.path.dirname(os.path.abspath(__file__))))



# Display ids a field's declaration states outright instead of the first
# entry with its label (the time and time zone tag of the GPRS and SMS
# arguments is shown under the Initial DP's).
STATED_DISPLAY_IDS = {2231: 2230}

def main():
    ap = argparse.ArgumentParser(description=__doc__.split('\n')[0])
    ap.add_argument('--decoder', required=True)
    ap.add_argument('--emulator')
    ap.add_argument('--tools', default=os.environ.get('DPX_REFERENCE_TOOLS',
                                                      os.path.join(ROOT, '..', 'shared', 'tools')))
    ap.add_argument('--messages', type=int, default=1500, help='messages per CAP phase')
    a = ap.parse_args()
    decoder = ([a.emulator] if a.emulator else []) + [a.decoder]

    tables = json.loads(subprocess.run(decoder + ['--tables'], capture_output=True, text=True,
                                       check=True).stdout)
    entries = {}
    first_with_label = {}
    for e in tables['catalogue']:
        entries.setdefault(e['id'], []).append(e)
        first_with_label.setdefault(e['label'], e['id'])

    inputs = sorted(glob.glob(os.path.join(ROOT, 'samples', '*.txt')))
    capgen = os.path.join(a.tools, 'capgen.py')
    generated = []
    if os.path.exists(capgen):
        for phase in ('2', '3', '4'):
            r = subprocess.run([sys.executable, capgen, 'corpus', '-n', str(a.messages), '--seed', '13',
                                '--no-comments', '--no-expect', '--phase', phase],
                               capture_output=True, text=True, check=True)
            generated += [l for l in r.stdout.splitlines() if l.strip()]
    elif not inputs:
        print('SKIPPED: no message generator at %s and no samples' % a.tools)
        return 77
    out = subprocess.run(decoder + ['--format', 'json', '--pass', 'md,display', '-'] + inputs,
                         input='\n'.join(generated) + '\n', capture_output=True, text=True)
    problems, messages, seen = [], 0, set()
    for line in out.stdout.splitlines():
        d = json.loads(line)
        messages += 1
        md, shown = d['md']['fields'], d['display']['fields']
        if len(md) != len(shown):
            problems.append('message %d: %d decoded fields, %d display values'
                            % (d['index'], len(md), len(shown)))
            continue
        for f, s in zip(md, shown):
            seen.add(f['id'])
            found = entries.get(f['id'], [])
            if len(found) != 1:
                problems.append('field %d: %d catalogue entries' % (f['id'], len(found)))
                continue
            label = found[0]['label']
            if f['label'].lstrip(' ') != label:
                problems.append('field %d: reported label %r, catalogue %r' % (f['id'], f['label'], label))
            stated = STATED_DISPLAY_IDS.get(f['id'])
            if s['displayId'] != (stated or first_with_label[label]):
                problems.append('field %d: display id %d, first entry labelled %r is %d'
                                % (f['id'], s['displayId'], label, first_with_label[label]))
            if stated is None and s.get('label') != label:
                problems.append('display id %d: label %r, catalogue %r' % (s['displayId'], s.get('label'), label))
    if out.returncode not in (0,) and messages == 0:
        print('FAILED: dpx-decode exit status %d: %s' % (out.returncode, out.stderr[:500]))
        return 1
    unique = sorted(set(problems))
    print('%d messages, %d distinct field ids reported, %d of %d catalogue entries'
          % (messages, len(seen), len(seen & set(entries)), len(tables['catalogue'])))
    for p in unique[:40]:
        print('  ' + p)
    if unique:
        print('FAILED: %d problems' % len(unique))
        return 1
    print('every reported field has one catalogue entry with its label and display id')
    return 0


if __name__ == '__main__':
    sys.exit(main())
