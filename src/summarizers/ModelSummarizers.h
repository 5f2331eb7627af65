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

}  // namespace bw
