#include "entry/HeaderEditor.h"

#include "entry/frmMain.h"
#include "lines/LineEditor.h"

namespace entry {

std::shared_ptr<forms::Form> NewHeaderEditor() {
  return std::make_shared<frmMain>(HeaderEditorWindows{
      .LineEditor = [] { return vb::ObjectPtr(lines::NewLineEditor()); },
      .HeaderEditor = [] { return vb::ObjectPtr(NewHeaderEditor()); },
  });
}

}  // namespace entry
