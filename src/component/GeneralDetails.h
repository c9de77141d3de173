#pragma once
// POC_Dorvantos.GeneralDetails: opens an entry given the identifier of one of its lines.

#include "component/ClassObject.h"

namespace component {

class GeneralDetails : public ClassObject {
 public:
  void Registo(vb::Variant& tRs, const vb::Variant& Pkey, const std::string& Tabela,
               const std::string& StrWhere, const vb::ObjectPtr& Caller) override;
};

}  // namespace component
