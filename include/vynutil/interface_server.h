#pragma once
// The SDK's extension-interface pattern. An object that can be asked for optional capabilities
// derives from InterfaceServer and answers GetInterface(id) with a BaseInterface, or null.
// BaseInterfaceServer keeps a list of interface objects and answers by their identifiers;
// BaseInterfaceServer13 adds registration at run time. Servers hold pointers to interfaces and
// own none of them. Nothing here is synchronised.

#include "vynutil/export.h"
#include "vynutil/heap.h"
#include "vynutil/tab.h"
#include "vynutil/wintypes.h"

// An interface identifier: two 32-bit parts, equal when both parts are.
class Interface_ID {
 public:
  constexpr Interface_ID() = default;
  constexpr Interface_ID(ULONG partA, ULONG partB) : a(partA), b(partB) {}
  constexpr ULONG PartA() const { return a; }
  constexpr ULONG PartB() const { return b; }
  constexpr void SetPartA(ULONG value) { a = value; }
  constexpr void SetPartB(ULONG value) { b = value; }
  friend constexpr bool operator==(Interface_ID x, Interface_ID y) { return x.a == y.a && x.b == y.b; }
  friend constexpr bool operator!=(Interface_ID x, Interface_ID y) { return !(x == y); }

 private:
  ULONG a = 0;
  ULONG b = 0;
};

// The identifier of BaseInterface itself.
inline constexpr Interface_ID BASEINTERFACE_ID(0, 1);

class BaseInterface;

// An object that may offer extension interfaces.
class VYN_API InterfaceServer : public VynHeapOperators {
 public:
  virtual ~InterfaceServer();
  // The interface with identifier id, or null; this base offers none.
  virtual BaseInterface* GetInterface(Interface_ID id);
};

// The base of every extension interface. Only Acquire and Dispose are used by the servers here;
// the other operations are for the host's interfaces to give meaning to.
class VYN_API BaseInterface : public InterfaceServer {
 public:
  ~BaseInterface() override;
  // This object for BASEINTERFACE_ID, else null.
  BaseInterface* GetInterface(Interface_ID id) override;
  // The interface's identifier: BASEINTERFACE_ID unless overridden.
  virtual Interface_ID GetID();
  // The object that owns this interface; null by default.
  virtual BaseInterface* GetOwner();
  // Asks to be told about the interface's changes through callback; false: not supported.
  virtual bool RegisterNotifyCallback(void* callback);
  // Withdraws a callback given to RegisterNotifyCallback; nothing by default.
  virtual void UnRegisterNotifyCallback(void* callback);
  // What a server hands out for this interface (a server's GetInterface returns this result);
  // this object by default.
  virtual BaseInterface* Acquire();
  // Gives back what Acquire handed out; nothing by default.
  virtual void Release();
  // Called by a server being destroyed on every interface it still lists; nothing by default.
  virtual void Dispose();
  // A copy of the interface for a copy of its owner; null by default (not copied).
  virtual BaseInterface* CloneInterface(void* remapDir = nullptr);
};

// A server answering from a list of interfaces.
class VYN_API BaseInterfaceServer : public InterfaceServer {
 public:
  // Calls Dispose on every listed interface, in list order, then frees the list.
  ~BaseInterfaceServer() override;
  // The Acquire() result of the first listed interface whose GetID() equals id, else null.
  BaseInterface* GetInterface(Interface_ID id) override;
  // The number of listed interfaces.
  virtual int NumInterfaces() const;
  // Listed interface i; throws VynSDK::Util::TabOutOfRangeException outside [0, NumInterfaces()).
  virtual BaseInterface* GetInterfaceAt(int i) const;

 protected:
  Tab<BaseInterface*> interfaces;
};

// A server whose list may change at run time.
class VYN_API BaseInterfaceServer13 : public BaseInterfaceServer {
 public:
  ~BaseInterfaceServer13() override;
  // Appends bi (duplicates allowed); false for null.
  virtual bool RegisterInterface(BaseInterface* bi);
  // Removes the first entry equal to bi; false when there is none. Nothing is called on bi.
  virtual bool UnregisterInterface(BaseInterface* bi);
};
