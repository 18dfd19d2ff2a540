#pragma once

class BQuery;

/// Pushes the condition by which songs are found: song name, artist, album or track number contains `text`,
/// taken as it is, upper and lower case told apart. An empty text matches every file that has one of the
/// four. The query must be clear and have its volume set; it is not fetched. Any thread.
void PushSongsContaining(BQuery& query, const char* text);
