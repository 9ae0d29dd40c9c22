# The settings that the primitives have, whatever the device.

package provide vorkel::hardware 1.1

namespace eval ::vorkel::hardware {
  # M of a PLL or a TSYN goes from the smallest one up to the largest one; a TSYN has an M of 1
  # beside that.
  variable smallest_m {PLL 1 TSYN 5}
  variable largest_m 64
  variable largest_d 80
  variable largest_divider 128
  # Of which parts M and the divider of output 0 of a TSYN can be; no divider is between 1 and 2.
  variable fraction 8
  # The outputs from which on both are whole.
  variable whole_outputs 6
  # Of the KRUs: M of CLKFX is from the smallest one, and M and D go up to the largest one.
  variable kru_smallest_m 2
  variable kru_largest {KRU_SP 32 KRU_CLKGEN 256}
  # The divides of CLKDV of a KRU_SP, and of CLKFXDV of a KRU_CLKGEN.
  variable kru_divides {2 2.5 3 3.5 4 4.5 5 5.5 6 6.5 7 7.5 8 9 10 11 12 13 14 15 16 17}
  variable clkgen_divides {2 4 8 16 32}
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
