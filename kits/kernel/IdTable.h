// Where the kernel kit keeps what is known by a number. Internal to this kit.
#pragma once

#include <SupportDefs.h>
#include <ThreadSafety.h>

#include <map>
#include <memory>

// Objects by ids that count up from 1 and are not given out twice. Any thread. An object that is taken out
// lives on for as long as somebody who found it before still uses it.
template <typename Object>
class IdTable {
  public:
    int32 Add(std::shared_ptr<Object> object) {
        GuardLock guard(mMutex);
        const int32 id = mNext++;
        mObjects.emplace(id, std::move(object));
        return id;
    }

    // Null when there is none.
    std::shared_ptr<Object> Find(int32 id) const {
        GuardLock guard(mMutex);
        const auto found = mObjects.find(id);
        return found != mObjects.end() ? found->second : nullptr;
    }

    std::shared_ptr<Object> Remove(int32 id) {
        GuardLock guard(mMutex);
        const auto found = mObjects.find(id);
        if (found == mObjects.end())
            return nullptr;
        std::shared_ptr<Object> object = std::move(found->second);
        mObjects.erase(found);
        return object;
    }

    // The first id whose object the predicate takes, or 0. The predicate runs with the table locked.
    template <typename Predicate>
    int32 FindIf(Predicate predicate) const {
        GuardLock guard(mMutex);
        for (const auto& [id, object] : mObjects) {
            if (predicate(*object))
                return id;
        }
        return 0;
    }

    uint32 Count() const {
        GuardLock guard(mMutex);
        return static_cast<uint32>(mObjects.size());
    }

  private:
    mutable GuardMutex mMutex;
    int32 mNext GUARDED_BY(mMutex) = 1;
    std::map<int32, std::shared_ptr<Object>> mObjects GUARDED_BY(mMutex);
};
