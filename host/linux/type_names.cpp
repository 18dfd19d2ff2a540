#include "host/api/type_names.h"

#include <cstdlib>
#include <cxxabi.h>
#include <memory>

namespace host {

std::string type_name(const std::type_info& type) {
    int status = 0;
    const std::unique_ptr<char, void (*)(void*)> name(
        abi::__cxa_demangle(type.name(), nullptr, nullptr, &status), std::free);
    return name != nullptr ? name.get() : type.name();
}

} // namespace host
