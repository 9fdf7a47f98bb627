#include "commands.h"

#include <string>

#include "input_error.h"
#include "number_parsing.h"

namespace {

const Command* const COMMANDS[] = {
    &XYZ2LLH, &LLH2XYZ, &NEU, &DIRECT,   &DISTANCE, &BEARING, &CROSSTRACK, &CONTAINS, &DMS,
    &FTIN,    &MJD,     &GPS, &JAVATIME, &HEX,      &UNHEX,   &PATH,       &PALETTE,
};

}  // namespace

std::span<const Command* const> commands() {
    return COMMANDS;
}

const Command& command_named(std::string_view name) {
    for (const Command* command : COMMANDS) {
        if (command->name == name) {
            return *command;
        }
    }
    throw InputError("unknown command " + quoted(name) + " (--help lists them)");
}
