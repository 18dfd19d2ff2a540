#include "soundplay/sptrackinfo.h"

#include <cstdio>

void sptrackinfo::ParseReply(BMessage*) {
    printf("GetValues:\n");
}
