#include "fileio/errors/identifiers.h"
#include "fileio/host/exception.h"
#include "tests/layout/slots.h"

namespace {

using foundation::core::except::IMsgIDException;
using Concrete = foundation::core::except::Exception<KESTRA::FileIO::Errno, std::exception>;

TEST(Layout, Exceptions) {
    layout::expectSlots(0, SLOTS(IMsgIDException, clone, rethrow));
    layout::expectSlots(4, SLOTS(IMsgIDException, what, GetID, GetBaseMsgIDObj));
    layout::expectSlots(0, SLOTS(Concrete, clone, rethrow));
    layout::expectSlots(4, SLOTS(Concrete, what, GetID, GetBaseMsgIDObj));

    const Concrete error{KESTRA::FileIO::Errno("text")};
    const void* whole = &error;
    EXPECT_EQ(static_cast<const IMsgIDException*>(&error), whole);
    EXPECT_GT(static_cast<const void*>(static_cast<const std::exception*>(&error)), whole);
}

}  // namespace
