#include "print/FigureViews.h"

#include <functional>
#include <utility>

#include "AlignmentPane.h"

namespace {

struct CFigureView {
    const char* name;
    std::function<std::unique_ptr<CPaneView>()> make;
};

const std::vector<CFigureView>& FigureViews() {
    static const std::vector<CFigureView> views = {
        {"alignment", [] { return std::make_unique<CBlockAlnView>(); }},
    };
    return views;
}

}  // namespace

std::unique_ptr<CPaneView> MakeFigurePane(const QString& name) {
    for (const CFigureView& view : FigureViews()) {
        if (name == QLatin1String(view.name)) {
            return view.make();
        }
    }
    return nullptr;
}

QStringList FigureViewNames() {
    QStringList names;
    for (const CFigureView& view : FigureViews()) {
        names << QString::fromLatin1(view.name);
    }
    return names;
}
