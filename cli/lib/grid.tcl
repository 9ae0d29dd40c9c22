# The whole grid of settings of a PLL or a TSYN, searched for those nearest to a request.
#
# The grid is what the engine chooses from. M is whole, from 1 to 64, on a TSYN 1 or from 5; D is
# whole, from 1 to 80; dividers are whole, from 1 to 128, only output 0 of a TSYN with up to 5
# outputs and without --int-div0 has 1 or eighths from 2. A setting counts when VCO and PFD with
# each input clock and each output, also output 0, are in the device's ranges. Nothing on the grid
# is left out: for an M and a D the outputs do not depend on each other (but see Kinds), and the
# error of an output falls up to the nearest divider and rises behind it.
#
# A point is what an M, a D and a bandwidth can do, a list of
#   class      0 when phases and duty cycles are asked for and all is within its tolerance, 1 when
#              they are and it is not, and 0 when none are asked for
#   ppm        the largest error of a frequency
#   phase      that of a phase, degrees
#   duty       that of a duty cycle, percent points
#   jitter     ps, or Inf when it is not known
#   vco        MHz
#   d m bandwidth primitive
#   dividers   of the outputs
# Points are compared in this order, the first difference decides, and less is better.

package provide vorkel::grid 1.1
package require vorkel::actual 1.1
package require vorkel::answer 1.1
package require vorkel::catalogue 1.1
package require vorkel::engine 1.1
package require vorkel::notes 1.1
package require vorkel::timing 1.1

namespace eval ::vorkel::grid {
  variable largest_m 64
  # Between 1 and this a TSYN has no M.
  variable smallest_tsyn_m 5
  variable largest_d 80
  variable largest_divider 128
  # Outputs from which on output 0 of a TSYN has a whole divider.
  variable outputs_with_whole_divider 6
  # A divider is counted in parts: eighths, with nothing between 1 and 2, or whole.
  variable eighths 8
  variable whole 1
  # Where in a point something stands.
  variable place {class 0 ppm 1 phase 2 duty 3 jitter 4 vco 5 d 6 m 7 bandwidth 8 primitive 9
    dividers 10}
}

# The best settings of a primitive, a list of one answer, or of none when no setting has
# everything in the device's ranges.
proc ::vorkel::grid::best {request primitive {variant ""}} {
  set points [order $request [points $request $primitive]]
  if {[llength $points] == 0} {
    return {}
  }
  return [list [answer $request [lindex $points 0] $variant]]
}

# The trade-offs of a primitive between the largest error of a frequency and the jitter, a list of
# answers: the best one, and then each one whose jitter is less than that of all with a smaller
# error.
proc ::vorkel::grid::front {request primitive {variant ""}} {
  return [lmap point [tradeoffs [order $request [points $request $primitive]]] {
    answer $request $point $variant
  }]
}

# The answer that a point is.
proc ::vorkel::grid::answer {request point {variant ""}} {
  foreach key {d m bandwidth primitive dividers} {
    set $key [of $point $key]
  }
  dict set request bandwidth $bandwidth
  return [::vorkel::answer::fromSettings $request $primitive [dict create M $m D $d] $dividers \
    $variant]
}

# What stands in a point under a name.
proc ::vorkel::grid::of {point name} {
  variable place
  return [lindex $point [dict get $place $name]]
}

# Points, the best first. When the user prefers a high VCO, the highest comes before the least
# jitter.
proc ::vorkel::grid::order {request points} {
  set points [Sorted $points {d vco jitter duty phase ppm class}]
  if {[dict get $request preferMaxVco] && [llength $points] > 1} {
    variable place
    set highest [lsort -real -decreasing -index [dict get $place vco] $points]
    set winner [lindex [Sorted $highest {duty phase ppm class}] 0]
    set points [linsert [lsearch -exact -all -inline -not $points $winner] 0 $winner]
  }
  return $points
}

