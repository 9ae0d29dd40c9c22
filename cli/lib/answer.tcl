# Answers: what a primitive makes of a request, with the error of everything that was asked for.
#
# A request is a dict (see request.tcl):
#   device, part   the part name as the engine takes it (both keys have it)
#   inputs         one or two input clocks, MHz
#   outputs        for each output a dict: freq (MHz), phase (degrees or ""), duty (percent or "")
#   inputJitter    ps, peak to peak
#   bandwidth      LOW, HIGH or OPTIMIZED; bandwidthAsked tells whether the user named it
#   feedback       whether a KRU_SP has its feedback connected
#   preferMaxVco, intDiv0
#                  switches
#   tolerance      ppm that a frequency may be off
#   limits         the limits of the device's grade, from keyword to number
#   primitives     those that the device has
#   primitive      only where the user has named one to plan, compare or best: that one
#
# An answer is a dict:
#   primitive      PLL, TSYN, KRU_SP or KRU_CLKGEN
#   source         engine, or grid for settings that come from elsewhere
#   variant        what was special about the search, such as "largest VCO", or ""
#   solved         0 or 1. An answer that is not solved has only the keys up to `reason`.
#   reason         why it is not solved, "" else
#   settings       names and values for display. PLL, TSYN: VCO, PFD (MHz), M, D. KRU_SP:
#                  CLKIN_DIVIDE_BY_2, M, D, CLKDV, "phase offset" (degrees), PHASE_SHIFT.
#                  KRU_CLKGEN: M, D, CLKFXDV. A KRU has only those that its outputs use.
#   searchVco      PLL, TSYN: the VCO that the engine counted with, or ""
#   bandwidth      of the loop; "" for a KRU
#   inputJitter    ps
#   phaseError     ps, or "" when it is not known
#   outputs        for each output a dict:
#     index        from 0
#     pin          of a KRU, else ""
#     divider      of a PLL or a TSYN, else ""
#     requested    MHz
#     actual       MHz, what the settings make
#     search       MHz, what the engine counted with, or ""
#     ratio        two whole numbers without a common factor: actual = input * first / second
#     ppm          (actual - requested) / requested * 1e6
#     reqPhase, phase, phaseError
#                  degrees; reqPhase and phaseError are "" when no phase was asked for
#     reqDuty, duty, dutyError
#                  percent, likewise
#     jitter       ps, peak to peak, or "" when it is not known; with that of the input
#     actual2      MHz, what the settings make of the second input; "" without one
#     outside      sentences on what of it is outside the device's limits
#     offs         those of ppm, phaseError and dutyError that are larger than they may be, and
#                  range and range2 when it is outside the device's limits, the latter with the
#                  second input
#     within       whether it is as asked for and in the device's range: offs is empty
#   violations     sentences on what is outside the device's limits, those of the outputs too
#   within         whether all outputs are within and there are no violations
#   worstPpm       the largest |ppm|
#   maxJitter      the largest jitter, ps, or "" when it is not known of all outputs
#   notes          sentences that a user should know beside the violations
#   request        the request with what the variant changed
#   timing         see timing.tcl

package provide vorkel::answer 1.1
package require vorkel::actual 1.1
package require vorkel::engine 1.1
package require vorkel::kru_notes 1.1
package require vorkel::kru_phases 1.1
package require vorkel::notes 1.1
package require vorkel::rank 1.1
package require vorkel::timing 1.1

namespace eval ::vorkel::answer {
  # An error of the frequency below this is the rounding of the arithmetic, ppm.
  variable rounding 1e-6
  # How far a phase (degrees) and a duty cycle (percent points) may be off.
  variable phase_tolerance 0.5
  variable duty_tolerance 0.5
}

# What the engine makes of a request. `variant` is a dict whose entries replace those of the
# request (bandwidth, feedback, preferMaxVco, intDiv0), and which may have `name`, the text for
# the answer, and `closest`, whether the engine is to choose by phases and duty cycles although
# there are none; that is how a preference for a VCO works without them.
proc ::vorkel::answer::solve {request primitive {variant {}}} {
  set name ""
  if {[dict exists $variant name]} {
    set name [dict get $variant name]
    dict unset variant name
  }
  set request [dict merge $request $variant]
  set refusal [refusal $request $primitive]
  if {$refusal ne ""} {
    return [unsolved $primitive $name $refusal]
  }
  set job [Job $request $primitive]
  if {[dict get $job family] eq "Kru"} {
    return [SolveKru $request $job $name]
  }
  return [Solve $request $job $name]
}

