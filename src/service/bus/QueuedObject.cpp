#include "service/bus/QueuedObject.h"

#include <utility>

namespace qel::service {

QueuedObject::QueuedObject(std::unique_ptr<sdbus::IObject> object, Arrived arrived)
    : _object(std::move(object)), _arrived(std::move(arrived)) {}

sdbus::method_callback QueuedObject::queued(std::string method,
                                            sdbus::method_callback answer) const {
  return [this, method = std::move(method), answer = std::move(answer)](sdbus::MethodCall call) {
    _arrived(method, std::move(call), answer);
  };
}

void QueuedObject::registerMethod(const std::string& interfaceName, std::string methodName,
                                  std::string inputSignature, std::string outputSignature,
                                  sdbus::method_callback methodCallback, sdbus::Flags flags) {
  auto callback = queued(methodName, std::move(methodCallback));
  _object->registerMethod(interfaceName, std::move(methodName), std::move(inputSignature),
                          std::move(outputSignature), std::move(callback), flags);
}

void QueuedObject::registerMethod(const std::string& interfaceName, std::string methodName,
                                  std::string inputSignature,
                                  const std::vector<std::string>& inputNames,
                                  std::string outputSignature,
                                  const std::vector<std::string>& outputNames,
                                  sdbus::method_callback methodCallback, sdbus::Flags flags) {
  auto callback = queued(methodName, std::move(methodCallback));
  _object->registerMethod(interfaceName, std::move(methodName), std::move(inputSignature),
                          inputNames, std::move(outputSignature), outputNames, std::move(callback),
                          flags);
}

void QueuedObject::registerSignal(const std::string& interfaceName, std::string signalName,
                                  std::string signature, sdbus::Flags flags) {
  _object->registerSignal(interfaceName, std::move(signalName), std::move(signature), flags);
}

void QueuedObject::registerSignal(const std::string& interfaceName, std::string signalName,
                                  std::string signature, const std::vector<std::string>& paramNames,
                                  sdbus::Flags flags) {
  _object->registerSignal(interfaceName, std::move(signalName), std::move(signature), paramNames,
                          flags);
}

void QueuedObject::registerProperty(const std::string& interfaceName, std::string propertyName,
                                    std::string signature, sdbus::property_get_callback getCallback,
                                    sdbus::Flags flags) {
  _object->registerProperty(interfaceName, std::move(propertyName), std::move(signature),
                            std::move(getCallback), flags);
}

void QueuedObject::registerProperty(const std::string& interfaceName, std::string propertyName,
                                    std::string signature, sdbus::property_get_callback getCallback,
                                    sdbus::property_set_callback setCallback, sdbus::Flags flags) {
  _object->registerProperty(interfaceName, std::move(propertyName), std::move(signature),
                            std::move(getCallback), std::move(setCallback), flags);
}

void QueuedObject::setInterfaceFlags(const std::string& interfaceName, sdbus::Flags flags) {
  _object->setInterfaceFlags(interfaceName, flags);
}

sdbus::Signal QueuedObject::createSignal(const std::string& interfaceName,
                                         const std::string& signalName) {
  return _object->createSignal(interfaceName, signalName);
}

void QueuedObject::emitPropertiesChangedSignal(const std::string& interfaceName,
                                               const std::vector<std::string>& names) {
  _object->emitPropertiesChangedSignal(interfaceName, names);
}

void QueuedObject::emitPropertiesChangedSignal(const std::string& interfaceName) {
  _object->emitPropertiesChangedSignal(interfaceName);
}

void QueuedObject::emitInterfacesAddedSignal(const std::vector<std::string>& interfaces) {
  _object->emitInterfacesAddedSignal(interfaces);
}

void QueuedObject::emitInterfacesRemovedSignal(const std::vector<std::string>& interfaces) {
  _object->emitInterfacesRemovedSignal(interfaces);
}

}  // namespace qel::service