# The front of ordered points, as front tells. Only points of the class of the best are on it: a
# lower jitter does not make up for a phase that is not as asked for.
proc ::vorkel::grid::tradeoffs {points} {
  if {[llength $points] == 0} {
    return {}
  }
  set class [of [lindex $points 0] class]
  set least [of [lindex $points 0] jitter]
  set front [list [lindex $points 0]]
  foreach point [lrange $points 1 end] {
    if {[of $point class] == $class && [of $point jitter] < $least} {
      set least [of $point jitter]
      lappend front $point
    }
  }
  return $front
}

# Sorted by the last of the names, then by the one before it, and so on.
proc ::vorkel::grid::Sorted {points names} {
  variable place
  foreach name $names {
    set points [lsort -real -index [dict get $place $name] $points]
  }
  return $points
}

# The points of a primitive that have a divider for each output. When phases or duty cycles are
# asked for, those are left out that another one makes neither best nor a trade-off: it has a
# smaller error of the frequency and no more jitter.
proc ::vorkel::grid::points {request primitive} {
  set targets [Targets $request $primitive]
  set kinds [Kinds $request $primitive]
  set input [lindex [dict get $request inputs] 0]
  set candidates {}
  dict for {ratio loops} [Loops $request $primitive] {
    foreach kind $kinds {
      set nearest [NearestOfAll $input $ratio $targets $kind]
      if {[llength $nearest] > 0} {
        lappend candidates [list [Largest $nearest 1] [Smallest $loops 0] $ratio $kind $nearest \
          $loops]
      }
    }
  }
  if {[lindex $kinds 0 1]} {
    set candidates [lsort -real -index 0 $candidates]
    foreach class {0 1} {
      set points [Shaped $input $primitive $targets $candidates $class]
      if {[llength $points] > 0} {
        return $points
      }
    }
    return {}
  }
  set points {}
  foreach candidate $candidates {
    lassign $candidate worst least ratio kind nearest loops
    set choice [Chosen 0 [lmap option $nearest {list $option}]]
    lappend points {*}[PointsOf $input $primitive $ratio $loops $choice]
  }
  return $points
}

# The points of a class when phases or duty cycles are asked for. A candidate is a list of its
# largest error of a frequency with the nearest dividers, which is the least that it can have, its
# least jitter, ratio, kind, nearest options and loops; the first come first.
proc ::vorkel::grid::Shaped {input primitive targets candidates class} {
  set tolerance [dict get [lindex $targets 0] tolerance]
  set points {}
  set reached {}
  foreach candidate $candidates {
    lassign $candidate worst least ratio kind nearest loops
    if {$class == 0 && $worst > $tolerance + $::vorkel::answer::rounding} break
    if {[IsBeaten $reached $worst $least]} continue
    if {[lindex $kind 2]} {
      set choice [Unmoved $targets $nearest $class]
    } elseif {$class == 0} {
      set choice [WithinTolerance $input $ratio $targets $nearest]
    } else {
      set choice [Chosen 1 [AllOptions $input $ratio $targets $worst]]
    }
    if {$choice eq ""} continue
    lappend reached [list [lindex $choice 1] $least]
    lappend points {*}[PointsOf $input $primitive $ratio $loops $choice]
  }
  return $points
}

# Whether one of the pairs of error and jitter that are reached has a smaller error and no more
# jitter.
proc ::vorkel::grid::IsBeaten {reached ppm jitter} {
  foreach pair $reached {
    if {[lindex $pair 0] < $ppm && [lindex $pair 1] <= $jitter} {
      return 1
    }
  }
  return 0
}

# The points of a choice of dividers with each of the loops that make its ratio.
proc ::vorkel::grid::PointsOf {input primitive ratio loops choice} {
  lassign $choice class ppm phase duty dividers
  set vco [::vorkel::actual::frequency $input $ratio]
  return [lmap loop $loops {
    lassign $loop jitter m d bandwidth
    list $class $ppm $phase $duty $jitter $vco $d $m $bandwidth $primitive $dividers
  }]
}

