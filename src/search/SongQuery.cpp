#include "search/SongQuery.h"

#include "metadata/MusicAttributes.h"
#include <Query.h>

void PushSongsContaining(BQuery& query, const char* text) {
    for (const char* attribute : {kAttributeSongname, kAttributeArtist, kAttributeAlbum, kAttributeTrackNo}) {
        query.PushAttr(attribute);
        query.PushString(text, false);
        query.PushOp(B_CONTAINS);
    }
    for (int joined = 1; joined < 4; ++joined)
        query.PushOp(B_OR);
}
