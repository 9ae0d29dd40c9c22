# The dividers of the outputs of a PLL or a TSYN that come nearest to a request behind a given VCO
# (see grid.tcl).
#
# For a VCO the outputs do not depend on each other, and the error of an output falls up to the
# nearest divider and rises behind it. A divider is counted in parts: eighths, with nothing between
# 1 and 2, or whole. A target is a dict of what an output is to be:
#   freq        MHz
#   phase duty  as asked for, or ""
#   range       of its frequency with the first input clock, MHz
#   most        how many VCO periods a divider can be high or low for
#   moved       whether phase and duty cycle have steps; else they are 0 degrees and 50 percent
#   parts       of which its divider is counted
#   largest     the largest divider
#   end         the largest count
#   below above lists with, at the place of each count up to one behind the largest, the nearest
#               count from there down and up that is to be looked at; 0, and one behind the
#               largest, when there is none
# An option is a list of divider, ppm, phase and duty, the last three errors without a sign.

package provide vorkel::grid_dividers 1.1
package require vorkel::actual 1.1
package require vorkel::answer 1.1
package require vorkel::hardware 1.1
package require vorkel::notes 1.1
package require vorkel::output_range 1.1

namespace eval ::vorkel::grid_dividers {
  # The parts of a divider that is whole.
  variable whole 1
}

# The targets of a search (see grid.tcl), those beside a whole M and those beside another one.
# For class 0, dividers are left out that no phase or no duty cycle within its tolerance goes
# with, which does not depend on the VCO. Beside a whole M that of output 0 is a fraction where
# something is to be.
proc ::vorkel::grid_dividers::targets {request primitive class shape parts} {
  variable whole
  set limits [dict get $request limits]
  set targets {}
  foreach output [dict get $request outputs] {
    set index [llength $targets]
    set target [dict create freq [expr {double([dict get $output freq])}] \
      phase [dict get $output phase] duty [dict get $output duty] \
      range [::vorkel::output_range::of $request $primitive $index $::vorkel::notes::rounding] \
      most [dict get $limits O_MAX_HT_LT] moved [expr {$shape eq "moved"}] \
      parts [expr {$index == 0 ? $parts : $whole}] \
      largest [::vorkel::hardware::largestDivider $limits]]
    set counts [Counts $target]
    if {$class == 0 && $shape eq "moved"} {
      set counts [lmap count $counts {
        if {![AreAllowed [Shape $target $count]]} continue
        set count
      }]
    }
    lappend targets [Tables $target $counts]
  }
  if {$shape ne "fixed"} {
    return [list $targets $targets]
  }
  set first [lindex $targets 0]
  set fractions [lmap count [Counts $first] {
    if {$count % $parts == 0} continue
    set count
  }]
  return [list [lreplace $targets 0 0 [Tables $first $fractions]] $targets]
}

# The class that settings with a fraction are at least of: 0 when the phases and duty cycles that
# they have are as near as they must be.
proc ::vorkel::grid_dividers::fixedClass {request} {
  variable whole
  foreach output [dict get $request outputs] {
    set target [dict create phase [dict get $output phase] duty [dict get $output duty] moved 0 \
      parts $whole]
    if {![AreAllowed [Shape $target $whole]]} {
      return 1
    }
  }
  return 0
}

# A count as a number.
proc ::vorkel::grid_dividers::number {count parts} {
  return [expr {$count % $parts == 0 ? $count / $parts : double($count) / $parts}]
}

# What is needed to tell quickly how near the outputs come, a flat list with six entries for each
# target: how many parts of a divider a MHz of the VCO makes for its frequency, for the highest
# and for the lowest frequency of its range, and the largest count and the tables. Those that come
# near least often are the first.
proc ::vorkel::grid_dividers::outline {targets} {
  set sorted [lsort -real -decreasing -index 0 [lmap target $targets {
    list [expr {[dict get $target freq] / [dict get $target parts]}] $target
  }]]
  return [concat {*}[lmap pair $sorted {
    set target [lindex $pair 1]
    lassign [dict get $target range] lowest highest
    list [Per $target [dict get $target freq]] [Per $target $highest] [Per $target $lowest] \
      [dict get $target end] [dict get $target below] [dict get $target above]
  }]]
}

# Parts of a divider for each MHz of the VCO. A range may begin at 0.
proc ::vorkel::grid_dividers::Per {target frequency} {
  return [expr {$frequency > 0.0 ? [dict get $target parts] / $frequency : Inf}]
}

# The choice of dividers with the smallest of the largest errors, of the frequencies first, then of
# the phases, then of the duty cycles: a list of these errors, and the dividers. Where that leaves
# several, each output takes its nearest. The VCO decides what is in an output's range, and its
# exact ratio to the input tells the errors; each target must have a divider that is in its range.
proc ::vorkel::grid_dividers::choose {input vco ratio targets} {
  set nearest [lmap target $targets {Nearest $input $vco $ratio $target}]
  set worst [list [tcl::mathfunc::max {*}[lmap option $nearest {lindex $option 1}]]]
  set options [lmap target $targets option $nearest {
    expr {[dict get $target moved] ? [Options $input $vco $ratio $target [lindex $worst 0]] :
      [list $option]}
  }]
  foreach index {2 3} {
    set most [tcl::mathfunc::max {*}[lmap list $options {Smallest $list $index}]]
    lappend worst $most
    set options [lmap list $options {AtMost $list $index $most}]
  }
  set dividers [lmap list $options {
    foreach index {3 2 1} {
      set list [lsort -real -index $index $list]
    }
    lindex $list 0 0
  }]
  return [list {*}$worst $dividers]
}

