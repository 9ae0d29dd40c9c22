# What the tests of the command line share: running a program and looking at what it leaves.

package require tcltest 2.5
namespace import -force ::tcltest::test
# What a terminal gets can only be seen with this program.
::tcltest::testConstraint script [expr {[auto_execok script] ne ""}]
# Sanitizers need much memory, and keep what is freed.
::tcltest::testConstraint ownMemory [expr {![info exists ::env(VORKEL_PRELOAD)]}]

namespace eval ::cli {
  variable folder [file dirname [file normalize [info script]]]
  variable checkout [file dirname [file dirname $folder]]
  # The words that start the program.
  variable build [file join $checkout build]
  if {[info exists ::env(VORKEL_PACKAGE_DIR)]} {
    set build [file dirname [file normalize $::env(VORKEL_PACKAGE_DIR)]]
  }
  variable program [list [file join $build vorkel]]
  # A folder of the test file's own, gone when it ends.
  variable scratch [exec mktemp -d]
  variable counter 0
  # The words that start an interpreter which can load the package. With sanitizers it has their
  # libraries loaded; nothing else that a test starts needs them, and other programs fail with them.
  variable interpreter [list [info nameofexecutable]]
  if {[info exists ::env(VORKEL_PRELOAD)]} {
    set interpreter [list env LD_PRELOAD=$::env(VORKEL_PRELOAD) {*}$interpreter]
    unset -nocomplain ::env(LD_PRELOAD)
  }
  # The names of the values above the tables of a report.
  variable labels [join {
    device input VCO PFD M D bandwidth {input jitter} {input tolerance} {phase error}
    CLKIN_DIVIDE_BY_2 CLKDV CLKFXDV {phase offset} PHASE_SHIFT
  } |]
}

# Ends a test file.
proc ::cli::finish {} {
  variable scratch
  file delete -force $scratch
  ::tcltest::cleanupTests
}

# Runs a command; answers its exit status, standard output and standard error as a dict with
# the keys status, out and err. Standard output goes to a file, so it is buffered as in a pipe.
proc ::cli::execute {args} {
  variable scratch
  variable counter
  set base [file join $scratch run-[incr counter]]
  set status 0
  if {[catch {exec {*}$args >$base.out 2>$base.err </dev/null} message options]} {
    set code [dict get $options -errorcode]
    if {[lindex $code 0] ne "CHILDSTATUS"} {
      error "could not run $args: $message"
    }
    set status [lindex $code 2]
  }
  set result [dict create status $status]
  foreach {key suffix} {out out err err} {
    dict set result $key [contents $base.$suffix]
    file delete $base.$suffix
  }
  return $result
}

# Writes a file of the scratch folder; its path.
proc ::cli::write {name text} {
  variable scratch
  set path [file join $scratch $name]
  file mkdir [file dirname $path]
  set channel [open $path w]
  puts -nonewline $channel $text
  close $channel
  return $path
}

# The words that start the program as a shell takes them.
proc ::cli::quoted {} {
  variable program
  return [join [lmap word $program {string cat ' [string map {' '\\''} $word] '}]]
}

# The text of a file.
proc ::cli::contents {path} {
  set channel [open $path]
  fconfigure $channel -translation lf
  set text [read $channel]
  close $channel
  return $text
}

# A text with each of its paragraphs in one line: what goes on in the next line is indented by two.
proc ::cli::joined {text} {
  return [regsub -all {\n  (?=\S)} $text { }]
}

# What a terminal gets from a program, run with some words and assignments of the environment.
proc ::cli::onTerminal {assignments args} {
  set line [join [lmap word $args {
    string cat ' $word '
  }]]
  return [dict get [execute env TERM=xterm {*}$assignments script --quiet --return \
    --command $line /dev/null] out]
}

# Runs the command line with the given words, in this interpreter's environment.
proc ::cli::vorkel {args} {
  variable program
  return [execute {*}$program {*}$args]
}

# Runs the command line, which must succeed and say nothing on standard error; its output.
proc ::cli::output {args} {
  set result [vorkel {*}$args]
  if {[dict get $result status] != 0 || [dict get $result err] ne ""} {
    error "unexpected failure: $result"
  }
  return [dict get $result out]
}

# The same for a run whose answer is outside of its tolerance or the device's range.
proc ::cli::offOutput {args} {
  set result [vorkel {*}$args]
  if {[dict get $result status] != 3 || [dict get $result err] ne ""} {
    error "not off as it must be: $result"
  }
  return [dict get $result out]
}

# What the report says: a dict with device, input, VCO and so on as they stand, notes (a list),
# and rows (a list with one dict for each output, from heading to text). An output has a line in
# each table.
proc ::cli::report {text} {
  variable labels
  set report [dict create notes {}]
  set rows [dict create]
  set headings {}
  foreach line [split [joined $text] \n] {
    if {[regexp "^($labels)  +(.*)\$" $line -> name value]} {
      dict set report $name $value
    } elseif {[regexp {^note: (.*)$} $line -> note]} {
      dict lappend report notes $note
    } elseif {[regexp {^output  } $line]} {
      set headings [regexp -all -inline {\S+(?: \S+)*} $line]
    } elseif {$headings ne "" && [regexp {^ +[0-9]} $line]} {
      set values [regexp -all -inline {\S+} $line]
      foreach heading $headings value $values {
        dict set rows [lindex $values 0] $heading $value
      }
    } elseif {$line ne ""} {
      error "a line that no report has: $line"
    }
  }
  dict set report rows [dict values $rows]
  return $report
}

# The report on a request that must succeed.
proc ::cli::solve {args} {
  return [report [output {*}$args]]
}

# The same for one that is outside of its tolerance or the device's range.
proc ::cli::solveOff {args} {
  return [report [offOutput {*}$args]]
}

# The entries of a column of the table.
proc ::cli::column {report heading} {
  return [lmap row [dict get $report rows] {dict get $row $heading}]
}

# The headings of the tables.
proc ::cli::headings {report} {
  return [dict keys [lindex [dict get $report rows] 0]]
}

# Some entries of a report above the table.
proc ::cli::summary {report args} {
  return [lmap name $args {dict get $report $name}]
}
