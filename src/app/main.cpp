#include "app/QuirnelApp.h"

#include <cstdio>

int main() {
    // What is said appears when it is said, also in a file or a pipe.
    setvbuf(stdout, nullptr, _IOLBF, 0);
    brindle_app = new QuirnelApp;
    brindle_app->Run();
    // The line "Bye !" tells of a clean end.
    printf("Bye ");
    delete brindle_app;
    brindle_app = nullptr;
    printf("!\n");
    return 0;
}
