#!/usr/bin/env bash
# A whole mailing run against Postfix's smtp-sink on 127.0.0.1: 500 copies of a 20 KB message
# sent by `pelmo send --group`, and the same by smtp-source with one connection per message,
# the protocol's floor. Prints both times and their ratio.
# Usage: bench-send.sh PATH-TO-PELMO [COPIES]
set -euo pipefail

pelmo=$(realpath "$1")
copies=${2:-500}
work=$(mktemp -d)
sink=""
cleanup() { [ -n "$sink" ] && kill "$sink" 2>/dev/null; rm -rf "$work"; }
trap cleanup EXIT

port=$(python3 -c 'import socket; s = socket.socket(); s.bind(("127.0.0.1", 0)); print(s.getsockname()[1])')
# smtp-sink drops its privileges to a user of its own when started as root.
as_user=()
[ "$(id -u)" -eq 0 ] && as_user=(-u nobody)
/usr/sbin/smtp-sink "${as_user[@]}" 127.0.0.1:"$port" 256 &
sink=$!

export XDG_DATA_HOME="$work/data" XDG_CONFIG_HOME="$work/config"
python3 - "$copies" > "$work/people.csv" <<'PY'
import sys
print("first name,last name,e-mail,groups")
for i in range(int(sys.argv[1])):
    print(f"Reader,{i:04d},reader{i:04d}@example.org,Bench")
PY
"$pelmo" contacts import "$work/people.csv" > /dev/null
python3 -c 'print(("Dear {toName}, " + "x" * 70 + "\n") * 240, end="")' > "$work/message.txt"

now() { date +%s.%N; }
start=$(now)
"$pelmo" send --group Bench --subject "Bench for {toName}" --message "$work/message.txt" \
  --set serverAddress=127.0.0.1 --set serverPort="$port" --set senderEmail=bench@example.org \
  --set senderName=Bench --set selectedContentType=1 --set selectedAuthentication=0 --set useSSL=false \
  > "$work/pelmo.out"
middle=$(now)
/usr/sbin/smtp-source -s 1 -m "$copies" -l 20480 -f bench@example.org -t reader@example.org 127.0.0.1:"$port"
end=$(now)

sent=$(grep -c '^Message sent. Closing the connection.$' "$work/pelmo.out" || true)
[ "$sent" -eq "$copies" ] || { echo "bench-send: pelmo sent $sent of $copies copies" >&2; exit 1; }
python3 - "$start" "$middle" "$end" "$copies" <<'PY'
import sys
start, middle, end = (float(v) for v in sys.argv[1:4])
copies = int(sys.argv[4])
pelmo, source = middle - start, end - middle
print(f"mailing run, {copies} copies of 20 KB through smtp-sink: pelmo send {pelmo:.2f} s, "
      f"smtp-source {source:.2f} s, ratio {pelmo / source:.2f}")
PY
