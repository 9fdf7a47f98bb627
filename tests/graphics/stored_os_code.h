#ifndef BASALT_TESTS_GRAPHICS_STORED_OS_CODE_H
#define BASALT_TESTS_GRAPHICS_STORED_OS_CODE_H

#include "src/frame/environment_state.h"

// Stores an operating-system code while alive.
class StoredOsCode {
public:
    explicit StoredOsCode(int code) {
        basalt::frame::environment.os_code.store(static_cast<basalt_os>(code));
    }
    ~StoredOsCode() { basalt::frame::environment.os_code.store(0); }
    StoredOsCode(const StoredOsCode&) = delete;
    StoredOsCode& operator=(const StoredOsCode&) = delete;
};

#endif
