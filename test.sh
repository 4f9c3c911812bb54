#!/usr/bin/env bash
# Sets up what is missing, builds everything and runs every test. An argument names another preset than dev: asan
# (AddressSanitizer, UBSan, leaks) or tsan (ThreadSanitizer).
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")"
preset=${1-dev}
scripts/install-packages test
scripts/configure "$preset"
cmake --build --preset "$preset"
exec ctest --preset "$preset" --parallel "$(nproc)"