# The loops whose VCO and PFD are in the device's ranges: a dict from the ratio of the VCO to the
# input to a list of jitter, M, D and bandwidth each.
proc ::vorkel::grid::Loops {request primitive} {
  set input [lindex [dict get $request inputs] 0]
  set known [::vorkel::timing::HasCalculator [dict get $request device]]
  set loops [dict create]
  set handle [Ip::Vorkel::Init]
  try {
    $handle SetDevice [dict get $request device]
    foreach pair [Pairs $request $primitive] {
      lassign $pair m d bandwidth
      set jitter Inf
      if {$known} {
        # It is that of the VCO, the same behind each divider. A refusal is a sentence.
        catch {$handle GetPLLPkToPkJitter $input $m $d $bandwidth 1 \
          [dict get $request inputJitter]} figure
        if {[string is double -strict $figure]} {
          set jitter $figure
        }
      }
      dict lappend loops [::vorkel::actual::reduce $m $d] [list $jitter $m $d $bandwidth]
    }
  } finally {
    rename $handle {}
  }
  return $loops
}

# Each M, D and bandwidth that has VCO and PFD in the device's ranges with each input clock.
proc ::vorkel::grid::Pairs {request primitive} {
  variable largest_m
  variable largest_d
  variable smallest_tsyn_m
  set limits [dict get $request limits]
  set inputs [dict get $request inputs]
  set widths [list [dict get $request bandwidth]]
  if {!([dict exists $request bandwidthAsked] && [dict get $request bandwidthAsked])} {
    set widths $::vorkel::answer::bandwidths
  }
  set vcos [Wide [::vorkel::catalogue::vcoRange $primitive $limits]]
  set pairs {}
  foreach bandwidth $widths {
    set pfds [Wide [::vorkel::catalogue::pfdRange $primitive $limits $bandwidth]]
    for {set d 1} {$d <= $largest_d} {incr d} {
      if {![AreInside $inputs 1 $d $pfds]} continue
      for {set m 1} {$m <= $largest_m} {incr m} {
        if {$primitive eq "TSYN" && $m > 1 && $m < $smallest_tsyn_m} continue
        if {[AreInside $inputs $m $d $vcos]} {
          lappend pairs [list $m $d $bandwidth]
        }
      }
    }
  }
  return $pairs
}

# A range with what its limits are off by the rounding of the arithmetic, as the notes on an
# answer have it.
proc ::vorkel::grid::Wide {range} {
  lassign $range lowest highest
  return [list [expr {$lowest - $::vorkel::notes::rounding}] \
    [expr {$highest + $::vorkel::notes::rounding}]]
}

proc ::vorkel::grid::AreInside {inputs m d range} {
  lassign $range lowest highest
  foreach input $inputs {
    set frequency [expr {double($input) * $m / $d}]
    if {$frequency < $lowest || $frequency > $highest} {
      return 0
    }
  }
  return 1
}

# For each output a dict of what is wanted and what the device allows.
proc ::vorkel::grid::Targets {request primitive} {
  set limits [dict get $request limits]
  set targets {}
  foreach output [dict get $request outputs] {
    set range [::vorkel::catalogue::outputRange $primitive $limits [llength $targets]]
    lappend targets [dict create freq [expr {double([dict get $output freq])}] \
      phase [dict get $output phase] duty [dict get $output duty] range [Wide $range] \
      most [dict get $limits O_MAX_HT_LT] tolerance [dict get $request tolerance]]
  }
  return $targets
}

# The searches for dividers that there are: the parts of the divider of output 0, whether phases
# and duty cycles are looked at, and whether that divider is to be a fraction. A fraction there
# takes phase and duty cycle from all outputs, so that the two kinds of dividers differ in more
# than output 0 when these are asked for.
proc ::vorkel::grid::Kinds {request primitive} {
  variable eighths
  variable whole
  variable outputs_with_whole_divider
  set asked [expr {[::vorkel::answer::isAsked $request phase] ||
    [::vorkel::answer::isAsked $request duty]}]
  set fractions [expr {$primitive eq "TSYN" && ![dict get $request intDiv0] &&
    [llength [dict get $request outputs]] < $outputs_with_whole_divider}]
  if {!$asked} {
    return [list [list [expr {$fractions ? $eighths : $whole}] 0 0]]
  }
  set kinds [list [list $whole 1 0]]
  if {$fractions} {
    lappend kinds [list $eighths 1 1]
  }
  return $kinds
}

