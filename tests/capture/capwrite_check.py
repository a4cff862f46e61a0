#!/usr/bin/env python3
"""Checks of capwrite's output.

--samples: the sample captures are what capwrite makes today from
  samples/callflow.hex (a changed writer or flow file shows here).
--tshark: every carrier, written with bundling, fragmentation and XUDT
  segments, is read back by tshark with checksum verification on: the
  frames carry good IPv4 and SCTP checksums, tshark reports nothing
  malformed, finds every message with its transaction ids in input order,
  and the time stamps and cut frames (snap length) are what was asked.

Exit status: 0 passed, 1 failed, 77 skipped (--tshark without tshark).
"""

import argparse
import os
import shutil
import subprocess
import sys
import tempfile
import xml.etree.ElementTree as ET
from pathlib import Path

SKIP = 77
ROOT = Path(__file__).resolve().parents[2]
SAMPLES = [('callflow-m3ua.pcap', []), ('callflow-mtp2.pcapng', ['--link', 'mtp2'])]

# Messages of different sizes (13 to 180 octets) from samples/callflow.hex.
def sample_messages():
    msgs = [l.strip() for l in (ROOT / 'samples' / 'callflow.hex').read_text().splitlines()
            if l.strip() and not l.startswith('#')]
    return msgs[:12]


# name, capwrite options.  '--fragment 40' and '--segment 50' split the
# longer messages; '--bundle 3' packs several chunks in one packet.
CARRIERS = [
    ('ethernet m3ua', ['--link', 'ethernet']),
    ('ethernet m3ua bundled', ['--link', 'ethernet', '--bundle', '3']),
    ('ethernet m3ua fragmented', ['--link', 'ethernet', '--fragment', '40']),
    ('ethernet m3ua fragmented bundled', ['--link', 'ethernet', '--fragment', '40', '--bundle', '3']),
    ('ethernet m3ua xudt segments', ['--link', 'ethernet', '--sccp', 'xudt', '--segment', '50']),
    ('ethernet m3ua ludt', ['--link', 'ethernet', '--sccp', 'ludt']),
    ('ethernet m3ua ansi', ['--link', 'ethernet', '--ansi', '--pc-in-address']),
    ('802.1Q ipv4 options', ['--link', 'ethernet', '--vlan', '7', '--ip-options']),
    ('QinQ ipv6 hop-by-hop', ['--link', 'ethernet', '--vlan', '7', '--vlan', '8', '--ipv6', '--ip-options']),
    ('sll m2ua', ['--link', 'sll', '--sigtran', 'm2ua']),
    ('sll2 m2pa', ['--link', 'sll2', '--sigtran', 'm2pa', '--fragment', '64']),
    ('raw ipv6 sua', ['--link', 'raw', '--ipv6', '--sigtran', 'sua', '--bundle', '2']),
    ('loopback ipv4 sua', ['--link', 'loopback', '--sigtran', 'sua', '--pc-in-address']),
    ('loopback ipv6 m3ua', ['--link', 'loopback', '--ipv6']),
    ('mtp2', ['--link', 'mtp2']),
    ('mtp2 xudt segments', ['--link', 'mtp2', '--sccp', 'xudt', '--segment', '40']),
    ('mtp2 pseudo-header pcapng', ['--link', 'mtp2-phdr', '--format', 'pcapng']),
    ('mtp3 pcapng nanoseconds', ['--link', 'mtp3', '--format', 'pcapng', '--nanoseconds']),
    ('pcap nanoseconds', ['--nanoseconds']),
]
START, INTERVAL_US = 1767225600.5, 250


def tids(hexmsg):
    """Transaction ids of a TCAP message: (otid, dtid), None when absent."""
    b = bytes.fromhex(hexmsg)
    pos = 2 + (b[1] & 0x7F if b[1] > 0x80 else 0)  # past the tag and length
    found = {}
    while pos + 2 <= len(b) and b[pos] in (0x48, 0x49):
        n = b[pos + 1]
        found[b[pos]] = b[pos + 2:pos + 2 + n].hex()
        pos += 2 + n
    return found.get(0x48), found.get(0x49)


def tshark_read(tshark, path, ansi):
    prefs = ['sctp.checksum:CRC-32C', 'ip.check_checksum:TRUE', 'camel.tcap.ssn:146',
             'tcap.persistentsrt:FALSE', 'mtp3.standard:' + ('ANSI' if ansi else 'ITU')]
    cmd = [tshark, '-n', '-r', str(path), '-T', 'pdml']
    for p in prefs:
        cmd += ['-o', p]
    env = dict(os.environ, WIRESHARK_CONFIG_DIR=tempfile.mkdtemp(prefix='capwrite-ws-'))
    proc = subprocess.run(cmd, capture_output=True, env=env)
    if proc.returncode != 0:
        raise RuntimeError(proc.stderr.decode(errors='replace')[:300])
    frames = []
    for packet in ET.fromstring(proc.stdout).iter('packet'):
        fields = {}
        msgs = []
        for f in packet.iter('field'):
            name = f.get('name')
            fields.setdefault(name, []).append(f.get('show'))
        for proto in packet.findall('proto'):
            if proto.get('name') == 'tcap':
                ids = {f.get('name'): f.get('value') for f in proto.iter('field')
                       if f.get('name') in ('tcap.otid', 'tcap.dtid')}
                msgs.append((ids.get('tcap.otid'), ids.get('tcap.dtid')))
        frames.append((fields, msgs))
    return frames


