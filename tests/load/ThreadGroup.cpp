// Threads that start together and each work in an order of their own, so that any two requests
// meet.
#include "load/ThreadGroup.h"

#include <sys/syscall.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <numeric>
#include <random>
#include <thread>

namespace load {
namespace {

std::vector<std::size_t> shuffledOrder(std::size_t rounds, std::size_t tasks, unsigned int seed) {
    std::mt19937 random(seed);
    std::vector<std::size_t> round(tasks);
    std::iota(round.begin(), round.end(), std::size_t{0});
    std::vector<std::size_t> result;
    for (std::size_t number = 0; number < rounds; ++number) {
        std::shuffle(round.begin(), round.end(), random);
        result.insert(result.end(), round.begin(), round.end());
    }
    return result;
}

void note(Member& member, const std::string& complaint) {
    if (!complaint.empty()) member.complaints.push_back(complaint);
}

}  // namespace

std::vector<Member> runThreadGroup(std::size_t threads, std::size_t rounds, std::size_t tasks,
                                   const std::function<std::string(std::size_t)>& task,
                                   const std::function<std::string()>& meanwhile) {
    std::vector<Member> members(threads + 1);
    std::atomic<std::size_t> waiting{threads};
    std::atomic<std::size_t> running{threads};
    std::vector<std::thread> workers;
    for (std::size_t number = 0; number < threads; ++number) {
        Member& member = members[number];
        member.order = shuffledOrder(rounds, tasks, static_cast<unsigned int>(number));
        workers.emplace_back([&] {
            member.thread = ::syscall(SYS_gettid);
            --waiting;
            while (waiting > 0) std::this_thread::yield();
            for (const std::size_t each : member.order) note(member, task(each));
            --running;
        });
    }
    Member& other = members.back();
    workers.emplace_back([&] {
        other.thread = ::syscall(SYS_gettid);
        while (running > 0) {
            other.order.push_back(other.order.size());
            note(other, meanwhile());
            std::this_thread::yield();
        }
    });
    for (std::thread& worker : workers) worker.join();
    return members;
}

}  // namespace load
