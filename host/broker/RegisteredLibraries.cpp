// One lock for all loading, not one for each library: two threads whose factories need each other's
// library would wait for each other.
#include "host/broker/RegisteredLibraries.h"

#include <utility>

namespace cmpihost {

namespace {

std::string libraryName(const Registration& registration) {
    return "lib" + registration.location + ".so";
}

/// A complaint about the library of a registration.
LoadError failureFor(const Registration& registration, const std::string& why) {
    return LoadError(registration.file.string() + ":" + std::to_string(registration.line) +
                     ": the provider of " + registration.className + ": " + why);
}

}  // namespace

std::string providerKey(const Registration& registration) {
    return registration.provider + '\n' + registration.location;
}

RegisteredLibraries::RegisteredLibraries(Broker& broker, std::vector<std::filesystem::path> folders)
    : broker_(broker), folders_(std::move(folders)) {}

ProviderLibrary& RegisteredLibraries::of(const Registration& registration) {
    ProviderLibrary* const known = loaded(providerKey(registration));
    ProviderLibrary& library = known != nullptr ? *known : loadOnce(registration);
    for (const Interface type : registration.types) {
        if (!library.interfaces().has(type))
            throw failureFor(registration, library.whyMissing(type));
    }
    return library;
}

void RegisteredLibraries::unload() noexcept {
    // A provider may make up-calls in cleanup: to one that is loaded still, or that is loaded only
    // now. One that has gone stays away, or two could bring each other back for ever.
    for (;;) {
        // Declared first, so that cleanup runs without the lock.
        std::unique_ptr<ProviderLibrary> going;
        const std::lock_guard<std::mutex> lock(mutex_);
        if (inOrder_.empty()) break;
        going = std::move(inOrder_.back().second);
        libraries_.erase(inOrder_.back().first);
        gone_.insert(std::move(inOrder_.back().first));
        inOrder_.pop_back();
    }
    const std::lock_guard<std::mutex> lock(mutex_);
    gone_.clear();
}

std::chrono::nanoseconds RegisteredLibraries::loadTime() const {
    const std::lock_guard<std::mutex> lock(mutex_);
    return loadTime_;
}

ProviderLibrary* RegisteredLibraries::loaded(const std::string& key) const {
    const std::lock_guard<std::mutex> lock(mutex_);
    if (gone_.count(key) != 0) {
        throw LoadError("lib" + key.substr(key.find('\n') + 1) +
                        ".so is needed in a cleanup after it was unloaded");
    }
    const auto found = libraries_.find(key);
    return found == libraries_.end() ? nullptr : found->second;
}

ProviderLibrary& RegisteredLibraries::loadOnce(const Registration& registration) {
    const std::string key = providerKey(registration);
    const std::lock_guard<std::recursive_mutex> loading(loading_);
    // Another thread may have been faster.
    if (ProviderLibrary* const known = loaded(key)) return *known;
    if (!beingLoaded_.insert(key).second)
        throw LoadError(libraryName(registration) + " is needed while it is being loaded");
    const auto start = std::chrono::steady_clock::now();
    std::unique_ptr<ProviderLibrary> made;
    try {
        made = load(registration);
    } catch (...) {
        beingLoaded_.erase(key);
        throw;
    }
    beingLoaded_.erase(key);
    const std::lock_guard<std::mutex> lock(mutex_);
    // One that was loaded for another is part of that one's time.
    if (beingLoaded_.empty()) loadTime_ += std::chrono::steady_clock::now() - start;
    inOrder_.emplace_back(key, std::move(made));
    return *libraries_.emplace(key, inOrder_.back().second.get()).first->second;
}

std::unique_ptr<ProviderLibrary> RegisteredLibraries::load(const Registration& registration) const {
    std::vector<std::filesystem::path> folders = {registration.file.parent_path()};
    // A bare name would be searched by the loader.
    if (folders.front().empty()) folders.front() = ".";
    folders.insert(folders.end(), folders_.begin(), folders_.end());
    LoadOptions options;
    options.providerName = registration.provider;
    options.parameters = registration.parameters;
    const std::string file = findLibrary(registration.location, folders).string();
    try {
        return std::make_unique<ProviderLibrary>(file, broker_, options);
    } catch (const LoadError& error) {
        std::string places;
        for (const std::filesystem::path& folder : folders)
            places += (places.empty() ? "; looked for in " : ", ") + folder.string();
        const bool found = file.find('/') != std::string::npos;
        throw failureFor(registration, error.what() + (found ? std::string() : places));
    }
}

}  // namespace cmpihost
