#include "binding/Call.h"

#include <array>
#include <atomic>
#include <charconv>
#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <system_error>

#include "engine/FixedText.h"
#include "engine/Messages.h"
#include "engine/StandardOutput.h"
#include "engine/Trace.h"

namespace Ip {

namespace {

constexpr int kWordsBeforeArguments = 2;  // the handle and the method name

// Whether the loss that goes on has been told.
constinit std::atomic<bool> loss_is_told = false;

void TellLostTrace(int loss) {
  if (loss == kWritten) {
    loss_is_told = false;
  } else if (!loss_is_told) {
    const std::string reason = loss == kStandsForAnother
                                   ? "it is closed, and another file has its number"
                                   : std::generic_category().message(loss);
    Message()->issueError("The trace could not be written to standard output: %s\n",
                          reason.c_str());
    loss_is_told = true;
  }
}

}  // namespace

bool Call::HasArguments(int arguments, const char* method) const {
  if (objc_ == arguments + kWordsBeforeArguments) return true;
  const std::string message = std::string(method) + ": Invalid number of arguments.";
  Tcl::SetResult(interp_, message.c_str());
  return false;
}

VorkelImp* Call::Object(const VorkelPtrHandle& handle, int arguments, const char* method,
                        const char* missing) const {
  if (!HasArguments(arguments, method)) return nullptr;
  void* value = nullptr;
  if (handle.GetValue(&value) == TCL_OK) return static_cast<VorkelImp*>(value);
  if (missing != nullptr) {
    Tcl::SetResult(interp_, missing);
  } else {
    const std::string message =
        std::string("Unable to obtain Implementation object for VorkelPtrHandle::") + method;
    Tcl::SetResult(interp_, message.c_str());
  }
  return nullptr;
}

const char* Call::Text(int argument) const {
  return Tcl::GetString(objv_[argument + kWordsBeforeArguments]->GetTclObj());
}

double Call::Number(int argument) const { return std::strtod(Text(argument), nullptr); }

int Call::Count(int argument) const {
  // What atoi does here, written out: of text that no int can hold C leaves its answer open, while
  // a conversion to int is defined.
  return static_cast<int>(std::strtol(Text(argument), nullptr, 10));
}

bool Call::Flag(int argument) const {
  return String(argument).Compare("true", Port::CompareType::kExact) == 0;
}

int Call::AnswerText(const char* text) const {
  Tcl::SetResult(interp_, text);
  return TCL_OK;
}

int Call::Answer(const char* format, ...) const {
  std::array<char, 512> text;  // the longest double takes 309 digits before the point
  std::va_list arguments;
  va_start(arguments, format);
  std::vsnprintf(text.data(), text.size(), format, arguments);
  va_end(arguments);
  return AnswerText(text.data());
}

int Call::AnswerNumber(const char* format, double number) const {
  std::array<char, kLongestFixed + 1> text;
  char* const end = WriteFixed3(number, text.data());
  if (end == nullptr) return Answer(format, number);
  *end = '\0';
  return AnswerText(text.data());
}

int Call::AnswerCount(int count) const {
  std::array<char, 16> text;
  *std::to_chars(text.data(), text.data() + text.size(), count).ptr = '\0';
  return AnswerText(text.data());
}

int Call::AnswerRun(bool traced, const char* text) const {
  if (traced) TellLostTrace(Trace::LossOfLast());
  return AnswerText(text);
}

int Call::Fail(const char* message) const {
  Tcl::SetResult(interp_, message);
  return TCL_ERROR;
}

int Call::AnswerQuery(bool answered, double figure, const Port::StringBase& error) const {
  return answered ? AnswerNumber("%3.3f", figure) : Fail(error.CStr());
}

}  // namespace Ip
