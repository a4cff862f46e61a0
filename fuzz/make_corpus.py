#!/usr/bin/env python3
"""Seed inputs for camel_fuzz from the sample message files.

Every message of the given files (one hex message a line, '#' comments, as
dpx-decode reads them) becomes one seed file: an option octet followed by
the message octets.  With several --option values every message is written
once per option octet.  File names are the SHA-1 of the content, as
libFuzzer names its own units, so running the script twice adds nothing.

    fuzz/make_corpus.py -o build/fuzz/seeds samples/*.txt
    fuzz/make_corpus.py -o fuzz/corpus --option 0x00 --option 0x26 FILE
"""
import argparse
import hashlib
import os
import re
import sys


def messages(path):
    with open(path, encoding="utf-8") as f:
        for line in f:
            text = line.split("#", 1)[0]
            digits = re.sub(r"[\s:]", "", text)
            if not digits:
                continue
            if len(digits) % 2 or not re.fullmatch(r"[0-9A-Fa-f]*", digits):
                print(f"{path}: skipped, not hex: {line.strip()}", file=sys.stderr)
                continue
            yield bytes.fromhex(digits)


def main():
    ap = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    ap.add_argument("-o", "--out", required=True, help="directory for the seed files")
    ap.add_argument("--option", action="append", type=lambda s: int(s, 0),
                    help="option octet (default 0x00); repeatable")
    ap.add_argument("files", nargs="+")
    args = ap.parse_args()
    options = args.option or [0]
    os.makedirs(args.out, exist_ok=True)
    written = 0
    for path in args.files:
        for m in messages(path):
            for o in options:
                seed = bytes([o & 0xFF]) + m
                name = os.path.join(args.out, hashlib.sha1(seed).hexdigest())
                if not os.path.exists(name):
                    with open(name, "wb") as f:
                        f.write(seed)
                    written += 1
    print(f"make_corpus: {written} new seed(s) in {args.out}")


if __name__ == "__main__":
    main()
