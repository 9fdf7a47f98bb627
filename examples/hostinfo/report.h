// The facts as text, as JSON, and in a log.
#ifndef HOSTINFO_REPORT_H
#define HOSTINFO_REPORT_H

#include <filesystem>
#include <string>
#include <vector>

#include "facts.h"

/// One line a fact, under a heading for each section.
CString text_report(const std::vector<Section>& sections);

/// An object of objects, in ASCII whatever the locale.
std::string json_report(const std::vector<Section>& sections);

/// A text in the encoding of the environment's locale.
std::string narrow(const CString& text);

/// The name under which the library has a file of a path: in UTF-8, `/` for either separator.
std::filesystem::path system_path(std::string path);

/// Writes a text into a log file. InputError for a device or a pipe, std::runtime_error when the file does
/// not hold the text afterwards.
void write_log(const std::string& path, const CString& text);

#endif
