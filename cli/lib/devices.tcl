# The command devices: which devices there are, and the limits of one.

package provide vorkel::devices 1.1
package require vorkel::catalogue 1.1
package require vorkel::hardware 1.1
package require vorkel::limit_doubts 1.1
package require vorkel::options 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::devices {
  variable label_width 10
  # So many grades stand beside each other.
  variable most_grades 5
  # No more letters of a description are shown.
  variable most_described 1000
  # Behind a range whose ends are the wrong way round.
  variable mark " !"
}

# Answers the list of all devices, or all limits of the device, or of the grade, that a part
# name, or its beginning, stands for.
proc ::vorkel::devices::run {words} {
  set operands [::vorkel::options::operands $words 1]
  TellFolders
  if {[llength $operands] == 0} {
    return [All]
  }
  return [One [lindex $operands 0]]
}

# Says on standard error which folders of VORKEL_DEVICES there are not: the host passes over them.
proc ::vorkel::devices::TellFolders {} {
  if {![info exists ::env(VORKEL_DEVICES)]} return
  foreach folder [lsort -unique [split $::env(VORKEL_DEVICES) :]] {
    if {$folder ne "" && ![file isdirectory [::vorkel::options::path $folder]]} {
      # Nobody may be listening.
      catch {
        puts stderr "vorkel: warning: VORKEL_DEVICES names [::vorkel::options::shown $folder],\
          which is no folder"
      }
    }
  }
}

# One row for each primitive of each device, in its default grade. A device whose file cannot
# be read does not hide the others.
proc ::vorkel::devices::All {} {
  set rows {}
  set troubles ""
  foreach name [::vorkel::catalogue::names] {
    try {
      set device [::vorkel::catalogue::resolve $name]
      lappend rows {*}[Rows $device]
      append troubles [Doubts "$name, " [dict get $device grade] [dict get $device limits]]
    } trap {VORKEL USAGE} {reason} {
      append troubles [::vorkel::table::prose \
        "[::vorkel::options::escaped $name] cannot be used: " [::vorkel::options::escaped $reason]]
    }
  }
  set columns {{left device} {left grade} {left primitive} {left {VCO MHz}} {left {PFD MHz}}
    {left {outputs MHz}} {left {output 1}}}
  set text [::vorkel::table::render $columns $rows]
  if {$troubles ne ""} {
    append text \n $troubles
  }
  append text "\nThe grade is the device's default; devices NAME shows all limits.\n"
  if {[lsearch -index 2 $rows PLL] >= 0} {
    append text [::vorkel::table::paragraph "The last column is the highest frequency of output 1\
      of a PLL, which can drive an I/O clock."]
  }
  if {[lsearch -index 2 $rows KRU_CLKGEN] >= 0} {
    lassign [::vorkel::catalogue::clkgenRange] lowest highest
    append text [::vorkel::table::paragraph "The engine looks for a KRU_CLKGEN from $lowest\
      to $highest MHz only, whatever the device."]
  }
  return $text
}

# What is doubtful about the limits of a grade, a line each.
proc ::vorkel::devices::Doubts {whose grade limits} {
  set text ""
  foreach doubt [::vorkel::limit_doubts::of $limits] {
    append text [::vorkel::table::prose "warning: " "${whose}grade $grade:\
      [dict get $doubt sentence]"]
  }
  return $text
}

proc ::vorkel::devices::Rows {device} {
  set limits [dict get $device limits]
  set label [list [dict get $device device] [dict get $device grade]]
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
  variable mark
  if {$range eq ""} {
    return -
  }
  lassign $range lowest highest
  return [format "%.6g - %.6g%s" $lowest $highest [expr {$lowest > $highest ? $mark : ""}]]
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
  variable most_described
  lassign [Shown $part] description grades
  set limits [dict get $description limits]
  set text ""
  foreach {label value} [list \
    device [dict get $description name] \
    about [::vorkel::options::escaped \
      [string map {\n { } \r { } \t { }} [dict get $description description]] $most_described] \
    file [::vorkel::options::escaped [dict get $description file]] \
    packages [Choice $description package] \
    grades [Choice $description grade]] {
    append text [::vorkel::table::labelled $label_width $label $value]
  }
  set there [concat {*}[lmap grade $grades {
    ::vorkel::catalogue::primitivesOf [dict get $limits $grade]
  }]]
  set counted 0
  foreach primitive [::vorkel::catalogue::primitives] {
    if {$primitive ni $there} continue
    append text \n [Limits $primitive $grades $limits] [Note [Settings $primitive]]
    if {$primitive in {PLL TSYN} && !$counted} {
      set counted 1
      append text [CountNote]
    }
    if {$primitive eq "KRU_CLKGEN"} {
      append text [ClkgenNote]
    }
  }
  set doubts [join [lmap grade $grades {Doubts "" $grade [dict get $limits $grade]}] ""]
  if {$doubts ne ""} {
    append text \n $doubts
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

# The settings that a primitive has on every device. CLKDV has no 8.5, though 7.5, and ends at 17.
proc ::vorkel::devices::Settings {primitive} {
  namespace upvar ::vorkel::hardware smallest_m smallest_m largest_m largest_m \
    largest_d largest_d largest_divider largest_divider fraction fraction \
    whole_outputs whole_outputs kru_smallest_m kru_smallest_m kru_largest kru_largest \
    clkgen_divides clkgen_divides
  switch -- $primitive {
    PLL {
      return "M is [dict get $smallest_m PLL] to $largest_m, D 1 to $largest_d and each output\
        divider 1 to $largest_divider, at most twice O_MAX_HT_LT; all are whole. Output 1 can drive\
        an I/O clock and goes up to CLKOUT_FREQ_MAX_IOCLK, the others to CLKOUT_FREQ_MAX_GCLK."
    }
    TSYN {
      return "M is 1 or [dict get $smallest_m TSYN] to $largest_m, D 1 to $largest_d and each\
        output divider 1 to $largest_divider, at most twice O_MAX_HT_LT. With fewer than\
        $whole_outputs outputs, M and the divider of output 0 can go in steps of 1/$fraction, the\
        divider from 2 on; the engine's search takes whole M, best takes all."
    }
    KRU_SP {
      return "M of CLKFX is $kru_smallest_m to [dict get $kru_largest KRU_SP], D 1 to\
        [dict get $kru_largest KRU_SP]. CLKDV divides by 2 to 8 in steps of 0.5, or by 9 to 17."
    }
    KRU_CLKGEN {
      return "M of CLKFX is $kru_smallest_m to [dict get $kru_largest KRU_CLKGEN], D 1 to\
        [dict get $kru_largest KRU_CLKGEN]. CLKFXDV divides CLKFX by\
        [::vorkel::options::enumerate $clkgen_divides or]."
    }
  }
  return ""
}

proc ::vorkel::devices::Note {sentence} {
  return [::vorkel::table::prose "note: " $sentence]
}

# What the limit of a count means.
proc ::vorkel::devices::CountNote {} {
  return [Note "O_MAX_HT_LT is the largest number of VCO cycles for which an output divider can\
    hold its output high or low. The further a divider is above it, the nearer to 50 % are the duty\
    cycles that it has."]
}

# What holds where a KRU_CLKGEN is planned.
proc ::vorkel::devices::ClkgenNote {} {
  set ranges [lmap {pin range} $::vorkel::catalogue::clkgen_ranges {
    string cat [join $range { to }] " MHz on $pin"
  }]
  return [Note "the engine does not read these limits to find a\
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
