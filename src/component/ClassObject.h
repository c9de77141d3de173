#pragma once
// What the two public classes share: the members a host reaches by name, Login and
// NovoRegisto. They differ only in how Registo finds the entry to open.
//
// Members, in the order of the class's interface:
//   Login([ByRef User As String], [ByRef Password As String]) As Boolean
//   NovoRegisto(ByRef Table As String, [Pkey], [Contacto_ID As Long], [Caller As Object])
//   Registo(ByRef tRs As Recordset, [Pkey], [Tabela As String], [StrWhere As String],
//           [Caller As Object])

#include <cstdint>
#include <memory>
#include <string>

#include "component/ConnectionSettings.h"
#include "platform/automation/Dispatch.h"
#include "platform/automation/InprocServer.h"
#include "platform/vb/Variant.h"

namespace component {

class DataEnvironment;

// The live class objects of the component, which DllCanUnloadNow answers from.
automation::ObjectCounter& LiveObjects();

class ClassObject : public automation::Dispatch<ClassObject> {
 public:
  static const automation::MemberTable<ClassObject>& Members();

  // Puts the host's user's login in place; true when it is.
  bool Login(std::string& User, std::string& Password);
  // Starts a new entry in the header editor.
  void NovoRegisto(std::string& Table, const vb::Variant& Pkey, int32_t Contacto_ID,
                   const vb::ObjectPtr& Caller);
  // Opens an existing entry in the header editor, found through the host's recordset.
  virtual void Registo(vb::Variant& tRs, const vb::Variant& Pkey, const std::string& Tabela,
                       const std::string& StrWhere, const vb::ObjectPtr& Caller) = 0;

 protected:
  // The object's one header editor, created on first use and reused by every later
  // NovoRegisto or Registo, with MainClass and CallBackClass set for this call.
  vb::Object& HeaderEditorFor(const vb::ObjectPtr& Caller);
  // Opens the entry (and selects the line) in the header editor.
  void OpenInHeaderEditor(const vb::ObjectPtr& Caller, int32_t dorvantoId, int32_t diarioId);

 private:
  // Login's steps once the settings are read and both passwords decoded.
  bool LoginWith(DataEnvironment& data, const std::string& user,
                 const std::string& encodedPassword, const std::string& userPassword,
                 const std::string& storedPassword);

  // The settings the last Login of this object read.
  ConnectionSettings settings_;
  std::shared_ptr<vb::Object> headerEditor_;
  automation::ObjectCounter::ObjectLock alive_{LiveObjects()};
};

}  // namespace component