# What the engine makes of a job.
proc ::vorkel::answer::Solve {request job name} {
  try {
    set solution [::vorkel::engine::solve $job]
  } trap {VORKEL UNSOLVED} {sentence} {
    return [unsolved [dict get $job primitive] $name $sentence]
  }
  return [Evaluate $request $job $solution engine $name]
}

# The same of a KRU: the first answer that is within its tolerances, of all phases that stand for
# those of the request, or else the best.
proc ::vorkel::answer::SolveKru {request job name} {
  variable phase_tolerance
  set answers {}
  foreach phases [::vorkel::kru_phases::lists $request [dict get $job primitive] \
      $phase_tolerance] {
    set answer [Solve $request [dict replace $job phases $phases] $name]
    if {[dict get $answer within]} {
      return $answer
    }
    lappend answers $answer
  }
  return [lindex [rank $answers] 0]
}

# The answer that given settings are. PLL, TSYN: `settings` has M and D, and `places` the
# dividers of the outputs. KRU: `settings` has what the outputs use (see above), and `places`
# their pins. Each phase and duty cycle is the nearest that there is.
proc ::vorkel::answer::fromSettings {request primitive settings places {variant ""}} {
  set job [Job $request $primitive]
  set solution [dict create m [Setting $settings M 0] d [Setting $settings D 0]]
  if {[dict get $job family] eq "Loop"} {
    dict set solution vco ""
    dict set solution outputs [lmap divider $places {dict create divider $divider}]
  } else {
    dict set solution pins $places
    dict set solution divide [Setting $settings CLKDV [Setting $settings CLKFXDV 0]]
    if {$primitive eq "KRU_SP"} {
      dict set solution divideBy2 [Setting $settings CLKIN_DIVIDE_BY_2 false]
      dict set solution phaseOffset [Setting $settings {phase offset} 0]
      dict set solution phaseShift [Setting $settings PHASE_SHIFT 0]
    }
  }
  return [Evaluate $request $job $solution grid $variant]
}

# An answer that is none.
proc ::vorkel::answer::unsolved {primitive variant reason} {
  return [dict create primitive $primitive source engine variant $variant solved 0 \
    reason $reason within 0]
}

# The exit status that an answer stands for.
proc ::vorkel::answer::status {answer} {
  if {![dict get $answer solved]} {
    return 1
  }
  return [expr {[dict get $answer within] ? 0 : 3}]
}

proc ::vorkel::answer::Setting {settings name default} {
  if {[dict exists $settings $name]} {
    return [dict get $settings $name]
  }
  return $default
}

# Why a primitive cannot be asked at all, or "". The engine would leave out what is too much.
proc ::vorkel::answer::refusal {request primitive} {
  set inputs [llength [dict get $request inputs]]
  set outputs [llength [dict get $request outputs]]
  set most_inputs [dict get $::vorkel::engine::most_inputs $primitive]
  set most_outputs [dict get $::vorkel::engine::most_outputs $primitive]
  if {$inputs > $most_inputs} {
    return "A $primitive has $most_inputs input clock, not $inputs."
  }
  if {$outputs > $most_outputs} {
    return "A $primitive has at most $most_outputs outputs, not $outputs."
  }
  return ""
}

# The request as engine.tcl takes it.
proc ::vorkel::answer::Job {request primitive} {
  set family [::vorkel::engine::family $primitive]
  set phases [Column $request phase 0]
  set duties [Column $request duty 0]
  set job [dict create primitive $primitive family $family part [dict get $request device] \
    inputs [dict get $request inputs] outputs [Column $request freq ""] phases $phases \
    inputJitter [dict get $request inputJitter] limits [dict get $request limits] \
    trace [Setting $request trace 0]]
  if {$family eq "Kru"} {
    dict set job feedback [dict get $request feedback]
    return $job
  }
  return [dict merge $job [dict create duties $duties \
    closest [expr {[isShapeAsked $request] || [Setting $request closest 0]}] \
    bandwidth [dict get $request bandwidth] \
    lowBandwidth [expr {[dict get $request bandwidth] eq "LOW"}] \
    preferMaxVco [dict get $request preferMaxVco] intDiv0 [dict get $request intDiv0]]]
}

# Whether a request asks for something of some output: its phase or its duty cycle.
proc ::vorkel::answer::isAsked {request what} {
  foreach output [dict get $request outputs] {
    if {[dict get $output $what] ne ""} {
      return 1
    }
  }
  return 0
}

