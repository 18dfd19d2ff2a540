#pragma once

#include "host/api/result.h"
#include <memory>
#include <string>

// Playing sound files.

namespace host {

enum class PlayerState {
    empty,   ///< nothing has been loaded
    loading, ///< the file is being opened
    playing,
    halted, ///< a file is loaded and its pitch is 0
    ended,  ///< the end has been reached; a seek goes on from there
    failed, ///< the file cannot be played; see PlayerFailure
};

enum class PlayerFailure {
    none,
    unreadable, ///< it is not there or cannot be read
    not_sound,  ///< nothing in it can be played; also lists of other files
    no_output,  ///< there is nothing to hear it with
    other,
};

struct PlayerValues {
    PlayerState state = PlayerState::empty;
    PlayerFailure failure = PlayerFailure::none; ///< when the state is `failed`
    double pitch = 1;                            ///< 1: the file's own; also how fast it plays
    double position = 0;                         ///< seconds
    double length = -1;                          ///< seconds; negative while it is not known
    double volume = 1;                           ///< 1: the file's own
};

/// Plays one file at a time; any number of players sound together. One thread at a time. Files are opened and
/// played in threads of its own: no call waits for them.
class Player {
  public:
    /// Silence at once.
    virtual ~Player() = default;

    /// Plays from the beginning of this file on, with the present pitch and volume, in place of the last one.
    /// Whether it can is in the values later on. ENOMEM.
    virtual Status load(const std::string& path) = 0;
    /// Silence; the player is empty again.
    virtual void unload() = 0;
    /// 0 halts, else from 0.01 to 100, in proportion to the speed. EINVAL outside.
    virtual Status set_pitch(double pitch) = 0;
    /// From 0 to 1, in proportion to the amplitude. EINVAL outside.
    virtual Status set_volume(double volume) = 0;
    /// In seconds; beyond the end is the end. ENOENT when there is no file, EINVAL when negative.
    virtual Status seek(double position) = 0;
    virtual PlayerValues values() = 0;
};

/// `output` is where the sound goes: empty for the desktop's choice, "null" for nowhere, at the pace of one
/// that is heard, "file:PATH" for a WAV file, as fast as it can be written; else the name of a driver such as
/// "pulse" or "alsa". A driver that is not there shows when a file is played.
/// ENOTSUP: this program was built without players. ENOMEM; EINVAL for a malformed name.
Result<std::unique_ptr<Player>> make_player(const std::string& output);

} // namespace host
