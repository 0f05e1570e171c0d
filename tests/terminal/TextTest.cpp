#include "frontends/terminal/Text.h"
#include "frontends/terminal/EditedLine.h"

#include <gmock/gmock.h>

#include <cstring>
#include <stdexcept>
#include <sys/mman.h>
#include <unistd.h>

namespace kestrum::terminal {
namespace {

class TerminalText : public testing::Test {
protected:
    static void SetUpTestSuite() { chooseLocale(); }
};

TEST_F(TerminalText, CountsColumnsNotBytesOrCharacters)
{
    EXPECT_EQ(columns(""), 0);
    EXPECT_EQ(columns("RSRP"), 4);
    EXPECT_EQ(columns("é"), 1);
    EXPECT_EQ(columns("e\xCC\x81"), 1); // e and a combining acute accent
    EXPECT_EQ(columns("漢字"), 4);
}

TEST_F(TerminalText, ShowsControlCharactersAsPictures)
{
    EXPECT_EQ(harmless("a\x1B[31mb"), "a␛[31mb");
    EXPECT_EQ(harmless(std::string_view("\0\a\n\x7F", 4)), "␀␇␊␡");
}

TEST_F(TerminalText, ReplacesWhatWouldSteerATerminal)
{
    EXPECT_EQ(harmless("a\xC2\x9B"
                       "31m"),
              "a\uFFFD31m"); // U+009B begins a control sequence, as ESC [ does
    EXPECT_EQ(harmless("\u202Eabc\u202C"), "\uFFFDabc\uFFFD");
    EXPECT_EQ(harmless("\u2067abc"), "\uFFFDabc");
}

TEST_F(TerminalText, ReplacesEachByteThatIsNoUtf8)
{
    EXPECT_EQ(harmless("a\xFFz"), "a\uFFFDz");
    EXPECT_EQ(harmless("\xE6\xBC"), "\uFFFD\uFFFD"); // an incomplete character
    EXPECT_EQ(harmless("\xC0\xAF"), "\uFFFD\uFFFD"); // a slash in an overlong encoding
}

TEST_F(TerminalText, HoldsAMarkWithoutALetter)
{
    EXPECT_EQ(columns("\xCC\x81"), 1);
    EXPECT_EQ(harmless("\xCC\x81"), "◌\xCC\x81");
}

TEST_F(TerminalText, DropsMarksThatNoCellCanHold)
{
    std::string tower = "a";
    for (int i = 0; i < 100; ++i)
        tower += "\xCC\x81";
    Glyphs glyphs(tower);
    const auto shown = glyphs.next();
    ASSERT_TRUE(shown);
    EXPECT_LE(shown->text.size(), 5u);
    EXPECT_FALSE(glyphs.next());
}

/// Megabytes of text, of which only the first page may be read.
class MostlyForbiddenText {
public:
    MostlyForbiddenText()
    {
        void* const memory = ::mmap(nullptr, kSize, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
        if (memory == MAP_FAILED)
            throw std::runtime_error("no memory");
        _bytes = static_cast<char*>(memory);
        std::memset(_bytes, 'a', _page);
        ::mprotect(_bytes + _page, kSize - _page, PROT_NONE);
    }
    ~MostlyForbiddenText() { ::munmap(_bytes, kSize); }
    MostlyForbiddenText(const MostlyForbiddenText&) = delete;
    MostlyForbiddenText& operator=(const MostlyForbiddenText&) = delete;

    std::string_view whole() const { return {_bytes, kSize}; }

private:
    static constexpr std::size_t kSize = 16 << 20;
    std::size_t _page = static_cast<std::size_t>(::sysconf(_SC_PAGESIZE));
    char* _bytes;
};

TEST_F(TerminalText, IsLookedAtOnlyAsFarAsItIsShown)
{
    const MostlyForbiddenText text;
    EXPECT_EQ(cutAtTheEnd(text.whole(), 5), "aaaa…");
    EXPECT_EQ(cutAtTheEnd(text.whole(), 1000).size(), 999 + sizeof("…") - 1);
    Glyphs glyphs(text.whole());
    for (int i = 0; i < 1000; ++i)
        glyphs.next();
    EXPECT_EQ(glyphs.read(), 1000u);
}

TEST_F(TerminalText, IsKeptUpTo16KiB)
{
    EXPECT_EQ(beginning("RSRP"), "RSRP");
    const std::string most(16 << 10, 'a');
    EXPECT_EQ(beginning(most), most);
    EXPECT_EQ(beginning(most + "a"), most + "…");
    // Cut between characters.
    EXPECT_EQ(beginning(most.substr(2) + "漢漢"), most.substr(2) + "…");
    EXPECT_EQ(columns(beginning(std::string(16 << 20, '\xBF'))), (16 << 10) + 1);
}

TEST_F(TerminalText, KeepsItsEndWhenItIsCutInTheMiddle)
{
    std::string towers;
    for (int i = 0; i < 100; ++i)
        towers += "a\u0301\u0301\u0301\u0301";
    towers += "bc";
    EXPECT_EQ(cutInTheMiddle(towers, 5), towers.substr(0, 18) + "…bc");
    EXPECT_EQ(cutInTheMiddle("Kestrum › " + std::string(1 << 20, 'x') + "yz", 13), "Kestru…xxxxyz");
}

TEST_F(TerminalText, IsCutInTheMiddleOrAtItsEnd)
{
    EXPECT_EQ(cutInTheMiddle("abcdefghij", 10), "abcdefghij");
    EXPECT_EQ(cutInTheMiddle("abcdefghij", 7), "abc…hij");
    EXPECT_EQ(cutInTheMiddle("漢字漢字", 6), "漢…字");
    EXPECT_EQ(cutAtTheEnd("abcdefghij", 4), "abc…");
    EXPECT_EQ(cutAtTheEnd("漢字", 3), "漢…");
    EXPECT_EQ(cutAtTheEnd("abc", 1), "…");
    EXPECT_EQ(cutAtTheEnd("abc", 0), "");
    EXPECT_EQ(cutInTheMiddle("abc", -3), "");
}

TEST_F(TerminalText, IsBrokenIntoLines)
{
    using testing::ElementsAre, testing::IsEmpty;
    EXPECT_THAT(wrapped("Waiting for it.\nTo start: voxd", 10), ElementsAre("Waiting", "for it.", "To start:", "voxd"));
    EXPECT_THAT(wrapped("Saved to /a/long/path/x", 12), ElementsAre("Saved to /a/", "long/path/x"));
    EXPECT_THAT(wrapped("abc def", 7), ElementsAre("abc def"));
    EXPECT_THAT(wrapped("漢字漢", 3), ElementsAre("漢", "字", "漢"));
    EXPECT_THAT(wrapped("abc", 0), IsEmpty());
    EXPECT_THAT(wrapped("", 10), IsEmpty());
}

TEST_F(TerminalText, IsFoundWhateverItsCase)
{
    EXPECT_TRUE(contains("Measured RSRP", "rsrp"));
    EXPECT_TRUE(contains("ÉTAT", "état"));
    EXPECT_TRUE(contains("Any", ""));
    EXPECT_FALSE(contains("RSRP", "RSRQ"));
}

class TerminalEditedLine : public TerminalText {
protected:
    void type(std::wstring_view text)
    {
        for (const wchar_t each : text)
            line.handle({Key::Character, each});
    }
    EditedLine line;
};

TEST_F(TerminalEditedLine, TakesWhatIsTypedWhereTheCursorIs)
{
    type(L"roof");
    line.handle({Key::Home});
    type(L"é漢 ");
    EXPECT_EQ(line.text(), "é漢 roof");
    EXPECT_EQ(line.beforeCursor(), "é漢 ");
}

TEST_F(TerminalEditedLine, ErasesALetterWithItsMarks)
{
    type(L"ae\u0301");
    line.handle({Key::Backspace});
    EXPECT_EQ(line.text(), "a");
    line.handle({Key::Backspace});
    line.handle({Key::Backspace});
    EXPECT_TRUE(line.isEmpty());
}

TEST_F(TerminalEditedLine, ErasesForwards)
{
    type(L"e\u0301a");
    line.handle({Key::Home});
    line.handle({Key::Delete});
    EXPECT_EQ(line.text(), "a");
    line.handle({Key::End});
    line.handle({Key::Delete});
    EXPECT_EQ(line.text(), "a");
}

TEST_F(TerminalEditedLine, ErasesWordsAndLinesAsAShellDoes)
{
    type(L"on the roof  ");
    type(L"\x17");
    EXPECT_EQ(line.text(), "on the ");
    type(L"\x17\x17\x17");
    EXPECT_EQ(line.text(), "");
    type(L"abc");
    line.handle({Key::Left});
    type(L"\x15");
    EXPECT_EQ(line.text(), "c");
    type(L"\x0B");
    EXPECT_EQ(line.text(), "");
}

TEST_F(TerminalEditedLine, LeavesOtherKeysAndControlCharactersAlone)
{
    EXPECT_FALSE(line.handle({Key::Up}));
    EXPECT_FALSE(line.handle({Key::Character, L'\x02'}));
    EXPECT_TRUE(line.isEmpty());
}

} // namespace
} // namespace kestrum::terminal
