// Any bytes are read as the record of a MIME type: refused, or every question answered and the record written
// again.

#include <MimeRecord.h>

#include <cstddef>
#include <cstdint>
#include <cstdlib>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    MimeRecord record("audio/x-mpeg");
    if (record.Parse(data, size) != B_OK)
        return 0;
    std::string text;
    BMessage list;
    std::vector<uint8> bits;
    using Text = MimeRecord::Text;
    for (Text field : {Text::shortDescription, Text::longDescription, Text::preferredApp, Text::appHint,
                       Text::snifferRule})
        (void)record.GetText(field, text);
    using List = MimeRecord::List;
    for (List field : {List::attributeInfo, List::extensions, List::supportedTypes})
        (void)record.GetList(field, list);
    for (icon_size iconSize : {B_MINI_ICON, B_LARGE_ICON}) {
        const std::size_t expected = iconSize == B_MINI_ICON ? 256 : 1024;
        if (record.GetIcon("", iconSize, bits) == B_OK && bits.size() != expected)
            std::abort();
        (void)record.GetIcon("audio/ogg", iconSize, bits);
    }
    if (record.SetText(Text::shortDescription, "Song") != B_OK)
        std::abort();
    std::vector<char> written;
    MimeRecord again("audio/x-mpeg");
    if (record.Serialize(written) != B_OK || again.Parse(written.data(), written.size()) != B_OK ||
        again.GetText(Text::shortDescription, text) != B_OK || text != "Song")
        std::abort();
    return 0;
}
