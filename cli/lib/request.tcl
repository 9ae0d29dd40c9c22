# A request to a primitive, from the options of the command line.

package provide vorkel::request 1.1
package require vorkel::catalogue 1.1
package require vorkel::engine 1.1
package require vorkel::numbers 1.1
package require vorkel::options 1.1

namespace eval ::vorkel::request {
  # How many clocks the primitives can have.
  variable most_inputs  {PLL 2 TSYN 2 KRU_SP 1 KRU_CLKGEN 1}
  variable most_outputs {PLL 7 TSYN 7 KRU_SP 6 KRU_CLKGEN 6}
  # The settings of the loop bandwidth of a PLL or a TSYN.
  variable bandwidths {LOW HIGH OPTIMIZED}
  variable default_bandwidth OPTIMIZED
  # The options of a PLL and a TSYN, and those of a KRU (see options.tcl).
  variable loop_options {
    --in F[,F2]       "input frequency; F2 is that of a second input clock"
    --out LIST        "frequencies of 1 to 7 outputs"
    --phase LIST      "phase of each output"
    --duty LIST       "duty cycle of each output, 0 where any will do"
    --device NAME     "part name: DEVICE\[PACKAGE]\[-GRADE]"
    --bandwidth NAME  "LOW (lower limit for the PFD), HIGH or OPTIMIZED (default)"
    --low-bandwidth   ""  "short for --bandwidth LOW"
    --prefer-max-vco  ""  "with --phase or --duty: take the highest VCO"
    --int-div0        ""  "a whole divider for output 0 of a TSYN"
    --input-jitter PS "peak-to-peak jitter of the input clock, 0 by default"
    --trace           ""  "print the steps of the search first"
  }
  variable kru_options {
    --in F            "input frequency"
    --out LIST        "frequencies of 1 to 6 outputs"
    --phase LIST      "phase of each output, 0 by default"
    --feedback        ""  "kru: use the feedback, without which it has only CLKFX pins"
    --device NAME     "part name: DEVICE\[PACKAGE]\[-GRADE]"
    --bandwidth NAME  "accepted, but a KRU has no such setting"
    --input-jitter PS "peak-to-peak jitter of the input clock, 0 by default"
    --trace           ""  "print the steps of the search first"
  }
}

# The options of the command for a primitive.
proc ::vorkel::request::optionsOf {primitive} {
  variable loop_options
  variable kru_options
  if {[::vorkel::engine::family $primitive] eq "Loop"} {
    return $loop_options
  }
  if {$primitive eq "KRU_SP"} {
    return $kru_options
  }
  set options {}
  foreach {name placeholder description} $kru_options {
    if {$name ne "--feedback"} {
      lappend options $name $placeholder $description
    }
  }
  return $options
}

# Reads the words of the command for a primitive. Everything is checked here, before the
# engine is called: it reads any text as a number. Answers a dict:
#   primitive            PLL, TSYN, KRU_SP or KRU_CLKGEN
#   part, limits         the full part name, and the limits of its grade (catalogue.tcl)
#   inputs               one or two frequencies, MHz; one for a KRU
#   outputs              requested frequencies, MHz
#   phases               degrees, one for each output; 0 is not asked for
#   phaseAsked           whether they were given
#   bandwidth            LOW, HIGH or OPTIMIZED
#   bandwidthAsked       whether it was given
#   inputJitter          ps, peak to peak
#   trace                a switch
# and what only some primitives have: see Loop and Kru.
proc ::vorkel::request::parse {primitive words} {
  variable most_inputs
  variable most_outputs
  set given [::vorkel::options::parse [optionsOf $primitive] $words]
  set operands [dict get $given operands]
  if {[llength $operands] > 0} {
    throw {VORKEL USAGE} "unexpected word \"[lindex $operands 0]\""
  }
  set inputs [Frequencies $given --in [dict get $most_inputs $primitive]]
  set outputs [Frequencies $given --out [dict get $most_outputs $primitive]]
  set request [dict create primitive $primitive inputs $inputs outputs $outputs \
    phases [PerOutput $given --phase any $outputs] phaseAsked [dict exists $given --phase] \
    bandwidth [Bandwidth $given] bandwidthAsked [dict exists $given --bandwidth] \
    inputJitter [InputJitter $given] trace [dict exists $given --trace]]
  set special [[::vorkel::engine::family $primitive] $given $outputs]
  set device [Device $primitive \
    [::vorkel::options::get $given --device $::vorkel::catalogue::defaultPart]]
  return [dict merge $request $special \
    [dict create part [dict get $device part] limits [dict get $device limits] \
      calculator [dict get $device calculator]]]
}

