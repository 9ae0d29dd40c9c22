# Completion of the command line for bash. In the checkout:
#
#     source cli/vorkel.bash
#
# The words come from the program's own help, so that they are those that it takes.

# The first words of the indented lines in a part of a help: _vorkel_listed PROGRAM HEADING WORD...
_vorkel_listed() {
  local program=$1 heading=$2
  shift 2
  "$program" "$@" 2>/dev/null |
    awk -v heading="$heading" '
      index($0, heading) == 1 { inside = 1; next }
      !/^  / { inside = 0 }
      inside && /^  [-a-z]/ { print $1 }'
}

# The options of a command: _vorkel_options PROGRAM COMMAND.
_vorkel_options() {
  _vorkel_listed "$1" Options help "$2"
  printf '%s\n' --help
}

# The words that an option of a command takes: _vorkel_values PROGRAM COMMAND OPTION. Its
# description begins with them, as in "text (default), json or tcl; what it is about".
_vorkel_values() {
  "$1" help "$2" 2>/dev/null |
    awk -v option="$3" '
      /^  [-a-z]/ || !/^  / { inside = 0 }
      $1 == option { inside = 1; $1 = $2 = "" }
      inside { text = text " " $0 }
      END {
        gsub(/\([^)]*\)/, "", text)
        sub(/;.*/, "", text)
        gsub(/,| or /, " ", text)
        print text
      }'
}

_vorkel() {
  local program=$1 word=$2 previous=$3 command=${COMP_WORDS[1]} words=
  COMPREPLY=()
  if ((COMP_CWORD == 1)); then
    words=$(_vorkel_listed "$program" Commands help)
  elif [[ $word == -* && $previous != -* ]]; then
    words=$(_vorkel_options "$program" "$command")
  else
    case $previous in
      -o | --request | check) mapfile -t COMPREPLY < <(compgen -f -- "$word"); return ;;
      --format | --bandwidth | --primitive)
        words=$(_vorkel_values "$program" "$command" "$previous")
        ;;
      --device | devices)
        words=$("$program" devices 2>/dev/null | awk '/^$/ { exit } /^[^ ]/ && NR > 1 { print $1 }')
        ;;
      help) words=$(_vorkel_listed "$program" Commands help) ;;
      *)
        if [[ $word == -* ]]; then
          words=$(_vorkel_options "$program" "$command")
        fi
        ;;
    esac
  fi
  mapfile -t COMPREPLY < <(compgen -W "$words" -- "$word")
}

complete -F _vorkel vorkel ./vorkel
