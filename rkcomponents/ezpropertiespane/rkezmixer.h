#pragma once

#include "io/rkbase.h"

#include <QVector>

#include <memory>

class RkEzMixerControl;
class RkEzMixerDriver;

// A set of morphs placed on a square field and blended by one handle: every move of the driver
// sets each control's property to its value times the control's interpolated weight.
class RkEzMixer : public RkBase
{
    Q_OBJECT
public:
    RkEzMixer();
    ~RkEzMixer() override;

    RkEzMixerDriver* getDriver() const;
    const QVector<RkEzMixerControl*>& getControls() const;
    // Takes ownership of the control and makes this mixer its mixer.
    void addControl(RkEzMixerControl* control);
    // Takes the control out at once; the event loop deletes it.
    void removeControl(RkEzMixerControl* control);

    void loadSection(RkInFile* file, short sectionId) override;
    void postLoadFile(RkInFile* file) override;
    void setPointer(const RkInFile* file, short sectionId, short index, RkBase* object) override;
    void save(RkOutFile* file) const override;

private Q_SLOTS:
    void drive();
    void beginEdit();
    void finishEdit();

private:
    void adoptDriver(RkEzMixerDriver* driver);

    struct Private;
    std::unique_ptr<Private> d;
};
