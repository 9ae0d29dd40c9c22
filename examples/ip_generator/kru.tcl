# KRU_SP and KRU_CLKGEN: a pin for each output.

namespace eval ::generator::kru {}

# Asks for a configuration. Answers "1", or why there is none.
proc ::generator::kru::calculate {primitive handle request} {
  if {[llength [dict get $request inputs]] > 1} {
    return "It has one input clock."
  }
  foreach duty [::generator::column $request outputs duty] {
    if {$duty ne "" && $duty != 50} {
      return "Its duty cycles are 50 %."
    }
  }
  set frequencies [::generator::column $request outputs frequency]
  set common [list $frequencies [::generator::column $request outputs phase] \
    [lindex [::generator::column $request inputs frequency] 0] [llength $frequencies]]
  set trace [::generator::flag [dict get $request trace]]
  if {$primitive eq "KRU_CLKGEN"} {
    return [$handle KruClkgenCalculateActuals {*}$common $trace]
  }
  return [$handle KruCalculateActuals {*}$common \
    [::generator::flag [dict get $request feedback]] $trace]
}

# Reads the chosen configuration: settings, outputs, phaseError and notes of a plan.
proc ::generator::kru::read {primitive handle request} {
  set in [lindex [::generator::column $request inputs frequency] 0]
  set chosen [Chosen $primitive $handle]
  set notes {}
  set outputs {}
  for {set n 0} {$n < [llength [dict get $request outputs]]} {incr n} {
    set pin [$handle GetKruChosenPinname $n]
    lappend outputs [Output notes $primitive $handle $request $chosen $in $pin]
  }
  return [dict create settings [Settings $primitive $chosen] outputs $outputs \
    phaseError [::generator::ask notes $handle GetKRUPhaseError] notes $notes]
}

# What has been chosen: m and d of the synthesiser (0 where it is not used), divider (of CLKDV or
# CLKFXDV, likewise), halved, offset (degrees), shift.
proc ::generator::kru::Chosen {primitive handle} {
  set chosen [dict create m [$handle GetKruChosenM] d [$handle GetKruChosenD]]
  if {$primitive eq "KRU_CLKGEN"} {
    return [dict merge $chosen [dict create divider [string trim [$handle GetKruChosenClkfxdv]] \
      halved false offset 0 shift 0]]
  }
  return [dict merge $chosen [dict create divider [$handle GetKruChosenClkdv] \
    halved [$handle GetKruChosenDivBy2] offset [$handle GetKruChosenPhaseOffset] \
    shift [$handle GetKruChosenPhaseShift]]]
}

# What is set in the primitive, as names and values.
proc ::generator::kru::Settings {primitive chosen} {
  dict with chosen {
    set settings {}
    if {$m != 0} {
      lappend settings CLKFX_MULTIPLY $m CLKFX_DIVIDE $d
    }
    if {$primitive eq "KRU_CLKGEN"} {
      if {$divider != 0} {
        lappend settings CLKFXDV_DIVIDE $divider
      }
      return $settings
    }
    if {$divider != 0} {
      lappend settings CLKDV_DIVIDE $divider
    }
    return [list CLKIN_DIVIDE_BY_2 $halved {*}$settings PHASE_SHIFT $shift]
  }
}

# One output of a plan.
proc ::generator::kru::Output {notesName primitive handle request chosen in pin} {
  upvar 1 $notesName notes
  dict with chosen {
    # A KRU_CLKGEN has no feedback.
    set feedback [::generator::flag [dict get $request feedback]]
    set method GetKRUPkToPkJitter
    if {$primitive eq "KRU_CLKGEN"} {
      set feedback false
      set method GetKRU_CLKGENPkToPkJitter
    }
    set shifted [::generator::flag [expr {$shift != 0}]]
    set period [::generator::ask notes $handle GetKRUPeriodPhaseDutyCycle $in $pin $halved $m $d \
      $divider]
    set phase -
    set duty -
    if {$period ne "-"} {
      # That of the pin; the common offset comes on top.
      set phase [expr {[$handle GetLatestPhase] + $offset}]
      set duty [$handle GetLatestDutyCycle]
    }
    return [dict create place $pin frequency [Frequency $chosen $in $pin] \
      phase $phase duty $duty period $period \
      jitter [::generator::ask notes $handle $method $in $pin $halved $feedback $shifted $m $d]]
  }
}

# The frequency of a pin, MHz. GetKruChosenOutFreqN tells it with three decimals, which are too
# few for an error in ppm.
proc ::generator::kru::Frequency {chosen in pin} {
  dict with chosen {
    if {$halved} {
      set in [expr {$in / 2.0}]
    }
    switch -glob -- $pin {
      CLKFXDV { return [expr {double($in) * $m / $d / $divider}] }
      CLKFX*  { return [expr {double($in) * $m / $d}] }
      CLK2X*  { return [expr {$in * 2.0}] }
      CLKDV   { return [expr {double($in) / $divider}] }
    }
    return [expr {double($in)}]
  }
}
