// soundplay: plays sound files for programs that ask for it. Launched by its signature; takes no options.
// SOUNDPLAY_OUTPUT says where the sound goes (docs/soundplay.md).
#include "SoundPlayApp.h"

#include "host/api/processes.h"

int main() {
    constexpr bigtime_t kFiveMinutes = bigtime_t{5} * 60 * 1'000'000;
    SoundPlayApp player(host::environment_variable("SOUNDPLAY_OUTPUT"), kFiveMinutes);
    player.Run();
    return 0;
}
