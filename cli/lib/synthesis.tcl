# The commands tsyn, pll, kru and clkgen.

package provide vorkel::synthesis 1.1
package require vorkel::answer 1.1
package require vorkel::help 1.1
package require vorkel::output 1.1
package require vorkel::plan_refusals 1.1
package require vorkel::report 1.1
package require vorkel::request 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::synthesis {}

# Solves what the words ask of a primitive (request.tcl), writes the report, and answers the
# exit status.
proc ::vorkel::synthesis::run {primitive words} {
  set call [::vorkel::request::parse $primitive $words]
  set request [dict get $call request]
  if {[dict get $request trace] && [dict get $call format] ne "text"} {
    throw {VORKEL USAGE} "--trace goes with --format text only"
  }
  ::vorkel::output::into [dict get $call file]
  set answer [::vorkel::answer::solve $request $primitive]
  if {![dict get $answer solved]} {
    throw {VORKEL UNSOLVED} [Unsolved $call $primitive $answer]
  }
  if {[dict get $call format] eq "text"} {
    set text [::vorkel::report::render $answer]
  } else {
    set text [::vorkel::output::format [dict get $call format] [list $answer] $request]
  }
  ::vorkel::output::write $text [dict get $call file]
  return [::vorkel::answer::status $answer]
}

# What is told when there is no configuration: the engine's sentence, and who says more.
proc ::vorkel::synthesis::Unsolved {call primitive answer} {
  set reason [dict get $answer reason]
  set cause [::vorkel::plan_refusals::cause [dict get $call request] $primitive $reason ""]
  set text $reason\n
  if {$cause ne ""} {
    append text [::vorkel::table::prose "" $cause]
  }
  return "${text}hint: what stands in the way: [::vorkel::help::command explain \
    [list {*}[dict get $call words] --primitive $primitive]]"
}
