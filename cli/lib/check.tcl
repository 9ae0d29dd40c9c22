# The command check: what is wrong with a device file, and what it leaves out.
#
# The host reads the file as it would a device of its own, so that what is good here is good
# there. It stops at the first mistake. So that a user sees more than one at a time, a copy is
# read again without the line of the mistake, where nothing else can depend on that line.

package provide vorkel::check 1.1
package require vorkel::catalogue 1.1
package require vorkel::engine 1.1
package require vorkel::options 1.1
package require vorkel::output 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::check {
  variable good 0
  variable bad 2
  variable most_mistakes 20
  variable largest_file 1000000
  # Limits that go together: what is to be the lower one, the higher one, and what there is
  # none of when they are the wrong way round.
  variable pairs {
    VCOCLK_FREQ_MIN VCOCLK_FREQ_MAX "VCO frequency"
    CLKPFD_FREQ_MIN CLKPFD_FREQ_MAX "PFD frequency"
    CLKOUT_FREQ_MIN_GCLK CLKOUT_FREQ_MAX_GCLK "output frequency"
    CLKOUT_FREQ_MIN_GCLK CLKOUT_FREQ_MAX_IOCLK "frequency of output 1"
    TSYN_VCOCLK_FREQ_MIN TSYN_VCOCLK_FREQ_MAX "VCO frequency"
    TSYN_VCOCLK_FREQ_MIN TSYN_VCOCLK_FREQ_TARGET "VCO frequency that is recommended"
    TSYN_VCOCLK_FREQ_TARGET TSYN_VCOCLK_FREQ_MAX "VCO frequency that is recommended"
    TSYN_CLKOUT_FREQ_MIN TSYN_CLKOUT_FREQ_MAX "output frequency"
    TSYN_CLKPFD_FREQ_MIN TSYN_CLKPFD_FREQ_MAX "PFD frequency"
    TSYN_CLKPFD_FREQ_MIN TSYN_CLKPFD_FREQ_MAX_LBW "PFD frequency with a narrow loop"
  }
  # Mistakes without which the rest of a file means the same.
  variable separate {
    {^unknown (keyword|coefficient|key) }
    {^"\w+" must be a (finite positive )?number}
  }
}

# Writes what the file that is named gives a device; its mistakes go to standard error.
proc ::vorkel::check::run {words} {
  variable good
  variable bad
  set operands [::vorkel::options::operands $words 1]
  if {[llength $operands] == 0} {
    throw {VORKEL USAGE} "the device file is missing: check FILE, such as check my_device.toml"
  }
  set path [lindex $operands 0]
  set text [Contents $path]
  lassign [Read $path $text] mistakes description
  if {[llength $mistakes] > 0} {
    foreach mistake $mistakes {
      # Nobody may be listening.
      catch {puts stderr $mistake}
    }
    return $bad
  }
  ::vorkel::output::write [Report $path $text $description]
  return $good
}

# The bytes of a file whose name is that of a device file.
proc ::vorkel::check::Contents {path} {
  variable largest_file
  set name $path
  set path [::vorkel::options::path $path]
  try {
    if {$path eq ""} {
      throw {POSIX ENOENT} "the name of the file is empty"
    }
    if {![file exists $path]} {
      throw {POSIX ENOENT} "there is no such file[IsDevice $name]"
    }
    if {[file isdirectory $path]} {
      throw {POSIX EISDIR} "it is a directory"
    }
    if {![file isfile $path]} {
      throw {POSIX EINVAL} "it is no plain file"
    }
    if {[file extension $path] ne ".toml" || [file rootname [file tail $path]] eq ""} {
      throw {POSIX EINVAL} "a device file is named DEVICE.toml"
    }
    if {[file size $path] > $largest_file} {
      throw {POSIX EFBIG} "it is too large for a device file"
    }
    set channel [open $path rb]
    try {
      return [read $channel]
    } finally {
      close $channel
    }
  } on error {reason options} {
    set cause [lindex [dict get $options -errorcode] 2]
    set label [expr {$name eq "" ? "" : "[::vorkel::options::shown $name]: "}]
    throw {VORKEL USAGE} "$label[expr {$cause eq "" ? $reason : $cause}]"
  }
}

# What to say when the name of a file is that of a device, or its beginning.
proc ::vorkel::check::IsDevice {name} {
  try {
    set device [dict get [::vorkel::catalogue::find $name] description]
  } trap {VORKEL USAGE} {} {
    return ""
  }
  return "; check takes the file of a device, that of [dict get $device name] is\
    [dict get $device file], and devices [dict get $device name] shows its limits"
}

