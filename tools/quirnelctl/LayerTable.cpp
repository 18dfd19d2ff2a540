#include "LayerTable.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdio>

namespace {

constexpr std::size_t kColumns = 7;
using Cells = std::array<std::string, kColumns>;

std::string NumberText(double number) {
    std::array<char, 32> text{};
    std::snprintf(text.data(), text.size(), "%.2f", number);
    return text.data();
}

Cells CellsOf(const LayerValues& layer) {
    return {std::to_string(layer.number), layer.state,
            TimeText(layer.position),     layer.length < 0 ? "?" : TimeText(layer.length),
            NumberText(layer.pitch),      NumberText(layer.volume),
            Printable(layer.name)};
}

} // namespace

std::string TimeText(double seconds) {
    const long long whole = std::llround(std::floor(std::clamp(seconds, 0.0, 1e12)));
    std::array<char, 48> text{};
    if (whole >= 3600)
        std::snprintf(text.data(), text.size(), "%lld:%02lld:%02lld", whole / 3600, whole / 60 % 60,
                      whole % 60);
    else
        std::snprintf(text.data(), text.size(), "%lld:%02lld", whole / 60, whole % 60);
    return text.data();
}

std::optional<LayerValues> LayerAt(const BMessage& answer, int32 index) {
    LayerValues layer;
    if (answer.FindInt32("layer", index, &layer.number) != B_OK)
        return std::nullopt;
    answer.FindMessenger("messenger", index, &layer.messenger);
    const auto text = [&](const char* name) {
        const char* found = "";
        return answer.FindString(name, index, &found) == B_OK ? std::string(found) : std::string();
    };
    layer.name = text("name");
    layer.path = text("path");
    layer.state = text("state");
    layer.error = text("error");
    answer.FindDouble("pitch", index, &layer.pitch);
    answer.FindDouble("position", index, &layer.position);
    answer.FindDouble("length", index, &layer.length);
    answer.FindDouble("volume", index, &layer.volume);
    return layer;
}

std::string LayerAsJson(const LayerValues& layer) {
    JsonObject object;
    object.Number("layer", layer.number)
        .Bytes("name", layer.name)
        .Bytes("path", layer.path)
        .Text("state", layer.state)
        .Real("pitch", layer.pitch)
        .Real("position", layer.position)
        .Real("length", layer.length)
        .Real("volume", layer.volume);
    if (!layer.error.empty())
        object.Bytes("error", layer.error);
    return object.Take();
}

void PrintLayers(const std::vector<LayerValues>& layers, Output& output) {
    if (output.IsJson()) {
        for (const LayerValues& layer : layers)
            output.Line(LayerAsJson(layer));
        return;
    }
    if (layers.empty())
        return;
    std::vector<Cells> rows = {{"Layer", "State", "Position", "Length", "Pitch", "Volume", "Name"}};
    for (const LayerValues& layer : layers)
        rows.push_back(CellsOf(layer));
    Cells::size_type column = 0;
    std::array<std::size_t, kColumns> widths{};
    for (column = 0; column < kColumns; ++column) {
        for (const Cells& row : rows)
            widths[column] = std::max(widths[column], DisplayWidth(row[column]));
    }
    for (const Cells& row : rows) {
        std::string line;
        for (column = 0; column < kColumns; ++column)
            line += (column == 0 ? "" : "  ") + Padded(row[column], widths[column]);
        line.erase(line.find_last_not_of(' ') + 1);
        output.Line(line);
    }
}
