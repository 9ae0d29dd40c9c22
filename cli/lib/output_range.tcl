# The range of an output of a PLL or a TSYN, which it must keep with each input clock. One ratio
# makes it of both, so that the range with the second one narrows what the first one may make.

package provide vorkel::output_range 1.1
package require vorkel::catalogue 1.1

namespace eval ::vorkel::output_range {}

# The lowest and the highest frequency, MHz, that an output may have with the first input clock.
# `slack` is how far each limit may be passed, MHz.
proc ::vorkel::output_range::of {request primitive index {slack 0}} {
  lassign [::vorkel::catalogue::outputRange $primitive [dict get $request limits] $index] \
    lowest highest
  set first [lindex [dict get $request inputs] 0]
  set from [expr {$lowest - $slack}]
  set to [expr {$highest + $slack}]
  foreach input [lrange [dict get $request inputs] 1 end] {
    set part [expr {double($first) / $input}]
    set from [expr {max($from, ($lowest - $slack) * $part)}]
    set to [expr {min($to, ($highest + $slack) * $part)}]
  }
  return [list $from $to]
}
