// What the find window and its list cost: from Enter to the painted list, adding, sorting, dropping, memory.
// The index holds a million tracks, most of them rows without files; every hit is a real file. Times are the
// processor time of the thread that works, whatever else the machine does.
//
// Usage: find_window [FILES [ROWS [FOLDER]]]     100000 files, 1000000 rows, a temporary folder

#include "support/BareLoops.h"
#include "support/Figures.h"
#include "support/Jobs.h"
#include "support/ProcessMemory.h"
#include "support/Surroundings.h"

#include "app/QuirnelApp.h"
#include "host/sqlite/attribute_record.h"
#include "host/sqlite/index_store.h"
#include "playlist/PlayListItem.h"
#include "playlist/PlayListView.h"
#include "search/FindWindow.h"

#include <Autolock.h>
#include <IndexMaintenance.h>
#include <Message.h>
#include <Node.h>
#include <TypeConstants.h>

#include <cstdlib>
#include <fstream>
#include <span>
#include <string>
#include <vector>

namespace {

namespace fs = std::filesystem;
using bench::Better;

constexpr int kRounds = 5;
constexpr int kManyHits = 10'000;
constexpr int kFewHits = 100;
// Texts that nothing else contains.
constexpr char kInAll[] = "Aqx";
constexpr char kInMany[] = "Mqx";
constexpr char kInFew[] = "Fqx";

void Write(BNode& node, const char* attribute, const std::string& text) {
    node.WriteAttr(attribute, B_STRING_TYPE, 0, text.c_str(), text.size() + 1);
}

// In folders of a hundred; those that a search for kInMany finds lie below "many".
bool MakeSongs(const fs::path& library, int count) {
    QuirnelApp app;
    app.CheckCreateIndices();
    for (int i = 0; i < count; ++i) {
        const bool many = i < kManyHits;
        const fs::path folder = library / (many ? "many" : "other") / std::to_string(i / 100);
        if (i % 100 == 0)
            fs::create_directories(folder);
        const std::string path = folder / (std::to_string(i) + ".mp3");
        std::ofstream(path) << "song";
        BNode node(path.c_str());
        const auto mixed = static_cast<unsigned>(i) * 2654435761U;
        Write(node, "Audio:Songname",
              "Song number " + std::to_string(mixed % 1000003) + (i < kFewHits ? kInFew : ""));
        Write(node, "Audio:Artist", "Artist " + std::to_string(mixed % 997) + kInAll);
        Write(node, "Audio:Album", "Album " + std::to_string(mixed % 5003) + (many ? kInMany : ""));
        Write(node, "Audio:TrackNo", std::to_string(i % 20));
        Write(node, "Audio:Disc", "");
        Write(node, "Audio:Version", "");
        Write(node, "Audio:Length", " 3:21");
    }
    // As it is in a library that was indexed: the job has seen every folder.
    bench::RunJob(bench::OnlyVolume(), bench::Job::index, static_cast<size_t>(count));
    close_indices();
    return true;
}

bool AddRowsWithoutFiles(const fs::path& folder, int count) {
    fs::path database;
    for (const auto& entry : fs::directory_iterator(folder)) {
        if (entry.path().extension() == ".db")
            database = entry.path();
    }
    host::IndexStore store;
    if (!host::succeeded(store.open(database, host::Connection::Mode::existing)))
        return false;
    const char* const attributes[] = {"Audio:Songname", "Audio:Artist", "Audio:Album", "Audio:TrackNo"};
    (void)store.begin();
    std::uint32_t ids[4] = {};
    for (int k = 0; k < 4; ++k)
        (void)store.attribute_id(attributes[k], B_STRING_TYPE, ids[k]);
    for (int i = 0; i < count; ++i) {
        const std::string texts[4] = {
            "A title that is as long as most " + std::to_string(i), "Somebody " + std::to_string(i / 50),
            "An album of theirs " + std::to_string(i / 10), std::to_string(i % 10 + 1)};
        host::IndexRow row;
        row.directory = 1'000'000'000 + static_cast<std::uint64_t>(i) / 10;
        row.name = std::to_string(i) + ".mp3";
        row.inode = 2'000'000'000 + static_cast<std::uint64_t>(i);
        row.change_time = 1;
        row.settled = true;
        for (int k = 0; k < 4; ++k)
            host::append_recorded_attribute(row.attributes,
                                            {ids[k], false, std::as_bytes(std::span(texts[k]))});
        (void)store.insert(row);
    }
    return host::succeeded(store.commit());
}

// The window, locked by this thread while it is measured.
class Searches {
  public:
    Searches() : mWindow(new FindWindow(nullptr)), mLock(mWindow), mList(mWindow->List()) {}

