#pragma once

#include <QAbstractTableModel>

#include <memory>

#include "platform/Grid.h"

namespace dovrel {

// Shows a Grid in a QTableView: the grid's fixed rows are the heading, the
// other rows the data. Every change of the grid resets the view; edits made
// in an editable view go to the grid's cells.
class GridModel : public QAbstractTableModel {
    Q_OBJECT

public:
    GridModel(Grid& grid, bool editable, QObject* parent = nullptr);
    ~GridModel() override { *alive_ = false; }

    Grid& grid() const { return grid_; }
    // The grid row of a view row, and back.
    int gridRow(int viewRow) const { return viewRow + headingRows(); }
    int viewRow(int gridRow) const { return gridRow - headingRows(); }

    int rowCount(const QModelIndex& parent = QModelIndex()) const override;
    int columnCount(const QModelIndex& parent = QModelIndex()) const override;
    QVariant data(const QModelIndex& index, int role) const override;
    QVariant headerData(int section, Qt::Orientation orientation, int role) const override;
    Qt::ItemFlags flags(const QModelIndex& index) const override;
    bool setData(const QModelIndex& index, const QVariant& value, int role) override;

    // Qt's alignment for the grid's alignment number of a column.
    static Qt::Alignment Alignment(int32_t gridAlignment);

private:
    std::shared_ptr<bool> alive_ = std::make_shared<bool>(true); // false once gone
    int headingRows() const;
    void gridChanged();

    Grid& grid_;
    bool editable_;
    bool writing_ = false;
    Connection gridChanged_;
};

} // namespace dovrel
