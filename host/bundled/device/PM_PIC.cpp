// Tested by personality_test.cpp.
#include "host/PM_PIC.h"

#include <exception>
#include <new>
#include <utility>

#include "host/bundled/device/Personality.h"

namespace {

// Fills an absent value with the default; false when both are absent.
bool FillDefault(const std::optional<std::string>& default_value,
                 std::optional<std::string>* value) {
  if (!value->has_value()) *value = default_value;
  return value->has_value();
}

}  // namespace

PM_PIC::PM_PIC(const Port::StringBase& partName, bool isPartName, PM_PARTNAME_BINDING /*binding*/) {
  try {
    const auto catalogue = Device::DeviceCatalogue::List();
    Device::Part part = isPartName
                            ? Device::FindPart(catalogue, partName.View())
                            : Device::Part{Device::FindDevice(catalogue, partName.View()), {}, {}};
    data_ = std::make_unique<Data>(Data{std::move(part)});
  } catch (const std::bad_alloc&) {
    Device::ReportAndThrow("out of memory");
  } catch (const std::exception& error) {
    Device::ReportAndThrow(error.what());
  }
}

PM_PIC::PM_PIC(std::unique_ptr<Data> data) : data_(std::move(data)) {}

PM_PIC::~PM_PIC() = default;

bool PM_PIC::fill_defaults() {
  Device::Part& part = data_->part;
  const bool has_package = FillDefault(part.file->default_package, &part.package);
  const bool has_grade = FillDefault(part.file->default_grade, &part.grade);
  return has_package && has_grade;
}
