# The nearest requests that work. None is told that the engine has not answered within all
# tolerances.

package provide vorkel::explain_nearest 1.1
package require vorkel::actual 1.1
package require vorkel::answer 1.1
package require vorkel::engine 1.1
package require vorkel::explain_kru 1.1
package require vorkel::explain_loop 1.1
package require vorkel::explain_walk 1.1
package require vorkel::numbers 1.1
package require vorkel::units 1.1

namespace eval ::vorkel::explain_nearest {
  # Oscillators that are on the shelf, MHz.
  variable stock {
    8 10 12 12.288 13 14.31818 14.7456 16 18.432 19.2 19.44 20 22.1184 24 24.576 25 26 27 30 32
    33.3333 37.125 38.4 40 48 50 54 60 62.5 66.6667 74.25 80 100 106.25 122.88 125 133.3333 148.5
    150 153.6 155.52 156.25 161.1328125 200 212.5 250
  }
  # As many candidates of a primitive are tried, and as many told, below and above an output.
  variable most_tried 12
  variable most_told 2
  variable most_sets 2
  # The time for all of it, ms, and when it ends.
  variable budget 1500
  variable deadline 0
  variable stopped 0
}

# Begins the time for the search.
proc ::vorkel::explain_nearest::start {} {
  variable budget
  variable deadline
  variable stopped
  set deadline [expr {[clock milliseconds] + $budget}]
  set stopped 0
}

# Whether the time has run out. Once it has, `stopped` tells so.
proc ::vorkel::explain_nearest::isLate {} {
  variable deadline
  variable stopped
  if {[clock milliseconds] > $deadline} {
    set stopped 1
  }
  return $stopped
}

# The engine's first answer of a primitive that is within all tolerances, or "".
proc ::vorkel::explain_nearest::proof {request primitive} {
  dict set request bandwidthAsked 1
  foreach variant [::vorkel::answer::Variants $request $primitive] {
    set answer [::vorkel::answer::solve $request $primitive $variant]
    if {[dict get $answer within]} {
      return $answer
    }
  }
  return ""
}

# A frequency as it can be given to the program: in up to six decimals if these are exact, else
# as a quotient.
proc ::vorkel::explain_nearest::spell {frequency input ratio} {
  set text [::vorkel::numbers::short $frequency 6]
  if {abs($text - $frequency) <= 1e-13 * $frequency} {
    return $text
  }
  lassign $ratio multiply divide
  set product [::vorkel::numbers::short [expr {double($input) * $multiply}] 6]
  if {abs(double($product) / $divide - $frequency) <= 1e-13 * $frequency} {
    if {$product == round($product)} {
      lassign [::vorkel::actual::reduce [expr {round($product)}] $divide] product divide
    }
    return $product/$divide
  }
  return [format %.15g $frequency]
}

# The frequencies for an output, the nearest first, that work with all else as asked for: dicts of
# text (to be given to the program), frequency (MHz), ppm (from what was asked) and primitives.
proc ::vorkel::explain_nearest::frequencies {request primitives index} {
  variable most_tried
  variable most_told
  set asked [dict get [lindex [dict get $request outputs] $index] freq]
  set candidates {}
  foreach primitive $primitives {
    set family [::vorkel::engine::family $primitive]
    set counts {0 0}
    foreach candidate [${family}Candidates $request $primitive $index] {
      set above [expr {[lindex $candidate 2] > $asked}]
      if {[lindex $counts $above] < $most_tried} {
        lset counts $above [expr {[lindex $counts $above] + 1}]
        lappend candidates [list {*}$candidate $above $primitive]
      }
    }
  }
  set told [dict create]
  set sides {0 0}
  foreach candidate [lsort -real -index 0 $candidates] {
    lassign $candidate distance text value above primitive
    if {[isLate]} break
    if {![dict exists $told $text] && [lindex $sides $above] >= $most_told} continue
    if {[dict exists $told $text] && $primitive in [dict get $told $text primitives]} continue
    set frequency [::vorkel::units::value $text frequency nearest]
    set changed $request
    set outputs [dict get $request outputs]
    lset outputs $index [dict replace [lindex $outputs $index] freq $frequency]
    dict set changed outputs $outputs
    if {[proof $changed $primitive] eq ""} continue
    if {[dict exists $told $text]} {
      dict set told $text primitives [list {*}[dict get $told $text primitives] $primitive]
      continue
    }
    lset sides $above [expr {[lindex $sides $above] + 1}]
    dict set told $text [dict create text $text frequency $frequency \
      ppm [expr {($frequency / $asked - 1) * 1e6}] primitives [list $primitive]]
  }
  return [dict values $told]
}

