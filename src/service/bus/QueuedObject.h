// An object on the bus whose method calls somebody else decides when to answer.
#pragma once

#include <sdbus-c++/IObject.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace qel::service {

// Passes everything on to the bus library's object. Only a method that is registered through it is
// not called back when its call arrives: `arrived` gets the call, the method's name and what
// answers it, and runs that at once, later or never.
class QueuedObject final : public sdbus::IObject {
 public:
  using Arrived = std::function<void(const std::string& method, sdbus::MethodCall call,
                                     const sdbus::method_callback& answer)>;

  QueuedObject(std::unique_ptr<sdbus::IObject> object, Arrived arrived);

  void registerMethod(const std::string& interfaceName, std::string methodName,
                      std::string inputSignature, std::string outputSignature,
                      sdbus::method_callback methodCallback, sdbus::Flags flags) override;
  void registerMethod(const std::string& interfaceName, std::string methodName,
                      std::string inputSignature, const std::vector<std::string>& inputNames,
                      std::string outputSignature, const std::vector<std::string>& outputNames,
                      sdbus::method_callback methodCallback, sdbus::Flags flags) override;
  void registerSignal(const std::string& interfaceName, std::string signalName,
                      std::string signature, sdbus::Flags flags) override;
  void registerSignal(const std::string& interfaceName, std::string signalName,
                      std::string signature, const std::vector<std::string>& paramNames,
                      sdbus::Flags flags) override;
  void registerProperty(const std::string& interfaceName, std::string propertyName,
                        std::string signature, sdbus::property_get_callback getCallback,
                        sdbus::Flags flags) override;
  void registerProperty(const std::string& interfaceName, std::string propertyName,
                        std::string signature, sdbus::property_get_callback getCallback,
                        sdbus::property_set_callback setCallback, sdbus::Flags flags) override;
  void setInterfaceFlags(const std::string& interfaceName, sdbus::Flags flags) override;
  void finishRegistration() override { _object->finishRegistration(); }
  void unregister() override { _object->unregister(); }
  sdbus::Signal createSignal(const std::string& interfaceName,
                             const std::string& signalName) override;
  void emitSignal(const sdbus::Signal& message) override { _object->emitSignal(message); }
  void emitPropertiesChangedSignal(const std::string& interfaceName,
                                   const std::vector<std::string>& names) override;
  void emitPropertiesChangedSignal(const std::string& interfaceName) override;
  void emitInterfacesAddedSignal() override { _object->emitInterfacesAddedSignal(); }
  void emitInterfacesAddedSignal(const std::vector<std::string>& interfaces) override;
  void emitInterfacesRemovedSignal() override { _object->emitInterfacesRemovedSignal(); }
  void emitInterfacesRemovedSignal(const std::vector<std::string>& interfaces) override;
  void addObjectManager() override { _object->addObjectManager(); }
  void removeObjectManager() override { _object->removeObjectManager(); }
  bool hasObjectManager() const override { return _object->hasObjectManager(); }
  sdbus::IConnection& getConnection() const override { return _object->getConnection(); }
  const std::string& getObjectPath() const override { return _object->getObjectPath(); }
  const sdbus::Message* getCurrentlyProcessedMessage() const override {
    return _object->getCurrentlyProcessedMessage();
  }

 private:
  sdbus::method_callback queued(std::string method, sdbus::method_callback answer) const;

  const std::unique_ptr<sdbus::IObject> _object;
  const Arrived _arrived;
};

}  // namespace qel::service
