# Numbers as the user writes them, checked before the engine sees them, and as reports show
# them. The engine reads any text as a number; a mistyped one would silently be 0 there.

package provide vorkel::numbers 1.1
package require vorkel::options 1.1

namespace eval ::vorkel::numbers {
  variable decimal {^[-+]?([0-9]+\.?[0-9]*|\.[0-9]+)([eE][-+]?[0-9]+)?$}
  variable largest 1.7976931348623157e308
  variable largest_jitter 1e9
}

# The value of a decimal number. `what` names it in the message when it is none, or has no
# finite double. Numbers such as 0100 are decimal, as the engine reads them.
proc ::vorkel::numbers::parse {text what} {
  variable decimal
  variable largest
  if {![regexp -- $decimal $text] || [scan $text %f value] != 1} {
    throw {VORKEL USAGE} "$what: \"$text\" is not a number"
  }
  if {abs($value) > $largest} {
    throw {VORKEL USAGE} "$what: [::vorkel::options::shown $text] is too large"
  }
  return $value
}

# Checks of units.tcl: each answers "" or what a value must be.
proc ::vorkel::numbers::positive {value} {
  return [expr {$value > 0.0 ? "" : "greater than 0"}]
}

proc ::vorkel::numbers::notNegative {value} {
  return [expr {$value >= 0.0 ? "" : "0 or greater"}]
}

# A jitter in ps; a millisecond is beyond any clock.
proc ::vorkel::numbers::jitter {value} {
  variable largest_jitter
  if {$value > $largest_jitter} {
    return "at most 1 ms"
  }
  return [notNegative $value]
}

proc ::vorkel::numbers::percentage {value} {
  return [expr {$value >= 0.0 && $value <= 100.0 ? "" : "between 0 and 100"}]
}

proc ::vorkel::numbers::turn {value} {
  return [expr {abs($value) <= 360.0 ? "" : "between -360 and 360"}]
}

# A number with up to `decimals` decimals, without trailing zeros and never "-0".
proc ::vorkel::numbers::short {value decimals} {
  set text [fixed $value $decimals]
  if {[string first . $text] >= 0} {
    set text [string trimright [string trimright $text 0] .]
  }
  return $text
}

# A number with exactly `decimals` decimals, and never "-0.00".
proc ::vorkel::numbers::fixed {value decimals} {
  set text [format %.*f $decimals $value]
  if {[regexp {^-[0.]*$} $text]} {
    set text [string range $text 1 end]
  }
  return $text
}

# A time in ps, as all of them are shown.
proc ::vorkel::numbers::ps {value} {
  return [fixed $value 3]
}
