#include "StorageTest.h"

#include <Entry.h>

#include <stdlib.h>

namespace test {

namespace {

class Surroundings : public testing::Environment {
  public:
    static Surroundings* Instance() {
        // Owned by GoogleTest once added.
        static auto* instance =
            static_cast<Surroundings*>(testing::AddGlobalTestEnvironment(new Surroundings));
        return instance;
    }

    void SetUp() override {
        // A process that a test has started works in that test's surroundings.
        if (const char* home = getenv("QUIRNEL_TEST_INHERIT_HOME"); home != nullptr) {
            mHome = getenv("HOME");
            mVolume = getenv("BEKITS_VOLUMES");
            return;
        }
        mEnvironment = std::make_unique<TemporaryEnvironment>();
        mVolume = mEnvironment->volume();
        mHome = mEnvironment->home();
    }
    void TearDown() override { mEnvironment.reset(); }

    std::string mVolume;
    std::string mHome;

  private:
    std::unique_ptr<TemporaryEnvironment> mEnvironment;
};

// Before main(): the variables must be set while there is one thread.
[[maybe_unused]] const auto* const kSurroundings = Surroundings::Instance();

} // namespace

const std::string& StorageTest::Volume() {
    return Surroundings::Instance()->mVolume;
}

const std::string& StorageTest::Home() {
    return Surroundings::Instance()->mHome;
}

entry_ref StorageTest::RefOf(const std::string& path) {
    entry_ref ref;
    EXPECT_EQ(get_ref_for_path(path.c_str(), &ref), B_OK) << path;
    return ref;
}

void StorageTest::SetUp() {
    const testing::TestInfo* info = testing::UnitTest::GetInstance()->current_test_info();
    mDirectory = Volume() + "/" + info->test_suite_name() + "." + info->name();
    std::filesystem::create_directories(mDirectory);
}

void StorageTest::TearDown() {
    remove_tree(mDirectory);
}

} // namespace test
