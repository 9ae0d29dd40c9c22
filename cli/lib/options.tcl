# Options of a command, as words: `--name value`, `--name=value`, or `--name` for a flag.
#
# A command that takes a request calls
#
#     set call [::vorkel::options::request $words ?table?]
#
# with the words after its name and a table of options of its own, in the form that `parse`
# takes: name, placeholder and description of each, flat. Anything wrong is thrown as
# {VORKEL USAGE}, which the program makes a complaint and exit status 2; {VORKEL USAGE FILE} is
# what is wrong inside a file. The answer is a dict:
#   request     the request, see answer.tcl
#   primitive   that of --primitive: PLL, TSYN, KRU_SP, KRU_CLKGEN, or auto, the default
#   primitives  a list: the one of --primitive, or those of the device
#   format      text (the default), json, tcl or sdc
#   file        the file of -o, or "" for standard output
#   given       the options that were given, from name to value; those of `table` among them
#   words       the words, or others that ask the same, to be shown in a hint
#
# ::vorkel::output::write TEXT FILE then writes what the command has to say.

package provide vorkel::options 1.1

namespace eval ::vorkel::options {
  # The command that runs, which the program sets. It decides which options there are; without
  # one there are those of plan.
  variable command ""
  # Of a text that is wrong a complaint shows so many letters.
  variable most_shown 60
}

# See above.
proc ::vorkel::options::request {words {table {}}} {
  package require vorkel::request 1.1
  return [::vorkel::request::read $words $table]
}

# Reads the words of a command. `table` has three entries for each option: its name with the
# dashes, the placeholder of its value ("" for a flag), and a description.
# Answers a dict from option names to values (1 for a flag), and the list of the other words
# under the key "operands"; behind "--" there are no options. An unknown option, a value too few
# or too many, and an option that is given twice are wrong usage.
proc ::vorkel::options::parse {table words} {
  set placeholders [dict create]
  foreach {name placeholder description} $table {
    dict set placeholders $name $placeholder
  }
  set given [dict create operands {}]
  while {[llength $words] > 0} {
    set words [lassign $words word]
    if {$word eq "--"} {
      dict lappend given operands {*}$words
      break
    }
    if {[string index $word 0] ne "-" || $word eq "-"} {
      dict lappend given operands $word
      continue
    }
    set inline [regexp {^(--[^=]*)=(.*)$} $word -> name value]
    if {!$inline} {
      set name $word
    }
    if {![dict exists $placeholders $name]} {
      throw {VORKEL USAGE} [Unknown $name $placeholders]
    }
    if {[dict exists $given $name]} {
      throw {VORKEL USAGE} "$name is given twice"
    }
    set placeholder [dict get $placeholders $name]
    if {$placeholder eq ""} {
      if {$inline} {
        throw {VORKEL USAGE} "$name takes no value"
      }
      set value 1
    } elseif {!$inline} {
      # A value may begin with a dash, as a phase does, but an option is not a value.
      if {[llength $words] == 0 || [string match --* [lindex $words 0]]} {
        throw {VORKEL USAGE} "$name needs a value: $name $placeholder"
      }
      set words [lassign $words value]
    }
    dict set given $name $value
  }
  return $given
}

# What is wrong with an option that the command does not have: another one may have it.
proc ::vorkel::options::Unknown {name placeholders} {
  variable command
  package require vorkel::command_options 1.1
  set takers [::vorkel::command_options::takers $name]
  if {$command ne "" && [llength $takers] > 0} {
    set text "option $name is not of the command $command; it is of [enumerate $takers]"
    set reason [::vorkel::command_options::reason $command $name]
    return [expr {$reason eq "" ? $text : "$text: $reason"}]
  }
  if {[regexp {^(-[a-z])=?(.+)$} $name -> letter value] && [dict exists $placeholders $letter]} {
    return "unknown option [shown $name]; a value stands apart: $letter\
      [dict get $placeholders $letter]"
  }
  return "unknown option [shown $name][nearest $name [dict keys $placeholders]]"
}

