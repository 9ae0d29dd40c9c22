# The engine: its package, and one run of one of its solvers through the methods of a handle.

package provide vorkel::engine 1.1
package require vorkel::options 1.1

namespace eval ::vorkel::engine {
  # Where the package stands when the environment does not say it: in the build folder.
  variable checkout [file dirname [file dirname [file dirname [file normalize [info script]]]]]
  variable bundled [file join $checkout build ip_vorkel1.1]
  # How many clocks the primitives can have.
  variable most_inputs  {PLL 2 TSYN 2 KRU_SP 1 KRU_CLKGEN 1}
  variable most_outputs {PLL 7 TSYN 7 KRU_SP 6 KRU_CLKGEN 6}
  # What the engine answers when it cannot read the limits of the device that it was given.
  variable noData "Could not get data from speedsfile."
}

# Loads the engine's package, and with it the host's command ::Vorkel::Devices. The folder of
# the package is VORKEL_PACKAGE_DIR, or the bundled one. An installed package of the same name
# elsewhere is not used.
proc ::vorkel::engine::load {} {
  variable bundled
  set dir $bundled
  if {[info exists ::env(VORKEL_PACKAGE_DIR)] && $::env(VORKEL_PACKAGE_DIR) ne ""} {
    set dir [file normalize [::vorkel::options::path $::env(VORKEL_PACKAGE_DIR)]]
  }
  set index [file join $dir pkgIndex.tcl]
  if {![file isfile $index]} {
    error "there is no engine in $dir; ./vorkel in the checkout builds it"
  }
  if {[catch {package present Ip_vorkel}]} {
    # An index finds its own folder in the variable `dir`.
    source $index
    package require Ip_vorkel 1.1
  }
}

# The family of a primitive: Loop for PLL and TSYN, Kru for KRU_SP and KRU_CLKGEN. A family
# shares its settings, and so the shape of its requests and solutions.
proc ::vorkel::engine::family {primitive} {
  return [expr {[string match KRU_* $primitive] ? "Kru" : "Loop"}]
}

# Those of some primitives that are of a family.
proc ::vorkel::engine::ofFamily {family primitives} {
  return [lmap primitive $primitives {
    if {[family $primitive] ne $family} continue
    set primitive
  }]
}

# Solves a request (see request.tcl). Answers a dict; LoopChosen and KruChosen tell what is in
# it. Without a configuration it throws {VORKEL UNSOLVED} with the engine's sentence; a device
# whose limits cannot be read is wrong usage.
#
# The engine's KRU solvers leave traces of a run for the next one, such as a CLKIN_DIVIDE_BY_2
# that a KRU_CLKGEN does not have; every run gets a handle of its own.
proc ::vorkel::engine::solve {request} {
  variable noData
  set handle [Ip::Vorkel::Init]
  try {
    $handle SetDevice [dict get $request part]
    set family [family [dict get $request primitive]]
    set answer [${family}Calculate $handle $request]
    if {$answer eq $noData} {
      throw {VORKEL USAGE} $answer
    }
    if {$answer ne "1"} {
      throw {VORKEL UNSOLVED} $answer
    }
    return [${family}Chosen $handle $request]
  } finally {
    rename $handle {}
  }
}

# Runs the solver of a PLL or a TSYN and answers its sentence, "1" for success. With a trace
# wanted the engine writes it to standard output.
proc ::vorkel::engine::LoopCalculate {handle request} {
  dict with request {
    $handle SetLowBandwidth [flag $lowBandwidth]
    lassign $inputs first second
    if {$second eq ""} {
      set second 0
    }
    set count [llength $outputs]
    set switches [list [flag $preferMaxVco] [flag $intDiv0]]
    if {$closest} {
      return [$handle GetClosestSolution $outputs $phases $duties $first $second $count \
        {*}$switches [flag [expr {$primitive eq "PLL"}]] [flag $trace]]
    }
    return [$handle ${primitive}CalculateActualOutFreqs $outputs $first $second $count \
      {*}$switches [flag $trace]]
  }
}

# The chosen configuration of a PLL or a TSYN:
#   vco       the VCO that the engine counted with, MHz, as it prints it
#   m, d      feedback multiplier and input divider
#   outputs   for each output a dict: divider; frequency, the engine's own figure (MHz);
#             phase (degrees) and duty (a fraction), both only in closest-solution mode
proc ::vorkel::engine::LoopChosen {handle request} {
  set outputs {}
  for {set n 0} {$n < [llength [dict get $request outputs]]} {incr n} {
    if {$n == 0} {
      set divider [$handle GetChosenDiv0]
    } else {
      set divider [$handle GetChosenDivN $n]
    }
    set output [dict create divider $divider frequency [$handle GetChosenOutFreqN $n]]
    if {[dict get $request closest]} {
      dict set output phase [$handle GetChosenPhaseN $n]
      dict set output duty [$handle GetChosenDutyCycleN $n]
    }
    lappend outputs $output
  }
  return [dict create vco [$handle GetChosenVCO] m [$handle GetChosenM] \
    d [$handle GetChosenD] outputs $outputs]
}

# The same for a KRU_SP or a KRU_CLKGEN.
proc ::vorkel::engine::KruCalculate {handle request} {
  dict with request {
    set count [llength $outputs]
    if {$primitive eq "KRU_CLKGEN"} {
      return [$handle KruClkgenCalculateActuals $outputs $phases $inputs $count [flag $trace]]
    }
    return [$handle KruCalculateActuals $outputs $phases $inputs $count [flag $feedback] \
      [flag $trace]]
  }
}

# The chosen configuration of a KRU:
#   pins         the pin of each output
#   m, d         multiplier and divider of CLKFX, CLKFX180 and CLKFXDV
#   divide       the divide of CLKDV or CLKFXDV
#   divideBy2    CLKIN_DIVIDE_BY_2, true or false; of a KRU_SP only, as what follows
#   phaseOffset  the phase that all outputs have beside that of their pin, degrees
#   phaseShift   PHASE_SHIFT, the whole number for it
proc ::vorkel::engine::KruChosen {handle request} {
  set pins {}
  for {set n 0} {$n < [llength [dict get $request outputs]]} {incr n} {
    lappend pins [$handle GetKruChosenPinname $n]
  }
  set solution [dict create pins $pins m [$handle GetKruChosenM] d [$handle GetKruChosenD] \
    divide [$handle GetKruChosenClkdv]]
  if {[dict get $request primitive] eq "KRU_SP"} {
    dict set solution divideBy2 [$handle GetKruChosenDivBy2]
    dict set solution phaseOffset [$handle GetKruChosenPhaseOffset]
    dict set solution phaseShift [$handle GetKruChosenPhaseShift]
  }
  return $solution
}

# A flag as the methods of a handle take it.
proc ::vorkel::engine::flag {value} {
  return [expr {$value ? "true" : "false"}]
}
