// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Implements.h"
#include "velmark/Project.h"
#include "velmark/Transport.h"

namespace cadrel::host::tests {

/// A host's project that answers otherwise here and there. All else is the project's behind it, which isn't owned.
class AlteredDocument : public Velmark::Implements<AlteredDocument, Velmark::FObject, Velmark::IProjectDocument> {
public:
    static constexpr const char* ClassName = "AlteredDocument";

    explicit AlteredDocument(Velmark::IProjectDocument* document) : m_document(document) {}

    bool hasLocators = true;
    Velmark::ILocators* locators = nullptr; ///< instead of the project's
    bool makesTracks = true;
    bool hasContainers = true;
    Velmark::IMarkerTrack* defaultMarkerTrack = nullptr;
    Velmark::int32 endResult = Velmark::ResultOk;
    double endRounding = 0.0; ///< how much later the end comes to stand than it was set, in seconds

    Velmark::int32 queryInterface(const Velmark::Identifier& id, void** out) override
    {
        return id == Velmark::IProjectDocument::iid ? Implements::queryInterface(id, out)
                                                    : m_document->queryInterface(id, out);
    }

    Velmark::int32 setProjectEnd(double seconds) override
    {
        return endResult == Velmark::ResultOk ? m_document->setProjectEnd(seconds + endRounding) : endResult;
    }
    Velmark::IFilePath* getProjectFile(Velmark::IProjectDocument* project) override
    {
        return m_document->getProjectFile(project);
    }
    Velmark::IMarkerTrack* getDefaultMarkerTrack() override { return defaultMarkerTrack; }
    Velmark::ILocators* getLocators() override
    {
        if (!hasLocators)
            return nullptr;
        return locators ? locators : m_document->getLocators();
    }
    Velmark::FUnknown* getContainer(Velmark::FUnknown* object) override
    {
        return hasContainers ? m_document->getContainer(object) : nullptr;
    }
    Velmark::FUnknown* createTrack(const char* word) override
    {
        return makesTracks ? m_document->createTrack(word) : nullptr;
    }
    Velmark::int32 addStorageNotification(Velmark::IProjectStorageNotification* listener) override
    {
        return m_document->addStorageNotification(listener);
    }
    Velmark::int32 removeStorageNotification(Velmark::IProjectStorageNotification* listener) override
    {
        return m_document->removeStorageNotification(listener);
    }
    Velmark::IMediaPool* getMediaPool() override { return m_document->getMediaPool(); }

private:
    Velmark::IProjectDocument* m_document;
};

} // namespace cadrel::host::tests
