#include "support/HostQueries.h"

#include "host/api/index.h"
#include "host/linux/directory_stream.h"
#include "support/Figures.h"
#include <dirent.h>
#include <fcntl.h>
#include <unistd.h>

namespace bench {
namespace {

std::uint64_t Walk(int directory) {
    std::uint64_t count = 0;
    host::DirectoryStream stream(directory, 65536);
    host::DirectoryStream::Entry entry;
    while (stream.next(entry)) {
        ++count;
        if (entry.type != DT_DIR)
            continue;
        const int child =
            openat(directory, entry.leaf.data(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC);
        if (child >= 0) {
            count += Walk(child);
            close(child);
        }
    }
    return count;
}

} // namespace

std::shared_ptr<const host::Predicate> Comparison(const char* attribute, host::Predicate::Operator op,
                                                  const char* text) {
    auto predicate = std::make_shared<host::Predicate>();
    predicate->attribute = attribute;
    predicate->op = op;
    predicate->value = std::string(text);
    return predicate;
}

Answer Ask(host::DeviceId volume, const std::shared_ptr<const host::Predicate>& predicate) {
    Answer answer;
    host::RunningQuery::Hit hit;
    const Stopwatch watch;
    const auto query = host::indexes().query(volume, predicate, nullptr);
    while (query && (*query)->next(hit).ok()) {
        if (answer.hits++ == 0)
            answer.first = watch.Seconds();
    }
    answer.all = watch.Seconds();
    return answer;
}

std::uint64_t BareWalk(const std::string& root) {
    const int directory = open(root.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (directory < 0)
        return 0;
    const std::uint64_t entries = Walk(directory);
    close(directory);
    return entries;
}

} // namespace bench
