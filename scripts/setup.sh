#!/usr/bin/env bash
# Installs the Debian packages the build needs, when any is missing. Idempotent: it runs
# 'apt-get update' at most once, and only when something has to be installed.
set -euo pipefail
packages=(cmake ninja-build g++ clang libclang-rt-14-dev libexpat1-dev libicu-dev
          libcli11-dev libgtest-dev libgmock-dev libbenchmark-dev binutils nlohmann-json3-dev
          dpkg-dev)
missing=()
for p in "${packages[@]}"; do
  dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q 'install ok installed' || missing+=("$p")
done
[ ${#missing[@]} -eq 0 ] && exit 0
echo "setup: installing ${missing[*]}" >&2
sudo=""
[ "$(id -u)" -ne 0 ] && sudo=sudo
$sudo apt-get update -qq
DEBIAN_FRONTEND=noninteractive $sudo apt-get install -y -qq --no-install-recommends "${missing[@]}"
