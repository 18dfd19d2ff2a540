#pragma once

#include "host/api/player.h"
#include <cstdint>
#include <mpv/client.h>
#include <optional>

namespace host {

/// A player that is one instance of libmpv.
class MpvPlayer : public Player {
  public:
    /// The handle, not initialised yet, is taken over. `silence` is only kept.
    MpvPlayer(std::shared_ptr<void> silence, mpv_handle* handle)
        : silence_(std::move(silence)), handle_(handle) {}
    ~MpvPlayer() override;
    MpvPlayer(const MpvPlayer&) = delete;
    MpvPlayer& operator=(const MpvPlayer&) = delete;

    /// EINVAL for a malformed output.
    Status start(const std::string& output);

    Status load(const std::string& path) override;
    void unload() override;
    Status set_pitch(double pitch) override;
    Status set_volume(double volume) override;
    Status seek(double position) override;
    PlayerValues values() override;

  private:
    enum class File { none, loading, loaded, ended, failed };

    void take_events();
    void take_event(const mpv_event& event);
    void file_ended(const mpv_event_end_file& end);
    void set_position(double position);
    double number(const char* property, double otherwise) const;

    /// Before the handle, which must go first.
    const std::shared_ptr<void> silence_;
    mpv_handle* const handle_;
    File file_ = File::none;
    PlayerFailure failure_ = PlayerFailure::none;
    double pitch_ = 1;
    double volume_ = 1;
    /// Where a seek goes that has not been carried out yet, or that nothing has been heard after.
    std::optional<double> target_;
    bool target_sought_ = false;
    bool target_reached_ = false;
    /// libmpv's numbers of the file that was asked for and of the one that events are about.
    std::int64_t wanted_entry_ = 0;
    std::int64_t present_entry_ = 0;
};

} // namespace host
