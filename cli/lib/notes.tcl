# What a user should know about a configuration although the engine accepts it. The engine
# tests less than a device demands: output 0 only through the range of the VCO, the
# phase-frequency detector only with the first input clock, and the VCO that it looks for
# rather than the one that M and D give, which can lie just outside the range.

package provide vorkel::notes 1.1
package require vorkel::answer 1.1
package require vorkel::catalogue 1.1
package require vorkel::colour 1.1
package require vorkel::hardware 1.1
package require vorkel::numbers 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::notes {
  # MHz. A frequency that reads like a limit, in a report to 1 Hz, is not outside of it: it can
  # be so by the rounding of the arithmetic alone.
  variable rounding 5e-7
  # The engine prints 3 decimals. What differs by no more than their rounding agrees.
  variable visible 0.0006
  # What is said behind what runs at another frequency with the second input clock.
  variable second " with the second input"
  # What the errors of an output are those of, and their units.
  variable error_words {
    ppm {frequency ppm} phaseError {phase degrees} dutyError {{duty cycle} {percent points}}
  }
}

# What of the configuration of an answer (see answer.tcl) is outside the device's range, as
# sentences.
proc ::vorkel::notes::violations {answer} {
  variable second
  set primitive [dict get $answer primitive]
  set request [dict get $answer request]
  set limits [dict get $request limits]
  set m [dict get $answer settings M]
  set d [dict get $answer settings D]
  set violations {}
  set vcoRange [::vorkel::catalogue::vcoRange $primitive $limits]
  set pfdRange [::vorkel::catalogue::pfdRange $primitive $limits [dict get $answer bandwidth]]
  foreach input [dict get $request inputs] suffix [list "" $second] {
    if {$input eq ""} continue
    lappend violations {*}[outside "the VCO$suffix" [expr {double($input) * $m / $d}] $vcoRange]
    lappend violations {*}[outside "the PFD$suffix" [expr {double($input) / $d}] $pfdRange]
  }
  foreach output [dict get $answer outputs] {
    lappend violations {*}[dict get $output outside]
  }
  return $violations
}

# What of an output is outside the device's range: a dict from the key that `offs` of the output
# has for it to a list of sentences.
proc ::vorkel::notes::ofOutput {request primitive output} {
  variable second
  set index [dict get $output index]
  set limits [dict get $request limits]
  set range [::vorkel::catalogue::outputRange $primitive $limits $index]
  set sentences [outside "output $index" [dict get $output actual] $range]
  set divider [dict get $output divider]
  if {$divider > [::vorkel::hardware::largestDivider $limits]} {
    lappend sentences "output $index: divider [::vorkel::numbers::short $divider 3] needs a high or\
      low time above [dict get $limits O_MAX_HT_LT] VCO periods, the device's most"
  }
  return [dict create range $sentences \
    range2 [outside "output $index$second" [dict get $output actual2] $range]]
}

# The other notes on an answer, as sentences.
proc ::vorkel::notes::on {answer} {
  set primitive [dict get $answer primitive]
  set request [dict get $answer request]
  set divider [dict get [lindex [dict get $answer outputs] 0] divider]
  set closest [expr {[dict exists $request closest] && [dict get $request closest]}]
  set asked [::vorkel::answer::isShapeAsked $request]
  set notes [Search $answer]
  if {[llength [dict get $request inputs]] > 1 && [isVcoOff $answer]} {
    set notes [linsert $notes 0 "the search took the VCO as [dict get $answer searchVco] MHz"]
  }
  set m [dict get $answer settings M]
  set fractions {}
  if {$m != round($m)} {
    lappend fractions M
  }
  if {$divider != round($divider)} {
    lappend fractions divider
  }
  if {$asked && $primitive eq "TSYN" && [llength $fractions] > 0} {
    lappend notes "with a fractional [join $fractions { and }] all phases are 0 and all duty\
      cycles 50 %; --int-div0 avoids it"
  }
  # That is so of the engine; the search over the grid has an order of its own.
  if {[dict get $request preferMaxVco] && !$asked && !$closest &&
      [dict get $answer source] eq "engine"} {
    lappend notes "--prefer-max-vco counts only with --phase or --duty"
  }
  if {[dict get $request intDiv0] && $primitive eq "PLL"} {
    lappend notes "--int-div0 changes nothing: all dividers of a PLL are whole numbers"
  }
  return [list {*}$notes {*}[refusals [dict get $answer timing]]]
}

# Whether the engine counted with a VCO that can be seen to differ from that of its settings.
proc ::vorkel::notes::isVcoOff {answer} {
  variable visible
  set counted [dict get $answer searchVco]
  return [expr {$counted ne "" &&
    abs($counted - [dict get $answer settings VCO]) > $visible}]
}

# A list of one sentence when the engine counted with frequencies that can be seen to differ from
# those of its settings, else none.
proc ::vorkel::notes::Search {answer} {
  variable visible
  set figures {}
  set differ 0
  foreach output [dict get $answer outputs] {
    set search [dict get $output search]
    if {$search eq ""} {
      return {}
    }
    lappend figures $search
    set differ [expr {$differ || abs($search - [dict get $output actual]) > $visible}]
  }
  if {!$differ} {
    return {}
  }
  return [list "the search counted with [join $figures {, }] MHz, which M and D do not make"]
}

# All that is to be said of an answer: what is off, what is outside the device's range, and the
# other notes.
proc ::vorkel::notes::all {answer} {
  return [list {*}[errors $answer] {*}[dict get $answer violations] {*}[dict get $answer notes]]
}

# What of the outputs is outside its tolerance, as sentences.
proc ::vorkel::notes::errors {answer} {
  variable error_words
  set errors {}
  foreach output [dict get $answer outputs] {
    set parts [lmap key [dict get $output offs] {
      if {![dict exists $error_words $key]} continue
      lassign [dict get $error_words $key] what unit
      set allowed [::vorkel::answer::allowance $key [dict get $answer request tolerance]]
      string cat "$what is off by [Figure [dict get $output $key]] $unit, with " \
        "[::vorkel::numbers::short $allowed 6] allowed"
    }]
    if {[llength $parts] > 0} {
      lappend errors "output [dict get $output index]: the [join $parts {; the }]"
    }
  }
  return $errors
}

# An error with two decimals, or with as many as it takes not to look like none.
proc ::vorkel::notes::Figure {error} {
  if {abs($error) < 0.005} {
    return [format %.2g $error]
  }
  return [::vorkel::numbers::fixed $error 2]
}

# The notes as the end of a report: a blank line and a paragraph for each, or nothing.
proc ::vorkel::notes::text {notes} {
  set text ""
  if {[llength $notes] > 0} {
    append text \n
  }
  foreach note $notes {
    append text [::vorkel::colour::paint note [::vorkel::table::prose "note: " $note]]
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