# The counts that are dividers of a target.
proc ::vorkel::grid_dividers::Counts {target} {
  set parts [dict get $target parts]
  set end [expr {[dict get $target largest] * $parts}]
  set counts [list $parts]
  for {set count [expr {2 * $parts}]} {$count <= $end} {incr count} {
    lappend counts $count
  }
  return $counts
}

# A target with the tables for what counts are to be looked at.
proc ::vorkel::grid_dividers::Tables {target counts} {
  set end [expr {[dict get $target largest] * [dict get $target parts]}]
  set below {}
  set above {}
  set last 0
  foreach count [list {*}$counts [expr {$end + 1}]] {
    lappend below {*}[lrepeat [expr {$count - $last}] $last]
    lappend above {*}[lrepeat [expr {$count - $last}] $count]
    set last $count
  }
  # The places are 0 to the last but one of the first list, and from 1 on of the other.
  set largest [expr {[llength $counts] > 0 ? [lindex $counts end] : 0}]
  return [dict merge $target [dict create end $end below [list {*}$below $largest] \
    above [list [lindex $above 0] {*}$above]]]
}

# The counts next to a quotient that bring an output into its range, and the first and the last
# one that do: 0 and one behind the largest when there is none.
proc ::vorkel::grid_dividers::Around {vco target} {
  lassign [dict get $target range] lowest highest
  set end [dict get $target end]
  set first [expr {max(1, int(ceil(min($vco * [Per $target $highest], $end + 1))))}]
  set last [expr {int(min($vco * [Per $target $lowest], $end))}]
  set near [expr {int(min($vco * [Per $target [dict get $target freq]], $end))}]
  return [list [lindex [dict get $target below] [expr {min($near, $last)}]] \
    [lindex [dict get $target above] [expr {max($near + 1, $first)}]] $first $last]
}

# The option whose frequency is nearest.
proc ::vorkel::grid_dividers::Nearest {input vco ratio target} {
  lassign [Around $vco $target] low high first last
  set best ""
  foreach count [list $low $high] {
    if {$count < $first || $count > $last} continue
    set option [Option $input $ratio $target $count]
    if {$best eq "" || [lindex $option 1] < [lindex $best 1]} {
      set best $option
    }
  }
  return $best
}

# The options whose error is at most `ppm`.
proc ::vorkel::grid_dividers::Options {input vco ratio target ppm} {
  lassign [Around $vco $target] low high first last
  set options {}
  foreach {count table step} [list $low below -1 $high above 1] {
    while {$count >= $first && $count <= $last} {
      set option [Option $input $ratio $target $count]
      if {[lindex $option 1] > $ppm + $::vorkel::answer::rounding} break
      lappend options $option
      set count [lindex [dict get $target $table] [expr {$count + $step}]]
    }
  }
  return $options
}

# What a divider makes of an output. Errors that the rounding of the arithmetic can make are none,
# and errors are only told apart where they differ by more.
proc ::vorkel::grid_dividers::Option {input ratio target count} {
  lassign $ratio m d
  set actual [::vorkel::actual::frequency $input [::vorkel::actual::reduce \
    [expr {$m * [dict get $target parts]}] [expr {$d * $count}]]]
  set requested [dict get $target freq]
  return [list [number $count [dict get $target parts]] \
    [format %.6f [expr {abs($actual - $requested) / $requested * 1e6}]] {*}[Shape $target $count]]
}

# The errors of phase and duty cycle with a divider.
proc ::vorkel::grid_dividers::Shape {target count} {
  set divider [number $count [dict get $target parts]]
  set moved [dict get $target moved]
  set errors {}
  set asked [dict get $target phase]
  if {$asked eq ""} {
    lappend errors 0.0
  } else {
    set step [expr {$moved ? [::vorkel::actual::phaseOnStep $asked $divider] : 0.0}]
    lappend errors [format %.6f [expr {abs([::vorkel::actual::phaseDifference $step $asked])}]]
  }
  set asked [dict get $target duty]
  if {$asked eq ""} {
    lappend errors 0.0
  } else {
    set step [expr {$moved ?
      [::vorkel::actual::dutyOnStep $asked $divider [dict get $target most]] : 50.0}]
    lappend errors [format %.6f [expr {abs($step - $asked)}]]
  }
  return $errors
}

# Whether the errors of phase and duty cycle are within their tolerance.
proc ::vorkel::grid_dividers::AreAllowed {errors} {
  foreach error $errors key {phaseError dutyError} {
    if {![::vorkel::answer::isAllowed $key $error]} {
      return 0
    }
  }
  return 1
}

proc ::vorkel::grid_dividers::Smallest {options index} {
  return [tcl::mathfunc::min {*}[lmap option $options {lindex $option $index}]]
}

proc ::vorkel::grid_dividers::AtMost {options index most} {
  return [lmap option $options {
    if {[lindex $option $index] > $most + $::vorkel::answer::rounding} continue
    set option
  }]
}
