# The whole grid of settings of a PLL or a TSYN, searched for those nearest to a request.
#
# The grid is what the hardware has (hardware.tcl): every M, whole D and divider. M and dividers are
# whole, only a TSYN with up to 5 outputs and without --int-div0 has an M in eighths and a divider
# of output 0 that is 1 or in eighths from 2.
# A setting counts when VCO, PFD and each output, also output 0, are in the device's ranges with
# each input clock, and the counters of the dividers go so far. Nothing on the grid is left out:
# grid_loops.tcl tells how M and D are gone through, and grid_dividers.tcl how the dividers are.
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
package require vorkel::grid_dividers 1.1
package require vorkel::grid_loops 1.1
package require vorkel::hardware 1.1
package require vorkel::timing 1.1

namespace eval ::vorkel::grid {
  # About as many steps of this search take as long as a run of the engine.
  variable run_steps 10
  # As many trade-offs, the best settings as the first, are shown to who does not say how many.
  variable default_front 6
  # Where in a point something stands.
  variable place {class 0 ppm 1 phase 2 duty 3 jitter 4 vco 5 d 6 m 7 bandwidth 8 primitive 9
    dividers 10}
}

# The best settings of a primitive, a list of one answer, or of none when no setting has
# everything in the device's ranges.
proc ::vorkel::grid::best {request primitive {variant ""}} {
  set points [dict get [search $request [list $primitive]] $primitive]
  if {[llength $points] == 0} {
    return {}
  }
  return [list [answer $request [lindex $points 0] $variant]]
}

# The points of some primitives, a dict from primitive to list, the best first. `tick` is that of
# points.
proc ::vorkel::grid::search {request primitives {tick list}} {
  set found [dict create]
  foreach primitive $primitives {
    dict set found $primitive [order $request [points $request $primitive $tick]]
  }
  return $found
}

# The trade-offs of what a search has found, over all its primitives.
proc ::vorkel::grid::front {request found} {
  return [tradeoffs [order $request [concat {*}[dict values $found]]]]
}

# The place among trade-offs of the one with the least jitter that has everything within its
# tolerance; -1 when there is none.
proc ::vorkel::grid::calmest {request front} {
  set place -1
  foreach point $front {
    if {[Of $point class] == 0 &&
        [::vorkel::answer::isAllowed ppm [Of $point ppm] [dict get $request tolerance]]} {
      incr place
    }
  }
  return $place
}

# The answer that a point is.
proc ::vorkel::grid::answer {request point {variant ""}} {
  foreach key {d m bandwidth primitive dividers} {
    set $key [Of $point $key]
  }
  dict set request bandwidth $bandwidth
  return [::vorkel::answer::fromSettings $request $primitive [dict create M $m D $d] $dividers \
    $variant]
}

