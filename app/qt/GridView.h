#pragma once

#include <QTableView>

#include <vector>

namespace dovrel {

// The table of a grid model. A new content shows from its first row, with a
// vertical scroll bar when the rows do not fit, and Tab leaves the table
// instead of walking its cells. With fitting on, the columns share the width
// of the view: each gets at least what its heading and cells need, up to
// the width its design asks for, so the last columns are seen without
// scrolling wherever the view is wide enough; extra width goes to the
// widest column.
class GridView : public QTableView {
    Q_OBJECT

public:
    explicit GridView(bool fitColumns, QWidget* parent = nullptr);

    // The widths the design asks for, one a column.
    void setDesignWidths(std::vector<int> widths);

protected:
    void resizeEvent(QResizeEvent* event) override;

private:
    void contentReset();
    void sizeColumns();
    std::vector<int> neededWidths() const;

    bool fit_;
    std::vector<int> design_;
};

} // namespace dovrel
