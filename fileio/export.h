#pragma once

// The library is compiled with hidden visibility. Whatever carries this mark is part of its
// contract: what it offers to hosts, and (in fileio/host) what it asks of them.
#define FILEIO_API __attribute__((visibility("default")))
