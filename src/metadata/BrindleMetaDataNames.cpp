// BrindleMetaData: the order of sources, and what file and folder names give.
#include "metadata/BrindleMetaData.h"

#include "metadata/NameParsing.h"

#include <Bitmap.h>
#include <CopyText.h>
#include <Directory.h>
#include <Entry.h>
#include <Node.h>
#include <NodeInfo.h>

status_t BrindleMetaData::ReadMetaDataFromRef(entry_ref* ref) {
    mRef = *ref;
    BNode node(ref);
    BNodeInfo nodeInfo(&node);

    // The icon is fetched and then let go with everything else that is cleared. The order is intended.
    delete mCover16x16bitmap;
    mCover16x16bitmap = new BBitmap(BRect(0, 0, 15, 15), B_CMAP8, false);
    if (nodeInfo.GetTrackerIcon(mCover16x16bitmap, B_MINI_ICON) != B_OK) {
        delete mCover16x16bitmap;
        mCover16x16bitmap = nullptr;
    }
    delete mCover16x16bitmap;
    DeleteOwnedBitmaps();
    ClearData();

    CopyText(mFilename, ref->name);
    if (node.InitCheck() != B_OK) {
        mIsValid = false;
        return -1;
    }
    if (ReadMetaAttributes(&node) != -1) {
        mIsValid = true;
        return 0;
    }
    if (ReadMetaID3Tag(ref) == 0) {
        mIsValid = true;
        return 0;
    }
    DeriveFromNames(*ref);
    WriteMetaAttributes(&node);
    mIsValid = true;
    return 0;
}

status_t BrindleMetaData::ReadMetaID3Tag(entry_ref*) {
    mIsValid = false;
    return -1;
}

status_t BrindleMetaData::ReadMetaFilename(entry_ref* ref) {
    DeriveFromNames(*ref);
    mIsValid = true;
    BNode node(ref);
    WriteMetaAttributes(&node);
    return 0;
}

void BrindleMetaData::DeriveFromNames(const entry_ref& ref) {
    const BEntry entry(&ref, false);
    char name[B_FILE_NAME_LENGTH];
    if (entry.GetName(name) != B_OK)
        CopyText(name, ref.name);
    CopyText(mFilename, name);

    FileNameParts parts;
    ParseFileName(name, parts);
    if (parts.disc[0])
        CopyText(mDisc, parts.disc);
    if (parts.trackNo[0])
        CopyText(mTrackNo, parts.trackNo);
    if (parts.asksForFolder)
        ReadFolderName(entry);
    if (parts.hasArtist)
        CopyText(mArtist, parts.artist);
    else
        DropLeadingBlank(mArtist);
    CopyText(mSongname, parts.songname);
}

void BrindleMetaData::ReadFolderName(const BEntry& entry) {
    BEntry folder;
    char folderName[B_FILE_NAME_LENGTH];
    if (entry.GetParent(&folder) == B_OK && folder.GetName(folderName) == B_OK)
        ParseDirName(folderName);
}

void BrindleMetaData::ParseDirName(char* folderName) {
    FolderNameParts parts;
    ParseFolderName(folderName, parts);
    CopyText(mArtist, parts.artist);
    CopyText(mAlbum, parts.album);
}

void BrindleMetaData::LessLoud(char* text) {
    FoldLoudText(text);
}
