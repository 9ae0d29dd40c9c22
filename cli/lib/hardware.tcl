# The settings that a PLL and a TSYN have, whatever the device.

package provide vorkel::hardware 1.1

namespace eval ::vorkel::hardware {
  # M goes up to the largest one from 1 or, on a TSYN, from the smallest one; a TSYN has an M of 1
  # beside that.
  variable smallest_m {PLL 1 TSYN 5}
  variable largest_m 64
  variable largest_d 80
  variable largest_divider 128
  # Of which parts M and the divider of output 0 of a TSYN can be; no divider is between 1 and 2.
  variable fraction 8
  # The outputs from which on both are whole.
  variable whole_outputs 6
}

# The largest divider of a device. A divider holds its output high and then low, each for at most
# as many VCO periods as its counters go to; a divider of 1 does not count.
proc ::vorkel::hardware::largestDivider {limits} {
  variable largest_divider
  return [expr {int(max(1, min($largest_divider, 2 * [dict get $limits O_MAX_HT_LT])))}]
}

# Whether M and the divider of output 0 may be fractions for a request.
proc ::vorkel::hardware::hasFractions {request primitive} {
  variable whole_outputs
  return [expr {$primitive eq "TSYN" && ![dict get $request intDiv0] &&
    [llength [dict get $request outputs]] < $whole_outputs}]
}
