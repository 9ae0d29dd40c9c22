// A primitive in a design, in no language yet: what it is set to, and what is connected to it.
//
// Everything is a whole number, so that nothing is rounded: frequencies are quotients of MHz, M and
// dividers count eighths, phases eighths and high times halves of a VCO period, divides of a KRU
// halves.
#ifndef VORKEL_PLANNER_HDL_INSTANCE_H_
#define VORKEL_PLANNER_HDL_INSTANCE_H_

#include <cstdint>
#include <string>
#include <variant>
#include <vector>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"

namespace planner::hdl {

struct Flag {
  bool is_set;
};

// An attribute: a Verilog parameter or a VHDL generic of the primitive.
struct Attribute {
  std::string name;
  std::variant<std::int64_t, Flag, std::string> value;
};

// A pin of the primitive and the net at it: a port of the module, or one of its own.
struct Connection {
  std::string pin;
  std::string net;  // empty: an output that is not used, or an input that is held low
  bool is_output = false;
};

struct Port {
  std::string name;
  bool is_output = false;
};

// A port that is on the net of another one, as two outputs on the same pin of a KRU.
struct Copy {
  std::string port;
  std::string net;
};

struct Instance {
  std::string model;              // "VORKEL_TSYN"
  std::string label;              // "tsyn_inst"
  std::vector<Port> ports;        // of the module
  std::vector<std::string> nets;  // in it, beside its ports
  std::vector<Attribute> attributes;
  std::vector<Connection> connections;  // all pins of the primitive
  std::vector<Copy> copies;
};

// Of an answer that is solved and fits (Refusal says nothing).
Instance InstanceOf(const Request& request, const Device& device, const Answer& answer);

// Why a request cannot be written, as a sentence: an input whose quotient of MHz has parts that are
// no whole numbers of 31 bits, which is all that VHDL has for sure. Nothing when it can.
std::string Refusal(const Request& request);

// Both parts of a number that fits.
struct Parts {
  std::int64_t numerator;
  std::int64_t denominator;
};
Parts PartsOf(const Rational& value);

}  // namespace planner::hdl

#endif  // VORKEL_PLANNER_HDL_INSTANCE_H_
