// The report an engineer reads.
#ifndef WORKAREA_REPORT_H
#define WORKAREA_REPORT_H

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "survey.h"
#include "work_area.h"

struct Options {
    std::string terrain;  ///< path; empty with synthetic
    std::optional<std::int64_t> synthetic;
    std::optional<std::string> boundary;
    std::optional<DegreeBox> view;
    std::optional<double> grade;  ///< metres
    std::optional<std::string> picture;
    bool legend = false;
};

/// A picture that was drawn.
struct PictureSize {
    int width;  ///< pixels
    int height;
    double metres_per_pixel;  ///< of its map
};

/// Everything the report speaks of.
struct Outcome {
    const Options& options;
    const WorkArea& area;
    const std::vector<geo_nee>& boundary;  ///< in the local plane; empty without one
    CellBox view;
    Survey survey;
    double load_seconds;
    double visit_seconds;
    std::optional<std::int64_t> memory_grown;  ///< resident bytes, by loading
    std::optional<PictureSize> picture;
};

std::string write_report(const Outcome& outcome);

#endif