# The mistakes of a device file, each a line that begins with file, line and column, and what
# the host says of the device when there is none.
proc ::vorkel::check::Read {path text} {
  variable most_mistakes
  set mistakes {}
  set removed {}
  while {[llength $mistakes] < $most_mistakes} {
    try {
      set description [Describe [file tail $path] $text]
      return [list $mistakes $description]
    } trap {VORKEL USAGE} {complaint} {
      set located [regexp {^.*?:(\d+):(\d+): (.*)$} $complaint -> line column reason]
      if {!$located} {
        lappend mistakes "$path: $complaint"
        break
      }
      if {![FollowsFrom $reason $removed]} {
        lappend mistakes "$path:$line:$column: $reason[Nearest $reason]"
      }
      set name [Separate $reason $text $line]
      if {$name eq ""} break
      lappend removed $name
      set text [WithoutLine $text $line]
    }
  }
  return [list $mistakes {}]
}

# What the host says of a device file with such a name and text. Its folder is the current one
# while the host looks, because a path with a colon could not be said.
proc ::vorkel::check::Describe {name text} {
  ::vorkel::engine::load
  set folder [Scratch]
  set back [pwd]
  set devices [expr {[info exists ::env(VORKEL_DEVICES)] ? [list $::env(VORKEL_DEVICES)] : {}}]
  try {
    set channel [open [file join $folder $name] wb]
    puts -nonewline $channel $text
    close $channel
    cd $folder
    set ::env(VORKEL_DEVICES) .
    return [::vorkel::catalogue::describe [file rootname $name]]
  } finally {
    cd $back
    if {[llength $devices] > 0} {
      set ::env(VORKEL_DEVICES) [lindex $devices 0]
    } else {
      unset -nocomplain ::env(VORKEL_DEVICES)
    }
    file delete -force -- $folder
  }
}

# A new folder of its own: the name of a file that was created is nobody else's.
proc ::vorkel::check::Scratch {} {
  close [file tempfile file vorkel]
  set folder $file.d
  if {[file exists $folder]} {
    file delete -- $file
    error "$folder is in the way"
  }
  file mkdir $folder
  file attributes $folder -permissions 0700
  file delete -- $file
  return $folder
}

