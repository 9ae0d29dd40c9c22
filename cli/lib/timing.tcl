# Jitter and phase error of a configuration, from the calculator of the device.

package provide vorkel::timing 1.1
package require vorkel::catalogue 1.1
package require vorkel::engine 1.1

namespace eval ::vorkel::timing {
  # Whether a part has a calculator, for those that have been looked at.
  variable calculators {}
}

# Asks for the figures of a solution (see engine.tcl). Answers a dict:
#   jitters     for each output its peak-to-peak jitter, ps
#   phaseError  ps
#   refusals    a dict from each reason for which there is no figure to the figures that are
#               missing, indices of outputs and the word phaseError
# A figure that there is not is "".
proc ::vorkel::timing::of {request solution} {
  set part [dict get $request part]
  set questions [Questions $request $solution]
  if {![hasCalculator $part]} {
    return [Nothing $questions "$part has no calculator coefficients"]
  }
  set figures [dict create jitters {} phaseError "" refusals {}]
  set handle [Ip::Vorkel::Init]
  try {
    $handle SetDevice $part
    dict set figures phaseError [Ask $handle [dict get $questions phaseError] phaseError figures]
    set n 0
    foreach question [dict get $questions jitters] {
      dict lappend figures jitters [Passed $request [Ask $handle $question $n figures]]
      incr n
    }
  } finally {
    rename $handle {}
  }
  return $figures
}

# Whether a part has a calculator. Without one the engine complains of each question on the
# standard error of the process, where no script can keep it from appearing.
proc ::vorkel::timing::hasCalculator {part} {
  variable calculators
  if {![dict exists $calculators $part]} {
    set device [::vorkel::catalogue::resolve $part]
    set coefficients [dict get $device description calculator [dict get $device grade]]
    dict set calculators $part [expr {$coefficients ne ""}]
  }
  return [dict get $calculators $part]
}

# Whether there is a figure for the jitter of some output.
proc ::vorkel::timing::isKnown {figures} {
  return [expr {[lsearch -not -exact [dict get $figures jitters] ""] >= 0}]
}

# The answer to a question, and "" with a refusal noted when the calculator refuses it.
proc ::vorkel::timing::Ask {handle question what figuresName} {
  upvar 1 $figuresName figures
  if {![catch {$handle {*}$question} answer]} {
    return $answer
  }
  dict update figures refusals refusals {
    dict lappend refusals [string trimright $answer .] $what
  }
  return ""
}

# The jitter of an output, ps, from the answer of the calculator. A KRU passes that of its input
# on, which the calculator leaves out; at worst the two add up.
proc ::vorkel::timing::Passed {request jitter} {
  if {$jitter eq "" || [::vorkel::engine::family [dict get $request primitive]] ne "Kru"} {
    return $jitter
  }
  set input [dict get $request inputJitter]
  if {$input == 0} {
    return $jitter
  }
  return [format %.3f [expr {$jitter + $input}]]
}

# The figures where there is none at all, for a reason.
proc ::vorkel::timing::Nothing {questions reason} {
  set jitters {}
  set missing phaseError
  foreach question [dict get $questions jitters] {
    lappend missing [llength $jitters]
    lappend jitters ""
  }
  return [dict create jitters $jitters phaseError "" refusals [dict create $reason $missing]]
}

# What there is to ask, as a dict from phaseError to a method and its arguments, and from
# jitters to a list of such, one for each output. All of it is asked with the first input
# clock, for which the report gives its frequencies.
proc ::vorkel::timing::Questions {request solution} {
  set family [::vorkel::engine::family [dict get $request primitive]]
  return [${family}Questions $request $solution]
}

proc ::vorkel::timing::LoopQuestions {request solution} {
  set input [lindex [dict get $request inputs] 0]
  set m [dict get $solution m]
  set d [dict get $solution d]
  set bandwidth [dict get $request bandwidth]
  set jitters [lmap output [dict get $solution outputs] {
    list GetPLLPkToPkJitter $input $m $d $bandwidth [dict get $output divider] \
      [dict get $request inputJitter]
  }]
  return [dict create phaseError [list GetPLLPhaseError $input $d $bandwidth] jitters $jitters]
}

# The calculator does not know CLKFXDV. Its clock is that of CLKFX behind a divider, which
# leaves the distance of its edges from where they should be as it is.
proc ::vorkel::timing::KruQuestions {request solution} {
  if {[dict get $request primitive] eq "KRU_CLKGEN"} {
    set method GetKRU_CLKGENPkToPkJitter
    set switches {false false false}
  } else {
    set method GetKRUPkToPkJitter
    set shifted [expr {[dict get $solution phaseShift] != 0}]
    set switches [list [dict get $solution divideBy2] \
      [::vorkel::engine::flag [dict get $request feedback]] [::vorkel::engine::flag $shifted]]
  }
  set input [lindex [dict get $request inputs] 0]
  set jitters [lmap pin [dict get $solution pins] {
    list $method $input [string map {CLKFXDV CLKFX} $pin] {*}$switches \
      [dict get $solution m] [dict get $solution d]
  }]
  return [dict create phaseError GetKRUPhaseError jitters $jitters]
}
