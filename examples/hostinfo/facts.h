// What the library answers, by name.
#ifndef HOSTINFO_FACTS_H
#define HOSTINFO_FACTS_H

#include <basalt/platform.h>

#include <string>
#include <variant>
#include <vector>

#include "options.h"

struct Fact {
    std::string name;
    std::variant<CString, long, bool, std::vector<CString>> value;
};

struct Section {
    std::string name;
    std::vector<Fact> facts;
};

/// Sets the library up from the options, as a host does at its start, and asks it everything.
std::vector<Section> gather_facts(const Options& options);

#endif
