# Where the values of a JSON text stand and of which type they are: what a reader of JSON as a
# value does not tell, and a complaint about it needs.

package provide vorkel::json_places 1.1

namespace eval ::vorkel::json_places {
  # Nothing that a program reads on its own account is nested more deeply.
  variable deepest 20
  variable number {\A-?(?:0|[1-9][0-9]*)(?:\.[0-9]+)?(?:[eE][-+]?[0-9]+)?}
  variable word {\A(?:true|false|null)(?![[:alnum:]_])}
  # A string without its closing quote.
  variable string {\A"(?:[^"\\\u0000-\u001f]|\\(?:["\\/bfnrt]|u[0-9a-fA-F]{4}))*}
}

# The values of a text: a dict from the path of each, a list of keys and indices (from 0), to a
# list of its type (object, array, string, number, boolean or null), where it begins, and where
# its key begins in an object. Places are counted in letters from 0. A text that is no JSON, or
# has an entry twice, is thrown as {VORKEL JSON PLACE} with what is wrong there.
proc ::vorkel::json_places::of {text} {
  set places [dict create]
  set next [Blank $text [Value $text [Blank $text 0] {} {} places]]
  if {$next < [string length $text]} {
    Fail $next "there is more behind the end, [Seen $text $next]"
  }
  return $places
}

# Where the lines of a text begin, for position.
proc ::vorkel::json_places::lines {text} {
  set starts 0
  foreach match [regexp -all -inline -indices {\n} $text] {
    lappend starts [expr {[lindex $match 0] + 1}]
  }
  return $starts
}

# The line and the column, from 1, of a place.
proc ::vorkel::json_places::position {lines place} {
  set line [lsearch -sorted -bisect -integer $lines $place]
  return [list [expr {$line + 1}] [expr {$place - [lindex $lines $line] + 1}]]
}

# Adds the value that begins at a place to `placesName`, and answers where it ends. `key` is the
# place of its key, or "".
proc ::vorkel::json_places::Value {text place path key placesName} {
  upvar 1 $placesName places
  variable deepest
  variable number
  variable word
  if {[llength $path] > $deepest} {
    Fail $place "it is nested too deeply"
  }
  switch -- [string index $text $place] {
    \{ { set type object }
    \[ { set type array }
    \" { set type string }
    default {
      if {[regexp -start $place -indices $number $text match]} {
        set type number
      } elseif {[regexp -start $place -indices $word $text match]} {
        set type [expr {[string index $text $place] eq "n" ? "null" : "boolean"}]
      } else {
        Fail $place "a value must be here, not [Seen $text $place]"
      }
    }
  }
  dict set places $path [list $type $place $key]
  switch -- $type {
    object { return [Object $text $place $path places] }
    array { return [Array $text $place $path places] }
    string { return [String $text $place] }
  }
  return [expr {[lindex $match 1] + 1}]
}

proc ::vorkel::json_places::Object {text place path placesName} {
  upvar 1 $placesName places
  set next [Blank $text [expr {$place + 1}]]
  if {[string index $text $next] eq "\}"} {
    return [expr {$next + 1}]
  }
  while 1 {
    if {[string index $text $next] ne "\""} {
      Fail $next "a name in quotes must be here, not [Seen $text $next]"
    }
    set key $next
    set next [String $text $key]
    # Escapes of JSON are escapes of Tcl.
    set name [subst -nocommands -novariables [string range $text $key+1 $next-2]]
    if {[dict exists $places [list {*}$path $name]]} {
      Fail $key "the entry \"$name\" is there twice"
    }
    set next [Blank $text $next]
    if {[string index $text $next] ne ":"} {
      Fail $next "a colon must be here, not [Seen $text $next]"
    }
    set next [Value $text [Blank $text [expr {$next + 1}]] [list {*}$path $name] $key places]
    lassign [Next $text $next \}] next ended
    if {$ended} {
      return $next
    }
  }
}

proc ::vorkel::json_places::Array {text place path placesName} {
  upvar 1 $placesName places
  set next [Blank $text [expr {$place + 1}]]
  if {[string index $text $next] eq "\]"} {
    return [expr {$next + 1}]
  }
  for {set index 0} 1 {incr index} {
    set next [Value $text $next [list {*}$path $index] {} places]
    lassign [Next $text $next \]] next ended
    if {$ended} {
      return $next
    }
  }
}

# Behind an entry of an object or array: where to go on, and whether it has ended.
proc ::vorkel::json_places::Next {text place closing} {
  set place [Blank $text $place]
  set letter [string index $text $place]
  if {$letter eq $closing} {
    return [list [expr {$place + 1}] 1]
  }
  if {$letter ne ","} {
    Fail $place "a comma or $closing must be here, not [Seen $text $place]"
  }
  return [list [Blank $text [expr {$place + 1}]] 0]
}

# Where a string ends, with its closing quote.
proc ::vorkel::json_places::String {text place} {
  variable string
  regexp -start $place -indices $string $text match
  set end [expr {[lindex $match 1] + 1}]
  switch -- [string index $text $end] {
    \" { return [expr {$end + 1}] }
    \\ { Fail $end "JSON has no such escape" }
    "" - \n - \r { Fail $place "the text in quotes that begins here does not end" }
  }
  Fail $end "a control character must be written as an escape"
}

# The place behind blanks.
proc ::vorkel::json_places::Blank {text place} {
  regexp -start $place -indices {\A[ \t\n\r]*} $text match
  return [expr {[lindex $match 1] + 1}]
}

# What stands at a place, for a complaint.
proc ::vorkel::json_places::Seen {text place} {
  if {$place >= [string length $text]} {
    return "the end of the file"
  }
  package require vorkel::options 1.1
  regexp -start $place {\A(?:[[:alnum:]_.+-]+|.)} $text word
  return [expr {$word eq "\"" ? "'\"'" : "\"[::vorkel::options::shown $word]\""}]
}

proc ::vorkel::json_places::Fail {place reason} {
  throw [list VORKEL JSON $place] $reason
}
