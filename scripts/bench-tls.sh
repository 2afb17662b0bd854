#!/usr/bin/env bash
# A mailing run the way users send: COPIES copies of a 20 KB message through a private Postfix
# submission service on 127.0.0.1 that requires STARTTLS and takes AUTH PLAIN through a private
# Dovecot's SASL socket, its certificate signed by a private CA given in SSL_CERT_FILE. The
# same bytes go through a Python smtplib loop (one session per copy, starttls, login), and the
# two runs are interleaved ROUNDS times; the medians per copy and their ratio are printed.
# Every process started here is stopped by its own PID; Postfix discards what it accepts.
# Usage: bench-tls.sh PATH-TO-PELMO [COPIES] [ROUNDS]
set -euo pipefail

pelmo=$(realpath "$1")
copies=${2:-300}
rounds=${3:-5}
here=$(dirname "$(realpath "$0")")
work=$(mktemp -d)
chmod 755 "$work" # Postfix's and Dovecot's unprivileged users must reach their folders
dovecot_pid=""
master_pid=""
cleanup() {
  for pid in $master_pid $dovecot_pid; do
    kill "$pid" 2> /dev/null || true
    wait "$pid" 2> /dev/null || true
  done
  rm -rf "$work"
}
trap cleanup EXIT
fail() {
  echo "bench-tls: $*" >&2
  exit 1
}
if [ "$(id -u)" -ne 0 ]; then
  echo "bench-tls: skipped: Postfix's master must start as root (its services run as postfix)" >&2
  exit 0
fi
command -v dovecot > /dev/null || fail "dovecot is missing: run scripts/install-deps.sh"

port=$(python3 -c 'import socket; s = socket.socket(); s.bind(("127.0.0.1", 0)); print(s.getsockname()[1])')

# The private CA and the server's certificate for localhost.
mkdir -m 700 "$work/pki"
(
  cd "$work/pki"
  echo "subjectAltName=DNS:localhost,IP:127.0.0.1" > san.cnf
  openssl req -x509 -newkey rsa:2048 -nodes -days 2 -subj /CN=Bench-CA -keyout ca.key \
    -out ca.pem 2> /dev/null
  openssl req -newkey rsa:2048 -nodes -subj /CN=localhost -keyout server.key -out server.csr \
    2> /dev/null
  openssl x509 -req -in server.csr -CA ca.pem -CAkey ca.key -CAcreateserial -days 2 \
    -extfile san.cnf -out server.pem 2> /dev/null
)

# One user with a password made for this run; it reaches the clients through files only.
password=$(openssl rand -hex 16)
umask 077
printf 'bench:{PLAIN}%s\n' "$password" > "$work/passwd"
printf '%s\n' "$password" > "$work/password"
umask 022
chown dovecot "$work/passwd" # read by Dovecot's auth service, which runs as dovecot

# Dovecot with nothing but the authentication socket that Postfix asks.
mkdir -p "$work/dovecot/run" "$work/dovecot/state"
cat > "$work/dovecot.conf" <<EOF
base_dir = $work/dovecot/run
state_dir = $work/dovecot/state
log_path = $work/dovecot.log
protocols =
ssl = no
auth_mechanisms = plain
passdb {
  driver = passwd-file
  args = $work/passwd
}
userdb {
  driver = static
  args = uid=nobody gid=nogroup home=/nonexistent
}
service auth {
  unix_listener auth-postfix {
    mode = 0660
    user = postfix
    group = postfix
  }
}
EOF
dovecot -F -c "$work/dovecot.conf" &
dovecot_pid=$!

# A Postfix instance of its own: configuration, queue and data under the temporary folder.
etc="$work/postfix/etc"
mkdir -p "$etc" "$work/postfix/queue"
cat > "$etc/main.cf" <<EOF
compatibility_level = 3.6
queue_directory = $work/postfix/queue
data_directory = $work/postfix/data
meta_directory = /etc/postfix
mail_owner = postfix
setgid_group = postdrop
inet_interfaces = 127.0.0.1
inet_protocols = ipv4
myhostname = bench.localdomain
mydestination =
relay_domains =
alias_maps =
alias_database =
local_recipient_maps =
maillog_file = $work/postfix/maillog
maillog_file_prefixes = $work
default_transport = discard
local_transport = discard
relay_transport = discard
smtpd_tls_security_level = encrypt
smtpd_tls_auth_only = yes
smtpd_tls_cert_file = $work/pki/server.pem
smtpd_tls_key_file = $work/pki/server.key
smtpd_sasl_auth_enable = yes
smtpd_sasl_type = dovecot
smtpd_sasl_path = $work/dovecot/run/auth-postfix
smtpd_relay_restrictions = permit_sasl_authenticated, reject
smtpd_recipient_restrictions = permit_sasl_authenticated, reject
EOF
cat > "$etc/master.cf" <<EOF
127.0.0.1:$port inet n - n - - smtpd
cleanup   unix n - n - 0 cleanup
qmgr      unix n - n 300 1 qmgr
rewrite   unix - - n - - trivial-rewrite
bounce    unix - - n - 0 bounce
defer     unix - - n - 0 bounce
trace     unix - - n - 0 bounce
verify    unix - - n - 1 verify
flush     unix n - n 1000? 0 flush
proxymap  unix - - n - - proxymap
discard   unix - - n - - discard
error     unix - - n - - error
retry     unix - - n - - error
tlsmgr    unix - - n 1000? 1 tlsmgr
anvil     unix - - n - 1 anvil
scache    unix - - n - 1 scache
postlog   unix-dgram n - n - 1 postlogd
EOF
postfix -c "$etc" check || fail "postfix check failed: $(cat "$work/postfix/maillog" 2> /dev/null)"
/usr/lib/postfix/sbin/master -d -c "$etc" &
master_pid=$!

