#!/usr/bin/env bash
# Installs what is missing, builds MorvelGUI and runs the whole test suite: the plain build, the same tests
# built with AddressSanitizer and UndefinedBehaviorSanitizer, and a bounded run of every fuzzer.
#   MORVEL_FUZZ_SECONDS   seconds per fuzzer (default 60)
set -euo pipefail
root=$(cd "$(dirname "$0")/.." && pwd)
bash "$root/scripts/deps.sh" clang libclang-rt-14-dev gdb xvfb xdotool imagemagick
jobs=$(nproc 2>/dev/null || echo 2)
export QT_QPA_PLATFORM=offscreen
stages=0

echo "== plain build and tests"
plain=${MORVEL_BUILD_DIR:-$root/build}
cmake -S "$root" -B "$plain" -DCMAKE_BUILD_TYPE=RelWithDebInfo -DMORVEL_BUILD_TESTS=ON
cmake --build "$plain" -j"$jobs"
(cd "$plain" && ctest --output-on-failure -j"$jobs")
stages=$((stages + 1))

echo "== sanitized build and tests"
sanitized=$root/build-sanitize
reports=$(mktemp -d "${TMPDIR:-/tmp}/morvel-sanitizer.XXXXXX")
cmake -S "$root" -B "$sanitized" -DCMAKE_BUILD_TYPE=RelWithDebInfo -DMORVEL_BUILD_TESTS=ON \
      -DMORVEL_SANITIZE=ON -DMORVEL_BUILD_BENCH=OFF
cmake --build "$sanitized" -j"$jobs"
# Reports go to files, so that one from a child program (the stand-ins are sanitized too) is not lost in a
# test's output; any report fails the run.
(cd "$sanitized" &&
 ASAN_OPTIONS="log_path=$reports/asan:detect_leaks=1:strict_string_checks=1" \
 UBSAN_OPTIONS="log_path=$reports/ubsan:print_stacktrace=1:halt_on_error=1" \
 ctest --output-on-failure -j"$jobs" -LE desktop)
if compgen -G "$reports/*" > /dev/null; then
  echo "Sanitizer reports:"
  cat "$reports"/*
  exit 1
fi
stages=$((stages + 1))

echo "== fuzzers"
fuzzbuild=$root/build-fuzz
CC=clang CXX=clang++ cmake -S "$root" -B "$fuzzbuild" -DCMAKE_BUILD_TYPE=RelWithDebInfo -DMORVEL_FUZZ=ON \
      -DMORVEL_BUILD_TESTS=OFF -DMORVEL_BUILD_TOOLS=OFF -DMORVEL_BUILD_BENCH=OFF
cmake --build "$fuzzbuild" -j"$jobs"
for fuzzer in "$fuzzbuild"/fuzz/fuzz_*; do
  [ -f "$fuzzer" ] && [ -x "$fuzzer" ] || continue
  name=$(basename "$fuzzer"); short=${name#fuzz_}
  corpus=$fuzzbuild/corpus/$short
  mkdir -p "$corpus"
  dict=()
  [ -f "$root/fuzz/$short.dict" ] && dict=(-dict="$root/fuzz/$short.dict")
  echo "-- $name for ${MORVEL_FUZZ_SECONDS:-60} s"
  "$fuzzer" -max_total_time="${MORVEL_FUZZ_SECONDS:-60}" -print_final_stats=1 "${dict[@]}" \
            "$corpus" "$root/fuzz/corpus/$short" 2>&1 | tail -n 12
  [ "${PIPESTATUS[0]}" -eq 0 ] || exit 1
done
stages=$((stages + 1))

echo "test stages: $stages passed, 0 failed"