# Refuses words that are no options, of which `most` are allowed.
proc ::vorkel::options::refuseOperands {given {most 0}} {
  set operands [dict get $given operands]
  if {[llength $operands] > $most} {
    throw {VORKEL USAGE} "unexpected word \"[shown [lindex $operands $most]]\""
  }
}

# The words of a command that takes no options, of which `most` are allowed.
proc ::vorkel::options::operands {words most} {
  set given [parse {} $words]
  refuseOperands $given $most
  return [dict get $given operands]
}

# The value of an option, or `default` when it was not given.
proc ::vorkel::options::get {given name default} {
  if {[dict exists $given $name]} {
    return [dict get $given $name]
  }
  return $default
}

# Words as a list in a sentence.
proc ::vorkel::options::enumerate {words {last and}} {
  if {[llength $words] < 2} {
    return [join $words]
  }
  return "[join [lrange $words 0 end-1] {, }] $last [lindex $words end]"
}

# The name of a file as the file commands take it. To them a leading "~" is a user's folder, which a
# shell has already made of it where that is meant, and a leading "|" is a program to run.
proc ::vorkel::options::path {name} {
  return [expr {[string index $name 0] in {~ |} ? "./$name" : $name}]
}

# The last part of the name of a file. "file tail" asks for the user that a leading "~" names.
proc ::vorkel::options::tail {name} {
  return [regsub {^.*/} $name {}]
}

# A text as a complaint shows it: on one line, and not without end.
proc ::vorkel::options::shown {text} {
  variable most_shown
  if {[string length $text] > $most_shown} {
    set text [string range $text 0 $most_shown-1]...
  }
  if {![regexp {[[:cntrl:]]} $text]} {
    return $text
  }
  return [join [lmap letter [split $text ""] {
    expr {[string is control $letter] ? [format \\x%02x [scan $letter %c]] : $letter}
  }] ""]
}

# A text that is not the program's own as it shows it: its control characters are escapes, and line
# breaks only where they are kept; what is longer than some letters is cut.
proc ::vorkel::options::escaped {text {most ""} {kept ""}} {
  if {$most ne "" && [string length $text] > $most} {
    set text [string range $text 0 $most-1]...
  }
  if {![regexp {[[:cntrl:]]} $text]} {
    return $text
  }
  return [join [lmap letter [split $text ""] {
    set code [scan $letter %c]
    expr {![string is control $letter] || $letter eq $kept ? $letter :
      [format [expr {$code < 256 ? "\\x%02x" : "\\u%04x"}] $code]}
  }] ""]
}

# "; did you mean X?" for the name that is nearest to a mistyped one, or "" when none is near.
proc ::vorkel::options::nearest {name names} {
  variable most_shown
  if {[string length $name] > $most_shown} {
    return ""
  }
  set best ""
  # One slip, or two in a long name.
  set least [expr {[string length $name] > 8 ? 3 : [string length $name] > 2 ? 2 : 0}]
  foreach candidate $names {
    set distance [Distance $name $candidate]
    if {$distance < $least} {
      set least $distance
      set best $candidate
    }
  }
  return [expr {$best eq "" ? "" : "; did you mean $best?"}]
}

# How many letters must be changed, added, left out or swapped with the next to make one word of
# the other.
proc ::vorkel::options::Distance {one other} {
  set row {}
  for {set i 0} {$i <= [string length $other]} {incr i} {
    lappend row $i
  }
  set above {}
  set last ""
  foreach letter [split $one ""] {
    set next [list [expr {[lindex $row 0] + 1}]]
    for {set i 0} {$i < [string length $other]} {incr i} {
      set against [string index $other $i]
      set cost [expr {min([lindex $row $i] + ($letter ne $against),
        [lindex $row $i+1] + 1, [lindex $next $i] + 1)}]
      if {$i > 0 && $last eq $against && $letter eq [string index $other $i-1]} {
        set cost [expr {min($cost, [lindex $above $i-1] + 1)}]
      }
      lappend next $cost
    }
    set above $row
    set row $next
    set last $letter
  }
  return [lindex $row end]
}