# The option of each output whose frequency is nearest (see Nearest); none when some output cannot
# be in its range, or when there is no reason to look at this kind.
proc ::vorkel::grid::NearestOfAll {input ratio targets kind} {
  variable whole
  lassign $kind parts asked fraction
  set nearest {}
  foreach target $targets {
    set option [Nearest $input $ratio $target $parts]
    if {$option eq ""} {
      return {}
    }
    lappend nearest $option
    set parts $whole
  }
  # A whole divider that is nearer than a fraction has no worse phases either.
  if {$fraction && [IsWhole [lindex $nearest 0 0]]} {
    return {}
  }
  return $nearest
}

proc ::vorkel::grid::IsWhole {divider} {
  return [expr {$divider == round($divider)}]
}

proc ::vorkel::grid::Largest {lists index} {
  return [tcl::mathfunc::max {*}[lmap list $lists {lindex $list $index}]]
}

proc ::vorkel::grid::Smallest {lists index} {
  return [tcl::mathfunc::min {*}[lmap list $lists {lindex $list $index}]]
}

# The option of an output whose frequency is nearest; "" when there is none. An option is a list
# of divider, ppm, phase and duty, the last three without a sign.
proc ::vorkel::grid::Nearest {input ratio target parts} {
  lassign [Reach $input $ratio [dict get $target range] $parts] first last
  if {$first > $last} {
    return ""
  }
  set best ""
  foreach count [Around [Quotient $input $ratio [dict get $target freq] $parts] $parts] {
    set option [Option $input $ratio $target [expr {max($first, min($last, $count))}] $parts]
    if {$best eq "" || [lindex $option 1] < [lindex $best 1]} {
      set best $option
    }
  }
  return $best
}

# How many parts of a divider make a frequency of the VCO, not beyond what a divider can have.
proc ::vorkel::grid::Quotient {input ratio frequency parts} {
  variable largest_divider
  set most [expr {($largest_divider + 1.0) * $parts}]
  if {$frequency <= 0.0} {
    return $most
  }
  return [expr {min($most, [::vorkel::actual::frequency $input $ratio] * $parts / $frequency)}]
}

# The counts of parts next to a quotient.
proc ::vorkel::grid::Around {quotient parts} {
  set below [expr {int(floor($quotient))}]
  return [list [Down $below $parts] [Up [expr {$below + 1}] $parts]]
}

# A count of parts that is a divider, not above the one given, and likewise not below.
proc ::vorkel::grid::Down {count parts} {
  return [expr {$count > $parts && $count < 2 * $parts ? $parts : $count}]
}

proc ::vorkel::grid::Up {count parts} {
  return [expr {$count > $parts && $count < 2 * $parts ? 2 * $parts : $count}]
}

# The first and the last count of parts that brings an output into its range.
proc ::vorkel::grid::Reach {input ratio range parts} {
  variable largest_divider
  lassign $range lowest highest
  set first [expr {int(ceil([Quotient $input $ratio $highest $parts]))}]
  set last [expr {int(floor([Quotient $input $ratio $lowest $parts]))}]
  return [list [Up [expr {max($parts, $first)}] $parts] \
    [Down [expr {min($largest_divider * $parts, $last)}] $parts]]
}

# What a divider makes of the frequency of an output. Errors that the rounding of the arithmetic can
# make are none, and errors are only told apart where they differ by more.
proc ::vorkel::grid::Option {input ratio target count parts} {
  set divider [expr {$count % $parts == 0 ? $count / $parts : double($count) / $parts}]
  lassign $ratio m d
  set actual [::vorkel::actual::frequency $input \
    [::vorkel::actual::reduce [expr {$m * $parts}] [expr {$d * $count}]]]
  set requested [dict get $target freq]
  return [list $divider [format %.6f [expr {abs($actual - $requested) / $requested * 1e6}]] 0.0 0.0]
}

