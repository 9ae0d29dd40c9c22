# JSON with the types of its values, and a check of it against a JSON schema: as much of either as
# the schema of the planner uses. tcllib's parser does not tell "1" from 1 or null from "null".

namespace eval ::schema {
  variable token {"(?:[^"\\]|\\.)*"|[][\{\}:,]|true|false|null|-?[0-9][-+.0-9eE]*|\S}
}

# A value as a list of its type and its content: {object DICT}, {array LIST}, {string TEXT},
# {number TEXT}, {boolean TEXT} or {null {}}. The text must be valid JSON; tcllib checks that.
proc ::schema::parse {text} {
  variable token
  ::json::json2dict $text
  set tokens [regexp -all -inline -- $token $text]
  set at 0
  set value [Value $tokens at]
  if {$at != [llength $tokens]} {
    error "something follows the value"
  }
  return $value
}

proc ::schema::Value {tokens atName} {
  upvar 1 $atName at
  set word [lindex $tokens $at]
  incr at
  switch -glob -- $word {
    "\\\{" {
      set object {}
      while {[lindex $tokens $at] ne "\}"} {
        set key [lindex [Value $tokens at] 1]
        if {[dict exists $object $key]} {
          error "$key stands twice"
        }
        incr at
        dict set object $key [Value $tokens at]
        if {[lindex $tokens $at] eq ","} {
          incr at
        }
      }
      incr at
      return [list object $object]
    }
    "\\\[" {
      set array {}
      while {[lindex $tokens $at] ne "\]"} {
        lappend array [Value $tokens at]
        if {[lindex $tokens $at] eq ","} {
          incr at
        }
      }
      incr at
      return [list array $array]
    }
    "\"*" { return [list string [subst -nocommands -novariables [string range $word 1 end-1]]] }
    true - false { return [list boolean $word] }
    null { return {null {}} }
  }
  if {![string is double -strict $word]} {
    error "\"$word\" is no value"
  }
  return [list number $word]
}

# What does not fit in a value, "" for nothing. `root` is the whole schema.
proc ::schema::fault {value schema root {where whole}} {
  lassign $value type content
  foreach {rule operand} [lindex $schema 1] {
    lassign $operand operand_type operand
    switch -- $rule {
      title - description - {$schema} - {$defs} - then {}
      properties {
        if {$type ne "object"} continue
        dict for {key rules} $operand {
          if {![dict exists $content $key]} continue
          set fault [fault [dict get $content $key] $rules $root $where.$key]
          if {$fault ne ""} {
            return $fault
          }
        }
      }
      if {
        if {[fault $value [list $operand_type $operand] $root $where] ne ""} continue
        set fault [fault $value [dict get [lindex $schema 1] then] $root $where]
        if {$fault ne ""} {
          return $fault
        }
      }
      allOf {
        foreach each $operand {
          set fault [fault $value $each $root $where]
          if {$fault ne ""} {
            return $fault
          }
        }
      }
      {$ref} {
        set name [lindex [split $operand /] end]
        set named [dict get [lindex [dict get [lindex $root 1] {$defs}] 1] $name]
        set fault [fault $value $named $root $where]
        if {$fault ne ""} {
          return $fault
        }
      }
      type {
        set types [expr {$operand_type eq "array" ? [lmap each $operand {lindex $each 1}] :
          [list $operand]}]
        set whole [expr {$type eq "number" && [string is entier -strict $content]}]
        if {$type ni $types && !($whole && "integer" in $types)} {
          return "$where is a $type, not a $types"
        }
      }
      const {
        if {$value ne [list $operand_type $operand]} {
          return "$where is $value, not $operand"
        }
      }
      enum {
        if {$value ni $operand} {
          return "$where is $value"
        }
      }
      minimum { if {$content < $operand} {return "$where is too small"} }
      exclusiveMinimum { if {$content <= $operand} {return "$where is too small"} }
      minItems { if {[llength $content] < $operand} {return "$where has too few"} }
      maxItems { if {[llength $content] > $operand} {return "$where has too many"} }
      items {
        set n -1
        foreach item $content {
          set fault [fault $item [list $operand_type $operand] $root $where.[incr n]]
          if {$fault ne ""} {
            return $fault
          }
        }
      }
      required {
        foreach key $operand {
          if {![dict exists $content [lindex $key 1]]} {
            return "$where lacks [lindex $key 1]"
          }
        }
      }
      additionalProperties {
        # It is false throughout: the properties are all that there may be.
        set properties [lindex [dict get [lindex $schema 1] properties] 1]
        foreach key [dict keys $content] {
          if {![dict exists $properties $key]} {
            return "$where has $key"
          }
        }
      }
      oneOf {
        set faults [lmap each $operand {fault $value $each $root $where}]
        if {[llength [lsearch -all -exact $faults ""]] != 1} {
          return [join $faults { | }]
        }
      }
      default { error "the schema has a rule that the check does not know: $rule" }
    }
  }
  return ""
}
