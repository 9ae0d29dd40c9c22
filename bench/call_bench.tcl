# What a method call costs from Tcl, against an empty command with the same words; against one
# that converts them as the method does; and against one that also converts an answer.
#
#   tclsh8.6 call_bench.tcl PACKAGE_FOLDER COMMAND_LIBRARY ?TABLE?
#
# PACKAGE_FOLDER has the package's pkgIndex.tcl, COMMAND_LIBRARY is that of empty_command.cpp, and
# TABLE the file that the summary goes to (standard output without it). The times are medians of
# rounds in which all that is compared takes its turn. Then, what handles cost.

namespace eval call_bench {
    variable rounds 41
    variable unrolled 20        ;# calls in the body of a loop, so that the loop does not count
    variable enough 0.002       ;# seconds that a loop works at least
    variable handles 20000      ;# made, to see what one costs
    variable goal 1.5           ;# times the empty command with its conversions, at most
    variable methods {
        {GetChosenVCO}
        {GetChosenDivN 1}
        {SetLowBandwidth true}
        {GetSpdKeyValue VCOCLK_FREQ_MIN}
    }
    variable solving {TSYNCalculateActualOutFreqs "200 100" 100 0 2 false false false}
}

# Makes a procedure of one argument, which calls `command` with `words` so many times `unrolled`.
proc call_bench::make_loop {name words unrolled} {
    set call "\$command $words\n"
    proc $name {command times} "
        for {set i 0} {\$i < \$times} {incr i} {
            [string repeat $call $unrolled]
        }
    "
}

# Seconds of one call.
proc call_bench::measure {loop command times unrolled} {
    set start [Bench::WorkedSeconds]
    $loop $command $times
    expr {([Bench::WorkedSeconds] - $start) / ($times * $unrolled)}
}

# How often a loop must run to work long enough.
proc call_bench::times_for {loop command} {
    variable enough
    set times 1
    while true {
        set start [Bench::WorkedSeconds]
        $loop $command $times
        if {[Bench::WorkedSeconds] - $start >= $enough} {return $times}
        set times [expr {$times * 2}]
    }
}

proc call_bench::median {values} {
    lindex [lsort -real $values] [expr {[llength $values] / 2}]
}

# Seconds of one call of each command with the same words, in the order of the commands.
proc call_bench::compare {words commands} {
    variable rounds
    variable unrolled
    make_loop loop $words $unrolled
    foreach command $commands {
        dict set times $command [times_for [namespace current]::loop $command]
    }
    for {set round 0} {$round < $rounds} {incr round} {
        foreach command $commands {
            dict lappend seconds $command [measure [namespace current]::loop $command \
                [dict get $times $command] $unrolled]
        }
        # The next round begins with another one.
        set commands [concat [lrange $commands 1 end] [lindex $commands 0]]
    }
    return $seconds
}

proc call_bench::row {handle words channel} {
    variable goal
    set method [lindex $words 0]
    set commands [list $handle ::Bench::Empty ::Bench::Words::$method ::Bench::Answer::$method]
    set seconds [compare $words $commands]
    foreach command $commands column {call empty converted answered} {
        set $column [median [dict get $seconds $command]]
    }
    if {$call <= $goal * $converted} {
        set verdict "reached"
    } elseif {$call <= $goal * $answered} {
        set verdict "reached with the answer"
    } else {
        set verdict "missed"
    }
    foreach column {call empty converted answered} {
        lappend times [format "%.0f ns" [expr {[set $column] * 1e9}]]
    }
    puts $channel [format "| %s | %s | %.2f | %.2f | %s |" $words [join $times " | "] \
        [expr {$call / $converted}] [expr {$call / $answered}] $verdict]
}

# A device, and a configuration that the accessors can tell about.
proc call_bench::new_handle {} {
    variable solving
    set handle [Ip::Vorkel::Init]
    $handle SetDevice vk40
    if {[$handle {*}$solving] ne "1"} {error "the device does not serve the request"}
    return $handle
}

# A new handle as a script begins with: it is made, takes a device and answers a first request.
proc call_bench::first_answer {} {
    new_handle
}

# Bytes of memory that the process has.
proc call_bench::memory {} {
    set status [open /proc/self/status]
    regexp {VmRSS:\s+(\d+) kB} [read $status] -> kilobytes
    close $status
    expr {$kilobytes * 1024}
}

# Seconds and bytes of one handle of `count` that `script` makes. Handles live as long as the
# process, so what they take adds up.
proc call_bench::of_a_handle {count script} {
    # A first one, for what is made once in a process.
    uplevel #0 $script
    set before [memory]
    set start [Bench::WorkedSeconds]
    for {set i 0} {$i < $count} {incr i} $script
    set seconds [expr {([Bench::WorkedSeconds] - $start) / $count}]
    list $seconds [expr {double([memory] - $before) / $count}]
}

# What handles cost: alone, and with a device and an answer.
proc call_bench::handles {channel} {
    variable handles
    puts $channel "\n| Handles | of one: time | memory |"
    puts $channel "|---|---:|---:|"
    foreach {name script} {
        "made" Ip::Vorkel::Init
        "made, with a device and a first answer" ::call_bench::first_answer
    } {
        lassign [of_a_handle $handles $script] seconds bytes
        puts $channel [format "| %d %s | %.1f us | %.1f kB |" $handles $name \
            [expr {$seconds * 1e6}] [expr {$bytes / 1024}]]
    }
}

# The method is nothing to be timed unless it answers.
proc call_bench::check {handle words} {
    if {[catch {$handle {*}$words} answer]} {error "$words: $answer"}
}

proc call_bench::main {package library {table ""}} {
    variable methods
    variable goal
    variable solving
    lappend ::auto_path $package
    package require Ip_vorkel
    load $library Bench
    set handle [new_handle]
    set channel [expr {$table eq "" ? "stdout" : [open $table w]}]
    puts $channel "| Call | Method | Empty command | with its words\
        | and its answer | Method / words | Method / words and answer | Goal: $goal |"
    puts $channel "|---|---:|---:|---:|---:|---:|---:|---|"
    foreach words $methods {
        check $handle $words
        row $handle $words $channel
    }
    check $handle $solving
    set seconds [compare $solving [list $handle ::Bench::Empty]]
    puts $channel [format \
        "\nOne call of %s from Tcl: %.2f us; an empty command: %.2f us." $solving \
        [expr {[median [dict get $seconds $handle]] * 1e6}] \
        [expr {[median [dict get $seconds ::Bench::Empty]] * 1e6}]]
    handles $channel
    if {$table ne ""} {close $channel}
}

if {$argc < 2 || $argc > 3} {
    puts stderr "usage: call_bench.tcl PACKAGE_FOLDER COMMAND_LIBRARY ?TABLE?"
    exit 2
}
call_bench::main {*}$argv
