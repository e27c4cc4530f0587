# shellcheck shell=bash
# SPDX-License-Identifier: MIT
# What ./run, ./test and .ci/run share; sourced by them with `set -euo pipefail`. Each step says
# what it does and how long it took, and a failure ends the program with one line that names it.

root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd -P)
program=$(basename "$0")
current_step=

die() {  # die MESSAGE...
  printf '%s: %s\n' "$program" "$*" >&2
  current_step=
  exit 1
}

report_failure() {
  local status=$?
  if ((status != 0)) && [[ -n $current_step ]]; then
    printf '\n%s: failed while %s (exit status %d)\n' "$program" "$current_step" "$status" >&2
  fi
}
trap report_failure EXIT

step() {  # step WHAT COMMAND...: runs the command under a heading
  local start=$SECONDS
  current_step=$1
  shift
  printf '== %s\n' "$current_step"
  "$@"
  printf -- '-- %s: %d s\n' "$current_step" $((SECONDS - start))
  current_step=
}

processors() {
  nproc 2>/dev/null || echo 2
}

listed_packages() {  # listed_packages GROUP...: the packages of these groups, one a line
  sed -e 's/#.*//' -e 's/[[:space:]]//g' -e '/^$/d' "$root/packages.txt" |
    awk -v groups=" $* " '/^\[/ {listed = index(groups, " " substr($0, 2, length - 2) " "); next}
                          listed'
}

missing_packages() {  # missing_packages GROUP...
  local installed
  # shellcheck disable=SC2016  # the format is dpkg-query's to expand
  installed=$(dpkg-query --show --showformat='${db:Status-Status} ${Package}\n' |
    sed -n 's/^installed //p')
  listed_packages "$@" | grep -vxF "$installed" || true
}

as_root() {
  if ((EUID == 0)); then
    "$@"
  elif command -v sudo >/dev/null; then
    if [[ -n ${CI:-} ]]; then sudo -n "$@"; else sudo "$@"; fi
  else
    # shellcheck disable=SC2154  # the caller's
    die "installing packages takes root or sudo; as root: apt-get install ${missing[*]}"
  fi
}

# Installs the groups' packages. Touches the network only when one is missing.
# KESTRO_SKIP_PACKAGES=1 leaves packages alone.
install_packages() {  # install_packages GROUP...
  if [[ -n ${KESTRO_SKIP_PACKAGES:-} ]]; then
    return
  fi
  if ! command -v apt-get >/dev/null || ! command -v dpkg-query >/dev/null; then
    printf 'Building Kestro needs what these Debian packages hold:\n'
    listed_packages "$@" | sed 's/^/  /'
    die "no apt here: install them your way, then run again with KESTRO_SKIP_PACKAGES=1"
  fi

  local missing=() package
  while read -r package; do
    missing+=("$package")
  done < <(missing_packages "$@")
  if ((${#missing[@]} == 0)); then
    return
  fi
  printf 'Installing: %s\n' "${missing[*]}"
  # An index that cannot be refreshed may still be good enough; the installation itself decides.
  as_root apt-get --quiet --option DPkg::Lock::Timeout=300 update || true
  as_root env DEBIAN_FRONTEND=noninteractive apt-get --quiet --option DPkg::Lock::Timeout=300 \
    --option Dpkg::Use-Pty=0 install --yes --no-install-recommends "${missing[@]}"
}

# A build tree made for another place (a copied or moved folder) is made anew.
configure() {  # configure PRESET [CMAKE ARGUMENT...]
  local cache="$root/build/$1/CMakeCache.txt"
  if [[ -f $cache ]] && ! grep -qxF "CMAKE_HOME_DIRECTORY:INTERNAL=$root" "$cache"; then
    rm -rf "$root/build/$1"
  fi
  (cd "$root" && cmake --preset "$@" --log-level=NOTICE)
}

# A tree for what takes only the packages to run. The programs are compiled in it as they are with
# tests, so that nothing of them is built anew when those are configured in. A tree that has tests
# keeps them: configuring them away would remove what was built of them.
configure_programs() {  # configure_programs PRESET
  if grep -qs '^KESTRO_BUILD_TESTS:.*=ON$' "$root/build/$1/CMakeCache.txt"; then
    configure "$1"
  else
    configure "$1" -DKESTRO_BUILD_TESTS=OFF -DKESTRO_BUILD_BENCHMARKS=OFF
  fi
}

build() {  # build PRESET [TARGET...]: in a configured tree
  local preset=$1
  shift
  (cd "$root" && cmake --build --preset "$preset" ${1:+--target "$@"})
}

# What takes long mostly waits for other processes, so three tests share a processor.
run_tests() {  # run_tests PRESET [CTEST ARGUMENT...]
  local preset=$1
  shift
  (cd "$root" && ctest --preset "$preset" --parallel "$((3 * $(processors)))" "$@" |
    tee "build/$preset/ctest.log")
}
