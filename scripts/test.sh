#!/usr/bin/env bash
# Builds everything under ASan and UBSan (clang) and runs every test, fuzz smoke runs included.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/setup.sh
cmake --workflow --preset test
