// What a user action may change in memory, kept when the action starts so that an
// action that fails, or must start again, leaves nothing behind it: the session
// puts back every automaton's variables, record buffers, requests, screen state and
// own members, and the currency service, as they were.
//
// Each holder adds its places with keep(); restore() puts them back, last kept
// first. A kept place must outlive the snapshot or be gone from it: the session
// keeps only automata that exist for the whole action.
#pragma once

#include <functional>
#include <utility>
#include <vector>

namespace host {

class Snapshot {
 public:
  Snapshot() = default;
  Snapshot(const Snapshot&) = delete;
  Snapshot& operator=(const Snapshot&) = delete;
  Snapshot(Snapshot&&) = default;
  Snapshot& operator=(Snapshot&&) = default;

  // Keeps a copy of each place; restore() assigns them back.
  template <class... T>
  void keep(T&... places) {
    (restores_.emplace_back([&places, copy = places]() mutable { places = std::move(copy); }), ...);
  }
  // Runs `restore` when the snapshot is restored.
  void add(std::function<void()> restore) { restores_.push_back(std::move(restore)); }
  void restore() {
    for (auto it = restores_.rbegin(); it != restores_.rend(); ++it) (*it)();
    restores_.clear();
  }

 private:
  std::vector<std::function<void()>> restores_;
};

}  // namespace host
