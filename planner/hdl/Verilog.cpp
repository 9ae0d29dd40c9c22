// Verilog-2001, but for $fatal in a testbench, which is SystemVerilog's.
//
// Tested by hdl.test.
#include <string_view>

#include "planner/hdl/Writers.h"
#include "planner/report/Words.h"

namespace planner::hdl {

namespace {

using report::Join;
using std::string;

string Literal(const Attribute& attribute) {
  if (const auto* number = std::get_if<std::int64_t>(&attribute.value)) {
    return std::to_string(*number);
  }
  if (const auto* flag = std::get_if<Flag>(&attribute.value)) return flag->is_set ? "1" : "0";
  return "\"" + std::get<string>(attribute.value) + "\"";
}

string Bound(const string& name, const string& value) { return "." + name + "(" + value + ")"; }

// Lines of a list, with commas between.
string Listed(const std::vector<string>& lines) { return Join(lines, ",\n"); }

// The net at a pin. An output that nobody reads has a net, too; tools warn where it has none.
string NetOf(const Connection& connection, std::vector<string>* unused) {
  if (!connection.net.empty()) return connection.net;
  if (!connection.is_output) return "1'b0";
  string name = "unused_" + connection.pin;
  for (char& c : name) {
    if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
  }
  unused->push_back(name);
  return name;
}

string Source(const Parts& mhz, int n) {
  const string number = std::to_string(n);
  return "  VORKEL_CLOCK_SOURCE #(\n" +
         Listed({"      " + Bound("MHZ_NUM", std::to_string(mhz.numerator)),
                 "      " + Bound("MHZ_DEN", std::to_string(mhz.denominator))}) +
         "\n  ) source" + number + " (\n" +
         Listed({"      " + Bound("enable", "enable"), "      " + Bound("clk", "clk_in" + number),
                 "      " + Bound("edge_time", "edge_time" + number),
                 "      " + Bound("edge_rest", "edge_rest" + number)}) +
         "\n  );\n";
}

// The check of an output from an input, and its place among all.
string Check(const Bench& bench, const Expected& output, int input, int place) {
  const Parts& mhz = bench.inputs[static_cast<std::size_t>(input) - 1];
  const string n = std::to_string(input);
  const string o = std::to_string(output.output);
  const string at = "[" + std::to_string(place) + "]";
  std::vector<string> lines;
  const auto set = [&](const char* name, const string& value) {
    lines.push_back("      " + Bound(name, value));
  };
  set("INDEX", o);
  set("MHZ_NUM", std::to_string(mhz.numerator));
  set("MHZ_DEN", std::to_string(mhz.denominator));
  set("RATIO_NUM", std::to_string(output.ratio.numerator));
  set("RATIO_DEN", std::to_string(output.ratio.denominator));
  set("SHAPE_DEN", std::to_string(output.shape));
  set("PHASE", std::to_string(output.phase));
  set("HIGH", std::to_string(output.high));
  set("RISES", (bench.hyperperiod ? "REPEAT * " : "") + std::to_string(output.rises));
  string text =
      "  VORKEL_CLOCK_CHECK #(\n" + Listed(lines) + "\n  ) check" + o + "_in" + n + " (\n";
  lines.clear();
  set("clk", "clk_out" + o);
  set("run", "locked && is_on" + n);
  set("source_time", "edge_time" + n);
  set("source_rest", "edge_rest" + n);
  set("is_done", "is_done" + at);
  set("is_wrong", "is_wrong" + at);
  return text + Listed(lines) + "\n  );\n";
}

string Declarations(const Instance& instance, const Bench& bench) {
  string text = "  reg enable;\n  reg rst;\n";
  for (std::size_t i = 1; i <= bench.inputs.size(); ++i) {
    const string n = std::to_string(i);
    text += "  wire clk_in" + n + ";\n  wire [63:0] edge_time" + n + ";\n  wire [63:0] edge_rest" +
            n + ";\n  reg is_on" + n + ";\n";
  }
  if (bench.inputs.size() > 1) text += "  reg clk_in_sel;\n";
  for (const Port& port : instance.ports) {
    if (port.is_output) text += "  wire " + port.name + ";\n";
  }
  const string last = std::to_string(bench.outputs.size() * bench.inputs.size() - 1);
  return text + "  wire [" + last + ":0] is_done;\n  wire [" + last + ":0] is_wrong;\n";
}

// Looks at the outputs from one input after the other.
string Course(const Bench& bench) {
  string text =
      "  initial begin\n"
      "    enable = 1'b0;\n"
      "    rst = 1'b1;\n";
  for (std::size_t i = 1; i <= bench.inputs.size(); ++i) {
    text += "    is_on" + std::to_string(i) + " = 1'b0;\n";
  }
  if (bench.inputs.size() > 1) text += "    clk_in_sel = 1'b0;\n";
  text += "    #(SPAN1);\n    enable = 1'b1;\n    #(64'd2 * SPAN1);\n    rst = 1'b0;\n";
  for (std::size_t i = 1; i <= bench.inputs.size(); ++i) {
    const string n = std::to_string(i);
    if (i > 1) text += "    clk_in_sel = 1'b1;\n    #(64'd1);\n";
    text += "    is_on" + n + " = 1'b1;\n    #(MORE_CYCLES * SPAN" + n + ");\n    " +
            (bench.hyperperiod ? "repeat (REPEAT) " : "") + "#(CYCLES * SPAN" + n +
            ");\n    is_on" + n + " = 1'b0;\n    #(SPAN" + n + ");\n";
  }
  return text +
         "    if (&is_done && is_wrong == 0) begin\n"
         "      $display(\"PASS\");\n"
         "      $finish;\n"
         "    end else begin\n"
         "      $display(\"FAIL\");\n"
         "      $fatal(0);\n"
         "    end\n"
         "  end\n";
}

}  // namespace

string VerilogModule(const string& name, const Instance& instance) {
  string text = "`timescale 1fs/1fs\nmodule " + name +
                " #(\n"
                "    // Of the simulation alone.\n"
                "    parameter integer JITTER_RMS_FS = 0,\n"
                "    parameter integer JITTER_SEED = 1\n) (\n";
  std::vector<string> lines;
  for (const Port& port : instance.ports) {
    lines.push_back(string("    ") + (port.is_output ? "output" : "input") + " wire " + port.name);
  }
  text += Listed(lines) + "\n);\n";
  lines.clear();
  std::vector<string> nets = instance.nets;
  for (const Connection& connection : instance.connections) {
    lines.push_back("      " + Bound(connection.pin, NetOf(connection, &nets)));
  }
  for (const string& net : nets) text += "  wire " + net + ";\n";
  std::vector<string> attributes;
  for (const Attribute& attribute : instance.attributes) {
    attributes.push_back("      " + Bound(attribute.name, Literal(attribute)));
  }
  for (const char* passed : {"JITTER_RMS_FS", "JITTER_SEED"}) {
    attributes.push_back("      " + Bound(passed, passed));
  }
  text += "\n  " + instance.model + " #(\n" + Listed(attributes) + "\n  ) " + instance.label +
          " (\n" + Listed(lines) + "\n  );\n";
  if (!instance.copies.empty()) text += "\n  // On the same pin.\n";
  for (const Copy& copy : instance.copies) {
    text += "  assign " + copy.port + " = " + copy.net + ";\n";
  }
  return text + "endmodule\n";
}

string VerilogBench(const string& name, const Instance& instance, const Bench& bench) {
  string text = "`timescale 1fs/1fs\nmodule " + name + "_tb";
  if (bench.hyperperiod) {
    text += " #(\n    parameter integer REPEAT = " + std::to_string(bench.repeat) + "\n)";
  }
  text += ";\n";
  for (std::size_t i = 0; i < bench.spans.size(); ++i) {
    text += "  localparam [63:0] SPAN" + std::to_string(i + 1) + " = 64'd" +
            std::to_string(bench.spans[i]) + ";  // a period of input " + std::to_string(i + 1) +
            ", rounded up\n";
  }
  text += "  localparam [63:0] CYCLES = 64'd" + std::to_string(bench.cycles) +
          (bench.hyperperiod ? ";  // of the input, a hyperperiod\n" : ";  // of the input\n") +
          "  localparam [63:0] MORE_CYCLES = 64'd" + std::to_string(bench.before + bench.after) +
          ";  // before the lock, and for the last edges\n\n";
  text += Declarations(instance, bench);
  int input = 0;
  for (const Parts& mhz : bench.inputs) text += "\n" + Source(mhz, ++input);
  std::vector<string> ports;
  for (const Port& port : instance.ports) ports.push_back("      " + Bound(port.name, port.name));
  text += "\n  " + name + " dut (\n" + Listed(ports) + "\n  );\n";
  int place = 0;
  for (int n = 1; n <= static_cast<int>(bench.inputs.size()); ++n) {
    for (const Expected& output : bench.outputs) text += "\n" + Check(bench, output, n, place++);
  }
  return text + "\n" + Course(bench) + "endmodule\n";
}

}  // namespace planner::hdl
