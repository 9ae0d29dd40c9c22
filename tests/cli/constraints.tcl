# An interpreter of the timing constraints that the planner writes: it has the commands of SDC as
# a timing tool has them, and works out what clocks they make.

namespace eval ::constraints {
  # From name to a dict: period, edges (rise, fall and next rise, ns), uncertainty, object; of a
  # generated one also description, the options that describe it, in alphabetical order.
  variable clocks {}
  variable groups {}
  # From name to name: the uncertainty of paths between two clocks.
  variable between {}
}

# The clocks of a file, with every name of a port and pin that it mentions. Only commands of SDC
# and `set` can be used in it.
proc ::constraints::evaluate {text} {
  variable clocks {}
  variable groups {}
  variable between {}
  set interp [interp create -safe]
  try {
    foreach command [$interp eval {info commands}] {
      if {$command ni {set rename}} {
        $interp hide $command
      }
    }
    $interp hide rename
    foreach command {create_clock create_generated_clock set_clock_uncertainty set_clock_groups} {
      $interp alias $command ::constraints::$command
    }
    foreach command {get_ports get_pins get_clocks} {
      $interp alias $command ::constraints::Get $command
    }
    $interp eval $text
  } finally {
    interp delete $interp
  }
  return $clocks
}

proc ::constraints::Get {command names} {
  variable clocks
  if {$command eq "get_clocks"} {
    foreach name $names {
      if {![dict exists $clocks $name]} {
        error "there is no clock $name"
      }
    }
    return $names
  }
  return [list $command $names]
}

# The options of a command, those in `flags` without values, and its other words under "".
proc ::constraints::Options {words known flags} {
  set given {"" {}}
  while {[llength $words] > 0} {
    set words [lassign $words word]
    if {$word in $flags} {
      dict set given $word 1
    } elseif {$word in $known} {
      set words [lassign $words value]
      dict lappend given $word $value
    } elseif {[string match -* $word]} {
      error "there is no option $word"
    } else {
      dict lappend given "" $word
    }
  }
  return $given
}

proc ::constraints::Add {name clock} {
  variable clocks
  if {[dict exists $clocks $name]} {
    error "the clock $name is there already"
  }
  dict set clocks $name $clock
}

proc ::constraints::create_clock {args} {
  set given [Options $args {-name -period} {}]
  set period [lindex [dict get $given -period] 0]
  Add [lindex [dict get $given -name] 0] [dict create period $period \
    edges [list 0.0 [expr {$period / 2.0}] $period] object [lindex [dict get $given ""] 0]]
}

proc ::constraints::create_generated_clock {args} {
  variable clocks
  set given [Options $args {-name -source -master_clock -multiply_by -divide_by -duty_cycle -edges
    -edge_shift} -add]
  set object [lindex [dict get $given ""] 0]
  set master [dict get $clocks [lindex [dict get $given -master_clock] 0]]
  if {[dict get $master object] ne [lindex [dict get $given -source] 0]} {
    error "the master clock is not at the source"
  }
  dict for {name clock} $clocks {
    if {[dict get $clock object] eq $object && ![dict exists $given -add]} {
      error "$name is at $object already"
    }
  }
  set description [lmap option [lsort [dict keys $given]] {
    if {$option ni {-multiply_by -divide_by -duty_cycle -edges -edge_shift}} continue
    set option
  }]
  set source [dict get $master period]
  switch -- $description {
    -divide_by - -multiply_by - {-duty_cycle -multiply_by} {
      set factor [lindex [dict get $given [lindex $description end]] 0]
      if {![regexp {^[1-9][0-9]*$} $factor]} {
        error "[lindex $description end] is no whole number"
      }
      set period [expr {[lindex $description end] eq "-divide_by" ? $source * $factor :
        $source / $factor}]
      set duty [expr {[dict exists $given -duty_cycle] ?
        [lindex [dict get $given -duty_cycle] 0] : 50}]
      set edges [list 0.0 [expr {$period * $duty / 100.0}] $period]
    }
    {-edge_shift -edges} {
      set edges {}
      set last 0
      foreach edge [lindex [dict get $given -edges] 0] \
          shift [lindex [dict get $given -edge_shift] 0] {
        if {$edge < max(1, $last)} {
          error "edges are in order, from 1 on"
        }
        set last $edge
        lappend edges [expr {($edge - 1) * $source / 2.0 + $shift}]
      }
      if {[llength $edges] != 3 || [lsort -real -unique $edges] ne $edges} {
        error "a clock rises, falls and rises, each time later: $edges"
      }
      set period [expr {[lindex $edges 2] - [lindex $edges 0]}]
    }
    default {
      error "a clock is not described by [join $description {, }]"
    }
  }
  Add [lindex [dict get $given -name] 0] [dict create period $period edges $edges object $object \
    description $description]
}

# Of a clock, or of all paths from some clocks to others.
proc ::constraints::set_clock_uncertainty {args} {
  variable clocks
  variable between
  set given [Options $args {-from -to} {}]
  set names [lassign [dict get $given ""] value]
  if {[dict exists $given -from] != [dict exists $given -to] ||
      [dict exists $given -from] != ($names eq "")} {
    error "an uncertainty is of a clock, or from one to another"
  }
  foreach name [concat {*}$names] {
    dict set clocks $name uncertainty $value
  }
  if {$names eq ""} {
    foreach from [lindex [dict get $given -from] 0] {
      foreach to [lindex [dict get $given -to] 0] {
        dict set between $from $to $value
      }
    }
  }
}

proc ::constraints::set_clock_groups {args} {
  variable groups
  set groups [dict get [Options $args -group -physically_exclusive] -group]
}
