#include <Archivable.h>

#include "host/api/type_names.h"
#include <ThreadSafety.h>

#include <map>
#include <string>
#include <typeinfo>

namespace {

constexpr const char* kClassField = "class";

class Registry {
  public:
    static Registry& Instance() {
        // Made on first use, because classes register before main(), in no known order.
        static Registry* const registry = new Registry;
        return *registry;
    }
    void Add(const char* name, instantiation_func function) {
        GuardLock guard(mMutex);
        mFunctions[name] = function;
    }
    instantiation_func Find(const char* name) {
        GuardLock guard(mMutex);
        const auto found = mFunctions.find(name);
        return found != mFunctions.end() ? found->second : nullptr;
    }

  private:
    GuardMutex mMutex;
    std::map<std::string, instantiation_func> mFunctions GUARDED_BY(mMutex);
};

} // namespace

BArchivable::BArchivable() = default;

BArchivable::BArchivable(BMessage*) {}

BArchivable::~BArchivable() = default;

status_t BArchivable::Archive(BMessage* into, bool) const {
    if (into == nullptr)
        return B_BAD_VALUE;
    const std::string name = host::type_name(typeid(*this));
    if (validate_instantiation(into, name.c_str()))
        return B_OK;
    return into->AddString(kClassField, name.c_str());
}

BArchivable* BArchivable::Instantiate(BMessage*) {
    return nullptr;
}

status_t BArchivable::Perform(perform_code, void*) {
    return B_NAME_NOT_FOUND;
}

BArchivable* instantiate_object(BMessage* from) {
    const instantiation_func function = find_instantiation_func(from);
    return function != nullptr ? function(from) : nullptr;
}

bool validate_instantiation(BMessage* from, const char* className) {
    if (from == nullptr || className == nullptr)
        return false;
    const char* name = nullptr;
    for (int32 index = 0; from->FindString(kClassField, index, &name) == B_OK; index++) {
        if (std::string_view(name) == className)
            return true;
    }
    return false;
}

instantiation_func find_instantiation_func(const char* className) {
    return className != nullptr ? Registry::Instance().Find(className) : nullptr;
}

instantiation_func find_instantiation_func(BMessage* archive) {
    const char* name = nullptr;
    for (int32 index = 0; archive != nullptr && archive->FindString(kClassField, index, &name) == B_OK;
         index++) {
        if (const instantiation_func function = find_instantiation_func(name))
            return function;
    }
    return nullptr;
}

void register_archivable(const char* className, instantiation_func function) {
    Registry::Instance().Add(className, function);
}
