# The command explain: which limits stand in the way of a request, and what would work.
#
# The kinds of limits are
#   number of clocks      the primitive has not so many inputs or outputs
#   PFD range, VCO range  of the input clocks, or the VCO for one output
#   inputs too far apart  one M and D cannot serve both
#   output range, divider range, M and D
#                         of an output of a PLL or a TSYN
#   phase grid, duty grid, high and low count
#                         of an output that is possible without its phase or duty cycle
#   pin frequency, pin range, pin phase
#                         of a KRU
#   outputs together      each is possible, but not with the others
#   the engine            the hardware could, but the engine does not answer so

package provide vorkel::explain 1.1
package require vorkel::answer 1.1
package require vorkel::colour 1.1
package require vorkel::explain_kru 1.1
package require vorkel::explain_loop 1.1
package require vorkel::explain_nearest 1.1
package require vorkel::explain_steps 1.1
package require vorkel::help 1.1
package require vorkel::notes 1.1
package require vorkel::numbers 1.1
package require vorkel::options 1.1
package require vorkel::output 1.1
package require vorkel::progress 1.1
package require vorkel::table 1.1
package require vorkel::units 1.1

namespace eval ::vorkel::explain {
  # The options that only this command has.
  variable options {
    --oscillators LIST "input frequencies to try instead of stock values"
  }
  # As many outputs are told what would work for them.
  variable most_outputs 3
}

# Writes the explanation. That is what was asked for, so the exit status is 0.
proc ::vorkel::explain::run {words} {
  variable options
  ::vorkel::explain_nearest::start
  set call [::vorkel::options::request $words $options]
  if {[dict get $call format] ne "text"} {
    throw {VORKEL USAGE} "explain has only --format text; plan, compare and best have the others"
  }
  if {[dict get $call file] ne ""} {
    ::vorkel::colour::off
  }
  set texts [Oscillators $call]
  # What is to be searched at most: both sides of each output on each primitive, and the inputs.
  ::vorkel::progress::start [expr {2 * [llength [dict get $call request outputs]] *
    [llength [dict get $call primitives]] + [llength $texts]}] "searching"
  try {
    set text [Explanation $call $texts]
  } finally {
    ::vorkel::progress::finish
  }
  ::vorkel::output::write $text [dict get $call file]
  return 0
}

# All that is told.
proc ::vorkel::explain::Explanation {call texts} {
  set answers [::vorkel::answer::rank [::vorkel::answer::all [dict get $call request] \
    [dict get $call primitives]]]
  set findings [Findings $call $answers]
  set text [Head $call]\n
  append text [Verdict $call $answers] [Reasons $findings] [Nearest $call $findings $answers] \
    [Inputs $call $texts [dict get [lindex $answers 0] within]] [Hints $call $answers]
  return $text
}

# The oscillators to try, as texts.
proc ::vorkel::explain::Oscillators {call} {
  set given [dict get $call given]
  if {![dict exists $given --oscillators]} {
    return $::vorkel::explain_nearest::stock
  }
  set list [dict get $given --oscillators]
  ::vorkel::units::values $list frequency --oscillators
  return [lmap entry [split $list ,] {string trim $entry}]
}

# For each primitive that does not do what is asked, its findings: a dict.
proc ::vorkel::explain::Findings {call answers} {
  set request [dict get $call request]
  set findings [dict create]
  foreach primitive [dict get $call primitives] {
    set own [Of $answers $primitive]
    if {[dict get [lindex $own 0] within]} continue
    dict set findings $primitive [Why $request $primitive [lindex $own 0]]
  }
  return $findings
}

# The answers of a primitive.
proc ::vorkel::explain::Of {answers primitive} {
  return [lmap answer $answers {
    if {[dict get $answer primitive] ne $primitive} continue
    set answer
  }]
}

