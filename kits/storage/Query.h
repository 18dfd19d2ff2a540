// BQuery: finds the files of a volume whose attributes satisfy a condition.
#pragma once

#include <EntryList.h>
#include <Messenger.h>

#include <memory>
#include <string>

class BEntry;
class BString;
class BVolume;

enum query_op {
    B_INVALID_OP = 0,
    B_EQ,
    B_GT,
    B_GE,
    B_LT,
    B_LE,
    B_NE,
    B_CONTAINS,
    B_BEGINS_WITH,
    B_ENDS_WITH,
    B_AND = 0x101,
    B_OR,
    B_NOT,
    _B_RESERVED_OP_ = 0x100000
};

// The condition is either given as a text (docs/queries.md) or pushed in reverse Polish order: an attribute,
// a value and the comparison; operands, then B_AND, B_OR or B_NOT. A pushed text is taken literally; in the
// text form `*`,
// `?` and `[` are wildcards.
//
// Order of use: volume and condition (and, for a live query, the target), Fetch(), then the entries. After
// Fetch() all of these are settled and setting one answers B_NOT_ALLOWED, until Clear(). One thread at a
// time.
class BQuery : public BEntryList {
  public:
    BQuery();
    BQuery(const BQuery&) = delete;
    BQuery& operator=(const BQuery&) = delete;
    ~BQuery() override;

    // Back to a fresh object; ends live updates.
    status_t Clear();

    // B_OK, B_NOT_ALLOWED after Fetch(), or B_BAD_VALUE for what can be no part of a condition. Whether the
    // parts fit together is found out by GetPredicate(), PredicateLength() and Fetch(), which take the pushed
    // parts.
    status_t PushAttr(const char* attribute);
    status_t PushOp(query_op op);
    status_t PushUInt32(uint32 value);
    status_t PushInt32(int32 value);
    status_t PushUInt64(uint64 value);
    status_t PushInt64(int64 value);
    // Finite numbers only.
    status_t PushFloat(float value);
    status_t PushDouble(double value);
    status_t PushString(const char* value, bool caseInsensitive = false);
    // A time in words, such as "yesterday" or "2001-02-03 04:05" (docs/queries.md), taken as it stands now.
    status_t PushDate(const char* date);

    status_t SetVolume(const BVolume* volume);
    // Replaces what was pushed. The text is looked at by Fetch(), which answers B_BAD_VALUE when it is
    // malformed.
    status_t SetPredicate(const char* expression);
    // Makes the query live: from Fetch() on the target gets B_QUERY_UPDATE messages with int32 "opcode"
    // (B_ENTRY_CREATED when a file begins to satisfy the condition, B_ENTRY_REMOVED when it ceases to),
    // string "name", int64 "directory", "device" and "node". An invalid messenger makes it not live.
    status_t SetTarget(BMessenger target);

    bool IsLive() const;
    // The condition as a text. B_NO_INIT when there is none, B_BAD_VALUE when the pushed parts do not fit or
    // the buffer is too small for the text and its terminating zero.
    status_t GetPredicate(char* buffer, size_t length);
    status_t GetPredicate(BString* predicate);
    // Bytes, the terminating zero included; 0 when there is no condition.
    size_t PredicateLength();
    // The volume's number; ~0 when there is none.
    dev_t TargetDevice() const;

    // B_NO_INIT without volume or condition, B_BAD_VALUE for a malformed condition or a volume that has gone,
    // B_NOT_ALLOWED the second time, B_UNSUPPORTED when the volume answers no queries.
    status_t Fetch();

    // In no particular order. B_FILE_ERROR before Fetch(), B_ENTRY_NOT_FOUND at the end. GetNextEntry()
    // passes over entries that cannot be reached: those whose directory has gone since or may not be
    // searched.
    status_t GetNextEntry(BEntry* entry, bool traverse = false) override;
    status_t GetNextRef(entry_ref* ref) override;
    int32 GetNextDirents(struct dirent* buffer, size_t length, int32 count = INT_MAX) override;
    status_t Rewind() override;
    // Always B_ERROR: the number is not known before the end.
    int32 CountEntries() override;

  private:
    struct State;
    std::unique_ptr<State> mState;
};
