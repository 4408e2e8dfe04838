#pragma once

#include "benchmarks/context.h"
#include "benchmarks/job.h"

#include <string>
#include <vector>

namespace bench {

// Add a peer that the interpreter runs, if there is one. The call names the script's function and
// gives its arguments.
void addPython(std::vector<Contender>& contenders, Context& context, const std::string& peer,
               const std::vector<std::string>& call);
void addR(std::vector<Contender>& contenders, Context& context,
          const std::vector<std::string>& call);

}  // namespace bench
