# What the settings of a plan make, in whole numbers: ratios, and the edges of the clocks on a grid
# that has all of them. Ratios are lists of two whole numbers, the second above 0.

namespace eval ::exact {
  # Degrees of the pins of a KRU.
  variable pin_phase {
    CLK0 0 CLK90 90 CLK180 180 CLK270 270 CLK2X 0 CLK2X180 180 CLKDV 0 CLKFX 0 CLKFX180 180
    CLKFXDV 0
  }
}

proc ::exact::gcd {a b} {
  while {$b != 0} {
    lassign [list $b [expr {$a % $b}]] a b
  }
  return [expr {abs($a)}]
}

proc ::exact::ratio {a {b 1}} {
  set common [gcd $a $b]
  return [list [expr {$a / $common}] [expr {$b / $common}]]
}

proc ::exact::times {one two} {
  lassign $one a b
  lassign $two c d
  return [ratio [expr {$a * $c}] [expr {$b * $d}]]
}

proc ::exact::over {one two} {
  return [times $one [lreverse $two]]
}

proc ::exact::plus {one two} {
  lassign $one a b
  lassign $two c d
  return [ratio [expr {$a * $d + $c * $b}] [expr {$b * $d}]]
}

# The whole number that a value is, which must be near to one.
proc ::exact::whole {value} {
  set whole [expr {round($value)}]
  if {abs($value - $whole) > 1e-6} {
    error "$value is not whole"
  }
  return $whole
}

# The ratio of an output to the input, its phase and its duty cycle, both in parts of a period.
proc ::exact::shape {answer output} {
  set settings [dict get $answer settings]
  if {[dict get $answer primitive] in {PLL TSYN}} {
    return [LoopShape $settings $output]
  }
  return [KruShape $settings $output]
}

# M and the divider have eighths. A phase is a number of eighths of the VCO's period, and an output
# is high for a number of its halves.
proc ::exact::LoopShape {settings output} {
  set divider [ratio [whole [expr {[dict get $output divider] * 8}]] 8]
  set m [ratio [whole [expr {[dict get $settings m] * 8}]] 8]
  set cycles [expr {double([dict get $output divider])}]
  set eighths [whole [expr {[dict get $output phase] / 360 * $cycles * 8}]]
  set halves [expr {[dict get $output duty] == 50 ? "" :
    [whole [expr {[dict get $output duty] / 100 * $cycles * 2}]]}]
  return [list [over [over $m [ratio [dict get $settings d]]] $divider] \
    [over [ratio $eighths 8] $divider] \
    [expr {$halves eq "" ? {1 2} : [over [ratio $halves 2] $divider]}]]
}

proc ::exact::KruShape {settings output} {
  variable pin_phase
  set pin [dict get $output pin]
  set frequency [ratio 1]
  if {[dict exists $settings clkin_divide_by_2] && [dict get $settings clkin_divide_by_2]} {
    set frequency {1 2}
  }
  switch -glob -- $pin {
    CLK2X* { set frequency [times $frequency {2 1}] }
    CLKFX* {
      set frequency [times $frequency [ratio [dict get $settings m] [dict get $settings d]]]
    }
  }
  set duty {1 2}
  foreach {name key} {CLKDV clkdv CLKFXDV clkfxdv} {
    if {$pin eq $name} {
      set halves [whole [expr {[dict get $settings $key] * 2}]]
      set frequency [over $frequency [ratio $halves 2]]
      # With an odd number of halves it is high for one half less than it is low.
      set duty [ratio [expr {$halves / 2}] $halves]
    }
  }
  set phase [ratio [dict get $pin_phase $pin] 360]
  if {[dict exists $settings phase_shift]} {
    set phase [plus $phase [ratio [dict get $settings phase_shift] 255]]
  }
  return [list $frequency $phase $duty]
}

# The clocks of a plan on a grid of whole steps: a list of the steps in a nanosecond (a ratio), and
# a dict from name to period, rise and fall. `inputs` are ratios, MHz, and `outputs` the outputs
# that have a clock.
proc ::exact::clocks {answer inputs outputs} {
  set exact [dict create]
  set n 0
  foreach input $inputs {
    incr n
    set source [over {1000 1} $input]
    dict set exact clk_in$n [list $source {0 1} [over $source {2 1}]]
    foreach output $outputs {
      lassign [shape $answer $output] frequency phase duty
      set period [over $source $frequency]
      # From 0 to below a whole period.
      set phase [ratio [expr {[lindex $phase 0] % [lindex $phase 1]}] [lindex $phase 1]]
      set name clk_out[dict get $output index][expr {[llength $inputs] > 1 ? "_in$n" : ""}]
      set rise [times $period $phase]
      dict set exact $name [list $period $rise [plus $rise [times $period $duty]]]
    }
  }
  set steps 1
  foreach times [dict values $exact] {
    foreach time $times {
      set divisor [lindex $time 1]
      set steps [expr {$steps / [gcd $steps $divisor] * $divisor}]
    }
  }
  return [list $steps [dict map {name times} $exact {
    lmap time $times {expr {[lindex $time 0] * $steps / [lindex $time 1]}}
  }]]
}

# The shortest time from a rising edge of one clock to a later edge of another, `first` and `second`
# being periods and `rise` and `edge` the times of such edges: of all edges of the second clock in
# `count` periods of it, which with count * second a multiple of `first` are all that there are.
# With `start` only launches from time 0 on count; "" when there are none.
proc ::exact::gap {first rise second edge count start} {
  set least ""
  for {set k 0} {$k < $count} {incr k} {
    set capture [expr {$edge + $k * $second}]
    # Whole periods from the rising edge up to the last one before this.
    set cycles [expr {($capture - $rise - 1) / $first}]
    if {$start && $cycles < 0} continue
    set between [expr {$capture - $rise - $cycles * $first}]
    if {$least eq "" || $between < $least} {
      set least $between
    }
  }
  return $least
}
