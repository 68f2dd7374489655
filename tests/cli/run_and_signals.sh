#!/usr/bin/env bash
# Signals that meet `tervane run`: Ctrl-C ends the engine with its children and the shell loop around it; a kill of the
# command leaves the engine alone, and nobody may run the setup meanwhile.
set -uo pipefail
tervane="$1"
folder="$(mktemp -d)"
trap 'rm -rf "$folder"' EXIT
cd "$folder" || exit 1
fail() { echo "$1"; cat ./out ./err 2>/dev/null; exit 1; }
soon() { for _ in $(seq 400); do eval "$1" && return; sleep 0.05; done; fail "never: $1"; }
mkdir engines
cat >engines/Tvn_Simulation <<'END'
#!/bin/sh
sleep 1000 &
echo $! >child
echo $$ >engine
wait
END
chmod +x engines/Tvn_Simulation
export TERVANE_ENGINES="$folder/engines"
"$tervane" new karup.tvd >/dev/null || fail "no setup"

# A loop as a user writes it, in a shell of its own that has no job control: the signal goes to all of the group.
# setsid waits, and ignored signals become ordinary ones again, as in a terminal.
set -m
bash -c "for i in 1 2 3; do echo round; '$tervane' run karup.tvd --wm; done" >out 2>err &
loop=$!
soon '[ -s engine ]'
child="$(cat child)" engine="$(cat engine)"
kill -INT -- "-$loop"
wait "$loop"
status=$?
[ "$status" -eq 130 ] || fail "the loop ended with $status"
[ "$(grep -c round out)" -eq 1 ] || fail "the loop went on"
kill -0 "$child" 2>/dev/null && fail "the child runs on"
kill -0 "$engine" 2>/dev/null && fail "the engine runs on"
grep -q 'The run was stopped' err || fail "the end was not told"

rm -f child engine
"$tervane" run karup.tvd --wm >out 2>err &
command=$!
soon '[ -s engine ]'
kill -KILL "$command"
wait "$command" 2>/dev/null
kill -0 "$(cat engine)" || fail "the engine was killed with the command"
"$tervane" run karup.tvd --wm >out 2>err
[ $? -eq 2 ] || fail "a second run began"
grep -q 'is being run already' err || fail "the second run was not refused in words"
kill "$(sed -n 's/^runner process: //p' karup_results/karup_Run.txt)"
soon 'grep -q "^ended: " karup_results/karup_Run.txt'
kill -0 "$(cat child)" 2>/dev/null && fail "the child runs on"
exit 0
