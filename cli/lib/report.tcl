# The report on a configuration of a PLL or a TSYN. Its frequencies are those of the hardware,
# worked out from the chosen M, D and dividers. The engine accepts an M and a D whose ratio
# misses its VCO by a small remainder, so its own figures can lie beside them; they are shown
# where they do.

package provide vorkel::report 1.1
package require vorkel::notes 1.1
package require vorkel::numbers 1.1
package require vorkel::table 1.1
package require vorkel::timing 1.1

namespace eval ::vorkel::report {
  # Decimals of a frequency in MHz: down to 1 Hz.
  variable decimals 6
  # The engine prints 3 decimals. What differs by no more than their rounding agrees.
  variable visible 0.0006
  variable frequency_columns {{right {requested MHz}} {right {actual MHz}} {right {error ppm}}}
}

# The report on the solution (see engine.tcl) of a request (see request.tcl) with its timing
# (see timing.tcl), as text.
proc ::vorkel::report::render {request solution timing} {
  set clocks [Clocks $request $solution]
  set text [Summary $request $solution $clocks $timing]\n
  append text [Outputs $request $solution $clocks $timing]
  if {[dict get $request closest]} {
    append text \n [Shapes $request $solution]
  }
  append text [::vorkel::notes::text [::vorkel::notes::on $request $clocks $timing]]
  return $text
}

# The frequencies in MHz that the hardware will have: the lists vcos and pfds, one for each
# input clock, and outputs, for each a dict of divider and frequency (with the first input).
proc ::vorkel::report::Clocks {request solution} {
  set m [dict get $solution m]
  set d [dict get $solution d]
  set clocks [dict create vcos {} pfds {} outputs {}]
  foreach input [dict get $request inputs] {
    scan $input %f input
    dict lappend clocks vcos [expr {$input * $m / $d}]
    dict lappend clocks pfds [expr {$input / $d}]
  }
  set vco [lindex [dict get $clocks vcos] 0]
  foreach output [dict get $solution outputs] {
    set divider [dict get $output divider]
    dict lappend clocks outputs \
      [dict create divider $divider frequency [expr {$vco / $divider}]]
  }
  return $clocks
}

# The lines above the table.
proc ::vorkel::report::Summary {request solution clocks timing} {
  set vco [Both [dict get $clocks vcos]]
  set counted [dict get $solution vco]
  if {[Differs $counted [lindex [dict get $clocks vcos] 0]]} {
    append vco " (the search took it as $counted)"
  }
  set inputs [lmap input [dict get $request inputs] {scan $input %f}]
  set pairs [list \
    device "[dict get $request part] [dict get $request primitive]" \
    input [Both $inputs] \
    VCO $vco \
    PFD [Both [dict get $clocks pfds]] \
    M [::vorkel::numbers::short [dict get $solution m] 3] \
    D [dict get $solution d]]
  if {[::vorkel::timing::isKnown $timing]} {
    lappend pairs bandwidth [dict get $request bandwidth] \
      {input jitter} "[::vorkel::numbers::short [scan [dict get $request inputJitter] %f] 3] ps"
  }
  lappend pairs {*}[phaseError $timing]
  return [::vorkel::table::pairs $pairs]
}

# The label and the value of the phase error, if there is one.
proc ::vorkel::report::phaseError {timing} {
  set error [dict get $timing phaseError]
  if {$error eq ""} {
    return {}
  }
  return [list {phase error} "$error ps"]
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

# The table of the outputs. The engine's own frequencies have a column when one of them can be
# seen to differ, and the jitter has one when it is known.
proc ::vorkel::report::Outputs {request solution clocks timing} {
  variable frequency_columns
  set search 0
  foreach output [dict get $solution outputs] clock [dict get $clocks outputs] {
    if {[Differs [dict get $output frequency] [dict get $clock frequency]]} {
      set search 1
    }
  }
  set columns {{right output} {right divider}}
  lappend columns {*}$frequency_columns
  if {$search} {
    lappend columns {right {search MHz}}
  }
  lappend columns {*}[jitterColumn $timing]

  set rows {}
  foreach output [dict get $solution outputs] clock [dict get $clocks outputs] \
      asked [dict get $request outputs] jitter [dict get $timing jitters] {
    set row [list [llength $rows] [::vorkel::numbers::short [dict get $output divider] 3] \
      {*}[frequencyCells $asked [dict get $clock frequency]]]
    if {$search} {
      lappend row [dict get $output frequency]
    }
    lappend rows [list {*}$row {*}[jitterCell $timing $jitter]]
  }
  return [::vorkel::table::render $columns $rows]
}

# A requested and an actual frequency, MHz, and the error, for the columns frequency_columns.
proc ::vorkel::report::frequencyCells {requested actual} {
  variable decimals
  scan $requested %f requested
  return [list [::vorkel::numbers::fixed $requested $decimals] \
    [::vorkel::numbers::fixed $actual $decimals] \
    [::vorkel::numbers::fixed [expr {($actual - $requested) / $requested * 1e6}] 2]]
}

# The column of the jitter, if that of some output is known, and an entry of it.
proc ::vorkel::report::jitterColumn {timing} {
  if {[::vorkel::timing::isKnown $timing]} {
    return {{right {jitter ps}}}
  }
  return {}
}

proc ::vorkel::report::jitterCell {timing jitter} {
  if {[::vorkel::timing::isKnown $timing]} {
    return [expr {$jitter eq "" ? "-" : $jitter}]
  }
  return {}
}

# The table of phases and duty cycles, each if it was asked for. One table with the above would
# be wider than a terminal.
proc ::vorkel::report::Shapes {request solution} {
  set columns {{right output}}
  if {[dict get $request phaseAsked]} {
    lappend columns {right {phase deg}} {right {actual deg}}
  }
  if {[dict get $request dutyAsked]} {
    lappend columns {right {duty %}} {right {actual %}}
  }
  set rows {}
  foreach output [dict get $solution outputs] phase [dict get $request phases] \
      duty [dict get $request duties] {
    set row [llength $rows]
    if {[dict get $request phaseAsked]} {
      lappend row [phase $phase] [phase [dict get $output phase]]
    }
    if {[dict get $request dutyAsked]} {
      lappend row {*}[Duty [scan $duty %f] [dict get $output duty]]
    }
    lappend rows $row
  }
  return [::vorkel::table::render $columns $rows]
}

# Whether the engine's figure (3 decimals) can be seen to differ from a frequency.
proc ::vorkel::report::Differs {figure frequency} {
  variable visible
  return [expr {abs($figure - $frequency) > $visible}]
}

# A phase in degrees.
proc ::vorkel::report::phase {degrees} {
  return [::vorkel::numbers::fixed [scan $degrees %f] 3]
}

# Requested (percent) and actual (a fraction) duty cycle; nothing is worked out for 0.
proc ::vorkel::report::Duty {asked actual} {
  if {$asked == 0} {
    return {- -}
  }
  return [list [::vorkel::numbers::fixed $asked 1] \
    [::vorkel::numbers::fixed [expr {$actual * 100}] 1]]
}
