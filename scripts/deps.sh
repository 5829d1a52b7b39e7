#!/usr/bin/env bash
# Installs everything the build, the tests and the tool need on Debian 12.
set -euo pipefail
SUDO=""
if [ "$(id -u)" -ne 0 ]; then SUDO="sudo"; fi
export DEBIAN_FRONTEND=noninteractive
$SUDO apt-get update -qq
$SUDO apt-get install -y -qq --no-install-recommends \
  cmake ninja-build g++ make pkg-config git ca-certificates \
  googletest libgtest-dev libbenchmark-dev \
  g++-mingw-w64-x86-64-posix binutils-mingw-w64-x86-64 wine wine64 \
  libvips-dev libcli11-dev nlohmann-json3-dev zlib1g-dev \
  icoutils clang-format valgrind file procps \
  clang libclang-rt-14-dev >/dev/null
