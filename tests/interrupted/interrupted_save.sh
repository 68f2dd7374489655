#!/usr/bin/env bash
# interrupted_save.sh FILE MAKE SAVE: the shell command MAKE makes FILE in an empty folder, SAVE changes it. SAVE is
# killed before each of its system calls in turn, and finds a full disk at each one that writes. Afterwards the old or
# the new file stands whole, and what did not save has told so.
set -uo pipefail
file="$1" make="$2"
read -ra save <<<"$3"
folder="$(mktemp -d)"
trap 'rm -rf "$folder"' EXIT
cd "$folder" || exit 1

if ! command -v strace >/dev/null || ! strace -o /dev/null true 2>/dev/null; then
  echo "skipped: strace is missing or may not trace"
  exit 77
fi
eval "$make" || exit 1
cp "$file" old
strace -f -o calls "${save[@]}" || exit 1
cp "$file" new
cmp -s old new && { echo "the save changed nothing"; exit 1; }
# The same again gives the same, or nothing could be told below.
cp old "$file" && "${save[@]}" && cmp -s "$file" new || { echo "two saves differ"; exit 1; }

# What comes before the file is opened is the loader's, the same for every program.
mapfile -t calls < <(sed -n "/$file/,\$p" calls | sed -nE 's/^[0-9]+ +([a-z0-9_]+)\(.*/\1/p')
declare -A skipped=()
while read -r call; do skipped[$call]=$((${skipped[$call]:-0} + 1)); done < \
  <(sed "/$file/,\$d" calls | sed -nE 's/^[0-9]+ +([a-z0-9_]+)\(.*/\1/p')

writes=" write pwrite64 writev openat fsync fdatasync ftruncate rename renameat renameat2 mkdir link linkat copy_file_range "
declare -A seen=()
killed=0 full=0 old=0 new=0
interrupt() { # interrupt CALL COUNT INJECTION: sets `status`
  cp old "$file"
  status="$(
    exec 2>/dev/null # where the shell, too, tells of each kill
    strace -f -o /dev/null -e trace="$1" -e inject="$1":"$3":when="$2" "${save[@]}" >/dev/null
    echo $?
  )"
  if cmp -s "$file" old; then
    old=$((old + 1))
    stands=old
  elif cmp -s "$file" new; then
    new=$((new + 1))
    stands=new
  else
    echo "$3 at $1 number $2: neither the old nor the new file stands"
    exit 1
  fi
}
for call in "${calls[@]}"; do
  seen[$call]=$((${seen[$call]:-0} + 1))
  count=$((${seen[$call]} + ${skipped[$call]:-0}))
  interrupt "$call" "$count" signal=KILL
  [ "$status" -eq 137 ] && killed=$((killed + 1))
  [[ $writes == *" $call "* ]] || continue
  interrupt "$call" "$count" error=ENOSPC
  full=$((full + 1))
  if [ "$status" -ge 128 ] || { [ "$stands" = old ] && [ "$status" -eq 0 ]; }; then
    echo "a full disk at $call number $count: status $status, and the $stands file stands"
    exit 1
  fi
done
echo "killed $killed times, $full times with a full disk: $old times the old file stands, $new times the new one"
# Both sides of the rename must have been seen.
[ "$killed" -ge 10 ] && [ "$full" -ge 3 ] && [ "$old" -ge 5 ] && [ "$new" -ge 1 ] || exit 1

# What the killed processes left is cleared by the next save.
cp old "$file"
"${save[@]}" && [ -z "$(find . -name ".$file.*")" ] || { ls -la; exit 1; }
