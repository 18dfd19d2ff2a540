#include <EntryList.h>

BEntryList::~BEntryList() = default;
