#!/usr/bin/env bash
# Builds everything and runs every test; ends with ctest's summary.
#   ./test.sh [ctest arguments]      e.g. ./test.sh -R base_tests
# TAVRIN_PRESET chooses another preset (asan, tsan) than dev.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")"
preset=${TAVRIN_PRESET:-dev}

packaging/install-packages.sh
cmake --preset "$preset" >build-configure.log 2>&1 || { cat build-configure.log; exit 1; }
rm -f build-configure.log
cmake --build --preset "$preset"
exec ctest --test-dir "build/$preset" --output-on-failure -j 2 "$@"
