# Why primitives have no configuration, a line for each, as plan and compare tell it.

package provide vorkel::plan_refusals 1.1
package require vorkel::answer 1.1
package require vorkel::engine 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::plan_refusals {
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

# The engine says of a KRU only that it is not possible; what is in the way first is quickly found.
proc ::vorkel::plan_refusals::Reason {request answer} {
  variable long
  set primitive [dict get $answer primitive]
  set reason [dict get $answer reason]
  if {[::vorkel::engine::family $primitive] ne "Kru" ||
      [::vorkel::answer::refusal $request $primitive] ne ""} {
    return $reason
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
