# Calls of the program that explain proposes, and what a primitive's own command needs for them.

package provide vorkel::explain_calls 1.1
package require vorkel::answer 1.1
package require vorkel::help 1.1

namespace eval ::vorkel::explain_calls {
  # The options that can make a difference, and what they change in a request.
  variable choices {
    TSYN {--int-div0 {intDiv0 1} --prefer-max-vco {preferMaxVco 1}
      {--bandwidth LOW} {bandwidth LOW}}
    PLL {--prefer-max-vco {preferMaxVco 1} {--bandwidth LOW} {bandwidth LOW}}
    KRU_SP {--feedback {feedback 1}}
    KRU_CLKGEN {}
  }
}

# A primitive that plan finds an answer of, with the fewest options that its own command needs for
# one within all tolerances, such as "TSYN --int-div0". The search of plan has ways that no option
# of the command stands for; these are "by plan".
proc ::vorkel::explain_calls::label {request primitive} {
  variable choices
  set usable {}
  foreach {option change} [dict get $choices $primitive] {
    lassign $change key value
    if {[dict get $request $key] eq $value ||
        ($key eq "bandwidth" && [dict get $request bandwidthAsked]) ||
        ($key eq "preferMaxVco" && ![::vorkel::answer::isShapeAsked $request])} continue
    lappend usable [list $option $change]
  }
  foreach some [Subsets $usable] {
    set changes [concat {*}[lmap pair $some {lindex $pair 1}]]
    if {[dict get [::vorkel::answer::solve $request $primitive $changes] within]} {
      return [join [list $primitive {*}[lmap pair $some {lindex $pair 0}]]]
    }
  }
  return "$primitive by plan"
}

# A label in a sentence.
proc ::vorkel::explain_calls::told {label} {
  return "the [regsub { --} $label { with --}]"
}

# All subsets of a list, the smallest first.
proc ::vorkel::explain_calls::Subsets {list} {
  set all {{}}
  foreach element $list {
    foreach some $all {
      lappend all [list {*}$some $element]
    }
  }
  return [lsort -command {apply {{one other} {
    expr {[llength $one] - [llength $other]}
  }}} $all]
}

# The call of a command with other outputs than those of the words: their frequencies as texts, and
# the outputs of the changed request for the rest of it.
proc ::vorkel::explain_calls::command {name call outputs texts} {
  set before [dict get $call request outputs]
  set words [dict get $call words]
  set changes [dict create --out [join $texts ,]]
  # Other frequencies than those of a request file go without its phases and duty cycles.
  set filed [expr {[index $words --out] < 0}]
  foreach {key option} {phase --phase duty --duty} {
    set values [lmap output $outputs {dict get $output $key}]
    if {($filed || $values ne [lmap output $before {dict get $output $key}]) &&
        [::vorkel::answer::isAsked [dict get $call request] $key]} {
      dict set changes $option [join [lmap value $values {Plain $value}] ,]
    }
  }
  dict for {option value} $changes {
    set index [index $words $option]
    if {$index < 0} {
      lappend words $option $value
    } elseif {[lindex $words $index] eq $option} {
      lset words [expr {$index + 1}] $value
    } else {
      lset words $index $option=$value
    }
  }
  return [::vorkel::help::command $name $words]
}

# Where an option stands among words, -1 for nowhere.
proc ::vorkel::explain_calls::index {words option} {
  set index 0
  foreach word $words {
    if {$word eq $option || [string match $option=* $word]} {
      return $index
    }
    incr index
  }
  return -1
}

# A phase or a duty cycle, "-" for none.
proc ::vorkel::explain_calls::Plain {value} {
  if {$value eq ""} {
    return -
  }
  return [regsub {\.0$} [expr {double($value)}] {}]
}
