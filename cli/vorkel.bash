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

_vorkel() {
  local program=$1 word=$2 previous=$3 words=
  COMPREPLY=()
  if ((COMP_CWORD == 1)); then
    words=$(_vorkel_listed "$program" Commands help)
  else
    case $previous in
      -o | --request | check) mapfile -t COMPREPLY < <(compgen -f -- "$word"); return ;;
      --format) words='text json tcl sdc' ;;
      --bandwidth) words='LOW HIGH OPTIMIZED' ;;
      --primitive) words='auto PLL TSYN KRU_SP KRU_CLKGEN' ;;
      --device | devices)
        words=$("$program" devices 2>/dev/null | awk '/^$/ { exit } /^[^ ]/ && NR > 1 { print $1 }')
        ;;
      help) words=$(_vorkel_listed "$program" Commands help) ;;
      *)
        if [[ $word == -* ]]; then
          words="$(_vorkel_listed "$program" Options help "${COMP_WORDS[1]}") --help"
        fi
        ;;
    esac
  fi
  mapfile -t COMPREPLY < <(compgen -W "$words" -- "$word")
}

complete -F _vorkel vorkel ./vorkel
