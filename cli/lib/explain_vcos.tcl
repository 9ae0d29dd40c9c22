# All VCO frequencies that a PLL or a TSYN makes of its input clocks, and which of them serve an
# output.

package provide vorkel::explain_vcos 1.1
package require vorkel::actual 1.1
package require vorkel::answer 1.1
package require vorkel::catalogue 1.1
package require vorkel::grid_dividers 1.1
package require vorkel::hardware 1.1

namespace eval ::vorkel::explain_vcos {
  # For each primitive the last request with its pairs and masks.
  variable known
  # The part of a frequency or of a limit that is only the rounding of the arithmetic.
  variable rounding 1e-12
}

# The smallest and the largest D that keep the phase-frequency detector in its range with an
# input clock. There is none when the first is the larger one.
proc ::vorkel::explain_vcos::dividersOf {input range} {
  variable rounding
  lassign $range lowest highest
  return [list [expr {max(1, int(ceil(min(1e6, $input / $highest * (1 - $rounding)))))}] \
    [expr {min($::vorkel::hardware::largest_d,
      int(floor(min(1e6, $input / $lowest * (1 + $rounding)))))}]]
}

# The pairs of M and D with a VCO in its range and a phase-frequency detector in its range, for
# all input clocks: a list of lists of the VCO of the first input clock, M and D. Of the pairs
# with the same quotient only one is there.
proc ::vorkel::explain_vcos::pairs {request primitive inputs} {
  set limits [dict get $request limits]
  set range [::vorkel::catalogue::pfdRange $primitive $limits [dict get $request bandwidth]]
  set vcoRange [::vorkel::catalogue::vcoRange $primitive $limits]
  set first 1
  set last $::vorkel::hardware::largest_d
  foreach input $inputs {
    lassign [dividersOf $input $range] low high
    set first [expr {max($first, $low)}]
    set last [expr {min($last, $high)}]
  }
  return [Within $primitive $inputs $vcoRange $first $last]
}

proc ::vorkel::explain_vcos::Within {primitive inputs vcoRange first last} {
  variable rounding
  lassign $vcoRange lowest highest
  set lowest [expr {$lowest * (1 - $rounding)}]
  set highest [expr {$highest * (1 + $rounding)}]
  set slow [tcl::mathfunc::min {*}$inputs]
  set fast [tcl::mathfunc::max {*}$inputs]
  set input [expr {double([lindex $inputs 0])}]
  set smallest [dict get $::vorkel::hardware::smallest_m $primitive]
  set pairs {}
  set seen [dict create]
  for {set d $first} {$d <= $last} {incr d} {
    set from [expr {max(1, int(min(1e6, ceil($lowest * $d / $slow))))}]
    set to [expr {min($::vorkel::hardware::largest_m,
      int(min(1e6, floor($highest * $d / $fast))))}]
    for {set m $from} {$m <= $to} {incr m} {
      if {$m > 1 && $m < $smallest} continue
      set vco [expr {$input * $m / $d}]
      if {![dict exists $seen $vco]} {
        dict set seen $vco 1
        lappend pairs [list $vco $m $d]
      }
    }
  }
  return $pairs
}

# Whether output 0 can have a divider with eighths: that of a TSYN can, but then nothing moves
# the phase or the duty cycle of any output.
proc ::vorkel::explain_vcos::isFractional {request primitive} {
  if {![::vorkel::hardware::hasFractions $request $primitive]} {
    return 0
  }
  foreach output [dict get $request outputs] {
    if {[dict get $output phase] ni {"" 0 0.0} || [dict get $output duty] ni {"" 50 50.0}} {
      return 0
    }
  }
  return 1
}

# Whether only the engine's search has whole M, while the hardware could take eighths of it: those
# of a TSYN with few outputs, whose phases and duty cycles are those that a fraction leaves.
proc ::vorkel::explain_vcos::isSearchWhole {request primitive} {
  return [expr {[::vorkel::hardware::hasFractions $request $primitive] &&
    [::vorkel::grid_dividers::fixedClass $request] == 0}]
}

