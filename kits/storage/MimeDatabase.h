// The files that hold the records of MIME types (docs/mime.md). Internal to the storage kit.
#pragma once

#include <MimeRecord.h>

#include <functional>

// Every function works on the files as they are now. A file that is damaged counts as missing. Any thread,
// any number of processes: changes exclude one another, and a reader sees a record either before or after a
// change.
class MimeDatabase {
  public:
    // B_ENTRY_NOT_FOUND when the type has no record.
    [[nodiscard]] static status_t Read(std::string_view type, MimeRecord& record);

    // Calls `change` with the record as it is (or an empty one) and stores what it makes of it, unless it
    // fails. B_TIMED_OUT when another process holds the database for ten seconds.
    static status_t Change(std::string_view type, const std::function<status_t(MimeRecord& record)>& change);

    // B_OK as well when there is none.
    static status_t Remove(std::string_view type);

    // The types that have a record, sorted.
    [[nodiscard]] static status_t List(std::vector<std::string>& types);

    // Moves with every change of any record by any process; 0 while there is no database.
    static int64 ChangeTime();
};
