// The exception that host services throw when an object cannot be built.
#ifndef VORKEL_HOST_PORT_EXCEPTION_H_
#define VORKEL_HOST_PORT_EXCEPTION_H_

#include <exception>

#include "host/Port_StringBase.h"

namespace Port {

class Exception : public std::exception {
 public:
  Exception(StringBase category, StringBase message);
  ~Exception() override;

  const StringBase& Category() const { return category_; }
  const StringBase& Message() const { return message_; }
  const char* what() const noexcept override { return message_.CStr(); }

 private:
  StringBase category_;
  StringBase message_;
};

}  // namespace Port

#endif  // VORKEL_HOST_PORT_EXCEPTION_H_
