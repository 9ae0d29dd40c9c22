# A request to a PLL or a TSYN, from the options of the command line.

package provide vorkel::request 1.1
package require vorkel::catalogue 1.1
package require vorkel::numbers 1.1
package require vorkel::options 1.1

namespace eval ::vorkel::request {
  variable most_inputs 2
  variable most_outputs 7
  variable options {
    --in F[,F2]       "input frequency; F2 is that of a second input clock"
    --out LIST        "frequencies of 1 to 7 outputs"
    --phase LIST      "phase of each output"
    --duty LIST       "duty cycle of each output, 0 where any will do"
    --device NAME     "part name: DEVICE\[PACKAGE]\[-GRADE]"
    --low-bandwidth   ""  "low-bandwidth loop: a lower limit for the PFD"
    --prefer-max-vco  ""  "with --phase or --duty: take the highest VCO"
    --int-div0        ""  "a whole divider for output 0 of a TSYN"
    --trace           ""  "print the steps of the search first"
  }
}

# Reads the words of the command for a primitive, PLL or TSYN. Everything is checked here,
# before the engine is called: it reads any text as a number. Answers a dict:
#   primitive            PLL or TSYN
#   part, limits         the full part name, and the limits of its grade (catalogue.tcl)
#   inputs               one or two frequencies, MHz
#   outputs              requested frequencies, MHz
#   phases, duties       degrees and percent, one for each output; 0 is not asked for
#   phaseAsked, dutyAsked, closest
#                        which of the two lists was given, and whether any was: then the
#                        engine looks for the closest solution, else for the lowest power
#   lowBandwidth, preferMaxVco, intDiv0, trace
#                        switches
proc ::vorkel::request::parse {primitive words} {
  variable options
  variable most_inputs
  variable most_outputs
  set given [::vorkel::options::parse $options $words]
  set operands [dict get $given operands]
  if {[llength $operands] > 0} {
    throw {VORKEL USAGE} "unexpected word \"[lindex $operands 0]\""
  }
  set inputs [Frequencies $given --in $most_inputs]
  set outputs [Frequencies $given --out $most_outputs]
  set phases [PerOutput $given --phase any $outputs]
  set duties [PerOutput $given --duty percentage $outputs]
  set phaseAsked [dict exists $given --phase]
  set dutyAsked [dict exists $given --duty]
  set device [Device $primitive \
    [::vorkel::options::get $given --device $::vorkel::catalogue::defaultPart]]
  return [dict create primitive $primitive \
    part [dict get $device part] limits [dict get $device limits] \
    inputs $inputs outputs $outputs phases $phases duties $duties \
    phaseAsked $phaseAsked dutyAsked $dutyAsked closest [expr {$phaseAsked || $dutyAsked}] \
    lowBandwidth [dict exists $given --low-bandwidth] \
    preferMaxVco [dict exists $given --prefer-max-vco] \
    intDiv0 [dict exists $given --int-div0] trace [dict exists $given --trace]]
}

# The list of an option that must be there: 1 to `most` frequencies.
proc ::vorkel::request::Frequencies {given name most} {
  if {![dict exists $given $name]} {
    throw {VORKEL USAGE} "$name is missing"
  }
  set list [::vorkel::numbers::parseList [dict get $given $name] $name ::vorkel::numbers::positive]
  if {[llength $list] > $most} {
    throw {VORKEL USAGE} "$name: at most $most frequencies, not [llength $list]"
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

# The device of a part name, which must have the primitive.
proc ::vorkel::request::Device {primitive part} {
  set device [::vorkel::catalogue::resolve $part]
  set primitives [dict get $device primitives]
  if {$primitive ni $primitives} {
    throw {VORKEL USAGE} "[dict get $device part] has no $primitive; it has [join $primitives {, }]"
  }
  return $device
}
