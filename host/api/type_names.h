#pragma once

#include <string>
#include <typeinfo>

namespace host {

/// A type's full name as sources write it, such as "space::Outer::Inner"; the compiler's own name for it
/// where there is no better one. Any thread.
std::string type_name(const std::type_info& type);

} // namespace host
