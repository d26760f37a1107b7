// A descriptor by which one thread wakes another from poll.
#pragma once

namespace qel {

class WakeUp {
 public:
  WakeUp();
  ~WakeUp();
  WakeUp(const WakeUp&) = delete;
  WakeUp& operator=(const WakeUp&) = delete;

  int descriptor() const { return _descriptor; }
  void signal() const;
  void clear() const;

 private:
  int _descriptor;
};

}  // namespace qel
