#include "face/ordered_work.h"

#include <system_error>
#include <utility>

namespace codeloom {

void COrderedWork::Add(CWork work) {
    const std::lock_guard lock(_fMutex);
    _fTasks.push_back({std::move(work)});
    // The owner does a single task itself.
    if (_fTasks.size() > 1 && _fThreads.size() < _fThreadCount) _StartThread();
    _fAdded.notify_one();
}

void COrderedWork::FinishOldest() {
    std::unique_lock lock(_fMutex);
    while (!_fTasks.front().is_done) {
        if (_HasNext())
            _DoNext(lock);
        else
            _fDone.wait(lock);
    }
    _fTasks.pop_front();
    --_fBegunCount;
}

void COrderedWork::EndThreads() {
    std::vector<std::jthread> ended;  // without the lock, since they take it
    const std::lock_guard lock(_fMutex);
    _fThreadCount = 0;
    _fAdded.notify_all();
    ended.swap(_fThreads);
}

void COrderedWork::_DoNext(std::unique_lock<std::mutex>& lock) {
    CTask& task = _fTasks[_fBegunCount++];  // stays where it is: a deque only changes at its ends
    lock.unlock();
    task.work();
    lock.lock();
    task.is_done = true;
    _fDone.notify_one();
}

void COrderedWork::_Serve() {
    std::unique_lock lock(_fMutex);
    while (true) {
        _fAdded.wait(lock, [this] { return _HasNext() || _fThreadCount == 0; });
        if (_fThreadCount == 0) return;
        _DoNext(lock);
    }
}

void COrderedWork::_StartThread() {
    try {
        _fThreads.emplace_back([this] { _Serve(); });
    } catch (const std::system_error&) {  // the system has no more: those that there are do the work
        _fThreadCount = _fThreads.size();
    }
}

}  // namespace codeloom
