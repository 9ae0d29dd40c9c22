# The report on an answer as text: the settings, tables of the outputs, of what they have with a
# second input clock, and of phases and duty cycles, what was asked for beside what comes out, and
# notes. Frequencies are those of the hardware, worked out from the settings. On a PLL or a TSYN the
# engine accepts an M and a D whose ratio misses its VCO by a small remainder, so its own figures
# can lie beside them; they are shown where they do.

package provide vorkel::report 1.1
package require vorkel::cells 1.1
package require vorkel::engine 1.1
package require vorkel::kru_report 1.1
package require vorkel::notes 1.1
package require vorkel::numbers 1.1
package require vorkel::table 1.1
package require vorkel::timing 1.1

namespace eval ::vorkel::report {
  # Decimals of a frequency in MHz: down to 1 Hz.
  variable decimals 6
  # What each table shows, and so marks.
  variable frequency_errors {ppm range}
  variable second_errors range2
  variable shape_errors {phaseError dutyError}
}

# The report on an answer that is solved (see answer.tcl), as text.
proc ::vorkel::report::render {answer} {
  set family [::vorkel::engine::family [dict get $answer primitive]]
  if {$family eq "Kru"} {
    set pairs [::vorkel::kru_report::summary $answer]
  } else {
    set pairs [Summary $answer]
  }
  set error [dict get $answer phaseError]
  if {$error ne ""} {
    lappend pairs {phase error} "[::vorkel::numbers::ps $error] ps"
  }
  set text [::vorkel::table::pairs $pairs]\n[Outputs $answer]
  set second [Second $answer]
  if {$second ne ""} {
    append text \n$second
  }
  set shapes [Shapes $answer]
  if {$shapes ne ""} {
    append text \n$shapes
  }
  return $text[::vorkel::notes::text [::vorkel::notes::all $answer]]
}

# The labels and values above the table for a PLL or a TSYN.
proc ::vorkel::report::Summary {answer} {
  set request [dict get $answer request]
  set m [dict get $answer settings M]
  set d [dict get $answer settings D]
  set inputs [lmap input [dict get $request inputs] {expr {double($input)}}]
  set vcos [lmap input $inputs {expr {$input * $m / $d}}]
  set vco [Both $vcos]
  set counted [dict get $answer searchVco]
  # With two input clocks there is no room for it; notes.tcl says it then.
  if {[llength $inputs] == 1 && [::vorkel::notes::isVcoOff $answer]} {
    append vco " (the search took it as $counted)"
  }
  set pairs [list \
    device "[dict get $request device] [dict get $answer primitive]" \
    input [Both $inputs] VCO $vco PFD [Both [lmap input $inputs {expr {$input / $d}}]] \
    M [::vorkel::numbers::short $m 3] D $d]
  if {[::vorkel::timing::isKnown [dict get $answer timing]]} {
    lappend pairs bandwidth [dict get $answer bandwidth] \
      {input jitter} "[::vorkel::numbers::short [dict get $answer inputJitter] 6] ps"
  }
  return $pairs
}

# One frequency, or that of each input clock.
proc ::vorkel::report::Both {frequencies} {
  variable decimals
  set texts [lmap frequency $frequencies {
    string cat [::vorkel::numbers::short $frequency $decimals] " MHz"
  }]
  if {[llength $texts] == 1} {
    return [lindex $texts 0]
  }
  return "[lindex $texts 0], with the second input [lindex $texts 1]"
}

# The table of the outputs. The jitter has a column when it is known, and so have marks when
# there are any.
proc ::vorkel::report::Outputs {answer} {
  variable decimals
  variable frequency_errors
  set outputs [dict get $answer outputs]
  set kru [expr {[::vorkel::engine::family [dict get $answer primitive]] eq "Kru"}]
  set known [::vorkel::timing::isKnown [dict get $answer timing]]
  set marks [HasMarks $outputs $frequency_errors]
  set columns {{right output}}
  lappend columns [expr {$kru ? {left pin} : {right divider}}] {right {requested MHz}} \
    {right {actual MHz}} {right {error ppm}}
  if {$known} {
    lappend columns {right {jitter ps}}
  }
  if {$marks} {
    lappend columns {left mark}
  }
  set rows {}
  foreach output $outputs {
    set row [list [dict get $output index] [Place $output] \
      [::vorkel::numbers::fixed [dict get $output requested] $decimals] \
      [::vorkel::numbers::fixed [dict get $output actual] $decimals] \
      [::vorkel::numbers::fixed [dict get $output ppm] 2]]
    if {$known} {
      lappend row [::vorkel::cells::ps [dict get $output jitter]]
    }
    if {$marks} {
      lappend row [Mark $output $frequency_errors]
    }
    lappend rows $row
  }
  return [::vorkel::table::render $columns $rows [Roles $outputs $frequency_errors]]
}

