// State that comes back on every road out of a scope.
#pragma once

#include <exception>
#include <utility>

namespace codeloom {

// Sets a field, and puts the old value back when the scope is left, by return or by exception.
template <class T>
class CRestoreOnExit {
  public:
    CRestoreOnExit(T& field, T value) : _fField(field), _fOld(std::exchange(field, std::move(value))) {}
    ~CRestoreOnExit() { _fField = std::move(_fOld); }
    CRestoreOnExit(const CRestoreOnExit&) = delete;
    CRestoreOnExit& operator=(const CRestoreOnExit&) = delete;

  private:
    T& _fField;
    T _fOld;
};

// Calls `action` when the scope is left.
template <class Action>
class CCallOnExit {
  public:
    explicit CCallOnExit(Action action) : _fAction(std::move(action)) {}
    ~CCallOnExit() { _fAction(); }
    CCallOnExit(const CCallOnExit&) = delete;
    CCallOnExit& operator=(const CCallOnExit&) = delete;

  private:
    Action _fAction;
};

// Calls `body` and then, whatever came of it, `last`, which may fail too: its failure is the one that counts.
template <class Body, class Last>
void TryFinally(Body body, Last last) {
    std::exception_ptr failure;
    try {
        body();
    } catch (...) {
        failure = std::current_exception();
    }
    last();
    if (failure) std::rethrow_exception(failure);
}

}  // namespace codeloom
