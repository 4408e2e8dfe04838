#pragma once

#include "fileio/host/message_id.h"

#include <string>

// The errors of NumPy files. Their arguments are the file's name and what is the matter.
namespace KESTRA::npy {

#define NPY_IDENTIFIER(Name)                                                                \
    class FILEIO_API Name : public ::foundation::core::except::BaseMsgID {                  \
    public:                                                                                 \
        Name(const std::string& file, const std::string& detail)                            \
            : ::foundation::core::except::BaseMsgID("KESTRA:npy", #Name, {file, detail}) {} \
    };

NPY_IDENTIFIER(cannotRead)        // the system's text
NPY_IDENTIFIER(cannotWrite)       // the system's text
NPY_IDENTIFIER(badHeader)         // the reason
NPY_IDENTIFIER(truncated)         // what of the file is missing
NPY_IDENTIFIER(unsupportedType)   // the type as the file describes it
NPY_IDENTIFIER(unsupportedClass)  // the class of the array

#undef NPY_IDENTIFIER

}  // namespace KESTRA::npy
