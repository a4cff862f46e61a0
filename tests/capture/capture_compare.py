#!/usr/bin/env python3
"""Which CAMEL messages are in a capture: dpx-decode against tshark.

Decodes the sample captures (samples/*.pcap, samples/*.pcapng) and a
generated set of captures - a few thousand call-flow messages
(tools/capwrite/callflow.py) spread over every link type and SIGTRAN
adaptation capwrite writes, with SCTP bundling and fragmentation, XUDT
segments, LUDT, VLAN tags, IPv6 and IPv4 options, some messages of the
call flows on other subsystems; a pcapng whose interfaces have different
link types (Ethernet, SLL, raw IP, MTP3), gzip-compressed captures, IPv4
and IPv6 fragments (in order, reversed, overlapping, duplicated, missing),
CAMEL on SSN 10, and a capture with no CAMEL at all (TCAP without a
dialogue portion on SSN 6 and 7) - with `dpx-decode --format json --pass
md` and with tshark (-T pdml), and checks that both find the same
messages: for each, the frame number, the originating and destination
transaction ids and the operation code of each Invoke.  tshark's TCAP
messages count when the called or the calling SSN is 146, when tshark
decodes them as CAMEL (on any SSN, by their dialogue), and when one of
their transaction ids was seen on such a message before (an End without
components, say).  tshark decodes some messages of a dialogue on another
SSN as something else (GSM MAP on SSN 6 and 7) or as no application at
all: for those the frame and the transaction ids are compared, not the
operations.

dpx-decode must exit with status 4 on the capture without CAMEL (and on
any capture where neither finds a message), 0 on the others.

Exit status: 0 both agree, 1 they differ or dpx-decode failed, 77 skipped
(tshark or the reference tools ../shared/tools are missing).  Python 3
standard library only.
"""

import argparse
import json
import os
import random
import shutil
import subprocess
import sys
import tempfile
import xml.etree.ElementTree as ET
from collections import Counter
from pathlib import Path

SKIP = 77
NO_CAMEL_STATUS = 4
ROOT = Path(__file__).resolve().parents[2]
CAMEL_SSN = 146
F_OTID, F_DTID, F_OPCODE = 3653, 3656, 1066
# tshark counts the protocol layers of a frame against gui.max_tree_depth
# (and some layers outlive their frame): bundles of several messages with
# VLAN tags reach the default of 500 after a few hundred frames.
TSHARK_PREFS = ['camel.tcap.ssn:%d' % CAMEL_SSN, 'tcap.persistentsrt:FALSE',
                'sctp.checksum:CRC-32C', 'mtp3.standard:ITU', 'gui.max_tree_depth:100000']

# Generated captures: name, capwrite file options, and the per-message
# carrier choices drawn at random (each a '#@' line).
SCTP_VARIANTS = ['--fragment 0 --bundle 1', '--fragment 0 --bundle 3', '--fragment 48 --bundle 1',
                 '--fragment 100 --bundle 2']
SCCP_VARIANTS = ['--sccp udt --segment 0', '--sccp udt --segment 0', '--sccp xudt --segment 0',
                 '--sccp xudt --segment 60']
