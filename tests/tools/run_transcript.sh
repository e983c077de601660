#!/usr/bin/env bash
# run_transcript.sh TRANSCRIPT PROGRAM...: runs the lines of a transcript that start with "$ " in an
# empty folder, and compares what they print, errors included, and their exit status with what stands
# behind them. Lines that start with "# " are comments. The programs are called by their file names.
# A line behind the comment "# Not on Windows: REASON" is left out when WINDOWS is set.
# Of a manual page the section EXAMPLES is run. Of a Markdown text the console blocks are run; they find
# the examples beside the text, and the programs behind the first one as if they had been built in the
# folder. Where nothing can be tested, a line exits with 77; where something cannot, it says so on
# descriptor 3, the test's log.
set -uo pipefail
export LC_ALL=C.UTF-8
exec 3>&1
transcript=$(realpath "$1")
for program in "${@:2}"; do PATH=$(dirname "$(realpath "$program")"):$PATH; done
folder=$(mktemp -d)
trap 'rm -rf "$folder" "$folder".{expected,actual}' EXIT
cd "$folder" || exit 1

# limited BLOCKS COMMAND...: the command may write files of so many KiB, and no coverage profile.
limited() (
  ulimit -f "$1"
  LLVM_PROFILE_FILE=/dev/null "${@:2}"
)

if [[ $transcript == *.md ]]; then
  ln -s "$(dirname "$transcript")/examples" "${@:3}" .
  awk '/^```/ { inside = $0 == "```console"; next } inside' "$transcript"
elif [[ $transcript == *.1 ]]; then
  sed -n '/^\.SH EXAMPLES/,$ { /^\./d; s/^\\&//; s/\\-/-/g; s/\\e/\\/g; p }' "$transcript"
elif [[ -n ${WINDOWS:-} ]]; then
  awk '/^# Not on Windows: / { left_out = 2 }
       /^\$ / && left_out { --left_out; if (left_out) print "Not tested: " $0 | "cat >&3" }
       !left_out' "$transcript"
else
  cat "$transcript"
fi >"$folder.expected"

while IFS= read -r line; do
  [[ $line == "# "* ]] && printf '%s\n' "$line"
  [[ $line == "$ "* ]] || continue
  printf '%s\n' "$line"
  eval "${line#"$ "}" </dev/null 2>&1
  status=$?
  ((status == 0)) || echo "[exit $status]"
done <"$folder.expected" >"$folder.actual"
diff -u "$folder.expected" "$folder.actual"
