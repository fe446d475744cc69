// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/changes/Edit.h"

#include <memory>
#include <vector>

namespace standin {

class Project;

/// Takes down the edits of the one transaction that can be open in the host, in their order. While none is open, changes
/// are made without a record.
class ChangeLog {
public:
    using Edits = std::vector<std::unique_ptr<Edit>>;

    /// An edit of a project or, with null, one that goes with whatever project the transaction is committed for.
    struct Record {
        Project* project;
        std::unique_ptr<Edit> edit;
    };

    bool isOpen() const { return m_isOpen; }
    void open() { m_isOpen = true; }
    /// What was taken down.
    std::vector<Record> close();
    const std::vector<Record>& records() const { return m_records; }

    // These do nothing while no transaction is open.

    void add(Project& project, std::unique_ptr<Edit> edit);
    void add(std::unique_ptr<Edit> edit);

private:
    bool m_isOpen = false;
    std::vector<Record> m_records;
};

} // namespace standin
