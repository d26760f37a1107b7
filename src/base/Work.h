// A piece of work, to be done once on another thread or later.
#pragma once

#include <concepts>
#include <memory>
#include <new>
#include <type_traits>
#include <utility>

#include "base/SmallBlocks.h"

namespace qel {

// Any callable without arguments, owned. It is held in a small block, so that work which is handed
// on with each event asks the heap for nothing.
class Work {
 public:
  Work() = default;
  template <class Function>
  requires(!std::same_as<std::remove_cvref_t<Function>, Work> &&
           std::invocable<std::decay_t<Function>&>) Work(Function&& function) {
    using Held = HolderOf<std::decay_t<Function>>;
    void* block = SmallBlocks::take(sizeof(Held));
    _held.reset(new (block) Held(std::forward<Function>(function)));
  }

  // There must be something to do.
  void operator()() { _held->run(); }
  explicit operator bool() const { return _held != nullptr; }

 private:
  struct Holder {
    virtual void run() = 0;
    virtual void end() noexcept = 0;

   protected:
    ~Holder() = default;
  };
  template <class Function>
  struct HolderOf final : Holder {
    explicit HolderOf(Function given) : function(std::move(given)) {}
    void run() override { function(); }
    void end() noexcept override {
      this->~HolderOf();
      SmallBlocks::give(this, sizeof(HolderOf));
    }
    Function function;
  };
  struct End {
    void operator()(Holder* held) const noexcept { held->end(); }
  };

  std::unique_ptr<Holder, End> _held;
};

}  // namespace qel