# The findings for one primitive, whose best answer it is.
proc ::vorkel::explain::Why {request primitive answer} {
  set refusal [::vorkel::answer::Refusal $request $primitive]
  if {$refusal ne ""} {
    return [list [dict create kind "number of clocks" outputs {} \
      text [string tolower [string trimright $refusal .] 0 0]]]
  }
  if {[::vorkel::engine::family $primitive] eq "Kru"} {
    set found [::vorkel::explain_kru::findings $request $primitive]
    foreach output [dict get $request outputs] {
      if {[dict get $output duty] ne "" && [dict get $output duty] != 50} {
        lappend found [dict create kind "duty grid" outputs [Duties $request] text \
          "a KRU has no setting for the duty cycle"]
        break
      }
    }
  } else {
    set found [::vorkel::explain_loop::findings $request $primitive]
  }
  if {[llength $found] > 0} {
    return $found
  }
  return [list [Engine $answer]]
}

proc ::vorkel::explain::Duties {request} {
  set indices {}
  set index 0
  foreach output [dict get $request outputs] {
    if {[dict get $output duty] ni {"" 50 50.0}} {
      lappend indices $index
    }
    incr index
  }
  return $indices
}

# No limit stands in the way, but the engine answers something else.
proc ::vorkel::explain::Engine {answer} {
  set text "no limit of the device stands in the way, but the engine "
  if {[dict get $answer solved]} {
    append text "takes settings that are off: it looks for the first that are near enough for it"
  } else {
    append text "finds none: it looks for a VCO from output 0 on and in steps of its own"
  }
  return [dict create kind "the engine" outputs [Offs $answer] \
    text "$text. best searches all settings"]
}

# The outputs of an answer that are off.
proc ::vorkel::explain::Offs {answer} {
  if {![dict get $answer solved]} {
    return {}
  }
  return [lmap output [dict get $answer outputs] {
    if {[dict get $output within]} continue
    dict get $output index
  }]
}

# What was asked.
proc ::vorkel::explain::Head {call} {
  set request [dict get $call request]
  set outputs [lmap output [dict get $request outputs] {Asked $output}]
  set tolerance [::vorkel::numbers::short [dict get $request tolerance] 6]
  return [string cat [::vorkel::table::pairs [list \
    device [dict get $request device] \
    input "[join [lmap input [dict get $request inputs] {
      ::vorkel::explain_loop::MHz $input
    }] {, }] MHz" \
    tolerance [expr {$tolerance == 0 ? "exact" : "$tolerance ppm"}]]] \
    [List "outputs    " $outputs]]
}

# Words behind a label, with commas, in as many lines as it takes, below each other.
proc ::vorkel::explain::List {label words} {
  set lines {}
  set line ""
  foreach word [lrange $words 0 end-1] {
    lappend parts $word,
  }
  lappend parts [lindex $words end]
  foreach part $parts {
    if {$line ne "" &&
        [string length "$label$line $part"] > $::vorkel::table::line_width} {
      lappend lines $line
      set line ""
    }
    append line [expr {$line eq "" ? "" : " "}] $part
  }
  return "$label[join [list {*}$lines $line] \n[string repeat { } [string length $label]]]\n"
}

proc ::vorkel::explain::Asked {output} {
  set text "[::vorkel::explain_loop::MHz [dict get $output freq]] MHz"
  if {[dict get $output phase] ne ""} {
    append text " at [::vorkel::explain_loop::MHz [dict get $output phase]] degrees"
  }
  if {[dict get $output duty] ne ""} {
    append text " with [::vorkel::explain_loop::MHz [dict get $output duty]] % high"
  }
  return $text
}

# Whether it is possible, and else how near the best answer is.
proc ::vorkel::explain::Verdict {call answers} {
  set able [lmap primitive [dict get $call primitives] {
    if {![dict get [lindex [Of $answers $primitive] 0] within]} continue
    set primitive
  }]
  if {[llength $able] > 0} {
    set verb [expr {[llength $able] > 1 ? "make" : "makes"}]
    return [::vorkel::colour::paint good [::vorkel::table::prose "" "Possible:\
      [::vorkel::explain_loop::Either $able and] $verb all of it."]]
  }
  set best [lindex $answers 0]
  set whom [expr {[llength [dict get $call primitives]] == 1 ?
    "the [lindex [dict get $call primitives] 0]" : "every primitive"}]
  set text "Not possible: something stands in the way of $whom."
  if {[dict get $best solved]} {
    append text " The engine's nearest answer is that of the [dict get $best primitive]:\
      [join [list {*}[::vorkel::notes::errors $best] {*}[dict get $best violations]] {; }]."
  }
  return [::vorkel::colour::paint off [::vorkel::table::prose "" $text]]
}

