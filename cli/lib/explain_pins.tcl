# What the pins of a KRU make: their ranges, frequencies, phases and duty cycles.
#
# A place is a list of the pin, how it is made (a text), the multiplier and the divisor of the
# input, and for CLKFX the divide of the input, M and D.

package provide vorkel::explain_pins 1.1
package require vorkel::actual 1.1
package require vorkel::answer 1.1
package require vorkel::catalogue 1.1
package require vorkel::hardware 1.1
package require vorkel::numbers 1.1

namespace eval ::vorkel::explain_pins {}

# The range of a pin of a KRU, MHz. That of a KRU_CLKGEN is as far as the engine looks for it.
proc ::vorkel::explain_pins::pinRange {request primitive pin} {
  lassign [::vorkel::catalogue::pinRange $pin 0 [dict get $request limits]] lowest highest
  if {$primitive eq "KRU_CLKGEN"} {
    lassign [dict get $::vorkel::catalogue::clkgen_ranges $pin] low high
    set lowest [expr {max($lowest, $low)}]
    set highest [expr {min($highest, $high)}]
  }
  return [list $lowest $highest]
}

# What a pin of a KRU makes whatever M and D are: a list of places and their frequencies, MHz.
proc ::vorkel::explain_pins::fixed {request primitive} {
  if {$primitive ne "KRU_SP"} {
    return {}
  }
  set input [lindex [dict get $request inputs] 0]
  set rows {}
  foreach half {1 2} {
    set from [From $input $half]
    lappend rows [list CLK0 $from 1 $half] [expr {double($input) / $half}] \
      [list CLK2X "$from x 2" 2 $half] [expr {double($input) * 2 / $half}]
    foreach divide $::vorkel::hardware::kru_divides {
      lappend rows [list CLKDV "$from / $divide" 2 [expr {round(2 * $half * $divide)}]] \
        [expr {double($input) / $half / $divide}]
    }
  }
  return $rows
}

# Each way in which a KRU comes nearest to a frequency, whatever the ranges of the pins, in the
# form of `fixed`: every pin without M and D, and CLKFX with every D.
proc ::vorkel::explain_pins::places {request primitive frequency} {
  set rows [fixed $request $primitive]
  set input [lindex [dict get $request inputs] 0]
  set most [dict get $::vorkel::hardware::kru_largest $primitive]
  foreach half [halves $primitive] {
    set base [expr {double($input) / $half}]
    for {set d 1} {$d <= $most} {incr d} {
      set m [expr {round(max($::vorkel::hardware::kru_smallest_m,
        min($most, $frequency * $d / $base)))}]
      lappend rows [synthesised $input $half $m $d] [expr {$base * $m / $d}]
    }
  }
  return $rows
}

# The divides of the input that a KRU has.
proc ::vorkel::explain_pins::halves {primitive} {
  return [expr {$primitive eq "KRU_SP" ? {1 2} : 1}]
}

# The place of CLKFX.
proc ::vorkel::explain_pins::synthesised {input half m d} {
  return [list CLKFX "[From $input $half] x $m / $d" $m [expr {$half * $d}] $half $m $d]
}

proc ::vorkel::explain_pins::From {input half} {
  return "[::vorkel::numbers::short $input 6][expr {$half == 2 ? " / 2" : ""}]"
}

# Whether a KRU can have all phases, and the duty cycles of all outputs but one, whatever the
# frequency of that one is.
proc ::vorkel::explain_pins::canHaveOthers {request primitive index} {
  set other -1
  set offsets {}
  foreach output [dict get $request outputs] {
    incr other
    set phase [dict get $output phase]
    if {$phase ne ""} {
      lappend offsets $phase
    }
    # Output 0 of a KRU_CLKGEN is at 0 degrees, the others are there or at 180.
    if {$primitive eq "KRU_CLKGEN" && $phase ne "" &&
        [Off $phase 0 [expr {$other == 0 ? 360 : 180}]] > $::vorkel::answer::phase_tolerance} {
      return 0
    }
    if {$other != $index && ![IsDutyPossible $request $primitive $output]} {
      return 0
    }
  }
  # One PHASE_SHIFT stands on top of quarters of a turn; each phase can be off by its tolerance.
  foreach offset $offsets {
    if {[Off $offset [lindex $offsets 0] 90] > 2 * $::vorkel::answer::phase_tolerance} {
      return 0
    }
  }
  return 1
}

# How far a phase is from another one, or from one that is multiples of a period away.
proc ::vorkel::explain_pins::Off {phase other period} {
  set rest [expr {fmod(abs($phase - $other), double($period))}]
  return [expr {min($rest, $period - $rest)}]
}

# Whether some pin that makes an output has its duty cycle.
proc ::vorkel::explain_pins::IsDutyPossible {request primitive output} {
  if {[isDutyOf $output {CLKFX "" 1 1}]} {
    return 1
  }
  set frequency [dict get $output freq]
  foreach {place value} [fixed $request $primitive] {
    if {abs($value - $frequency) <= [Slack $request $frequency] && [isDutyOf $output $place]} {
      return 1
    }
  }
  return 0
}

# Whether the pin of a place has the duty cycle that an output asks for.
proc ::vorkel::explain_pins::isDutyOf {output place} {
  set duty [dict get $output duty]
  if {$duty eq ""} {
    return 1
  }
  lassign $place pin how multiply divide
  set made 50.0
  if {$pin eq "CLKDV"} {
    set made [::vorkel::actual::pinDuty CLKDV [lindex $how end]]
  }
  return [::vorkel::answer::isAllowed dutyError [expr {$made - $duty}]]
}

# How far the frequency of a pin without M and D can be from what is asked for: the engine takes
# what is 0.001 MHz off, or it is within the tolerance.
proc ::vorkel::explain_pins::Slack {request frequency} {
  return [expr {max(1e-3, $frequency * [dict get $request tolerance] * 1e-6)}]
}

# The frequency that CLKFX must have because some other output is on no other pin; "" when there
# is none. All outputs on CLKFX share its M and D.
proc ::vorkel::explain_pins::bound {request primitive index} {
  if {$primitive ne "KRU_SP"} {
    return ""
  }
  set other -1
  foreach output [dict get $request outputs] {
    if {[incr other] == $index} continue
    set frequency [dict get $output freq]
    set free 0
    foreach {place value} [fixed $request $primitive] {
      if {abs($value - $frequency) <= [Slack $request $frequency]} {
        set free 1
        break
      }
    }
    if {!$free} {
      return $frequency
    }
  }
  return ""
}
