#include "SongTable.h"

#include "metadata/MusicAttributes.h"
#include <Node.h>
#include <TypeConstants.h>
#include <algorithm>

namespace {

constexpr std::array<const char*, 6> kTitles = {"File", "No", "Disc", "Artist", "Album", "Songname"};
constexpr std::array<const char*, 6> kAttributes = {nullptr,          kAttributeTrackNo, kAttributeDisc,
                                                    kAttributeArtist, kAttributeAlbum,   kAttributeSongname};

std::string TextAttribute(BNode& node, const char* name) {
    std::array<char, kTextFieldSize> text{};
    const ssize_t size = node.ReadAttr(name, B_STRING_TYPE, 0, text.data(), text.size() - 1);
    return size > 0 ? std::string(text.data()) : std::string();
}

} // namespace

void SongTable::Add(const entry_ref& ref, const std::string& path) {
    Row row;
    row.path = path;
    row.cells[0] = ref.name;
    BNode node(&ref);
    for (std::size_t column = 1; column < kColumns; ++column)
        row.cells[column] = TextAttribute(node, kAttributes[column]);
    mRows.push_back(std::move(row));
}

void SongTable::Print() {
    if (mOutput.IsJson()) {
        for (const Row& row : mRows) {
            JsonObject object;
            object.Bytes("path", row.path);
            for (std::size_t column = 1; column < kColumns; ++column)
                object.Bytes(kTitles[column], row.cells[column]);
            mOutput.Line(object.Take());
        }
        return;
    }
    std::array<std::size_t, kColumns> widths{};
    for (std::size_t column = 0; column < kColumns; ++column) {
        widths[column] = DisplayWidth(kTitles[column]);
        for (const Row& row : mRows)
            widths[column] = std::max(widths[column], DisplayWidth(Printable(row.cells[column])));
    }
    const auto line = [&](const auto& cell) {
        std::string text;
        for (std::size_t column = 0; column < kColumns; ++column)
            text += (column == 0 ? "" : "  ") + Padded(cell(column), widths[column]);
        text.erase(text.find_last_not_of(' ') + 1);
        mOutput.Line(text);
    };
    line([](std::size_t column) { return std::string(kTitles[column]); });
    for (const Row& row : mRows)
        line([&](std::size_t column) { return Printable(row.cells[column]); });
}
