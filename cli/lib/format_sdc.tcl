# A plan as timing constraints in SDC: the clocks at the inputs, those that the primitive makes of
# them, and their uncertainty.
#
# A timing tool takes one description of a clock and refuses two beside each other, so each clock
# has the plainest that says all of it:
#   -multiply_by   a whole multiple of the input; -duty_cycle goes with it, and with nothing else
#   -divide_by     a whole part of the input, high for half of the time
#   -edges and -edge_shift
#                  all else: fractions, phases, and parts with another duty cycle
# The last are three edges of the input and how much later than these the clock rises, falls and
# rises again. The edges of a clock are counted from 1, two in each period, the input's being half
# a period apart. The first rise is in the first period of the clock, from time 0 on: some tools
# overlook gaps between clocks that rise for the first time before or after that. A delay of the
# clock (set_clock_latency) would be no phase: tools then count from the edges as if they were not
# shifted. Of a whole part of the input both rising edges are shifted by the same number, so that
# its period is exactly a multiple of the input's. Else the shift of the second has what the period
# is longer or shorter than whole periods of the input, in all digits of a double; the comment has
# the ratio.

package provide vorkel::format_sdc 1.1
package require vorkel::actual 1.1
package require vorkel::numbers 1.1

namespace eval ::vorkel::format {}
namespace eval ::vorkel::format::sdc_writer {
  variable width 78
}

# The constraints of the first answer. Outputs on the same pin of a KRU are one clock: a second one
# there would replace it or, added to it, have every path counted twice.
proc ::vorkel::format::sdc {answers request} {
  set answer [lindex $answers 0]
  if {![dict get $answer solved]} {
    throw {VORKEL UNSOLVED} [dict get $answer reason]
  }
  set inputs [dict get $request inputs]
  set text [sdc_writer::Head $answer $request]
  foreach input $inputs {
    append text \n [sdc_writer::Input [incr n] $input [dict get $answer inputJitter]]
  }
  set at [dict create]
  foreach output [dict get $answer outputs] {
    append text \n [sdc_writer::Comment [sdc_writer::Figures $output $inputs]]
    set n 0
    set pin [sdc_writer::Pin $output]
    if {[dict exists $at $pin]} {
      append text [sdc_writer::Comment "Output [dict get $output index] is on the pin $pin, too:\
        its clock is [dict get $at $pin]."]
      continue
    }
    dict set at $pin [sdc_writer::Name $output 1 [llength $inputs]]
    foreach input $inputs {
      append text [sdc_writer::Generated $output [incr n] $input [llength $inputs] $pin]
    }
    append text [sdc_writer::Uncertainty $output [llength $inputs]]
  }
  if {[llength $inputs] > 1} {
    append text \n [sdc_writer::Either [llength [dict get $answer outputs]]]
  }
  return $text
}

# What the file is about, what is off, and the names that a design has its own for.
proc ::vorkel::format::sdc_writer::Head {answer request} {
  set settings [lmap {name value} [dict get $answer settings] {
    string cat $name " " [Short $value]
  }]
  if {[dict get $answer bandwidth] ne ""} {
    lappend settings "bandwidth [dict get $answer bandwidth]"
  }
  set text [Comment "[dict get $request device] [dict get $answer primitive]:\
    [join $settings {, }]"]
  append text [Comment "Periods and shifts are in ns. The uncertainty of a clock is half of its\
    peak-to-peak jitter, by which an edge can be early or late."]
  if {[dict get $answer phaseError] ne ""} {
    append text [Comment "The outputs are up to [Short [dict get $answer phaseError]] ps beside\
      the phase of the input, which no constraint here counts."]
  }
  if {![dict get $answer within]} {
    append text [Comment "OFF: not everything is as asked for, or in the device's range."]
    foreach violation [dict get $answer violations] {
      append text [Comment "OFF: $violation"]
    }
  }
  append text \n [Comment "The names of the input ports and of the primitive in the design."]
  set n 0
  foreach input [dict get $request inputs] {
    append text "set input_port_[incr n] clk_in$n\n"
  }
  return "${text}set primitive [string tolower [dict get $answer primitive]]_inst\n"
}

proc ::vorkel::format::sdc_writer::Input {n frequency jitter} {
  set text [Comment "Input $n: [Short $frequency] MHz, jitter [Short $jitter] ps peak to peak"]
  append text "create_clock -name clk_in$n -period [Exact [expr {1000.0 / $frequency}]]\
    \[get_ports \$input_port_$n\]\n"
  if {$jitter > 0} {
    append text "set_clock_uncertainty [Half $jitter] \[get_clocks clk_in$n\]\n"
  }
  return $text
}

# The numbers of an output, for the first input where nothing else is said.
proc ::vorkel::format::sdc_writer::Figures {output inputs} {
  lassign [dict get $output ratio] multiply divide
  set text "Output [dict get $output index]: [Short [dict get $output actual]] MHz, $multiply /\
    $divide of the input"
  append text ", [Short [dict get $output requested]] MHz asked for,\
    [::vorkel::numbers::fixed [dict get $output ppm] 2] ppm off"
  append text [Shape $output phase reqPhase phaseError degrees] \
    [Shape $output duty reqDuty dutyError percent]
  if {[dict get $output jitter] eq ""} {
    append text "; jitter unknown"
  } else {
    append text "; jitter [Short [dict get $output jitter]] ps peak to peak"
  }
  if {![dict get $output within]} {
    append text "; OFF"
  }
  foreach input [lrange $inputs 1 end] {
    append text "; from input 2 [Short [expr {double($input) * $multiply / $divide}]] MHz, whose\
      jitter is unknown: it is worked out for the first input only, so that this clock has no\
      uncertainty here and needs one of your own"
  }
  return $text
}

