#!/usr/bin/env python3
"""Seed inputs for capture_fuzz from pcap files.

Each pcap file (classic format, either byte order) becomes one seed: the
index of its link type in the fuzz target's table, option octet 0x02, then
its frames, each as a two-octet big-endian length and the frame.  Captures
with a link type the target does not know, and pcapng files, are skipped.

    fuzz/capture_seeds.py -o build/fuzz/capture-seeds samples/*.pcap
"""
import argparse
import hashlib
import os
import struct
import sys

# The order of kLinkTypes in fuzz_frame_walker.cpp.
LINK_TYPES = [1, 113, 276, 101, 0, 108, 140, 139, 141, 229]


def frames(path):
    with open(path, "rb") as f:
        data = f.read()
    if len(data) < 24:
        return None, []
    magic = data[:4]
    if magic in (b"\xd4\xc3\xb2\xa1", b"\x4d\x3c\xb2\xa1"):
        order = "<"
    elif magic in (b"\xa1\xb2\xc3\xd4", b"\xa1\xb2\x3c\x4d"):
        order = ">"
    else:
        return None, []
    link = struct.unpack(order + "I", data[20:24])[0] & 0x0FFFFFFF
    out, pos = [], 24
    while pos + 16 <= len(data):
        caplen = struct.unpack(order + "I", data[pos + 8:pos + 12])[0]
        out.append(data[pos + 16:pos + 16 + caplen])
        pos += 16 + caplen
    return link, out


def main():
    ap = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    ap.add_argument("-o", "--out", required=True)
    ap.add_argument("files", nargs="*")
    args = ap.parse_args()
    os.makedirs(args.out, exist_ok=True)
    for path in args.files:
        link, fs = frames(path)
        if link not in LINK_TYPES:
            print(f"{path}: skipped (not a pcap of a known link type)", file=sys.stderr)
            continue
        seed = bytes([LINK_TYPES.index(link), 0x02])
        for fr in fs:
            fr = fr[:0xFFFF]
            seed += struct.pack(">H", len(fr)) + fr
        name = hashlib.sha1(seed).hexdigest()
        with open(os.path.join(args.out, name), "wb") as f:
            f.write(seed)


if __name__ == "__main__":
    main()
