#!/usr/bin/env python3
"""dpx-decode against tshark on one capture of CAMEL traffic.

Writes a capture of --messages CAMEL messages (default 100,000) of every
operation, with their results, errors, rejects and aborts, in all five
message types (capgen.py's random corpus, valid messages only) over
Ethernet/IPv4/SCTP/M3UA/SCCP, a few messages bundled or fragmented, and
times, on the same file, side by side:

    dpx-decode --pass md        against  tshark -V
    dpx-decode --pass keys      against  tshark -T fields (otid, dtid, opcode,
                                         service key, calling digits, IMSI)
    dpx-decode --summary        against  tshark (one line per frame)

dpx-decode runs with --jobs 1 and with --jobs at every core.  Each command
runs three times, the three sides of a comparison in turn, and the best time
of each is kept.  Output goes to /dev/null on both sides.  Prints wall time,
CPU time (user + system, workers included: steadier than wall time on a busy
machine), the ratios (tshark / dpx-decode) and the peak resident memory of
each side (the largest single process: the reading process or one of the
workers); then dpx-decode's peak memory on a capture a tenth the size, to
show it does not grow with the capture.  The capture is kept in --workdir and
reused while its parameters stay the same.

Needs tshark and the reference tools (../shared/tools, for capgen.py).
Python 3 standard library only.
"""

import argparse
import os
import shutil
import subprocess
import sys
import tempfile
import time
from pathlib import Path

ROOT = Path(__file__).resolve().parents[1]
TSHARK_PREFS = ['camel.tcap.ssn:146', 'tcap.persistentsrt:FALSE', 'camel.persistentsrt:FALSE',
                'mtp3.standard:ITU', 'gui.max_tree_depth:100000']
KEY_FIELDS = ['tcap.otid', 'tcap.dtid', 'camel.local', 'camel.serviceKey', 'e164.calling_party_number.digits',
              'e212.imsi']
ROUNDS = 3


# The peak memory the kernel reports for a process counts what it held
# before exec: a command started straight from this (large) Python process
# would show Python's size.  GNU time, small itself, starts it instead and
# reports the peak of the command and the processes it waited for.
GNU_TIME = '/usr/bin/time' if os.access('/usr/bin/time', os.X_OK) else None


def run(cmd, env=None):
    """-> (wall seconds, CPU seconds (user + system), peak resident set in
    MiB of the largest process, exit status)."""
    with tempfile.NamedTemporaryFile('r', prefix='bench-rss-') as rss:
        full = [GNU_TIME, '-q', '-f', '%M', '-o', rss.name] + cmd if GNU_TIME else cmd
        start = time.perf_counter()
        proc = subprocess.Popen(full, stdout=subprocess.DEVNULL, stderr=subprocess.PIPE, env=env)
        _, status, usage = os.wait4(proc.pid, 0)
        wall = time.perf_counter() - start
        peak = rss.read().strip().splitlines() if GNU_TIME else []
    err = proc.stderr.read().decode(errors='replace')
    proc.stderr.close()
    proc.returncode = os.waitstatus_to_exitcode(status)
    if proc.returncode != 0:
        sys.stderr.write('capture_bench: %s exited %d: %s\n' % (cmd[0], proc.returncode, err.strip()[:300]))
    kib = int(peak[-1]) if peak and peak[-1].isdigit() else usage.ru_maxrss
    return wall, usage.ru_utime + usage.ru_stime, kib / 1024.0, proc.returncode


def write_corpus(path, messages, seed):
    sys.path.insert(0, str(ROOT / 'tools' / 'capwrite'))
    import callflow
    c = callflow.load_capgen()
    if c is None:
        sys.exit('capture_bench: capgen.py not found (../shared/tools or DPX_REFERENCE_TOOLS)')
    # The two sides take turns; every 50th message is bundled with the next
    # ones or fragmented, as busy links do.
    with open(path, 'w') as out:
        for i, m in enumerate(c.random_corpus(messages, seed=seed, avoid_quirks=True)):
            opts = ['--from ' + 'ab'[i % 2]]
            if i % 50 == 0:
                opts.append('--fragment 64')
            elif i % 50 == 1:
                opts.append('--fragment 0 --bundle 4')
            elif i % 50 == 5:
                opts.append('--bundle 1')
            out.write('#@ %s\n%s\n' % (' '.join(opts), m['hex']))


