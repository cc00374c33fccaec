#include "app/qt/GridModel.h"

#include "app/qt/QtText.h"

#include <algorithm>

namespace dovrel {

GridModel::GridModel(Grid& grid, bool editable, QObject* parent)
    : QAbstractTableModel(parent), grid_(grid), editable_(editable) {
    gridChanged_ = grid_.changed.connect([this, alive = alive_] {
        if (*alive)
            gridChanged();
    });
}

void GridModel::gridChanged() {
    if (writing_)
        return;
    beginResetModel();
    endResetModel();
}

int GridModel::headingRows() const {
    return std::clamp(grid_.FixedRows(), 0, grid_.Rows());
}

int GridModel::rowCount(const QModelIndex& parent) const {
    return parent.isValid() ? 0 : grid_.Rows() - headingRows();
}

int GridModel::columnCount(const QModelIndex& parent) const {
    return parent.isValid() ? 0 : grid_.Cols();
}

QVariant GridModel::data(const QModelIndex& index, int role) const {
    if (!index.isValid() || index.row() >= rowCount() || index.column() >= columnCount())
        return QVariant();
    if (role == Qt::DisplayRole || role == Qt::EditRole) {
        QString text = ToQString(grid_.TextMatrix(gridRow(index.row()), index.column()));
        return role == Qt::DisplayRole && IsPlainNumber(text) ? LeftToRight(text) : text;
    }
    if (role == Qt::TextAlignmentRole)
        return QVariant::fromValue(Alignment(grid_.ColAlignment(index.column())));
    return QVariant();
}

QVariant GridModel::headerData(int section, Qt::Orientation orientation, int role) const {
    if (orientation == Qt::Vertical || section < 0 || section >= columnCount())
        return QVariant();
    // The spaces after a heading widen its column (ColWidthChars); drawn,
    // they would push the heading's letters out of sight.
    if (role == Qt::DisplayRole)
        return headingRows() > 0 ? ToQString(grid_.TextMatrix(0, section)).trimmed() : QVariant();
    if (role == Qt::TextAlignmentRole)
        return QVariant::fromValue(Alignment(grid_.ColAlignment(section)));
    return QVariant();
}

Qt::ItemFlags GridModel::flags(const QModelIndex& index) const {
    Qt::ItemFlags flags = QAbstractTableModel::flags(index);
    return editable_ ? flags | Qt::ItemIsEditable : flags;
}

bool GridModel::setData(const QModelIndex& index, const QVariant& value, int role) {
    if (!editable_ || role != Qt::EditRole || !index.isValid())
        return false;
    writing_ = true;
    grid_.setTextMatrix(gridRow(index.row()), index.column(), FromQString(value.toString()));
    writing_ = false;
    emit dataChanged(index, index, {Qt::DisplayRole, Qt::EditRole});
    return true;
}

// The grid numbers its alignments 0 to 8 as left, centre, right, each top,
// centre and bottom; 9 is general (text to the left, numbers to the right).
// Right and left are the screen's, whatever the direction of the view.
Qt::Alignment GridModel::Alignment(int32_t gridAlignment) {
    if (gridAlignment < 0 || gridAlignment > 8)
        return Qt::AlignVCenter;
    static const Qt::Alignment horizontal[] = {Qt::AlignLeft, Qt::AlignHCenter, Qt::AlignRight};
    static const Qt::Alignment vertical[] = {Qt::AlignTop, Qt::AlignVCenter, Qt::AlignBottom};
    Qt::Alignment h = horizontal[gridAlignment / 3];
    return h | vertical[gridAlignment % 3] |
           (h == Qt::AlignHCenter ? Qt::Alignment() : Qt::AlignAbsolute);
}

} // namespace dovrel
