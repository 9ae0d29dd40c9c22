# What a user should know about a configuration of a KRU although the engine accepts it. The
# engine tests what was asked for and not what comes out, gives a pin up for CLKFX without a
# look at the range of CLKFX, and looks for a KRU_CLKGEN in ranges that are not the device's.

package provide vorkel::kru_notes 1.1
package require vorkel::catalogue 1.1
package require vorkel::notes 1.1
package require vorkel::numbers 1.1
package require vorkel::timing 1.1

namespace eval ::vorkel::kru_notes {}

# What of the configuration of an answer (see answer.tcl) is outside the device's range, as
# sentences.
proc ::vorkel::kru_notes::violations {answer} {
  return [concat {*}[lmap output [dict get $answer outputs] {dict get $output outside}]]
}

# What of an output is outside the device's range, as that of notes.tcl. `pins` are those of all
# outputs.
proc ::vorkel::kru_notes::ofOutput {request pins output} {
  return [dict create range [::vorkel::notes::outside "output [dict get $output index]" \
    [dict get $output actual] {*}[Range [dict get $output pin] $pins [dict get $request limits]]]]
}

# The other notes on an answer, as sentences.
proc ::vorkel::kru_notes::on {answer} {
  set notes {}
  set request [dict get $answer request]
  set phase [dict get [lindex [dict get $request outputs] 0] phase]
  if {[dict get $answer primitive] eq "KRU_CLKGEN" && $phase ne "" && $phase != 0} {
    lappend notes "output 0 is at phase 0: a KRU_CLKGEN has it on CLKFX whatever its phase"
  }
  if {[dict get $request bandwidthAsked]} {
    lappend notes "--bandwidth changes nothing: a KRU has no such setting"
  }
  set jitter [dict get $request inputJitter]
  set timing [dict get $answer timing]
  if {$jitter > 0 && [::vorkel::timing::isKnown $timing]} {
    lappend notes "the jitter of each output is with all of the input's,\
      [::vorkel::numbers::short $jitter 6] ps, which passes through a KRU"
  }
  return [list {*}$notes {*}[::vorkel::notes::refusals $timing]]
}

# The range of a pin, and what to say of it, when the outputs have these pins. The feedback is
# taken from output 0.
proc ::vorkel::kru_notes::Range {pin pins limits} {
  set range [::vorkel::catalogue::pinRange $pin 0 $limits]
  set whose " for $pin"
  if {[lindex $pins 0] eq "CLK2X"} {
    set doubled [::vorkel::catalogue::pinRange $pin 1 $limits]
    if {$doubled ne $range} {
      return [list $doubled "$whose with feedback from CLK2X"]
    }
  }
  return [list $range $whose]
}
