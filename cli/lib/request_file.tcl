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
  variable json_keys {device primitive inputs outputs input_jitter bandwidth tolerance exact
    feedback prefer_max_vco int_div0}
  variable output_keys {frequency phase duty}
  # No request is larger, in letters.
  variable largest 100000
  # A file that takes longer, in seconds and commands, does not end by itself.
  variable patience 2
  variable most_commands 1000000
}

# What a file says, as a dict from options to their values (see request.tcl); under the key
# "places" a dict has for options where the file says so, for a complaint. "-" is standard input.
# What is wrong is told with the name of the file and the line.
proc ::vorkel::request_file::read {path} {
  set text [Contents $path]
  if {[string tolower [file extension $path]] eq ".json" || [regexp {^\s*[\{\[]} $text]} {
    return [FromJson $text $path]
  }
  return [FromTcl $text $path]
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

# The answer of `read`: `inputs` and `frequencies`, `phases` and `duties` of the outputs are
# lists.
proc ::vorkel::request_file::Options {given places inputs frequencies phases duties} {
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

proc ::vorkel::request_file::FromJson {text path} {
  variable texts
  variable switches
  variable values
  package require json
  package require vorkel::json_places 1.1
  set lines [::vorkel::json_places::lines $text]
  try {
    set places [::vorkel::json_places::of $text]
  } trap {VORKEL JSON} {reason options} {
    throw {VORKEL USAGE} "[Place $path $lines [lindex [dict get $options -errorcode] 2]]: no valid\
      JSON: $reason"
  }
  # What is read, as the procedures below take it.
  set source [dict create path $path lines $lines places $places]
  Expect $source {} object "no request: it"
  set given [dict create]
  set told [dict create]
  set lists [dict create inputs {} frequencies {} phases {} duties {}]
  dict for {key value} [::json::json2dict $text] {
    set where [list $key]
    set what "[At $source $where]: $key"
    if {[dict exists $texts $key]} {
      Expect $source $where string $what
      set option [dict get $texts $key]
      dict set given $option [Named $key $value $what]
    } elseif {[dict exists $switches $key]} {
      Expect $source $where boolean $what
      set option [dict get $switches $key]
      if {$value} {
        dict set given $option 1
      }
    } elseif {[dict exists $values $key]} {
      Expect $source $where {number string} $what
      lassign [dict get $values $key] option kind
      dict set given $option [::vorkel::units::value $value $kind $what]
    } elseif {$key eq "inputs"} {
      Expect $source $where array $what
      set option --in
      dict set lists inputs [JsonInputs $source $value]
    } elseif {$key eq "outputs"} {
      Expect $source $where array $what
      set option --out
      set lists [dict merge $lists [JsonOutputs $source $value]]
    } else {
      throw {VORKEL USAGE} [Unknown $source $where $::vorkel::request_file::json_keys]
    }
    dict set told $option $what
  }
  return [Options $given $told {*}[dict values $lists]]
}

# FILE:LINE:COLUMN of a place in a file whose lines begin at some places.
proc ::vorkel::request_file::Place {path lines place} {
  return [join [list $path {*}[::vorkel::json_places::position $lines $place]] :]
}

# FILE:LINE:COLUMN of a value, or of its key.
proc ::vorkel::request_file::At {source where {which value}} {
  lassign [dict get $source places $where] type value key
  return [Place [dict get $source path] [dict get $source lines] [set $which]]
}

# Refuses a value that is of none of some types.
proc ::vorkel::request_file::Expect {source where types what} {
  set type [lindex [dict get $source places $where] 0]
  if {$type in $types} return
  set names {object {an object} array {an array} string {a text in quotes} number {a number}
    boolean {true or false} null null}
  set wanted [lmap name $types {dict get $names $name}]
  if {[llength $where] == 0} {
    set what "[At $source $where]: $what"
  }
  throw {VORKEL USAGE} "$what must be [::vorkel::options::enumerate $wanted or], not\
    [expr {$type eq "boolean" ? "a boolean" : [dict get $names $type]}]"
}

# What is wrong with an entry whose name is not among those there are.
proc ::vorkel::request_file::Unknown {source where known {whose ""}} {
  set key [lindex $where end]
  return "[At $source $where key]: ${whose}unknown entry\
    \"[::vorkel::options::shown $key]\"; the entries are\
    [join $known {, }][::vorkel::options::nearest $key $known]"
}

# The text of an entry, where it can be checked without a device.
proc ::vorkel::request_file::Named {key value what} {
  switch -- $key {
    primitive { return [::vorkel::request::primitive $value $what] }
    bandwidth { return [::vorkel::request::bandwidth $value $what] }
  }
  return $value
}

proc ::vorkel::request_file::JsonInputs {source entries} {
  set index -1
  return [lmap entry $entries {
    set where [list inputs [incr index]]
    set what "[At $source $where]: input $index"
    Expect $source $where {number string} $what
    ::vorkel::units::value $entry frequency $what
  }]
}

# The lists frequencies, phases and duties of the outputs, each a number, a text or an object.
proc ::vorkel::request_file::JsonOutputs {source entries} {
  variable output_keys
  set lists [dict create frequencies {} phases {} duties {}]
  set index -1
  foreach entry $entries {
    set where [list outputs [incr index]]
    set what "[At $source $where]: output $index"
    Expect $source $where {number string object} $what
    if {[lindex [dict get $source places $where] 0] ne "object"} {
      set lists [AddOutput $lists [dict create frequency $entry] [list $what $what $what]]
      continue
    }
    set whats {}
    foreach key $output_keys {
      set inner [list {*}$where $key]
      if {[dict exists $source places $inner]} {
        lappend whats "[At $source $inner]: output $index: $key"
        set types [expr {$key eq "frequency" ? {number string} : {number string null}}]
        Expect $source $inner $types [lindex $whats end]
      } else {
        lappend whats ""
      }
    }
    foreach key [dict keys $entry] {
      if {$key ni $output_keys} {
        throw {VORKEL USAGE} [Unknown $source [list {*}$where $key] $output_keys \
          "output $index: "]
      }
    }
    if {![dict exists $entry frequency]} {
      throw {VORKEL USAGE} "$what has no frequency"
    }
    set lists [AddOutput $lists $entry $whats]
  }
  return $lists
}

# Adds an output, a dict of what is said of it, to the lists. `whats` names its frequency, phase
# and duty cycle in a complaint.
proc ::vorkel::request_file::AddOutput {lists entry whats} {
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

proc ::vorkel::request_file::FromTcl {text path} {
  variable patience
  variable most_commands
  variable place
  variable state [dict create given {} places {} inputs {} frequencies {} phases {} duties {}]
  set chunks [Chunks $text $path]
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
    foreach {line chunk} $chunks {
      set place $path:$line
      if {[Evaluate $child $chunk $path $line]} break
    }
  } finally {
    interp delete $child
  }
  return [Options {*}[dict values $state]]
}

# The commands of a text, each with the line on which it begins: what is wrong is told with a
# line, and not even a command that never ends takes it away. Several on one line stay together.
proc ::vorkel::request_file::Chunks {text path} {
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
proc ::vorkel::request_file::Evaluate {child chunk path line} {
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
proc ::vorkel::request_file::Commands {} {
  variable texts
  variable switches
  return [list input output tolerance {*}[dict keys $texts] {*}[dict keys $switches]]
}

# What is wrong with a command that begins on a line, with its own line.
proc ::vorkel::request_file::Wrong {path line reason options} {
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
proc ::vorkel::request_file::Command {name args} {
  variable state
  variable texts
  variable switches
  if {[dict exists $switches $name]} {
    if {[llength $args] > 0} {
      throw {VORKEL USAGE} "$name takes no value"
    }
    Say [dict get $switches $name] 1 $name
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
      set state [dict merge $state [AddOutput [dict remove $state given places inputs] $options \
        [list $what "$what: -phase" "$what: -duty"]]]
      Say --out "" $name
    }
    tolerance { Say --tolerance [::vorkel::units::value $value tolerance tolerance] $name }
    default { Say [dict get $texts $name] [Named $name $value $name] $name }
  }
  return
}

# Notes what a command says of an option, and where; without a value only where.
proc ::vorkel::request_file::Say {option value name} {
  variable state
  variable place
  dict set state places $option "$place: $name"
  if {$value ne ""} {
    dict set state given $option $value
  }
}

# The words of a command: a dict of its value and its options without their dash.
proc ::vorkel::request_file::CommandOptions {name words} {
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

proc ::vorkel::request_file::Choice {allowed} {
  if {[llength $allowed] == 0} {
    return ""
  }
  return "; it has [join [lmap name $allowed {string cat - $name}] {, }]"
}
