# A bar that shows on a terminal how far long work has come. It stands on standard error and is
# gone when the work is done; where that is no terminal there is none.

package provide vorkel::progress 1.1
package require vorkel::colour 1.1

namespace eval ::vorkel::progress {
  # Work that is done sooner than this shows no bar, and a bar moves at such intervals, ms.
  variable patience 300
  variable interval 50
  variable width 40
  variable state {shown 0 active 0}
}

# Begins the work of `total` steps.
proc ::vorkel::progress::start {total label} {
  variable state
  variable patience
  set dumb [expr {![info exists ::env(TERM)] || $::env(TERM) in {"" dumb}}]
  set state [dict create total [expr {max(1, $total)}] label $label done 0 shown 0 \
    active [expr {!$dumb && [::vorkel::colour::isTerminal stderr]}] \
    next [expr {[clock milliseconds] + $patience}]]
}

# So many more steps are done.
proc ::vorkel::progress::step {{count 1}} {
  variable state
  variable interval
  if {![dict get $state active]} return
  dict incr state done $count
  set now [clock milliseconds]
  if {$now >= [dict get $state next]} {
    dict set state shown 1
    dict set state next [expr {$now + $interval}]
    catch {
      puts -nonewline stderr \r[bar [dict get $state done] [dict get $state total] \
        [dict get $state label]]
      flush stderr
    }
  }
}

# The work is done, or has ended otherwise.
proc ::vorkel::progress::finish {} {
  variable state
  if {[dict get $state shown]} {
    catch {
      puts -nonewline stderr "\r\033\[K"
      flush stderr
    }
  }
  set state {shown 0 active 0}
}

# The bar as text, shorter than 80 columns.
proc ::vorkel::progress::bar {done total label} {
  variable width
  set part [expr {min(1.0, double($done) / $total)}]
  set full [expr {int($part * $width)}]
  return [format "%-.24s \[%s%s] %3d%%" $label [string repeat # $full] \
    [string repeat . [expr {$width - $full}]] [expr {int($part * 100)}]]
}
