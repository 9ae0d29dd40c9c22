# The commands tsyn and pll.

package provide vorkel::synthesis 1.1
package require vorkel::engine 1.1
package require vorkel::report 1.1
package require vorkel::request 1.1

namespace eval ::vorkel::synthesis {}

# Solves what the words ask of a primitive, PLL or TSYN, and answers the report.
proc ::vorkel::synthesis::run {primitive words} {
  set request [::vorkel::request::parse $primitive $words]
  return [::vorkel::report::render $request [::vorkel::engine::solve $request]]
}
