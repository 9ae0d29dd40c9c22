# The frequencies that a primitive can make for an output, one after the other, away from the one
# that is asked for.
#
# A ladder is what one choice of the other settings makes: that of a PLL or a TSYN is a VCO with
# its dividers, that of CLKFX of a KRU a D with its M; every other pin of a KRU is a ladder of one
# rung. A search keeps the next rung of each ladder, sorted by its distance, and replaces the
# nearest one by what follows on its ladder. So it visits all that there is, the nearest first.
#
# A rung is a list of its distance (MHz), its frequency (MHz) and its place. The place on a VCO is
# a list of the VCO (MHz), M, D and the divider; explain_pins.tcl tells what that on a KRU is.

package provide vorkel::explain_ladder 1.1
package require vorkel::actual 1.1
package require vorkel::engine 1.1
package require vorkel::explain_pins 1.1
package require vorkel::explain_vcos 1.1
package require vorkel::hardware 1.1
package require vorkel::output_range 1.1

namespace eval ::vorkel::explain_ladder {
  # What differs by less than this part is the same but for the rounding of the arithmetic.
  variable rounding 1e-12
}

# Begins a search for an output on one side, below or above what it asks for. Frequencies stay in
# the range of the output or of the pin. With `alone` neither the other outputs nor the phase and
# the duty cycle count.
proc ::vorkel::explain_ladder::search {request primitive index side {alone 0}} {
  set output [lindex [dict get $request outputs] $index]
  set search [dict create request $request primitive $primitive index $index side $side \
    output $output asked [dict get $output freq] alone $alone last "" rungs {} \
    family [::vorkel::engine::family $primitive]]
  if {[dict get $search family] eq "Loop"} {
    lassign [::vorkel::output_range::of $request $primitive $index] lowest highest
    dict set search largest [::vorkel::hardware::largestDivider [dict get $request limits]]
    dict set search lowest $lowest
    dict set search highest $highest
    dict set search fractional [expr {$index == 0 &&
      [::vorkel::explain_vcos::isFractional $request $primitive]}]
  }
  dict set search rungs [lsort -real -index 0 [[dict get $search family]Rungs $search]]
  return $search
}

# The nearest rung that has not been visited yet, or "" when there is none. Of equal frequencies
# only the first is told, and what is asked for itself is left out.
proc ::vorkel::explain_ladder::next {searchName} {
  variable rounding
  upvar 1 $searchName search
  set rungs [dict get $search rungs]
  set least [expr {[dict get $search asked] * $rounding}]
  set found ""
  while {$found eq "" && [llength $rungs] > 0} {
    set rung [lindex $rungs 0]
    set rungs [lrange $rungs 1 end]
    set following [[dict get $search family]Next $search [lindex $rung 2]]
    if {$following ne ""} {
      set after [lsearch -bisect -real -index 0 $rungs [lindex $following 0]]
      set rungs [linsert $rungs [expr {$after + 1}] $following]
    }
    set key [format %.12g [lindex $rung 1]]
    if {[lindex $rung 0] > $least && $key ne [dict get $search last]} {
      dict set search last $key
      set found $rung
    }
  }
  dict set search rungs $rungs
  return $found
}

# The ratio of a rung to the input: two whole numbers.
proc ::vorkel::explain_ladder::ratio {search rung} {
  set place [lindex $rung 2]
  if {[dict get $search family] eq "Loop"} {
    return [::vorkel::actual::loopRatio {*}[lrange $place 1 3]]
  }
  return [::vorkel::actual::reduce {*}[lrange $place 2 3]]
}

# The frequency from which a side begins in a range: what is asked for, or the end of the range
# that is nearer to it.
proc ::vorkel::explain_ladder::Start {search lowest highest} {
  set asked [dict get $search asked]
  return [expr {[dict get $search side] eq "below" ? min($asked, $highest) : max($asked, $lowest)}]
}

proc ::vorkel::explain_ladder::Rung {search value place} {
  return [list [expr {abs($value - [dict get $search asked])}] $value $place]
}

