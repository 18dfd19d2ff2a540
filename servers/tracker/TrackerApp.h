// The program behind the file manager's signature.
#pragma once

#include <Application.h>

inline constexpr char kTrackerSignature[] = "application/x-vnd.Be-TRAK";

// Opens the "refs" of each B_REFS_RECEIVED; those in the field "select" are shown selected in their folders
// instead. Ends by itself when nothing has come for a while, to be launched again by whoever needs it.
class TrackerApp : public BApplication {
  public:
    // How long it stays without work, in microseconds.
    explicit TrackerApp(bigtime_t patience);

    void RefsReceived(BMessage* message) override;
    void Pulse() override;
    // After Run(): what came as the loop was ending already.
    void OpenWhatIsLeft();

  private:
    const bigtime_t mPatience;
    bigtime_t mLastWork = 0;
};