# The table of the frequencies with the second input clock; "" without one. One table with the
# above would be wider than a terminal.
proc ::vorkel::report::Second {answer} {
  variable decimals
  variable second_errors
  if {[llength [dict get $answer request inputs]] == 1} {
    return ""
  }
  set outputs [dict get $answer outputs]
  set columns {{right output} {right {MHz with the second input}}}
  set marks [HasMarks $outputs $second_errors]
  if {$marks} {
    lappend columns {left mark}
  }
  set rows [lmap output $outputs {
    set row [list [dict get $output index] \
      [::vorkel::numbers::fixed [dict get $output actual2] $decimals]]
    if {$marks} {
      lappend row [Mark $output $second_errors]
    }
    set row
  }]
  return [::vorkel::table::render $columns $rows [Roles $outputs $second_errors]]
}

# The pin of an output, or its divider.
proc ::vorkel::report::Place {output} {
  if {[dict get $output divider] eq ""} {
    return [dict get $output pin]
  }
  return [::vorkel::numbers::short [dict get $output divider] 3]
}

# The table of phases and duty cycles, each if it was asked for, or if an output has another one
# than is usual; "" without any. One table with the above would be wider than a terminal.
proc ::vorkel::report::Shapes {answer} {
  variable shape_errors
  set outputs [dict get $answer outputs]
  set phases [expr {[IsAsked $outputs reqPhase] || [IsOther $outputs phase 0.0]}]
  set duties [expr {[IsAsked $outputs reqDuty] || [IsOther $outputs duty 50.0]}]
  if {!$phases && !$duties} {
    return ""
  }
  set columns {{right output}}
  if {$phases} {
    lappend columns {right {phase deg}} {right {actual deg}} {right {error deg}}
  }
  if {$duties} {
    lappend columns {right {duty %}} {right {actual %}} {right {error points}}
  }
  set marks [HasMarks $outputs $shape_errors]
  if {$marks} {
    lappend columns {left mark}
  }
  set rows {}
  foreach output $outputs {
    set row [list [dict get $output index]]
    if {$phases} {
      lappend row {*}[Asked $output reqPhase phase phaseError]
    }
    if {$duties} {
      lappend row {*}[Asked $output reqDuty duty dutyError]
    }
    if {$marks} {
      lappend row [Mark $output $shape_errors]
    }
    lappend rows $row
  }
  return [::vorkel::table::render $columns $rows [Roles $outputs $shape_errors]]
}

proc ::vorkel::report::IsAsked {outputs key} {
  foreach output $outputs {
    if {[dict get $output $key] ne ""} {
      return 1
    }
  }
  return 0
}

proc ::vorkel::report::IsOther {outputs key usual} {
  foreach output $outputs {
    if {[dict get $output $key] != $usual} {
      return 1
    }
  }
  return 0
}

# What was asked for, what comes out, and the difference; "-" where nothing was asked for.
proc ::vorkel::report::Asked {output requested actual error} {
  return [lmap key [list $requested $actual $error] {
    Cell [dict get $output $key]
  }]
}

# A phase or a duty cycle in a table, "-" for none.
proc ::vorkel::report::Cell {value} {
  if {$value eq ""} {
    return -
  }
  return [::vorkel::numbers::fixed $value 3]
}

# The mark of an output with one of some keys among its `offs`.
proc ::vorkel::report::Mark {output errors} {
  foreach key $errors {
    if {$key in [dict get $output offs]} {
      return OFF
    }
  }
  return ""
}

proc ::vorkel::report::HasMarks {outputs errors} {
  foreach output $outputs {
    if {[Mark $output $errors] ne ""} {
      return 1
    }
  }
  return 0
}

proc ::vorkel::report::Roles {outputs errors} {
  return [lmap output $outputs {expr {[Mark $output $errors] eq "" ? "" : "off"}}]
}
