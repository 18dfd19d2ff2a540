#include "indexing/JobStatusText.h"

#include <gtest/gtest.h>

#include <limits>
#include <string>

namespace {

struct StatusCase {
    const char* situation;
    int state;
    float progress;
    int32 fileCount;
    const char* text;
};

constexpr int32 kLargest = std::numeric_limits<int32>::max();

const StatusCase kStatusTable[] = {
    {"NeverStarted", 712, 0.0f, 0, ""},
    {"StatusBegins", 710, 0.0f, 0, "Getting status..."},
    {"StatusHalfWay", 710, 0.5f, 0, "Getting status..."},
    {"StatusFinished", 710, 1.0f, 0, "Got status"},
    {"EraseBegins", 711, 0.05f, 0, "Stripping (0)"},
    {"EraseWalks", 711, -1.0f, 42, "Stripping (42)"},
    {"EraseFinished", 711, 1.0f, 42, "Striped 42 files"},
    {"EraseFinishedWithoutFiles", 711, 1.0f, 0, "Striped 0 files"},
    {"IndexBegins", 713, 0.05f, 0, "Indexing files (0)"},
    {"IndexWalks", 713, -1.0f, 42, "Indexing files (42)"},
    {"IndexFinished", 713, 1.0f, 42, "Indexed 42 files"},
    {"IndexFinishedWithoutFiles", 713, 1.0f, 0, "Indexed 0 files"},
    {"IndexOfVeryManyFiles", 713, 1.0f, kLargest, "Indexed 2147483647 files"},
    {"Cancelled", 714, -1.0f, 42, "Cancelled."},
    {"CancelledWhenFinished", 714, 1.0f, 42, "Cancelled."},
};

class JobStatusText : public testing::TestWithParam<StatusCase> {};

TEST_P(JobStatusText, SaysWhatTheTableSays) {
    const StatusCase& given = GetParam();
    char text[kJobStatusTextSize] = "left over";

    FormatJobStatus(static_cast<JobState>(given.state), given.progress, given.fileCount, text);

    EXPECT_STREQ(text, given.text);
}

INSTANTIATE_TEST_SUITE_P(States, JobStatusText, testing::ValuesIn(kStatusTable),
                         [](const auto& given) { return std::string(given.param.situation); });

} // namespace
