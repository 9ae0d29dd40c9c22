# Requests from the options of the command line and from request files. A request is described
# in answer.tcl.

package provide vorkel::request 1.1
package require vorkel::catalogue 1.1
package require vorkel::command_options 1.1
package require vorkel::engine 1.1
package require vorkel::options 1.1
package require vorkel::units 1.1

namespace eval ::vorkel::request {
  # The settings of the loop bandwidth of a PLL or a TSYN.
  variable bandwidths {LOW HIGH OPTIMIZED}
  variable default_bandwidth OPTIMIZED
  variable default_tolerance 100
  variable formats {text json tcl sdc}
  # The commands for one primitive.
  variable commands {PLL pll TSYN tsyn KRU_SP kru KRU_CLKGEN clkgen}
}

# Reads the words of a command for all primitives: see request in options.tcl.
proc ::vorkel::request::read {words {table {}}} {
  set command $::vorkel::options::command
  if {$command eq ""} {
    set command plan
  }
  set call [Call [concat [::vorkel::command_options::shared $command] $table] $words]
  set given [dict get $call given]
  set primitive [primitive [::vorkel::options::get $given --primitive auto] \
    [Told $given --primitive]]
  set device [Device $given $primitive]
  set primitives [dict get $device primitives]
  if {$primitive ne "auto"} {
    set primitives [list $primitive]
  }
  return [Complete $call $device [dict create primitive $primitive primitives $primitives]]
}

# Reads the words of the command for a primitive, likewise. The request has one more key, trace,
# a switch.
proc ::vorkel::request::parse {primitive words} {
  variable commands
  set call [Call [::vorkel::command_options::shared [dict get $commands $primitive]] $words \
    $primitive]
  set given [dict get $call given]
  if {[dict exists $given --primitive]} {
    set place [Told $given --primitive]
    set asked [primitive [dict get $given --primitive] $place]
    if {$asked ni [list auto $primitive]} {
      throw [Fault $given --primitive] \
        "$place: the request is for a $asked, this command for a $primitive"
    }
  }
  set call [Complete $call [Device $given $primitive] \
    [dict create primitive $primitive primitives [list $primitive]]]
  dict set call request trace [dict exists $given --trace]
  return $call
}

# Reads words and request file and checks what can be checked without a device. With a
# primitive, what it cannot have is wrong usage; without one, it is for the answers to tell.
proc ::vorkel::request::Call {table words {primitive ""}} {
  variable formats
  set given [::vorkel::options::parse $table $words]
  ::vorkel::options::refuseOperands $given
  if {[dict exists $given --request]} {
    set given [WithFile $given]
  }
  set format [::vorkel::options::get $given --format text]
  if {$format ni $formats} {
    throw {VORKEL USAGE} "--format: \"[::vorkel::options::shown $format]\" must be\
      [::vorkel::options::enumerate $formats or]"
  }
  set file [::vorkel::options::get $given -o ""]
  if {$file eq "" && [dict exists $given -o]} {
    throw {VORKEL USAGE} "-o: the name of the file is empty"
  }
  set request [dict create inputs [Frequencies $given --in most_inputs $primitive] \
    outputs [Outputs $given $primitive] bandwidth [Bandwidth $given] \
    bandwidthAsked [expr {[dict exists $given --bandwidth] ||
      [dict exists $given --low-bandwidth]}] \
    inputJitter [::vorkel::units::value [::vorkel::options::get $given --input-jitter 0] \
      jitter --input-jitter] \
    tolerance [Tolerance $given] feedback [dict exists $given --feedback] \
    preferMaxVco [dict exists $given --prefer-max-vco] intDiv0 [dict exists $given --int-div0]]
  return [dict create request $request format $format file $file given $given \
    words [Pasted $table $given $words]]
}

