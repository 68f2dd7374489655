#!/usr/bin/env bash
# Memory that the system refuses is told, with status 2: nothing crashes, and the file stays as it was.
set -uo pipefail
tervane="$1" engine="$2"
folder="$(mktemp -d)"
trap 'rm -rf "$folder"' EXIT
cd "$folder" || exit 1

"$tervane" new small.tvd || exit 1
{
  printf 'target TERVANE_FLOWMODEL {\n  section ExtraParams {\n    NoOfParams = 200000\n'
  for ((i = 1; i <= 200000; ++i)); do printf '    section ExtraParam_%d {\n    }\n' "$i"; done
  printf '  }\n}\n'
} >large.tvd
cp large.tvd before.tvd

# refused PROGRAM ARGUMENTS... -- ENOUGH: what runs with the small setup runs out of memory with the large one.
refused() {
  local program="$1" size status
  shift
  for size in 40000 60000 90000 130000 190000 280000; do
    (ulimit -v "$size" && exec "$program" "${@/SETUP/small.tvd}") >out 2>&1
    status=$?
    # Too little for the program itself.
    grep -q 'shared libraries' out || [ "$status" -gt 2 ] && continue
    (ulimit -v "$size" && exec "$program" "${@/SETUP/large.tvd}") >out 2>&1
    status=$?
    [ "$status" -eq 2 ] && grep -qi 'not enough memory\|no memory' out && return 0
    echo "$program $*: status $status in $size kB: $(head -c 500 out)"
    return 1
  done
  echo "$program $*: never started"
  return 1
}
refused "$tervane" check SETUP || exit 1
refused "$tervane" set SETUP SimSpec/SimTitle:Title new || exit 1
refused "$engine" SETUP /PP || exit 1
cmp large.tvd before.tvd
