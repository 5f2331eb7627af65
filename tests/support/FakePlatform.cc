#include "support/FakePlatform.h"

namespace bw::test {

FakePlatform::FakePlatform(const std::string& r) : root(r) { setPlatform(this); }
FakePlatform::~FakePlatform() { setPlatform(nullptr); }

}  // namespace bw::test
