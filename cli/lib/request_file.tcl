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
# Tcl is read in a safe interpreter: variables, expr and loops work, files and programs are out
# of its reach, and it is stopped when it does not end.

package provide vorkel::request_file 1.1
package require vorkel::units 1.1

namespace eval ::vorkel::request_file {
  # The entries that are one text, and those that are switches, with their options.
  variable texts {device --device primitive --primitive bandwidth --bandwidth}
  variable switches {exact --exact feedback --feedback prefer_max_vco --prefer-max-vco
    int_div0 --int-div0}
  variable json_keys {device primitive inputs outputs input_jitter bandwidth tolerance exact
    feedback prefer_max_vco int_div0}
  variable output_keys {frequency phase duty}
  # A file that takes longer, in seconds and commands, does not end by itself.
  variable patience 2
  variable most_commands 1000000
}

# What a file says, as a dict from options to their values (see request.tcl). "-" is standard
# input. What is wrong is told with the name of the file.
proc ::vorkel::request_file::read {path} {
  set text [Contents $path]
  if {[string tolower [file extension $path]] eq ".json" || [regexp {^\s*[\{\[]} $text]} {
    return [FromJson $text $path]
  }
  return [FromTcl $text $path]
}

proc ::vorkel::request_file::Contents {path} {
  if {$path eq ""} {
    throw {VORKEL USAGE} "--request: the name of the file is empty"
  }
  try {
    if {$path eq "-"} {
      return [::read stdin]
    }
    if {[file isdirectory $path]} {
      throw {POSIX EISDIR {it is a directory}} "it is a directory"
    }
    set channel [open $path]
    try {
      fconfigure $channel -encoding utf-8
      return [::read $channel]
    } finally {
      close $channel
    }
  } trap POSIX {reason options} {
    throw {VORKEL USAGE} "--request: $path cannot be read:\
      [lindex [dict get $options -errorcode] 2]"
  }
}

# The options that the values of a file mean: `inputs` and `frequencies`, `phases` and `duties`
# of the outputs are lists.
proc ::vorkel::request_file::Options {given inputs frequencies phases duties} {
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

proc ::vorkel::request_file::FromJson {text path} {
  variable texts
  variable switches
  variable json_keys
  package require json
  if {[catch {::json::json2dict $text} file] || ![regexp {^\s*\{} $text]} {
    set reason [expr {[regexp {^\s*\{} $text] ? $file : "it must be an object"}]
    throw {VORKEL USAGE} "$path: no valid JSON: [string trim $reason]"
  }
  set given [dict create]
  set lists [dict create inputs {} frequencies {} phases {} duties {}]
  dict for {key value} $file {
    set what "$path: $key"
    if {[dict exists $texts $key]} {
      dict set given [dict get $texts $key] $value
    } elseif {[dict exists $switches $key]} {
      if {$value ni {true false}} {
        throw {VORKEL USAGE} "$what: \"$value\" must be true or false"
      }
      if {$value} {
        dict set given [dict get $switches $key] 1
      }
    } else {
      switch -- $key {
        input_jitter { dict set given --input-jitter [::vorkel::units::value $value jitter $what] }
        tolerance { dict set given --tolerance [::vorkel::units::value $value tolerance $what] }
        inputs {
          dict set lists inputs [lmap entry [List $value $what] {
            ::vorkel::units::value $entry frequency $what
          }]
        }
        outputs { set lists [dict merge $lists [JsonOutputs [List $value $what] $path]] }
        default {
          throw {VORKEL USAGE} "$path: unknown entry \"$key\"; the entries are\
            [join $json_keys {, }]"
        }
      }
    }
  }
  return [Options $given {*}[dict values $lists]]
}

proc ::vorkel::request_file::List {value what} {
  if {![string is list $value]} {
    throw {VORKEL USAGE} "$what must be an array"
  }
  return $value
}

# The lists frequencies, phases and duties of the outputs, each a number, a text or an object.
proc ::vorkel::request_file::JsonOutputs {entries path} {
  variable output_keys
  set lists [dict create frequencies {} phases {} duties {}]
  set n 0
  foreach entry $entries {
    set what "$path: output $n"
    incr n
    # An object begins with a name, and a value with a digit.
    if {![regexp {^\s*[-+.0-9]} $entry]} {
      if {![string is list $entry] || [llength $entry] % 2 != 0} {
        throw {VORKEL USAGE} "$what: \"$entry\" is neither a frequency nor an object"
      }
      foreach key [dict keys $entry] {
        if {$key ni $output_keys} {
          throw {VORKEL USAGE} "$what: unknown entry \"$key\"; the entries are\
            [join $output_keys {, }]"
        }
      }
      if {![dict exists $entry frequency]} {
        throw {VORKEL USAGE} "$what has no frequency"
      }
    } else {
      set entry [dict create frequency $entry]
    }
    set lists [AddOutput $lists $entry $what]
  }
  return $lists
}

# Adds an output, a dict of what is said of it, to the lists.
proc ::vorkel::request_file::AddOutput {lists entry what} {
  foreach {key kind list} {
    frequency frequency frequencies  phase phase phases  duty duty duties
  } {
    set value -
    if {[dict exists $entry $key] && [dict get $entry $key] ni {"" - null}} {
      set value [::vorkel::units::value [dict get $entry $key] $kind "$what: $key"]
    }
    dict lappend lists $list $value
  }
  return $lists
}

proc ::vorkel::request_file::FromTcl {text path} {
  variable patience
  variable most_commands
  variable state [dict create given {} inputs {} frequencies {} phases {} duties {}]
  set child [interp create -safe]
  try {
    foreach command [Commands] {
      interp alias $child $command {} ::vorkel::request_file::Command $command
    }
    # A file is a description: it waits for nothing and makes no other interpreters.
    foreach command {after vwait update interp} {
      interp eval $child [list rename $command {}]
    }
    interp limit $child time -seconds [expr {[clock seconds] + $patience}]
    interp limit $child commands -value $most_commands
    if {![info complete $text]} {
      throw {VORKEL USAGE} "$path: a brace, bracket or quote is not closed"
    }
    # Only a catch around the text itself tells its line; that a limit is exceeded passes it.
    if {[catch {interp eval $child [list catch $text reason options]} failed]} {
      throw {VORKEL USAGE} [expr {[string match {*limit exceeded} $failed] ?
        "$path: it does not end" : "$path: $failed"}]
    }
    if {$failed} {
      throw {VORKEL USAGE} [Wrong $path {*}[interp eval $child {list $reason $options}]]
    }
  } finally {
    interp delete $child
  }
  return [Options {*}[dict values $state]]
}

# All commands that a file can have beside those of Tcl.
proc ::vorkel::request_file::Commands {} {
  variable texts
  variable switches
  return [list input output tolerance {*}[dict keys $texts] {*}[dict keys $switches]]
}

# What is wrong with a file, with the line.
proc ::vorkel::request_file::Wrong {path reason options} {
  set place $path
  if {[dict exists $options -errorline]} {
    append place :[dict get $options -errorline]
  }
  if {[regexp {^invalid command name "(.*)"$} $reason -> name]} {
    set reason "unknown command \"$name\"; a request has [join [Commands] {, }]"
  }
  return "$place: $reason"
}

# A command of a file. Values may have a blank before their unit.
proc ::vorkel::request_file::Command {name args} {
  variable state
  variable texts
  variable switches
  if {[dict exists $switches $name]} {
    if {[llength $args] > 0} {
      throw {VORKEL USAGE} "$name takes no value"
    }
    dict set state given [dict get $switches $name] 1
    return
  }
  set options [dict create]
  set key value
  foreach word $args {
    if {[regexp {^-[a-z]} $word]} {
      set key [string range $word 1 end]
      dict set options $key {}
    } else {
      dict lappend options $key $word
    }
  }
  set allowed [dict get {input jitter output {phase duty}} \
    [expr {$name in {input output} ? $name : "input"}]]
  if {$name ni {input output}} {
    set allowed {}
  }
  foreach key [dict keys $options] {
    if {$key ne "value" && $key ni $allowed} {
      throw {VORKEL USAGE} "$name has no option -$key[Choice $allowed]"
    }
  }
  if {![dict exists $options value]} {
    throw {VORKEL USAGE} "$name needs a value"
  }
  set options [dict map {key words} $options {join $words}]
  set value [dict get $options value]
  switch -- $name {
    input {
      dict lappend state inputs [::vorkel::units::value $value frequency input]
      if {[dict exists $options jitter]} {
        dict set state given --input-jitter \
          [::vorkel::units::value [dict get $options jitter] jitter "input: -jitter"]
      }
    }
    output {
      dict set options frequency $value
      set what "output [llength [dict get $state frequencies]]"
      set state [dict merge $state [AddOutput [dict remove $state given inputs] $options $what]]
    }
    tolerance {
      dict set state given --tolerance [::vorkel::units::value $value tolerance tolerance]
    }
    default { dict set state given [dict get $texts $name] $value }
  }
  return
}

proc ::vorkel::request_file::Choice {allowed} {
  if {[llength $allowed] == 0} {
    return ""
  }
  return "; it has [join [lmap name $allowed {string cat - $name}] {, }]"
}
