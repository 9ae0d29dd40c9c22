# Why primitives have no configuration, a line for each, as plan and compare tell it.

package provide vorkel::plan_refusals 1.1
package require vorkel::answer 1.1
package require vorkel::engine 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::plan_refusals {
  # What the engine says when it sees no VCO for the input clocks.
  variable apart "*2 input clock freqs are too far apart*"
  # The kinds of obstacles (see explain.tcl) whose sentences go on, behind a colon, with all that
  # there is instead.
  variable long {{pin frequency} {pin range} {pin phase}}
}

# The primitives without a configuration among some answers.
proc ::vorkel::plan_refusals::names {answers} {
  return [lmap answer $answers {
    if {[dict get $answer solved]} continue
    dict get $answer primitive
  }]
}

# A line for each of them.
proc ::vorkel::plan_refusals::text {request answers} {
  set text ""
  foreach answer $answers {
    if {![dict get $answer solved]} {
      append text [::vorkel::table::prose "[dict get $answer primitive]: " \
        [Reason $request $answer]]
    }
  }
  return $text
}

# What else there is to say when the engine has said why it has no PLL or TSYN: that limits of the
# device contradict each other, or, where it says of a single input clock that two are too far
# apart, what is in the way of that one. "" for nothing; else it begins with `between`.
proc ::vorkel::plan_refusals::cause {request primitive reason between} {
  variable apart
  if {[::vorkel::engine::family $primitive] ne "Loop" ||
      [::vorkel::answer::refusal $request $primitive] ne ""} {
    return ""
  }
  package require vorkel::limit_doubts 1.1
  set sentences {}
  foreach doubt [::vorkel::limit_doubts::of [dict get $request limits]] {
    if {$primitive in [dict get $doubt lost]} {
      lappend sentences [dict get $doubt sentence]
    }
  }
  if {[llength $sentences] == 0 && [llength [dict get $request inputs]] == 1 &&
      [string match $apart $reason]} {
    package require vorkel::explain_loop 1.1
    foreach finding [::vorkel::explain_loop::inputs $request $primitive] {
      lappend sentences [dict get $finding text]
    }
  }
  return [join [lmap sentence $sentences {string cat $between "The reason: $sentence."}] ""]
}

# The engine says of a KRU only that it is not possible; what is in the way first is quickly found.
proc ::vorkel::plan_refusals::Reason {request answer} {
  variable long
  set primitive [dict get $answer primitive]
  set reason [dict get $answer reason]
  if {[::vorkel::engine::family $primitive] ne "Kru" ||
      [::vorkel::answer::refusal $request $primitive] ne ""} {
    return [string cat $reason [cause $request $primitive $reason " "]]
  }
  package require vorkel::explain_kru 1.1
  package require vorkel::explain_text 1.1
  set findings [::vorkel::explain_kru::findings $request $primitive]
  if {[llength $findings] == 0} {
    return [regsub {^The KRU\S* } $reason {}]
  }
  set first [lindex $findings 0]
  set outputs [dict get $first outputs]
  set text [dict get $first text]
  if {[dict get $first kind] in $long} {
    set text [lindex [split $text :] 0]
  }
  return "[::vorkel::explain_text::outputs $outputs]: $text."
}
