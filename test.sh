#!/usr/bin/env bash
# Sets up what is missing, builds everything and runs every test. An argument names another preset than dev: asan
# (AddressSanitizer, UBSan, leaks), tsan (ThreadSanitizer, with the tests that start threads) or clang (the other
# compiler).
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")"
preset=${1-dev}
packages=test
[[ $preset != clang ]] || packages=check
scripts/install-packages "$packages"
scripts/configure "$preset"
cmake --build --preset "$preset"
exec ctest --preset "$preset" --parallel "$(nproc)"
