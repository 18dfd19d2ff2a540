// GetTruncatedString: the list's one rule for shortening a text with an ellipsis.
#pragma once

// Puts into `out` the text, shortened so far that it is at most `width` pixels wide in be_plain_font,
// whatever font it is drawn with. `out` needs room for the length of `full` + 3 bytes. Blanks before the
// ellipsis are dropped. It counts bytes: a character of several may be cut in half.
//
// Where nothing but the first byte would be left before the ellipsis, it gives way too: first two dots follow
// it, then one, then none, and that is the end even if it is still too wide.
void GetTruncatedString(const char* full, char* out, float width);
