#!/usr/bin/env bash
# Runs the built test suite N times in a row (default 10), each run with twice as many tests in
# parallel as there are cores, all under one virtual X server that never resets, as `make test`
# runs it. Stops at the first failing run, prints its output and exits non-zero.
#
#   scripts/stress-tests.sh [N]          BUILD=build-asan scripts/stress-tests.sh 5
#
# BUILD is the build folder (default build, relative to the repository); build it first.
set -euo pipefail

runs=${1:-10}
if ! [[ $runs =~ ^[1-9][0-9]*$ ]]; then
  echo "usage: $0 [N]   (N: number of runs, at least 1)" >&2
  exit 2
fi
root=$(cd "$(dirname "$0")/.." && pwd)
build=${BUILD:-build}
[[ $build = /* ]] || build=$root/$build
if [ ! -f "$build/CTestTestfile.cmake" ]; then
  echo "stress: no built test suite in $build (make build BUILD=...)" >&2
  exit 2
fi

# One X server for all the runs: the script starts itself again under xvfb-run.
if [ -z "${RK_STRESS_UNDER_XVFB:-}" ]; then
  export RK_STRESS_UNDER_XVFB=1 BUILD=$build
  exec xvfb-run -a -s "-screen 0 1600x1200x24 -noreset" "$0" "$runs"
fi

jobs=$((2 * $(nproc)))
log=$(mktemp)
trap 'rm -f "$log"' EXIT
cd "$build"
start=$SECONDS
for ((run = 1; run <= runs; run++)); do
  begin=$SECONDS
  if ! ctest --output-on-failure -j "$jobs" >"$log" 2>&1; then
    cat "$log"
    echo "stress: run $run of $runs FAILED (ctest -j $jobs in $build); $((run - 1)) passed before it"
    exit 1
  fi
  echo "stress: run $run of $runs passed ($((SECONDS - begin)) s)"
done
tests=$(ctest -N | sed -n 's/^Total Tests: //p')
echo "stress: all $runs runs passed, $tests tests each, ctest -j $jobs in $build, $((SECONDS - start)) s"
