#include "ui/kit/ResourceBundle.h"

#include <filesystem>
#include <system_error>

namespace qel {
namespace {

class EmptyBundle final : public ResourceBundle {
 public:
  std::optional<std::string> pathForResource(std::string_view /*name*/,
                                             std::string_view /*type*/) const override {
    return std::nullopt;
  }
};

std::shared_ptr<const ResourceBundle>& mainBundle() {
  static std::shared_ptr<const ResourceBundle> bundle = std::make_shared<EmptyBundle>();
  return bundle;
}

}  // namespace

const ResourceBundle& ResourceBundle::main() { return *mainBundle(); }

void ResourceBundle::setMain(std::shared_ptr<const ResourceBundle> bundle) {
  mainBundle() = std::move(bundle);
}

std::optional<std::string> DirectoryBundle::pathForResource(std::string_view name,
                                                            std::string_view type) const {
  const auto path =
      std::filesystem::path(_directory) / (std::string(name) + "." + std::string(type));
  std::error_code error;
  if (!std::filesystem::is_regular_file(path, error)) return std::nullopt;
  return path.lexically_normal().string();
}

}  // namespace qel
