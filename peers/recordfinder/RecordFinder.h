#pragma once
// RecordFinder.General: a modal picker of rows, by table key.
//
//   Connect(user, password)     logs in with the component's user; the password in the
//                               encoded form Login received it. True when accepted.
//   Find([table], [2], [3], [4], [filter], [6], [7])
//                               shows the table's rows (narrowed by the filter), waits
//                               for the person, and returns the chosen row's key, or 0.
//
// The second, third, fourth, sixth and seventh arguments are accepted and ignored.

#include <string>

#include "platform/ado/Connection.h"
#include "platform/automation/Dispatch.h"
#include "platform/automation/InprocServer.h"

namespace recordfinder {

automation::ObjectCounter& LiveObjects();

class RecordFinder : public automation::Dispatch<RecordFinder> {
 public:
  static const automation::MemberTable<RecordFinder>& Members();

  bool Connect(const std::string& user, const std::string& password);
  // Raises vb::Error 5 for an unknown table or filter, and when not connected.
  int32_t Find(const std::string& tableKey, const std::string& filter);

 private:
  ado::ConnectionPtr connection_;
  automation::ObjectCounter::ObjectLock alive_{LiveObjects()};
};

}  // namespace recordfinder
