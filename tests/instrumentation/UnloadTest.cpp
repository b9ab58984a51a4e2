#include <dlfcn.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <string>
#include <thread>

#include "tests/instrumentation/FixtureTree.h"

namespace {

bool isMapped(const std::string& name) {
    std::ifstream maps("/proc/self/maps");
    for (std::string line; std::getline(maps, line);) {
        if (line.find(name) != std::string::npos) return true;
    }
    return false;
}

std::ptrdiff_t openDescriptors() {
    const std::filesystem::directory_iterator all("/proc/self/fd"), end;
    return std::distance(all, end);
}

void loadUseUnload(const std::string& root) {
    void* plugin = ::dlopen(INSTRUMENTATION_PLUGIN, RTLD_NOW | RTLD_LOCAL);
    ASSERT_TRUE(plugin) << ::dlerror();
    EXPECT_TRUE(isMapped("libvainstrumentation.so"));
    const auto use = reinterpret_cast<int (*)(const char*)>(::dlsym(plugin, "useLibrary"));
    ASSERT_TRUE(use);
    EXPECT_EQ(use(root.c_str()), 1);
    // A worker's own thread-local data must not hold the library either.
    std::thread([&] { EXPECT_EQ(use(root.c_str()), 1); }).join();
    ASSERT_EQ(::dlclose(plugin), 0);
}

TEST(Unloading, LibraryVanishesFromTheProcessEachOfAHundredTimes) {
    FixtureTree tree;
    tree.writeCompleteHost();
    tree.makeFolder("run/systemd/system");  // so that libsystemd is loaded where there is one
    loadUseUnload(tree.root());
    const auto descriptors = openDescriptors();
    for (int i = 0; i < 100; ++i) {
        loadUseUnload(tree.root());
        ASSERT_FALSE(isMapped("libvainstrumentation")) << i;
        ASSERT_FALSE(isMapped("instrumentation_plugin")) << i;
    }
    EXPECT_EQ(openDescriptors(), descriptors);
}

}  // namespace
