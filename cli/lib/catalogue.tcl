# The devices that the host knows: what they have, and what a part name stands for.

package provide vorkel::catalogue 1.1
package require vorkel::engine 1.1
package require vorkel::options 1.1

namespace eval ::vorkel::catalogue {
  variable defaultPart vk40
  # The highest frequency at the phase-frequency detector of a PLL with a narrow loop, MHz. A
  # device file has it for a TSYN only.
  variable low_bandwidth_pfd 300
  # The ranges in which the engine looks for the outputs of a KRU_CLKGEN, MHz. It reads none from
  # the device for it, and a handle of its own for each search keeps those that it begins with.
  variable clkgen_ranges {CLKFX {5 374.532} CLKFXDV {0.156 187.266}}
}

# The names of all devices, sorted.
proc ::vorkel::catalogue::names {} {
  ::vorkel::engine::load
  return [::Vorkel::Devices names]
}

# A device as the host describes it. A device file that cannot be read is {VORKEL USAGE FILE}; the
# message tells file, line and column.
proc ::vorkel::catalogue::describe {device} {
  ::vorkel::engine::load
  try {
    return [::Vorkel::Devices describe $device]
  } on error {message} {
    throw {VORKEL USAGE FILE} $message
  }
}

# What a part name, `<device>[<package>][-<grade>]`, stands for, as a dict: device, package,
# grade, part (the full name, defaults filled in), primitives (those of that grade), limits (a
# dict from keyword to text, MHz, ns or a count), and description (what `describe` answers).
# A name that stands for nothing is wrong usage.
#
# Nothing marks where the device ends, so a name can begin with several devices. As for the
# host, the longest that has such a package and grade is meant. A device whose file is bad is not
# passed over in favour of a shorter one; but only for its own name the file is to blame.
proc ::vorkel::catalogue::resolve {part} {
  set unknown "unknown device \"[::vorkel::options::shown $part]\"; the devices are\
    [join [names] {, }]"
  set complaint ""
  set bad ""
  foreach device [Prefixes $part] {
    set rest [string range $part [string length $device] end]
    try {
      set found [Resolve $device $rest]
    } trap {VORKEL DETAIL} {wrong} {
      set found ""
    } trap {VORKEL USAGE FILE} {reason options} {
      if {[string index $rest 0] in {{} -}} {
        return -options $options $reason
      }
      # The rest may be a package of this device, or the name that of another one.
      set wrong "$unknown; it could be a part of $device, whose file is bad: $reason"
      set found ""
      if {$bad eq ""} {
        set bad $reason
      }
    }
    if {$found ne ""} {
      if {$bad ne ""} {
        throw {VORKEL USAGE FILE} $bad
      }
      return $found
    }
    if {$complaint eq ""} {
      set complaint $wrong
    }
  }
  throw {VORKEL USAGE} [expr {$complaint eq "" ? $unknown : $complaint}]
}

# The devices that a part name begins with, the longest first.
proc ::vorkel::catalogue::Prefixes {part} {
  set prefixes [lmap name [names] {
    if {![string equal -length [string length $name] $name $part]} continue
    set name
  }]
  # Prefixes of one text sort by their length.
  return [lsort -decreasing $prefixes]
}

# The part that is made of a device and the rest of a part name. A package or grade that the
# device does not have is thrown as {VORKEL DETAIL}.
proc ::vorkel::catalogue::Resolve {device rest} {
  set description [describe $device]
  regexp {^([^-]*)(-?)(.*)$} $rest -> package dash grade
  set package [Member $description package $package [expr {$package ne ""}]]
  set grade [Member $description grade $grade [expr {$dash ne ""}]]
  set limits [dict get $description limits $grade]
  return [dict create device $device package $package grade $grade part "$device$package-$grade" \
    primitives [primitivesOf $limits] limits $limits description $description]
}

# The package or grade (`kind`) of a device: the one named, or the default. A device may do
# without a default package, but its limits are those of a grade.
proc ::vorkel::catalogue::Member {description kind name named} {
  set device [dict get $description name]
  set known [dict get $description ${kind}s]
  if {!$named} {
    set name [dict get $description default_$kind]
    if {$name eq "" && $kind eq "grade"} {
      throw {VORKEL DETAIL} "$device has no default grade; it has [join $known {, }]"
    }
  } elseif {$name ni $known} {
    throw {VORKEL DETAIL} "$device has no $kind \"[::vorkel::options::shown $name]\"; it has\
      [join $known {, }]"
  }
  return $name
}

# All primitives that the host knows, in its order.
proc ::vorkel::catalogue::primitives {} {
  ::vorkel::engine::load
  set primitives {}
  foreach keyword [::Vorkel::Devices keywords] {
    foreach primitive [lindex $keyword 2] {
      if {$primitive ni $primitives} {
        lappend primitives $primitive
      }
    }
  }
  return $primitives
}

# The primitives whose limits are all there, in the host's order.
proc ::vorkel::catalogue::primitivesOf {limits} {
  return [lmap primitive [primitives] {
    set missing [lmap keyword [keywordsOf $primitive] {
      if {[dict exists $limits [lindex $keyword 0]]} continue
      set keyword
    }]
    if {[llength $missing] > 0} continue
    set primitive
  }]
}

# The keywords that a primitive needs, each a list of keyword and unit.
proc ::vorkel::catalogue::keywordsOf {primitive} {
  set keywords {}
  foreach keyword [::Vorkel::Devices keywords] {
    lassign $keyword name unit primitives
    if {$primitive in $primitives} {
      lappend keywords [list $name $unit]
    }
  }
  return $keywords
}

