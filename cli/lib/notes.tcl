# What a user should know about a configuration although the engine accepts it. The engine
# tests less than a device demands: output 0 only through the range of the VCO, the
# phase-frequency detector only with the first input clock, and the VCO that it looks for
# rather than the one that M and D give, which can lie just outside the range.

package provide vorkel::notes 1.1
package require vorkel::catalogue 1.1
package require vorkel::numbers 1.1

namespace eval ::vorkel::notes {
  # MHz. A frequency that reads like a limit, in a report to 1 Hz, is not outside of it: it can
  # be so by the rounding of the arithmetic alone.
  variable rounding 5e-7
}

# The notes on a request, the clocks of its configuration (see report.tcl) and their timing
# (see timing.tcl), as sentences.
proc ::vorkel::notes::on {request clocks timing} {
  set primitive [dict get $request primitive]
  set limits [dict get $request limits]
  set notes {}
  set vcoRange [::vorkel::catalogue::vcoRange $primitive $limits]
  set pfdRange [::vorkel::catalogue::pfdRange $primitive $limits]
  foreach vco [dict get $clocks vcos] pfd [dict get $clocks pfds] \
      suffix {"" " with the second input"} {
    lappend notes {*}[outside "the VCO$suffix" $vco $vcoRange]
    lappend notes {*}[outside "the PFD$suffix" $pfd $pfdRange]
  }
  set first [lindex [dict get $clocks outputs] 0]
  lappend notes {*}[outside "output 0" [dict get $first frequency] \
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
  return [list {*}$notes {*}[refusals $timing]]
}

# The notes as the end of a report: a blank line and a line for each, or nothing.
proc ::vorkel::notes::text {notes} {
  set text ""
  if {[llength $notes] > 0} {
    append text \n
  }
  foreach note $notes {
    append text "note: $note\n"
  }
  return $text
}

# What figures of the timing there are not, and why.
proc ::vorkel::notes::refusals {timing} {
  set notes {}
  set all [llength [dict get $timing jitters]]
  dict for {reason figures} [dict get $timing refusals] {
    set missing {}
    set outputs [lsearch -inline -all -not $figures phaseError]
    if {[llength $outputs] == $all} {
      lappend missing "no jitter"
    } elseif {[llength $outputs] > 0} {
      set noun [expr {[llength $outputs] == 1 ? "output" : "outputs"}]
      lappend missing "no jitter of $noun [join $outputs {, }]"
    }
    if {"phaseError" in $figures} {
      lappend missing "no phase error"
    }
    lappend notes "[join $missing { and }]: $reason"
  }
  return $notes
}

# A list of one sentence when there is a frequency and it is outside the range, else none.
# `whose` says what in the device has that range.
proc ::vorkel::notes::outside {what frequency range {whose ""}} {
  variable rounding
  lassign $range lowest highest
  if {$frequency eq "" ||
      ($frequency >= $lowest - $rounding && $frequency <= $highest + $rounding)} {
    return {}
  }
  foreach number {frequency lowest highest} {
    set $number [::vorkel::numbers::short [set $number] 6]
  }
  return [list \
    "$what is at $frequency MHz, outside the device's range$whose of $lowest to $highest MHz"]
}
