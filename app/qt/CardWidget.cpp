#include "app/qt/CardWidget.h"

#include "app/qt/QtText.h"
#include "platform/Encoding.h"
#include "platform/Error.h"

#include <QFontDatabase>

#include <exception>

namespace dovrel {

CardWidget::CardWidget(const CardServices& services, ModuleState& shared, QWidget* parent)
    : QWidget(parent), card_(std::make_unique<Card>(services, shared)) {
    setLayoutDirection(Qt::RightToLeft);
    setFont(SurfaceFont());
    setAutoFillBackground(true);
    bindSurface();
}

// The binder goes first, so no event of a closing widget reaches the control,
// then the widgets, which show the control's models to the last.
CardWidget::~CardWidget() {
    delete binder_;
    const QObjectList children = this->children();
    qDeleteAll(children);
}

QFont CardWidget::SurfaceFont() {
    QStringList families = QFontDatabase::families();
    QFont font(QString::fromLatin1(kCardFont));
    if (!families.contains(font.family())) {
        // Arial's own metrics, or a narrower cut of a wider font, so the
        // captions fit the places designed for them.
        for (const char* fallback : {"Liberation Sans", "Noto Sans Hebrew", "DejaVu Sans"})
            if (families.contains(QString::fromLatin1(fallback))) {
                font.setFamily(QString::fromLatin1(fallback));
                break;
            }
        if (font.family() == QLatin1String("DejaVu Sans"))
            font.setStretch(QFont::SemiCondensed);
    }
    font.setPointSize(8);
    return font;
}

QSize CardWidget::sizeHint() const {
    double scale = ControlBinder::Scale(this);
    return QSize(ControlBinder::ToPixels(kCardDesignWidth, scale),
                 ControlBinder::ToPixels(kCardDesignHeight, scale));
}

void CardWidget::resizeEvent(QResizeEvent* event) {
    QWidget::resizeEvent(event);
    binder_->arrange(sizeHint(), size(), "DocLines");
}

void CardWidget::bindSurface() {
    SurfaceEvents events;
    events.click = [this](const std::string& name) { card_->Click(name); };
    events.dblClick = [this](const std::string& name) { card_->DblClick(name); };
    events.lostFocus = [this](const std::string& name) { card_->LostFocus(name); };
    events.run = [this](const std::function<void()>& step) { runForUser(step); };
    binder_ = new ControlBinder(this, std::move(events), this);
    for (const ControlDesign& design : CardSurface()) {
        Control* control = card_->findControl(design.name);
        if (control == nullptr || design.name == "ProgressFill")
            continue;
        if (design.name == "ProgressFrame") {
            progress_ = new ProgressWidget(card_->ProgressFrame, card_->ProgressFill, this);
            binder_->place(progress_, design);
            continue;
        }
        binder_->bind(*control, design);
    }
    setMinimumSize(sizeHint());
    resize(sizeHint());
}

void CardWidget::call(const std::function<void()>& step) {
    if (depth_ > 0)
        throw Error("The control is busy: a call cannot start while another one runs");
    InputHoldScope hold(hold_);
    std::exception_ptr failure;
    try {
        runStep(step);
    } catch (...) {
        failure = std::current_exception();
    }
    runWaitingSteps();
    if (failure)
        std::rethrow_exception(failure);
}

void CardWidget::runStep(const std::function<void()>& step) {
    ++depth_;
    progress_->setScanning(true);
    struct Done {
        CardWidget& widget;
        ~Done() {
            --widget.depth_;
            widget.progress_->setScanning(false);
            widget.binder_->refresh();
        }
    } done{*this};
    step();
}

// Steps for the user that came up while a call ran (a list that lost the
// focus to a button pressed during a scan) run after it, in their order, and
// before the held input is delivered.
void CardWidget::runWaitingSteps() {
    while (!waiting_.empty()) {
        std::function<void()> next = std::move(waiting_.front());
        waiting_.erase(waiting_.begin());
        try {
            runStep(next);
        } catch (const std::exception& failure) {
            reportFailure(failure);
        }
    }
}

void CardWidget::runForUser(const std::function<void()>& step) {
    if (depth_ > 0) {
        waiting_.push_back(step);
        return;
    }
    try {
        call(step);
    } catch (const std::exception& failure) {
        reportFailure(failure);
    }
}

void CardWidget::reportFailure(const std::exception& failure) {
    ShowFailure(card_->services().messages, Utf8("תקלה"), failure);
}

} // namespace dovrel
