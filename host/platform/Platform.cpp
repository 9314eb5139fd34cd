#include "platform/Platform.h"

#include <cerrno>
#include <new>
#include <system_error>

// What is the same on every system.

namespace acd::platform {

void raiseSystemError() {
    if (errno == ENOMEM) {
        throw std::bad_alloc();
    }
    throw ReadError(std::generic_category().message(errno));
}

} // namespace acd::platform
