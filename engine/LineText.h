// Lines of a trace, as printf makes them in the C locale, and several times as fast.
//
// Tested by line_text_test.cpp.
#ifndef VORKEL_ENGINE_LINETEXT_H_
#define VORKEL_ENGINE_LINETEXT_H_

#include <cstdarg>

namespace Ip {

// Writes to [to, end) what printf makes of a format and its arguments, without a terminating 0, and
// returns the end of it. Null, with anything in [to, end), when that has no room, or is left to
// printf: formats with other conversions than %c, %d, %s, %u, %f and %N.3f of an N up to 5, and
// numbers that WriteFixed3 and WriteFixed6 leave to it.
char* WriteLine(char* to, const char* end, const char* format, std::va_list arguments);

}  // namespace Ip

#endif  // VORKEL_ENGINE_LINETEXT_H_
