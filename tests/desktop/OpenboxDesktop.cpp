#include "desktop/WindowOnDesktop.h"

test::Desktop& TheDesktop() {
    static test::Desktop desktop(test::Desktop::WindowManager::openbox);
    return desktop;
}
