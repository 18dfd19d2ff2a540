#pragma once

#include "Output.h"
#include <Entry.h>
#include <array>
#include <string>
#include <vector>

/// Songs with their fields as they stand on the files. Nothing is derived and nothing is written.
class SongTable {
  public:
    explicit SongTable(Output& output) : mOutput(output) {}

    void Add(const entry_ref& ref, const std::string& path);
    /// Columns as wide as their texts; as JSON, an object a song.
    void Print();

  private:
    static constexpr std::size_t kColumns = 6;
    struct Row {
        std::string path;
        std::array<std::string, kColumns> cells;
    };

    Output& mOutput;
    std::vector<Row> mRows;
};
