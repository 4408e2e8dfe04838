#pragma once

#include "embedded/builtins/code_error.h"
#include "fileio/host/exception.h"

#include <string>

namespace fileio_tests {

// The identifier that `run` raises and the arguments it carries, with blanks between; empty when
// nothing is raised.
template <class Run>
std::string raisedBy(Run run) {
    try {
        run();
    } catch (const foundation::core::except::IMsgIDException& error) {
        std::string raised = error.GetID();
        for (const std::string& argument : error.GetBaseMsgIDObj().GetArguments())
            raised += ' ' + argument;
        return raised;
    }
    return "";
}

// The code that a built-in ends with; 0 when it does its work.
template <class Run>
int codeOf(Run run) {
    try {
        run();
    } catch (const Orvandeil::FileIO::embedded::CodeError& error) {
        return error.code;
    }
    return 0;
}

}  // namespace fileio_tests