proc ::vorkel::format::sdc_writer::Shape {output actual requested error unit} {
  set text "; $actual [Short [dict get $output $actual]] $unit"
  if {[dict get $output $requested] ne ""} {
    append text ", [Short [dict get $output $requested]] asked for,\
      [Short [dict get $output $error]] off"
  }
  return $text
}

# A clock that the primitive makes. With two inputs it is one of two at its pin.
proc ::vorkel::format::sdc_writer::Generated {output n input inputs pin} {
  set text "create_generated_clock -name [Name $output $n $inputs]"
  append text " -source \[get_ports \$input_port_$n\] -master_clock clk_in$n"
  if {$n > 1} {
    append text " -add"
  }
  append text " \\\n  [Waveform $output $input] \\\n  \[get_pins \$primitive/$pin\]\n"
  return $text
}

# When a clock rises and falls, in the plainest of the descriptions above.
proc ::vorkel::format::sdc_writer::Waveform {output input} {
  lassign [dict get $output ratio] multiply divide
  set phase [::vorkel::actual::turned [dict get $output phase]]
  set duty [dict get $output duty]
  if {$phase == 0.0 && $divide == 1} {
    return "-multiply_by $multiply[expr {$duty == 50.0 ? "" : " -duty_cycle [Exact $duty]"}]"
  }
  if {$phase == 0.0 && $multiply == 1 && $duty == 50.0} {
    return "-divide_by $divide"
  }
  return [Edges $multiply $divide [expr {1000.0 / $input}] $phase $duty]
}

# Edges of the source, and their shifts (ns). The shifts are worked out in periods of the source,
# where what is 0 or the same comes out so, and multiplied by `source`, its period, at the end.
#
# A timing tool may count in floats. Of a fast clock little would be left of them where a shift
# takes away nearly all of a period of the source; so one that is more than four times as fast has
# all three edges at the first one of the source.
proc ::vorkel::format::sdc_writer::Edges {multiply divide source phase duty} {
  # Whole periods of the source between the rising edges.
  set whole [expr {$multiply > 4 * $divide ? 0 : max(1, $divide / $multiply)}]
  set rise [expr {$divide * $phase / (360.0 * $multiply)}]
  set fall [expr {$rise + ($divide * $duty / (100.0 * $multiply) - $whole / 2.0)}]
  set again [expr {$rise + double($divide - $multiply * $whole) / $multiply}]
  set shifts [lmap shift [list $rise $fall $again] {Exact [expr {$source * $shift}]}]
  return "-edges {1 [expr {1 + $whole}] [expr {1 + 2 * $whole}]} -edge_shift {$shifts}"
}

# The jitter is worked out for the first input clock, and with another one it is another.
proc ::vorkel::format::sdc_writer::Uncertainty {output inputs} {
  set jitter [dict get $output jitter]
  if {$jitter eq ""} {
    return ""
  }
  return "set_clock_uncertainty [Half $jitter] \[get_clocks [Name $output 1 $inputs]\]\n"
}

# Only one of two input clocks drives the primitive at a time.
proc ::vorkel::format::sdc_writer::Either {outputs} {
  set text [Comment "The outputs follow one input or the other."]
  append text "set_clock_groups -physically_exclusive"
  foreach n {1 2} {
    set names {}
    for {set index 0} {$index < $outputs} {incr index} {
      lappend names [Name [dict create index $index] $n 2]
    }
    append text " \\\n  -group \[get_clocks {[join $names]}\]"
  }
  return $text\n
}

proc ::vorkel::format::sdc_writer::Name {output n inputs} {
  set name clk_out[dict get $output index]
  return [expr {$inputs > 1 ? "${name}_in$n" : $name}]
}

# The pin of the primitive at which an output is.
proc ::vorkel::format::sdc_writer::Pin {output} {
  set pin [dict get $output pin]
  return [expr {$pin eq "" ? "CLKOUT[dict get $output index]" : $pin}]
}

# Half of a jitter in ps, in ns.
proc ::vorkel::format::sdc_writer::Half {jitter} {
  return [::vorkel::numbers::short [expr {$jitter / 2000.0}] 7]
}

# A number for people; words stay.
proc ::vorkel::format::sdc_writer::Short {value} {
  if {![string is double -strict $value]} {
    return $value
  }
  return [::vorkel::numbers::short $value 6]
}

# The shortest text that reads back as the same double, without an exponent, which not every
# tool takes.
proc ::vorkel::format::sdc_writer::Exact {value} {
  set value [expr {double($value)}]
  if {[string first e $value] < 0} {
    return $value
  }
  return [::vorkel::numbers::short $value 18]
}

# Lines of comment, broken where they would be long.
proc ::vorkel::format::sdc_writer::Comment {sentence} {
  variable width
  package require textutil::adjust
  set lines [split [::textutil::adjust::adjust $sentence -length $width -strictlength 0] \n]
  return "# [join $lines "\n#   "]\n"
}
