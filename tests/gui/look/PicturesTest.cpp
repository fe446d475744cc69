// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/window/Pictures.h"

#include "tests/support/TreePaths.h"

#include <gtest/gtest-spi.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <optional>
#include <string>
#include <vector>

using cadrel::tests::expectPicture;
using cadrel::tests::programPath;

namespace {

class Square : public juce::Component {
public:
    Square()
    {
        setOpaque(true);
        setSize(10, 10);
    }

    void paint(juce::Graphics& graphics) override { graphics.fillAll(colour); }

    juce::Colour colour = juce::Colour(100, 150, 200);
};

/// Pictures are compared while it lives, even if others are renewed.
class Comparing {
public:
    Comparing()
    {
        if (const char* const value = std::getenv("CADREL_RENEW_PICTURES"))
            m_renewing = value;
        unsetenv("CADREL_RENEW_PICTURES");
    }
    Comparing(const Comparing&) = delete;
    Comparing& operator=(const Comparing&) = delete;
    ~Comparing()
    {
        if (m_renewing)
            setenv("CADREL_RENEW_PICTURES", m_renewing->c_str(), 1);
    }

private:
    std::optional<std::string> m_renewing;
};

class PicturesTest : public testing::Test {
protected:
    /// What a test would be told that compares the square.
    std::vector<std::string> failures(const char* name = "square")
    {
        const Comparing comparing;
        testing::TestPartResultArray results;
        {
            const testing::ScopedFakeTestPartResultReporter reporter(
                testing::ScopedFakeTestPartResultReporter::INTERCEPT_ONLY_CURRENT_THREAD, &results);
            expectPicture(m_square, name);
        }
        std::vector<std::string> messages;
        for (int i = 0; i < results.size(); ++i)
            messages.emplace_back(results.GetTestPartResult(i).message());
        return messages;
    }

    juce::ScopedJuceInitialiser_GUI m_juce;
    Square m_square;
};

} // namespace

TEST_F(PicturesTest, AreTheSameWithinTheTolerance)
{
    expectPicture(m_square, "square");

    m_square.colour = juce::Colour(106, 144, 200);
    EXPECT_TRUE(failures().empty());
}

TEST_F(PicturesTest, DifferByMoreThanTheTolerance)
{
    m_square.colour = juce::Colour(107, 150, 200);
    const juce::File difference(programPath("../pictures/square.png"));
    difference.deleteFile();

    const std::vector<std::string> messages = failures();

    ASSERT_EQ(messages.size(), 2U);
    EXPECT_NE(messages[0].find("100 pixels of square differ"), std::string::npos) << messages[0];
    EXPECT_NE(messages[1].find("400 pixels of square@2x differ"), std::string::npos) << messages[1];
    // What was expected, what was drawn and where they differ.
    const juce::Image all = juce::ImageFileFormat::loadFrom(difference);
    EXPECT_EQ(all.getWidth(), 46);
    EXPECT_EQ(all.getPixelAt(5, 5), juce::Colour(100, 150, 200));
    EXPECT_EQ(all.getPixelAt(23, 5), juce::Colour(107, 150, 200));
    EXPECT_EQ(all.getPixelAt(41, 5), juce::Colour(255, 0, 0));
}

TEST_F(PicturesTest, DifferWhereTheSizeIsAnother)
{
    m_square.setSize(11, 10);

    const std::vector<std::string> messages = failures();

    // The last column isn't in the tree's picture.
    ASSERT_EQ(messages.size(), 2U);
    EXPECT_NE(messages[0].find("10 pixels of square differ"), std::string::npos) << messages[0];
    EXPECT_NE(messages[1].find("40 pixels of square@2x differ"), std::string::npos) << messages[1];
}

TEST_F(PicturesTest, DifferWhereAComponentHasNoSize)
{
    m_square.setSize(0, 0);

    const std::vector<std::string> messages = failures("a picture that isn't kept");

    ASSERT_EQ(messages.size(), 2U);
    EXPECT_NE(messages[0].find("has no size"), std::string::npos) << messages[0];
}
