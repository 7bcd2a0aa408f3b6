#!/usr/bin/env bash
# Runs one libFuzzer target for a fixed time from a copy of its seed corpus, so that new inputs
# never land in the repository. Seeds named hostile_* (documents that run into the production
# budget, taking a minute each under the sanitizers) are left to the long runs by hand.
set -euo pipefail
exe=$1 corpus=$2 scratch=$3 seconds=$4
rm -rf "$scratch" && mkdir -p "$scratch/corpus" "$scratch/artifacts"
find "$corpus" -maxdepth 1 -type f ! -name 'hostile_*' -exec cp {} "$scratch/corpus" \;
exec "$exe" -max_total_time="$seconds" -timeout=10 -rss_limit_mb=4096 -print_final_stats=1 \
  -artifact_prefix="$scratch/artifacts/" "$scratch/corpus"