# The lowest and the highest frequency of an output of a primitive, MHz. Output 1 of a PLL may
# drive an I/O clock, which runs faster.
proc ::vorkel::catalogue::outputRange {primitive limits {index 0}} {
  switch -- $primitive {
    PLL {
      set highest [expr {$index == 1 ? "CLKOUT_FREQ_MAX_IOCLK" : "CLKOUT_FREQ_MAX_GCLK"}]
      return [list [dict get $limits CLKOUT_FREQ_MIN_GCLK] [dict get $limits $highest]]
    }
    TSYN {
      return [list [dict get $limits TSYN_CLKOUT_FREQ_MIN] [dict get $limits TSYN_CLKOUT_FREQ_MAX]]
    }
  }
  # The others have their limits as periods of each pin, in ns.
  set shortest {}
  set longest {}
  foreach keyword [keywordsOf $primitive] {
    set name [lindex $keyword 0]
    if {[string match *_MINPERIOD $name]} {
      lappend shortest [dict get $limits $name]
    } elseif {[string match *_MAXPERIOD $name]} {
      lappend longest [dict get $limits $name]
    }
  }
  return [list [expr {1000.0 / [tcl::mathfunc::max {*}$longest]}] \
    [expr {1000.0 / [tcl::mathfunc::min {*}$shortest]}]]
}

# The lowest and the highest frequency of a pin of a KRU, MHz. With a doubled feedback, which
# is one by CLK2X, some pins have another highest frequency.
proc ::vorkel::catalogue::pinRange {pin doubled limits} {
  # Opposite phases share their limits.
  set pins {CLK180 CLK0 CLK270 CLK90 CLK2X180 CLK2X CLKFX180 CLKFX}
  if {[dict exists $pins $pin]} {
    set pin [dict get $pins $pin]
  }
  set keyword D_KRU_${pin}_CLKIN_DIVIDE_BY_2_FALSE_
  if {$pin ne "CLKFXDV"} {
    append keyword CLK_FEEDBACK_1X_
  }
  set longest [dict get $limits ${keyword}MAXPERIOD]
  set shortest [dict get $limits ${keyword}MINPERIOD]
  set other [string map {_1X_ _2X_} ${keyword}MINPERIOD]
  if {$doubled && [dict exists $limits $other]} {
    set shortest [dict get $limits $other]
  }
  return [list [expr {1000.0 / $longest}] [expr {1000.0 / $shortest}]]
}

# The lowest and the highest frequency at which the engine looks for an output of a KRU_CLKGEN,
# MHz.
proc ::vorkel::catalogue::clkgenRange {} {
  variable clkgen_ranges
  set bounds [concat {*}[dict values $clkgen_ranges]]
  return [list [tcl::mathfunc::min {*}$bounds] [tcl::mathfunc::max {*}$bounds]]
}

# The lowest and the highest VCO frequency of a PLL or a TSYN, MHz; "" for other primitives.
proc ::vorkel::catalogue::vcoRange {primitive limits} {
  return [Range $primitive VCOCLK $limits]
}

# The lowest and the highest frequency at the phase-frequency detector, likewise. A narrow loop
# has a lower highest one.
proc ::vorkel::catalogue::pfdRange {primitive limits {bandwidth ""}} {
  variable low_bandwidth_pfd
  set range [Range $primitive CLKPFD $limits]
  if {$range eq "" || $bandwidth ne "LOW"} {
    return $range
  }
  lassign $range lowest highest
  set narrow $low_bandwidth_pfd
  if {$primitive eq "TSYN"} {
    set narrow [dict get $limits TSYN_CLKPFD_FREQ_MAX_LBW]
  }
  return [list $lowest [expr {$narrow < $highest ? $narrow : $highest}]]
}

proc ::vorkel::catalogue::Range {primitive what limits} {
  switch -- $primitive {
    PLL { set prefix "" }
    TSYN { set prefix TSYN_ }
    default { return "" }
  }
  set keyword $prefix${what}_FREQ
  return [list [dict get $limits ${keyword}_MIN] [dict get $limits ${keyword}_MAX]]
}

# Like resolve, but takes the beginning of a name, too, if only one goes on like it: of a device,
# or of a device and its package, either with a grade or without.
proc ::vorkel::catalogue::find {part} {
  try {
    return [resolve $part]
  } trap {VORKEL USAGE FILE} {complaint options} {
    return -options $options $complaint
  } trap {VORKEL USAGE} {complaint options} {
    set matches [Completions $part]
    if {[llength $matches] == 1} {
      return [resolve [lindex $matches 0]]
    }
    if {[llength $matches] > 1} {
      throw {VORKEL USAGE} "device \"$part\" could be [join $matches {, }]"
    }
    return -options $options $complaint
  }
}

# The names that a part name is the beginning of: those of devices, or else those of devices
# with a package. A file that cannot be read has no packages.
proc ::vorkel::catalogue::Completions {part} {
  if {![regexp {^([^-]+)(-.*)?$} $part -> head grade]} {
    return {}
  }
  set devices {}
  set packages {}
  foreach name [names] {
    if {[string equal -length [string length $head] $head $name]} {
      lappend devices $name$grade
    } elseif {[string equal -length [string length $name] $name $head]} {
      try {
        set known [dict get [describe $name] packages]
      } trap {VORKEL USAGE} {} {
        continue
      }
      foreach package $known {
        if {[string equal -length [string length $head] $head $name$package]} {
          lappend packages $name$package$grade
        }
      }
    }
  }
  return [expr {[llength $devices] > 0 ? $devices : $packages}]
}