def make_capture(capwrite, workdir, messages, seed):
    cap = workdir / ('camel-ops-%d-%d.pcap' % (messages, seed))
    if cap.exists():
        return cap
    flow = workdir / ('camel-ops-%d-%d.hex' % (messages, seed))
    t = time.perf_counter()
    write_corpus(flow, messages, seed)
    subprocess.run([capwrite, '-o', str(cap), str(flow)], check=True)
    print('wrote %s (%d messages, %.1f MB) in %.1f s'
          % (cap, messages, cap.stat().st_size / 1e6, time.perf_counter() - t))
    return cap


def main(argv=None):
    ap = argparse.ArgumentParser(description=__doc__.split('\n\n')[0])
    ap.add_argument('--decoder', default=str(ROOT / 'build' / 'native' / 'dpx-decode'))
    ap.add_argument('--capwrite', default=str(ROOT / 'build' / 'native' / 'capwrite'))
    ap.add_argument('--tshark', default=os.environ.get('TSHARK', 'tshark'))
    ap.add_argument('--messages', type=int, default=100000)
    ap.add_argument('--seed', type=int, default=1)
    ap.add_argument('--workdir', default=str(ROOT / 'build' / 'bench-capture'))
    ap.add_argument('--only', choices=('md', 'keys', 'summary'), action='append',
                    help='run only these comparisons (repeatable)')
    a = ap.parse_args(argv)
    for tool in (a.decoder, a.capwrite):
        if not os.access(tool, os.X_OK):
            sys.exit('capture_bench: %s not built (make build)' % tool)
    if not shutil.which(a.tshark):
        sys.exit('capture_bench: %s not found' % a.tshark)
    work = Path(a.workdir)
    work.mkdir(parents=True, exist_ok=True)
    cap = make_capture(a.capwrite, work, a.messages, a.seed)
    small = make_capture(a.capwrite, work, max(1, a.messages // 10), a.seed)

    env = dict(os.environ, WIRESHARK_CONFIG_DIR=tempfile.mkdtemp(prefix='bench-ws-'))
    tshark = [a.tshark, '-n', '-r', str(cap)]
    for p in TSHARK_PREFS:
        tshark += ['-o', p]
    fields = []
    for f in KEY_FIELDS:
        fields += ['-e', f]
    cores = len(os.sched_getaffinity(0))
    comparisons = [
        ('md', ['--pass', 'md'], tshark + ['-V']),
        ('keys', ['--pass', 'keys'], tshark + ['-T', 'fields'] + fields),
        ('summary', ['--summary'], tshark),
    ]
    print('\n%d messages in %s (%s), %d cores' % (a.messages, cap.name, subprocess.run(
        [a.tshark, '--version'], capture_output=True, text=True).stdout.splitlines()[0], cores))
    print('best of %d, interleaved; wall / CPU (user + system) seconds; ratio: tshark / dpx-decode' % ROUNDS)
    print('%-8s %-9s %15s %15s %15s %12s %10s %10s' % ('pass', 'jobs', 'dpx-decode', 'tshark', 'ratio wall/CPU',
                                                      'msgs/s ours', 'RSS ours', 'RSS tshark'))
    failed = False
    for name, args, theirs in comparisons:
        if a.only and name not in a.only:
            continue
        sides = [[a.decoder, '--jobs', '1'] + args + [str(cap)],
                 [a.decoder, '--jobs', str(cores)] + args + [str(cap)], theirs]
        best = [None] * len(sides)
        for _ in range(ROUNDS):
            for k, cmd in enumerate(sides):
                wall, cpu, rss, rc = run(cmd, env if k == 2 else None)
                failed |= rc != 0
                b = best[k] or (wall, cpu, rss)
                best[k] = (min(b[0], wall), min(b[1], cpu), max(b[2], rss))
        t_theirs, c_theirs, m_theirs = best[2]
        for k, jobs in ((0, '1'), (1, '%d (all)' % cores)):
            t_ours, c_ours, m_ours = best[k]
            print('%-8s %-9s %7.2f / %6.2f %7.2f / %6.2f %7.1fx/%5.1fx %12.0f %7.1f MB %7.1f MB'
                  % (name, jobs, t_ours, c_ours, t_theirs, c_theirs, t_theirs / t_ours,
                     c_theirs / max(c_ours, 1e-3), a.messages / t_ours, m_ours, m_theirs))
    _, _, m_small, rc = run([a.decoder, '--pass', 'md', str(small)])
    _, _, m_big, rc2 = run([a.decoder, '--pass', 'md', str(cap)])
    failed |= rc != 0 or rc2 != 0
    print('dpx-decode --pass md peak memory: %.1f MB on %d messages, %.1f MB on %d'
          % (m_small, max(1, a.messages // 10), m_big, a.messages))
    return 1 if failed else 0


if __name__ == '__main__':
    sys.exit(main())
