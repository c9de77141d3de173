#include "accounts/AccountFinder.h"

#include "accounts/frmFindConta.h"

namespace accounts {

std::shared_ptr<forms::Form> NewAccountFinder() { return std::make_shared<frmFindConta>(); }

}  // namespace accounts
