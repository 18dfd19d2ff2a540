#pragma once

#include "support/temporary_environment.h"

#include <EntryRef.h>

#include <filesystem>
#include <gtest/gtest.h>
#include <memory>
#include <string>

namespace test {

/// Gives each test an empty directory on the one declared volume that the program has. The volume lives as
/// long as the tests run.
class StorageTest : public testing::Test {
  protected:
    static const std::string& Volume();
    static const std::string& Home();

    void SetUp() override;
    void TearDown() override;

    /// A path in this test's directory.
    std::string At(const std::string& relative) const { return mDirectory + "/" + relative; }
    const std::string& Directory() const { return mDirectory; }

    std::string MakeFile(const std::string& relative, const std::string& content = "") const {
        write_file(At(relative), content);
        return At(relative);
    }
    std::string MakeDirectory(const std::string& relative) const {
        std::filesystem::create_directories(At(relative));
        return At(relative);
    }
    std::string MakeLink(const std::string& relative, const std::string& target) const {
        std::filesystem::create_symlink(target, At(relative));
        return At(relative);
    }

    /// The reference of a path; a failure of the test where there is none.
    static entry_ref RefOf(const std::string& path);

  private:
    std::string mDirectory;
};

} // namespace test
