# The report on a plan, as text.

namespace eval ::generator::report {}

proc ::generator::report::render {request part plan} {
  set lines {}
  foreach {name value} [list \
    request [regsub {^.*/} [dict get $request path] {}] \
    device [dict get $part name] \
    primitive [dict get $plan primitive] \
    {*}[Inputs $request] {*}[dict get $plan settings] \
    "phase error" [Figure [dict get $plan phaseError] " ps"]] {
    lappend lines [format "%-18s%s" $name $value]
  }
  set text "[join $lines \n]\n\n[Table [Rows $request $plan]]"
  set notes [dict get $plan notes]
  dict for {primitive reason} [dict get $plan refused] {
    lappend notes "$primitive is not used: $reason"
  }
  if {[llength $notes] > 0} {
    append text "\nnote: [join $notes "\nnote: "]\n"
  }
  return $text
}

proc ::generator::report::Inputs {request} {
  set lines {}
  foreach input [dict get $request inputs] {
    lappend lines input "[dict get $input frequency] MHz, jitter [dict get $input jitter] ps"
  }
  return $lines
}

# A line of the table for each output, and before them one of headings.
proc ::generator::report::Rows {request plan} {
  set rows {{output divider/pin {wanted MHz} {actual MHz} {error ppm} {wanted deg} {actual deg}
    {wanted %} {actual %} {period ns} {jitter ps}}}
  set n 0
  foreach wanted [dict get $request outputs] actual [dict get $plan outputs] {
    set duty [dict get $wanted duty]
    set frequency [dict get $actual frequency]
    lappend rows [list $n [dict get $actual place] [dict get $wanted frequency] \
      [format %.6f $frequency] \
      [format %.2f [::generator::ppm $frequency [dict get $wanted frequency]]] \
      [dict get $wanted phase] [Figure [dict get $actual phase]] \
      [expr {$duty eq "" ? "any" : $duty}] [Figure [dict get $actual duty]] \
      [dict get $actual period] [dict get $actual jitter]]
    incr n
  }
  return $rows
}

# Rows under each other, each column as wide as its widest entry.
proc ::generator::report::Table {rows} {
  set widths {}
  foreach row $rows {
    set column 0
    foreach entry $row {
      if {$column == [llength $widths]} {
        lappend widths 0
      }
      lset widths $column [expr {max([lindex $widths $column], [string length $entry])}]
      incr column
    }
  }
  set text ""
  foreach row $rows {
    set line [lmap entry $row width $widths {format %*s $width $entry}]
    append text [join $line "  "] \n
  }
  return $text
}

# A number with up to three decimals and its unit, or "-".
proc ::generator::report::Figure {value {unit ""}} {
  if {$value eq "-"} {
    return -
  }
  return [format %g $value]$unit
}
