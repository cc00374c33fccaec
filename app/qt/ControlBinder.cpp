#include "app/qt/ControlBinder.h"

#include "app/qt/GridModel.h"
#include "app/qt/GridView.h"
#include "app/qt/QtText.h"
#include "platform/FileSystem.h"
#include "platform/ListControls.h"

#include <QCheckBox>
#include <QComboBox>
#include <QEvent>
#include <QFile>
#include <QFileSystemModel>
#include <QFocusEvent>
#include <QFrame>
#include <QHeaderView>
#include <QLabel>
#include <QLineEdit>
#include <QListWidget>
#include <QMouseEvent>
#include <QScreen>
#include <QStyle>
#include <QTableView>
#include <QToolButton>
#include <QTreeView>

#include <algorithm>
#include <cmath>

namespace dovrel {

namespace {

QStyle::StandardPixmap PictureOf(const std::string& picture) {
    static const std::map<std::string, QStyle::StandardPixmap> pictures = {
        {"folder", QStyle::SP_DirOpenIcon},
        {"print", QStyle::SP_FileDialogContentsView},
        {"settings", QStyle::SP_FileDialogDetailedView},
        {"first", QStyle::SP_MediaSkipForward},
        {"previous", QStyle::SP_MediaSeekForward},
        {"next", QStyle::SP_MediaSeekBackward},
        {"last", QStyle::SP_MediaSkipBackward},
    };
    auto found = pictures.find(picture);
    return found == pictures.end() ? QStyle::SP_CustomBase : found->second;
}

QColor ColorOf(uint32_t rgb) {
    return QColor((rgb >> 16) & 0xFF, (rgb >> 8) & 0xFF, rgb & 0xFF);
}

} // namespace

ControlBinder::ControlBinder(QWidget* surface, SurfaceEvents events, QObject* parent)
    : QObject(parent), surface_(surface), events_(std::move(events)), scale_(Scale(surface)),
      alive_(std::make_shared<bool>(true)) {}

ControlBinder::~ControlBinder() {
    *alive_ = false;
}

double ControlBinder::Scale(const QWidget* widget) {
    QScreen* screen = widget != nullptr ? widget->screen() : nullptr;
    double dpi = screen != nullptr ? screen->logicalDotsPerInchX() : 96.0;
    return (dpi > 0 ? dpi : 96.0) / 1440.0;
}

int ControlBinder::ToPixels(int32_t twips, double scale) {
    return static_cast<int>(std::lround(twips * scale));
}

void ControlBinder::place(QWidget* widget, const ControlDesign& design) {
    widget->setParent(surface_);
    widget->setObjectName(QString::fromStdString(design.name));
    widget->setGeometry(designRect(design, widget));
    designs_[widget] = design;
    if (!design.toolTip.empty())
        widget->setToolTip(ToQString(design.toolTip));
    widgets_[design.name] = widget;
    names_[widget] = design.name;
}

// A label is made tall enough for its font, which may be taller than the
// design's where its font is missing.
QRect ControlBinder::designRect(const ControlDesign& design, const QWidget* widget) const {
    QRect rect(ToPixels(design.left, scale_), ToPixels(design.top, scale_),
               ToPixels(design.width, scale_), ToPixels(design.height, scale_));
    if (qobject_cast<const QLabel*>(widget) != nullptr)
        rect.setHeight(std::max(rect.height(), widget->fontMetrics().height() + 2));
    return rect;
}

void ControlBinder::arrange(QSize designSize, QSize size, const std::string& stretching) {
    int dx = std::max(0, size.width() - designSize.width());
    int dy = std::max(0, size.height() - designSize.height());
    QWidget* grid = widgetFor(stretching);
    QRect anchor = grid != nullptr ? designRect(designs_.at(grid), grid) : QRect();
    for (const auto& [widget, design] : designs_) {
        QRect rect = designRect(design, widget);
        bool spansWidth =
            grid != nullptr && rect.left() <= anchor.left() && rect.right() >= anchor.right();
        bool spansHeight =
            grid != nullptr && rect.top() <= anchor.top() && rect.bottom() >= anchor.bottom();
        if (spansWidth)
            rect.setWidth(rect.width() + dx);
        else
            rect.translate(dx, 0);
        if (spansHeight)
            rect.setHeight(rect.height() + dy);
        else if (grid != nullptr && rect.top() > anchor.center().y())
            rect.translate(0, dy);
        widget->setGeometry(rect);
    }
}

QWidget* ControlBinder::bind(Control& control, const ControlDesign& design, bool editableGrid) {
    QWidget* widget = nullptr;
    switch (control.kind()) {
    case ControlKind::TextBox:
        widget = makeTextBox(static_cast<TextBox&>(control), design);
        break;
    case ControlKind::ComboBox:
    case ControlKind::DriveList:
        widget = makeComboBox(static_cast<ComboBox&>(control), design);
        break;
    case ControlKind::ListBox:
        widget = makeListBox(static_cast<ComboBox&>(control), design);
        break;
    case ControlKind::DirList:
        widget = makeDirList(control);
        break;
    case ControlKind::CheckBox:
        widget = makeCheckBox(static_cast<CheckBox&>(control), design);
        break;
    case ControlKind::Label:
        widget = makeLabel(&control, design);
        break;
    case ControlKind::Button:
        widget = makeButton(control, design);
        break;
    case ControlKind::Shape:
        widget = makeShape(design);
        break;
    case ControlKind::Grid:
        widget = makeGrid(control, editableGrid);
        break;
    }
    place(widget, design);
    if (control.kind() == ControlKind::Shape)
        widget->lower();
    widget->show();
    return widget;
}

QWidget* ControlBinder::widgetFor(const std::string& name) const {
    auto found = widgets_.find(name);
    return found == widgets_.end() ? nullptr : found->second;
}

void ControlBinder::refresh() {
    for (const auto& refresher : refreshers_)
        refresher();
}

// The step may run later (when it comes while the owner is busy), so it holds
// copies of what it needs.
void ControlBinder::user(const std::function<void()>& step) {
    if (events_.run)
        events_.run(step);
    else
        step();
}

// Runs the refresher now, again on every change the model announces, and on
// every refresh; it stops once the binder is gone.
void ControlBinder::follow(Signal<>& changed, std::function<void()> refresher) {
    refresher();
    connections_.push_back(changed.connect([alive = alive_, refresher] {
        if (*alive)
            refresher();
    }));
    refreshers_.push_back(std::move(refresher));
}

QWidget* ControlBinder::makeTextBox(TextBox& box, const ControlDesign& design) {
    auto* edit = new QLineEdit(surface_);
    edit->setAlignment(Qt::AlignRight | Qt::AlignAbsolute | Qt::AlignVCenter);
    if (design.grey) {
        QPalette palette = edit->palette();
        palette.setColor(QPalette::Base, palette.color(QPalette::Button));
        edit->setPalette(palette);
    }
    follow(box.changed, [edit, &box, this] {
        QString text = ToQString(box.Text());
        ++syncing_;
        if (edit->text() != text)
            edit->setText(text);
        // A number reads left to right, its minus sign first, in a box that
        // stays aligned to the right.
        edit->setLayoutDirection(IsPlainNumber(text) ? Qt::LeftToRight : Qt::RightToLeft);
        // A box without the focus shows no selection, so only the focused
        // one stands out.
        if (edit->hasFocus() && box.SelLength() > 0 &&
            (edit->selectionStart() != box.SelStart() ||
             edit->selectedText().size() != box.SelLength()))
            edit->setSelection(box.SelStart(), box.SelLength());
        --syncing_;
    });
    connect(edit, &QLineEdit::textEdited, this, [this, edit, &box](const QString& text) {
        user([&box, text] { box.setText(FromQString(text)); });
        QString stored = ToQString(box.Text());
        if (edit->text() != stored)
            edit->setText(stored);
        selectionToModel(edit, box);
    });
    connect(edit, &QLineEdit::selectionChanged, this,
            [this, edit, &box] { selectionToModel(edit, box); });
    connect(edit, &QLineEdit::cursorPositionChanged, this,
            [this, edit, &box] { selectionToModel(edit, box); });
    watch(edit, design.name);
    return edit;
}

// Each character of the core's code page is one byte there and one unit of
// Qt's strings, so the positions carry over as they are. Only the user's
// selection counts: the box keeps it when the focus leaves, as a button that
// copies the selection needs, while Qt's line edit drops it.
void ControlBinder::selectionToModel(QLineEdit* edit, TextBox& box) {
    if (syncing_ > 0 || !edit->hasFocus() || edit->text() != ToQString(box.Text()))
        return;
    bool selected = edit->hasSelectedText();
    box.setSelStart(selected ? edit->selectionStart() : edit->cursorPosition());
    box.setSelLength(selected ? static_cast<int32_t>(edit->selectedText().size()) : 0);
}

QWidget* ControlBinder::makeComboBox(ComboBox& list, const ControlDesign& design) {
    auto* combo = new QComboBox(surface_);
    combo->setEditable(false);
    follow(list.changed, [combo, &list, this] {
        ++syncing_;
        QStringList entries;
        for (int32_t i = 0; i < list.ListCount(); ++i)
            entries.push_back(ToQString(list.List(i)));
        QStringList shown;
        for (int i = 0; i < combo->count(); ++i)
            shown.push_back(combo->itemText(i));
        if (shown != entries) {
            combo->clear();
            combo->addItems(entries);
        }
        combo->setCurrentIndex(list.ListIndex());
        --syncing_;
    });
    connect(combo, &QComboBox::currentIndexChanged, this, [this, combo, &list](int index) {
        if (syncing_ > 0)
            return;
        user([&list, index] { list.setListIndex(index); });
        if (combo->currentIndex() != list.ListIndex()) {
            ++syncing_;
            combo->setCurrentIndex(list.ListIndex());
            --syncing_;
        }
    });
    watch(combo, design.name);
    return combo;
}

QWidget* ControlBinder::makeListBox(ComboBox& list, const ControlDesign& design) {
    auto* view = new QListWidget(surface_);
    auto* box = dynamic_cast<ListBox*>(&list);
    follow(list.changed, [view, &list, box, this] {
        ++syncing_;
        QStringList entries;
        for (int32_t i = 0; i < list.ListCount(); ++i)
            entries.push_back(ToQString(list.List(i)));
        if (view->count() != entries.size() ||
            std::any_of(entries.begin(), entries.end(), [&, i = 0](const QString& e) mutable {
                return view->item(i++)->text() != e;
            })) {
            view->clear();
            view->addItems(entries);
        }
        view->setCurrentRow(list.ListIndex());
        if (box != nullptr)
            view->setEnabled(box->Enabled());
        --syncing_;
    });
    connect(view, &QListWidget::currentRowChanged, this, [this, &list](int row) {
        if (syncing_ == 0)
            user([&list, row] { list.setListIndex(row); });
    });
    std::string name = design.name;
    connect(view, &QListWidget::itemDoubleClicked, this, [this, name] {
        if (events_.dblClick)
            user([this, name] { events_.dblClick(name); });
    });
    return view;
}

// The directory tree shows the file system's directories; the model's path
// is the core's text of the chosen directory.
QWidget* ControlBinder::makeDirList(Control& control) {
    auto& tree = static_cast<DirListBox&>(control);
    auto* view = new QTreeView(surface_);
    auto* files = new QFileSystemModel(view);
    files->setFilter(QDir::AllDirs | QDir::NoDotAndDotDot | QDir::Drives);
    files->setRootPath(QStringLiteral("/"));
    view->setModel(files);
    for (int column = 1; column < files->columnCount(); ++column)
        view->hideColumn(column);
    view->setHeaderHidden(true);
    follow(tree.changed, [view, files, &tree, this] {
        const std::string native = ResolvePath(PathFromCp1255(tree.Path())).native();
        QModelIndex index = files->index(QFile::decodeName(QByteArray::fromStdString(native)));
        if (!index.isValid() || index == view->currentIndex())
            return;
        ++syncing_;
        view->setCurrentIndex(index);
        view->scrollTo(index);
        --syncing_;
    });
    connect(
        view->selectionModel(), &QItemSelectionModel::currentChanged, this,
        [this, files, &tree](const QModelIndex& current) {
            if (syncing_ == 0 && current.isValid())
                user([&tree, path = files->filePath(current)] { tree.setPath(FromQString(path)); });
        });
    return view;
}

QWidget* ControlBinder::makeCheckBox(CheckBox& check, const ControlDesign& design) {
    auto* box = new QCheckBox(ToQString(design.caption), surface_);
    follow(check.changed, [box, &check] {
        box->setTristate(check.Value() == 2);
        box->setCheckState(check.Value() == 1   ? Qt::Checked
                           : check.Value() == 2 ? Qt::PartiallyChecked
                                                : Qt::Unchecked);
    });
    connect(box, &QCheckBox::clicked, this, [this, box, &check] {
        int32_t value = box->checkState() == Qt::Checked            ? 1
                        : box->checkState() == Qt::PartiallyChecked ? 2
                                                                    : 0;
        user([&check, value] { check.setValue(value); });
    });
    follow(check.captionChanged, [box, &check] { box->setText(ToQString(check.Caption())); });
    watch(box, design.name);
    return box;
}

QWidget* ControlBinder::draw(const ControlDesign& design) {
    QWidget* widget =
        design.kind == ControlKind::Shape ? makeShape(design) : makeLabel(nullptr, design);
    place(widget, design);
    if (design.kind == ControlKind::Shape)
        widget->lower();
    widget->show();
    return widget;
}

// A label with a model shows its caption and passes on its clicks; one
// without shows the designed caption only.
QWidget* ControlBinder::makeLabel(Control* label, const ControlDesign& design) {
    auto* text =
        new QLabel(ToQString(label != nullptr ? label->Caption() : design.caption), surface_);
    // A caption keeps close to the field it names, which stands to its left.
    Qt::Alignment side = design.labelFor.empty() ? Qt::AlignRight : Qt::AlignLeft;
    text->setAlignment(side | Qt::AlignAbsolute | Qt::AlignVCenter);
    if (design.bold) {
        QFont font = text->font();
        font.setBold(true);
        text->setFont(font);
    }
    if (design.foreColor != 0) {
        QPalette palette = text->palette();
        palette.setColor(QPalette::WindowText, ColorOf(design.foreColor));
        text->setPalette(palette);
    }
    if (label != nullptr) {
        // A caption set while a handler runs (a "please wait" line) is shown
        // at once, before the handler's long work.
        auto show = [text, label] { text->setText(ToQString(label->Caption())); };
        follow(label->captionChanged, show);
        connections_.push_back(label->captionChanged.connect([alive = alive_, text] {
            if (*alive && text->isVisible())
                text->repaint();
        }));
        text->installEventFilter(this);
    }
    return text;
}

QWidget* ControlBinder::makeButton(Control& button, const ControlDesign& design) {
    auto* tool = new QToolButton(surface_);
    tool->setText(ToQString(button.Caption()));
    // A button takes the focus when pressed, so the field the user leaves
    // hears of it before the click; a bare picture does not.
    bool image = button.Caption().empty() && !design.picture.empty();
    tool->setFocusPolicy(image ? Qt::NoFocus : Qt::StrongFocus);
    QStyle::StandardPixmap picture = PictureOf(design.picture);
    if (picture != QStyle::SP_CustomBase) {
        tool->setIcon(surface_->style()->standardIcon(picture));
        int height = ToPixels(design.height, scale_);
        int iconSize = button.Caption().empty() ? height - 8 : std::max(8, height - 26);
        tool->setIconSize(QSize(iconSize, iconSize));
        tool->setToolButtonStyle(button.Caption().empty() ? Qt::ToolButtonIconOnly
                                                          : Qt::ToolButtonTextUnderIcon);
    }
    std::string name = design.name;
    connect(tool, &QToolButton::clicked, this,
            [this, name] { user([this, name] { events_.click(name); }); });
    follow(button.captionChanged, [tool, &button] { tool->setText(ToQString(button.Caption())); });
    return tool;
}

QWidget* ControlBinder::makeShape(const ControlDesign&) {
    auto* frame = new QFrame(surface_);
    frame->setFrameShape(QFrame::Box);
    frame->setFrameShadow(QFrame::Plain);
    frame->setAttribute(Qt::WA_TransparentForMouseEvents);
    return frame;
}

QWidget* ControlBinder::makeGrid(Control& control, bool editable) {
    auto& grid = static_cast<Grid&>(control);
    // The lines grid fits its columns to its width; an editable grid keeps
    // the widths its headings ask for.
    auto* view = new GridView(!editable, surface_);
    auto* model = new GridModel(grid, editable, view);
    view->setModel(model);
    view->verticalHeader()->hide();
    view->setSelectionBehavior(QAbstractItemView::SelectRows);
    view->setSelectionMode(QAbstractItemView::SingleSelection);
    view->setEditTriggers(editable ? QAbstractItemView::AllEditTriggers
                                   : QAbstractItemView::NoEditTriggers);
    view->verticalHeader()->setDefaultSectionSize(view->fontMetrics().height() + 4);
    auto sizeColumns = [view, &grid] {
        int charWidth = view->fontMetrics().averageCharWidth();
        std::vector<int> widths;
        for (int32_t col = 0; col < grid.Cols(); ++col)
            widths.push_back(std::max(24, (grid.ColWidthChars(col) + 1) * charWidth));
        view->setDesignWidths(std::move(widths));
    };
    sizeColumns();
    connect(model, &QAbstractItemModel::modelReset, view, sizeColumns);
    connect(view->selectionModel(), &QItemSelectionModel::currentChanged, this,
            [model, &grid](const QModelIndex& current) {
                if (current.isValid())
                    grid.setRow(model->gridRow(current.row()));
            });
    return view;
}

void ControlBinder::watch(QWidget* widget, const std::string& name) {
    names_[widget] = name;
    widget->installEventFilter(this);
}

// Labels have no click signal, and lists tell no loss of focus: both come
// from the widgets' events. As on the system the control comes from, the first
// press of a double click is a click; the release of the second is not.
bool ControlBinder::eventFilter(QObject* watched, QEvent* event) {
    auto named = names_.find(watched);
    if (named == names_.end())
        return false;
    std::string name = named->second;
    switch (event->type()) {
    case QEvent::MouseButtonPress:
        doubleClicked_ = nullptr;
        break;
    case QEvent::MouseButtonRelease:
        if (qobject_cast<QLabel*>(watched) == nullptr ||
            static_cast<QMouseEvent*>(event)->button() != Qt::LeftButton)
            break;
        if (doubleClicked_ == watched)
            doubleClicked_ = nullptr;
        else if (events_.click)
            user([this, name] { events_.click(name); });
        break;
    case QEvent::MouseButtonDblClick:
        if (qobject_cast<QLabel*>(watched) == nullptr || !events_.dblClick)
            break;
        doubleClicked_ = watched;
        user([this, name] { events_.dblClick(name); });
        break;
    case QEvent::FocusOut: {
        auto reason = static_cast<QFocusEvent*>(event)->reason();
        if (reason != Qt::PopupFocusReason && reason != Qt::ActiveWindowFocusReason &&
            events_.lostFocus)
            user([this, name] { events_.lostFocus(name); });
        break;
    }
    default:
        break;
    }
    return false;
}

} // namespace dovrel
