# The settings of a KRU_SP or a KRU_CLKGEN in the report on an answer.

package provide vorkel::kru_report 1.1
package require vorkel::actual 1.1
package require vorkel::numbers 1.1
package require vorkel::report 1.1

namespace eval ::vorkel::kru_report {}

# The labels and values above the table (see report.tcl). Settings of what no output uses are
# left out.
proc ::vorkel::kru_report::summary {answer} {
  set request [dict get $answer request]
  set input [lindex [dict get $request inputs] 0]
  set settings [dict get $answer settings]
  set pairs [list \
    device "[dict get $request device] [dict get $answer primitive]" \
    input "[::vorkel::numbers::short $input $::vorkel::report::decimals] MHz"]
  foreach name {CLKIN_DIVIDE_BY_2 M D} {
    if {[dict exists $settings $name]} {
      lappend pairs $name [dict get $settings $name]
    }
  }
  foreach name {CLKDV CLKFXDV} {
    if {[dict exists $settings $name]} {
      lappend pairs $name [::vorkel::numbers::short [dict get $settings $name] 1]
    }
  }
  if {[dict exists $settings PHASE_SHIFT]} {
    set offset [::vorkel::numbers::short [dict get $settings {phase offset}] 3]
    lappend pairs {phase offset} "$offset degrees" \
      PHASE_SHIFT [Shift [dict get $settings PHASE_SHIFT]]
  }
  return $pairs
}

# PHASE_SHIFT, and the phase that it makes.
proc ::vorkel::kru_report::Shift {shift} {
  if {$shift == 0} {
    return $shift
  }
  set degrees [expr {$shift * 360.0 / $::vorkel::actual::shift_steps}]
  return "$shift ([::vorkel::numbers::short $degrees 3] degrees)"
}
