# TSYN and PLL: a loop with a VCO, and a divider for each output.

namespace eval ::generator::loop {}

# Asks for the configuration of lowest power, or for the closest one when phases or duty cycles
# matter. Answers "1", or why there is none.
proc ::generator::loop::calculate {primitive handle request} {
  lassign [::generator::column $request inputs frequency] first second
  if {$second eq ""} {
    set second 0
  }
  set frequencies [::generator::column $request outputs frequency]
  set common [list $first $second [llength $frequencies] \
    [::generator::flag [dict get $request prefer_max_vco]] \
    [::generator::flag [dict get $request whole_div0]]]
  set trace [::generator::flag [dict get $request trace]]
  if {![Shaped $request]} {
    return [$handle ${primitive}CalculateActualOutFreqs $frequencies {*}$common $trace]
  }
  # A duty cycle of 0 asks for none.
  set duties [lmap duty [::generator::column $request outputs duty] {
    expr {$duty eq "" ? 0 : $duty}
  }]
  return [$handle GetClosestSolution $frequencies \
    [::generator::column $request outputs phase] $duties {*}$common \
    [::generator::flag [expr {$primitive eq "PLL"}]] $trace]
}

# Reads the chosen configuration: settings, outputs, phaseError and notes of a plan. Frequencies
# and timing figures are those with the first input clock.
proc ::generator::loop::read {primitive handle request} {
  set input [lindex [dict get $request inputs] 0]
  set in [dict get $input frequency]
  set m [$handle GetChosenMInt]
  set d [$handle GetChosenD]
  set bandwidth [dict get $request bandwidth]
  set notes {}
  set outputs {}
  for {set n 0} {$n < [llength [dict get $request outputs]]} {incr n} {
    # Only output 0 has a divider that can be fractional, and a method of its own.
    set divider [expr {$n == 0 ? [$handle GetChosenDiv0] : [$handle GetChosenDivN $n]}]
    lassign [Shape $handle $request $n] phase duty
    lappend outputs [dict create place [format %g $divider] \
      frequency [expr {double($in) * $m / $d / $divider}] phase $phase duty $duty \
      period [::generator::ask notes $handle GetPLLPeriodPhaseDutyCycle $in $m $d $divider \
        $phase $duty 0] \
      jitter [::generator::ask notes $handle GetPLLPkToPkJitter $in $m $d $bandwidth $divider \
        [dict get $input jitter]]]
  }
  return [dict create \
    settings [list {*}[Vcos $handle $request $m $d] M $m D $d bandwidth $bandwidth] \
    outputs $outputs \
    phaseError [::generator::ask notes $handle GetPLLPhaseError $in $d $bandwidth] \
    notes $notes]
}

# The VCO frequency with each input clock. M and D may miss the one that the search has counted
# with; it is told where they do.
proc ::generator::loop::Vcos {handle request m d} {
  set lines [lmap frequency [::generator::column $request inputs frequency] {
    format "%.3f MHz" [expr {double($frequency) * $m / $d}]
  }]
  set counted "[$handle GetChosenVCO] MHz"
  if {$counted ne [lindex $lines 0]} {
    lset lines 0 "[lindex $lines 0], taken as $counted"
  }
  return [concat {*}[lmap line $lines {list VCO $line}]]
}

# Whether phases or duty cycles matter.
proc ::generator::loop::Shaped {request} {
  foreach output [dict get $request outputs] {
    if {[dict get $output phase] != 0 || [dict get $output duty] ne ""} {
      return 1
    }
  }
  return 0
}

# The phase (degrees) and duty cycle (percent) of output n. Where none is asked for, the counters
# are set for 0 and 50; the methods then answer 0.
proc ::generator::loop::Shape {handle request n} {
  if {![Shaped $request]} {
    return {0 50}
  }
  set duty 50
  if {[dict get [lindex [dict get $request outputs] $n] duty] ne ""} {
    set duty [format %.1f [expr {[$handle GetChosenDutyCycleN $n] * 100}]]
  }
  return [list [$handle GetChosenPhaseN $n] $duty]
}
