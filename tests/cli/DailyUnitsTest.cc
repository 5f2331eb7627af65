#include <gtest/gtest.h>

#include <sys/stat.h>
#include <cstdio>

#include <cstdlib>
#include <fstream>
#include <sstream>

#include "support/TempDir.h"

namespace bw {
namespace {

std::string unitText(const std::string& name) {
  std::ifstream in(std::string(BRINDLEWICK_SOURCE_DIR) + "/dist/" + name);
  std::stringstream s;
  s << in.rdbuf();
  return s.str();
}

// The units as systemd reads them: systemd-analyze checks the unit syntax and that ExecStart names an
// executable: it gets a stand-in for the installed tool through a root
// (which holds none of the system's units, hence no recursive errors).
TEST(DailyUnits, SystemdAcceptsTheUnits) {
  if (std::system("command -v systemd-analyze >/dev/null 2>&1") != 0) GTEST_SKIP() << "no systemd-analyze";
  test::TempDir root;
  const std::string tool = root.write("usr/bin/brindlewick", "#!/bin/sh\n");
  ASSERT_EQ(chmod(tool.c_str(), 0755), 0);
  for (const char* name : {"brindlewick-daily.service", "brindlewick-daily.timer"})
    root.write(std::string("etc/systemd/system/") + name, unitText(name));
  const std::string command = "systemd-analyze verify --man=no --recursive-errors=no --root=" + root.path() + " " +
                              root.path() + "/etc/systemd/system/brindlewick-daily.timer " + root.path() +
                              "/etc/systemd/system/brindlewick-daily.service 2>&1";
  FILE* p = popen(command.c_str(), "r");
  ASSERT_TRUE(p);
  std::string output;
  char buffer[512];
  while (std::fgets(buffer, sizeof buffer, p)) output += buffer;
  const int status = pclose(p);
  EXPECT_EQ(status, 0) << output;
  EXPECT_EQ(output, "");
}

}  // namespace
}  // namespace bw
