#pragma once

#include "host/api/file_system.h"
#include "host/api/index.h"
#include "host/api/volumes.h"
#include "host/linux/directory_cache.h"
#include "host/linux/volume_table.h"
#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>
#include <memory>
#include <string>
#include <sys/xattr.h>
#include <unistd.h>
#include <vector>

namespace host {

inline constexpr std::uint32_t kText = 0x43535452;    // 'CSTR'
inline constexpr std::uint32_t kInteger = 0x4c4f4e47; // 'LONG'

/// A declared volume of its own below the working directory, with real attributes, and a data directory of
/// its own. Everything is removed at the end.
class IndexFixture : public ::testing::Test {
  protected:
    void SetUp() override {
        std::string pattern = (std::filesystem::current_path() / "index-test-XXXXXX").string();
        ASSERT_NE(mkdtemp(pattern.data()), nullptr);
        base_ = pattern;
        root_ = base_ + "/volume";
        std::filesystem::create_directories(root_);
        std::filesystem::create_directories(base_ + "/data");
        setenv("BEKITS_VOLUMES", root_.c_str(), 1);
        setenv("XDG_DATA_HOME", (base_ + "/data").c_str(), 1);
        setenv("XDG_CONFIG_HOME", (base_ + "/config").c_str(), 1);
        const auto list = volumes().list();
        ASSERT_EQ(list.size(), 1U);
        device_ = list.front();
        ASSERT_TRUE(volumes().info(device_)->knows_queries);
    }
    void TearDown() override {
        indexes().shut_down();
        DirectoryCache::instance().clear();
        std::error_code error;
        std::filesystem::remove_all(base_, error);
    }

    EntryRef ref(const std::string& path) {
        const auto entry = file_system().entry_of(root_ + "/" + path, Follow::no);
        EXPECT_TRUE(entry.ok()) << path;
        return entry ? *entry : EntryRef();
    }
    void make(const std::string& path) {
        std::filesystem::create_directories(std::filesystem::path(root_ + "/" + path).parent_path());
        std::ofstream(root_ + "/" + path) << "content";
    }
    void tag(const std::string& path, const std::string& attribute, const std::string& text) {
        const auto node = file_system().open(ref(path), {});
        ASSERT_TRUE(node.ok()) << path;
        ASSERT_TRUE(
            (*node)->write_attribute(attribute.c_str(), kText, 0, text.c_str(), text.size() + 1).ok());
    }
    void untag(const std::string& path, const std::string& attribute) {
        const auto node = file_system().open(ref(path), {});
        ASSERT_TRUE(node.ok()) << path;
        ASSERT_TRUE((*node)->remove_attribute(attribute.c_str()).ok());
    }
    /// As another program would, past the kits.
    void tag_outside(const std::string& path, const std::string& attribute, const std::string& text) {
        const std::string value = "CSTR" + text + '\0';
        ASSERT_EQ(setxattr((root_ + "/" + path).c_str(), ("user.be." + attribute).c_str(), value.data(),
                           value.size(), 0),
                  0);
    }

    static std::shared_ptr<const Predicate>
    compare(const std::string& attribute, Predicate::Operator op, Predicate::Value value,
            Predicate::Case letter_case = Predicate::Case::sensitive) {
        auto predicate = std::make_shared<Predicate>();
        predicate->op = op;
        predicate->attribute = attribute;
        predicate->value = std::move(value);
        predicate->letter_case = letter_case;
        return predicate;
    }
    static std::shared_ptr<const Predicate> join(Predicate::Operator op,
                                                 std::vector<std::shared_ptr<const Predicate>> operands) {
        auto predicate = std::make_shared<Predicate>();
        predicate->op = op;
        predicate->operands = std::move(operands);
        return predicate;
    }
    static std::shared_ptr<const Predicate> contains(const std::string& attribute, const std::string& text) {
        return compare(attribute, Predicate::Operator::contains, text);
    }

    /// The leaves of the hits, sorted.
    std::vector<std::string> find(const std::shared_ptr<const Predicate>& predicate) {
        std::vector<std::string> leaves;
        const auto query = indexes().query(device_, predicate, nullptr);
        EXPECT_TRUE(query.ok()) << query.error();
        if (!query)
            return leaves;
        RunningQuery::Hit hit;
        Status status;
        while ((status = (*query)->next(hit)).ok())
            leaves.push_back(hit.ref.leaf);
        EXPECT_EQ(status.error(), ENOENT);
        std::sort(leaves.begin(), leaves.end());
        return leaves;
    }
    std::string database() {
        return base_ + "/data/bekits/index/" + VolumeTable::instance().current()->find(device_)->stable_key +
               ".db";
    }

    std::string base_;
    std::string root_;
    DeviceId device_ = 0;
};

using Leaves = std::vector<std::string>;

} // namespace host
