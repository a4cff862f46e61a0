#!/usr/bin/env python3
"""Following calls with dpx-decode, checked against the truth and tshark.

Writes one capture of CAMEL call flows of every kind - answered, busy,
refused, announcement, SMS, no answer, activity test, rejected, aborted by
the gsmSCF and by the gsmSSF, ended by a pre-arranged end, left open, one
whose Begin is missing - with the same transaction ids used at once between
different point codes, and known delays between the messages (whole
milliseconds).  Then:

  dialogues  `--dialogues --format json` gives exactly the generated calls:
             frames, outcome, what closed them, Begin seen, subscriber.
  srt        `--stats srt --format json` gives, per category, exactly the
             counts, min, max, mean and nearest-rank p50/p90/p99 of the
             delays the flows were written with; beside it tshark's
             `-z camel,srt` on the same capture: counts and min/max/mean
             must agree except where tshark is known to differ (printed).
  filters    `--match imsi=X`, `--match called=Y`, `--match
             operation=initialDP` select the frames `tshark -Y` selects.
  flow       `--flow` writes well-formed SVG with one arrow per message;
             with --render, headless Chromium renders it to a PNG without
             error (skipped, 77, without chromium).

Exit status: 0 all agree, 1 a difference, 77 skipped (tshark, capwrite's
call flows or ../shared/tools missing).  Python 3 standard library only.
"""

import argparse
import json
import math
import os
import random
import re
import shutil
import subprocess
import sys
import tempfile
import xml.etree.ElementTree as ET
from pathlib import Path

SKIP = 77
ROOT = Path(__file__).resolve().parents[2]
T0 = 1767225600
SCF_PC = 2
SSF_PCS = (1, 3, 5)
TIMEOUT = 60

# The categories tshark measures, then ours.  Each: name, rule, start
# operation, end operations, restart, slice.
CATEGORIES = [
    ('TCAP_Session', 'session', None, (), False, 0),
    ('InitialDP/Continue', 'pair', 'initialDP', ('continue',), False, 0),
    ('Slice1_ACR/ACH', 'pair', 'applyChargingReport', ('applyCharging',), False, 1),
    ('Slice2_ACR/ACH', 'pair', 'applyChargingReport', ('applyCharging',), False, 2),
    ('Slice3_ACR/ACH', 'pair', 'applyChargingReport', ('applyCharging',), False, 3),
    ('EvtRepBSCM/Release', 'pair', 'eventReportBCSM', ('releaseCall',), True, 0),
    ('InitialDP/ContinueGPRS', 'pair', 'initialDPGPRS', ('continueGPRS',), False, 0),
    ('EvtRepGPRS/ContinueGPRS', 'pair', 'eventReportGPRS', ('continueGPRS',), True, 0),
    ('InitialDP/ContinueSMS', 'pair', 'initialDPSMS', ('continueSMS',), False, 0),
    ('InitialDP/FirstAnswer', 'answer', 'initialDP', (), False, 0),
    ('InitialDPSMS/FirstAnswer', 'answer', 'initialDPSMS', (), False, 0),
    ('InitialDPGPRS/FirstAnswer', 'answer', 'initialDPGPRS', (), False, 0),
    ('RRBE/EvtRepBSCM', 'pair', 'requestReportBCSMEvent', ('eventReportBCSM',), False, 0),
    ('PromptAndCollect/Result', 'result', 'promptAndCollectUserInformation', (), False, 0),
    ('ActivityTest/Result', 'result', 'activityTest', (), False, 0),
    ('ActivityTestGPRS/Result', 'result', 'activityTestGPRS', (), False, 0),
]
# Calls tshark leaves out of a category (see the README): it times nothing
# in a dialogue whose Begin it has not seen, and no TCAP session that ends
# with a Return Error or a Reject in the End.
def tshark_sees(call, name):
    if call['kind'] == 'no-begin':
        return False
    return name != 'TCAP_Session' or call['kind'] not in ('refused', 'rejected')


def fail(msg):
    print('FAIL: ' + msg)
    return 1


# --------------------------------------------------------------------------
# The calls
# --------------------------------------------------------------------------
def lower_first(s):
    return s[:1].lower() + s[1:]


