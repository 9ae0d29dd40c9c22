# What the tests of the package vorkel share: the package, and what a call says when it fails.

package require tcltest 2.5
namespace import -force ::tcltest::test

# Both packages stand beside each other.
set engineDir [file normalize $env(VORKEL_PACKAGE_DIR)]
set plannerDir [file join [file dirname $engineDir] vorkel1.1]
lappend auto_path $plannerDir $engineDir
unset -nocomplain env(VORKEL_DEVICES)
package require vorkel

# A device of its own in a folder of its own, gone when the process ends.
proc newFolder {} {
    close [file tempfile path]
    file delete $path
    file mkdir $path
    lappend ::folders $path
    return $path
}
set folders {}
rename exit exitAndKeepFolders
proc exit {{code 0}} {
    file delete -force -- {*}$::folders
    exitAndKeepFolders $code
}

proc writeFile {path text} {
    set channel [open $path w]
    puts -nonewline $channel $text
    close $channel
    return $path
}

# The sentence of a call that fails, and its errorCode without the mistakes.
proc failure {args} {
    if {![catch {uplevel 1 $args} message options]} {
        return "no error"
    }
    return [list $message [lrange [dict get $options -errorcode] 0 1]]
}

# The mistakes of a call that fails, some entries of each.
proc mistakes {entries args} {
    catch {uplevel 1 $args} message options
    set all {}
    foreach mistake [lindex [dict get $options -errorcode] 2] {
        set one {}
        foreach entry $entries {
            lappend one [dict get $mistake $entry]
        }
        lappend all $one
    }
    return $all
}

# One entry of the first answer.
proc first {plan args} {
    return [dict get [lindex [dict get $plan answers] 0] {*}$args]
}
