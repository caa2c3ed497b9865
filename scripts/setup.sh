# Sourced by ./run, ./test and the scripts that build: goes to the project's root, installs what is missing, and offers
# `configure` and `build`.
set -euo pipefail
root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)
cd "$root"

# Installs the packages of packages.txt that are missing. A second call does nothing.
install_packages() {
  if ! grep -qs '^VERSION_ID="12"' /etc/os-release || ! grep -qs '^ID=debian' /etc/os-release; then
    echo "Quorl builds on Debian 12; elsewhere install the equivalents of packages.txt and set QUORL_SKIP_PACKAGES=1." >&2
    exit 1
  fi
  local missing=() name
  while read -r name; do
    case $name in '' | '#'*) continue ;; esac
    dpkg-query -W -f='${db:Status-Status}' "$name" 2>/dev/null | grep -q '^installed$' || missing+=("$name")
  done <packages.txt
  [ ${#missing[@]} -eq 0 ] && return
  local sudo=()
  if [ "$(id -u)" -ne 0 ]; then
    command -v sudo >/dev/null || { echo "Run as root or install sudo: ${missing[*]} must be installed." >&2; exit 1; }
    sudo=(sudo)
  fi
  echo "Installing ${missing[*]}"
  "${sudo[@]}" apt-get update -q >/dev/null
  "${sudo[@]}" env DEBIAN_FRONTEND=noninteractive apt-get install -y -q --no-install-recommends "${missing[@]}" >/dev/null
}

# configure PRESET: only when that was not done yet.
configure() {
  [ -f "build/$1/build.ninja" ] || cmake --preset "$1" >/dev/null
}

# build PRESET [TARGET...]: quiet unless it fails.
build() {
  local preset=$1
  shift
  local log
  log=$(mktemp)
  if ! cmake --build "build/$preset" ${1:+--target "$@"} >"$log" 2>&1; then
    cat "$log" >&2
    rm -f "$log"
    exit 1
  fi
  rm -f "$log"
}

[ -n "${QUORL_SKIP_PACKAGES:-}" ] || install_packages
