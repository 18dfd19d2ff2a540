// The smallest program with a window; ends when the window is closed.
#include <Application.h>
#include <Window.h>

int main() {
    BApplication application("application/x-vnd.Test-WindowProgram");
    auto* const window =
        new BWindow(BRect(100, 100, 299, 199), "Window program", B_TITLED_WINDOW, B_QUIT_ON_WINDOW_CLOSE);
    window->Show();
    application.Run();
    return 0;
}