# What stands in a point under a name.
proc ::vorkel::grid::Of {point name} {
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

# The trade-offs between the largest error of a frequency and the jitter among ordered points: the
# best one, and then each one whose jitter is less than that of all with a smaller error. Only
# points of the class of the best are there: a lower jitter does not make up for a phase that is not
# as asked for.
proc ::vorkel::grid::tradeoffs {points} {
  if {[llength $points] == 0} {
    return {}
  }
  set class [Of [lindex $points 0] class]
  set least [Of [lindex $points 0] jitter]
  set front [list [lindex $points 0]]
  foreach point [lrange $points 1 end] {
    if {[Of $point class] == $class && [Of $point jitter] < $least} {
      set least [Of $point jitter]
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

# The points of a primitive that have a divider for each output. Left out are those that another
# one keeps from being the best and from being a trade-off (see survivors of grid_loops.tcl).
# `tick` is a command prefix that is called at each step; `steps` tells how many there are.
proc ::vorkel::grid::points {request primitive {tick list}} {
  set points {}
  foreach search [Searches $request $primitive] {
    if {[llength $points] > 0 && [Of [lindex $points 0] class] < [dict get $search class]} {
      # Whatever it has comes behind these.
      for {set step 0} {$step < [Size $search]} {incr step} {
        {*}$tick
      }
      continue
    }
    lappend points {*}[Found $request $primitive $search $tick]
  }
  return $points
}

# How many steps it takes to search for the points.
proc ::vorkel::grid::steps {request primitive} {
  set steps 0
  foreach search [Searches $request $primitive] {
    incr steps [Size $search]
  }
  return $steps
}

# The same together with runs of the engine for some primitives, besides the search of those that
# are `loops`.
proc ::vorkel::grid::stepsWithRuns {request primitives loops} {
  variable run_steps
  set steps [expr {[::vorkel::answer::runs $request $primitives] * $run_steps}]
  foreach primitive $loops {
    incr steps [steps $request $primitive]
  }
  return $steps
}

# The searches that together go through the whole grid, those for a lower class first. A search is
# a dict of
#   class    of the points that it is for
#   shape    plain when no phases and duty cycles are asked for. Else moved, for the settings
#            without a fraction, whose outputs can be moved; or fixed, for those with one, beside
#            which all phases are 0 degrees and all duty cycles 50 percent
#   parts    of which M and the divider of output 0 are counted
#   group    see grid_loops.tcl
proc ::vorkel::grid::Searches {request primitive} {
  set whole $::vorkel::grid_dividers::whole
  set parts [expr {[::vorkel::hardware::hasFractions $request $primitive] ?
    $::vorkel::hardware::fraction : $whole}]
  if {![::vorkel::answer::isShapeAsked $request]} {
    set kinds [list [list 0 plain $parts]]
  } else {
    set kinds {}
    foreach class {0 1} {
      lappend kinds [list $class moved $whole]
      if {$parts != $whole && $class >= [::vorkel::grid_dividers::fixedClass $request]} {
        lappend kinds [list $class fixed $parts]
      }
    }
  }
  set searches {}
  foreach kind $kinds {
    lassign $kind class shape parts
    foreach group [::vorkel::grid_loops::groups $request $primitive $parts] {
      lappend searches [dict create class $class shape $shape parts $parts group $group]
    }
  }
  return $searches
}

proc ::vorkel::grid::Size {search} {
  return [llength [dict get $search group rows]]
}

# The points that a search finds.
proc ::vorkel::grid::Found {request primitive search tick} {
  dict with search {}
  set most Inf
  if {$class == 0 && $shape ne "plain"} {
    set most [dict get $request tolerance]
  }
  set input [lindex [dict get $request inputs] 0]
  set targets [::vorkel::grid_dividers::targets $request $primitive $class $shape $parts]
  set points {}
  foreach loop [::vorkel::grid_loops::survivors $input $parts $group $targets $most $tick] {
    lassign $loop count d
    set ratio [::vorkel::actual::reduce $count [expr {$parts * $d}]]
    set choice [::vorkel::grid_dividers::choose $input \
      [::vorkel::grid_loops::vco $input $count $parts $d] $ratio \
      [lindex $targets [expr {$count % $parts != 0}]]]
    lassign $choice ppm phase duty dividers
    if {$ppm > $most + $::vorkel::answer::rounding} continue
    set vco [::vorkel::actual::frequency $input $ratio]
    set m [::vorkel::grid_dividers::number $count $parts]
    foreach bandwidth [dict get $group bandwidths] {
      lappend points [list $class $ppm $phase $duty Inf $vco $d $m $bandwidth $primitive $dividers]
    }
  }
  return [Timed $request $points]
}

# Points with their jitter, as far as it is known. It is that of the VCO, the same behind each
# divider.
proc ::vorkel::grid::Timed {request points} {
  variable place
  if {[llength $points] == 0 || ![::vorkel::timing::hasCalculator [dict get $request device]]} {
    return $points
  }
  set input [lindex [dict get $request inputs] 0]
  set handle [Ip::Vorkel::Init]
  try {
    $handle SetDevice [dict get $request device]
    return [lmap point $points {
      # A refusal is a sentence.
      catch {$handle GetPLLPkToPkJitter $input [Of $point m] [Of $point d] [Of $point bandwidth] 1 \
        [dict get $request inputJitter]} jitter
      if {[string is double -strict $jitter]} {
        lset point [dict get $place jitter] $jitter
      }
      set point
    }]
  } finally {
    rename $handle {}
  }
}
