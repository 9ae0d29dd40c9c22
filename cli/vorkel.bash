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

# The part names that go on from a word: the devices, or, where the word is already one or longer,
# that device with its packages and grades: _vorkel_parts PROGRAM WORD.
_vorkel_parts() {
  local program=$1 word=$2 name package grade packages grades
  "$program" devices 2>/dev/null | awk '/^$/ { exit } /^[^ ]/ && NR > 1 { print $1 }' |
    while read -r name; do
      printf '%s\n' "$name"
      [[ $word == "$name"* ]] || continue
      packages=$(_vorkel_choices "$program" "$name" packages)
      grades=$(_vorkel_choices "$program" "$name" grades)
      for package in '' $packages; do
        printf '%s\n' "$name$package"
        [[ $word == "$name$package"-* ]] || continue
        for grade in $grades; do
          printf '%s\n' "$name$package-$grade"
        done
      done
    done | sort -u
}

# The packages or the grades of a device: _vorkel_choices PROGRAM DEVICE packages|grades.
_vorkel_choices() {
  "$1" devices "$2" 2>/dev/null </dev/null |
    awk -v label="$3" '
      /^[^ ]/ { inside = 0 }
      /^$/ { exit }
      $1 == label { inside = 1; $1 = "" }
      inside { text = text " " $0 }
      END { sub(/\(.*/, "", text); gsub(/,/, " ", text); print text }'
}

_vorkel() {
  local program=$1 word=$2 previous=$3 command=${COMP_WORDS[1]} words='' prefix=''
  COMPREPLY=()
  # Bash takes --option=value apart at the "=", if COMP_WORDBREAKS has it.
  if [[ $previous == = ]]; then
    previous=${COMP_WORDS[COMP_CWORD - 2]}
  elif [[ ${COMP_WORDS[COMP_CWORD]} == = ]]; then
    word=
  elif [[ $word == --*=* ]]; then
    prefix=${word%%=*}=
    previous=${word%%=*}
    word=${word#*=}
  fi
  if ((COMP_CWORD == 1)); then
    words=$(_vorkel_listed "$program" Commands help)
  elif [[ $word == -* && $previous != -* ]]; then
    words=$(_vorkel_options "$program" "$command")
  elif ((COMP_CWORD == 2)) && [[ $previous == "$command" ]]; then
    case $command in
      check) _vorkel_files "$word" '' .toml; return ;;
      verify) _vorkel_files "$word" '' .json; return ;;
      batch) _vorkel_files "$word" ''; return ;;
      devices) words=$(_vorkel_parts "$program" "$word") ;;
      help) words=$(_vorkel_listed "$program" Commands help) ;;
    esac
  else
    case $previous in
      -o | --request) _vorkel_files "$word" "$prefix"; return ;;
      --format | --bandwidth | --primitive | --rank | --language)
        words=$(_vorkel_values "$program" "$command" "$previous")
        ;;
      --device) words=$(_vorkel_parts "$program" "$word") ;;
      *)
        if [[ $word == -* ]]; then
          words=$(_vorkel_options "$program" "$command")
        fi
        ;;
    esac
  fi
  mapfile -t COMPREPLY < <(compgen -P "$prefix" -W "$words" -- "$word")
}

# Offers the files that a word begins: _vorkel_files WORD PREFIX [ENDING]. With an ending, only
# folders and the files with it. A folder goes on with a slash; with a prefix bash does not see that
# it is one, and leaves the end to the user.
_vorkel_files() {
  local name
  COMPREPLY=()
  while IFS= read -r name; do
    if [[ -z ${3-} || $name == *"$3" || -d $name ]]; then
      COMPREPLY+=("$2$name")
    fi
  done < <(compgen -f -- "$1")
  compopt -o "$([[ -n $2 ]] && printf nospace || printf filenames)" 2>/dev/null || true
}

complete -F _vorkel vorkel ./vorkel
