# The phases that the engine is asked for on a KRU.
#
# It takes them as numbers: the pins have 0, 90, 180 and 270 degrees, or 0 and 180, one PHASE_SHIFT
# moves them all, and what is left of each phase above that of a pin must be the same to the last
# bit. So it has nothing for -90 degrees, which are 270, nor for 10.1 beside 100.1, of which the
# arithmetic leaves two different rests. And an output whose phase does not matter must have one
# that goes with the others. It is asked, in this order, until it has what is wanted:
#   for the phases as they are written
#   for those between 0 and 360 degrees that are the same
#   for those that the pins make with one step of PHASE_SHIFT, the one that comes nearest to all,
#   where all are then within their tolerance
#   for those with the nearest step that is not 0: the pins that make a frequency need not have the
#   phase of a pin, such as 90 degrees, but they have all steps below it
# each time with these phases of the outputs that ask for none: 0, each one that is asked for, and
# those 90, 180 and 270 degrees from it.

package provide vorkel::kru_phases 1.1
package require vorkel::actual 1.1

namespace eval ::vorkel::kru_phases {
  # Degrees by which a phase stays below the next one of a pin: it is that of a pin from there on.
  variable below 0.001
}

# The lists of phases to ask for, each a phase for each output. `allowed` is how far a phase may be
# off, degrees.
proc ::vorkel::kru_phases::lists {request primitive allowed} {
  set asked [lmap output [dict get $request outputs] {dict get $output phase}]
  set quarter [Quarter $request $primitive]
  set shifts [expr {$primitive eq "KRU_SP"}]
  set all [list $asked [Turned $asked] [Stepped $asked $quarter $shifts $allowed]]
  if {$shifts} {
    lappend all [Stepped $asked $quarter $shifts $allowed 1]
  }
  set lists [dict create]
  foreach phases $all {
    foreach filling [Fillings $phases] {
      set list [lmap phase $phases {expr {$phase eq "" ? $filling : $phase}}]
      set key [lmap phase $list {expr {double($phase)}}]
      if {![dict exists $lists $key]} {
        dict set lists $key $list
      }
    }
  }
  return [dict values $lists]
}

# The largest step of PHASE_SHIFT where the phases of pins are so many degrees apart. Steps are
# rounded, and half a step is one only from there on, which is a pin already.
proc ::vorkel::kru_phases::lastStep {quarter} {
  return [expr {int(ceil($quarter / 360.0 * $::vorkel::actual::shift_steps - 0.5))}]
}

# The degrees between the phases of pins. Without feedback there are only CLKFX and CLKFX180, as on
# a KRU_CLKGEN.
proc ::vorkel::kru_phases::Quarter {request primitive} {
  return [expr {$primitive eq "KRU_SP" && [dict get $request feedback] ? 90.0 : 180.0}]
}

# Phases from 0 to below 360 degrees; those that are so already stay as they are written.
proc ::vorkel::kru_phases::Turned {phases} {
  return [lmap phase $phases {
    if {$phase ne "" && ($phase < 0 || $phase >= 360)} {
      set phase [::vorkel::actual::turned $phase]
    }
    set phase
  }]
}

# The phases that the pins make with the step of PHASE_SHIFT, of those below the phase of the next
# pin, whose largest error is the smallest; without PHASE_SHIFT, those of the pins. Where that is
# larger than it may be the phases stay as they are. `first` is the first step to try.
proc ::vorkel::kru_phases::Stepped {phases quarter shifts allowed {first 0}} {
  variable below
  set steps $::vorkel::actual::shift_steps
  set last [expr {$shifts ? [lastStep $quarter] : 0}]
  set least [expr {$allowed * (1 + 1e-9)}]
  set best $phases
  for {set step $first} {$step <= $last} {incr step} {
    set offset [expr {$step * 360.0 / $steps}]
    # What the engine is to be asked for, of which it makes this step.
    set rest [expr {min($offset, $quarter - $below)}]
    # In binary fractions, so that nothing of it is lost beside the phase of a pin.
    set rest [expr {floor($rest * 1024) / 1024}]
    set worst 0.0
    set made [lmap phase $phases {
      if {$phase ne ""} {
        set pin [expr {round(($phase - $offset) / $quarter) * $quarter}]
        set error [expr {abs([::vorkel::actual::phaseDifference [expr {$pin + $offset}] $phase])}]
        set worst [expr {max($worst, $error)}]
        set phase [expr {[::vorkel::actual::turned $pin] + $rest}]
      }
      set phase
    }]
    if {$worst < $least} {
      set least $worst
      set best $made
    }
  }
  return $best
}

# The phases to try for the outputs that ask for none.
proc ::vorkel::kru_phases::Fillings {phases} {
  set fillings 0
  if {"" ni $phases} {
    return $fillings
  }
  foreach turn {0.0 90.0 180.0 270.0} {
    foreach phase $phases {
      if {$phase eq ""} continue
      set filling [expr {$turn == 0 ? $phase : [::vorkel::actual::turned [expr {$phase + $turn}]]}]
      if {$filling ni $fillings} {
        lappend fillings $filling
      }
    }
  }
  return $fillings
}
