#!/usr/bin/env bash
# Kills `tervane set` before each of its system calls in turn: afterwards the old or the new setup stands whole.
set -uo pipefail
tervane="$1"
folder="$(mktemp -d)"
trap 'rm -rf "$folder"' EXIT
cd "$folder" || exit 1
# The leak check of a sanitized build cannot run under strace.
export ASAN_OPTIONS=detect_leaks=0

if ! command -v strace >/dev/null || ! strace -o /dev/null true 2>/dev/null; then
  echo "skipped: strace is missing or may not trace"
  exit 77
fi
save=("$tervane" set setup.tvd SimSpec/SimTitle:Title "a new title")
"$tervane" new old.tvd || exit 1
cp old.tvd setup.tvd
strace -f -o calls "${save[@]}" || exit 1
cp setup.tvd new.tvd
cmp -s old.tvd new.tvd && { echo "the save changed nothing"; exit 1; }

# What comes before the setup is opened is the loader's, the same for every program.
mapfile -t calls < <(sed -n '/setup\.tvd/,$p' calls | sed -nE 's/^[0-9]+ +([a-z0-9_]+)\(.*/\1/p')
declare -A skipped=()
while read -r call; do skipped[$call]=$((${skipped[$call]:-0} + 1)); done < \
  <(sed '/setup\.tvd/,$d' calls | sed -nE 's/^[0-9]+ +([a-z0-9_]+)\(.*/\1/p')

declare -A seen=()
killed=0 old=0 new=0
for call in "${calls[@]}"; do
  seen[$call]=$((${seen[$call]:-0} + 1))
  count=$((${seen[$call]} + ${skipped[$call]:-0}))
  cp old.tvd setup.tvd
  status="$(
    exec 2>/dev/null # where the shell, too, tells of each kill
    strace -f -o /dev/null -e trace="$call" -e inject="$call":signal=KILL:when="$count" "${save[@]}"
    echo $?
  )"
  [ "$status" -eq 137 ] && killed=$((killed + 1))
  if cmp -s setup.tvd old.tvd; then
    old=$((old + 1))
  elif cmp -s setup.tvd new.tvd; then
    new=$((new + 1))
  else
    echo "killed at $call number $count: neither the old nor the new setup stands"
    exit 1
  fi
done
echo "killed $killed times in ${#calls[@]} runs: $old times the old setup stands, $new times the new one"
# Both sides of the rename must have been seen.
[ "$killed" -ge 10 ] && [ "$old" -ge 5 ] && [ "$new" -ge 1 ] || exit 1

# What the killed processes left is cleared by the next save.
"${save[@]}" && [ -z "$(find . -name '.setup.tvd.*')" ] || { ls -la; exit 1; }