# For a PLL or a TSYN: what the VCO frequencies that serve the other outputs make.
proc ::vorkel::explain_nearest::LoopCandidates {request primitive index} {
  set pairs [::vorkel::explain_walk::pairs $request $primitive [dict get $request inputs]]
  set input [lindex [dict get $request inputs] 0]
  set output [lindex [dict get $request outputs] $index]
  set frequency [dict get $output freq]
  set others {}
  foreach other [dict get $request outputs] {
    lappend others [llength $others]
  }
  set others [lsearch -all -inline -not -exact $others $index]
  set common [::vorkel::explain_walk::serving \
    [::vorkel::explain_walk::masks $request $primitive $pairs] $others]
  set serving {}
  foreach pair $pairs {
    if {$common & 1} {
      lappend serving $pair
    }
    set common [expr {$common >> 1}]
  }
  lassign [::vorkel::catalogue::outputRange $primitive [dict get $request limits] $index] \
    lowest highest
  # Beyond the range the nearest stand at its ends.
  set aim [expr {min(max($frequency, $lowest), $highest)}]
  set fractional [expr {$index == 0 && [::vorkel::explain_walk::isFractional $request $primitive]}]
  set candidates {}
  foreach near [::vorkel::explain_loop::nearest $aim $serving $fractional 1000] {
    lassign $near distance value m d divider
    if {$value < $lowest || $value > $highest} continue
    if {![::vorkel::explain_walk::phaseServes $output $divider] ||
        ![::vorkel::explain_walk::dutyServes $request $output $divider]} continue
    lappend candidates [list [expr {abs($value - $frequency)}] \
      [spell $value $input [::vorkel::actual::loopRatio $m $d $divider]] $value]
  }
  return [lsort -real -index 0 $candidates]
}

# For a KRU: what its pins make, and what divides or multiplies another output, as a KRU_CLKGEN
# does.
proc ::vorkel::explain_nearest::KruCandidates {request primitive index} {
  set input [lindex [dict get $request inputs] 0]
  set outputs [dict get $request outputs]
  set frequency [dict get [lindex $outputs $index] freq]
  set clkgen [expr {$primitive eq "KRU_CLKGEN"}]
  set candidates {}
  if {$clkgen && [llength $outputs] > 1} {
    foreach other $outputs {
      foreach factor {1 2 4 8 16 32} {
        foreach value [list [expr {double([dict get $other freq]) / $factor}] \
            [expr {double([dict get $other freq]) * $factor}]] {
          lappend candidates [list [expr {abs($value - $frequency)}] [format %.15g $value] $value]
        }
      }
    }
    return [lsort -real -index 0 -unique $candidates]
  }
  set seen [dict create]
  foreach row [::vorkel::explain_kru::made $request $primitive $frequency] {
    lassign $row distance value pin how ratio
    if {![::vorkel::explain_kru::inRange $request $primitive $pin $value]} continue
    set text [spell $value $input $ratio]
    if {![dict exists $seen $text]} {
      dict set seen $text 1
      lappend candidates [list $distance $text $value]
    }
  }
  return $candidates
}

# When no output can be moved alone: all frequencies that are in the way moved to those of one VCO.
# Dicts of texts (one for each output), ppm (the largest change) and primitive, the nearest first.
proc ::vorkel::explain_nearest::sets {request primitives} {
  variable most_tried
  variable most_sets
  set candidates {}
  foreach primitive $primitives {
    if {[::vorkel::engine::family $primitive] ne "Loop"} continue
    foreach pair [::vorkel::explain_walk::pairs $request $primitive [dict get $request inputs]] {
      set candidate [Moved $request $primitive $pair]
      if {$candidate ne ""} {
        lappend candidates [list {*}$candidate $primitive]
      }
    }
  }
  set told [dict create]
  foreach candidate [lrange [lsort -real -index 0 $candidates] 0 $most_tried-1] {
    lassign $candidate ppm texts primitive
    if {[dict size $told] >= $most_sets || [isLate]} break
    if {[dict exists $told $texts]} continue
    set outputs [lmap output [dict get $request outputs] text $texts {
      dict replace $output freq [::vorkel::units::value $text frequency nearest]
    }]
    if {[proof [dict replace $request outputs $outputs] $primitive] ne ""} {
      dict set told $texts [dict create texts $texts ppm $ppm primitive $primitive]
    }
  }
  return [dict values $told]
}

