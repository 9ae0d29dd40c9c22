# Values as people write them, such as 148.5MHz, 8ns, 100/3, 90deg or 50%, in the units that the
# rest of the program counts in.

package provide vorkel::units 1.1
package require vorkel::numbers 1.1
package require vorkel::options 1.1

namespace eval ::vorkel::units {
  variable number {[-+]?(?:[0-9]+\.?[0-9]*|\.[0-9]+)(?:[eE][-+]?[0-9]+)?}
  # For each kind of value: the unit of a number without one, examples, what a value must be (a
  # check of numbers.tcl), and its units, which are written in any case (but see other_units). A
  # unit has what to do with the number: multiply it, divide it, or divide by it, as a period is
  # made a frequency. A range is that of all that is shown in columns.
  variable kinds {
    frequency {unit MHz article "a frequency" examples "100, 148.5MHz, 100/3 or 8ns"
      check positive units {hz {/ 1e6} khz {/ 1e3} mhz {* 1.0} ghz {* 1e3}
        ps {by 1e6} ns {by 1e3} us {by 1.0} ms {by 1e-3}}
      known "Hz, kHz, MHz and GHz, or ps, ns, us and ms for a period"
      range {1e-6 1e6} bounds "1 Hz to 1000 GHz"}
    phase {unit degrees article "a phase" examples "90, 90deg or -45"
      check turn units {deg {* 1.0} degree {* 1.0} degrees {* 1.0} ° {* 1.0}} known "deg"}
    duty {unit percent article "a duty cycle" examples "50, 50% or 33.3"
      check percentage units {% {* 1.0} percent {* 1.0}} known "%"}
    jitter {unit ps article "a jitter" examples "50, 50ps or 0.05ns"
      check jitter units {fs {/ 1e3} ps {* 1.0} ns {* 1e3} us {* 1e6} ms {* 1e9}}
      known "fs, ps, ns, us and ms"}
    tolerance {unit ppm article "a tolerance" examples "100, 100ppm or 0.01%"
      check notNegative units {ppm {* 1.0} ppb {/ 1e3} % {* 1e4}} known "ppm, ppb and %"
      range {0 1e9} bounds "0 to 1000000000 ppm"}
  }
  # Units whose case says something else than what is nearly always meant: what they stand for
  # and what to write. All capitals, or none, say nothing.
  variable other_units {mHz {millihertz MHz} mHZ {millihertz MHz} Ps {petaseconds ps}
    Ms {megaseconds ms}}
  # The entry of a list for an output that asks for nothing.
  variable none -
}

# The value of a text, a double in the unit of its kind. `what` names it in a complaint, which
# is thrown as wrong usage.
proc ::vorkel::units::value {text kind what} {
  return [lindex [Parse $text $kind $what] 0]
}

# The values of a text with commas between them. With `optional` an entry may be "-"; it is ""
# in the answer. Where some entry is in another unit than numbers without one, an entry without a
# unit would be a trap: who writes "8,16 ns" means both.
proc ::vorkel::units::values {text kind what {optional 0}} {
  variable kinds
  variable none
  set values {}
  set bare ""
  set strange ""
  foreach entry [split $text ,] {
    set entry [string trim $entry]
    if {$entry eq ""} {
      throw {VORKEL USAGE} "$what: a number is missing in \"[::vorkel::options::shown $text]\""
    }
    if {$optional && $entry eq $none} {
      lappend values ""
      continue
    }
    lassign [Parse $entry $kind $what] value unit rule
    lappend values $value
    if {$unit eq ""} {
      set bare $entry
    } elseif {$rule ne {* 1.0}} {
      set strange [list $entry $unit]
    }
  }
  if {[llength $values] == 0} {
    throw {VORKEL USAGE} "$what: the list is empty"
  }
  if {$bare ne "" && $strange ne ""} {
    lassign $strange other unit
    set usual [dict get $kinds $kind unit]
    throw {VORKEL USAGE} "$what: \"$bare\" has no unit, and beside \"$other\" it could be in\
      $usual or in $unit; write $bare$usual or $bare$unit"
  }
  return $values
}

# A list of the value, the unit as it is written, and what it does.
proc ::vorkel::units::Parse {text kind what} {
  variable kinds
  variable number
  set facts [dict get $kinds $kind]
  set shown [::vorkel::options::shown $text]
  set pattern "^\\s*($number)(?:\\s*/\\s*($number))?\\s*(\[^\\s0-9.\]\[^0-9\]*)?\$"
  if {![regexp -- $pattern $text -> first second unit]} {
    throw {VORKEL USAGE} "$what: \"$shown\" is not [dict get $facts article], such as\
      [dict get $facts examples]"
  }
  set value [::vorkel::numbers::parse $first $what]
  if {$second ne ""} {
    set divisor [::vorkel::numbers::parse $second $what]
    if {$divisor == 0.0} {
      throw {VORKEL USAGE} "$what: \"$shown\" divides by 0"
    }
    set value [expr {$value / $divisor}]
  }
  set demand [::vorkel::numbers::[dict get $facts check] $value]
  if {$demand ne ""} {
    throw {VORKEL USAGE} "$what: $shown must be $demand"
  }
  set unit [string trim $unit]
  set rule [Rule $kind $unit $shown $what]
  set value [Convert $value $rule]
  set demand [::vorkel::numbers::[dict get $facts check] $value]
  if {$demand ne "" && $kind eq "jitter"} {
    throw {VORKEL USAGE} "$what: $shown must be $demand"
  }
  if {[dict exists $facts range]} {
    lassign [dict get $facts range] lowest highest
    if {$value < $lowest || $value > $highest} {
      throw {VORKEL USAGE} "$what: $shown is out of range: [dict get $facts article] is from\
        [dict get $facts bounds]"
    }
  }
  if {$demand ne "" || abs($value) > $::vorkel::numbers::largest} {
    throw {VORKEL USAGE} "$what: $shown is out of any range"
  }
  return [list $value $unit $rule]
}

# What a unit does with the number before it.
proc ::vorkel::units::Rule {kind unit shown what} {
  variable kinds
  variable other_units
  if {$unit eq ""} {
    return {* 1.0}
  }
  set facts [dict get $kinds $kind]
  if {[dict exists $other_units $unit] &&
      [dict exists $facts units [string tolower [lindex [dict get $other_units $unit] 1]]]} {
    lassign [dict get $other_units $unit] meaning right
    throw {VORKEL USAGE} "$what: $unit in \"$shown\" is $meaning; write $right"
  }
  # In a locale without UTF-8 the bytes of a degree sign come as letters of their own.
  foreach name [list $unit [encoding convertfrom utf-8 [encoding convertto iso8859-1 $unit]]] {
    set name [string tolower $name]
    if {[dict exists $facts units $name]} {
      return [dict get $facts units $name]
    }
  }
  throw {VORKEL USAGE} "$what: unknown unit \"[::vorkel::options::shown $unit]\" in \"$shown\"; the\
    units of [dict get $facts article] are [dict get $facts known]"
}

proc ::vorkel::units::Convert {value rule} {
  lassign $rule operation factor
  switch -- $operation {
    * { return [expr {$value * $factor}] }
    / { return [expr {$value / $factor}] }
    by { return [expr {$factor / $value}] }
  }
}
