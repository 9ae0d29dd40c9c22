# The phases and duty cycles next to what an output asks for that work, with all else as it is.

package provide vorkel::explain_steps 1.1
package require vorkel::actual 1.1
package require vorkel::answer 1.1
package require vorkel::engine 1.1
package require vorkel::explain_calls 1.1
package require vorkel::explain_kru 1.1
package require vorkel::explain_nearest 1.1
package require vorkel::explain_vcos 1.1
package require vorkel::numbers 1.1

namespace eval ::vorkel::explain_steps {
  # As many of a primitive are tried below and above what is asked for: of a KRU all steps of
  # PHASE_SHIFT, for which its pins have phases in different quarters.
  variable most_tried {Loop 40 Kru 400}
}

# The phases (degrees) or duty cycles (percent), as `what` says, that are nearest below and above
# for each primitive: a dict from text to labels of primitives (see explain_calls.tcl), the nearest
# of all first.
proc ::vorkel::explain_steps::nearest {request primitives index what} {
  set asked [dict get [lindex [dict get $request outputs] $index] $what]
  set told [dict create]
  foreach primitive $primitives {
    if {[::vorkel::answer::refusal $request $primitive] ne ""} continue
    set family [::vorkel::engine::family $primitive]
    set candidates [lmap value [${family}Values $request $primitive $index $what] {
      list [expr {abs($value - $asked)}] [::vorkel::numbers::short $value 6]
    }]
    set candidates [lsort -unique -real -index 1 $candidates]
    foreach side {-1 1} {
      set text [First $request $primitive $index $what [lmap pair [lsort -real -index 0 \
          $candidates] {
        if {([lindex $pair 1] - $asked) * $side <= 0} continue
        lindex $pair 1
      }]]
      if {$text ne ""} {
        dict lappend told $text [::vorkel::explain_calls::label \
          [::vorkel::explain_nearest::with $request $index $what $text] $primitive]
      }
    }
  }
  set sorted [lsort -real -index 0 [lmap text [dict keys $told] {
    list [expr {abs($text - $asked)}] $text
  }]]
  return [concat {*}[lmap pair $sorted {
    list [lindex $pair 1] [dict get $told [lindex $pair 1]]
  }]]
}

# The first of some values of an output with which the primitive does all that is asked, or "".
proc ::vorkel::explain_steps::First {request primitive index what values} {
  variable most_tried
  set most [dict get $most_tried [::vorkel::engine::family $primitive]]
  if {[llength $values] > $most} {
    set ::vorkel::explain_nearest::stopped 1
  }
  foreach value [lrange $values 0 $most-1] {
    if {[::vorkel::explain_nearest::isSpent]} break
    set changed [::vorkel::explain_nearest::with $request $index $what $value]
    if {[::vorkel::explain_nearest::proof $changed $primitive] ne ""} {
      return $value
    }
  }
  return ""
}

# The steps next to what is asked for of all dividers that make the output and that leave the other
# outputs, and its duty cycle or phase, as they are asked for.
proc ::vorkel::explain_steps::LoopValues {request primitive index what} {
  set output [lindex [dict get $request outputs] $index]
  set free [dict replace $output $what ""]
  set values {}
  foreach divider [Dividers $request $primitive $index] {
    if {[::vorkel::explain_vcos::phaseServes $free $divider] &&
        [::vorkel::explain_vcos::dutyServes $request $free $divider]} {
      lappend values {*}[Beside $request $what [dict get $output $what] $divider]
    }
  }
  return $values
}

# The dividers that make the frequency of an output beside the others.
proc ::vorkel::explain_steps::Dividers {request primitive index} {
  set frequency [dict get [lindex [dict get $request outputs] $index] freq]
  set allowed [::vorkel::explain_vcos::allowed $request]
  set found {}
  foreach pair [::vorkel::explain_vcos::beside $request $primitive $index] {
    set vco [lindex $pair 0]
    foreach divider [::vorkel::explain_vcos::dividersAt $request [expr {$vco / $frequency}] 0] {
      if {abs($vco / $divider / $frequency - 1) <= $allowed} {
        lappend found $divider
      }
    }
  }
  return [lsort -integer -unique $found]
}

# The steps of a divider below and above a phase or a duty cycle.
proc ::vorkel::explain_steps::Beside {request what asked divider} {
  if {$what eq "phase"} {
    set step [expr {$::vorkel::actual::phase_step / $divider}]
    set below [expr {floor($asked / $step)}]
    return [lmap count [list $below [expr {$below + 1}]] {
      set phase [expr {$count * $step}]
      if {abs($phase) > 360} continue
      set phase
    }]
  }
  set most [dict get $request limits O_MAX_HT_LT]
  set step [expr {50.0 / $divider}]
  set below [expr {floor($asked / $step) * $step}]
  return [list [::vorkel::actual::dutyOnStep $below $divider $most] \
    [::vorkel::actual::dutyOnStep [expr {$below + $step}] $divider $most]]
}

# What a KRU could have: all phases that pins make with PHASE_SHIFT, those at quarters of a turn
# from those of the other outputs, and what the engine answers. There is one duty cycle, 50 %, but
# for CLKDV.
proc ::vorkel::explain_steps::KruValues {request primitive index what} {
  set values {}
  foreach answer [::vorkel::answer::all $request [list $primitive]] {
    if {[dict get $answer solved]} {
      lappend values [dict get [lindex [dict get $answer outputs] $index] $what]
    }
  }
  if {$what eq "duty"} {
    return [list {*}$values 50.0]
  }
  set others {}
  foreach output [lreplace [dict get $request outputs] $index $index] {
    if {[dict get $output phase] ne ""} {
      lappend others [dict get $output phase]
    }
  }
  set phases [Shifted $request $primitive $index $others]
  foreach other $others {
    foreach quarter {-270 -180 -90 0 90 180 270 360} {
      lappend phases [expr {$other + $quarter}]
    }
  }
  set asked [dict get [lindex [dict get $request outputs] $index] phase]
  foreach phase $phases {
    # Those further away are the same as others that are nearer.
    if {abs($phase) <= 360 && abs($phase - $asked) <= 180} {
      lappend values [::vorkel::numbers::short $phase 3]
    }
  }
  return $values
}

# The phases of the pins of an output with all steps of PHASE_SHIFT that there are and that go with
# the phases of the other outputs. Whether there is feedback may be left open. Only the pins at the
# frequency of CLK0 have all four quarters.
proc ::vorkel::explain_steps::Shifted {request primitive index others} {
  set phases {}
  set pins [lmap row [::vorkel::explain_kru::fitting $request $primitive \
      [dict get [lindex [dict get $request outputs] $index] freq]] {lindex $row 2}]
  set quarter [expr {"CLK0" in $pins ? 90 : 180}]
  foreach distance [expr {[dict get $request feedback] ? 90 : {90 180}}] {
    set shifts [expr {$primitive eq "KRU_SP" ? [::vorkel::explain_kru::shifts $distance] : 0.0}]
    foreach shift $shifts {
      if {![Serves $shift $others $distance]} continue
      for {set pin -360} {$pin <= 360} {incr pin [expr {max($distance, $quarter)}]} {
        lappend phases [expr {$pin + $shift}]
      }
    }
  }
  return $phases
}

# Whether pins that are so many degrees apart have all of some phases with a shift.
proc ::vorkel::explain_steps::Serves {shift phases distance} {
  foreach phase $phases {
    set pin [expr {round(($phase - $shift) / $distance) * $distance}]
    if {![::vorkel::answer::isAllowed phaseError [expr {$pin + $shift - $phase}]]} {
      return 0
    }
  }
  return 1
}
