// Points, from lines and from operands.
#ifndef TOOLS_POINTS_H
#define TOOLS_POINTS_H

#include <basalt/geo.h>

#include <string>

#include "fields.h"
#include "format.h"
#include "input_error.h"
#include "number_parsing.h"

/// Latitude and longitude.
inline geo_llh read_place(Fields& fields) {
    const double latitude = fields.latitude();
    return {latitude, fields.longitude(), 0.0};
}

/// An operand with fields between commas, in both formats; `name` appears in the InputError.
template <typename Read>
auto read_operand(const std::string& operand, const std::string& name, const Format& format, Read read) {
    Format with_commas = format;
    with_commas.csv = true;
    Fields fields(operand, with_commas);
    try {
        const auto point = read(fields);
        if (!fields.ended()) {
            throw InputError("expected its end, not " + quoted(fields.rest()));
        }
        return point;
    } catch (const InputError& error) {
        throw InputError(name + " " + quoted(operand) + ": " + error.what());
    }
}

#endif
