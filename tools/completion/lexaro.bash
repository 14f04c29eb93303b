# SPDX-License-Identifier: Apache-2.0
# Completion of lexaro and lexaroc for bash. Names come from the program that is completed, once for each shell.

declare -gA _lexaro_options=(
  [lexaro]="-h --help --locale-dir --version"
  [lexaro convert]="-h --help -f --from -t --to -o --output -c -s --silent --report --progress --nl --verify -l --list"
  [lexaro records]="-h --help --length --to-length --keep --range --plan --format --line-out --keep-blanks --nl --line-in
    -f --from -t --to -o --output -c -s --silent --report --progress"
  [lexaro list]="-h --help"
  [lexaro list codepages]="-h --help --json --aliases"
  [lexaro list aliases]="-h --help --json"
  [lexaro list languages]="-h --help --json"
  [lexaro list territories]="-h --help --json"
  [lexaro list sorts]="-h --help --json"
  [lexaro list native]="-h --help --json"
  [lexaro locale]="-h --help --item --territory --native --json"
  [lexaro sort]="-h --help --locale -f --from --ignore-case --ignore-width -r --reverse -u --unique --keys -o --output
    --check"
  [lexaro format]="-h --help --locale -t --to --format --unsigned --international --territory"
  [lexaro parse]="-h --help --locale -t --text --format --base --unsigned --full-width --monetary --territory"
  [lexaro catalog]="-h --help"
  [lexaroc]="-h --help --version"
  [lexaroc data]="-h --help --layout --only"
  [lexaroc dump]="-h --help -o --output --locale-dir"
  [lexaroc check]="-h --help"
  [lexaroc catalog]="-h --help -o --output --locale --byte-order --encoding --header --merge --locale-dir"
  [lexaroc builtin]="-h --help"
)
declare -gA _lexaro_words=(
  [lexaro]="catalog convert format list locale parse records sort help"
  [lexaro help]="catalog convert format list locale parse records sort"
  [lexaro list]="codepages aliases languages territories sorts native"
  [lexaro format]="integer number currency time"
  [lexaro parse]="integer number currency time"
  [lexaroc]="data dump catalog check builtin"
)
declare -gA _lexaro_known=()

# Leaves a column of a list of the locale data in _lexaro_names.
_lexaro_list() {
  local key="$1 $2 $_lexaro_directory"
  if [[ ! -v _lexaro_known[$key] ]]; then
    _lexaro_known[$key]=$("$_lexaro_program" list "$1" ${_lexaro_directory:+--locale-dir "$_lexaro_directory"} \
      2> /dev/null | awk -v column="$2" 'NR > 1 { print $column }')
  fi
  _lexaro_names=${_lexaro_known[$key]}
}

# Offers PREFIX and each name that goes on as typed, whatever its case.
_lexaro_offer() {
  local prefix=$1 typed=${2,,} name
  for name in $_lexaro_names; do
    if [[ ${name,,} == "$typed"* ]]; then COMPREPLY+=("$prefix$name"); fi
  done
}

_lexaro_code_page() {
  _lexaro_list codepages 2
  _lexaro_offer "$1" "$2"
  if [[ -n $2 ]]; then
    _lexaro_list aliases 1
    _lexaro_offer "$1" "$2"
  fi
}

