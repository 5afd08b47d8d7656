#include <gtest/gtest.h>

#include <vector>

#include "vynutil/interface_server.h"

using VynSDK::Util::TabOutOfRangeException;

namespace {

// An interface that reports a chosen identifier and records what the server calls on it.
class Recorder : public BaseInterface {
 public:
  Recorder(Interface_ID id, std::vector<const Recorder*>* disposed, BaseInterface* acquired = nullptr)
      : id_(id), disposed_(disposed), acquired_(acquired) {}
  Interface_ID GetID() override { return id_; }
  BaseInterface* Acquire() override { return acquired_ ? acquired_ : this; }
  void Dispose() override { disposed_->push_back(this); }

 private:
  Interface_ID id_;
  std::vector<const Recorder*>* disposed_;
  BaseInterface* acquired_;
};

}  // namespace

TEST(InterfaceServer, BaseInterfaceDefaults) {
  BaseInterface bi;
  EXPECT_EQ(bi.GetInterface(Interface_ID(0, 1)), &bi);
  EXPECT_EQ(bi.GetInterface(Interface_ID(0, 2)), nullptr);
  EXPECT_EQ(bi.GetInterface(Interface_ID(1, 1)), nullptr);
  EXPECT_EQ(bi.GetID(), BASEINTERFACE_ID);
  EXPECT_EQ(bi.Acquire(), &bi);
  EXPECT_EQ(bi.GetOwner(), nullptr);
  EXPECT_FALSE(bi.RegisterNotifyCallback(&bi));
  EXPECT_EQ(bi.CloneInterface(), nullptr);
  InterfaceServer plain;
  EXPECT_EQ(plain.GetInterface(BASEINTERFACE_ID), nullptr);
}

TEST(InterfaceServer, RegistrationLookupAndDisposal) {
  std::vector<const Recorder*> disposed;
  BaseInterface handedOut;
  Recorder a(Interface_ID(7, 1), &disposed, &handedOut);
  Recorder b(Interface_ID(7, 1), &disposed);
  Recorder c(Interface_ID(7, 2), &disposed);
  {
    BaseInterfaceServer13 server;
    EXPECT_EQ(server.GetInterface(Interface_ID(7, 1)), nullptr);  // empty list
    EXPECT_FALSE(server.RegisterInterface(nullptr));
    EXPECT_TRUE(server.RegisterInterface(&a));
    EXPECT_TRUE(server.RegisterInterface(&b));
    EXPECT_TRUE(server.RegisterInterface(&c));
    EXPECT_TRUE(server.RegisterInterface(&a));  // duplicates are kept
    EXPECT_EQ(server.NumInterfaces(), 4);
    // The first match answers, with what its Acquire hands out; no match in either part: null.
    EXPECT_EQ(server.GetInterface(Interface_ID(7, 1)), &handedOut);
    EXPECT_EQ(server.GetInterface(Interface_ID(7, 2)), &c);
    EXPECT_EQ(server.GetInterface(Interface_ID(2, 7)), nullptr);
    EXPECT_EQ(server.GetInterface(BASEINTERFACE_ID), nullptr);  // not the server's own
    // Unregistering removes the first entry only; later entries move up.
    EXPECT_TRUE(server.UnregisterInterface(&a));
    EXPECT_EQ(server.NumInterfaces(), 3);
    EXPECT_EQ(server.GetInterfaceAt(0), &b);
    EXPECT_EQ(server.GetInterfaceAt(2), &a);
    EXPECT_EQ(server.GetInterface(Interface_ID(7, 1)), &b);
    EXPECT_FALSE(server.UnregisterInterface(&handedOut));
    EXPECT_THROW(server.GetInterfaceAt(server.NumInterfaces()), TabOutOfRangeException);
    EXPECT_THROW(server.GetInterfaceAt(-1), TabOutOfRangeException);
    EXPECT_TRUE(disposed.empty());
  }
  // Destruction disposes every listed interface, once each, in list order.
  EXPECT_EQ(disposed, (std::vector<const Recorder*>{&b, &c, &a}));
}
