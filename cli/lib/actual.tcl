# What the hardware makes of its settings: exact ratios of frequencies, phases and duty cycles.

package provide vorkel::actual 1.1
package require vorkel::hardware 1.1

namespace eval ::vorkel::actual {
  # The steps of PHASE_SHIFT of a KRU in 360 degrees.
  variable shift_steps 255
  # The VCO has eight phases, so an output moves by eighths of a VCO period: degrees of a VCO
  # period, of which those of an output behind a divider are the quotient.
  variable phase_step 45.0
  # The phase of each pin of a KRU, degrees.
  variable pin_phase {
    CLK0 0 CLK90 90 CLK180 180 CLK270 270 CLK2X 0 CLK2X180 180 CLKDV 0 CLKFX 0 CLKFX180 180
    CLKFXDV 0
  }
}

# A ratio of whole numbers in lowest terms, as a list.
proc ::vorkel::actual::reduce {multiply divide} {
  lassign [list $multiply $divide] a b
  while {$b != 0} {
    lassign [list $b [expr {$a % $b}]] a b
  }
  return [list [expr {$multiply / $a}] [expr {$divide / $a}]]
}

# The ratio of an output of a PLL or a TSYN to the input. m and divider may have eighths.
proc ::vorkel::actual::loopRatio {m d divider} {
  set parts $::vorkel::hardware::fraction
  return [reduce [expr {round($m * $parts)}] [expr {round($d) * round($divider * $parts)}]]
}

# The ratio of a pin of a KRU to the input. `settings` is a dict of m, d, divide (that of CLKDV
# or CLKFXDV) and divideBy2.
proc ::vorkel::actual::pinRatio {pin settings} {
  set m [expr {round([dict get $settings m])}]
  set d [expr {round([dict get $settings d])}]
  # A divide has halves.
  set halves [expr {round([dict get $settings divide] * 2)}]
  set half [expr {[dict exists $settings divideBy2] && [dict get $settings divideBy2] ? 2 : 1}]
  switch -- $pin {
    CLK0 - CLK90 - CLK180 - CLK270 { return [reduce 1 $half] }
    CLK2X - CLK2X180 { return [reduce 2 $half] }
    CLKDV { return [reduce 2 [expr {$half * $halves}]] }
    CLKFX - CLKFX180 { return [reduce $m [expr {$half * $d}]] }
    CLKFXDV { return [reduce [expr {2 * $m}] [expr {$half * $d * $halves}]] }
  }
  error "the engine has chosen the pin \"$pin\""
}

# The frequency, MHz, that a ratio makes of an input, MHz. One rounding of a product and one of
# a quotient, so that a ratio that hits a frequency shows no error.
proc ::vorkel::actual::frequency {input ratio} {
  lassign $ratio multiply divide
  return [expr {double($input) * $multiply / $divide}]
}

# The step of the phase of an output of a PLL or a TSYN that is nearest to a phase, degrees.
proc ::vorkel::actual::phaseOnStep {degrees divider} {
  variable phase_step
  return [expr {round($degrees * $divider / $phase_step) * $phase_step / $divider}]
}

# The duty cycle, percent, of an output of a PLL or a TSYN that is nearest to one, percent, when
# its divider can be high or low for `most` VCO periods. It counts half periods.
proc ::vorkel::actual::dutyOnStep {percent divider most} {
  if {$divider == 1} {
    return 50.0
  }
  set lowest [expr {$divider > $most ? 2 * ($divider - $most) : 2}]
  set highest [expr {$divider > $most ? min(2 * $most + 1, 2 * $divider - 1) : 2 * $divider - 1}]
  set halves [expr {round($percent / 100.0 * 2 * $divider)}]
  return [expr {100.0 * max($lowest, min($highest, $halves)) / (2 * $divider)}]
}

# The phase from 0 to below 360 degrees that is the same as one.
proc ::vorkel::actual::turned {degrees} {
  return [expr {fmod(fmod($degrees, 360.0) + 360.0, 360.0)}]
}

# The phase of a pin of a KRU, degrees from 0 to 360, with PHASE_SHIFT.
proc ::vorkel::actual::pinPhase {pin shift} {
  variable pin_phase
  variable shift_steps
  return [turned [expr {[dict get $pin_phase $pin] + 360.0 * $shift / $shift_steps}]]
}

# The duty cycle of a pin of a KRU, percent. A divide between whole numbers is one half period
# of the line longer low than high.
proc ::vorkel::actual::pinDuty {pin divide} {
  if {$pin eq "CLKDV"} {
    return [expr {50.0 * floor($divide) / $divide}]
  }
  return 50.0
}

# The difference of two phases, degrees above -180 up to 180.
proc ::vorkel::actual::phaseDifference {actual requested} {
  set difference [expr {fmod($actual - $requested, 360.0)}]
  if {$difference > 180.0} {
    set difference [expr {$difference - 360.0}]
  } elseif {$difference <= -180.0} {
    set difference [expr {$difference + 360.0}]
  }
  return $difference
}
