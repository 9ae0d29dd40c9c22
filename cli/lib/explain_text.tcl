# What explain says things with: findings, outputs, numbers and changes.
#
# A finding is a dict: kind (see explain.tcl), outputs (a list of indices, empty when it is the
# input clocks'), and text, a sentence with the numbers, without its full stop.

package provide vorkel::explain_text 1.1
package require vorkel::numbers 1.1
package require vorkel::options 1.1

namespace eval ::vorkel::explain_text {}

proc ::vorkel::explain_text::finding {kind outputs text} {
  return [dict create kind $kind outputs $outputs text $text]
}

# "output 1", "outputs 1, 2 and 3".
proc ::vorkel::explain_text::outputs {indices} {
  return "output[expr {[llength $indices] > 1 ? "s" : ""}]\
    [::vorkel::options::enumerate $indices]"
}

# A number in up to six decimals, or as it is short when that would be very long or nothing.
proc ::vorkel::explain_text::number {value} {
  if {abs($value) >= 1e9 || ($value != 0 && abs($value) < 1e-6)} {
    return [format %.6g $value]
  }
  return [::vorkel::numbers::short $value 6]
}

# A frequency in MHz, in as many digits as it takes to be that one.
proc ::vorkel::explain_text::plainMHz {frequency} {
  set text [::vorkel::numbers::short $frequency 6]
  if {abs($text - $frequency) <= 1e-13 * $frequency} {
    return $text
  }
  return [format %.15g $frequency]
}

# How far a frequency is from another one.
proc ::vorkel::explain_text::change {value frequency} {
  return [far [expr {($value / $frequency - 1) * 1e6}]]
}

# An error in ppm as text, in percent when it is much; with its sign, or without one.
proc ::vorkel::explain_text::far {ppm {signed 1}} {
  set flag [expr {$signed ? "+" : ""}]
  if {abs($ppm) >= 1e4} {
    return "[format %${flag}.3g [expr {$ppm / 1e4}]] %"
  }
  return "[format %${flag}.2f $ppm] ppm"
}
