// What is read of a hit that is opened next: as it is on the file, whether or not the file is asked.

#include "index_fixture.h"

#include "host/linux/system_calls.h"
#include <array>
#include <set>
#include <string>
#include <vector>

namespace host {
namespace {

using Op = Predicate::Operator;

class CountingSystemCalls : public SystemCalls {
  public:
    ssize_t fgetxattr(int descriptor, const char* name, void* buffer, std::size_t size) override {
        ++questions;
        return SystemCalls::fgetxattr(descriptor, name, buffer, size);
    }
    ssize_t flistxattr(int descriptor, char* buffer, std::size_t size) override {
        ++lists;
        return SystemCalls::flistxattr(descriptor, buffer, size);
    }
    int questions = 0;
    int lists = 0;
};

struct Read {
    std::vector<std::string> names;
    /// Size and value of each, or the error.
    std::vector<std::string> values;
    bool operator==(const Read&) const = default;
};

class HitAttributes : public IndexFixture {
  protected:
    void set(const std::string& path, const std::string& attribute, const std::string& stored) {
        ASSERT_EQ(setxattr((root_ + "/" + path).c_str(), ("user.be." + attribute).c_str(), stored.data(),
                           stored.size(), 0),
                  0);
    }
    /// Rows that are made now are relied upon.
    void make_rows() {
        usleep(20'000);
        (void)indexes().create(device_, "A", kText);
        ASSERT_TRUE(indexes().rebuild(device_, nullptr).ok());
    }
    static std::unique_ptr<Node> open(const EntryRef& ref) {
        OpenOptions options;
        options.access = Access::none;
        return *file_system().open(ref, options);
    }
    static Read read(Node& node, const std::vector<const char*>& attributes) {
        Read result;
        result.names = *node.attribute_names();
        for (const char* attribute : attributes) {
            std::array<char, 600> buffer{};
            const Result<std::size_t> size = node.read_attribute(attribute, 0, buffer.data(), buffer.size());
            const Result<AttributeInfo> info = node.attribute_info(attribute);
            EXPECT_EQ(size.ok(), info.ok()) << attribute;
            result.values.push_back(size.ok()
                                        ? std::to_string(info->size) + ":" + std::string(buffer.data(), *size)
                                        : "error " + std::to_string(size.error()));
        }
        return result;
    }
    std::unique_ptr<RunningQuery> ask(const std::shared_ptr<const Predicate>& predicate) {
        return *indexes().query(device_, predicate, nullptr);
    }
    EntryRef next(RunningQuery& query) {
        RunningQuery::Hit hit;
        EXPECT_TRUE(query.next(hit).ok());
        return hit.ref;
    }
    /// What the system is asked for while a hit's attributes are read. A thread that is put aside for longer
    /// than what is known lasts asks more often: the least of some tries counts.
    CountingSystemCalls count(const std::shared_ptr<const Predicate>& predicate,
                              const std::vector<const char*>& attributes, const Read& expected) {
        CountingSystemCalls least;
        least.questions = least.lists = 1000;
        for (int attempt = 0; attempt < 100; ++attempt) {
            const auto query = ask(predicate);
            const EntryRef ref = next(*query);
            CountingSystemCalls counting;
            const ScopedSystemCalls scope(counting);
            const auto node = open(ref);
            const Read found = read(*node, attributes);
            EXPECT_EQ(found.names, expected.names);
            EXPECT_EQ(found.values, expected.values);
            least.questions = std::min(least.questions, counting.questions);
            least.lists = std::min(least.lists, counting.lists);
        }
        return least;
    }

    const std::string kMissing_ = "error " + std::to_string(ENOENT);
};

TEST_F(HitAttributes, AreKnownFromTheIndex) {
    make("song");
    set("song", "A", std::string("CSTRone\0", 8));
    set("song", "Number", std::string("LONG\1\0\0\0", 8));
    make_rows();
    const Read expected = {{"A", "Number"},
                           {std::string("4:one\0", 6), std::string("4:\1\0\0\0", 6), kMissing_}};
    const CountingSystemCalls least = count(contains("A", "one"), {"A", "Number", "None"}, expected);
    EXPECT_EQ(least.questions, 0);
    EXPECT_EQ(least.lists, 0);
}

TEST_F(HitAttributes, OfAFileThatLacksOneThatWasAskedForAreReadFromTheFile) {
    make("song");
    set("song", "A", std::string("CSTRone\0", 8));
    make_rows();
    const auto either = join(Op::either, {contains("A", "one"), contains("B", "one")});
    const CountingSystemCalls least =
        count(either, {"A", "B"}, {{"A"}, {std::string("4:one\0", 6), kMissing_}});
    EXPECT_GE(least.questions, 1);
    EXPECT_EQ(least.lists, 1);
}

TEST_F(HitAttributes, ThatARowDoesNotHoldExactlyAreReadFromTheFile) {
    const std::string longest = "CSTR" + std::string(255, 'x') + '\0';
    const std::string tooLong = "CSTR" + std::string(256, 'x') + '\0';
    const struct {
        const char* what;
        std::string stored;
        bool isExact;
        std::string read;
    } cases[] = {
        {"a text", std::string("CSTRtext\0", 9), true, std::string("5:text\0", 7)},
        {"a text without its end", "CSTRtext", false, "4:text"},
        {"a text with a second end", std::string("CSTRtext\0\0", 10), false, std::string("6:text\0\0", 8)},
        {"a text and more", std::string("CSTRa\0b\0", 8), false, std::string("4:a\0b\0", 6)},
        {"a text of its end alone", std::string("CSTR\0", 5), true, std::string("1:\0", 3)},
        {"nothing at all", "CSTR", false, "0:"},
        {"the longest text of a row", longest, true, "256:" + longest.substr(4)},
        {"a longer one", tooLong, false, "257:" + tooLong.substr(4)},
        {"a number", std::string("LLNG\1\2\3\4\5\6\7\0", 12), true, std::string("8:\1\2\3\4\5\6\7\0", 10)},
        {"other bytes", std::string("RAWTraw", 7), false, "3:raw"},
        {"a value that is none", "CS", false, kMissing_},
    };
    const std::string a("CSTRone\0", 8);
    for (const auto& value : cases) {
        SCOPED_TRACE(value.what);
        std::filesystem::remove(root_ + "/song");
        make("song");
        set("song", "A", a);
        set("song", "V", value.stored);
        make_rows();
        const Read expected = {{"A", "V"}, {std::string("4:one\0", 6), value.read}};
        const CountingSystemCalls least = count(contains("A", "one"), {"A", "V"}, expected);
        EXPECT_EQ(least.questions == 0, value.isExact);
    }
}

TEST_F(HitAttributes, ThatChangedAfterTheHitAreReadAsTheyAre) {
    make("song");
    set("song", "A", std::string("CSTRone\0", 8));
    make_rows();
    for (int i = 0; i < 50; ++i) {
        const auto query = ask(contains("A", "one"));
        const EntryRef ref = next(*query);
        const std::string value = "one " + std::to_string(i);
        tag_outside("song", "A", value);
        const auto node = open(ref);
        EXPECT_EQ(read(*node, {"A"}).values[0], std::to_string(value.size() + 1) + ":" + value + '\0');
        usleep(11'000);
        ASSERT_TRUE(indexes().rebuild(device_, nullptr).ok());
    }
}

TEST_F(HitAttributes, ThatChangeWhileTheFileIsOpenAreReadAsTheyAre) {
    make("song");
    set("song", "A", std::string("CSTRone\0", 8));
    make_rows();
    const auto query = ask(contains("A", "one"));
    const EntryRef ref = next(*query);
    const auto reader = open(ref);
    const auto writer = open(ref);
    EXPECT_EQ(read(*reader, {"A"}).values[0], std::string("4:one\0", 6));
    ASSERT_TRUE(writer->write_attribute("A", kText, 0, "two", 4).ok());
    ASSERT_TRUE(writer->write_attribute("B", kText, 0, "new", 4).ok());
    EXPECT_EQ(read(*reader, {"A", "B"}).values,
              (std::vector<std::string>{std::string("4:two\0", 6), std::string("4:new\0", 6)}));
}

TEST_F(HitAttributes, OfAnotherFileThatTookTheHitsNameAreThatFiles) {
    make("song");
    set("song", "A", std::string("CSTRone\0", 8));
    make_rows();
    const auto query = ask(contains("A", "one"));
    const EntryRef ref = next(*query);
    make("other");
    set("other", "A", std::string("CSTRother\0", 10));
    std::filesystem::rename(root_ + "/other", root_ + "/song");
    const auto node = open(ref);
    EXPECT_EQ(read(*node, {"A"}).values[0], std::string("6:other\0", 8));
}

TEST_F(HitAttributes, AllNamesOfAFileTellTheSame) {
    make("song");
    std::filesystem::create_hard_link(root_ + "/song", root_ + "/link");
    set("song", "A", std::string("CSTRone\0", 8));
    make_rows();
    const auto query = ask(contains("A", "one"));
    for (int i = 0; i < 2; ++i) {
        const auto node = open(next(*query));
        EXPECT_EQ(read(*node, {"A"}).values[0], std::string("4:one\0", 6));
    }
}

// More than one group of rows, and rows between them that are gone.
TEST_F(HitAttributes, BelongToTheirOwnHitAmongMany) {
    for (int i = 0; i < 700; ++i) {
        const std::string name = std::to_string(i);
        make(name);
        set(name, "A", "CSTRone " + name + '\0');
    }
    make_rows();
    const auto query = ask(contains("A", "one"));
    RunningQuery::Hit hit;
    int hits = 0;
    for (; hits < 5; ++hits)
        ASSERT_TRUE(query->next(hit).ok());
    for (int i = 0; i < 700; i += 7)
        std::filesystem::remove(root_ + "/" + std::to_string(i));
    std::set<std::string> found;
    while (query->next(hit).ok()) {
        const auto node = open(hit.ref);
        const std::string text = "one " + hit.ref.leaf;
        ASSERT_EQ(read(*node, {"A"}).values[0], std::to_string(text.size() + 1) + ":" + text + '\0');
        EXPECT_NE(std::stoi(hit.ref.leaf) % 7, 0) << "a file that is gone";
        EXPECT_TRUE(found.insert(hit.ref.leaf).second) << "twice";
    }
    EXPECT_GE(found.size(), 600U - 5);
    EXPECT_LE(found.size(), 600U);
}

} // namespace
} // namespace host
