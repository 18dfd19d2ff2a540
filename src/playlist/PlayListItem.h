// A song's row in the playlist and among the songs that were found.
#pragma once

#include "gui/ColumnListView/CLVListItem.h"
#include "metadata/PackedMetaData.h"

#include <EntryRef.h>
#include <GraphicsDefs.h>

#include <memory>
#include <optional>

class BrindleMetaData;

// The columns of the list, in the order in which they are added, and its sort keys.
enum PlayListColumn : int32 {
    kColumnCover,
    kColumnTrackNo,
    kColumnTime,
    kColumnSongname,
    kColumnArtist,
    kColumnAlbum
};

// Owns the file's metadata, which it reads once, when it is made. A list may have very many rows, so a row
// without covers keeps it packed. Thread rule: that of BListItem.
class PlayListItem : public CLVListItem {
  public:
    // Of the texts, in pixels.
    static constexpr float kTextSize = 14;

    // Tags the file from its and its folder's name where it has no attributes.
    explicit PlayListItem(entry_ref* ref);
    ~PlayListItem() override;

    // Copies the file's reference.
    void GetRef(entry_ref* out) const;
    // The whole record, which the row keeps from now on. The small cover in it is the row's.
    BrindleMetaData& MetaData();

    void DrawItemColumn(BView* owner, BRect columnRect, int32 columnIndex, bool complete) override;
    void Update(BView* owner, const BFont* font) override;

    // For ColumnListView::SetSortFunction(); both rows must be PlayListItems. Texts compare byte by byte.
    // Track numbers do so within their albums, as texts. Play times compare by the low 32 bits of their
    // difference in microseconds, on purpose.
    static int CompareFunc(const CLVListItem* a, const CLVListItem* b, long sortKey);

  private:
    void DrawCovers(BView* owner, BRect rect) const;
    // Null for a column without text.
    const char* TextOf(int32 columnIndex) const;
    int64 LengthUsec() const;

    // Either the one or the other.
    std::optional<PackedMetaData> mPacked;
    std::unique_ptr<BrindleMetaData> mMetaData;
    // From the row's top to the baseline of its texts.
    float mTextOffset = 0;
};
