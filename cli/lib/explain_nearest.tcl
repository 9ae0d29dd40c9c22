# The nearest requests that work. None is told that the engine has not answered within all
# tolerances.

package provide vorkel::explain_nearest 1.1
package require vorkel::actual 1.1
package require vorkel::answer 1.1
package require vorkel::catalogue 1.1
package require vorkel::engine 1.1
package require vorkel::explain_calls 1.1
package require vorkel::explain_ladder 1.1
package require vorkel::explain_loop 1.1
package require vorkel::explain_text 1.1
package require vorkel::explain_vcos 1.1
package require vorkel::grid 1.1
package require vorkel::hardware 1.1
package require vorkel::numbers 1.1
package require vorkel::output_range 1.1
package require vorkel::progress 1.1
package require vorkel::units 1.1

namespace eval ::vorkel::explain_nearest {
  namespace path ::vorkel::explain_text
  # Oscillators that are on the shelf, MHz.
  variable stock {
    8 10 12 12.288 13 14.31818 14.7456 16 18.432 19.2 19.44 20 22.1184 24 24.576 25 26 27 30 32
    33.3333 37.125 38.4 40 48 50 54 60 62.5 66.6667 74.25 80 100 106.25 122.88 125 133.3333 148.5
    150 153.6 155.52 156.25 161.1328125 200 212.5 250
  }
  # As many frequencies of a primitive are tried below and above an output. Of several primitives
  # the nearest one that works is told, of a single one the nearest two.
  variable most_tried 300
  variable told_of_one 2
  variable told_of_each 1
  # As many requests with all outputs moved are tried, and as many told.
  variable most_sets_tried 12
  variable most_sets 2
  # As many runs of the engine are made for all of it, and how many there have been. Runs are
  # counted and not the time, so that the answer is the same on every machine. `stopped` tells that
  # something has not been searched to its end.
  variable most_runs 4000
  variable runs 0
  variable stopped 0
  # The input clock can be a quotient with a divisor of up to this, such as 100/3 MHz or 7 ns.
  variable largest_divisor 100
  # The VCO frequencies that serve all outputs, by primitive, outputs and range.
  variable vcos
  # What stands nearer to an output than what is told of a PLL or a TSYN: settings make it, but the
  # engine does not take them. For each output a list of texts.
  variable passed {}
}

# Begins to count the runs of the search.
proc ::vorkel::explain_nearest::start {} {
  variable runs
  variable stopped
  variable passed
  set runs 0
  set stopped 0
  set passed {}
}

# Whether all runs have been made.
proc ::vorkel::explain_nearest::isSpent {} {
  variable most_runs
  variable runs
  variable stopped
  if {$runs < $most_runs} {
    return 0
  }
  set stopped 1
  return 1
}

# The engine's first answer of a primitive that is within all tolerances, or "". A narrow loop,
# which the user can ask for, has another range of the PFD; it is tried where it is left open and
# the engine has an answer, which is off.
proc ::vorkel::explain_nearest::proof {request primitive} {
  variable runs
  set widths [list [dict get $request bandwidth]]
  if {[::vorkel::engine::family $primitive] eq "Loop" &&
      ![dict get $request bandwidthAsked]} {
    lappend widths LOW
  }
  dict set request bandwidthAsked 1
  foreach width $widths {
    set solved 0
    dict set request bandwidth $width
    foreach variant [::vorkel::answer::variants $request $primitive] {
      incr runs
      set answer [::vorkel::answer::solve $request $primitive $variant]
      if {[dict get $answer within]} {
        return $answer
      }
      incr solved [dict get $answer solved]
    }
    if {$solved == 0} break
  }
  return ""
}

# A frequency as it can be given to the program: in up to six decimals if these are exact, else
# as a quotient.
proc ::vorkel::explain_nearest::Spell {frequency input ratio} {
  set text [plainMHz $frequency]
  if {abs([::vorkel::numbers::short $frequency 6] - $frequency) <= 1e-13 * $frequency} {
    return $text
  }
  variable largest_divisor
  lassign $ratio multiply divide
  for {set divisor 1} {$divisor <= $largest_divisor} {incr divisor} {
    set product [::vorkel::numbers::short [expr {double($input) * $multiply * $divisor}] 6]
    set whole [expr {$divide * $divisor}]
    if {abs(double($product) / $whole - $frequency) <= 1e-13 * $frequency} {
      if {$product == round($product)} {
        lassign [::vorkel::actual::reduce [expr {round($product)}] $whole] product whole
      }
      return $product/$whole
    }
  }
  return $text
}

