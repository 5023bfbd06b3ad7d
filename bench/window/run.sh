#!/usr/bin/env bash
# bench/window/run.sh BUILD_DIR: the main window's start-up and selection
# figures, each with its anchor measured in the same run.
set -euo pipefail
build=$1
out=$(mktemp)
trap 'rm -f "$out"' EXIT
export QT_QPA_PLATFORM=offscreen
"$build/bench/window/quorvel_window_bench" --benchmark_out="$out" --benchmark_out_format=json \
    >/dev/null 2>&1
/usr/bin/python3 - "$out" <<'PY'
import json, sys
runs = {b["name"].split("/")[0]: b for b in json.load(open(sys.argv[1]))["benchmarks"]}
def ms(name):
    b = runs[name]
    if b.get("error_occurred"):
        sys.exit(f"{name}: {b.get('error_message')}")
    return b["real_time"]  # the benchmarks report milliseconds
pairs = [("window_startup_10000_records", "BM_StartupShownWithLongList", "BM_StartupAnchorBareListWindow"),
         ("window_select_record_1gb_date", "BM_SelectRecordWithBigDataFile", "BM_SelectAnchorBareListAndFileTail")]
for label, ours, anchor in pairs:
    a, b = ms(ours), ms(anchor)
    print(f"{label}: {a:.3f} ms")
    print(f"{label}_anchor: {b:.3f} ms")
    print(f"{label}_vs_anchor: {a / b:.2f} x")
PY
