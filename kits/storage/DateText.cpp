#include <DateText.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <ctype.h>
#include <string>
#include <vector>

namespace {

constexpr std::array<std::string_view, 12> kMonths = {"jan", "feb", "mar", "apr", "may", "jun",
                                                      "jul", "aug", "sep", "oct", "nov", "dec"};
constexpr std::array<std::string_view, 12> kLongMonths = {"january",   "february", "march",    "april",
                                                          "may",       "june",     "july",     "august",
                                                          "september", "october",  "november", "december"};
constexpr std::array<std::string_view, 7> kWeekdays = {"sunday",   "monday", "tuesday", "wednesday",
                                                       "thursday", "friday", "saturday"};

std::vector<std::string> Words(std::string_view text) {
    std::vector<std::string> words(1);
    for (char c : text) {
        bool isSeparator = c == ' ' || c == '\t' || c == ',';
        if (!isSeparator)
            words.back() += static_cast<char>(tolower(static_cast<unsigned char>(c)));
        else if (!words.back().empty())
            words.emplace_back();
    }
    if (words.back().empty())
        words.pop_back();
    return words;
}

std::optional<int> Number(std::string_view word, int low, int high) {
    int number = 0;
    auto [end, error] = std::from_chars(word.data(), word.data() + word.size(), number);
    if (word.empty() || !isdigit(static_cast<unsigned char>(word[0])) || error != std::errc() ||
        end != word.data() + word.size() || number < low || number > high)
        return std::nullopt;
    return number;
}

template <size_t kCount>
std::optional<int> IndexOf(const std::array<std::string_view, kCount>& names, std::string_view word) {
    auto found = std::find(names.begin(), names.end(), word);
    if (found == names.end())
        return std::nullopt;
    return static_cast<int>(found - names.begin());
}

std::optional<int> MonthOf(std::string_view word) {
    std::optional<int> month = IndexOf(kMonths, word);
    return month ? month : IndexOf(kLongMonths, word);
}

std::vector<std::string_view> Split(std::string_view word, char separator) {
    std::vector<std::string_view> parts;
    for (;;) {
        size_t end = word.find(separator);
        parts.push_back(word.substr(0, end));
        if (end == std::string_view::npos)
            return parts;
        word.remove_prefix(end + 1);
    }
}

// Reads one text; a field of `mTime` that nothing has named yet counts as midnight.
class Reader {
  public:
    Reader(std::string_view text, time_t now) : mWords(Words(text)), mNow(now) {
        localtime_r(&mNow, &mTime);
        mTime.tm_hour = mTime.tm_min = mTime.tm_sec = 0;
    }

    std::optional<time_t> Run() {
        if (mWords.empty())
            return std::nullopt;
        if (mWords.size() == 1 && mWords[0] == "now")
            return mNow;
        if (TakeSpan())
            return mNext == mWords.size() ? Result() : std::nullopt;
        bool hasDay = TakeDay();
        bool hasTime = TakeTimeOfDay();
        if ((!hasDay && !hasTime) || mNext != mWords.size())
            return std::nullopt;
        return Result();
    }

  private:
    std::string_view Word(size_t offset) const {
        return mNext + offset < mWords.size() ? std::string_view(mWords[mNext + offset]) : std::string_view();
    }

    std::optional<time_t> Result() {
        int day = mTime.tm_mday;
        mTime.tm_isdst = -1;
        time_t result = mktime(&mTime);
        // mktime() turns the 31st of April into the 1st of May: such a day does not exist.
        if (mDayIsExact && mTime.tm_mday != day)
            return std::nullopt;
        return result;
    }

    // "3 days ago", "2 weeks"
    bool TakeSpan() {
        std::optional<int> count = Number(Word(0), 0, 1000000);
        std::string unit(Word(1));
        if (!count || unit.empty())
            return false;
        if (unit.size() > 1 && unit.back() == 's')
            unit.pop_back();
        bool ago = Word(2) == "ago";
        int amount = ago ? -*count : *count;
        tm moved = mTime;
        localtime_r(&mNow, &moved);
        if (unit == "second")
            moved.tm_sec += amount;
        else if (unit == "minute")
            moved.tm_min += amount;
        else if (unit == "hour")
            moved.tm_hour += amount;
        else if (unit == "day")
            moved.tm_mday += amount;
        else if (unit == "week")
            moved.tm_mday += 7 * amount;
        else if (unit == "month")
            moved.tm_mon += amount;
        else if (unit == "year")
            moved.tm_year += amount;
        else
            return false;
        mTime = moved;
        mNext += ago ? 3 : 2;
        return true;
    }

