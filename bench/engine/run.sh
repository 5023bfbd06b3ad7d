#!/usr/bin/env bash
# bench/engine/run.sh BUILD_DIR
# Runs of many records against the reference service (server/run: wd.php under
# PHP's web server, and FTP), each next to its anchor in the same run:
#   1,000 records "Only new data" with nothing new, through the engine, against
#   curl sending the same 2,000 requests in one process; the same run through
#   the window offscreen against the engine's own time; 100 files of 1 MB
#   "Complete file" through the engine against curl downloading them (and
#   against curl also finding each file first and syncing it to disk before
#   renaming it, as the described download does); and the peak memory of a run
#   of 1,000 and of 10,000 records.
# Medians of three runs. Every file lives in a temporary folder removed at exit.
set -euo pipefail
build=$1
here=$(cd "$(dirname "${BASH_SOURCE[0]}")" && pwd)
root=$(cd "$here/../.." && pwd)
py=/usr/bin/python3
tmp=$(mktemp -d "${TMPDIR:-/tmp}/quorvel-engine-bench.XXXXXX")
run_pid=
cleanup() {
  if [[ -n $run_pid ]]; then kill "$run_pid" 2>/dev/null || true; wait "$run_pid" 2>/dev/null || true; fi
  rm -rf "$tmp"
}
trap cleanup EXIT

data="$tmp/data"
"$root/server/add-user" bench bench --data "$data" --season '' --ftp-password bench-ftp \
    --quorvel "$build/src/quorvel" >/dev/null
user_dir="$data/users/bench"
# Every request checks the password; at PHP's default hashing cost that check
# alone would take most of each request's time, on both sides alike. The
# cheapest cost leaves the client's own work to be measured.
php -r '$f = $argv[1]; $u = json_decode(file_get_contents($f), true);
  $u["bench"]["password_hash"] = password_hash("bench", PASSWORD_BCRYPT, ["cost" => 4]);
  file_put_contents($f, json_encode($u, JSON_PRETTY_PRINT));' "$data/users.json"
"$py" - "$user_dir" <<'PY'
import os, sys
folder = sys.argv[1]
records = "2024-11-01 10:00:00,1\r\n2024-11-01 10:10:00,2\r\n2024-11-01 10:20:00,3\r\n"
for i in range(10000):
    with open(os.path.join(folder, f"r{i}.dat"), "w", newline="") as f:
        f.write(records)
block = os.urandom(1 << 20)
for i in range(100):
    with open(os.path.join(folder, f"w{i}.dat"), "wb") as f:
        f.write(block)
PY

# Written out and read once before anything is timed, so that no run waits for
# the disk to catch up with the files made here.
sync
cat "$user_dir"/*.dat >/dev/null

"$root/server/run" --port 0 --ftp-port 0 --data "$data" >"$tmp/run.out" 2>&1 &
run_pid=$!
for _ in $(seq 300); do grep -q 'Ctrl+C stops' "$tmp/run.out" 2>/dev/null && break; sleep 0.1; done
http=$(sed -n 's|^HTTP: http://\(127\.0\.0\.1:[0-9]*\)/.*|\1|p' "$tmp/run.out")
ftp=$(sed -n 's|^FTP: ftp://\(127\.0\.0\.1:[0-9]*\)/.*|\1|p' "$tmp/run.out")
if [[ -z $http || -z $ftp ]]; then echo "engine bench: the service did not start" >&2; cat "$tmp/run.out" >&2; exit 1; fi

export ENGINE_BENCH_HTTP=$http ENGINE_BENCH_FTP=$ftp ENGINE_BENCH_FTP_PASSWORD=bench-ftp
export ENGINE_BENCH_USER_DIR=$user_dir QT_QPA_PLATFORM=offscreen
bench="$build/bench/engine/engine_bench"
"$bench" --benchmark_out="$tmp/out.json" --benchmark_out_format=json \
    --benchmark_report_aggregates_only=true --benchmark_enable_random_interleaving=true \
    >/dev/null 2>"$tmp/bench.err" ||
  { cat "$tmp/bench.err" >&2; exit 1; }
peak1k=$("$bench" --peak-records=1000)
peak10k=$("$bench" --peak-records=10000)

"$py" - "$tmp/out.json" "$peak1k" "$peak10k" <<'PY'
import json, sys
runs = json.load(open(sys.argv[1]))["benchmarks"]
med = {}
for r in runs:
    if r.get("error_occurred"):
        sys.exit(f"engine bench: {r['run_name']} failed: {r.get('error_message')}")
    if r.get("aggregate_name") == "median":
        med[r["run_name"].split("/")[0]] = r["real_time"]  # milliseconds
def show(label, ours, anchor, per=None):
    a, b = med[ours], med[anchor]
    print(f"{label}: {a:.0f} ms")
    if per:
        print(f"{label}_per_record: {a / per:.2f} ms")
    print(f"{label}_anchor: {b:.0f} ms")
    print(f"{label}_vs_anchor: {a / b:.2f} x")
show("engine_new_data_1000_records", "BM_EngineNewData", "BM_CurlNewData", 1000)
show("window_new_data_1000_records", "BM_WindowNewData", "BM_EngineNewData", 1000)
show("engine_complete_files_100_of_1mb", "BM_EngineWholeFiles", "BM_CurlWholeFiles")
show("engine_complete_files_100_of_1mb_vs_found_and_synced", "BM_EngineWholeFiles",
     "BM_CurlWholeFilesFoundAndSynced")
p1, p10 = int(sys.argv[2]) / 1024, int(sys.argv[3]) / 1024
print(f"engine_peak_rss_1000_records: {p1:.1f} MB")
print(f"engine_peak_rss_10000_records: {p10:.1f} MB")
print(f"engine_peak_rss_10000_vs_1000_records: {p10 / p1:.2f} x")
PY
