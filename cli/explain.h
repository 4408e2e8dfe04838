#pragma once

#include "cli/command_line.h"
#include "cli/report.h"

#include <string>

namespace cli {

// One kind of text that `explain` knows. A kind is one function and one line in the table of
// explain.cc.
using Explain = void(const std::string& text, const CommandLine& line, Report& report);

Explain explainPermission;
Explain explainMachineFormat;
Explain explainPrecision;
Explain explainSize;
Explain explainSkip;
Explain explainOutputFormat;
Explain explainScanFormat;
Explain explainCode;

// Whether an attribute validates; the report takes the error that it raises.
template <class Attribute>
bool tellValidity(const Attribute& attribute, Report& report) {
    bool valid = true;
    try {
        attribute.Validate();
    } catch (const foundation::core::except::IMsgIDException& error) {
        report.fail(error);
        valid = false;
    }
    if (report.isJson()) report.key("valid", valid);
    return valid;
}

}  // namespace cli
