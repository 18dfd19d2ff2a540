// ToUpperStr: a copy of a text in capitals.
#pragma once

// Of the ASCII letters alone; other bytes stay as they are. The copy is the caller's to delete[]. Null for
// null.
char* ToUpperStr(const char* text);
