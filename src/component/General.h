#pragma once
// POC_Dorvantos.General: opens an entry given the entry's own identifier.

#include "component/ClassObject.h"

namespace component {

class General : public ClassObject {
 public:
  void Registo(vb::Variant& tRs, const vb::Variant& Pkey, const std::string& Tabela,
               const std::string& StrWhere, const vb::ObjectPtr& Caller) override;
};

}  // namespace component
