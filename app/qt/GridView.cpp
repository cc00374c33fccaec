#include "app/qt/GridView.h"

#include <QHeaderView>
#include <QResizeEvent>

#include <algorithm>
#include <numeric>

namespace dovrel {

GridView::GridView(bool fitColumns, QWidget* parent) : QTableView(parent), fit_(fitColumns) {
    setTabKeyNavigation(false);
    setVerticalScrollBarPolicy(Qt::ScrollBarAsNeeded);
}

void GridView::setDesignWidths(std::vector<int> widths) {
    design_ = std::move(widths);
    if (model() != nullptr)
        connect(model(), &QAbstractItemModel::modelReset, this, &GridView::contentReset,
                Qt::UniqueConnection);
    sizeColumns();
}

void GridView::resizeEvent(QResizeEvent* event) {
    QTableView::resizeEvent(event);
    if (fit_)
        sizeColumns();
}

void GridView::contentReset() {
    sizeColumns();
    scrollToTop();
}

std::vector<int> GridView::neededWidths() const {
    std::vector<int> needed(design_.size());
    for (size_t col = 0; col < design_.size(); ++col) {
        int c = static_cast<int>(col);
        QString heading = model()->headerData(c, Qt::Horizontal).toString().trimmed();
        int need = std::max(sizeHintForColumn(c), fontMetrics().horizontalAdvance(heading) + 16);
        needed[col] = std::min(need, design_[col]);
    }
    return needed;
}

void GridView::sizeColumns() {
    if (model() == nullptr || design_.size() != static_cast<size_t>(model()->columnCount()))
        return;
    std::vector<int> widths = design_;
    int available = viewport()->width();
    int designed = std::accumulate(design_.begin(), design_.end(), 0);
    if (fit_ && designed > available) {
        widths = neededWidths();
        int spare = available - std::accumulate(widths.begin(), widths.end(), 0);
        int wanted = designed - std::accumulate(widths.begin(), widths.end(), 0);
        for (size_t col = 0; col < widths.size() && spare > 0 && wanted > 0; ++col)
            widths[col] += static_cast<int>(static_cast<long long>(design_[col] - widths[col]) *
                                            spare / wanted);
    } else if (fit_ && !widths.empty()) {
        auto widest = std::max_element(widths.begin(), widths.end());
        *widest += available - designed;
    }
    for (size_t col = 0; col < widths.size(); ++col)
        setColumnWidth(static_cast<int>(col), widths[col]);
}

} // namespace dovrel
