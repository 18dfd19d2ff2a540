// The application object.
#pragma once

#include <Application.h>
#include <SupportDefs.h>

#include <memory>

class BMessage;
class BVolume;
class BVolumeRoster;

inline constexpr char kQuirnelSignature[] = "application/x-vnd.vorn-quirnel";

// One per process, kept in brindle_app. Its members are called on the application's own thread.
class QuirnelApp : public BApplication {
  public:
    // Installs the application's MIME type when it is missing.
    QuirnelApp();
    ~QuirnelApp() override;

    // Makes the attribute indices on every volume that knows attributes and queries. The walk over the
    // volumes goes on where the last one stopped: a second call finds no volume. Always 0.
    status_t CheckCreateIndices();

    // Makes the music attributes' indices on one volume; those that exist stay as they are. Always 0.
    status_t CreateIndices(BVolume* volume);

    // Makes the file manager offer the music attributes as columns of MP3 files. Those that are listed
    // already stay as they are; says on standard output which it adds. Always 0.
    status_t CheckTrackerDisplayAttributes();

    // Appends one column to an attribute-info message, unless the attribute is in it; says so on standard
    // output.
    void AddToMsg(BMessage* attributeInfo, const char* attributeName, const char* publicName, long type,
                  long width, long alignment);

  private:
    // Null until it is first needed, then kept with its place in the list of volumes.
    std::unique_ptr<BVolumeRoster> mVolumeRoster;
};

// Null before main() has made the application and after it was deleted.
extern QuirnelApp* brindle_app;
