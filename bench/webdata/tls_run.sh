#!/usr/bin/env bash
# bench/webdata/tls_run.sh BUILD_DIR
# Ingest of a large GETDATA reply over TLS (https, certificate verified against
# the bench's own CA) against curl fetching the same reply from the same nginx
# over https, best of five each, a new connection and handshake per fetch.
# Every file lives in a temporary folder removed at exit; nginx is stopped.
set -euo pipefail
build=$1
here=$(cd "$(dirname "${BASH_SOURCE[0]}")" && pwd)
root=$(cd "$here/../.." && pwd)
py=/usr/bin/python3
tmp=$(mktemp -d "${TMPDIR:-/tmp}/quorvel-tls-bench.XXXXXX")
nginx_pid=
cleanup() {
  if [[ -n $nginx_pid ]]; then kill "$nginx_pid" 2>/dev/null || true; wait "$nginx_pid" 2>/dev/null || true; fi
  rm -rf "$tmp"
}
trap cleanup EXIT

n=1000000
"$py" - "$tmp/body" "$n" <<'PY'
import sys, datetime
path, n = sys.argv[1], int(sys.argv[2])
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
    f.write("OK\r\n")
PY
mkdir -p "$tmp/certs" "$tmp/local" "$tmp/temp"
"$py" "$root/tests/security/make_certs.py" "$tmp/certs"
port=$("$py" -c 'import socket; s=socket.socket(); s.bind(("127.0.0.1",0)); print(s.getsockname()[1])')
user_line=
if [[ $(id -u) -eq 0 ]]; then user_line="user root root;"; fi
cat > "$tmp/nginx.conf" <<CONF
$user_line
worker_processes 1;
daemon off;
pid $tmp/nginx.pid;
error_log $tmp/error.log warn;
events { worker_connections 64; }
http {
  access_log off;
  client_body_temp_path $tmp/temp/body; fastcgi_temp_path $tmp/temp/fastcgi;
  proxy_temp_path $tmp/temp/proxy; uwsgi_temp_path $tmp/temp/uwsgi; scgi_temp_path $tmp/temp/scgi;
  server {
    listen 127.0.0.1:$port ssl;
    ssl_certificate $tmp/certs/good.pem;
    ssl_certificate_key $tmp/certs/good.key;
    location = /wd/wd.php {
      default_type text/plain;
      if (\$arg_cmd = GETLASTDATE) { return 200 "OK 0\r\n"; }
      alias $tmp/body;
    }
  }
}
CONF
/usr/sbin/nginx -p "$tmp" -c "$tmp/nginx.conf" -e "$tmp/error.log" &
nginx_pid=$!
for _ in $(seq 200); do
  curl -s -o /dev/null --cacert "$tmp/certs/ca.pem" "https://localhost:$port/wd/wd.php?cmd=GETLASTDATE" && break
  sleep 0.05
done

json_field() { # file benchmark-name
  "$py" -c 'import json,sys
d=json.load(open(sys.argv[1]))
print(min(x["real_time"] for x in d["benchmarks"] if x["name"].startswith(sys.argv[2]) and x.get("run_type","iteration")=="iteration"))' "$1" "$2"
}

WD_BENCH_HOST="https://localhost:$port" WD_BENCH_CA="$tmp/certs/ca.pem" WD_BENCH_FILE="tls$n.dat" \
  WD_BENCH_DIR="$tmp/local" "$build/bench/webdata/webdata_tls_ingest_bench" --benchmark_format=json \
  --benchmark_out="$tmp/tls.json" --benchmark_out_format=json >/dev/null
ours=$(json_field "$tmp/tls.json" BM_GetNewDataTls)
best=
for _ in 1 2 3 4 5; do
  t=$(curl -s --cacert "$tmp/certs/ca.pem" -o "$tmp/local/curl.dat" -w '%{time_total}' \
    "https://localhost:$port/wd/wd.php?cmd=GETDATA&user=bench&pwd=bench&file=tls$n.dat&dt=1&filelocation=0&date=0")
  [[ $(stat -c %s "$tmp/local/curl.dat") -eq $(stat -c %s "$tmp/body") ]] || { echo "curl fetched a short reply" >&2; exit 1; }
  rm -f "$tmp/local/curl.dat"
  if [[ -z $best ]] || "$py" -c "import sys; sys.exit(0 if $t < $best else 1)"; then best=$t; fi
done
curl_ms=$("$py" -c "print(f'{float(\"$best\")*1000:.1f}')")
printf 'webdata_tls_ingest_%s_lines: %.1f ms\n' "$n" "$ours"
printf 'curl_https_fetch_%s_lines: %s ms\n' "$n" "$curl_ms"
printf 'webdata_tls_ingest_%s_lines_vs_curl: %s x\n' "$n" "$("$py" -c "print(f'{float(\"$ours\")/float(\"$curl_ms\"):.2f}')")"
