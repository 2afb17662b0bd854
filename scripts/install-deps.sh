#!/usr/bin/env bash
# Installs the Debian 12 packages that Pelmo's build, tests and benchmarks need.
# Idempotent: prints nothing and touches nothing when every package is present.
set -euo pipefail

packages=(
  cmake g++ make ninja-build pkg-config
  qt6-base-dev qt6-qpa-plugins libqt6sql6-sqlite qtkeychain-qt6-dev shared-mime-info
  libfontconfig-dev
  qt6-tools-dev qt6-l10n-tools qt6-translations-l10n
  libgmime-3.0-dev liblz4-dev libplist-dev
  chromium firefox-esr
  libgtest-dev libgmock-dev libbenchmark-dev
  clang libclang-rt-14-dev
  python3-aiosmtpd openssl python3-lxml time
  postfix dovecot-core
  libxcb1-dev xvfb
  xdg-utils desktop-file-utils
  librsvg2-bin appstream dpkg-dev lintian
)

missing=()
for p in "${packages[@]}"; do
  status=$(dpkg-query -W -f='${db:Status-Status}' "$p" 2>/dev/null || true)
  [ "$status" = "installed" ] || missing+=("$p")
done
[ ${#missing[@]} -eq 0 ] && exit 0

sudo=""
if [ "$(id -u)" -ne 0 ]; then
  command -v sudo >/dev/null || { echo "install-deps: need root or sudo to install: ${missing[*]}" >&2; exit 1; }
  sudo="sudo"
fi

echo "install-deps: installing ${missing[*]}"
export DEBIAN_FRONTEND=noninteractive
# Postfix is here for its smtp-sink and smtp-source benchmark tools: configured for local
# mail only, it never takes mail from the network.
if [[ " ${missing[*]} " == *" postfix "* ]]; then
  printf '%s\n' "postfix postfix/main_mailer_type select Local only" \
    "postfix postfix/mailname string localhost" | $sudo debconf-set-selections
fi
# Dovecot is here for its SASL authentication service, which the STARTTLS benchmark starts
# with a configuration of its own; the system-wide one is left as the package installs it.
$sudo apt-get update -qq
$sudo apt-get install -y -qq --no-install-recommends "${missing[@]}" >/dev/null
