# Reads a request that is written in Tcl, within bounds, and answers what it says as JSON: a program
# of its own, for whatever plans the request.
#
#     tclsh8.6 cli/tcl_request.tcl <REQUEST
#
# The text of the request is on standard input, in UTF-8. The answer is one line on standard output,
# and the exit status is 0, whatever is wrong with the request. An answer of a request that can be
# read:
#
#     {"request": {"device": "vk40", "inputs": ["27MHz"],
#                  "outputs": [{"frequency": "148.5MHz"},
#                              {"frequency": "74.25MHz", "phase": "90deg", "duty": "50%"}],
#                  "input_jitter": "50ps", "bandwidth": "LOW", "primitive": "TSYN",
#                  "tolerance": "20ppm", "rank": "error", "exact": true, "feedback": true,
#                  "prefer_max_vco": true, "int_div0": true},
#      "lines": {"device": 1, "inputs": [2], "outputs": [3, 4], "input_jitter": 2, "bandwidth": 5,
#                "primitive": 6, "tolerance": 7, "rank": 8, "exact": 9, "feedback": 10,
#                "prefer_max_vco": 11, "int_div0": 12}}
#
# `request` has what the request says and nothing else, all values as the texts that it says:
# whether they mean something is for the caller to tell, who has in `lines` the line of each. The
# answer of a request that cannot be read, or that says what no request has:
#
#     {"error": {"line": 3, "message": "tolerance needs a value"}}
#
# Beside the message of a command that there is not, `name` is that command, and `commands` are
# those that a request has, in which the caller can look for the nearest one.
#
# When this program itself fails, the exit status is 1 and standard error says why.
#
# The text is evaluated in a safe interpreter: variables, expr, procedures and loops work; files,
# programs, channels and time are out of its reach. How many commands it may take is counted. What a
# single command costs is not seen there, so the interpreter lives in a process of its own, whose
# memory and processor time are bounded, and which tells each command that it begins. When that
# process does not live to answer, the line of its last command is known, and the answer is an
# error. None of these bounds depends on how busy the machine is, and only that of time on how fast
# it is: the others end what costs far less. What a request says depends on neither: it has no clock
# and no random numbers.

namespace eval ::tcl_request {
  variable script [file normalize [info script]]
  variable most_commands 1000000
  # The processor time of the process in seconds, and its memory in KiB.
  variable most_time 2
  variable most_memory 262144
  # How many letters are read to find where commands end.
  variable most_read 20000000
  # The letters of a value and of a message, and how many clocks are listed: no request has more.
  variable longest 1000
  variable most_clocks 1000
  # The commands that are one text and those that are switches, with the options of the others.
  variable texts {tolerance device primitive bandwidth rank phase_tolerance duty_tolerance
    max_jitter input_tolerance}
  variable switches {exact feedback prefer_max_vco int_div0 engine any_order}
  variable options {input {jitter tolerance}
    output {phase duty tolerance phase_tolerance duty_tolerance max_jitter}}
  # Commands of a safe interpreter that wait, know the time, reach other interpreters, or need a
  # channel, of which there is none.
  variable withheld {after vwait update interp clock time
    puts gets read close flush eof seek tell fblocked fcopy fileevent chan}
  # The line of the command that runs, and what the commands have said so far: each a list of its
  # line and what is said of it.
  variable line 0
  variable said {}
  variable inputs {}
  variable outputs {}
}

# --- The answer ------------------------------------------------------------------------------

# A text as JSON, and as a message shows one that is wrong: on one line, and not without end.
proc ::tcl_request::Text {text} {
  return "\"[Escaped [string map {\\ \\\\ \" \\\"} $text] \\u%04x]\""
}

proc ::tcl_request::Shown {text} {
  if {[string length $text] > 60} {
    set text [string range $text 0 59]...
  }
  return [Escaped $text \\x%02x]
}

proc ::tcl_request::Escaped {text format} {
  if {![regexp {[[:cntrl:]]} $text]} {
    return $text
  }
  return [join [lmap letter [split $text ""] {
    expr {[string is control $letter] ? [format $format [scan $letter %c]] : $letter}
  }] ""]
}

# Names and values in JSON as an object.
proc ::tcl_request::Object {pairs} {
  return "{[join [lmap {name value} $pairs {string cat [Text $name] ": " $value}] {, }]}"
}

proc ::tcl_request::Array {values} {
  return "\[[join $values {, }]\]"
}

proc ::tcl_request::Error {line message {more {}}} {
  variable longest
  if {[string length $message] > $longest} {
    set message [string range $message 0 $longest-1]...
  }
  return [Object [list error [Object [list line $line message [Text $message] {*}$more]]]]
}

