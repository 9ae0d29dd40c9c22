# The phases and duty cycles next to what an output asks for that work, with all else as it is.

package provide vorkel::explain_steps 1.1
package require vorkel::actual 1.1
package require vorkel::answer 1.1
package require vorkel::engine 1.1
package require vorkel::explain_calls 1.1
package require vorkel::explain_nearest 1.1
package require vorkel::explain_vcos 1.1
package require vorkel::numbers 1.1

namespace eval ::vorkel::explain_steps {
  # As many of a primitive are tried below and above what is asked for.
  variable most_tried 40
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
  if {[llength $values] > $most_tried} {
    set ::vorkel::explain_nearest::stopped 1
  }
  foreach value [lrange $values 0 $most_tried-1] {
    if {[::vorkel::explain_nearest::isLate]} break
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

# What the pins of a KRU have beside one PHASE_SHIFT: phases at quarters of a turn from 0 and from
# those of all outputs, and what the engine answers. There is one duty cycle, 50 %, but for CLKDV.
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
  set bases 0.0
  set other -1
  foreach output [dict get $request outputs] {
    if {[incr other] != $index && [dict get $output phase] ne ""} {
      lappend bases [dict get $output phase]
    }
  }
  foreach base $bases {
    foreach quarter {-270 -180 -90 0 90 180 270 360} {
      set phase [expr {$base + $quarter}]
      if {abs($phase) <= 360} {
        lappend values $phase
      }
    }
  }
  return $values
}
