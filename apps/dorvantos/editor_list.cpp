#include "editor_list.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

#include "common/modData.h"
#include "platform/ado/Recordset.h"
#include "platform/ado/RecordsetObject.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"
#include "platform/vb/Variant.h"

namespace app {

namespace {

using forms::ControlType;

constexpr int32_t kMargin = 120;
constexpr int32_t kButtonHeight = 375;
// What a form's border and caption take of its Width and Height.
constexpr int32_t kFrameWidth = 120, kFrameHeight = 420;
constexpr int32_t kMinimumWidth = 6000, kMinimumHeight = 3600;

// The entries with what the list shows; the total is the sum of the debits, which a
// balanced entry has equal to its credits.
constexpr const char* kEntriesQuery =
    "SELECT d.dorvanto_id, d.data, t.descrit AS tipo, d.dorvanto_no, d.referencia, "
    "d.finalizado, (SELECT SUM(x.debito) FROM tbPOC_Dorvantos_Details x "
    "WHERE x.dorvanto_id = d.dorvanto_id) AS total "
    "FROM tbPOC_Dorvantos d LEFT JOIN tbPOC_Diario_Tipos t "
    "ON t.tipo_diario_id = d.tipo_diario_id ORDER BY d.data, d.dorvanto_id";

// The caller object the component reports back to.
class ListCallBack : public vb::Object {
 public:
  explicit ListCallBack(std::weak_ptr<vb::Object> list) : list_(std::move(list)) {}

  vb::Variant Invoke(const std::string& name, std::vector<vb::Variant>& args) override {
    if (name != "RemoteKey") throw vb::Error(vb::kErrMemberNotSupported);
    auto list = std::dynamic_pointer_cast<frmDiario>(list_.lock());
    if (!list || !list->Loaded()) return {};
    std::optional<int32_t> id;
    if (!args.empty() && !args[0].IsEmpty() && !args[0].IsNull() && !args[0].IsMissing()) {
      const int32_t key = vb::CLng(args[0]);
      if (key > 0) id = key;
    }
    list->Refresh(id);
    return {};
  }

