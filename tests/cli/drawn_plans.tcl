# Requests drawn at random, always the same ones: words for the command line, of all primitives and
# with all that shapes a clock.

namespace eval ::drawn {
  # MHz, as they are written and as ratios. A PLL's PFD begins at 19 MHz.
  variable inputs {
    100 {100 1} 27MHz {27 1} 50 {50 1} 100/3 {100 3} 8ns {125 1} 148.5 {297 2} 24.576 {3072 125}
    200/3 {200 3} 33.333 {33333 1000} 74.25 {297 4} 156.25 {625 4} 19.44 {486 25} 12 {12 1}
  }
  # The second input in parts of the first.
  variable seconds {1/2 2/1 3/2 4/5 9/10}
  # MHz that few inputs make.
  variable frequencies {148.5 74.25 27 33.3 12.288 125 156.25 62.5 11.2896 49.152 100 333 65}
}

proc ::drawn::seed {number} {
  expr {srand($number)}
}

proc ::drawn::number {from to} {
  return [expr {$from + int(rand() * ($to - $from + 1))}]
}

proc ::drawn::one {list} {
  return [lindex $list [number 0 [expr {[llength $list] - 1}]]]
}

proc ::drawn::often {percent} {
  return [expr {rand() * 100 < $percent}]
}

# One request: its words, and its inputs as ratios.
proc ::drawn::request {} {
  set kind [one {Loop Loop Loop Loop Best Kru Clkgen}]
  return [$kind]
}

# An input, as written and as a ratio.
proc ::drawn::Input {} {
  variable inputs
  set text [one [dict keys $inputs]]
  return [list $text [dict get $inputs $text]]
}

# One of the options that change no frequency.
proc ::drawn::Jitter {} {
  return [expr {[often 40] ? [list --input-jitter [number 1 200]] : {}}]
}

# A PLL or a TSYN: frequencies that some M, D and dividers make, or any.
proc ::drawn::Loop {} {
  variable seconds
  variable frequencies
  lassign [Input] text input
  set mhz [expr {double([lindex $input 0]) / [lindex $input 1]}]
  set primitive [expr {$mhz < 19 ? "tsyn" : [one {pll tsyn}]}]
  set whole [often 30]
  set d [expr {$whole ? 1 : [number 1 [expr {max(1, min(6, int($mhz / 19)))}]]}]
  set m [number [expr {int(ceil(620 * $d / $mhz))}] [expr {min(64, int(1050 * $d / $mhz))}]]
  set choice {3 4 5 6 7 8 9 10 11 12 15 16 20 25 32 40 64 75 100 125}
  if {$whole} {
    # Those that make whole multiples, and parts, of the input.
    set choice [lmap divider $choice {
      if {$m % $divider && $divider % $m} continue
      set divider
    }]
    lappend choice $m
  }
  set dividers {}
  set outputs {}
  for {set count [number 1 [one {2 3 4 7}]]} {[llength $outputs] < $count} {} {
    set divider [one $choice]
    lappend dividers $divider
    lappend outputs [expr {[often 15] ? [one $frequencies] : $mhz * $m / $d / $divider}]
  }
  set words [list $primitive --in $text --out [join $outputs ,] {*}[Jitter] {*}[Shapes $dividers]]
  set inputs [list $input]
  if {[often 30]} {
    set second [::exact::times $input [split [one $seconds] /]]
    lappend inputs $second
    lset words 2 [join $input /],[join $second /]
  }
  if {[often 30]} {
    lappend words --bandwidth [one {LOW HIGH OPTIMIZED}]
  }
  return [list $words $inputs]
}

# Phases and duty cycles, those that an output can have and others, for most of the outputs.
proc ::drawn::Shapes {dividers} {
  set words {}
  if {[often 60]} {
    lappend words --phase [join [lmap divider $dividers {
      switch [number 0 3] {
        0 {string cat -}
        1 {number -360 360}
        2 {expr {[number -8 8] * 45.0 / $divider}}
        3 {one {0 90 -90 180 270 -45 -180}}
      }
    }] ,]
  }
  if {[often 50]} {
    lappend words --duty [join [lmap divider $dividers {
      switch [number 0 2] {
        0 {string cat -}
        1 {number 10 90}
        2 {one {25 50 75 40 33.3}}
      }
    }] ,]
  }
  return $words
}

# The best settings of all, which of a TSYN have an M and a divider of output 0 with a fraction.
proc ::drawn::Best {} {
  variable frequencies
  lassign [Input] text input
  set outputs {}
  set dividers {}
  for {set count [number 1 3]} {[llength $outputs] < $count} {} {
    lappend outputs [one $frequencies]
    lappend dividers [number 3 40]
  }
  return [list [list best --primitive [one {TSYN TSYN TSYN PLL}] --in $text \
    --out [join $outputs ,] {*}[Jitter] {*}[expr {[often 25] ? [Shapes $dividers] : {}}]] \
    [list $input]]
}

proc ::drawn::Kru {} {
  lassign [Input] text input
  set mhz [expr {double([lindex $input 0]) / [lindex $input 1]}]
  set half [expr {[often 40] || $mhz > 150 ? 2 : 1}]
  set base [expr {$mhz / $half}]
  set d [number 1 8]
  set m [number [expr {max(2, int(ceil(6 * $d / $base)))}] [expr {min(32, int(380 * $d / $base))}]]
  set divide [one {2 2.5 3.5 4 4.5 5.5 7.5 8}]
  set outputs {}
  set phases {}
  for {set count [number 1 6]} {[llength $outputs] < $count} {} {
    lassign [one [list [list $base {0 90 180 270 -90}] [list [expr {$base * 2}] {0 180 -180}] \
      [list [expr {$base / $divide}] 0] [list [expr {$base * $m / $d}] {0 180 -180}]]] frequency pin
    lappend outputs $frequency
    lappend phases [one $pin]
  }
  set shift [expr {[often 40] ? [number 1 63] * 360.0 / 255 : 0}]
  set phases [lmap phase $phases {expr {$phase + $shift}}]
  return [list [list kru --in $text --out [join $outputs ,] --phase [join $phases ,] --feedback \
    {*}[Jitter]] [list $input]]
}

proc ::drawn::Clkgen {} {
  lassign [Input] text input
  set mhz [expr {double([lindex $input 0]) / [lindex $input 1]}]
  set d [number 1 20]
  set m [number [expr {max(2, int(ceil(10 * $d / $mhz)))}] [expr {min(256, int(360 * $d / $mhz))}]]
  set outputs {}
  set phases {}
  for {set count [number 1 4]} {[llength $outputs] < $count} {} {
    lappend outputs [expr {$mhz * $m / $d / [one {1 1 4}]}]
    lappend phases [one {0 0 180}]
  }
  return [list [list clkgen --in $text --out [join $outputs ,] --phase [join $phases ,] \
    {*}[Jitter]] [list $input]]
}
