#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "CMPIOperatingSystem.h"
#include "CMPIOperatingSystemCapabilities.h"
#include "host/broker/Value.h"
#include "host/mof/Schema.h"

// The tables of the adapters, held against the classes that schema/ declares.

namespace {

using namespace VA::OSStatusProvider;

const cmpihost::ClassDeclaration& declared(const std::string& className) {
    static const cmpihost::SchemaCatalogue catalogue(
        cmpihost::Schema::load(KORVA_SOURCE_DIR "/schema"));
    return *catalogue.find(className);
}

template <class Design>
std::vector<std::string> publishedProperties() {
    std::vector<std::string> result;
    for (const auto& row : Design::properties())
        result.push_back(cmpihost::cimTypeName(row.type) + " " + row.name);
    return result;
}

std::vector<std::string> declaredProperties(const std::string& className) {
    std::vector<std::string> result;
    for (const cmpihost::PropertyDeclaration& property : declared(className).properties)
        result.push_back(cmpihost::cimTypeName(property.type) + " " + property.name);
    return result;
}

template <class Design>
std::vector<std::string> keysOfPaths() {
    std::vector<std::string> result;
    for (const auto& key : Design::keys()) result.push_back(key.name);
    return result;
}

std::vector<std::string> declaredKeys(const std::string& className) {
    std::vector<std::string> result;
    for (const cmpihost::PropertyDeclaration& property : declared(className).properties)
        if (property.key) result.push_back(property.name);
    return result;
}

TEST(PropertyTable, OfTheOperatingSystemIsThatOfItsClass) {
    EXPECT_EQ(publishedProperties<OperatingSystemDesign>().size(), 43U);
    EXPECT_EQ(publishedProperties<OperatingSystemDesign>(),
              declaredProperties("KORVA_OperatingSystem"));
    EXPECT_EQ(keysOfPaths<OperatingSystemDesign>(), declaredKeys("KORVA_OperatingSystem"));
}

TEST(PropertyTable, OfTheCapabilitiesIsThatOfItsClass) {
    EXPECT_EQ(publishedProperties<OperatingSystemCapabilitiesDesign>().size(), 6U);
    EXPECT_EQ(publishedProperties<OperatingSystemCapabilitiesDesign>(),
              declaredProperties("KORVA_OperatingSystemCapabilities"));
    EXPECT_EQ(keysOfPaths<OperatingSystemCapabilitiesDesign>(),
              declaredKeys("KORVA_OperatingSystemCapabilities"));
}

}  // namespace
