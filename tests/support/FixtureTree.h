#ifndef TESTS_SUPPORT_FIXTURE_TREE_H
#define TESTS_SUPPORT_FIXTURE_TREE_H

#include "support/TemporaryDirectory.h"

/// A temporary directory to be the root of a host; missing parent folders are made.
class FixtureTree : public TemporaryDirectory {
  public:
    const std::string& root() const { return path(); }

    void makeFolder(const std::string& name) const;
    void makeFifo(const std::string& name) const;
    void makeLink(const std::string& name, const std::string& target) const;
    void remove(const std::string& name) const;

    /// Dates a file or folder into the future: a source that keeps what it read keeps nothing of
    /// it.
    void dateAhead(const std::string& name) const;

    /// A whole, healthy host: "Test Linux" 7.1, booted at 1700000000, 16 GiB of memory, 2 GiB of
    /// swap, processes 1, 20 and 300, two user sessions.
    void writeCompleteHost() const;
};

#endif
