#pragma once

#include <Volume.h>
#include <cstddef>
#include <filesystem>
#include <functional>

/// A volume's jobs as the indexer runs them. What goes wrong ends the program with a line on standard error.
namespace bench {

enum class Job { index, strip };

/// Called with the number of files that the job has come to, over and over, on the caller's thread.
using JobWatcher = std::function<void(std::size_t files)>;

/// Files per second of one whole job on the volume, index writes included.
double RunJob(const BVolume& volume, Job job, std::size_t expected, const JobWatcher& watcher = {});

/// The large sample library.
void MakeLibrary(const std::filesystem::path& root, std::size_t count);

/// The only volume there is, which must hold attributes.
BVolume OnlyVolume();

/// Runs the work in a process of its own, so that it finds memory and caches as a fresh program does. Whether
/// it answered true.
bool Apart(const std::function<bool()>& work);

} // namespace bench
