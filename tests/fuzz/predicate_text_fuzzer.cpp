// Any bytes are read as a query's condition: refused with a reason, or read, printed, and read back the same.

#include <PredicateParser.h>
#include <PredicatePrinter.h>

#include <cstddef>
#include <cstdint>
#include <cstdlib>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    constexpr time_t kNow = 1'000'000'000;
    std::string_view text(reinterpret_cast<const char*>(data), size);
    ParsedPredicate parsed = ParsePredicate(text, kNow);
    if (parsed.predicate == nullptr) {
        if (parsed.error.empty() || parsed.position > size)
            std::abort();
        return 0;
    }
    if (!PredicatesAreEqual(*parsed.predicate, *CanonicalPredicate(parsed.predicate)))
        std::abort();
    std::string printed = PrintPredicate(*parsed.predicate);
    if (printed.size() > kMaxPredicateLength)
        return 0;
    ParsedPredicate again = ParsePredicate(printed, kNow);
    if (again.predicate == nullptr || !PredicatesAreEqual(*parsed.predicate, *again.predicate))
        std::abort();
    return 0;
}
