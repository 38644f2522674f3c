// The runtime's own fault (a database error, a broken invariant of the runtime), as opposed to a
// business refusal, which is an outcome. A handler's guard catches it, writes the handler's label
// into it and reports it through the automaton's `exception`; the automaton stays alive.
#pragma once

#include <stdexcept>
#include <string>

namespace quarvo::host {

class UException : public std::runtime_error {
 public:
  explicit UException(const std::string& what) : std::runtime_error(what) {}
  void setLabel(std::string label) { label_ = std::move(label); }
  const std::string& label() const { return label_; }

 private:
  std::string label_;
};

// A statement refused by the database because of the data (a duplicate key, a missing value).
class ConstraintError : public UException {
 public:
  using UException::UException;
};

// The database cannot be written at all: locked by another program past the wait, read-only,
// full, or failing. No handler can go on without it: the guard lets this fault through, every
// transaction open rolls back on the way out, and the command ends with this one line (exit 2).
class BaseIndisponible : public UException {
 public:
  using UException::UException;
};

}  // namespace quarvo::host
