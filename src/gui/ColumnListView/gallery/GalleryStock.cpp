#include "gui/ColumnListView/gallery/GalleryStock.h"

#include <algorithm>
#include <array>

namespace {

constexpr std::array<const char*, kStockParts> kParts = {
    "Bell",   "Bottom bracket", "Brake cable", "Brake lever", "Chain",      "Chain guard",
    "Crank",  "Fork",           "Handlebar",   "Hub",         "Inner tube", "Mudguard",
    "Pedals", "Pump",           "Rim",         "Saddle",
};

constexpr std::array<const char*, 7> kMakers = {
    "Alder & Son", "Birch Works", "cedar cycles", "Dogwood", "Elder Ltd", "Fjällbjörk", "Ginkgo",
};

constexpr std::array<const char*, 6> kNotes = {
    "",         "sold in pairs",           "order two weeks ahead, the maker is slow in spring",
    "last one", "for children's bicycles", "needs the small spanner from the drawer under the till",
};

// Spreads neighbouring numbers.
uint32 Mixed(int32 n, uint32 salt) {
    uint32 value = static_cast<uint32>(n) * 2654435761U + salt * 40503U;
    value ^= value >> 15;
    value *= 2246822519U;
    return value ^ (value >> 13);
}

template <size_t Count>
const char* Pick(const std::array<const char*, Count>& words, int32 n, uint32 salt) {
    return words[Mixed(n, salt) % Count];
}

// Blanks before it, so that sorting by text sorts by number.
std::string Padded(uint32 value, size_t digits) {
    std::string text = std::to_string(value);
    return std::string(digits - std::min(digits, text.size()), ' ') + text;
}

std::string Price(uint32 units, uint32 hundredths) {
    return Padded(units, 3) + (hundredths < 10 ? ".0" : ".") + std::to_string(hundredths);
}

} // namespace

const char* StockPart(int32 index) {
    return kParts[static_cast<size_t>(index % kStockParts)];
}

StockItem::StockItem(int32 n)
    : part(Pick(kParts, n, 1)), maker(Pick(kMakers, n, 2)),
      shelf(std::string(1, "ABCDE"[Mixed(n, 3) % 5]) + std::to_string(1 + Mixed(n, 4) % 9)),
      count(Padded(Mixed(n, 5) % 200, 3)), price(Price(1 + Mixed(n, 6) % 120, Mixed(n, 7) % 20 * 5)),
      note(Pick(kNotes, n, 8)) {}
