# Answers as plain data with names for the outside, which the formats json and tcl write:
# doc/planner-json.md describes it. What is not known, or was not asked for, is "".

package provide vorkel::plan_data 1.1

namespace eval ::vorkel::plan_data {
  # Counts up when an entry goes, is added, or changes its meaning or type.
  variable version 2
  # A frequency that is off beyond what a double can count is told as the largest one.
  variable largest 1.7976931348623157e308
}

# The data of answers to a request (see answer.tcl), in the order given.
proc ::vorkel::plan_data::of {answers request} {
  variable version
  return [dict create format vorkel-plan version $version request [Request $request] \
    answers [lmap answer $answers {Answer $answer}]]
}

# A request with the names of a request file. As there, what was not asked for is left out.
proc ::vorkel::plan_data::Request {request} {
  set data [dict create device [dict get $request device]]
  if {[dict exists $request primitive]} {
    dict set data primitive [dict get $request primitive]
  }
  set data [dict merge $data [dict create \
    inputs [lmap input [dict get $request inputs] {number $input}] \
    outputs [lmap output [dict get $request outputs] {RequestedOutput $output}] \
    input_jitter [number [dict get $request inputJitter]] \
    tolerance [number [dict get $request tolerance]]]]
  if {[dict get $request bandwidthAsked]} {
    dict set data bandwidth [dict get $request bandwidth]
  }
  foreach {name key} {feedback feedback prefer_max_vco preferMaxVco int_div0 intDiv0} {
    dict set data $name [flag [dict get $request $key]]
  }
  return $data
}

proc ::vorkel::plan_data::RequestedOutput {output} {
  set data [dict create frequency [number [dict get $output freq]]]
  foreach key {phase duty} {
    if {[dict get $output $key] ne ""} {
      dict set data $key [number [dict get $output $key]]
    }
  }
  return $data
}

# An answer. One that is not solved has only the entries up to `within`.
proc ::vorkel::plan_data::Answer {answer} {
  set data [dict create]
  foreach key {primitive source variant} {
    dict set data $key [dict get $answer $key]
  }
  foreach key {solved within} {
    dict set data $key [flag [dict get $answer $key]]
  }
  dict set data reason [dict get $answer reason]
  if {![dict get $answer solved]} {
    return $data
  }
  set settings [dict create]
  dict for {name value} [dict get $answer settings] {
    # PHASE_SHIFT and "phase offset" are named alike.
    dict set settings [string tolower [string map {{ } _} $name]] [number $value]
  }
  if {[llength [dict get $answer request inputs]] > 1} {
    set second [lindex [dict get $answer request inputs] 1]
    dict set settings vco_second [number [expr {double($second) * [dict get $settings m] /
      [dict get $settings d]}]]
    dict set settings pfd_second [number [expr {double($second) / [dict get $settings d]}]]
  }
  dict set data settings $settings
  dict set data bandwidth [dict get $answer bandwidth]
  foreach {name key} {
    search_vco searchVco input_jitter inputJitter phase_error phaseError worst_ppm worstPpm
    max_jitter maxJitter
  } {
    dict set data $name [number [dict get $answer $key]]
  }
  dict set data outputs [lmap output [dict get $answer outputs] {Output $output}]
  dict set data violations [dict get $answer violations]
  dict set data notes [dict get $answer notes]
  return $data
}

proc ::vorkel::plan_data::Output {output} {
  lassign [dict get $output ratio] multiply divide
  set data [dict create index [dict get $output index] pin [dict get $output pin] \
    divider [number [dict get $output divider]] multiply $multiply divide $divide]
  foreach {name key} {
    requested requested actual actual actual_second actual2 search search error_ppm ppm
    requested_phase reqPhase phase phase phase_error phaseError
    requested_duty reqDuty duty duty duty_error dutyError jitter jitter
  } {
    dict set data $name [number [dict get $output $key]]
  }
  dict set data within [flag [dict get $output within]]
  return $data
}

# A number of the engine as every reader takes it: whole ones as they are, others as the
# shortest text that reads back as the same double. "" and the words true and false stay.
proc ::vorkel::plan_data::number {text} {
  variable largest
  set text [string trim $text]
  if {$text in {"" true false} || [regexp {^(0|-?[1-9][0-9]*)$} $text]} {
    return $text
  }
  # scan takes digits behind a 0 as decimal, which an expression would not.
  if {[scan $text %f value] != 1} {
    set value $text
  }
  return [expr {max(-$largest, min($largest, $value))}]
}

proc ::vorkel::plan_data::flag {value} {
  return [expr {$value ? "true" : "false"}]
}
