#include "sources/RunThreads.h"

#include <utility>

namespace qel::sources {

RunThreads::~RunThreads() {
  for (Worker& worker : _workers) {
    if (worker.thread.get_id() == std::this_thread::get_id()) {
      worker.thread.detach();
    } else {
      worker.thread.join();
    }
  }
}

void RunThreads::start(std::function<void()> work) {
  std::erase_if(_workers, [](Worker& worker) {
    if (!*worker.finished) return false;
    worker.thread.join();
    return true;
  });
  auto finished = std::make_shared<std::atomic<bool>>(false);
  _workers.push_back({finished, std::thread([finished, work = std::move(work)] {
                        work();
                        *finished = true;
                      })});
}

}  // namespace qel::sources
