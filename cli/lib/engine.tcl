# The engine: its package, and one run of its PLL/TSYN solver through the methods of a handle.

package provide vorkel::engine 1.1

namespace eval ::vorkel::engine {
  # Where the package stands when the environment does not say it: in the build folder.
  variable checkout [file dirname [file dirname [file dirname [file normalize [info script]]]]]
  variable bundled [file join $checkout build ip_vorkel1.1]
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
    set dir [file normalize $::env(VORKEL_PACKAGE_DIR)]
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

# Solves a request (see request.tcl). Answers a dict:
#   vco       the VCO that the engine counted with, MHz, as it prints it
#   m, d      feedback multiplier and input divider
#   outputs   for each output a dict: divider; frequency, the engine's own figure (MHz);
#             phase (degrees) and duty (a fraction), both only in closest-solution mode
# Without a configuration it throws {VORKEL UNSOLVED} with the engine's sentence; a device
# whose limits cannot be read is wrong usage.
proc ::vorkel::engine::solve {request} {
  variable noData
  set handle [Ip::Vorkel::Init]
  try {
    $handle SetDevice [dict get $request part]
    $handle SetLowBandwidth [Flag [dict get $request lowBandwidth]]
    set answer [Calculate $handle $request]
    if {$answer eq $noData} {
      throw {VORKEL USAGE} $answer
    }
    if {$answer ne "1"} {
      throw {VORKEL UNSOLVED} $answer
    }
    return [Chosen $handle $request]
  } finally {
    rename $handle {}
  }
}

# Runs the solver and answers its sentence, "1" for success. With a trace wanted the engine
# writes it to standard output.
proc ::vorkel::engine::Calculate {handle request} {
  dict with request {
    lassign $inputs first second
    if {$second eq ""} {
      set second 0
    }
    set count [llength $outputs]
    set switches [list [Flag $preferMaxVco] [Flag $intDiv0]]
    if {$closest} {
      return [$handle GetClosestSolution $outputs $phases $duties $first $second $count \
        {*}$switches [Flag [expr {$primitive eq "PLL"}]] [Flag $trace]]
    }
    return [$handle ${primitive}CalculateActualOutFreqs $outputs $first $second $count \
      {*}$switches [Flag $trace]]
  }
}

# Reads the chosen configuration back.
proc ::vorkel::engine::Chosen {handle request} {
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

# A flag as the methods of a handle take it.
proc ::vorkel::engine::Flag {value} {
  return [expr {$value ? "true" : "false"}]
}
