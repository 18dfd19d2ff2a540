#include "host/api/player.h"

// What stands in where libmpv is missing.

namespace host {

Result<std::unique_ptr<Player>> make_player(const std::string&) {
    return Status(ENOTSUP);
}

} // namespace host
