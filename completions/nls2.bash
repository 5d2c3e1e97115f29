# Bash completion of nls2: commands and options are those that its --help shows.

# Words of the help that begin with the prefix: _nls2_help PREFIX [COMMAND]
_nls2_help() {
  local line
  "$_nls2_tool" ${2:+"$2"} --help 2>/dev/null | while IFS= read -r line; do
    [[ $line =~ ^"  "(-[[:alnum:]]", ")?([[:alnum:]-]+) ]] || continue
    [[ ${BASH_REMATCH[2]} == "$1"* ]] && echo "${BASH_REMATCH[2]}"
  done
}

_nls2_pages() { "$_nls2_tool" codepages --names 2>/dev/null; }

_nls2_locales() {
  local row name
  "$_nls2_tool" locales 2>/dev/null | while read -r row name _; do
    [[ $row == row ]] || echo "$name"
  done
}

# What may be at a place: _nls2_candidates COMMAND WORD-BEFORE WORD
_nls2_candidates() {
  case $2 in
    --from | --to | --codepage | --encoding) _nls2_pages ;;
    --locale) _nls2_locales ;;
    --read) echo lines fixed: prefixed prefixed:data blocked csv ;;
    --write) echo lines lines:crlf lines:nel fixed: prefixed prefixed:data csv joined ;;
    --blanks) echo keep ;;
    --on-error) echo stop replace reject ;;
    *)
      case $1:$3 in
        :* | help:*) _nls2_help "" ;;
        *:-*) _nls2_help -- "$1" ;;
        codepages:*) _nls2_pages ;;
        locales:*) _nls2_locales ;;
      esac
      ;;
  esac
}

# Without candidates bash completes file names. "--from=cp" comes as three words.
_nls2() {
  local _nls2_tool=${COMP_WORDS[0]} word=${COMP_WORDS[COMP_CWORD]} before=${COMP_WORDS[COMP_CWORD - 1]}
  local command=${COMP_WORDS[1]}
  [[ $COMP_CWORD == 1 ]] && command=
  if [[ $before == "=" ]]; then
    before=${COMP_WORDS[COMP_CWORD - 2]}
  elif [[ $word == "=" ]]; then
    word=
  fi
  mapfile -t COMPREPLY < <(compgen -W "$(_nls2_candidates "$command" "$before" "$word")" -- "$word")
}

complete -o default -F _nls2 nls2
