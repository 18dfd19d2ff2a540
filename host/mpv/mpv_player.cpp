#include "mpv_player.h"

#include "host/api/thread_safety.h"

#include <algorithm>
#include <cmath>
#include <cstring>

namespace host {

namespace {

constexpr double slowest_pitch = 0.01;
constexpr double fastest_pitch = 100;

struct Option {
    const char* name;
    const char* value;
};

// Sound alone, from that very file, with nothing that the user's own player is set up with.
constexpr Option options[] = {
    {"vid", "no"},
    {"sid", "no"},
    {"audio-display", "no"},
    {"force-window", "no"},
    // Pitch and speed belong together.
    {"audio-pitch-correction", "no"},
    // The end is a place that can be left again.
    {"keep-open", "yes"},
    {"keep-open-pause", "no"},
    {"cache", "no"},
    {"load-scripts", "no"},
    {"ytdl", "no"},
    {"osc", "no"},
    {"autoload-files", "no"},
    {"access-references", "no"},
    {"resume-playback", "no"},
};

PlayerFailure failure_of(int error) {
    switch (error) {
    case MPV_ERROR_LOADING_FAILED:
        return PlayerFailure::unreadable;
    case MPV_ERROR_NOTHING_TO_PLAY:
    case MPV_ERROR_UNKNOWN_FORMAT:
        return PlayerFailure::not_sound;
    case MPV_ERROR_AO_INIT_FAILED:
        return PlayerFailure::no_output;
    default:
        return PlayerFailure::other;
    }
}

std::int64_t entry_in(const mpv_node& result) {
    if (result.format != MPV_FORMAT_NODE_MAP)
        return 0;
    for (int at = 0; at < result.u.list->num; ++at) {
        if (std::strcmp(result.u.list->keys[at], "playlist_entry_id") == 0 &&
            result.u.list->values[at].format == MPV_FORMAT_INT64)
            return result.u.list->values[at].u.int64;
    }
    return 0;
}

void set_options(mpv_handle* handle) {
    for (const Option& option : options) {
        // Which of them there are depends on how libmpv was built.
        (void)mpv_set_option_string(handle, option.name, option.value);
    }
}

Status set_output(mpv_handle* handle, const std::string& output) {
    constexpr char file[] = "file:";
    if (output.empty())
        return {};
    if (output.compare(0, std::strlen(file), file) != 0)
        return mpv_set_option_string(handle, "ao", output.c_str()) < 0 ? EINVAL : 0;
    if (mpv_set_option_string(handle, "ao", "pcm") < 0 ||
        mpv_set_option_string(handle, "ao-pcm-file", output.c_str() + std::strlen(file)) < 0)
        return EINVAL;
    return {};
}

// The decoders' own messages go to the instance of libmpv that was made first, and to standard error when
// that is gone. So there is one that plays nothing, as long as there is any.
std::shared_ptr<void> silence_of_decoders() {
    static Mutex mutex;
    static std::weak_ptr<void> present;
    MutexLock lock(mutex);
    std::shared_ptr<void> silence = present.lock();
    if (silence == nullptr) {
        mpv_handle* const handle = mpv_create();
        if (handle == nullptr)
            return nullptr;
        set_options(handle);
        if (mpv_initialize(handle) < 0) {
            mpv_terminate_destroy(handle);
            return nullptr;
        }
        silence = std::shared_ptr<void>(
            handle, [](void* instance) { mpv_terminate_destroy(static_cast<mpv_handle*>(instance)); });
        present = silence;
    }
    return silence;
}

} // namespace

MpvPlayer::~MpvPlayer() {
    mpv_terminate_destroy(handle_);
}

Status MpvPlayer::start(const std::string& output) {
    set_options(handle_);
    if (const Status known = set_output(handle_, output); !known)
        return known;
    if (mpv_initialize(handle_) < 0)
        return ENOMEM;
    return {};
}

Status MpvPlayer::load(const std::string& path) {
    const char* command[] = {"loadfile", path.c_str(), "replace", nullptr};
    mpv_node result{};
    if (mpv_command_ret(handle_, command, &result) < 0)
        return ENOMEM;
    wanted_entry_ = entry_in(result);
    mpv_free_node_contents(&result);
    file_ = File::loading;
    failure_ = PlayerFailure::none;
    target_.reset();
    return {};
}

void MpvPlayer::unload() {
    const char* command[] = {"stop", nullptr};
    (void)mpv_command(handle_, command);
    // What is still told of the last file counts no more.
    wanted_entry_ = 0;
    file_ = File::none;
    failure_ = PlayerFailure::none;
    target_.reset();
}

Status MpvPlayer::set_pitch(double pitch) {
    if (pitch != 0 && !(pitch >= slowest_pitch && pitch <= fastest_pitch))
        return EINVAL;
    int halted = pitch == 0;
    if (!halted)
        mpv_set_property(handle_, "speed", MPV_FORMAT_DOUBLE, &pitch);
    mpv_set_property(handle_, "pause", MPV_FORMAT_FLAG, &halted);
    pitch_ = pitch;
    if (!halted && target_reached_)
        target_.reset();
    return {};
}

Status MpvPlayer::set_volume(double volume) {
    if (!(volume >= 0 && volume <= 1))
        return EINVAL;
    // libmpv's per cent are those of a knob: the amplitude is their third power.
    double knob = 100 * std::cbrt(volume);
    mpv_set_property(handle_, "volume", MPV_FORMAT_DOUBLE, &knob);
    volume_ = volume;
    return {};
}

Status MpvPlayer::seek(double position) {
    if (!(position >= 0) || std::isinf(position))
        return EINVAL;
    take_events();
    if (file_ == File::none || file_ == File::failed || file_ == File::ended)
        return ENOENT;
    // While a file is being opened it has no positions yet.
    target_ = position;
    target_sought_ = false;
    target_reached_ = false;
    if (file_ == File::loaded)
        set_position(position);
    return {};
}

void MpvPlayer::set_position(double position) {
    if (mpv_set_property(handle_, "time-pos", MPV_FORMAT_DOUBLE, &position) < 0)
        target_.reset();
}

double MpvPlayer::number(const char* property, double otherwise) const {
    double value = 0;
    return mpv_get_property(handle_, property, MPV_FORMAT_DOUBLE, &value) < 0 ? otherwise : value;
}

PlayerValues MpvPlayer::values() {
    take_events();
    PlayerValues values;
    values.pitch = pitch_;
    values.volume = volume_;
    values.failure = failure_;
    switch (file_) {
    case File::none:
        return values;
    case File::failed:
        values.state = PlayerState::failed;
        return values;
    case File::loading:
        values.state = PlayerState::loading;
        values.position = target_.value_or(0);
        return values;
    case File::ended:
    case File::loaded:
        break;
    }
    values.length = number("duration", -1);
    int at_end = 0;
    mpv_get_property(handle_, "eof-reached", MPV_FORMAT_FLAG, &at_end);
    if (file_ == File::ended || (at_end != 0 && !target_))
        values.state = PlayerState::ended;
    else
        values.state = pitch_ == 0 ? PlayerState::halted : PlayerState::playing;
    values.position = std::max(target_ ? *target_ : number("time-pos", 0), 0.0);
    if (values.length >= 0)
        values.position = std::min(values.position, values.length);
    return values;
}

void MpvPlayer::take_events() {
    for (const mpv_event* event = mpv_wait_event(handle_, 0); event->event_id != MPV_EVENT_NONE;
         event = mpv_wait_event(handle_, 0))
        take_event(*event);
}

void MpvPlayer::take_event(const mpv_event& event) {
    switch (event.event_id) {
    case MPV_EVENT_START_FILE:
        present_entry_ = static_cast<const mpv_event_start_file*>(event.data)->playlist_entry_id;
        break;
    case MPV_EVENT_FILE_LOADED:
        if (present_entry_ != wanted_entry_)
            break;
        file_ = File::loaded;
        if (target_)
            set_position(*target_);
        break;
    case MPV_EVENT_SEEK:
        target_sought_ = target_.has_value();
        break;
    case MPV_EVENT_PLAYBACK_RESTART:
        // The first one is the file's own beginning.
        if (!target_sought_)
            break;
        target_reached_ = true;
        // While it is halted libmpv tells a position that is a little too early.
        if (pitch_ != 0)
            target_.reset();
        break;
    case MPV_EVENT_END_FILE:
        file_ended(*static_cast<const mpv_event_end_file*>(event.data));
        break;
    default:
        break;
    }
}

void MpvPlayer::file_ended(const mpv_event_end_file& end) {
    if (end.playlist_entry_id != wanted_entry_)
        return;
    target_.reset();
    if (end.reason == MPV_END_FILE_REASON_EOF) {
        file_ = File::ended;
        return;
    }
    file_ = File::failed;
    failure_ = end.reason == MPV_END_FILE_REASON_REDIRECT ? PlayerFailure::not_sound
               : end.reason == MPV_END_FILE_REASON_ERROR  ? failure_of(end.error)
                                                          : PlayerFailure::other;
}

Result<std::unique_ptr<Player>> make_player(const std::string& output) {
    std::shared_ptr<void> silence = silence_of_decoders();
    mpv_handle* const handle = mpv_create();
    if (handle == nullptr)
        return Status(ENOMEM);
    auto player = std::make_unique<MpvPlayer>(std::move(silence), handle);
    if (const Status started = player->start(output); !started)
        return started;
    return std::unique_ptr<Player>(std::move(player));
}

} // namespace host
