#pragma once

#include "fileio/export.h"

#include <string>
#include <utility>
#include <vector>

namespace foundation::core::except {

// A message of the host's catalog: component ("KESTRA:FileIO"), key ("Errno") and the arguments
// that fill its text. A plain value.
class FILEIO_API BaseMsgID {
public:
    BaseMsgID(std::string componentText, std::string keyText,
              std::vector<std::string> argumentTexts = {})
        : component(std::move(componentText)),
          key(std::move(keyText)),
          arguments(std::move(argumentTexts)) {}
    BaseMsgID(const BaseMsgID&) = default;
    BaseMsgID(BaseMsgID&&) = default;
    BaseMsgID& operator=(const BaseMsgID&) = default;
    BaseMsgID& operator=(BaseMsgID&&) = default;
    virtual ~BaseMsgID() = default;

    const std::string& GetComponent() const { return component; }
    const std::string& GetKey() const { return key; }
    const std::vector<std::string>& GetArguments() const { return arguments; }
    // Component and key joined by a colon: "KESTRA:FileIO:Errno".
    std::string GetIdentifier() const { return component + ':' + key; }

private:
    std::string component;
    std::string key;
    std::vector<std::string> arguments;
};

}  // namespace foundation::core::except
