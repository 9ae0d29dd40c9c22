# A copy of a device file that is mended, mistake by mistake, so that the host reads on and finds
# the next one. What is wrong is left out where nothing depends on it, and else replaced by what is
# right. A mistake that is only there because of that is known as such.
#
# A copy is a dict:
#   device    the name that the device must have
#   lines     lists of a number, which the line has in the file, and its text
#   replaced  lists of the heading above a name (see Heading) and the name, where another value
#             than the user's stands

package provide vorkel::device_repair 1.1

namespace eval ::vorkel::device_repair {
  # Coefficients whose values depend on each other, in rising order, and some that are right.
  # Of the others 1 is.
  variable bandwidths {LOOP_BANDWIDTH_LOW 0.01 LOOP_BANDWIDTH_OPTIMIZED 0.02
    LOOP_BANDWIDTH_HIGH 0.03}
  # An entry that ends on its line: its name, and a number or the like, a text or a list.
  variable entry {(?x) ^ \s* (\w+ | "\w+") \s* = \s*
    ( [^\s\[\{"'\#] [^\[\{"'\#]* | "[^"\\]*" \s* | \[ [^\[\]\#]* \] \s* )
    (\#.*)? $}
}

proc ::vorkel::device_repair::begin {device text} {
  set number 0
  # An empty text has a line, too.
  set lines [lmap line [lrange [split $text\n \n] 0 end-1] {list [incr number] $line}]
  return [dict create device $device lines $lines replaced {}]
}

proc ::vorkel::device_repair::text {copy} {
  return [join [lmap line [dict get $copy lines] {lindex $line 1}] \n]
}

# The number in the file of a line of the copy.
proc ::vorkel::device_repair::line {copy line} {
  set last [expr {[llength [dict get $copy lines]] - 1}]
  return [lindex [dict get $copy lines] [expr {min($line - 1, $last)}] 0]
}

# Whether a mistake on a line of the copy is there only because the copy was mended.
proc ::vorkel::device_repair::isFollowing {copy line reason} {
  variable bandwidths
  if {[string match {* is not in the list of packages, *} $reason]} {
    return [expr {{{} packages} in [dict get $copy replaced]}]
  }
  if {[regexp {^"(LOOP_BANDWIDTH_\w+)" must be above } $reason]} {
    set heading [Heading $copy $line]
    foreach name [dict keys $bandwidths] {
      if {[list $heading $name] in [dict get $copy replaced]} {
        return 1
      }
    }
  }
  return 0
}

# The copy without a mistake on a line of it, or as it is when that cannot be mended.
proc ::vorkel::device_repair::mend {copy line reason} {
  if {[regexp {^unknown (?:keyword|coefficient|key) "(\w+)"} $reason -> name] ||
      [regexp {^"(description|default_package|default_grade)" must be a text$} $reason -> name]} {
    return [Without $copy $line $name]
  }
  if {[regexp { is not in the list of packages, } $reason]} {
    return [Without $copy $line default_package]
  }
  if {[regexp { is not one of the grades, } $reason]} {
    return [Without $copy $line default_grade]
  }
  if {[regexp {^"(\w+)" must be a (?:finite positive )?number$} $reason -> name]} {
    # A keyword may be missing, a coefficient may not.
    if {[string match *.calculator [Heading $copy $line]]} {
      return [Replace $copy $line $name [Sample $name]]
    }
    return [Without $copy $line $name]
  }
  if {[regexp {^the coefficient "(\w+)" is missing, } $reason -> name]} {
    if {[string match *.calculator [Heading $copy $line]]} {
      return [Insert $copy $line $name [Sample $name]]
    }
    return $copy
  }
  if {[regexp {^"(LOOP_BANDWIDTH_\w+)" must be (?:above|at most) } $reason -> name]} {
    return [Rising $copy $line $name]
  }
  if {[regexp {^(?:device "|"device" |device name ")} $reason]} {
    return [Replace $copy $line device "\"[dict get $copy device]\""]
  }
  if {[regexp {^(?:"packages" |package name "|duplicate package ")} $reason]} {
    return [Replace $copy $line packages {["any"]}]
  }
  switch -- $reason {
    {the key "device" is missing} {
      return [Insert $copy 0 device "\"[dict get $copy device]\""]
    }
    {the key "packages" is missing} { return [Insert $copy 0 packages {["any"]}] }
  }
  return $copy
}

# The name of the table that a line is in, as in [grade.1.calculator], or "" for none.
proc ::vorkel::device_repair::Heading {copy line} {
  for {set index [expr {$line - 1}]} {$index >= 0} {incr index -1} {
    if {[regexp {^\s*\[([^\[\]]*)\]\s*(#.*)?$} [lindex [dict get $copy lines] $index 1] -> name]} {
      return [string map {{ } {} \t {} \" {}} $name]
    }
  }
  return ""
}

proc ::vorkel::device_repair::Sample {name} {
  variable bandwidths
  return [expr {[dict exists $bandwidths $name] ? [dict get $bandwidths $name] : 1}]
}

# Whether a line of the copy is the entry of a name, and nothing else.
proc ::vorkel::device_repair::IsEntry {copy line name} {
  variable entry
  return [expr {[regexp $entry [lindex [dict get $copy lines] $line-1 1] -> found] &&
    [string trim $found \"] eq $name}]
}

proc ::vorkel::device_repair::Without {copy line name} {
  if {[IsEntry $copy $line $name]} {
    set lines [dict get $copy lines]
    lset lines $line-1 1 ""
    dict set copy lines $lines
  }
  return $copy
}

proc ::vorkel::device_repair::Replace {copy line name value} {
  if {[IsEntry $copy $line $name]} {
    set lines [dict get $copy lines]
    lset lines $line-1 1 "$name = $value"
    dict set copy lines $lines
    dict lappend copy replaced [list [Heading $copy $line] $name]
  }
  return $copy
}

# The copy with an entry behind a line; behind line 0 it is the first one.
proc ::vorkel::device_repair::Insert {copy line name value} {
  set lines [dict get $copy lines]
  set number [expr {$line == 0 ? 1 : [lindex $lines $line-1 0]}]
  dict set copy lines [linsert $lines $line [list $number "$name = $value"]]
  dict lappend copy replaced [list [Heading $copy $line] $name]
  return $copy
}

# The copy with bandwidths that rise up to that of a name, in the table that a line is in.
proc ::vorkel::device_repair::Rising {copy line name} {
  variable bandwidths
  set heading [Heading $copy $line]
  foreach {lower value} $bandwidths {
    for {set number 1} {$number <= [llength [dict get $copy lines]]} {incr number} {
      if {[IsEntry $copy $number $lower] && [Heading $copy $number] eq $heading} {
        set copy [Replace $copy $number $lower $value]
      }
    }
    if {$lower eq $name} break
  }
  return $copy
}
