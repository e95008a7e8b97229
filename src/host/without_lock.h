// The interpreter's lock, given up for a while.
#pragma once

#include <nanobind/nanobind.h>

#include <unistd.h>

namespace codeloom {

// Others of the host's threads run as long as it lives.
class CWithoutLock {
  public:
    CWithoutLock() : _fState(PyEval_SaveThread()) {}
    ~CWithoutLock() {
        try {
            PyEval_RestoreThread(_fState);
        } catch (...) {
            // An interpreter that ends unwinds the threads that nobody waits for, which would end the process
            // in our midst. This one sleeps until the process has ended.
            while (true) pause();
        }
    }
    CWithoutLock(const CWithoutLock&) = delete;
    CWithoutLock& operator=(const CWithoutLock&) = delete;

  private:
    PyThreadState* _fState;
};

}  // namespace codeloom
