# Request files in JSON (see request_file.tcl).

package provide vorkel::request_json 1.1
package require json
package require vorkel::json_places 1.1
package require vorkel::options 1.1
package require vorkel::request_file 1.1
package require vorkel::units 1.1

namespace eval ::vorkel::request_json {
  # The entries of a request, and those of an output.
  variable keys {device primitive inputs outputs input_jitter bandwidth tolerance exact feedback
    prefer_max_vco int_div0}
  variable output_keys {frequency phase duty}
}

# What a text says, as read of request_file.tcl has it. `path` names the file in complaints.
proc ::vorkel::request_json::read {text path} {
  variable keys
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
    if {[dict exists $::vorkel::request_file::texts $key]} {
      Expect $source $where string $what
      set option [dict get $::vorkel::request_file::texts $key]
      dict set given $option [::vorkel::request_file::named $key $value $what]
    } elseif {[dict exists $::vorkel::request_file::switches $key]} {
      Expect $source $where boolean $what
      set option [dict get $::vorkel::request_file::switches $key]
      if {$value} {
        dict set given $option 1
      }
    } elseif {[dict exists $::vorkel::request_file::values $key]} {
      Expect $source $where {number string} $what
      lassign [dict get $::vorkel::request_file::values $key] option kind
      dict set given $option [::vorkel::units::value $value $kind $what]
    } elseif {$key eq "inputs"} {
      Expect $source $where array $what
      set option --in
      dict set lists inputs [Inputs $source $value]
    } elseif {$key eq "outputs"} {
      Expect $source $where array $what
      set option --out
      set lists [dict merge $lists [Outputs $source $value]]
    } else {
      throw {VORKEL USAGE} [Unknown $source $where $keys]
    }
    dict set told $option $what
  }
  return [::vorkel::request_file::options $given $told {*}[dict values $lists]]
}

# FILE:LINE:COLUMN of a place in a file whose lines begin at some places.
proc ::vorkel::request_json::Place {path lines place} {
  return [join [list $path {*}[::vorkel::json_places::position $lines $place]] :]
}

# FILE:LINE:COLUMN of a value, or of its key.
proc ::vorkel::request_json::At {source where {which value}} {
  lassign [dict get $source places $where] type value key
  return [Place [dict get $source path] [dict get $source lines] [set $which]]
}

# Refuses a value that is of none of some types.
proc ::vorkel::request_json::Expect {source where types what} {
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
proc ::vorkel::request_json::Unknown {source where known {whose ""}} {
  set key [lindex $where end]
  return "[At $source $where key]: ${whose}unknown entry\
    \"[::vorkel::options::shown $key]\"; the entries are\
    [join $known {, }][::vorkel::options::nearest $key $known]"
}

proc ::vorkel::request_json::Inputs {source entries} {
  set index -1
  return [lmap entry $entries {
    set where [list inputs [incr index]]
    set what "[At $source $where]: input $index"
    Expect $source $where {number string} $what
    ::vorkel::units::value $entry frequency $what
  }]
}

# The lists frequencies, phases and duties of the outputs, each a number, a text or an object.
proc ::vorkel::request_json::Outputs {source entries} {
  variable output_keys
  set lists [dict create frequencies {} phases {} duties {}]
  set index -1
  foreach entry $entries {
    set where [list outputs [incr index]]
    set what "[At $source $where]: output $index"
    Expect $source $where {number string object} $what
    if {[lindex [dict get $source places $where] 0] ne "object"} {
      set lists [::vorkel::request_file::addOutput $lists [dict create frequency $entry] \
        [list $what $what $what]]
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
    set lists [::vorkel::request_file::addOutput $lists $entry $whats]
  }
  return $lists
}
