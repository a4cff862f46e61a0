#!/usr/bin/env python3
"""Compares the field ids a protocol description text states with the
field catalogue (read as a host reads it, through dpx-decode --tables).

    tools/catalogue/stated_ids.py --decoder build/native/dpx-decode --text FILE [--check]

An id is stated when the text names it: a number from 1000 to 4999
outside quoted texts, sizes and counts, and the edge-case lists, a
range "a to b" of such numbers, or a rule "a + k(n−1)" with "n = 1 to m".
Ids of the MS Radio Access Capability body (3919 to 4139) are handed out in
decoding order and are only counted.

Two lists below say where the catalogue and the text part on purpose:
fields the text describes without giving them an id, and ids inside a
stated range for which the text describes no field.  With --check the exit
status is 1 when the comparison finds anything else, 77 when the text is
missing.
"""
import argparse
import json
import re
import subprocess
import sys

# Numbers that are sizes, counts or table positions, not ids.
NOT_AN_ID = re.compile(r'(?:entry |× |\*)\d{4}\b|\b\d{4}(?:-byte| bytes| entries| texts| octets)')
RADIO_ACCESS = range(3919, 4140)

# Fields the text describes (by label or as an element's tag or length)
# without an id; the decoder reports them under ids of its own.
UNSTATED = {
    1577: 'Forwarded call (tag of the O answer NULL)',
    1579: 'Release Cause Tag (disconnect alternatives)',
    1580: 'Route Not Permitted Tag (busy and no-answer alternatives)',
    1581: 'LocationInformation Tag (term seized, call accepted, change of position)',
    1583: 'LocationInformation Info',
    1584: 'routeNotPermitted Tag (abandon alternative)',
    1600: 'Call forwarded (tag of the busy and no-answer NULL)',
    2177: 'Failure Cause Tag (SMS failure alternatives)',
    2178: 'LENGTH of the Failure Cause element',
    2318: 'Max Elapsed Time(second)',
    2334: 'LENGTH of Volume If No Tariff Switch',
    2335: 'Volume If No Tariff Switch(byte)',
    2336: 'LENGTH of Volume If Tariff Switch',
    2349: 'LENGTH of Time GPRS If No Tariff Switch',
    2350: 'Time GPRS IF No Tariff Switch(second)',
    2351: 'LENGTH of Time GPRS If Tariff Switch',
    2468: 'Enduser Address Tag',
    2469: 'LENGTH of the Enduser Address',
    2503: 'LENGTH of Camel Fci GPRS Bill Cha Char',
    4182: 'suppress_D_CSI Tag',
    4184: 'suppress_N_CSI Tag',
    4211: 'suppressOutgoingCallBarring Tag',
}

# Ids inside a stated range ("fids a to b") that no described field takes.
RANGE_ONLY = {2259, 2260, 2261, 2262, 2275, 2277, 2347, 2438, 2506, 2507, 2587, 2588,
              3890, 3891, 3892, 3893, 3900, 3905, 3906, 3907, 3908}


def id_lines(text):
    skipping = False
    for line in text.splitlines():
        if line.startswith('**') or line.startswith('#'):
            skipping = line.startswith('**Edge cases')
            continue
        if not skipping:
            yield NOT_AN_ID.sub('', re.sub(r'"[^"]*"', '""', line))


def stated_ids(text):
    ids = set()
    for line in id_lines(text):
        for a, b in re.findall(r'\b(\d{4}) to (\d{4})\b', line):
            if int(a) < int(b) <= int(a) + 40:
                ids.update(range(int(a), int(b) + 1))
        rule = re.search(r'n = (\d+) to (\d+)', line)
        if rule:
            for base, step in re.findall(r'\b(\d{4}) \+ (\d+)\(n−1\)', line):
                ids.update(int(base) + int(step) * (n - 1)
                           for n in range(int(rule.group(1)), int(rule.group(2)) + 1))
        ids.update(int(n) for n in re.findall(r'\b(\d{4})\b', line) if 1000 <= int(n) < 5000)
    return ids


def differences(found, expected, what):
    """What the comparison found against what the list above expects."""
    return (['%d is %s and not listed' % (i, what) for i in sorted(set(found) - expected)] +
            ['%d is listed as %s but is not' % (i, what) for i in sorted(expected - set(found))])


def main():
    ap = argparse.ArgumentParser(description=__doc__.split('\n')[0])
    ap.add_argument('--decoder', required=True)
    ap.add_argument('--emulator')
    ap.add_argument('--text', required=True, help='the protocol description text')
    ap.add_argument('--check', action='store_true')
    a = ap.parse_args()
    try:
        with open(a.text, encoding='utf-8') as f:
            text = f.read()
    except OSError:
        print('SKIPPED: no description text at %s' % a.text)
        return 77
    decoder = ([a.emulator] if a.emulator else []) + [a.decoder]
    tables = json.loads(subprocess.run(decoder + ['--tables'], capture_output=True, text=True,
                                       check=True).stdout)
    declared = {e['id'] for e in tables['catalogue']}
    stated = stated_ids(text)

    unstated = sorted(i for i in declared - stated if i not in RADIO_ACCESS)
    missing = sorted(i for i in stated - declared if i not in RADIO_ACCESS)
    radio = len([i for i in declared if i in RADIO_ACCESS])
    print('catalogue: %d fields; stated outside the radio access body: %d; radio access ids: %d'
          % (len(declared), len([i for i in stated if i not in RADIO_ACCESS]), radio))
    print('declared without a stated id: %d %s' % (len(unstated), unstated))
    print('stated but not declared: %d %s' % (len(missing), missing))

    problems = differences(unstated, set(UNSTATED), 'declared without a stated id') + \
        differences(missing, RANGE_ONLY, 'stated but not declared')
    for p in problems:
        print(p)
    return 1 if a.check and problems else 0


if __name__ == '__main__':
    sys.exit(main())
