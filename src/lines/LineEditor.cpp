#include "lines/LineEditor.h"

#include "lines/frmMainDetails.h"

namespace lines {

std::shared_ptr<forms::Form> NewLineEditor() { return std::make_shared<frmMainDetails>(); }

}  // namespace lines
