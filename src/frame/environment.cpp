#include <cstdlib>

#include "basalt/frame.h"
#include "src/frame/environment_state.h"
#include "src/frame/os_detection.h"
#include "src/platform/clock.h"

using basalt::frame::environment;

namespace basalt::frame {

constinit EnvironmentState environment;

}  // namespace basalt::frame

basalt_os _operatingsystem() {
    if (environment.os_code.load() == 0) {
        basalt::frame::detect_operating_system();
    }
    return environment.os_code.load();
}

int _operatingsystemversion() {
    if (environment.os_version_number.load() == 0) {
        basalt::frame::detect_operating_system();
    }
    return environment.os_version_number.load();
}

basalt_hh _handheldVersion() {
    constexpr basalt_hh DESKTOP = 1;
    if (environment.handheld_code.load() == 0) {
        environment.handheld_code.store(DESKTOP);
    }
    return environment.handheld_code.load();
}

bool _isNewLumoOS() {
    switch (_handheldVersion()) {
        case 6:
        case 13:
            return environment.new_generation.load();
        default:
            return false;
    }
}

bool _handheldCanHaveInBuildKV7Radio() {
    switch (_handheldVersion()) {
        case 5:
        case 6:
        case 8:
            return true;
        default:
            return false;
    }
}

bool _handheldCanHaveInBuildModem() {
    switch (_handheldVersion()) {
        case 3:
        case 7:
        case 10:
        case 11:
        case 14:
            return true;
        default:
            return false;
    }
}

bool _handheldCanHaveInBuildKestraRTK() {
    switch (_handheldVersion()) {
        case 7:
            return true;
        case 11:
            return environment.rtk_option.load();
        default:
            return false;
    }
}

bool _isDefaultFontSize() {
    const basalt_hh code = _handheldVersion();
    return code != 8 && code != 9;
}

double _checkForHighResolution() {
    if (environment.resolution_factor.load() == basalt::frame::RESOLUTION_NOT_DETERMINED) {
        environment.resolution_factor.store(1.0);
    }
    return environment.resolution_factor.load();
}

basalt_language _languageVersion() {
    const basalt_language stored = environment.language.load();
    return stored == 0 ? basalt::frame::DEFAULT_LANGUAGE : stored;
}

void _setLanguageVersion(basalt_language language) {
    environment.language.store(language);
}

int _taskbarheight() {
    return 26;
}

std::uint16_t _random_uint16() {
    const DWORD tick = GetTickCount();
    if (tick != environment.last_random_seed.load()) {
        environment.last_random_seed.store(tick);
        std::srand(tick);
    }
    return static_cast<std::uint16_t>(std::rand() % 65535);
}