    // Milliseconds until the list is painted.
    double Search(const char* text) {
        const bench::ProcessorStopwatch watch;
        mWindow->SearchFor(text);
        mWindow->UpdateIfNeeded();
        return watch.Seconds() * 1e3;
    }
    double MedianOf(const char* text, int32 hits) {
        std::vector<double> times;
        for (int round = 0; round < kRounds; ++round) {
            times.push_back(Search(text));
            if (mList->CountItems() != hits) {
                std::fprintf(stderr, "%d hits for %s\n", mList->CountItems(), text);
                std::exit(1);
            }
        }
        return bench::Median(times);
    }
    std::vector<entry_ref> Refs() const {
        std::vector<entry_ref> refs(static_cast<size_t>(mList->CountItems()));
        for (int32 i = 0; i < mList->CountItems(); ++i)
            static_cast<PlayListItem*>(mList->ItemAt(i))->GetRef(&refs[static_cast<size_t>(i)]);
        return refs;
    }
    // Milliseconds for the first half of so many refs, and once more for the same.
    double Add(std::vector<entry_ref> refs, size_t count) {
        std::vector<double> times;
        for (int round = 0; round < 3; ++round) {
            mList->MakeEmpty();
            const bench::ProcessorStopwatch watch;
            for (size_t i = 0; i < count; ++i)
                mList->AddToList(&refs[i % (count / 2)]);
            mWindow->UpdateIfNeeded();
            times.push_back(watch.Seconds() * 1e3);
        }
        return bench::Median(times);
    }
    double Sort() {
        std::vector<double> times;
        for (int round = 0; round < kRounds; ++round) {
            mList->SetSortKey(kColumnAlbum);
            mWindow->UpdateIfNeeded();
            const bench::ProcessorStopwatch watch;
            mList->SetSortKey(kColumnSongname);
            mWindow->UpdateIfNeeded();
            times.push_back(watch.Seconds() * 1e3);
        }
        return bench::Median(times);
    }
    double Drop(const std::vector<entry_ref>& refs, size_t count) {
        BMessage files(B_SIMPLE_DATA);
        for (size_t i = 0; i < count; ++i)
            files.AddRef("refs", &refs[i]);
        std::vector<double> times;
        for (int round = 0; round < kRounds; ++round) {
            mList->MakeEmpty();
            const bench::ProcessorStopwatch watch;
            mList->MouseMoved(BPoint(50, 50), B_ENTERED_VIEW, &files);
            mList->MouseUp(BPoint(50, 50));
            mWindow->UpdateIfNeeded();
            times.push_back(watch.Seconds() * 1e3);
            if (mList->CountItems() != static_cast<int32>(count))
                std::exit(1);
        }
        return bench::Median(times);
    }

  private:
    FindWindow* const mWindow;
    const BAutolock mLock;
    PlayListView* const mList;
};

bool Measure(const fs::path& library, int files) {
    QuirnelApp app;
    brindle_app = &app;
    app.CheckCreateIndices();
    bool reached = true;
    {
        Searches searches;
        std::printf("(the first search, which loads the index: %.0f ms)\n", searches.Search(kInFew));
        const double few = searches.MedianOf(kInFew, kFewHits);
        reached &= bench::Report("Enter to painted list, 100 hits", few, "ms", "limit", 60, 1, Better::lower);
        const double many = searches.MedianOf(kInMany, kManyHits);
        reached &=
            bench::Report("Enter to painted list, 10 000 hits", many, "ms", "limit", 500, 1, Better::lower);
        std::vector<double> bare;
        for (int round = 0; round < kRounds; ++round) {
            const bench::ProcessorStopwatch watch;
            bench::BareRead(library / "many");
            bare.push_back(watch.Seconds() * 1e3);
        }
        reached &= bench::Report("the same, as a rate", kManyHits / many * 1e3, "hits/s",
                                 "bare loop: open, read seven", kManyHits / bench::Median(bare) * 1e3, 0.5,
                                 Better::higher);
        const double before = bench::AllocatedBytes();
        const double all = searches.Search(kInAll);
        const double memory = bench::AllocatedBytes() - before;
        const int more = files - kManyHits;
        if (more > 0)
            std::printf("(%d rows take %.0f MB, %.0f bytes each)\n", more, memory / 1e6, memory / more);
        reached &= bench::Report("time per hit, all files", all / files * 1e6, "ns", "with 10 000 hits",
                                 many / kManyHits * 1e6, 1.3, Better::lower);
        // Folder by folder, as files are dragged.
        const std::vector<entry_ref> refs = searches.Refs();
        reached &=
            bench::Report("sort them by a click", searches.Sort(), "ms", "limit", 300, 1, Better::lower);
        const auto count = static_cast<size_t>(files);
        const double tenth = searches.Add(refs, count / 10);
        const double whole = searches.Add(refs, count);
        reached &= bench::Report("add, half of them repeats, per file", whole / files * 1e6, "ns",
                                 "with a tenth", tenth / files * 1e7, 1.3, Better::lower);
        reached &= bench::Report("drop 5 000 files", searches.Drop(refs, 5000), "ms", "limit", 500, 1,
                                 Better::lower);
    }
    app.FindWindowSlot().Close();
    brindle_app = nullptr;
    return reached;
}

} // namespace

int main(int argc, char** argv) {
    const int files = argc > 1 ? std::atoi(argv[1]) : 100'000;
    const int rows = argc > 2 ? std::atoi(argv[2]) : 1'000'000;
    const bench::Surroundings surroundings(argc > 3 ? argv[3] : nullptr);
    const fs::path library = surroundings.Folder() / "library";
    fs::create_directory(library);
    setenv("BEKITS_VOLUMES", library.c_str(), 1);
    setenv("QT_QPA_PLATFORM", "offscreen", 1);
    if (!bench::Apart([&] { return MakeSongs(library, files); }) ||
        !AddRowsWithoutFiles(surroundings.Folder() / "XDG_DATA_HOME/bekits/index", rows - files)) {
        std::fprintf(stderr, "the library cannot be made\n");
        return 1;
    }
    return Measure(library, files) ? 0 : 1;
}
