#pragma once

#include "fileio/host/exception.h"

#include <exception>

#include <boost/exception_ptr.hpp>

namespace Orvandeil::FileIO::detail {

// The error that raises `id`, kept to be raised later. It is thrown and caught again because that
// is what keeps its exact type through every later rethrow.
template <class Id>
boost::exception_ptr storedException(const Id& id) {
    try {
        throw foundation::core::except::Exception<Id, std::exception>(id);
    } catch (...) {
        return boost::current_exception();
    }
}

}  // namespace Orvandeil::FileIO::detail
