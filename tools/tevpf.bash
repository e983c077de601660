# Completion of the command tevpf for bash: commands, options, files, and names of elements, parameters
# and columns as FILE on the line has them.

# Those lines of standard input that start with $1, quoted for the command line.
_tevpf_lines() {
  local name
  while IFS= read -r name; do
    [[ $name == "$1"* ]] && COMPREPLY+=("$(printf '%q' "$name")")
  done
}

_tevpf_files() {
  compopt -o filenames
  mapfile -t COMPREPLY < <(compgen -f -- "$1")
}

# A word of the command line without its quotes and backslashes; nothing in it is expanded.
_tevpf_plain() {
  xargs printf '%s' <<<"${1/#\~\//$HOME/}" 2>/dev/null
}

_tevpf() {
  local word=${COMP_WORDS[COMP_CWORD]} previous=${COMP_WORDS[COMP_CWORD - 1]}
  local command=${COMP_WORDS[1]}
  COMPREPLY=()
  if ((COMP_CWORD == 1)); then
    mapfile -t COMPREPLY < <(compgen -W "$(tevpf --help 2>/dev/null |
      sed -n 's/^  \([a-z]*\) .*/\1/p') --help --version" -- "$word")
    return
  fi

  # Which positional argument is this? Options and their values do not count.
  local i position=0 file='' element=''
  for ((i = 2; i < COMP_CWORD; ++i)); do
    case ${COMP_WORDS[i]} in
      -o | --output | --columns | --sort | --where | --from | --to | --limit | --type | --width | \
        --units | --min | --max | --precision | --description | --default | --before | --after | \
        --position | --on-conflict | --with | --delimiter | --types | --missing | --skip | \
        --comment) ((++i)) ;;
      -*) ;;
      *)
        ((++position))
        ((position == 1)) && file=$(_tevpf_plain "${COMP_WORDS[i]}")
        ((position == 2)) && element=$(_tevpf_plain "${COMP_WORDS[i]}")
        ;;
    esac
  done

  case $previous in
    -o | --output | --with) _tevpf_files "$word"; return ;;
    --to) [[ $command == cp ]] && _tevpf_files "$word"; return ;;
    --delimiter) mapfile -t COMPREPLY < <(compgen -W "comma semicolon tab" -- "$word"); return ;;
    --type) mapfile -t COMPREPLY < <(compgen -W "integer short real double string" -- "$word"); return ;;
    --on-conflict) mapfile -t COMPREPLY < <(compgen -W "refuse rename replace skip" -- "$word"); return ;;
    --columns | --sort | --before | --after)
      _tevpf_lines "$word" < <(tevpf info --names "$file" "$element" 2>/dev/null)
      return
      ;;
    --where | --from | --limit | --width | --units | --min | --max | --precision | --description | \
      --default | --position | --types | --missing | --skip | --comment) return ;;
  esac
  if [[ $word == -* ]]; then
    mapfile -t COMPREPLY < <(compgen -W "$(tevpf "$command" --help 2>/dev/null |
      grep -oE -- '(^  |,)--?[a-z-]+' | tr -d ' ,')" -- "$word")
    return
  fi
  case $position:$command in
    0:* | 1:diff | 1:merge | 2:import) _tevpf_files "$word" ;;
    1:import)
      _tevpf_lines "$word" < <(tevpf info --names "$file" 2>/dev/null)
      mapfile -t -O ${#COMPREPLY[@]} COMPREPLY < <(compgen -f -X '!*.json' -- "$word")
      ;;
    1:check | 1:new | 1:sql) ;;
    1:*) _tevpf_lines "$word" < <(tevpf info --names "$file" 2>/dev/null) ;;
    2:get | 2:set | 2:define | 2:rm | 2:mv | 2:info)
      _tevpf_lines "$word" < <(tevpf info --names "$file" "$element" 2>/dev/null)
      ;;
    *:insert)
      compopt -o nospace
      _tevpf_lines "$word" < <(tevpf info --names "$file" "$element" 2>/dev/null | sed 's/$/=/')
      ;;
  esac
}
complete -F _tevpf tevpf
