# Plans the clocks of a design, as the generator of a clocking IP core does.
#
# Usage: tclsh8.6 ip_generator.tcl ?-o REPORT? REQUEST
#
# REQUEST is a file that names a device, one or two input clocks and the wanted output clocks:
#
#   device vk40 grade 2              ;# also: package NAME; what is left out is the default
#   input  100 jitter 50             ;# MHz; ps, peak to peak
#   output 200                       ;# MHz; one line for each output, from output 0 on
#   output 100 phase 90 duty 25      ;# degrees; percent
#   option bandwidth LOW             ;# LOW, HIGH or OPTIMIZED: the loop of a TSYN or PLL
#   option prefer_max_vco yes        ;# the highest VCO, where phases or duty cycles matter
#   option whole_div0 yes            ;# no fractional divider on a TSYN
#   option feedback no               ;# a KRU_SP without feedback
#   option tolerance 100             ;# ppm that a frequency may be off; without it, any
#   option trace yes                 ;# print the steps of the search
#
# The primitives of the device are asked in turn, TSYN, PLL, KRU_SP, KRU_CLKGEN; the first that
# has a configuration gets the clocks. The report on it goes to REPORT or to standard output.
#
# Exit status: 0 the report is written; 1 no primitive serves the request; 2 the call or the
# request is wrong; 3 something else has failed.
#
# The folder ip_generator has the parts: request.tcl reads request files, device.tcl finds the
# device, loop.tcl and kru.tcl know the methods of their primitives, report.tcl writes.

namespace eval ::generator {
  # The primitives in turn, each with the namespace that knows it.
  variable order {TSYN loop PLL loop KRU_SP kru KRU_CLKGEN kru}
  variable usage "usage: tclsh8.6 ip_generator.tcl ?-o REPORT? REQUEST"
  variable script [file normalize [info script]]
}

apply {{folder} {
  foreach part {request device loop kru report} {
    source [file join $folder ip_generator $part.tcl]
  }
}} [file dirname $::generator::script]

# Loads the engine from the folder in VORKEL_PACKAGE_DIR, from the build folder of the checkout
# that this script stands in, or from where Tcl finds packages.
proc ::generator::loadEngine {} {
  variable script
  set folder [file join [file dirname [file dirname $script]] build ip_vorkel1.1]
  if {[info exists ::env(VORKEL_PACKAGE_DIR)]} {
    set folder [file normalize [path $::env(VORKEL_PACKAGE_DIR)]]
  }
  set ::auto_path [linsert $::auto_path 0 $folder]
  package require Ip_vorkel 1.1
}

# Asks the primitives in turn. Answers a dict:
#   primitive    the one that gets the clocks
#   refused      those before it, each followed by the reason
#   settings     names and values
#   outputs      for each a dict: place (its divider or pin), frequency (MHz, as the settings make
#                it), phase (degrees), duty (percent), period (ns), jitter (ps, peak to peak)
#   phaseError   ps
#   notes        what could not be told, and why
# Figures that could not be told are "-". All calls go to one handle: a KRU_CLKGEN works with the
# limits that the calculation of a KRU_SP has read.
proc ::generator::plan {request part} {
  variable order
  set handle [Ip::Vorkel::Init]
  try {
    $handle SetDevice [dict get $part name]
    $handle SetLowBandwidth [flag [expr {[dict get $request bandwidth] eq "LOW"}]]
    set refused {}
    foreach {primitive knowledge} $order {
      if {$primitive ni [dict get $part primitives]} {
        lappend refused $primitive "The device has none."
        continue
      }
      set answer [${knowledge}::calculate $primitive $handle $request]
      if {$answer eq "1"} {
        set plan [${knowledge}::read $primitive $handle $request]
        set answer [Inexact $plan $request]
        if {$answer eq ""} {
          return [dict merge $plan [dict create primitive $primitive refused $refused]]
        }
      }
      lappend refused $primitive $answer
    }
  } finally {
    rename $handle {}
  }
  set text "no primitive of [dict get $part name] serves the request"
  dict for {primitive reason} $refused {
    append text "\n$primitive: $reason"
  }
  throw {GENERATOR UNSERVED} $text
}

# Why a plan is not exact enough, or nothing.
proc ::generator::Inexact {plan request} {
  set tolerance [dict get $request tolerance]
  if {$tolerance eq ""} {
    return ""
  }
  set n 0
  foreach actual [column $plan outputs frequency] wanted [column $request outputs frequency] {
    if {abs([ppm $actual $wanted]) > $tolerance} {
      return [format "Output %d would have %.6f MHz, which is more than %s ppm off." $n $actual \
        $tolerance]
    }
    incr n
  }
  return ""
}

# Asks for a timing figure. One that is not to be had is "-", with the reason among the notes.
proc ::generator::ask {notesName handle method args} {
  upvar 1 $notesName notes
  if {![catch {$handle $method {*}$args} answer]} {
    return $answer
  }
  set note "$method: $answer"
  if {$answer eq ""} {
    set note "The device has no coefficients for timing figures."
  }
  if {$note ni $notes} {
    lappend notes $note
  }
  return -
}

# The error of a frequency in ppm.
proc ::generator::ppm {actual wanted} {
  return [expr {($actual - $wanted) / double($wanted) * 1e6}]
}

# One key of all the dicts of a list that stands in a dict.
proc ::generator::column {dict list key} {
  return [lmap entry [dict get $dict $list] {dict get $entry $key}]
}

# The name of a file as the file commands take it: to them a leading "|" is a program to run, and a
# leading "~" a user's folder.
proc ::generator::path {name} {
  return [expr {[string index $name 0] in {~ |} ? "./$name" : $name}]
}

# A flag as the methods of a handle take it.
proc ::generator::flag {value} {
  return [expr {$value ? "true" : "false"}]
}

# The request file and the report file, empty for standard output, that the words name.
proc ::generator::Words {words} {
  variable usage
  set report ""
  if {[lindex $words 0] eq "-o"} {
    set words [lassign $words option report]
    if {$report eq ""} {
      throw {GENERATOR WRONG} "-o needs the name of a file\n$usage"
    }
  }
  if {[llength $words] != 1} {
    throw {GENERATOR WRONG} $usage
  }
  return [list [lindex $words 0] $report]
}

proc ::generator::Write {text path} {
  if {$path eq ""} {
    puts -nonewline $text
    return
  }
  set channel [open [path $path] w]
  try {
    fconfigure $channel -encoding utf-8
    puts -nonewline $channel $text
  } finally {
    close $channel
  }
}

# Does what the words of the call say; the exit status.
proc ::generator::main {words} {
  try {
    lassign [Words $words] path report
    set request [request::read $path]
    loadEngine
    set part [device::find $request]
    Write [report::render $request $part [plan $request $part]] $report
    return 0
  } trap {GENERATOR UNSERVED} {reason} {
    set status 1
  } trap {GENERATOR WRONG} {reason} {
    set status 2
  } on error {reason} {
    set status 3
  }
  puts stderr "ip_generator: $reason"
  return $status
}

if {[info exists ::argv0] && [file normalize $::argv0] eq $::generator::script} {
  exit [::generator::main $::argv]
}
