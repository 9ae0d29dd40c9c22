# A plan as timing constraints in SDC: the clocks at the inputs, those that the primitive makes of
# them, and their uncertainty.
#
# A clock without a phase has the ratio of its settings, as whole numbers: -multiply_by,
# -divide_by and, when it is not 50 percent, -duty_cycle.
#
# SDC has no phase beside these. Its means for one is -edge_shift, which goes with -edges and
# with nothing else: three edges of the source clock, and how much later than these the clock
# rises, falls and rises again. A delay of the clock (set_clock_latency) would be no phase: tools
# then count from the edges as if they were not shifted. Without a multiplier the shift of both
# rising edges is the same number, so that the period is exactly a multiple of the source's. With
# one the second has what the period is longer or shorter than whole periods of the source, as
# exactly as a decimal can be; the comment has the ratio.

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

proc ::vorkel::format::sdc_writer::Waveform {output input} {
  lassign [dict get $output ratio] multiply divide
  set phase [::vorkel::actual::turned [dict get $output phase]]
  set duty [dict get $output duty]
  if {$phase != 0.0} {
    return [Edges $multiply $divide [expr {1000.0 / $input}] $phase $duty]
  }
  set text "-multiply_by $multiply -divide_by $divide"
  if {$duty != 50.0} {
    append text " -duty_cycle [Exact $duty]"
  }
  return $text
}

# Edges of the source, which has two in each period, and their shifts (ns).
proc ::vorkel::format::sdc_writer::Edges {multiply divide source phase duty} {
  # Whole periods of the source, of which there must be one at least between rising edges.
  set whole [expr {max(1, $divide / $multiply)}]
  set period [expr {$source * $divide / $multiply}]
  set rise [expr {$period * $phase / 360.0}]
  set fall [expr {$rise + $period * $duty / 100.0 - $source * $whole / 2.0}]
  set again $rise
  if {$multiply * $whole != $divide} {
    set again [expr {$rise + $source * ($divide - $multiply * $whole) / $multiply}]
  }
  return "-edges {1 [expr {1 + $whole}] [expr {1 + 2 * $whole}]}\
    -edge_shift {[Exact $rise] [Exact $fall] [Exact $again]}"
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