    bool TakeDay() { return TakeNamedDay() || TakeWeekday() || TakeNumericDate() || TakeDateWithMonthName(); }

    bool TakeNamedDay() {
        if (Word(0) == "yesterday")
            mTime.tm_mday--;
        else if (Word(0) == "tomorrow")
            mTime.tm_mday++;
        else if (Word(0) != "today")
            return false;
        mNext++;
        return true;
    }

    // The last such day before today, with or without "last".
    bool TakeWeekday() {
        size_t skipped = Word(0) == "last" ? 1 : 0;
        std::optional<int> weekday = IndexOf(kWeekdays, Word(skipped));
        if (!weekday)
            return false;
        int back = (mTime.tm_wday - *weekday + 7) % 7;
        mTime.tm_mday -= back == 0 ? 7 : back;
        mNext += skipped + 1;
        return true;
    }

    // 2001-02-03, 02/03/2001, 2/3/01; "2001-02-03t04:05" gives its time of day as a word of its own.
    bool TakeNumericDate() {
        std::string_view word = Word(0);
        std::vector<std::string_view> iso = Split(word.substr(0, word.find('t')), '-');
        if (iso.size() == 3) {
            if (!SetDate(Number(iso[0], 1900, 9999), Number(iso[1], 1, 12), Number(iso[2], 1, 31)))
                return false;
            if (size_t time = word.find('t'); time != std::string_view::npos)
                mWords[mNext].erase(0, time + 1);
            else
                mNext++;
            return true;
        }
        std::vector<std::string_view> parts = Split(word, '/');
        if (parts.size() != 3)
            return false;
        std::optional<int> year = Number(parts[2], 0, 9999);
        if (year && parts[2].size() == 2)
            year = *year + (*year < 70 ? 2000 : 1900);
        if (!year || *year < 1900 || !SetDate(year, Number(parts[0], 1, 12), Number(parts[1], 1, 31)))
            return false;
        mNext++;
        return true;
    }

    // "feb 3 2001", "3 february 2001"
    bool TakeDateWithMonthName() {
        std::optional<int> month = MonthOf(Word(0));
        std::optional<int> day = Number(Word(1), 1, 31);
        if (!month) {
            month = MonthOf(Word(1));
            day = Number(Word(0), 1, 31);
        }
        if (!month || !SetDate(Number(Word(2), 1900, 9999), *month + 1, day))
            return false;
        mNext += 3;
        return true;
    }

    bool SetDate(std::optional<int> year, std::optional<int> month, std::optional<int> day) {
        if (!year || !month || !day)
            return false;
        mTime.tm_year = *year - 1900;
        mTime.tm_mon = *month - 1;
        mTime.tm_mday = *day;
        mDayIsExact = true;
        return true;
    }

    // 04:05, 04:05:06
    bool TakeTimeOfDay() {
        std::vector<std::string_view> parts = Split(Word(0), ':');
        if (parts.size() != 2 && parts.size() != 3)
            return false;
        std::optional<int> hour = Number(parts[0], 0, 23);
        std::optional<int> minute = Number(parts[1], 0, 59);
        std::optional<int> second = parts.size() == 3 ? Number(parts[2], 0, 60) : 0;
        if (!hour || !minute || !second)
            return false;
        mTime.tm_hour = *hour;
        mTime.tm_min = *minute;
        mTime.tm_sec = *second;
        mNext++;
        return true;
    }

    std::vector<std::string> mWords;
    size_t mNext = 0;
    time_t mNow;
    tm mTime = {};
    bool mDayIsExact = false;
};

} // namespace

std::optional<time_t> TimeFromText(std::string_view text, time_t now) {
    return Reader(text, now).Run();
}