# The name in a mistake whose line can be left out, or "": the line must be an entry that ends
# on it.
proc ::vorkel::check::Separate {reason text line} {
  variable separate
  foreach pattern $separate {
    if {[regexp $pattern $reason] && [regexp {"(\w+)"} $reason -> name] &&
        [regexp {^\s*(\w+|"\w+")\s*=\s*([^\s\[\{"'#][^\[\{"'#]*|"[^"\\]*"\s*)(#.*)?$} \
          [lindex [split $text \n] $line-1]]} {
      return $name
    }
  }
  return ""
}

# Whether a mistake is there only because a line was left out.
proc ::vorkel::check::FollowsFrom {reason removed} {
  foreach name $removed {
    if {[regexp "the (coefficient|key) \"$name\" is missing" $reason]} {
      return 1
    }
  }
  return 0
}

proc ::vorkel::check::WithoutLine {text line} {
  return [join [lreplace [split $text \n] $line-1 $line-1 ""] \n]
}

# "; did you mean X?" for an unknown keyword that is nearly another one.
proc ::vorkel::check::Nearest {reason} {
  if {![regexp {^unknown keyword "(.*)"$} $reason -> name]} {
    return ""
  }
  return [::vorkel::options::nearest $name \
    [lmap keyword [::Vorkel::Devices keywords] {lindex $keyword 0}]]
}

# What a file without mistakes gives: for each grade the primitives, what each keyword that is
# not there costs, and limits that contradict each other.
proc ::vorkel::check::Report {path text description} {
  set lines [Lines $text]
  set report "$path: device [dict get $description name], packages\
    [join [dict get $description packages] {, }]\n"
  foreach kind {package grade} {
    if {[dict get $description default_$kind] eq ""} {
      append report [::vorkel::table::prose "note: " "there is no default_$kind: a part name must\
        have the $kind"]
    }
  }
  set warnings ""
  dict for {grade limits} [dict get $description limits] {
    append report "\n[Grade $grade $limits [Calculator $description $grade]]"
    append warnings [Warnings $path $grade $limits $lines]
  }
  if {$warnings ne ""} {
    append report \n $warnings
  }
  return $report
}

# The coefficients of a grade, where the host tells them: a dict, or "" when it does not.
proc ::vorkel::check::Calculator {description grade} {
  if {![dict exists $description calculator]} {
    return ""
  }
  if {![dict exists $description calculator $grade]} {
    return {LOOP 0 KRU 0}
  }
  set names [dict keys [dict get $description calculator $grade]]
  return [dict create LOOP [expr {[lsearch -glob $names LOOP_*] >= 0}] \
    KRU [expr {[lsearch -glob $names KRU_*] >= 0}]]
}

# The primitives of a grade, and the keywords that it lacks.
proc ::vorkel::check::Grade {grade limits calculator} {
  set columns [list [list left "grade $grade"] {right keywords} {left {}}]
  set rows {}
  set begun {}
  foreach primitive [::vorkel::catalogue::primitives] {
    lassign [Count $primitive $limits] there needed own
    set result [expr {$there == $needed ? "yes" : $own == 0 ? "left out" : "NO"}]
    if {$result eq "NO"} {
      lappend begun $primitive
    }
    if {$result eq "yes" && $calculator ne ""} {
      set group [expr {[::vorkel::engine::family $primitive] eq "Kru" ? "KRU" : "LOOP"}]
      append result [expr {[dict get $calculator $group] ? ", with" : ", without"}] " jitter"
    }
    lappend rows [list $primitive "$there of $needed" $result]
  }
  return [::vorkel::table::render $columns $rows][Missing $limits $begun]
}

# How many of the keywords of a primitive there are, how many it needs, and how many of those
# there are no other primitive needs.
proc ::vorkel::check::Count {primitive limits} {
  lassign {0 0 0} there needed own
  foreach keyword [::Vorkel::Devices keywords] {
    lassign $keyword name unit primitives
    if {$primitive in $primitives} {
      incr needed
      if {[dict exists $limits $name]} {
        incr there
        incr own [expr {[llength $primitives] == 1}]
      }
    }
  }
  return [list $there $needed $own]
}

# A table of the keywords that keep primitives away of which others are there.
proc ::vorkel::check::Missing {limits begun} {
  set rows {}
  foreach keyword [::Vorkel::Devices keywords] {
    lassign $keyword name unit primitives
    set costs [lmap primitive $primitives {
      if {$primitive ni $begun} continue
      set primitive
    }]
    if {[llength $costs] > 0 && ![dict exists $limits $name]} {
      lappend rows [list $name $unit [join $costs {, }]]
    }
  }
  if {[llength $rows] == 0} {
    return ""
  }
  return "\n[::vorkel::table::fitted {{left missing} {left unit} {left costs}} $rows]"
}

# Limits that contradict each other, a line each, with the line of the first.
proc ::vorkel::check::Warnings {path grade limits lines} {
  set text ""
  foreach {low high what} [Pairs] {
    if {![dict exists $limits $low] || ![dict exists $limits $high] ||
        [dict get $limits $low] <= [dict get $limits $high]} continue
    set place $path
    if {[dict exists $lines $grade $low]} {
      append place : [dict get $lines $grade $low]
    }
    append text [::vorkel::table::prose "$place: warning: " "grade $grade: $low,\
      [dict get $limits $low], is above $high, [dict get $limits $high]: there is no $what"]
  }
  if {[llength [::vorkel::catalogue::primitivesOf $limits]] == 0} {
    append text [::vorkel::table::prose "$path: warning: " "grade $grade has all limits of no\
      primitive: nothing can be planned for it"]
  }
  return $text
}

# The variable pairs, and the shortest and longest periods of the pins of a KRU.
proc ::vorkel::check::Pairs {} {
  variable pairs
  set all $pairs
  foreach keyword [::Vorkel::Devices keywords] {
    set name [lindex $keyword 0]
    if {[regexp {^D_KRU_([^_]+)_.*_MINPERIOD$} $name -> pin]} {
      # The longest period of a pin is the same for both feedbacks.
      lappend all $name [string map {_2X_ _1X_ MINPERIOD MAXPERIOD} $name] "period of $pin"
    }
  }
  return $all
}

# The lines of the keywords in the tables of the grades, as files are commonly written: a dict
# from grade and keyword to the number of the line.
proc ::vorkel::check::Lines {text} {
  set lines {}
  set grade ""
  set number 0
  foreach line [split $text \n] {
    incr number
    if {[regexp {^\s*\[([^\]]*)\]} $line -> table]} {
      set grade ""
      regexp {^\s*grade\s*\.\s*"?(\w+)"?\s*$} $table -> grade
    } elseif {$grade ne "" && [regexp {^\s*"?(\w+)"?\s*=} $line -> name]} {
      dict set lines $grade $name $number
    }
  }
  return $lines
}
