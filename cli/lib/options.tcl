# Options of a command, as words: `--name value`, `--name=value`, or `--name` for a flag.

package provide vorkel::options 1.1

namespace eval ::vorkel::options {}

# Reads the words of a command. `table` has three entries for each option: its name with the
# dashes, the placeholder of its value ("" for a flag), and a description.
# Answers a dict from option names to values (1 for a flag), and the list of the other words
# under the key "operands". An unknown option, a value too few or too many, and an option
# that is given twice are wrong usage.
proc ::vorkel::options::parse {table words} {
  set placeholders [dict create]
  foreach {name placeholder description} $table {
    dict set placeholders $name $placeholder
  }
  set given [dict create operands {}]
  while {[llength $words] > 0} {
    set words [lassign $words word]
    if {[string index $word 0] ne "-"} {
      dict lappend given operands $word
      continue
    }
    set inline [regexp {^(--[^=]*)=(.*)$} $word -> name value]
    if {!$inline} {
      set name $word
    }
    if {![dict exists $placeholders $name]} {
      throw {VORKEL USAGE} "unknown option $name"
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

# The value of an option, or `default` when it was not given.
proc ::vorkel::options::get {given name default} {
  if {[dict exists $given $name]} {
    return [dict get $given $name]
  }
  return $default
}
