// Another header may name an adapter without knowing more of it than that it is a class.
namespace VA::OSStatusProvider {
class CMPIInstalledOS;
class CMPIOSComputerSystem;
class CMPIOSElementCapabilities;
class CMPIOperatingSystem;
class CMPIOperatingSystemCapabilities;
class CMPIRunningOS;
class InstalledOS;
class OSElementCapabilities;
class OperatingSystem;
class OperatingSystemCapabilities;
class RunningOS;
}  // namespace VA::OSStatusProvider

#include <gtest/gtest.h>

#include <type_traits>

#include "CMPIComputerSystem.h"
#include "CMPIElementCapabilities.h"
#include "CMPIInstalledOS.h"
#include "CMPIOperatingSystem.h"
#include "CMPIOperatingSystemCapabilities.h"
#include "CMPIRunningOS.h"
#include "Linux/ElementCapabilities.h"
#include "Linux/InstalledOS.h"
#include "Linux/OperatingSystem.h"
#include "Linux/OperatingSystemCapabilities.h"
#include "Linux/RunningOS.h"

namespace {

using namespace VA::OSStatusProvider;

template <class Class>
class DeclaredInAdvance : public testing::Test {};

using Classes =
    testing::Types<CMPIInstalledOS, CMPIOSComputerSystem, CMPIOSElementCapabilities,
                   CMPIOperatingSystem, CMPIOperatingSystemCapabilities, CMPIRunningOS, InstalledOS,
                   OSElementCapabilities, OperatingSystem, OperatingSystemCapabilities, RunningOS>;
TYPED_TEST_SUITE(DeclaredInAdvance, Classes, );

TYPED_TEST(DeclaredInAdvance, IsAPlainClassWithoutVirtualOperations) {
    EXPECT_TRUE(std::is_class_v<TypeParam>);
    EXPECT_FALSE(std::is_polymorphic_v<TypeParam>);
}

}  // namespace
