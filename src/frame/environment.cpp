#include <algorithm>
#include <cstdlib>
#include <initializer_list>

#include "basalt/frame.h"
#include "src/frame/environment_state.h"
#include "src/frame/os_detection.h"
#include "src/platform/clock.h"

using basalt::frame::environment;

namespace basalt::frame {

constinit EnvironmentState environment;

}  // namespace basalt::frame

namespace {

bool is_handheld(std::initializer_list<basalt_hh> codes) {
    return std::find(codes.begin(), codes.end(), _handheldVersion()) != codes.end();
}

}  // namespace

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
    return is_handheld({6, 13}) && environment.new_generation.load();
}

bool _handheldCanHaveInBuildKV7Radio() {
    return is_handheld({5, 6, 8});
}

bool _handheldCanHaveInBuildModem() {
    return is_handheld({3, 7, 10, 11, 14});
}

bool _handheldCanHaveInBuildKestraRTK() {
    return is_handheld({7}) || (is_handheld({11}) && environment.rtk_option.load());
}

bool _isDefaultFontSize() {
    return !is_handheld({8, 9});
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