def parse_desc(desc):
    """callflow's description -> (message type, [(kind, operation)])."""
    mtype, _, rest = desc.partition(':')
    comps = []
    for item in filter(None, (x.strip() for x in rest.split(','))):
        words = item.split()
        if words[0] == 'Return' and words[1] == 'Result':
            comps.append(('result', lower_first(words[2])))
        elif words[0] == 'Return' and words[1] == 'Error':
            comps.append(('error', words[2]))
        elif words[0] in ('Reject', 'P-Abort'):
            comps.append((words[0].lower(), None))
        else:
            comps.append(('invoke', lower_first(words[0])))
    return mtype.strip(), comps


class Recorder:
    """callflow.Calls whose Initial DPs remember their subscriber."""

    def __init__(self, callflow, c, rng):
        self.calls = callflow.Calls(c, rng)
        self.c = c
        self.last = None
        original = c.arg_initial_dp

        def idp(**kw):
            self.last = kw
            return original(**kw)
        c.arg_initial_dp = idp
        # An SMS Initial DP gives its dialogue the service key; its addresses
        # are not the call's called and calling numbers.
        original_sms = c.arg_initial_dp_sms

        def idp_sms(**kw):
            self.last = {'service_key': kw.get('service_key')}
            return original_sms(**kw)
        c.arg_initial_dp_sms = idp_sms

    def make(self, kind, a, b):
        self.last = None
        c = self.c
        base = {'abort-by-ssf': 'answered', 'prearranged': 'answered', 'open': 'answered',
                'no-begin': 'answered'}.get(kind, kind)
        msgs = self.calls.call(base, a, b)
        if kind == 'abort-by-ssf':
            msgs = msgs[:2] + [('a', c.hx(c.tcap_abort(b, p_abort=1)), 'Abort: P-Abort')]
        elif kind == 'prearranged':
            release = c.invoke(4, 'releaseCall', c.arg_release_call(31))
            msgs = msgs[:3] + [('b', c.hx(c.tcap_continue(b, a, None, [release])), 'Continue: ReleaseCall')]
        elif kind == 'open':
            msgs = msgs[:3]
        elif kind == 'no-begin':
            msgs = msgs[1:]
        return msgs, self.last


OUTCOME = {'abort': ('aborted', 'abort'), 'abort-by-ssf': ('aborted', 'abort'),
           'prearranged': ('ended', 'prearranged'), 'open': ('open', 'timeout')}
KINDS = ['answered', 'busy', 'refused', 'announcement', 'sms', 'noanswer', 'activity', 'rejected',
         'abort', 'abort-by-ssf', 'prearranged', 'open', 'no-begin']