# Words that ask the same when they are pasted into a shell: what standard input or a pipe has said
# is gone, and the options say it instead.
proc ::vorkel::request::Pasted {table given words} {
  if {![dict exists $given --request]} {
    return $words
  }
  set path [dict get $given --request]
  if {$path ne "-" && [file isfile [::vorkel::options::path $path]] &&
      ![regexp {^/(dev|proc)/} $path]} {
    return $words
  }
  set names [lmap {name placeholder description} $table {set name}]
  # The file may say what this command has no option for, and another has.
  lappend names {*}[lmap name [dict keys $given] {
    if {$name in [list operands places --request {*}$names]} continue
    set name
  }]
  set pasted {}
  foreach name $names {
    if {$name eq "--request" || ![dict exists $given $name]} continue
    lappend pasted $name
    if {![::vorkel::command_options::isFlag $name]} {
      # Values of a file are doubles here.
      lappend pasted [regsub -all {(^|,)(-?[0-9]+)\.0(?=,|$)} [dict get $given $name] {\1\2}]
    }
  }
  return $pasted
}

# How a complaint names an option: by the place in the request file when its value is from there.
proc ::vorkel::request::Told {given name} {
  if {[dict exists $given places $name]} {
    return [dict get $given places $name]
  }
  return $name
}

# What is thrown when the value of an option is wrong: that of a file says nothing of the words.
proc ::vorkel::request::Fault {given name} {
  return [expr {[dict exists $given places $name] ? {VORKEL USAGE FILE} : {VORKEL USAGE}}]
}

# Adds the device to what was read, and what else the caller knows.
proc ::vorkel::request::Complete {call device more} {
  dict set call request device [dict get $device part]
  dict set call request part [dict get $device part]
  dict set call request limits [Numbers [dict get $device limits]]
  dict set call request primitives [dict get $device primitives]
  return [dict merge $call $more]
}

# The options with those of the request file that they do not replace. Other outputs than those
# of the file have nothing to do with its phases and duty cycles.
proc ::vorkel::request::WithFile {given} {
  package require vorkel::request_file 1.1
  set file [::vorkel::request_file::read [dict get $given --request]]
  if {[dict exists $given --out]} {
    set file [dict remove $file --phase --duty]
  }
  foreach names {{--bandwidth --low-bandwidth} {--tolerance --exact}} {
    foreach name $names {
      if {[dict exists $given $name]} {
        set file [dict remove $file {*}$names]
      }
    }
  }
  set places [dict get $file places]
  foreach name [dict keys $given] {
    dict unset places $name
  }
  return [dict merge $file $given [dict create places $places]]
}

# Limits as doubles, so that arithmetic with them is that of real numbers; counts stay whole.
proc ::vorkel::request::Numbers {limits} {
  return [dict map {keyword value} $limits {
    expr {$keyword eq "O_MAX_HT_LT" ? int($value) : double($value)}
  }]
}

# The list of an option that must be there: 1 to as many frequencies as the primitive can have,
# or the most able one when it is not given.
proc ::vorkel::request::Frequencies {given name mostName primitive} {
  lassign [dict get {
    --in {{input frequency} inputs {--in 100}}
    --out {{output frequencies} outputs {--out 200,50}}
  } $name] what entry example
  if {![dict exists $given $name]} {
    set missing "$name is missing"
    if {[dict exists $given --request]} {
      set missing "[dict get $given --request] has no $entry, and $missing"
    }
    throw [expr {[dict exists $given --request] ? {VORKEL USAGE FILE} : {VORKEL USAGE}}] \
      "$missing: the $what, such as $example"
  }
  set list [::vorkel::units::values [dict get $given $name] frequency $name]
  set counts [set ::vorkel::engine::$mostName]
  set most [tcl::mathfunc::max {*}[dict values $counts]]
  set whose ""
  if {$primitive ne ""} {
    set most [dict get $counts $primitive]
    set whose " of a $primitive"
  }
  if {[llength $list] > $most} {
    set frequencies [expr {$most == 1 ? "frequency" : "frequencies"}]
    throw [Fault $given $name] "[Told $given $name]: at most $most $frequencies$whose,\
      not [llength $list]"
  }
  return $list
}

