#pragma once
// The contract of an in-process server: a shared library that exports four entry points
// with C linkage, found by the host with dlsym and called as COM calls them.
//
//   DllRegisterServer     writes the server's classes and type library into the class
//                         registry, with the server's own absolute path
//   DllUnregisterServer   removes them
//   DllGetClassObject     the class factory of one CLSID
//   DllCanUnloadNow       S_OK when no object of the server is alive, else S_FALSE
//
// No exception crosses them: failures come back as HRESULTs, with a description left
// through SetErrorInfo. A server defines them in one file, usually as one-liners over
// the helpers below:
//
//   static const automation::ServerModule& Module();  // its classes and type library
//   HRESULT DllRegisterServer() noexcept { return automation::RegisterServer(Module(), &anchor); }

#include <atomic>
#include <memory>
#include <new>
#include <string>
#include <vector>

#include "platform/automation/ClassRegistry.h"
#include "platform/automation/HResult.h"
#include "platform/vb/Object.h"

// Entry points stay visible even when a server hides everything else.
#define DV_SERVER_EXPORT __attribute__((visibility("default")))

namespace automation {

// Makes instances of one class, as IClassFactory::CreateInstance does.
class IClassFactory {
 public:
  virtual ~IClassFactory() = default;
  virtual HRESULT CreateInstance(vb::ObjectPtr* object) noexcept = 0;
};

// The factory of a class that is default-constructible.
template <class T>
class ClassFactory final : public IClassFactory {
 public:
  HRESULT CreateInstance(vb::ObjectPtr* object) noexcept override {
    if (object == nullptr) return E_POINTER;
    try {
      *object = std::make_shared<T>();
      return S_OK;
    } catch (const std::bad_alloc&) {
      return E_OUTOFMEMORY;
    } catch (const std::exception& e) {
      SetErrorInfo(e.what());
      return E_FAIL;
    } catch (...) {
      return E_FAIL;
    }
  }
};

// What a server serves: its classes, their factories and its type library.
struct CoClass {
  ClassEntry entry;
  IClassFactory* factory;
};

struct ServerModule {
  TypeLibrary typeLibrary;
  std::vector<CoClass> classes;
};

// Counts the live objects of a server, for DllCanUnloadNow. A class holds one
// ObjectLock for its lifetime.
class ObjectCounter {
 public:
  class ObjectLock {
   public:
    explicit ObjectLock(ObjectCounter& counter) : counter_(counter) { ++counter_.count_; }
    ObjectLock(const ObjectLock& other) : counter_(other.counter_) { ++counter_.count_; }
    ObjectLock& operator=(const ObjectLock&) = delete;
    ~ObjectLock() { --counter_.count_; }

   private:
    ObjectCounter& counter_;
  };

  long Count() const { return count_.load(); }
  HRESULT CanUnloadNow() const noexcept { return count_.load() == 0 ? S_OK : S_FALSE; }

 private:
  std::atomic<long> count_{0};
};

// The absolute path of the shared library holding the given address: how a server
// learns where it was loaded from. Use the address of something with internal linkage
// so that no other library's symbol of the same name can stand in for it.
std::string ModulePathOf(const void* address);

// The work behind the entry points. On failure they leave a description with
// SetErrorInfo; a registration that fails half-way is undone.
HRESULT RegisterServer(const ServerModule& module, const void* anchor) noexcept;
HRESULT UnregisterServer(const ServerModule& module) noexcept;
HRESULT GetClassObject(const ServerModule& module, const char* clsid,
                       IClassFactory** factory) noexcept;

}  // namespace automation

extern "C" {
DV_SERVER_EXPORT automation::HRESULT DllRegisterServer(void) noexcept;
DV_SERVER_EXPORT automation::HRESULT DllUnregisterServer(void) noexcept;
DV_SERVER_EXPORT automation::HRESULT DllGetClassObject(const char* clsid,
                                                       automation::IClassFactory** factory) noexcept;
DV_SERVER_EXPORT automation::HRESULT DllCanUnloadNow(void) noexcept;
}

// Defines the four entry points of an in-process server, so each server states only
// what is its own: the function giving its ServerModule, an object whose address lies
// in its library (for DllRegisterServer to find the library's path), and the counter of
// its live objects.
#define DV_INPROC_SERVER_ENTRY_POINTS(moduleFn, anchor, liveObjects)                      \
  extern "C" automation::HRESULT DllRegisterServer(void) noexcept {                     \
    return automation::RegisterServer(moduleFn(), &(anchor));                           \
  }                                                                                     \
  extern "C" automation::HRESULT DllUnregisterServer(void) noexcept {                   \
    return automation::UnregisterServer(moduleFn());                                    \
  }                                                                                     \
  extern "C" automation::HRESULT DllGetClassObject(                                     \
      const char* clsid, automation::IClassFactory** factory) noexcept {                \
    return automation::GetClassObject(moduleFn(), clsid, factory);                      \
  }                                                                                     \
  extern "C" automation::HRESULT DllCanUnloadNow(void) noexcept {                       \
    return (liveObjects).CanUnloadNow();                                                \
  }

namespace automation {

// The entry points as the host finds them with dlsym.
using DllRegisterServerFn = HRESULT (*)() noexcept;
using DllUnregisterServerFn = HRESULT (*)() noexcept;
using DllGetClassObjectFn = HRESULT (*)(const char*, IClassFactory**) noexcept;
using DllCanUnloadNowFn = HRESULT (*)() noexcept;

}  // namespace automation
