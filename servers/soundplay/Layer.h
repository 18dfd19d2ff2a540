// One layer of the player: a track that sounds together with those of the other layers.
#pragma once

#include "host/api/player.h"
#include <Handler.h>
#include <OS.h>

#include <memory>
#include <string>

struct entry_ref;

// Takes the commands for a layer. A handler of the player's looper; all of it in that thread. What it cannot
// do is said on standard error, one line each.
class Layer : public BHandler {
  public:
    // `number` is what people call it, `client` the process that asked for it.
    Layer(int32 number, const std::string& name, team_id client, std::unique_ptr<host::Player> player);

    void MessageReceived(BMessage* message) override;

    int32 Number() const { return mNumber; }
    team_id Client() const { return mClient; }
    // It was told to end, and is silent already.
    bool HasEnded() const { return mPlayer == nullptr; }
    // Says so when the track has turned out not to be one that can be played.
    void Look();
    // Adds one item to each of the fields that describe a layer.
    void AddValues(BMessage* reply);

  private:
    void LookAt(const host::PlayerValues& values);
    // B_OK, or the status of what was refused.
    status_t SetValues(const BMessage& message);
    void Play(const entry_ref& ref);
    void Refuse(const char* what, double value);
    void Fail(const std::string& why);
    std::string Name() const;

    const int32 mNumber;
    const team_id mClient;
    // Of the file that was asked for last; its path once it has been found.
    std::string mName;
    std::string mPath;
    // Why it cannot be played; empty when it can, or that is not known yet.
    std::string mError;
    std::unique_ptr<host::Player> mPlayer;
};
