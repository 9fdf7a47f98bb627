// System message texts.
#ifndef BASALT_SRC_PLATFORM_ERROR_MESSAGE_H
#define BASALT_SRC_PLATFORM_ERROR_MESSAGE_H

#include "basalt/platform/types.h"

DWORD FormatMessageW(DWORD flags, const void* source, DWORD code, DWORD language, wchar_t** buffer,
                     DWORD size, void* arguments);
void* LocalFree(void* memory);

#endif
