#!/usr/bin/env bash
# Runs one libFuzzer target for a fixed time: new inputs go to a scratch folder, never into the
# seed corpus in the repository.
set -euo pipefail
exe=$1 corpus=$2 scratch=$3 seconds=$4
rm -rf "$scratch" && mkdir -p "$scratch" "$scratch/artifacts"
exec "$exe" -max_total_time="$seconds" -timeout=10 -rss_limit_mb=4096 -print_final_stats=1 \
  -artifact_prefix="$scratch/artifacts/" "$scratch" "$corpus"