# Language_Territory.CodePage@Sort, part by part.
_lexaro_locale() {
  case $1 in
    *@*) _lexaro_list sorts 2 && _lexaro_offer "${1%@*}@" "${1##*@}" ;;
    *.*) _lexaro_list codepages 2 && _lexaro_offer "${1%.*}." "${1##*.}" ;;
    *_*) _lexaro_list territories 2 && _lexaro_offer "${1%%_*}_" "${1#*_}" ;;
    *) _lexaro_list languages 2 && _lexaro_offer "" "$1" ;;
  esac
  _lexaro_list native 1
  _lexaro_offer "" "$1"
  if [[ ${#COMPREPLY[@]} -gt 0 ]]; then compopt -o nospace 2> /dev/null; fi
  return 0
}

_lexaro_files() {
  mapfile -t COMPREPLY < <(compgen "$1" -- "$2")
  compopt -o filenames 2> /dev/null
  return 0
}

_lexaro_values() {
  case "$1 $2" in
    *" --locale") _lexaro_locale "$3" ;;
    *" -f" | *" --from" | "lexaro "*" -t" | *" --to" | *" --text" | *" --encoding") _lexaro_code_page "" "$3" ;;
    *" --progress") COMPREPLY=($(compgen -W "always auto never" -- "$3")) ;;
    "lexaro convert --nl") COMPREPLY=($(compgen -W "keep lf nel crlf" -- "$3")) ;;
    *" --nl") COMPREPLY=($(compgen -W "lf nel crlf" -- "$3")) ;;
    "lexaro records --format") COMPREPLY=($(compgen -W "F V VB" -- "$3")) ;;
    *" --byte-order") COMPREPLY=($(compgen -W "little big" -- "$3")) ;;
    *" --layout") COMPREPLY=($(compgen -W "1 2" -- "$3")) ;;
    *" --item") _lexaro_items "$3" ;;
    *" --locale-dir") _lexaro_files -d "$3" ;;
    *" --length" | *" --to-length" | *" --keep" | *" --range" | *" --plan" | *" --format" | *" --base" | *" --only") ;;
    *" -o" | *" --output" | *" --report" | *" --header" | *" --merge") _lexaro_files -f "$3" ;;
    *) return 1 ;;
  esac
}

_lexaro_items() {
  if [[ ! -v _lexaro_known[items] ]]; then
    _lexaro_known[items]=$("$_lexaro_program" locale English 2> /dev/null | awk '$1 ~ /^[0-9]+$/ { print $2 }')
  fi
  COMPREPLY=($(compgen -W "${_lexaro_known[items]}" -- "$1"))
}

_lexaro() {
  local command=${COMP_WORDS[0]##*/} word previous current i
  local _lexaro_program _lexaro_directory="" _lexaro_names
  _lexaro_program=${COMP_WORDS[0]%/*}
  if [[ $_lexaro_program == "${COMP_WORDS[0]}" ]]; then _lexaro_program=lexaro; else _lexaro_program+=/lexaro; fi
  # Readline takes words apart at "=" and "@".
  local -a words=()
  local joined=
  for ((i = 1; i <= COMP_CWORD; ++i)); do
    word=${COMP_WORDS[i]}
    if [[ $word == "=" ]]; then continue; fi
    if [[ -n $joined || $word == @* ]] && [[ ${#words[@]} -gt 0 ]]; then
      words[-1]+=$word
      joined=
      if [[ $word == @ ]]; then joined=1; fi
    else
      words+=("$word")
    fi
  done
  if [[ ${COMP_WORDS[COMP_CWORD]} == "=" ]]; then words+=(""); fi
  COMPREPLY=()
  for ((i = 0; i < ${#words[@]} - 1; ++i)); do
    word=${words[i]}
    if [[ $word == --locale-dir ]]; then
      _lexaro_directory=${words[++i]}
    elif [[ " ${_lexaro_words[$command]:-} " == *" $word "* && -v _lexaro_options["$command $word"] ]]; then
      command+=" $word"
    elif [[ $command == lexaro && $word == help ]]; then
      command="lexaro help"
    fi
  done
  current=${words[-1]}
  previous=
  if [[ ${#words[@]} -gt 1 ]]; then previous=${words[-2]}; fi
  if _lexaro_values "$command" "$previous" "$current"; then
    :
  elif [[ $current == -* ]]; then
    local options=${_lexaro_options[$command]:-}
    if [[ $command == "lexaro "* ]]; then options+=" --locale-dir"; fi
    COMPREPLY=($(compgen -W "$options" -- "$current"))
  elif [[ $command == "lexaro locale" ]]; then
    _lexaro_locale "$current"
  elif [[ -n ${_lexaro_words[$command]:-} ]]; then
    COMPREPLY=($(compgen -W "${_lexaro_words[$command]}" -- "$current"))
  else
    _lexaro_files -f "$current"
  fi
  # What stands before an "@" is a word of its own for readline.
  if [[ $current == *@* && $COMP_WORDBREAKS == *@* ]]; then COMPREPLY=("${COMPREPLY[@]#"${current%@*}@"}"); fi
}

complete -F _lexaro lexaro lexaroc
