// The part of QuirnelApp that prepares the volumes and the file manager.
#include "app/QuirnelApp.h"

#include "metadata/MusicAttributes.h"

#include <InterfaceDefs.h>
#include <Message.h>
#include <MimeType.h>
#include <TypeConstants.h>
#include <Volume.h>
#include <VolumeRoster.h>
#include <fs_index.h>

#include <cstdio>
#include <cstring>

namespace {

constexpr char kMP3Type[] = "audio/x-mpeg";

struct AttributeIndex {
    const char* attribute;
    type_code type;
};

constexpr AttributeIndex kIndices[] = {
    {kAttributeSongname, B_STRING_TYPE}, {kAttributeArtist, B_STRING_TYPE},
    {kAttributeAlbum, B_STRING_TYPE},    {kAttributeChannels, B_INT32_TYPE},
    {kAttributeDisc, B_STRING_TYPE},     {kAttributeVersion, B_STRING_TYPE},
};

struct Column {
    const char* attribute;
    const char* title;
    long width;
};

// All columns are declared as texts, the number of channels too, and the play time is the one in
// microseconds.
constexpr Column kColumns[] = {
    {kAttributeSongname, "Songname", 150},  {kAttributeArtist, "Artist", 150},
    {kAttributeAlbum, "Album", 150},        {kAttributeTrackNo, "TrackNo", 50},
    {kAttributeDisc, "Disc", 50},           {kAttributeVersion, "Version", 100},
    {kAttributeLengthUsec, "Playtime", 50}, {kAttributeSamplerate, "Samplerate", 50},
    {kAttributeBitrate, "Bitrate", 50},     {kAttributeChannels, "Channels", 50},
    {kAttributeEncoder, "Encoder", 50},
};

bool ListsAttribute(const BMessage& attributeInfo, const char* attributeName) {
    const char* listed = nullptr;
    for (int32 i = 0; attributeInfo.HasString("attr:name", i); ++i) {
        if (attributeInfo.FindString("attr:name", i, &listed) == B_OK && strcmp(listed, attributeName) == 0)
            return true;
    }
    return false;
}

} // namespace

status_t QuirnelApp::CheckCreateIndices() {
    if (!mVolumeRoster)
        mVolumeRoster = std::make_unique<BVolumeRoster>();
    // Not rewound first, on purpose.
    BVolume volume;
    while (mVolumeRoster->GetNextVolume(&volume) == B_OK) {
        if (volume.KnowsAttr() && volume.KnowsQuery())
            CreateIndices(&volume);
    }
    return 0;
}

status_t QuirnelApp::CreateIndices(BVolume* volume) {
    const dev_t device = volume->Device();
    // An index that exists already is refused, and so stays as it is.
    for (const AttributeIndex& index : kIndices)
        fs_create_index(device, index.attribute, index.type, 0);
    return 0;
}

status_t QuirnelApp::CheckTrackerDisplayAttributes() {
    BMimeType type(kMP3Type);
    if (!type.IsInstalled())
        type.Install();
    BMessage attributeInfo;
    type.GetAttrInfo(&attributeInfo);
    // No field is ever called so: AddToMsg() is what keeps attributes from being listed twice.
    if (!attributeInfo.HasString(kAttributeSongname, 0)) {
        for (const Column& column : kColumns)
            AddToMsg(&attributeInfo, column.attribute, column.title, B_STRING_TYPE, column.width,
                     B_ALIGN_LEFT);
    }
    type.SetAttrInfo(&attributeInfo);
    return 0;
}

void QuirnelApp::AddToMsg(BMessage* attributeInfo, const char* attributeName, const char* publicName,
                          long type, long width, long alignment) {
    if (ListsAttribute(*attributeInfo, attributeName))
        return;
    printf("Adding '%s' to Tracker attributes\n", attributeName);
    attributeInfo->AddString("attr:name", attributeName);
    attributeInfo->AddString("attr:public_name", publicName);
    attributeInfo->AddInt32("attr:type", static_cast<int32>(type));
    attributeInfo->AddBool("attr:viewable", true);
    attributeInfo->AddBool("attr:editable", true);
    attributeInfo->AddInt32("attr:width", static_cast<int32>(width));
    attributeInfo->AddInt32("attr:alignment", static_cast<int32>(alignment));
}