# The frequencies for an output that work with all else as asked for: the nearest below and above
# of each primitive, the nearest of all first. Dicts of text (to be given to the program),
# frequency (MHz), ppm (from what was asked) and labels of all primitives that make it (see
# explain_calls.tcl).
proc ::vorkel::explain_nearest::frequencies {request primitives index} {
  variable told_of_one
  variable told_of_each
  set count [expr {[llength $primitives] == 1 ? $told_of_one : $told_of_each}]
  set told [dict create]
  foreach primitive $primitives {
    foreach side {below above} {
      foreach near [Working $request $primitive $index $side $count] {
        set key [format %.12g [dict get $near frequency]]
        if {![dict exists $told $key]} {
          dict set told $key $near
        }
      }
      ::vorkel::progress::step
    }
  }
  set asked [dict get [lindex [dict get $request outputs] $index] freq]
  return [lsort -command ::vorkel::explain_nearest::Nearer [lmap near [dict values $told] {
    set frequency [dict get $near frequency]
    dict set near ppm [expr {($frequency / $asked - 1) * 1e6}]
    set changed [with $request $index freq $frequency]
    dict set near labels [lmap primitive [Makers $changed $primitives [dict get $near primitives]] {
      ::vorkel::explain_calls::label $changed $primitive
    }]
  }]]
}

proc ::vorkel::explain_nearest::Nearer {one other} {
  set difference [expr {abs([dict get $one ppm]) - abs([dict get $other ppm])}]
  return [expr {$difference < 0 ? -1 : $difference > 0}]
}

# As many frequencies of a primitive on one side as are wanted, the nearest ones that work.
proc ::vorkel::explain_nearest::Working {request primitive index side count} {
  variable most_tried
  variable stopped
  variable passed
  if {[isSpent] || [::vorkel::answer::refusal $request $primitive] ne ""} {
    return {}
  }
  set input [lindex [dict get $request inputs] 0]
  set search [::vorkel::explain_ladder::search $request $primitive $index $side]
  set told {}
  set missed {}
  set tried 0
  while {[llength $told] < $count &&
      [set rung [::vorkel::explain_ladder::next search]] ne ""} {
    if {[isSpent]} break
    if {[incr tried] > $most_tried} {
      set stopped 1
      break
    }
    set text [Spell [lindex $rung 1] $input [::vorkel::explain_ladder::ratio $search $rung]]
    set frequency [::vorkel::units::value $text frequency nearest]
    if {[proof [with $request $index freq $frequency] $primitive] ne ""} {
      lappend told [dict create text $text frequency $frequency primitives [list $primitive]]
    } elseif {[llength $told] == 0} {
      lappend missed $text
    }
  }
  if {[llength $missed] > 0 && [::vorkel::engine::family $primitive] eq "Loop"} {
    dict lappend passed $index "[lindex $missed 0] MHz ($primitive)"
  }
  return $told
}

# A request with another frequency (freq), phase or duty cycle of an output.
proc ::vorkel::explain_nearest::with {request index what value} {
  set outputs [dict get $request outputs]
  lset outputs $index [dict replace [lindex $outputs $index] $what $value]
  return [dict replace $request outputs $outputs]
}

# Those of some primitives that do what is asked. Of some it is `known`.
proc ::vorkel::explain_nearest::Makers {request primitives known} {
  return [lmap primitive $primitives {
    if {$primitive ni $known && ([isSpent] || ![couldMake $request $primitive] ||
        [proof $request $primitive] eq "")} continue
    set primitive
  }]
}

# Whether a request is worth a run of the engine: of a PLL or a TSYN it is when a pair of M and D
# serves all outputs.
proc ::vorkel::explain_nearest::couldMake {request primitive} {
  if {[::vorkel::answer::refusal $request $primitive] ne ""} {
    return 0
  }
  if {[::vorkel::engine::family $primitive] ne "Loop"} {
    return 1
  }
  return [::vorkel::explain_vcos::isServed $request $primitive]
}

# When no output can be moved alone: all frequencies that are in the way moved to those of one VCO.
# Dicts of texts (one for each output), ppm (the largest change), primitive and request, the
# nearest first.
proc ::vorkel::explain_nearest::sets {request primitives} {
  variable most_sets_tried
  variable most_sets
  set candidates {}
  foreach primitive [::vorkel::engine::ofFamily Loop $primitives] {
    foreach pair [::vorkel::explain_vcos::pairs $request $primitive [dict get $request inputs]] {
      set candidate [Moved $request $primitive $pair]
      if {$candidate ne ""} {
        lappend candidates [list {*}$candidate $primitive]
      }
    }
  }
  set told [dict create]
  foreach candidate [lrange [lsort -real -index 0 $candidates] 0 $most_sets_tried-1] {
    lassign $candidate ppm texts primitive
    if {[dict size $told] >= $most_sets || [isSpent]} break
    if {[dict exists $told $texts]} continue
    set outputs [lmap output [dict get $request outputs] text $texts {
      dict replace $output freq [::vorkel::units::value $text frequency nearest]
    }]
    set changed [dict replace $request outputs $outputs]
    if {[proof $changed $primitive] ne ""} {
      dict set told $texts [dict create texts $texts ppm $ppm primitive $primitive request $changed]
    }
  }
  return [dict values $told]
}

