# What the tests of the package share: the package itself, devices with limits that a test
# chooses, and other processes to watch what goes to standard output and standard error.

package require tcltest 2.5
namespace import -force ::tcltest::test

set packageDir [file normalize $env(VORKEL_PACKAGE_DIR)]

# --- Folders ------------------------------------------------------------------------------

set folders {}

# A new empty folder, removed when the process ends.
proc newFolder {} {
    close [file tempfile path [file join [temporaryRoot] vorkel]]
    file delete $path
    file mkdir $path
    lappend ::folders $path
    return $path
}

proc temporaryRoot {} {
    return [expr {[info exists ::env(TMPDIR)] ? $::env(TMPDIR) : "/tmp"}]
}

rename exit exitAndKeepFolders
proc exit {{code 0}} {
    foreach folder $::folders {
        file delete -force -- $folder
    }
    exitAndKeepFolders $code
}

proc writeFile {path text} {
    set channel [open $path w]
    fconfigure $channel -encoding utf-8 -translation lf
    puts -nonewline $channel $text
    close $channel
}

proc readFile {path} {
    set channel [open $path rb]
    set text [read $channel]
    close $channel
    return $text
}

# --- Devices ------------------------------------------------------------------------------

# A folder in which VORKEL_DEVICES finds the devices of a test.
set deviceFolder [newFolder]
set env(VORKEL_DEVICES) $deviceFolder

# Round limits, each of which the engine reads back exactly.
set pllLimits {
    VCOCLK_FREQ_MIN 400 VCOCLK_FREQ_MAX 1000
    CLKOUT_FREQ_MIN_GCLK 5 CLKOUT_FREQ_MAX_GCLK 400
    CLKPFD_FREQ_MIN 20 CLKPFD_FREQ_MAX 500
    CLKOUT_FREQ_MAX_IOCLK 1000 O_MAX_HT_LT 64
}
set tsynLimits {
    TSYN_VCOCLK_FREQ_MIN 600 TSYN_VCOCLK_FREQ_MAX 1200
    TSYN_CLKOUT_FREQ_MIN 5 TSYN_CLKOUT_FREQ_MAX 800
    TSYN_CLKPFD_FREQ_MIN 10 TSYN_CLKPFD_FREQ_MAX 500
    TSYN_VCOCLK_FREQ_TARGET 1000 TSYN_CLKPFD_FREQ_MAX_LBW 80
    O_MAX_HT_LT 64
}

# Writes the file of a device with packages p1 and p2 and the speed grades of a dictionary
# grade -> keyword -> number; the first grade is the default.
proc writeDevice {name grades {folder ""}} {
    if {$folder eq ""} {
        set folder $::deviceFolder
    }
    set lines [list "device = \"$name\"" {packages = ["p1", "p2"]} {default_package = "p1"} \
        "default_grade = \"[lindex $grades 0]\""]
    dict for {grade limits} $grades {
        lappend lines "\[grade.$grade\]"
        dict for {keyword number} $limits {
            lappend lines "$keyword = $number"
        }
    }
    writeFile [file join $folder $name.toml] [join $lines \n]\n
}

# --- Handles ------------------------------------------------------------------------------

proc requirePackage {} {
    if {$::packageDir ni $::auto_path} {
        lappend ::auto_path $::packageDir
    }
    package require Ip_vorkel
}

# A new handle with a device selected.
proc newHandle {{part ""}} {
    set handle [Ip::Vorkel::Init]
    $handle SetDevice $part
    return $handle
}

# The status and the result of a script, as a list.
proc outcome {script} {
    set status [catch {uplevel 1 $script} result]
    return [list $status $result]
}

# What every accessor of the chosen configuration answers, outputs 0 to count - 1.
proc chosen {handle count} {
    set answer {}
    foreach {key method} {
        vco GetChosenVCO m GetChosenM mint GetChosenMInt d GetChosenD
        div0 GetChosenDiv0 div0int GetChosenDiv0Int
    } {
        lappend answer $key [$handle $method]
    }
    foreach {key method} {
        divn GetChosenDivN freq GetChosenOutFreqN phase GetChosenPhaseN duty GetChosenDutyCycleN
    } {
        set values {}
        for {set n 0} {$n < $count} {incr n} {
            lappend values [$handle $method $n]
        }
        lappend answer $key $values
    }
    return $answer
}

# The same for given values: vco m d div0 and then for each output {divn freq phase duty}.
# Whole numbers are those of m and div0 without their fraction.
proc chosenIs {vco m d div0 args} {
    lassign {} divns freqs phases duties
    foreach output $args {
        lassign $output divn freq phase duty
        lappend divns $divn
        lappend freqs $freq
        lappend phases $phase
        lappend duties $duty
    }
    return [list vco $vco m $m mint [lindex [split $m .] 0] d $d div0 $div0 \
        div0int [lindex [split $div0 .] 0] \
        divn $divns freq $freqs phase $phases duty $duties]
}

# What all accessors answer when nothing is chosen.
proc nothingChosen {count} {
    return [chosenIs 0.000 0.000 0 0.000 {*}[lrepeat $count {0 0.000 0.000 0.000}]]
}

# --- Other processes ----------------------------------------------------------------------

# What a child process begins with: the package, loaded.
set requireScript [string cat \
    [list lappend auto_path $packageDir] "\n" {package require Ip_vorkel} "\n"]

# Runs a script in a tclsh of its own. Returns a dictionary: status is the exit status, or
# the signal that ended it; out and err are what it wrote, byte for byte.
# Options: -load 0 does not load the package first; -cd FOLDER runs it there; -pipe 1 sends
# its standard output through a pipe and not to a file; -env DICT adds to its environment.
proc child {script args} {
    set options [dict merge {-load 1 -cd "" -pipe 0 -env {}} $args]
    set folder [newFolder]
    set file [file join $folder script.tcl]
    writeFile $file [string cat [expr {[dict get $options -load] ? $::requireScript : ""}] $script]
    set out [file join $folder out]
    set err [file join $folder err]
    set command [list [info nameofexecutable] $file]
    if {[dict get $options -pipe]} {
        lappend command | cat
    }
    set was [array get ::env]
    array set ::env [dict get $options -env]
    set cwd [pwd]
    if {[dict get $options -cd] ne ""} {
        cd [dict get $options -cd]
    }
    set failed [catch {exec {*}$command >$out 2>$err </dev/null} message details]
    cd $cwd
    foreach name [dict keys [dict get $options -env]] {
        unset ::env($name)
    }
    array set ::env $was
    set status 0
    if {$failed} {
        set code [dict get $details -errorcode]
        if {[lindex $code 0] in {CHILDSTATUS CHILDKILLED}} {
            set status [lindex $code 2]
        } else {
            set status $message
        }
    }
    return [dict create status $status out [readFile $out] err [readFile $err]]
}