def check_carrier(tshark, capwrite, name, opts, msgs, tmp):
    src = tmp / 'in.txt'
    src.write_text('\n'.join(msgs) + '\n')
    fmt = 'pcapng' if 'pcapng' in opts else 'pcap'
    path = tmp / ('out.' + fmt)
    subprocess.run(capwrite + ['-o', str(path), '--time', str(START), '--interval', str(INTERVAL_US)]
                   + opts + [str(src)], check=True)
    frames = tshark_read(tshark, path, '--ansi' in opts)
    faults = []
    found = [m for _, ms in frames for m in ms]
    want = [tids(m) for m in msgs]
    if found != want:
        faults.append('messages %s, wanted %s' % (found[:4], want[:4]))
    for i, (fields, _) in enumerate(frames, 1):
        bad = [s for s in fields.get('_ws.expert', []) + fields.get('_ws.malformed', [])]
        if bad or '_ws.malformed' in fields:
            faults.append('frame %d: expert items %s' % (i, fields.get('_ws.expert.message')))
        for status in ('ip.checksum.status', 'sctp.checksum.status'):
            for v in fields.get(status, []):
                if v != '1':  # 1: good
                    faults.append('frame %d: %s %s' % (i, status, v))
        if not fields.get('ip.checksum.status') and not fields.get('ipv6.version') and \
                'mtp' not in name:
            faults.append('frame %d: no IP layer' % i)
        stamp = float(fields['frame.time_epoch'][0])
        if abs(stamp - (START + (i - 1) * INTERVAL_US / 1e6)) > 1e-7:
            faults.append('frame %d: time %.9f' % (i, stamp))
    return ['%s: %s' % (name, f) for f in faults[:5]]


def check_snaplen(tshark, capwrite, msgs, tmp):
    src = tmp / 'in.txt'
    src.write_text(msgs[0] + '\n')
    faults = []
    for fmt in ('pcap', 'pcapng'):
        path = tmp / ('cut.' + fmt)
        subprocess.run(capwrite + ['-o', str(path), '--format', fmt, '--snaplen', '60', str(src)], check=True)
        fields, _ = tshark_read(tshark, path, False)[0]
        cap, whole = int(fields['frame.cap_len'][0]), int(fields['frame.len'][0])
        if cap != 60 or whole <= 60:
            faults.append('snaplen %s: captured %d of %d' % (fmt, cap, whole))
    return faults


def check_samples(capwrite, tmp):
    faults = []
    for name, opts in SAMPLES:
        path = tmp / name
        subprocess.run(capwrite + ['-o', str(path)] + opts + [str(ROOT / 'samples' / 'callflow.hex')], check=True)
        if path.read_bytes() != (ROOT / 'samples' / name).read_bytes():
            faults.append('samples/%s differs from what capwrite writes now from samples/callflow.hex '
                          '(tests/capture/capwrite_check.py --regenerate)' % name)
    return faults


def main(argv=None):
    ap = argparse.ArgumentParser(description=__doc__.split('\n\n')[0])
    ap.add_argument('--capwrite', required=True)
    ap.add_argument('--emulator', default='', help='runs capwrite (a build for another machine)')
    ap.add_argument('--tshark', default=os.environ.get('TSHARK', 'tshark'))
    what = ap.add_mutually_exclusive_group(required=True)
    what.add_argument('--samples', action='store_true')
    what.add_argument('--tshark-check', action='store_true')
    what.add_argument('--regenerate', action='store_true', help='rewrite the sample captures')
    a = ap.parse_args(argv)
    a.capwrite = ([a.emulator] if a.emulator else []) + [a.capwrite]
    if a.regenerate:
        for name, opts in SAMPLES:
            subprocess.run(a.capwrite + ['-o', str(ROOT / 'samples' / name)] + opts
                           + [str(ROOT / 'samples' / 'callflow.hex')], check=True)
        return 0
    tmp = Path(tempfile.mkdtemp(prefix='capwrite-check-'))
    try:
        if a.samples:
            faults = check_samples(a.capwrite, tmp)
            checked = len(SAMPLES)
        else:
            if not shutil.which(a.tshark):
                print('capwrite_check: SKIPPED: %s not found' % a.tshark)
                return SKIP
            msgs = sample_messages()
            faults = []
            for name, opts in CARRIERS:
                faults += check_carrier(a.tshark, a.capwrite, name, opts, msgs, tmp)
            faults += check_snaplen(a.tshark, a.capwrite, msgs, tmp)
            checked = len(CARRIERS) + 2
    finally:
        shutil.rmtree(tmp, ignore_errors=True)
    for f in faults:
        print('FAIL', f)
    print('capwrite_check: %d checks, %d faults' % (checked, len(faults)))
    return 1 if faults else 0


if __name__ == '__main__':
    sys.exit(main())