# Both servers take a moment to open their sockets.
listening() {
  [ -S "$work/dovecot/run/auth-postfix" ] &&
    python3 -c "import socket; socket.create_connection(('127.0.0.1', $port), 1).close()" 2> /dev/null
}
for _ in $(seq 100); do
  listening && break
  sleep 0.1
done
listening || fail "the servers did not start: $(tail -3 "$work/postfix/maillog" "$work/dovecot.log" 2> /dev/null)"

export XDG_DATA_HOME="$work/data" XDG_CONFIG_HOME="$work/config" XDG_RUNTIME_DIR="$work/run"
export SSL_CERT_FILE="$work/pki/ca.pem"
# No keyring in this run: the password is read from the settings file, as without one.
unset DBUS_SESSION_BUS_ADDRESS
mkdir -m 700 "$work/run" "$work/config"
mkdir -m 700 "$work/config/Orvale Software"
python3 - "$work/password" "$work/config/Orvale Software/Pelmo.conf" <<'PY'
import os, sys
password = open(sys.argv[1]).read().strip()
descriptor = os.open(sys.argv[2], os.O_WRONLY | os.O_CREAT | os.O_TRUNC, 0o600)
with os.fdopen(descriptor, "w") as settings:
    settings.write(f"[General]\nloginPassword={password}\n")
PY
python3 - "$copies" > "$work/people.csv" <<'PY'
import sys
print("first name,last name,e-mail,groups")
for i in range(int(sys.argv[1])):
    print(f"Reader,{i:04d},reader{i:04d}@example.org,Bench")
PY
"$pelmo" contacts import "$work/people.csv" > /dev/null
python3 -c 'print(("Dear {toName}, " + "x" * 70 + "\n") * 240, end="")' > "$work/message.txt"

settings=(--set serverAddress=localhost --set serverPort="$port" --set senderEmail=bench@example.org
  --set senderName=Bench --set selectedContentType=1 --set useSSL=true --set selectedAuthentication=1
  --set loginUsername=bench --set smtpTimeout=30)

# The copies as Pelmo makes them, for the Python loop to send the same bytes.
"$pelmo" send --group Bench --subject "Bench for {toName}" --message "$work/message.txt" \
  "${settings[@]}" --dry-run "$work/copies" > /dev/null

run_pelmo() {
  local start end sent
  start=$(date +%s.%N)
  "$pelmo" send --group Bench --subject "Bench for {toName}" --message "$work/message.txt" \
    "${settings[@]}" > "$work/pelmo.out"
  end=$(date +%s.%N)
  sent=$(grep -c '^Message sent. Closing the connection.$' "$work/pelmo.out" || true)
  [ "$sent" -eq "$copies" ] || fail "pelmo sent $sent of $copies copies: $(grep -v '^Message sent' "$work/pelmo.out" | tail -3)"
  python3 -c "print($end - $start)"
}

# The loop a script mailer would be, timed as a whole process like pelmo's run.
run_smtplib() {
  local start end
  start=$(date +%s.%N)
  python3 - "$port" "$work/password" "$work/copies" "$work/loop" <<'PY'
import email.utils, os, smtplib, ssl, sys, time
port, password = int(sys.argv[1]), open(sys.argv[2]).read().strip()
folder = sys.argv[3]
start = time.monotonic()
for name in sorted(os.listdir(folder)):
    data = open(os.path.join(folder, name), "rb").read()
    headers = email.message_from_bytes(data.split(b"\r\n\r\n", 1)[0])
    with smtplib.SMTP("localhost", port) as smtp:
        smtp.starttls(context=ssl.create_default_context())
        smtp.login("bench", password)
        smtp.sendmail("bench@example.org", [email.utils.parseaddr(headers["To"])[1]], data)
print(time.monotonic() - start, file=open(sys.argv[4], "w"))
PY
  end=$(date +%s.%N)
  python3 -c "print($end - $start, open('$work/loop').read().strip())"
}

: > "$work/times"
for _ in $(seq "$rounds"); do
  echo "pelmo $(run_pelmo)" >> "$work/times"
  read -r whole loop <<< "$(run_smtplib)"
  echo "smtplib $whole" >> "$work/times"
  echo "loop $loop" >> "$work/times"
done
python3 - "$work/times" "$copies" "$(dirname "$0")" <<'PY'
import sys
sys.path.insert(0, sys.argv[3])
from bench_medians import per_copy
copies = int(sys.argv[2])
per, rounds = per_copy(sys.argv[1], copies)
print(f"mailing run, {copies} copies of 20 KB through Postfix with STARTTLS and AUTH PLAIN, "
      f"medians of {rounds} interleaved rounds, per copy (whole process):")
print(f"  pelmo send: {per['pelmo']:.2f} ms, ratio to smtplib {per['pelmo'] / per['smtplib']:.2f}")
print(f"  Python smtplib loop: {per['smtplib']:.2f} ms; the loop alone, without the "
      f"interpreter's start: {per['loop']:.2f} ms (pelmo's ratio to it {per['pelmo'] / per['loop']:.2f})")
PY
