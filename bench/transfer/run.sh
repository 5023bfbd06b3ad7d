#!/usr/bin/env bash
# Runs the transfer benchmarks with their anchors (curl, zip, unzip) and prints
# the median times and the ratios ours / anchor of the medians. The benchmarks
# run in a shuffled order and every timed run starts with the disk caught up,
# so neither side inherits the other's pending writes.
set -euo pipefail
build=$1
out=$(mktemp)
trap 'rm -f "$out"' EXIT
"$build/bench/transfer/transfer_bench" --benchmark_format=json --benchmark_out="$out" \
    --benchmark_report_aggregates_only=true --benchmark_enable_random_interleaving=true >/dev/null
/usr/bin/python3 - "$out" <<'PY'
import json, sys
runs = json.load(open(sys.argv[1]))["benchmarks"]
times = {}
for r in runs:
    if r.get("error_occurred"):
        sys.exit("transfer bench: %s failed: %s" % (r["run_name"], r.get("error_message")))
    if r.get("aggregate_name") == "median":
        times[(r["run_name"].split("/iterations")[0], r["aggregate_name"])] = r["real_time"] / 1000.0
pairs = [("ftp_download", "ours", "curl"), ("ftp_upload", "ours", "curl"),
         ("ftp_small_files", "ours", "curl"),
         ("zip", "ours", "cli"), ("unzip", "ours", "cli")]
for name, ours, anchor in pairs:
    a, b = times[(f"{name}/{ours}", "median")], times[(f"{name}/{anchor}", "median")]
    print(f"transfer_{name}_ours: {a:.3f} s")
    print(f"transfer_{name}_{anchor}: {b:.3f} s")
    print(f"transfer_{name}_ratio: {a / b:.2f} x")
PY
