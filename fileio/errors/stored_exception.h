#pragma once

#include "fileio/host/exception.h"

#include <exception>
#include <type_traits>

#include <boost/exception_ptr.hpp>
#include <boost/make_shared.hpp>

namespace Orvandeil::FileIO::detail {

// Stands for the error that raises an identifier without arguments, and makes it, text and all,
// when it is raised. Most stored errors never are.
template <class Id>
class DeferredError : public boost::exception_detail::clone_base {
public:
    const clone_base* clone() const override { return Error(Id()).clone(); }
    [[noreturn]] void rethrow() const override { throw Error(Id()); }

private:
    using Error = foundation::core::except::Exception<Id, std::exception>;
};

// The error that raises `id`, kept to be raised later, any number of times with its exact type.
template <class Id>
boost::exception_ptr storedException(const Id& id) {
    if constexpr (std::is_default_constructible_v<Id>) {
        static const boost::exception_ptr deferred(boost::make_shared<DeferredError<Id>>());
        return deferred;
    } else {
        // Thrown, since that is what keeps the type.
        try {
            throw foundation::core::except::Exception<Id, std::exception>(id);
        } catch (...) {
            return boost::current_exception();
        }
    }
}

}  // namespace Orvandeil::FileIO::detail