# A paragraph for each finding.
proc ::vorkel::explain::Reasons {findings} {
  set text ""
  dict for {primitive found} $findings {
    append text \n
    foreach finding $found {
      set whom $primitive
      set outputs [dict get $finding outputs]
      if {[llength $outputs] > 0} {
        append whom ", output[expr {[llength $outputs] > 1 ? "s" : ""}] [join $outputs {, }]"
      }
      append text [::vorkel::table::prose "$whom: " "[dict get $finding kind]: [dict get $finding \
        text]."]
    }
  }
  return $text
}

# The nearest requests for the outputs that something stands in the way of.
proc ::vorkel::explain::Nearest {call findings answers} {
  variable most_outputs
  set request [dict get $call request]
  set primitives [dict get $call primitives]
  if {[dict get [lindex $answers 0] within]} {
    return ""
  }
  set offenders [Offenders $findings]
  if {[llength $offenders] == 0} {
    set offenders [Indices $request]
  }
  set rows {}
  set moved {}
  set tried {}
  set helped 0
  foreach index $offenders {
    if {$helped >= $most_outputs} break
    lappend tried $index
    set own [Rows $request $primitives $index]
    set steps [Steps $request $primitives $index]
    lappend rows {*}$own
    lappend moved {*}$steps
    incr helped [expr {[llength $own] + [llength $steps] > 0}]
  }
  set left [lrange $offenders [llength $tried] end]
  set text ""
  if {[llength $rows] > 0} {
    append text \n [Table $rows $primitives]
  }
  if {$helped == 0} {
    append text [Together [::vorkel::explain_nearest::sets $request $primitives] $tried]
  }
  if {[llength $moved] > 0} {
    append text \n
    foreach sentence $moved {
      append text [::vorkel::table::prose "" $sentence]
    }
  }
  dict for {index texts} $::vorkel::explain_nearest::passed {
    append text \n [::vorkel::table::prose "note: " "output $index: [join $texts {, }] would be\
      nearer; the engine does not find the settings, best does"]
  }
  if {[llength $left] > 0} {
    append text \n [::vorkel::table::prose "note: " "what would work instead of\
      [Outputs $left] has not been searched"]
  }
  return $text
}

proc ::vorkel::explain::Indices {request} {
  set indices {}
  foreach output [dict get $request outputs] {
    lappend indices [llength $indices]
  }
  return $indices
}

# "output 1", "outputs 1, 2 and 3".
proc ::vorkel::explain::Outputs {indices} {
  return "output[expr {[llength $indices] > 1 ? "s" : ""}]\
    [::vorkel::explain_loop::Either $indices and]"
}

# The frequencies that work for an output, as rows of a table.
proc ::vorkel::explain::Rows {request primitives index} {
  return [lmap near [::vorkel::explain_nearest::frequencies $request $primitives $index] {
    list $index [Spelled $near] [::vorkel::explain_loop::far [dict get $near ppm]] \
      [join [dict get $near primitives] {, }]
  }]
}

proc ::vorkel::explain::Table {rows primitives} {
  set which [expr {[llength $primitives] == 1 ? "the nearest two below and above" :
    "the nearest below and above of each primitive"}]
  set columns {{right output} {left {MHz instead}} {right change} {left {made by}}}
  set head [::vorkel::table::prose "" "frequencies nearby that work, all else as asked for;\
    $which:"]
  set table [::vorkel::table::render $columns $rows]
  foreach line [split $table \n] {
    if {[string length $line] > $::vorkel::table::line_width} {
      # A quotient with many digits stands for itself.
      set rows [lmap row $rows {lreplace $row 1 1 [lindex [split [lindex $row 1] =] 0]}]
      return $head[::vorkel::table::render $columns $rows]
    }
  }
  return $head$table
}

