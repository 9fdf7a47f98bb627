// The facts as text, as JSON, and in a log.
#ifndef HOSTINFO_REPORT_H
#define HOSTINFO_REPORT_H

#include <string>
#include <vector>

#include "facts.h"

/// One line a fact, under a heading for each section.
CString text_report(const std::vector<Section>& sections);

/// An object of objects, in ASCII whatever the locale.
CString json_report(const std::vector<Section>& sections);

/// A text in the encoding of the environment's locale.
std::string narrow(const CString& text);

/// Writes a text into a log file. std::runtime_error, naming it, when it does not arrive there.
void write_log(const std::string& path, const CString& text);

#endif
