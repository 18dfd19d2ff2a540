#include "Commands.h"
#include "SongTable.h"
#include "VolumeChoice.h"
#include "search/SongQuery.h"
#include <Entry.h>
#include <Path.h>
#include <Query.h>
#include <set>
#include <tuple>

namespace {

constexpr char kNoVolumeAnswers[] = "no volume here answers queries";

/// Lists refs once each, as paths or as a table of fields.
class HitList {
  public:
    HitList(const Request& request, Output& output) : mOutput(output) {
        if (request.fields)
            mTable.emplace(output);
    }
    void Add(const entry_ref& ref) {
        if (!mSeen.emplace(ref.device, ref.directory, ref.name).second)
            return;
        BPath path;
        if (BEntry(&ref).GetPath(&path) != B_OK)
            return;
        if (mTable)
            mTable->Add(ref, path.Path());
        else
            mOutput.Path(path.Path());
    }
    void Finish() {
        if (mTable)
            mTable->Print();
    }

  private:
    Output& mOutput;
    std::optional<SongTable> mTable;
    std::set<std::tuple<dev_t, ino_t, std::string>> mSeen;
};

} // namespace

int FindSongs(const Request& request, Output& output) {
    if (request.arguments.size() != 1)
        return Fail("find takes one text");
    HitList hits(request, output);
    bool answered = false;
    for (const ChosenVolume& volume : AllVolumes()) {
        if (!volume.volume.KnowsQuery())
            continue;
        BQuery query;
        query.SetVolume(&volume.volume);
        PushSongsContaining(query, request.arguments.front().c_str());
        // As in the window, a volume that cannot answer adds nothing.
        if (query.Fetch() != B_OK)
            continue;
        answered = true;
        entry_ref ref;
        while (query.GetNextRef(&ref) == B_OK)
            hits.Add(ref);
    }
    if (!answered)
        return Fail(kNoVolumeAnswers);
    hits.Finish();
    return 0;
}

int QueryFiles(const Request& request, Output& output) {
    if (request.arguments.empty())
        return Fail("query takes a predicate, such as 'Audio:Artist==\"*Lanterns*\"'");
    std::string problem;
    std::vector<ChosenVolume> volumes;
    const std::vector<std::string> roots(request.arguments.begin() + 1, request.arguments.end());
    if (roots.empty()) {
        for (const ChosenVolume& volume : AllVolumes()) {
            if (volume.volume.KnowsQuery())
                volumes.push_back(volume);
        }
        if (volumes.empty())
            return Fail(kNoVolumeAnswers);
    } else if (const auto named = VolumesOf(roots, problem)) {
        volumes = *named;
    } else {
        return Fail(problem);
    }
    HitList hits(request, output);
    for (const ChosenVolume& volume : volumes) {
        BQuery query;
        query.SetVolume(&volume.volume);
        query.SetPredicate(request.arguments.front().c_str());
        const status_t status = query.Fetch();
        if (status == B_BAD_VALUE)
            return Fail("not a predicate: " + Printable(request.arguments.front()));
        if (status != B_OK)
            return Fail(Printable(volume.root) + ": " + strerror(status));
        entry_ref ref;
        while (query.GetNextRef(&ref) == B_OK)
            hits.Add(ref);
    }
    hits.Finish();
    return 0;
}
