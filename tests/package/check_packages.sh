#!/usr/bin/env bash
# check_packages.sh FOLDER: checks the packages that scripts/package.sh made there. lintian reads
# Debian's; then they and the archive are installed, used and removed in a fresh Debian, which is
# downloaded (as root, or by a user who has namespaces). The archive for Windows is run by Wine, if there
# is one. Part of scripts/full.sh.
set -euo pipefail
packages=$(realpath "$1")
root=$(realpath "$(dirname "${BASH_SOURCE[0]}")/../..")

echo "== lintian"
# They are no upload to Debian, which would close a bug there.
lintian --fail-on error,warning,info --display-info --tag-display-limit 0 \
  --suppress-tags initial-upload-closes-no-bugs "$packages"/*.deb

echo "== in a fresh Debian"
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
files=$work/packages
mkdir "$files"
cp "$packages"/*.deb "$packages"/*.tar.gz "$root"/examples/engine.{c,cpp} \
  "$root"/tests/package/{installed.sh,consumer/CMakeLists.txt} "$files"
chmod -R a+rX "$work"
mmdebstrap --quiet --variant=apt --format=null --include=g++,make,cmake,pkgconf,dpkg-dev \
  --customize-hook="copy-in '$files' /" \
  --customize-hook="chroot \"\$1\" bash /packages/installed.sh" bookworm /dev/null

shopt -s nullglob
for archive in "$packages"/*-win64.zip; do
  echo "== ${archive##*/}"
  (cd "$files" && cmake -E tar xf "$archive")
  program=("$files"/*-win64/bin/tevpf.exe)
  run() { (cd "$files" && "$root/scripts/wine.sh" "${program[0]}" "$@"); }
  run new engine.pf
  run add engine.pf Engine Thrust 480
  [[ $(run get engine.pf Engine Thrust | tr -d '\r') == 480 ]]
  echo "the tool: as expected"
done
