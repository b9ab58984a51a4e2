// CMPIBrokerExtFT: threads, locks and names of the platform, over pthreads.
#include "host/broker/BrokerTables.h"
#include "host/broker/Entry.h"

#include <pthread.h>

#include <cerrno>
#include <cstring>
#include <ctime>
#include <memory>

namespace cmpihost {

namespace {

/// The calls of this table carry no broker: they count for the broker of the thread's request, if
/// any. True: the call is to fail.
bool toFail(const char* slot) noexcept {
    const Scope* const scope = innermostScope();
    if (scope == nullptr) return false;
    try {
        scope->core->countCall({tableName<CMPIBrokerExtFT>, slot});
        return false;
    } catch (...) {
        return true;
    }
}

char* resolveFileName(const char* name) {
    if (toFail("resolveFileName") || name == nullptr) return nullptr;
    try {
        return ::strdup(("lib" + std::string(name) + ".so").c_str());
    } catch (...) {
        return nullptr;
    }
}

// A pthread_t of Linux is an integer as wide as a pointer.
static_assert(sizeof(pthread_t) == sizeof(CMPI_THREAD_TYPE));

pthread_t threadOf(CMPI_THREAD_TYPE thread) noexcept {
    return reinterpret_cast<pthread_t>(thread);
}

CMPI_THREAD_TYPE newThread(CMPI_THREAD_RETURN (*start)(void*), void* parm, int detached) {
    if (toFail("newThread") || start == nullptr) return nullptr;
    pthread_t thread{};
    if (pthread_create(&thread, nullptr, start, parm) != 0) return nullptr;
    if (detached != 0) pthread_detach(thread);
    return reinterpret_cast<CMPI_THREAD_TYPE>(thread);
}

int joinThread(CMPI_THREAD_TYPE thread, CMPI_THREAD_RETURN* result) {
    return toFail("joinThread") ? EAGAIN : pthread_join(threadOf(thread), result);
}

int exitThread(CMPI_THREAD_RETURN code) {
    toFail("exitThread");
    pthread_exit(code);
}

int cancelThread(CMPI_THREAD_TYPE thread) {
    return toFail("cancelThread") ? EAGAIN : pthread_cancel(threadOf(thread));
}

int threadSleep(CMPIUint32 milliseconds) {
    if (toFail("threadSleep")) return EAGAIN;
    timespec rest{};
    rest.tv_sec = static_cast<time_t>(milliseconds / 1000);
    rest.tv_nsec = static_cast<long>(milliseconds % 1000) * 1000000L;
    while (nanosleep(&rest, &rest) != 0) {
        if (errno != EINTR) return errno;
    }
    return 0;
}

int threadOnce(int* once, void (*init)()) {
    static_assert(std::is_same_v<pthread_once_t, int>);
    return toFail("threadOnce") ? EAGAIN : pthread_once(once, init);
}

int createThreadKey(CMPI_THREAD_KEY_TYPE* key, void (*cleanup)(void*)) {
    if (toFail("createThreadKey") || key == nullptr) return EAGAIN;
    pthread_key_t made{};
    const int error = pthread_key_create(&made, cleanup);
    if (error == 0) *key = made;
    return error;
}

int destroyThreadKey(CMPI_THREAD_KEY_TYPE key) {
    return toFail("destroyThreadKey") ? EAGAIN
                                      : pthread_key_delete(static_cast<pthread_key_t>(key));
}

void* getThreadSpecific(CMPI_THREAD_KEY_TYPE key) {
    return toFail("getThreadSpecific") ? nullptr
                                       : pthread_getspecific(static_cast<pthread_key_t>(key));
}

int setThreadSpecific(CMPI_THREAD_KEY_TYPE key, void* data) {
    return toFail("setThreadSpecific") ? EAGAIN
                                       : pthread_setspecific(static_cast<pthread_key_t>(key), data);
}

pthread_mutex_t* mutexOf(CMPI_MUTEX_TYPE mutex) noexcept {
    return static_cast<pthread_mutex_t*>(mutex);
}
pthread_cond_t* conditionOf(CMPI_COND_TYPE condition) noexcept {
    return static_cast<pthread_cond_t*>(condition);
}

CMPI_MUTEX_TYPE newMutex(int) {
    if (toFail("newMutex")) return nullptr;
    auto* const mutex = new (std::nothrow) pthread_mutex_t;
    if (mutex != nullptr) pthread_mutex_init(mutex, nullptr);
    return mutex;
}

void destroyMutex(CMPI_MUTEX_TYPE mutex) {
    toFail("destroyMutex");
    if (mutex == nullptr) return;
    const std::unique_ptr<pthread_mutex_t> owned(mutexOf(mutex));
    pthread_mutex_destroy(owned.get());
}

void lockMutex(CMPI_MUTEX_TYPE mutex) {
    toFail("lockMutex");
    pthread_mutex_lock(mutexOf(mutex));
}

void unlockMutex(CMPI_MUTEX_TYPE mutex) {
    toFail("unlockMutex");
    pthread_mutex_unlock(mutexOf(mutex));
}

CMPI_COND_TYPE newCondition(int) {
    if (toFail("newCondition")) return nullptr;
    auto* const condition = new (std::nothrow) pthread_cond_t;
    if (condition != nullptr) pthread_cond_init(condition, nullptr);
    return condition;
}

void destroyCondition(CMPI_COND_TYPE condition) {
    toFail("destroyCondition");
    if (condition == nullptr) return;
    const std::unique_ptr<pthread_cond_t> owned(conditionOf(condition));
    pthread_cond_destroy(owned.get());
}

int condWait(CMPI_COND_TYPE condition, CMPI_MUTEX_TYPE mutex) {
    return toFail("condWait") ? EAGAIN : pthread_cond_wait(conditionOf(condition), mutexOf(mutex));
}

int timedCondWait(CMPI_COND_TYPE condition, CMPI_MUTEX_TYPE mutex, timespec* until) {
    return toFail("timedCondWait")
               ? EAGAIN
               : pthread_cond_timedwait(conditionOf(condition), mutexOf(mutex), until);
}

int signalCondition(CMPI_COND_TYPE condition) {
    return toFail("signalCondition") ? EAGAIN : pthread_cond_signal(conditionOf(condition));
}

}  // namespace

CMPIBrokerExtFT threadTable() {
    CMPIBrokerExtFT table{};
    table.ftVersion = CMPICurrentVersion;
    table.resolveFileName = &resolveFileName;
    table.newThread = &newThread;
    table.joinThread = &joinThread;
    table.exitThread = &exitThread;
    table.cancelThread = &cancelThread;
    table.threadSleep = &threadSleep;
    table.threadOnce = &threadOnce;
    table.createThreadKey = &createThreadKey;
    table.destroyThreadKey = &destroyThreadKey;
    table.getThreadSpecific = &getThreadSpecific;
    table.setThreadSpecific = &setThreadSpecific;
    table.newMutex = &newMutex;
    table.destroyMutex = &destroyMutex;
    table.lockMutex = &lockMutex;
    table.unlockMutex = &unlockMutex;
    table.newCondition = &newCondition;
    table.destroyCondition = &destroyCondition;
    table.condWait = &condWait;
    table.timedCondWait = &timedCondWait;
    table.signalCondition = &signalCondition;
    return table;
}

}  // namespace cmpihost
