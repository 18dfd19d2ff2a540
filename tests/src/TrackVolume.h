// The files that tests of the application work on: real files with real attributes on declared volumes.
#pragma once

#include "support/temporary_environment.h"

#include <Entry.h>
#include <EntryRef.h>

#include <gtest/gtest.h>

#include <sched.h>
#include <sys/mount.h>
#include <sys/xattr.h>

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <optional>
#include <string>
#include <vector>

// Directories of this process alone, declared as the machine's volumes before any kit has looked. Made by
// TrackTest, removed at the end of the process.
class TestVolumes {
  public:
    static TestVolumes& Instance() {
        static TestVolumes volumes;
        return volumes;
    }

    // Two volumes that hold attributes and answer queries.
    const std::string& Music() const { return mMusic; }
    const std::string& Second() const { return mSecond; }
    // One that a test may remove.
    const std::string& Passing() const { return mPassing; }
    // One whose name is too long for a row.
    const std::string& LongName() const { return mLongName; }
    // One that cannot be written, holding "Artist - Song.mp3" without attributes. Empty where this process
    // may not mount file systems.
    const std::string& ReadOnly() const { return mReadOnly; }
    // One that holds no attributes.
    std::string WithoutAttributes() const { return "/sys/class"; }

    TestVolumes(const TestVolumes&) = delete;
    TestVolumes& operator=(const TestVolumes&) = delete;

  private:
    TestVolumes() {
        for (const std::string& directory : {mMusic, mSecond, mPassing, mLongName})
            std::filesystem::create_directory(directory);
        MountReadOnly(mEnvironment.root() + "/ReadOnly");
        std::string declared =
            mMusic + ":" + mSecond + ":" + mPassing + ":" + mLongName + ":" + WithoutAttributes();
        if (!mReadOnly.empty())
            declared += ":" + mReadOnly;
        mEnvironment.declare_volumes(declared);
    }
    ~TestVolumes() {
        if (!mReadOnly.empty())
            umount(mReadOnly.c_str());
    }

    // In a mount namespace of this process alone, so that nothing stays behind if the process dies.
    void MountReadOnly(const std::string& directory) {
        std::filesystem::create_directory(directory);
        if (unshare(CLONE_NEWNS) != 0 || mount("none", "/", nullptr, MS_REC | MS_PRIVATE, nullptr) != 0 ||
            mount("tmpfs", directory.c_str(), "tmpfs", 0, "size=1m") != 0)
            return;
        std::ofstream(directory + "/Artist - Song.mp3") << "not music";
        mount("tmpfs", directory.c_str(), "tmpfs", MS_REMOUNT | MS_RDONLY, nullptr);
        mReadOnly = directory;
    }

    test::TemporaryEnvironment mEnvironment{test::TemporaryEnvironment::DeclaredVolume::none};
    std::string mMusic = mEnvironment.root() + "/Music";
    std::string mSecond = mEnvironment.root() + "/Second";
    std::string mPassing = mEnvironment.root() + "/Passing";
    std::string mLongName = mEnvironment.root() + "/Everything that was ever recorded in the old barn";
    std::string mReadOnly;
};

// Base of tests with files. The volumes are empty at the start of each.
class TrackTest : public testing::Test {
  protected:
    TrackTest() {
        for (const std::string& root : {Volume(), TestVolumes::Instance().Second()}) {
            for (const auto& entry : std::filesystem::directory_iterator(root))
                std::filesystem::remove_all(entry.path());
        }
    }

    static const std::string& Volume() { return TestVolumes::Instance().Music(); }

    // Makes a file below the volume's root, with the folders above it, and answers its path.
    static std::string MakeFile(const std::string& path, const std::string& contents = "not music") {
        const std::filesystem::path full = Volume() + "/" + path;
        std::filesystem::create_directories(full.parent_path());
        std::ofstream(full, std::ios::binary) << contents;
        return full;
    }

    static entry_ref RefOf(const std::string& path) {
        entry_ref ref;
        EXPECT_EQ(get_ref_for_path(path.c_str(), &ref), B_OK) << path;
        return ref;
    }

    // The bytes of an attribute as they lie on the disk: four bytes of type, then the value.
    static std::optional<std::string> RawAttribute(const std::string& path, const std::string& name) {
        std::string value(70000, '\0');
        const ssize_t size = lgetxattr(path.c_str(), ("user.be." + name).c_str(), value.data(), value.size());
        if (size < 0)
            return std::nullopt;
        value.resize(static_cast<size_t>(size));
        return value;
    }

    static void SetRawAttribute(const std::string& path, const std::string& name, const std::string& value) {
        ASSERT_EQ(lsetxattr(path.c_str(), ("user.be." + name).c_str(), value.data(), value.size(), 0), 0)
            << path << " " << name;
    }

    // The text of an attribute that is a text as it should be; says so when it is not.
    static std::string Text(const std::string& path, const std::string& name) {
        const auto raw = RawAttribute(path, name);
        if (!raw)
            return "(no " + name + ")";
        if (raw->size() < 5 || raw->substr(0, 4) != "CSTR" || raw->find('\0') != raw->size() - 1)
            return "(malformed " + name + ")";
        return raw->substr(4, raw->size() - 5);
    }

    static void SetText(const std::string& path, const std::string& name, const std::string& text) {
        SetRawAttribute(path, name, "CSTR" + text + '\0');
    }

    // Every attribute of the file by name, in alphabetical order.
    static std::vector<std::string> AttributeNames(const std::string& path) {
        std::string names(65536, '\0');
        const ssize_t size = llistxattr(path.c_str(), names.data(), names.size());
        std::vector<std::string> found;
        for (size_t begin = 0; size > 0 && begin < static_cast<size_t>(size);) {
            const std::string name = names.c_str() + begin;
            if (name.starts_with("user.be."))
                found.push_back(name.substr(8));
            begin += name.size() + 1;
        }
        std::sort(found.begin(), found.end());
        return found;
    }
};
