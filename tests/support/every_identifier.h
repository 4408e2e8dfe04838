#pragma once

#include "fileio/host/message_id.h"

#include <string>
#include <vector>

namespace support {

// One object of every identifier that the library raises or warns with. Its arguments are "first",
// "second", "third".
std::vector<foundation::core::except::BaseMsgID> everyIdentifier();

// The keys of the codes -1, -2, … in order.
const std::vector<std::string>& codedKeys();

}  // namespace support
