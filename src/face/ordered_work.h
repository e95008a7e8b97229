// Work that threads do ahead, and that its owner takes in its order.
#pragma once

#include <condition_variable>
#include <cstddef>
#include <deque>
#include <functional>
#include <mutex>
#include <thread>
#include <vector>

namespace codeloom {

// Its owner is one thread, and works too: instead of waiting it does work that hasn't begun. So without other
// threads the work is done when it is waited for.
class COrderedWork {
  public:
    using CWork = std::function<void()>;

    // With so many threads besides the owner; each is started when there is work for it.
    explicit COrderedWork(size_t thread_count) : _fThreadCount(thread_count) {}
    ~COrderedWork() { EndThreads(); }
    COrderedWork(const COrderedWork&) = delete;
    COrderedWork& operator=(const COrderedWork&) = delete;

    // Requires: `work` throws nothing.
    void Add(CWork work);
    // Returns when the oldest work is done. Requires: there is some.
    void FinishOldest();
    // Ends the threads when they have done what they have begun. What is left is done as it is waited for.
    void EndThreads();

  private:
    struct CTask {
        CWork work;
        bool is_done = false;
    };

    bool _HasNext() const { return _fBegunCount < _fTasks.size(); }
    void _DoNext(std::unique_lock<std::mutex>& lock);
    void _Serve();
    void _StartThread();

    std::mutex _fMutex;    // of all below
    size_t _fThreadCount;  // that there may be; none when they are to end
    std::condition_variable _fAdded;
    std::condition_variable _fDone;
    std::deque<CTask> _fTasks;  // by age; the first ones are begun
    size_t _fBegunCount = 0;
    std::vector<std::jthread> _fThreads;
};

}  // namespace codeloom
