// Building the tree of the chart of accounts: one node per account, under the nearest
// account whose code its own code extends.

#include <array>

#include "accounts/frmFindConta.h"
#include "common/ErrorTrap.h"
#include "common/SqlServer.h"
#include "common/modData.h"
#include "platform/forms/Utf8.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace accounts {

namespace {

// The node text is the code and the description joined by " - "; the linked asset and
// liability accounts come along as associacao. Rows come in code order, so a parent
// code always arrives before the longer codes under it.
constexpr const char* kAccountsQuery =
    "SELECT CASE WHEN codigo is null AND descrit is null THEN null WHEN codigo is null AND "
    "descrit is not null THEN ' - ' + descrit WHEN codigo is not null AND descrit is null THEN "
    "codigo + ' - ' WHEN codigo is not null AND descrit is not null THEN codigo + ' - ' + "
    "descrit END as codigo_descrit, CASE WHEN conta_activo is null and conta_passivo is null "
    "THEN '' WHEN conta_activo is not null and conta_passivo is null THEN ' => ' + "
    "conta_activo + '' WHEN conta_activo is null and conta_passivo is not null THEN ' => ' + "
    "conta_passivo + '' WHEN conta_activo is not null and conta_passivo is not null THEN ' => "
    "' + conta_activo + ', ' + conta_passivo + '' END as associacao, * FROM tbPOC_Contas "
    "ORDER BY codigo";

// Pictures of ImageList1.
constexpr int kPictureClass = 1;
constexpr int kPictureGroup = 2;
constexpr int kPictureAssignable = 3;

// A parent is looked for among the codes shortened by one, two and three characters.
constexpr std::array<size_t, 3> kParentTries = {1, 2, 3};

std::string NodeKey(std::string_view codigo) { return "#" + std::string(codigo); }

// The first `count` characters of a code (characters, not bytes).
std::string_view LeftChars(std::string_view text, size_t count) {
  return text.substr(0, forms::utf8::Offset(text, count));
}

bool IsAssignable(const vb::Variant& atribuicao) {
  return !atribuicao.IsNull() && !atribuicao.IsEmpty() && vb::CDbl(atribuicao) == 1;
}

}  // namespace

void frmFindConta::Fill_Tree() {
  // Window messages run while the tree is built, so the person may close the finder
  // half-way; from then on nothing here may touch it, or it would load again.
  const uint64_t generation = LoadGeneration();
  common::Trap(
      common::FindContaSite("Fill_Tree"),
      [&] {
        ShowBuildProgress(true);
        TreeView1.Nodes().Clear();

        auto rs = ado::Recordset::Create();
        rs->Open(kAccountsQuery, common::SqlServer(), ado::adOpenStatic, ado::adLockReadOnly);
        if (!rs->Eof()) {
          rs->MoveLast();
          rs->MoveFirst();
        }
        ProgressBar1.SetValue(0);
        // A bar cannot have a maximum equal to its minimum: an empty chart of accounts
        // keeps the bar's range, with nothing to step through.
        if (rs->RecordCount() > 0) ProgressBar1.SetMax(rs->RecordCount());

        while (!rs->Eof()) {
          AddAccountNode(rs);
          StepProgress();
          if (!StillOpen(generation)) return;
          rs->MoveNext();
        }
        rs->Close();

        ShowBuildProgress(false);
        if (TreeView1.Nodes().Count() > 0) TreeView1.Nodes()(1).EnsureVisible();
      },
      [&] {
        // The tree keeps the nodes added so far, and the window stays open.
        if (StillOpen(generation)) ShowBuildProgress(false);
      });
}

void frmFindConta::ShowBuildProgress(bool building) {
  TreeView1.SetVisible(!building);
  ProgressBar1_Label.SetVisible(building);
  ProgressBar1.SetVisible(building);
}

void frmFindConta::AddAccountNode(const ado::RecordsetPtr& rs) {
  const vb::Variant& codigoValue = rs->Fields("codigo").Value();
  const std::string codigo = codigoValue.IsNull() ? std::string() : vb::CStr(codigoValue);
  const std::string text = common::ListField(rs, "codigo_descrit", common::kListText);
  const vb::Variant contaId(vb::CLng(rs->Fields("conta_id").Value()));

  const bool topLevel = forms::utf8::Length(codigo) <= 1;
  forms::Node* node = nullptr;
  if (topLevel) {
    node = &TreeView1.Nodes().Add({}, forms::tvwLast, NodeKey(codigo), text, kPictureClass);
    node->SetTag(contaId);
    node->SetBold(true);
  } else {
    node = &PlaceUnderParent(codigo, text);
  }
  node->SetTag(contaId);

  const int picture = topLevel                                         ? kPictureClass
                      : IsAssignable(rs->Fields("atribuicao").Value()) ? kPictureAssignable
                                                                       : kPictureGroup;
  node->SetImage(picture);
  node->SetSelectedImage(picture);
}

forms::Node& frmFindConta::PlaceUnderParent(const std::string& codigo, const std::string& text) {
  // The nearest account above is usually the code less its last character; where the
  // chart skips a level (2111 without 211) the next shorter codes are tried. Each try
  // looks its parent up by key, so the whole build stays linear in the accounts.
  const size_t length = forms::utf8::Length(codigo);
  vb::Error failure(vb::kErrElementNotFound, "Element not found");
  for (size_t dropped : kParentTries) {
    if (dropped >= length) break;  // a code shortened to nothing has no node
    const std::string parentKey = NodeKey(LeftChars(codigo, length - dropped));
    try {
      forms::Node& node = TreeView1.Nodes().Add(parentKey, forms::tvwChild, NodeKey(codigo),
                                                text, kPictureGroup);
      // Only the classes of the chart open up: the tree shows them with their groups.
      if (length - dropped == 1) node.Parent()->SetExpanded(true);
      return node;
    } catch (const vb::Error& e) {
      // No such parent, or this very code already in the tree (the chart holds it
      // twice): either way the next shorter code is tried.
      failure = e;
    }
  }
  // No parent within three characters: the build stops here, with the reason of the
  // last try.
  throw failure;
}

void frmFindConta::StepProgress() {
  const double before = ProgressBar1.Value();
  if (before + 1 > ProgressBar1.Max()) return;
  ProgressBar1.SetValue(before + 1);
  // Let the bar be drawn and the window answer, once per hundredth of the way: often
  // enough to look alive, rarely enough not to slow a large chart down.
  const double max = ProgressBar1.Max();
  if (static_cast<int64_t>(before * 100 / max) != static_cast<int64_t>((before + 1) * 100 / max))
    forms::DoEvents();
}

bool frmFindConta::StillOpen(uint64_t generation) const {
  return Loaded() && LoadGeneration() == generation;
}

}  // namespace accounts
