#ifndef TESTS_SUPPORT_FIXTURE_TREE_H
#define TESTS_SUPPORT_FIXTURE_TREE_H

#include <string>

/// A temporary folder to be the root of a host; removed, with all in it, when the object dies.
/// Paths are relative to it; missing parent folders are made.
class FixtureTree {
  public:
    FixtureTree();
    ~FixtureTree();
    FixtureTree(const FixtureTree&) = delete;
    FixtureTree& operator=(const FixtureTree&) = delete;

    const std::string& root() const { return root_; }
    std::string path(const std::string& name) const { return root_ + '/' + name; }

    void write(const std::string& name, const std::string& content) const;
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

  private:
    std::string root_;
};

#endif
