// Which files a list holds rows of, found without walking the list.
#pragma once

#include <EntryRef.h>

#include <cstddef>
#include <unordered_map>

// Counts the rows of each file: the same device, directory and name. Not synchronised.
class ListedRefs {
  public:
    bool Has(const entry_ref& ref) const { return mRows.find(ref) != mRows.end(); }
    void Add(const entry_ref& ref) { ++mRows[ref]; }
    // Nothing when it is not in here.
    void Remove(const entry_ref& ref);
    void Clear() { mRows.clear(); }

  private:
    struct Hash {
        size_t operator()(const entry_ref& ref) const;
    };
    std::unordered_map<entry_ref, int, Hash> mRows;
};
