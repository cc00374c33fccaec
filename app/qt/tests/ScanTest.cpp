#include "QtHost.h"

#include <QElapsedTimer>
#include <QLineEdit>
#include <QThread>

namespace dovrel::test {
namespace {

using json = nlohmann::json;

// A long scan: thousands of filler records before the one delivery note.
class ScanTest : public QtHost {
protected:
    static constexpr int kFillers = 60000;

    void SetUp() override {
        QtHost::SetUp();
        company = std::make_unique<TestCompany>(json{
            {"documents",
             {Doc(20, "1", "ראשון"), Filler("ISHP.FIX", kFillers),
              Doc(20, "2", "אחרון")}}}.dump());
        card().txtCompPath.setText(company->compPath());
        card().cmbDocType.setListIndex(13);
    }
    QString reference() {
        return qobject_cast<QLineEdit*>(widget->widgetFor("txtReference1"))->text().trimmed();
    }

    std::unique_ptr<TestCompany> company;
};

TEST_F(ScanTest, TheProgressBarRepaintsAtMostThirtyTimesASecond) {
    click("FirstButt");
    // Every move of the fill takes a little time, as on a slow disk, so the
    // scan lasts long enough for several repaints.
    int moves = 0;
    Connection watching = card().ProgressFill.changed.connect([&] {
        ++moves;
        QThread::usleep(100);
    });
    int before = widget->progress()->paintCount();
    QElapsedTimer timer;
    timer.start();
    click("NextButt");
    qint64 elapsed = timer.elapsed();
    int paints = widget->progress()->paintCount() - before;
    EXPECT_EQ(reference(), "2");
    EXPECT_GT(moves, 100);
    EXPECT_GE(paints, 2); // the bar moved on screen during the scan
    EXPECT_LE(paints, 1 + elapsed * ProgressWidget::kMaxRepaintsPerSecond / 1000)
        << paints << " repaints in " << elapsed << " ms";
    EXPECT_LT(paints, moves);
    EXPECT_EQ(card().ProgressFill.Width(), 0);
}

TEST_F(ScanTest, InputDuringAScanWaitsUntilItEnds) {
    click("FirstButt");
    ASSERT_EQ(reference(), "1");
    bool clicked = false;
    int32_t positionAtClick = 0;
    Connection watching = card().ProgressFill.changed.connect([&] {
        if (clicked || card().ProgressFill.Width() == 0)
            return;
        clicked = true;
        positionAtClick = card().PubACTLocation;
        // The user presses "First" while "Next" scans.
        QTest::mouseClick(widget->widgetFor("FirstButt"), Qt::LeftButton);
        EXPECT_EQ(widget->inputHold().heldCount(), 2); // press and release
        QCoreApplication::processEvents();
        EXPECT_EQ(widget->inputHold().heldCount(), 2);
    });
    click("NextButt");
    ASSERT_TRUE(clicked);
    EXPECT_GT(card().PubACTLocation, positionAtClick);
    EXPECT_EQ(reference(), "2"); // the scan ran to its end undisturbed
    EXPECT_EQ(widget->inputHold().heldCount(), 0);
    QCoreApplication::processEvents();
    EXPECT_EQ(reference(), "1"); // and then the click was delivered
    EXPECT_TRUE(boxes.empty());
}

TEST_F(ScanTest, AListLeftDuringAScanHearsOfItAfterTheScan) {
    click("FirstButt");
    find("cmbDocType")->setFocus();
    ASSERT_TRUE(find("cmbDocType")->hasFocus());
    card().PubSearchBy = "CustomerName";
    card().PubSearchValue = Variant(W("אחרון"));
    bool clicked = false;
    std::string searchAfterClick;
    Connection watching = card().ProgressFill.changed.connect([&] {
        if (clicked || card().ProgressFill.Width() == 0)
            return;
        clicked = true;
        // Pressing a button takes the focus from the list at once; the
        // list's handler must not run inside the scan.
        QTest::mouseClick(widget->widgetFor("PrevButt"), Qt::LeftButton);
        searchAfterClick = card().PubSearchBy;
    });
    // A scan the host starts: the focus stays in the list.
    widget->runForUser([&] { card().Click("NextButt"); });
    ASSERT_TRUE(clicked);
    EXPECT_EQ(searchAfterClick, "CustomerName");
    EXPECT_EQ(reference(), "2");       // found under the search
    EXPECT_EQ(card().PubSearchBy, ""); // then the list's handler cleared it
    EXPECT_EQ(card().PubACTLocation, 2);
    QCoreApplication::processEvents(); // "Previous" from record 2 finds nothing before it
    EXPECT_EQ(reference(), "");
    EXPECT_TRUE(boxes.empty()) << (boxes.empty() ? "" : boxes[0].text.toStdString());
}

} // namespace
} // namespace dovrel::test
