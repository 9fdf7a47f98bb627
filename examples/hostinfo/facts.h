// The library's results, by name.
#ifndef HOSTINFO_FACTS_H
#define HOSTINFO_FACTS_H

#include <basalt/platform.h>

#include <optional>
#include <string>
#include <variant>
#include <vector>

struct Options {
    std::optional<std::string> root;     ///< folder
    std::optional<std::string> product;  ///< folder
    std::optional<std::string> path;     ///< to be taken apart; the program's own otherwise
};

struct Fact {
    std::string name;
    std::variant<CString, long, bool, std::vector<CString>> value;
};

struct Section {
    std::string name;
    std::vector<Fact> facts;
};

/// Configures the library from the options, as a host does at its start, and collects all results.
std::vector<Section> gather_facts(const Options& options);

#endif
