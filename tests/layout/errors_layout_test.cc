#include "fileio/errors/identifiers.h"
#include "fileio/host/exception.h"
#include "tests/layout/slots.h"

namespace {

using foundation::core::except::Exception;
using foundation::core::except::IMsgIDException;

template <class E>
std::vector<layout::Place> exceptionPlaces() {
    return {SLOT(0, E, clone), SLOT(1, E, rethrow), SLOT(4, E, what), SLOT(5, E, GetID),
            SLOT(6, E, GetBaseMsgIDObj)};
}

TEST(Layout, Exceptions) {
    using Concrete = Exception<KESTRA::FileIO::Errno, std::exception>;
    layout::expectPlaces(exceptionPlaces<IMsgIDException>());
    layout::expectPlaces(exceptionPlaces<Concrete>());

    const Concrete error{KESTRA::FileIO::Errno("text")};
    const auto* whole = reinterpret_cast<const char*>(&error);
    const auto* asInterface =
        reinterpret_cast<const char*>(static_cast<const IMsgIDException*>(&error));
    const auto* asStandard =
        reinterpret_cast<const char*>(static_cast<const std::exception*>(&error));
    EXPECT_EQ(asInterface, whole);
    EXPECT_GT(asStandard, asInterface);
}

}  // namespace
