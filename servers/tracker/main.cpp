// tracker: opens files and folders for programs that ask for it. Launched by its signature; takes no options.
#include "TrackerApp.h"

int main() {
    constexpr bigtime_t kFiveMinutes = bigtime_t{5} * 60 * 1'000'000;
    TrackerApp tracker(kFiveMinutes);
    tracker.Run();
    tracker.OpenWhatIsLeft();
    return 0;
}
