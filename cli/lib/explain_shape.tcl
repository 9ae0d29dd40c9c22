# Why no VCO that makes an output of a PLL or a TSYN gives it its phase or its duty cycle. The pairs
# of M and D are those that serve its frequency.

package provide vorkel::explain_shape 1.1
package require vorkel::actual 1.1
package require vorkel::answer 1.1
package require vorkel::explain_text 1.1
package require vorkel::numbers 1.1
package require vorkel::options 1.1

namespace eval ::vorkel::explain_shape {
  namespace path ::vorkel::explain_text
  # As many dividers are told one by one.
  variable most_named 4
}

# The dividers that make an output of the VCOs of pairs (see explain_vcos.tcl), sorted.
proc ::vorkel::explain_shape::Dividers {output pairs} {
  return [lsort -integer -unique [lmap pair $pairs {
    expr {round([lindex $pair 0] / [dict get $output freq])}
  }]]
}

# Text for a list of dividers: all of them, or the ends.
proc ::vorkel::explain_shape::Named {dividers} {
  variable most_named
  if {[llength $dividers] > $most_named} {
    return "[lindex $dividers 0] to [lindex $dividers end]"
  }
  return [::vorkel::options::enumerate $dividers or]
}

# The finding that no divider that makes the frequency has a step at the phase.
proc ::vorkel::explain_shape::phase {output index pairs} {
  set dividers [Dividers $output $pairs]
  set phase [dict get $output phase]
  set best ""
  foreach divider $dividers {
    set step [expr {$::vorkel::actual::phase_step / $divider}]
    set made [::vorkel::actual::phaseOnStep $phase $divider]
    set error [expr {abs([::vorkel::actual::phaseDifference $made $phase])}]
    if {$best eq "" || $error < [lindex $best 0]} {
      set best [list $error $made $divider $step]
    }
  }
  lassign $best error made divider step
  return [finding "phase grid" $index "the phase moves in steps of\
    [number $::vorkel::actual::phase_step] degrees of the VCO, 45 / N behind a divider N.\
    [number [dict get $output freq]] MHz has a divider of [Named $dividers]; its step nearest to\
    [number $phase] degrees is [::vorkel::numbers::short $made 3], with N = $divider in steps of\
    [::vorkel::numbers::short $step 3], off by [::vorkel::numbers::short $error 3] with\
    $::vorkel::answer::phase_tolerance allowed"]
}

# The finding that no divider that makes the frequency has the duty cycle: its counters are too
# short, or it has no step there.
proc ::vorkel::explain_shape::duty {request output index pairs} {
  set dividers [Dividers $output $pairs]
  set duty [dict get $output duty]
  set most [dict get $request limits O_MAX_HT_LT]
  set best ""
  foreach divider $dividers {
    set made [::vorkel::actual::dutyOnStep $duty $divider $most]
    # What counters without an end would do.
    set free [::vorkel::actual::dutyOnStep $duty $divider $divider]
    set row [list [expr {abs($made - $duty)}] $made $divider \
      [::vorkel::answer::isAllowed dutyError [expr {$free - $duty}]]]
    if {$best eq "" || [lindex $row 0] < [lindex $best 0]} {
      set best $row
    }
    lappend counted [lindex $row 3]
  }
  lassign $best error made divider
  set near "the nearest is [::vorkel::numbers::short $made 3] %, with N = $divider"
  set head "[number [dict get $output freq]] MHz has a divider N of [Named $dividers]"
  if {1 in $counted} {
    set low [expr {100.0 * max(1, $divider - $most) / $divider}]
    set high [expr {100.0 * min($divider - 0.5, $most + 0.5) / $divider}]
    return [finding "high and low count" $index "$head, which holds its output high or low for at\
      most $most VCO periods: with N = $divider that is a duty cycle of\
      [::vorkel::numbers::short $low 3] to [::vorkel::numbers::short $high 3] %, not\
      [number $duty] %; $near"]
  }
  return [finding "duty grid" $index "$head and counts its high time in half VCO periods, at least\
    one whole, so that [number $duty] % is none of its steps: $near, off by\
    [::vorkel::numbers::short $error 3] points with $::vorkel::answer::duty_tolerance allowed"]
}
