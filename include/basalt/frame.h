/// @file
/// Environment queries: operating-system and handheld codes, language, display and two small utilities.
#ifndef BASALT_FRAME_H
#define BASALT_FRAME_H

#include <cstdint>

#include "basalt/export.h"

/// Operating-system release code. Codes compare by magnitude; there is no code 8.
using basalt_os = std::uint32_t;
/// Handheld platform code; 0 is not determined, 1 the desktop.
using basalt_hh = std::uint32_t;
/// Language setting; 15 is the default.
using basalt_language = std::uint32_t;

BASALT_API basalt_os _operatingsystem();
BASALT_API int _operatingsystemversion();
BASALT_API basalt_hh _handheldVersion();
BASALT_API bool _isNewLumoOS();
BASALT_API bool _handheldCanHaveInBuildKV7Radio();
BASALT_API bool _handheldCanHaveInBuildModem();
BASALT_API bool _handheldCanHaveInBuildKestraRTK();
BASALT_API bool _isDefaultFontSize();
BASALT_API double _checkForHighResolution();
BASALT_API basalt_language _languageVersion();
BASALT_API void _setLanguageVersion(basalt_language language);
BASALT_API int _taskbarheight();
BASALT_API std::uint16_t _random_uint16();
BASALT_API void _reversebytes(void* data, std::uint32_t count);

#endif
