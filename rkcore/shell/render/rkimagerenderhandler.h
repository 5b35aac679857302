#pragma once

#include "render/rkrenderhandler.h"

#include <QImage>
#include <QString>

// A render handler that collects the rendered frame into an image of its size and, when given a
// file name, writes the image there when the render finishes.
class RKCORE_EXPORT RkImageRenderHandler : public RkRenderHandler
{
    Q_OBJECT
public:
    RkImageRenderHandler(const QSize& size, int startTime, const QString& fileName,
                         QObject* parent = nullptr);
    ~RkImageRenderHandler() override;

    QString getFileName() const;
    // The last frame taken (transparent until a frame arrives).
    QImage getImage() const;
    // True when the file was written (or no file was asked for).
    bool wasSaved() const;

public Q_SLOTS:
    void renderStarting() override;
    void renderFinished() override;
    bool takeFrameData(const RkRenderData* data) override;

private:
    struct Private;
    std::unique_ptr<Private> d;
};
