#include "commands.h"

#include <algorithm>
#include <cstddef>
#include <iterator>
#include <numeric>
#include <string>
#include <vector>

#include "input_error.h"
#include "number_parsing.h"

namespace {

const Command* const COMMANDS[] = {
    &XYZ2LLH,  &LLH2XYZ,  &NEU,        &DIRECT, &INVERSE_GEODESIC,
    &DISTANCE, &BEARING,  &CROSSTRACK, &REDUCE, &OBSERVE,
    &AREA,     &CONTAINS, &DMS,        &FTIN,   &MJD,
    &GPS,      &JAVATIME, &HEX,        &UNHEX,  &PATH,
    &PALETTE,
};

/// Letters to insert, delete or replace to make one word of the other (V. Levenshtein, 1966).
std::size_t edits(std::string_view from, std::string_view to) {
    std::vector<std::size_t> row(to.size() + 1);
    std::iota(row.begin(), row.end(), std::size_t{0});
    for (const char c : from) {
        std::size_t diagonal = row[0]++;
        for (std::size_t i = 0; i < to.size(); ++i) {
            const std::size_t replaced = diagonal + (c != to[i] ? 1 : 0);
            diagonal = row[i + 1];
            row[i + 1] = std::min({replaced, diagonal + 1, row[i] + 1});
        }
    }
    return row.back();
}

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
    const Command* nearest = *std::min_element(
        std::begin(COMMANDS), std::end(COMMANDS),
        [name](const Command* a, const Command* b) { return edits(name, a->name) < edits(name, b->name); });
    const bool is_slip = edits(name, nearest->name) <= 2 && name.size() > 2;
    throw InputError("unknown command " + quoted(name) +
                     (is_slip ? ": did you mean " + std::string(nearest->name) + "?" : "") +
                     " (--help lists them)");
}
