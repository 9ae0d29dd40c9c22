# The report on a configuration. Its frequencies are those of the hardware, worked out from
# the chosen M, D and dividers. The engine accepts an M and a D whose ratio misses its VCO by
# a small remainder, so its own figures can lie beside them; they are shown where they do.

package provide vorkel::report 1.1
package require vorkel::notes 1.1
package require vorkel::numbers 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::report {
  # Decimals of a frequency in MHz: down to 1 Hz.
  variable decimals 6
  # The engine prints 3 decimals. What differs by no more than their rounding agrees.
  variable visible 0.0006
}

# The report on the solution (see engine.tcl) of a request (see request.tcl), as text.
proc ::vorkel::report::render {request solution} {
  set clocks [Clocks $request $solution]
  set text [Summary $request $solution $clocks]\n
  append text [Outputs $request $solution $clocks]
  set notes [::vorkel::notes::on $request $clocks]
  if {[llength $notes] > 0} {
    append text \n
  }
  foreach note $notes {
    append text "note: $note\n"
  }
  return $text
}

# The frequencies in MHz that the hardware will have: the lists vcos and pfds, one for each
# input clock, and outputs, for each a dict of divider, frequency (with the first input) and
# error (ppm of the requested frequency).
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
  foreach output [dict get $solution outputs] requested [dict get $request outputs] {
    scan $requested %f requested
    set divider [dict get $output divider]
    set frequency [expr {$vco / $divider}]
    dict lappend clocks outputs [dict create divider $divider frequency $frequency \
      error [expr {($frequency - $requested) / $requested * 1e6}]]
  }
  return $clocks
}

# The lines above the table.
proc ::vorkel::report::Summary {request solution clocks} {
  set vco [Both [dict get $clocks vcos]]
  set counted [dict get $solution vco]
  if {[Differs $counted [lindex [dict get $clocks vcos] 0]]} {
    append vco " (the search took it as $counted)"
  }
  set inputs [lmap input [dict get $request inputs] {scan $input %f}]
  set lines {}
  foreach {name value} [list \
    device "[dict get $request part] [dict get $request primitive]" \
    input [Both $inputs] \
    VCO $vco \
    PFD [Both [dict get $clocks pfds]] \
    M [::vorkel::numbers::short [dict get $solution m] 3] \
    D [dict get $solution d]] {
    lappend lines [format "%-8s%s" $name $value]
  }
  return "[join $lines \n]\n"
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

# The table of the outputs. Phases and duty cycles have columns when they were asked for, and
# the engine's own frequency when one of them can be seen to differ.
proc ::vorkel::report::Outputs {request solution clocks} {
  variable decimals
  set search 0
  foreach output [dict get $solution outputs] clock [dict get $clocks outputs] {
    if {[Differs [dict get $output frequency] [dict get $clock frequency]]} {
      set search 1
    }
  }
  set columns {{right output} {right divider} {right {requested MHz}} {right {actual MHz}}
    {right {error ppm}}}
  if {$search} {
    lappend columns {right {search MHz}}
  }
  if {[dict get $request phaseAsked]} {
    lappend columns {right {phase deg}} {right {actual deg}}
  }
  if {[dict get $request dutyAsked]} {
    lappend columns {right {duty %}} {right {actual %}}
  }

  set rows {}
  set n 0
  foreach output [dict get $solution outputs] clock [dict get $clocks outputs] \
      asked [dict get $request outputs] phase [dict get $request phases] \
      duty [dict get $request duties] {
    set row [list $n [::vorkel::numbers::short [dict get $output divider] 3] \
      [::vorkel::numbers::fixed [scan $asked %f] $decimals] \
      [::vorkel::numbers::fixed [dict get $clock frequency] $decimals] \
      [::vorkel::numbers::fixed [dict get $clock error] 2]]
    if {$search} {
      lappend row [dict get $output frequency]
    }
    if {[dict get $request phaseAsked]} {
      lappend row [Phase [scan $phase %f]] [Phase [dict get $output phase]]
    }
    if {[dict get $request dutyAsked]} {
      lappend row {*}[Duty [scan $duty %f] [dict get $output duty]]
    }
    lappend rows $row
    incr n
  }
  return [::vorkel::table::render $columns $rows]
}

# Whether the engine's figure (3 decimals) can be seen to differ from a frequency.
proc ::vorkel::report::Differs {figure frequency} {
  variable visible
  return [expr {abs($figure - $frequency) > $visible}]
}

proc ::vorkel::report::Phase {degrees} {
  return [::vorkel::numbers::fixed $degrees 3]
}

# Requested (percent) and actual (a fraction) duty cycle; nothing is worked out for 0.
proc ::vorkel::report::Duty {asked actual} {
  if {$asked == 0} {
    return {- -}
  }
  return [list [::vorkel::numbers::fixed $asked 1] \
    [::vorkel::numbers::fixed [expr {$actual * 100}] 1]]
}
