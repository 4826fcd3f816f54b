// Start-up objects of the host services. Every source file that uses the services holds one of
// each (by including "Port/InitObjects.h"). The first holder constructed readies the service, so
// the service is set up before any static object of those files uses it and, being set up first,
// is torn down after them.
#pragma once

#include <atomic>

namespace Port {

// Counts its holders; the first construction readies the service.
class ServiceInit {
 public:
  ServiceInit(const ServiceInit&) = delete;
  ServiceInit& operator=(const ServiceInit&) = delete;

 protected:
  // `readyService` may be null for a service that readies itself on first use.
  ServiceInit(std::atomic<int>& holders, void (*readyService)());
  ~ServiceInit();

 private:
  std::atomic<int>& holders_;
};

class FileInit : private ServiceInit {
 public:
  FileInit();
  static int Holders();
};

class PathListInit : private ServiceInit {
 public:
  PathListInit();
  static int Holders();
};

}  // namespace Port

namespace RavA {

class InstanceTableInit : private Port::ServiceInit {
 public:
  InstanceTableInit();
  static int Holders();
};

class FactoryInit : private Port::ServiceInit {
 public:
  FactoryInit();
  static int Holders();
};

}  // namespace RavA

class Port_MsgManInit : private Port::ServiceInit {
 public:
  Port_MsgManInit();
  static int Holders();
};