# What the commands have said.
proc ::tcl_request::Request {} {
  variable inputs
  variable outputs
  variable said
  variable switches
  set request {}
  set lines {}
  foreach list {inputs outputs} {
    if {[llength [set $list]] > 0} {
      lappend request $list [Array [lmap entry [set $list] {lindex $entry 1}]]
      lappend lines $list [Array [lmap entry [set $list] {lindex $entry 0}]]
    }
  }
  dict for {name entry} $said {
    lappend request $name [expr {$name in $switches ? "true" : [Text [lindex $entry 1]]}]
    lappend lines $name [lindex $entry 0]
  }
  return [Object [list request [Object $request] lines [Object $lines]]]
}

# --- The commands of a request ---------------------------------------------------------------

proc ::tcl_request::Commands {} {
  variable options
  variable texts
  variable switches
  return [concat [dict keys $options] $texts $switches]
}

# A command of the request. Values may have a blank before their unit.
proc ::tcl_request::Command {name args} {
  variable line
  variable switches
  variable said
  variable inputs
  variable outputs
  if {$name in $switches} {
    if {[llength $args] > 0} {
      error "$name takes no value"
    }
    dict set said $name [list $line]
    return
  }
  set options [Options $name $args]
  set value [dict get $options value]
  switch -- $name {
    input {
      AddClock inputs [Text $value]
      if {[dict exists $options jitter]} {
        dict set said input_jitter [list $line [dict get $options jitter]]
      }
      if {[dict exists $options tolerance]} {
        dict set said input_tolerance [list $line [dict get $options tolerance]]
      }
    }
    output {
      AddClock outputs [Object [list frequency [Text $value] {*}[dict map {key text} \
        [dict remove $options value] {Text $text}]]]
    }
    default { dict set said $name [list $line $value] }
  }
  return
}

proc ::tcl_request::AddClock {list json} {
  variable line
  variable $list
  variable most_clocks
  if {[llength [set $list]] == $most_clocks} {
    error "there are more than $most_clocks $list"
  }
  lappend $list [list $line $json]
}

# The words of a command: a dict of its value and its options without their dash.
proc ::tcl_request::Options {name words} {
  variable options
  variable longest
  set given [dict create]
  set key value
  foreach word $words {
    if {[regexp {^-[a-z]} $word]} {
      set key [string range $word 1 end]
      if {[dict exists $given $key]} {
        error "$name: -[Shown $key] is there twice"
      }
      dict set given $key {}
    } else {
      dict lappend given $key $word
    }
  }
  set allowed [expr {[dict exists $options $name] ? [dict get $options $name] : ""}]
  foreach key [dict keys $given] {
    if {$key ne "value" && $key ni $allowed} {
      set choice [join [lmap option $allowed {string cat - $option}] {, }]
      error "$name has no option -[Shown $key][expr {$choice eq "" ? "" : "; it has $choice"}]"
    }
  }
  set given [dict map {key words} $given {join $words}]
  if {![dict exists $given value]} {
    dict set given value ""
  }
  dict for {key text} $given {
    set what [expr {$key eq "value" ? $name : "$name: -$key"}]
    if {$text eq ""} {
      error "$what needs a value"
    }
    if {[string length $text] > $longest} {
      error "$what: the value \"[Shown $text]\" is too long"
    }
  }
  return $given
}

# --- The process that is bounded -------------------------------------------------------------

# Reads the request on standard input and writes a line with a number for each command that begins,
# and the answer behind them.
proc ::tcl_request::Work {} {
  fconfigure stdin -encoding utf-8
  fconfigure stdout -encoding utf-8 -buffering line
  try {
    set chunks [Chunks [read stdin]]
    set child [Interpreter]
    foreach {number chunk} $chunks {
      Begin $number
      if {[Evaluate $child $chunk]} break
    }
    puts [Request]
  } trap ANSWER {answer} {
    puts $answer
  }
}

# Ends the request with the answer that something is wrong in the command that begins on the line,
# or on one of its further lines.
proc ::tcl_request::Refuse {message {more {}} {further 0}} {
  variable line
  throw ANSWER [Error [expr {$line + $further}] $message $more]
}

# Tells on which line a command begins.
proc ::tcl_request::Begin {number} {
  variable line $number
  puts $number
}