# Whether a request asks for a phase or a duty cycle of some output.
proc ::vorkel::answer::isShapeAsked {request} {
  return [expr {[isAsked $request phase] || [isAsked $request duty]}]
}

# The indices of the outputs of a request.
proc ::vorkel::answer::indices {request} {
  set indices {}
  foreach output [dict get $request outputs] {
    lappend indices [llength $indices]
  }
  return $indices
}

# An entry of each requested output, `default` for one that is empty.
proc ::vorkel::answer::Column {request key default} {
  return [lmap output [dict get $request outputs] {
    if {[dict get $output $key] eq ""} {
      set default
    } else {
      dict get $output $key
    }
  }]
}

# The answer that a solution is, in the form that engine.tcl has for them.
proc ::vorkel::answer::Evaluate {request job solution source variant} {
  set family [dict get $job family]
  set primitive [dict get $job primitive]
  set timing [::vorkel::timing::of $job $solution]
  set places [Setting $solution pins ""]
  set outputs {}
  foreach output [${family}Outputs $request $solution] \
      asked [dict get $request outputs] jitter [dict get $timing jitters] {
    set output [Judge $request [dict merge [dict create index [llength $outputs]] $output \
      [dict create requested [dict get $asked freq] reqPhase [dict get $asked phase] \
        reqDuty [dict get $asked duty] jitter $jitter]]]
    if {$family eq "Kru"} {
      set outside [::vorkel::kru_notes::ofOutput $request $places $output]
    } else {
      set outside [::vorkel::notes::ofOutput $request $primitive $output]
    }
    lappend outputs [Confine $output $outside]
  }
  set answer [dict create primitive $primitive source $source variant $variant solved 1 \
    reason "" settings [${family}Settings $request $solution] \
    searchVco [Setting $solution vco ""] bandwidth [Setting $job bandwidth ""] \
    inputJitter [dict get $request inputJitter] phaseError [dict get $timing phaseError] \
    outputs $outputs violations {} within 0 worstPpm 0.0 maxJitter "" notes {} \
    request $request timing $timing]
  set remarks [expr {$family eq "Kru" ? "kru_notes" : "notes"}]
  dict set answer violations [::vorkel::${remarks}::violations $answer]
  dict set answer notes [::vorkel::${remarks}::on $answer]
  return [Sum $answer]
}

# Adds what is told of all outputs together.
proc ::vorkel::answer::Sum {answer} {
  set within [expr {[llength [dict get $answer violations]] == 0}]
  set worst 0.0
  set jitters {}
  foreach output [dict get $answer outputs] {
    set within [expr {$within && [dict get $output within]}]
    set worst [expr {max($worst, abs([dict get $output ppm]))}]
    lappend jitters [dict get $output jitter]
  }
  dict set answer within $within
  dict set answer worstPpm $worst
  if {"" ni $jitters} {
    dict set answer maxJitter [tcl::mathfunc::max {*}$jitters]
  }
  return $answer
}

# Adds the errors of an output.
proc ::vorkel::answer::Judge {request output} {
  variable rounding
  set requested [dict get $output requested]
  set ppm [expr {([dict get $output actual] - $requested) / double($requested) * 1e6}]
  if {abs($ppm) < $rounding} {
    set ppm 0.0
  }
  dict set output ppm $ppm
  dict set output phaseError ""
  if {[dict get $output reqPhase] ne ""} {
    dict set output phaseError [::vorkel::actual::phaseDifference [dict get $output phase] \
      [dict get $output reqPhase]]
  }
  dict set output dutyError ""
  if {[dict get $output reqDuty] ne ""} {
    dict set output dutyError [expr {[dict get $output duty] - [dict get $output reqDuty]}]
  }
  dict set output offs [Offs $output [dict get $request tolerance]]
  dict set output within [expr {[llength [dict get $output offs]] == 0}]
  return $output
}

# Adds what of an output is outside the device's limits, a dict from a key of `offs` to sentences.
proc ::vorkel::answer::Confine {output outside} {
  dict set output outside [concat {*}[dict values $outside]]
  dict for {key sentences} $outside {
    if {[llength $sentences] > 0} {
      dict lappend output offs $key
      dict set output within 0
    }
  }
  return $output
}

# How large the error under a key of an output may be.
proc ::vorkel::answer::allowance {key tolerance} {
  variable phase_tolerance
  variable duty_tolerance
  switch -- $key {
    ppm { return $tolerance }
    phaseError { return $phase_tolerance }
    dutyError { return $duty_tolerance }
  }
}

