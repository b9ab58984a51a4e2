// Stands in for libvainstrumentation.so.1 where a program is to show the same host on every
// machine: the product's own objects, with the tree of fixture_host/ as the root and a kernel and a
// service manager that say fixed things. Programs find it through LD_LIBRARY_PATH; the product has
// no switch for it.
#include <memory>

#include "framework/instrumentation/LinuxHost.h"
#include "support/TestHost.h"

namespace {

[[gnu::constructor]] void showFixtureHost() {
    const auto files = std::make_shared<CountingFiles>(KORVA_FIXTURE_ROOT);
    files->fixedDates[""].birth = 1650000000;
    const auto kernel = std::make_shared<FixedKernel>();
    kernel->fixedNames->node = "fixture.example";
    kernel->fixedLimit = 68719476736;
    VA::setHostSource(std::make_shared<VA::LinuxHost>(
        VA::Linux::HostParts{files, kernel, std::make_shared<FixedSystemManager>()}));
}

}  // namespace
