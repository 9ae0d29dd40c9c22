# What plan, explain and best say of settings that stand on the grid (see grid.tcl) and that the
# engine's search does not find.

package provide vorkel::grid_words 1.1
package require vorkel::cells 1.1
package require vorkel::grid 1.1
package require vorkel::help 1.1
package require vorkel::numbers 1.1
package require vorkel::options 1.1

namespace eval ::vorkel::grid_words {
  namespace path ::vorkel::cells
  # ps. Jitters that differ by less read the same.
  variable visible 0.0005
}

# The settings of an answer of a PLL or a TSYN in one line.
proc ::vorkel::grid_words::settings {answer} {
  set dividers [lmap output [dict get $answer outputs] {
    ::vorkel::numbers::short [dict get $output divider] 3
  }]
  set noun [expr {[llength $dividers] > 1 ? "dividers" : "divider"}]
  return "M [::vorkel::numbers::short [dict get $answer settings M] 3], D\
    [dict get $answer settings D] and $noun [::vorkel::options::enumerate $dividers]"
}

# How far an answer is off, and its jitter where it is known.
proc ::vorkel::grid_words::figures {answer} {
  set text "[ppm $answer] ppm"
  if {[dict get $answer maxJitter] ne ""} {
    append text " with [jitter $answer] ps of jitter"
  }
  return $text
}

# Those settings that are within all tolerances and rank before an answer: the nearest ones and
# those with the least jitter, as answers, none to two. `front` is what grid.tcl has as trade-offs.
proc ::vorkel::grid_words::better {request front answer} {
  variable visible
  set calmest [::vorkel::grid::calmest $request $front]
  if {$calmest < 0} {
    return {}
  }
  set reached Inf
  if {[dict get $answer within] && [dict get $answer maxJitter] ne ""} {
    set reached [dict get $answer maxJitter]
  }
  return [lmap place [lsort -integer -unique [list 0 $calmest]] {
    set made [::vorkel::grid::answer $request [lindex $front $place]]
    # An error as small as the rounding of the arithmetic is none here and may be one there.
    if {![dict get $made within]} continue
    set jitter [dict get $made maxJitter]
    if {[dict get $answer within] && ($jitter eq "" || $jitter > $reached - $visible)} continue
    set made
  }]
}

# A call of best that shows all trade-offs up to the one with the least jitter within all
# tolerances.
proc ::vorkel::grid_words::command {request front words} {
  set needed [expr {[::vorkel::grid::calmest $request $front] + 1}]
  set call [::vorkel::help::command best $words]
  if {$needed > $::vorkel::grid::default_front} {
    append call " --front $needed"
  }
  return $call
}