def build_calls(callflow, c, seed, rounds):
    """-> (hex lines for capwrite, [call]) with every message's frame and time."""
    rng = random.Random(seed)
    rec = Recorder(callflow, c, rng)
    calls, events = [], []

    def add(kind, pc, tid_a, tid_b, start, steps):
        msgs, idp = rec.make(kind, tid_a, tid_b)
        t = start()
        call = {'kind': kind, 'pc': pc, 'idp': idp, 'messages': []}
        for side, hexmsg, desc in msgs:
            mtype, comps = parse_desc(desc)
            call['messages'].append({'t': t, 'side': side, 'type': mtype, 'comps': comps})
            events.append((t, len(events), side, pc, hexmsg, call['messages'][-1]))
            t += steps()
        calls.append(call)

    n = 0
    for r in range(rounds):
        for kind in KINDS:
            # Ids repeat across the SSFs: three calls at once share them.
            add(kind, SSF_PCS[n % len(SSF_PCS)], 0x10000000 + n // len(SSF_PCS), 0x80000000 + n // len(SSF_PCS),
                lambda: 40 * n + rng.randint(0, 30), lambda: rng.choice((1, 2, 3, 5, 8, 13, 21, 40, 150, 400, 1200)))
            n += 1
    # One last call long after the rest: every silent dialogue times out.
    last = max(e[0] for e in events) + (TIMEOUT + 5) * 1000
    add('answered', SSF_PCS[0], 0x1FFFFFFF, 0x8FFFFFFF, lambda: last, lambda: 7)

    lines = []
    for frame, (t, _, side, pc, hexmsg, msg) in enumerate(sorted(events, key=lambda e: (e[0], e[1])), 1):
        msg['frame'] = frame
        lines.append('#@ --from %s --opc %d --dpc %d --at %d.%03d' % (side, pc, SCF_PC, T0 + t // 1000, t % 1000))
        lines.append(hexmsg)
    return lines, calls


# --------------------------------------------------------------------------
# The truth of the response times
# --------------------------------------------------------------------------
def truth_samples(call, rule, start, ends, restart, slice_):
    msgs = call['messages']
    invokes = lambda m, op: any(k == 'invoke' and o == op for k, o in m['comps'])  # noqa: E731
    out = []
    if rule == 'session':
        if call['kind'] not in ('no-begin', 'open'):
            out.append(msgs[-1]['t'] - msgs[0]['t'])
    elif rule == 'pair':
        waiting, done = None, 0
        for m in msgs:
            for k, o in m['comps']:
                if k == 'invoke' and o == start:
                    if waiting is None or restart:
                        waiting = m
                elif waiting is not None and m['side'] != waiting['side'] and k == 'invoke' and o in ends:
                    done += 1
                    if slice_ in (0, done):
                        out.append(m['t'] - waiting['t'])
                    waiting = None
    elif rule == 'answer':
        for i, m in enumerate(msgs):
            if invokes(m, start):
                nxt = [x for x in msgs[i + 1:] if x['side'] != m['side']]
                if nxt:
                    out.append(nxt[0]['t'] - m['t'])
                break
    elif rule == 'result':
        for i, m in enumerate(msgs):
            if invokes(m, start):
                nxt = [x for x in msgs[i + 1:] if x['side'] != m['side'] and ('result', start) in x['comps']]
                if nxt:
                    out.append(nxt[0]['t'] - m['t'])
    return out


def summary(ms):
    if not ms:
        return {'count': 0, 'min': 0, 'max': 0, 'mean': 0, 'p50': 0, 'p90': 0, 'p99': 0}
    s = sorted(ms)
    rank = lambda p: s[max(0, math.ceil(p * len(s) / 100) - 1)] / 1000  # noqa: E731
    return {'count': len(s), 'min': s[0] / 1000, 'max': s[-1] / 1000, 'mean': sum(s) / len(s) / 1000,
            'p50': rank(50), 'p90': rank(90), 'p99': rank(99)}


# --------------------------------------------------------------------------
# Runs
# --------------------------------------------------------------------------
def run(decoder, *args):
    p = subprocess.run([decoder] + list(args), capture_output=True, text=True)
    if p.returncode != 0:
        raise RuntimeError('dpx-decode %s: exit %d: %s' % (' '.join(args), p.returncode, p.stderr[:400]))
    return p.stdout


def tshark_env():
    return dict(os.environ, WIRESHARK_CONFIG_DIR=tempfile.mkdtemp(prefix='follow-ws-'))


def tshark_srt(tshark, capture):
    out = subprocess.run([tshark, '-n', '-q', '-r', str(capture), '-o', 'camel.tcap.ssn:146', '-z', 'camel,srt'],
                         capture_output=True, text=True, env=tshark_env()).stdout
    rows = {}
    for line in out.splitlines():
        m = re.match(r'\|\s*(\S+)\s*\|\s*(\d+)\s*\|\s*([\d.]+)\s*(m?s)\s*\|\s*([\d.]+)\s*(m?s)\s*\|\s*([\d.]+)\s*(m?s)',
                     line)
        if m:
            scale = lambda v, u: float(v) / (1000 if u == 'ms' else 1)  # noqa: E731
            rows[m.group(1)] = {'count': int(m.group(2)), 'min': scale(m.group(3), m.group(4)),
                                'max': scale(m.group(5), m.group(6)), 'mean': scale(m.group(7), m.group(8))}
    return rows


def tshark_frames(tshark, capture, display_filter):
    out = subprocess.run([tshark, '-n', '-r', str(capture), '-o', 'camel.tcap.ssn:146', '-Y', display_filter,
                          '-T', 'fields', '-e', 'frame.number'], capture_output=True, text=True,
                         env=tshark_env()).stdout
    return sorted({int(x) for x in out.split()})


def check_dialogues(decoder, capture, calls):
    errors = 0
    got = [json.loads(x) for x in run(decoder, '--dialogues', '--format', 'json', str(capture)).splitlines()]
    by_frames = {tuple(d['frames']): d for d in got}
    if len(got) != len(calls):
        errors += fail('%d dialogues, %d calls' % (len(got), len(calls)))
    for call in calls:
        frames = tuple(m['frame'] for m in call['messages'])
        d = by_frames.get(frames)
        if d is None:
            errors += fail('%s call on pc %d: no dialogue with frames %s' % (call['kind'], call['pc'], frames))
            continue
        outcome, closed = OUTCOME.get(call['kind'], ('ended', 'end'))
        idp = call['idp'] if call['kind'] != 'no-begin' else None
        want = {'outcome': outcome, 'closedBy': closed, 'beginSeen': call['kind'] != 'no-begin',
                'imsi': idp and idp.get('imsi'), 'called': idp and idp.get('called'),
                'calling': idp and idp.get('calling'), 'serviceKey': idp and idp.get('service_key')}
        have = {k: d[k] for k in want}
        if have != want:
            errors += fail('%s call, frames %s: %s, expected %s' % (call['kind'], frames, have, want))
        # Side a, the gsmSSF, begins every dialogue.
        dirs = [m['direction'] for m in d['messages']]
        if dirs != [('forward' if m['side'] == 'a' else 'backward') for m in call['messages']]:
            errors += fail('%s call: directions %s' % (call['kind'], dirs))
    print('dialogues: %d calls, %d dialogues' % (len(calls), len(got)))
    return errors


def check_srt(decoder, tshark, capture, calls):
    errors = 0
    ours = json.loads(run(decoder, '--stats', 'srt', '--format', 'json', str(capture)))
    rows = {r['category']: r for r in ours['srt']}
    for name, rule, start, ends, restart, slice_ in CATEGORIES:
        ms = [x for call in calls for x in truth_samples(call, rule, start, ends, restart, slice_)]
        want = summary(ms)
        have = {k: rows[name][k] for k in want}
        if have['count'] != want['count'] or any(abs(have[k] - want[k]) > 1e-9 for k in want):
            errors += fail('%s: %s, the flows say %s' % (name, have, want))
    print('srt: %d categories against the delays written' % len(CATEGORIES))
    # tshark shows two decimals of seconds or milliseconds.
    theirs = tshark_srt(tshark, capture)
    print('%-26s %8s %8s %14s' % ('beside tshark', 'ours', 'tshark', 'tshark sees'))
    for cat in CATEGORIES[:9]:
        name = cat[0]
        seen = summary([x for call in calls if tshark_sees(call, name) for x in truth_samples(call, *cat[1:])])
        t, o = theirs.get(name), rows[name]
        print('%-26s %8d %8s %14d' % (name, o['count'], t and t['count'], seen['count']))
        # tshark's TCAP_Session times differ from the dialogues' for a few
        # calls of a mixed capture (not so for any pair of call kinds alone):
        # only its count is compared.  Two decimals of s or ms are shown.
        timed = ('min', 'max', 'mean') if name != 'TCAP_Session' else ()
        if t is None or t['count'] != seen['count'] or (seen['count'] and any(
                abs(t[k] - seen[k]) > 0.005 * max(1, seen[k]) for k in timed)):
            errors += fail('%s: tshark %s, expected %s' % (name, t, seen))
    return errors


def check_filters(decoder, tshark, capture, calls):
    errors = 0
    idp = next(c['idp'] for c in calls if c['kind'] == 'answered')
    for ours, theirs in ((['--match', 'imsi=' + idp['imsi']], 'e212.imsi == "%s"' % idp['imsi']),
                         (['--match', 'called=' + idp['called']], 'isup.called == "%s"' % idp['called']),
                         (['--match', 'operation=initialDP'], 'camel.local == 0'),
                         (['--match', 'imsi~26201', '--match', 'op=0'], 'e212.imsi matches "^26201" && camel.local == 0')):
        out = run(decoder, '--format', 'json', '--pass', 'md', *ours, str(capture))
        have = sorted({json.loads(x)['frame'] for x in out.splitlines()})
        want = tshark_frames(tshark, capture, theirs)
        if have != want or not have:
            errors += fail('%s selects %s, tshark -Y %s selects %s' % (' '.join(ours), have, theirs, want))
    print('filters: 4 against tshark -Y')
    return errors


def check_flow(decoder, capture, calls, outdir, chromium):
    errors = 0
    idp = next(c['idp'] for c in calls if c['kind'] == 'activity')
    call = next(c for c in calls if c['idp'] is idp)
    one = outdir / 'one-call.svg'
    run(decoder, '--flow', str(one), '--match', 'imsi=' + idp['imsi'], str(capture))
    everything = outdir / 'all.svg'
    run(decoder, '--flow', str(everything), str(capture))
    total = sum(len(c['messages']) for c in calls)
    for path, want in ((one, len(call['messages'])), (everything, total)):
        root = ET.parse(path).getroot()  # raises on XML that is not well-formed
        arrows = root.findall('{http://www.w3.org/2000/svg}g')
        if len(arrows) != want:
            errors += fail('%s: %d arrows, %d messages' % (path.name, len(arrows), want))
    print('flow: %d and %d arrows, well-formed' % (len(call['messages']), total))
    if chromium:
        for path in (one, everything):
            errors += render(chromium, path, outdir)
    return errors


def render(chromium, svg, outdir):
    """Headless Chromium draws the picture to a PNG and reads it back as a document."""
    png = outdir / (svg.stem + '.png')
    profile = tempfile.mkdtemp(prefix='follow-chromium-')
    flags = ['--headless', '--no-sandbox', '--disable-gpu', '--no-first-run', '--disable-background-networking',
             '--disable-component-update', '--disable-sync', '--user-data-dir=' + profile]
    root = ET.parse(svg).getroot()
    size = '%s,%s' % (root.get('width'), min(int(root.get('height')), 16000))
    shot = subprocess.run([chromium] + flags + ['--window-size=' + size, '--screenshot=' + str(png),
                                                svg.resolve().as_uri()], capture_output=True, text=True, timeout=180)
    dom = subprocess.run([chromium] + flags + ['--dump-dom', svg.resolve().as_uri()],
                         capture_output=True, text=True, timeout=180)
    shutil.rmtree(profile, ignore_errors=True)
    if shot.returncode != 0 or not png.is_file() or png.stat().st_size < 1000:
        return fail('chromium could not render %s: %s' % (svg.name, shot.stderr[-400:]))
    if dom.returncode != 0 or 'parsererror' in dom.stdout or '<svg' not in dom.stdout:
        return fail('chromium reports an error in %s' % svg.name)
    with open(png, 'rb') as f:
        if f.read(8) != b'\x89PNG\r\n\x1a\n':
            return fail('%s is not a PNG' % png)
    print('rendered %s (%d bytes)' % (png.name, png.stat().st_size))
    return 0


def main(argv=None):
    ap = argparse.ArgumentParser(description=__doc__.split('\n\n')[0])
    ap.add_argument('--decoder', required=True)
    ap.add_argument('--capwrite', required=True)
    ap.add_argument('--tools', help='folder of capgen.py (default ../shared/tools)')
    ap.add_argument('--rounds', type=int, default=6, help='calls of every kind')
    ap.add_argument('--seed', type=int, default=3)
    ap.add_argument('--render', action='store_true', help='only the flow pictures, rendered by Chromium')
    ap.add_argument('--keep', help='keep the capture and pictures in this folder')
    a = ap.parse_args(argv)

    tshark = shutil.which('tshark')
    chromium = shutil.which('chromium') or shutil.which('chromium-browser')
    sys.path.insert(0, str(ROOT / 'tools' / 'capwrite'))
    import callflow  # noqa: E402
    c = callflow.load_capgen(a.tools)
    if c is None or (tshark is None and not a.render) or (a.render and chromium is None):
        print('skipped: %s missing' % ('capgen.py' if c is None else 'chromium' if a.render else 'tshark'))
        return SKIP

    outdir = Path(a.keep or tempfile.mkdtemp(prefix='follow-'))
    outdir.mkdir(parents=True, exist_ok=True)
    lines, calls = build_calls(callflow, c, a.seed, a.rounds)
    src, capture = outdir / 'calls.hex', outdir / 'calls.pcap'
    src.write_text('\n'.join(lines) + '\n')
    subprocess.run([a.capwrite, '-o', str(capture), str(src)], check=True)
    try:
        if a.render:
            errors = check_flow(a.decoder, capture, calls, outdir, chromium)
        else:
            errors = (check_dialogues(a.decoder, capture, calls) + check_srt(a.decoder, tshark, capture, calls)
                      + check_filters(a.decoder, tshark, capture, calls)
                      + check_flow(a.decoder, capture, calls, outdir, None))
    finally:
        if not a.keep:
            shutil.rmtree(outdir, ignore_errors=True)
    print('%s: %d calls, %d messages' % ('FAILED' if errors else 'passed', len(calls),
                                         sum(len(x['messages']) for x in calls)))
    return 1 if errors else 0


if __name__ == '__main__':
    sys.exit(main())
