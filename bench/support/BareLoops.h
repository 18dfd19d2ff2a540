#pragma once

#include <cstddef>
#include <string>

/// One-thread loops of plain system calls over a tree of MP3 files: what the jobs are measured against.
namespace bench {

/// Files that were visited.
struct Visited {
    std::size_t files = 0;
};

/// Walks the tree, opens every *.mp3 and writes the seven attributes of a tagged file with fsetxattr.
Visited BareTag(const std::string& root);
/// The same with seven fgetxattr.
Visited BareRead(const std::string& root);
/// The same with the seventeen fremovexattr of the strip job.
Visited BareStrip(const std::string& root);

} // namespace bench
