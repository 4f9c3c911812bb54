#!/usr/bin/env bash
# Sets up what is missing, builds the library and the tool, and sends test patterns and pictures to the GPU and back.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")"
scripts/install-packages build
scripts/configure release
cmake --build --preset release
exec build/release/tools/fwzel roundtrip demo/mountains.png --interlaced demo/mountains.ppm --out out
