# What a row of a table of answers says of one, and how such a table is coloured.

package provide vorkel::cells 1.1
package require vorkel::colour 1.1
package require vorkel::numbers 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::cells {}

# A text, "-" for none.
proc ::vorkel::cells::dash {text} {
  if {$text eq ""} {
    return -
  }
  return $text
}

# The VCO, MHz; "-" where there is none.
proc ::vorkel::cells::vco {answer} {
  if {![dict exists $answer settings VCO]} {
    return -
  }
  return [format %.6g [dict get $answer settings VCO]]
}

# The largest error of a frequency, in at most nine characters.
proc ::vorkel::cells::ppm {answer} {
  set ppm [dict get $answer worstPpm]
  if {$ppm >= 1e6} {
    return [format %.3g $ppm]
  }
  return [::vorkel::numbers::fixed $ppm 2]
}

# A jitter, ps; "-" where it is not known.
proc ::vorkel::cells::ps {value} {
  # An expression would make another number of "126.030".
  if {$value eq ""} {
    return -
  }
  return [::vorkel::numbers::ps $value]
}

# The largest jitter, ps; "-" where it is not known.
proc ::vorkel::cells::jitter {answer} {
  return [ps [dict get $answer maxJitter]]
}

# The mark of an answer that is not as asked for.
proc ::vorkel::cells::mark {answer} {
  return [expr {[dict get $answer within] ? "" : "OFF"}]
}

# A table of some answers, of which the first is the best: its row is coloured when it is as asked
# for. Of the others only the marks, which are last in their rows, are: to be off can be a fair
# price for something else.
proc ::vorkel::cells::render {columns rows answers} {
  set roles [list [expr {[dict get [lindex $answers 0] within] ? "good" : ""}]]
  set lines [split [::vorkel::table::render $columns $rows $roles] \n]
  return [join [lmap line $lines {
    if {[regexp {^(.* )((?:winner, but )?OFF)$} $line -> rest mark]} {
      set line $rest[::vorkel::colour::paint off $mark]
    }
    set line
  }] \n]
}
