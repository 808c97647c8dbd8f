#include <benchmark/benchmark.h>
#include <curses.h>

#include <cstdio>
#include <string>

#include "console/screen/colours.h"
#include "console/widgets/markup_layout.h"
#include "console/widgets/text_area.h"

namespace {

constexpr int COLUMNS = 80;
constexpr int ROWS = 25;

// A piece of a screen as the console shows it: a sentence, a table row, a hint line.
constexpr char SCREEN_PIECE[] =
    "{color:white}By default, this test{/color} will attempt to ping the configured default "
    "gateway, ping the configured primary and alternate DNS servers.\n"
    "    {align:padding:13}corenic0{/align}{align:padding:30}Rackline (02:fc:00:00:00:01)"
    "{/align}{color:yellow}Connected{/color}\n"
    "<F2> Customize System{align:right}<F12> Shut Down/Restart{/align}\n";

std::string TextOf(size_t size) {
  std::string text;
  while (text.size() < size) text += SCREEN_PIECE;
  return text;
}

void Measure(benchmark::State& state, const std::string& text) {
  const Tarnel::ValueTags facts = {{"hostname", [] { return std::string("rack7"); }}};
  for ([[maybe_unused]] auto _ : state) {
    benchmark::DoNotOptimize(Tarnel::LayoutMarkup(text, COLUMNS, facts));
  }
  state.SetBytesProcessed(state.iterations() * static_cast<int64_t>(text.size()));
}

void LayoutOfScreens(benchmark::State& state) {
  Measure(state, TextOf(static_cast<size_t>(state.range(0))));
}
BENCHMARK(LayoutOfScreens)->Arg(4 << 10)->Arg(64 << 10)->Arg(1 << 20);

// A region that is never closed and wraps at every line.
void LayoutOfOneRegion(benchmark::State& state) {
  std::string text = "{align:right}";
  while (text.size() < static_cast<size_t>(state.range(0))) text += "word after word ";
  Measure(state, text);
}
BENCHMARK(LayoutOfOneRegion)->Arg(4 << 10)->Arg(64 << 10)->Arg(1 << 20);

void LayoutOfTags(benchmark::State& state) {
  std::string text;
  while (text.size() < static_cast<size_t>(state.range(0))) text += "{color:red}";
  Measure(state, text);
}
BENCHMARK(LayoutOfTags)->Arg(4 << 10)->Arg(64 << 10)->Arg(1 << 20);

// Erase, layout, paint and staging of a text that fills the screen. Nothing is sent, so any
// terminal will do.
void RenderFullScreen(benchmark::State& state) {
  FILE* const terminal = fopen("/dev/null", "r+");
  if (terminal == nullptr || newterm("xterm-256color", terminal, terminal) == nullptr) {
    state.SkipWithError("no terminal to paint on");
    return;
  }
  resizeterm(ROWS, COLUMNS);
  start_color();
  Tarnel::InitColours();
  Tarnel::Window pane(0, 0, COLUMNS, ROWS, Tarnel::LIGHT_GREY, Tarnel::BLACK);
  pane.Activate(true);
  auto* const area = pane.Add<Tarnel::TextArea>(0, 0, COLUMNS, ROWS, Tarnel::PARENT_COLOUR);
  area->Activate(true);
  const std::string text = TextOf(size_t{COLUMNS} * ROWS * 2);
  for ([[maybe_unused]] auto _ : state) {
    area->SetText(text);
  }
}
BENCHMARK(RenderFullScreen)->Unit(benchmark::kMicrosecond);

}  // namespace
