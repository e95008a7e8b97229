// State that comes back on every road out of a scope.
#pragma once

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

}  // namespace codeloom
