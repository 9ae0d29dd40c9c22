#include <utility>

#include "host/Port_Exception.h"

namespace Port {

Exception::Exception(StringBase category, StringBase message)
    : category_(std::move(category)), message_(std::move(message)) {}

Exception::~Exception() = default;

}  // namespace Port
