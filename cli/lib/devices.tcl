# The command devices: which devices there are, and the limits of one.

package provide vorkel::devices 1.1
package require vorkel::catalogue 1.1
package require vorkel::options 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::devices {
  variable options {}
}

# Answers the list of all devices, or all limits of the device, or of the grade, that a part
# name stands for.
proc ::vorkel::devices::run {words} {
  variable options
  set operands [dict get [::vorkel::options::parse $options $words] operands]
  switch -- [llength $operands] {
    0 { return [All] }
    1 { return [One [lindex $operands 0]] }
  }
  throw {VORKEL USAGE} "unexpected word \"[lindex $operands 1]\""
}

# One row for each primitive of each device, in its default grade. A device whose file cannot
# be read does not hide the others.
proc ::vorkel::devices::All {} {
  set rows {}
  set unreadable ""
  foreach name [::vorkel::catalogue::names] {
    try {
      lappend rows {*}[Rows $name]
    } trap {VORKEL USAGE} {reason} {
      append unreadable "\n$name cannot be used: $reason\n"
    }
  }
  set columns {{left device} {left grade} {left primitive} {left {VCO MHz}} {left {PFD MHz}}
    {left {outputs MHz}} {left {output 1}}}
  set text [::vorkel::table::render $columns $rows]
  append text $unreadable
  append text "\nThe grade is the device's default; devices NAME shows all limits.\n"
  return $text
}

proc ::vorkel::devices::Rows {name} {
  set device [::vorkel::catalogue::resolve $name]
  set limits [dict get $device limits]
  set label [list $name [dict get $device grade]]
  return [lmap primitive [dict get $device primitives] {
    set row [list {*}$label $primitive \
      [Span [::vorkel::catalogue::vcoRange $primitive $limits]] \
      [Span [::vorkel::catalogue::pfdRange $primitive $limits]] \
      [Span [::vorkel::catalogue::outputRange $primitive $limits]] \
      [SecondOutput $primitive $limits]]
    set label {{} {}}
    set row
  }]
}

# A range as text, "-" for none.
proc ::vorkel::devices::Span {range} {
  if {$range eq ""} {
    return -
  }
  lassign $range lowest highest
  return [format "%.6g - %.6g" $lowest $highest]
}

# Output 1 of a PLL may drive an I/O clock, which runs faster.
proc ::vorkel::devices::SecondOutput {primitive limits} {
  if {$primitive ne "PLL"} {
    return ""
  }
  return [format "to %.6g" [dict get $limits CLKOUT_FREQ_MAX_IOCLK]]
}

# Everything that is known about a device: a row for each keyword, a column for each grade.
proc ::vorkel::devices::One {part} {
  set device [::vorkel::catalogue::resolve $part]
  set description [dict get $device description]
  set name [dict get $device device]
  # A part name that is no more than the device's name asks for all grades.
  set grades [dict get $description grades]
  if {$part ne $name} {
    set grades [list [dict get $device grade]]
  }
  set lines {}
  foreach {label value} [list \
    device $name \
    about [dict get $description description] \
    file [dict get $description file] \
    packages [Choice $description package] \
    grades [Choice $description grade]] {
    lappend lines [string trimright [format "%-10s%s" $label $value]]
  }
  set text "[join $lines \n]\n"
  foreach primitive [dict get $device primitives] {
    append text \n [Limits $primitive $grades [dict get $description limits]]
  }
  return $text
}

# The packages or grades (`kind`) of a device, with the default.
proc ::vorkel::devices::Choice {description kind} {
  return "[join [dict get $description ${kind}s] {, }] (default\
    [dict get $description default_$kind])"
}

# The limits of a primitive. A grade that lacks one shows "-".
proc ::vorkel::devices::Limits {primitive grades limits} {
  set columns [list [list left $primitive] {left unit}]
  foreach grade $grades {
    lappend columns [list right "grade $grade"]
  }
  set rows {}
  foreach keyword [::vorkel::catalogue::keywordsOf $primitive] {
    lassign $keyword name unit
    set row [list $name $unit]
    foreach grade $grades {
      if {[dict exists $limits $grade $name]} {
        lappend row [dict get $limits $grade $name]
      } else {
        lappend row -
      }
    }
    lappend rows $row
  }
  return [::vorkel::table::render $columns $rows]
}