# The largest change, ppm, and the frequencies as texts when all outputs take the nearest that a
# VCO makes; "" when it cannot make one of them. What is within its tolerance stays as it is.
proc ::vorkel::explain_nearest::Moved {request primitive pair} {
  lassign $pair vco m d
  set input [lindex [dict get $request inputs] 0]
  set fractional [::vorkel::explain_walk::isFractional $request $primitive]
  set worst 0.0
  set texts {}
  foreach output [dict get $request outputs] {
    set index [llength $texts]
    set frequency [dict get $output freq]
    lassign [::vorkel::catalogue::outputRange $primitive [dict get $request limits] $index] \
      lowest highest
    set best ""
    foreach divider [::vorkel::explain_walk::dividersAt [expr {$vco / $frequency}] \
        [expr {$fractional && $index == 0}]] {
      set made [expr {$vco / $divider}]
      if {$made < $lowest || $made > $highest} continue
      if {![::vorkel::explain_walk::phaseServes $output $divider] ||
          ![::vorkel::explain_walk::dutyServes $request $output $divider]} continue
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
      lappend texts [spell $frequency $input {1 1}]
      continue
    }
    set worst [expr {max($worst, $ppm)}]
    lappend texts [spell $made $input [::vorkel::actual::loopRatio $m $d $divider]]
  }
  return [list $worst $texts]
}

# The phases or duty cycles (`what`) next to the one of an output that is off in nothing else: a
# dict from text to primitive. They are those that the engine chooses itself.
proc ::vorkel::explain_nearest::steps {request primitives index what} {
  variable most_sets
  set outputs [dict get $request outputs]
  set told [dict create]
  foreach answer [::vorkel::answer::rank [::vorkel::answer::all \
      [dict merge $request {bandwidthAsked 1}] $primitives]] {
    if {![dict get $answer solved]} continue
    set made [lindex [dict get $answer outputs] $index]
    if {[dict get $made offs] ne "${what}Error"} continue
    set text [::vorkel::numbers::short [dict get $made $what] 6]
    set changed $outputs
    lset changed $index [dict replace [lindex $outputs $index] $what $text]
    set primitive [dict get $answer primitive]
    if {[dict size $told] < $most_sets && ![dict exists $told $text] &&
        [proof [dict replace $request outputs $changed] $primitive] ne ""} {
      dict set told $text $primitive
    }
  }
  return $told
}

# The input frequencies of a list that make every output exact: a list of the text and the
# primitive for each. Of two input clocks the first one is replaced.
proc ::vorkel::explain_nearest::oscillators {request primitives texts} {
  dict set request tolerance 0
  set told {}
  foreach text $texts {
    if {[isLate]} break
    set input [::vorkel::units::value $text frequency --oscillators]
    set changed [dict replace $request inputs [lreplace [dict get $request inputs] 0 0 $input]]
    set serving {}
    foreach primitive $primitives {
      if {[CouldBe $changed $primitive] && [proof $changed $primitive] ne ""} {
        lappend serving $primitive
      }
    }
    if {[llength $serving] > 0} {
      lappend told [list $text $serving]
    }
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
  set indices {}
  foreach output [dict get $request outputs] {
    lappend indices [llength $indices]
  }
  set range [::vorkel::catalogue::vcoRange $primitive $limits]
  set input [lindex [dict get $request inputs] 0]
  lassign [::vorkel::explain_walk::dividersOf $input [::vorkel::catalogue::pfdRange $primitive \
    $limits [dict get $request bandwidth]]] first last
  foreach vco [Vcos $request $primitive $indices $range] {
    for {set d $first} {$d <= $last} {incr d} {
      set m [expr {$vco * $d / $input}]
      if {$m > $::vorkel::explain_walk::largest_m + 0.5} break
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
    set vcos($key) [::vorkel::explain_loop::Common $request $primitive $indices $range]
  }
  return $vcos($key)
}