# The same of what settings of the grid make, of which best is asked whether it finds them; "" when
# it does not, or when nothing is to be moved. `answer` is what the grid has for the request, or "".
proc ::vorkel::explain_nearest::gridSet {request answer} {
  if {$answer eq "" || [isSpent]} {
    return ""
  }
  set primitive [dict get $answer primitive]
  set input [lindex [dict get $request inputs] 0]
  set worst 0.0
  set outputs {}
  set texts {}
  foreach output [dict get $request outputs] made [dict get $answer outputs] {
    if {"ppm" in [dict get $made offs]} {
      set worst [expr {max($worst, abs([dict get $made ppm]))}]
      lappend texts [Spell [dict get $made actual] $input [dict get $made ratio]]
    } else {
      lappend texts [Spell [dict get $output freq] $input {1 1}]
    }
    lappend outputs [dict replace $output freq [::vorkel::units::value [lindex $texts end] \
      frequency nearest]]
  }
  set changed [dict replace $request outputs $outputs]
  if {$worst == 0.0 || ![dict get [lindex [::vorkel::grid::best $changed $primitive] 0] within]} {
    return ""
  }
  return [dict create texts $texts ppm $worst primitive $primitive request $changed]
}

# The largest change, ppm, and the frequencies as texts when all outputs take the nearest that a
# VCO makes; "" when it cannot make one of them. What is within its tolerance stays as it is.
proc ::vorkel::explain_nearest::Moved {request primitive pair} {
  lassign $pair vco m d
  set input [lindex [dict get $request inputs] 0]
  set fractional [::vorkel::explain_vcos::isFractional $request $primitive]
  set worst 0.0
  set texts {}
  foreach output [dict get $request outputs] {
    set index [llength $texts]
    set frequency [dict get $output freq]
    lassign [::vorkel::output_range::of $request $primitive $index] lowest highest
    set best ""
    foreach divider [::vorkel::explain_vcos::dividersAt $request [expr {$vco / $frequency}] \
        [expr {$fractional && $index == 0}]] {
      set made [expr {$vco / $divider}]
      if {$made < $lowest || $made > $highest} continue
      if {![::vorkel::explain_vcos::phaseServes $output $divider] ||
          ![::vorkel::explain_vcos::dutyServes $request $output $divider]} continue
      set ppm [expr {abs($made / $frequency - 1) * 1e6}]
      if {$best eq "" || $ppm < [lindex $best 0]} {
        set best [list $ppm $made $divider]
      }
    }
    if {$best eq ""} {
      return ""
    }
    lassign $best ppm made divider
    if {$ppm <= [dict get $request tolerance] + 1e-6} {
      lappend texts [Spell $frequency $input {1 1}]
      continue
    }
    set worst [expr {max($worst, $ppm)}]
    lappend texts [Spell $made $input [::vorkel::actual::loopRatio $m $d $divider]]
  }
  return [list $worst $texts]
}

# The input frequencies of a list with which the engine's search makes every frequency exact: a list
# of the frequency in MHz, as a text, and the labels of the primitives for each. Of two input clocks
# the first one is replaced.
proc ::vorkel::explain_nearest::oscillators {request primitives texts} {
  dict set request tolerance 0
  set told {}
  foreach text $texts {
    if {[isSpent]} break
    set plain [plainMHz [::vorkel::units::value $text frequency --oscillators]]
    set input [::vorkel::units::value $plain frequency --oscillators]
    set changed [dict replace $request inputs [lreplace [dict get $request inputs] 0 0 $input]]
    set serving {}
    foreach primitive $primitives {
      if {[CouldBe $changed $primitive] && [proof $changed $primitive] ne ""} {
        lappend serving [::vorkel::explain_calls::label $changed $primitive]
      }
    }
    if {[llength $serving] > 0} {
      lappend told [list $plain $serving]
    }
    ::vorkel::progress::step
  }
  return $told
}

# Whether an exact answer of a primitive is worth a run of the engine: of a PLL or a TSYN it is
# when some VCO that all outputs divide is one that M and D make.
proc ::vorkel::explain_nearest::CouldBe {request primitive} {
  if {[::vorkel::engine::family $primitive] ne "Loop"} {
    return 1
  }
  set limits [dict get $request limits]
  set indices [::vorkel::answer::indices $request]
  set range [::vorkel::catalogue::vcoRange $primitive $limits]
  set input [lindex [dict get $request inputs] 0]
  lassign [::vorkel::explain_vcos::dividersOf $input [::vorkel::catalogue::pfdRange $primitive \
    $limits [dict get $request bandwidth]]] first last
  foreach vco [Vcos $request $primitive $indices $range] {
    for {set d $first} {$d <= $last} {incr d} {
      set m [expr {$vco * $d / $input}]
      if {$m > $::vorkel::hardware::largest_m + 0.5} break
      if {abs($m - round($m)) < 1e-9 * $m} {
        return 1
      }
    }
  }
  return 0
}

# The VCO frequencies that serve all outputs, which are the same for each oscillator.
proc ::vorkel::explain_nearest::Vcos {request primitive indices range} {
  variable vcos
  set key [list $primitive [dict get $request outputs] $range]
  if {![info exists vcos($key)]} {
    set vcos($key) [::vorkel::explain_loop::commonVcos $request $primitive $indices $range]
  }
  return $vcos($key)
}
