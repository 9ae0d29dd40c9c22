# The report on a configuration of a KRU_SP or a KRU_CLKGEN. Its frequencies are those of the
# hardware, worked out from pins, M, D and the divide: the engine has none for a CLKFXDV.

package provide vorkel::kru_report 1.1
package require vorkel::kru_notes 1.1
package require vorkel::numbers 1.1
package require vorkel::report 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::kru_report {
  # The number of steps of PHASE_SHIFT in 360 degrees.
  variable phase_steps 255
}

# The report on the solution (see engine.tcl) of a request (see request.tcl) with its timing
# (see timing.tcl), as text.
proc ::vorkel::kru_report::render {request solution timing} {
  set frequencies [Frequencies $request $solution]
  set text [Summary $request $solution $timing]\n
  append text [Outputs $request $solution $frequencies $timing]
  append text [::vorkel::notes::text \
    [::vorkel::kru_notes::on $request $solution $frequencies $timing]]
  return $text
}

# The frequency of each output, MHz.
proc ::vorkel::kru_report::Frequencies {request solution} {
  scan [dict get $request inputs] %f line
  if {[dict exists $solution divideBy2] && [dict get $solution divideBy2]} {
    set line [expr {$line * 0.5}]
  }
  set m [dict get $solution m]
  set d [dict get $solution d]
  set divide [dict get $solution divide]
  return [lmap pin [dict get $solution pins] {
    switch -- $pin {
      CLK0 - CLK90 - CLK180 - CLK270 { set line }
      CLK2X - CLK2X180 { expr {$line * 2.0} }
      CLKDV { expr {$line / $divide} }
      CLKFX - CLKFX180 { expr {$line * $m / $d} }
      CLKFXDV { expr {$line * $m / ($divide * $d)} }
      default { error "the engine has chosen the pin \"$pin\"" }
    }
  }]
}

# The lines above the table. Settings of what no output uses are left out.
proc ::vorkel::kru_report::Summary {request solution timing} {
  scan [dict get $request inputs] %f input
  set pins [dict get $solution pins]
  set pairs [list \
    device "[dict get $request part] [dict get $request primitive]" \
    input "[::vorkel::numbers::short $input $::vorkel::report::decimals] MHz"]
  if {[dict exists $solution divideBy2]} {
    lappend pairs CLKIN_DIVIDE_BY_2 [dict get $solution divideBy2]
  }
  if {[lsearch -glob $pins CLKFX*] >= 0} {
    lappend pairs M [dict get $solution m] D [dict get $solution d]
  }
  foreach pin {CLKDV CLKFXDV} {
    if {$pin in $pins} {
      lappend pairs $pin [::vorkel::numbers::short [dict get $solution divide] 1]
    }
  }
  lappend pairs {*}[PhaseOffset $solution] {*}[::vorkel::report::phaseError $timing]
  return [::vorkel::table::pairs $pairs]
}

# The phase that all outputs of a KRU_SP share, with PHASE_SHIFT and what it makes of it.
proc ::vorkel::kru_report::PhaseOffset {solution} {
  variable phase_steps
  if {![dict exists $solution phaseShift]} {
    return {}
  }
  set shift [dict get $solution phaseShift]
  set text $shift
  if {$shift != 0} {
    append text " ([::vorkel::numbers::short [expr {$shift * 360.0 / $phase_steps}] 3] degrees)"
  }
  set offset [::vorkel::numbers::short [dict get $solution phaseOffset] 3]
  return [list {phase offset} "$offset degrees" PHASE_SHIFT $text]
}

# The table of the outputs.
proc ::vorkel::kru_report::Outputs {request solution frequencies timing} {
  set columns {{right output} {left pin}}
  lappend columns {*}$::vorkel::report::frequency_columns {right {phase deg}} \
    {*}[::vorkel::report::jitterColumn $timing]
  set rows {}
  foreach pin [dict get $solution pins] asked [dict get $request outputs] \
      frequency $frequencies phase [dict get $request phases] \
      jitter [dict get $timing jitters] {
    lappend rows [list [llength $rows] $pin \
      {*}[::vorkel::report::frequencyCells $asked $frequency] \
      [::vorkel::report::phase $phase] {*}[::vorkel::report::jitterCell $timing $jitter]]
  }
  return [::vorkel::table::render $columns $rows]
}
