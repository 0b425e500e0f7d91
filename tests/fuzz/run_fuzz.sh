#!/usr/bin/env bash
# Builds the fuzz targets with clang and runs each for SECONDS (60 by default); fails on any
# crash, leak, hang or sanitizer report.
set -euo pipefail
seconds="${1:-60}"
zx917_root="$(cd "$(dirname "$0")/../.." && pwd)"
source "$zx917_root/tools/deps.sh"

ensure_deps
dir="$zx917_root/build-fuzz"
targets=(fuzz_download_file fuzz_reception fuzz_settings fuzz_avi zx917-mkfile zx917-clipgen)
cmake -S "$zx917_root" -B "$dir" -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo -DZX917_FUZZ=ON \
    -DCMAKE_CXX_COMPILER=clang++ >/dev/null
cmake --build "$dir" -j"$(nproc)" --target "${targets[@]}" >/dev/null
corpus="$dir/corpus"
bash "$zx917_root/tests/fuzz/make_seeds.sh" "$corpus" "$dir/tools/zx917-mkfile" \
    "$dir/tools/zx917-clipgen"
status=0
for target in download_file reception settings avi; do
    echo "fuzz_$target: ${seconds}s"
    if ! "$dir/tests/fuzz/fuzz_$target" "$corpus/$target" -max_total_time="$seconds" \
        -timeout=20 -rss_limit_mb=2048 -print_final_stats=1 \
        -artifact_prefix="$dir/fuzz_$target-" >"$dir/fuzz_$target.log" 2>&1; then
        echo "fuzz_$target found a fault:" >&2
        tail -40 "$dir/fuzz_$target.log" >&2
        status=1
    else
        grep -E "stat::number_of_executed_units" "$dir/fuzz_$target.log" || true
    fi
done
exit $status
