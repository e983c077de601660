#!/usr/bin/env bash
# package.sh: builds the packages of a release in build/packages: Debian's, and an archive for any
# folder on Linux; with --windows, also the archive for 64-bit Windows. tests/package/check_packages.sh
# checks them.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

case ${1:-} in
  "" | --windows) ;;
  *) sed -n '2,/^set /{/^set /d;s/^# \{0,1\}//;p}' "${BASH_SOURCE[0]}"; exit 2 ;;
esac
out=build/packages
rm -rf "$out"
mkdir -p "$out"

make() {  # BUILD-FOLDER CMAKE-OPTION...
  local build=build/$1
  shift
  cmake -S . -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=Release -DTEVPF_BUILD_EXAMPLES=OFF \
    -DTEVPF_BUILD_ONCE=ON "$@"
  rm -f "$build"/*.{deb,tar.gz,zip}
  cmake --build "$build" --target package
}

scripts/install-packages.sh build tool python package
make package
mv build/package/*.{deb,tar.gz} "$out"
if [[ ${1:-} == --windows ]]; then
  scripts/install-packages.sh wine
  make package-windows --toolchain cmake/windows-x64.cmake
  mv build/package-windows/*.zip "$out"
fi
ls -l "$out"
