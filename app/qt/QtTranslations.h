#pragma once

class QCoreApplication;

namespace dovrel {

// Qt's own texts (the buttons of message boxes and dialogs) in Hebrew, from
// the translations the system installs beside Qt.
class QtTranslations {
public:
    // True when the Hebrew translation was found and installed; without it
    // Qt keeps its English texts.
    static bool LoadHebrew(QCoreApplication& application);
};

} // namespace dovrel