# The commands of a text, each with the line on which it begins: what is wrong is told with a
# line, and not even a command that never ends takes it away. Several on one line stay together.
proc ::tcl_request::Chunks {text} {
  variable most_read
  set chunks {}
  set read 0
  set chunk ""
  set number 0
  set first 1
  foreach line [split $text \n] {
    incr number
    if {$chunk eq ""} {
      set first $number
      Begin $first
    }
    set continued [string match *\\\n $chunk]
    append chunk $line \n
    # What is open stays so where nothing of a line can close it.
    if {$number > $first && !$continued && ![regexp {[\]\}"]} $line]} continue
    # A long command is read again with each line that could end it.
    if {[incr read [string length $chunk]] > $most_read} {
      Refuse "the command that begins here is longer than any request, or is not closed"
    }
    if {[info complete $chunk]} {
      lappend chunks $first $chunk
      set chunk ""
    }
  }
  if {$chunk ne ""} {
    Refuse "a brace, bracket or quote of the command that begins here is not closed"
  }
  return $chunks
}

# The interpreter of a request.
proc ::tcl_request::Interpreter {} {
  variable most_commands
  variable withheld
  set child [interp create -safe]
  foreach name [Commands] {
    interp alias $child $name {} ::tcl_request::Command $name
  }
  foreach name $withheld {
    interp eval $child [list rename $name {}]
  }
  foreach name {rand srand} {
    interp eval $child [list rename ::tcl::mathfunc::$name {}]
  }
  interp limit $child commands -value $most_commands
  return $child
}

# Runs a command of the text; whether it ends the request.
proc ::tcl_request::Evaluate {child chunk} {
  # Only a catch around the text itself tells its line; that a limit is exceeded passes it.
  if {[catch {interp eval $child [list catch $chunk ::reason ::options]} code]} {
    if {[string match {*limit exceeded} $code]} {
      Refuse "the command that begins here does not end"
    }
    Wrong $code
  }
  switch -- $code {
    0 { return 0 }
    2 { return 1 }
    1 {
      interp limit $child commands -value {}
      # The request may have taken away what this needs.
      if {[catch {interp eval $child {list $::reason [dict get $::options -errorline]}} error]} {
        Refuse "the command that begins here has failed"
      }
      Wrong {*}$error
    }
  }
  Refuse "there is no loop to leave"
}

# Ends the request for what Tcl has to say of a command, on a line of it.
proc ::tcl_request::Wrong {reason {number 1}} {
  set further [expr {$number - 1}]
  if {[regexp {unable to (re)?alloc|size overflow|^max (size|length) } $reason]} {
    Refuse "the command that begins here needs too much memory"
  }
  if {[regexp {^invalid command name "(.*)"$} $reason -> name]} {
    Refuse "unknown command \"[Shown $name]\"; a request has [join [Commands] {, }]" \
      [list name [Text [Shown $name]] commands [Array [lmap name [Commands] {Text $name}]]] $further
  }
  Refuse [lindex [split $reason \n] 0] {} $further
}

# --- The process that answers ----------------------------------------------------------------

# Runs the process that is bounded, and answers for it when it does not.
proc ::tcl_request::Answer {} {
  variable script
  variable most_time
  variable most_memory
  # A bound that is narrower already stays. The second one of time is for those who have the signal
  # of the first ignored. A library that is loaded before all others may need more memory for itself
  # than there is. What ends the process leaves no dump.
  set bound "unset LD_PRELOAD; ulimit -c 0; ulimit -v $most_memory; ulimit -S -t $most_time;\
    ulimit -H -t [expr {$most_time + 1}]; exec \"\$0\" \"\$@\""
  set channel [open |[list sh -c $bound [info nameofexecutable] $script work <@stdin 2>/dev/null]]
  fconfigure $channel -encoding utf-8
  set line 0
  set answer ""
  while {[gets $channel text] >= 0} {
    if {[string is integer -strict $text]} {
      set line $text
    } else {
      set answer $text
    }
  }
  set code {}
  if {[catch {close $channel} reason options]} {
    set code [dict get $options -errorcode]
  } elseif {$answer ne ""} {
    return $answer
  }
  if {$line == 0} {
    error "the request cannot be read: [expr {$code eq "" ? "there is no answer" : $reason}]"
  }
  switch -- [lindex $code 2] {
    SIGXCPU { return [Error $line "the command that begins here does not end"] }
    SIGABRT { return [Error $line "the command that begins here needs too much memory"] }
  }
  return [Error $line "the command that begins here cannot be carried out"]
}

if {$::argv eq "work"} {
  ::tcl_request::Work
} else {
  try {
    fconfigure stdout -encoding utf-8
    puts [::tcl_request::Answer]
  } on error {reason} {
    puts stderr "tcl_request: $reason"
    exit 1
  }
}
