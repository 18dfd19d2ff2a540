// Questions about an object's class.
#pragma once

#include <typeinfo>

#define class_name(ptr) ((ptr) == nullptr ? nullptr : typeid(*(ptr)).name())
#define cast_as(ptr, class) (dynamic_cast<class*>(ptr))
#define is_kind_of(ptr, class) (dynamic_cast<class*>(ptr) != nullptr)
#define is_instance_of(ptr, class) ((ptr) != nullptr && typeid(*(ptr)) == typeid(class))
