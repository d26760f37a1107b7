// A ModemManager of the tests' own: what it says is what a test has told it to.
#pragma once

#include <sdbus-c++/sdbus-c++.h>

#include <atomic>
#include <deque>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <thread>
#include <utility>
#include <vector>

#include "base/WakeUp.h"

namespace qel::testing {

using FakeDictionary = std::map<std::string, sdbus::Variant>;

// A property of any type.
struct FakeProperty {
  template <class Type>
  FakeProperty(Type value)  // NOLINT: written as the value alone
      : signature(sdbus::signature_of<Type>::str()),
        write([value](sdbus::PropertyGetReply& reply) { reply << value; }) {}

  std::string signature;
  std::function<void(sdbus::PropertyGetReply&)> write;
};

using FakeInterfaces = std::map<std::string, std::map<std::string, FakeProperty>>;

// How a method answers.
struct FakeAnswer {
  enum class Kind { normal, error, never, nonsense };
  Kind kind = Kind::normal;
  std::string error;  // its name
};

// Has a thread and a bus connection of its own. Any thread.
class FakeModemManager {
 public:
  explicit FakeModemManager(const std::string& busAddress);
  ~FakeModemManager();

  // An object under the manager is listed by it; others have to be asked for.
  void add(const std::string& path, FakeInterfaces interfaces);
  // Tells of its interfaces one after the other.
  void addInPieces(const std::string& path, FakeInterfaces interfaces);
  void remove(const std::string& path);
  // The property exists and keeps its type.
  void set(const std::string& path, const std::string& interface, const std::string& name,
           FakeProperty value);
  // The same, but says only that the property has changed.
  void setQuietly(const std::string& path, const std::string& interface, const std::string& name,
                  FakeProperty value);

  // What GetCellInfo and GetLocation of every modem answer.
  void setCells(std::vector<FakeDictionary> cells);
  void setPlace(std::string place);
  // By the method's name: GetCellInfo, GetLocation, Setup and SetupThresholds (of Signal) or
  // Location.Setup.
  void answer(const std::string& method, FakeAnswer how);
  int calls(const std::string& method);
  std::vector<std::uint32_t> ratesAskedFor();
  std::vector<std::uint32_t> thresholdsAskedFor();
  std::vector<std::pair<std::uint32_t, bool>> placesAskedFor();

 private:
  struct Object;
  void perform(const std::function<void()>& task);
  void live();
  Object& make(const std::string& path, FakeInterfaces interfaces);
  void addMethods(sdbus::IObject& object, const std::string& path);
  // Known as `name`; on the bus it is what stands behind the last dot.
  void method(sdbus::IObject& object, const std::string& interface, const std::string& name,
              const std::string& in, const std::string& out,
              std::function<void(sdbus::MethodCall&, sdbus::MethodReply&)> write);

  std::unique_ptr<sdbus::IConnection> _connection;
  std::unique_ptr<sdbus::IObject> _root;
  // The thread only, from here on.
  std::map<std::string, std::unique_ptr<Object>> _objects;
  std::vector<FakeDictionary> _cells;
  std::string _place;
  std::map<std::string, FakeAnswer> _answers;
  std::map<std::string, int> _calls;
  std::vector<std::uint32_t> _rates;
  std::vector<std::uint32_t> _thresholds;
  std::vector<std::pair<std::uint32_t, bool>> _places;
  std::vector<sdbus::MethodCall> _unanswered;

  const WakeUp _wakeUp;
  std::mutex _mutex;  // guards the tasks
  std::deque<std::function<void()>> _tasks;
  std::atomic<bool> _stopping = false;
  std::thread _thread;
};

}  // namespace qel::testing