 private:
  std::weak_ptr<vb::Object> list_;
};

}  // namespace

std::string EntryKey(int32_t dorvantoId) { return fmt::format("#{}", dorvantoId); }

frmDiario::frmDiario(ado::ConnectionPtr database, vb::ObjectPtr component)
    : Form(Design()), database_(std::move(database)), component_(std::move(component)) {
  Handle(Command1.Click, &frmDiario::Command1_Click);
  Handle(Command2.Click, &frmDiario::Command2_Click);
  Handle(ListView1.DblClick, &frmDiario::ListView1_DblClick);
  Handle(ListView1.KeyDown, &frmDiario::ListView1_KeyDown);
}

forms::FormDesign frmDiario::Design() {
  const int left = forms::lvwColumnLeft;
  return {
      .name = "frmDiario",
      .caption = "Diário - Lançamentos",
      .width = 11400,
      .height = 7200,
      .controls = {
          {.name = "Label1", .type = ControlType::Label, .left = kMargin, .top = kMargin,
           .width = 6000, .height = 300, .caption = "Lançamentos no Diário",
           .properties = {{"FontBold", true}}},
          {.name = "ListView1", .type = ControlType::ListView, .left = kMargin, .top = 480,
           .width = 11040, .height = 5640, .properties = {{"TabIndex", 0}},
           .items = {{.key = "data", .caption = "Data", .width = 1300, .alignment = left},
                     {.key = "tipo", .caption = "Tipo de Diário", .width = 2700, .alignment = left},
                     {.key = "documento", .caption = "Nº Documento", .width = 1800,
                      .alignment = left},
                     {.key = "referencia", .caption = "Referência", .width = 2600,
                      .alignment = left},
                     {.key = "estado", .caption = "Estado", .width = 1200,
                      .alignment = forms::lvwColumnCenter},
                     {.key = "total", .caption = "Total", .width = 1300,
                      .alignment = forms::lvwColumnRight}}},
          {.name = "Command1", .type = ControlType::CommandButton, .left = kMargin, .top = 6240,
           .width = 2055, .height = kButtonHeight, .caption = "&Novo lançamento",
           .properties = {{"TabIndex", 1}}},
          {.name = "Command2", .type = ControlType::CommandButton, .left = 2280, .top = 6240,
           .width = 1215, .height = kButtonHeight, .caption = "&Abrir",
           .properties = {{"TabIndex", 2}}},
      }};
}

vb::ObjectPtr frmDiario::CallBack() {
  if (!callBack_) callBack_ = std::make_shared<ListCallBack>(weak_from_this());
  return callBack_;
}

void frmDiario::Form_Load() {
  designWidth_ = Width();
  designHeight_ = Height();
  Refresh();
}

void frmDiario::Form_Resize() {
  if (WindowState() == forms::vbMinimized || designWidth_ == 0) return;
  // The list takes whatever the window gains; the buttons keep to the bottom.
  const int32_t width = std::max(Width(), kMinimumWidth);
  const int32_t height = std::max(Height(), kMinimumHeight);
  const int32_t buttonsTop = height - kFrameHeight - kMargin - kButtonHeight;
  ListView1.Move(kMargin, ListView1.Top(), width - kFrameWidth - 2 * kMargin,
                 buttonsTop - kMargin - ListView1.Top());
  Command1.SetTop(buttonsTop);
  Command2.SetTop(buttonsTop);
}

void frmDiario::Refresh(std::optional<int32_t> dorvantoId) {
  try {
    if (!dorvantoId) dorvantoId = SelectedEntry();
    forms::ListItemList& items = ListView1.ListItems();
    items.Clear();
    ado::RecordsetPtr rs = database_->Execute(kEntriesQuery);
    for (; !rs->Eof(); rs->MoveNext()) {
      const int32_t id = vb::CLng(rs->Fields("dorvanto_id").Value());
      forms::ListItem& item = items.Add(EntryKey(id), common::ListField(rs, "data", common::kListDate));
      item.SetSubItems(1, common::ListField(rs, "tipo", common::kListText));
      item.SetSubItems(2, common::ListField(rs, "dorvanto_no", common::kListText));
      item.SetSubItems(3, common::ListField(rs, "referencia", common::kListText));
      const vb::Variant& finalized = rs->Fields("finalizado").Value();
      const bool closed = !finalized.IsNull() && !finalized.IsEmpty() && vb::CLng(finalized) != 0;
      item.SetSubItems(4, closed ? "Finalizado" : "Aberto");
      item.SetSubItems(5, common::ListField(rs, "total", common::kListNumber));
    }
    rs->Close();
    forms::ListItem* chosen = dorvantoId ? items.Find(EntryKey(*dorvantoId)) : nullptr;
    if (!chosen && items.Count() > 0) chosen = &items(items.Count());
    if (chosen) {
      chosen->SetSelected(true);
      chosen->EnsureVisible();
    }
  } catch (const std::exception& error) {
    Report(error);
  }
}

std::optional<int32_t> frmDiario::SelectedEntry() const {
  const forms::ListItem* item = ListView1.SelectedItem();
  if (!item || item->Key().size() < 2) return std::nullopt;
  try {
    return std::stoi(item->Key().substr(1));
  } catch (const std::exception&) {
    return std::nullopt;
  }
}

void frmDiario::Command1_Click() {
  try {
    component_->Call("NovoRegisto", {vb::Variant("tbPOC_Dorvantos"), vb::Variant::Missing(),
                                     vb::Variant::Missing(), vb::Variant(CallBack())});
  } catch (const std::exception& error) {
    Report(error);
  }
}

void frmDiario::Command2_Click() { OpenSelected(); }

void frmDiario::ListView1_DblClick() { OpenSelected(); }

void frmDiario::ListView1_KeyDown(int& KeyCode, int /*Shift*/) {
  if (KeyCode != forms::vbKeyReturn) return;
  KeyCode = 0;
  OpenSelected();
}

void frmDiario::OpenSelected() {
  const std::optional<int32_t> id = SelectedEntry();
  if (!id) return;
  try {
    // As a host does: its own recordset of the entries, handed over with the key.
    ado::RecordsetPtr records =
        database_->Execute("SELECT * FROM tbPOC_Dorvantos ORDER BY dorvanto_id");
    component_->Call("Registo", {ado::RecordsetObject::Wrap(records), vb::Variant(*id),
                                 vb::Variant::Missing(), vb::Variant::Missing(),
                                 vb::Variant(CallBack())});
  } catch (const std::exception& error) {
    Report(error);
  }
}

void frmDiario::Report(const std::exception& error) {
  forms::MsgBox(fmt::format("Não foi possível ler os lançamentos: {}", error.what()),
                forms::vbCritical, Caption());
}

}  // namespace app
