// Tested by hdl.test.
#include "planner/hdl/Head.h"

#include <nlohmann/json.hpp>

#include "planner/report/Data.h"
#include "planner/report/Numbers.h"
#include "planner/report/ReportText.h"
#include "planner/report/Style.h"
#include "planner/report/Table.h"

namespace planner::hdl {

namespace {

using std::string;

constexpr int kWidth = 96;

// An entry to a line.
string RequestLines(const Request& request, const Device& device) {
  string text = "The request:\n\n{";
  const char* separator = "\n";
  const nlohmann::ordered_json data = report::RequestData(request, device);
  for (const auto& [name, value] : data.items()) {
    if (name == "outputs") {
      text += string(separator) + " \"outputs\": [";
      const char* between = "\n";
      for (const auto& output : value) {
        text += between + ("  " + output.dump());
        between = ",\n";
      }
      text += "]";
    } else {
      text += string(separator) + " \"" + name + "\": " + value.dump();
    }
    separator = ",\n";
  }
  return text + "}\n";
}

// The random part, which the models can be given.
string RandomJitter(const Answer& answer) {
  double most = 0;
  for (const OutputAnswer& output : answer.outputs) {
    if (!output.used) continue;
    if (!output.jitter_rms) return "";
    if (*output.jitter_rms > most) most = *output.jitter_rms;
  }
  return "\nThe random part of the jitter is at most " + report::Short(most, 3) + " ps rms.\n";
}

}  // namespace

string Comment(std::string_view mark, std::string_view text) {
  string lines;
  while (!text.empty()) {
    const std::size_t end = text.find('\n');
    const std::string_view line = text.substr(0, end);
    lines += string(mark) + (line.empty() ? "" : " ") + string(line) + "\n";
    if (end == std::string_view::npos) break;
    text.remove_prefix(end + 1);
  }
  return lines;
}

string Head(std::string_view mark, const string& title, const Request& request,
            const Device& device, const Answer& answer) {
  const report::Style style{false, kWidth};
  return Comment(mark, report::Paragraph(style, title) + "\n" + RequestLines(request, device) +
                           "\nThe answer:\n\n" +
                           report::ReportText(request, device, answer, style) +
                           RandomJitter(answer)) +
         "\n";
}

}  // namespace planner::hdl
