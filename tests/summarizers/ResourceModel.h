#pragma once
// A one-boot model built from records written in the test: a LogStartsV1
// at absolute time 0 (so positions equal absolute times), then the given
// records, fed to every summarizer of the model.
#include <memory>
#include <vector>

#include "model/Model.h"
#include "support/Records.h"
#include "time/BootTimeline.h"

namespace bw::test {

class ResourceModel {
 public:
  // Takes ownership of the records; their absolute times must ascend.
  explicit ResourceModel(std::vector<std::unique_ptr<Record>> records) : records_(std::move(records)) {
    records_.insert(records_.begin(),
                    std::make_unique<LogStartsV1>(logStart(bootNamed(7), 0, 1700000000000, "22A100")));
    std::vector<Record*> pointers;
    for (auto& r : records_) pointers.push_back(r.get());
    std::vector<std::unique_ptr<Timeline>> boots;
    boots.push_back(std::make_unique<BootTimeline>(bootNamed(7), pointers));
    model_ = std::make_unique<Model>(Timeline::timelineWithTimelines(std::move(boots)), "22A100");
    model_->processEventsWithDomains({});
  }
  Model& model() { return *model_; }

 private:
  std::vector<std::unique_ptr<Record>> records_;
  std::unique_ptr<Model> model_;
};

// A record of class R at absolute time `t`, filled in by `set`.
template <class R, class F>
std::unique_ptr<Record> at(std::uint64_t t, F set) {
  auto r = std::make_unique<R>();
  r->setAbsoluteTime(t);
  set(*r);
  return r;
}

}  // namespace bw::test
