// Remote control of the SoundPlay player.
#pragma once

#include "soundplay/sptrackinfo.h"

#include <List.h>
#include <Messenger.h>
#include <SupportDefs.h>

#include <memory>

class ScriptMessage;

inline constexpr char kSoundPlaySignature[] = "application/x-marcone-soundplay";

// Starts or finds the player and drives it by messages (docs/soundplay.md): opens layers, which play at the
// same time, hands each a file, sets a layer's pitch, position and volume.
//
// All calls come from one thread. Every failure is a line on standard output and nothing else; what is sent
// to a layer that has gone is lost without one. A layer that is not open here is refused with a line.
class SoundplayScripter {
  public:
    // Connects to the player if it runs; does not start it.
    SoundplayScripter();
    // Ends the player if it was started from here, or did not run at construction. The layers that are open
    // then are forgotten, their records stay.
    ~SoundplayScripter();
    SoundplayScripter(const SoundplayScripter&) = delete;
    SoundplayScripter& operator=(const SoundplayScripter&) = delete;

    // Starts the player and waits a second for it. Nothing when connected.
    void StartSoundPlay();
    // Connects to the running player and has its window minimised.
    void BuildConnection();
    // Asks the player to end and waits a second. It is not started again: from here on there are no new
    // layers.
    void QuitSoundPlay();

    // Has the player, which is started if need be, open a layer and play the file on it. `ref` is only read;
    // `track` may be null. Null when there is no player. A player that does not answer within three seconds,
    // or answers without a messenger, leaves a layer that nothing reaches. The scripter owns the layer.
    sptrackinfo* NewLayer(entry_ref* ref, SoundplayBrindleTrack* track);
    // Opens a layer here that another client has made and whose messenger has come from the player.
    sptrackinfo* TakeUpLayer(const BMessenger& messenger);
    // Also for a layer that is not in the list.
    void SetLayerTrack(sptrackinfo* layer, entry_ref* ref);
    // Ends the layer. The record is gone afterwards.
    void DeleteLayer(sptrackinfo* layer);
    // Asks for the layer's values; they go to the application.
    void UpdateLayerInfo(sptrackinfo* layer);
    // 1.0 is the track's own pitch.
    void RepitchLayer(sptrackinfo* layer, double pitch);
    // Seconds from the track's beginning.
    void SeekLayer(sptrackinfo* layer, double position);
    // 1.0 is the track's own level.
    void SetLevel(sptrackinfo* layer, float level);

  private:
    // A layer without its messenger yet, not in the list.
    static std::unique_ptr<sptrackinfo> MakeLayer(SoundplayBrindleTrack* track);
    static status_t Send(const sptrackinfo& layer, ScriptMessage& message);
    static void SendValue(const sptrackinfo& layer, const char* name, double value);

    // A messenger to the player has been made; stays true when the player has been asked to end.
    bool mConnected = false;
    bool mQuitAtEnd = false;
    std::unique_ptr<BMessenger> mMessenger;
    std::unique_ptr<BList> mLayers;
};
