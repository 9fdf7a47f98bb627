// All commands.
#ifndef TOOLS_COMMANDS_H
#define TOOLS_COMMANDS_H

#include <span>
#include <string_view>

#include "command.h"

/// @name coordinates.cpp
/// @{
extern const Command XYZ2LLH;
extern const Command LLH2XYZ;
extern const Command NEU;
/// @}
/// @name geodesics.cpp
/// @{
extern const Command DIRECT;
extern const Command INVERSE_GEODESIC;
extern const Command DISTANCE;
extern const Command BEARING;
extern const Command CROSSTRACK;
/// @}
/// @name observations.cpp
/// @{
extern const Command REDUCE;
extern const Command OBSERVE;
/// @}
/// @name units.cpp
/// @{
extern const Command DMS;
extern const Command FTIN;
/// @}
/// @name times.cpp
/// @{
extern const Command MJD;
extern const Command GPS;
extern const Command JAVATIME;
/// @}
/// @name texts.cpp
/// @{
extern const Command HEX;
extern const Command UNHEX;
extern const Command PATH;
/// @}
/// @name colours.cpp
/// @{
extern const Command PALETTE;
/// @}
/// @name regions.cpp
/// @{
extern const Command AREA;
extern const Command CONTAINS;
/// @}

/// The commands in the order of the help. A further one is declared above, and listed in commands.cpp.
std::span<const Command* const> commands();

/// The command of this name. InputError if there is none.
const Command& command_named(std::string_view name);

#endif