# An option with the errors of its phase and duty cycle, which without any steps are 0 degrees and
# 50 percent.
proc ::vorkel::grid::WithShape {option target steps} {
  lassign $option divider ppm phase duty
  set asked [dict get $target phase]
  if {$asked ne ""} {
    set step [expr {$steps ? [::vorkel::actual::phaseOnStep $asked $divider] : 0.0}]
    set phase [format %.6f [expr {abs([::vorkel::actual::phaseDifference $step $asked])}]]
  }
  set asked [dict get $target duty]
  if {$asked ne ""} {
    set step [expr {!$steps ? 50.0 :
      [::vorkel::actual::dutyOnStep $asked $divider [dict get $target most]]}]
    set duty [format %.6f [expr {abs($step - $asked)}]]
  }
  return [list $divider $ppm $phase $duty]
}

# The options of an output whose error is at most `ppm`, with a whole divider.
proc ::vorkel::grid::Options {input ratio target ppm} {
  variable whole
  lassign [Reach $input $ratio [dict get $target range] $whole] first last
  set requested [dict get $target freq]
  set slack [expr {$ppm / 1e6 + 1e-9}]
  set from [Quotient $input $ratio [expr {$requested * (1 + $slack)}] $whole]
  set to [Quotient $input $ratio [expr {$requested * (1 - $slack)}] $whole]
  set options {}
  for {set count [expr {max($first, int(floor($from)))}]} {$count <= min($last, ceil($to))} \
      {incr count} {
    set option [Option $input $ratio $target $count $whole]
    if {[lindex $option 1] <= $ppm + $::vorkel::answer::rounding} {
      lappend options [WithShape $option $target 1]
    }
  }
  return $options
}

# The best dividers where that of output 0 is a fraction, beside which no phase and no duty cycle
# depends on a divider; "" for class 0 when something is outside its tolerance.
proc ::vorkel::grid::Unmoved {targets nearest class} {
  set options [lmap option $nearest target $targets {
    set option [list [WithShape $option $target 0]]
    expr {$class == 0 ? [Allowed $option [dict get $target tolerance]] : $option}
  }]
  return [expr {{} in $options ? "" : [Chosen $class $options]}]
}

# The best dividers with which all that is asked for is within its tolerance; "" when there are
# none. Each output alone tells how far its frequency must be off for that at least; nothing that
# is further off than the worst of these is worth a look.
proc ::vorkel::grid::WithinTolerance {input ratio targets nearest} {
  set least 0.0
  foreach target $targets option $nearest {
    set tolerance [dict get $target tolerance]
    set bound [lindex $option 1]
    while {[set found [Allowed [Options $input $ratio $target $bound] $tolerance]] eq ""} {
      if {$bound >= $tolerance} {
        return ""
      }
      set bound [expr {min($tolerance, max(100.0, $bound * 4))}]
    }
    set least [expr {max($least, [Smallest $found 1])}]
  }
  return [Chosen 0 [lmap options [AllOptions $input $ratio $targets $least] {
    Allowed $options $tolerance
  }]]
}

# The options whose phase and duty cycle are within their tolerance.
proc ::vorkel::grid::Allowed {options tolerance} {
  foreach {key index} {phaseError 2 dutyError 3} {
    set options [AtMost $options $index [::vorkel::answer::allowance $key $tolerance]]
  }
  return $options
}

# The options of each output whose error is at most `ppm`.
proc ::vorkel::grid::AllOptions {input ratio targets ppm} {
  return [lmap target $targets {Options $input $ratio $target $ppm}]
}

proc ::vorkel::grid::AtMost {options index most} {
  return [lmap option $options {
    if {[lindex $option $index] > $most + $::vorkel::answer::rounding} continue
    set option
  }]
}

# From the options of each output, the choice with the smallest of the largest errors, of the
# frequencies first, then of the phases, then of the duty cycles. Where that leaves several, each
# output takes its nearest.
proc ::vorkel::grid::Chosen {class options} {
  set worst {}
  foreach index {1 2 3} {
    set most 0.0
    foreach list $options {
      set most [expr {max($most, [Smallest $list $index])}]
    }
    lappend worst $most
    set options [lmap list $options {AtMost $list $index $most}]
  }
  set dividers [lmap list $options {
    foreach index {3 2 1} {
      set list [lsort -real -index $index $list]
    }
    lindex $list 0 0
  }]
  return [list $class {*}$worst $dividers]
}
