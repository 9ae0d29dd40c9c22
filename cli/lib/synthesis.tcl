# The commands tsyn, pll, kru and clkgen.

package provide vorkel::synthesis 1.1
package require vorkel::engine 1.1
package require vorkel::kru_report 1.1
package require vorkel::report 1.1
package require vorkel::request 1.1
package require vorkel::timing 1.1

namespace eval ::vorkel::synthesis {}

# Solves what the words ask of a primitive (request.tcl) and answers the report.
proc ::vorkel::synthesis::run {primitive words} {
  set request [::vorkel::request::parse $primitive $words]
  set solution [::vorkel::engine::solve $request]
  set timing [::vorkel::timing::of $request $solution]
  set report [expr {[::vorkel::engine::family $primitive] eq "Kru" ? "kru_report" : "report"}]
  return [::vorkel::${report}::render $request $solution $timing]
}
