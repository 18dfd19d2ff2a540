#include "Commands.h"
#include "Interruption.h"
#include "LayerTable.h"
#include "Programs.h"
#include "ProgressLine.h"
#include "app/QuirnelApp.h"
#include "soundplay/ScriptMessage.h"
#include "soundplay/SoundplayScripter.h"
#include <Entry.h>
#include <Errors.h>
#include <OS.h>
#include <Roster.h>
#include <charconv>

namespace {

constexpr bigtime_t kPatience = 3'000'000;
constexpr bigtime_t kLookInterval = 100'000;

/// A whole number or a decimal fraction, as all of the text.
template <typename Number>
std::optional<Number> NumberIn(const std::string& text) {
    Number number{};
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    if (error != std::errc() || end != text.data() + text.size())
        return std::nullopt;
    return number;
}

status_t AskForValues(const BMessenger& target, BMessage& answer) {
    ScriptMessage request(SCRIPTGETVALUES);
    return target.SendMessage(&request, &answer, kPatience, kPatience);
}

/// The layers that are open. Empty, with a status, when the player cannot be asked.
std::vector<LayerValues> OpenLayers(status_t& status) {
    BMessage answer;
    std::vector<LayerValues> layers;
    status = AskForValues(BMessenger(kSoundPlaySignature), answer);
    for (int32 index = 0; status == B_OK; index++) {
        const std::optional<LayerValues> layer = LayerAt(answer, index);
        if (!layer)
            break;
        layers.push_back(*layer);
    }
    return layers;
}

int ListLayers(Output& output) {
    // A player that does not run plays nothing.
    if (!be_roster->IsRunning(kSoundPlaySignature)) {
        PrintLayers({}, output);
        return 0;
    }
    status_t status = B_OK;
    const std::vector<LayerValues> layers = OpenLayers(status);
    if (status != B_OK)
        return Fail(ProblemOf(kSoundPlaySignature, status));
    PrintLayers(layers, output);
    return 0;
}

/// Until the track's end, an interruption, or until the layer is stopped by somebody else.
int FollowLayer(SoundplayScripter& scripter, sptrackinfo* record, const std::string& path, Output& output) {
    ProgressLine progress;
    bool told = false;
    while (!Interrupted()) {
        BMessage answer;
        const status_t status = AskForValues(*record->messenger, answer);
        const std::optional<LayerValues> layer = LayerAt(answer, 0);
        progress.Clear();
        if (status == B_TIMED_OUT)
            return Fail(ProblemOf(kSoundPlaySignature, status));
        if (status != B_OK || !layer)
            return be_roster->IsRunning(kSoundPlaySignature) ? 0 : Fail("the player has ended");
        if (layer->state == "failed") {
            scripter.DeleteLayer(record);
            return Fail(Printable(path) + ": " + Printable(layer->error));
        }
        if (!told && layer->state != "empty" && layer->state != "loading") {
            if (output.IsJson())
                output.Line(LayerAsJson(*layer));
            else
                output.Line("Playing " + Printable(path) + " as layer " + std::to_string(layer->number));
            told = true;
            if (!output.Finish())
                break;
        }
        if (layer->state == "ended")
            break;
        progress.Show(TimeText(layer->position) +
                      (layer->length < 0 ? "" : " of " + TimeText(layer->length)));
        snooze(kLookInterval);
    }
    scripter.DeleteLayer(record);
    return 0;
}

int PlayFile(const std::string& path, Output& output) {
    BEntry entry(path.c_str(), true);
    entry_ref ref;
    if (entry.GetRef(&ref) != B_OK || !entry.Exists())
        return Fail(Printable(path) + ": no such file");
    if (!entry.IsFile())
        return Fail(Printable(path) + ": is no file");
    // One that runs already is not ended with this program, so that others go on playing. What is wrong with
    // the file is told from here.
    bool launched = false;
    if (const std::string problem = StartProgram(kSoundPlaySignature, LaunchedErrors::dropped, launched);
        !problem.empty())
        return Fail(problem);
    CatchInterruptions();
    SoundplayScripter& scripter = *brindle_app->GetSoundplayScripter();
    sptrackinfo* const record = scripter.NewLayer(&ref, nullptr);
    if (record == nullptr)
        return Fail(ProblemOf(kSoundPlaySignature, B_BAD_PORT_ID));
    if (!record->messenger->IsValid())
        return Fail("the player opens no further layer");
    return FollowLayer(scripter, record, path, output);
}

struct Setting {
    const char* name;
    const char* usage;
    double least;
    double most;
    /// What besides the range is a value.
    double exception;
    const char* range;
};

constexpr double kNoLimit = 1e12;
constexpr Setting kSettings[] = {
    {"pitch", "layer pitch takes the number of a layer and a pitch", 0.01, 100, 0,
     "a pitch is 0 or a number from 0.01 to 100"},
    {"seek", "layer seek takes the number of a layer and seconds", 0, kNoLimit, 0,
     "a position is a number of seconds, 0 or more"},
    {"volume", "layer volume takes the number of a layer and a volume", 0, 1, 0,
     "a volume is a number from 0 to 1"},
};

/// The layer of that number; nothing, having said why.
std::optional<LayerValues> LayerNumbered(const std::string& text) {
    const std::optional<std::int32_t> number = NumberIn<std::int32_t>(text);
    if (!number) {
        Fail("no number of a layer: " + Printable(text));
        return std::nullopt;
    }
    status_t status = B_OK;
    std::vector<LayerValues> layers;
    if (be_roster->IsRunning(kSoundPlaySignature))
        layers = OpenLayers(status);
    if (status != B_OK) {
        Fail(ProblemOf(kSoundPlaySignature, status));
        return std::nullopt;
    }
    for (const LayerValues& layer : layers) {
        if (layer.number == *number)
            return layer;
    }
    Fail("there is no layer " + std::to_string(*number) + "; 'quirnelctl layer list' lists them");
    return std::nullopt;
}

int ChangeLayer(const Setting& setting, const std::vector<std::string>& arguments, Output& output) {
    if (arguments.size() != 3)
        return Fail(setting.usage);
    const std::optional<double> value = NumberIn<double>(arguments[2]);
    if (!value || !((*value >= setting.least && *value <= setting.most) || *value == setting.exception))
        return Fail(std::string(setting.range) + ": " + Printable(arguments[2]));
    const std::optional<LayerValues> layer = LayerNumbered(arguments[1]);
    if (!layer)
        return 1;
    const std::string name = setting.name;
    if (name == "seek" && (layer->state == "failed" || layer->state == "empty"))
        return Fail("layer " + std::to_string(layer->number) + " plays nothing");
    SoundplayScripter& scripter = *brindle_app->GetSoundplayScripter();
    sptrackinfo* const record = scripter.TakeUpLayer(layer->messenger);
    if (name == "pitch")
        scripter.RepitchLayer(record, *value);
    else if (name == "seek")
        scripter.SeekLayer(record, *value);
    else
        scripter.SetLevel(record, static_cast<float>(*value));
    // Commands are not answered for; what is asked afterwards is.
    BMessage answer;
    const status_t status = AskForValues(*record->messenger, answer);
    const std::optional<LayerValues> changed = LayerAt(answer, 0);
    if (status != B_OK || !changed)
        return Fail("layer " + std::to_string(layer->number) + " has ended");
    if (output.IsJson())
        output.Line(LayerAsJson(*changed));
    return 0;
}

int StopLayer(const std::string& number) {
    const std::optional<LayerValues> layer = LayerNumbered(number);
    if (!layer)
        return 1;
    SoundplayScripter& scripter = *brindle_app->GetSoundplayScripter();
    scripter.DeleteLayer(scripter.TakeUpLayer(layer->messenger));
    return 0;
}

} // namespace

int ControlLayer(const Request& request, Output& output) {
    constexpr char kWhat[] = "layer takes play, list, pitch, seek, volume or stop";
    const std::vector<std::string>& arguments = request.arguments;
    if (arguments.empty())
        return Fail(kWhat);
    const std::string& what = arguments.front();
    if (what == "play")
        return arguments.size() == 2 ? PlayFile(arguments[1], output) : Fail("layer play takes one file");
    if (what == "list")
        return arguments.size() == 1 ? ListLayers(output) : Fail("layer list takes nothing more");
    if (what == "stop")
        return arguments.size() == 2 ? StopLayer(arguments[1])
                                     : Fail("layer stop takes the number of a layer");
    for (const Setting& setting : kSettings) {
        if (what == setting.name)
            return ChangeLayer(setting, arguments, output);
    }
    return Fail(std::string(kWhat) + ", not " + Printable(what));
}