# The first rungs of all VCO frequencies, of those that serve the other outputs.
proc ::vorkel::explain_ladder::LoopRungs {search} {
  variable rounding
  dict with search {
    set begin [Start $search $lowest $highest]
    if {$begin < $lowest || $begin > $highest} {
      return {}
    }
    if {$alone} {
      set pairs [::vorkel::explain_vcos::pairs $request $primitive [dict get $request inputs]]
    } else {
      set pairs [::vorkel::explain_vcos::beside $request $primitive $index]
    }
    set rungs {}
    foreach pair $pairs {
      set quotient [expr {[lindex $pair 0] / $begin}]
      if {$side eq "below"} {
        set divider [AtLeast [expr {$quotient * (1 - $rounding)}] $fractional]
      } else {
        set divider [AtMost $largest [expr {$quotient * (1 + $rounding)}] $fractional]
      }
      set rung [LoopRung $search $pair $divider]
      if {$rung ne ""} {
        lappend rungs $rung
      }
    }
  }
  return $rungs
}

proc ::vorkel::explain_ladder::LoopNext {search place} {
  set divider [lindex $place 3]
  set fractional [dict get $search fractional]
  set step [expr {$fractional ? 1.0 / $::vorkel::hardware::fraction : 1}]
  if {[dict get $search side] eq "below"} {
    set divider [AtLeast [expr {$divider + $step}] $fractional]
  } else {
    set divider [AtMost [dict get $search largest] [expr {$divider - $step}] $fractional]
  }
  return [LoopRung $search [lrange $place 0 2] $divider]
}

# The smallest divider that is no smaller than a quotient; too large a one when there is none. A
# divider with eighths is at least 2.
proc ::vorkel::explain_ladder::AtLeast {quotient fractional} {
  if {$quotient <= 1} {
    return 1
  }
  if {!$fractional || $quotient <= 2} {
    return [expr {ceil($quotient)}]
  }
  return [expr {ceil($quotient * $::vorkel::hardware::fraction) / $::vorkel::hardware::fraction}]
}

# The largest divider up to `most` that is no larger than a quotient; 0 when there is none.
proc ::vorkel::explain_ladder::AtMost {most quotient fractional} {
  if {$quotient >= $most} {
    return $most
  }
  if {!$fractional || $quotient < 2} {
    return [expr {floor($quotient)}]
  }
  return [expr {floor($quotient * $::vorkel::hardware::fraction) / $::vorkel::hardware::fraction}]
}

# The rung of a VCO at a divider, or the next one of the same VCO that has the phase and the duty
# cycle; "" when the VCO has none in the range.
proc ::vorkel::explain_ladder::LoopRung {search pair divider} {
  set step [expr {[dict get $search side] eq "below" ? 1 : -1}]
  while {$divider >= 1 && $divider <= [dict get $search largest]} {
    set value [expr {[lindex $pair 0] / $divider}]
    if {![IsBetween $value [dict get $search lowest] [dict get $search highest]]} {
      return ""
    }
    if {$divider == round($divider)} {
      set divider [expr {round($divider)}]
    }
    if {[dict get $search alone] || [dict get $search fractional] ||
        ([::vorkel::explain_vcos::phaseServes [dict get $search output] $divider] &&
          [::vorkel::explain_vcos::dutyServes [dict get $search request] \
            [dict get $search output] $divider])} {
      return [Rung $search $value [list {*}$pair $divider]]
    }
    incr divider $step
  }
  return ""
}

proc ::vorkel::explain_ladder::IsBetween {value lowest highest} {
  variable rounding
  return [expr {$value >= $lowest * (1 - $rounding) && $value <= $highest * (1 + $rounding)}]
}

