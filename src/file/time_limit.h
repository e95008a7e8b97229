// How long a pass over a text may take, in the time that its thread runs, so a busy machine changes
// nothing.
#pragma once

#include <ctime>

namespace codeloom {

class CTimeLimit {
  public:
    // Counts from now on.
    explicit CTimeLimit(double seconds) : _fEnd(_Now() + seconds) {}

    bool IsOver() const { return _Now() > _fEnd; }

  private:
    static double _Now() {
        timespec time = {};
        clock_gettime(CLOCK_THREAD_CPUTIME_ID, &time);
        return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_nsec) * 1e-9;
    }

    double _fEnd;
};

}  // namespace codeloom
