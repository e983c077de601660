#!/usr/bin/env bash
# run_transcript.sh TRANSCRIPT TEVPF MAKE_PLANT: runs the lines of a transcript that start with "$ " in
# an empty folder, and compares what they print, errors included, and their exit status with what
# stands behind them. Lines that start with "# " are comments.
set -uo pipefail
export LC_ALL=C.UTF-8
transcript=$(realpath "$1") tevpf=$(realpath "$2") make_plant=$(realpath "$3")
folder=$(mktemp -d)
trap 'rm -rf "$folder" "$folder.actual"' EXIT
cd "$folder" || exit 1

tevpf() { "$tevpf" "$@"; }
make_plant() { "$make_plant" "$@"; }

while IFS= read -r line; do
  [[ $line == "# "* ]] && printf '%s\n' "$line"
  [[ $line == "$ "* ]] || continue
  printf '%s\n' "$line"
  eval "${line#"$ "}" </dev/null 2>&1
  status=$?
  ((status == 0)) || echo "[exit $status]"
done <"$transcript" >"$folder.actual"
diff -u "$transcript" "$folder.actual"
