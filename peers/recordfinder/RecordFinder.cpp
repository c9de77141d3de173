#include "RecordFinder.h"

#include <memory>

#include "FinderConnection.h"
#include "FinderTables.h"
#include "frmRecordFinder.h"
#include "platform/vb/Error.h"

namespace recordfinder {

automation::ObjectCounter& LiveObjects() {
  static automation::ObjectCounter counter;
  return counter;
}

const automation::MemberTable<RecordFinder>& RecordFinder::Members() {
  static const auto table =
      automation::MemberTable<RecordFinder>()
          .Method("Connect", {2, 2},
                  [](RecordFinder& self, automation::Args& a) {
                    return vb::Variant(
                        self.Connect(automation::TextArg(a[0]), automation::TextArg(a[1])));
                  })
          .Method("Find", {0, 7}, [](RecordFinder& self, automation::Args& a) {
            return vb::Variant(self.Find(automation::TextArg(a[0]), automation::TextArg(a[4])));
          });
  return table;
}

bool RecordFinder::Connect(const std::string& user, const std::string& password) {
  if (connection_ && connection_->State() == ado::adStateOpen) connection_->Close();
  connection_ = OpenFinderConnection(user, password);
  return connection_ != nullptr;
}

int32_t RecordFinder::Find(const std::string& tableKey, const std::string& filter) {
  if (!connection_)
    throw vb::Error(vb::kErrInvalidProcedureCall,
                    "RecordFinder: sem ligação à base de dados (Connect recusado ou em falta)",
                    "RecordFinder.General");
  auto window = std::make_shared<frmRecordFinder>(LoadFinderTable(connection_, tableKey, filter));
  window->Show(forms::vbModal);
  const int32_t chosen = window->Chosen;
  if (window->Loaded()) window->Unload();
  return chosen;
}

}  // namespace recordfinder
