#pragma once

#include "control/Surface.h"
#include "platform/Controls.h"

#include <QObject>
#include <QRect>
#include <QSize>

#include <functional>
#include <map>
#include <memory>
#include <string>
#include <vector>

class QLineEdit;
class QWidget;

namespace dovrel {

// Where the user's events on a bound surface go: the owner's event
// dispatch, and the owner's way of running a step for the user (holding
// input, reporting failures).
struct SurfaceEvents {
    std::function<void(const std::string& name)> click;
    std::function<void(const std::string& name)> dblClick;
    std::function<void(const std::string& name)> lostFocus;
    std::function<void(const std::function<void()>& step)> run;
};

// Binds a real widget to each control model of a surface, laid out from its
// design in twips: text boxes, drop-down lists, check boxes, labels, buttons,
// frames and grids. A model change updates its widget; what the user does in
// a widget goes to the model or, as an event, to the owner. The binder adds
// no behaviour of its own.
class ControlBinder : public QObject {
    Q_OBJECT

public:
    ControlBinder(QWidget* surface, SurfaceEvents events, QObject* parent = nullptr);
    ~ControlBinder() override;

    // Pixels per twip on the surface's screen (1/15 at 96 dots per inch).
    static double Scale(const QWidget* widget);
    static int ToPixels(int32_t twips, double scale);

    // Makes and places the widget of one control; grids may be editable.
    QWidget* bind(Control& control, const ControlDesign& design, bool editableGrid = false);
    // Draws a label or frame that has no model, as designed.
    QWidget* draw(const ControlDesign& design);
    // Places a widget made elsewhere for a control of the surface.
    void place(QWidget* widget, const ControlDesign& design);

    QWidget* widgetFor(const std::string& name) const;
    // Shows every model's state again (lists whose entries changed without
    // a notice, captions set directly).
    void refresh();

    // Lays the placed widgets out on a surface of the given size, at least
    // the design's: anchored to the right, the stretching widget (the grid)
    // taking the extra width and height; what lies below its middle moves
    // down, what spans it grows with it.
    void arrange(QSize designSize, QSize size, const std::string& stretching);

protected:
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    QWidget* makeTextBox(TextBox& box, const ControlDesign& design);
    void selectionToModel(QLineEdit* edit, TextBox& box);
    QWidget* makeComboBox(ComboBox& list, const ControlDesign& design);
    QWidget* makeCheckBox(CheckBox& check, const ControlDesign& design);
    QWidget* makeLabel(Control* label, const ControlDesign& design);
    QWidget* makeButton(Control& button, const ControlDesign& design);
    QWidget* makeListBox(ComboBox& list, const ControlDesign& design);
    QWidget* makeDirList(Control& tree);
    QWidget* makeShape(const ControlDesign& design);
    QWidget* makeGrid(Control& grid, bool editable);
    void watch(QWidget* widget, const std::string& name);
    void follow(Signal<>& changed, std::function<void()> refresher);
    void user(const std::function<void()>& step);
    QRect designRect(const ControlDesign& design, const QWidget* widget) const;

    QWidget* surface_;
    SurfaceEvents events_;
    double scale_;
    std::shared_ptr<bool> alive_; // false once the binder is gone
    std::map<std::string, QWidget*> widgets_;
    std::map<QWidget*, ControlDesign> designs_;
    std::map<const QObject*, std::string> names_;
    std::vector<std::function<void()>> refreshers_;
    std::vector<Connection> connections_; // to the models, dropped with the binder
    const QObject* doubleClicked_ = nullptr;
    int syncing_ = 0;
};

} // namespace dovrel
