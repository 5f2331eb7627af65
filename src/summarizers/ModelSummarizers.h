#pragma once
// The summarizers every model holds, each under its key ("A/C", "Sleep",
// "Power", ...).
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "framework/Summarizer.h"

namespace bw {

std::vector<std::pair<std::string, std::unique_ptr<Summarizer>>> makeModelSummarizers();
// The keys of makeModelSummarizers(), in its order: what the state names of
// a run may be, known before any record is read.
std::vector<std::string> modelSummarizerKeys();

}  // namespace bw