# The first rungs of all pins of a KRU.
proc ::vorkel::explain_ladder::KruRungs {search} {
  dict with search {
    set rungs {}
    if {!$alone && ![::vorkel::explain_pins::canHaveOthers $request $primitive $index]} {
      return {}
    }
    if {!$alone && $primitive eq "KRU_CLKGEN" && [llength [dict get $request outputs]] > 1} {
      return [Followers $search]
    }
    foreach {place value} [::vorkel::explain_pins::fixed $request $primitive] {
      if {$alone || [::vorkel::explain_pins::isDutyOf $output $place]} {
        lappend rungs {*}[Single $search $value $place]
      }
    }
    if {!$alone && ![::vorkel::explain_pins::isDutyOf $output {CLKFX "" 1 1}]} {
      return $rungs
    }
    set bound [expr {$alone ? "" : [::vorkel::explain_pins::bound $request $primitive $index]}]
    if {$bound ne ""} {
      return [list {*}$rungs {*}[Single $search $bound [list CLKFX "as another output" 1 1]]]
    }
    foreach half [::vorkel::explain_pins::halves $primitive] {
      for {set d 1} {$d <= [dict get $::vorkel::hardware::kru_largest $primitive]} {incr d} {
        set rung [KruRung $search $half $d [FirstM $search $half $d]]
        if {$rung ne ""} {
          lappend rungs $rung
        }
      }
    }
  }
  return $rungs
}

# A rung of a ladder that has no other, as a list; none when it is on the other side or out of
# the range of its pin.
proc ::vorkel::explain_ladder::Single {search value place} {
  set below [expr {$value < [dict get $search asked]}]
  set range [::vorkel::explain_pins::pinRange [dict get $search request] \
    [dict get $search primitive] [lindex $place 0]]
  if {([dict get $search side] eq "below") != $below || ![IsBetween $value {*}$range]} {
    return {}
  }
  return [list [Rung $search $value $place]]
}

# The M of CLKFX that is next to what is asked for, behind a divide of the input and with a D.
proc ::vorkel::explain_ladder::FirstM {search half d} {
  variable rounding
  dict with search {
    set begin [Start $search {*}[::vorkel::explain_pins::pinRange $request $primitive CLKFX]]
    set quotient [expr {$begin * $d * $half / [lindex [dict get $request inputs] 0]}]
    set most [dict get $::vorkel::hardware::kru_largest $primitive]
    if {$side eq "below"} {
      return [expr {int(floor(min($most, $quotient * (1 + $rounding))))}]
    }
    return [expr {max($::vorkel::hardware::kru_smallest_m,
      int(ceil(min($most + 1, $quotient * (1 - $rounding)))))}]
  }
}

proc ::vorkel::explain_ladder::KruNext {search place} {
  lassign $place pin how multiply divide half m d
  if {$m eq ""} {
    return ""
  }
  return [KruRung $search $half $d [expr {[dict get $search side] eq "below" ? $m - 1 : $m + 1}]]
}

# The rung of CLKFX at an M, or "" when M or the frequency is out of its range.
proc ::vorkel::explain_ladder::KruRung {search half d m} {
  set primitive [dict get $search primitive]
  if {$m < $::vorkel::hardware::kru_smallest_m ||
      $m > [dict get $::vorkel::hardware::kru_largest $primitive]} {
    return ""
  }
  set request [dict get $search request]
  set input [lindex [dict get $request inputs] 0]
  set value [expr {double($input) / $half * $m / $d}]
  if {![IsBetween $value {*}[::vorkel::explain_pins::pinRange $request $primitive CLKFX]]} {
    return ""
  }
  return [Rung $search $value [::vorkel::explain_pins::synthesised $input $half $m $d]]
}

# Of a KRU_CLKGEN with several outputs: output 0 is on CLKFX, each other one there, too, or on
# CLKFXDV, which divides it.
proc ::vorkel::explain_ladder::Followers {search} {
  set outputs [dict get $search request outputs]
  set index [dict get $search index]
  set rungs {}
  foreach factor [list 1 {*}$::vorkel::hardware::clkgen_divides] {
    set pin [expr {$factor == 1 || $index == 0 ? "CLKFX" : "CLKFXDV"}]
    if {$index > 0} {
      set value [expr {double([dict get [lindex $outputs 0] freq]) / $factor}]
      lappend rungs {*}[Single $search $value [list $pin "output 0 / $factor" 1 1]]
      continue
    }
    foreach other [lrange $outputs 1 end] {
      set value [expr {double([dict get $other freq]) * $factor}]
      lappend rungs {*}[Single $search $value [list $pin "another output x $factor" 1 1]]
    }
  }
  return $rungs
}
