#!/usr/bin/env bash
# Builds the fuzz preset (clang, libFuzzer, ASan + UBSan) and runs every fuzz
# target for a bounded time. A finding fails the script and leaves the
# crashing input in the target's artifact folder.
#   FUZZ_SECONDS   seconds per target (default 60)
#   FUZZ_BUILD_DIR build directory (default build/fuzz)
#   FUZZ_JOBS      build parallelism (default 2)
set -euo pipefail
cd "$(dirname "$0")/.."
seconds=${FUZZ_SECONDS:-60}
build=${FUZZ_BUILD_DIR:-build/fuzz}
jobs=${FUZZ_JOBS:-2}

cmake --preset fuzz -B "$build" >/dev/null
# Every executable defined under fuzz/ (the preset generates Ninja files).
mapfile -t targets < <(ninja -C "$build" -t targets all |
  sed -n 's|^fuzz/.*/\([A-Za-z0-9_]*\): CXX_EXECUTABLE_LINKER__\1_.*|\1|p' | sort -u)
if [[ ${#targets[@]} -eq 0 ]]; then
  echo "fuzz: no fuzz targets" >&2
  exit 1
fi
cmake --build "$build" -j"$jobs" --target "${targets[@]}"

status=0
for target in "${targets[@]}"; do
  exe=$(find "$build/fuzz" -type f -name "$target" -perm -u+x | head -n1)
  if [[ -z $exe ]]; then
    echo "fuzz: $target was not built" >&2
    status=1
    continue
  fi
  corpus="$build/corpus/$target"
  artifacts="$build/artifacts/$target/"
  mkdir -p "$corpus" "$artifacts"
  echo "fuzz: $target for ${seconds}s"
  if ! "$exe" -max_total_time="$seconds" -max_len=4096 -print_final_stats=1 \
      -artifact_prefix="$artifacts" "$corpus" 2>"$build/$target.log"; then
    tail -n 40 "$build/$target.log" >&2
    echo "fuzz: $target found a failure; inputs in $artifacts" >&2
    status=1
  else
    grep -E '^stat::(number_of_executed_units|peak_rss_mb)' "$build/$target.log" || true
  fi
done
exit $status
