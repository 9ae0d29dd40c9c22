# Whether a request works when two of its outputs change places: not all outputs of a primitive
# have the same range and the same dividers, and the engine begins with output 0.

package provide vorkel::explain_swap 1.1
package require vorkel::explain_calls 1.1
package require vorkel::explain_nearest 1.1
package require vorkel::explain_text 1.1
package require vorkel::options 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::explain_swap {
  namespace path ::vorkel::explain_text
  # The last output that is another one than those behind it: output 1 of a PLL can be faster.
  variable last_other 1
}

# A paragraph on the swaps that work, "" when there are none. `answers` are the engine's, the best
# first.
proc ::vorkel::explain_swap::advice {call answers} {
  set request [dict get $call request]
  if {[dict get [lindex $answers 0] within]} {
    return ""
  }
  set told [dict create]
  foreach primitive [dict get $call primitives] {
    set pair [Working $request $primitive]
    if {$pair ne ""} {
      dict lappend told $pair [::vorkel::explain_calls::told \
        [::vorkel::explain_calls::label [Swapped $request $pair] $primitive]]
    }
  }
  set text ""
  dict for {pair whom} $told {
    set outputs [dict get [Swapped $request $pair] outputs]
    append text \n [::vorkel::table::prose "" "Outputs [join $pair { and }] swapped work on\
      [::vorkel::options::enumerate $whom]: not every output has the same range and dividers."] \
      "hint: swapped: [::vorkel::explain_calls::command plan $call $outputs [lmap output $outputs {
        plainMHz [dict get $output freq]
      }]]\n"
  }
  return $text
}

# The first two outputs of a primitive that are to be swapped, or "".
proc ::vorkel::explain_swap::Working {request primitive} {
  variable last_other
  set count [llength [dict get $request outputs]]
  for {set one 0} {$one <= $last_other} {incr one} {
    for {set other [expr {$one + 1}]} {$other < $count} {incr other} {
      set swapped [Swapped $request [list $one $other]]
      if {[::vorkel::explain_nearest::isSpent]} {
        return ""
      }
      if {$swapped ne $request && [::vorkel::explain_nearest::couldMake $swapped $primitive] &&
          [::vorkel::explain_nearest::proof $swapped $primitive] ne ""} {
        return [list $one $other]
      }
    }
  }
  return ""
}

proc ::vorkel::explain_swap::Swapped {request pair} {
  lassign $pair one other
  set outputs [dict get $request outputs]
  set first [lindex $outputs $one]
  lset outputs $one [lindex $outputs $other]
  lset outputs $other $first
  return [dict replace $request outputs $outputs]
}
