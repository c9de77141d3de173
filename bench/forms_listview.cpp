// Lookups of list items by key in a list of 100,000 lines, as the lines list does
// when a saved line is refreshed.

#include <benchmark/benchmark.h>

#include <string>

#include "platform/forms/Forms.h"

namespace {

forms::FormDesign ListDesign() {
  return {.name = "frmBench",
          .controls = {{.name = "ListView1", .type = forms::ControlType::ListView,
                        .items = {{"", "Nº Reg.", 800, 0}, {"", "Subconta", 1250, 0}}}}};
}

constexpr int kItems = 100000;

void BM_ListViewAddByKey(benchmark::State& state) {
  for (auto _ : state) {
    forms::Form form(ListDesign());
    auto& items = form.Ctl<forms::ListView>("ListView1").ListItems();
    for (int i = 0; i < kItems; ++i) items.Add("#" + std::to_string(i), std::to_string(i));
    benchmark::DoNotOptimize(items.Count());
  }
  state.SetItemsProcessed(state.iterations() * kItems);
}
BENCHMARK(BM_ListViewAddByKey)->Unit(benchmark::kMillisecond);

void BM_ListViewFindByKey(benchmark::State& state) {
  forms::Form form(ListDesign());
  auto& items = form.Ctl<forms::ListView>("ListView1").ListItems();
  for (int i = 0; i < kItems; ++i) items.Add("#" + std::to_string(i), std::to_string(i));
  int i = 0;
  for (auto _ : state) {
    forms::ListItem& item = items("#" + std::to_string(i));
    benchmark::DoNotOptimize(item.Index());
    i = (i + 7919) % kItems;
  }
  state.SetItemsProcessed(state.iterations());
}
BENCHMARK(BM_ListViewFindByKey);

void BM_ListViewRewriteEveryItem(benchmark::State& state) {
  forms::Form form(ListDesign());
  auto& items = form.Ctl<forms::ListView>("ListView1").ListItems();
  for (int i = 0; i < kItems; ++i) items.Add("#" + std::to_string(i), std::to_string(i));
  for (auto _ : state) {
    for (int i = 0; i < kItems; ++i) items("#" + std::to_string(i)).SetSubItems(1, "2211");
  }
  state.SetItemsProcessed(state.iterations() * kItems);
}
BENCHMARK(BM_ListViewRewriteEveryItem)->Unit(benchmark::kMillisecond);

}  // namespace
