#include "app/qt/FormDialog.h"

#include "app/qt/CardWidget.h"
#include "app/qt/QtText.h"
#include "forms/FormDesigns.h"
#include "pictures/ItemPicsDesign.h"
#include "platform/Encoding.h"

#include <QCloseEvent>

namespace dovrel {

namespace {

// A control that has no design gets a place of its own under the others.
FormLayout StackedLayout(const Form& form) {
    FormLayout layout;
    layout.caption = form.name();
    layout.width = 6000;
    int32_t top = 120;
    for (const Control* control : form.controls()) {
        ControlDesign design;
        design.name = control->name();
        design.kind = control->kind();
        design.caption = control->Caption();
        design.left = 120;
        design.top = top;
        design.width = layout.width - 240;
        bool tall = control->kind() == ControlKind::Grid ||
                    control->kind() == ControlKind::ListBox ||
                    control->kind() == ControlKind::DirList;
        design.height = tall ? 1800 : 315;
        top += design.height + 60;
        layout.controls.push_back(design);
    }
    layout.height = top + 60;
    return layout;
}

} // namespace

FormLayout FormDialog::LayoutOf(const Form& form) {
    if (form.name() == "frmItemPics")
        return {FromUtf8(Utf8(kItemPicsCaptionUtf8)), kItemPicsDesignWidth, kItemPicsDesignHeight,
                ItemPicsDesign()};
    if (form.name() == "frmOpenDir")
        return {FromUtf8(Utf8(kOpenDirCaptionUtf8)), kOpenDirWidth, kOpenDirHeight,
                OpenDirDesign()};
    if (form.name() == "frmAccDetails")
        return {FromUtf8(Utf8(kAccDetailsCaptionUtf8)), kAccDetailsWidth, kAccDetailsHeight,
                AccDetailsDesign()};
    return StackedLayout(form);
}

FormDialog::FormDialog(Form& form, const FormLayout& layout, Messages& messages, QWidget* parent)
    : QDialog(parent), form_(form), messages_(messages) {
    setObjectName(QString::fromStdString(form.name()));
    setLayoutDirection(Qt::RightToLeft);
    setFont(CardWidget::SurfaceFont());
    setWindowTitle(ToQString(layout.caption));
    SurfaceEvents events;
    events.click = [this](const std::string& name) { form_.Click(name); };
    events.dblClick = [this](const std::string& name) { form_.DblClick(name); };
    events.run = [this](const std::function<void()>& step) { run(step); };
    binder_ = new ControlBinder(this, std::move(events), this);
    for (const ControlDesign& design : layout.controls) {
        if (Control* control = form.findControl(design.name)) {
            binder_->bind(*control, design, true);
        } else if (design.kind == ControlKind::Label || design.kind == ControlKind::Shape) {
            binder_->draw(design);
        }
    }
    double scale = ControlBinder::Scale(this);
    setFixedSize(ControlBinder::ToPixels(layout.width, scale),
                 ControlBinder::ToPixels(layout.height, scale));
}

// A failure the form's handlers do not report themselves is shown, and the
// dialog stays.
void FormDialog::run(const std::function<void()>& step) {
    try {
        step();
    } catch (const std::exception& failure) {
        ShowFailure(messages_, Utf8("תקלה"), failure);
    }
    binder_->refresh();
    closeIfHidden();
}

void FormDialog::closeIfHidden() {
    if (!form_.Visible() && isVisible())
        done(QDialog::Accepted);
}

void FormDialog::reject() {
    run([this] { form_.QueryClose(); });
    if (!form_.Visible())
        QDialog::reject();
}

void FormDialog::closeEvent(QCloseEvent* event) {
    run([this] { form_.QueryClose(); });
    if (form_.Visible())
        event->ignore();
    else
        event->accept();
}

} // namespace dovrel
