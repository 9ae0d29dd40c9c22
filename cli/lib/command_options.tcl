# Which options each command takes, and what its help says of them. What stands here is what the
# commands accept, what their help lists and what bash completes.

package provide vorkel::command_options 1.1

namespace eval ::vorkel::command_options {
  variable groups {
    any     {plan compare best explain tsyn pll kru clkgen}
    asking  {plan compare explain}
    finding {plan compare best explain}
    loops   {plan compare best explain tsyn pll}
    loop    {tsyn pll}
    krus    {kru clkgen}
    single  {tsyn pll kru clkgen}
    written {plan best tsyn pll kru clkgen}
  }
  # For each option its name, the placeholder of its value ("" for a flag), the commands that take
  # it, which are names of groups or commands, and a description. Where the value is one of
  # several words, the description begins with them, up to a semicolon; the completion relies on
  # it. An option that commands describe differently has several entries.
  variable table {
    --in F[,F2] loops
      "input frequency; F2 is that of a second input clock, with which all must stay in range;\
      errors are for the first"
    --in F krus "input frequency"
    --out LIST loops "frequencies of 1 to 7 outputs"
    --out LIST krus "frequencies of 1 to 6 outputs"
    --phase LIST any "phase of each output; - where any will do"
    --duty LIST loops "duty cycle of each output; - or 0 where any will do"
    --device NAME any "DEVICE\[PACKAGE]\[-GRADE] or its beginning; %DEVICE% by default"
    --primitive NAME asking "auto (default), PLL, TSYN, KRU_SP or KRU_CLKGEN"
    --primitive NAME best "auto (default), PLL or TSYN"
    --bandwidth NAME finding "LOW, HIGH or OPTIMIZED; of the loop, all by default"
    --bandwidth NAME loop "LOW (lower limit for the PFD), HIGH or OPTIMIZED (default)"
    --low-bandwidth "" loops "short for --bandwidth LOW"
    --prefer-max-vco "" {plan explain}
      "of PLL and TSYN only the variants that look for the largest VCO"
    --prefer-max-vco "" compare
      "of PLL and TSYN only the variants that look for the largest VCO, and on the grid the highest\
      VCO before the least jitter"
    --prefer-max-vco "" best "the highest VCO comes before the least jitter"
    --prefer-max-vco "" loop "with --phase or --duty: take the highest VCO"
    --int-div0 "" {plan explain} "a whole divider for output 0 of a TSYN"
    --int-div0 "" {compare best} "of a TSYN only whole M and whole dividers"
    --int-div0 "" tsyn "a whole divider for output 0"
    --feedback "" asking "a KRU_SP only with its feedback connected; both by default"
    --feedback "" kru "use the feedback, without which there are only CLKFX pins"
    --input-jitter PS any "peak-to-peak jitter of the input clock, 0 by default"
    --tolerance PPM any "how far a frequency may be off, 100 by default"
    --exact "" any "short for --tolerance 0"
    --request FILE any "take from a file what no option says; - is standard input"
    --format NAME written "text (default), json, tcl or sdc"
    --format NAME compare "text (default), json or tcl"
    -o FILE any "write to a file; - is standard output"
    --trace "" single "print first what the engine itself tells of its search, a line\
      for each step; text format only"
  }
  # Why some commands have no use for an option, and what to do.
  variable reasons {
    --duty {krus "a KRU has no choice of its duty cycles; leave --duty out"}
    --bandwidth {krus "a KRU has no loop; leave --bandwidth out"}
    --low-bandwidth {krus "a KRU has no loop; leave --low-bandwidth out"}
    --prefer-max-vco {krus "a KRU has no VCO; leave --prefer-max-vco out"}
    --int-div0 {
      pll "all dividers of a PLL are whole; leave --int-div0 out"
      krus "a KRU has no such divider; leave --int-div0 out"
    }
    --feedback {
      loop "only a KRU_SP has a feedback to connect"
      best "only a KRU_SP has a feedback to connect, and best searches PLL and TSYN"
      clkgen "only a KRU_SP has a feedback to connect"
    }
    --primitive {single "the command itself names the primitive"}
    --format {explain "explain writes text only"}
    --trace {finding "a trace is of one search; take the command of a primitive"}
  }
}

# The options of a command, flat: name, placeholder and description of each.
proc ::vorkel::command_options::of {command} {
  return [concat [shared $command] [Own $command]]
}

# Those of them that the table has; the others are the command's own.
proc ::vorkel::command_options::shared {command} {
  variable table
  set options {}
  foreach {name placeholder takers description} $table {
    if {$command in [Commands $takers]} {
      lappend options $name $placeholder [Filled $description]
    }
  }
  return $options
}

# The commands that take an option, in the order of the help.
proc ::vorkel::command_options::takers {option} {
  variable groups
  return [lmap command [dict get $groups any] {
    if {![Takes $command $option]} continue
    set command
  }]
}

# Why a command does not take an option that others take: a sentence, or "".
proc ::vorkel::command_options::reason {command option} {
  variable reasons
  if {[dict exists $reasons $option]} {
    dict for {commands reason} [dict get $reasons $option] {
      if {$command in [Commands $commands]} {
        return $reason
      }
    }
  }
  return ""
}

# Whether an option has no value.
proc ::vorkel::command_options::isFlag {option} {
  return [expr {[lindex [Entry $option] 1] eq ""}]
}

# The words of a call that another command takes, too: without the options that it does not have,
# and without those that say where the output goes and what it looks like.
proc ::vorkel::command_options::kept {command words} {
  set kept {}
  while {[llength $words] > 0} {
    set words [lassign $words word]
    set name [regsub {^(--[^=]*)=.*$} $word {\1}]
    set value {}
    if {$name eq $word && [string match -* $name] && ![isFlag $name]} {
      set words [lassign $words value]
      set value [list $value]
    }
    if {[string match -* $name] &&
        (![Takes $command $name] || $name in {--format -o --trace})} continue
    lappend kept $word {*}$value
  }
  return $kept
}

# The commands that a list of groups and commands means.
proc ::vorkel::command_options::Commands {takers} {
  variable groups
  return [concat {*}[lmap taker $takers {
    expr {[dict exists $groups $taker] ? [dict get $groups $taker] : $taker}
  }]]
}

proc ::vorkel::command_options::Takes {command option} {
  variable table
  set found 0
  foreach {name placeholder takers description} $table {
    if {$name ne $option} continue
    set found 1
    if {$command in [Commands $takers]} {
      return 1
    }
  }
  return [expr {!$found && $option in [Names [Own $command]]}]
}

# Name, placeholder and description of an option of some command, or nothing.
proc ::vorkel::command_options::Entry {option} {
  variable table
  foreach {name placeholder takers description} $table {
    if {$name eq $option} {
      return [list $name $placeholder $description]
    }
  }
  foreach {name placeholder description} [concat [Own best] [Own explain]] {
    if {$name eq $option} {
      return [list $name $placeholder $description]
    }
  }
  return {}
}

proc ::vorkel::command_options::Names {options} {
  return [lmap {name placeholder description} $options {set name}]
}

# The options that a command keeps in its own package.
proc ::vorkel::command_options::Own {command} {
  if {$command ni {best explain}} {
    return {}
  }
  package require vorkel::$command 1.1
  return [set ::vorkel::${command}::options]
}

# A description with the default device in it.
proc ::vorkel::command_options::Filled {description} {
  package require vorkel::catalogue 1.1
  return [string map [list %DEVICE% $::vorkel::catalogue::defaultPart] $description]
}
