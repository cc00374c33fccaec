#include "QtHost.h"

#include "control/CardInterface.h"
#include "control/Surface.h"
#include "platform/Error.h"

#include <QFileInfo>

#include <QCheckBox>
#include <QComboBox>
#include <QFrame>
#include <QHeaderView>
#include <QLabel>
#include <QLineEdit>
#include <QTableView>

#include <map>

namespace dovrel::test {
namespace {

using json = nlohmann::json;

constexpr int kDeliveryRow = 13; // type 20, ISHP.FIX

class CardWidgetTest : public QtHost {
protected:
    void writeCompany() {
        company = std::make_unique<TestCompany>(json{
            {"documents",
             {Doc(20, "101", "כהן שיפוצים", {Line("A100", "ברגים"), Line("B200", "פטיש")}),
              Doc(20, "102", "לוי בנייה", {Line("C300", "מסור")}),
              Doc(20, "103", "כהן שיפוצים")}}}.dump());
    }
    // The company path typed into its box and the delivery notes chosen, as
    // a user would.
    void openCompany() {
        writeCompany();
        retype(find<QLineEdit>("txtCompPath"), QString::fromStdString(company->path().string()));
        find<QComboBox>("cmbDocType")->setCurrentIndex(kDeliveryRow);
    }
    QString text(const std::string& name) { return find<QLineEdit>(name)->text(); }

