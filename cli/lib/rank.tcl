# All that the primitives of a device make of a request, and which of it is the best.

package provide vorkel::rank 1.1
package require vorkel::engine 1.1

namespace eval ::vorkel::answer {
  # The searches that a primitive is worth (see solve). A PLL or a TSYN that is asked for no
  # phase and no duty cycle takes the smallest VCO; as the closest solution, a TSYN takes the
  # VCO next to the one that is recommended.
  variable searches {
    PLL {
      {name "smallest VCO"}
      {name "largest VCO" closest 1 preferMaxVco 1}
    }
    TSYN {
      {name "smallest VCO" smallest 1}
      {name "target VCO" closest 1}
      {name "largest VCO" closest 1 preferMaxVco 1}
      {name "integer divider 0" intDiv0 1}
    }
    KRU_SP {
      {name "feedback" feedback 1}
      {name "no feedback" feedback 0}
    }
    KRU_CLKGEN {
      {name ""}
    }
  }
  # The bandwidths of a loop, that of the default first.
  variable bandwidths {OPTIMIZED LOW HIGH}
}

# Answers to a request from all primitives of the device, or from those listed, with all variants
# that what the user has set leaves open. The same settings come once. A primitive for which
# nothing is found has one answer, which says why. `tick` is a command prefix that is called
# after each run of the engine; `runs` tells how many there are.
proc ::vorkel::answer::all {request {primitives ""} {tick list}} {
  if {$primitives eq ""} {
    set primitives [dict get $request primitives]
  }
  set answers {}
  foreach primitive $primitives {
    lappend answers {*}[Answers $request $primitive $tick]
  }
  return $answers
}

# How many runs of the engine the answers from these primitives take.
proc ::vorkel::answer::runs {request primitives} {
  set runs 0
  foreach primitive $primitives {
    incr runs [llength [variants $request $primitive]]
  }
  return $runs
}

proc ::vorkel::answer::Answers {request primitive tick} {
  set seen {}
  set solved {}
  set unsolved {}
  foreach variant [variants $request $primitive] {
    set answer [solve $request $primitive $variant]
    {*}$tick
    if {![dict get $answer solved]} {
      lappend unsolved $answer
      continue
    }
    set identity [Identity $answer]
    if {![dict exists $seen $identity]} {
      dict set seen $identity 1
      lappend solved $answer
    }
  }
  if {[llength $solved] > 0} {
    return $solved
  }
  # The reason is that of all of them; a variant would only distract from it.
  set answer [lindex $unsolved 0]
  dict set answer variant ""
  return [list $answer]
}

# The bandwidths of a loop that a request leaves open.
proc ::vorkel::answer::widths {request} {
  variable bandwidths
  if {[dict get $request bandwidthAsked]} {
    return [list [dict get $request bandwidth]]
  }
  return $bandwidths
}

# The variants for a primitive that do not contradict what the user has set.
proc ::vorkel::answer::variants {request primitive} {
  variable searches
  set variants {}
  set loop [expr {[::vorkel::engine::family $primitive] eq "Loop"}]
  set widths [expr {$loop ? [widths $request] : [list [dict get $request bandwidth]]}]
  foreach search [dict get $searches $primitive] {
    if {[Contradicts $request $search $loop]} continue
    foreach width $widths {
      lappend variants [dict merge $search [dict create bandwidth $width]]
    }
  }
  return $variants
}

# Whether a search is without a switch that the user has set, or is not what its name says: with
# phases or duty cycles the VCO of a TSYN is never the smallest as such.
proc ::vorkel::answer::Contradicts {request search loop} {
  set switches [dict merge {preferMaxVco 0 closest 0 intDiv0 0 feedback 1} $search]
  if {!$loop} {
    return [expr {[dict get $request feedback] && ![dict get $switches feedback]}]
  }
  if {[dict get $request preferMaxVco] && ![dict get $switches preferMaxVco]} {
    return 1
  }
  return [expr {[dict exists $search smallest] && [isShapeAsked $request]}]
}

# Those of some answers that are of a primitive.
proc ::vorkel::answer::ofPrimitive {answers primitive} {
  return [lmap answer $answers {
    if {[dict get $answer primitive] ne $primitive} continue
    set answer
  }]
}

# Whether two answers that are solved have the same settings and figures.
proc ::vorkel::answer::isSame {one other} {
  return [expr {[dict get $one primitive] eq [dict get $other primitive] &&
    [Identity $one] eq [Identity $other]}]
}

# What makes an answer of a primitive the same as another.
proc ::vorkel::answer::Identity {answer} {
  set places [lmap output [dict get $answer outputs] {
    list [dict get $output divider] [dict get $output pin] [dict get $output phase] \
      [dict get $output duty]
  }]
  return [list [dict get $answer settings] [dict get $answer bandwidth] $places \
    [dict get $answer maxJitter]]
}

# Answers, the best first: those that are within their tolerance before the others, those that
# are outside of the device's range behind these, and those that are not solved last. Within the
# tolerance the smallest jitter counts; outside of it, before that, the smallest error of a
# frequency, then of a phase, then of a duty cycle, as far as they are larger than they may be.
# Then the lowest VCO does, which takes the least power.
proc ::vorkel::answer::rank {answers} {
  set keyed [lmap answer $answers {list [Key $answer] $answer}]
  return [lmap pair [lsort -command ::vorkel::answer::Before $keyed] {lindex $pair 1}]
}

# What answers are compared by, numbers of which smaller ones are better.
proc ::vorkel::answer::Key {answer} {
  if {![dict get $answer solved]} {
    return {3 0 0 0 0 0}
  }
  set jitter [dict get $answer maxJitter]
  set vco 0.0
  if {[dict exists $answer settings VCO]} {
    set vco [dict get $answer settings VCO]
  }
  set class 0
  if {![dict get $answer within]} {
    set class [expr {[llength [dict get $answer violations]] > 0 ? 2 : 1}]
  }
  return [list $class {*}[Excess $answer] [expr {$jitter eq "" ? Inf : $jitter}] $vco]
}

# By what one answer ranks before another: class, ppm, phaseError, dutyError, jitter or vco; "" when
# they are equal in all of it.
proc ::vorkel::answer::decided {one other} {
  foreach a [Key $one] b [Key $other] what {class ppm phaseError dutyError jitter vco} {
    if {$a != $b} {
      return $what
    }
  }
  return ""
}

# The largest errors of a frequency, a phase and a duty cycle among those that are larger than
# they may be; 0 where there is none. Rounded: what cannot be told apart decides nothing.
proc ::vorkel::answer::Excess {answer} {
  set worst [dict create ppm 0.0 phaseError 0.0 dutyError 0.0]
  foreach output [dict get $answer outputs] {
    foreach key [dict get $output offs] {
      if {![dict exists $worst $key]} continue
      dict set worst $key [expr {max([dict get $worst $key], abs([dict get $output $key]))}]
    }
  }
  return [lmap error [dict values $worst] {format %.3f $error}]
}

proc ::vorkel::answer::Before {one other} {
  foreach a [lindex $one 0] b [lindex $other 0] {
    if {$a < $b} {
      return -1
    }
    if {$a > $b} {
      return 1
    }
  }
  return 0
}
