# Devices: what the host of the engine knows of the one that a request names.

namespace eval ::generator::device {}

# The part that a request names, a dict of its full name (name) and the primitives that it has
# (primitives). There being no such part is thrown as {GENERATOR WRONG}.
proc ::generator::device::find {request} {
  set device [dict get $request device]
  try {
    set description [::Vorkel::Devices describe $device]
  } on error {reason} {
    Wrong $request $reason
  }
  set package [Choice $request $description package]
  set grade [Choice $request $description grade]
  if {$grade eq ""} {
    Wrong $request "$device has no default grade: must be\
      [join [dict get $description grades] { or }]"
  }
  return [dict create name $device$package-$grade \
    primitives [Primitives [dict get $description limits $grade]]]
}

proc ::generator::device::Wrong {request reason} {
  throw {GENERATOR WRONG} "[dict get $request path]: $reason"
}

# The package or grade (`kind`) of a request, or the device's default, which may be empty.
proc ::generator::device::Choice {request description kind} {
  set name [dict get $request $kind]
  set known [dict get $description ${kind}s]
  if {$name eq ""} {
    return [dict get $description default_$kind]
  }
  if {$name ni $known} {
    Wrong $request "[dict get $description name] has no $kind \"$name\": must be\
      [join $known { or }]"
  }
  return $name
}

# The primitives of which a grade has all limits.
proc ::generator::device::Primitives {limits} {
  set primitives {}
  set incomplete {}
  foreach keyword [::Vorkel::Devices keywords] {
    lassign $keyword name unit users
    lappend primitives {*}$users
    if {![dict exists $limits $name]} {
      lappend incomplete {*}$users
    }
  }
  return [lmap primitive [lsort -unique $primitives] {
    if {$primitive in $incomplete} continue
    set primitive
  }]
}
