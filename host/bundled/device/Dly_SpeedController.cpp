// Tested by personality_test.cpp.
#include "host/Dly_SpeedController.h"

#include <exception>
#include <limits>
#include <new>
#include <optional>

#include "host/bundled/device/KeywordTable.h"
#include "host/bundled/device/Personality.h"
#include "host/bundled/device/SpeedFigure.h"

namespace {

constexpr double kNoFigure = std::numeric_limits<double>::max();

// The grade that the personality stands for. Throws DeviceError when it has none.
const Device::Grade& GradeOf(const PM_PIC* pic) {
  if (pic == nullptr) throw Device::DeviceError("there is no device to read the speed data of");
  const Device::Part& part = pic->data().part;
  if (part.grade) {
    const Device::Grade* const grade = part.file->FindGrade(*part.grade);
    if (grade != nullptr) return *grade;
  }
  throw Device::ErrorAt(part.file->path, part.file->grades_position,
                        "no speed grade was given for device \"" + part.file->device +
                            "\", which has " + Device::JoinNames(part.file->GradeNames()));
}

}  // namespace

Dly_SpeedController::Dly_SpeedController(const PM_PIC* pic) {
  try {
    const Device::Grade& grade = GradeOf(pic);
    data_ = std::make_unique<Data>();
    data_->file = pic->data().part.file;
    data_->grade = &grade;
    data_->calculator = std::make_shared<std::atomic<Tw_BmCMBCalculator*>>(nullptr);
    data_->figures.reserve(grade.figures.size());
    for (const std::optional<double>& figure : grade.figures) {
      data_->figures.push_back(figure ? Device::SpeedFigure(*figure) : kNoFigure);
    }
  } catch (const std::bad_alloc&) {
    Device::ReportAndThrow("out of memory");
  } catch (const std::exception& error) {
    Device::ReportAndThrow(error.what());
  }
}

Dly_SpeedController::~Dly_SpeedController() = default;

double Dly_SpeedController::GetBelDelay(const Port::StringBase& key,
                                        const Pds_PdmBlock* /*block*/) const {
  const auto index = Device::FindKeyword(key.View());
  return index ? data_->figures[*index] : kNoFigure;
}
