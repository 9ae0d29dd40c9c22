# Request files in Tcl (see request_file.tcl). Another program, tcl_request.tcl, reads them within
# bounds and tells what they say; what their values mean is found here.

package provide vorkel::request_tcl 1.1
package require json
package require vorkel::options 1.1
package require vorkel::request_file 1.1
package require vorkel::units 1.1

namespace eval ::vorkel::request_tcl {
  variable reader [file join [file dirname [file dirname [file normalize [info script]]]] \
    tcl_request.tcl]
}

# What a text says, as read of request_file.tcl has it. `path` names the file in complaints.
proc ::vorkel::request_tcl::read {text path} {
  set answer [Answer $text]
  if {[dict exists $answer error]} {
    throw {VORKEL USAGE} [Wrong $path [dict get $answer error]]
  }
  set request [dict get $answer request]
  set lines [dict get $answer lines]
  set given [dict create]
  set places [dict create]
  set lists [dict create inputs {} frequencies {} phases {} duties {}]
  dict for {key value} $request {
    # Of clocks the last line counts.
    set what "$path:[lindex [dict get $lines $key] end]: $key"
    if {[dict exists $::vorkel::request_file::texts $key]} {
      set option [dict get $::vorkel::request_file::texts $key]
      dict set given $option [::vorkel::request_file::named $key $value $what]
    } elseif {[dict exists $::vorkel::request_file::switches $key]} {
      set option [dict get $::vorkel::request_file::switches $key]
      dict set given $option 1
    } elseif {[dict exists $::vorkel::request_file::values $key]} {
      lassign [dict get $::vorkel::request_file::values $key] option kind
      set label $what
      if {$key eq "input_jitter"} {
        set what [regsub {input_jitter$} $what input]
        set label "$what: -jitter"
      }
      dict set given $option [::vorkel::units::value $value $kind $label]
    } elseif {$key eq "inputs"} {
      set option --in
      set what [string range $what 0 end-1]
      dict set lists inputs [lmap input $value line [dict get $lines inputs] {
        ::vorkel::units::value $input frequency "$path:$line: input"
      }]
    } else {
      set option --out
      set what [string range $what 0 end-1]
      set index -1
      foreach output $value line [dict get $lines outputs] {
        set label "$path:$line: output [incr index]"
        set lists [dict merge $lists [::vorkel::request_file::addOutput \
          [dict remove $lists inputs] $output [list $label "$label: -phase" "$label: -duty"]]]
      }
    }
    dict set places $option $what
  }
  return [::vorkel::request_file::options $given $places {*}[dict values $lists]]
}

# What the program that reads a text answers, as a dict.
proc ::vorkel::request_tcl::Answer {text} {
  variable reader
  set channel [open |[list [info nameofexecutable] $reader] r+]
  fconfigure $channel -encoding utf-8
  puts -nonewline $channel $text
  close $channel write
  set answer [::read $channel]
  close $channel
  return [::json::json2dict $answer]
}

# A complaint about what is wrong with a file.
proc ::vorkel::request_tcl::Wrong {path error} {
  set complaint "$path:[dict get $error line]: [dict get $error message]"
  if {[dict exists $error name]} {
    append complaint [::vorkel::options::nearest [dict get $error name] [dict get $error commands]]
  }
  return $complaint
}
