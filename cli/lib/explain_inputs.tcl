# What explain tells when the input clocks or the number of clocks are in the way, whatever the
# outputs are.

package provide vorkel::explain_inputs 1.1
package require vorkel::answer 1.1
package require vorkel::catalogue 1.1
package require vorkel::explain_calls 1.1
package require vorkel::explain_nearest 1.1
package require vorkel::explain_text 1.1
package require vorkel::explain_vcos 1.1
package require vorkel::numbers 1.1
package require vorkel::options 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::explain_inputs {
  namespace path ::vorkel::explain_text
  variable clocks "number of clocks"
  variable apart "inputs too far apart"
  # As many second input clocks of a primitive are tried.
  variable most_tried 12
}

# Whether one of these two is in the way of each primitive that does not do what is asked.
# `findings` is a dict from primitives to findings (see explain_text.tcl).
proc ::vorkel::explain_inputs::areInTheWay {findings} {
  variable clocks
  variable apart
  dict for {primitive found} $findings {
    set kinds [lmap finding $found {dict get $finding kind}]
    if {$clocks ni $kinds && $apart ni $kinds} {
      return 0
    }
  }
  return 1
}

# Whether only the number of clocks is in the way of all of them, which no other input clock helps.
proc ::vorkel::explain_inputs::isCountOnly {findings} {
  variable clocks
  set kinds [concat {*}[lmap found [dict values $findings] {
    lmap finding $found {dict get $finding kind}
  }]]
  return [expr {[lsort -unique $kinds] eq [list $clocks]}]
}

# Paragraphs on the input clocks that would do.
proc ::vorkel::explain_inputs::advice {request findings} {
  set inputs [dict get $request inputs]
  if {[llength $inputs] == 1} {
    return ""
  }
  set text ""
  foreach input $inputs {
    set able [lmap primitive [dict keys $findings] {
      set single [dict replace $request inputs [list $input]]
      if {[::vorkel::answer::refusal $single $primitive] ne "" ||
          [::vorkel::explain_nearest::proof $single $primitive] eq ""} continue
      ::vorkel::explain_calls::told [::vorkel::explain_calls::label $single $primitive]
    }]
    if {[llength $able] > 0} {
      append text [::vorkel::table::prose "" "[plainMHz $input] MHz as the only input clock works\
        on [::vorkel::options::enumerate $able]"]
    }
  }
  append text [Seconds $request $findings]
  return [expr {$text eq "" ? "" : "\n$text"}]
}

# Sentences on the nearest second input clock that is found to work.
proc ::vorkel::explain_inputs::Seconds {request findings} {
  variable apart
  lassign [dict get $request inputs] first second
  set text ""
  dict for {primitive found} $findings {
    if {$apart ni [lmap finding $found {dict get $finding kind}]} continue
    set near [Second $request $primitive]
    if {$near eq ""} continue
    set changed [dict replace $request inputs [list $first $near]]
    append text [::vorkel::table::prose "" "beside [plainMHz $first] MHz, a second input of $near\
      MHz works on [::vorkel::explain_calls::told [::vorkel::explain_calls::label $changed \
      $primitive]]; none nearer to [plainMHz $second] MHz was found"]
  }
  return $text
}

# The second input clock, MHz as text, that is nearest to the one that was asked for, of those with
# which VCO, PFD and outputs stay in their ranges, beside settings that serve all outputs with the
# first one; "" when the engine finds none of the nearest.
proc ::vorkel::explain_inputs::Second {request primitive} {
  variable most_tried
  lassign [dict get $request inputs] first second
  set single [dict replace $request inputs [list $first]]
  set rows {}
  foreach pair [Serving $single $primitive] {
    lassign [Bounds $single $primitive {*}$pair] lowest highest
    if {$lowest > $highest} continue
    set nearest [expr {min($highest, max($lowest, $second))}]
    # Not beyond the end by the rounding of its six decimals.
    set nearest [expr {$nearest < $second ? floor($nearest * 1e6 + 1e-3) / 1e6 :
      ceil($nearest * 1e6 - 1e-3) / 1e6}]
    lappend rows [list [expr {abs($nearest - $second)}] [::vorkel::numbers::short $nearest 6]]
  }
  foreach row [lrange [lsort -unique -real -index 0 $rows] 0 $most_tried-1] {
    if {[::vorkel::explain_nearest::isSpent]} break
    set near [lindex $row 1]
    if {[::vorkel::explain_nearest::proof [dict replace $request inputs [list $first $near]] \
        $primitive] ne ""} {
      return $near
    }
  }
  return ""
}

# The pairs of VCO, M and D that serve all outputs with one input clock.
proc ::vorkel::explain_inputs::Serving {request primitive} {
  set fractional [::vorkel::explain_vcos::isFractional $request $primitive]
  return [lmap pair [::vorkel::explain_vcos::pairs $request $primitive [dict get $request inputs]] {
    set eighths $fractional
    set serves 1
    foreach output [dict get $request outputs] {
      if {[::vorkel::explain_vcos::level $request $output [lindex $pair 0] $eighths] < 3} {
        set serves 0
        break
      }
      set eighths 0
    }
    if {!$serves} continue
    set pair
  }]
}

# The lowest and the highest other input clock, MHz, that keeps VCO, PFD and all outputs in their
# ranges with an M and D. Each output is as much faster as the input clock is.
proc ::vorkel::explain_inputs::Bounds {request primitive vco m d} {
  set limits [dict get $request limits]
  lassign [::vorkel::catalogue::vcoRange $primitive $limits] lowest highest
  lassign [::vorkel::catalogue::pfdRange $primitive $limits [dict get $request bandwidth]] slow fast
  set low [expr {max($lowest * double($d) / $m, $slow * double($d))}]
  set high [expr {min($highest * double($d) / $m, $fast * double($d))}]
  set input [lindex [dict get $request inputs] 0]
  foreach output [dict get $request outputs] index [::vorkel::answer::indices $request] {
    lassign [::vorkel::catalogue::outputRange $primitive $limits $index] lowest highest
    set ratio [expr {double($input) / [dict get $output freq]}]
    set low [expr {max($low, $lowest * $ratio)}]
    set high [expr {min($high, $highest * $ratio)}]
  }
  return [list $low $high]
}
