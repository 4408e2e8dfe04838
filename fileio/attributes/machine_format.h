#pragma once

#include "fileio/attributes/char_attr_validator.h"

namespace Orvandeil::FileIO {

// The byte order and integer layout of a binary file, as an index into the host's table of machine
// formats (fileio/host/data_sizes.h). In either case of its letters: "n" or "native" for the
// machine's own, "l", "b", "a", "s" for indices 0, 1, 5, 6, or the host's long name of an index.
class FILEIO_API MachineFormat
    : public CharAttrValidator<&dfltAttrEmpty, KESTRA::legacy_two_part::badmachformat_vx> {
public:
    // The machine's own format.
    MachineFormat();
    explicit MachineFormat(const char* name);
    MachineFormat(const MachineFormat&) = default;
    MachineFormat& operator=(const MachineFormat&) = default;
    MachineFormat& operator=(const char* name);

    // `text` stays as it is. A name that is none leaves the invalid last index, except that a
    // single blank leaves the index alone.
    bool Init(const char* name) override;
    // Raises the host's legacy error `errorMessageNumber`, not the identifier of the base.
    void Validate() const override;

    int errorMessageNumber = 34;
    int dataSizeType;

private:
    // A letter's index is its place minus 1. The blanks stand for indices that have no letter.
    static constexpr char m_FormatMap[9] = "nlb   as";

    static int indexOfLetter(char letter);
};

}  // namespace Orvandeil::FileIO
