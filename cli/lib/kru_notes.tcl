# What a user should know about a configuration of a KRU although the engine accepts it. The
# engine tests what was asked for and not what comes out, gives a pin up for CLKFX without a
# look at the range of CLKFX, and looks for a KRU_CLKGEN in ranges that are not the device's.

package provide vorkel::kru_notes 1.1
package require vorkel::catalogue 1.1
package require vorkel::notes 1.1
package require vorkel::numbers 1.1
package require vorkel::timing 1.1

namespace eval ::vorkel::kru_notes {}

# The notes on a request, its solution (see engine.tcl), the frequencies of the outputs and the
# timing (see timing.tcl), as sentences.
proc ::vorkel::kru_notes::on {request solution frequencies timing} {
  set notes {}
  set pins [dict get $solution pins]
  set n 0
  foreach pin $pins frequency $frequencies {
    lappend notes {*}[::vorkel::notes::outside "output $n" $frequency \
      {*}[Range $pin $pins [dict get $request limits]]]
    incr n
  }
  scan [lindex [dict get $request phases] 0] %f phase
  if {[dict get $request primitive] eq "KRU_CLKGEN" && $phase != 0} {
    lappend notes "output 0 is at phase 0: a KRU_CLKGEN has it on CLKFX whatever its phase"
  }
  if {[dict get $request bandwidthAsked]} {
    lappend notes "--bandwidth changes nothing: a KRU has no such setting"
  }
  scan [dict get $request inputJitter] %f jitter
  if {$jitter > 0 && [::vorkel::timing::isKnown $timing]} {
    lappend notes "the input's jitter passes through a KRU: add up to\
      [::vorkel::numbers::short $jitter 3] ps to each output's"
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
