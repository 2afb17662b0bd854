#!/usr/bin/env bash
# Whole mailing runs against Postfix's smtp-sink on 127.0.0.1: COPIES copies of a 20 KB message
# sent by `pelmo send --group`, as plain text and as rich text (HTML), each against smtp-source
# sending as many messages of the same size as that format's copy (base64 makes a copy larger
# than its text) with one connection per message, the protocol's floor. The four runs are
# interleaved ROUNDS times; the medians per copy and their ratios are printed.
# Usage: bench-send.sh PATH-TO-PELMO [COPIES] [ROUNDS]
set -euo pipefail

pelmo=$(realpath "$1")
copies=${2:-300}
rounds=${3:-5}
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

export XDG_DATA_HOME="$work/data" XDG_CONFIG_HOME="$work/config" XDG_RUNTIME_DIR="$work/run"
mkdir -m 700 "$work/run"
python3 - "$copies" > "$work/people.csv" <<'PY'
import sys
print("first name,last name,e-mail,groups")
for i in range(int(sys.argv[1])):
    print(f"Reader,{i:04d},reader{i:04d}@example.org,Bench")
PY
"$pelmo" contacts import "$work/people.csv" > /dev/null
python3 -c 'print("first name,last name,e-mail,groups")
for i in range(30): print(f"Far,{i:02d},far{i:02d}@example.org,Far")' > "$work/far.csv"
"$pelmo" contacts import "$work/far.csv" > /dev/null
python3 -c 'print(("Dear {toName}, " + "x" * 70 + "\n") * 240, end="")' > "$work/message.txt"
python3 -c 'print("<html><body>" + ("<p>Dear <b>{toName}</b>, " + "x" * 60 + "</p>\n") * 240 + "</body></html>")' \
  > "$work/message.html"

# pelmo FORMAT MESSAGE-FILE [OPTION...]: `pelmo send` over the group.
send_group() {
  "$pelmo" send --group Bench --subject "Bench for {toName}" --message "$work/$2" \
    --set serverAddress=127.0.0.1 --set serverPort="$port" --set senderEmail=bench@example.org \
    --set senderName=Bench --set selectedContentType="$1" --set selectedAuthentication=0 \
    --set useSSL=false "${@:3}"
}

# The size of the first copy in FORMAT, as smtp-source's message size.
copy_size() {
  send_group "$@" --preview 1 | wc -c
}

# pelmo FORMAT MESSAGE-FILE: one run over the group; the time goes to standard output.
run_pelmo() {
  local start end sent
  start=$(date +%s.%N)
  send_group "$@" > "$work/pelmo.out"
  end=$(date +%s.%N)
  sent=$(grep -c '^Message sent. Closing the connection.$' "$work/pelmo.out" || true)
  [ "$sent" -eq "$copies" ] || { echo "bench-send: pelmo sent $sent of $copies copies" >&2; exit 1; }
  python3 -c "print($end - $start)"
}

# smtp-source SIZE: as many messages of SIZE bytes, one connection each.
run_source() {
  local start end
  start=$(date +%s.%N)
  /usr/sbin/smtp-source -s 1 -m "$copies" -l "$1" -f bench@example.org -t reader@example.org \
    127.0.0.1:"$port"
  end=$(date +%s.%N)
  python3 -c "print($end - $start)"
}

plain_size=$(copy_size 1 message.txt)
rich_size=$(copy_size 0 message.html)
: > "$work/times"
for _ in $(seq "$rounds"); do
  echo "plain $(run_pelmo 1 message.txt)" >> "$work/times"
  echo "source-plain $(run_source "$plain_size")" >> "$work/times"
  echo "rich $(run_pelmo 0 message.html)" >> "$work/times"
  echo "source-rich $(run_source "$rich_size")" >> "$work/times"
done
python3 - "$work/times" "$copies" "$(dirname "$0")" "$plain_size" "$rich_size" <<'PY'
import sys
sys.path.insert(0, sys.argv[3])
from bench_medians import per_copy
copies = int(sys.argv[2])
sizes = {"plain": int(sys.argv[4]), "rich": int(sys.argv[5])}
per, rounds = per_copy(sys.argv[1], copies)
print(f"mailing run, {copies} copies of a 20 KB text through smtp-sink, medians of {rounds} "
      f"interleaved rounds, per copy (whole process):")
