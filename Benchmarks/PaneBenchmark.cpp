#include "App/Toolkit/NavigationStack.h"
#include "App/VentrikPaneController.h"

#include <QApplication>

#include <array>

#include <benchmark/benchmark.h>
#include <fmt/format.h>

namespace ventrik
{

namespace
{

class NoHost : public VentrikPaneHost
{
  public:
    bool allowSaveButton() const override { return false; }
    void showSaveView() override {}
    bool tintsChanges() const override { return true; }
};

// One application for all runs; it needs no display.
void startToolkit()
{
    static int argc = 1;
    static char name[] = "benchmark";
    static char* argv[] = {name, nullptr};
    qputenv("QT_QPA_PLATFORM", "offscreen");
    static const QApplication application(argc, argv);
}

ModelNodePointer nodeWithRows(std::int64_t count, std::string_view value)
{
    VentrikModelNode::Children children;
    for (std::int64_t i = 0; i < count; ++i)
        children.push_back(VentrikModelLeafNode::initWithName(fmt::format("Cell {}", i),
                                                              fmt::format("{} {}", value, i)));
    return VentrikModelTreeNode::initWithName("Ventrik", std::move(children));
}

// Every value changes; the cost is that of the rows in view, however many there are.
void reloadPane(benchmark::State& state)
{
    startToolkit();
    const std::array nodes{nodeWithRows(state.range(0), "-94 dBm"),
                           nodeWithRows(state.range(0), "-95 dBm")};
    NoHost host;
    auto made = VentrikPaneController::initWithNode(host, nodes[0], "/");
    VentrikPaneController& pane = *made;
    NavigationStack stack(std::move(made));
    stack.setAnimationEnabled(false);
    stack.resize(390, 780);
    stack.show();
    std::size_t turn = 0;
    for (auto _ : state) {
        pane.reloadWithNode(nodes[++turn % 2]);
        QCoreApplication::processEvents();
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    }
    state.SetItemsProcessed(state.iterations());
}
BENCHMARK(reloadPane)->Arg(100)->Arg(10000)->Arg(1000000)->Unit(benchmark::kMillisecond);

} // namespace

} // namespace ventrik
