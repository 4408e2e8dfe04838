#pragma once

#include "embedded/services/array.h"
#include "fileio/host/memory.h"

#include <memory>
#include <optional>
#include <string>
#include <vector>

struct HostBlockDestroyer {
    void operator()(void* block) const noexcept { vxMemoryFree(block); }
};

// What cells, structs and objects have beside their dimensions. Of the members behind the name
// those are in use that the class asks for.
struct ArrayContents {
    std::string className;
    std::vector<Orvandeil::FileIO::embedded::StringElement> texts;
    std::vector<Orvandeil::FileIO::embedded::ArrayPtr> arrays;  // of a cell, or by field
    std::vector<std::string> fields;
    // Of an object that was made with them; it then answers by nothing else.
    std::optional<Orvandeil::FileIO::embedded::FunctionTable> functions;
};

// How the embedded host lays out an array. It is small: a print of many texts is a walk over them.
struct vxArray {
    vxClassID classID = vxUNKNOWN_CLASS;
    Orvandeil::FileIO::embedded::Dimensions dimensions;
    std::unique_ptr<void, HostBlockDestroyer> real;
    std::unique_ptr<void, HostBlockDestroyer> imaginary;
    std::unique_ptr<ArrayContents> contents;  // null for numbers, logicals and characters
};
