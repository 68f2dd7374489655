#!/usr/bin/env bash
# The C program of the manual is compiled as the manual says, and does what it says: manual_program.sh LIBFOLDER SOURCES
set -euo pipefail
work="$(mktemp -d)"
trap 'rm -rf "$work"' EXIT
cd "$work"
awk '/^```c$/ { on = 1; next } /^```$/ { on = 0 } on' "$2/docs/manual/programming.md" >shorter_steps.c
cc -std=c11 -Wall -Wextra -Werror -I"$2/capi" shorter_steps.c -L"$1" -ltervane -Wl,-rpath,"$1" -o shorter_steps
# Under the name by which a program that was linked with a version looks for it.
readelf -d shorter_steps | grep -q 'libtervane.so.0'
# The earlier names are C as well.
echo '#include <tervane_names.h>' | cc -std=c99 -Wall -Wextra -pedantic -Werror -I"$2/capi" -x c -fsyntax-only -
cp "$2/examples/water_quality.tvd" setup.tvd
./shorter_steps setup.tvd changed.tvd >output
cat output
grep -q '^initial time step: 6 hours$' output
grep -q 'error at ' output
grep -q 'InitialTimeStep = 3f' changed.tvd
if ./shorter_steps missing.tvd changed.tvd 2>message; then exit 1; fi
grep -q 'missing.tvd' message
