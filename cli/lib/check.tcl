# The command check: what is wrong with a device file, and what it leaves out.
#
# The host reads the file as it would a device of its own, so that what is good here is good
# there. It stops at the first mistake. So that a user sees more than one at a time, the copy that
# it reads is mended, where that cannot be seen in the rest of the file, and read again.

package provide vorkel::check 1.1
package require vorkel::catalogue 1.1
package require vorkel::device_repair 1.1
package require vorkel::engine 1.1
package require vorkel::limit_doubts 1.1
package require vorkel::options 1.1
package require vorkel::output 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::check {
  variable good 0
  variable bad 2
  variable most_mistakes 20
  # So often a copy is mended, at most.
  variable most_rounds 100
  variable largest_file 1000000
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
    set warnings ""
    if {$description ne ""} {
      set warnings [Warnings $path $description [Lines $text]]
    }
    # Nobody may be listening.
    catch {
      puts -nonewline stderr [::vorkel::options::escaped "[join $mistakes \n]\n$warnings" "" \n]
    }
    return $bad
  }
  ::vorkel::output::write [Report [::vorkel::options::escaped $path] $text $description]
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
    if {[file extension $path] ne ".toml" || [::vorkel::options::tail $path] eq ".toml"} {
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

# The mistakes of a device file in the order of their places, each a line that begins with file,
# line and column, and what the host says of the device, without what is wrong; "" when it says
# nothing.
proc ::vorkel::check::Read {path text} {
  variable most_mistakes
  variable most_rounds
  set name [::vorkel::options::tail $path]
  set copy [::vorkel::device_repair::begin [file rootname $name] $text]
  set mistakes {}
  set description ""
  for {set round 0} {$round < $most_rounds && [llength $mistakes] < $most_mistakes} {incr round} {
    try {
      set description [Describe $name [::vorkel::device_repair::text $copy]]
      break
    } trap {VORKEL USAGE} {complaint} {
      if {![regexp {^.*?:(\d+):(\d+): (.*)$} $complaint -> line column reason]} {
        lappend mistakes [list 0 0 "$path: $complaint"]
        break
      }
      if {![::vorkel::device_repair::isFollowing $copy $line $reason]} {
        set place [list [::vorkel::device_repair::line $copy $line] $column]
        set mistake [list {*}$place "$path:[join $place :]: $reason[Nearest $reason]"]
        # What cannot be mended, such as a device whose file no device can be named as, comes again.
        if {$mistake in $mistakes} break
        lappend mistakes $mistake
      }
      set mended [::vorkel::device_repair::mend $copy $line $reason]
      if {$mended eq $copy} break
      set copy $mended
    }
  }
  set mistakes [lsort -integer -index 0 [lsort -integer -index 1 $mistakes]]
  return [list [lmap mistake $mistakes {lindex $mistake 2}] $description]
}

# What the host says of a device file with such a name and text. Its folder is the current one
# while the host looks, because a path with a colon could not be said.
proc ::vorkel::check::Describe {name text} {
  ::vorkel::engine::load
  set folder [Scratch]
  set back [pwd]
  set devices [expr {[info exists ::env(VORKEL_DEVICES)] ? [list $::env(VORKEL_DEVICES)] : {}}]
  try {
    set channel [open $folder/$name wb]
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

# A new folder of its own, by its whole path: the name of a file that was created is nobody else's.
proc ::vorkel::check::Scratch {} {
  close [file tempfile file vorkel]
  set file [file normalize [::vorkel::options::path $file]]
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
  set report "$path: device [dict get $description name], packages\
    [join [dict get $description packages] {, }]\n"
  foreach kind {package grade} {
    if {[dict get $description default_$kind] eq ""} {
      append report [::vorkel::table::prose "note: " "there is no default_$kind: a part name must\
        have the $kind"]
    }
  }
  set warnings [Warnings $path $description [Lines $text]]
  dict for {grade limits} [dict get $description limits] {
    append report "\n[Grade $grade $limits [Calculator $description $grade]]"
    if {[llength [::vorkel::catalogue::primitivesOf $limits]] == 0} {
      append warnings [::vorkel::table::prose "$path: warning: " "grade $grade has all limits of\
        no primitive: nothing can be planned for it"]
    }
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
  set doubts [::vorkel::limit_doubts::of $limits]
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
    foreach doubt $doubts {
      if {$primitive in [dict get $doubt lost] && $result ne "NO"} {
        set result "NO, there is no [dict get $doubt none]"
        break
      }
    }
    if {[string match yes* $result] &&
        $primitive in [concat {*}[lmap doubt $doubts {dict get $doubt touched}]]} {
      append result "; see below"
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

# What is doubtful about the limits of a device, a line each, with the line of its keyword.
proc ::vorkel::check::Warnings {path description lines} {
  set text ""
  dict for {grade limits} [dict get $description limits] {
    foreach doubt [::vorkel::limit_doubts::of $limits] {
      set place $path
      if {[dict exists $lines $grade [dict get $doubt keyword]]} {
        append place : [dict get $lines $grade [dict get $doubt keyword]]
      }
      append text [::vorkel::table::prose "$place: warning: " \
        "grade $grade: [dict get $doubt sentence]"]
    }
  }
  return $text
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
