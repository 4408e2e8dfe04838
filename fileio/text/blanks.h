#pragma once

#include "fileio/host/text.h"

#include <array>

namespace Orvandeil::FileIO::detail {

// The host's breakable spaces, asked about once as far as they are ASCII.
class Blanks {
public:
    bool has(char16_t unit) const {
        return unit < ascii.size() ? ascii[unit] : qzu_isbreakablespace(unit);
    }

private:
    using Answers = std::array<bool, 0x80>;

    static const Answers& asciiAnswers() {
        static const Answers answers = [] {
            Answers asked{};
            for (char16_t unit = 0; unit < asked.size(); ++unit)
                asked[unit] = qzu_isbreakablespace(unit);
            return asked;
        }();
        return answers;
    }

    const Answers& ascii = asciiAnswers();
};

}  // namespace Orvandeil::FileIO::detail