proc ::vorkel::request::Outputs {given primitive} {
  set frequencies [Frequencies $given --out most_outputs $primitive]
  set count [llength $frequencies]
  set phases [PerOutput $given --phase phase $count]
  set duties [PerOutput $given --duty duty $count]
  return [lmap frequency $frequencies phase $phases duty $duties {
    # No divider makes a clock without an edge; the engine takes 0 for nothing.
    dict create freq $frequency phase $phase duty [expr {$duty eq "" || $duty == 0 ? "" : $duty}]
  }]
}

# The list of an option with one entry for each output; nothing for all when it is not given.
proc ::vorkel::request::PerOutput {given name kind count} {
  if {![dict exists $given $name]} {
    return [lrepeat $count ""]
  }
  set list [::vorkel::units::values [dict get $given $name] $kind $name 1]
  if {[llength $list] != $count} {
    throw {VORKEL USAGE} "$name: [llength $list] in the list, but there\
      [expr {$count == 1 ? "is 1 output" : "are $count outputs"}]"
  }
  return $list
}

proc ::vorkel::request::Bandwidth {given} {
  variable default_bandwidth
  set low [dict exists $given --low-bandwidth]
  set bandwidth [bandwidth [::vorkel::options::get $given --bandwidth \
    [expr {$low ? "LOW" : $default_bandwidth}]] [Told $given --bandwidth]]
  if {$low && $bandwidth ne "LOW"} {
    throw {VORKEL USAGE} "--low-bandwidth and --bandwidth $bandwidth contradict each other"
  }
  return $bandwidth
}

# A bandwidth by its name, in any case. `what` names it in a complaint.
proc ::vorkel::request::bandwidth {name what} {
  variable bandwidths
  if {[string toupper $name] ni $bandwidths} {
    throw {VORKEL USAGE} "$what: \"[::vorkel::options::shown $name]\" must be\
      [::vorkel::options::enumerate $bandwidths or]"
  }
  return [string toupper $name]
}

proc ::vorkel::request::Tolerance {given} {
  variable default_tolerance
  set exact [dict exists $given --exact]
  set tolerance [::vorkel::units::value [::vorkel::options::get $given --tolerance \
    [expr {$exact ? 0 : $default_tolerance}]] tolerance --tolerance]
  if {$exact && $tolerance != 0} {
    if {[dict exists $given places --exact]} {
      throw {VORKEL USAGE FILE} "[Told $given --exact] contradicts the tolerance"
    }
    throw {VORKEL USAGE} "--exact and --tolerance [dict get $given --tolerance] contradict each\
      other"
  }
  return $tolerance
}

# A primitive by its name, in any case, or auto. `what` names it in a complaint.
proc ::vorkel::request::primitive {name what} {
  set known [dict keys $::vorkel::engine::most_outputs]
  if {[string tolower $name] eq "auto"} {
    return auto
  }
  if {[string toupper $name] ni $known} {
    throw {VORKEL USAGE} "$what: \"[::vorkel::options::shown $name]\" must be\
      [::vorkel::options::enumerate [concat auto $known] or]"
  }
  return [string toupper $name]
}

# The device that is asked for, which must have the primitive.
proc ::vorkel::request::Device {given primitive} {
  set place [Told $given --device]
  # Without a file the complaints name the device; that is enough.
  set label [expr {$place eq "--device" ? "" : "$place: "}]
  try {
    set device [::vorkel::catalogue::find \
      [::vorkel::options::get $given --device $::vorkel::catalogue::defaultPart]]
  } trap {VORKEL USAGE} {reason options} {
    throw [expr {$label eq "" ? [dict get $options -errorcode] : {VORKEL USAGE FILE}}] $label$reason
  }
  set primitives [dict get $device primitives]
  if {$primitive ne "auto" && $primitive ni $primitives} {
    throw [Fault $given --device] "$label[dict get $device part] has no $primitive; it has\
      [join $primitives {, }]"
  }
  if {[llength $primitives] == 0} {
    throw [Fault $given --device] "$label[dict get $device part] has the limits of no primitive"
  }
  return $device
}
