// The host's error type. Handlers catch it, stamp it with their event name and hand
// it to Automate::exception; the host reports it and undoes the user action.
#pragma once

#include <stdexcept>
#include <string>

namespace host {

class HostError : public std::runtime_error {
 public:
  explicit HostError(const std::string& message) : std::runtime_error(message) {}

  // Name of the event whose handler raised or caught the error ("" until stamped).
  const std::string& evenement() const { return event_; }
  void setEvenement(std::string event) { event_ = std::move(event); }

 private:
  std::string event_;
};

}  // namespace host
