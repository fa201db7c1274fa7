# Shared by q7r and run-tests, which source it: installs packages that are missing, configures and builds. Messages are
# one line each on standard error; what the commands print goes to build/setup.log and is shown when one fails. Needs
# `set -o pipefail`.
# shellcheck shell=bash

top=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd -P)
program=$(basename "$0")
builds=$top/build
log=$builds/setup.log

say() { printf '%s: %s\n' "$program" "$*" >&2; }

fail() {
  say "$*"
  exit 2
}

# A tree that this user can't write to is built in a folder of the user's own, below the home folder or that for
# temporary files.
choose_builds() {
  if [[ -w $builds ]] || { [[ ! -e $builds && -w $top ]]; }; then
    return
  fi
  local own=${XDG_CACHE_HOME:-${HOME:-/nonexistent}/.cache} place
  place=q7r-$(printf '%s' "$top" | cksum | cut -d' ' -f1)
  if ! mkdir -p "$own/$place" 2>/dev/null; then
    own=${TMPDIR:-/tmp}
    place+=-$EUID
    mkdir -m 700 "$own/$place" 2>/dev/null || [[ -d $own/$place && ! -L $own/$place && -O $own/$place ]] ||
      fail "cannot write to $top, nor make $own/$place to build in"
  fi
  builds=$own/$place
  log=$builds/setup.log
}

# Only one process at a time installs and builds in this tree, or in a folder of it; the others wait here.
lock_tree() {
  local folder=${1-$builds}
  mkdir -p "$folder" || fail "cannot make $folder"
  exec 9>"$folder/.lock"
  if ! flock --nonblock 9; then
    say "waiting for another build in this tree"
    flock 9
  fi
}

unlock_tree() { exec 9>&-; }

# Runs a command with its output in the log; tells the end of it when the command fails.
logged() {
  "$@" >"$log" 2>&1 9>&- && return
  tail -n 40 "$log" >&2
  return 1
}

# Prints those packages of the groups that are not installed.
missing_packages() {
  local group name
  local -A installed=()
  while read -r name; do
    installed[$name]=1
  done < <(dpkg-query --show --showformat '${db:Status-Status} ${Package}\n' | sed -n 's/^installed //p')
  while read -r group name; do
    if [[ " $* " == *" $group "* && -z ${installed[$name]-} ]]; then
      echo "$name"
    fi
  done <"$top/packaging/debian-packages"
}

# Installs what the groups lack. Where there is no dpkg, the configuration step tells what is missing.
install_packages() {
  command -v dpkg-query >/dev/null || return 0
  local packages
  mapfile -t packages < <(missing_packages "$@")
  ((${#packages[@]})) || return 0

  local as_root=()
  if ((EUID != 0)); then
    as_root=(sudo)
    [[ -t 0 ]] || as_root+=(--non-interactive)
  fi
  local apt=("${as_root[@]}" env DEBIAN_FRONTEND=noninteractive apt-get --quiet --option DPkg::Lock::Timeout=600)
  if ((EUID != 0)) && ! command -v sudo >/dev/null; then
    fail "please install these packages: ${packages[*]}"
  fi
  say "installing ${packages[*]}"
  if ! logged "${apt[@]}" update || ! logged "${apt[@]}" install --yes --no-install-recommends "${packages[@]}"; then
    fail "could not install; please install these packages: ${packages[*]}"
  fi
}

# Configures a preset, with further arguments for cmake. A folder that was configured for another place (the tree was
# copied or moved) starts afresh.
configure() {
  local preset=$1 fresh=()
  local cache=$builds/$preset/CMakeCache.txt
  if [[ -e $cache ]] && ! grep -qxF "CMAKE_HOME_DIRECTORY:INTERNAL=$top" "$cache"; then
    fresh=(--fresh)
  fi
  (cd "$top" && logged cmake --preset "$preset" -B "$builds/$preset" "${fresh[@]}" "${@:2}")
}

# Passes a build's output on to the log and shows, on a terminal, how far it has come.
show_progress() {
  local line shown=
  while IFS= read -r line; do
    printf '%s\n' "$line" >>"$log"
    if [[ $line =~ ^\[[0-9]+/[0-9]+\] && $line != *" Re-checking globbed directories"* ]]; then
      if [[ -t 2 ]]; then
        printf '\r%s: building %s' "$program" "${BASH_REMATCH[0]}" >&2
      elif [[ -z $shown ]]; then
        say "building"
      fi
      shown=1
    fi
  done
  if [[ $shown && -t 2 ]]; then
    printf '\r\e[K' >&2
  fi
}

# Builds the targets of a configured preset; silent when there is nothing to do.
build() {
  : >"$log"
  if ! NINJA_STATUS='[%f/%t] ' ninja -C "$builds/$1" "${@:2}" 2>&1 9>&- | show_progress; then
    grep -v '^\[' "$log" | tail -n 40 >&2
    return 1
  fi
}
