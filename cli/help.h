#pragma once

#include "cli/verb.h"

#include <string>

namespace cli {

std::string programHelp();
std::string verbHelp(const Verb& verb);
std::string versionText();

}  // namespace cli
