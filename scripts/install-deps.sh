#!/usr/bin/env bash
# Installs what building and testing qorctl needs on Debian 12, and nothing
# that is already there. Safe to run again.
#
# Python 2.7 is not part of Debian 12. It comes from the Debian 11 suite of the
# mirror this machine already uses: the address is read from the existing apt
# source entry, and the extra suite is pinned low so nothing else is upgraded
# from it.
set -euo pipefail

need_pkgs=(
  build-essential cmake make g++ pkg-config
  googletest libgtest-dev libboost-dev
  python3 python3-clang-14 libclang-14-dev
  python2.7 python2.7-dev python2.7-dbg libpython2.7-dev libpython2.7-dbg
  valgrind
)

missing=()
for p in "${need_pkgs[@]}"; do
  dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q "ok installed" || missing+=("$p")
done
if [ ${#missing[@]} -eq 0 ]; then
  exit 0
fi

if [ "$(id -u)" -ne 0 ]; then
  echo "install-deps: missing packages: ${missing[*]}; run as root to install them" >&2
  exit 1
fi

# The mirror: the first Debian archive address of the existing apt sources
# (deb822 .sources files or one-line .list files), security archive excluded.
mirror_of_sources() {
  local f
  for f in /etc/apt/sources.list.d/*.sources; do
    [ -f "$f" ] || continue
    awk '
      /^[[:space:]]*$/ { if (uri != "" && suite ~ /^(bookworm|stable)( |$)/) { print uri; exit } uri=""; suite=""; next }
      /^URIs:/   { uri=$2 }
      /^Suites:/ { $1=""; sub(/^ /,""); suite=$0 }
      END { if (uri != "" && suite ~ /^(bookworm|stable)( |$)/) print uri }
    ' "$f"
  done
  for f in /etc/apt/sources.list /etc/apt/sources.list.d/*.list; do
    [ -f "$f" ] || continue
    awk '$1=="deb" { i=2; if ($2 ~ /^\[/) { while ($i !~ /\]$/) i++; i++ }
                     if ($(i+1) ~ /^(bookworm|stable)$/) { print $i } }' "$f"
  done
}

list=/etc/apt/sources.list.d/qorctl-bullseye.sources
pin=/etc/apt/preferences.d/qorctl-bullseye
if [ ! -f "$list" ]; then
  mirror=$(mirror_of_sources | head -n 1)
  if [ -z "$mirror" ]; then
    echo "install-deps: no Debian 12 archive entry found in the apt sources" >&2
    exit 1
  fi
  keyring=/usr/share/keyrings/debian-archive-keyring.gpg
  {
    echo "Types: deb"
    echo "URIs: $mirror"
    echo "Suites: bullseye"
    echo "Components: main"
    [ -f "$keyring" ] && echo "Signed-By: $keyring"
  } > "$list"
  printf 'Package: *\nPin: release n=bullseye\nPin-Priority: 100\n' > "$pin"
fi

export DEBIAN_FRONTEND=noninteractive
apt-get update -qq
apt-get install -y -qq --no-install-recommends "${missing[@]}" </dev/null
