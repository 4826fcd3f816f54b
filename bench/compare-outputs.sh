#!/usr/bin/env bash
# Runs two quillon builds on the same projects and fails when any output differs: standard output,
# standard error and exit status of every command in every format. Meant for changes that must
# not change what quillon prints (speed-ups).
#
# Usage: bench/compare-outputs.sh BEFORE AFTER [LISTING...]
#   BEFORE, AFTER  quillon programs (each with its module beside it)
#   LISTING        -f file lists to compare on besides examples/project.json (for instance the
#                  files.f of the projects that bench/cli-bench.py writes)
set -uo pipefail
cd "$(dirname "$0")/.."

before=$1 after=$2
shift 2
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
failures=0

compare() {
  local name=$1
  shift
  local run
  for run in before after; do
    local program=$before
    [[ $run == after ]] && program=$after
    "$program" "$@" >"$work/$run.out" 2>"$work/$run.err"
    echo $? >"$work/$run.status"
  done
  if cmp -s "$work/before.out" "$work/after.out" && cmp -s "$work/before.err" "$work/after.err" &&
    cmp -s "$work/before.status" "$work/after.status"; then
    echo "same     $name ($(wc -c <"$work/after.out") bytes)"
  else
    echo "DIFFERS  $name"
    diff <(cat "$work/before.status" "$work/before.err" "$work/before.out") \
      <(cat "$work/after.status" "$work/after.err" "$work/after.out") | head -20
    failures=$((failures + 1))
  fi
}

commands=("units" "tree" "order" "check")
for command in "${commands[@]}"; do
  for format in text json; do
    compare "examples $command $format" -P examples/project.json --format "$format" $command
  done
done
compare "examples order dot" -P examples/project.json --format dot order
compare "examples tree dot" -P examples/project.json --format dot tree
compare "examples order --with-library" -P examples/project.json --with-library order
compare "examples ports crossing" -P examples/project.json --format json ports crossing

for listing in "$@"; do
  for command in units order tree; do
    for format in text json; do
      compare "$listing $command $format" -f "$listing" --format "$format" $command
    done
  done
  compare "$listing order dot" -f "$listing" --format dot order
done

echo "$failures difference(s)"
[[ $failures -eq 0 ]]