# What only a PLL and a TSYN have:
#   duties               percent, one for each output; 0 is not asked for
#   dutyAsked            whether they were given
#   closest              whether phases or duty cycles were: then the engine looks for the
#                        closest solution, else for the lowest power
#   lowBandwidth         whether the bandwidth is LOW, for which the PFD has a lower limit
#   preferMaxVco, intDiv0
#                        switches
proc ::vorkel::request::Loop {given outputs} {
  set dutyAsked [dict exists $given --duty]
  return [dict create duties [PerOutput $given --duty percentage $outputs] \
    dutyAsked $dutyAsked closest [expr {$dutyAsked || [dict exists $given --phase]}] \
    lowBandwidth [expr {[Bandwidth $given] eq "LOW"}] \
    preferMaxVco [dict exists $given --prefer-max-vco] intDiv0 [dict exists $given --int-div0]]
}

# What only a KRU has: the switch feedback.
proc ::vorkel::request::Kru {given outputs} {
  return [dict create feedback [dict exists $given --feedback]]
}

# The list of an option that must be there: 1 to `most` frequencies.
proc ::vorkel::request::Frequencies {given name most} {
  if {![dict exists $given $name]} {
    throw {VORKEL USAGE} "$name is missing"
  }
  set list [::vorkel::numbers::parseList [dict get $given $name] $name ::vorkel::numbers::positive]
  if {[llength $list] > $most} {
    set frequencies [expr {$most == 1 ? "frequency" : "frequencies"}]
    throw {VORKEL USAGE} "$name: at most $most $frequencies, not [llength $list]"
  }
  return $list
}

# The list of an option with one number for each output; zeros when it is not given.
proc ::vorkel::request::PerOutput {given name check outputs} {
  set count [llength $outputs]
  if {![dict exists $given $name]} {
    return [lrepeat $count 0]
  }
  set list [::vorkel::numbers::parseList [dict get $given $name] $name ::vorkel::numbers::$check]
  if {[llength $list] != $count} {
    throw {VORKEL USAGE} "$name: [llength $list] in the list, but --out has $count"
  }
  return $list
}

proc ::vorkel::request::Bandwidth {given} {
  variable bandwidths
  variable default_bandwidth
  set low [dict exists $given --low-bandwidth]
  set bandwidth [::vorkel::options::get $given --bandwidth \
    [expr {$low ? "LOW" : $default_bandwidth}]]
  if {$bandwidth ni $bandwidths} {
    throw {VORKEL USAGE} "--bandwidth: \"$bandwidth\" must be LOW, HIGH or OPTIMIZED"
  }
  if {$low && $bandwidth ne "LOW"} {
    throw {VORKEL USAGE} "--low-bandwidth and --bandwidth $bandwidth contradict each other"
  }
  return $bandwidth
}

proc ::vorkel::request::InputJitter {given} {
  return [::vorkel::numbers::parseOne [::vorkel::options::get $given --input-jitter 0] \
    --input-jitter ::vorkel::numbers::notNegative]
}

# The device of a part name, which must have the primitive.
proc ::vorkel::request::Device {primitive part} {
  set device [::vorkel::catalogue::resolve $part]
  set primitives [dict get $device primitives]
  if {$primitive ni $primitives} {
    throw {VORKEL USAGE} "[dict get $device part] has no $primitive; it has [join $primitives {, }]"
  }
  return $device
}
