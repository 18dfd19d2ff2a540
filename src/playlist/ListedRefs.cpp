#include "playlist/ListedRefs.h"

#include <functional>
#include <string_view>

size_t ListedRefs::Hash::operator()(const entry_ref& ref) const {
    const std::string_view name = ref.name != nullptr ? ref.name : "";
    // The odd constant spreads directory numbers, which mostly follow each other.
    const size_t place = std::hash<long long>()(ref.device) ^
                         (static_cast<size_t>(ref.directory) * size_t{0x9E3779B97F4A7C15});
    return std::hash<std::string_view>()(name) ^ place;
}

void ListedRefs::Remove(const entry_ref& ref) {
    const auto found = mRows.find(ref);
    if (found != mRows.end() && --found->second == 0)
        mRows.erase(found);
}
