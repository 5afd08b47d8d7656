// The interface-server classes' member functions and virtual tables.

#include "vynutil/interface_server.h"

InterfaceServer::~InterfaceServer() = default;

BaseInterface* InterfaceServer::GetInterface(Interface_ID) { return nullptr; }

BaseInterface::~BaseInterface() = default;

BaseInterface* BaseInterface::GetInterface(Interface_ID id) {
  return id == BASEINTERFACE_ID ? this : nullptr;
}

Interface_ID BaseInterface::GetID() { return BASEINTERFACE_ID; }

BaseInterface* BaseInterface::GetOwner() { return nullptr; }

bool BaseInterface::RegisterNotifyCallback(void*) { return false; }

void BaseInterface::UnRegisterNotifyCallback(void*) {}

BaseInterface* BaseInterface::Acquire() { return this; }

void BaseInterface::Release() {}

void BaseInterface::Dispose() {}

BaseInterface* BaseInterface::CloneInterface(void*) { return nullptr; }

BaseInterfaceServer::~BaseInterfaceServer() {
  // The count is read anew at every step: a Dispose may change the list.
  for (int i = 0; i < interfaces.Count(); ++i) {
    if (BaseInterface* bi = interfaces[i]) bi->Dispose();
  }
}

BaseInterface* BaseInterfaceServer::GetInterface(Interface_ID id) {
  for (BaseInterface* bi : interfaces) {
    if (bi && bi->GetID() == id) return bi->Acquire();
  }
  return nullptr;
}

int BaseInterfaceServer::NumInterfaces() const { return interfaces.Count(); }

BaseInterface* BaseInterfaceServer::GetInterfaceAt(int i) const { return interfaces[i]; }

BaseInterfaceServer13::~BaseInterfaceServer13() = default;

bool BaseInterfaceServer13::RegisterInterface(BaseInterface* bi) {
  if (!bi) return false;
  interfaces.Append(1, &bi, 0);
  return true;
}

bool BaseInterfaceServer13::UnregisterInterface(BaseInterface* bi) {
  for (int i = 0; i < interfaces.Count(); ++i) {
    if (interfaces[i] == bi) {
      interfaces.Delete(i, 1);
      return true;
    }
  }
  return false;
}