GENERATED = [
    ('eth-m3ua.pcap', ['--link', 'ethernet'], ['--sigtran m3ua'], SCTP_VARIANTS, SCCP_VARIANTS),
    ('eth-vlan-ipv6-m3ua.pcapng', ['--link', 'ethernet'], ['--sigtran m3ua --ipv6 --vlan 100'],
     SCTP_VARIANTS, SCCP_VARIANTS),
    ('eth-qinq-m2pa.pcap', ['--link', 'ethernet', '--nanoseconds'],
     ['--sigtran m2pa --vlan 10 --vlan 20 --ip-options'], SCTP_VARIANTS, SCCP_VARIANTS),
    ('sll-m2ua.pcap', ['--link', 'sll'], ['--sigtran m2ua'], SCTP_VARIANTS, SCCP_VARIANTS),
    ('sll2-ipv6-sua.pcapng', ['--link', 'sll2'], ['--sigtran sua --ipv6 --ip-options'], SCTP_VARIANTS, ['']),
    ('raw-m3ua-ludt.pcap', ['--link', 'raw'], ['--sigtran m3ua'], SCTP_VARIANTS,
     ['--sccp ludt --segment 0', '--sccp udt --segment 0']),
    ('loopback-m3ua.pcapng', ['--link', 'loopback'], ['--sigtran m3ua --ip-options --pc-in-address'],
     SCTP_VARIANTS, SCCP_VARIANTS),
    ('mtp2.pcap', ['--link', 'mtp2'], [''], [''], SCCP_VARIANTS),
    ('mtp2-phdr.pcapng', ['--link', 'mtp2-phdr'], [''], [''], SCCP_VARIANTS),
    ('mtp3.pcap', ['--link', 'mtp3'], ['--pc-in-address'], [''], SCCP_VARIANTS),
    # Each message on one of four interfaces of different link types.
    ('multi-interface.pcapng', ['--link', 'ethernet,sll,raw,mtp3'],
     ['--interface 0 --sigtran m3ua --ipv4', '--interface 1 --sigtran m2ua --ipv6',
      '--interface 2 --sigtran m3ua --ipv4', '--interface 3 --pc-in-address'], SCTP_VARIANTS, SCCP_VARIANTS),
    ('multi-interface-gz.pcapng.gz', ['--link', 'mtp3,ethernet'],
     ['--interface 0 --sigtran m3ua --pc-in-address', '--interface 1 --sigtran sua --ipv6'], SCTP_VARIANTS, ['']),
    ('eth-m3ua-gz.pcap.gz', ['--link', 'ethernet'], ['--sigtran m3ua'], SCTP_VARIANTS, SCCP_VARIANTS),
    ('ipv4-fragments.pcap', ['--link', 'ethernet'],
     ['--sigtran m3ua --ip-fragment 64 --ip-fragment-order ' + o
      for o in ('in', 'reverse', 'overlap', 'duplicate', 'missing')], SCTP_VARIANTS, SCCP_VARIANTS),
    ('ipv6-fragments.pcapng', ['--link', 'sll'],
     ['--sigtran m3ua --ipv6 --ip-options --ip-fragment 48 --ip-fragment-order ' + o
      for o in ('in', 'reverse', 'overlap', 'duplicate', 'missing')], SCTP_VARIANTS, SCCP_VARIANTS),
]
OTHER_SSN = '--called-ssn 6 --calling-ssn 7'   # HLR and VLR
CAMEL_SSNS = '--called-ssn 146 --calling-ssn 146'
SSN10 = '--called-ssn 10 --calling-ssn 10'
# Whole call flows on SSN 10: found by their CAMEL application contexts.
SSN10_CAPTURE = ('ssn10-m3ua.pcap', ['--link', 'ethernet'], ['--sigtran m3ua'], SCTP_VARIANTS, SCCP_VARIANTS)
NO_CAMEL_CAPTURE = 'no-camel.pcap'


def message_key(frame, otid, dtid, ops):
    return (int(frame), otid or '-', dtid or '-', None if ops is None else tuple(ops))


# --------------------------------------------------------------------------
# tshark
# --------------------------------------------------------------------------
def tshark_messages(tshark, capture):
    """-> [(frame, otid, dtid, (opcode, ...) or None)] for the TCAP messages tshark finds CAMEL."""
    env = dict(os.environ, WIRESHARK_CONFIG_DIR=tempfile.mkdtemp(prefix='capcmp-ws-'))
    cmd = [tshark, '-n', '-r', str(capture), '-T', 'pdml']
    for p in TSHARK_PREFS:
        cmd += ['-o', p]
    errors = tempfile.TemporaryFile()
    proc = subprocess.Popen(cmd, stdout=subprocess.PIPE, stderr=errors, env=env)
    out = []
    camel_ids = set()
    for _, packet in ET.iterparse(proc.stdout):
        if packet.tag != 'packet':
            continue
        frame, ssns, msg = None, (), None
        pending = []  # TCAP messages of the frame not on SSN 146: CAMEL or not, by what follows
        for proto in packet.findall('proto'):
            name = proto.get('name')
            if name == 'frame':
                frame = int(proto.find("field[@name='frame.number']").get('show'))
            elif name in ('sccp', 'sua'):
                ssns = {f.get('show') for f in proto.iter('field')
                        if f.get('name') in ('sccp.called.ssn', 'sccp.calling.ssn',
                                             'sua.source.ssn', 'sua.destination.ssn')}
            elif name == 'tcap':
                ids = {f.get('name'): f.get('value').lower() for f in proto.iter('field')
                       if f.get('name') in ('tcap.otid', 'tcap.dtid')}
                msg = [frame, ids.get('tcap.otid'), ids.get('tcap.dtid'), []]
                if str(CAMEL_SSN) in ssns:
                    out.append(msg)
                    camel_ids.update(i for i in msg[1:3] if i)
                elif msg[1] in camel_ids or msg[2] in camel_ids:
                    msg[3] = None  # operations unknown unless a camel layer follows
                    out.append(msg)
                else:
                    pending.append(msg)
            elif name == 'camel' and msg is not None:
                if msg[3] is None:
                    msg[3] = []
                if pending and pending[-1] is msg:
                    pending.pop()
                    out.append(msg)
                    camel_ids.update(i for i in msg[1:3] if i)
                for inv in proto.iter('field'):
                    if inv.get('name') != 'camel.invoke_element':
                        continue
                    for code in inv.findall("field[@name='camel.opcode']/field[@name='camel.local']"):
                        msg[3].append(int(code.get('show')))
        packet.clear()
    status = proc.wait()
    errors.seek(0)
    err = errors.read().decode(errors='replace')
    if status != 0 or 'Dissector bug' in err:
        raise RuntimeError('tshark failed on %s: %s' % (capture, err.strip()[:500]))
    return [message_key(*m) for m in out]