for kind in ("plain", "rich"):
    source = per["source-" + kind]
    print(f"  pelmo send, {kind} text ({sizes[kind]:,} bytes a copy): {per[kind]:.2f} ms; "
          f"smtp-source, same size: {source:.2f} ms; ratio {per[kind] / source:.2f}")
PY

# A 1 MB file attached to 50 copies, against smtp-source with as many messages of the same
# size: a run reads and encodes the file once, not once a copy.
head -c 1000000 /dev/urandom > "$work/file.pdf"
python3 -c 'print("first name,last name,e-mail,groups")
for i in range(50): print(f"Attached,{i:02d},attached{i:02d}@example.org,Attached")' > "$work/attached.csv"
"$pelmo" contacts import "$work/attached.csv" > /dev/null
attached() {
  "$pelmo" send --group Attached --subject "Bench for {toName}" --message "$work/message.txt" \
    --attach "$work/file.pdf" --set serverAddress=127.0.0.1 --set serverPort="$port" \
    --set senderEmail=bench@example.org --set senderName=Bench --set selectedContentType=1 \
    --set selectedAuthentication=0 --set useSSL=false "$@"
}
attached_size=$(attached --preview 1 | wc -c)
: > "$work/attached-times"
for _ in $(seq "$rounds"); do
  start=$(date +%s.%N)
  attached > /dev/null
  end=$(date +%s.%N)
  echo "attached $(python3 -c "print($end - $start)")" >> "$work/attached-times"
  echo "source $(copies=50 run_source "$attached_size")" >> "$work/attached-times"
done
python3 - "$work/attached-times" "$(dirname "$0")" "$attached_size" <<'PY'
import sys
sys.path.insert(0, sys.argv[2])
from bench_medians import per_copy
per, rounds = per_copy(sys.argv[1], 50)
print(f"  with a 1 MB attachment ({int(sys.argv[3]):,} bytes a copy), 50 copies: {per['attached']:.2f} ms; "
      f"smtp-source, same size: {per['source']:.2f} ms; ratio {per['attached'] / per['source']:.2f}")
PY

# The same message to 30 members through a relay that holds each direction 10 ms, as a server
# that far away: the server waits a copy costs, one connection a copy and with reuseConnection.
for reuse in false true; do
  coproc RELAY { python3 "$(dirname "$0")/delay-relay.py" "$port" --delay 10; }
  read -r _ relay <&"${RELAY[0]}"
  start=$(date +%s.%N)
  "$pelmo" send --group Far --subject "Bench for {toName}" --message "$work/message.txt" \
    --set serverAddress=127.0.0.1 --set serverPort="$relay" --set senderEmail=bench@example.org \
    --set senderName=Bench --set selectedContentType=1 --set selectedAuthentication=0 \
    --set useSSL=false --set reuseConnection="$reuse" > "$work/far.out"
  end=$(date +%s.%N)
  exec {RELAY[1]}>&-
  read -r _ waits _ sessions <&"${RELAY[0]}"
  python3 -c "print(f'10 ms away, reuseConnection=$reuse: {($end - $start) / 30 * 1000:.0f} ms and ' \
                    f'{$waits / 30:.1f} server waits a copy over $sessions connections')"
done

# Memory stays flat however many members a run mails: peak resident size of a 10,000-member run
# against a one-member run of the same message.
python3 -c 'print("first name,last name,e-mail,groups")
for i in range(10000): print(f"Many,{i:05d},many{i:05d}@example.org,Many")
print("One,00000,one@example.org,One")' > "$work/many.csv"
"$pelmo" contacts import "$work/many.csv" > /dev/null
peak_kb() {
  /usr/bin/time -f %M -o "$work/peak" "$pelmo" send --group "$1" --subject "Bench for {toName}" \
    --message "$work/message.txt" --set serverAddress=127.0.0.1 --set serverPort="$port" \
    --set senderEmail=bench@example.org --set senderName=Bench --set selectedContentType=1 \
    --set selectedAuthentication=0 --set useSSL=false > /dev/null
  cat "$work/peak"
}
many=$(peak_kb Many)
one=$(peak_kb One)
python3 -c "print(f'peak memory: 10,000 members {$many / 1024:.1f} MiB, one member {$one / 1024:.1f} MiB, ' \
                  f'ratio {$many / $one:.2f}')"
