#pragma once

#include "host/api/index.h"
#include "host/linux/tree_walker.h"
#include "host/sqlite/condition.h"
#include "host/sqlite/live_queries.h"
#include <memory>

namespace host {

/// Answers a condition by walking the volume.
class WalkQuery final : public RunningQuery {
  public:
    /// `live` may be null. `keep_alive` is held as long as the query.
    WalkQuery(DeviceId device, std::shared_ptr<const Condition> condition, std::shared_ptr<LiveQuery> live,
              std::shared_ptr<void> keep_alive, std::unique_ptr<TreeWalker> walker)
        : device_(device), condition_(std::move(condition)), live_(std::move(live)),
          keep_alive_(std::move(keep_alive)), walker_(std::move(walker)) {}
    ~WalkQuery() override;

    Status next(Hit& hit) override;
    Status rewind() override;

  private:
    const DeviceId device_;
    const std::shared_ptr<const Condition> condition_;
    const std::shared_ptr<LiveQuery> live_;
    const std::shared_ptr<void> keep_alive_;
    std::unique_ptr<TreeWalker> walker_;
};

} // namespace host