# Sentences on the phases and duty cycles that work for an output.
proc ::vorkel::explain::Steps {request primitives index} {
  set sentences {}
  foreach {what name unit} {phase phase degrees duty "duty cycle" %} {
    if {[dict get [lindex [dict get $request outputs] $index] $what] eq ""} continue
    foreach {text makers} [::vorkel::explain_steps::nearest $request $primitives $index $what] {
      set whom [lmap maker $makers {string cat "the " $maker}]
      lappend sentences "output $index: a $name of $text $unit works on\
        [::vorkel::explain_loop::Either $whom and]"
    }
  }
  return $sentences
}

# Frequencies for all outputs at once, when to move those that were tried one at a time is in vain.
proc ::vorkel::explain::Together {sets tried} {
  set vain "to move [Outputs $tried][expr {[llength $tried] > 1 ? ", one at a time," : " alone"}]\
    does not help"
  if {$::vorkel::explain_nearest::stopped || [dict size $::vorkel::explain_nearest::passed] > 0} {
    set vain ""
  }
  if {[llength $sets] == 0} {
    return [expr {$vain eq "" ? "" : "\n[::vorkel::table::prose {} $vain]"}]
  }
  set text \n[::vorkel::table::prose "" \
    "[expr {$vain eq "" ? "" : "$vain; "}]moved together, these work:"]
  foreach set $sets {
    append text [::vorkel::table::prose "[dict get $set primitive]: " \
      "--out [join [dict get $set texts] ,] (at most\
      [::vorkel::explain_loop::far [dict get $set ppm]])"]
  }
  return $text
}

# A frequency with what it is about when it is written as a quotient.
proc ::vorkel::explain::Spelled {near} {
  set text [dict get $near text]
  if {[string first / $text] >= 0} {
    append text " = [::vorkel::explain_loop::MHz [dict get $near frequency]]"
  }
  return $text
}

# The outputs that stand in the findings, those of most primitives first.
proc ::vorkel::explain::Offenders {findings} {
  set counts [dict create]
  dict for {primitive found} $findings {
    foreach finding $found {
      foreach index [dict get $finding outputs] {
        dict incr counts $index
      }
    }
  }
  set pairs [lsort -integer -index 0 [lmap {index count} $counts {list $index $count}]]
  return [lmap pair [lsort -integer -decreasing -index 1 $pairs] {lindex $pair 0}]
}

# The input clocks that would make everything exact. Where nothing is in the way, they are told
# only to who asks.
proc ::vorkel::explain::Inputs {call texts possible} {
  set stock [expr {![dict exists $call given --oscillators]}]
  if {$stock && $possible} {
    return ""
  }
  set found [::vorkel::explain_nearest::oscillators [dict get $call request] \
    [dict get $call primitives] $texts]
  set what [expr {$stock ? "stock oscillators" : "oscillators of your list"}]
  if {[llength $found] == 0 && $::vorkel::explain_nearest::stopped} {
    return ""
  }
  set first [expr {[llength [dict get $call request inputs]] > 1 ?
    " in place of the first input clock" : ""}]
  if {[llength $found] == 0} {
    return "\n[::vorkel::table::prose {} "None of the $what makes every output exact$first."]"
  }
  set groups [dict create]
  foreach pair $found {
    lassign $pair text primitives
    dict lappend groups $primitives $text
  }
  set text \n[::vorkel::table::prose "" "$what that make every output exact$first, MHz:"]
  dict for {primitives inputs} $groups {
    append text [::vorkel::table::prose "[join $primitives {, }]: " [join $inputs {, }]]
  }
  return $text
}

proc ::vorkel::explain::Hints {call answers} {
  set text ""
  if {$::vorkel::explain_nearest::stopped} {
    append text \n [::vorkel::table::prose "note: " "the search for what works was cut short; there\
      may be more and nearer"]
  }
  set words [dict get $call words]
  if {[dict get [lindex $answers 0] within]} {
    append text "\nhint: the settings: [::vorkel::help::command plan [Without $words]]\n"
  }
  return $text
}

# The words without the option that other commands do not have.
proc ::vorkel::explain::Without {words} {
  set kept {}
  while {[llength $words] > 0} {
    set words [lassign $words word]
    if {$word eq "--oscillators"} {
      set words [lrange $words 1 end]
    } elseif {![string match --oscillators=* $word]} {
      lappend kept $word
    }
  }
  return $kept
}
