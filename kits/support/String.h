// BString: a text that owns its bytes.
#pragma once

#include <SupportDefs.h>

#include <string>

// A growing byte string, always terminated. Lengths, offsets and positions count bytes from 0 (not
// characters), except where a name says Chars. Comparing and searching compare bytes; the methods that begin
// with I take ASCII letters of either case for the same. Null pointers count as empty texts. An offset
// outside the string changes nothing and finds nothing; a length that reaches past the end is cut. A plain
// value: not synchronised, and every copy is its own.
class BString {
  public:
    BString() = default;
    BString(const char* text);
    BString(const BString& other) = default;
    BString(BString&& other) noexcept = default;
    // At most `maxLength` bytes of `text`; a negative length takes all of it.
    BString(const char* text, int32 maxLength);
    ~BString() = default;

    const char* String() const { return mText.c_str(); }
    int32 Length() const { return static_cast<int32>(mText.size()); }
    bool IsEmpty() const { return mText.empty(); }
    // The number of UTF-8 characters.
    int32 CountChars() const;
    // The number of bytes that `charCount` characters from character `fromCharOffset` on take.
    int32 CountBytes(int32 fromCharOffset, int32 charCount) const;
    operator const char*() const { return mText.c_str(); }

    BString& operator=(const BString& other) = default;
    BString& operator=(BString&& other) noexcept = default;
    BString& operator=(const char* text);
    BString& operator=(char c);
    BString& SetTo(const char* text);
    BString& SetTo(const char* text, int32 maxLength);
    BString& SetTo(const BString& other);
    BString& SetTo(const BString& other, int32 maxLength);
    BString& SetTo(char c, int32 count);
    BString& SetToFormat(const char* format, ...) __attribute__((format(printf, 2, 3)));
    // Takes the other's bytes and leaves it empty.
    BString& Adopt(BString& from);
    BString& Adopt(BString& from, int32 maxLength);

    BString& CopyInto(BString& into, int32 fromOffset, int32 length) const;
    // `into` has room for `length` bytes; it is not terminated when they are all used.
    void CopyInto(char* into, int32 fromOffset, int32 length) const;

    BString& operator+=(const BString& other);
    BString& operator+=(const char* text);
    BString& operator+=(char c);
    BString& Append(const BString& other);
    BString& Append(const char* text);
    BString& Append(const BString& other, int32 length);
    BString& Append(const char* text, int32 length);
    BString& Append(char c, int32 count);

    BString& Prepend(const char* text);
    BString& Prepend(const BString& other);
    BString& Prepend(const char* text, int32 length);
    BString& Prepend(const BString& other, int32 length);
    BString& Prepend(char c, int32 count);

    BString& Insert(const char* text, int32 position);
    BString& Insert(const char* text, int32 length, int32 position);
    BString& Insert(const char* text, int32 fromOffset, int32 length, int32 position);
    BString& Insert(const BString& other, int32 position);
    BString& Insert(const BString& other, int32 length, int32 position);
    BString& Insert(const BString& other, int32 fromOffset, int32 length, int32 position);
    BString& Insert(char c, int32 count, int32 position);

    // `lazy` is accepted for the sake of the API; memory is kept either way.
    BString& Truncate(int32 newLength, bool lazy = true);
    BString& Remove(int32 from, int32 length);
    BString& RemoveFirst(const BString& text);
    BString& RemoveLast(const BString& text);
    BString& RemoveAll(const BString& text);
    BString& RemoveFirst(const char* text);
    BString& RemoveLast(const char* text);
    BString& RemoveAll(const char* text);
    // Removes every byte that occurs in the set.
    BString& RemoveSet(const char* setOfBytes);
    BString& MoveInto(BString& into, int32 from, int32 length);
    void MoveInto(char* into, int32 from, int32 length);

    bool operator<(const BString& other) const { return Compare(other) < 0; }
    bool operator<=(const BString& other) const { return Compare(other) <= 0; }
    bool operator==(const BString& other) const { return Compare(other) == 0; }
    bool operator>=(const BString& other) const { return Compare(other) >= 0; }
    bool operator>(const BString& other) const { return Compare(other) > 0; }
    bool operator!=(const BString& other) const { return Compare(other) != 0; }
    bool operator<(const char* text) const { return Compare(text) < 0; }
    bool operator<=(const char* text) const { return Compare(text) <= 0; }
    bool operator==(const char* text) const { return Compare(text) == 0; }
    bool operator>=(const char* text) const { return Compare(text) >= 0; }
    bool operator>(const char* text) const { return Compare(text) > 0; }
    bool operator!=(const char* text) const { return Compare(text) != 0; }

    // Negative, 0 or positive, by the bytes as unsigned numbers; `length` limits how many are looked at.
    int Compare(const BString& other) const;
    int Compare(const char* text) const;
    int Compare(const BString& other, int32 length) const;
    int Compare(const char* text, int32 length) const;
    int ICompare(const BString& other) const;
    int ICompare(const char* text) const;
    int ICompare(const BString& other, int32 length) const;
    int ICompare(const char* text, int32 length) const;

