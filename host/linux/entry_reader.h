#pragma once

#include "host/api/file_system.h"
#include "host/linux/descriptor.h"
#include "host/linux/directory_stream.h"

namespace host {

/// Reads a directory through a descriptor of its own.
class EntryReader final : public DirectoryReader {
  public:
    explicit EntryReader(Descriptor directory)
        : directory_(std::move(directory)), stream_(directory_.get()) {}

    Status next(Entry& entry) override;
    Status rewind() override;

  private:
    const Descriptor directory_;
    DirectoryStream stream_;
};

} // namespace host
