#include "host/bundled/script/DeviceCommand.h"

#include <charconv>
#include <exception>
#include <new>
#include <string>
#include <string_view>
#include <system_error>
#include <vector>

#include "host/TclVersion.h"
#include "host/bundled/device/DeviceCatalogue.h"
#include "host/bundled/device/DeviceFile.h"
#include "host/bundled/device/KeywordTable.h"
#include "host/bundled/script/TclAccess.h"

namespace Script {
namespace {

Tcl_Obj* NewEncodedText(Tcl_Encoding encoding, std::string_view text) {
  Tcl_DString converted;
  Tcl_ExternalToUtfDString(encoding, text.data(), static_cast<int>(text.size()), &converted);
  Tcl_Obj* const object =
      Tcl_NewStringObj(Tcl_DStringValue(&converted), Tcl_DStringLength(&converted));
  Tcl_DStringFree(&converted);
  return object;
}

// Texts from outside Tcl, such as paths and messages about them, are in the encoding of the
// system.
Tcl_Obj* NewText(std::string_view text) { return NewEncodedText(nullptr, text); }

// The contents of device files are in UTF-8, whatever the system speaks.
Tcl_Obj* NewFileText(std::string_view text) {
  Tcl_Encoding const utf8 = Tcl_GetEncoding(nullptr, "utf-8");
  Tcl_Obj* const object = NewEncodedText(utf8, text);
  if (utf8 != nullptr) Tcl_FreeEncoding(utf8);
  return object;
}

std::string TextOf(Tcl_Obj* object) {
  Tcl::Size length = 0;
  const char* const text = Tcl_GetStringFromObj(object, &length);
  Tcl_DString converted;
  Tcl_UtfToExternalDString(nullptr, text, length, &converted);
  std::string result(Tcl_DStringValue(&converted),
                     static_cast<std::size_t>(Tcl_DStringLength(&converted)));
  Tcl_DStringFree(&converted);
  return result;
}

Tcl_Obj* NewList() { return Tcl_NewListObj(0, nullptr); }

void Append(Tcl_Obj* list, Tcl_Obj* element) { Tcl_ListObjAppendElement(nullptr, list, element); }

// Dictionaries are built as lists of keys and values, which every Tcl understands.
void AppendPair(Tcl_Obj* dictionary, std::string_view key, Tcl_Obj* value) {
  Append(dictionary, NewText(key));
  Append(dictionary, value);
}

Tcl_Obj* NewTextList(const std::vector<std::string>& texts) {
  Tcl_Obj* const list = NewList();
  for (const std::string& text : texts) Append(list, NewText(text));
  return list;
}

// The shortest text that reads back as the same number.
Tcl_Obj* NewNumber(double number) {
  char text[32];
  const auto [end, error] = std::to_chars(std::begin(text), std::end(text), number);
  const std::size_t length = error == std::errc() ? static_cast<std::size_t>(end - text) : 0;
  return NewText(std::string_view(text, length));
}

// The primitives of a set.
Tcl_Obj* NewPrimitiveList(unsigned primitives) {
  Tcl_Obj* const list = NewList();
  for (const Device::Primitive primitive : Device::kPrimitives) {
    if ((primitives & primitive) != 0) Append(list, NewText(Device::PrimitiveName(primitive)));
  }
  return list;
}

// The set of the primitives of which the grade has all keywords.
unsigned CompletePrimitives(const Device::Grade& grade) {
  unsigned complete = 0;
  for (const Device::Primitive primitive : Device::kPrimitives) {
    if (grade.Has(primitive)) complete |= primitive;
  }
  return complete;
}

Tcl_Obj* NewLimits(const Device::Grade& grade) {
  Tcl_Obj* const limits = NewList();
  const auto keywords = Device::Keywords();
  for (std::size_t i = 0; i < keywords.size(); ++i) {
    if (grade.figures[i]) AppendPair(limits, keywords[i].name, NewNumber(*grade.figures[i]));
  }
  return limits;
}

Tcl_Obj* NewCoefficients(const Device::Grade& grade) {
  Tcl_Obj* const list = NewList();
  const auto coefficients = Device::Coefficients();
  for (std::size_t i = 0; i < coefficients.size(); ++i) {
    if (!grade.coefficients[i]) continue;
    AppendPair(list, coefficients[i].name, NewNumber(*grade.coefficients[i]));
  }
  return list;
}

Tcl_Obj* NewDescription(const Device::DeviceFile& file) {
  const std::string default_grade = file.default_grade.value_or("");
  const Device::Grade* grade = file.FindGrade(default_grade);
  if (grade == nullptr) grade = &file.grades.front();
  Tcl_Obj* const limits = NewList();
  Tcl_Obj* const calculator = NewList();
  for (const Device::Grade& each : file.grades) {
    AppendPair(limits, each.name, NewLimits(each));
    AppendPair(calculator, each.name, NewCoefficients(each));
  }

  Tcl_Obj* const description = NewList();
  AppendPair(description, "name", NewText(file.device));
  AppendPair(description, "description", NewFileText(file.description));
  AppendPair(description, "file", NewText(file.path));
  AppendPair(description, "packages", NewTextList(file.packages));
  AppendPair(description, "default_package", NewText(file.default_package.value_or("")));
  AppendPair(description, "grades", NewTextList(file.GradeNames()));
  AppendPair(description, "default_grade", NewText(default_grade));
  AppendPair(description, "primitives", NewPrimitiveList(CompletePrimitives(*grade)));
  AppendPair(description, "limits", limits);
  AppendPair(description, "calculator", calculator);
  return description;
}

// "unknown device "x": must be a, b or c"
std::string UnknownDevice(const std::string& device, const std::vector<std::string>& names) {
  const std::string text = "unknown device " + Device::Quoted(device) + ": ";
  if (names.empty()) return text + "there are no devices";
  const std::string last = Device::JoinNames({names.back()});
  if (names.size() == 1) return text + "must be " + last;
  return text + "must be " + Device::JoinNames({names.begin(), names.end() - 1}) + " or " + last;
}

int Describe(Tcl_Interp* interp, Tcl_Obj* name) {
  const auto catalogue = Device::DeviceCatalogue::List();
  const std::string device = TextOf(name);
  const std::string* const path = catalogue.FindFile(device);
  if (path == nullptr) {
    Tcl_SetObjResult(interp, NewText(UnknownDevice(device, catalogue.Names())));
    return TCL_ERROR;
  }
  Tcl_SetObjResult(interp, NewDescription(Device::DeviceFile::Read(*path, device)));
  return TCL_OK;
}

int Names(Tcl_Interp* interp) {
  Tcl_SetObjResult(interp, NewTextList(Device::DeviceCatalogue::List().Names()));
  return TCL_OK;
}

int Keywords(Tcl_Interp* interp) {
  Tcl_Obj* const list = NewList();
  for (const Device::Keyword& keyword : Device::Keywords()) {
    Tcl_Obj* const entry = NewList();
    Append(entry, NewText(keyword.name));
    Append(entry, NewText(Device::UnitName(keyword.unit)));
    Append(entry, NewPrimitiveList(keyword.primitives));
    Append(list, entry);
  }
  Tcl_SetObjResult(interp, list);
  return TCL_OK;
}

int Dispatch(Tcl_Interp* interp, int objc, Tcl_Obj* const objv[]) {
  enum Option { kDescribe, kKeywords, kNames };
  static const char* const kOptions[] = {"describe", "keywords", "names", nullptr};
  if (objc < 2) {
    Tcl_WrongNumArgs(interp, 1, objv, "option ?arg?");
    return TCL_ERROR;
  }
  int option = 0;
  if (Tcl_GetIndexFromObj(interp, objv[1], kOptions, "option", 0, &option) != TCL_OK) {
    return TCL_ERROR;
  }
  const int argument_count = option == kDescribe ? 1 : 0;
  if (objc != 2 + argument_count) {
    Tcl_WrongNumArgs(interp, 2, objv, option == kDescribe ? "name" : nullptr);
    return TCL_ERROR;
  }
  switch (option) {
    case kDescribe:
      return Describe(interp, objv[2]);
    case kKeywords:
      return Keywords(interp);
    default:
      return Names(interp);
  }
}

int DevicesCommand(ClientData, Tcl_Interp* interp, int objc, Tcl_Obj* const objv[]) {
  try {
    return Dispatch(interp, objc, objv);
  } catch (const std::bad_alloc&) {
    return ErrorResult(interp, "out of memory");
  } catch (const std::exception& error) {
    Tcl_SetObjResult(interp, NewText(error.what()));
    return TCL_ERROR;
  }
}

}  // namespace

void CreateDeviceCommand(Tcl_Interp* interp) {
  Tcl_CreateObjCommand(interp, "::Vorkel::Devices", &DevicesCommand, nullptr, nullptr);
}

}  // namespace Script
