# Request files, JSON or Tcl. Both say what the options say; an option beside the file replaces
# what the file says.
#
#     {"device": "vk40", "inputs": ["27MHz"],
#      "outputs": [148.5, {"frequency": "74.25MHz", "phase": 90, "duty": "50%"}],
#      "input_jitter": 50, "bandwidth": "LOW", "primitive": "TSYN", "tolerance": "50ppm",
#      "exact": false, "feedback": false, "prefer_max_vco": false, "int_div0": false}
#
#     device vk40
#     input  27MHz -jitter 50ps        ;# a second one is a second input clock
#     output 148.5MHz                  ;# one for each output, from output 0 on
#     output 74.25MHz -phase 90 -duty 50%
#     bandwidth LOW
#     primitive TSYN
#     tolerance 50ppm                  ;# or: exact
#     feedback
#     prefer_max_vco
#     int_div0
#
# What both have in common stands here; request_json.tcl and request_tcl.tcl read them.

package provide vorkel::request_file 1.1
package require vorkel::options 1.1
package require vorkel::request 1.1
package require vorkel::units 1.1

namespace eval ::vorkel::request_file {
  # The entries that are one text, and those that are switches, with their options.
  variable texts {device --device primitive --primitive bandwidth --bandwidth}
  variable switches {exact --exact feedback --feedback prefer_max_vco --prefer-max-vco
    int_div0 --int-div0}
  # The entries that are one value, with their options and kinds.
  variable values {input_jitter {--input-jitter jitter} tolerance {--tolerance tolerance}}
  # No request is larger, in letters.
  variable largest 100000
}

# What a file says, as a dict from options to their values (see request.tcl); under the key
# "places" a dict has for options where the file says so, for a complaint. "-" is standard input.
# What is wrong in it is {VORKEL USAGE FILE}, and told with the name of the file and the line.
proc ::vorkel::request_file::read {path} {
  set text [Contents $path]
  try {
    return [Said $text $path]
  } trap {VORKEL USAGE} {reason} {
    throw {VORKEL USAGE FILE} $reason
  }
}

proc ::vorkel::request_file::Said {text path} {
  if {[string tolower [file extension $path]] eq ".json" || [regexp {^\s*[\{\[]} $text]} {
    package require vorkel::request_json 1.1
    return [::vorkel::request_json::read $text $path]
  }
  package require vorkel::request_tcl 1.1
  return [::vorkel::request_tcl::read $text $path]
}

proc ::vorkel::request_file::Contents {path} {
  variable largest
  if {$path eq ""} {
    throw {VORKEL USAGE} "--request: the name of the file is empty"
  }
  try {
    if {$path eq "-"} {
      set text [Text stdin]
    } else {
      set name [::vorkel::options::path $path]
      if {[file isdirectory $name]} {
        throw {POSIX EISDIR {it is a directory}} "it is a directory"
      }
      set channel [open $name]
      try {
        set text [Text $channel]
      } finally {
        close $channel
      }
    }
  } trap POSIX {reason options} {
    throw {VORKEL USAGE} "--request: [::vorkel::options::shown $path] cannot be read:\
      [lindex [dict get $options -errorcode] 2]"
  }
  if {[string length $text] > $largest} {
    throw {VORKEL USAGE} "--request: $path is too large for a request"
  }
  # Some editors put a mark of the encoding first.
  return [string trimleft $text \ufeff]
}

# The text of a channel, or the beginning of one that is too long.
proc ::vorkel::request_file::Text {channel} {
  variable largest
  fconfigure $channel -encoding utf-8
  return [::read $channel [expr {$largest + 1}]]
}

# The answer of `read`. `inputs` and `frequencies`, `phases` and `duties` of the outputs are lists.
proc ::vorkel::request_file::options {given places inputs frequencies phases duties} {
  dict set given places $places
  if {[llength $inputs] > 0} {
    dict set given --in [join $inputs ,]
  }
  if {[llength $frequencies] > 0} {
    dict set given --out [join $frequencies ,]
  }
  foreach {option list} [list --phase $phases --duty $duties] {
    if {[lsearch -not -exact $list -] >= 0} {
      dict set given $option [join $list ,]
    }
  }
  return $given
}

# The text of an entry, where it can be checked without a device.
proc ::vorkel::request_file::named {key value what} {
  switch -- $key {
    primitive { return [::vorkel::request::primitive $value $what] }
    bandwidth { return [::vorkel::request::bandwidth $value $what] }
  }
  return $value
}

# Adds an output, a dict of what is said of it, to the lists. `whats` names its frequency, phase
# and duty cycle in a complaint.
proc ::vorkel::request_file::addOutput {lists entry whats} {
  foreach {key kind list} {
    frequency frequency frequencies  phase phase phases  duty duty duties
  } what $whats {
    set value -
    if {$key eq "frequency" ||
        ([dict exists $entry $key] && [dict get $entry $key] ni {"" - null})} {
      set value [::vorkel::units::value [dict get $entry $key] $kind $what]
    }
    dict lappend lists $list $value
  }
  return $lists
}
