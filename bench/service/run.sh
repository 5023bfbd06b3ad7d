#!/usr/bin/env bash
# bench/service/run.sh BUILD_DIR
# GETDATA of 1,000,000 and 5,000,000 new records through the reference service
# (server/run, one PHP process) fetched into a file, against PHP's web server
# serving the same reply bytes as a static file in the same run (best of five
# each), and the peak memory of the service's PHP process. Every request checks
# the user's password (bcrypt, cost 10): that fixed part is measured on its own
# too (a GETUSERFOLDERS request). Every file lives in a temporary folder
# removed at exit.
set -euo pipefail
build=$1
here=$(cd "$(dirname "${BASH_SOURCE[0]}")" && pwd)
root=$(cd "$here/../.." && pwd)
py=/usr/bin/python3
tmp=$(mktemp -d "${TMPDIR:-/tmp}/quorvel-service-bench.XXXXXX")
run_pid=
static_pid=
cleanup() {
  for pid in $run_pid $static_pid; do
    kill "$pid" 2>/dev/null || true
    wait "$pid" 2>/dev/null || true
  done
  rm -rf "$tmp"
}
trap cleanup EXIT

data="$tmp/data"
mkdir -p "$tmp/www"
"$root/server/add-user" bench bench --data "$data" --season '' --quorvel "$build/src/quorvel" >/dev/null
sizes=(1000000 5000000)
for n in "${sizes[@]}"; do
  # "DateTime" records one minute apart, and the reply the service must give for
  # them: every record, then the final line.
  "$py" - "$data/users/bench/big$n.dat" "$tmp/www/reply$n.txt" "$n" <<'PY'
import sys, datetime
path, reply, n = sys.argv[1], sys.argv[2], int(sys.argv[3])
t = datetime.datetime(2006, 5, 1)
step = datetime.timedelta(minutes=1)
with open(path, "w", newline="") as f:
    block = []
    for i in range(n):
        block.append(f"{t:%Y-%m-%d %H:%M:%S},{i % 1000}.5,{i % 97}\r\n")
        t += step
        if len(block) == 100000:
            f.write("".join(block)); block = []
    f.write("".join(block))
with open(reply, "wb") as out, open(path, "rb") as f:
    while chunk := f.read(1 << 20):
        out.write(chunk)
    out.write(b"OK\r\n")
PY
done

wait_for() { # file pattern
  for _ in $(seq 300); do grep -q "$2" "$1" 2>/dev/null && return 0; sleep 0.1; done
  echo "service bench: no \"$2\" in $1" >&2; cat "$1" >&2; return 1
}

"$root/server/run" --port 0 --ftp-port 0 --data "$data" --workers 1 >"$tmp/run.out" 2>&1 &
run_pid=$!
wait_for "$tmp/run.out" 'Ctrl+C stops'
port=$(sed -n 's|^HTTP: http://127\.0\.0\.1:\([0-9]*\)/.*|\1|p' "$tmp/run.out")
# The PHP process: the child of the guard that server/run starts for it.
guard_pid=$(pgrep -P "$run_pid" -f -- '--guard php')
php_pid=$(pgrep -P "$guard_pid" -x php)

php -S 127.0.0.1:0 -t "$tmp/www" >/dev/null 2>"$tmp/static.log" &
static_pid=$!
wait_for "$tmp/static.log" 'started'
static_port=$(sed -n 's|.*Development Server (http://127\.0\.0\.1:\([0-9]*\)) started.*|\1|p' "$tmp/static.log")

json_field() { # file benchmark-name field
  "$py" -c 'import json,sys
d=json.load(open(sys.argv[1]))
b=[x for x in d["benchmarks"] if x["name"].startswith(sys.argv[2]) and x.get("run_type","iteration")=="iteration"]
print(min(x[sys.argv[3]] for x in b))' "$1" "$2" "$3"
}
ratio() { "$py" -c "print(f'{float(\"$1\")/float(\"$2\"):.2f}')"; }
peak_mb() { "$py" -c "print(f'{int(open(\"/proc/$1/status\").read().split(\"VmHWM:\")[1].split()[0])/1024:.1f}')"; }

declare -A peak
for n in "${sizes[@]}"; do
  # Records newer than a date before the first one: every line's date is read.
  getdata="http://127.0.0.1:$port/wd/wd.php?cmd=GETDATA&user=bench&pwd=bench&file=big$n.dat&dt=1&filelocation=2&date=2006-04-30%2023%3A59%3A59"
  curl -s -o "$tmp/check.txt" "$getdata"
  if ! cmp -s "$tmp/check.txt" "$tmp/www/reply$n.txt"; then
    echo "service bench: the GETDATA reply for $n records is not the expected one" >&2
    exit 1
  fi
  rm -f "$tmp/check.txt"
  echo 5 >"/proc/$php_pid/clear_refs" # the peak memory counts from here
  SERVICE_BENCH_GETDATA_URL="$getdata" \
  SERVICE_BENCH_GETALL_URL="${getdata%%&date=*}&date=0" \
  SERVICE_BENCH_STATIC_URL="http://127.0.0.1:$static_port/reply$n.txt" \
  SERVICE_BENCH_LOGIN_URL="http://127.0.0.1:$port/wd/wd.php?cmd=GETUSERFOLDERS&user=bench&pwd=bench" \
  SERVICE_BENCH_OUT="$tmp/fetched.txt" \
    "$build/bench/service/service_fetch_bench" --benchmark_format=json \
    --benchmark_out="$tmp/fetch$n.json" --benchmark_out_format=json >/dev/null
  ours=$(json_field "$tmp/fetch$n.json" BM_ServiceGetData real_time)
  anchor=$(json_field "$tmp/fetch$n.json" BM_StaticFile real_time)
  login=$(json_field "$tmp/fetch$n.json" BM_ServiceLoginCheck real_time)
  all=$(json_field "$tmp/fetch$n.json" BM_ServiceGetAll real_time)
  peak[$n]=$(peak_mb "$php_pid")
  printf 'service_getdata_%s_records: %.1f ms\n' "$n" "$ours"
  printf 'php_static_file_%s_records: %.1f ms\n' "$n" "$anchor"
  printf 'service_getdata_%s_records_vs_static: %s x\n' "$n" "$(ratio "$ours" "$anchor")"
  printf 'service_getdata_date0_%s_records: %.1f ms\n' "$n" "$all"
  printf 'service_getdata_date0_%s_records_vs_static: %s x\n' "$n" "$(ratio "$all" "$anchor")"
  printf 'service_password_check_request_%s_run: %.1f ms\n' "$n" "$login"
  printf 'service_getdata_%s_records_less_password_check_vs_static: %s x\n' "$n" \
    "$(ratio "$("$py" -c "print(float('$ours') - float('$login'))")" "$anchor")"
  printf 'service_php_peak_rss_%s_records: %s MB\n' "$n" "${peak[$n]}"
done
printf 'service_php_peak_rss_5000000_vs_1000000_records: %s x\n' "$(ratio "${peak[5000000]}" "${peak[1000000]}")"
