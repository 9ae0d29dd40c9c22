# Requests from the options of the command line and from request files. A request is described
# in answer.tcl.

package provide vorkel::request 1.1
package require vorkel::catalogue 1.1
package require vorkel::engine 1.1
package require vorkel::numbers 1.1
package require vorkel::options 1.1
package require vorkel::units 1.1

namespace eval ::vorkel::request {
  # The settings of the loop bandwidth of a PLL or a TSYN.
  variable bandwidths {LOW HIGH OPTIMIZED}
  variable default_bandwidth OPTIMIZED
  variable default_tolerance 100
  variable formats {text json tcl sdc}
  # All options of a request (see options.tcl).
  variable options {
    --in F[,F2]       "input frequency; F2 is that of a second input clock"
    --out LIST        "frequencies of 1 to 7 outputs"
    --phase LIST      "phase of each output, - where any will do"
    --duty LIST       "duty cycle of each output, - or 0 where any will do"
    --device NAME     "part name: DEVICE\[PACKAGE]\[-GRADE], or its beginning"
    --primitive NAME  "PLL, TSYN, KRU_SP, KRU_CLKGEN or auto (default)"
    --bandwidth NAME  "of the loop: LOW, HIGH or OPTIMIZED"
    --low-bandwidth   ""  "short for --bandwidth LOW"
    --prefer-max-vco  ""  "take the highest VCO"
    --int-div0        ""  "a whole divider for output 0 of a TSYN"
    --feedback        ""  "the feedback of a KRU_SP is connected"
    --input-jitter PS "peak-to-peak jitter of the input clock, 0 by default"
    --tolerance PPM   "how far a frequency may be off, 100 by default"
    --exact           ""  "short for --tolerance 0"
    --request FILE    "take from a file what no option says"
    --format NAME     "text (default), json, tcl or sdc"
    -o FILE           "write to a file instead of standard output"
  }
  # The options of the commands for one primitive, and what some of them say there.
  variable loop_options {--in --out --phase --duty --device --bandwidth --low-bandwidth
    --prefer-max-vco --int-div0 --input-jitter --tolerance --exact --request --format -o --trace}
  variable kru_options {--in --out --phase --device --feedback --bandwidth --input-jitter
    --tolerance --exact --request --format -o --trace}
  variable loop_texts {
    --bandwidth       NAME "LOW (lower limit for the PFD), HIGH or OPTIMIZED (default)"
    --prefer-max-vco  ""   "with --phase or --duty: take the highest VCO"
    --trace           ""   "print the steps of the search first"
  }
  variable kru_texts {
    --in              F    "input frequency"
    --out             LIST "frequencies of 1 to 6 outputs"
    --feedback        ""   "kru: use the feedback, without which it has only CLKFX pins"
    --bandwidth       NAME "accepted, but a KRU has no such setting"
    --trace           ""   "print the steps of the search first"
  }
}

# The options of the command for a primitive.
proc ::vorkel::request::optionsOf {primitive} {
  variable options
  set family [string tolower [::vorkel::engine::family $primitive]]
  variable ${family}_options
  variable ${family}_texts
  set texts [dict create]
  foreach {name placeholder description} [concat $options [set ${family}_texts]] {
    dict set texts $name [list $placeholder $description]
  }
  set table {}
  foreach name [set ${family}_options] {
    if {$name ne "--feedback" || $primitive eq "KRU_SP"} {
      lappend table $name {*}[dict get $texts $name]
    }
  }
  return $table
}

# Reads the words of a command for all primitives: see request in options.tcl.
proc ::vorkel::request::read {words {table {}}} {
  variable options
  set call [Call [concat $options $table] $words]
  set primitive [Primitive [dict get $call given]]
  set device [Device [dict get $call given] $primitive]
  set primitives [dict get $device primitives]
  if {$primitive ne "auto"} {
    set primitives [list $primitive]
  }
  return [Complete $call $device [dict create primitive $primitive primitives $primitives]]
}

