#include "tests/model/Session.h"

#include <cstdio>
#include <cstdlib>
#include <string_view>
#include <utility>

#include "tests/binding/ScriptCalls.h"

// Defined in binding/PackageEntry.cpp.
extern "C" int Ip_vorkel_Init(Tcl_Interp* interp);

namespace model {

namespace {

// What is printed on a stream of C while an object of this class lives.
class Captured {
 public:
  explicit Captured(std::FILE** stream)
      : stream_(stream), saved_(std::exchange(*stream, open_memstream(&text_, &size_))) {}
  ~Captured() {
    std::fclose(*stream_);
    *stream_ = saved_;
    std::free(text_);
  }
  Captured(const Captured&) = delete;
  Captured& operator=(const Captured&) = delete;

  std::string Text() {
    std::fflush(*stream_);
    return {text_, size_};
  }

 private:
  char* text_ = nullptr;
  std::size_t size_ = 0;
  std::FILE** stream_;
  std::FILE* saved_;
};

// As the host's messages show what a line cannot.
std::string Shown(const std::string& text) {
  std::string shown;
  for (const char letter : text) {
    const auto code = static_cast<unsigned char>(letter);
    shown += code < 0x20 || code == 0x7f ? '?' : letter;
  }
  return shown;
}

// The messages of the engine among the lines; the host says more.
std::vector<std::string> EngineErrors(const std::string& lines) {
  constexpr std::string_view kHead = "ERROR:DesignEntry: ";
  constexpr std::string_view kOfEngine = "Internal ";
  std::vector<std::string> errors;
  for (std::size_t at = 0; at < lines.size();) {
    const std::size_t end = lines.find('\n', at);
    const std::string_view line = std::string_view(lines).substr(at, end - at);
    if (line.starts_with(kHead) && line.substr(kHead.size()).starts_with(kOfEngine)) {
      errors.emplace_back(line.substr(kHead.size()));
    }
    at = end == std::string::npos ? lines.size() : end + 1;
  }
  return errors;
}

std::string FirstLineApart(const std::string& given, const std::string& expected) {
  std::size_t at = 0;
  while (at < given.size() && at < expected.size() && given[at] == expected[at]) ++at;
  const std::size_t begin = at == 0 ? 0 : given.rfind('\n', at - 1) + 1;
  const auto line = [&](const std::string& text) {
    return text.substr(begin, text.find('\n', begin) - begin);
  };
  return "trace \"" + line(given) + "\", expected \"" + line(expected) + "\"";
}

std::string Quoted(const std::vector<std::string>& lines) {
  std::string text;
  for (const std::string& line : lines) text += "\"" + line + "\" ";
  return text;
}

// What is wrong with an answer; empty when nothing is.
std::string Compare(const Answer& given, const Answer& expected) {
  if (given.is_ok != expected.is_ok || (expected.is_known && given.text != expected.text)) {
    return std::string(given.is_ok ? "" : "error ") + "\"" + given.text + "\", expected " +
           (expected.is_ok ? "" : "error ") + "\"" + expected.text + "\"";
  }
  if (given.trace != expected.trace) return FirstLineApart(given.trace, expected.trace);
  std::vector<std::string> errors;
  for (const std::string& error : expected.errors) errors.push_back(Shown(error));
  if (given.errors != errors) {
    return "messages " + Quoted(given.errors) + "expected " + Quoted(errors);
  }
  return "";
}

}  // namespace

struct Session::Interpreter {
  Interpreter() {
    if (Ip_vorkel_Init(interp.get()) != TCL_OK) std::abort();
  }

  Answer Eval(const std::string& script) {
    Captured out(&stdout);
    Captured error(&stderr);
    Answer answer;
    answer.is_ok = interp.Eval(script) == TCL_OK;
    answer.text = Nameless(interp.Result());
    answer.trace = out.Text();
    answer.errors = EngineErrors(error.Text());
    return answer;
  }

  TestInterp interp;
};

Session::Session(std::unique_ptr<World> world)
    : world_(std::move(world)), interpreter_(std::make_unique<Interpreter>()) {}

Session::~Session() = default;

std::optional<Difference> Session::Run(const Step& step) {
  // The host's own messages about a device that there is not come from the model, too.
  Answer expected;
  {
    Captured silent(&stderr);
    expected = world_->Expect(step);
  }
  const Answer given = interpreter_->Eval(TextOf(step));
  const std::size_t number = steps_++;
  std::string text = Compare(given, expected);
  if (text.empty()) return std::nullopt;
  return Difference{number, TextOf(step), std::move(text)};
}

std::optional<Difference> Play(const Steps& steps, const NewWorld& new_world, bool far) {
  Session session(new_world());
  for (const Step& step : steps) {
    if (!far && session.world().GoesFar(step)) continue;
    if (auto difference = session.Run(step)) return difference;
  }
  return std::nullopt;
}

}  // namespace model
