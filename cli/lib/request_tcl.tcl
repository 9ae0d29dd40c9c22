# Request files in Tcl (see request_file.tcl). They are read in a safe interpreter: variables, expr
# and loops work, files and programs are out of its reach, and it is stopped when it does not end.

package provide vorkel::request_tcl 1.1
package require vorkel::options 1.1
package require vorkel::request_file 1.1
package require vorkel::units 1.1

namespace eval ::vorkel::request_tcl {
  # A file that takes longer, in seconds and commands, does not end by itself.
  variable patience 2
  variable most_commands 1000000
  # The file and the line of the command that runs, and what the commands have said so far: given
  # and places as read has them, and lists of the inputs and of what the outputs are.
  variable place ""
  variable state {}
}

# What a text says, as read of request_file.tcl has it. `path` names the file in complaints.
proc ::vorkel::request_tcl::read {text path} {
  variable patience
  variable most_commands
  variable place
  variable state [dict create given {} places {} inputs {} frequencies {} phases {} duties {}]
  set chunks [Chunks $text $path]
  set child [interp create -safe]
  try {
    foreach command [Commands] {
      interp alias $child $command {} ::vorkel::request_tcl::Command $command
    }
    # A file is a description: it waits for nothing and makes no other interpreters.
    foreach command {after vwait update interp} {
      interp eval $child [list rename $command {}]
    }
    interp limit $child time -seconds [expr {[clock seconds] + $patience}]
    interp limit $child commands -value $most_commands
    foreach {line chunk} $chunks {
      set place $path:$line
      if {[Evaluate $child $chunk $path $line]} break
    }
  } finally {
    interp delete $child
  }
  return [::vorkel::request_file::options {*}[dict values $state]]
}

# The commands of a text, each with the line on which it begins: what is wrong is told with a
# line, and not even a command that never ends takes it away. Several on one line stay together.
proc ::vorkel::request_tcl::Chunks {text path} {
  set chunks {}
  set chunk ""
  set number 0
  foreach line [split $text \n] {
    incr number
    if {$chunk eq ""} {
      set start $number
    }
    append chunk $line \n
    if {[info complete $chunk]} {
      lappend chunks $start $chunk
      set chunk ""
    }
  }
  if {$chunk ne ""} {
    throw {VORKEL USAGE} "$path:$start: a brace, bracket or quote of the command that begins here\
      is not closed"
  }
  return $chunks
}

# Runs a command that begins on a line; whether it ends the file.
proc ::vorkel::request_tcl::Evaluate {child chunk path line} {
  # Only a catch around the text itself tells its line; that a limit is exceeded passes it.
  if {[catch {interp eval $child [list catch $chunk reason options]} code]} {
    throw {VORKEL USAGE} [expr {[string match {*limit exceeded} $code] ?
      "$path:$line: the command that begins here does not end" : "$path:$line: $code"}]
  }
  lassign [interp eval $child {list $reason $options}] reason options
  switch -- $code {
    0 { return 0 }
    2 { return 1 }
    1 { throw {VORKEL USAGE} [Wrong $path $line $reason $options] }
  }
  throw {VORKEL USAGE} "$path:$line: there is no loop to leave"
}

# All commands that a file can have beside those of Tcl.
proc ::vorkel::request_tcl::Commands {} {
  return [list input output tolerance {*}[dict keys $::vorkel::request_file::texts] \
    {*}[dict keys $::vorkel::request_file::switches]]
}

# What is wrong with a command that begins on a line, with its own line.
proc ::vorkel::request_tcl::Wrong {path line reason options} {
  if {[dict exists $options -errorline]} {
    incr line [expr {[dict get $options -errorline] - 1}]
  }
  if {[regexp {^invalid command name "(.*)"$} $reason -> name]} {
    set reason "unknown command \"[::vorkel::options::shown $name]\"; a request has\
      [join [Commands] {, }][::vorkel::options::nearest $name [Commands]]"
  }
  return "$path:$line: [lindex [split $reason \n] 0]"
}

# A command of a file. Values may have a blank before their unit.
proc ::vorkel::request_tcl::Command {name args} {
  variable state
  if {[dict exists $::vorkel::request_file::switches $name]} {
    if {[llength $args] > 0} {
      throw {VORKEL USAGE} "$name takes no value"
    }
    Say [dict get $::vorkel::request_file::switches $name] 1 $name
    return
  }
  set options [CommandOptions $name $args]
  set value [dict get $options value]
  switch -- $name {
    input {
      dict lappend state inputs [::vorkel::units::value $value frequency input]
      Say --in "" $name
      if {[dict exists $options jitter]} {
        Say --input-jitter \
          [::vorkel::units::value [dict get $options jitter] jitter "input: -jitter"] $name
      }
    }
    output {
      dict set options frequency $value
      set what "output [llength [dict get $state frequencies]]"
      set state [dict merge $state [::vorkel::request_file::addOutput \
        [dict remove $state given places inputs] $options \
        [list $what "$what: -phase" "$what: -duty"]]]
      Say --out "" $name
    }
    tolerance { Say --tolerance [::vorkel::units::value $value tolerance tolerance] $name }
    default {
      Say [dict get $::vorkel::request_file::texts $name] \
        [::vorkel::request_file::named $name $value $name] $name
    }
  }
  return
}

# Notes what a command says of an option, and where; without a value only where.
proc ::vorkel::request_tcl::Say {option value name} {
  variable state
  variable place
  dict set state places $option "$place: $name"
  if {$value ne ""} {
    dict set state given $option $value
  }
}

# The words of a command: a dict of its value and its options without their dash.
proc ::vorkel::request_tcl::CommandOptions {name words} {
  set options [dict create]
  set key value
  foreach word $words {
    if {[regexp {^-[a-z]} $word]} {
      set key [string range $word 1 end]
      if {[dict exists $options $key]} {
        throw {VORKEL USAGE} "$name: -$key is there twice"
      }
      dict set options $key {}
    } else {
      dict lappend options $key $word
    }
  }
  set allowed [expr {$name eq "input" ? "jitter" : $name eq "output" ? "phase duty" : ""}]
  foreach key [dict keys $options] {
    if {$key ne "value" && $key ni $allowed} {
      throw {VORKEL USAGE} "$name has no option -$key[Choice $allowed]"
    }
  }
  set options [dict map {key words} $options {join $words}]
  dict for {key value} $options {
    if {$key ne "value" && $value eq ""} {
      throw {VORKEL USAGE} "$name: -$key needs a value"
    }
  }
  if {![dict exists $options value] || [dict get $options value] eq ""} {
    throw {VORKEL USAGE} "$name needs a value"
  }
  return $options
}

proc ::vorkel::request_tcl::Choice {allowed} {
  if {[llength $allowed] == 0} {
    return ""
  }
  return "; it has [join [lmap name $allowed {string cat - $name}] {, }]"
}
