#include "AttributeText.h"
#include "Commands.h"
#include "metadata/BrindleMetaData.h"
#include "metadata/MusicAttributes.h"
#include <Bitmap.h>
#include <Entry.h>
#include <Message.h>
#include <Node.h>
#include <TypeConstants.h>
#include <algorithm>
#include <array>

namespace {

struct Attribute {
    std::string name;
    attr_info info;
    std::string value;
};

std::vector<Attribute> AttributesOf(BNode& node) {
    std::vector<Attribute> attributes;
    std::array<char, B_ATTR_NAME_LENGTH + 1> name{};
    node.RewindAttrs();
    while (node.GetNextAttrName(name.data()) == B_OK) {
        Attribute attribute{name.data(), {}, {}};
        if (node.GetAttrInfo(name.data(), &attribute.info) != B_OK)
            continue;
        attribute.value.resize(static_cast<std::size_t>(attribute.info.size));
        const ssize_t size = node.ReadAttr(name.data(), attribute.info.type, 0, attribute.value.data(),
                                           attribute.value.size());
        if (size < 0)
            continue;
        attribute.value.resize(static_cast<std::size_t>(size));
        attributes.push_back(std::move(attribute));
    }
    std::sort(attributes.begin(), attributes.end(),
              [](const Attribute& one, const Attribute& other) { return one.name < other.name; });
    return attributes;
}

void PrintAsJson(const std::string& path, const std::vector<Attribute>& attributes, Output& output) {
    for (const Attribute& attribute : attributes) {
        JsonObject object;
        object.Bytes("path", path)
            .Bytes("name", attribute.name)
            .Text("type", TypeCodeText(attribute.info.type))
            .Number("size", attribute.info.size);
        AddAttributeValue(object, attribute.info.type, attribute.value);
        output.Line(object.Take());
    }
}

void PrintAsTable(const std::string& path, const std::vector<Attribute>& attributes, Output& output) {
    std::size_t name_width = 0;
    std::size_t size_width = 0;
    for (const Attribute& attribute : attributes) {
        name_width = std::max(name_width, DisplayWidth(Printable(attribute.name)));
        size_width = std::max(size_width, std::to_string(attribute.info.size).size());
    }
    output.Line(Printable(path) + (attributes.empty() ? ": no attributes" : ":"));
    for (const Attribute& attribute : attributes) {
        const std::string size = std::to_string(attribute.info.size);
        output.Line("  " + Padded(Printable(attribute.name), name_width) + "  " +
                    TypeCodeText(attribute.info.type) + "  " + std::string(size_width - size.size(), ' ') +
                    size + "  " + AttributeValueText(attribute.info.type, attribute.value));
    }
}

int ShowAttributesOf(const std::string& path, Output& output) {
    BEntry entry;
    if (entry.SetTo(path.c_str(), true) != B_OK || !entry.Exists())
        return Fail(Printable(path) + ": no such file");
    BNode node(&entry);
    if (const status_t status = node.InitCheck(); status != B_OK)
        return Fail(Printable(path) + ": " + strerror(status));
    const std::vector<Attribute> attributes = AttributesOf(node);
    if (output.IsJson())
        PrintAsJson(path, attributes, output);
    else
        PrintAsTable(path, attributes, output);
    return 0;
}

/// The cover as it lies on the file, whole.
std::string CoverOf(const entry_ref& track) {
    BNode node(&track);
    attr_info info;
    if (node.GetAttrInfo(kAttribute64x64Cover, &info) != B_OK)
        return {};
    std::string value(static_cast<std::size_t>(info.size), '\0');
    const ssize_t size = node.ReadAttr(kAttribute64x64Cover, B_RAW_TYPE, 0, value.data(), value.size());
    value.resize(size > 0 ? static_cast<std::size_t>(size) : 0);
    return value;
}

} // namespace

int ShowAttributes(const Request& request, Output& output) {
    if (request.arguments.empty())
        return Fail("attr takes the files to show");
    for (const std::string& path : request.arguments) {
        if (const int status = ShowAttributesOf(path, output); status != 0)
            return status;
    }
    return 0;
}

int SetCover(const Request& request, Output& output) {
    if (request.arguments.size() != 2)
        return Fail("cover takes a song and a picture");
    const std::string& song = request.arguments[0];
    const std::string& picture = request.arguments[1];

    BEntry song_entry(song.c_str(), true);
    BEntry picture_entry(picture.c_str(), true);
    entry_ref song_ref;
    entry_ref picture_ref;
    if (song_entry.GetRef(&song_ref) != B_OK || !song_entry.IsFile())
        return Fail(Printable(song) + ": no such file");
    if (picture_entry.GetRef(&picture_ref) != B_OK || !picture_entry.IsFile())
        return Fail(Printable(picture) + ": no such file");

    const std::string before = CoverOf(song_ref);
    BrindleMetaData record(&song_ref);
    if (!record.mIsValid)
        return Fail(Printable(song) + ": cannot be opened");
    if (record.SetTrackPicture(&picture_ref) != 0)
        return Fail(Printable(picture) + ": not a picture that can be read");

    // Writing attributes reports nothing, so what is on the file now is looked at.
    const std::string after = CoverOf(song_ref);
    BMessage archive;
    if (record.mCover64x64bitmap != nullptr && record.mCover64x64bitmap->Archive(&archive) == B_OK) {
        std::string wanted(static_cast<std::size_t>(archive.FlattenedSize()), '\0');
        archive.Flatten(wanted.data(), static_cast<ssize_t>(wanted.size()));
        if (after != wanted)
            return Fail(Printable(song) +
                        ": the cover could not be written; is the volume full or read-only, or its "
                        "file system one without attributes?");
    }
    if (output.IsJson())
        output.Line(JsonObject()
                        .Bytes("path", song)
                        .Number("size", static_cast<std::int64_t>(after.size()))
                        .Flag("replaced", !before.empty())
                        .Take());
    else
        output.Line((before.empty() ? "Set the cover of " : "Replaced the cover of ") + Printable(song));
    return 0;
}
