#!/usr/bin/env bash
# Builds everything under ASan and UBSan (clang) and runs every test, fuzz smoke runs included;
# then builds the tests where threads meet under ThreadSanitizer and runs them.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/setup.sh
cmake --workflow --preset test
cmake --workflow --preset concurrency