# Reads the words of the command for a primitive, likewise. The request has one more key, trace,
# a switch.
proc ::vorkel::request::parse {primitive words} {
  set call [Call [optionsOf $primitive] $words $primitive]
  set given [dict get $call given]
  if {[dict exists $given --primitive] && [Primitive $given] ni [list auto $primitive]} {
    throw {VORKEL USAGE} "the request is for a [Primitive $given], this command for a $primitive"
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
    throw {VORKEL USAGE} "--format: \"$format\" must be text, json, tcl or sdc"
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
  return [dict create request $request format $format file $file given $given words $words]
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
  return [dict merge $file $given]
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
  set what [dict get {--in {input frequency} --out {output frequencies}} $name]
  if {![dict exists $given $name]} {
    throw {VORKEL USAGE} "$name is missing: the $what, such as\
      [dict get {--in {--in 100} --out {--out 200,50}} $name]"
  }
  set list [::vorkel::units::values [dict get $given $name] frequency $name]
  set counts [set ::vorkel::engine::$mostName]
  set most [tcl::mathfunc::max {*}[dict values $counts]]
  if {$primitive ne ""} {
    set most [dict get $counts $primitive]
  }
  if {[llength $list] > $most} {
    set frequencies [expr {$most == 1 ? "frequency" : "frequencies"}]
    throw {VORKEL USAGE} "$name: at most $most $frequencies, not [llength $list]"
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
    throw {VORKEL USAGE} "$name: [llength $list] in the list, but --out has $count"
  }
  return $list
}

proc ::vorkel::request::Bandwidth {given} {
  variable bandwidths
  variable default_bandwidth
  set low [dict exists $given --low-bandwidth]
  set bandwidth [::vorkel::options::get $given --bandwidth \
    [expr {$low ? "LOW" : $default_bandwidth}]]
  if {$bandwidth ni $bandwidths} {
    throw {VORKEL USAGE} "--bandwidth: \"$bandwidth\" must be LOW, HIGH or OPTIMIZED"
  }
  if {$low && $bandwidth ne "LOW"} {
    throw {VORKEL USAGE} "--low-bandwidth and --bandwidth $bandwidth contradict each other"
  }
  return $bandwidth
}

proc ::vorkel::request::Tolerance {given} {
  variable default_tolerance
  set exact [dict exists $given --exact]
  set tolerance [::vorkel::units::value [::vorkel::options::get $given --tolerance \
    [expr {$exact ? 0 : $default_tolerance}]] tolerance --tolerance]
  if {$exact && $tolerance != 0} {
    throw {VORKEL USAGE} "--exact and --tolerance [dict get $given --tolerance] contradict each\
      other"
  }
  return $tolerance
}

# The primitive of --primitive, in any case.
proc ::vorkel::request::Primitive {given} {
  set name [::vorkel::options::get $given --primitive auto]
  set known [dict keys $::vorkel::engine::most_outputs]
  if {[string tolower $name] eq "auto"} {
    return auto
  }
  if {[string toupper $name] ni $known} {
    throw {VORKEL USAGE} "--primitive: \"$name\" must be auto, [join [lrange $known 0 end-1] {, }]\
      or [lindex $known end]"
  }
  return [string toupper $name]
}

# The device that is asked for, which must have the primitive.
proc ::vorkel::request::Device {given primitive} {
  set device [::vorkel::catalogue::find \
    [::vorkel::options::get $given --device $::vorkel::catalogue::defaultPart]]
  set primitives [dict get $device primitives]
  if {$primitive ne "auto" && $primitive ni $primitives} {
    throw {VORKEL USAGE} "[dict get $device part] has no $primitive; it has [join $primitives {, }]"
  }
  if {[llength $primitives] == 0} {
    throw {VORKEL USAGE} "[dict get $device part] has the limits of no primitive"
  }
  return $device
}
