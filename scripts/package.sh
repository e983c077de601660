#!/usr/bin/env bash
# package.sh: builds the packages of a release in build/packages: Debian's, and an archive for any
# folder on Linux; with --windows, also the archive for 64-bit Windows.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

case ${1:-} in
  "" | --windows) ;;
  *) sed -n '2,/^set /{/^set /d;s/^# \{0,1\}//;p}' "${BASH_SOURCE[0]}"; exit 2 ;;
esac
out=build/packages
mkdir -p "$out"

make() {  # BUILD-FOLDER GENERATOR CMAKE-OPTION...
  local build=build/$1 generator=$2
  shift 2
  cmake -S . -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=Release -DTEVPF_BUILD_EXAMPLES=OFF "$@"
  cmake --build "$build"
  (cd "$build" && cpack -G "$generator")
}

scripts/install-packages.sh build tool python
make package-deb DEB -DCMAKE_INSTALL_PREFIX=/usr -DTEVPF_BUILD_PYTHON=ON \
  -DTEVPF_PYTHON_INSTALL_DIR=lib/python3/dist-packages
make package-archive TGZ -DCMAKE_INSTALL_LIBDIR=lib
mv build/package-deb/*.deb build/package-archive/*.tar.gz "$out"
if [[ ${1:-} == --windows ]]; then
  scripts/install-packages.sh wine
  make package-windows ZIP --toolchain cmake/windows-x64.cmake
  mv build/package-windows/*.zip "$out"
fi
ls -l "$out"
