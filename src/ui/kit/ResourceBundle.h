// Where the files live that the program is shipped with.
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace qel {

class ResourceBundle {
 public:
  virtual ~ResourceBundle() = default;

  // The bundle of the program: an empty one until it is set at start-up.
  static const ResourceBundle& main();
  static void setMain(std::shared_ptr<const ResourceBundle> bundle);

  // The path of the resource NAME.TYPE, or nothing when there is none.
  virtual std::optional<std::string> pathForResource(std::string_view name,
                                                     std::string_view type) const = 0;
};

// The files of one folder.
class DirectoryBundle final : public ResourceBundle {
 public:
  explicit DirectoryBundle(std::string directory) : _directory(std::move(directory)) {}
  std::optional<std::string> pathForResource(std::string_view name,
                                             std::string_view type) const override;

 private:
  std::string _directory;
};

}  // namespace qel
