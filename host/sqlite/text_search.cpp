#include "host/sqlite/text_search.h"

namespace host {

SearchKernel best_search_kernel() {
#if defined(__x86_64__)
    static const bool has_avx2 = __builtin_cpu_supports("avx2") != 0;
    return has_avx2 ? SearchKernel::avx2 : SearchKernel::portable;
#else
    return SearchKernel::portable;
#endif
}

} // namespace host
