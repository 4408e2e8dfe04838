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

// How the embedded host lays out an array. Of the last five members those are in use that the
// class asks for.
struct vxArray {
    vxClassID classID = vxUNKNOWN_CLASS;
    std::string className;
    Orvandeil::FileIO::embedded::Dimensions dimensions;

    std::unique_ptr<void, HostBlockDestroyer> real;
    std::unique_ptr<void, HostBlockDestroyer> imaginary;
    std::vector<Orvandeil::FileIO::embedded::StringElement> texts;
    std::vector<Orvandeil::FileIO::embedded::ArrayPtr> contents;  // of a cell, or by field
    std::vector<std::string> fields;
    // Of an object that was made with them; it then answers by nothing else.
    std::optional<Orvandeil::FileIO::embedded::FunctionTable> functions;
};
