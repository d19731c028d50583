#!/bin/bash
# Installs what is missing of the given sections of debian-packages.txt:
#   packaging/install-packages.sh build test
# Does nothing, and asks for nothing, when nothing is missing. Without root and without sudo it
# says what to install and exits with 1.
set -euo pipefail

list=$(dirname "$0")/debian-packages.txt

usage() {
  echo "usage: install-packages.sh SECTION...   (sections: $(sections | paste -sd' '))" >&2
  exit 2
}

sections() {
  sed -nE 's/^# ([a-z]+): .*/\1/p' "$list"
}

packages_of() {
  awk -v wanted="# $1:" '
    /^# [a-z]+: / { inside = (index($0, wanted) == 1) }
    inside && /^[^#]/ { print $1 }' "$list"
}

is_installed() {
  [ "$(dpkg-query -W -f='${db:Status-Status}' "$1" 2>/dev/null)" = installed ]
}

[ $# -gt 0 ] || usage
for section in "$@"; do
  sections | grep -qx -- "$section" || usage
done

if ! command -v apt-get >/dev/null || ! command -v dpkg-query >/dev/null; then
  echo "This is no Debian system. Make sure that the equivalents of these are installed:" >&2
  for section in "$@"; do packages_of "$section"; done | paste -sd' ' >&2
  exit 0
fi

missing=()
for section in "$@"; do
  for package in $(packages_of "$section"); do
    is_installed "$package" || missing+=("$package")
  done
done
[ ${#missing[@]} -gt 0 ] || exit 0

as_root=()
if [ "$(id -u)" -ne 0 ]; then
  if ! command -v sudo >/dev/null || { [ ! -t 0 ] && ! sudo -n true 2>/dev/null; }; then
    echo "These packages are missing, and installing them takes root:" >&2
    echo "  apt-get update && apt-get install --no-install-recommends ${missing[*]}" >&2
    exit 1
  fi
  as_root=(sudo)
fi

echo "Installing: ${missing[*]}" >&2
install=("${as_root[@]}" env DEBIAN_FRONTEND=noninteractive apt-get -y -qq
         -o Dpkg::Use-Pty=0 -o Acquire::Retries=3 -o DPkg::Lock::Timeout=300)
"${install[@]}" update >&2
"${install[@]}" install --no-install-recommends "${missing[@]}" >&2
