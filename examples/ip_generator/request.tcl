# Request files. A request is a Tcl script of four commands: device, input, output and option.
# It is evaluated in an interpreter that has no others, so all it can do is ask for clocks.

namespace eval ::generator::request {
  variable most_inputs 2
  variable most_outputs 7
  # Each option with its default and what it can be.
  variable options {
    bandwidth      OPTIMIZED {LOW HIGH OPTIMIZED}
    prefer_max_vco no        {yes no}
    whole_div0     no        {yes no}
    feedback       yes       {yes no}
    tolerance      ""        number
    trace          no        {yes no}
  }
  # Numbers in this form mean the same to Tcl and to the engine.
  variable decimal {^[-+]?([0-9]+\.?[0-9]*|\.[0-9]+)([eE][-+]?[0-9]+)?$}
  variable request
}

# Reads a request file. Answers a dict:
#   path                     the file
#   device, package, grade   names; the latter two may be empty
#   inputs                   one or two dicts: frequency (MHz), jitter (ps)
#   outputs                  a dict for each: frequency (MHz), phase (degrees), duty (percent, or
#                            empty where any will do)
#   one key for each option
# A mistake is thrown as {GENERATOR WRONG}, with the file and the line of the command.
proc ::generator::request::read {path} {
  variable options
  variable request
  set request [dict create path $path device "" inputs {} outputs {}]
  foreach {name default choices} $options {
    dict set request $name $default
  }
  set parser [interp create -safe]
  try {
    interp eval $parser {namespace delete ::}
    foreach command {device input output option} {
      interp alias $parser $command {} ::generator::request::Take $command
    }
    foreach {line command} [Commands $path] {
      try {
        interp eval $parser $command
      } trap {TCL LOOKUP COMMAND} {reason} {
        Wrong "$path:$line: $reason: must be device, input, output or option"
      } on error {reason} {
        Wrong "$path:$line: $reason"
      }
    }
  } finally {
    interp delete $parser
  }
  foreach {key name} {device device inputs input outputs output} {
    if {[dict get $request $key] eq ""} {
      Wrong "$path: the request has no $name"
    }
  }
  return $request
}

proc ::generator::request::Wrong {reason} {
  throw {GENERATOR WRONG} $reason
}

# The commands of a file, each behind the number of its first line.
proc ::generator::request::Commands {path} {
  try {
    set channel [open [::generator::path $path]]
    fconfigure $channel -encoding utf-8
    set text [::read $channel]
    close $channel
  } on error {reason} {
    Wrong $reason
  }
  set commands {}
  set command ""
  set number 0
  foreach line [split $text \n] {
    incr number
    if {$command eq ""} {
      set first $number
    }
    append command $line \n
    if {[info complete $command]} {
      lappend commands $first $command
      set command ""
    }
  }
  if {$command ne ""} {
    Wrong "$path:$first: the command that begins here has no end"
  }
  return $commands
}

# A command of the file, with its words.
proc ::generator::request::Take {command args} {
  if {[llength $args] == 0} {
    Wrong "$command needs a word that tells which"
  }
  Take_$command {*}$args
  return
}

proc ::generator::request::Take_device {name args} {
  variable request
  if {[dict get $request device] ne ""} {
    Wrong "there is a device already"
  }
  set request [dict merge $request [Details $args {package "" grade ""}] [list device $name]]
}

proc ::generator::request::Take_input {frequency args} {
  variable request
  variable most_inputs
  set details [Details $args {jitter 0}]
  Number frequency $frequency above 0
  Number jitter [dict get $details jitter] from 0
  Append inputs $most_inputs [dict create frequency $frequency {*}$details]
}

proc ::generator::request::Take_output {frequency args} {
  variable most_outputs
  set details [Details $args {phase 0 duty ""}]
  Number frequency $frequency above 0
  Number phase [dict get $details phase] from -360 360
  if {[dict get $details duty] ne ""} {
    Number duty [dict get $details duty] above 0 100
  }
  Append outputs $most_outputs [dict create frequency $frequency {*}$details]
}

proc ::generator::request::Append {list most entry} {
  variable request
  if {[llength [dict get $request $list]] == $most} {
    Wrong "there are $most $list already"
  }
  dict lappend request $list $entry
}

proc ::generator::request::Take_option {name args} {
  variable request
  variable options
  if {[llength $args] != 1} {
    Wrong "option $name needs one value"
  }
  lassign $args value
  foreach {option default choices} $options {
    if {$option ne $name} continue
    if {$choices eq "number"} {
      Number $name $value from 0
    } elseif {$value ni $choices} {
      Wrong "$name \"$value\" must be [join $choices { or }]"
    }
    dict set request $name $value
    return
  }
  set known [lmap {option default choices} $options {set option}]
  Wrong "unknown option \"$name\": must be [join $known { or }]"
}

# The keys and values that follow the first word of a command, over their defaults.
proc ::generator::request::Details {given defaults} {
  foreach {key value} $given {
    if {![dict exists $defaults $key]} {
      Wrong "unknown word \"$key\": must be [join [dict keys $defaults] { or }]"
    }
    dict set defaults $key $value
  }
  if {[llength $given] % 2 != 0} {
    Wrong "[lindex $given end] has no value"
  }
  return $defaults
}

# Refuses a text that is no number `above` or `from` a lowest value up to a highest. The engine
# reads any text as a number, so a mistyped one would silently be another request.
proc ::generator::request::Number {what text lower lowest {highest 1000000}} {
  variable decimal
  if {![regexp $decimal $text]} {
    Wrong "$what \"$text\" is not a number"
  }
  scan $text %f value
  if {$value < $lowest || ($lower eq "above" && $value == $lowest) || $value > $highest} {
    Wrong "$what $text must be $lower $lowest, up to $highest"
  }
}
