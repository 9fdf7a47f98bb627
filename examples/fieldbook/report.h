// The tables a surveyor reads, and the same points for a machine.
#ifndef FIELDBOOK_REPORT_H
#define FIELDBOOK_REPORT_H

#include <string>

#include "results.h"

std::string write_report(const Results& results);

/// One line a point: metres and decimal degrees, empty fields where a point has none.
std::string write_csv(const Results& results);

#endif
