#!/usr/bin/env bash
# bench/webdata/run.sh BUILD_DIR
# Ingest of a large GETDATA reply against curl fetching the same reply from the
# same loopback server (best of each, taken in alternating rounds), and the
# last date of a 1 GB file against a whole-file read and tail. Every data file
# lives in a temporary folder removed at exit.
set -euo pipefail
build=$1
here=$(cd "$(dirname "${BASH_SOURCE[0]}")" && pwd)
py=/usr/bin/python3
tmp=$(mktemp -d "${TMPDIR:-/tmp}/quorvel-webdata-bench.XXXXXX")
server_pid=
cleanup() {
  if [[ -n $server_pid ]]; then kill "$server_pid" 2>/dev/null || true; wait "$server_pid" 2>/dev/null || true; fi
  rm -rf "$tmp"
}
trap cleanup EXIT

# Reply bodies: "DateTime" records, then the final line.
for n in 1000000 5000000; do
  "$py" - "$tmp/ingest$n.dat.body" "$n" <<'PY'
import sys, datetime
path, n = sys.argv[1], int(sys.argv[2])
start = datetime.datetime(2006, 5, 1)
step = datetime.timedelta(minutes=1)
with open(path, "w", newline="") as f:
    block = []
    t = start
    for i in range(n):
        block.append(f"{t:%Y-%m-%d %H:%M:%S},{i % 1000}.5,{i % 97}\r\n")
        t += step
        if len(block) == 100000:
            f.write("".join(block)); block = []
    f.write("".join(block))
    f.write("OK\r\n")
PY
done

"$py" "$here/reply_server.py" "$tmp" "$tmp/port" &
server_pid=$!
for _ in $(seq 100); do [[ -f $tmp/port ]] && break; sleep 0.05; done
port=$(cat "$tmp/port")
mkdir -p "$tmp/local"

json_field() { # file benchmark-name field
  "$py" -c 'import json,sys
d=json.load(open(sys.argv[1]))
b=[x for x in d["benchmarks"] if x["name"].startswith(sys.argv[2]) and x.get("run_type","iteration")=="iteration"]
vals=[x[sys.argv[3]] for x in b]
print(min(vals) if sys.argv[3]=="real_time" else max(vals))' "$1" "$2" "$3"
}
to_ms() { "$py" -c "print(f'{float(\"$1\")*1000:.1f}')"; }
ratio() { "$py" -c "print(f'{float(\"$1\")/float(\"$2\"):.2f}')"; }

first_rep() { # file: the first repetition of BM_GetNewData, made on a fresh process and connection
  "$py" -c 'import json,sys
d=json.load(open(sys.argv[1]))
print([x for x in d["benchmarks"] if x["name"].startswith("BM_GetNewData") and x.get("run_type","iteration")=="iteration"][0]["real_time"])' "$1"
}
curl_ms_once() {
  local t
  t=$(curl -s -o "$tmp/local/curl.dat" -w '%{time_total}' \
    "http://127.0.0.1:$port/wd/wd.php?cmd=GETDATA&user=bench&pwd=bench&file=$1&dt=1&filelocation=0&date=0")
  rm -f "$tmp/local/curl.dat"
  to_ms "$t"
}
minimum() { "$py" -c 'import sys; print(min(float(x) for x in sys.argv[1:]))' "$@"; }
maximum() { "$py" -c 'import sys; print(max(float(x) for x in sys.argv[1:]))' "$@"; }

# Three rounds, each of one process of our ingest (five runs on one kept
# connection; the first of them also connects, like every curl fetch) and two
# curl fetches, so that both sides meet the same load on a shared machine.
for n in 1000000 5000000; do
  warm=(); first=(); rss=(); curls=()
  for round in 1 2 3; do
    WD_BENCH_HOST="127.0.0.1:$port" WD_BENCH_FILE="ingest$n.dat" WD_BENCH_DIR="$tmp/local" \
      "$build/bench/webdata/webdata_ingest_bench" --benchmark_format=json \
      --benchmark_out="$tmp/ingest$n.json" --benchmark_out_format=json >/dev/null
    warm+=("$(json_field "$tmp/ingest$n.json" BM_GetNewData real_time)")
    first+=("$(first_rep "$tmp/ingest$n.json")")
    rss+=("$(json_field "$tmp/ingest$n.json" BM_GetNewData peak_rss_mb)")
    curls+=("$(curl_ms_once "ingest$n.dat")" "$(curl_ms_once "ingest$n.dat")")
  done
  ours=$(minimum "${warm[@]}"); ours_first=$(minimum "${first[@]}")
  curl_ms=$(minimum "${curls[@]}")
  printf 'webdata_ingest_%s_lines: %.1f ms\n' "$n" "$ours"
  printf 'webdata_ingest_%s_lines_first_on_new_connection: %.1f ms\n' "$n" "$ours_first"
  printf 'curl_fetch_%s_lines: %s ms\n' "$n" "$curl_ms"
  printf 'webdata_ingest_%s_lines_vs_curl: %s x\n' "$n" "$(ratio "$ours" "$curl_ms")"
  printf 'webdata_ingest_%s_lines_first_vs_curl: %s x\n' "$n" "$(ratio "$ours_first" "$curl_ms")"
  printf 'webdata_ingest_%s_lines_peak_rss: %.1f MB\n' "$n" "$(maximum "${rss[@]}")"
done
kill "$server_pid" 2>/dev/null || true; wait "$server_pid" 2>/dev/null || true; server_pid=
rm -f "$tmp"/*.body

# A 1 GB "DateTime" data file whose last record is distinct.
big="$tmp/big.dat"
"$py" - "$big" <<'PY'
import sys
line = b"2006-05-01 10:20:30,12.5,13.25,14.125,15.0625\r\n"
block = line * (1048576 // len(line))
with open(sys.argv[1], "wb") as f:
    for _ in range(1024):
        f.write(block)
    f.write(b"2009-12-31 23:59:59,1.0\r\n")
PY
WD_BENCH_BIGFILE="$big" "$build/bench/webdata/webdata_lastdate_bench" --benchmark_format=json \
  --benchmark_out="$tmp/last.json" --benchmark_out_format=json >/dev/null
ours_us=$(json_field "$tmp/last.json" BM_LastDateInFile real_time)
full_ms=$(json_field "$tmp/last.json" BM_WholeFileRead real_time)
tail_ms=$("$py" - "$big" <<'PY'
import subprocess, sys, time
best = None
for _ in range(20):
    t = time.perf_counter()
    out = subprocess.run(["tail", "-n", "1", sys.argv[1]], capture_output=True, check=True).stdout
    d = time.perf_counter() - t
    assert out.startswith(b"2009-12-31")
    best = d if best is None else min(best, d)
print(f"{best * 1000:.3f}")
PY
)
ours_ms=$("$py" -c "print(float('$ours_us')/1000)")
printf 'webdata_last_date_1gb: %.1f us\n' "$ours_us"
printf 'whole_file_read_last_date_1gb: %.1f ms\n' "$full_ms"
printf 'tail_n1_1gb: %s ms\n' "$tail_ms"
printf 'webdata_last_date_1gb_vs_whole_read: %s x\n' "$(ratio "$ours_ms" "$full_ms")"
printf 'webdata_last_date_1gb_vs_tail: %s x\n' "$(ratio "$ours_ms" "$tail_ms")"

# The same ingest over TLS, against curl over the same https server.
"$here/tls_run.sh" "$build"