# The dividers next to a quotient of VCO and output, of an output that can have eighths or not.
proc ::vorkel::explain_vcos::dividersAt {request quotient fractional} {
  set largest [::vorkel::hardware::largestDivider [dict get $request limits]]
  set steps [expr {$fractional && $quotient >= 2 ? $::vorkel::hardware::fraction : 1}]
  set below [expr {floor($quotient * $steps) / $steps}]
  set dividers {}
  foreach divider [list $below [expr {$below + 1.0 / $steps}]] {
    if {$divider >= 1 && $divider <= $largest} {
      lappend dividers [expr {$divider == round($divider) ? round($divider) : $divider}]
    }
  }
  return $dividers
}

# How far a frequency may be off, as a fraction of it.
proc ::vorkel::explain_vcos::allowed {request} {
  variable rounding
  return [expr {[dict get $request tolerance] * 1e-6 + $rounding}]
}

# How far a VCO serves an output: 0, 1 when the frequency is within its tolerance, 2 when the
# phase is so too, 3 when the duty cycle is so too.
proc ::vorkel::explain_vcos::level {request output vco fractional} {
  set frequency [dict get $output freq]
  set allowed [allowed $request]
  set best 0
  foreach divider [dividersAt $request [expr {$vco / $frequency}] $fractional] {
    if {abs($vco / $divider / $frequency - 1) > $allowed} continue
    set level 1
    if {[phaseServes $output $divider]} {
      set level [expr {[dutyServes $request $output $divider] ? 3 : 2}]
    }
    set best [expr {max($best, $level)}]
  }
  return $best
}

proc ::vorkel::explain_vcos::phaseServes {output divider} {
  set phase [dict get $output phase]
  if {$phase eq "" || $divider != round($divider)} {
    return 1
  }
  return [::vorkel::answer::isAllowed phaseError [::vorkel::actual::phaseDifference \
    [::vorkel::actual::phaseOnStep $phase $divider] $phase]]
}

proc ::vorkel::explain_vcos::dutyServes {request output divider} {
  set duty [dict get $output duty]
  if {$duty eq "" || $divider != round($divider)} {
    return 1
  }
  set made [::vorkel::actual::dutyOnStep $duty $divider [dict get $request limits O_MAX_HT_LT]]
  return [::vorkel::answer::isAllowed dutyError [expr {$made - $duty}]]
}

# For each output a whole number whose bit n tells that pair n serves it in all.
proc ::vorkel::explain_vcos::masks {request primitive pairs} {
  set fractional [isFractional $request $primitive]
  set masks {}
  foreach output [dict get $request outputs] {
    set mask 0
    set bit 1
    foreach pair $pairs {
      if {[level $request $output [lindex $pair 0] $fractional] == 3} {
        set mask [expr {$mask | $bit}]
      }
      set bit [expr {$bit << 1}]
    }
    lappend masks $mask
    set fractional 0
  }
  return $masks
}

# The pairs that serve all outputs of a list of indices; all pairs for an empty list.
proc ::vorkel::explain_vcos::serving {masks indices} {
  set common -1
  foreach index $indices {
    set common [expr {$common & [lindex $masks $index]}]
  }
  return $common
}

# The pairs that serve all outputs but one. The pairs and masks of a request are kept, as each of
# its outputs is asked for.
proc ::vorkel::explain_vcos::beside {request primitive index} {
  variable known
  if {![info exists known($primitive)] || [lindex $known($primitive) 0] ne $request} {
    set pairs [pairs $request $primitive [dict get $request inputs]]
    set single [expr {[llength [dict get $request outputs]] == 1}]
    set known($primitive) [list $request $pairs \
      [expr {$single ? 0 : [masks $request $primitive $pairs]}]]
  }
  lassign $known($primitive) -> pairs masks
  set others [lsearch -all -inline -not -exact [::vorkel::answer::indices $request] $index]
  set common [serving $masks $others]
  set kept {}
  foreach pair $pairs {
    if {$common & 1} {
      lappend kept $pair
    }
    set common [expr {$common >> 1}]
  }
  return $kept
}

# Whether some pair serves all outputs.
proc ::vorkel::explain_vcos::isServed {request primitive} {
  set fractional [isFractional $request $primitive]
  foreach pair [pairs $request $primitive [dict get $request inputs]] {
    set vco [lindex $pair 0]
    set eighths $fractional
    set serves 1
    foreach output [dict get $request outputs] {
      if {[level $request $output $vco $eighths] < 3} {
        set serves 0
        break
      }
      set eighths 0
    }
    if {$serves} {
      return 1
    }
  }
  return 0
}
