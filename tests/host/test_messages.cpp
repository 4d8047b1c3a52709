#include <gtest/gtest.h>

#include <string>
#include <vector>

#include <carnet/cwnd.h>
#include <carnet/messages.h>
#include <carnet/msgbox.h>

namespace {

struct Box {
    CWnd* owner;
    std::string text, caption;
    unsigned int flags;
};

// Captures every box and answers with a chosen button.
class Messages : public ::testing::Test {
protected:
    void SetUp() override {
        m_previous = SetMessageBoxHandler([this](CWnd* owner, const char* text, const char* caption, unsigned int flags) {
            m_boxes.push_back({owner, text, caption, flags});
            return m_answer;
        });
    }
    void TearDown() override { SetMessageBoxHandler(m_previous); }

    std::vector<Box> m_boxes;
    int m_answer = IDOK;

private:
    MessageBoxHandler m_previous;
};

}  // namespace

TEST_F(Messages, WarningBelongsToTheParentOrTheApplication) {
    CWnd parent;
    EXPECT_EQ(ShowWarning(&parent, "Impossible d'ouvrir la Sitebook :\n%s !", "a.geo"), IDOK);
    EXPECT_EQ(ShowWarning(nullptr,
                          "La cha\xEEne de s\xE9lection des points est vide.\nVeuillez la renseigner avant de "
                          "r\xE9" "essayer !"),
              IDOK);
    ASSERT_EQ(m_boxes.size(), 2u);
    EXPECT_EQ(m_boxes[0].owner, &parent);
    EXPECT_EQ(m_boxes[0].caption, "NORVEX");
    EXPECT_EQ(m_boxes[0].flags, 0x30u);
    EXPECT_EQ(m_boxes[0].text, "Impossible d'ouvrir la Sitebook :\na.geo !");
    EXPECT_EQ(m_boxes[1].owner, nullptr);
    EXPECT_EQ(m_boxes[1].caption, "");
    EXPECT_EQ(m_boxes[1].flags, 0u);
    EXPECT_EQ(m_boxes[1].text,
              "La cha\xEEne de s\xE9lection des points est vide.\nVeuillez la renseigner avant de r\xE9" "essayer !");
}

TEST_F(Messages, QuestionKeepsItsFlagsAndAnswer) {
    CWnd parent;
    struct Case {
        CWnd* parent;
        unsigned int flags;
        int answer;
        const char* caption;
    } cases[] = {
        {&parent, MB_YESNO | MB_ICONQUESTION, IDYES, "NORVEX"},
        {&parent, MB_YESNO | MB_ICONQUESTION, IDNO, "NORVEX"},
        {nullptr, MB_YESNO, IDYES, ""},
        {nullptr, MB_OK, IDOK, ""},
    };
    for (const Case& c : cases) {
        m_boxes.clear();
        m_answer = c.answer;
        EXPECT_EQ(ShowMessage(c.parent, c.flags, "Le matricule '%s' est d\xE9j\xE0 utilis\xE9 !", "P12"), c.answer);
        ASSERT_EQ(m_boxes.size(), 1u);
        EXPECT_EQ(m_boxes[0].owner, c.parent);
        EXPECT_EQ(m_boxes[0].flags, c.flags);
        EXPECT_EQ(m_boxes[0].caption, c.caption);
        EXPECT_EQ(m_boxes[0].text, "Le matricule 'P12' est d\xE9j\xE0 utilis\xE9 !");
    }
}

TEST_F(Messages, ValuesAreNotFormats) {
    // A value holding '%' shows as it is, however long.
    const std::string long_value = std::string(5000, 'x') + "%s%n%d";
    ShowWarning(nullptr, "%s :\n%d", long_value.c_str(), 2);
    const char* none = nullptr;
    ShowWarning(nullptr, none, 0);
    ASSERT_EQ(m_boxes.size(), 2u);
    EXPECT_EQ(m_boxes[0].text, long_value + " :\n2");
    EXPECT_EQ(m_boxes[1].text, "");
}
