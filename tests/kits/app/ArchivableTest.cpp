#include <Archivable.h>

#include <gtest/gtest.h>
#include <memory>

namespace {

int sLiving = 0;

} // namespace

// In the global namespace, as applications' classes are: archives name a class by its full name.
class ArchivedShape : public BArchivable {
  public:
    explicit ArchivedShape(int32 corners) : mCorners(corners) { sLiving++; }
    explicit ArchivedShape(BMessage* from) : BArchivable(from), mCorners(from->GetInt32("corners", 0)) {
        sLiving++;
    }
    ~ArchivedShape() override { sLiving--; }

    static BArchivable* Instantiate(BMessage* from) {
        return validate_instantiation(from, "ArchivedShape") ? new ArchivedShape(from) : nullptr;
    }
    status_t Archive(BMessage* into, bool deep = true) const override {
        const status_t status = BArchivable::Archive(into, deep);
        return status == B_OK ? into->AddInt32("corners", mCorners) : status;
    }
    int32 Corners() const { return mCorners; }

  private:
    int32 mCorners;
};

class UnregisteredShape : public ArchivedShape {
  public:
    using ArchivedShape::ArchivedShape;
};

REGISTER_ARCHIVABLE(ArchivedShape);

namespace {

BArchivable* RefuseToInstantiate(BMessage*) {
    return nullptr;
}

} // namespace

TEST(ArchivableTest, AnArchiveNamesTheObjectsClass) {
    BMessage archive;
    ASSERT_EQ(ArchivedShape(3).Archive(&archive), B_OK);
    EXPECT_STREQ(archive.GetString("class"), "ArchivedShape");
    EXPECT_EQ(archive.GetInt32("corners", 0), 3);
    EXPECT_TRUE(validate_instantiation(&archive, "ArchivedShape"));
    EXPECT_FALSE(validate_instantiation(&archive, "Archived"));
    EXPECT_FALSE(validate_instantiation(&archive, nullptr));
    EXPECT_FALSE(validate_instantiation(nullptr, "ArchivedShape"));
    EXPECT_EQ(BArchivable().Archive(nullptr), B_BAD_VALUE);
}

TEST(ArchivableTest, ARegisteredClassIsMadeAnewFromItsArchive) {
    BMessage archive;
    ASSERT_EQ(ArchivedShape(5).Archive(&archive), B_OK);
    BMallocIO stream;
    ASSERT_EQ(archive.Flatten(&stream), B_OK);
    BMessage read;
    ASSERT_EQ(read.Unflatten(static_cast<const char*>(stream.Buffer()), stream.BufferLength()), B_OK);
    {
        const std::unique_ptr<BArchivable> object(instantiate_object(&read));
        const auto* shape = dynamic_cast<ArchivedShape*>(object.get());
        ASSERT_NE(shape, nullptr);
        EXPECT_EQ(shape->Corners(), 5);
        EXPECT_EQ(sLiving, 1);
    }
    EXPECT_EQ(sLiving, 0);
}

TEST(ArchivableTest, WhatIsNotRegisteredOrNoArchiveMakesNothing) {
    BMessage archive;
    ASSERT_EQ(UnregisteredShape(4).Archive(&archive), B_OK);
    EXPECT_STREQ(archive.GetString("class"), "UnregisteredShape");
    EXPECT_EQ(instantiate_object(&archive), nullptr);
    BMessage empty;
    EXPECT_EQ(instantiate_object(&empty), nullptr);
    EXPECT_EQ(instantiate_object(nullptr), nullptr);
    EXPECT_EQ(BArchivable::Instantiate(&archive), nullptr);
    BMessage wrongType;
    wrongType.AddInt32("class", 1);
    EXPECT_EQ(instantiate_object(&wrongType), nullptr);
}

TEST(ArchivableTest, AnUnknownDerivedClassIsMadeAsItsRegisteredBase) {
    BMessage archive;
    archive.AddString("class", "PluginShape");
    archive.AddString("class", "ArchivedShape");
    archive.AddInt32("corners", 6);
    const std::unique_ptr<BArchivable> object(instantiate_object(&archive));
    ASSERT_NE(dynamic_cast<ArchivedShape*>(object.get()), nullptr);
    EXPECT_EQ(dynamic_cast<ArchivedShape*>(object.get())->Corners(), 6);
}

TEST(ArchivableTest, TheFunctionOfAClassIsFoundByItsName) {
    EXPECT_EQ(find_instantiation_func("ArchivedShape"), &ArchivedShape::Instantiate);
    EXPECT_EQ(find_instantiation_func("UnregisteredShape"), nullptr);
    EXPECT_EQ(find_instantiation_func(static_cast<const char*>(nullptr)), nullptr);
    register_archivable("ReplacedShape", &ArchivedShape::Instantiate);
    register_archivable("ReplacedShape", &RefuseToInstantiate);
    EXPECT_EQ(find_instantiation_func("ReplacedShape"), &RefuseToInstantiate);
    BMessage archive;
    archive.AddString("class", "ReplacedShape");
    EXPECT_EQ(instantiate_object(&archive), nullptr);
}