    // The offset of the first or last occurrence, or B_ERROR. FindLast with `beforeOffset` looks at
    // occurrences that end at or before it. A null text answers B_BAD_VALUE.
    int32 FindFirst(const BString& text) const;
    int32 FindFirst(const char* text) const;
    int32 FindFirst(const BString& text, int32 fromOffset) const;
    int32 FindFirst(const char* text, int32 fromOffset) const;
    int32 FindFirst(char c) const;
    int32 FindFirst(char c, int32 fromOffset) const;
    int32 FindLast(const BString& text) const;
    int32 FindLast(const char* text) const;
    int32 FindLast(const BString& text, int32 beforeOffset) const;
    int32 FindLast(const char* text, int32 beforeOffset) const;
    int32 FindLast(char c) const;
    // The last occurrence at or before the offset.
    int32 FindLast(char c, int32 atOrBeforeOffset) const;
    int32 IFindFirst(const BString& text) const;
    int32 IFindFirst(const char* text) const;
    int32 IFindFirst(const BString& text, int32 fromOffset) const;
    int32 IFindFirst(const char* text, int32 fromOffset) const;
    int32 IFindLast(const BString& text) const;
    int32 IFindLast(const char* text) const;
    int32 IFindLast(const BString& text, int32 beforeOffset) const;
    int32 IFindLast(const char* text, int32 beforeOffset) const;

    bool StartsWith(const BString& text) const;
    bool StartsWith(const char* text) const;
    bool IStartsWith(const BString& text) const;
    bool IStartsWith(const char* text) const;
    bool EndsWith(const BString& text) const;
    bool EndsWith(const char* text) const;
    bool IEndsWith(const BString& text) const;
    bool IEndsWith(const char* text) const;

    BString& ReplaceFirst(char replaceThis, char withThis);
    BString& ReplaceLast(char replaceThis, char withThis);
    BString& ReplaceAll(char replaceThis, char withThis, int32 fromOffset = 0);
    BString& Replace(char replaceThis, char withThis, int32 maxReplaceCount, int32 fromOffset = 0);
    BString& ReplaceFirst(const char* replaceThis, const char* withThis);
    BString& ReplaceLast(const char* replaceThis, const char* withThis);
    BString& ReplaceAll(const char* replaceThis, const char* withThis, int32 fromOffset = 0);
    BString& Replace(const char* replaceThis, const char* withThis, int32 maxReplaceCount,
                     int32 fromOffset = 0);
    BString& IReplaceFirst(char replaceThis, char withThis);
    BString& IReplaceLast(char replaceThis, char withThis);
    BString& IReplaceAll(char replaceThis, char withThis, int32 fromOffset = 0);
    BString& IReplace(char replaceThis, char withThis, int32 maxReplaceCount, int32 fromOffset = 0);
    BString& IReplaceFirst(const char* replaceThis, const char* withThis);
    BString& IReplaceLast(const char* replaceThis, const char* withThis);
    BString& IReplaceAll(const char* replaceThis, const char* withThis, int32 fromOffset = 0);
    BString& IReplace(const char* replaceThis, const char* withThis, int32 maxReplaceCount,
                      int32 fromOffset = 0);
    // Replaces every byte of the set; with a text, every run of them.
    BString& ReplaceSet(const char* setOfBytes, char with);
    BString& ReplaceSet(const char* setOfBytes, const char* with);

    // ByteAt() answers 0 outside the string; the operators do not look.
    char ByteAt(int32 index) const;
    char operator[](int32 index) const { return mText[static_cast<size_t>(index)]; }
    char& operator[](int32 index) { return mText[static_cast<size_t>(index)]; }

    // Room for `maxLength` bytes and a terminator, beginning with the present text, to be written by hand.
    // UnlockBuffer() ends that and takes the first `length` bytes, or all up to the first zero when negative.
    char* LockBuffer(int32 maxLength);
    BString& UnlockBuffer(int32 length = -1);

    // ASCII letters alone.
    BString& ToLower();
    BString& ToUpper();
    BString& Capitalize();
    BString& CapitalizeEachWord();

    // Put `escapeWith` in front of every byte of the set, or take it away again.
    BString& CharacterEscape(const char* original, const char* setOfBytesToEscape, char escapeWith);
    BString& CharacterEscape(const char* setOfBytesToEscape, char escapeWith);
    BString& CharacterDeescape(const char* original, char escapeChar);
    BString& CharacterDeescape(char escapeChar);

    // Removes white space at both ends.
    BString& Trim();

    BString& operator<<(const char* text);
    BString& operator<<(const BString& text);
    BString& operator<<(char c);
    BString& operator<<(bool value);
    BString& operator<<(int value);
    BString& operator<<(unsigned int value);
    BString& operator<<(long value);
    BString& operator<<(unsigned long value);
    BString& operator<<(long long value);
    BString& operator<<(unsigned long long value);
    // With two digits after the point.
    BString& operator<<(float value);
    BString& operator<<(double value);

  private:
    std::string mText;
};

bool operator<(const char* text, const BString& string);
bool operator<=(const char* text, const BString& string);
bool operator==(const char* text, const BString& string);
bool operator>(const char* text, const BString& string);
bool operator>=(const char* text, const BString& string);
bool operator!=(const char* text, const BString& string);

BString operator+(const BString& first, const BString& second);
BString operator+(const BString& first, const char* second);
BString operator+(const char* first, const BString& second);

// For sorting arrays of strings: compare what the pointers point to.
int Compare(const BString& first, const BString& second);
int ICompare(const BString& first, const BString& second);
int Compare(const BString* first, const BString* second);
int ICompare(const BString* first, const BString* second);