# --------------------------------------------------------------------------
# dpx-decode
# --------------------------------------------------------------------------
def after_eq(text):
    return text.split('=', 1)[1].strip().lower() if '=' in text else None


def our_messages(decoder, capture):
    proc = subprocess.run([decoder, '--format', 'json', '--pass', 'md', str(capture)],
                          capture_output=True, text=True)
    empty = not proc.stdout.strip()
    if proc.returncode != (NO_CAMEL_STATUS if empty else 0):
        raise RuntimeError('dpx-decode exit status %d on %s (%s): %s'
                           % (proc.returncode, capture, 'no message' if empty else 'messages',
                              proc.stderr.strip()[:500]))
    if empty and 'no CAMEL message' not in proc.stderr:
        raise RuntimeError('dpx-decode did not say that %s holds no CAMEL message' % capture)
    out = []
    for line in proc.stdout.splitlines():
        if not line.strip():
            continue
        o = json.loads(line)
        if 'frame' not in o:
            raise RuntimeError('dpx-decode gave a message without "frame" on %s' % capture)
        otid = dtid = None
        ops = []
        for f in (o.get('md') or {}).get('fields', []):
            if f['id'] == F_OTID:
                otid = after_eq(f['text'])
            elif f['id'] == F_DTID:
                dtid = after_eq(f['text'])
            elif f['id'] == F_OPCODE:
                spans = f.get('spans') or []
                ops.append(spans[0][2] if spans else after_eq(f['text']))
        out.append(message_key(o['frame'], otid, dtid, ops))
    return out


# --------------------------------------------------------------------------
# generated captures
# --------------------------------------------------------------------------
def without_dialogue(hexmsg):
    """The TCAP message without its dialogue portion (definite lengths only), or None."""
    b = bytes.fromhex(hexmsg)

    def tlv(at):
        n = b[at + 1]
        if n == 0x80:
            return None
        if n < 0x80:
            return at + 2, n
        k = n & 0x7F
        return at + 2 + k, int.from_bytes(b[at + 2:at + 2 + k], 'big')

    def length(n):
        return bytes([n]) if n < 0x80 else bytes([0x81, n]) if n < 0x100 else bytes([0x82]) + n.to_bytes(2, 'big')

    head = tlv(0)
    if head is None:
        return None
    start, n = head
    body, at = b'', start
    while at < start + n:
        e = tlv(at)
        if e is None:
            return None
        if b[at] != 0x6B:
            body += b[at:e[0] + e[1]]
        at = e[0] + e[1]
    return (bytes([b[0]]) + length(len(body)) + body).hex()


def write_capture(capwrite, outdir, name, file_opts, lines):
    src = outdir / (name + '.hex')
    src.write_text('\n'.join(lines) + '\n')
    path = outdir / name
    r = subprocess.run([capwrite] + file_opts + ['-o', str(path), str(src)],
                       capture_output=True, text=True)
    if r.returncode != 0 and name.endswith('.gz') and 'not supported' in r.stderr:
        # A build without zlib (the 32-bit one, typically) neither writes nor
        # reads compressed captures.
        print('%s: skipped, %s' % (name, r.stderr.strip()))
        return None
    if r.returncode != 0:
        sys.stderr.write(r.stderr)
        raise subprocess.CalledProcessError(r.returncode, r.args)
    return path


