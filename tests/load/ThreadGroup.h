#ifndef TESTS_LOAD_THREAD_GROUP_H
#define TESTS_LOAD_THREAD_GROUP_H

#include <cstddef>
#include <functional>
#include <string>
#include <vector>

namespace load {

/// What one thread of a group did.
struct Member {
    long thread;                     ///< its number in the records
    std::vector<std::size_t> order;  ///< the tasks in the order in which it did them
    std::vector<std::string> complaints;
};

/// Has `threads` threads do all of `tasks` tasks `rounds` times, each in an order of its own,
/// starting together. `task` gets the number of a task and returns a complaint, empty for none.
/// Until all are through, one more thread calls `meanwhile` again and again; what it complains
/// about is in the last member, whose order is as long as it called.
std::vector<Member> runThreadGroup(std::size_t threads, std::size_t rounds, std::size_t tasks,
                                   const std::function<std::string(std::size_t)>& task,
                                   const std::function<std::string()>& meanwhile);

}  // namespace load

#endif
