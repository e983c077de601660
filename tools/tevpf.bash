# Completion of the command tevpf for bash: commands, options, files, names of elements.

# The names of the elements of file $1 that start with $2, quoted for the command line.
_tevpf_elements() {
  local name
  while IFS= read -r name; do
    [[ $name == "$2"* ]] && COMPREPLY+=("$(printf '%q' "$name")")
  done < <(tevpf info --names "$1" 2>/dev/null)
}

_tevpf_files() {
  compopt -o filenames
  mapfile -t COMPREPLY < <(compgen -f -- "$1")
}

_tevpf() {
  local word=${COMP_WORDS[COMP_CWORD]} previous=${COMP_WORDS[COMP_CWORD - 1]}
  local commands="info show get set dump export import sql check new rm cp mv --help --version"
  COMPREPLY=()
  if ((COMP_CWORD == 1)); then
    mapfile -t COMPREPLY < <(compgen -W "$commands" -- "$word")
    return
  fi

  local options="--help"
  case ${COMP_WORDS[1]} in
    info) options+=" --json --names" ;;
    show) options+=" --columns --sort --from --to --json --list --table" ;;
    dump) options+=" -o --output --list --table --force" ;;
    export) options+=" -o --output --list --table" ;;
    sql) options+=" --with --csv --json" ;;
    rm | cp | mv) options+=" --list --table" ;;
  esac
  case $previous in
    -o | --output | --with) _tevpf_files "$word"; return ;;
    --columns | --sort | --from | --to) return ;;
  esac
  if [[ $word == -* ]]; then
    mapfile -t COMPREPLY < <(compgen -W "$options" -- "$word")
    return
  fi

  # Which positional argument is this? Options and their values do not count.
  local i position=0 file=
  for ((i = 2; i < COMP_CWORD; ++i)); do
    case ${COMP_WORDS[i]} in
      -o | --output | --with | --columns | --sort | --from | --to) ((++i)) ;;
      -*) ;;
      *) ((++position == 1)) && file=${COMP_WORDS[i]} ;;
    esac
  done
  # Quotes and backslashes are taken away without expanding anything.
  file=$(xargs printf '%s' <<<"${file/#\~\//$HOME/}" 2>/dev/null)
  case $position:${COMP_WORDS[1]} in
    0:* | 2:import) _tevpf_files "$word" ;;
    1:info | 1:check | 1:new | 1:sql) ;;
    1:*) _tevpf_elements "$file" "$word" ;;
  esac
}
complete -F _tevpf tevpf
