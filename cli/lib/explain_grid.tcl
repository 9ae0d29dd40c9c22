# What explain tells of the whole grid of settings of a PLL and a TSYN (see grid.tcl). The engine's
# search has only whole M and stops at the first settings that are near enough for it, so the grid
# can have settings for what the engine does not solve.

package provide vorkel::explain_grid 1.1
package require vorkel::answer 1.1
package require vorkel::engine 1.1
package require vorkel::explain_text 1.1
package require vorkel::explain_vcos 1.1
package require vorkel::grid 1.1
package require vorkel::grid_words 1.1

namespace eval ::vorkel::explain_grid {
  namespace path ::vorkel::explain_text
  # The kinds of findings that are due to the M and D there are.
  variable of_loop {{M and D} {outputs together}}
  # ppm. Errors that differ by less read the same.
  variable visible 0.005
}

# What the grid has of those of some primitives whose best answer of the engine, among `answers`, is
# not within all tolerances: what search of grid.tcl has, without those that have nothing.
proc ::vorkel::explain_grid::look {request primitives answers} {
  set missed [lmap primitive [::vorkel::engine::ofFamily Loop $primitives] {
    if {[::vorkel::answer::refusal $request $primitive] ne "" || [dict get \
        [lindex [::vorkel::answer::ofPrimitive $answers $primitive] 0] within]} continue
    set primitive
  }]
  return [dict filter [::vorkel::grid::search $request $missed] script {primitive points} {
    expr {[llength $points] > 0}
  }]
}

# The best of it as an answer, "" when there is none.
proc ::vorkel::explain_grid::winner {request found} {
  set front [::vorkel::grid::front $request $found]
  if {[llength $front] == 0} {
    return ""
  }
  return [::vorkel::grid::answer $request [lindex $front 0]]
}

# The findings for a PLL or a TSYN, for which the engine's search does not answer as asked for, with
# what the grid has. `found` is what look has.
proc ::vorkel::explain_grid::completed {request primitive findings found} {
  variable of_loop
  set best [winner $request [dict filter $found key $primitive]]
  if {$best ne "" && [dict get $best within]} {
    set whole [expr {[dict get $best settings M] == int([dict get $best settings M])}]
    set why [expr {$whole ? "it stops at the first settings that are near enough for it, and looks\
      for a VCO from output 0 on and in steps of its own" : "it has only whole M"}]
    return [list {*}$findings [finding "the engine" {} "the limits of the device allow\
      [::vorkel::grid_words::settings $best], [::vorkel::grid_words::figures $best], but the\
      engine's search does not find them: $why. best does"]]
  }
  if {$best eq "" || ![::vorkel::explain_vcos::isSearchWhole $request $primitive]} {
    return $findings
  }
  foreach finding $findings {
    if {[dict get $finding kind] in $of_loop} {
      return [list {*}$findings [finding "M in eighths" {} "these, which the engine's search does\
        not have and best searches, do not make all of it either: the nearest is\
        [far [dict get $best worstPpm] 0] off"]]
    }
  }
  return $findings
}

# A sentence on the best that the grid has when nothing makes all that is asked for; "" when it is
# no nearer than the engine's best answer.
proc ::vorkel::explain_grid::nearer {best answer} {
  variable visible
  if {$best eq ""} {
    return ""
  }
  if {[dict get $answer solved] && [llength [dict get $answer violations]] == 0 &&
      [dict get $best worstPpm] > [dict get $answer worstPpm] - $visible} {
    return ""
  }
  set shapes [lsearch -all -inline -not -exact [concat {*}[lmap output [dict get $best outputs] {
    dict get $output offs
  }]] ppm]
  return " Of all settings in the device's ranges, those of a [dict get $best primitive] that best\
    finds are [expr {[dict get $best worstPpm] == 0 ? "exact in frequency" :
    "nearest in frequency, at most [far [dict get $best worstPpm] 0] off"}][expr {
    [llength $shapes] > 0 ? ", but with phases or duty cycles that are off" : ""}]."
}

# The settings that make all of it, in a sentence behind "Possible".
proc ::vorkel::explain_grid::possible {best} {
  return "Possible, but the engine's search does not find it: a [dict get $best primitive] with\
    [::vorkel::grid_words::settings $best] makes all of it, within\
    [::vorkel::grid_words::figures $best]. best shows these settings."
}