# Whether the error under a key of an output is no larger than it may be.
proc ::vorkel::answer::isAllowed {key error {tolerance ""}} {
  variable rounding
  return [expr {abs($error) <= [allowance $key $tolerance] + $rounding}]
}

# The errors of an output that are larger than they may be.
proc ::vorkel::answer::Offs {output tolerance} {
  return [lmap key {ppm phaseError dutyError} {
    set error [dict get $output $key]
    if {$error eq "" || [isAllowed $key $error $tolerance]} continue
    set key
  }]
}

# The settings of a PLL or a TSYN, for display.
proc ::vorkel::answer::LoopSettings {request solution} {
  set input [lindex [dict get $request inputs] 0]
  set m [dict get $solution m]
  set d [dict get $solution d]
  # The engine writes M with three decimals.
  if {$m == round($m)} {
    set m [expr {round($m)}]
  }
  return [dict create VCO [expr {double($input) * $m / $d}] PFD [expr {double($input) / $d}] \
    M $m D $d]
}

# The outputs of a PLL or a TSYN. A phase and a duty cycle that the engine has chosen are told
# in three decimals; the step that they mean is taken.
proc ::vorkel::answer::LoopOutputs {request solution} {
  lassign [dict get $request inputs] input second
  set m [dict get $solution m]
  set first [dict get [lindex [dict get $solution outputs] 0] divider]
  set fractional [expr {$m != round($m) || $first != round($first)}]
  set most [dict get $request limits O_MAX_HT_LT]
  set outputs {}
  foreach output [dict get $solution outputs] asked [dict get $request outputs] {
    set divider [expr {double([dict get $output divider])}]
    set ratio [::vorkel::actual::loopRatio $m [dict get $solution d] $divider]
    set phase [Setting $output phase [dict get $asked phase]]
    set duty [dict get $asked duty]
    if {$duty ne "" && [dict exists $output duty] && [dict get $output duty] > 0} {
      set duty [expr {[dict get $output duty] * 100}]
    }
    # Nothing can be moved beside an M or a divider that changes from period to period.
    set phase [expr {$fractional || $phase eq "" ? 0.0 :
      [::vorkel::actual::phaseOnStep $phase $divider]}]
    set duty [expr {$fractional || $duty eq "" ? 50.0 :
      [::vorkel::actual::dutyOnStep $duty $divider $most]}]
    if {$divider == round($divider)} {
      set divider [expr {round($divider)}]
    }
    lappend outputs [dict create pin "" divider $divider \
      actual [::vorkel::actual::frequency $input $ratio] \
      actual2 [expr {$second eq "" ? "" : [::vorkel::actual::frequency $second $ratio]}] \
      search [Setting $output frequency ""] ratio $ratio phase $phase duty $duty]
  }
  return $outputs
}

# The settings of a KRU that its outputs use, for display.
proc ::vorkel::answer::KruSettings {request solution} {
  set pins [dict get $solution pins]
  set settings [dict create]
  if {[dict exists $solution divideBy2]} {
    dict set settings CLKIN_DIVIDE_BY_2 [dict get $solution divideBy2]
  }
  if {[lsearch -glob $pins CLKFX*] >= 0} {
    dict set settings M [dict get $solution m]
    dict set settings D [dict get $solution d]
  }
  foreach pin {CLKDV CLKFXDV} {
    if {$pin in $pins} {
      dict set settings $pin [expr {[string trim [dict get $solution divide]] + 0}]
    }
  }
  if {[dict exists $solution phaseShift]} {
    dict set settings {phase offset} [dict get $solution phaseOffset]
    dict set settings PHASE_SHIFT [dict get $solution phaseShift]
  }
  return $settings
}

# The outputs of a KRU.
proc ::vorkel::answer::KruOutputs {request solution} {
  set input [lindex [dict get $request inputs] 0]
  set shift [Setting $solution phaseShift 0]
  return [lmap pin [dict get $solution pins] {
    set ratio [::vorkel::actual::pinRatio $pin $solution]
    dict create pin $pin divider "" actual [::vorkel::actual::frequency $input $ratio] actual2 "" \
      search "" \
      ratio $ratio phase [::vorkel::actual::pinPhase $pin $shift] \
      duty [::vorkel::actual::pinDuty $pin [dict get $solution divide]]
  }]
}
