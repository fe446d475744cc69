#include "app/JsonOutput.h"

#include "app/Failure.h"
#include "app/Paths.h"
#include "util/FilePath.h"
#include "util/Result.h"

#include <iostream>

namespace cadrel::app {

using util::Result;

JsonOutput::JsonOutput(const std::string& path) : path_(path)
{
    if (isStandardOutput(path))
        return;
    const auto target = util::toFilePath(toWide(path));
    try {
        file_.emplace(target);
    } catch (const Result::Type&) {
        throw unwritable(path_);
    }
}

void JsonOutput::write(std::string_view text)
{
    if (!file_) {
        std::cout << text;
        return;
    }
    try {
        file_->write(text);
    } catch (const Result::Type&) {
        throw unwritable(path_);
    }
}

void JsonOutput::finish()
{
    if (!file_) {
        flushStandardOutput();
        return;
    }
    try {
        file_->putInPlace();
    } catch (const Result::Type&) {
        throw unwritable(path_);
    }
}

void JsonOutput::keep()
{
    if (file_)
        file_->keep();
}

void flushStandardOutput()
{
    if (!std::cout.flush())
        throw Failure{"standard output", "can't be written", "see whether the disk is full"};
}

} // namespace cadrel::app
