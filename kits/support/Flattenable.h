// BFlattenable: the interface of objects that can be turned into bytes and back.
#pragma once

#include <SupportDefs.h>

class BFlattenable {
  public:
    virtual ~BFlattenable();

    // True when every object of the class flattens to the same number of bytes.
    virtual bool IsFixedSize() const = 0;
    virtual type_code TypeCode() const = 0;
    virtual ssize_t FlattenedSize() const = 0;
    // Writes FlattenedSize() bytes; B_NO_MEMORY or another negative status when `size` is too small.
    virtual status_t Flatten(void* buffer, ssize_t size) const = 0;
    // True when Unflatten() takes data of this type; the base class takes TypeCode() alone.
    virtual bool AllowsTypeCode(type_code code) const;
    // B_BAD_TYPE for a type that is not allowed, B_BAD_VALUE or B_BAD_DATA for bytes that are not such an
    // object.
    virtual status_t Unflatten(type_code code, const void* buffer, ssize_t size) = 0;
};
