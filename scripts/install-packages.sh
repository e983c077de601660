#!/usr/bin/env bash
# install-packages.sh GROUP...: installs the missing Debian packages of these groups.
# Groups: build tool test python bench x86 windows wine clang arm64 fuzz lint browser package
set -euo pipefail

declare -A groups=(
  [build]="cmake ninja-build g++"
  [tool]="libcli11-dev nlohmann-json3-dev libsqlite3-dev"
  [test]="libgtest-dev pkg-config python3 sqlite3 strace"
  [python]="python3-dev python3-pip python3-setuptools python3-wheel python3-venv pybind11-dev python3-pybind11
    python3-numpy python3-pandas python3-matplotlib python3-pytest"
  [bench]="libbenchmark-dev libsqlite3-dev nlohmann-json3-dev python3"
  [x86]="g++-multilib googletest"
  [windows]="g++-mingw-w64-i686-win32"
  [wine]="g++-mingw-w64-x86-64-posix googletest wine64"
  [clang]="clang libc++-dev libc++abi-dev googletest"
  [arm64]="clang binutils-aarch64-linux-gnu libstdc++-12-dev-arm64-cross qemu-user googletest"
  [fuzz]="clang libclang-rt-14-dev llvm"
  [lint]="clang-format clang-tidy cppcheck shellcheck python3"
  [browser]="chromium chromium-driver python3-selenium"
  [package]="abigail-tools debhelper dh-python lintian mmdebstrap"
)

missing=()
for group in "$@"; do
  if [[ -z ${groups[$group]:-} ]]; then
    echo "install-packages.sh: no group '$group'; there are: ${!groups[*]}" >&2
    exit 2
  fi
  for package in ${groups[$group]}; do
    state=$(dpkg-query -W -f '${Status}' "$package" 2>/dev/null || true)
    [[ $state == "install ok installed" ]] || missing+=("$package")
  done
done
((${#missing[@]})) || exit 0

as_root=()
if ((EUID != 0)); then
  command -v sudo >/dev/null || {
    echo "install-packages.sh: run this as root: apt-get install ${missing[*]}" >&2
    exit 1
  }
  as_root=(sudo)
fi

# Waits for another package manager instead of failing on its lock, and retries network errors.
apt() {
  "${as_root[@]}" env DEBIAN_FRONTEND=noninteractive apt-get -q -y \
    -o DPkg::Lock::Timeout=300 -o Acquire::Retries=3 "$@" </dev/null
}
retry() {
  local try
  for try in 1 2 3 4 5; do
    "$@" && return
    echo "install-packages.sh: attempt $try failed, trying again" >&2
    sleep $((5 * try))
  done
  return 1
}

echo "Installing: ${missing[*]}"
retry apt update
retry apt install --no-install-recommends "${missing[@]}"
