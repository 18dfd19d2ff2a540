// BPropertyInfo: which scripting messages a class understands.
#pragma once

#include <Flattenable.h>
#include <Message.h>

// One property: the commands and the forms of specifiers that it takes (each list ends with 0; none means
// any), a line for people, a number for the class itself, and the types of its value. A table ends with a
// null name.
struct property_info {
    const char* name;
    uint32 commands[10];
    uint32 specifiers[10];
    const char* usage;
    uint32 extra_data;
    uint32 types[10];
};

// Borrows the table, which must outlive it. A plain value otherwise.
class BPropertyInfo : public BFlattenable {
  public:
    explicit BPropertyInfo(property_info* properties = nullptr);
    ~BPropertyInfo() override;

    // The index of the first property that the message with this specifier matches, or B_ERROR. `index` is
    // that of the current specifier: commands are compared only at the last one, 0.
    virtual int32 FindMatch(BMessage* message, int32 index, BMessage* specifier, int32 form,
                            const char* property, void* data = nullptr) const;

    property_info* Properties() const { return mProperties; }
    int32 CountProperties() const;

    bool IsFixedSize() const override;
    type_code TypeCode() const override;
    ssize_t FlattenedSize() const override;
    status_t Flatten(void* buffer, ssize_t size) const override;
    // The table cannot be given back as C strings that somebody owns: always B_NOT_ALLOWED.
    status_t Unflatten(type_code code, const void* buffer, ssize_t size) override;

  private:
    BMessage Describe() const;

    property_info* mProperties;
};
