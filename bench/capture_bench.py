#!/usr/bin/env python3
"""dpx-decode against tshark on one capture of CAMEL traffic.

Writes a capture of --messages CAMEL messages (default 100,000): overlapping
call flows (tools/capwrite/callflow.py: InitialDP, RequestReportBCSMEvent,
ApplyCharging, Continue, EventReportBCSM, ApplyChargingReport, ReleaseCall,
SMS, announcements with their Return Results, Return Errors, rejects,
aborts) over Ethernet/IPv4/SCTP/M3UA/SCCP, a few messages bundled or
fragmented, and times, on the same file, side by side:

    dpx-decode --pass md        against  tshark -V
    dpx-decode --pass keys      against  tshark -T fields (frame, otid, dtid, invoke id, opcode)
    dpx-decode --summary        against  tshark (one line per frame)

Output goes to /dev/null on both sides.  Prints wall time, messages per
second, CPU time (user + system: steadier than wall time on a busy
machine), the ratios (tshark / dpx-decode) and the peak resident memory of
each process; then dpx-decode's peak memory on a capture a tenth
the size, to show it does not grow with the capture.  The capture is kept
in --workdir and reused while its parameters stay the same.

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
KEY_FIELDS = ['frame.number', 'tcap.otid', 'tcap.dtid', 'camel.present', 'camel.local']


def run(cmd, env=None):
    """-> (wall seconds, CPU seconds (user + system), peak resident set in
    MiB, exit status)."""
    start = time.perf_counter()
    proc = subprocess.Popen(cmd, stdout=subprocess.DEVNULL, stderr=subprocess.PIPE, env=env)
    _, status, usage = os.wait4(proc.pid, 0)
    wall = time.perf_counter() - start
    err = proc.stderr.read().decode(errors='replace')
    proc.stderr.close()
    proc.returncode = os.waitstatus_to_exitcode(status)
    if proc.returncode != 0:
        sys.stderr.write('capture_bench: %s exited %d: %s\n' % (cmd[0], proc.returncode, err.strip()[:300]))
    return wall, usage.ru_utime + usage.ru_stime, usage.ru_maxrss / 1024.0, proc.returncode


def write_flow(path, messages, seed):
    sys.path.insert(0, str(ROOT / 'tools' / 'capwrite'))
    import callflow
    c = callflow.load_capgen()
    if c is None:
        sys.exit('capture_bench: capgen.py not found (../shared/tools or DPX_REFERENCE_TOOLS)')
    # Mostly one message a packet; every 50th message bundled with the next
    # ones or fragmented, as busy links do.
    with open(path, 'w') as out:
        side = None
        for i, (s, hexmsg, _desc, _call) in enumerate(
                callflow.generate(c, seed=seed, messages=messages, overlap=200)):
            opts = []
            if s != side:
                opts.append('--from ' + s)
                side = s
            if i % 50 == 0:
                opts.append('--fragment 64')
            elif i % 50 == 1:
                opts.append('--fragment 0 --bundle 4')
            elif i % 50 == 5:
                opts.append('--bundle 1')
            if opts:
                out.write('#@ %s\n' % ' '.join(opts))
            out.write(hexmsg + '\n')


def make_capture(capwrite, workdir, messages, seed):
    cap = workdir / ('camel-%d-%d.pcap' % (messages, seed))
    if cap.exists():
        return cap
    flow = workdir / ('camel-%d-%d.hex' % (messages, seed))
    t = time.perf_counter()
    write_flow(flow, messages, seed)
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
    pairs = [
        ('md', [a.decoder, '--pass', 'md', str(cap)], tshark + ['-V']),
        ('keys', [a.decoder, '--pass', 'keys', str(cap)], tshark + ['-T', 'fields'] + fields),
        ('summary', [a.decoder, '--summary', str(cap)], tshark),
    ]
    print('\n%d messages in %s (%s)' % (a.messages, cap.name, subprocess.run(
        [a.tshark, '--version'], capture_output=True, text=True).stdout.splitlines()[0]))
    print('wall and CPU (user + system) seconds; ratio: tshark / dpx-decode')
    print('%-8s %15s %15s %13s %12s %10s %10s' % ('pass', 'dpx-decode', 'tshark', 'ratio wall/CPU',
                                                  'msgs/s ours', 'RSS ours', 'RSS tshark'))
    failed = False
    for name, ours, theirs in pairs:
        if a.only and name not in a.only:
            continue
        t_ours, c_ours, m_ours, rc1 = run(ours)
        t_theirs, c_theirs, m_theirs, rc2 = run(theirs, env)
        failed |= rc1 != 0 or rc2 != 0
        print('%-8s %7.2f / %6.2f %7.2f / %6.2f %6.1fx/%5.1fx %12.0f %7.1f MB %7.1f MB'
              % (name, t_ours, c_ours, t_theirs, c_theirs, t_theirs / t_ours,
                 c_theirs / max(c_ours, 1e-3), a.messages / t_ours, m_ours, m_theirs))
    _, _, m_small, rc = run([a.decoder, '--pass', 'md', str(small)])
    _, _, m_big, rc2 = run([a.decoder, '--pass', 'md', str(cap)])
    failed |= rc != 0 or rc2 != 0
    print('dpx-decode --pass md peak memory: %.1f MB on %d messages, %.1f MB on %d'
          % (m_small, max(1, a.messages // 10), m_big, a.messages))
    return 1 if failed else 0


if __name__ == '__main__':
    sys.exit(main())
