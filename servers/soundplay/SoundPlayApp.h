// The program behind the player's signature.
#pragma once

#include "Layer.h"
#include "LayerMessages.h"
#include <Application.h>

#include <memory>
#include <set>
#include <string>
#include <vector>

// Opens layers for other programs and ends them with the process that asked for them. Has no window. Ends by
// itself when no program that ever sent it a command has been there for a while, to be launched again.
class SoundPlayApp : public BApplication {
  public:
    static constexpr size_t kMostLayers = 16;

    // `output` as for host::make_player(). `patience`, in microseconds, is how long it stays without clients.
    SoundPlayApp(const std::string& output, bigtime_t patience);

    void MessageReceived(BMessage* message) override;
    void DispatchMessage(BMessage* message, BHandler* handler) override;
    bool QuitRequested() override;
    void Pulse() override;

  private:
    void OpenLayer(BMessage* request);
    // Null, and why.
    Layer* MakeLayer(const std::string& name, team_id client, std::string* error);
    void ListLayers(BMessage* request);
    int32 FreeNumber() const;
    void RemoveEndedLayers();
    void EndLayersOf(team_id client);

    const std::string mOutput;
    const bigtime_t mPatience;
    bigtime_t mLastUse = 0;
    // Processes that live, or did at the last look.
    std::set<team_id> mClients;
    // In the order of their numbers. Handlers of this looper.
    std::vector<std::unique_ptr<Layer>> mLayers;
};
