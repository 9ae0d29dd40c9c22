# The command devices: which devices there are, and the limits of one.

package provide vorkel::devices 1.1
package require vorkel::catalogue 1.1
package require vorkel::options 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::devices {
  variable label_width 10
  # So many grades stand beside each other.
  variable most_grades 5
}

# Answers the list of all devices, or all limits of the device, or of the grade, that a part
# name, or its beginning, stands for.
proc ::vorkel::devices::run {words} {
  set operands [::vorkel::options::operands $words 1]
  if {[llength $operands] == 0} {
    return [All]
  }
  return [One [lindex $operands 0]]
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
  if {[lsearch -index 2 $rows KRU_CLKGEN] >= 0} {
    lassign [::vorkel::catalogue::clkgenRange] lowest highest
    append text [::vorkel::table::paragraph "The engine looks for a KRU_CLKGEN from $lowest\
      to $highest MHz only, whatever the device."]
  }
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
  variable label_width
  lassign [Shown $part] description grades
  set limits [dict get $description limits]
  set text ""
  foreach {label value} [list \
    device [dict get $description name] \
    about [dict get $description description] \
    file [dict get $description file] \
    packages [Choice $description package] \
    grades [Choice $description grade]] {
    append text [::vorkel::table::labelled $label_width $label $value]
  }
  set there [concat {*}[lmap grade $grades {
    ::vorkel::catalogue::primitivesOf [dict get $limits $grade]
  }]]
  foreach primitive [::vorkel::catalogue::primitives] {
    if {$primitive ni $there} continue
    append text \n [Limits $primitive $grades $limits]
    if {$primitive eq "KRU_CLKGEN"} {
      append text [ClkgenNote]
    }
  }
  return $text
}

# What the host says of the device that a part name, or its beginning, stands for, and the grades
# to show: all of them when it says no more than the device.
proc ::vorkel::devices::Shown {part} {
  if {$part in [::vorkel::catalogue::names]} {
    set description [::vorkel::catalogue::describe $part]
    return [list $description [dict get $description grades]]
  }
  set device [::vorkel::catalogue::find $part]
  set description [dict get $device description]
  if {[string equal -length [string length $part] $part [dict get $device device]]} {
    return [list $description [dict get $description grades]]
  }
  return [list $description [list [dict get $device grade]]]
}

# The packages or grades (`kind`) of a device, with the default.
proc ::vorkel::devices::Choice {description kind} {
  set default [dict get $description default_$kind]
  return "[join [dict get $description ${kind}s] {, }]\
    ([expr {$default eq "" ? "no default" : "default $default"}])"
}

# What holds where a KRU_CLKGEN is planned.
proc ::vorkel::devices::ClkgenNote {} {
  set ranges [lmap {pin range} $::vorkel::catalogue::clkgen_ranges {
    string cat [join $range { to }] " MHz on $pin"
  }]
  return [::vorkel::table::prose "note: " "the engine does not read these limits to find a\
    KRU_CLKGEN: on every device it takes outputs from [join $ranges { and from }]. clkgen, plan\
    and compare mark an answer that is then outside the limits above, with exit status 3."]
}

# The limits of a primitive. A grade that lacks one shows "-". Grades that do not fit a terminal
# beside each other follow below.
proc ::vorkel::devices::Limits {primitive grades limits} {
  variable most_grades
  set text ""
  while {[llength $grades] > 0} {
    append text [LimitsOf $primitive [lrange $grades 0 $most_grades-1] $limits]
    set grades [lrange $grades $most_grades end]
  }
  return $text
}

proc ::vorkel::devices::LimitsOf {primitive grades limits} {
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
  return [::vorkel::table::fitted $columns $rows]
}
