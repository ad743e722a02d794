#!/usr/bin/env bash
# Builds the fuzz preset (clang, libFuzzer, ASan + UBSan) and runs every fuzz
# target for a bounded time, starting from its committed seed corpus
# (fuzz/<family>/corpus). A finding fails the script and leaves the crashing
# input in the target's artifact folder.
#   FUZZ_TOTAL_SECONDS  seconds shared by all targets (default 600)
#   FUZZ_SECONDS        seconds per target (overrides the shared budget)
#   FUZZ_BUILD_DIR      build directory (default build/fuzz)
#   FUZZ_JOBS           build parallelism (default 2)
#   FUZZ_KEEP_CORPUS    1: add what the run finds to fuzz/<family>/corpus
set -euo pipefail
cd "$(dirname "$0")/.."
total=${FUZZ_TOTAL_SECONDS:-600}
build=${FUZZ_BUILD_DIR:-build/fuzz}
jobs=${FUZZ_JOBS:-2}
keep=${FUZZ_KEEP_CORPUS:-0}

cmake --preset fuzz -B "$build" >/dev/null
# Every executable defined under fuzz/ (the preset generates Ninja files).
mapfile -t targets < <(ninja -C "$build" -t targets all |
  sed -n 's|^fuzz/.*/\([A-Za-z0-9_]*\): CXX_EXECUTABLE_LINKER__\1_.*|\1|p' | sort -u)
if [[ ${#targets[@]} -eq 0 ]]; then
  echo "fuzz: no fuzz targets" >&2
  exit 1
fi
cmake --build "$build" -j"$jobs" --target "${targets[@]}"

seconds=${FUZZ_SECONDS:-$((total / ${#targets[@]}))}
((seconds >= 1)) || seconds=1

status=0
for target in "${targets[@]}"; do
  exe=$(find "$build/fuzz" -type f -name "$target" -perm -u+x | head -n1)
  if [[ -z $exe ]]; then
    echo "fuzz: $target was not built" >&2
    status=1
    continue
  fi
  family=$(basename "$(dirname "$exe")")
  seeds="fuzz/$family/corpus"
  corpus="$build/corpus/$target"
  artifacts="$build/artifacts/$target/"
  mkdir -p "$corpus" "$artifacts"
  # The run writes new inputs into its first folder only; the seeds are read.
  dirs=("$corpus")
  [[ -d $seeds ]] && dirs+=("$seeds")
  echo "fuzz: $target for ${seconds}s"
  if ! "$exe" -max_total_time="$seconds" -max_len=4096 -print_final_stats=1 \
      -artifact_prefix="$artifacts" "${dirs[@]}" 2>"$build/$target.log"; then
    tail -n 40 "$build/$target.log" >&2
    echo "fuzz: $target found a failure; inputs in $artifacts" >&2
    status=1
  else
    grep -E '^stat::(number_of_executed_units|average_exec_per_sec|peak_rss_mb)' \
      "$build/$target.log" || true
    grep -E '^#[0-9]+[[:space:]]+DONE' "$build/$target.log" | tail -n1 || true
  fi
  if [[ $keep == 1 && -d $seeds ]]; then
    # Merge: only inputs that add coverage join the committed corpus.
    "$exe" -merge=1 "$seeds" "$corpus" >/dev/null 2>&1 || true
  fi
done
exit $status
