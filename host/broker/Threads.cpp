// CMPIBrokerExtFT: threads, locks and names of the platform, over pthreads. The calls of this table
// carry no broker: they count for the broker of the thread's request, if any.
#include "host/broker/SlotThunk.h"

#include <pthread.h>

#include <cerrno>
#include <cstring>
#include <ctime>

namespace cmpihost {

namespace {

// A pthread_t of Linux is an integer as wide as a pointer.
static_assert(sizeof(pthread_t) == sizeof(CMPI_THREAD_TYPE));
static_assert(std::is_same_v<pthread_once_t, int>);

/// Counts a call. True: it is to fail.
bool isFaulty(std::string_view slot) noexcept {
    const ObjectScope* const scope = ObjectScope::innermost();
    if (scope == nullptr) return false;
    try {
        // It throws when the call is to fail, which must not reach the provider's C code.
        scope->core().countCall({tableName<CMPIBrokerExtFT>, slot});
        return false;
    } catch (...) {
        return true;
    }
}

/// The table function of `Slot`: a call without a result is done even if it is to fail. Not
/// noexcept, because a thread may end or be cancelled in it.
template <auto Slot, auto Impl>
struct ThreadThunk;
template <class R, class... Args, R (*CMPIBrokerExtFT::*Slot)(Args...), auto Impl>
struct ThreadThunk<Slot, Impl> {
    static R call(Args... args) {
        const bool faulty = isFaulty(slotName<Slot>);
        if constexpr (std::is_same_v<R, int>) {
            if (faulty) return EAGAIN;
        } else if constexpr (!std::is_void_v<R>) {
            if (faulty) return nullptr;
        }
        return Impl(args...);
    }
};

template <auto Slot, auto Impl>
void bindThread(CMPIBrokerExtFT& table, std::string_view name) {
    slotName<Slot> = name;
    table.*Slot = &ThreadThunk<Slot, Impl>::call;
}

char* resolveFileName(const char* name) {
    if (name == nullptr) return nullptr;
    try {
        // The provider frees it by free().
        return ::strdup(("lib" + std::string(name) + ".so").c_str());
    } catch (...) {
        return nullptr;
    }
}

pthread_t threadOf(CMPI_THREAD_TYPE thread) noexcept {
    return reinterpret_cast<pthread_t>(thread);
}

CMPI_THREAD_TYPE newThread(CMPI_THREAD_RETURN (*start)(void*), void* parm, int detached) {
    if (start == nullptr) return nullptr;
    pthread_t thread{};
    if (pthread_create(&thread, nullptr, start, parm) != 0) return nullptr;
    if (detached != 0) pthread_detach(thread);
    return reinterpret_cast<CMPI_THREAD_TYPE>(thread);
}

int joinThread(CMPI_THREAD_TYPE thread, CMPI_THREAD_RETURN* result) {
    return pthread_join(threadOf(thread), result);
}

/// It cannot fail: its callers do not expect it to come back.
int exitThread(CMPI_THREAD_RETURN code) {
    isFaulty("exitThread");
    pthread_exit(code);
}

int cancelThread(CMPI_THREAD_TYPE thread) {
    return pthread_cancel(threadOf(thread));
}

int threadSleep(CMPIUint32 milliseconds) {
    timespec rest{};
    rest.tv_sec = static_cast<time_t>(milliseconds / 1000);
    rest.tv_nsec = static_cast<long>(milliseconds % 1000) * 1000000L;
    while (nanosleep(&rest, &rest) != 0) {
        if (errno != EINTR) return errno;
    }
    return 0;
}

int threadOnce(int* once, void (*init)()) {
    return pthread_once(once, init);
}

int createThreadKey(CMPI_THREAD_KEY_TYPE* key, void (*cleanup)(void*)) {
    if (key == nullptr) return EAGAIN;
    pthread_key_t made{};
    const int error = pthread_key_create(&made, cleanup);
    if (error == 0) *key = made;
    return error;
}

int destroyThreadKey(CMPI_THREAD_KEY_TYPE key) {
    return pthread_key_delete(static_cast<pthread_key_t>(key));
}

void* getThreadSpecific(CMPI_THREAD_KEY_TYPE key) {
    return pthread_getspecific(static_cast<pthread_key_t>(key));
}

int setThreadSpecific(CMPI_THREAD_KEY_TYPE key, void* data) {
    return pthread_setspecific(static_cast<pthread_key_t>(key), data);
}

pthread_mutex_t* mutexOf(CMPI_MUTEX_TYPE mutex) noexcept {
    return static_cast<pthread_mutex_t*>(mutex);
}
pthread_cond_t* conditionOf(CMPI_COND_TYPE condition) noexcept {
    return static_cast<pthread_cond_t*>(condition);
}

CMPI_MUTEX_TYPE newMutex(int) {
    auto* const mutex = new (std::nothrow) pthread_mutex_t;
    if (mutex != nullptr) pthread_mutex_init(mutex, nullptr);
    return mutex;
}

void destroyMutex(CMPI_MUTEX_TYPE mutex) {
    if (mutex == nullptr) return;
    const std::unique_ptr<pthread_mutex_t> owned(mutexOf(mutex));
    pthread_mutex_destroy(owned.get());
}

void lockMutex(CMPI_MUTEX_TYPE mutex) {
    pthread_mutex_lock(mutexOf(mutex));
}

void unlockMutex(CMPI_MUTEX_TYPE mutex) {
    pthread_mutex_unlock(mutexOf(mutex));
}

CMPI_COND_TYPE newCondition(int) {
    auto* const condition = new (std::nothrow) pthread_cond_t;
    if (condition != nullptr) pthread_cond_init(condition, nullptr);
    return condition;
}

void destroyCondition(CMPI_COND_TYPE condition) {
    if (condition == nullptr) return;
    const std::unique_ptr<pthread_cond_t> owned(conditionOf(condition));
    pthread_cond_destroy(owned.get());
}

int condWait(CMPI_COND_TYPE condition, CMPI_MUTEX_TYPE mutex) {
    return pthread_cond_wait(conditionOf(condition), mutexOf(mutex));
}

int timedCondWait(CMPI_COND_TYPE condition, CMPI_MUTEX_TYPE mutex, timespec* until) {
    return pthread_cond_timedwait(conditionOf(condition), mutexOf(mutex), until);
}

int signalCondition(CMPI_COND_TYPE condition) {
    return pthread_cond_signal(conditionOf(condition));
}

CMPIBrokerExtFT completeThreads() {
    using FT = CMPIBrokerExtFT;
    FT table{};
    table.ftVersion = CMPICurrentVersion;
    bindThread<&FT::resolveFileName, &resolveFileName>(table, "resolveFileName");
    bindThread<&FT::newThread, &newThread>(table, "newThread");
    bindThread<&FT::threadOnce, &threadOnce>(table, "threadOnce");
    bindThread<&FT::createThreadKey, &createThreadKey>(table, "createThreadKey");
    bindThread<&FT::destroyThreadKey, &destroyThreadKey>(table, "destroyThreadKey");
    bindThread<&FT::getThreadSpecific, &getThreadSpecific>(table, "getThreadSpecific");
    bindThread<&FT::setThreadSpecific, &setThreadSpecific>(table, "setThreadSpecific");
    bindThread<&FT::newMutex, &newMutex>(table, "newMutex");
    bindThread<&FT::destroyMutex, &destroyMutex>(table, "destroyMutex");
    bindThread<&FT::lockMutex, &lockMutex>(table, "lockMutex");
    bindThread<&FT::unlockMutex, &unlockMutex>(table, "unlockMutex");
    bindThread<&FT::newCondition, &newCondition>(table, "newCondition");
    bindThread<&FT::destroyCondition, &destroyCondition>(table, "destroyCondition");
    bindThread<&FT::condWait, &condWait>(table, "condWait");
    bindThread<&FT::timedCondWait, &timedCondWait>(table, "timedCondWait");
    bindThread<&FT::joinThread, &joinThread>(table, "joinThread");
    table.exitThread = &exitThread;
    bindThread<&FT::cancelThread, &cancelThread>(table, "cancelThread");
    bindThread<&FT::threadSleep, &threadSleep>(table, "threadSleep");
    bindThread<&FT::signalCondition, &signalCondition>(table, "signalCondition");
    return table;
}

}  // namespace

CMPIBrokerExtFT threadTable(bool sparse) {
    static const CMPIBrokerExtFT complete = completeThreads();
    CMPIBrokerExtFT table = complete;
    if (sparse) {
        table.joinThread = nullptr;
        table.exitThread = nullptr;
        table.cancelThread = nullptr;
        table.threadSleep = nullptr;
        table.signalCondition = nullptr;
    }
    return table;
}

}  // namespace cmpihost
