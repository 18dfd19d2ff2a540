#include <TypeIcons.h>

#include <Bitmap.h>
#include <EntryRef.h>
#include <Message.h>
#include <MimeDatabase.h>
#include <OS.h>
#include <PixelFormat.h>
#include <ThreadSafety.h>

#include "host/api/file_system.h"
#include "host/api/icons.h"
#include "host/api/mime_sniffer.h"

#include <map>
#include <memory>

namespace {

using IconBits = std::shared_ptr<const std::vector<uint8>>;

// The desktop's words for types that it calls otherwise.
std::string_view DesktopType(std::string_view type) {
    if (type == kVolumeType)
        return "inode/mount-point";
    if (type == kDirectoryType)
        return "inode/directory";
    if (type == kSymLinkType)
        return "inode/symlink";
    return host::desktop_type_of(type);
}

IconBits DesktopIcon(std::string_view type, icon_size size) {
    std::shared_ptr<const host::IconPixels> pixels = host::icon_for_type(DesktopType(type), size);
    auto bits = std::make_shared<std::vector<uint8>>(IconBytes(size), B_TRANSPARENT_MAGIC_CMAP8);
    if (pixels->pixels.size() == bits->size())
        store_pixels(B_CMAP8, bits->data(), 0, static_cast<int32>(bits->size()), pixels->pixels.data());
    return bits;
}

IconBits LoadIcon(std::string_view type, icon_size size) {
    auto bits = std::make_shared<std::vector<uint8>>();
    for (std::string_view name : {type, type.substr(0, type.find('/'))}) {
        MimeRecord record(name);
        if (MimeDatabase::Read(name, record) == B_OK && record.GetIcon("", size, *bits) == B_OK)
            return bits;
    }
    return DesktopIcon(type, size);
}

std::string_view ExtensionOf(std::string_view leaf) {
    size_t dot = leaf.rfind('.');
    return dot == std::string_view::npos || dot == 0 ? std::string_view() : leaf.substr(dot + 1);
}

class TypeCache {
  public:
    static TypeCache& Instance() {
        static TypeCache cache;
        return cache;
    }

    IconBits Icon(std::string_view type, icon_size size) {
        uint64 generation = 0;
        {
            GuardLock lock(mMutex);
            DropWhatIsStale();
            const IconMap& icons = IconsOf(size);
            if (auto found = icons.find(type); found != icons.end())
                return found->second;
            generation = mGeneration;
        }
        // Reading files is no work to do under the lock.
        IconBits bits = LoadIcon(type, size);
        GuardLock lock(mMutex);
        if (generation == mGeneration) {
            IconMap& icons = IconsOf(size);
            MakeRoom(icons);
            icons.emplace(type, bits);
        }
        return bits;
    }

    std::string TypeOfName(std::string_view leaf) {
        std::string extension = FoldedType(ExtensionOf(leaf));
        if (extension.empty())
            return AskDesktop(leaf);
        uint64 generation = 0;
        {
            GuardLock lock(mMutex);
            DropWhatIsStale();
            if (!mExtensionsLoaded)
                LoadExtensions();
            if (auto found = mInstalled.find(extension); found != mInstalled.end())
                return found->second;
            if (auto found = mTypes.find(extension); found != mTypes.end())
                return found->second;
            generation = mGeneration;
        }
        std::string type = AskDesktop(leaf);
        GuardLock lock(mMutex);
        if (generation == mGeneration) {
            MakeRoom(mTypes);
            mTypes.emplace(std::move(extension), type);
        }
        return type;
    }

    void Forget() {
        GuardLock lock(mMutex);
        Clear();
        mNextLook = 0;
    }

  private:
    using IconMap = std::map<std::string, IconBits, std::less<>>;

    IconMap& IconsOf(icon_size size) REQUIRES(mMutex) { return size == B_MINI_ICON ? mMini : mLarge; }

    static std::string AskDesktop(std::string_view leaf) {
        std::string type = host::type_of_name(leaf);
        return type == host::unknown_type ? std::string() : type;
    }

    // Types and extensions come from files, so there may be any number of them.
    template <typename Map>
    static void MakeRoom(Map& map) {
        constexpr size_t kMostEntries = 1024;
        if (map.size() >= kMostEntries)
            map.clear();
    }

    void Clear() REQUIRES(mMutex) {
        mMini.clear();
        mLarge.clear();
        mInstalled.clear();
        mTypes.clear();
        mExtensionsLoaded = false;
        mGeneration++;
    }

    void DropWhatIsStale() REQUIRES(mMutex) {
        constexpr bigtime_t kInterval = 500'000;
        bigtime_t now = system_time();
        if (now < mNextLook)
            return;
        mNextLook = now + kInterval;
        int64 changeTime = MimeDatabase::ChangeTime();
        if (changeTime != mChangeTime) {
            Clear();
            mChangeTime = changeTime;
        }
    }

    void LoadExtensions() REQUIRES(mMutex) {
        mExtensionsLoaded = true;
        std::vector<std::string> types;
        if (MimeDatabase::List(types) != B_OK)
            return;
        for (const std::string& type : types) {
            MimeRecord record(type);
            BMessage extensions;
            if (MimeDatabase::Read(type, record) != B_OK ||
                record.GetList(MimeRecord::List::extensions, extensions) != B_OK)
                continue;
            const char* extension = nullptr;
            for (int32 i = 0; extensions.FindString("extensions", i, &extension) == B_OK; i++)
                mInstalled.emplace(FoldedType(extension), type);
        }
    }

    GuardMutex mMutex;
    IconMap mMini GUARDED_BY(mMutex);
    IconMap mLarge GUARDED_BY(mMutex);
    // Types by extension: what the database says, and what the desktop says (empty for nothing).
    std::map<std::string, std::string> mInstalled GUARDED_BY(mMutex);
    std::map<std::string, std::string> mTypes GUARDED_BY(mMutex);
    bool mExtensionsLoaded GUARDED_BY(mMutex) = false;
    uint64 mGeneration GUARDED_BY(mMutex) = 0;
    int64 mChangeTime GUARDED_BY(mMutex) = 0;
    bigtime_t mNextLook GUARDED_BY(mMutex) = 0;
};

} // namespace

status_t GetTypeIcon(std::string_view type, BBitmap* icon, icon_size size) {
    if (status_t status = CheckIconBitmap(icon, size); status != B_OK)
        return status;
    IconBits bits = TypeCache::Instance().Icon(type, size);
    FillIconBitmap(bits->data(), size, icon);
    return B_OK;
}

std::string TypeOfName(std::string_view leaf) {
    return TypeCache::Instance().TypeOfName(leaf);
}

std::string_view TypeOfDirectory(const node_ref& directory) {
    host::Result<host::NodeId> root = host::file_system().root_of(directory.device);
    return root && root->inode == directory.node ? kVolumeType : kDirectoryType;
}

void ForgetTypeIcons() {
    TypeCache::Instance().Forget();
}
