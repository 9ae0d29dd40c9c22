# What a user should know about a configuration although the engine accepts it. The engine
# tests less than a device demands: output 0 only through the range of the VCO, the
# phase-frequency detector only with the first input clock, and the VCO that it looks for
# rather than the one that M and D give, which can lie just outside the range.

package provide vorkel::notes 1.1
package require vorkel::catalogue 1.1
package require vorkel::numbers 1.1

namespace eval ::vorkel::notes {}

# The notes on a request and the clocks of its configuration (see report.tcl), as sentences.
proc ::vorkel::notes::on {request clocks} {
  set primitive [dict get $request primitive]
  set limits [dict get $request limits]
  set notes {}
  set vcoRange [::vorkel::catalogue::vcoRange $primitive $limits]
  set pfdRange [::vorkel::catalogue::pfdRange $primitive $limits]
  foreach vco [dict get $clocks vcos] pfd [dict get $clocks pfds] \
      suffix {"" " with the second input"} {
    lappend notes {*}[Outside "the VCO$suffix" $vco $vcoRange]
    lappend notes {*}[Outside "the PFD$suffix" $pfd $pfdRange]
  }
  set first [lindex [dict get $clocks outputs] 0]
  lappend notes {*}[Outside "output 0" [dict get $first frequency] \
    [::vorkel::catalogue::outputRange $primitive $limits]]
  set divider [dict get $first divider]
  if {[dict get $request closest] && $primitive eq "TSYN" && $divider != round($divider)} {
    lappend notes "with a fractional divider all phases are 0 and all duty cycles 50 %;\
      --int-div0 avoids it"
  }
  if {[dict get $request preferMaxVco] && ![dict get $request closest]} {
    lappend notes "--prefer-max-vco counts only with --phase or --duty"
  }
  if {[dict get $request intDiv0] && $primitive eq "PLL"} {
    lappend notes "--int-div0 changes nothing: all dividers of a PLL are whole numbers"
  }
  return $notes
}

# A list of one sentence when there is a frequency and it is outside the range, else none.
proc ::vorkel::notes::Outside {what frequency range} {
  lassign $range lowest highest
  if {$frequency eq "" || ($frequency >= $lowest && $frequency <= $highest)} {
    return {}
  }
  return [list "$what is at [::vorkel::numbers::short $frequency 6] MHz, outside the\
    device's range of $lowest to $highest MHz"]
}
