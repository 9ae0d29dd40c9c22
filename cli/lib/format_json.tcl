# Answers as JSON: doc/planner-json.md describes it, doc/planner.schema.json is its schema.

package provide vorkel::format_json 1.1
package require json::write
package require vorkel::plan_data 1.1

namespace eval ::vorkel::format {}
namespace eval ::vorkel::format::json_writer {
  # The entries whose values are no numbers and no words true and false. Of the texts, those
  # that may be missing are null then.
  variable texts {format device primitive source variant reason}
  variable texts_or_null {bandwidth pin}
  variable flags {solved within feedback prefer_max_vco int_div0 clkin_divide_by_2}
  variable objects {request settings}
  variable lists {answers Object outputs Object inputs Number violations Text notes Text}
}

proc ::vorkel::format::json {answers request} {
  ::json::write indented true
  ::json::write aligned false
  return [json_writer::Object [::vorkel::plan_data::of $answers $request]]\n
}

# The JSON of a value, by the name of its entry.
proc ::vorkel::format::json_writer::Value {key value} {
  variable texts
  variable texts_or_null
  variable flags
  variable objects
  variable lists
  if {$key in $texts} {
    return [Text $value]
  }
  if {$key in $texts_or_null} {
    return [expr {$value eq "" ? "null" : [Text $value]}]
  }
  if {$key in $objects} {
    return [Object $value]
  }
  if {[dict exists $lists $key]} {
    set writer [dict get $lists $key]
    return [::json::write array {*}[lmap element $value {$writer $element}]]
  }
  if {$key in $flags} {
    return $value
  }
  return [Number $value]
}

proc ::vorkel::format::json_writer::Object {data} {
  return [::json::write object {*}[dict map {key value} $data {Value $key $value}]]
}

proc ::vorkel::format::json_writer::Text {value} {
  return [::json::write string $value]
}

# A number; none is null.
proc ::vorkel::format::json_writer::Number {value} {
  return [expr {$value eq "" ? "null" : $value}]
}