    std::unique_ptr<TestCompany> company;
};

TEST_F(CardWidgetTest, EveryControlHasAWidgetWhereItIsDesignedThatFollowsItsModel) {
    double scale = ControlBinder::Scale(widget.get());
    std::map<ControlKind, const char*> classes = {
        {ControlKind::TextBox, "QLineEdit"},  {ControlKind::ComboBox, "QComboBox"},
        {ControlKind::CheckBox, "QCheckBox"}, {ControlKind::Label, "QLabel"},
        {ControlKind::Button, "QToolButton"}, {ControlKind::Grid, "QTableView"},
        {ControlKind::Shape, "QFrame"}};
    for (const ControlDesign& design : CardSurface()) {
        if (design.name == "ProgressFill")
            continue;
        QWidget* shown = widget->widgetFor(design.name);
        ASSERT_NE(shown, nullptr) << design.name;
        EXPECT_EQ(shown->geometry(), QRect(ControlBinder::ToPixels(design.left, scale),
                                           ControlBinder::ToPixels(design.top, scale),
                                           ControlBinder::ToPixels(design.width, scale),
                                           ControlBinder::ToPixels(design.height, scale)))
            << design.name;
        EXPECT_EQ(shown->layoutDirection(), Qt::RightToLeft) << design.name;
        if (design.name != "ProgressFrame") {
            EXPECT_TRUE(shown->inherits(classes.at(design.kind))) << design.name;
        }
        if (!design.labelFor.empty()) { // a caption stands to the right of its field
            EXPECT_GE(shown->x(), widget->widgetFor(design.labelFor)->geometry().right())
                << design.name;
        }
    }
    EXPECT_EQ(widget->size(), QSize(ControlBinder::ToPixels(kCardDesignWidth, scale),
                                    ControlBinder::ToPixels(kCardDesignHeight, scale)));
    // A caption's quotation mark and a list's Hebrew entries reach the widgets as they read.
    EXPECT_EQ(find<QLabel>("lblItemKey")->text(), Q(":חיפוש מק\"ט"));
    EXPECT_EQ(find<QComboBox>("CmbDocLang")->itemText(2), Q("עברית ללא סכומים"));
    // The grey boxes have the button face behind their text.
    QLineEdit* date = find<QLineEdit>("txtDate");
    EXPECT_EQ(date->palette().color(QPalette::Base), date->palette().color(QPalette::Button));
    // A first start: the settings' defaults and no document.
    EXPECT_EQ(text("txtCompPath"), "c:\\comp02");
    EXPECT_EQ(find<QComboBox>("cmbDocType")->currentIndex(), card().cmbDocType.ListIndex());
    EXPECT_EQ(text("txtFromDate"), "01/01/1980");
    EXPECT_EQ(text("txtReference1"), "");

    // A fresh grid: the heading of eight columns and one empty row.
    auto* lines = find<QTableView>("DocLines");
    ASSERT_EQ(lines->model()->columnCount(), 8);
    EXPECT_EQ(lines->model()->rowCount(), 1);
    EXPECT_EQ(lines->model()->headerData(0, Qt::Horizontal).toString(), Q("שורה"));
    EXPECT_EQ(lines->model()->headerData(7, Qt::Horizontal).toString().trimmed(), Q("סהכ שח"));
    EXPECT_GT(lines->columnWidth(2), lines->columnWidth(0)); // "תאור" has 70 spaces

    // The model's changes reach their widgets.
    card().txtTitle.setText(W("כותרת חדשה"));
    EXPECT_EQ(text("txtTitle"), Q("כותרת חדשה"));
    card().ChkWithDrawing.setValue(1);
    EXPECT_EQ(find<QCheckBox>("ChkWithDrawing")->checkState(), Qt::Checked);
    card().chkLineDisc.setValue(2);
    EXPECT_EQ(find<QCheckBox>("chkLineDisc")->checkState(), Qt::PartiallyChecked);
    card().cmbRules.setListIndex(2);
    EXPECT_EQ(find<QComboBox>("cmbRules")->currentIndex(), 2);
    card().DocLines.AddItem("1\tA", 1);
    EXPECT_EQ(lines->model()->rowCount(), 2);

    // And the user's changes reach the models.
    card().ChkShowDetails.setValue(0);
    QTest::mouseClick(find<QCheckBox>("ChkShowDetails"), Qt::LeftButton);
    EXPECT_EQ(card().ChkShowDetails.Value(), 1);
    find<QComboBox>("CmbDocLang")->setCurrentIndex(1);
    EXPECT_EQ(card().CmbDocLang.ListIndex(), 1);

    // Leaving the language list on English puts the English title into the
    // title box, replacing what was typed.
    find<QComboBox>("cmbDocType")->setCurrentIndex(kDeliveryRow);
    find("CmbDocLang")->setFocus();
    find("txtTitle")->setFocus();
    EXPECT_EQ(text("txtTitle"), "Delivery Note");
}

TEST_F(CardWidgetTest, ClicksRunTheHandlersTheBoxesShowTheDocumentAndPrintOpensIt) {
    openCompany();
    EXPECT_EQ(card().cmbDocType.ListIndex(), kDeliveryRow);

    click("FirstButt");
    EXPECT_EQ(text("txtReference1").trimmed(), "101");
    EXPECT_EQ(text("txtCustomerName").trimmed(), Q("כהן שיפוצים"));
    auto* lines = find<QTableView>("DocLines");
    ASSERT_EQ(lines->model()->rowCount(), 3);
    EXPECT_EQ(lines->model()->index(1, 1).data().toString().trimmed(), "B200");
    EXPECT_EQ(lines->model()->index(1, 2).data().toString().trimmed(), Q("פטיש"));
    EXPECT_EQ(lines->model()->index(2, 1).data().toString(), "");
    click("PrintButt"); // the browser is asked to open the page
    ASSERT_EQ(opened.size(), 1u) << (boxes.empty() ? "" : boxes[0].text.toStdString());
    EXPECT_TRUE(QFileInfo::exists(opened[0].toLocalFile()));

    click("LastButt"); // a document without lines empties the grid
    EXPECT_EQ(text("txtReference1").trimmed(), "103");
    EXPECT_EQ(lines->model()->rowCount(), 1);

    // A double click on the name's label searches by the name typed.
    retype(find<QLineEdit>("txtCustomerName"), Q("כהן שיפוצים"));
    doubleClick("Label2");
    EXPECT_EQ(text("txtReference1").trimmed(), "101");
    click("NextButt");
    EXPECT_EQ(text("txtReference1").trimmed(), "103");

    // Leaving the document-type list for a button resets the position and
    // the search before the button's click: "Next" starts afresh.
    find("cmbDocType")->setFocus();
    click("NextButt");
    EXPECT_EQ(card().PubSearchBy, "");
    EXPECT_EQ(text("txtReference1").trimmed(), "102");

    // A single click on the details label searches.
    retype(find<QLineEdit>("txtDetails"), "zzz");
    click("lblDetails");
    EXPECT_EQ(card().PubSearchBy, "Details");
    EXPECT_EQ(text("txtReference1"), "");
    EXPECT_TRUE(boxes.empty());
}

TEST_F(CardWidgetTest, MessageBoxesCarryTheExactTitleTextIconAndButtons) {
    TempDir empty;
    retype(find<QLineEdit>("txtCompPath"), QString::fromStdString(empty.str()));
    click("FirstButt");
    ASSERT_EQ(boxes.size(), 1u);
    EXPECT_EQ(boxes[0].title, Q("שגיאה"));
    EXPECT_EQ(boxes[0].text, Q("קבצי מסמכים לא נמצאו"));
    EXPECT_EQ(boxes[0].icon, QMessageBox::Critical);
    EXPECT_EQ(boxes[0].buttons, QMessageBox::StandardButtons(QMessageBox::Ok));
    EXPECT_EQ(boxes[0].direction, Qt::RightToLeft);

    // A question is answered by the test.
    for (auto [button, expected] :
         {std::pair{QMessageBox::Yes, MsgAnswer::Yes}, {QMessageBox::No, MsgAnswer::No}}) {
        answer = button;
        EXPECT_EQ(messages.show(MsgIcon::Question, MsgButtons::YesNo, Utf8("שימו לב"),
                                Utf8("האם למחוק?")),
                  expected);
    }
    ASSERT_EQ(boxes.size(), 3u);
    EXPECT_EQ(boxes[2].title, Q("שימו לב"));
    EXPECT_EQ(boxes[2].icon, QMessageBox::Question);
    EXPECT_EQ(boxes[2].buttons, QMessageBox::Yes | QMessageBox::No);

    // A failure's description is UTF-8 and reads as written, whatever the
    // letters of the path: Cyrillic has no place in the control's code page.
    widget->runForUser([] { throw Error("Cannot open /tmp/Документы/משה/ISHP.FIX"); });
    ASSERT_EQ(boxes.size(), 4u);
    EXPECT_EQ(boxes[3].title, Q("תקלה"));
    EXPECT_EQ(boxes[3].text, Q("Cannot open /tmp/Документы/משה/ISHP.FIX"));
}

TEST_F(CardWidgetTest, MembersCanBeCalledByName) {
    writeCompany();
    // Every member by its name, with the Qt kind of each argument and result.
    using T = CardInterface::Type;
    const std::map<T, int> kinds = {
        {T::Int16, QMetaType::Short},  {T::Int32, QMetaType::Int},
        {T::Byte, QMetaType::UChar},   {T::Boolean, QMetaType::Bool},
        {T::Text, QMetaType::QString}, {T::Variant, QMetaType::QVariant},
        {T::None, QMetaType::Void}};
    auto kind = [&](T type) { return kinds.at(type); };
    const QMetaObject* meta = object->metaObject();
    for (const CardInterface::Member& member : CardInterface::Members()) {
        if (member.isProperty) {
            int index = meta->indexOfProperty(member.name);
            ASSERT_GE(index, 0) << member.name;
            EXPECT_EQ(meta->property(index).typeId(), kind(member.type)) << member.name;
            continue;
        }
        int found = -1;
        for (int i = meta->methodOffset(); i < meta->methodCount(); ++i)
            if (meta->method(i).name() == member.name)
                found = i;
        ASSERT_GE(found, 0) << member.name;
        QMetaMethod method = meta->method(found);
        EXPECT_EQ(method.returnType(), kind(member.type)) << member.name;
        ASSERT_EQ(method.parameterCount(), static_cast<int>(member.params.size())) << member.name;
        for (int p = 0; p < method.parameterCount(); ++p) {
            const CardInterface::Param& param = member.params[static_cast<size_t>(p)];
            EXPECT_EQ(method.parameterNames()[p], param.name) << member.name;
            EXPECT_EQ(method.parameterType(p), kind(param.type))
                << member.name << " " << param.name;
        }
    }

    int result = -1;
    QString compPath = QString::fromStdString(company->path().string());
    ASSERT_TRUE(QMetaObject::invokeMethod(object.get(), "ShowDoc", Q_RETURN_ARG(int, result),
                                          Q_ARG(QString, compPath), Q_ARG(short, 20),
                                          Q_ARG(int, 5)));
    EXPECT_EQ(result, 0);
    EXPECT_EQ(text("txtReference1").trimmed(), "102");
    EXPECT_EQ(object->property("ACTLocation").toInt(), card().PubACTLocation);
    EXPECT_EQ(object->property("SetCompDir").toString(), compPath);

    EXPECT_TRUE(object->setProperty("ACTLocation", 10.5));
    EXPECT_EQ(object->property("PubACTLocation").toInt(), 10);
    EXPECT_TRUE(object->setProperty("SetAccountKey", Q("אבג")));
    EXPECT_EQ(text("txtAccountKey"), Q("אבג"));
    EXPECT_TRUE(object->property("lastError").toString().isEmpty());

    // A failure is the call's error, not the end of the program.
    object->setProperty("ACTLocation", Q("not a number"));
    EXPECT_FALSE(object->lastError().isEmpty());
    EXPECT_EQ(card().PubACTLocation, 10);
    QString rules;
    QMetaObject::invokeMethod(object.get(), "RulesValue", Q_RETURN_ARG(QString, rules));
    EXPECT_TRUE(object->lastError().isEmpty());
}

} // namespace
} // namespace dovrel::test
