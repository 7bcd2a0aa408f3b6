#!/usr/bin/env bash
# The main job on a fresh machine: installs what the build needs, builds the module and the
# embedded host (release), then has wbhost load and check the bundled target description and
# compare it with two others, then plays a whole session (a project with a target, items added,
# saved, reopened, the target's tree edited) with `wbhost demo`. Exits 0 when every answer is the
# expected one.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/setup.sh
cmake --preset release >/dev/null
cmake --build --preset release --target wbhost wbtangio
wbhost=build/release/wbhost/wbhost
failures=0

# Runs wbhost with the arguments after EXPECTED and reports whether it exited with EXPECTED.
run() {
  local expected=$1
  shift
  echo "\$ wbhost $*"
  local rc=0
  "$wbhost" "$@" || rc=$?
  if [ "$rc" -ne "$expected" ]; then
    echo "!! exit $rc, expected $expected" >&2
    failures=$((failures + 1))
  fi
  echo
}

echo "== Loading and checking the Kestrel K-40 description"
dump=$("$wbhost" tree examples/KestrelK40.xml) || { echo "!! the description does not load cleanly" >&2; failures=$((failures + 1)); }
echo "\$ wbhost tree examples/KestrelK40.xml   (the first lines of $(wc -l <<<"$dump") lines)"
sed -n 1,12p <<<"$dump"
echo "  ..."
echo
run 0 tree examples/KestrelK40.xml Connector0/DIO3
run 0 tree examples/KestrelK40.xml AnalogInputs/AI2
# Every example, problems only; then the K-40 with its include (shared/KestrelTiming.xml)
# looked up in examples/ itself instead of beside the executable.
run 0 tree --check examples/KestrelK40.xml examples/KestrelK20.xml examples/KestrelK40X.xml
run 0 --host-dir examples tree --check examples/KestrelK40.xml

echo "== Comparing descriptions (required first, offered second)"
run 0 compare examples/KestrelK40.xml examples/KestrelK40.xml
run 2 compare examples/KestrelK40.xml examples/KestrelK40X.xml
run 1 compare examples/KestrelK40.xml examples/KestrelK20.xml

echo "== A whole session: a project with the K-40, items, reopening, edits of its tree"
run 0 demo --examples examples

if [ "$failures" -ne 0 ]; then
  echo "run: $failures unexpected answer(s)" >&2
  exit 1
fi
echo "run: every answer as expected"
