// The settings page: the probe of Com1 and Com2, the option lists filled from the port's
// settings, Preset, and the engineer's choice applied to the port.
#pragma once

#include <QComboBox>
#include <QGroupBox>
#include <QLabel>
#include <QPushButton>
#include <QWidget>
#include <functional>
#include <string>
#include <vector>

#include "app/app_state.h"
#include "app/dialogs.h"
#include "app/texts.h"
#include "link/serial_port.h"

namespace zx917::ui {

struct SettingsParts {
    AppState& app;
    const TextTables& texts;
    SerialPort& port;
    Dialogs& dialogs;
    // What "Com<n>" is on this machine (device path and description), for its tooltip.
    std::function<std::string(int16_t)> describePort;
};

inline constexpr int16_t kProbedPorts = 2;

class SettingsPage {
public:
    // Builds the page's instruction, port list and "Settings" frame on the page container.
    SettingsPage(QWidget* page, const SettingsParts& parts);

    bool ProtSettings();
    void cmdReset_Click();
    bool ProtSettingsApply();

    // The seven lists and Preset; identification disables them while it runs.
    void setListsEnabled(bool enabled);
    // The page's focusable controls in the order of their tab stops.
    std::vector<QWidget*> tabStops() const;

    QLabel* Label7_1;
    QLabel* Label3;
    QComboBox* cboPort;
    QGroupBox* Frame3;
    QComboBox* cboSpeed;
    QComboBox* cboDataBits;
    QComboBox* cboStopBits;
    QComboBox* cboParity;
    QComboBox* cboXon;
    QComboBox* cboEoc;
    QPushButton* cmdReset;

private:
    void ProtSettingsShow();

    SettingsParts p_;
};

// Selects the item with exactly this text; without one, a pick-only list has no selection and
// an editable list shows the text.
void SetListText(QComboBox* list, const QString& text);

}  // namespace zx917::ui
