#!/bin/sh
# How this machine runs the 32-bit x86 programs of the m32 preset.
#
#   sh cmake/m32-runner.sh [EMULATOR]
#
# Builds a tiny program with "${CC:-gcc} -m32" that prints its pointer width
# and runs it: directly, and where the kernel cannot execute it (no IA-32
# emulation), under qemu-i386 from PATH.  Given EMULATOR (a program name or
# path), only that emulator is tried.  The program counts as run only when
# it prints 4.
#
# Prints "native" or the emulator's full path.  Exit status 0; 1 when the
# program cannot be built (g++-multilib missing), 2 when it builds but
# cannot be run; either way one line on standard error says why.
set -u

emulator=${1:-}
cc=${CC:-gcc}
dir=$(mktemp -d "${TMPDIR:-/tmp}/m32-runner.XXXXXX") || exit 1
trap 'rm -rf "$dir"' EXIT

printf '#include <stdio.h>\nint main(void) { printf("%%u\\n", (unsigned)sizeof(void *)); return 0; }\n' \
    >"$dir/probe.c"
if ! "$cc" -m32 -o "$dir/probe" "$dir/probe.c" >"$dir/cc.log" 2>&1; then
    echo "m32: $cc -m32 cannot build a program (is g++-multilib installed?): $(head -n 1 "$dir/cc.log")" >&2
    exit 1
fi

if [ -z "$emulator" ]; then
    if [ "$("$dir/probe" 2>/dev/null)" = 4 ]; then
        echo native
        exit 0
    fi
    emulator=qemu-i386
    why="this machine cannot execute 32-bit x86 programs and"
else
    why="DPX_M32_EMULATOR=$emulator:"
fi

path=$(command -v "$emulator") || {
    [ "$emulator" = qemu-i386 ] && hint=" (make deps installs qemu-user)" || hint=
    echo "m32: $why $emulator is not installed$hint" >&2
    exit 2
}
case $path in /*) ;; *) path=$PWD/$path ;; esac
if [ "$("$path" "$dir/probe" 2>/dev/null)" != 4 ]; then
    echo "m32: $why $path does not run a 32-bit x86 program" >&2
    exit 2
fi
echo "$path"