def generate(capwrite, callflow, outdir, total, seed):
    rng = random.Random(seed)
    items = list(callflow.generate(callflow.load_capgen(), seed=seed, messages=total, overlap=20))
    captures = [(g, None) for g in GENERATED] + [(SSN10_CAPTURE, SSN10)]
    per = max(1, len(items) // len(captures))
    paths = []
    for i, ((name, file_opts, base, sctp, sccp), ssns) in enumerate(captures):
        chunk = items[i * per:(i + 1) * per] if i + 1 < len(captures) else items[i * per:]
        lines = []
        for side, hexmsg, desc, call in chunk:
            ssn = ssns or (OTHER_SSN if rng.random() < 0.05 else CAMEL_SSNS)
            lines.append('#@ --from %s %s %s %s %s' % (side, rng.choice(base), rng.choice(sctp),
                                                       rng.choice(sccp), ssn))
            lines.append('# call %d: %s' % (call, desc))
            lines.append(hexmsg)
        path = write_capture(capwrite, outdir, name, file_opts, lines)
        if path is not None:
            paths.append(path)
    # TCAP between the HLR and the VLR, no dialogue portion: nothing CAMEL.
    lines = ['#@ ' + OTHER_SSN]
    for side, hexmsg, desc, call in items[:200]:
        stripped = without_dialogue(hexmsg)
        if stripped:
            lines += ['#@ --from %s' % side, stripped]
    paths.append(write_capture(capwrite, outdir, NO_CAMEL_CAPTURE, ['--link', 'ethernet'], lines))
    return paths


def compare(name, ours, theirs, show=8):
    # Where tshark did not decode the message as CAMEL, ours is compared
    # without its operations.
    unknown = {k[:3] for k in theirs if k[3] is None}
    ours = [k[:3] + (None,) if k[:3] in unknown else k for k in ours]
    a, b = Counter(ours), Counter(theirs)
    only_ours, only_theirs = a - b, b - a
    if not only_ours and not only_theirs:
        print('%-28s %5d messages agree%s' % (name, len(theirs), ' (%d without operations)' % len(unknown)
                                              if unknown else ''))
        return True
    print('%-28s DIFFER: %d messages found by dpx-decode, %d by tshark; %d only ours, %d only tshark'
          % (name, len(ours), len(theirs), sum(only_ours.values()), sum(only_theirs.values())))
    for label, diff in (('only dpx-decode', only_ours), ('only tshark', only_theirs)):
        for key in sorted(diff)[:show]:
            print('    %s: frame %d otid %s dtid %s operations %s'
                  % ((label,) + key[:3] + ('not compared' if key[3] is None else list(key[3]),)))
    return False


def main(argv=None):
    ap = argparse.ArgumentParser(description=__doc__.split('\n\n')[0])
    ap.add_argument('--decoder', required=True, help='dpx-decode')
    ap.add_argument('--capwrite', required=True, help='capwrite')
    ap.add_argument('--tshark', default=os.environ.get('TSHARK', 'tshark'))
    ap.add_argument('--tools', help='reference tools folder (default ../shared/tools)')
    ap.add_argument('--messages', type=int, default=4000, help='generated messages (default 4000)')
    ap.add_argument('--seed', type=int, default=9)
    ap.add_argument('--keep', help='keep the generated captures in this folder')
    a = ap.parse_args(argv)

    sys.path.insert(0, str(ROOT / 'tools' / 'capwrite'))
    import callflow
    if a.tools:
        os.environ['DPX_REFERENCE_TOOLS'] = a.tools
    if not shutil.which(a.tshark):
        print('capture_compare: SKIPPED: %s not found' % a.tshark)
        return SKIP
    if callflow.load_capgen(a.tools) is None:
        print('capture_compare: SKIPPED: capgen.py not found (../shared/tools or --tools)')
        return SKIP

    captures = sorted(p for p in (ROOT / 'samples').iterdir() if p.suffix in ('.pcap', '.pcapng'))
    tmp = Path(a.keep) if a.keep else Path(tempfile.mkdtemp(prefix='capture-compare-'))
    tmp.mkdir(parents=True, exist_ok=True)
    captures += generate(a.capwrite, callflow, tmp, a.messages, a.seed)

    ok = True
    total = 0
    for cap in captures:
        try:
            theirs = tshark_messages(a.tshark, cap)
            ours = our_messages(a.decoder, cap)
        except RuntimeError as e:
            print('%-28s FAILED: %s' % (cap.name, e))
            ok = False
            continue
        total += len(theirs)
        ok = compare(cap.name, ours, theirs) and ok
        if cap.name == NO_CAMEL_CAPTURE and theirs:
            print('%-28s tshark finds CAMEL in the capture meant to hold none' % cap.name)
            ok = False
    if not a.keep:
        shutil.rmtree(tmp, ignore_errors=True)
    print('capture_compare: %d captures, %d messages: %s'
          % (len(captures), total, 'all agree' if ok else 'DIFFERENCES'))
    return 0 if ok else 1


if __name__ == '__main__':
    sys.exit(main())
